// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <vector>

#include <fmt/format.h>
#include <fmt/ostream.h>

#include "access/file_merge.h"
#include "cli/offers.h"
#include "cli/parts/difference_text.h"
#include "cli/parts/json.h"
#include "cli/parts/setup_file.h"
#include "platform/files.h"
#include "platform/paths.h"

namespace tervane {

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
                     {"kind", JsonQuoted(NameOf(difference.kind))},
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

struct MergeOptions {
  std::string base, mine, theirs, out;
  bool force = false, json = false;
};

std::string ConflictJson(const MergeConflict& conflict) {
  constexpr std::string_view kKinds[] = {"value", "deletedByMe", "deletedByThem", "order"};
  return JsonObject({{"kind", JsonQuoted(kKinds[static_cast<std::size_t>(conflict.kind)])},
                     {"path", JsonQuoted(conflict.path)},
                     {"key", conflict.key.empty() ? "" : JsonQuoted(conflict.key)},
                     {"base", JsonQuoted(conflict.base)},
                     {"mine", JsonQuoted(conflict.mine)},
                     {"theirs", JsonQuoted(conflict.theirs)}});
}

int MergeCommand(const MergeOptions& options, Streams streams) {
  // Into mine is what version control asks for.
  const bool isIntoMine = options.out == options.mine || IsSameFile(options.out, options.mine);
  SetupLock lock;
  if (isIntoMine ? !HoldSetup(lock, options.out, options.force, streams)
                 : RefuseToReplace(options.out, options.force, streams))
    return kCouldNot;
  const auto [result, text, comments] = MergeSetupFiles(options.base, options.mine, options.theirs, options.out);
  if (!result.problem.empty()) return Refuse(streams, result.problem);
  if (const FileResult written = WriteFileAtomically(options.out, text); !written.Ok())
    return Refuse(streams, written.error);
  if (options.json) {
    std::vector<std::string> conflicts;
    for (const MergeConflict& conflict : result.conflicts) conflicts.push_back(ConflictJson(conflict));
    fmt::print(streams.out, "{}\n",
               JsonObject({{"taken", std::to_string(result.takenFromThem)}, {"conflicts", JsonArray(conflicts)}}));
  } else {
    for (const MergeConflict& conflict : result.conflicts) fmt::print(streams.out, "{}\n", conflict.Sentence());
    fmt::print(streams.out, "{} changes taken from {}, {} conflicts\n", result.takenFromThem, options.theirs,
               result.conflicts.size());
  }
  if (comments > 0)
    fmt::print(streams.err, "{}: {} comments inside of the setups are not merged\n", options.out, comments);
  return result.conflicts.empty() ? kDone : kFindings;
}

void OfferMerge(CommandOffers& offers) {
  auto options = std::make_shared<MergeOptions>();
  Command merge = offers.Offer("merge", "Put together two setups that were made from one",
                               [offers, options] { return MergeCommand(*options, offers.Output()); });
  merge.Add("BASE", options->base, "The setup that both were made from").Required();
  merge.Add("MINE", options->mine, "One of them, which holds where both have changed a thing").Required();
  merge.Add("THEIRS", options->theirs, "The other one").Required();
  merge.Add("-o,--output", options->out, "The merged setup; it may be MINE").Required();
  merge.AddFlag("--force", options->force, "Replaces a file of that name");
  merge.AddFlag("--json", options->json, "As JSON");
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
  OfferMerge(offers);
}

}  // namespace tervane
