// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/offers.h"
#include "cli/parts/json.h"
#include "cli/parts/setup_file.h"
#include "core/path.h"
#include "pages/why.h"

namespace tervane {

namespace {

struct WhyOptions {
  std::string file, path;
  bool json = false;
};

std::string Json(const Explanation& why, const std::string& path) {
  std::vector<std::string> reasons;
  for (const Reason& reason : why.reasons)
    reasons.push_back(JsonObject({{"text", JsonQuoted(reason.text)},
                                  {"alternative", reason.isAlternative ? "true" : ""},
                                  {"holds", JsonBool(reason.holds)},
                                  {"page", JsonQuoted(reason.page)},
                                  {"path", JsonQuoted(reason.path)},
                                  {"key", JsonQuoted(reason.key)}}));
  return JsonObject({{"path", JsonQuoted(path)},
                     {"title", JsonQuoted(why.subject)},
                     {"used", JsonBool(why.holds)},
                     {"reasons", JsonArray(reasons)}});
}

void Write(const Explanation& why, const std::string& path, Streams streams) {
  fmt::print(streams.out, "{} ({}) takes {}{}\n", path, why.subject, why.holds ? "part" : "no part",
             why.reasons.empty() ? "." : ":");
  for (const Reason& reason : why.reasons)
    fmt::print(streams.out, "  {}{}\n", reason.text,
               reason.path.empty() ? "" : fmt::format("  ({}:{})", reason.path, reason.key));
}

int WhyCommand(const std::string& file, const std::string& typed, bool json, Streams streams) {
  CFlowModelDoc document;
  if (!OpenSetup(document, file, streams)) return kCouldNot;
  PrintLoadReportHint(document, streams);
  std::vector<MissingNode> told;
  if (typed.empty()) {
    told = WhatIsMissing(document);
  } else {
    const SetupPath path = ParseSetupPath(typed);
    CYbSEKvfBase* node = FindNodeOrReport(document, path, typed, streams);
    if (!node) return kCouldNot;
    told.push_back({PathOf(*node), node->Serial(), WhyTakesPart(document, *node)});
  }
  std::vector<std::string> objects;
  for (const MissingNode& node : told)
    json ? objects.push_back(Json(node.why, node.path)) : Write(node.why, node.path, streams);
  if (json) fmt::print(streams.out, "{}\n", JsonObject({{"nodes", JsonArray(objects)}}));
  return kDone;
}

}  // namespace

void OfferWhyCommand(CommandOffers& offers) {
  auto options = std::make_shared<WhyOptions>();
  Command why = offers.Offer("why", "Tell why a node takes part or not", [offers, options] {
    return WhyCommand(options->file, options->path, options->json, offers.Output());
  });
  AddSetup(why, options->file);
  why.Add("PATH", options->path, "The node; without it all that is missing, and what would bring it");
  why.AddFlag("--json", options->json, "As JSON");
}

}  // namespace tervane
