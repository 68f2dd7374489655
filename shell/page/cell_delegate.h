// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QKeyEvent>
#include <QPersistentModelIndex>
#include <QStyledItemDelegate>
#include <optional>

#include "shell/page/table_model.h"

class QLineEdit;

namespace tervane {

/// How the cells of a table are drawn and edited. A value that the cell refuses stays in its editor.
class CellDelegate : public QStyledItemDelegate {
  Q_OBJECT

 public:
  CellDelegate(TableModel& model, CYbSEDlgBase& page, QObject* parent)
      : QStyledItemDelegate(parent), model_(model), page_(page) {}

  QWidget* createEditor(QWidget* parent, const QStyleOptionViewItem& option, const QModelIndex& index) const override;
  void setEditorData(QWidget* editor, const QModelIndex& index) const override;
  void setModelData(QWidget* editor, QAbstractItemModel* model, const QModelIndex& index) const override;
  void updateEditorGeometry(QWidget* editor, const QStyleOptionViewItem& option,
                            const QModelIndex& index) const override;
  void paint(QPainter* painter, const QStyleOptionViewItem& option, const QModelIndex& index) const override;
  bool editorEvent(QEvent* event, QAbstractItemModel* model, const QStyleOptionViewItem& option,
                   const QModelIndex& index) override;

 signals:
  /// The value of an editor was taken, and the key leads to another cell.
  void LeftBy(int key, Qt::KeyboardModifiers modifiers);
  void ButtonPressed(int row, int column);

 protected:
  void initStyleOption(QStyleOptionViewItem* option, const QModelIndex& index) const override;
  bool eventFilter(QObject* watched, QEvent* event) override;

 private:
  CellKind KindAt(const QModelIndex& index) const { return model_.Table().Kind(index.row() + 1, index.column() + 1); }
  bool IsGrey(const QModelIndex& index) const { return model_.Table().IsGrey(index.row() + 1, index.column() + 1); }
  QWidget* NewChoiceList(QWidget* parent, const QModelIndex& index) const;
  /// A choice among so many that one is found by its name, in a line that offers those that hold what is typed.
  bool IsFoundByName(const QModelIndex& index) const;
  void AddNames(QLineEdit* edit, const QModelIndex& index) const;
  /// What the cell stores for a text of its editor; nothing where that means no choice, or several.
  std::optional<QString> ValueOf(const QModelIndex& index, const QString& text) const;
  void AddBrowseButton(QLineEdit* edit, const QModelIndex& index) const;
  void AddCalendarButton(QLineEdit* edit) const;
  void AddOffers(QLineEdit* edit, const QModelIndex& index) const;
  /// Hands the text of a line over; false when it was refused, and then stays in it.
  bool Take(QLineEdit* edit);
  void ShowRefusal(QLineEdit* edit, const QString& expected) const;
  void Close(QWidget* editor);

  TableModel& model_;
  CYbSEDlgBase& page_;
  mutable QPersistentModelIndex index_;  ///< Of the cell that is edited.
  QPersistentModelIndex held_;           ///< The button under the mouse while it is held down.
};

}  // namespace tervane
