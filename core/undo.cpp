// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/undo.h"

#include "core/dependent_list.h"

namespace tervane {

UndoStack::UndoStack(CYbSEKvfGlobalBase& root) : root_(root) { Reset(); }

UndoStack::~UndoStack() = default;

void UndoStack::Reset() {
  steps_.clear();
  done_ = saved_ = 0;
  shadow_.clear();
  CaptureAll();
}

bool UndoStack::TakeState(CYbSEKvfBase& node, const State* known, State& state) {
  values_.Clear();
  KeyExchange keys = KeyExchange::Keeping(values_);
  node.ExchangeState(keys);
  const auto* holder = dynamic_cast<const LinkHolder*>(&node);
  std::vector<void*> links = holder ? holder->Links() : std::vector<void*>();
  if (known && known->values == values_.Bytes() && known->title == node.title_ &&
      known->abbreviatedTitle == node.abbreviatedTitle_ && known->children == node.children_ &&
      known->plainChildren == node.plainChildren_ && known->links == links)
    return false;
  state = {values_.Bytes(), node.title_, node.abbreviatedTitle_, node.children_, node.plainChildren_, std::move(links)};
  return true;
}

void UndoStack::Restore(CYbSEKvfBase& node, const State& state) {
  node.children_ = state.children;
  node.plainChildren_ = state.plainChildren;
  node.title_ = state.title;
  node.abbreviatedTitle_ = state.abbreviatedTitle;
  StateBuffer values(state.values);
  KeyExchange keys = KeyExchange::Restoring(values);
  node.ExchangeState(keys);
  if (auto* links = dynamic_cast<LinkHolder*>(&node)) links->SetLinks(state.links);
}

void UndoStack::Capture(CYbSEKvfBase& node, const std::shared_ptr<CYbSEKvfBase>& owner, std::vector<Change>& changes) {
  if (!node.HoldsSetup()) return;
  const auto [place, isNew] = shadow_.try_emplace(&node);
  Shadow& shadow = place->second;
  shadow.round = round_;
  if (State state; TakeState(node, isNew ? nullptr : &shadow.state, state)) {
    if (!isNew) changes.push_back({&node, owner, std::move(shadow.state), state});
    shadow.state = std::move(state);
  }
  for (const auto& property : node.properties_) Capture(*property, property, changes);
  for (const auto& child : node.children_) Capture(*child, child, changes);
}

std::vector<UndoStack::Change> UndoStack::CaptureAll() {
  std::vector<Change> changes;
  ++round_;
  Capture(root_, nullptr, changes);
  // What was taken out of the tree may have changed on its way out: its links were cut. From here on it is forgotten:
  // the change of its parent keeps it alive, and it holds its values itself.
  for (auto& [node, shadow] : shadow_) {
    if (shadow.round == round_) continue;
    if (State state; TakeState(*node, &shadow.state, state))
      changes.push_back({node, nullptr, std::move(shadow.state), std::move(state)});
  }
  std::erase_if(shadow_, [this](const auto& entry) { return entry.second.round != round_; });
  return changes;
}

bool UndoStack::Commit(const std::string& name, const void* source, Time now, StepPlace place) {
  std::vector<Change> changes = CaptureAll();
  if (changes.empty()) return false;
  steps_.erase(steps_.begin() + static_cast<std::ptrdiff_t>(done_), steps_.end());
  if (saved_ > done_) saved_ = static_cast<std::size_t>(-1);  // what was saved cannot be reached any more

  const bool melts = done_ > 0 && saved_ != done_ && source && steps_.back().source == source &&
                     steps_.back().name == name && now - steps_.back().time <= std::chrono::seconds(1);
  if (melts) {
    Step& last = steps_.back();
    last.time = now;
    last.state = ++lastState_;
    for (Change& change : changes) {
      const auto same = std::find_if(last.changes.begin(), last.changes.end(),
                                     [&](const Change& other) { return other.node == change.node; });
      if (same == last.changes.end())
        last.changes.push_back(std::move(change));
      else
        same->after = std::move(change.after);
    }
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
  CaptureAll();
  return true;
}

bool UndoStack::Redo() {
  if (!CanRedo()) return false;
  const Step& step = steps_[done_++];
  for (const Change& change : step.changes) Restore(*change.node, change.after);
  CaptureAll();
  return true;
}

}  // namespace tervane
