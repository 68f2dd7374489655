// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <QApplication>
#include <QClipboard>
#include <QDesktopServices>
#include <QHBoxLayout>
#include <QLineEdit>
#include <QMimeData>
#include <QPlainTextEdit>
#include <QPushButton>
#include <QTextBrowser>

#include "pages/document/help_pages.h"
#include "shell/editors/text_file_view.h"
#include "shell/page/control_widgets.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr qsizetype kLongValue = 40;  ///< Letters.

/// A value that is only shown.
class ShownWidget : public ControlWidget {
 public:
  ShownWidget(CYbSEDlgBase& page, Control& control) : ControlWidget(page, control) {
    if (!control.beside) MakeLabel();
    value_ = new QLabel;
    value_->setAlignment(AtBegin());
    value_->setTextInteractionFlags(Qt::TextSelectableByMouse);
    // As high as a field, so that it is on the line of its label.
    if (!control.beside) value_->setMinimumHeight(QLineEdit().sizeHint().height());
    MakeField(value_, control.unit.empty() && control.itemType == 0);
  }

 protected:
  void SyncValue() override {
    const QString value = Translated(Described().Text());
    const bool bearsLabel = Described().beside && !Described().label.empty();
    value_->setText(bearsLabel ? QString("%1: %2").arg(Translated(Described().label), value) : value);
    // Several lines, or a sentence, are a text to be read, however narrow the page is.
    value_->setWordWrap(value.contains('\n') || value.size() > kLongValue);
  }

 private:
  QLabel* value_;
};

class NoticeWidget : public ControlWidget {
 public:
  NoticeWidget(CYbSEDlgBase& page, Control& control) : ControlWidget(page, control) {
    text_ = new QLabel;
    text_->setAlignment(AtBegin());
    text_->setWordWrap(true);
    text_->setTextFormat(Qt::PlainText);
    auto* copy = new QAction(tr("&Copy"), text_);
    connect(copy, &QAction::triggered, this, [this] { QApplication::clipboard()->setText(ToQt(Described().Text())); });
    text_->addAction(copy);
    text_->setContextMenuPolicy(Qt::ActionsContextMenu);
    MakeField(text_, true);
  }

 protected:
  void SyncValue() override {
    // A path has no place to break but behind its separators.
    text_->setText(Translated(Described().Text()).replace("/", QString("/") + QChar(0x200b)));
    Field()->setVisible(Described().IsShown() && !text_->text().isEmpty());
  }

 private:
  QLabel* text_;
};

class LabelWidget : public ControlWidget {
 public:
  LabelWidget(CYbSEDlgBase& page, Control& control) : ControlWidget(page, control) {
    MakeField(NewLabel(Translated(control.label), kWidestOption), false);
  }

 protected:
  void SyncValue() override {}
};

class ButtonWidget : public ControlWidget {
 public:
  ButtonWidget(CYbSEDlgBase& page, Control& control) : ControlWidget(page, control) {
    button_ = new QPushButton(Translated(control.label));
    MakeField(button_, false);
    connect(button_, &QPushButton::clicked, this, [this] { Page().Press(Described()); });
  }
  QWidget* FocusTarget() const override { return button_; }

 protected:
  void SyncValue() override {}

 private:
  QPushButton* button_;
};

class TextViewWidget : public ControlWidget {
 public:
  TextViewWidget(CYbSEDlgBase& page, Control& control) : ControlWidget(page, control) {
    MakeLabel();
    view_ = new QPlainTextEdit;
    view_->setReadOnly(true);
    view_->setLineWrapMode(QPlainTextEdit::NoWrap);
    QFont font("DejaVu Sans Mono");
    font.setStyleHint(QFont::Monospace);
    font.setPointSizeF(view_->font().pointSizeF());
    view_->setFont(font);
    MakeField(view_, true);
  }
  bool GrowsDown() const override { return true; }
  bool GrowsRight() const override { return true; }
  QWidget* FocusTarget() const override { return view_; }

 protected:
  void SyncValue() override {
    if (const QString text = ToQt(Described().Text()).remove('\r'); text != view_->toPlainText())
      view_->setPlainText(text);
  }

 private:
  QPlainTextEdit* view_;
};

class TextFileWidget : public ControlWidget {
 public:
  TextFileWidget(CYbSEDlgBase& page, Control& control) : ControlWidget(page, control) {
    view_ = new TextFileView;
    MakeField(view_, true);
  }
  bool GrowsDown() const override { return true; }
  bool GrowsRight() const override { return true; }
  QWidget* FocusTarget() const override { return &view_->Text(); }

 protected:
  void SyncValue() override { view_->Show(Described().Text()); }

 private:
  TextFileView* view_;
};

class BrowserWidget : public ControlWidget {
 public:
  BrowserWidget(CYbSEDlgBase& page, Control& control) : ControlWidget(page, control) {
    view_ = new QTextBrowser;
    view_->setOpenLinks(false);
    MakeField(view_, true);
    connect(view_, &QTextBrowser::anchorClicked, this, [this](const QUrl& link) {
      if (const std::string_view* linked = FindHelpPage(FromQt(link.toString())))
        view_->setHtml(ToQt(*linked));
      else
        QDesktopServices::openUrl(QUrl::fromLocalFile(ToQt(Described().folder) + "/").resolved(link));
    });
  }
  bool GrowsDown() const override { return true; }
  bool GrowsRight() const override { return true; }
  QWidget* FocusTarget() const override { return view_; }

 protected:
  void SyncValue() override {
    if (const QString text = ToQt(Described().Text()); text != shown_) {
      view_->setSearchPaths({ToQt(Described().folder)});
      view_->setHtml(shown_ = text);
    }
  }

 private:
  QTextBrowser* view_;
  QString shown_;
};

}  // namespace

std::unique_ptr<ControlWidget> MakeReadingWidget(CYbSEDlgBase& page, Control& control) {
  switch (control.kind) {
    case ControlKind::Shown:
      return std::make_unique<ShownWidget>(page, control);
    case ControlKind::Notice:
      return std::make_unique<NoticeWidget>(page, control);
    case ControlKind::Label:
      return std::make_unique<LabelWidget>(page, control);
    case ControlKind::Button:
      return std::make_unique<ButtonWidget>(page, control);
    case ControlKind::TextView:
      return std::make_unique<TextViewWidget>(page, control);
    case ControlKind::TextFile:
      return std::make_unique<TextFileWidget>(page, control);
    case ControlKind::Browser:
      return std::make_unique<BrowserWidget>(page, control);
    default:
      return nullptr;
  }
}

}  // namespace tervane
