// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What the benchmarks of whole setups share.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include <fmt/format.h>
#include <malloc.h>

#include "bench/median_table.h"
#include "document/edit_session.h"

namespace tervane::bench {

/// The setup as it would be saved into `/setups`.
std::string TextOf(const CFlowModelDoc& setup);
int NodesBelow(const CYbSEKvfBase& node);

/// Megabytes that were taken from the allocator since then.
class MemoryTaken {
 public:
  std::size_t Megabytes() const { return (mallinfo2().uordblks - before_) / 1'000'000; }

 private:
  std::size_t before_ = mallinfo2().uordblks;
};

/// A setup that is edited, with undo.
struct EditedSetup {
  explicit EditedSetup(std::string sizeLabel) : label(std::move(sizeLabel)) {}

  /// A measured action; `act` gives the node that it concerns.
  template <class Act>
  void Add(MedianTable& table, const std::string& what, double limit, int hint, const Act& act) {
    names.push_back(fmt::format("{}, {}", what, label));
    table.Add(names.back(), [this, hint, what, act] {
      CYbSEKvfBase& node = act();
      session->UpdateDoc(node, hint, what);
      return session->Steps().CanUndo();
    });
    table.LimitTime(names.back(), limit);
  }

  /// The latest edit undone and done again.
  void AddUndo(MedianTable& table, double limit) {
    names.push_back(fmt::format("undo and redo, {}", label));
    table.Add(names.back(), [this] { return session->Undo() && session->Redo(); });
    table.LimitTime(names.back(), limit);
  }

  std::string label;
  MemoryTaken memory;
  std::unique_ptr<EditSession> session = EditSession::New({});
  std::vector<std::string> names;
};

}  // namespace tervane::bench
