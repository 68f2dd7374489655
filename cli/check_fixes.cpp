// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "cli/check_fixes.h"

#include <map>
#include <utility>
#include <vector>

#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/parts/json.h"
#include "cli/parts/setup_file.h"
#include "document/key_reference.h"
#include "fixes/quick_fixes.h"
#include "platform/paths.h"
#include "platform/suggestion.h"
#include "platform/text.h"

namespace tervane {

const char* const kFixesFooter =
    "FIXES, in the order in which they are tried. moved-file: a file that is gone is found by its name below a "
    "folder,\n"
    "where only one file has that name. only-item: the only item or attribute of a file that will do. projection: "
    "that\n"
    "of the shapes of the domain. convert: a copy of a file that is in another system than the domain, in that of the\n"
    "domain, beside the file. period-of-data: the simulation within what all files cover. date-within-simulation: a "
    "date\n"
    "of water quality or particle tracking within the simulation of flow. range: the nearest number that is allowed.\n"
    "offer: what a finding offers, where it offers one value alone.";

namespace {

std::string PlaceOf(const CYbSEKvfBase& node, const std::string& key) {
  return key.empty() ? PathOf(node) : fmt::format("{}:{}", PathOf(node), key);
}

/// Lines that say the same of several like places, in the order of the first of each.
class LinesByPlace {
 public:
  void Add(const std::string& place, std::string text) {
    const auto [line, isNew] = lines_.try_emplace({NumberlessPath(place), std::move(text)}, order_.size());
    if (isNew) order_.push_back({line->first.second, {}});
    order_[line->second].places.push_back(place);
  }
  /// Few of a kind stand one by one, as do all with `each`.
  void Write(const std::string& head, bool each, std::ostream& out) const {
    constexpr std::size_t kFewest = 4;
    for (const auto& [text, places] : order_) {
      if (!each && places.size() >= kFewest) {
        fmt::print(out, "{}: {}: {}: {} places\n", head, OneLine(Replaced(NumberlessPath(places.front()), "%d", "*")),
                   text, places.size());
        continue;
      }
      for (const std::string& place : places) fmt::print(out, "{}: {}: {}\n", head, OneLine(place), text);
    }
  }

 private:
  struct Line {
    std::string text;
    std::vector<std::string> places;
  };
  std::map<std::pair<std::string, std::string>, std::size_t> lines_;
  std::vector<Line> order_;
};

void WriteRounds(const std::string& file, const std::vector<FixRound>& rounds, bool each, std::ostream& out) {
  const auto shown = [](const std::string& value) { return value.empty() ? std::string("nothing") : OneLine(value); };
  for (const FixRound& round : rounds) {
    LinesByPlace fixed, left;
    for (const FixedValue& value : round.plan.values)
      fixed.Add(PlaceOf(*value.node, value.key), fmt::format("{} -> {}", shown(value.before), shown(value.after)));
    for (const LeftFinding& one : round.plan.left) left.Add(PlaceOf(*one.node, one.key), OneLine(one.why));
    fixed.Write(fmt::format("{}: fix {}", file, round.kind->name), each, out);
    left.Write(fmt::format("{}: left {}", file, round.kind->name), each, out);
  }
}

std::string JsonRounds(const std::vector<FixRound>& rounds, bool isSaved) {
  std::vector<std::string> changes, left;
  for (const FixRound& round : rounds) {
    for (const FixedValue& value : round.plan.values)
      changes.push_back(JsonObject({{"kind", JsonQuoted(round.kind->name)},
                                    {"path", JsonQuoted(PlaceOf(*value.node, value.key))},
                                    {"before", JsonQuoted(value.before)},
                                    {"after", JsonQuoted(value.after)}}));
    for (const LeftFinding& one : round.plan.left)
      left.push_back(JsonObject({{"kind", JsonQuoted(round.kind->name)},
                                 {"path", JsonQuoted(PlaceOf(*one.node, one.key))},
                                 {"why", JsonQuoted(one.why)}}));
  }
  return JsonObject({{"saved", JsonBool(isSaved)}, {"changes", JsonArray(changes)}, {"left", JsonArray(left)}});
}

}  // namespace

bool FixAndSave(CFlowModelDoc& document, const std::string& file, const FixOptions& options, std::string* json,
                Streams streams) {
  QuickFixes fixes(document);
  const auto refuse = [&](const std::string& why) { return Refuse(streams, why) == kDone; };
  const FixKind* only = fixes.KindOf(options.only);
  if (!options.only.empty() && !only) {
    std::vector<std::string> names;
    for (const FixKind& kind : fixes.Kinds()) names.emplace_back(kind.name);
    return refuse(fmt::format("there is no kind of fix {}{}", options.only, Suggestion(options.only, names)));
  }
  const std::string folder = AbsoluteFromHere(options.folder.empty() ? document.Root().SetupFolder() : options.folder);
  std::string problem;
  const std::vector<FixRound> rounds = FixAll(document, fixes, only, folder, options.isDry, problem);
  if (!problem.empty()) return refuse(problem);
  std::size_t changed = 0;
  for (const FixRound& round : rounds) changed += round.plan.values.size();
  const bool isSaved = changed > 0 && !options.isDry;
  if (isSaved && !SaveSetup(document, file, "check --fix", streams)) return false;
  if (json) {
    *json = JsonRounds(rounds, isSaved);
    return true;
  }
  WriteRounds(file, rounds, options.each, streams.out);
  if (changed == 0)
    fmt::print(streams.out, "{}: nothing was fixed\n", file);
  else
    fmt::print(streams.out, "{}: {} value{} {}\n", file, changed, changed == 1 ? "" : "s",
               isSaved ? "changed, and the setup is saved" : "would change; nothing was written");
  return true;
}

}  // namespace tervane
