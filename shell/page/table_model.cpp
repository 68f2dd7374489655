// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/page/table_model.h"

#include <QApplication>
#include <QFont>
#include <QPalette>
#include <QPointer>
#include <QRegularExpression>

#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

/// A number, perhaps with the share that it stands for behind: "812.5 (98%)".
bool IsNumberText(const QString& text) {
  static const QRegularExpression number(R"(^-?\d+(\.\d+)?(e[+-]?\d+)?( \([\d.]+%\))?$)");
  return number.match(text).hasMatch();
}

}  // namespace

QStringList TableModel::Columns() const {
  QStringList columns;
  for (int column = 1; column <= Table().ColumnCount(); ++column)
    columns << (Table().Column(column)->IsButton() ? "button " : "") + ToQt(Table().Column(column)->head);
  return columns;
}

void TableModel::Sync() {
  Table().Follow();
  const int rows = Table().RowCount();
  if (const QStringList columns = Columns(); columns != columns_) {
    beginResetModel();
    columns_ = columns;
    rows_ = rows;
    endResetModel();
    return;
  }
  if (rows > rows_) {
    beginInsertRows({}, rows_, rows - 1);
    rows_ = rows;
    endInsertRows();
  } else if (rows < rows_) {
    beginRemoveRows({}, rows, rows_ - 1);
    rows_ = rows;
    endRemoveRows();
  }
  // Views fetch again only what they show.
  if (rows > 0) emit dataChanged(index(0, 0), index(rows - 1, columnCount() - 1));
  emit headerDataChanged(Qt::Horizontal, 0, columnCount() - 1);
  if (rows > 0 && Table().HasRowHeads()) emit headerDataChanged(Qt::Vertical, 0, rows - 1);
}

bool TableModel::IsGreyText(int row, int column) const {
  // A button is grey itself, and so is all of a table that is disabled as a whole.
  return Table().IsGrey(row, column) && !Table().Column(column)->IsButton() && control_.IsEnabled();
}

QString TableModel::ShownText(int row, int column) const {
  const std::string text = Table().ShownCell(row, column);
  const CellKind kind = Table().Kind(row, column);
  const bool isTyped = kind != CellKind::Choice && kind != CellKind::Button && !Table().IsReadOnly(row, column);
  return isTyped ? ToQt(text) : Translated(text);
}

QVariant TableModel::data(const QModelIndex& index, int role) const {
  const int row = index.row() + 1, column = index.column() + 1;
  switch (role) {
    case Qt::DisplayRole:
      if (Table().Kind(row, column) == CellKind::Check) return {};
      return ShownText(row, column);
    case Qt::EditRole:
      return ToQt(Table().Cell(row, column));
    case Qt::CheckStateRole:
      if (Table().Kind(row, column) == CellKind::Check)
        return Table().Cell(row, column) == "1" ? Qt::Checked : Qt::Unchecked;
      return {};
    case Qt::ToolTipRole:
      // What does not fit into its cell is read here.
      return Table().IsShownOnly() ? ShownText(row, column) : Translated(Table().ToolTip(row, column));
    case Qt::AccessibleTextRole:
      if (Table().Kind(row, column) == CellKind::Check) return Translated(Table().Head(column));
      // A button may have no more than an icon.
      return Table().Column(column) && Table().Column(column)->IsButton() && Table().ShownCell(row, column).empty()
                 ? QVariant(Translated(Table().ToolTip(row, column)))
                 : QVariant();
    case Qt::DecorationRole: {
      const std::string icon = Table().Icon(row, column);
      return icon.empty() ? QVariant() : QVariant(Theme::Get().Icon(icon.c_str()));
    }
    case Qt::FontRole:
      if (Table().IsLink(row, column)) {
        QFont font = QApplication::font();
        font.setUnderline(true);
        return font;
      }
      return {};
    case Qt::BackgroundRole:
      return IsGreyText(row, column) ? QVariant(QApplication::palette().window()) : QVariant();
    case Qt::ForegroundRole:
      if (IsGreyText(row, column)) return Theme::Get().QuietColor();
      if (Table().IsLink(row, column)) return QApplication::palette().link();
      return {};
    case Qt::TextAlignmentRole: {
      const CellKind kind = Table().Kind(row, column);
      const bool isNumber = kind == CellKind::Number || kind == CellKind::Integer ||
                            (Table().IsShownOnly() && IsNumberText(ToQt(Table().ShownCell(row, column))));
      return static_cast<int>(Qt::AlignVCenter | (isNumber ? Qt::AlignRight : Qt::AlignLeft));
    }
    default:
      return {};
  }
}

bool TableModel::setData(const QModelIndex& index, const QVariant& value, int role) {
  std::string typed = FromQt(value.toString());
  if (role == Qt::CheckStateRole) typed = value.toInt() == Qt::Checked ? "1" : "0";
  const QPointer<TableModel> self(this);
  const std::string expected = page_.EnterCell(control_, index.row() + 1, index.column() + 1, typed);
  if (!self) return expected.empty();
  refusal_ = Translated(expected);
  return expected.empty();
}

QVariant TableModel::headerData(int section, Qt::Orientation orientation, int role) const {
  if (role == Qt::DisplayRole && orientation == Qt::Vertical) return Translated(Table().RowHead(section + 1));
  if (role == Qt::DisplayRole)
    return Table().HeadSpan(section + 1) == 0 ? QVariant() : QVariant(Translated(Table().Head(section + 1)));
  if (role == Qt::ToolTipRole && orientation == Qt::Horizontal && Table().Column(section + 1))
    return Translated(Table().Column(section + 1)->toolTip);
  return {};
}

Qt::ItemFlags TableModel::flags(const QModelIndex& index) const {
  const Qt::ItemFlags flags = Qt::ItemIsSelectable | Qt::ItemIsEnabled;
  if (Table().IsReadOnly(index.row() + 1, index.column() + 1)) return flags;
  return flags | (Table().Kind(index.row() + 1, index.column() + 1) == CellKind::Check ? Qt::ItemIsUserCheckable
                                                                                       : Qt::ItemIsEditable);
}

}  // namespace tervane
