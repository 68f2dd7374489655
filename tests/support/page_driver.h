// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <deque>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <variant>
#include <vector>

#include "document/flow_model_document.h"
#include "forms/page.h"

namespace tervane::test {

/// A host that answers by a script, question after question; one that the script does not have fails the test.
class ScriptedHost : public Host {
 public:
  using Reply = std::variant<Answer, std::optional<std::string>, std::optional<int>, std::optional<LibraryChoice>>;

  /// The next question holds `part` in its text or title.
  void Expect(std::string part, Reply reply) { script_.push_back({std::move(part), std::move(reply)}); }
  /// Whether all was asked.
  bool IsDone() const { return script_.empty(); }
  /// What was shown by the latest question for an item.
  const ItemQuestion& Items() const { return items_; }
  /// The messages to the main window.
  const std::vector<Message>& Sent() const { return sent_; }
  /// The files that were to be opened in an editor.
  std::vector<std::string> Opened() const;

  Answer Ask(const std::string& text, Icon icon, Buttons buttons) override;
  std::optional<std::string> AskFileToOpen(const FileQuestion& question) override;
  std::optional<std::string> AskFileToSave(const FileQuestion& question) override;
  std::optional<int> AskItem(const ItemQuestion& question) override;
  std::optional<LibraryChoice> SelectLibraryEntry(const LibraryQuestion& question) override;
  void OpenBrowser(const std::string& address) override;
  bool Send(const Message& message) override {
    sent_.push_back(message);
    return true;
  }
  std::string Setting(const std::string& name) const override;
  void SetSetting(const std::string& name, const std::string& value) override;

 private:
  template <class Expected>
  Expected Next(const std::string& question);

  std::deque<std::pair<std::string, Reply>> script_;
  ItemQuestion items_;
  std::vector<Message> sent_;
};

/// The page of a node of a setup, driven by its labels.
class PageDriver {
 public:
  PageDriver(CFlowModelDoc& document, std::string_view path);

  CYbSEDlgBase& Page() { return *page_; }
  ScriptedHost& Outside() { return host_; }
  /// The control with that label, the one that is shown where several bear it; of controls without a label the one of
  /// that key. One that is not there fails the test.
  Control& Find(std::string_view label);
  /// Types a value; gives what was expected when it is refused.
  std::string Enter(std::string_view label, const std::string& typed) { return page_->Enter(Find(label), typed); }
  bool IsEnabled(std::string_view label) { return Find(label).IsEnabled(); }
  std::string Text() { return FormText(page_->Form()); }
  /// The hints and names of the changes so far: "1 Change End Date".
  const std::vector<std::string>& Changes() const { return changes_; }

 private:
  ScriptedHost host_;
  std::vector<std::string> changes_;
  std::unique_ptr<CYbSEDlgBase> page_;
};

}  // namespace tervane::test
