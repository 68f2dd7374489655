// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/text/setup_text.h"

#include <QHelpEvent>
#include <QPainter>
#include <QPlainTextDocumentLayout>
#include <QScrollBar>
#include <QTextBlock>
#include <QToolTip>
#include <algorithm>

#include "shell/text/text_colors.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr int kLinesInPiece = 12'000;
constexpr int kGap = 6;

/// The lines at the beginning, or at the end, that two texts have in common.
int CommonLines(const TextOutline& a, const TextOutline& b, bool isAtEnd) {
  const int most = std::min(a.LineCount(), b.LineCount());
  int same = 0;
  while (same < most && (isAtEnd ? a.Line(a.LineCount() - 1 - same) == b.Line(b.LineCount() - 1 - same)
                                 : a.Line(same) == b.Line(same)))
    ++same;
  return same;
}

class TextMargin : public QWidget {
 public:
  explicit TextMargin(SetupText* text) : QWidget(text), text_(*text) { setCursor(Qt::ArrowCursor); }
  QSize sizeHint() const override { return {text_.MarginWidth(), 0}; }

 protected:
  void paintEvent(QPaintEvent* event) override { text_.PaintMargin(*event); }
  void mousePressEvent(QMouseEvent* event) override { text_.PressMargin(qRound(event->position().y())); }

 private:
  SetupText& text_;
};

}  // namespace

SetupText::SetupText(QWidget* parent) : QPlainTextEdit(parent), margin_(new TextMargin(this)) {
  setLineWrapMode(NoWrap);
  setLayoutDirection(Qt::LeftToRight);
  setAccessibleName(tr("Text of the setup"));
  setTabChangesFocus(true);
  Restyle();
  connect(&Theme::Get(), &Theme::Changed, this, &SetupText::Restyle);
  connect(document(), &QTextDocument::contentsChange, this, &SetupText::OnContentsChange);
  connect(this, &QPlainTextEdit::updateRequest, this, [this](const QRect& rect, int dy) {
    if (dy)
      margin_->scroll(0, dy);
    else
      margin_->update(0, rect.y(), margin_->width(), rect.height());
  });
  connect(this, &QPlainTextEdit::blockCountChanged, this, [this] { setViewportMargins(MarginWidth(), 0, 0, 0); });
  connect(this, &QPlainTextEdit::cursorPositionChanged, this, [this] {
    const int line = textCursor().blockNumber();
    if (isOurs_ || line == lastLine_) return;
    lastLine_ = line;
    if (isEdited_) emit LeftEdit();
  });
  filling_.setSingleShot(true);
  connect(&filling_, &QTimer::timeout, this, &SetupText::FillOn);
}

void SetupText::Restyle() {
  QFont font(QStringList{"Courier New", "DejaVu Sans Mono"});
  font.setStyleHint(QFont::Monospace);
  font.setPointSizeF(this->font().pointSizeF());
  setFont(font);
  // Two blanks are a step of the indentation.
  setTabStopDistance(2 * fontMetrics().horizontalAdvance(' '));
  setViewportMargins(MarginWidth(), 0, 0, 0);
  viewport()->update();
}

int SetupText::PercentThere() const { return static_cast<int>(100LL * whole_ / std::max(outline_.LineCount(), 1)); }

// ---- The text

void SetupText::SetOutline(TextOutline outline) {
  const bool wasWhole = IsWhole();
  const int top = std::min(isEdited_ ? keptTop_ : outline_.LineCount(), CommonLines(outline_, outline, false));
  int tail = std::min(isEdited_ ? keptTail_ : outline_.LineCount(), CommonLines(outline_, outline, true));
  tail = std::min({tail, outline.LineCount() - top, document()->blockCount() - top});
  const int first = wasWhole ? top : 0;
  const bool isTheSame = wasWhole && !isEdited_ && top == outline.LineCount() && top == outline_.LineCount();
  outline_ = std::move(outline);
  isEdited_ = false;
  if (isTheSame) return;

  const QTextCursor before = textCursor();
  const int line = before.blockNumber(), column = before.positionInBlock();
  const int scrolled = verticalScrollBar()->value();
  const int oldCount = document()->blockCount() - first - (wasWhole ? tail : 0);
  const int newCount = outline_.LineCount() - first - (wasWhole ? tail : 0);
  if (!wasWhole || newCount > kLinesInPiece) {
    isOurs_ = true;
    setUndoRedoEnabled(false);
    clear();
    isOurs_ = false;
    whole_ = 0;
    wanted_ = line;
    FillOn();
  } else {
    // A last line without an end of its own is replaced with the end of the line in front of it.
    Replace(first, oldCount, newCount > 0 ? outline_.Lines(first, first + newCount - 1) : std::string_view());
    whole_ = outline_.LineCount();
    const QTextBlock block = document()->findBlockByNumber(std::min(line, document()->blockCount() - 1));
    isOurs_ = true;
    QTextCursor cursor(block);
    cursor.setPosition(block.position() + std::min(column, block.length() - 1));
    setTextCursor(cursor);
    isOurs_ = false;
    lastLine_ = cursor.blockNumber();
    verticalScrollBar()->setValue(scrolled);
  }
  setReadOnly(!IsWhole());
}

void SetupText::Rebase(TextOutline outline) {
  // All lines together are held against the new text, from both ends.
  const TextOutline now(FromQt(toPlainText()));
  const int same = std::min(now.LineCount(), outline.LineCount());
  keptTop_ = CommonLines(now, outline, false);
  keptTail_ = std::min(CommonLines(now, outline, true), same - keptTop_);
  isEdited_ = keptTop_ < std::max(now.LineCount(), outline.LineCount());
  outline_ = std::move(outline);
  whole_ = outline_.LineCount();
}

void SetupText::Replace(int first, int count, std::string_view text) {
  isOurs_ = true;
  setUndoRedoEnabled(false);
  QTextCursor cursor(document());
  const QTextBlock begin = document()->findBlockByNumber(first);
  const QTextBlock end = document()->findBlockByNumber(first + count);
  QString added = ToQt(text);
  if (!end.isValid() && begin.isValid()) {
    cursor.setPosition(begin.position());
    cursor.movePosition(QTextCursor::End, QTextCursor::KeepAnchor);
  } else {
    cursor.setPosition(begin.position());
    cursor.setPosition(end.position(), QTextCursor::KeepAnchor);
  }
  cursor.insertText(added);
  setUndoRedoEnabled(true);
  isOurs_ = false;
  viewport()->update();
}

void SetupText::FillOn() {
  const int last = std::min(whole_ + kLinesInPiece, outline_.LineCount()) - 1;
  isOurs_ = true;
  setUndoRedoEnabled(false);
  QTextCursor end(document());
  end.movePosition(QTextCursor::End);
  end.insertText(ToQt(outline_.Lines(whole_, last)));
  if (whole_ == 0) moveCursor(QTextCursor::Start);
  whole_ = last + 1;
  setUndoRedoEnabled(true);
  isOurs_ = false;
  setReadOnly(!IsWhole());
  if (!IsWhole()) filling_.start(0);
  if (wanted_ >= 0 && (wanted_ < whole_ || IsWhole())) {
    const int wanted = std::exchange(wanted_, -1);
    GoToLine(wanted);
  }
  emit Came();
}

void SetupText::OnContentsChange(int position, int /*removed*/, int added) {
  if (isOurs_) return;
  const int count = document()->blockCount(), given = outline_.LineCount();
  const int first = document()->findBlock(position).blockNumber();
  const QTextBlock end = document()->findBlock(position + added);
  const int last = end.isValid() ? end.blockNumber() : count - 1;
  // Lines that were coloured count as changed in the document, and are told with the next that is.
  const auto isGiven = [this](int line, int givenLine) {
    return FromQt(document()->findBlockByNumber(line).text()) == outline_.Line(givenLine);
  };
  int top = first;
  while (top <= last && top < given && isGiven(top, top)) ++top;
  int tail = count - 1 - last;
  while (tail < count - top && tail < given - top && isGiven(count - 1 - tail, given - 1 - tail)) ++tail;
  if (!isEdited_ && top == count && top == given) return;
  keptTop_ = isEdited_ ? std::min(keptTop_, top) : top;
  keptTail_ = isEdited_ ? std::min(keptTail_, tail) : tail;
  keptTail_ = std::min({keptTail_, count - keptTop_, given - keptTop_});
  isEdited_ = true;
  emit Typed();
}

QString SetupText::TextOfLines(int first, int last) const {
  QString text;
  QTextBlock block = document()->findBlockByNumber(first);
  for (int line = first; line <= last && block.isValid(); ++line, block = block.next()) {
    text += block.text();
    text += '\n';
  }
  return text;
}

SetupText::Edited SetupText::EditedLines() const {
  Edited edited;
  const int more = document()->blockCount() - outline_.LineCount();
  edited.firstEdited = keptTop_;
  edited.lastEdited = std::max(document()->blockCount() - 1 - keptTail_, keptTop_);
  // Lines that were put between two others touch neither of them; what was taken out leaves none behind.
  const int lastGiven = outline_.LineCount() - 1 - keptTail_;
  edited.section = lastGiven < keptTop_ ? outline_.SectionAround(keptTop_, keptTop_ - 1)
                                        : outline_.SectionAround(keptTop_, lastGiven);
  if (edited.section == TextOutline::kNone) return edited;
  const TextOutline::Section& section = outline_.Sections()[static_cast<std::size_t>(edited.section)];
  edited.firstLine = section.begin;
  edited.before = outline_.Lines(section.begin, section.end);
  edited.after = FromQt(TextOfLines(section.begin, section.end + more));
  return edited;
}

// ---- Places

int SetupText::OutlineLineAtCursor() const {
  const int line = textCursor().blockNumber();
  if (!isEdited_ || line < keptTop_) return line;
  if (line >= document()->blockCount() - keptTail_) return line - document()->blockCount() + outline_.LineCount();
  return std::min(line, outline_.LineCount() - 1 - keptTail_);
}

void SetupText::GoToLine(int line) {
  if (line >= whole_ && !IsWhole()) {
    wanted_ = line;
    return;
  }
  const QTextBlock block = document()->findBlockByNumber(std::clamp(line, 0, document()->blockCount() - 1));
  // What is folded around it opens.
  if (!block.isVisible())
    for (QTextBlock above = block; above.isValid(); above = above.previous())
      if (above.isVisible()) {
        const int begin = above.blockNumber();
        SetFolded(above, EndOfSection(begin), false);
        if (block.isVisible()) break;
        above = block;
      }
  QTextCursor cursor(block);
  const QString text = block.text();
  qsizetype indent = 0;
  while (indent < text.size() && text[indent].isSpace()) ++indent;
  cursor.setPosition(block.position() + static_cast<int>(indent));
  setTextCursor(cursor);
  centerCursor();
}

// ---- Folding

int SetupText::EndOfSection(int line) const {
  QTextBlock block = document()->findBlockByNumber(line);
  if (!block.isValid() || !BeginsSection(FromQt(block.text()))) return -1;
  int depth = 0;
  for (; block.isValid(); block = block.next()) {
    const std::string text = FromQt(block.text());
    if (BeginsSection(text)) ++depth;
    if (EndsSection(text) && --depth == 0) return block.blockNumber();
  }
  return -1;
}

bool SetupText::IsFolded(int line) const {
  const QTextBlock next = document()->findBlockByNumber(line).next();
  return next.isValid() && !next.isVisible();
}

void SetupText::SetFolded(const QTextBlock& begin, int end, bool isFolded) {
  if (end <= begin.blockNumber()) return;
  QTextBlock block = begin.next();
  for (; block.isValid() && block.blockNumber() <= end; block = block.next()) {
    block.setVisible(!isFolded);
    block.setLineCount(isFolded ? 0 : 1);
  }
  const int from = begin.position();
  const int to = block.isValid() ? block.position() : document()->characterCount();
  document()->markContentsDirty(from, to - from);
  if (auto* layout = qobject_cast<QPlainTextDocumentLayout*>(document()->documentLayout()))
    emit layout->documentSizeChanged(layout->documentSize());
  viewport()->update();
  margin_->update();
}

void SetupText::FoldAt(int line) {
  const int end = EndOfSection(line);
  const bool isFolded = !IsFolded(line);
  const QTextBlock begin = document()->findBlockByNumber(line);
  SetFolded(begin, end, isFolded);
  // A cursor in what is not seen would write there.
  if (isFolded && textCursor().blockNumber() > line && textCursor().blockNumber() <= end) GoToLine(line);
}

void SetupText::FoldAll(bool isFolded) {
  GoToLine(0);
  for (QTextBlock block = document()->firstBlock(); block.isValid(); block = block.next()) {
    const int end = block.blockNumber() == 0 ? -1 : EndOfSection(block.blockNumber());
    if (end < 0) {
      if (!isFolded && !block.isVisible()) SetFolded(block.previous(), block.blockNumber(), false);
      continue;
    }
    SetFolded(block, end, isFolded);
    block = document()->findBlockByNumber(end);
  }
}

// ---- Marks

void SetupText::SetProblems(std::vector<TextProblem> problems) {
  problems_ = std::move(problems);
  QList<QTextEdit::ExtraSelection> marks;
  for (const TextProblem& problem : problems_) {
    const QTextBlock block = document()->findBlockByNumber(problem.line);
    if (!block.isValid()) continue;
    QTextEdit::ExtraSelection mark;
    mark.cursor = QTextCursor(block);
    mark.cursor.movePosition(QTextCursor::EndOfBlock, QTextCursor::KeepAnchor);
    mark.format.setUnderlineStyle(QTextCharFormat::WaveUnderline);
    mark.format.setUnderlineColor(Theme::Get().ErrorColor());
    marks.push_back(mark);
  }
  setExtraSelections(marks);
  margin_->update();
}

const TextProblem* SetupText::ProblemAt(int line) const {
  const auto found =
      std::ranges::find_if(problems_, [line](const TextProblem& problem) { return problem.line == line; });
  return found == problems_.end() ? nullptr : &*found;
}

// ---- The margin

int SetupText::MarginWidth() const {
  const int digits = std::max(3, static_cast<int>(QString::number(document()->blockCount()).size()));
  return 2 * kGap + fontMetrics().horizontalAdvance('9') * digits + fontMetrics().height();
}

void SetupText::PaintMargin(QPaintEvent& event) {
  const Theme& theme = Theme::Get();
  QPainter painter(margin_);
  painter.fillRect(event.rect(), palette().color(QPalette::Window));
  painter.setRenderHint(QPainter::Antialiasing);
  const int height = fontMetrics().height(), width = margin_->width() - height;
  for (QTextBlock block = firstVisibleBlock(); block.isValid(); block = block.next()) {
    const QRectF place = blockBoundingGeometry(block).translated(contentOffset());
    if (place.top() > event.rect().bottom()) break;
    if (!block.isVisible()) continue;
    const int line = block.blockNumber();
    const bool isFaulty = ProblemAt(line) != nullptr;
    painter.setPen(isFaulty ? theme.ErrorColor() : theme.QuietColor());
    QFont font = this->font();
    font.setBold(isFaulty || line == textCursor().blockNumber());
    painter.setFont(font);
    painter.drawText(QRectF(0, place.top(), width - kGap, height), Qt::AlignRight | Qt::AlignVCenter,
                     QString::number(line + 1));
    if (!BeginsSection(FromQt(block.text()))) continue;
    const bool isFolded = IsFolded(line);
    const double unit = height / 5.0, x = width + 2.5 * unit, y = place.top() + height / 2.0;
    QPolygonF mark = isFolded ? QPolygonF{{{-unit / 2, -unit}, {unit / 2, 0}, {-unit / 2, unit}}}
                              : QPolygonF{{{-unit, -unit / 2}, {0, unit / 2}, {unit, -unit / 2}}};
    mark.translate(x - unit, y);
    painter.setPen(QPen(theme.QuietColor(), 1.5));
    painter.drawPolyline(mark);
  }
}

void SetupText::PressMargin(int y) {
  const int line = cursorForPosition({0, y}).blockNumber();
  FoldAt(line);
}

// ---- Events

void SetupText::paintEvent(QPaintEvent* event) {
  const TextColors colors = TextColors::Of(Theme::Get().IsDark());
  for (QTextBlock block = firstVisibleBlock(); block.isValid(); block = block.next()) {
    if (!block.isVisible()) continue;
    if (blockBoundingGeometry(block).translated(contentOffset()).top() > event->rect().bottom()) break;
    const QList<QTextLayout::FormatRange> formats = FormatsOf(block.text(), colors);
    if (block.layout()->formats() != formats) block.layout()->setFormats(formats);
  }
  QPlainTextEdit::paintEvent(event);
  QPainter painter(viewport());
  painter.setPen(Theme::Get().QuietColor());
  for (QTextBlock block = firstVisibleBlock(); block.isValid(); block = block.next()) {
    const QRectF place = blockBoundingGeometry(block).translated(contentOffset());
    if (place.top() > event->rect().bottom()) break;
    if (block.isVisible() && IsFolded(block.blockNumber()))
      painter.drawText(QPointF(place.left() + document()->documentMargin() +
                                   fontMetrics().horizontalAdvance(block.text()) + fontMetrics().averageCharWidth(),
                               place.top() + fontMetrics().ascent()),
                       "… }");
  }
}

void SetupText::resizeEvent(QResizeEvent* event) {
  QPlainTextEdit::resizeEvent(event);
  const QRect all = contentsRect();
  margin_->setGeometry(all.left(), all.top(), MarginWidth(), all.height());
}

void SetupText::focusOutEvent(QFocusEvent* event) {
  QPlainTextEdit::focusOutEvent(event);
  if (isEdited_ && event->reason() != Qt::PopupFocusReason) emit LeftEdit();
}

bool SetupText::event(QEvent* event) {
  // Undo and redo are the setup's: the commands of the window take them.
  if (event->type() == QEvent::ShortcutOverride) {
    const auto* key = static_cast<QKeyEvent*>(event);
    if (key->matches(QKeySequence::Undo) || key->matches(QKeySequence::Redo)) {
      event->ignore();
      return true;
    }
  }
  if (event->type() == QEvent::ToolTip) {
    const auto* help = static_cast<QHelpEvent*>(event);
    const QPoint place = viewport()->mapFromGlobal(help->globalPos());
    const TextProblem* problem = ProblemAt(cursorForPosition(place).blockNumber());
    QToolTip::showText(help->globalPos(), problem ? Translated(problem->text) : QString(), this);
    return true;
  }
  return QPlainTextEdit::event(event);
}

void SetupText::keyPressEvent(QKeyEvent* event) {
  if (event->matches(QKeySequence::Undo) || event->matches(QKeySequence::Redo)) return event->ignore();
  if (event->modifiers() == Qt::ControlModifier && event->key() == Qt::Key_Period) {
    // The section around the cursor, or that of its own line.
    int line = textCursor().blockNumber();
    while (line > 0 && EndOfSection(line) < textCursor().blockNumber()) --line;
    return FoldAt(line);
  }
  QPlainTextEdit::keyPressEvent(event);
  // A new line begins below the one above.
  if ((event->key() == Qt::Key_Return || event->key() == Qt::Key_Enter) && !isReadOnly()) {
    const QString above = textCursor().block().previous().text();
    qsizetype indent = 0;
    while (indent < above.size() && above[indent] == ' ') ++indent;
    if (BeginsSection(FromQt(above))) indent += 2;
    insertPlainText(QString(indent, ' '));
  }
}

}  // namespace tervane
