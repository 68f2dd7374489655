// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What a node offers to mend one of its findings: a value for one of its keys.
#pragma once

#include <string>
#include <vector>

#include "core/node.h"

namespace tervane {

struct Mend {
  std::string text;   ///< What is done: "Change Species to Chloride".
  std::string key;    ///< Of the node.
  std::string value;  ///< As the file holds it.

  bool operator==(const Mend&) const = default;
};

/// A node that offers some.
class OffersMends {
 public:
  virtual ~OffersMends() = default;
  virtual std::vector<Mend> MendsOf(const Finding& finding) const = 0;
  /// Does what was offered.
  virtual void TakeMend(const Mend& mend) = 0;
};

}  // namespace tervane
