// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/editors/edit_panel.h"

#include <QComboBox>
#include <QGroupBox>
#include <QHBoxLayout>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QScrollArea>
#include <QVBoxLayout>
#include <utility>

#include "data/csv_reader.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr int kPanelWidth = 280, kLabelWidth = 78;

}  // namespace

EditPanel::EditPanel() {
  auto* body = new QWidget;
  all_ = new QVBoxLayout(body);
  all_->setContentsMargins(0, 0, Theme::Get().Scaled(8), 0);
  told_ = new QLabel;
  told_->setWordWrap(true);
  told_->setTextFormat(Qt::PlainText);
  told_->setTextInteractionFlags(Qt::TextSelectableByMouse);
  told_->hide();
  auto* groups = new QScrollArea;
  groups->setWidget(body);
  groups->setWidgetResizable(true);
  groups->setFrameShape(QFrame::NoFrame);
  // The keyboard goes to what it holds.
  groups->setFocusPolicy(Qt::NoFocus);
  groups->setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
  auto* column = new QVBoxLayout(this);
  column->setContentsMargins(0, 0, 0, 0);
  column->addWidget(groups, 1);
  column->addWidget(told_);
  setFixedWidth(Theme::Get().Scaled(kPanelWidth));
  connect(&Theme::Get(), &Theme::Changed, this, [this] { setFixedWidth(Theme::Get().Scaled(kPanelWidth)); });
}

void EditPanel::Group(const QString& title) {
  auto* box = new QGroupBox(title);
  group_ = new QVBoxLayout(box);
  group_->setSpacing(Theme::Get().Scaled(5));
  buttons_ = nullptr;
  all_->addWidget(box);
}

namespace {

QHBoxLayout* LabelledRow(const QString& label, QWidget* field) {
  auto* row = new QHBoxLayout;
  auto* name = new QLabel(label);
  name->setMinimumWidth(Theme::Get().Scaled(kLabelWidth));
  name->setBuddy(field);
  row->addWidget(name);
  row->addWidget(field, 1);
  return row;
}

}  // namespace

QLineEdit* EditPanel::Field(const QString& label, const QString& toolTip, const QString& text) {
  auto* field = new QLineEdit(text);
  field->setToolTip(toolTip);
  field->setAccessibleName(label);
  field->setMinimumWidth(0);
  group_->addLayout(LabelledRow(label, field));
  return field;
}

QComboBox* EditPanel::Choice(const QString& label, const QString& toolTip, const QStringList& choices) {
  auto* field = new QComboBox;
  field->addItems(choices);
  field->setToolTip(toolTip);
  field->setAccessibleName(label);
  group_->addLayout(LabelledRow(label, field));
  return field;
}

QLabel* EditPanel::Text() {
  auto* text = new QLabel;
  text->setTextInteractionFlags(Qt::TextSelectableByMouse);
  text->setWordWrap(true);
  group_->addWidget(text);
  return text;
}

QPushButton* EditPanel::Button(const QString& text, const QString& toolTip, Run run, bool isNewRow) {
  if (isNewRow || !buttons_) {
    buttons_ = new QHBoxLayout;
    group_->addLayout(buttons_);
  }
  auto* button = new QPushButton(text);
  button->setToolTip(toolTip);
  buttons_->addWidget(button);
  connect(button, &QPushButton::clicked, this, [this, run = std::move(run)] {
    Tell({});
    const QString told = run();
    if (!told.isEmpty()) Tell(told);
    emit Done();
  });
  return button;
}

void EditPanel::End() { all_->addStretch(); }

std::optional<double> EditPanel::NumberIn(const QLineEdit& field) {
  const std::optional<double> number = ParseCsvNumber(FromQt(field.text().trimmed()), true);
  if (!number) Tell(tr("%1 a number was expected.").arg(field.accessibleName()));
  return number;
}

void EditPanel::Tell(const QString& text) {
  told_->setText(text);
  told_->setVisible(!text.isEmpty());
}

QString EditPanel::Told() const { return told_->text(); }

}  // namespace tervane
