// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/run/log_view.h"

#include <QApplication>
#include <QClipboard>
#include <QContextMenuEvent>
#include <QDesktopServices>
#include <QFileInfo>
#include <QFontDatabase>
#include <QMenu>
#include <QPainter>
#include <QScrollBar>
#include <QUrl>
#include <algorithm>

#include "execution/engine_line.h"
#include "shell/widgets/drawing_access.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr int kMargin = 4;

/// Engines write into columns.
QFont LogFont() {
  QFont font = QFontDatabase::systemFont(QFontDatabase::FixedFont);
  font.setPointSizeF(QApplication::font().pointSizeF());
  return font;
}

}  // namespace

LogView::LogView(const LogTail& lines, const QString& emptyText) : lines_(lines), emptyText_(emptyText) {
  setFrameShape(QFrame::NoFrame);
  setLayoutDirection(Qt::LeftToRight);
  setFocusPolicy(Qt::StrongFocus);
  setFont(LogFont());
  DescribeDrawing(
      *this,
      [this] {
        QStringList shown;
        const auto first = static_cast<std::size_t>(verticalScrollBar()->value());
        for (std::size_t line = first; line < lines_.Count() && shown.size() < LinesInSight(); ++line)
          shown << TextOf(line);
        return shown.isEmpty() ? emptyText_ : shown.join('\n');
      },
      QAccessible::Document);
  viewport()->setBackgroundRole(QPalette::Base);
  viewport()->setCursor(Qt::IBeamCursor);
  setVerticalScrollBarPolicy(Qt::ScrollBarAlwaysOn);
  Follow();
}

int LogView::LineHeight() const { return fontMetrics().lineSpacing(); }

int LogView::LinesInSight() const { return std::max(1, (viewport()->height() - 2 * kMargin) / LineHeight()); }

void LogView::SetBars() {
  verticalScrollBar()->setPageStep(LinesInSight());
  verticalScrollBar()->setRange(0, std::max(0, static_cast<int>(lines_.Count()) - LinesInSight()));
  const int width = static_cast<int>(lines_.Longest() + 1) * fontMetrics().horizontalAdvance('x') + 2 * kMargin;
  horizontalScrollBar()->setPageStep(viewport()->width());
  horizontalScrollBar()->setSingleStep(fontMetrics().horizontalAdvance('x') * 4);
  horizontalScrollBar()->setRange(0, std::max(0, width - viewport()->width()));
}

void LogView::Follow() {
  const bool isAtEnd = verticalScrollBar()->value() == verticalScrollBar()->maximum();
  const auto gone = static_cast<int>(std::min<std::uint64_t>(lines_.Dropped() - dropped_, LogTail::kMostLines));
  dropped_ = lines_.Dropped();
  const int kept = std::max(0, verticalScrollBar()->value() - gone);
  SetBars();
  verticalScrollBar()->setValue(isAtEnd ? verticalScrollBar()->maximum() : kept);
  viewport()->update();
}

QString LogView::TextOf(std::size_t index) const {
  const std::string_view line = lines_.Line(index);
  QString text = QString::fromUtf8(line.data(), static_cast<qsizetype>(line.size()));
  constexpr int kTab = 8;
  for (qsizetype i = 0; i < text.size(); ++i) {
    if (text[i] == '\t')
      text.replace(i, 1, QString(kTab - i % kTab, ' '));
    else if (text[i].category() == QChar::Other_Control)
      text[i] = QChar::ReplacementCharacter;
  }
  return text;
}

void LogView::paintEvent(QPaintEvent* /*event*/) {
  QPainter painter(viewport());
  const Theme& theme = Theme::Get();
  if (lines_.IsEmpty()) {
    painter.setFont(QApplication::font());
    painter.setPen(theme.QuietColor());
    const int margin = theme.Scaled(12);
    painter.drawText(viewport()->rect().adjusted(margin, margin, -margin, -margin),
                     Qt::AlignTop | Qt::AlignLeft | Qt::TextWordWrap, emptyText_);
    return;
  }
  const int height = LineHeight(), x = kMargin - horizontalScrollBar()->value();
  auto index = static_cast<std::size_t>(verticalScrollBar()->value());
  for (int y = kMargin; y < viewport()->height() && index < lines_.Count(); y += height, ++index) {
    const std::uint64_t number = lines_.Dropped() + index;
    const bool isChosen = number >= chosenBegin_ && number < chosenEnd_;
    if (isChosen) painter.fillRect(0, y, viewport()->width(), height, palette().highlight());
    const auto message = EngineMessageOf(lines_.Line(index));
    painter.setPen(isChosen   ? palette().highlightedText().color()
                   : !message ? palette().text().color()
                              : (message->isError ? theme.ErrorColor() : theme.WarningColor()));
    painter.drawText(x, y + fontMetrics().ascent(), TextOf(index));
  }
}

void LogView::resizeEvent(QResizeEvent* /*event*/) { Follow(); }

void LogView::changeEvent(QEvent* event) {
  QAbstractScrollArea::changeEvent(event);
  if (event->type() == QEvent::FontChange || event->type() == QEvent::StyleChange) Follow();
}

// ---- Choosing lines

std::uint64_t LogView::LineAt(int y) const {
  const int row = verticalScrollBar()->value() + (y - kMargin) / LineHeight() - (y < kMargin ? 1 : 0);
  return lines_.Dropped() + static_cast<std::uint64_t>(std::clamp(row, 0, static_cast<int>(lines_.Count())));
}

void LogView::mousePressEvent(QMouseEvent* event) {
  if (event->button() != Qt::LeftButton) return;
  const std::uint64_t line = LineAt(qRound(event->position().y()));
  if (event->modifiers() & Qt::ShiftModifier) {
    mouseMoveEvent(event);
    return;
  }
  anchor_ = line;
  chosenBegin_ = chosenEnd_ = 0;
  viewport()->update();
}

void LogView::mouseMoveEvent(QMouseEvent* event) {
  if (!(event->buttons() & Qt::LeftButton)) return;
  const int y = qRound(event->position().y());
  if (y < 0) verticalScrollBar()->triggerAction(QAbstractSlider::SliderSingleStepSub);
  if (y > viewport()->height()) verticalScrollBar()->triggerAction(QAbstractSlider::SliderSingleStepAdd);
  const std::uint64_t line = LineAt(y);
  chosenBegin_ = std::min(anchor_, line);
  chosenEnd_ = std::max(anchor_, line) + 1;
  viewport()->update();
}

void LogView::selectAll() {
  chosenBegin_ = lines_.Dropped();
  chosenEnd_ = lines_.Dropped() + lines_.Count();
  viewport()->update();
}

void LogView::copy() {
  const std::uint64_t all = lines_.Dropped() + lines_.Count();
  const bool isChosen = chosenBegin_ < chosenEnd_;
  const std::uint64_t begin = isChosen ? std::max(chosenBegin_, lines_.Dropped()) : lines_.Dropped();
  std::string text;
  for (std::uint64_t number = begin; number < (isChosen ? std::min(chosenEnd_, all) : all); ++number) {
    text += lines_.Line(static_cast<std::size_t>(number - lines_.Dropped()));
    text += '\n';
  }
  QApplication::clipboard()->setText(QString::fromUtf8(text.data(), static_cast<qsizetype>(text.size())));
}

void LogView::keyPressEvent(QKeyEvent* event) {
  QScrollBar& bar = *verticalScrollBar();
  if (event->matches(QKeySequence::Copy)) return copy();
  if (event->matches(QKeySequence::SelectAll)) return selectAll();
  switch (event->key()) {
    case Qt::Key_Home:
      return bar.setValue(0);
    case Qt::Key_End:
      return bar.setValue(bar.maximum());
    default:
      QAbstractScrollArea::keyPressEvent(event);
  }
}

void LogView::contextMenuEvent(QContextMenuEvent* event) {
  QMenu menu;
  menu.addAction(tr("&Copy"), this, &LogView::copy)->setEnabled(!lines_.IsEmpty());
  menu.addAction(tr("Select &All"), this, &LogView::selectAll)->setEnabled(!lines_.IsEmpty());
  const QString file = file_ ? file_() : QString();
  menu.addAction(tr("&Open the Whole Log"), this, [file] { QDesktopServices::openUrl(QUrl::fromLocalFile(file)); })
      ->setEnabled(QFileInfo::exists(file));
  menu.exec(event->globalPos());
}

}  // namespace tervane
