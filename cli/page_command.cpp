// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/command_line.h"
#include "cli/commands.h"
#include "cli/setup_file.h"
#include "forms/page.h"
#include "pages/tree_entries.h"

namespace tervane {

int PageCommand(const std::string& file, const std::string& typed, Streams streams) {
  CFlowModelDoc document;
  if (!OpenSetup(document, file, streams)) return kCouldNot;
  TellThatThereIsAReport(document, streams);
  ReadProcessedData(document, streams);
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
