// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <memory>

#include "core/node.h"

namespace tervane {

/// A node in the hands of a program, which may keep it longer than the setup does. To ask whether it is still there
/// costs a comparison while no node has gone.
class HeldNode {
 public:
  /// `parent` holds the node's parent; null for the root of a tree, which is there until `Drop`.
  HeldNode(CYbSEKvfBase& node, std::shared_ptr<HeldNode> parent);

  /// Null once it is gone, and for ever after.
  CYbSEKvfBase* Get();
  std::uint64_t Serial() const { return serial_; }
  void Drop() { node_ = nullptr; }

 private:
  bool IsStillThere();

  CYbSEKvfBase* node_;
  std::shared_ptr<HeldNode> parent_;
  std::uint64_t serial_;
  std::uint64_t deaths_;  ///< When it was last seen.
  int number_ = 0;        ///< Its place below its parent then: looked at first.
};

}  // namespace tervane
