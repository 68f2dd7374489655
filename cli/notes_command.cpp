// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Review notes of a setup: list, add, answer, give another state, remove.
#include <ctime>
#include <optional>

#include <fmt/chrono.h>
#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/offers.h"
#include "cli/parts/json.h"
#include "cli/parts/setup_file.h"
#include "cli/parts/text_table.h"
#include "platform/os.h"
#include "platform/text.h"
#include "simspec/review_notes.h"

namespace tervane {

namespace {

struct NotesOptions {
  std::string file, place, name, text, author;
  std::optional<ReviewState> state;
  bool json = false, csv = false, force = false;

  std::string Author() const { return author.empty() ? os::UserName() : author; }
};

std::string Now() { return fmt::format("{:%Y-%m-%d %H:%M}", fmt::localtime(std::time(nullptr))); }

std::string JsonNote(CYbSEKvfBase& root, const ReviewNote& note) {
  std::vector<std::string> answers;
  for (const ReviewAnswer& answer : note.answers)
    answers.push_back(JsonObject(
        {{"author", JsonQuoted(answer.author)}, {"date", JsonQuoted(answer.date)}, {"text", JsonQuoted(answer.text)}}));
  return JsonObject({{"note", JsonQuoted(note.name)},
                     {"place", JsonQuoted(note.place)},
                     {"isThere", JsonBool(NodeOfReviewNote(root, note) != nullptr)},
                     {"state", JsonQuoted(NameOf(note.state))},
                     {"author", JsonQuoted(note.author)},
                     {"date", JsonQuoted(note.date)},
                     {"text", JsonQuoted(note.text)},
                     {"answers", JsonArray(answers)}});
}

int ListNotes(const NotesOptions& options, Streams streams) {
  CFlowModelDoc document;
  if (!OpenSetup(document, options.file, streams)) return kCouldNot;
  std::vector<ReviewNote> notes = ReviewNotesOf(*document.Root().Child<CExtraParamsKvf>());
  if (options.state) std::erase_if(notes, [&](const ReviewNote& note) { return note.state != *options.state; });
  if (options.json) {
    std::vector<std::string> objects;
    for (const ReviewNote& note : notes) objects.push_back(JsonNote(document.Root(), note));
    fmt::print(streams.out, "{}\n", JsonArray(objects));
  } else if (options.csv) {
    fmt::print(streams.out, "{}", ReviewNotesAsCsv(notes));
  } else {
    for (const ReviewNote& note : notes) {
      const bool isThere = NodeOfReviewNote(document.Root(), note) != nullptr;
      fmt::print(streams.out, "{}: {}: {}{}: {} ({}, {})\n", note.name.substr(kReviewNotePrefix.size()),
                 NameOf(note.state), note.place.empty() ? "the whole setup" : OneLine(note.place),
                 isThere ? "" : ", which is gone", OneLine(note.text), OneLine(note.author), note.date);
      for (const ReviewAnswer& answer : note.answers)
        fmt::print(streams.out, "  {} ({}, {})\n", OneLine(answer.text), OneLine(answer.author), answer.date);
    }
    if (notes.empty()) fmt::print(streams.out, "{}: no notes\n", options.file);
  }
  return kDone;
}

/// A problem that has been printed.
constexpr std::string_view kTold = "told";

/// Opens the setup for `change`, which tells why it cannot be done, and saves it.
int ChangeNotes(const NotesOptions& options, Streams streams,
                const std::function<std::string(CFlowModelDoc&, CExtraParamsKvf&)>& change) {
  SetupLock lock;
  CFlowModelDoc document;
  if (!HoldSetup(lock, options.file, options.force, streams) || !OpenSetup(document, options.file, streams))
    return kCouldNot;
  PrintLoadReport(document, streams);
  if (const std::string problem = change(document, *document.Root().Child<CExtraParamsKvf>()); !problem.empty())
    return problem == kTold ? kCouldNot : Refuse(streams, problem);
  return SaveSetup(document, options.file, "notes", streams) ? kDone : kCouldNot;
}

int AddNote(const NotesOptions& options, Streams streams) {
  return ChangeNotes(options, streams, [&](CFlowModelDoc& document, CExtraParamsKvf& list) {
    const SetupPath path = ParseSetupPath(options.place);
    CYbSEKvfBase* node = FindNodeOrReport(document, path, options.place, streams);
    if (!node) return std::string(kTold);
    ReviewNote note = NewReviewNoteAt(*node, path.key.name);
    note.author = options.Author();
    note.date = Now();
    note.text = options.text;
    fmt::print(streams.out, "{}\n", PutReviewNote(list, std::move(note)).substr(kReviewNotePrefix.size()));
    return std::string();
  });
}

int ChangeNote(const NotesOptions& options, Streams streams, const std::function<void(ReviewNote&)>& change) {
  return ChangeNotes(options, streams, [&](CFlowModelDoc&, CExtraParamsKvf& list) {
    for (ReviewNote& note : ReviewNotesOf(list)) {
      if (note.name != options.name && note.name != std::string(kReviewNotePrefix) + options.name) continue;
      if (change) {
        change(note);
        PutReviewNote(list, std::move(note));
      } else {
        RemoveReviewNote(list, note.name);
      }
      return std::string();
    }
    return fmt::format("{}: the setup has no note {}", options.file, options.name);
  });
}

}  // namespace

void OfferNotesCommands(CommandOffers& offers) {
  auto options = std::make_shared<NotesOptions>();
  const Command family = offers.Family("notes", "Review notes at the places of a setup");
  Command list = offers.Offer(
      "list", "List the notes", [offers, options] { return ListNotes(*options, offers.Output()); }, &family);
  Command add = offers.Offer(
      "add", "Add a note and print its number", [offers, options] { return AddNote(*options, offers.Output()); },
      &family);
  Command answer = offers.Offer(
      "answer", "Answer a note",
      [offers, options] {
        return ChangeNote(*options, offers.Output(), [&](ReviewNote& note) {
          note.answers.push_back({options->Author(), Now(), options->text});
          if (note.state == ReviewState::Open) note.state = ReviewState::Answered;
        });
      },
      &family);
  Command state = offers.Offer(
      "state", "Give a note another state",
      [offers, options] {
        return ChangeNote(*options, offers.Output(), [&](ReviewNote& note) { note.state = *options->state; });
      },
      &family);
  Command remove = offers.Offer(
      "remove", "Remove a note", [offers, options] { return ChangeNote(*options, offers.Output(), {}); }, &family);
  const auto takeState = [options](const std::string& typed) {
    return ReadReviewState(typed, options->state.emplace())
               ? std::string()
               : fmt::format("{} is none of open, answered and done", typed);
  };
  for (Command* command : {&list, &add, &answer, &state, &remove}) AddSetup(*command, options->file);
  list.AddTaken("--state", takeState, "Those in this state: open, answered or done");
  list.AddFlag("--json", options->json, "As JSON");
  list.AddFlag("--csv", options->csv, "As a table separated by commas");
  add.Add("PLACE", options->place, "The node or key, as SECTION/SECTION:KEY; \"\" for the whole setup").Required();
  for (Command* command : {&answer, &state, &remove})
    command->Add("NOTE", options->name, "The number of the note, as list prints it").Required();
  for (Command* command : {&add, &answer}) {
    command->Add("TEXT", options->text, "What is to be said").Required();
    command->Add("--author", options->author, "Who says it; the user of the system by default");
  }
  state.AddTaken("STATE", takeState, "open, answered or done").Required();
  for (Command* command : {&add, &answer, &state, &remove})
    command->AddFlag("--force", options->force, "Also where an editor has the setup open");
}

}  // namespace tervane
