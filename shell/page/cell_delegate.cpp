// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/page/cell_delegate.h"

#include <QAction>
#include <QApplication>
#include <QComboBox>
#include <QLineEdit>
#include <QMenu>
#include <QMouseEvent>
#include <QPainter>
#include <QPointer>
#include <QToolTip>
#include <algorithm>

#include "shell/page/table_view.h"
#include "shell/widgets/date_entry.h"
#include "shell/widgets/offered_texts.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

/// The texts of choices, by which each is found: those that several share have the value behind them.
QStringList NamesOf(const CellChoices& choices) {
  QStringList names;
  for (const CellChoice& choice : choices) {
    const auto isSame = [&](const CellChoice& other) { return other.text == choice.text; };
    const bool isAlone = std::ranges::count_if(choices, isSame) == 1;
    names << (isAlone ? Translated(choice.text) : Translated(choice.text) + " (" + ToQt(choice.value) + ")");
  }
  return names;
}

}  // namespace

// ---- Editors

QWidget* CellDelegate::createEditor(QWidget* parent, const QStyleOptionViewItem&, const QModelIndex& index) const {
  index_ = index;
  const CellKind kind = KindAt(index);
  if (kind == CellKind::Choice && !IsFoundByName(index)) return NewChoiceList(parent, index);
  auto* edit = new QLineEdit(parent);
  edit->setFrame(false);
  if (kind == CellKind::File) AddBrowseButton(edit, index);
  if (kind == CellKind::Date) AddCalendarButton(edit);
  if (kind == CellKind::Choice) AddNames(edit, index);
  if (kind == CellKind::Text && model_.Table().Column(index.column() + 1)->offers) AddOffers(edit, index);
  return edit;
}

QWidget* CellDelegate::NewChoiceList(QWidget* parent, const QModelIndex& index) const {
  auto* list = new QComboBox(parent);
  for (const CellChoice& choice : model_.Table().Choices(index.row() + 1, index.column() + 1))
    list->addItem(Translated(choice.text), ToQt(choice.value));
  connect(list, &QComboBox::activated, this, [this, list] {
    auto* self = const_cast<CellDelegate*>(this);
    emit self->commitData(list);
    emit self->closeEditor(list);
  });
  return list;
}

bool CellDelegate::IsFoundByName(const QModelIndex& index) const {
  constexpr std::size_t kMostInList = 12;  // more are not seen at once
  return KindAt(index) == CellKind::Choice &&
         model_.Table().Choices(index.row() + 1, index.column() + 1).size() > kMostInList;
}

void CellDelegate::AddNames(QLineEdit* edit, const QModelIndex& index) const {
  const QStringList names = NamesOf(model_.Table().Choices(index.row() + 1, index.column() + 1));
  OfferTexts(
      *edit, [names] { return names; },
      [this, edit] {
        auto* self = const_cast<CellDelegate*>(this);
        if (self->Take(edit)) self->Close(edit);
      });
}

std::optional<QString> CellDelegate::ValueOf(const QModelIndex& index, const QString& text) const {
  if (!IsFoundByName(index)) return text;
  // As it stands there, which a choice that is offered no longer may do.
  if (text == index.data(Qt::DisplayRole).toString()) return index.data(Qt::EditRole).toString();
  const CellChoices choices = model_.Table().Choices(index.row() + 1, index.column() + 1);
  const QStringList names = NamesOf(choices);
  const auto isMeant = [&](const QString& name) { return name.compare(text, Qt::CaseInsensitive) == 0; };
  auto found = std::ranges::find_if(names, isMeant);
  if (found == names.end()) {
    const QStringList holding = names.filter(text, Qt::CaseInsensitive);
    if (text.isEmpty() || holding.size() != 1) return std::nullopt;
    found = std::ranges::find(names, holding.front());
  }
  return ToQt(choices[static_cast<std::size_t>(found - names.begin())].value);
}

void CellDelegate::AddBrowseButton(QLineEdit* edit, const QModelIndex& index) const {
  QAction* browse = edit->addAction(Theme::Get().Icon("browse"), QLineEdit::TrailingPosition);
  browse->setToolTip(TableView::tr("Choose a file"));
  const Host::FileQuestion question = model_.Table().Column(index.column() + 1)->fileQuestion;
  connect(browse, &QAction::triggered, this, [this, question, edit = QPointer<QLineEdit>(edit)] {
    const auto chosen = page_.AskFile(question, FromQt(edit->text()));
    if (!edit) return;
    if (chosen) edit->setText(ToQt(*chosen));
    edit->setFocus();
  });
}

void CellDelegate::AddCalendarButton(QLineEdit* edit) const {
  QAction* button = edit->addAction(Theme::Get().Icon("calendar"), QLineEdit::TrailingPosition);
  button->setToolTip(TableView::tr("Choose a day"));
  QMenu* calendar = NewCalendarMenu(
      edit, [edit] { return edit->text(); },
      [this, edit](const QString& date) {
        auto* self = const_cast<CellDelegate*>(this);
        edit->setText(date);
        if (self->Take(edit)) self->Close(edit);
      });
  connect(button, &QAction::triggered, calendar,
          [edit, calendar] { calendar->popup(edit->mapToGlobal(QPoint(0, edit->height()))); });
}

void CellDelegate::AddOffers(QLineEdit* edit, const QModelIndex& index) const {
  const auto offered = [this, cell = QPersistentModelIndex(index)] {
    QStringList texts;
    for (const std::string& text : model_.Table().Offers(cell.row() + 1, cell.column() + 1)) texts << ToQt(text);
    return texts;
  };
  OfferTexts(*edit, offered, [this, edit] {
    auto* self = const_cast<CellDelegate*>(this);
    if (self->Take(edit)) self->Close(edit);
  });
}

void CellDelegate::setEditorData(QWidget* editor, const QModelIndex& index) const {
  const QString value = index.data(Qt::EditRole).toString();
  if (auto* list = qobject_cast<QComboBox*>(editor))
    list->setCurrentIndex(list->findData(value));
  else if (auto* edit = qobject_cast<QLineEdit*>(editor); edit && !edit->property("refused").toBool())
    edit->setText(IsFoundByName(index) ? index.data(Qt::DisplayRole).toString() : value);
}

void CellDelegate::setModelData(QWidget* editor, QAbstractItemModel* model, const QModelIndex& index) const {
  const auto* list = qobject_cast<QComboBox*>(editor);
  if (list && list->currentIndex() >= 0)
    model->setData(index, list->currentData(), Qt::EditRole);
  else if (const auto* edit = qobject_cast<QLineEdit*>(editor))
    if (const auto value = ValueOf(index, edit->text())) model->setData(index, *value, Qt::EditRole);
}

void CellDelegate::updateEditorGeometry(QWidget* editor, const QStyleOptionViewItem& option,
                                        const QModelIndex& index) const {
  QStyledItemDelegate::updateEditorGeometry(editor, option, index);
  // A line with a button needs more room than a narrow column has.
  const auto* edit = qobject_cast<QLineEdit*>(editor);
  if (!edit || edit->actions().isEmpty()) return;
  QRect place = editor->geometry();
  const int wanted =
      edit->fontMetrics().horizontalAdvance(index.data(Qt::EditRole).toString()) + Theme::Get().Scaled(48);
  place.setWidth(std::max(place.width(), std::min(wanted, editor->parentWidget()->width() - place.left())));
  editor->setGeometry(place);
}

bool CellDelegate::Take(QLineEdit* edit) {
  if (!index_.isValid()) return true;
  const auto value = ValueOf(index_, edit->text());
  if (value == index_.data(Qt::EditRole).toString()) return true;
  const QPointer<QLineEdit> stays(edit);
  if (value && (model_.setData(index_, *value, Qt::EditRole) || !stays)) return true;
  ShowRefusal(edit, value ? model_.Refusal() : TableView::tr("one of the list was expected"));
  return false;
}

void CellDelegate::ShowRefusal(QLineEdit* edit, const QString& expected) const {
  edit->setProperty("refused", true);
  QPalette palette;
  palette.setColor(QPalette::Text, Theme::Get().ErrorColor());
  edit->setPalette(palette);
  const QString message = TableView::tr("Not taken: %1.").arg(expected);
  edit->setToolTip(message);
  QToolTip::showText(edit->mapToGlobal(QPoint(0, edit->height())), message, edit);
}

void CellDelegate::Close(QWidget* editor) { emit closeEditor(editor, QAbstractItemDelegate::NoHint); }

bool CellDelegate::eventFilter(QObject* watched, QEvent* event) {
  auto* edit = qobject_cast<QLineEdit*>(watched);
  if (event->type() == QEvent::FocusOut) {
    // The calendar and the list of a choice belong to their editor.
    const bool isLeft = static_cast<const QFocusEvent*>(event)->reason() != Qt::PopupFocusReason;
    if (edit && isLeft && !Take(edit)) return false;
    return QStyledItemDelegate::eventFilter(watched, event);
  }
  if (event->type() != QEvent::KeyPress) return QStyledItemDelegate::eventFilter(watched, event);
  const auto* keys = static_cast<const QKeyEvent*>(event);
  const int key = keys->key();
  const Qt::KeyboardModifiers modifiers = keys->modifiers();
  const bool isDate = edit && index_.isValid() && KindAt(index_) == CellKind::Date;
  if (isDate && (key == Qt::Key_Up || key == Qt::Key_Down)) {
    if (modifiers & Qt::AltModifier) {
      edit->actions().constLast()->trigger();
    } else if (const QString stepped = SteppedDate(edit->text(), edit->cursorPosition(), key == Qt::Key_Up ? 1 : -1);
               !stepped.isEmpty()) {
      const int cursor = edit->cursorPosition();
      edit->setText(stepped);
      edit->setCursorPosition(cursor);
    }
    return true;
  }
  if (key != Qt::Key_Return && key != Qt::Key_Enter && key != Qt::Key_Tab && key != Qt::Key_Backtab)
    return QStyledItemDelegate::eventFilter(watched, event);
  const QPointer<QWidget> editor(qobject_cast<QWidget*>(watched));
  if (edit && !Take(edit)) return true;
  if (editor && !edit) emit commitData(editor);
  if (editor) Close(editor);
  emit LeftBy(key, modifiers);
  return true;
}

// ---- Drawing and pressing

void CellDelegate::initStyleOption(QStyleOptionViewItem* option, const QModelIndex& index) const {
  QStyledItemDelegate::initStyleOption(option, index);
  if (KindAt(index) == CellKind::Button) {
    option->text.clear();
    option->icon = {};
    option->features &= ~QStyleOptionViewItem::HasDecoration;
  }
  const CellKind kind = KindAt(index);
  if (kind == CellKind::Check && IsGrey(index)) option->state &= ~QStyle::State_Enabled;
  // Their parts keep their order where texts go from the right.
  if (kind == CellKind::Number || kind == CellKind::Date || kind == CellKind::File) option->direction = Qt::LeftToRight;
}

void CellDelegate::paint(QPainter* painter, const QStyleOptionViewItem& option, const QModelIndex& index) const {
  QStyledItemDelegate::paint(painter, option, index);
  if (KindAt(index) != CellKind::Button) return;
  QStyleOptionButton button;
  button.rect = option.rect.adjusted(1, 1, -2, -2);
  button.palette = option.palette;
  button.fontMetrics = option.fontMetrics;
  button.text = index.data(Qt::DisplayRole).toString();
  button.icon = index.data(Qt::DecorationRole).value<QIcon>();
  const int icon = option.widget->style()->pixelMetric(QStyle::PM_SmallIconSize, nullptr, option.widget);
  button.iconSize = QSize(icon, icon);
  const bool isEnabled = (option.state & QStyle::State_Enabled) && !IsGrey(index);
  const bool isDown = held_ == index && (QApplication::mouseButtons() & Qt::LeftButton);
  button.state = isDown ? QStyle::State_Sunken : QStyle::State_Raised;
  if (isEnabled)
    button.state |= QStyle::State_Enabled;
  else
    button.palette.setCurrentColorGroup(QPalette::Disabled);
  if (option.state & QStyle::State_HasFocus) button.state |= QStyle::State_HasFocus;
  option.widget->style()->drawControl(QStyle::CE_PushButton, &button, painter, option.widget);
}

bool CellDelegate::editorEvent(QEvent* event, QAbstractItemModel* model, const QStyleOptionViewItem& option,
                               const QModelIndex& index) {
  if (KindAt(index) != CellKind::Button) return QStyledItemDelegate::editorEvent(event, model, option, index);
  const auto isLeft = [event] { return static_cast<const QMouseEvent*>(event)->button() == Qt::LeftButton; };
  if (event->type() == QEvent::MouseButtonPress && isLeft()) {
    held_ = index;
  } else if (event->type() == QEvent::MouseButtonRelease && isLeft()) {
    const bool isClick = held_ == index;
    held_ = QPersistentModelIndex();
    if (isClick) emit ButtonPressed(index.row(), index.column());
  } else if (event->type() == QEvent::KeyPress && static_cast<const QKeyEvent*>(event)->key() == Qt::Key_Space) {
    emit ButtonPressed(index.row(), index.column());
    return true;
  }
  return false;
}

}  // namespace tervane
