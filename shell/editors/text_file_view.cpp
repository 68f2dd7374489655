// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/editors/text_file_view.h"

#include <QLabel>
#include <QLocale>
#include <QPlainTextEdit>
#include <QScrollBar>
#include <QTextCursor>
#include <QVBoxLayout>

#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr std::size_t kPiece = 256 * 1024;

}  // namespace

TextFileView::TextFileView(QWidget* parent) : QWidget(parent), text_(new QPlainTextEdit), status_(new QLabel) {
  auto* column = new QVBoxLayout(this);
  column->setContentsMargins(0, 0, 0, 0);
  column->addWidget(text_, 1);
  column->addWidget(status_);
  text_->setReadOnly(true);
  text_->setLayoutDirection(Qt::LeftToRight);
  text_->setUndoRedoEnabled(false);
  text_->setAccessibleName(tr("Text of the file"));
  text_->setLineWrapMode(QPlainTextEdit::NoWrap);
  QFont font(QStringList{"Courier New", "DejaVu Sans Mono"});
  font.setStyleHint(QFont::Monospace);
  font.setPointSizeF(text_->font().pointSizeF());
  text_->setFont(font);
  status_->setWordWrap(true);
  status_->setTextFormat(Qt::PlainText);
  QPalette quiet = status_->palette();
  quiet.setColor(QPalette::WindowText, Theme::Get().QuietColor());
  status_->setPalette(quiet);
  connect(text_->verticalScrollBar(), &QScrollBar::valueChanged, this, &TextFileView::ReadOnAtEnd);
}

QString TextFileView::Status() const { return status_->text(); }

void TextFileView::Show(const std::string& path) {
  const FileStamp stamp = StampOf(path);
  if (path == path_ && stamp == stamp_) return;
  path_ = path;
  stamp_ = stamp;
  text_->clear();
  status_->clear();
  if (path.empty()) {
    status_->setText(tr("The report names no file here."));
  } else if (const std::string problem = pieces_.Open(path); !problem.empty()) {
    status_->setText(Translated(problem));
  } else {
    ReadOn();
  }
  status_->setVisible(!status_->text().isEmpty());
}

void TextFileView::ReadOn() {
  // A cursor of its own: the user's, and what is in view, stay where they are.
  QTextCursor end(text_->document());
  end.movePosition(QTextCursor::End);
  end.insertText(ToQt(pieces_.Next(kPiece)).remove('\r'));
  const QLocale locale;
  if (!pieces_.Error().empty())
    status_->setText(Translated(pieces_.Error()));
  else if (pieces_.IsAtEnd() || pieces_.Place() >= pieces_.Size())
    status_->clear();
  else
    status_->setText(tr("%1 of %2 are shown: scroll down to read on.")
                         .arg(locale.formattedDataSize(static_cast<qint64>(pieces_.Place())),
                              locale.formattedDataSize(static_cast<qint64>(pieces_.Size()))));
  status_->setVisible(!status_->text().isEmpty());
}

void TextFileView::ReadOnAtEnd() {
  const QScrollBar& bar = *text_->verticalScrollBar();
  if (!pieces_.IsAtEnd() && bar.value() > 0 && bar.value() >= bar.maximum() - bar.pageStep()) ReadOn();
}

}  // namespace tervane
