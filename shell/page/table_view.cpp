// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/page/table_view.h"

#include <QAction>
#include <QApplication>
#include <QClipboard>
#include <QComboBox>
#include <QHBoxLayout>
#include <QHeaderView>
#include <QKeyEvent>
#include <QLabel>
#include <QLineEdit>
#include <QMenu>
#include <QPointer>
#include <QStyledItemDelegate>
#include <QToolButton>
#include <QToolTip>
#include <algorithm>

#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

// ---- Model

int TableModel::columnCount(const QModelIndex& parent) const {
  return parent.isValid() ? 0 : static_cast<int>(Table().Columns().size());
}

QStringList TableModel::Heads() const {
  QStringList heads;
  for (int column = 1; column <= columnCount(); ++column) heads << ToQt(Table().Head(column));
  return heads;
}

void TableModel::Sync() {
  const int rows = Table().RowCount();
  if (Table().IsShownOnly() && heads_ != Heads()) {
    beginResetModel();
    heads_ = Heads();
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
}

QVariant TableModel::data(const QModelIndex& index, int role) const {
  const int row = index.row() + 1, column = index.column() + 1;
  const CellKind kind = Table().Kind(row, column);
  switch (role) {
    case Qt::DisplayRole:
      if (kind == CellKind::Check) return {};
      return ToQt(Table().ShownCell(row, column));
    case Qt::EditRole:
      return ToQt(Table().Cell(row, column));
    case Qt::CheckStateRole:
      if (kind == CellKind::Check) return Table().Cell(row, column) == "1" ? Qt::Checked : Qt::Unchecked;
      return {};
    case Qt::ToolTipRole:
      // What does not fit into its cell is read here.
      return Table().IsShownOnly() ? ToQt(Table().ShownCell(row, column)) : Translated(Table().ToolTip(column));
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
    case Qt::ForegroundRole:
      if (Table().IsLink(row, column)) return QApplication::palette().link();
      return {};
    case Qt::TextAlignmentRole: {
      const bool isNumber = kind == CellKind::Number || kind == CellKind::Integer;
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
  if (role == Qt::DisplayRole)
    return orientation == Qt::Vertical ? QVariant(section + 1) : QVariant(Translated(Table().Head(section + 1)));
  if (role == Qt::ToolTipRole && orientation == Qt::Horizontal) return Translated(Table().ToolTip(section + 1));
  return {};
}

Qt::ItemFlags TableModel::flags(const QModelIndex& index) const {
  Qt::ItemFlags flags = Qt::ItemIsSelectable | Qt::ItemIsEnabled;
  if (Table().IsReadOnly(index.row() + 1, index.column() + 1)) return flags;
  return flags | (Table().Kind(index.row() + 1, index.column() + 1) == CellKind::Check ? Qt::ItemIsUserCheckable
                                                                                       : Qt::ItemIsEditable);
}

// ---- Cells

namespace {

/// The editors of cells. A value that the cell refuses stays in its editor.
class CellDelegate : public QStyledItemDelegate {
 public:
  CellDelegate(TableModel& model, CYbSEDlgBase& page, QObject* parent)
      : QStyledItemDelegate(parent), model_(model), page_(page) {}

  QWidget* createEditor(QWidget* parent, const QStyleOptionViewItem&, const QModelIndex& index) const override {
    const TableForm& table = model_.Table();
    const int column = index.column() + 1;
    index_ = index;
    if (table.Kind(index.row() + 1, column) == CellKind::Choice) {
      auto* list = new QComboBox(parent);
      for (const std::string& choice : table.Choices(column)) list->addItem(Translated(choice));
      connect(list, &QComboBox::activated, this, [this, list] {
        auto* self = const_cast<CellDelegate*>(this);
        emit self->commitData(list);
        emit self->closeEditor(list);
      });
      return list;
    }
    auto* edit = new QLineEdit(parent);
    edit->setFrame(false);
    if (table.Kind(index.row() + 1, column) == CellKind::File) {
      QAction* browse = edit->addAction(Theme::Get().Icon("browse"), QLineEdit::TrailingPosition);
      browse->setToolTip(TableView::tr("Choose a file"));
      connect(browse, &QAction::triggered, this, [this, edit] {
        Host::FileQuestion question;
        question.current = FromQt(edit->text());
        if (const auto chosen = page_.Outside().AskFileToOpen(question)) edit->setText(ToQt(*chosen));
        edit->setFocus();
      });
    }
    return edit;
  }

  void setEditorData(QWidget* editor, const QModelIndex& index) const override {
    const QString value = index.data(Qt::EditRole).toString();
    if (auto* list = qobject_cast<QComboBox*>(editor))
      list->setCurrentIndex(value.toInt());
    else if (auto* edit = qobject_cast<QLineEdit*>(editor); edit && !IsMarked(edit))
      edit->setText(value);
  }

  void setModelData(QWidget* editor, QAbstractItemModel* model, const QModelIndex& index) const override {
    const auto* list = qobject_cast<QComboBox*>(editor);
    if (list)
      model->setData(index, QString::number(list->currentIndex()), Qt::EditRole);
    else if (const auto* edit = qobject_cast<QLineEdit*>(editor))
      model->setData(index, edit->text(), Qt::EditRole);
  }

 protected:
  bool eventFilter(QObject* watched, QEvent* event) override {
    auto* edit = qobject_cast<QLineEdit*>(watched);
    if (edit && Leaves(event) && index_.isValid() && edit->text() != index_.data(Qt::EditRole).toString() &&
        !model_.setData(index_, edit->text(), Qt::EditRole)) {
      edit->setProperty("refused", true);
      QPalette palette;
      palette.setColor(QPalette::Text, Theme::Get().ErrorColor());
      edit->setPalette(palette);
      const QString message = TableView::tr("Not taken: %1.").arg(model_.Refusal());
      edit->setToolTip(message);
      QToolTip::showText(edit->mapToGlobal(QPoint(0, edit->height())), message, edit);
      return event->type() == QEvent::KeyPress;
    }
    return QStyledItemDelegate::eventFilter(watched, event);
  }

 private:
  static bool IsMarked(const QWidget* edit) { return edit->property("refused").toBool(); }
  static bool Leaves(const QEvent* event) {
    if (event->type() == QEvent::FocusOut)
      return static_cast<const QFocusEvent*>(event)->reason() != Qt::PopupFocusReason;
    if (event->type() != QEvent::KeyPress) return false;
    const int key = static_cast<const QKeyEvent*>(event)->key();
    return key == Qt::Key_Return || key == Qt::Key_Enter || key == Qt::Key_Tab || key == Qt::Key_Backtab;
  }

  TableModel& model_;
  CYbSEDlgBase& page_;
  mutable QPersistentModelIndex index_;  ///< Of the cell that is edited.
};

}  // namespace

// ---- View

constexpr int kTableWidth = 540;  ///< Of a table that is only shown, so that it can be read beside a map.

TableView::TableView(CYbSEDlgBase& page, Control& control) : page_(page), control_(control) {
  const Theme& theme = Theme::Get();
  auto* all = new QVBoxLayout(this);
  all->setContentsMargins(0, 0, 0, 0);
  auto* bar = new QHBoxLayout;
  bar->setSpacing(theme.Scaled(4));
  const auto button = [&](const char* icon, const QString& text, const QString& toolTip, RowAction action) {
    auto* made = new QToolButton;
    made->setIcon(theme.Icon(icon));
    made->setText(text);
    made->setToolButtonStyle(Qt::ToolButtonTextBesideIcon);
    made->setToolTip(toolTip);
    made->setFocusPolicy(Qt::TabFocus);
    bar->addWidget(made);
    connect(made, &QToolButton::clicked, this, [this, action] { ChangeRows(action); });
    return made;
  };
  insert_ = button("insert", tr("Insert"),
                   tr("Insert rows above the selected ones, or one at the end (Ctrl+Insert: above the current cell)"),
                   RowAction::Insert);
  delete_ = button("delete", tr("Delete"), tr("Delete the selected rows (Ctrl+Delete: that of the current cell)"),
                   RowAction::Delete);
  up_ = button("up", tr("Up"), tr("Move the selected rows up (Ctrl+Up: that of the current cell)"), RowAction::MoveUp);
  down_ = button("down", tr("Down"), tr("Move the selected rows down (Ctrl+Down: that of the current cell)"),
                 RowAction::MoveDown);
  message_ = new QLabel;
  message_->setWordWrap(true);
  bar->addSpacing(theme.Scaled(12));
  bar->addWidget(message_, 1);
  all->addLayout(bar);

  model_ = new TableModel(page, control);
  model_->setParent(this);
  view_ = new QTableView;
  view_->setModel(model_);
  view_->setItemDelegate(new CellDelegate(*model_, page, view_));
  view_->setAlternatingRowColors(true);
  view_->setEditTriggers(QAbstractItemView::DoubleClicked | QAbstractItemView::SelectedClicked |
                         QAbstractItemView::EditKeyPressed | QAbstractItemView::AnyKeyPressed);
  view_->setSelectionMode(QAbstractItemView::ContiguousSelection);
  view_->setTabKeyNavigation(true);
  view_->setMinimumHeight(theme.Scaled(140));
  view_->installEventFilter(this);
  view_->setContextMenuPolicy(Qt::ActionsContextMenu);
  const int rowHeight = view_->fontMetrics().height() + theme.Scaled(8);
  view_->verticalHeader()->setDefaultSectionSize(rowHeight);
  view_->verticalHeader()->setSectionResizeMode(QHeaderView::Fixed);
  view_->horizontalHeader()->setStretchLastSection(true);
  view_->horizontalHeader()->setDefaultAlignment(Qt::AlignLeft | Qt::AlignVCenter);
  FitColumns();
  connect(model_, &QAbstractItemModel::modelReset, this, &TableView::FitColumns);
  all->addWidget(view_, 1);

  const auto action = [this](const QString& text, const QKeySequence& keys, auto operation) {
    auto* made = new QAction(text, view_);
    made->setShortcut(keys);
    made->setShortcutContext(Qt::WidgetShortcut);
    view_->addAction(made);
    connect(made, &QAction::triggered, this, operation);
  };
  action(tr("Cu&t"), QKeySequence::Cut, &TableView::Cut);
  action(tr("&Copy"), QKeySequence::Copy, &TableView::Copy);
  action(tr("&Paste"), QKeySequence::Paste, &TableView::Paste);
  action(tr("&Fill Down"), QKeySequence(Qt::CTRL | Qt::Key_D), &TableView::FillDown);
  action(tr("C&lear"), QKeySequence(Qt::Key_Delete), &TableView::ClearCells);
  connect(view_->selectionModel(), &QItemSelectionModel::selectionChanged, this, &TableView::SyncButtons);
  view_->horizontalHeader()->setContextMenuPolicy(Qt::CustomContextMenu);
  connect(view_->horizontalHeader(), &QWidget::customContextMenuRequested, this, [this](const QPoint& place) {
    OfferUnits(view_->horizontalHeader()->logicalIndexAt(place), view_->horizontalHeader()->mapToGlobal(place));
  });
  if (control.table->IsShownOnly()) {
    for (QToolButton* change : {insert_, delete_, up_, down_}) change->hide();
    message_->hide();
    view_->setSelectionBehavior(QAbstractItemView::SelectRows);
    view_->setMinimumWidth(theme.Scaled(kTableWidth));
    view_->verticalHeader()->hide();
    connect(view_, &QTableView::clicked, this,
            [this](const QModelIndex& index) { control_.table->Press(index.row() + 1, index.column() + 1); });
    connect(view_->selectionModel(), &QItemSelectionModel::currentRowChanged, this,
            [this](const QModelIndex& current) { control_.table->Choose(current.row() + 1); });
  }
  SyncButtons();
}

QWidget* TableView::FocusTarget() const { return view_; }

void TableView::Sync() {
  model_->Sync();
  message_->clear();
  // What is only shown is chosen by the user alone.
  if (!control_.table->IsShownOnly() && !view_->currentIndex().isValid() && model_->rowCount() > 0)
    view_->selectionModel()->setCurrentIndex(model_->index(0, 0), QItemSelectionModel::NoUpdate);
  SyncButtons();
}

void TableView::Commit() {
  // An open editor hands its value over when it loses the keyboard.
  if (QWidget* focus = QApplication::focusWidget(); focus && focus != view_ && view_->isAncestorOf(focus))
    view_->setFocus();
}

std::optional<CellRange> TableView::Selected() const {
  const QItemSelection selection = view_->selectionModel()->selection();
  if (!selection.isEmpty()) {
    CellRange range{model_->rowCount(), model_->columnCount(), 1, 1};
    for (const QItemSelectionRange& part : selection) {
      range.firstRow = std::min(range.firstRow, part.top() + 1);
      range.firstColumn = std::min(range.firstColumn, part.left() + 1);
      range.lastRow = std::max(range.lastRow, part.bottom() + 1);
      range.lastColumn = std::max(range.lastColumn, part.right() + 1);
    }
    return range;
  }
  const QModelIndex current = view_->currentIndex();
  if (current.isValid()) return OneCell(current.row() + 1, current.column() + 1);
  return std::nullopt;
}

std::pair<int, int> TableView::SelectedRows() const {
  const QModelIndexList rows = view_->selectionModel()->selectedRows();
  if (rows.isEmpty()) return {0, 0};
  const auto [first, last] =
      std::ranges::minmax_element(rows, {}, [](const QModelIndex& index) { return index.row(); });
  return {first->row() + 1, last->row() + 1};
}

void TableView::ChangeRows(RowAction action) {
  const auto [first, last] = SelectedRows();
  if (!page_.ChangeRows(control_, action, first, last) || first < 1) {
    if (action == RowAction::Insert && first < 1) SelectCell(model_->rowCount(), 1);
    return;
  }
  const int by = action == RowAction::MoveUp ? -1 : action == RowAction::MoveDown ? 1 : 0;
  if (by == 0) return;
  // The selection goes with its rows.
  QItemSelection selection(model_->index(first - 1 + by, 0), model_->index(last - 1 + by, model_->columnCount() - 1));
  view_->selectionModel()->setCurrentIndex(model_->index(first - 1 + by, 0), QItemSelectionModel::NoUpdate);
  view_->selectionModel()->select(selection, QItemSelectionModel::ClearAndSelect);
}

void TableView::ChangeRowOfCurrentCell(RowAction action) {
  const QModelIndex current = view_->currentIndex();
  if (!current.isValid()) return;
  const int row = current.row(), column = current.column();
  if (!page_.ChangeRow(control_, action, row + 1)) return;
  const int by = action == RowAction::MoveUp ? -1 : action == RowAction::MoveDown ? 1 : 0;
  if (model_->rowCount() > 0)
    view_->setCurrentIndex(model_->index(std::clamp(row + by, 0, model_->rowCount() - 1), column));
}

void TableView::SelectCell(int row, int column) { view_->setCurrentIndex(model_->index(row - 1, column - 1)); }

void TableView::Copy() {
  if (const auto cells = Selected()) QApplication::clipboard()->setText(ToQt(control_.table->CopyText(*cells)));
}

void TableView::Cut() {
  Copy();
  ClearCells();
}

void TableView::Paste() {
  const QString text = QApplication::clipboard()->text();
  const CellRange cells = Selected().value_or(CellRange{});
  if (!text.isEmpty()) {
    const CellsResult result = page_.Paste(control_, cells, FromQt(text));
    Tell(result, tr("Cells pasted: %1").arg(result.taken));
    if (result.taken > 0)
      view_->selectionModel()->select(
          QItemSelection(model_->index(result.cells.firstRow - 1, result.cells.firstColumn - 1),
                         model_->index(result.cells.lastRow - 1, result.cells.lastColumn - 1)),
          QItemSelectionModel::ClearAndSelect);
  }
}

void TableView::FillDown() {
  const auto cells = Selected();
  if (!cells) return;
  const CellsResult result = page_.FillDown(control_, *cells);
  Tell(result, tr("Cells filled: %1").arg(result.taken));
}

void TableView::ClearCells() {
  if (const auto cells = Selected()) Tell(page_.ClearCells(control_, *cells), {});
}

void TableView::Tell(const CellsResult& result, const QString& done) {
  message_->setText(done);
  if (result.refused == 0) return;
  page_.Outside().Tell(FromQt(tr("These cells kept their values:")) + "\n\n" + result.Message(), Host::Icon::Warning);
}

bool TableView::eventFilter(QObject* watched, QEvent* event) {
  const bool isPress = event->type() == QEvent::KeyPress || event->type() == QEvent::ShortcutOverride;
  if (watched == view_ && (isPress || event->type() == QEvent::KeyRelease)) {
    const auto* keys = static_cast<QKeyEvent*>(event);
    const bool isReturn = keys->key() == Qt::Key_Return || keys->key() == Qt::Key_Enter;
    if (event->type() == QEvent::KeyPress && isReturn && control_.table->IsShownOnly()) {
      const QModelIndex current = view_->currentIndex();
      for (int column = 1; column <= model_->columnCount(); ++column)
        if (control_.table->Press(current.row() + 1, column)) return true;
    }
    if (keys->modifiers() & Qt::ControlModifier) {
      std::optional<RowAction> action;
      if (keys->key() == Qt::Key_Insert) action = RowAction::Insert;
      if (keys->key() == Qt::Key_Delete) action = RowAction::Delete;
      if (keys->key() == Qt::Key_Up) action = RowAction::MoveUp;
      if (keys->key() == Qt::Key_Down) action = RowAction::MoveDown;
      if (action) {
        // Taken at the press, done at the release: holding the key does not repeat it.
        event->accept();
        if (event->type() == QEvent::KeyRelease && !keys->isAutoRepeat()) ChangeRowOfCurrentCell(*action);
        return true;
      }
    }
  }
  return QWidget::eventFilter(watched, event);
}

void TableView::resizeEvent(QResizeEvent* event) {
  QWidget::resizeEvent(event);
  if (hasFittedColumns_ || (!isVisible() && !control_.table->IsShownOnly())) return;
  // Columns that do not fit begin narrower; from then on they are the user's. What is only shown follows its room.
  hasFittedColumns_ = !control_.table->IsShownOnly();
  FitColumns();
}

void TableView::FitColumns() {
  // The view itself is laid out later.
  const int edges = 2 * view_->frameWidth() + style()->pixelMetric(QStyle::PM_ScrollBarExtent);
  const int room = control_.table->IsShownOnly() ? width() - edges : view_->viewport()->width();
  int wanted = 0;
  for (const TableColumn& column : control_.table->Columns()) wanted += Theme::Get().Scaled(column.width);
  const double share = wanted > room ? static_cast<double>(room) / wanted : 1;
  for (int column = 0; column < model_->columnCount(); ++column) {
    const int width = Theme::Get().Scaled(control_.table->Columns()[static_cast<std::size_t>(column)].width);
    view_->setColumnWidth(column, std::max(Theme::Get().Scaled(50), static_cast<int>(width * share)));
  }
}

void TableView::OfferUnits(int column, const QPoint& place) {
  const std::vector<UnitChoice> choices = control_.table->UnitChoices(column + 1);
  if (choices.size() < 2) return;
  const int itemType = control_.table->Columns()[static_cast<std::size_t>(column)].itemType;
  QMenu menu;
  for (const UnitChoice& choice : choices)
    connect(menu.addAction(Translated(choice.text)), &QAction::triggered, this,
            [this, itemType, key = choice.key] { emit UnitChosen(itemType, key); });
  menu.exec(place);
}

void TableView::SyncButtons() {
  const auto [first, last] = SelectedRows();
  delete_->setEnabled(first > 0);
  up_->setEnabled(first > 1);
  down_->setEnabled(first > 0 && last < model_->rowCount());
}

}  // namespace tervane
