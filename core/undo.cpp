// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/undo.h"

#include <algorithm>
#include <iterator>
#include <unordered_map>
#include <unordered_set>
#include <utility>

#include "core/dependent_list.h"

namespace tervane {

namespace {

/// Puts what a node's entry of a list is linked with.
void PutLinks(const LinkHolder* links, auto& state) {
  if (!links) return;
  const std::vector<void*> addresses = links->Links();
  state.Put(addresses.size());
  for (void* address : addresses) state.Put(reinterpret_cast<std::uintptr_t>(address));
}

/// A walk over many nodes waits for memory more than it works, unless what comes soon was asked for before.
void AskFor([[maybe_unused]] const void* memory, [[maybe_unused]] std::size_t size) {
#ifdef __GNUC__
  constexpr std::size_t kLine = 64;
  for (std::size_t offset = 0; offset < size; offset += kLine)
    __builtin_prefetch(static_cast<const char*>(memory) + offset);
#endif
}

}  // namespace

UndoStack::UndoStack(CYbSEKvfGlobalBase& root) : root_(root) { Reset(); }

UndoStack::~UndoStack() = default;

void UndoStack::Reset() {
  steps_.clear();
  done_ = saved_ = 0;
  known_.clear();
  Learn(root_, known_);
}

// ---- What is known

void UndoStack::Learn(CYbSEKvfBase& node, std::vector<Known>& known) {
  if (!node.HoldsSetup()) return;
  const std::size_t place = known.size();
  Known& learned = known.emplace_back(Known{&node, dynamic_cast<LinkHolder*>(&node), 0, 0, nullptr});
  learned.fingerprint = FingerprintOf(learned);
  learned.state = std::make_unique<State>(StateOf(learned));
  for (const auto* nodes : {&node.properties_, &node.children_})
    for (const auto& below : *nodes) Learn(*below, known);
  known[place].size = known.size() - place;
}

std::shared_ptr<CYbSEKvfBase> UndoStack::OwnerOf(const CYbSEKvfBase& node) {
  const std::ptrdiff_t place = node.parent_ ? node.parent_->IndexOfChild(&node) : -1;
  return place < 0 ? nullptr : node.parent_->children_[static_cast<std::size_t>(place)];
}

UndoStack::State UndoStack::StateOf(const Known& known) const {
  CYbSEKvfBase& node = *known.node;
  StateBuffer state;
  state.Put(node.title_);
  state.Put(node.abbreviatedTitle_);
  state.Put(node.plainChildren_);
  PutLinks(known.links, state);
  KeyExchange keys = KeyExchange::Keeping(state);
  node.ExchangeState(keys);
  return {state.Bytes(), node.children_};
}

std::uint64_t UndoStack::FingerprintOf(const Known& known) {
  CYbSEKvfBase& node = *known.node;
  fingerprint_.Clear();
  fingerprint_.Put(node.children_.size());
  for (const auto& child : node.children_) fingerprint_.Put(child.get());
  fingerprint_.Put(node.textsNumber_);
  fingerprint_.Put(node.plainChildren_);
  PutLinks(known.links, fingerprint_);
  node.ExchangeState(fingerprinting_);
  return fingerprint_.Number();
}

std::vector<UndoStack::Change> UndoStack::TakeChanges() {
  std::vector<Change> changes;
  std::vector<std::size_t> rearranged;
  // The node far ahead, and what hangs at the one near by, which has come by now.
  const auto askFor = [this](std::size_t place) {
    constexpr std::size_t kFar = 8, kNear = 3, kFront = 64, kUsualValues = 128, kUsualChildren = 64;
    if (place + kFar < known_.size()) {
      const CYbSEKvfBase* node = known_[place + kFar].node;
      AskFor(node, kFront);
      AskFor(&node->textsNumber_, sizeof node->textsNumber_ + kUsualValues);
    }
    if (place + kNear < known_.size()) {
      const CYbSEKvfBase& node = *known_[place + kNear].node;
      if (!node.children_.empty()) AskFor(node.children_.data(), kUsualChildren);
    }
  };
  // Also what was taken out of the tree is met: it may have changed on its way out, when its links were cut.
  for (std::size_t place = 0; place < known_.size(); ++place) {
    askFor(place);
    Known& known = known_[place];
    if (FingerprintOf(known) == known.fingerprint) continue;
    State before = TakeState(known);
    if (before.children != known.state->children) rearranged.push_back(place);
    changes.push_back({known.node, OwnerOf(*known.node), std::move(before), *known.state});
  }
  Arrange(rearranged);
  return changes;
}

UndoStack::State UndoStack::TakeState(Known& known) {
  known.fingerprint = FingerprintOf(known);
  return std::exchange(*known.state, StateOf(known));
}

void UndoStack::TakeRestored(const Step& step) {
  std::unordered_set<const CYbSEKvfBase*> restored;
  for (const Change& change : step.changes) restored.insert(change.node);
  std::vector<std::size_t> rearranged;
  for (std::size_t place = 0; place < known_.size(); ++place)
    if (Known& known = known_[place]; restored.contains(known.node))
      if (TakeState(known).children != known.state->children) rearranged.push_back(place);
  Arrange(rearranged);
}

void UndoStack::Arrange(const std::vector<std::size_t>& changed) {
  if (changed.empty()) return;
  std::vector<Known> arranged;
  arranged.reserve(known_.size());
  ArrangeAt(0, changed, arranged);
  // What was taken out is forgotten: the change of its parent keeps it alive, and it holds its values itself.
  known_ = std::move(arranged);
}

void UndoStack::ArrangeAt(std::size_t place, const std::vector<std::size_t>& changed, std::vector<Known>& arranged) {
  const std::size_t end = place + known_[place].size;
  const auto next = std::ranges::lower_bound(changed, place);
  if (next == changed.end() || *next >= end) {
    std::move(known_.begin() + static_cast<std::ptrdiff_t>(place), known_.begin() + static_cast<std::ptrdiff_t>(end),
              std::back_inserter(arranged));
    return;
  }
  std::unordered_map<const CYbSEKvfBase*, std::size_t> places;
  for (std::size_t below = place + 1; below < end; below += known_[below].size) places[known_[below].node] = below;
  const CYbSEKvfBase& node = *known_[place].node;
  const std::size_t arrangedPlace = arranged.size();
  arranged.push_back(std::move(known_[place]));
  for (const auto* nodes : {&node.properties_, &node.children_})
    for (const auto& below : *nodes) {
      const auto found = places.find(below.get());
      found == places.end() ? Learn(*below, arranged) : ArrangeAt(found->second, changed, arranged);
    }
  arranged[arrangedPlace].size = arranged.size() - arrangedPlace;
}

void UndoStack::Restore(CYbSEKvfBase& node, const State& state) {
  node.children_ = state.children;
  // What comes back has the findings that it left with.
  for (CYbSEKvfBase* above = &node; above; above = above->parent_) above->isClear_ = false;
  StateBuffer bytes(state.bytes);
  std::string title, abbreviatedTitle;
  bytes.Take(title);
  bytes.Take(abbreviatedTitle);
  node.SetTexts(std::move(title), std::move(abbreviatedTitle));
  bytes.Take(node.plainChildren_);
  auto* holder = dynamic_cast<LinkHolder*>(&node);
  std::vector<std::uintptr_t> addresses;
  if (holder) bytes.Take(addresses);
  KeyExchange keys = KeyExchange::Restoring(bytes);
  node.ExchangeState(keys);
  // Behind the values, since a name that is set is passed on along the links.
  std::vector<void*> links;
  for (const std::uintptr_t address : addresses) links.push_back(reinterpret_cast<void*>(address));
  if (holder) holder->SetLinks(links);
}

// ---- Steps

void UndoStack::Merge(Step& step, std::vector<Change> changes) {
  for (Change& change : changes) {
    const auto same = std::find_if(step.changes.begin(), step.changes.end(),
                                   [&](const Change& other) { return other.node == change.node; });
    if (same == step.changes.end())
      step.changes.push_back(std::move(change));
    else
      same->after = std::move(change.after);
  }
}

bool UndoStack::Join() {
  std::vector<Change> changes = TakeChanges();
  if (changes.empty()) return false;
  if (CanUndo()) Merge(steps_[done_ - 1], std::move(changes));
  return true;
}

bool UndoStack::Commit(const std::string& name, const void* source, Time now, StepPlace place) {
  std::vector<Change> changes = TakeChanges();
  if (changes.empty()) return false;
  steps_.erase(steps_.begin() + static_cast<std::ptrdiff_t>(done_), steps_.end());
  if (saved_ > done_) saved_ = static_cast<std::size_t>(-1);  // what was saved cannot be reached any more

  const bool melts = done_ > 0 && saved_ != done_ && source && steps_.back().source == source &&
                     steps_.back().name == name && now - steps_.back().time <= std::chrono::seconds(1);
  if (melts) {
    Step& last = steps_.back();
    last.time = now;
    last.state = ++lastState_;
    Merge(last, std::move(changes));
    return true;
  }
  steps_.push_back({name, source, now, std::move(place), ++lastState_, std::move(changes)});
  if (steps_.size() > kMostSteps) {
    steps_.pop_front();
    if (saved_ != static_cast<std::size_t>(-1)) saved_ = saved_ == 0 ? static_cast<std::size_t>(-1) : saved_ - 1;
  }
  done_ = steps_.size();
  return true;
}

bool UndoStack::Undo() {
  if (!CanUndo()) return false;
  const Step& step = steps_[--done_];
  for (auto change = step.changes.rbegin(); change != step.changes.rend(); ++change)
    Restore(*change->node, change->before);
  TakeRestored(step);
  return true;
}

bool UndoStack::Redo() {
  if (!CanRedo()) return false;
  const Step& step = steps_[done_++];
  for (const Change& change : step.changes) Restore(*change.node, change.after);
  TakeRestored(step);
  return true;
}

}  // namespace tervane
