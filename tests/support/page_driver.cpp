// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/support/page_driver.h"

#include <stdexcept>

#include <fmt/format.h>

#include "libraries/library_kind.h"

namespace tervane::test {

namespace {

[[noreturn]] void Unexpected(const std::string& question) { throw std::runtime_error("nobody expected: " + question); }

}  // namespace

template <class Expected>
Expected ScriptedHost::Next(const std::string& question) {
  if (script_.empty() || question.find(script_.front().first) == std::string::npos) Unexpected(question);
  Expected reply = std::get<Expected>(script_.front().second);
  script_.pop_front();
  return reply;
}

Host::Answer ScriptedHost::Ask(const std::string& text, Icon, Buttons) { return Next<Answer>(text); }
std::optional<std::string> ScriptedHost::AskFileToOpen(const FileQuestion& question) {
  return Next<std::optional<std::string>>(question.title);
}
std::optional<std::string> ScriptedHost::AskFileToSave(const FileQuestion& question) {
  return Next<std::optional<std::string>>(question.title);
}
std::optional<int> ScriptedHost::AskItem(const ItemQuestion& question) {
  items_ = question;
  return Next<std::optional<int>>(question.title);
}
std::optional<Host::LibraryChoice> ScriptedHost::SelectLibraryEntry(const LibraryQuestion& question) {
  return Next<std::optional<LibraryChoice>>(std::string(question.kind.name));
}
std::vector<std::string> ScriptedHost::Opened() const {
  std::vector<std::string> paths;
  for (const Message& message : sent_)
    if (message.name == kMainWindowMessage && message.wParam == kOpenFile)
      paths.push_back(std::get<std::string>(message.lParam));
  return paths;
}

void ScriptedHost::OpenBrowser(const std::string& address) { Unexpected(address); }
std::string ScriptedHost::Setting(const std::string&) const { return {}; }
void ScriptedHost::SetSetting(const std::string& name, const std::string&) { Unexpected(name); }

PageDriver::PageDriver(CFlowModelDoc& document, std::string_view path) {
  CYbSEKvfBase* node = FindNode(document.Root(), ParseSetupPath(path).steps);
  const PageClass* pageClass = node ? node->GetDlgRuntimeClass(kSetupDataTree) : nullptr;
  if (pageClass)
    page_ = MakePage(*pageClass, *node, {document, host_, [this](int hint, const std::string& action, const void*) {
                                           changes_.push_back(fmt::format("{} {}", hint, action));
                                         }});
  if (!page_) throw std::runtime_error(fmt::format("{} has no page", path));
}

Control& PageDriver::Find(std::string_view label) {
  Control* found = nullptr;
  page_->Form().ForEach([&](Control& control) {
    const bool isNamed = control.label == label || (control.label.empty() && control.key == label);
    if (isNamed && (!found || (!found->IsShown() && control.IsShown()))) found = &control;
  });
  if (!found) throw std::runtime_error(fmt::format("the page has no {}", label));
  return *found;
}

}  // namespace tervane::test
