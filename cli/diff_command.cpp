// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <vector>

#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/difference_text.h"
#include "cli/json.h"
#include "cli/offers.h"
#include "cli/setup_file.h"

namespace tervane {

namespace {

std::string_view KindName(SetupDifference::Kind kind) {
  switch (kind) {
    case SetupDifference::Kind::Changed:
      return "changed";
    case SetupDifference::Kind::Added:
      return "added";
    case SetupDifference::Kind::Removed:
      return "removed";
    case SetupDifference::Kind::Moved:
      return "moved";
  }
  return {};
}

}  // namespace

std::string DifferenceLine(const SetupDifference& difference) {
  const std::string place =
      difference.key.empty() ? difference.path : fmt::format("{}:{}", difference.path, difference.key);
  const auto value = [](const std::string& text, const std::string& meaning, bool isDefault) {
    return fmt::format("{}{}{}", text, meaning.empty() ? "" : fmt::format(" [{}]", meaning),
                       isDefault ? " (default)" : "");
  };
  const std::string from = value(difference.from, difference.fromMeaning, difference.fromDefault);
  const std::string to = value(difference.to, difference.toMeaning, difference.toDefault);
  switch (difference.kind) {
    case SetupDifference::Kind::Changed:
      return fmt::format("{}: {} -> {}", place, from, to);
    case SetupDifference::Kind::Moved:
      return fmt::format("{}: moved here from {}", place, difference.from);
    case SetupDifference::Kind::Added:
      return difference.key.empty() ? fmt::format("{}: added", place) : fmt::format("{}: added: {}", place, to);
    case SetupDifference::Kind::Removed:
      return difference.key.empty() ? fmt::format("{}: removed", place) : fmt::format("{}: removed: {}", place, from);
  }
  return {};
}

std::string DifferenceJson(const SetupDifference& difference) {
  const auto optional = [](const std::string& text) { return text.empty() ? std::string() : JsonQuoted(text); };
  return JsonObject({{"path", JsonQuoted(difference.path)},
                     {"key", optional(difference.key)},
                     {"kind", JsonQuoted(KindName(difference.kind))},
                     {"from", optional(difference.from)},
                     {"to", optional(difference.to)},
                     {"fromMeaning", optional(difference.fromMeaning)},
                     {"toMeaning", optional(difference.toMeaning)},
                     {"fromDefault", difference.fromDefault ? "true" : ""},
                     {"toDefault", difference.toDefault ? "true" : ""}});
}

namespace {

int DiffCommand(const std::string& from, const std::string& to, bool json, Streams streams) {
  CFlowModelDoc a, b;
  if (!OpenSetup(a, from, streams) || !OpenSetup(b, to, streams)) return kCouldNot;
  PrintLoadReport(a, streams);
  PrintLoadReport(b, streams);
  const WrittenSetup writtenA(a), writtenB(b);
  const std::vector<SetupDifference> differences = CompareSetups(writtenA.Target(), writtenB.Target(), KeyReference());
  if (json) {
    std::vector<std::string> elements;
    for (const SetupDifference& difference : differences) elements.push_back(DifferenceJson(difference));
    fmt::print(streams.out, "{}\n", JsonObject({{"differences", JsonArray(elements)}}));
  } else {
    for (const SetupDifference& difference : differences) fmt::print(streams.out, "{}\n", DifferenceLine(difference));
  }
  return differences.empty() ? kDone : kFindings;
}

}  // namespace

void OfferDiffCommand(CommandOffers& offers) {
  struct Options {
    std::string from, to;
    bool json = false;
  };
  auto options = std::make_shared<Options>();
  Command diff = offers.Offer("diff", "Compare two setups by section and key", [offers, options] {
    return DiffCommand(options->from, options->to, options->json, offers.Output());
  });
  diff.Add("A", options->from, "The old setup").Required();
  diff.Add("B", options->to, "The new setup").Required();
  diff.AddFlag("--json", options->json, "As JSON");
}

}  // namespace tervane
