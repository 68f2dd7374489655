// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <deque>
#include <memory>
#include <string>
#include <unordered_map>
#include <vector>

#include "core/node.h"
#include "core/state_buffer.h"

namespace tervane {

/// Where a user has made a step: on a node's page, in the control of that name there; either may be unknown.
struct StepPlace {
  std::uint64_t node = 0;  ///< Its serial number.
  std::string control;
};

/// Undoing by comparing: a shadow holds what every node held, and after each action of the user all that differs is one
/// step. So no effect in another node is forgotten. Nodes that were taken out live on in their step and go back to
/// their places with their links; nobody is notified again.
class UndoStack {
 public:
  using Time = std::chrono::steady_clock::time_point;

  explicit UndoStack(CYbSEKvfGlobalBase& root);
  ~UndoStack();

  /// Begins anew with the tree as it is, after a load.
  void Reset();
  /// Takes what changed since the last call as one step of that name; false when nothing did. Steps of one source (a
  /// control) that follow each other within a second are one.
  bool Commit(const std::string& name, const void* source = nullptr, Time now = std::chrono::steady_clock::now(),
              StepPlace place = {});

  bool CanUndo() const { return done_ > 0; }
  bool CanRedo() const { return done_ < steps_.size(); }
  /// The name of the step that would be undone or redone; empty when there is none.
  std::string UndoName() const { return CanUndo() ? steps_[done_ - 1].name : std::string(); }
  std::string RedoName() const { return CanRedo() ? steps_[done_].name : std::string(); }
  /// Where the step was made that would be undone or redone.
  StepPlace UndoPlace() const { return CanUndo() ? steps_[done_ - 1].place : StepPlace(); }
  StepPlace RedoPlace() const { return CanRedo() ? steps_[done_].place : StepPlace(); }
  bool Undo();
  bool Redo();

  /// A number of the tree as it is now: the same again when undo and redo have come back to it.
  std::uint64_t StateNumber() const { return CanUndo() ? steps_[done_ - 1].state : 0; }

  /// The tree is as it was saved.
  void MarkSaved() { saved_ = done_; }
  bool IsSaved() const { return saved_ == done_; }

  /// Steps beyond this are forgotten, oldest first.
  static constexpr std::size_t kMostSteps = 1000;

 private:
  using Nodes = std::vector<std::shared_ptr<CYbSEKvfBase>>;

  struct State {
    std::string values;
    std::string title, abbreviatedTitle;
    Nodes children;
    std::size_t plainChildren = 0;
    std::vector<void*> links;
  };
  struct Change {
    CYbSEKvfBase* node;
    std::shared_ptr<CYbSEKvfBase> keptAlive;  ///< Null for the root, and for what its parent's change keeps alive.
    State before, after;
  };
  struct Step {
    std::string name;
    const void* source;
    Time time;
    StepPlace place;
    std::uint64_t state;  ///< The number of the tree behind it.
    std::vector<Change> changes;
  };
  struct Shadow {
    State state;
    std::size_t round;  ///< The latest capture that met the node.
  };

  /// Takes a node's state where it is not `known`; false otherwise. Most nodes are as they were, so that comparing
  /// makes no copies.
  bool TakeState(CYbSEKvfBase& node, const State* known, State& state);
  static void Restore(CYbSEKvfBase& node, const State& state);
  /// Brings the shadow up to date below a node, and collects what differed.
  void Capture(CYbSEKvfBase& node, const std::shared_ptr<CYbSEKvfBase>& owner, std::vector<Change>& changes);
  std::vector<Change> CaptureAll();

  CYbSEKvfGlobalBase& root_;
  std::unordered_map<CYbSEKvfBase*, Shadow> shadow_;
  std::size_t round_ = 0;
  StateBuffer values_;  ///< Of the node that is compared; kept for its memory.
  std::deque<Step> steps_;
  std::size_t done_ = 0;  ///< Number of steps that are done; the others can be redone.
  std::size_t saved_ = 0;
  std::uint64_t lastState_ = 0;
};

}  // namespace tervane
