// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/page/control_widget.h"

#include <QAction>
#include <QApplication>
#include <QClipboard>
#include <QHBoxLayout>
#include <QKeyEvent>
#include <QMenu>
#include <QPainter>
#include <QToolButton>
#include <algorithm>

#include "shell/page/control_widgets.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr int kWidestLabel = 280;  ///< In pixels at zoom 1; a longer label breaks into lines.
constexpr int kMostLabelPixels = 440;
constexpr int kMarkSize = 16, kDotSize = 6;

/// Stands behind a value that is not its default.
class ChangedDot : public QWidget {
 public:
  ChangedDot() {
    const int size = Theme::Get().Scaled(kDotSize);
    setFixedSize(size, size);
    setToolTip(ControlWidget::tr("This value differs from its default"));
  }

 protected:
  void paintEvent(QPaintEvent* /*event*/) override {
    QPainter painter(this);
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setPen(Qt::NoPen);
    painter.setBrush(Theme::Get().NoteColor());
    painter.drawEllipse(rect());
  }
};

}  // namespace

QString WithoutMarks(QString text) { return text.replace("&", "&&"); }

QLabel* NewLabel(const QString& text, int widest) {
  auto* label = new QLabel(text);
  label->setTextFormat(Qt::PlainText);
  // At a large zoom a label breaks earlier: the field beside it needs its room too.
  const int limit = std::min(Theme::Get().Scaled(widest), std::max(widest, kMostLabelPixels));
  if (label->sizeHint().width() > limit) {
    label->setWordWrap(true);
    label->setFixedWidth(limit);
  }
  return label;
}

bool LeavesToDocument(QEvent* event) {
  if (event->type() != QEvent::ShortcutOverride) return false;
  const auto* keys = static_cast<QKeyEvent*>(event);
  if (!keys->matches(QKeySequence::Undo) && !keys->matches(QKeySequence::Redo)) return false;
  event->ignore();
  return true;
}

ControlWidget::ControlWidget(CYbSEDlgBase& page, Control& control) : page_(page), control_(control) {}

std::unique_ptr<ControlWidget> ControlWidget::Make(CYbSEDlgBase& page, Control& control) {
  for (const auto& make : {MakeOptionWidget, MakeFieldWidget, MakeReadingWidget, MakeReportWidget, MakeLargeWidget})
    if (std::unique_ptr<ControlWidget> widget = make(page, control)) return widget;
  return nullptr;
}

void ControlWidget::MakeLabel() {
  if (control_.label.empty()) return;
  auto* label = NewLabel(WithoutMarks(Translated(control_.label)), kWidestLabel);
  label_ = label;
}

void ControlWidget::AddTo(QMenu& menu) {
  if (!control_.node || control_.key.empty()) return;
  const QString path = ToQt(PathOf(*control_.node) + ":" + control_.key);
  QAction* reset = menu.addAction(tr("&Reset to Default"), this, [this] {
    Forget();
    if (reset_) Enter(ToQt(*reset_));
  });
  reset->setEnabled(reset_ && control_.IsEnabled());
  menu.addAction(tr("Copy &Path of This Key"), this, [path] { QApplication::clipboard()->setText(path); });
}

void ControlWidget::ShowNotes(const QString& notes) {
  if (!noteMark_ && (notes.isEmpty() || !row_)) return;
  if (!noteMark_) {
    const int size = Theme::Get().Scaled(kMarkSize);
    noteMark_ = new QLabel;
    noteMark_->setFixedSize(size, size);
    noteMark_->setPixmap(Theme::Get().Icon("review").pixmap(size, size));
    row_->insertWidget(row_->indexOf(mark_), noteMark_);
  }
  noteMark_->setToolTip(notes);
  noteMark_->setAccessibleName(notes.isEmpty() ? QString() : tr("Review note: %1").arg(notes));
  noteMark_->setVisible(!notes.isEmpty());
}

void ControlWidget::ShowDeclared(const QString& toolTip, std::optional<std::string> reset) {
  reset_ = std::move(reset);
  if (label_) label_->setToolTip(toolTip);
  if (editor_ && !HasOwnToolTip()) editor_->setToolTip(toolTip);
  if (dot_) dot_->setVisible(reset_.has_value());
}

QBoxLayout* ControlWidget::MakeField(QWidget* editor, bool grows) {
  field_ = new QWidget;
  auto* column = new QVBoxLayout(field_);
  column->setContentsMargins(0, 0, 0, 0);
  column->setSpacing(2);
  auto* row = new QHBoxLayout;
  row->setSpacing(Theme::Get().Scaled(6));
  row->addWidget(editor, grows ? 1 : 0);
  editor_ = editor;
  if (control_.itemType || !control_.unit.empty()) row->addWidget(unit_ = MakeUnit());
  if (control_.isOfKey) {
    row->addWidget(dot_ = new ChangedDot);
    // What comes and goes must not move what stands beside it.
    QSizePolicy policy = dot_->sizePolicy();
    policy.setRetainSizeWhenHidden(true);
    dot_->setSizePolicy(policy);
    dot_->hide();
  }
  const int size = Theme::Get().Scaled(kMarkSize);
  mark_ = new QLabel;
  mark_->setFixedSize(size, size);
  mark_->hide();
  row->addWidget(mark_);
  row_ = row;
  if (!grows) row->addStretch();
  column->addLayout(row);
  message_ = new QLabel;
  message_->setWordWrap(true);
  message_->hide();
  column->addWidget(message_);
  if (auto* label = qobject_cast<QLabel*>(label_)) label->setBuddy(FocusTarget() ? FocusTarget() : editor);
  if (!control_.toolTip.empty()) editor->setToolTip(Translated(control_.toolTip));
  NameFor(*editor);
  if (FocusTarget()) NameFor(*FocusTarget());
  return row;
}

void ControlWidget::NameFor(QWidget& target) const {
  if (!target.accessibleName().isEmpty() || qobject_cast<QAbstractButton*>(&target)) return;
  // What fills a page has no label but the page's.
  const std::string& label = control_.label.empty() ? page_.Node().GetTitle() : control_.label;
  target.setAccessibleName(Translated(label));
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
        emit UnitChosen(control_.NumberUnit().itemType, key);
      });
    }
  });
  return button;
}

void ControlWidget::SyncUnit() {
  const QString unit = Translated(control_.UnitText());
  if (auto* label = qobject_cast<QLabel*>(unit_)) label->setText(unit);
  if (auto* button = qobject_cast<QToolButton*>(unit_)) {
    button->setText(unit);
    button->setAccessibleName(tr("Unit of %1: %2").arg(Translated(control_.label), unit));
  }
}

void ControlWidget::SyncSubject() {
  if (!control_.subject || control_.subject() == subject_) return;
  subject_ = control_.subject();
  Forget();
  ForgetRefusal();
}

void ControlWidget::ForgetRefusal() {
  refusal_.clear();
  SyncMessage();
  ShowRefused(false);
}

void ControlWidget::DropRefused() {
  if (!IsRefused()) return;
  ForgetRefusal();
  SyncValue();
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
  SyncSubject();
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
  SyncDescription();
}

void ControlWidget::SyncDescription() {
  QWidget* target = FocusTarget() ? FocusTarget() : editor_.data();
  if (!target) return;
  QStringList parts{message_ ? message_->text() : QString(), findings_, Translated(control_.UnitText()),
                    target->toolTip()};
  parts.removeAll(QString());
  const QString text = parts.join('\n');
  if (target->accessibleDescription() != text) target->setAccessibleDescription(text);
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
      if (!finding.detail.empty()) texts += "\n" + Translated(finding.detail);
    }
  }
  mark_->setVisible(!texts.isEmpty() && control_.IsShown());
  findings_ = texts;
  SyncDescription();
  if (texts.isEmpty()) return;
  mark_->setToolTip(texts);
  mark_->setAccessibleName(texts);
  const QString icon = ToQt(std::string(NameOf(worst)));
  mark_->setPixmap(Theme::Get().Icon(icon).pixmap(mark_->size()));
}

}  // namespace tervane
