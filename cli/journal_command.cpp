// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <memory>
#include <string>
#include <vector>

#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/offers.h"
#include "cli/parts/json.h"
#include "document/journal.h"
#include "platform/files.h"
#include "platform/text.h"

namespace tervane {

namespace {

struct JournalOptions {
  std::string file, search;
  bool json = false, csv = false;
};

void PrintStep(const JournalStep& step, Streams streams) {
  fmt::print(streams.out, "{}  {}  {}{}{}\n", step.time, OneLine(step.user), OneLine(step.action),
             step.page.empty() ? "" : "  ", OneLine(step.page));
  for (const JournalChange& change : step.changes) {
    const std::string place = change.key.empty() ? change.path : change.path + ":" + change.key;
    if (change.kind == SetupDifference::Kind::Changed)
      fmt::print(streams.out, "    {}: {} -> {}\n", OneLine(place), OneLine(change.from), OneLine(change.to));
    else
      fmt::print(streams.out, "    {}: {}\n", OneLine(place), NameOf(change.kind));
  }
}

int JournalCommand(const JournalOptions& options, Streams streams) {
  const std::string path = JournalBeside(options.file);
  if (!FileExists(path))
    return Refuse(streams, fmt::format("{}: there is no journal beside this setup; the editor keeps one where it is "
                                       "asked to (the tab Journal of its window)",
                                       options.file));
  Journal journal = ReadJournal(path);
  if (!journal.error.empty()) return Refuse(streams, journal.error);
  for (const std::string& problem : journal.problems) fmt::print(streams.err, "{}\n", OneLine(problem));
  std::erase_if(journal.steps, [&](const JournalStep& step) { return !IsInJournalStep(step, options.search); });
  if (options.csv) {
    fmt::print(streams.out, "{}", JournalCsv(journal.steps));
  } else if (options.json) {
    std::vector<std::string> lines;
    for (const JournalStep& step : journal.steps) {
      lines.push_back(WriteJournalLine(step));
      lines.back().pop_back();
    }
    fmt::print(streams.out, "{}\n", JsonObject({{"steps", JsonArray(lines)}}));
  } else {
    for (const JournalStep& step : journal.steps) PrintStep(step, streams);
  }
  return kDone;
}

}  // namespace

void OfferJournalCommand(CommandOffers& offers) {
  auto options = std::make_shared<JournalOptions>();
  Command journal = offers.Offer("journal", "List the steps of the journal beside a setup",
                                 [offers, options] { return JournalCommand(*options, offers.Output()); });
  AddSetup(journal, options->file);
  journal.Add("--search", options->search, "Steps alone in which this text stands, in any case");
  const CommandOption json = journal.AddFlag("--json", options->json, "As JSON");
  journal.AddFlag("--csv", options->csv, "As a table (CSV) with a row for each change").Excludes(json);
}

}  // namespace tervane
