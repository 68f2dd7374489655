// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <QAction>
#include <QColorDialog>
#include <QContextMenuEvent>
#include <QDropEvent>
#include <QHBoxLayout>
#include <QKeyEvent>
#include <QLineEdit>
#include <QMenu>
#include <QMimeData>
#include <QPlainTextEdit>
#include <QToolButton>
#include <QUrl>

#include "shell/page/control_widgets.h"
#include "shell/widgets/date_entry.h"
#include "shell/widgets/offered_texts.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr int kNumberWidth = 120;
constexpr int kDateWidth = 190;
constexpr int kTextWidth = 420;

/// A text in one line: texts, numbers, dates and names of files.
class LineWidget : public ControlWidget {
 public:
  LineWidget(CYbSEDlgBase& page, Control& control) : ControlWidget(page, control) {
    MakeLabel();
    edit_ = new QLineEdit;
    edit_->installEventFilter(this);
    edit_->setReadOnly(!control.enter);
    auto* row = MakeField(edit_, Width() == kTextWidth);
    if (Width() != kTextWidth)
      edit_->setFixedWidth(Theme::Get().Scaled(Width()));
    else
      edit_->setMinimumWidth(Theme::Get().Scaled(120));
    if (control.kind == ControlKind::Date) row->insertWidget(1, CalendarButton());
    if (control.kind == ControlKind::File) {
      edit_->setMinimumWidth(Theme::Get().Scaled(200));
      auto* browse = new QToolButton;
      browse->setIcon(Theme::Get().Icon("browse"));
      browse->setToolTip(tr("Choose a file"));
      browse->setAccessibleName(tr("Browse for %1").arg(Translated(control.label)));
      row->insertWidget(1, browse);
      connect(browse, &QToolButton::clicked, this, &LineWidget::Browse);
    }
    if (control.kind == ControlKind::Color) row->insertWidget(1, ColorButton());
    if (control.offers)
      OfferTexts(
          *edit_, [this] { return Offered(); }, [this] { Enter(edit_->text()); });
    connect(edit_, &QLineEdit::editingFinished, this, &LineWidget::Commit);
    connect(edit_, &QLineEdit::textEdited, this, [this] { edited_ = true; });
  }
  QWidget* FocusTarget() const override { return edit_; }
  void Commit() override {
    if (!edited_) return;
    edited_ = false;
    Enter(edit_->text());
  }

 protected:
  void Forget() override { edited_ = false; }
  bool HasOwnToolTip() const override { return Described().kind == ControlKind::File || edit_->isReadOnly(); }
  void SyncValue() override {
    if (edited_ || IsRefused()) return;
    if (const QString text = ToQt(Described().Text()); text != edit_->text()) {
      edit_->setText(text);
      edit_->setCursorPosition(edit_->isReadOnly() ? static_cast<int>(text.size()) : 0);
    }
    if (Described().kind == ControlKind::File || edit_->isReadOnly()) edit_->setToolTip(ToQt(Described().Text()));
    if (color_) ShowColor();
  }
  void ShowRefused(bool refused) override {
    QPalette palette;
    if (refused) {
      palette.setColor(QPalette::Text, Theme::Get().ErrorColor());
      QColor back = Theme::Get().ErrorColor();
      back.setAlphaF(0.15F);
      const QColor base = palette.color(QPalette::Base);
      palette.setColor(QPalette::Base, QColor::fromRgbF(base.redF() * 0.85F + back.redF() * 0.15F,
                                                        base.greenF() * 0.85F + back.greenF() * 0.15F,
                                                        base.blueF() * 0.85F + back.blueF() * 0.15F));
    }
    edit_->setPalette(palette);
  }
  bool eventFilter(QObject* watched, QEvent* event) override {
    if (!edited_ && !IsRefused() && LeavesToDocument(event)) return true;
    if (Described().kind == ControlKind::File && event->type() == QEvent::Drop) {
      const QList<QUrl> urls = static_cast<QDropEvent*>(event)->mimeData()->urls();
      if (urls.size() == 1 && urls.front().isLocalFile()) {
        Enter(urls.front().toLocalFile());
        return true;
      }
    }
    if (event->type() == QEvent::ContextMenu) {
      const std::unique_ptr<QMenu> menu(edit_->createStandardContextMenu());
      menu->addSeparator();
      AddTo(*menu);
      menu->exec(static_cast<QContextMenuEvent*>(event)->globalPos());
      return true;
    }
    if (event->type() == QEvent::KeyPress) {
      const int key = static_cast<QKeyEvent*>(event)->key();
      if (key == Qt::Key_Escape && (edited_ || IsRefused())) {
        edited_ = false;
        Enter(ToQt(Described().Text()));
        return true;
      }
      if (calendar_ && key == Qt::Key_Down && (static_cast<QKeyEvent*>(event)->modifiers() & Qt::AltModifier)) {
        calendar_->click();
        return true;
      }
      if (Described().kind == ControlKind::Date && (key == Qt::Key_Up || key == Qt::Key_Down))
        return StepDate(key == Qt::Key_Up ? 1 : -1);
    }
    return ControlWidget::eventFilter(watched, event);
  }

 private:
  int Width() const {
    switch (Described().kind) {
      case ControlKind::Integer:
      case ControlKind::Number:
      case ControlKind::Color:
        return kNumberWidth;
      case ControlKind::Date:
        return kDateWidth;
      default:
        return kTextWidth;
    }
  }
  QStringList Offered() const {
    QStringList texts;
    for (const std::string& text : Described().offers()) texts << ToQt(text);
    return texts;
  }
  /// Counts the part of the date in which the cursor stands.
  bool StepDate(int by) {
    Commit();
    const int cursor = edit_->cursorPosition();
    const QString stepped = SteppedDate(ToQt(Described().Text()), cursor, by);
    if (stepped.isEmpty() || IsRefused()) return false;
    Enter(stepped);
    edit_->setCursorPosition(cursor);
    return true;
  }
  QWidget* CalendarButton() {
    auto* button = calendar_ = new QToolButton;
    button->setIcon(Theme::Get().Icon("calendar"));
    button->setToolTip(tr("Choose a day (Alt+Down)"));
    button->setAccessibleName(tr("Calendar for %1").arg(Translated(Described().label)));
    QMenu* menu = NewCalendarMenu(
        button, [this] { return ToQt(Described().Text()); }, [this](const QString& date) { Enter(date); });
    connect(button, &QToolButton::clicked, menu, [this, button, menu] {
      Commit();
      menu->popup(button->mapToGlobal(QPoint(0, button->height())));
    });
    return button;
  }
  /// Shows the colour, and asks for another.
  QWidget* ColorButton() {
    color_ = new QToolButton;
    color_->setToolTip(tr("Choose a colour"));
    color_->setAccessibleName(tr("Colour of %1").arg(Translated(Described().label)));
    connect(color_, &QToolButton::clicked, this, [this] {
      Commit();
      const QColor chosen = QColorDialog::getColor(QColor(ToQt(Described().Text())), edit_, tr("Choose a colour"));
      if (chosen.isValid()) Enter(chosen.name());
    });
    return color_;
  }
  void ShowColor() {
    QPixmap patch(color_->iconSize() * color_->devicePixelRatioF());
    patch.fill(QColor(ToQt(Described().Text())));
    QPainter painter(&patch);
    painter.setPen(color_->palette().color(QPalette::Mid));
    painter.drawRect(patch.rect().adjusted(0, 0, -1, -1));
    painter.end();
    color_->setIcon(QIcon(patch));
  }
  void Browse() {
    Commit();
    if (Described().browse) {
      const QPointer<LineWidget> self(this);
      Page().Browse(Described());
      if (self) SyncValue();
      return;
    }
    if (const auto chosen = Page().AskFile(Described().fileQuestion, Described().Text())) Enter(ToQt(*chosen));
  }

  QLineEdit* edit_;
  QToolButton *color_ = nullptr, *calendar_ = nullptr;
  bool edited_ = false;
};

class LongTextWidget : public ControlWidget {
 public:
  LongTextWidget(CYbSEDlgBase& page, Control& control) : ControlWidget(page, control) {
    MakeLabel();
    edit_ = new QPlainTextEdit;
    edit_->setTabChangesFocus(true);
    edit_->installEventFilter(this);
    edit_->setMinimumSize(Theme::Get().Scaled(200), Theme::Get().Scaled(80));
    MakeField(edit_, true);
  }
  bool GrowsDown() const override { return true; }
  QWidget* FocusTarget() const override { return edit_; }
  void Commit() override {
    if (edit_->document()->isModified()) {
      edit_->document()->setModified(false);
      Enter(edit_->toPlainText());
    }
  }

 protected:
  void SyncValue() override {
    if (edit_->document()->isModified()) return;
    if (const QString text = ToQt(Described().Text()); text != edit_->toPlainText()) edit_->setPlainText(text);
  }
  bool eventFilter(QObject* watched, QEvent* event) override {
    if (!edit_->document()->isModified() && LeavesToDocument(event)) return true;
    if (event->type() == QEvent::FocusOut) Commit();
    return ControlWidget::eventFilter(watched, event);
  }

 private:
  QPlainTextEdit* edit_;
};

}  // namespace

std::unique_ptr<ControlWidget> MakeFieldWidget(CYbSEDlgBase& page, Control& control) {
  switch (control.kind) {
    case ControlKind::Text:
      return std::make_unique<LineWidget>(page, control);
    case ControlKind::Integer:
      return std::make_unique<LineWidget>(page, control);
    case ControlKind::Number:
      return std::make_unique<LineWidget>(page, control);
    case ControlKind::Date:
      return std::make_unique<LineWidget>(page, control);
    case ControlKind::File:
      return std::make_unique<LineWidget>(page, control);
    case ControlKind::Color:
      return std::make_unique<LineWidget>(page, control);
    case ControlKind::LongText:
      return std::make_unique<LongTextWidget>(page, control);
    default:
      return nullptr;
  }
}

}  // namespace tervane
