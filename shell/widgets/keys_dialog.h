// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The keys that no menu shows, and the window that lists all.
#pragma once

#include <QDialog>
#include <QString>
#include <vector>

class QAction;

namespace tervane {

/// Keys and what they do, "`Up`, `Down`" being told as "Up, Down".
struct KeyRow {
  QString keys, what;
};

/// What has these keys while it has the keyboard.
struct KeyGroup {
  QString place;  ///< "In a table"
  std::vector<KeyRow> rows;
};

/// All keys that parts of the window take, as they are told to the user.
std::vector<KeyGroup> KeysOfParts();

/// Lists the keys of the commands and those of the parts.
class KeysDialog : public QDialog {
  Q_OBJECT

 public:
  KeysDialog(const std::vector<KeyRow>& commands, QWidget* parent);
};

}  // namespace tervane
