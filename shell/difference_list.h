// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QTreeWidget>
#include <vector>

#include "document/setup_diff.h"

namespace tervane {

/// Differences between two setups, by section and key.
class DifferenceList : public QTreeWidget {
  Q_OBJECT

 public:
  /// What the columns of the two setups are called.
  DifferenceList(const QString& from, const QString& to);

  /// The chosen row stays where it was.
  void Show(std::vector<SetupDifference> differences);
  const std::vector<SetupDifference>& Differences() const { return differences_; }
  /// The chosen difference; null for none, and for a row that only names a section.
  const SetupDifference* Chosen() const;

 private:
  std::vector<SetupDifference> differences_;
};

}  // namespace tervane
