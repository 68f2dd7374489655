// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/offers.h"
#include "cli/setup_file.h"
#include "forms/page.h"
#include "pages/tree_entries.h"

namespace tervane {

namespace {

int PageCommand(const std::string& file, const std::string& typed, Streams streams) {
  CFlowModelDoc document;
  if (!OpenSetup(document, file, streams)) return kCouldNot;
  PrintLoadReportHint(document, streams);
  ReadProcessedData(document, streams);
  CYbSEKvfBase* node = FindNodeOrReport(document, ParseSetupPath(typed), typed, streams);
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

}  // namespace

void OfferPageCommand(CommandOffers& offers) {
  struct Options {
    std::string file, path;
  };
  auto options = std::make_shared<Options>();
  CLI::App* page = offers.Command("page", "Show the page of a node as text, control by control", [offers, options] {
    return PageCommand(options->file, options->path, offers.Output());
  });
  AddSetup(page, options->file);
  page->add_option("PATH", options->path, "The node")->required();
}

}  // namespace tervane
