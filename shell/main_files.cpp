// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Files that setups use in tabs of their own: shown, edited, saved and closed.
#include <QDesktopServices>
#include <QFile>
#include <QFileInfo>
#include <QMessageBox>
#include <QStatusBar>
#include <QTabWidget>
#include <QUrl>

#include "data/datafile_facts.h"
#include "document/edit_session.h"
#include "libraries/library_kinds.h"
#include "pages/result_view.h"
#include "platform/files.h"
#include "platform/paths.h"
#include "platform/text_fields.h"
#include "shell/document_frame.h"
#include "shell/editors/data_viewer.h"
#include "shell/editors/edit_tab.h"
#include "shell/editors/grid_editor.h"
#include "shell/editors/series_editor.h"
#include "shell/library_tab.h"
#include "shell/main_window.h"
#include "shell/program.h"
#include "shell/template_tab.h"
#include "shell/widgets/qt_text.h"

namespace tervane {

namespace {

constexpr int kWhyTold = 8000;  ///< Milliseconds for which the status line tells why a file is only shown.

/// Lines of numbers, which some readers of grids would take as well.
bool IsNamedAsText(const QString& path) {
  const QString suffix = QFileInfo(path).suffix().toLower();
  return suffix == "txt" || suffix == "xyz" || suffix == "csv";
}

/// By what stands at its begin.
bool IsText(const std::string& path) {
  QFile file(ToQt(path));
  constexpr qint64 kBegin = 4096;
  if (!file.open(QIODevice::ReadOnly)) return false;
  const QByteArray begin = file.read(kBegin);
  return WhyNoText({begin.constData(), static_cast<std::size_t>(begin.size())}).empty();
}

}  // namespace

int MainWindow::AskForChanges(const QString& name) {
  QMessageBox box(QMessageBox::Question, tr("Close"), tr("Save the changes to %1 before it is closed?").arg(name),
                  QMessageBox::Save | QMessageBox::Discard | QMessageBox::Cancel, this);
  box.setInformativeText(tr("Changes that are not saved are lost."));
  return box.exec();
}

template <class Tab>
Tab* MainWindow::TabOf(const std::string& path) const {
  for (int i = 0; i < tabs_->count(); ++i) {
    auto* tab = qobject_cast<Tab*>(tabs_->widget(i));
    if (tab && (tab->Path() == path || IsSameFile(tab->Path(), path))) return tab;
  }
  return nullptr;
}

bool MainWindow::ShowDataFile(const QString& path) {
  const std::string file = path.isEmpty() ? std::string() : FromQt(QFileInfo(path).absoluteFilePath());
  if (file.empty()) {
    host_.ShowMessage("No file is chosen.", Host::Icon::Warning);
    return false;
  }
  if (const LibraryKind* kind = LibraryKindOf(FromQt(path))) return OpenLibrary(*kind, path);
  if (IsNamedAsTemplate(file)) return ShowTemplate(path);
  if (auto* viewer = TabOf<DataViewer>(file)) {
    tabs_->setCurrentWidget(viewer);
    viewer->Reload(false);
    return true;
  }
  std::unique_ptr<DataViewer> viewer;
  if (!IsNamedAsText(path)) {
    viewer = std::make_unique<DataViewer>(file, host_, program_.Units());
    if (viewer->Problem().empty()) {
      const QString title = viewer->Title();
      tabs_->setCurrentIndex(tabs_->addTab(viewer.release(), title));
      SyncCommands();
      return true;
    }
  }
  if (FileExists(file) && IsText(file) && QDesktopServices::openUrl(QUrl::fromLocalFile(ToQt(file)))) return true;
  host_.ShowMessage(viewer             ? viewer->Problem()
                    : FileExists(file) ? FromQt(tr("The desktop has no editor for %1.").arg(ToQt(file)))
                                       : FromQt(tr("%1 is not there.").arg(ToQt(file))),
                    Host::Icon::Error);
  return false;
}

bool MainWindow::IsStoredByRun(const std::string& path) const {
  const std::string real = RealPath(path);
  // Beside a setup that nobody has open, its folder has this name.
  if (real.find("_results/") != std::string::npos) return true;
  for (int i = 0; i < tabs_->count(); ++i) {
    const auto* frame = qobject_cast<const DocumentFrame*>(tabs_->widget(i));
    if (!frame) continue;
    const std::string folder = frame->Session().Document().getResultFolder();
    if (!folder.empty() && real.starts_with(RealPath(ResolvedPath(folder, {})) + "/")) return true;
  }
  return false;
}

bool MainWindow::EditDataFile(const QString& path) {
  const std::string file = path.isEmpty() ? std::string() : FromQt(QFileInfo(path).absoluteFilePath());
  if (file.empty() || LibraryKindOf(FromQt(path)) || IsNamedAsTemplate(file) || IsNamedAsText(path) ||
      IsNamedAsViewedSetup(file))
    return ShowDataFile(path);
  if (auto* editor = TabOf<EditTab>(file)) {
    tabs_->setCurrentWidget(editor);
    editor->CheckDisk();
    return true;
  }
  if (IsStoredByRun(file)) {
    if (!ShowDataFile(path)) return false;
    statusBar()->showMessage(tr("What a run has stored is shown and not changed."), kWhyTold);
    return true;
  }
  const auto facts = DataFileFactsOf(file);
  const DataItem* first = facts->Item(1);
  std::unique_ptr<EditTab> editor;
  if (first && first->dimensions >= 2) editor = std::make_unique<GridEditor>(file, host_);
  if (first && first->dimensions == 0) editor = std::make_unique<SeriesEditor>(file, host_);
  if (!editor || !editor->File().Problem().empty()) {
    if (!ShowDataFile(path)) return false;
    if (editor) statusBar()->showMessage(Translated(editor->File().Problem()), kWhyTold);
    return true;
  }
  AddEditor(std::move(editor));
  return true;
}

EditTab* MainWindow::Editor() const { return qobject_cast<EditTab*>(tabs_->currentWidget()); }

bool MainWindow::OpenLibrary(const LibraryKind& kind, const QString& path) {
  const std::string file = FromQt(QFileInfo(path).absoluteFilePath());
  if (auto* library = TabOf<LibraryTab>(file)) {
    tabs_->setCurrentWidget(library);
    library->CheckDisk();
    return true;
  }
  auto library = std::make_unique<LibraryTab>(kind, file, host_);
  if (!library->Editor().Problem().empty()) {
    host_.ShowMessage(library->Editor().Problem(), Host::Icon::Error);
    return false;
  }
  AddEditor(std::move(library));
  return true;
}

void MainWindow::AddEditor(std::unique_ptr<EditTab> editor) {
  connect(editor.get(), &EditTab::StateChanged, this, &MainWindow::SyncCommands);
  connect(editor.get(), &EditTab::FileSaved, this, [this] {
    for (int i = 0; i < tabs_->count(); ++i)
      if (auto* frame = qobject_cast<DocumentFrame*>(tabs_->widget(i))) frame->FollowFiles();
  });
  const QString title = editor->Title();
  tabs_->setCurrentIndex(tabs_->addTab(editor.release(), title));
  SyncCommands();
}

bool MainWindow::ShowTemplate(const QString& path) {
  const std::string file = FromQt(QFileInfo(path).absoluteFilePath());
  if (auto* shown = TabOf<TemplateTab>(file)) {
    tabs_->setCurrentWidget(shown);
    shown->Reload();
    return true;
  }
  auto made = std::make_unique<TemplateTab>(file, host_);
  if (!made->Problem().empty()) {
    host_.ShowMessage(made->Problem(), Host::Icon::Error);
    return false;
  }
  const QString title = made->Title();
  tabs_->setCurrentIndex(tabs_->addTab(made.release(), title));
  SyncCommands();
  return true;
}

bool MainWindow::SaveEditor() {
  EditTab* editor = Editor();
  if (!editor) return false;
  editor->Commit();
  if (!editor->File().WhyReadOnly().empty()) return SaveEditorAs();
  if (FileExists(editor->Path()) && editor->File().IsOtherOnDisk()) {
    const auto answer = host_.Choose(tr("Another program has changed %1 since it was read.").arg(editor->Name()),
                                     tr("To reload is to lose your own changes, to save over it those of the other "
                                        "program; saved under another name, both stay."),
                                     {tr("&Reload"), tr("Save &As…"), tr("Save &Over It")});
    if (answer == 0) editor->Reload();
    if (answer == 1) return SaveEditorAs();
    if (answer != 2) return false;
  }
  return editor->Save(editor->Path());
}

bool MainWindow::SaveEditorAs() {
  EditTab* editor = Editor();
  if (!editor) return false;
  editor->Commit();
  const auto path = host_.AskFileToSave(editor->NameQuestion());
  return path && editor->Save(*path);
}

bool MainWindow::CloseEditor(EditTab* editor) {
  tabs_->setCurrentWidget(editor);
  editor->Commit();
  if (editor->File().IsModified()) {
    const int answer = AskForChanges(editor->Name());
    if (answer == QMessageBox::Save && !SaveEditor()) return false;
    if (answer != QMessageBox::Save && answer != QMessageBox::Discard) return false;
  }
  delete editor;
  SyncCommands();
  return true;
}

}  // namespace tervane
