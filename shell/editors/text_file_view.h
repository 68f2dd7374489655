// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QWidget>
#include <string>

#include "platform/files.h"
#include "platform/text_pieces.h"

class QLabel;
class QPlainTextEdit;

namespace tervane {

/// The text of a file to read. It is read as far as the user scrolls: a line below says how much of it is shown.
class TextFileView : public QWidget {
  Q_OBJECT

 public:
  explicit TextFileView(QWidget* parent = nullptr);

  /// Shows a file; one that is shown already only where it has changed on disk.
  void Show(const std::string& path);
  QPlainTextEdit& Text() const { return *text_; }
  QString Status() const;

 private:
  void ReadOn();
  void ReadOnAtEnd();

  QPlainTextEdit* text_;
  QLabel* status_;
  std::string path_;
  FileStamp stamp_;
  TextPieces pieces_;
};

}  // namespace tervane
