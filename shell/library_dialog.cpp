// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/library_dialog.h"

#include <QDialogButtonBox>
#include <QDir>
#include <QHBoxLayout>
#include <QLabel>
#include <QLineEdit>
#include <QListWidget>
#include <QPushButton>
#include <QSignalBlocker>
#include <QSplitter>
#include <QVBoxLayout>

#include "pages/library_views.h"
#include "shell/charts/series_plot.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/row_delegate.h"
#include "shell/widgets/theme.h"

namespace tervane {

LibraryDialog::LibraryDialog(const Host::LibraryQuestion& question, Host& host, QWidget* parent)
    : QDialog(parent), question_(question), host_(host) {
  const Theme& theme = Theme::Get();
  const QString entries = Translated(std::string(question.kind.entryNames));
  setWindowTitle(tr("Choose a %1").arg(Translated(std::string(question.kind.entryName))));
  resize(theme.Scaled(820), theme.Scaled(520));
  auto* all = new QVBoxLayout(this);
  auto* row = new QHBoxLayout;
  file_ = new QLineEdit(QDir::toNativeSeparators(ToQt(question.file)));
  auto* label = new QLabel(tr("&File:"));
  label->setBuddy(file_);
  auto* browse = new QPushButton(tr("&Browse…"));
  browse->setAutoDefault(false);
  row->addWidget(label);
  row->addWidget(file_, 1);
  row->addWidget(browse);
  all->addLayout(row);

  list_ = new QListWidget;
  list_->setAccessibleName(entries);
  list_->setItemDelegate(new RowDelegate(list_));
  chart_ = new SeriesPlot(host);
  auto* split = new QSplitter;
  split->setChildrenCollapsible(false);
  split->addWidget(list_);
  split->addWidget(chart_);
  split->setStretchFactor(1, 1);
  split->setSizes({theme.Scaled(240), theme.Scaled(560)});
  all->addWidget(split, 1);

  problem_ = new QLabel;
  problem_->setWordWrap(true);
  problem_->setTextFormat(Qt::PlainText);
  problem_->setTextInteractionFlags(Qt::TextSelectableByMouse);
  all->addWidget(problem_);
  auto* buttons = new QDialogButtonBox(QDialogButtonBox::Ok | QDialogButtonBox::Cancel);
  ok_ = buttons->button(QDialogButtonBox::Ok);
  all->addWidget(buttons);
  connect(buttons, &QDialogButtonBox::accepted, this, &QDialog::accept);
  connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);
  connect(browse, &QPushButton::clicked, this, &LibraryDialog::Browse);
  connect(file_, &QLineEdit::editingFinished, this, [this] {
    if (FromQt(QDir::fromNativeSeparators(file_->text())) != question_.file) {
      question_.file = FromQt(QDir::fromNativeSeparators(file_->text()));
      Read(Chosen().entry);
    }
  });
  connect(list_, &QListWidget::currentRowChanged, this, &LibraryDialog::ShowEntry);
  connect(list_, &QListWidget::itemActivated, this, [this] {
    if (ok_->isEnabled()) accept();
  });
  Read(question.entry);
  if (list_->count() > 0) list_->setFocus();
}

Host::LibraryChoice LibraryDialog::Chosen() const {
  const QListWidgetItem* item = list_->currentItem();
  return {question_.file, item ? FromQt(item->text()) : std::string()};
}

void LibraryDialog::Browse() {
  const LibraryKind& kind = question_.kind;
  const auto path =
      host_.AskFileToOpen({"Open", std::string(kind.filter), std::string(kind.extension), question_.file});
  if (!path) return;
  const std::string entry = Chosen().entry;
  question_.file = *path;
  file_->setText(QDir::toNativeSeparators(ToQt(*path)));
  Read(entry);
}

void LibraryDialog::Read(const std::string& entry) {
  reading_ = question_.file.empty() ? nullptr : ReadLibraryOnce(question_.kind, question_.file);
  {
    const QSignalBlocker blocker(list_);
    list_->clear();
    if (reading_) {
      const Library& library = reading_->library;
      for (const LibraryEntry& each : library.entries) list_->addItem(ToQt(each.Name()));
      list_->setCurrentRow(static_cast<int>(library.Find(entry).value_or(0)));
    }
  }
  ShowEntry();
}

void LibraryDialog::ShowEntry() {
  const int row = list_->currentRow();
  const bool isEntry = reading_ && row >= 0 && row < static_cast<int>(reading_->library.entries.size());
  chart_->ShowWhenThere([this, row, isEntry] {
    if (isEntry) return ChartOf(reading_->library, reading_->library.entries[static_cast<std::size_t>(row)]);
    SeriesContent none;
    none.message = FromQt(tr("No %1 is chosen.").arg(Translated(std::string(question_.kind.entryName))));
    return none;
  });
  std::string problem = reading_ ? reading_->problem : std::string();
  if (isEntry) problem = WhyNoEntry(question_.file, reading_->library, Chosen().entry);
  problem_->setText(Translated(problem));
  problem_->setVisible(!problem.empty());
  ok_->setEnabled(isEntry && problem.empty() && !Chosen().entry.empty());
}

}  // namespace tervane
