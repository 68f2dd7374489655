// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/page/control_widget.h"

#include <QAction>
#include <QApplication>
#include <QButtonGroup>
#include <QCalendarWidget>
#include <QCheckBox>
#include <QClipboard>
#include <QComboBox>
#include <QDateTime>
#include <QDesktopServices>
#include <QHBoxLayout>
#include <QKeyEvent>
#include <QLabel>
#include <QLineEdit>
#include <QMenu>
#include <QMimeData>
#include <QPlainTextEdit>
#include <QPushButton>
#include <QRadioButton>
#include <QSignalBlocker>
#include <QTextBrowser>
#include <QToolButton>
#include <QWidgetAction>
#include <algorithm>

#include "forms/plots.h"
#include "pages/document/help_pages.h"
#include "shell/charts/series_plot.h"
#include "shell/editors/text_file_view.h"
#include "shell/maps/map_canvas.h"
#include "shell/maps/map_view.h"
#include "shell/page/table_view.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr int kWidestLabel = 300;   ///< In pixels at zoom 1; a longer label breaks into lines.
constexpr int kWidestOption = 460;  ///< The same for texts of check boxes and radio buttons.
constexpr int kNumberWidth = 150;
constexpr int kDateWidth = 190;
constexpr int kTextWidth = 420;
constexpr int kChoiceWidth = 190;  ///< At least.
constexpr int kMarkSize = 16;

/// A text as it stands, where the toolkit would take an ampersand for the mark of a key.
QString WithoutMarks(QString text) { return text.replace("&", "&&"); }

/// A label that breaks into lines only where it must.
QLabel* NewLabel(const QString& text, int widest) {
  auto* label = new QLabel(text);
  label->setTextFormat(Qt::PlainText);
  const int limit = Theme::Get().Scaled(widest);
  if (label->sizeHint().width() > limit) {
    label->setWordWrap(true);
    label->setFixedWidth(limit);
  }
  return label;
}

/// A check box or radio button whose long text breaks into lines; the toolkit's own does not.
template <class Button>
class OptionButton : public QWidget {
 public:
  explicit OptionButton(const QString& text) : button_(new Button) {
    auto* row = new QHBoxLayout(this);
    row->setContentsMargins(0, 0, 0, 0);
    row->addWidget(button_, 0, Qt::AlignTop);
    button_->setText(WithoutMarks(text));
    if (button_->sizeHint().width() > Theme::Get().Scaled(kWidestOption)) {
      button_->setText({});
      button_->setAccessibleName(text);
      text_ = NewLabel(text, kWidestOption);
      text_->installEventFilter(this);
      row->addWidget(text_, 0, Qt::AlignTop);
    }
    row->addStretch();
    setFocusProxy(button_);
  }
  Button* operator->() const { return button_; }
  Button* Toggle() const { return button_; }

 protected:
  bool eventFilter(QObject* watched, QEvent* event) override {
    if (event->type() == QEvent::MouseButtonRelease && button_->isEnabled()) button_->click();
    return QWidget::eventFilter(watched, event);
  }

 private:
  Button* button_;
  QLabel* text_ = nullptr;
};

/// A drop list that the mouse wheel changes only when it has the keyboard, so that scrolling a page changes nothing.
class DropList : public QComboBox {
 public:
  DropList() { setFocusPolicy(Qt::StrongFocus); }

 protected:
  void wheelEvent(QWheelEvent* event) override {
    if (hasFocus())
      QComboBox::wheelEvent(event);
    else
      event->ignore();
  }
};

/// Undo and redo are the field's own while something typed in it is not entered yet, and the document's otherwise.
bool LeavesToDocument(QEvent* event) {
  if (event->type() != QEvent::ShortcutOverride) return false;
  const auto* keys = static_cast<QKeyEvent*>(event);
  if (!keys->matches(QKeySequence::Undo) && !keys->matches(QKeySequence::Redo)) return false;
  event->ignore();
  return true;
}

class CheckWidget : public ControlWidget {
 public:
  CheckWidget(CYbSEDlgBase& page, Control& control) : ControlWidget(page, control) {
    check_ = new OptionButton<QCheckBox>(Translated(control.label));
    MakeField(check_, false);
    connect(check_->Toggle(), &QCheckBox::toggled, this, [this](bool on) { Enter(on ? "1" : "0"); });
  }
  QWidget* FocusTarget() const override { return check_->Toggle(); }

 protected:
  void SyncValue() override {
    const QSignalBlocker blocker(check_->Toggle());
    (*check_)->setChecked(Described().Text() == "1");
  }

 private:
  OptionButton<QCheckBox>* check_;
};

QString NotInTheList(const Control& control) {
  return ControlWidget::tr("%1 (not in the list)").arg(ToQt(control.Text()));
}

class RadioWidget : public ControlWidget {
 public:
  RadioWidget(CYbSEDlgBase& page, Control& control) : ControlWidget(page, control) {
    MakeLabel();
    auto* box = new QWidget;
    auto* column = new QVBoxLayout(box);
    column->setContentsMargins(0, 0, 0, 0);
    group_ = new QButtonGroup(this);
    int number = 0;
    for (const std::string& option : control.Options()) {
      auto* button = new OptionButton<QRadioButton>(Translated(option));
      group_->addButton(button->Toggle(), number++);
      column->addWidget(button);
    }
    MakeField(box, false);
    connect(group_, &QButtonGroup::idClicked, this, [this](int id) { Enter(QString::number(id)); });
  }
  QWidget* FocusTarget() const override {
    return group_->checkedButton() ? group_->checkedButton() : group_->button(0);
  }

 protected:
  void SyncValue() override {
    const int chosen = Described().Option();
    group_->setExclusive(chosen >= 0);
    for (QAbstractButton* button : group_->buttons()) button->setChecked(group_->id(button) == chosen);
    group_->setExclusive(true);
    SetRemark(chosen >= 0 ? QString() : tr("The setup holds %1: choose one.").arg(NotInTheList(Described())));
  }

 private:
  QButtonGroup* group_;
};

class ChoiceWidget : public ControlWidget {
 public:
  ChoiceWidget(CYbSEDlgBase& page, Control& control) : ControlWidget(page, control) {
    MakeLabel();
    list_ = new DropList;
    list_->setMinimumWidth(Theme::Get().Scaled(kChoiceWidth));
    MakeField(list_, false);
    connect(list_, &QComboBox::activated, this, [this](int index) {
      if (index < static_cast<int>(shown_.size())) Enter(QString::number(index));
    });
  }
  QWidget* FocusTarget() const override { return list_; }

 protected:
  void SyncValue() override {
    const QSignalBlocker blocker(list_);
    std::vector<std::string> options = Described().Options();
    const int chosen = Described().Option();
    // A value outside the list stands in a row of its own behind the others, until another one is chosen.
    const int expected = static_cast<int>(options.size()) + (chosen < 0 && !options.empty() ? 1 : 0);
    if (options != shown_ || list_->count() != expected || chosen < 0) {
      list_->clear();
      for (const std::string& option : options) list_->addItem(Translated(option));
      shown_ = std::move(options);
      if (chosen < 0 && !shown_.empty()) list_->addItem(NotInTheList(Described()));
    }
    list_->setCurrentIndex(chosen >= 0 ? chosen : static_cast<int>(shown_.size()));
    const bool isOutside = chosen < 0 && !shown_.empty();
    SetRemark(isOutside ? tr("This value is not in the list: choose one.") : QString());
  }

 private:
  DropList* list_;
  std::vector<std::string> shown_;
};

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
  void SyncValue() override {
    if (edited_ || IsRefused()) return;
    if (const QString text = ToQt(Described().Text()); text != edit_->text()) {
      edit_->setText(text);
      edit_->setCursorPosition(edit_->isReadOnly() ? static_cast<int>(text.size()) : 0);
    }
    if (Described().kind == ControlKind::File || edit_->isReadOnly()) edit_->setToolTip(ToQt(Described().Text()));
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
    if (event->type() == QEvent::KeyPress) {
      const int key = static_cast<QKeyEvent*>(event)->key();
      if (key == Qt::Key_Escape && (edited_ || IsRefused())) {
        edited_ = false;
        Enter(ToQt(Described().Text()));
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
        return kNumberWidth;
      case ControlKind::Date:
        return kDateWidth;
      default:
        return kTextWidth;
    }
  }
  static QString DateFormat() { return "yyyy/MM/dd  HH:mm"; }
  QDateTime ShownDate() const { return QDateTime::fromString(ToQt(Described().Text()), DateFormat()); }

  /// Counts the part of the date in which the cursor stands.
  bool StepDate(int by) {
    Commit();
    const QDateTime date = ShownDate();
    if (!date.isValid() || IsRefused()) return false;
    const int cursor = edit_->cursorPosition();
    const QDateTime stepped = cursor <= 4    ? date.addYears(by)
                              : cursor <= 7  ? date.addMonths(by)
                              : cursor <= 10 ? date.addDays(by)
                              : cursor <= 14 ? date.addSecs(3600 * by)
                                             : date.addSecs(60 * by);
    if (stepped.date().year() < 1 || stepped.date().year() > 9999) return true;
    Enter(stepped.toString(DateFormat()));
    edit_->setCursorPosition(cursor);
    return true;
  }
  QWidget* CalendarButton() {
    auto* button = new QToolButton;
    button->setIcon(Theme::Get().Icon("calendar"));
    button->setToolTip(tr("Choose a day"));
    button->setAccessibleName(tr("Calendar for %1").arg(Translated(Described().label)));
    auto* menu = new QMenu(button);
    auto* calendar = new QCalendarWidget;
    calendar->setGridVisible(true);
    auto* action = new QWidgetAction(menu);
    action->setDefaultWidget(calendar);
    menu->addAction(action);
    connect(button, &QToolButton::clicked, menu,
            [button, menu] { menu->popup(button->mapToGlobal(QPoint(0, button->height()))); });
    connect(menu, &QMenu::aboutToShow, this, [this, calendar] {
      Commit();
      if (const QDateTime date = ShownDate(); date.isValid()) calendar->setSelectedDate(date.date());
      calendar->setFocus();
    });
    const auto choose = [this, menu](const QDate& day) {
      const QDateTime date = ShownDate();
      const QTime time = date.isValid() ? date.time() : QTime(0, 0);
      menu->close();
      Enter(QDateTime(day, time).toString(DateFormat()));
    };
    connect(calendar, &QCalendarWidget::clicked, this, choose);
    connect(calendar, &QCalendarWidget::activated, this, choose);
    return button;
  }
  void Browse() {
    Commit();
    if (Described().browse) {
      const QPointer<LineWidget> self(this);
      Page().Browse(Described());
      if (self) SyncValue();
      return;
    }
    Host::FileQuestion question = Described().fileQuestion;
    const CYbSEKvfGlobalBase* root = Page().Node().GetRoot();
    question.current = FileName(Described().Text(), root ? root->SetupFolder() : std::string()).Absolute();
    if (question.current.empty() && root) question.current = root->SetupFolder();
    if (const auto chosen = Page().Outside().AskFileToOpen(question)) Enter(ToQt(*chosen));
  }

  QLineEdit* edit_;
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

/// A value that is only shown.
class ShownWidget : public ControlWidget {
 public:
  ShownWidget(CYbSEDlgBase& page, Control& control) : ControlWidget(page, control) {
    if (!control.beside) MakeLabel();
    value_ = new QLabel;
    value_->setTextInteractionFlags(Qt::TextSelectableByMouse);
    MakeField(value_, control.unit.empty() && control.itemType == 0);
  }

 protected:
  void SyncValue() override {
    const QString value = Translated(Described().Text());
    const bool bearsLabel = Described().beside && !Described().label.empty();
    value_->setText(bearsLabel ? QString("%1: %2").arg(Translated(Described().label), value) : value);
    // Several lines are a text to be read, however narrow the page is.
    value_->setWordWrap(value.contains('\n'));
  }

 private:
  QLabel* value_;
};

class NoticeWidget : public ControlWidget {
 public:
  NoticeWidget(CYbSEDlgBase& page, Control& control) : ControlWidget(page, control) {
    text_ = new QLabel;
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

class TableWidget : public ControlWidget {
 public:
  TableWidget(CYbSEDlgBase& page, Control& control) : ControlWidget(page, control) {
    MakeLabel();
    table_ = new TableView(page, control);
    connect(table_, &TableView::UnitChosen, this, &ControlWidget::UnitChosen);
    MakeField(table_, true);
  }
  bool GrowsDown() const override { return true; }
  bool GrowsRight() const override { return true; }
  QWidget* FocusTarget() const override { return table_->FocusTarget(); }
  void Commit() override { table_->Commit(); }

 protected:
  void SyncValue() override { table_->Sync(); }

 private:
  TableView* table_;
};

class MapWidget : public ControlWidget {
 public:
  MapWidget(CYbSEDlgBase& page, Control& control) : ControlWidget(page, control) {
    view_ = new MapView(page.Outside());
    MakeField(view_, true);
  }
  bool GrowsDown() const override { return true; }
  bool GrowsRight() const override { return true; }
  QWidget* FocusTarget() const override { return &view_->Canvas(); }

 protected:
  void SyncValue() override {
    if (Described().IsShown())
      view_->ShowWhenThere(Described().map, Described().displayUnits);
    else
      view_->StopWaiting();
  }

 private:
  MapView* view_;
};

class ChartWidget : public ControlWidget {
 public:
  ChartWidget(CYbSEDlgBase& page, Control& control) : ControlWidget(page, control) {
    plot_ = new SeriesPlot(page.Outside());
    MakeField(plot_, true);
  }
  bool GrowsDown() const override { return true; }
  bool GrowsRight() const override { return true; }
  QWidget* FocusTarget() const override { return plot_->FocusTarget(); }

 protected:
  void SyncValue() override {
    if (Described().IsShown())
      plot_->ShowWhenThere(Described().chart);
    else
      plot_->StopWaiting();
  }

 private:
  SeriesPlot* plot_;
};

}  // namespace

ControlWidget::ControlWidget(CYbSEDlgBase& page, Control& control) : page_(page), control_(control) {}

std::unique_ptr<ControlWidget> ControlWidget::Make(CYbSEDlgBase& page, Control& control) {
  switch (control.kind) {
    case ControlKind::Check:
      return std::make_unique<CheckWidget>(page, control);
    case ControlKind::Radio:
      return std::make_unique<RadioWidget>(page, control);
    case ControlKind::Choice:
      return std::make_unique<ChoiceWidget>(page, control);
    case ControlKind::Text:
    case ControlKind::Integer:
    case ControlKind::Number:
    case ControlKind::Date:
    case ControlKind::File:
      return std::make_unique<LineWidget>(page, control);
    case ControlKind::LongText:
      return std::make_unique<LongTextWidget>(page, control);
    case ControlKind::Shown:
      return std::make_unique<ShownWidget>(page, control);
    case ControlKind::Notice:
      return std::make_unique<NoticeWidget>(page, control);
    case ControlKind::Label:
      return std::make_unique<LabelWidget>(page, control);
    case ControlKind::Button:
      return std::make_unique<ButtonWidget>(page, control);
    case ControlKind::Table:
      return std::make_unique<TableWidget>(page, control);
    case ControlKind::TextView:
      return std::make_unique<TextViewWidget>(page, control);
    case ControlKind::TextFile:
      return std::make_unique<TextFileWidget>(page, control);
    case ControlKind::Browser:
      return std::make_unique<BrowserWidget>(page, control);
    case ControlKind::Map:
      return std::make_unique<MapWidget>(page, control);
    case ControlKind::Chart:
      return std::make_unique<ChartWidget>(page, control);
    case ControlKind::Group:
    case ControlKind::SubForms:
      break;
  }
  return nullptr;
}

void ControlWidget::MakeLabel() {
  if (control_.label.empty()) return;
  auto* label = NewLabel(WithoutMarks(Translated(control_.label)), kWidestLabel);
  label_ = label;
  if (!control_.node || control_.key.empty()) return;
  const QString path = ToQt(PathOf(*control_.node) + ":" + control_.key);
  label->setToolTip(path);
  auto* copy = new QAction(tr("&Copy Path of This Key"), label);
  connect(copy, &QAction::triggered, this, [path] { QApplication::clipboard()->setText(path); });
  label->addAction(copy);
  label->setContextMenuPolicy(Qt::ActionsContextMenu);
}

QBoxLayout* ControlWidget::MakeField(QWidget* editor, bool grows) {
  field_ = new QWidget;
  auto* column = new QVBoxLayout(field_);
  column->setContentsMargins(0, 0, 0, 0);
  column->setSpacing(2);
  auto* row = new QHBoxLayout;
  row->setSpacing(Theme::Get().Scaled(6));
  row->addWidget(editor, grows ? 1 : 0);
  if (control_.itemType || !control_.unit.empty()) row->addWidget(unit_ = MakeUnit());
  const int size = Theme::Get().Scaled(kMarkSize);
  mark_ = new QLabel;
  mark_->setFixedSize(size, size);
  mark_->hide();
  row->addWidget(mark_);
  if (!grows) row->addStretch();
  column->addLayout(row);
  message_ = new QLabel;
  message_->setWordWrap(true);
  message_->hide();
  column->addWidget(message_);
  if (auto* label = qobject_cast<QLabel*>(label_)) label->setBuddy(FocusTarget() ? FocusTarget() : editor);
  if (!control_.toolTip.empty()) editor->setToolTip(Translated(control_.toolTip));
  if (QWidget* target = editor; target->accessibleName().isEmpty() && !control_.label.empty())
    target->setAccessibleName(Translated(control_.label));
  return row;
}

QWidget* ControlWidget::MakeUnit() {
  if (control_.UnitChoices().size() < 2) return new QLabel;
  auto* button = new QToolButton;
  button->setAutoRaise(true);
  button->setPopupMode(QToolButton::InstantPopup);
  button->setToolTip(tr("Choose the unit in which this quantity is shown everywhere"));
  auto* menu = new QMenu(button);
  button->setMenu(menu);
  connect(menu, &QMenu::aboutToShow, this, [this, menu] {
    menu->clear();
    for (const UnitChoice& choice : control_.UnitChoices()) {
      QAction* action = menu->addAction(Translated(choice.text));
      action->setCheckable(true);
      action->setChecked(choice.key == control_.NumberUnit().Key());
      connect(action, &QAction::triggered, this, [this, key = choice.key] {
        Commit();
        emit UnitChosen(control_.itemType, key);
      });
    }
  });
  return button;
}

void ControlWidget::SyncUnit() {
  const QString unit = Translated(control_.UnitText());
  if (auto* label = qobject_cast<QLabel*>(unit_)) label->setText(unit);
  if (auto* button = qobject_cast<QToolButton*>(unit_)) button->setText(unit);
}

void ControlWidget::Sync() {
  if (!field_) return;
  const bool shown = control_.IsShown();
  const bool enabled = control_.IsEnabled();
  field_->setVisible(shown);
  if (label_) {
    label_->setVisible(shown);
    label_->setEnabled(enabled);
  }
  SyncEnabled(enabled);
  SyncValue();
  SyncUnit();
  SyncFindings();
}

bool ControlWidget::Enter(const QString& typed) {
  const QPointer<ControlWidget> self(this);  // the page may be replaced by what the change does
  const std::string expected = page_.Enter(control_, FromQt(typed));
  if (!self) return expected.empty();
  refusal_ = expected.empty() ? QString() : tr("Not taken: %1.").arg(Translated(expected));
  SyncMessage();
  ShowRefused(IsRefused());
  if (!IsRefused()) SyncValue();
  return expected.empty();
}

void ControlWidget::SetRemark(const QString& remark) {
  remark_ = remark;
  SyncMessage();
}

void ControlWidget::SyncMessage() {
  if (!message_) return;
  const QString text = !refusal_.isEmpty() ? refusal_ : remark_;
  QPalette palette = message_->palette();
  palette.setColor(QPalette::WindowText, refusal_.isEmpty() ? Theme::Get().WarningColor() : Theme::Get().ErrorColor());
  message_->setPalette(palette);
  message_->setText(text);
  message_->setVisible(!text.isEmpty());
}

void ControlWidget::SyncFindings() {
  if (!mark_) return;
  QString texts;
  Severity worst = Severity::Note;
  if (control_.node && !control_.key.empty()) {
    for (const Finding& finding : control_.node->Findings()) {
      if (finding.key != control_.key) continue;
      worst = std::min(worst, finding.severity);
      texts += (texts.isEmpty() ? "" : "\n") + Translated(finding.text);
      if (!finding.detail.empty()) texts += "\n" + ToQt(finding.detail);
    }
  }
  mark_->setVisible(!texts.isEmpty() && control_.IsShown());
  if (texts.isEmpty()) return;
  mark_->setToolTip(texts);
  mark_->setAccessibleName(texts);
  const QString icon = ToQt(std::string(NameOf(worst)));
  mark_->setPixmap(Theme::Get().Icon(icon).pixmap(mark_->size()));
}

}  // namespace tervane
