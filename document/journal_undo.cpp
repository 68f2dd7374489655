// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// A step of a journal is taken back on its own.
#include <algorithm>
#include <charconv>
#include <map>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include <fmt/format.h>

#include "core/kvf_parser.h"
#include "core/kvf_writer.h"
#include "core/path.h"
#include "document/flow_model_document.h"
#include "document/journal.h"
#include "document/journal_sections.h"
#include "document/key_reference.h"
#include "document/setup_merge.h"
#include "document/text_taking.h"
#include "platform/text.h"

namespace tervane {

namespace {

std::string PlaceOf(const JournalChange& change) { return change.path + ":" + change.key; }

std::string NameInFile(const KvfNode& node) {
  if (node.name->isBare) return std::string(node.WrittenName());
  return "\"" + Replaced(Replaced(node.WrittenName(), "\\", "\\\\"), "\"", "\\\"") + "\"";
}

std::optional<long> WholeNumber(const std::string& text) {
  long number = 0;
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
  if (error != std::errc() || end != text.data() + text.size()) return std::nullopt;
  return number;
}

/// What a step has changed in one section: its keys, and sections in it that came or went.
struct SectionChanges {
  std::vector<const JournalChange*> keys, added, removed;

  bool HasItems() const { return !added.empty() || !removed.empty(); }
};

/// The section as it is, and as it was before the step.
struct SectionEdit {
  std::vector<PathStep> steps;
  std::string before, after;
  std::vector<std::string>
      itemsAfter;  ///< Of each section in it that is to stand there afterwards; none where none came or went.
};

/// A section in another one.
struct Inner {
  std::string name, text;

  std::string Whole() const { return fmt::format("section {} {{\n{}}}\n", name, text); }
  /// Items are numbered anew.
  std::string Numberless() const { return NumberlessPath(name) + " " + text; }
};

std::vector<Inner> InnerSections(const KvfSection& section) {
  std::vector<Inner> sections;
  for (const KvfNode* node = section.firstChild; node; node = node->next)
    if (!node->IsKeyword()) sections.push_back({NameInFile(*node), KvfTextInside(*AsSection(node))});
  return sections;
}

/// Puts the section's own keys into both texts. What is wrong, where the step's are others by now.
std::string TakeKeys(KvfSection& section, const std::vector<const JournalChange*>& changes, SectionEdit& edit) {
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
  return {};
}

/// Whether a section holds what a text says, but for what every save computes.
bool Holds(KvfSection& section, const std::string& text) {
  const std::string head = fmt::format("target T {{\nsection {} {{\n", NameInFile(section));
  KvfFile file;
  if (!ParseKvf(FileContent::Of(head + text + "}\n}\n"), file)) return false;
  KvfSection* target = AsSection(file.top.firstChild);
  KvfSection* told = target ? AsSection(target->firstChild) : nullptr;
  return told && CompareSetups(*told, section, KeyReference::Get()).empty();
}

/// The place of an item among its like, from 1: the number at the end of its name, or which of equal names it is.
std::size_t PlaceAmongItems(const PathStep& step) {
  const std::size_t end = step.name.find_last_not_of("0123456789") + 1;
  const std::size_t digits = step.name.size() - end;
  constexpr std::size_t kMostDigits = 9;
  return digits > 0 && digits <= kMostDigits ? std::stoul(step.name.substr(end))
                                             : static_cast<std::size_t>(step.instance);
}

/// Puts the sections in it into both texts, those that the step added and removed alone into one.
std::string TakeItems(KvfSection& section, const SectionChanges& changes, SectionEdit& edit) {
  std::vector<Inner> inner = InnerSections(section);
  for (const Inner& one : inner) edit.before += one.Whole();
  std::vector<std::string> gone;
  for (const JournalChange* change : changes.added) {
    const PathStep step = ParseSetupPath(change->path).steps.back();
    KvfSection* own = AsSection(FindKvfNode(section, false, step.name, static_cast<std::size_t>(step.instance)));
    if (!own) return fmt::format("{} is no more in the setup", change->path);
    if (change->to.empty()) return fmt::format("the journal does not hold what was added at {}", change->path);
    if (!Holds(*own, change->to)) return fmt::format("{} is no more as it was added", change->path);
    const auto found =
        std::ranges::find_if(inner, [&, name = NameInFile(*own), instance = step.instance](const Inner& one) mutable {
          return one.name == name && --instance == 0;
        });
    found->name.clear();
  }
  std::erase_if(inner, [](const Inner& one) { return one.name.empty(); });
  // The first of those that went comes first, so that the places of the others hold.
  std::vector<std::pair<std::size_t, const JournalChange*>> coming;
  for (const JournalChange* change : changes.removed) {
    if (change->from.empty()) return fmt::format("the journal does not hold what was removed at {}", change->path);
    coming.emplace_back(PlaceAmongItems(ParseSetupPath(change->path).steps.back()), change);
  }
  std::ranges::sort(coming, {}, [](const auto& one) { return one.first; });
  for (const auto& [place, change] : coming) {
    const std::string name = ParseSetupPath(change->path).steps.back().name;
    std::size_t like = 0, at = 0;
    for (; at < inner.size(); ++at)
      if (NumberlessPath(inner[at].name) == NumberlessPath(name) && ++like == place) break;
    inner.insert(inner.begin() + static_cast<std::ptrdiff_t>(at), {name, change->from});
  }
  for (const Inner& one : inner) {
    edit.after += one.Whole();
    edit.itemsAfter.push_back(one.Numberless());
  }
  return {};
}

std::string EditOf(KvfSection& section, const SectionChanges& changes, SectionEdit& edit) {
  edit.before = edit.after = fmt::format("section {} {{\n", NameInFile(section));
  std::string problem = TakeKeys(section, changes.keys, edit);
  if (problem.empty() && changes.HasItems()) problem = TakeItems(section, changes, edit);
  edit.before += "}\n";
  edit.after += "}\n";
  return problem;
}

std::string PathAbove(const std::string& path) {
  std::vector<PathStep> steps = ParseSetupPath(path).steps;
  std::string above;
  if (!steps.empty()) steps.pop_back();
  for (const PathStep& step : steps) above = JoinPath(above, PathName(step.name, step.instance));
  return above;
}

/// Whether a key has followed the items of its section, of which it tells the number.
bool CountsItems(const JournalStep& step, const JournalChange& change) {
  if (change.kind != SetupDifference::Kind::Changed || change.key.empty()) return false;
  int more = 0;
  for (const JournalChange& other : step.changes)
    if (other.key.empty() && PathAbove(other.path) == change.path)
      more += (other.kind == SetupDifference::Kind::Added) - (other.kind == SetupDifference::Kind::Removed);
  const std::optional<long> from = WholeNumber(change.from), to = WholeNumber(change.to);
  return more != 0 && from && to && *to - *from == more;
}

std::string EditsOf(const CFlowModelDoc& document, const JournalStep& step, std::vector<SectionEdit>& edits) {
  if (step.changes.empty()) return "the step has changed nothing";
  std::map<std::string, SectionChanges> bySection;
  for (const JournalChange& change : step.changes) {
    if (CountsItems(step, change)) continue;
    if (change.kind == SetupDifference::Kind::Changed && !change.key.empty()) {
      bySection[change.path].keys.push_back(&change);
      continue;
    }
    const bool isItem = change.key.empty() &&
                        (change.kind == SetupDifference::Kind::Added || change.kind == SetupDifference::Kind::Removed);
    if (!isItem)
      return fmt::format("{} was {}: that goes back by undo alone", change.key.empty() ? change.path : PlaceOf(change),
                         NameOf(change.kind));
    SectionChanges& above = bySection[PathAbove(change.path)];
    (change.kind == SetupDifference::Kind::Added ? above.added : above.removed).push_back(&change);
  }
  const OpenKvf now(document.BuildFile(document.Root().SetupFolder()));
  for (const auto& [path, changes] : bySection) {
    SectionEdit edit;
    edit.steps = ParseSetupPath(path).steps;
    KvfSection* section = FindSection(*now, document.Root().GetTargetName(), edit.steps);
    if (!section || edit.steps.empty()) return fmt::format("{} is no more in the setup", path);
    if (std::string problem = EditOf(*section, changes, edit); !problem.empty()) return problem;
    edits.push_back(std::move(edit));
  }
  return {};
}

/// Whether an edit before this one has brought its items, as a list does that keeps another one in its order.
bool HasItemsAlready(const CFlowModelDoc& document, const SectionEdit& edit) {
  if (edit.itemsAfter.empty()) return false;
  const OpenKvf now(document.BuildFile(document.Root().SetupFolder()));
  const KvfSection* section = FindSection(*now, document.Root().GetTargetName(), edit.steps);
  if (!section) return false;
  std::vector<std::string> items;
  for (const Inner& one : InnerSections(*section)) items.push_back(one.Numberless());
  return items == edit.itemsAfter;
}

/// Gives the setup what was edited; the node that has changed.
CYbSEKvfBase* Apply(CFlowModelDoc& document, const std::vector<SectionEdit>& edits, std::string& problem) {
  CYbSEKvfBase* changed = nullptr;
  for (const SectionEdit& edit : edits) {
    if (changed && HasItemsAlready(document, edit)) continue;
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

/// Whether a difference is one that taking back makes: a value that stands again, an item that goes or comes.
bool IsUndone(const JournalChange& change, const SetupDifference& difference) {
  using Kind = SetupDifference::Kind;
  if (change.path != difference.path || change.key != difference.key) return false;
  if (change.kind == Kind::Added) return difference.kind == Kind::Removed;
  if (change.kind == Kind::Removed) return difference.kind == Kind::Added;
  return difference.kind == Kind::Changed && change.from == difference.to;
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
    if (std::ranges::none_of(step.changes, [&](const JournalChange& change) {
          return IsUndone(change, difference) ||
                 (CountsItems(step, change) && change.path == difference.path && change.key == difference.key);
        })) {
      problem = fmt::format("{}{}{} depends on it", difference.path, difference.key.empty() ? "" : ":", difference.key);
      return nullptr;
    }
  }
  CYbSEKvfBase* changed = Apply(document, edits, problem);
  if (changed) changed->SetRevalidateAll();
  return changed;
}

}  // namespace tervane
