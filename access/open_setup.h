// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <string>
#include <unordered_map>
#include <vector>

#include "access/accessed_setup.h"
#include "access/held_node.h"
#include "access/setup_keys.h"
#include "pages/findings.h"

namespace tervane {

/// A setup as programs in other languages drive it: nodes that they hold, keys by path, items of lists.
class OpenSetup {
 public:
  OpenSetup();
  ~OpenSetup();
  OpenSetup(const OpenSetup&) = delete;
  OpenSetup& operator=(const OpenSetup&) = delete;

  /// Reads a setup in the place of the one that is there. False with the reason in `Error`.
  bool Open(const std::string& path);
  /// As `AccessedSetup::Save`; an empty path is that of the setup.
  bool Save(const std::string& path);
  const std::string& Error() const { return setup_->Error(); }
  /// Makes another one alike, as a setup that was never saved. False with the problem, and then it stays as it was.
  bool CopyTo(OpenSetup& copy, std::string& problem) const;

  CFlowModelDoc& Document() const { return setup_->Document(); }
  CGlobal& Root() const { return setup_->Root(); }
  SetupKeys& Keys() { return *keys_; }

  std::shared_ptr<HeldNode> HeldRoot() const { return root_; }
  std::shared_ptr<HeldNode> Hold(CYbSEKvfBase& node) const;
  /// What a path names.
  struct Place {
    std::shared_ptr<HeldNode> node;
    PathStep key;  ///< Without a name where the path names none.
  };
  /// Null with the problem, which names what comes near. The place is kept until something changes.
  const Place* Find(const std::string& path, std::string& problem);

  /// A new item of a list, or zone, in front of the one at `place`, behind all others where there is none; with the
  /// values of another item of the same kind where one is given. Null with the problem.
  CYbSEKvfBase* InsertItem(CYbSEKvfBase& owner, int place, CYbSEKvfBase* like, std::string& problem);
  /// False where there is no such item.
  bool RemoveItem(CYbSEKvfBase& owner, int place);
  /// Gives an item another place, by which the others step aside. False where that is not possible.
  bool MoveItem(CYbSEKvfBase& owner, int from, int to);

  /// Validates the whole, and gives what is found, with what was met when the file was read.
  std::vector<SetupFinding> Validate();

 private:
  void Begin();

  std::unique_ptr<AccessedSetup> setup_;
  std::unique_ptr<SetupKeys> keys_;
  std::shared_ptr<HeldNode> root_;
  std::unordered_map<std::string, Place> places_;
  std::uint64_t placesRevision_ = 0;
};

}  // namespace tervane
