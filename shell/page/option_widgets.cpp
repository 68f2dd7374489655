// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <QButtonGroup>
#include <QCheckBox>
#include <QComboBox>
#include <QHBoxLayout>
#include <QLabel>
#include <QRadioButton>
#include <QSignalBlocker>
#include <QWheelEvent>

#include "shell/page/control_widgets.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr int kChoiceWidth = 190;  ///< At least.

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
    connect(group_, &QButtonGroup::idClicked, this, [this](int id) { Enter(ToQt(Described().OptionValue(id))); });
  }
  QWidget* FocusTarget() const override {
    return group_->checkedButton() ? group_->checkedButton() : group_->button(0);
  }

 protected:
  void SyncValue() override {
    const int chosen = Described().Option();
    group_->setExclusive(chosen >= 0);
    for (QAbstractButton* button : group_->buttons()) {
      button->setChecked(group_->id(button) == chosen);
      button->parentWidget()->setEnabled(Described().IsOptionEnabled(group_->id(button)));
    }
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
      if (index < static_cast<int>(shown_.size())) Enter(ToQt(Described().OptionValue(index)));
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

}  // namespace

std::unique_ptr<ControlWidget> MakeOptionWidget(CYbSEDlgBase& page, Control& control) {
  switch (control.kind) {
    case ControlKind::Check:
      return std::make_unique<CheckWidget>(page, control);
    case ControlKind::Radio:
      return std::make_unique<RadioWidget>(page, control);
    case ControlKind::Choice:
      return std::make_unique<ChoiceWidget>(page, control);
    default:
      return nullptr;
  }
}

}  // namespace tervane
