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
  ChangesDialog(const std::vector<SetupDifference>& differences, bool maySave, QWidget* parent);
};

}  // namespace tervane
