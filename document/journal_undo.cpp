// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// A step of a journal is taken back on its own.
#include <algorithm>
#include <map>

#include <fmt/format.h>

#include "core/kvf_writer.h"
#include "core/path.h"
#include "document/flow_model_document.h"
#include "document/journal.h"
#include "document/setup_merge.h"
#include "document/text_taking.h"
#include "platform/text.h"

namespace tervane {

namespace {

std::string PlaceOf(const JournalChange& change) { return change.path + ":" + change.key; }

KvfSection* SectionAt(KvfFile& file, std::string_view target, const std::vector<PathStep>& steps) {
  KvfSection* section = AsSection(FindKvfNode(file.top, false, target));
  for (const PathStep& step : steps)
    section =
        section ? AsSection(FindKvfNode(*section, false, step.name, static_cast<std::size_t>(step.instance))) : nullptr;
  return section;
}

std::string NameInFile(const KvfNode& node) {
  if (node.name->isBare) return std::string(node.WrittenName());
  return "\"" + Replaced(Replaced(node.WrittenName(), "\\", "\\\\"), "\"", "\\\"") + "\"";
}

/// The keys of one section that a step has changed.
struct SectionEdit {
  std::vector<PathStep> steps;
  std::string before, after;
};

/// The section's own keys as they are, and as they were before the step. What is wrong, where they are others by now.
std::string EditOf(KvfSection& section, const std::vector<const JournalChange*>& changes, SectionEdit& edit) {
  edit.before = edit.after = fmt::format("section {} {{\n", NameInFile(section));
  std::map<std::pair<std::string, int>, const JournalChange*> open;
  for (const JournalChange* change : changes) {
    const PathStep key = ParseSetupPath(PlaceOf(*change)).key;
    open[{key.name, key.instance}] = change;
  }
  std::map<std::string, int> instances;
  for (const KvfNode* node = section.firstChild; node; node = node->next) {
    if (!node->IsKeyword()) continue;
    const std::string name(node->Name());
    const std::string head = fmt::format("{} = ", NameInFile(*node));
    const std::string now = KvfValuesText(*node);
    edit.before += head + now + "\n";
    const auto found = open.find({name, ++instances[name]});
    if (found == open.end()) {
      edit.after += head + now + "\n";
      continue;
    }
    const JournalChange& change = *found->second;
    if (ComparedText(*node) != change.to)
      return fmt::format("{} holds {} now, and no more {}, which the step gave it", PlaceOf(change), now,
                         change.to.empty() ? "nothing" : change.to);
    if (!change.from.empty()) edit.after += head + change.from + "\n";
    open.erase(found);
  }
  for (const auto& [key, change] : open) {
    if (!change->to.empty()) return fmt::format("{} is no more in the setup", PlaceOf(*change));
    edit.after += fmt::format("{} = {}\n", key.first, change->from);
  }
  edit.before += "}\n";
  edit.after += "}\n";
  return {};
}

std::string EditsOf(const CFlowModelDoc& document, const JournalStep& step, std::vector<SectionEdit>& edits) {
  if (step.changes.empty()) return "the step has changed nothing";
  std::map<std::string, std::vector<const JournalChange*>> bySection;
  for (const JournalChange& change : step.changes) {
    if (change.kind != SetupDifference::Kind::Changed || change.key.empty())
      return fmt::format("{} was {}: only values can be taken back on their own",
                         change.key.empty() ? change.path : PlaceOf(change), NameOf(change.kind));
    bySection[change.path].push_back(&change);
  }
  const OpenKvf now(document.BuildFile(document.Root().SetupFolder()));
  for (const auto& [path, changes] : bySection) {
    SectionEdit edit;
    edit.steps = ParseSetupPath(path).steps;
    KvfSection* section = SectionAt(*now, document.Root().GetTargetName(), edit.steps);
    if (!section) return fmt::format("{} is no more in the setup", path);
    if (std::string problem = EditOf(*section, changes, edit); !problem.empty()) return problem;
    edits.push_back(std::move(edit));
  }
  return {};
}

/// Gives the setup what was edited; the node that has changed.
CYbSEKvfBase* Apply(CFlowModelDoc& document, const std::vector<SectionEdit>& edits, std::string& problem) {
  CYbSEKvfBase* changed = nullptr;
  for (const SectionEdit& edit : edits) {
    EditedSection edited;
    edited.steps = edit.steps;
    edited.before = edit.before;
    edited.after = edit.after;
    edited.lastEdited = static_cast<int>(std::ranges::count(edit.after, '\n'));
    const TakenText taken = TakeText(document, edited);
    if (!taken.problems.empty()) {
      problem = taken.problems.front().text;
      return nullptr;
    }
    if (taken.node) changed = edits.size() == 1 ? taken.node : &document.Root();
  }
  if (!changed) problem = "the setup takes the former values for no change";
  return changed;
}

}  // namespace

CYbSEKvfBase* TakeBackStep(CFlowModelDoc& document, const JournalStep& step, std::string& problem) {
  std::vector<SectionEdit> edits;
  problem = EditsOf(document, step, edits);
  if (!problem.empty()) return nullptr;
  // On a copy first: it tells what else would change.
  CFlowModelDoc copy;
  std::string text;
  if (!document.BuildText(document.Root().SetupFolder(), text, problem)) return nullptr;
  if (!copy.OpenText(text, document.PathName())) {
    problem = copy.Error();
    return nullptr;
  }
  if (!Apply(copy, edits, problem)) return nullptr;
  copy.Root().Validate();
  for (const SetupDifference& difference : DifferencesBetween(document, copy)) {
    const auto isItsOwn = [&](const JournalChange& change) {
      return difference.kind == SetupDifference::Kind::Changed && change.path == difference.path &&
             change.key == difference.key && change.from == difference.to;
    };
    if (std::ranges::none_of(step.changes, isItsOwn)) {
      problem = fmt::format("{}{}{} depends on it", difference.path, difference.key.empty() ? "" : ":", difference.key);
      return nullptr;
    }
  }
  CYbSEKvfBase* changed = Apply(document, edits, problem);
  if (changed) changed->SetRevalidateAll();
  return changed;
}

}  // namespace tervane
