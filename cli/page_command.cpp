// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/command_line.h"
#include "cli/commands.h"
#include "cli/setup_file.h"
#include "pages/page.h"

namespace tervane {

namespace {

/// A command that only shows a page is asked nothing.
class NobodyToAsk : public Host {
 public:
  Answer Ask(const std::string& /*text*/, Icon /*icon*/, Buttons /*buttons*/) override { return Answer::Cancel; }
  std::optional<std::string> AskFileToOpen(const FileQuestion& /*question*/) override { return std::nullopt; }
  std::optional<std::string> AskFileToSave(const FileQuestion& /*question*/) override { return std::nullopt; }
  void OpenBrowser(const std::string& /*address*/) override {}
  std::string Setting(const std::string& /*name*/) const override { return {}; }
  void SetSetting(const std::string& /*name*/, const std::string& /*value*/) override {}
};

const PageClass* PageClassOf(const CYbSEKvfBase& node) {
  for (const int tree : {kSetupDataTree, kProcessedDataTree, kResultsTree})
    if (const PageClass* page = node.GetDlgRuntimeClass(tree)) return page;
  return nullptr;
}

}  // namespace

int PageCommand(const std::string& file, const std::string& typed, Streams streams) {
  CFlowModelDoc document;
  if (!OpenSetup(document, file, streams)) return kCouldNot;
  TellThatThereIsAReport(document, streams);
  CYbSEKvfBase* node = FindNodeOrTell(document, ParseSetupPath(typed), typed, streams);
  if (!node) return kCouldNot;
  const PageClass* pageClass = PageClassOf(*node);
  NobodyToAsk host;
  const auto page = pageClass ? MakePage(*pageClass, *node, {document, host, {}}) : nullptr;
  if (!page) {
    fmt::print(streams.err, "{}: this place has no page; what it holds shows on the page of a place above it\n", typed);
    return kCouldNot;
  }
  fmt::print(streams.out, "{}", FormText(page->Form()));
  return kDone;
}

}  // namespace tervane
