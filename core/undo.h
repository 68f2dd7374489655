// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <deque>
#include <memory>
#include <string>
#include <vector>

#include "core/node.h"
#include "core/state_buffer.h"

namespace tervane {

class LinkHolder;

/// A bit in the hint of a change: it follows from the latest step and is a part of it, as of `UndoStack::Join`.
inline constexpr int kFollowsFromStep = 128;

/// Where a user has made a step: on a node's page, in the control of that name there; either may be unknown.
struct StepPlace {
  std::uint64_t node = 0;  ///< Its serial number.
  std::string control;
};

/// Undoing by comparing: after each action of the user every node is held against what it was, and all that differs is
/// one step. So no effect in another node is forgotten. Nodes that were taken out live on in their step and go back to
/// their places with their links; nobody is notified again.
///
/// A setup may have some 100,000 nodes, of which an action changes a few. What is compared of each is a number, in a
/// list of all nodes in the order of the walk.
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

  /// Takes what changed since the last call as a part of the latest step that is done, whose consequence it is: what
  /// can no longer be and goes when somebody looks. Without a step it is no change of the user's. False when nothing
  /// did.
  bool Join();

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

  /// What a node holds.
  struct State {
    std::string bytes;  ///< Its titles, how many children are plain, its links, and its values, one behind the other.
    Nodes children;
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
  /// A node as it was when last looked at. The state of its parent keeps it alive.
  struct Known {
    CYbSEKvfBase* node;
    LinkHolder* links;  ///< The node itself, where it has links.
    std::uint64_t fingerprint;
    std::size_t size;  ///< How many nodes are known from this one on to the last one below it.
    std::unique_ptr<State> state;
  };

  /// Adds changes to those of a step.
  static void Merge(Step& step, std::vector<Change> changes);
  /// Knows a node and all below it, behind what `known` holds.
  void Learn(CYbSEKvfBase& node, std::vector<Known>& known);
  /// What keeps a node alive; null where its parent does not hold it.
  static std::shared_ptr<CYbSEKvfBase> OwnerOf(const CYbSEKvfBase& node);
  State StateOf(const Known& known) const;
  std::uint64_t FingerprintOf(const Known& known);
  /// Takes what differs from what was known.
  std::vector<Change> TakeChanges();
  /// Knows a node as it is now; gives what was known.
  State TakeState(Known& known);
  /// Knows the nodes of a step as they are now: restoring a node changes none that is not in its step.
  void TakeRestored(const Step& step);
  /// Brings what is known in the order of the walk again, when the nodes at those places got or lost others.
  void Arrange(const std::vector<std::size_t>& changed);
  void ArrangeAt(std::size_t place, const std::vector<std::size_t>& changed, std::vector<Known>& arranged);
  static void Restore(CYbSEKvfBase& node, const State& state);

  CYbSEKvfGlobalBase& root_;
  std::vector<Known> known_;
  StateFingerprint fingerprint_;
  KeyExchange fingerprinting_ = KeyExchange::Fingerprinting(fingerprint_);
  std::deque<Step> steps_;
  std::size_t done_ = 0;  ///< Number of steps that are done; the others can be redone.
  std::size_t saved_ = 0;
  std::uint64_t lastState_ = 0;
};

}  // namespace tervane
