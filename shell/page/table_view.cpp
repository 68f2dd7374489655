// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/page/table_view.h"

#include <QAction>
#include <QApplication>
#include <QClipboard>
#include <QComboBox>
#include <QDropEvent>
#include <QHBoxLayout>
#include <QHeaderView>
#include <QKeyEvent>
#include <QLabel>
#include <QLineEdit>
#include <QMenu>
#include <QMimeData>
#include <QRegularExpression>
#include <QToolButton>
#include <QUrl>
#include <algorithm>

#include "shell/page/cell_delegate.h"
#include "shell/page/table_head.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

constexpr int kTableWidth = 500;  ///< Of a table whose columns are not known yet.
constexpr int kLeastWidth = 320;  ///< Of a table that is only shown, so that it can be read beside a map.

TableView::TableView(CYbSEDlgBase& page, Control& control) : page_(page), control_(control) {
  auto* all = new QVBoxLayout(this);
  all->setContentsMargins(0, 0, 0, 0);
  model_ = new TableModel(page, control);
  model_->setParent(this);
  MakeButtons();
  MakeView();
  MakeActions();
  ConnectView();
  if (control_.table->CanArrange()) MakeFilter();
  SyncButtons();
}

void TableView::MakeButtons() {
  const Theme& theme = Theme::Get();
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
    if (!control_.table->Allows(action)) made->hide();
    connect(made, &QToolButton::clicked, this, [this, action] { ChangeRows(action); });
    return made;
  };
  insert_ = button("insert", tr("Insert"),
                   tr("Insert rows above the selected ones, or one at the end (Ctrl+Insert: above the current cell)"),
                   RowAction::Insert);
  delete_ = button("delete", tr("Delete"), tr("Delete the selected rows, or that of the current cell (Ctrl+Delete)"),
                   RowAction::Delete);
  up_ =
      button("up", tr("Up"), tr("Move the selected rows up, or that of the current cell (Ctrl+Up)"), RowAction::MoveUp);
  down_ = button("down", tr("Down"), tr("Move the selected rows down, or that of the current cell (Ctrl+Down)"),
                 RowAction::MoveDown);
  message_ = new QLabel;
  message_->setWordWrap(true);
  bar->addSpacing(theme.Scaled(12));
  bar->addWidget(message_, 1);
  static_cast<QVBoxLayout*>(layout())->addLayout(bar);
  Tell({});
}

void TableView::Tell(const QString& text) {
  message_->setText(text);
  // Above a table without buttons it takes no room while there is nothing to say.
  message_->setVisible(!text.isEmpty() || filter_ || control_.table->Allows(RowAction::Insert));
}

void TableView::MakeFilter() {
  filter_ = new QLineEdit;
  filter_->setPlaceholderText(tr("Filter"));
  filter_->setToolTip(tr("Shows the rows that hold this text; a click on a head sorts by its column"));
  filter_->setAccessibleName(tr("Filter rows"));
  filter_->setClearButtonEnabled(true);
  filter_->setMaximumWidth(Theme::Get().Scaled(200));
  static_cast<QHBoxLayout*>(layout()->itemAt(0)->layout())->insertWidget(0, filter_);
  setTabOrder(filter_, view_);
  connect(filter_, &QLineEdit::textChanged, this, [this](const QString& typed) {
    Commit();
    control_.table->Filter(FromQt(typed));
    Sync();
  });
  connect(view_->horizontalHeader(), &QHeaderView::sectionClicked, this, [this](int section) {
    Commit();
    control_.table->SortBy(section + 1);
    Sync();
  });
}

void TableView::ShowArrangement() {
  if (!filter_) return;
  const TableForm& table = *control_.table;
  QHeaderView& head = *view_->horizontalHeader();
  const int sorted = table.SortedColumn();
  head.setSortIndicatorShown(sorted > 0);
  if (sorted > 0) head.setSortIndicator(sorted - 1, table.IsDescending() ? Qt::DescendingOrder : Qt::AscendingOrder);
  if (!table.FilterText().empty() || message_->text().isEmpty())
    Tell(table.FilterText().empty() ? QString() : tr("%1 of %2").arg(table.RowCount()).arg(table.AllRows()));
}

void TableView::MakeView() {
  const Theme& theme = Theme::Get();
  view_ = new QTableView;
  view_->setHorizontalHeader(new TableHead(*model_, view_));
  view_->setModel(model_);
  view_->setAlternatingRowColors(true);
  view_->setWordWrap(false);
  view_->setEditTriggers(QAbstractItemView::DoubleClicked | QAbstractItemView::SelectedClicked |
                         QAbstractItemView::EditKeyPressed | QAbstractItemView::AnyKeyPressed);
  view_->setSelectionMode(QAbstractItemView::ContiguousSelection);
  view_->setTabKeyNavigation(false);  // the keys are our own
  view_->setMinimumHeight(theme.Scaled(140));
  view_->installEventFilter(this);
  view_->viewport()->setAcceptDrops(true);
  view_->viewport()->installEventFilter(this);
  view_->setContextMenuPolicy(Qt::ActionsContextMenu);
  const int rowHeight = view_->fontMetrics().height() + theme.Scaled(8);
  view_->verticalHeader()->setDefaultSectionSize(rowHeight);
  view_->verticalHeader()->setSectionResizeMode(QHeaderView::Fixed);
  view_->horizontalHeader()->setContextMenuPolicy(Qt::CustomContextMenu);
  FitColumns();
  static_cast<QVBoxLayout*>(layout())->addWidget(view_, 1);
  if (!control_.table->IsShownOnly()) return;
  view_->setSelectionBehavior(QAbstractItemView::SelectRows);
  view_->setMinimumWidth(std::min(theme.Scaled(kLeastWidth), WidthOfColumns()));
  view_->verticalHeader()->setVisible(control_.table->HasRowHeads());
}

void TableView::MakeActions() {
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
  if (const std::string& toAll = control_.table->ToAllRowsCommand(); !toAll.empty())
    action(Translated(toAll), QKeySequence(Qt::CTRL | Qt::ALT | Qt::Key_D), &TableView::FillAll);
  action(tr("C&lear"), QKeySequence(Qt::Key_Delete), &TableView::ClearCells);
}

void TableView::ConnectView() {
  auto* cells = new CellDelegate(*model_, page_, view_);
  view_->setItemDelegate(cells);
  connect(cells, &CellDelegate::LeftBy, this, &TableView::GoOn);
  const auto press = [this](int row, int column) {
    // What a press does may run a dialog of its own or replace the page: the view's own code returns first.
    QMetaObject::invokeMethod(
        this, [this, row, column] { control_.table->Press(row + 1, column + 1); }, Qt::QueuedConnection);
  };
  connect(cells, &CellDelegate::ButtonPressed, this, press);
  connect(view_, &QTableView::clicked, this, [this, press](const QModelIndex& index) {
    if (control_.table->IsLink(index.row() + 1, index.column() + 1)) press(index.row(), index.column());
  });
  connect(model_, &QAbstractItemModel::modelReset, this, &TableView::FitColumns);
  connect(view_->horizontalHeader(), &QHeaderView::sectionResized, this, [this] {
    if (!isFitting_ && (QApplication::mouseButtons() & Qt::LeftButton) && view_->horizontalHeader()->underMouse())
      areColumnsTheUsers_ = true;
  });
  connect(view_->selectionModel(), &QItemSelectionModel::selectionChanged, this, [this] {
    const auto selected = Selected();
    control_.table->Select(selected ? selected->firstRow : 0, selected ? selected->lastRow : 0);
    SyncButtons();
  });
  connect(view_->selectionModel(), &QItemSelectionModel::currentChanged, this,
          [this](const QModelIndex& current, const QModelIndex& before) {
            isSelectedByHead_ = false;
            SyncButtons();
            if (!isSyncing_ && current.isValid() && current.row() != before.row())
              page_.ChooseRow(control_, current.row() + 1);
          });
  const auto selectedByHead = [this] {
    isSelectedByHead_ = true;
    SyncButtons();
  };
  connect(view_->verticalHeader(), &QHeaderView::sectionPressed, this, selectedByHead);
  connect(view_->verticalHeader(), &QHeaderView::sectionEntered, this, selectedByHead);
  connect(view_->horizontalHeader(), &QWidget::customContextMenuRequested, this, [this](const QPoint& place) {
    OfferUnits(view_->horizontalHeader()->logicalIndexAt(place), view_->horizontalHeader()->mapToGlobal(place));
  });
}

QWidget* TableView::FocusTarget() const { return view_; }

int TableView::WantedWidth() const {
  const QHeaderView& rowHeads = *view_->verticalHeader();
  return WidthOfColumns() + (rowHeads.isHidden() ? 0 : rowHeads.sizeHint().width());
}

void TableView::Sync() {
  isSyncing_ = true;
  model_->Sync();
  // What is only shown is chosen by the user alone.
  if (!control_.table->IsShownOnly()) FollowCurrentRow();
  isSyncing_ = false;
  Tell({});
  ShowArrangement();
  SyncButtons();
}

void TableView::FollowCurrentRow() {
  const int row = control_.table->CurrentRow() - 1;
  const QModelIndex before = view_->currentIndex();
  if (row < 0 || row >= model_->rowCount() || model_->columnCount() == 0 || before.row() == row) return;
  const QModelIndexList selected = view_->selectionModel()->selectedIndexes();
  const bool isAlone = selected.size() == 1 && selected.front() == before;
  view_->selectionModel()->setCurrentIndex(
      model_->index(row, std::max(before.column(), 0)),
      isAlone ? QItemSelectionModel::ClearAndSelect : QItemSelectionModel::NoUpdate);
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
  if (rows.isEmpty() || (model_->columnCount() == 1 && !isSelectedByHead_)) return {0, 0};
  const auto [first, last] =
      std::ranges::minmax_element(rows, {}, [](const QModelIndex& index) { return index.row(); });
  return {first->row() + 1, last->row() + 1};
}

int TableView::FirstEditableColumn(int row) const {
  for (int column = 0; column < model_->columnCount(); ++column)
    if (model_->flags(model_->index(row, column)) & Qt::ItemIsEditable) return column;
  return 0;
}

void TableView::ChangeRows(RowAction action) {
  Commit();
  const auto [first, last] = SelectedRows();
  if (first < 1 && action != RowAction::Insert) {
    ChangeRowOfCurrentCell(action);
  } else if (page_.ChangeRows(control_, action, first, last)) {
    // What is typed next goes into the new row.
    const int row = action != RowAction::Insert ? first - 1 : first < 1 ? model_->rowCount() - 1 : first - 1;
    const int by = action == RowAction::MoveUp ? -1 : action == RowAction::MoveDown ? 1 : 0;
    if (action == RowAction::Insert && first < 1) {
      SelectCell(row + 1, FirstEditableColumn(row) + 1);
    } else if (action != RowAction::Delete) {
      // The selection goes with its rows.
      const int column = action == RowAction::Insert ? FirstEditableColumn(row) : 0;
      const QItemSelection rows(model_->index(first - 1 + by, 0),
                                model_->index(last - 1 + by, model_->columnCount() - 1));
      view_->selectionModel()->setCurrentIndex(model_->index(row + by, column), QItemSelectionModel::NoUpdate);
      view_->selectionModel()->select(rows, QItemSelectionModel::ClearAndSelect);
      isSelectedByHead_ = true;
      SyncButtons();
    }
  }
  view_->setFocus();
}

void TableView::ChangeRowOfCurrentCell(RowAction action) {
  const QModelIndex current = view_->currentIndex();
  if (!current.isValid()) return;
  const int row = current.row(), column = current.column();
  if (!page_.ChangeRow(control_, action, row + 1)) return;
  const int by = action == RowAction::MoveUp ? -1 : action == RowAction::MoveDown ? 1 : 0;
  if (model_->rowCount() == 0) return;
  const int now = std::clamp(row + by, 0, model_->rowCount() - 1);
  view_->setCurrentIndex(model_->index(now, action == RowAction::Insert ? FirstEditableColumn(now) : column));
}

void TableView::SelectCell(int row, int column) { view_->setCurrentIndex(model_->index(row - 1, column - 1)); }

void TableView::Copy() {
  const auto cells = Selected();
  if (!cells) return;
  // Buttons alone have no text.
  if (const std::string text = control_.table->CopyText(*cells); !text.empty())
    QApplication::clipboard()->setText(ToQt(text));
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
    ShowResult(result, tr("Cells pasted: %1").arg(result.taken));
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
  ShowResult(result, tr("Cells filled: %1").arg(result.taken));
}

void TableView::FillAll() {
  auto cells = Selected();
  if (!cells) return;
  // Of several rows that are selected the current one is taken, wherever among them it stands.
  const int current = view_->currentIndex().row() + 1;
  if (current >= cells->firstRow && current <= cells->lastRow) cells->firstRow = current;
  cells->lastRow = cells->firstRow;
  const CellsResult result = page_.FillAll(control_, *cells);
  ShowResult(result, tr("Cells filled: %1, with the values of row %2").arg(result.taken).arg(cells->firstRow));
}

void TableView::ClearCells() {
  if (const auto cells = Selected()) ShowResult(page_.ClearCells(control_, *cells), {});
}

void TableView::ShowResult(const CellsResult& result, const QString& done) {
  Tell(done);
  if (result.refused == 0) return;
  page_.Outside().ShowMessage(FromQt(tr("These cells kept their values:")) + "\n\n" + result.Message(),
                              Host::Icon::Warning);
}

bool TableView::GoOn(int key, Qt::KeyboardModifiers modifiers) {
  const QModelIndex current = view_->currentIndex();
  if (!current.isValid()) return false;
  int row = current.row(), column = current.column();
  const bool isTab = key == Qt::Key_Tab || key == Qt::Key_Backtab;
  const int by = key == Qt::Key_Backtab || (modifiers & Qt::ShiftModifier) ? -1 : 1;
  if (isTab)
    column += by;
  else
    row += by;
  if (column < 0 || column >= model_->columnCount()) {
    row += by;
    column = by > 0 ? 0 : model_->columnCount() - 1;
  }
  if (row < 0 || row >= model_->rowCount()) return false;
  view_->setCurrentIndex(model_->index(row, column));
  return true;
}

void TableView::OpenList() {
  const QModelIndex current = view_->currentIndex();
  if (!(model_->flags(current) & Qt::ItemIsEditable)) return;
  view_->edit(current);
  QWidget* editor = QApplication::focusWidget();
  if (!editor || !view_->viewport()->isAncestorOf(editor)) return;
  if (auto* list = qobject_cast<QComboBox*>(editor)) list->showPopup();
  if (control_.table->Kind(current.row() + 1, current.column() + 1) == CellKind::Date && !editor->actions().isEmpty())
    editor->actions().constLast()->trigger();
}

bool TableView::TakeKey(const QKeyEvent& keys) {
  if (keys.modifiers() & Qt::ControlModifier) return false;
  const TableForm& table = *control_.table;
  const QModelIndex current = view_->currentIndex();
  switch (keys.key()) {
    case Qt::Key_Return:
    case Qt::Key_Enter:
      if (table.IsShownOnly()) {
        for (int column = 1; column <= model_->columnCount(); ++column)
          if (table.Press(current.row() + 1, column)) return true;
        return false;
      }
      if (!table.IsLink(current.row() + 1, current.column() + 1) ||
          !table.Press(current.row() + 1, current.column() + 1))
        GoOn(keys.key(), keys.modifiers());
      return true;
    case Qt::Key_Tab:
    case Qt::Key_Backtab:
      // At its ends the table leaves the key to the page, where it leads to the next field.
      return !table.IsShownOnly() && GoOn(keys.key(), keys.modifiers());
    case Qt::Key_Up:
    case Qt::Key_Down:
      if (!(keys.modifiers() & Qt::AltModifier)) return false;
      OpenList();
      return true;
    default:
      return false;
  }
}

QModelIndex TableView::FileCellAt(QPoint place) const {
  const QModelIndex at = view_->indexAt(place);
  if (!at.isValid()) return {};
  const TableForm& table = *control_.table;
  int column = at.column() + 1;
  while (column > 1 && table.Column(column)->IsButton()) --column;
  const bool isFile = table.Kind(at.row() + 1, column) == CellKind::File && !table.IsReadOnly(at.row() + 1, column);
  return isFile && control_.IsEnabled() ? model_->index(at.row(), column - 1) : QModelIndex();
}

bool TableView::TakeDraggedFile(QDropEvent& event) {
  const QList<QUrl> urls = event.mimeData()->urls();
  if (urls.size() != 1 || !urls.front().isLocalFile()) return false;
  if (event.type() == QEvent::DragEnter) {
    // It may come in over any cell, and is told of the others only then.
    event.acceptProposedAction();
    return true;
  }
  const QModelIndex cell = FileCellAt(event.position().toPoint());
  event.setAccepted(cell.isValid());
  if (!cell.isValid() || event.type() != QEvent::Drop) return true;
  view_->setCurrentIndex(cell);
  if (!model_->setData(cell, urls.front().toLocalFile(), Qt::EditRole))
    page_.Outside().ShowMessage(FromQt(tr("Not taken: %1.").arg(model_->Refusal())), Host::Icon::Warning);
  return true;
}

bool TableView::eventFilter(QObject* watched, QEvent* event) {
  const bool isDrag =
      event->type() == QEvent::DragEnter || event->type() == QEvent::DragMove || event->type() == QEvent::Drop;
  if (watched == view_->viewport() && isDrag) return TakeDraggedFile(static_cast<QDropEvent&>(*event));
  const bool isPress = event->type() == QEvent::KeyPress || event->type() == QEvent::ShortcutOverride;
  if (watched == view_ && (isPress || event->type() == QEvent::KeyRelease)) {
    const auto* keys = static_cast<QKeyEvent*>(event);
    if (event->type() == QEvent::KeyPress && TakeKey(*keys)) return true;
    const bool isNext = keys->key() == Qt::Key_PageDown;
    // Tab goes from cell to cell, of which there may be thousands.
    if (event->type() == QEvent::KeyPress && keys->modifiers() == Qt::ControlModifier &&
        (isNext || keys->key() == Qt::Key_PageUp))
      return focusNextPrevChild(isNext);
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
  if (!areColumnsTheUsers_) FitColumns();
}

int TableView::WidthOf(int column) const {
  const TableForm& table = *control_.table;
  const TableColumn& shown = *table.Column(column);
  const int declared = Theme::Get().Scaled(shown.width);
  if (!table.IsShownOnly() || shown.IsButton() || table.RowCount() == 0) return declared;
  // The first rows stand for all; what is longer than two usual cells is cut, and read in its tool tip.
  constexpr int kLookedAt = 60;
  const QFontMetrics metrics = view_->fontMetrics();
  const int padding = Theme::Get().Scaled(14), icon = shown.icon ? Theme::Get().Scaled(24) : 0;
  QFont bold = view_->font();
  bold.setBold(true);
  int width = QFontMetrics(bold).horizontalAdvance(Translated(table.Head(column)));
  bool isAny = false;
  for (int row = 1; row <= std::min(table.RowCount(), kLookedAt); ++row) {
    const QString text = ToQt(table.ShownCell(row, column));
    isAny = isAny || !text.isEmpty();
    width = std::max(width, icon + metrics.horizontalAdvance(text));
  }
  // What is still to come has the room that it was given.
  return isAny ? std::min(width + padding, 2 * declared) : std::max(width + padding, declared);
}

int TableView::WidthOfHeadWords(int column) const {
  QFont bold = view_->font();
  bold.setBold(true);
  const QFontMetrics metrics(bold);
  int widest = 0;
  for (const QString& word :
       Translated(control_.table->Head(column)).split(QRegularExpression("\\s"), Qt::SkipEmptyParts))
    widest = std::max(widest, metrics.horizontalAdvance(word));
  return widest + Theme::Get().Scaled(10);
}

int TableView::WidthOfColumns() const {
  // A table that makes its columns later needs its room.
  if (model_->columnCount() == 0) return Theme::Get().Scaled(kTableWidth);
  int width = 2 * view_->frameWidth() + style()->pixelMetric(QStyle::PM_ScrollBarExtent);
  for (int column = 1; column <= model_->columnCount(); ++column) width += WidthOf(column);
  return width;
}

void TableView::FitColumns() {
  isFitting_ = true;
  // The view itself is laid out later.
  const int edges = 2 * view_->frameWidth() + style()->pixelMetric(QStyle::PM_ScrollBarExtent);
  const QHeaderView& rowHeads = *view_->verticalHeader();
  int room = width() - edges - (rowHeads.isHidden() ? 0 : rowHeads.sizeHint().width());
  std::vector<int> widths;
  for (int column = 0; column < model_->columnCount(); ++column) {
    const int width = WidthOf(column + 1);
    // Buttons keep their width, so that their texts stay whole.
    if (control_.table->Column(column + 1)->IsButton())
      room -= width;
    else
      widths.push_back(width);
  }
  // Where room is short the widest columns give first: dates and numbers stay whole.
  std::ranges::sort(widths);
  int widest = widths.empty() ? 0 : widths.back();
  int left = room;
  for (std::size_t i = 0; i < widths.size(); ++i) {
    const int share = left / static_cast<int>(widths.size() - i);
    if (widths[i] > share) {
      widest = share;
      break;
    }
    left -= widths[i];
  }
  QHeaderView& head = *view_->horizontalHeader();
  for (int column = 0; column < model_->columnCount(); ++column) {
    const TableColumn& shown = *control_.table->Column(column + 1);
    // Whatever the language makes of a head, its words stay whole; one over several columns has more room.
    const int words = control_.table->HeadSpan(column + 1) == 1 ? WidthOfHeadWords(column + 1) : 0;
    const int width = std::max(WidthOf(column + 1), words);
    head.setSectionResizeMode(column, shown.IsButton() ? QHeaderView::Fixed : QHeaderView::Interactive);
    const int smallest = std::min(std::max(Theme::Get().Scaled(75), words), width);
    head.resizeSection(column, shown.IsButton() ? width : std::max(smallest, std::min(width, widest)));
  }
  const TableColumn* last = control_.table->Column(model_->columnCount());
  head.setStretchLastSection(!last || !last->IsButton());
  isFitting_ = false;
}

void TableView::OfferUnits(int column, const QPoint& place) {
  const std::vector<UnitChoice> choices = control_.table->UnitChoices(column + 1);
  if (choices.size() < 2) return;
  const int itemType = control_.table->Column(column + 1)->itemType;
  QMenu menu;
  for (const UnitChoice& choice : choices)
    connect(menu.addAction(Translated(choice.text)), &QAction::triggered, this,
            [this, itemType, key = choice.key] { emit UnitChosen(itemType, key); });
  menu.exec(place);
}

void TableView::SyncButtons() {
  auto [first, last] = SelectedRows();
  if (first < 1 && view_->currentIndex().isValid()) first = last = view_->currentIndex().row() + 1;
  delete_->setEnabled(first > 0);
  up_->setEnabled(first > 1);
  down_->setEnabled(first > 0 && last < model_->rowCount());
}

}  // namespace tervane
