// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QDialog>
#include <vector>

#include "document/setup_diff.h"

namespace tervane {

/// What a save will change in the file on disk, by section and key. Accepted when the user wants to save.
class ChangesDialog : public QDialog {
  Q_OBJECT

 public:
  /// What a save would do; none where the file cannot be written.
  enum class Save { No, Yes, OverAnother };
  ChangesDialog(const std::vector<SetupDifference>& differences, Save saves, QWidget* parent);
};

}  // namespace tervane
