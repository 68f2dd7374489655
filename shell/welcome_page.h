// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QStringList>
#include <QWidget>

class QVBoxLayout;

namespace tervane {

/// What the window shows while no document is open: how to begin, and the setups that were open lately.
class WelcomePage : public QWidget {
  Q_OBJECT

 public:
  WelcomePage();
  void Show(const QStringList& recentFiles);

 signals:
  void NewWanted();
  void OpenWanted();
  void FileWanted(const QString& path);

 private:
  QVBoxLayout* recent_;
};

}  // namespace tervane
