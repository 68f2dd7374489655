// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstddef>
#include <string>
#include <vector>

namespace tervane {

class CYbSEKvfBase;

}

namespace tervane::modflow6 {

/// What became of an input of the setup in another model.
enum class Fate {
  Carried,  ///< It is there as it was.
  Changed,  ///< It is there in another form, or a part of it.
  LeftOut   ///< The other model has nothing like it.
};
/// "carried over", "changed", "left out".
std::string NameOf(Fate fate);

struct ExportEntry {
  Fate fate;
  std::string place;  ///< Path of a node, with ":Key" behind it where one key is meant.
  std::string text;   ///< What it became, or why it is not there.
};

/// An account of all inputs.
class ExportReport {
 public:
  void Add(Fate fate, std::string place, std::string text);
  /// Tells of each node that takes part, has a page, and was not spoken of, neither itself nor one above it.
  void LeaveOutTheRest(CYbSEKvfBase& root);

  const std::vector<ExportEntry>& Entries() const { return entries_; }
  std::size_t Count(Fate fate) const;
  /// As a text for people: what was left out first, since that is what must be judged.
  std::string Text() const;

 private:
  std::vector<ExportEntry> entries_;
};

}  // namespace tervane::modflow6
