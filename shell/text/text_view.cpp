// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/text/text_view.h"

#include <QHBoxLayout>
#include <QKeyEvent>
#include <QLabel>
#include <QLineEdit>
#include <QListWidget>
#include <QShortcut>
#include <QTextBlock>
#include <QToolButton>
#include <QVBoxLayout>

#include <fmt/format.h>

#include "core/path.h"
#include "forms/page_form.h"
#include "platform/text.h"
#include "shell/widgets/flat_button.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr int kCheckDelay = 350;  ///< Milliseconds after the last key until what is typed is looked at.
constexpr int kMostProblemRows = 4;

}  // namespace

TextView::TextView(EditSession& session, QWidget* parent)
    : QWidget(parent), session_(session), text_(new SetupText), status_(new QLabel), problems_(new QListWidget) {
  auto* column = new QVBoxLayout(this);
  column->setContentsMargins(0, 0, 0, 0);
  column->setSpacing(2);

  findBar_ = new QWidget;
  auto* findRow = new QHBoxLayout(findBar_);
  findRow->setContentsMargins(4, 4, 4, 0);
  find_ = new QLineEdit;
  find_->setPlaceholderText(tr("Find in the text"));
  find_->setAccessibleName(tr("Find in the text"));
  find_->setClearButtonEnabled(true);
  findRow->addWidget(find_, 1);
  found_ = new QLabel;
  findRow->addWidget(found_);
  AddFlatButton(*findRow, tr("Previous"), [this] { FindOn(true); })->setToolTip(tr("Shift+Enter"));
  AddFlatButton(*findRow, tr("Next"), [this] { FindOn(false); })->setToolTip(tr("Enter"));
  AddFlatButton(*findRow, tr("Close"), [this] {
    findBar_->hide();
    text_->setFocus();
  })->setToolTip(tr("Esc"));
  findBar_->hide();
  column->addWidget(findBar_);
  column->addWidget(text_, 1);

  problemBar_ = new QWidget;
  auto* problemRow = new QHBoxLayout(problemBar_);
  problemRow->setContentsMargins(4, 0, 4, 4);
  problems_->setAccessibleName(tr("Lines that the setup has not taken"));
  problems_->setHorizontalScrollBarPolicy(Qt::ScrollBarAsNeeded);
  problemRow->addWidget(problems_, 1);
  drop_ = AddFlatButton(*problemRow, tr("Show What Is &Held"), [this] { Drop(); });
  drop_->setToolTip(tr("Gives up the lines that the setup has not taken"));
  problemRow->setAlignment(drop_, Qt::AlignTop);
  problemBar_->hide();
  column->addWidget(problemBar_);
  status_->setContentsMargins(4, 0, 4, 2);
  status_->setTextFormat(Qt::PlainText);
  column->addWidget(status_);

  connect(find_, &QLineEdit::textChanged, this, [this] { FindOn(false); });
  connect(find_, &QLineEdit::returnPressed, this, [this] { FindOn(false); });
  connect(problems_, &QListWidget::itemActivated, this, [this](const QListWidgetItem* item) {
    text_->GoToLine(item->data(Qt::UserRole).toInt());
    text_->setFocus();
  });
  connect(problems_, &QListWidget::itemClicked, problems_, &QListWidget::itemActivated);
  checking_.setSingleShot(true);
  connect(&checking_, &QTimer::timeout, this, &TextView::LookAtTyping);
  connect(text_, &SetupText::Typed, this, [this] {
    checking_.start(kCheckDelay);
    if (!std::exchange(wasTyping_, true)) emit TypingChanged();
  });
  // Behind the key that has led away, which still works on the text. In an empty line typing goes on.
  connect(
      text_, &SetupText::LeftEdit, this,
      [this] {
        if (!text_->hasFocus() || !text_->textCursor().block().text().trimmed().isEmpty()) Commit();
      },
      Qt::QueuedConnection);
  connect(text_, &SetupText::Came, this, &TextView::ShowStatus);
  connect(text_, &QPlainTextEdit::cursorPositionChanged, this, &TextView::ShowStatus);
}

TextOutline TextView::OutlineNow(std::string& error) const {
  std::string text;
  const CFlowModelDoc& document = session_.Document();
  document.BuildText(document.Root().SetupFolder(), text, error);
  return TextOutline(std::move(text));
}

void TextView::Follow() {
  if (isTaking_) return;
  isStale_ = true;
  if (!isVisible() || text_->IsEdited()) return ShowStatus();
  std::string error;
  TextOutline outline = OutlineNow(error);
  isStale_ = false;
  if (!error.empty()) {
    ShowProblems({{0, fmt::format("there is no text to save: {}", error)}});
    return;
  }
  text_->SetOutline(std::move(outline));
  ShowProblems({});
  if (std::exchange(wasTyping_, false)) emit TypingChanged();
}

void TextView::showEvent(QShowEvent* event) {
  QWidget::showEvent(event);
  if (isStale_) Follow();
}

// ---- Places

void TextView::GoTo(const CYbSEKvfBase& node, const std::string& key) {
  if (isStale_) Follow();
  const TextOutline& outline = text_->Outline();
  const int section = outline.Find(SectionOf(node));
  if (section == TextOutline::kNone || text_->IsEdited()) return;
  const TextOutline::Section& lines = outline.Sections()[static_cast<std::size_t>(section)];
  const int line = text_->OutlineLineAtCursor();
  if (key.empty() && outline.SectionAround(line, line) == section && lines.begin > 0) return;
  text_->GoToLine(outline.LineOf(section, key));
}

TextView::Place TextView::PlaceAtCursor() const {
  const TextOutline& outline = text_->Outline();
  const int line = text_->OutlineLineAtCursor();
  const std::string_view shown = outline.Line(line);
  int section = outline.SectionAround(line, line);
  // The first and the last line of a section are its own, too.
  if (BeginsSection(shown) || EndsSection(shown))
    for (std::size_t i = 0; i < outline.Sections().size(); ++i)
      if (outline.Sections()[i].begin == line || outline.Sections()[i].end == line) section = static_cast<int>(i);
  if (section == TextOutline::kNone) return {};
  const CYbSEKvfBase* node = OwnerOfSection(session_.Document().Root(), outline.StepsTo(section));
  if (!node) return {};
  Place place{node->Serial(), {}};
  if (const std::size_t equals = shown.find('='); equals != std::string_view::npos)
    place.key = Trimmed(shown.substr(0, equals));
  return place;
}

// ---- Typing

EditedSection TextView::EditedNow(SetupText::Edited& lines) const {
  lines = text_->EditedLines();
  EditedSection edited;
  edited.steps = text_->Outline().StepsTo(lines.section);
  edited.before = lines.before;
  edited.after = lines.after;
  edited.firstLine = lines.firstLine;
  edited.firstEdited = lines.firstEdited;
  edited.lastEdited = lines.lastEdited;
  return edited;
}

namespace {

/// Edits in front of the setup and behind it.
std::vector<TextProblem> OutsideOfAll(const SetupText::Edited& lines) {
  return {{lines.firstEdited, "what stands outside of the setup's braces is not changed here"}};
}

}  // namespace

void TextView::LookAtTyping() {
  if (!text_->IsEdited() || text_->document()->revision() == triedRevision_) return;
  SetupText::Edited lines;
  const EditedSection edited = EditedNow(lines);
  ShowProblems(lines.section == TextOutline::kNone ? OutsideOfAll(lines) : FaultsOf(edited));
}

void TextView::Commit() {
  checking_.stop();
  if (isTaking_ || !text_->IsEdited() || text_->document()->revision() == triedRevision_) return;
  triedRevision_ = text_->document()->revision();
  SetupText::Edited lines;
  const EditedSection edited = EditedNow(lines);
  if (lines.section == TextOutline::kNone) return ShowProblems(OutsideOfAll(lines));
  const TakenText taken = TakeText(session_.Document(), edited);
  if (!taken.isParsed) return ShowProblems(taken.problems);
  if (taken.node) {
    isTaking_ = true;
    session_.UpdateDoc(*taken.node, kDataChanged | kItemAdded | kItemDeleted | kTreeRebuilt, "Edit Text", this);
    isTaking_ = false;
  }
  std::string error;
  TextOutline outline = OutlineNow(error);
  isStale_ = false;
  if (taken.problems.empty()) {
    text_->SetOutline(std::move(outline));
  } else {
    text_->Rebase(std::move(outline));
    triedRevision_ = text_->document()->revision();
  }
  ShowProblems(taken.problems);
  wasTyping_ = text_->IsEdited();
  emit TypingChanged();
}

bool TextView::UndoTyping() {
  if (!isVisible() || !HasTyping() || !text_->document()->isUndoAvailable()) return false;
  text_->undo();
  Commit();
  return true;
}

bool TextView::RedoTyping() {
  if (!isVisible() || !HasTyping() || !text_->document()->isRedoAvailable()) return false;
  text_->redo();
  Commit();
  return true;
}

void TextView::Drop() {
  std::string error;
  text_->SetOutline(OutlineNow(error));
  isStale_ = false;
  ShowProblems({});
  wasTyping_ = false;
  emit TypingChanged();
  text_->setFocus();
}

void TextView::Resume(const QString& typed) {
  Follow();
  text_->selectAll();
  text_->insertPlainText(typed);
  LookAtTyping();
}

void TextView::ShowProblems(std::vector<TextProblem> problems) {
  problems_->clear();
  for (const TextProblem& problem : problems) {
    auto* item = new QListWidgetItem(tr("Line %1: %2").arg(problem.line + 1).arg(Translated(problem.text)), problems_);
    item->setIcon(Theme::Get().Icon("error"));
    item->setData(Qt::UserRole, problem.line);
  }
  const int rows = std::min(problems_->count(), kMostProblemRows);
  problems_->setFixedHeight(std::max(rows, 1) * problems_->sizeHintForRow(0) + 2 * problems_->frameWidth() + 2);
  problemBar_->setVisible(rows > 0);
  drop_->setVisible(text_->IsEdited());
  text_->SetProblems(std::move(problems));
  ShowStatus();
}

void TextView::ShowStatus() {
  QStringList told;
  if (!text_->IsWhole()) told << tr("The text is coming: %1 %.").arg(text_->PercentThere());
  if (isStale_ && text_->IsEdited())
    told << tr("The setup has changed on a page since; the text shows that when it is taken.");
  const QTextCursor cursor = text_->textCursor();
  told << tr("Line %1, column %2").arg(cursor.blockNumber() + 1).arg(cursor.positionInBlock() + 1);
  status_->setText(told.join("  "));
}

// ---- Finding

void TextView::StartFind() {
  findBar_->show();
  const QString chosen = text_->textCursor().selectedText();
  if (!chosen.isEmpty() && !chosen.contains(QChar::ParagraphSeparator)) find_->setText(chosen);
  find_->selectAll();
  find_->setFocus();
}

void TextView::FindOn(bool isBackward) {
  const QString wanted = find_->text();
  found_->clear();
  if (wanted.isEmpty()) return;
  // A longer text may stand where the shorter one was found.
  QTextCursor from = text_->textCursor();
  if (sender() == find_ && find_->isModified() && from.hasSelection() &&
      wanted.startsWith(from.selectedText(), Qt::CaseInsensitive) && wanted.size() > from.selectedText().size())
    from.setPosition(from.selectionStart());
  const QTextDocument::FindFlags flags = isBackward ? QTextDocument::FindBackward : QTextDocument::FindFlags();
  QTextCursor hit = text_->document()->find(wanted, from, flags);
  if (hit.isNull()) {
    QTextCursor edge(text_->document());
    edge.movePosition(isBackward ? QTextCursor::End : QTextCursor::Start);
    hit = text_->document()->find(wanted, edge, flags);
    found_->setText(hit.isNull() ? tr("Not found") : isBackward ? tr("On from the end") : tr("On from the beginning"));
  }
  if (hit.isNull()) return;
  if (!hit.block().isVisible()) text_->GoToLine(hit.blockNumber());
  text_->setTextCursor(hit);
}

void TextView::keyPressEvent(QKeyEvent* event) {
  if (event->key() == Qt::Key_Escape && findBar_->isVisible()) {
    findBar_->hide();
    text_->setFocus();
  } else if ((event->key() == Qt::Key_Return || event->key() == Qt::Key_Enter) &&
             event->modifiers() == Qt::ShiftModifier && find_->hasFocus()) {
    FindOn(true);
  } else {
    QWidget::keyPressEvent(event);
  }
}

}  // namespace tervane
