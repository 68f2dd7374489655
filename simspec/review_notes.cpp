// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "simspec/review_notes.h"

#include <algorithm>
#include <optional>

#include <fmt/format.h>

#include "core/kvf.h"
#include "core/kvf_parser.h"
#include "core/kvf_writer.h"
#include "platform/csv_cell.h"

namespace tervane {

namespace {

CExtraParamsItemKvf* ItemOfNote(const CExtraParamsKvf& list, std::string_view name) {
  for (int number = 1; number <= list.GetItemCount(); ++number)
    if (CExtraParamsItemKvf* item = list.GetItem(number); HoldsReviewNote(*item) && item->Name == name) return item;
  return nullptr;
}

void PutText(KvfFile& file, std::string_view key, const std::string& text) { kvfPutParam(&file, key, text.c_str()); }

std::string TextOfNote(const ReviewNote& note) {
  KvfFile file;
  kvfAddTarget(&file, "Note");
  PutText(file, "Place", note.place);
  PutText(file, "Title", note.title);
  PutText(file, "Author", note.author);
  PutText(file, "Date", note.date);
  PutText(file, "State", std::string(NameOf(note.state)));
  PutText(file, "Text", note.text);
  for (const ReviewAnswer& answer : note.answers) {
    kvfAddSection(&file, "Answer");
    PutText(file, "Author", answer.author);
    PutText(file, "Date", answer.date);
    PutText(file, "Text", answer.text);
    kvfEndSection(&file);
  }
  std::string text;
  AppendKvfNodes(file.Cursor(), 0, text);
  return text;
}

std::string TextIn(KvfSection& section, std::string_view key) {
  const KvfNode* node = FindKvfNode(section, true, key);
  return node && node->count == 1 && node->params[0].IsText() ? std::string(node->params[0].Text()) : std::string();
}

/// The name that the user has given it, where it has one.
std::string CallOf(CYbSEKvfBase& node) {
  KvfFile file;
  kvfAddTarget(&file, "Keys");
  node.WriteData(&file);
  for (const char* key : {"Name", "NAME"})
    if (std::string name = TextIn(file.Cursor(), key); !name.empty()) return name;
  return node.GetTitle();
}

}  // namespace

bool ReadReviewState(std::string_view name, ReviewState& state) {
  const auto* found = std::ranges::find(kReviewStateNames, name);
  if (found == std::end(kReviewStateNames)) return false;
  state = static_cast<ReviewState>(found - std::begin(kReviewStateNames));
  return true;
}

bool ReadReviewNote(const CExtraParamsItemKvf& item, ReviewNote& note, std::string& problem) {
  KvfFile file;
  const std::string whole = fmt::format("target Note {{\n{}\n}}\n", item.TextValue);
  KvfSection* section = ParseKvf(FileContent::Of(whole), file) ? AsSection(file.top.firstChild) : nullptr;
  if (!section) {
    problem = file.syntaxError.message;
    return false;
  }
  note = {item.Name,
          TextIn(*section, "Place"),
          TextIn(*section, "Title"),
          TextIn(*section, "Author"),
          TextIn(*section, "Date"),
          TextIn(*section, "Text"),
          ReviewState::Open,
          {}};
  if (!ReadReviewState(TextIn(*section, "State"), note.state)) {
    problem = fmt::format("'{}' is no state of a note: open, answered or done was expected", TextIn(*section, "State"));
    return false;
  }
  for (KvfNode* node = section->firstChild; node; node = node->next)
    if (KvfSection* answer = AsSection(node))
      note.answers.push_back({TextIn(*answer, "Author"), TextIn(*answer, "Date"), TextIn(*answer, "Text")});
  return true;
}

std::vector<ReviewNote> ReviewNotesOf(const CExtraParamsKvf& list) {
  std::vector<ReviewNote> notes;
  for (int number = 1; number <= list.GetItemCount(); ++number) {
    const CExtraParamsItemKvf& item = *list.GetItem(number);
    std::string problem;
    if (ReviewNote note; HoldsReviewNote(item) && ReadReviewNote(item, note, problem)) notes.push_back(std::move(note));
  }
  return notes;
}

std::string PutReviewNote(CExtraParamsKvf& list, ReviewNote note) {
  CExtraParamsItemKvf* item = note.name.empty() ? nullptr : ItemOfNote(list, note.name);
  if (note.name.empty()) {
    // Two people who note things in copies of one setup get different names.
    const std::uint64_t hash = HashOf(TextOfNote(note));
    for (std::uint64_t number = hash & 0xFFFFFF; note.name.empty() || ItemOfNote(list, note.name); ++number)
      note.name = fmt::format("{}{:06x}", kReviewNotePrefix, number & 0xFFFFFF);
  }
  if (!item) item = list.AddItem();
  item->Name = note.name;
  item->Type = CExtraParamsItemKvf::kText;
  item->TextValue = TextOfNote(note);
  return note.name;
}

bool RemoveReviewNote(CExtraParamsKvf& list, std::string_view name) {
  const CExtraParamsItemKvf* item = ItemOfNote(list, name);
  if (!item) return false;
  list.DeleteItem(list.GetNumberWhatIs(item), 1);
  return true;
}

std::string ReviewNotesAsCsv(const std::vector<ReviewNote>& notes) {
  std::string csv = "Note,Place,State,Author,Date,Text\r\n";
  const auto add = [&csv](std::initializer_list<std::string_view> cells) {
    std::string_view separator;
    for (const std::string_view cell : cells) {
      csv += separator;
      csv += CsvCell(cell);
      separator = ",";
    }
    csv += "\r\n";
  };
  for (const ReviewNote& note : notes) {
    add({note.name, note.place, NameOf(note.state), note.author, note.date, note.text});
    for (const ReviewAnswer& answer : note.answers)
      add({note.name, note.place, "answer", answer.author, answer.date, answer.text});
  }
  return csv;
}

CYbSEKvfBase* NodeOfReviewNote(CYbSEKvfBase& root, const ReviewNote& note) {
  std::vector<PathStep> steps = ParseSetupPath(note.place).steps;
  if (steps.empty()) return &root;
  CYbSEKvfBase* there = FindNode(root, steps);
  if (there && (note.title.empty() || CallOf(*there) == note.title)) return there;
  steps.pop_back();
  const CYbSEKvfBase* above = FindNode(root, steps);
  std::optional<CYbSEKvfBase*> beside;
  for (CYbSEKvfBase* child = above ? above->GetFirstChild() : nullptr; child; child = above->GetNextChild(child))
    if (CallOf(*child) == note.title) beside = beside ? nullptr : child;
  return beside.value_or(nullptr);
}

bool FollowNode(ReviewNote& note, CYbSEKvfBase& node) {
  const PathStep key = ParseSetupPath(note.place).key;
  ReviewNote now = NewReviewNoteAt(node, key.name);
  if (now.place == note.place && now.title == note.title) return false;
  note.place = std::move(now.place);
  note.title = std::move(now.title);
  return true;
}

ReviewNote NewReviewNoteAt(CYbSEKvfBase& node, std::string_view key) {
  ReviewNote note;
  note.place = PathOf(node);
  if (!key.empty()) note.place += fmt::format(":{}", PathName(key));
  note.title = CallOf(node);
  return note;
}

}  // namespace tervane
