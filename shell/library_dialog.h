// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QDialog>
#include <memory>

#include "core/host.h"
#include "libraries/library.h"

class QLabel;
class QLineEdit;
class QListWidget;
class QPushButton;

namespace tervane {

class SeriesPlot;

/// A library and one of its entries to choose, with a chart of the chosen one. A file that is no such library says why.
class LibraryDialog : public QDialog {
  Q_OBJECT

 public:
  /// The host asks for another file.
  LibraryDialog(const Host::LibraryQuestion& question, Host& host, QWidget* parent);
  Host::LibraryChoice Chosen() const;

 private:
  void Browse();
  /// Reads the file that is named and lists its entries, that of the name chosen.
  void Read(const std::string& entry);
  void ShowEntry();

  Host::LibraryQuestion question_;
  Host& host_;
  std::shared_ptr<const LibraryReading> reading_;
  QLineEdit* file_;
  QListWidget* list_;
  SeriesPlot* chart_;
  QLabel* problem_;
  QPushButton* ok_;
};

}  // namespace tervane
