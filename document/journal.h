// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What was done in a setup, step by step, kept in a file beside it where the user wishes: JSON lines, one for each
// step.
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "core/open_kvf.h"
#include "document/setup_diff.h"

namespace tervane {

class CYbSEKvfBase;

/// A key that a step has given another value, or an item that it has added, removed or moved.
struct JournalChange {
  SetupDifference::Kind kind = SetupDifference::Kind::Changed;
  /// As of a difference. Of a whole section `from` or `to` is what stood or stands in it, unless that is very long.
  std::string path, key, from, to;

  bool operator==(const JournalChange&) const = default;
};
struct JournalStep {
  std::string time;  ///< "2026-11-27 08:30:15", local.
  std::string user;
  std::string action;                  ///< What the menu of undo calls it.
  std::string page;                    ///< Path of the node in which it was done; empty for the setup as a whole.
  std::vector<JournalChange> changes;  ///< None for a save.

  bool operator==(const JournalStep&) const = default;
};

/// The journal of a setup: its file with `.journal` behind.
std::string JournalBeside(const std::string& setup);

/// The step in one line, with its end.
std::string WriteJournalLine(const JournalStep& step);
/// Nothing, with the reason, where the line is no step.
std::optional<JournalStep> ReadJournalLine(std::string_view line, std::string& problem);

struct Journal {
  std::vector<JournalStep> steps;     ///< The oldest first.
  std::vector<std::string> problems;  ///< Of lines that are no steps, with their numbers; they are left as they are.
  std::string error;                  ///< Why the file cannot be read; empty where there is none.
};
Journal ReadJournal(const std::string& path);

/// Adds lines at the end of a journal, which is made where there is none; gives what is wrong. What was written in
/// part, on a full disk, is taken back.
std::string AppendToJournal(const std::string& path, std::string_view lines);

/// Whether any word of a step contains the text, in any case.
bool IsInJournalStep(const JournalStep& step, std::string_view text);
/// The steps as a table (CSV) with a row for each change.
std::string JournalCsv(const std::vector<JournalStep>& steps);

/// Takes a step back on its own: all its keys get what they held before it, items that it added go, and those that it
/// removed come again. Nothing, with the reason, where the setup holds another value or item by now, where items were
/// moved, and where more than the step would change. Else the node that has changed, to be told to the document.
CYbSEKvfBase* TakeBackStep(CFlowModelDoc& document, const JournalStep& step, std::string& problem);

/// Saves a setup that was changed without an editor. Where a journal stands beside the file that is replaced, what
/// changes in that file becomes a step of it. False when it could not be saved, with the reason in the document;
/// `trouble` tells why a journal could not be written, which hinders no save.
bool SaveKeepingJournal(CFlowModelDoc& document, const std::string& path, const std::string& action,
                        std::string& trouble);

/// Writes the journal of a setup that is being edited, by comparing what it would write after each step.
class JournalKeeper {
 public:
  explicit JournalKeeper(const CFlowModelDoc& document);

  /// Takes what changed since the last call as a step; one without changes is none.
  void Take(const CFlowModelDoc& document, std::string action, std::string page);
  /// Takes what has changed no value: a save, or an end without one.
  void TakeEvent(const CFlowModelDoc& document, std::string action);
  /// What is wrong, told once; the steps that could not be written are tried again with the next one.
  std::string TakeTrouble();

 private:
  void Write(const CFlowModelDoc& document, JournalStep step);

  OpenKvf known_;
  std::string waiting_;  ///< Lines of a setup without a file, or of a journal that cannot be written.
  std::string trouble_, told_;
};

}  // namespace tervane
