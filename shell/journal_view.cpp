// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/journal_view.h"

#include <QComboBox>
#include <QFileDialog>
#include <QHBoxLayout>
#include <QHeaderView>
#include <QLabel>
#include <QLineEdit>
#include <QSettings>
#include <QToolButton>
#include <QVBoxLayout>
#include <algorithm>

#include "core/host.h"
#include "pages/place_names.h"
#include "shell/program.h"
#include "shell/widgets/data_delegate.h"
#include "shell/widgets/flat_button.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/row_delegate.h"
#include "shell/widgets/scrolled_row.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr const char *kKeepOfAll = "Journal/OfAll", *kKeepOf = "Journal/Setups";
constexpr std::size_t kMostJournalRows = 1000;  ///< The latest; a filter finds the others.

enum JournalColumn { kJournalTime, kJournalUser, kJournalStep, kJournalPlace, kJournalBefore, kJournalAfter };
enum JournalRole { kJournalStepRole = Qt::UserRole, kJournalPathRole, kJournalKeyRole };

QString JournalText(const std::string& text) { return ToQt(text).simplified(); }

}  // namespace

JournalView::JournalView(EditSession& session, Host& host, Program& program, std::function<void()> commit)
    : session_(session),
      host_(host),
      program_(program),
      commit_(std::move(commit)),
      keep_(new QComboBox),
      filter_(new QLineEdit),
      told_(new QLabel),
      list_(new QTreeWidget) {
  auto* column = new QVBoxLayout(this);
  column->setContentsMargins(0, 0, 0, 0);
  column->setSpacing(0);
  auto* area = new ScrolledRow;
  QHBoxLayout* row = &area->Row();
  row->setContentsMargins(4, 2, 4, 2);
  row->setSpacing(Theme::Get().Scaled(8));
  keep_->addItem(tr("No journal is kept"));
  keep_->addItem(tr("Keep a journal of this setup"));
  keep_->addItem(tr("Keep a journal of every setup"));
  keep_->setAccessibleName(tr("Whether a journal is kept"));
  row->addWidget(keep_);
  filter_->setPlaceholderText(tr("Filter"));
  filter_->setAccessibleName(tr("Filter the journal"));
  filter_->setClearButtonEnabled(true);
  filter_->setMaximumWidth(Theme::Get().Scaled(260));
  row->addWidget(filter_, 1);
  row->addWidget(told_);
  row->addStretch(1);
  takeBack_ = AddFlatButton(*row, tr("Take Back"), [this] { TakeBack(); });
  takeBack_->setToolTip(tr("Gives the keys of the chosen step the values that they had before it"));
  export_ = AddFlatButton(*row, tr("Export…"), [this] {
    const QString path = QFileDialog::getSaveFileName(window(), tr("Export Journal"), tr("journal.csv"),
                                                      tr("Tables separated by commas (*.csv)"));
    if (!path.isEmpty()) ExportTo(FromQt(path));
  });
  column->addWidget(area);
  column->addWidget(list_, 1);

  list_->setHeaderLabels({tr("Time"), tr("By"), tr("Step"), tr("Place"), tr("Before"), tr("After")});
  list_->setItemDelegate(new RowDelegate(list_));
  for (const int held : {kJournalTime, kJournalBefore, kJournalAfter})
    list_->setItemDelegateForColumn(held, new DataDelegate(list_));
  list_->setUniformRowHeights(true);
  list_->setAlternatingRowColors(true);
  list_->setFrameShape(QFrame::NoFrame);
  list_->setAccessibleName(tr("Journal"));
  const Theme& theme = Theme::Get();
  for (const auto& [at, width] : {std::pair<int, int>{kJournalTime, 170},
                                  {kJournalUser, 80},
                                  {kJournalStep, 170},
                                  {kJournalPlace, 275},
                                  {kJournalBefore, 120}})
    list_->setColumnWidth(at, theme.Scaled(width));
  connect(list_, &QTreeWidget::itemActivated, this, [this](const QTreeWidgetItem* item) { GoToChange(item); });
  connect(list_, &QTreeWidget::itemClicked, this, [this](const QTreeWidgetItem* item) { GoToChange(item); });
  connect(list_, &QTreeWidget::currentItemChanged, this, [this] { SyncButtons(); });
  connect(filter_, &QLineEdit::textChanged, this, [this] { Fill(); });
  connect(keep_, &QComboBox::activated, this, [this](int chosen) { Choose(static_cast<Keep>(chosen)); });
  setFocusProxy(list_);
  Apply();
  Fill();
}

// ---- Whether one is kept

JournalView::Keep JournalView::Chosen() const {
  const QSettings& settings = program_.Settings();
  if (settings.value(kKeepOfAll).toBool()) return Keep::OfAll;
  if (session_.Path().empty()) return wantsNew_ ? Keep::OfThis : Keep::No;
  return settings.value(kKeepOf).toStringList().contains(ToQt(RealPath(session_.Path()))) ? Keep::OfThis : Keep::No;
}

void JournalView::Choose(Keep keep) {
  QSettings& settings = program_.Settings();
  settings.setValue(kKeepOfAll, keep == Keep::OfAll);
  if (session_.Path().empty()) {
    wantsNew_ = keep == Keep::OfThis;
  } else {
    const QString path = ToQt(RealPath(session_.Path()));
    QStringList setups = settings.value(kKeepOf).toStringList();
    setups.removeAll(path);
    if (keep == Keep::OfThis) setups << path;
    settings.setValue(kKeepOf, setups);
  }
  Apply();
  SyncButtons();
}

void JournalView::Apply() {
  if (wantsNew_ && !session_.Path().empty()) {
    wantsNew_ = false;
    if (Chosen() == Keep::No) Choose(Keep::OfThis);
  }
  const Keep keep = Chosen();
  keep_->setCurrentIndex(static_cast<int>(keep));
  // Beside a setup that another editor has open stands the journal of that one.
  keep_->setEnabled(!session_.IsReadOnly());
  session_.KeepJournal(keep != Keep::No && !session_.IsReadOnly());
}

// ---- The list

void JournalView::Sync() {
  Apply();
  isStale_ = true;
  if (isVisible()) Read();
}

void JournalView::showEvent(QShowEvent* event) {
  QWidget::showEvent(event);
  if (isStale_) Read();
}

void JournalView::Read() {
  isStale_ = false;
  const std::string path = session_.Path().empty() ? std::string() : JournalBeside(session_.Path());
  const FileStamp stamp = path.empty() ? FileStamp() : StampOf(path);
  if (path == path_ && stamp == read_) return;
  path_ = path;
  read_ = stamp;
  journal_ = path.empty() ? Journal() : ReadJournal(path);
  Fill();
}

std::vector<JournalStep> JournalView::Matching() const {
  const std::string wanted = FromQt(filter_->text().trimmed());
  std::vector<JournalStep> steps;
  std::ranges::copy_if(journal_.steps, std::back_inserter(steps),
                       [&](const JournalStep& step) { return wanted.empty() || IsInJournalStep(step, wanted); });
  return steps;
}

void JournalView::Fill() {
  list_->clear();
  const std::string wanted = FromQt(filter_->text().trimmed());
  CYbSEKvfBase& root = session_.Document().Root();
  PlaceNames names(session_.Document());
  const auto placeOf = [&](const std::string& path, const std::string& key) {
    CYbSEKvfBase* node = FindNode(root, ParseSetupPath(path).steps);
    return node ? Translated(names.Of(*node, path, key)) : ToQt(key.empty() ? path : path + ":" + key);
  };
  const auto showChange = [&](QTreeWidgetItem& item, const JournalChange& change) {
    item.setText(kJournalPlace, placeOf(change.path, change.key));
    item.setToolTip(kJournalPlace, ToQt(change.key.empty() ? change.path : change.path + ":" + change.key));
    // Of a whole section its text stands in the tips alone.
    if (!change.key.empty()) item.setText(kJournalBefore, JournalText(change.from));
    item.setText(kJournalAfter, change.kind == SetupDifference::Kind::Changed
                                    ? JournalText(change.to)
                                    : Translated(std::string(NameOf(change.kind))));
    constexpr qsizetype kLongestTip = 1000;
    item.setToolTip(kJournalBefore, ToQt(change.from).left(kLongestTip));
    item.setToolTip(kJournalAfter, ToQt(change.to).left(kLongestTip));
    item.setData(0, kJournalPathRole, ToQt(change.path));
    item.setData(0, kJournalKeyRole, ToQt(change.key));
  };
  QList<QTreeWidgetItem*> items;
  std::size_t matching = 0;
  for (std::size_t place = journal_.steps.size(); place-- > 0;) {
    const JournalStep& step = journal_.steps[place];
    if (!wanted.empty() && !IsInJournalStep(step, wanted)) continue;
    if (++matching > kMostJournalRows) continue;
    auto* item = new QTreeWidgetItem({ToQt(step.time), ToQt(step.user), Translated(step.action)});
    item->setData(0, kJournalStepRole, static_cast<int>(place));
    item->setToolTip(kJournalStep, item->text(kJournalStep));
    if (step.changes.size() == 1) {
      showChange(*item, step.changes.front());
    } else if (!step.changes.empty()) {
      item->setText(kJournalPlace, placeOf(step.page, {}));
      item->setText(kJournalAfter, tr("%1 changes").arg(step.changes.size()));
      item->setData(0, kJournalPathRole, ToQt(step.page));
      for (const JournalChange& change : step.changes) {
        auto* below = new QTreeWidgetItem(item);
        below->setData(0, kJournalStepRole, static_cast<int>(place));
        showChange(*below, change);
      }
    }
    items << item;
  }
  list_->addTopLevelItems(items);
  QString told = !journal_.error.empty()       ? Translated(journal_.error)
                 : journal_.steps.empty()      ? tr("No step was written yet.")
                 : matching > kMostJournalRows ? tr("The latest %1 of %2 steps").arg(kMostJournalRows).arg(matching)
                 : wanted.empty()              ? tr("%1 steps").arg(matching)
                                               : tr("%1 of %2 steps").arg(matching).arg(journal_.steps.size());
  if (!journal_.problems.empty()) told += tr(", lines that are no steps: %1").arg(journal_.problems.size());
  told_->setText(told);
  QStringList problems;
  for (const std::string& problem : journal_.problems) problems << Translated(problem);
  told_->setToolTip(problems.mid(0, 10).join("\n"));
  SyncButtons();
}

void JournalView::Filter(const QString& text) { filter_->setText(text); }

const JournalStep* JournalView::ChosenStep() const {
  const QTreeWidgetItem* item = list_->currentItem();
  const std::size_t place =
      item ? static_cast<std::size_t>(item->data(0, kJournalStepRole).toInt()) : journal_.steps.size();
  return place < journal_.steps.size() ? &journal_.steps[place] : nullptr;
}

void JournalView::SyncButtons() {
  const JournalStep* step = ChosenStep();
  takeBack_->setEnabled(step && !step->changes.empty());
  export_->setEnabled(!journal_.steps.empty());
}

void JournalView::GoToChange(const QTreeWidgetItem* item) {
  if (!item || item->data(0, kJournalPathRole).toString().isEmpty()) return;
  CYbSEKvfBase* node =
      FindNode(session_.Document().Root(), ParseSetupPath(FromQt(item->data(0, kJournalPathRole).toString())).steps);
  if (node) emit StepChosen(node->Serial(), item->data(0, kJournalKeyRole).toString());
}

void JournalView::TakeBack() {
  commit_();
  const JournalStep* chosen = ChosenStep();
  if (!chosen) return;
  // The list is made anew by what changes.
  const JournalStep step = *chosen;
  if (const std::string problem = session_.TakeBack(step); !problem.empty())
    host_.ShowMessage(FromQt(tr("The step cannot be taken back on its own: %1.").arg(Translated(problem))),
                      Host::Icon::Warning);
}

void JournalView::ExportTo(const std::string& path) {
  if (const FileResult result = WriteFileAtomically(path, JournalCsv(Matching())); !result.Ok())
    host_.ShowMessage(result.error, Host::Icon::Error);
}

}  // namespace tervane
