// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QDialog>
#include <QWidget>

class QLabel;
class QProgressBar;
class QPushButton;

namespace tervane {

class DocumentRun;

/// How far a run is, in one row: what the engine does, a bar, the time, and a button that stops it.
class RunPanel : public QWidget {
  Q_OBJECT

 public:
  explicit RunPanel(DocumentRun& run);

 private:
  void Sync();

  DocumentRun& run_;
  QLabel *text_, *time_;
  QProgressBar* bar_;
  QPushButton* stop_;
};

/// The same as a window beside the document.
class RunWindow : public QDialog {
  Q_OBJECT

 public:
  RunWindow(DocumentRun& run, QWidget* parent);
};

}  // namespace tervane
