// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Notes of reviewers at places of a setup. Each is an extra parameter of kind Text: a list that every version of the
// editor reads and writes, that undo knows, and whose items are followed by their names when setups are merged.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "simspec/extra_params.h"

namespace tervane {

enum class ReviewState { Open, Answered, Done };
inline constexpr std::string_view kReviewStateNames[] = {"open", "answered", "done"};
inline std::string_view NameOf(ReviewState state) { return kReviewStateNames[static_cast<std::size_t>(state)]; }
/// False where no state has that name.
bool ReadReviewState(std::string_view name, ReviewState& state);

struct ReviewAnswer {
  std::string author, date, text;

  bool operator==(const ReviewAnswer&) const = default;
};

struct ReviewNote {
  std::string name;   ///< Of the extra parameter, which no other has.
  std::string place;  ///< Path of a node, with `:Key` behind where the note is at a key.
  std::string title;  ///< What the node was called then, its name or its title; by it, it is found at another path.
  std::string author, date, text;  ///< The date as "2026-11-27 14:05", of the reviewer's clock.
  ReviewState state = ReviewState::Open;
  std::vector<ReviewAnswer> answers;

  bool operator==(const ReviewNote&) const = default;
};

inline constexpr std::string_view kReviewNotePrefix = "Review note ";
/// Whether an extra parameter holds a note, be it readable or not.
inline bool HoldsReviewNote(const CExtraParamsItemKvf& item) {
  return item.Type == CExtraParamsItemKvf::kText && item.Name.starts_with(kReviewNotePrefix);
}
/// Reads what an extra parameter holds; false with the reason in `problem` when it is no note.
bool ReadReviewNote(const CExtraParamsItemKvf& item, ReviewNote& note, std::string& problem);

/// The notes that can be read, in the order of the file.
std::vector<ReviewNote> ReviewNotesOf(const CExtraParamsKvf& list);
/// Adds a note, which gets a name where it has none, or puts it in the place of the one of that name. Its name.
std::string PutReviewNote(CExtraParamsKvf& list, ReviewNote note);
/// False where there is no note of that name.
bool RemoveReviewNote(CExtraParamsKvf& list, std::string_view name);

/// The notes as a table for other programs, separated by commas, answers below their notes.
std::string ReviewNotesAsCsv(const std::vector<ReviewNote>& notes);

/// The node at which a note stands: that of its path where it is called so, else the only one beside it that is. Null
/// where there is none: its place is gone, or was given another name where nobody followed it.
CYbSEKvfBase* NodeOfReviewNote(CYbSEKvfBase& root, const ReviewNote& note);
/// Gives a note the place of its node, which was moved or bears another name now; false where nothing is to be done.
bool FollowNode(ReviewNote& note, CYbSEKvfBase& node);
/// A note at a node, or at a key of it, which is yet without text, author and date.
ReviewNote NewReviewNoteAt(CYbSEKvfBase& node, std::string_view key);

}  // namespace tervane
