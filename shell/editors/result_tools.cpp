// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/editors/result_tools.h"

#include <QComboBox>
#include <QHBoxLayout>
#include <QLabel>
#include <QMenu>
#include <QToolButton>

#include "shell/widgets/qt_text.h"

namespace tervane {

namespace {

QToolButton* ToolWithText(const QString& text, const QString& tip) {
  auto* made = new QToolButton;
  made->setText(text);
  made->setToolTip(tip);
  made->setToolButtonStyle(Qt::ToolButtonTextOnly);
  return made;
}

}  // namespace

ResultTools::ResultTools(ResultView& view, DataFileView& file, Host& host) : view_(view), file_(file), host_(host) {
  colors_ = new QComboBox;
  colors_->setAccessibleName(tr("Colours"));
  flows_ = new QComboBox;
  flows_->setAccessibleName(tr("Arrows"));
  // Long names of items give way.
  flows_->setSizeAdjustPolicy(QComboBox::AdjustToMinimumContentsLengthWithIcon);
  flows_->setMinimumContentsLength(14);
  flowLabel_ = new QLabel(tr("Arrows:"));
  difference_ = ToolWithText({}, tr("Shows each step minus another one, or minus the same step of another run"));
  difference_->setPopupMode(QToolButton::InstantPopup);
  auto* differences = new QMenu(difference_);
  thisStep_ = differences->addAction(tr("Minus &This Step"));
  otherRun_ = differences->addAction(tr("Minus &Another Run..."));
  none_ = differences->addAction(tr("&Values"));
  difference_->setMenu(differences);
  cells_ = ToolWithText(tr("Cells"), tr("Click a cell on the map to see its values over time"));
  cells_->setPopupMode(QToolButton::InstantPopup);
  auto* cells = new QMenu(cells_);
  keep_ = cells->addAction(tr("&Keep Cells When Others Are Clicked"));
  keep_->setCheckable(true);
  forget_ = cells->addAction(tr("&Forget All Cells"));
  cells_->setMenu(cells);
  line_ = ToolWithText(tr("Draw Line"), tr("Shows the values along a line that you draw on the map"));
  animation_ = ToolWithText(tr("Save Animation..."), tr("Saves a picture of each step, with its number in the name"));

  auto* row = new QHBoxLayout(this);
  row->setContentsMargins(0, 0, 0, 0);
  row->addWidget(new QLabel(tr("Colours:")));
  row->addWidget(colors_);
  row->addWidget(flowLabel_);
  row->addWidget(flows_);
  for (QToolButton* button : {difference_, cells_, line_, animation_}) row->addWidget(button);
  row->addStretch();

  connect(colors_, &QComboBox::activated, this, [this](int number) {
    view_.ChoosePalette(static_cast<std::size_t>(number));
    emit Changed();
  });
  connect(flows_, &QComboBox::activated, this, [this](int number) {
    view_.ShowFlow(number > 0 ? std::optional(static_cast<std::size_t>(number - 1)) : std::nullopt);
    emit Changed();
  });
  connect(thisStep_, &QAction::triggered, this, [this] {
    view_.SubtractStep(file_.Slice().step);
    emit Changed();
  });
  connect(otherRun_, &QAction::triggered, this, &ResultTools::SubtractFile);
  connect(none_, &QAction::triggered, this, [this] {
    view_.SubtractNothing();
    emit Changed();
  });
  connect(keep_, &QAction::toggled, this, [this](bool isOn) { view_.KeepCells(isOn); });
  connect(forget_, &QAction::triggered, this, [this] {
    view_.ForgetCells();
    emit CellsChanged();
  });
  connect(line_, &QToolButton::clicked, this, &ResultTools::LineWanted);
  connect(animation_, &QToolButton::clicked, this, &ResultTools::AnimationWanted);
}

void ResultTools::Sync() {
  const bool hasSteps = file_.Steps() > 1;
  colors_->clear();
  for (const std::string& name : view_.Palettes()) colors_->addItem(Translated(name));
  colors_->setCurrentIndex(static_cast<int>(view_.Palette()));
  // Differences have one scale, which is the same on both sides of 0; codes have a colour each.
  colors_->setEnabled(!view_.IsDifference() && file_.Item().itemType != quantity::kCode);
  flows_->clear();
  flows_->addItem(tr("None"));
  for (const std::string& name : view_.Flows()) flows_->addItem(Translated(name));
  flows_->setCurrentIndex(view_.ShownFlow() ? static_cast<int>(*view_.ShownFlow()) + 1 : 0);
  flows_->setVisible(flows_->count() > 1);
  flowLabel_->setVisible(flows_->count() > 1);
  difference_->setText(view_.IsDifference() ? Translated(view_.DifferenceText()) : tr("Difference"));
  thisStep_->setEnabled(hasSteps);
  none_->setEnabled(view_.IsDifference());
  cells_->setVisible(hasSteps && file_.HasDates());
  animation_->setVisible(hasSteps);
}

void ResultTools::SubtractFile() {
  const auto path = host_.AskFileToOpen(
      {"Minus Another Run", "Results (*.nds2;*.nds3)|*.nds2;*.nds3|All Files (*.*)|*.*||", "nds3", file_.Path()});
  if (!path) return;
  if (const std::string reason = view_.SubtractFile(*path); !reason.empty())
    return host_.ShowMessage(reason, Host::Icon::Warning);
  emit Changed();
}

}  // namespace tervane
