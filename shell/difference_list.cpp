// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/difference_list.h"

#include <QHeaderView>
#include <algorithm>

#include "shell/widgets/data_delegate.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr int kNumberRole = Qt::UserRole;

QString ValueText(const std::string& value, const std::string& meaning, bool isDefault) {
  if (value.empty()) return isDefault ? DifferenceList::tr("(default)") : QString("—");
  const QString text = meaning.empty() ? ToQt(value) : QString("%1 [%2]").arg(ToQt(value), ToQt(meaning));
  return isDefault ? DifferenceList::tr("%1 (default)").arg(text) : text;
}

QString KindText(SetupDifference::Kind kind) {
  switch (kind) {
    case SetupDifference::Kind::Changed:
      return DifferenceList::tr("Changed");
    case SetupDifference::Kind::Added:
      return DifferenceList::tr("Added");
    case SetupDifference::Kind::Removed:
      return DifferenceList::tr("Removed");
    case SetupDifference::Kind::Moved:
      return DifferenceList::tr("Moved");
  }
  return {};
}

}  // namespace

DifferenceList::DifferenceList(const QString& from, const QString& to) {
  const Theme& theme = Theme::Get();
  setAccessibleName(tr("Differences"));
  setRootIsDecorated(true);
  setAlternatingRowColors(true);
  setUniformRowHeights(true);
  setHeaderLabels({tr("Section and key"), tr("Change"), from, to});
  for (const int column : {2, 3}) setItemDelegateForColumn(column, new DataDelegate(this));
  constexpr int kWidths[] = {0, 90, 190, 190};
  header()->setStretchLastSection(false);
  header()->setSectionResizeMode(0, QHeaderView::Stretch);
  for (int column = 1; column < 4; ++column)
    setColumnWidth(column, std::max(theme.Scaled(kWidths[column]), header()->sectionSizeHint(column)));
}

void DifferenceList::Show(std::vector<SetupDifference> differences) {
  const int chosen = currentItem() ? currentItem()->data(0, kNumberRole).toInt() : -1;
  differences_ = std::move(differences);
  clear();
  QTreeWidgetItem* section = nullptr;
  std::string path;
  for (int number = 0; number < static_cast<int>(differences_.size()); ++number) {
    const SetupDifference& difference = differences_[static_cast<std::size_t>(number)];
    if (!section || path != difference.path) {
      path = difference.path;
      section = new QTreeWidgetItem(this, {ToQt(path)});
      section->setData(0, kNumberRole, -1);
      section->setExpanded(true);
    }
    const bool isSection = difference.key.empty();
    QTreeWidgetItem* row = isSection ? section : new QTreeWidgetItem(section, {ToQt(difference.key)});
    row->setData(0, kNumberRole, number);
    row->setText(1, KindText(difference.kind));
    if (number == chosen) setCurrentItem(row);
    if (isSection && difference.from.empty() && difference.to.empty()) {
      const bool isAdded = difference.kind == SetupDifference::Kind::Added;
      if (!isAdded && difference.kind != SetupDifference::Kind::Removed) continue;
      row->setText(isAdded ? 2 : 3, tr("not there"));
      row->setText(isAdded ? 3 : 2, tr("there"));
      continue;
    }
    row->setText(2, ValueText(difference.from, difference.fromMeaning, difference.fromDefault));
    row->setText(3, ValueText(difference.to, difference.toMeaning, difference.toDefault));
    for (const int column : {2, 3}) row->setToolTip(column, row->text(column));
  }
}

const SetupDifference* DifferenceList::Chosen() const {
  const int number = currentItem() ? currentItem()->data(0, kNumberRole).toInt() : -1;
  return number >= 0 && number < static_cast<int>(differences_.size()) ? &differences_[static_cast<std::size_t>(number)]
                                                                       : nullptr;
}

}  // namespace tervane
