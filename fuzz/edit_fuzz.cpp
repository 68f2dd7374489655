// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// A setup, and behind a line "@@" the edits of its text, undo and redo that are done to it, in groups of five bytes.
// What was done and is undone leads back to the first text; done again it leads to the last one, which opens.
#include <algorithm>
#include <cstdint>
#include <string>

#include "core/undo.h"
#include "document/flow_model_document.h"
#include "document/text_outline.h"
#include "document/text_taking.h"
#include "fuzz/asked_items.h"
#include "fuzz/require.h"

namespace tervane {
namespace {

using fuzz::Require;

constexpr const char* kFolder = "/setups";
constexpr const char* kPath = "/setups/fuzzed.tvd";

std::string TextOf(const CFlowModelDoc& document) {
  std::string text, error;
  Require(document.BuildText(kFolder, text, error), "a setup can be written", error);
  return text;
}

/// An edit of the text of one section.
struct Edit {
  std::uint8_t kind, line;
  std::uint16_t section;
  std::uint8_t letter;
};

/// The line with its last letter before the line's end, digit or sign, changed.
std::string Changed(std::string line, std::uint8_t letter) {
  const std::size_t last = line.find_last_of("0123456789abcdefghijklmnopqrstuvwxyz.-");
  if (last != std::string::npos) line[last] = static_cast<char>(' ' + letter % 95);
  return line;
}

/// The lines of a section with one of those inside it taken out, changed, or twice.
std::string WithOneLineEdited(const TextOutline& outline, const TextOutline::Section& section, const Edit& edit) {
  const int inside = section.end - section.begin - 1;
  if (inside < 1) return std::string(outline.Lines(section.begin, section.end));
  const int line = section.begin + 1 + edit.line % inside;
  const std::string text(outline.Lines(line, line));
  const std::string edited = edit.kind % 4 == 0   ? std::string()
                             : edit.kind % 4 == 1 ? Changed(text, edit.letter)
                                                  : text + text;
  return std::string(outline.Lines(section.begin, line - 1)) + edited +
         std::string(outline.Lines(line + 1, section.end));
}

/// The lines of a section with one below it twice, which is one more item of a list.
std::string WithSectionTwice(const TextOutline& outline, const TextOutline::Section& section,
                             const TextOutline::Section& twice) {
  return std::string(outline.Lines(section.begin, twice.end)) + std::string(outline.Lines(twice.begin, section.end));
}

void Take(CFlowModelDoc& document, const Edit& edit) {
  const TextOutline outline(TextOf(document));
  int number = edit.section % static_cast<int>(outline.Sections().size());
  const TextOutline::Section* section = &outline.Sections()[static_cast<std::size_t>(number)];
  std::string after;
  if (edit.kind % 4 == 3 && section->parent != TextOutline::kNone) {
    number = section->parent;
    const TextOutline::Section& parent = outline.Sections()[static_cast<std::size_t>(number)];
    after = WithSectionTwice(outline, parent, *section);
    section = &parent;
  } else {
    after = WithOneLineEdited(outline, *section, edit);
  }
  EditedSection edited;
  edited.steps = outline.StepsTo(number);
  edited.before = outline.Lines(section->begin, section->end);
  edited.after = after;
  edited.firstLine = edited.firstEdited = section->begin + 1;
  edited.lastEdited = edited.firstLine + static_cast<int>(std::ranges::count(after, '\n'));
  TakeText(document, edited);
}

void Check(std::string_view input) {
  constexpr std::string_view kMark = "\n@@\n";
  constexpr std::size_t kGroup = 5, kMostEdits = 12, kLargest = 40'000;
  const std::size_t mark = input.rfind(kMark);
  if (mark == std::string_view::npos || mark > kLargest) return;
  std::string_view groups = input.substr(mark + kMark.size());
  if (fuzz::AsksForTooMuch(input.substr(0, mark))) return;
  CFlowModelDoc document;
  if (!document.OpenText(input.substr(0, mark), kPath)) return;
  document.Root().Validate();
  UndoStack steps(document.Root());
  const std::string first = TextOf(document);
  if (first.size() > 20 * kLargest) return;
  for (std::size_t i = 0; i < kMostEdits && groups.size() >= kGroup; ++i, groups.remove_prefix(kGroup)) {
    const auto at = [&groups](std::size_t place) { return static_cast<std::uint8_t>(groups[place]); };
    if (at(0) % 8 == 6) {
      steps.Undo();
    } else if (at(0) % 8 == 7) {
      steps.Redo();
    } else {
      Take(document, {at(0), at(1), static_cast<std::uint16_t>(at(2) + 256 * at(3)), at(4)});
      document.Root().Validate();
      steps.Commit("Edit Text");
    }
  }
  const std::string last = TextOf(document);
  int undone = 0;
  while (steps.Undo()) ++undone;
  const std::string back = TextOf(document);
  Require(back == first, "undo leads back", first + "\n---- and back:\n" + back);
  while (undone-- > 0) Require(steps.Redo(), "what was undone is done again");
  const std::string again = TextOf(document);
  Require(again == last, "redo leads to the last text", last + "\n---- and again:\n" + again);
  CFlowModelDoc opened;
  Require(opened.OpenText(last, kPath), "an edited setup opens", opened.Error());
  const std::string saved = TextOf(opened);
  Require(saved == last, "an edited setup comes back", last + "\n---- and then:\n" + saved);
}

}  // namespace
}  // namespace tervane

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  tervane::Check({reinterpret_cast<const char*>(data), size});
  return 0;
}
