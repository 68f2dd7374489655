// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/library_tab.h"

#include <QHBoxLayout>
#include <QListWidget>
#include <QPixmap>
#include <QShortcut>
#include <QSignalBlocker>
#include <QSplitter>
#include <QTimer>
#include <QToolButton>
#include <QVBoxLayout>

#include "shell/page/page_view.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/row_delegate.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr int kListWidth = 230;

}  // namespace

LibraryTab::LibraryTab(const LibraryKind& kind, const std::string& path, Host& host)
    : EditTab(host), editor_(kind, path) {
  pagePlace_ = new QWidget;
  auto* place = new QVBoxLayout(pagePlace_);
  place->setContentsMargins(0, 0, 0, 0);
  auto* body = new QSplitter;
  body->setChildrenCollapsible(false);
  body->addWidget(BuildList());
  body->addWidget(pagePlace_);
  body->setStretchFactor(1, 1);
  body->setSizes({Theme::Get().Scaled(kListWidth), Theme::Get().Scaled(4 * kListWidth)});
  SetBody(body);
  BuildPage();
  Sync();
}

LibraryTab::~LibraryTab() {
  // The page reads the editor.
  delete page_;
}

Host::FileQuestion LibraryTab::NameQuestion() const {
  const LibraryKind& kind = editor_.Kind();
  return {"Save As", std::string(kind.filter), std::string(kind.extension), Path()};
}

QWidget* LibraryTab::BuildList() {
  const Theme& theme = Theme::Get();
  auto* left = new QWidget;
  auto* column = new QVBoxLayout(left);
  const int margin = theme.Scaled(8);
  column->setContentsMargins(margin, margin, 0, 0);
  auto* bar = new QHBoxLayout;
  bar->setSpacing(theme.Scaled(4));
  const auto button = [&](const QString& text, const QString& toolTip, void (LibraryEditor::*operation)()) {
    auto* made = new QToolButton;
    made->setText(text);
    made->setToolTip(toolTip);
    made->setToolButtonStyle(Qt::ToolButtonTextBesideIcon);
    made->setFocusPolicy(Qt::TabFocus);
    bar->addWidget(made);
    connect(made, &QToolButton::clicked, this, [this, operation] { Act(operation); });
    return made;
  };
  const QString entry = Translated(std::string(editor_.Kind().entryName));
  add_ = button(tr("Add"), tr("Add a %1 behind the chosen one").arg(entry), &LibraryEditor::Add);
  copy_ = button(tr("Copy"), tr("Add a copy of the chosen %1").arg(entry), &LibraryEditor::Duplicate);
  delete_ = button(tr("Delete"), tr("Delete the chosen %1").arg(entry), &LibraryEditor::Delete);
  bar->addStretch();
  column->addLayout(bar);

  list_ = new QListWidget;
  list_->setAccessibleName(tr("Entries"));
  list_->setFrameShape(QFrame::NoFrame);
  list_->setItemDelegate(new RowDelegate(list_));
  column->addWidget(list_, 1);
  connect(list_, &QListWidget::currentRowChanged, this, [this](int row) {
    if (row < 0) return;
    Commit();
    editor_.Choose(static_cast<std::size_t>(row));
    Sync();
  });
  // To rename is to type into the field of the name.
  connect(list_, &QListWidget::itemActivated, this, [this] { page_->FocusOn({}); });
  auto* rename = new QShortcut(QKeySequence(Qt::Key_F2), list_, nullptr, nullptr, Qt::WidgetShortcut);
  connect(rename, &QShortcut::activated, this, [this] { page_->FocusOn({}); });
  auto* remove = new QShortcut(QKeySequence::Delete, list_, nullptr, nullptr, Qt::WidgetShortcut);
  connect(remove, &QShortcut::activated, this, [this] { Act(&LibraryEditor::Delete); });
  return left;
}

void LibraryTab::BuildPage() {
  delete page_;
  const auto sync = [this] { QTimer::singleShot(0, this, &LibraryTab::Sync); };
  page_ = new PageView(editor_.MakePage(
                           Outside(), [this] { Sync(); }, sync),
                       Name());
  pagePlace_->layout()->addWidget(page_);
  const Theme& theme = Theme::Get();
  list_->setIconSize(QSize(theme.Scaled(14), theme.Scaled(14)));
  add_->setIcon(theme.Icon("insert"));
  copy_->setIcon(theme.Icon("new"));
  delete_->setIcon(theme.Icon("delete"));
}

void LibraryTab::Sync() {
  const Library& library = editor_.Content();
  {
    const QSignalBlocker blocker(list_);
    // Rows stay where they are, so that the list does not jump.
    while (list_->count() > static_cast<int>(library.entries.size())) delete list_->takeItem(list_->count() - 1);
    while (list_->count() < static_cast<int>(library.entries.size())) list_->addItem(QString());
    // Beside marked entries the names of the others stand in line with theirs.
    QIcon noIcon;
    if (editor_.HasFindings()) {
      QPixmap empty(list_->iconSize());
      empty.fill(Qt::transparent);
      noIcon = QIcon(empty);
    }
    for (int row = 0; row < list_->count(); ++row) {
      const auto place = static_cast<std::size_t>(row);
      QListWidgetItem* item = list_->item(row);
      const QString name = ToQt(library.entries[place].Name());
      item->setText(name.isEmpty() ? tr("(no name)") : name);
      item->setIcon(editor_.HasFindings(place) ? Theme::Get().Icon("error") : noIcon);
    }
    list_->setCurrentRow(library.entries.empty() ? -1 : static_cast<int>(editor_.Current()));
  }
  copy_->setEnabled(!library.entries.empty());
  delete_->setEnabled(!library.entries.empty());
  if (page_) page_->Sync();
  emit StateChanged();
}

void LibraryTab::Act(void (LibraryEditor::*operation)()) {
  Commit();
  const std::size_t before = editor_.Content().entries.size();
  (editor_.*operation)();
  Sync();
  // A new entry is named first.
  if (editor_.Content().entries.size() > before) page_->FocusOn({});
}

void LibraryTab::Commit() {
  if (page_) page_->Commit();
}

void LibraryTab::Redraw() {
  BuildPage();
  Sync();
}

}  // namespace tervane
