// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>

#include "shell/editors/value_table.h"

namespace tervane {

/// What a table of a file shows and does; rows and columns count from 0.
struct EditTableContent {
  std::function<int()> rows, columns;
  std::function<QString(int row, int column)> text;
  std::function<QString(int row)> rowHead;
  std::function<QString(int column)> columnHead;
  std::function<bool(int column)> mayEdit;
  /// These give why nothing was done, or what is to be known, or nothing.
  std::function<QString(int row, int column, const QString& text)> enter;
  std::function<QString(int row, int column, const QString& text)> paste;
  std::function<QString(int top, int left, int bottom, int right)> clear;
};

/// The values of a file that is edited: cells are typed, copied, pasted and cleared as in a spreadsheet.
class EditTable : public ValueTable {
  Q_OBJECT

 public:
  explicit EditTable(EditTableContent content);

  /// Other rows, columns or heads than before; what is current stays so.
  void Reset();
  /// The same rows and columns with other values.
  void Refill();
  /// Enters what stands in a cell that is being typed.
  void CommitOpenEditor();

  Q_INVOKABLE void copy();
  Q_INVOKABLE void paste();
  void Clear();

 signals:
  /// The user has changed something.
  void Changed();

 protected:
  void keyPressEvent(QKeyEvent* event) override;

 private:
  class Model;

  void Tell(const QString& told);

  EditTableContent content_;
  Model* model_;
};

}  // namespace tervane
