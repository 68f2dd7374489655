// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/merge_view.h"

#include <QComboBox>
#include <QHBoxLayout>
#include <QHeaderView>
#include <QLabel>
#include <QPushButton>
#include <QTableWidget>
#include <QVBoxLayout>
#include <array>
#include <utility>

#include "platform/files.h"
#include "platform/paths.h"
#include "shell/widgets/data_delegate.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

enum Column { kPlace, kBase, kMine, kTheirs, kTake, kColumns };

QString Shown(const std::string& value) { return value.empty() ? MergeView::tr("nothing") : ToQt(value); }

/// What the base and both sides are of a conflict about something other than a value.
std::array<QString, 3> SidesOf(const MergeConflict& conflict) {
  switch (conflict.kind) {
    case MergeConflict::Kind::DeletedByMe:
      return {MergeView::tr("there"), MergeView::tr("deleted"), MergeView::tr("changed")};
    case MergeConflict::Kind::DeletedByThem:
      return {MergeView::tr("there"), MergeView::tr("changed"), MergeView::tr("deleted")};
    case MergeConflict::Kind::Order:
      return {MergeView::tr("the first order of %1").arg(ToQt(conflict.mine)), MergeView::tr("moved"),
              MergeView::tr("moved otherwise")};
    case MergeConflict::Kind::Value:
      break;
  }
  return {Shown(conflict.base), Shown(conflict.mine), Shown(conflict.theirs)};
}

QString NameOf(const std::string& path) { return ToQt(FileNameOf(path)); }

}  // namespace

MergeView::MergeView(MergeFiles files, Host& host)
    : files_(std::move(files)), host_(host), summary_(new QLabel), table_(new QTableWidget) {
  auto* all = new QVBoxLayout(this);
  summary_->setWordWrap(true);
  all->addWidget(summary_);
  table_->setColumnCount(kColumns);
  table_->setHorizontalHeaderLabels({tr("Place"), tr("Base"), tr("Mine"), tr("Theirs"), tr("Take")});
  table_->horizontalHeader()->setSectionResizeMode(QHeaderView::Stretch);
  table_->horizontalHeader()->setSectionResizeMode(kTake, QHeaderView::ResizeToContents);
  table_->verticalHeader()->hide();
  for (const int held : {kPlace, kBase, kMine, kTheirs})
    table_->setItemDelegateForColumn(held, new DataDelegate(table_));
  table_->setSelectionBehavior(QAbstractItemView::SelectRows);
  table_->setEditTriggers(QAbstractItemView::NoEditTriggers);
  table_->setAccessibleName(tr("Conflicts"));
  all->addWidget(table_, 1);
  auto* row = new QHBoxLayout;
  const auto button = [&](const QString& text, const QString& tip, auto command) {
    auto* made = new QPushButton(text);
    made->setToolTip(tip);
    connect(made, &QPushButton::clicked, this, command);
    row->addWidget(made);
    return made;
  };
  button(tr("All &Mine"), tr("Takes mine of every conflict"), [this] { TakeAll(MergeSide::Mine); });
  button(tr("All The&irs"), tr("Takes theirs of every conflict"), [this] { TakeAll(MergeSide::Theirs); });
  row->addStretch();
  button(tr("Save Mer&ged…"), tr("Writes the merged setup and opens it"), [this] { AskAndSave(); })->setDefault(true);
  all->addLayout(row);
  Merge();
}

QString MergeView::Title() const { return tr("Merge of %1 and %2").arg(NameOf(files_.mine), NameOf(files_.theirs)); }

void MergeView::Merge() {
  stamps_ = Stamps();
  merge_ = MergeSetupFiles(files_.base, files_.mine, files_.theirs, files_.mine, choices_);
  Fill();
}

void MergeView::Fill() {
  const auto& conflicts = Conflicts();
  QString told = tr("Changes taken from %1: %2. Conflicts: %3")
                     .arg(NameOf(files_.theirs))
                     .arg(merge_.result.takenFromThem)
                     .arg(conflicts.size());
  told += conflicts.empty() ? tr(".") : tr("; of each, one side is taken.");
  if (!Problem().empty()) told = Translated(Problem());
  if (merge_.comments > 0) told += " " + tr("Comments inside of the setups are not merged: %1.").arg(merge_.comments);
  summary_->setText(told);
  table_->setRowCount(static_cast<int>(conflicts.size()));
  for (int i = 0; i < table_->rowCount(); ++i) {
    const auto place = static_cast<std::size_t>(i);
    const MergeConflict& conflict = conflicts[place];
    const std::array<QString, 3> sides = SidesOf(conflict);
    const QString path = ToQt(conflict.key.empty() ? conflict.path : conflict.path + ":" + conflict.key);
    const QString texts[] = {path, sides[0], sides[1], sides[2]};
    for (int column = kPlace; column <= kTheirs; ++column) {
      auto* item = new QTableWidgetItem(texts[column]);
      item->setToolTip(column == kPlace ? Translated(conflict.Sentence()) : texts[column]);
      table_->setItem(i, column, item);
    }
    auto* take = new QComboBox;
    take->addItems({tr("Mine"), tr("Theirs")});
    if (conflict.HasBase()) take->addItem(tr("Base"));
    take->setCurrentIndex(static_cast<int>(conflict.taken));
    take->setAccessibleName(tr("Taken of %1").arg(path));
    connect(take, &QComboBox::activated, this,
            [this, place](int index) { Take(place, static_cast<MergeSide>(index)); });
    table_->setCellWidget(i, kTake, take);
  }
}

void MergeView::Take(std::size_t conflict, MergeSide side) {
  choices_[Conflicts()[conflict].Identity()] = side;
  // Later: who chose still works with the row.
  QMetaObject::invokeMethod(this, &MergeView::Merge, Qt::QueuedConnection);
}

void MergeView::TakeAll(MergeSide side) {
  for (const MergeConflict& conflict : Conflicts()) choices_[conflict.Identity()] = side;
  Merge();
}

bool MergeView::SaveTo(const std::string& path) {
  // What was taken last may still be due to be merged.
  const bool isOther = Stamps() != stamps_;
  Merge();
  std::string problem = Problem();
  if (problem.empty() && isOther)
    problem = "A file has changed since it was merged. It was merged again: look at the conflicts, then save.";
  if (problem.empty()) problem = WriteFileAtomically(path, merge_.text).error;
  if (!problem.empty()) {
    host_.ShowMessage(problem, Host::Icon::Error);
    return false;
  }
  emit Saved(ToQt(path));
  return true;
}

void MergeView::AskAndSave() {
  if (const auto path = host_.AskFileToSave({FromQt(tr("Save Merged")), "Setups (*.tvd)|*.tvd||", "tvd", files_.mine}))
    SaveTo(*path);
}

}  // namespace tervane
