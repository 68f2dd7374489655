// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QSettings>
#include <QString>
#include <QStringList>
#include <memory>
#include <string>

#include "platform/units.h"

namespace tervane {

/// What all windows of the running program share: its settings, the user's units, the places where it keeps things.
class Program {
 public:
  /// `settingsFile` is where the settings are kept; empty for the user's own.
  explicit Program(const QString& settingsFile = {});

  QSettings& Settings() { return *settings_; }
  const DisplayUnits& Units() const { return units_; }
  void ChooseUnit(int itemType, int unitKey);

  /// The language that the user chose, a code or `kSystemLanguage`; it is shown from the next start on.
  QString Language() const;
  void ChooseLanguage(const QString& language);

  /// Setups that were open, the latest first.
  QStringList RecentFiles() const;
  void AddRecentFile(const QString& path);
  void ForgetRecentFiles();

  /// Branches of the trees of a setup that was open lately, as they were left.
  QStringList Branches(const QString& path) const;
  void KeepBranches(const QString& path, const QStringList& branches);

  /// A folder of the user's for autosaves that cannot stand beside their setup.
  const std::string& RecoveryFolder() const { return recoveryFolder_; }

 private:
  std::unique_ptr<QSettings> settings_;
  DisplayUnits units_;
  std::string recoveryFolder_;
};

}  // namespace tervane
