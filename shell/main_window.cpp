// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/main_window.h"

#include <QApplication>
#include <QCloseEvent>
#include <QDateTime>
#include <QDesktopServices>
#include <QFile>
#include <QFileInfo>
#include <QLabel>
#include <QMenuBar>
#include <QMessageBox>
#include <QMimeData>
#include <QPointer>
#include <QPushButton>
#include <QStackedWidget>
#include <QStatusBar>
#include <QTabWidget>
#include <QTimer>
#include <QToolBar>

#include "data/datafile_facts.h"
#include "document/edit_session.h"
#include "execution/run_passport.h"
#include "libraries/library_kinds.h"
#include "pages/parts/plot_content.h"
#include "pages/run_comparison.h"
#include "platform/files.h"
#include "platform/paths.h"
#include "platform/text_fields.h"
#include "shell/changes_dialog.h"
#include "shell/compare_view.h"
#include "shell/document_frame.h"
#include "shell/editors/data_viewer.h"
#include "shell/editors/edit_tab.h"
#include "shell/editors/exchange_backdrop.h"
#include "shell/editors/grid_editor.h"
#include "shell/library_tab.h"
#include "shell/program.h"
#include "shell/run/document_run.h"
#include "shell/run_comparison_view.h"
#include "shell/template_tab.h"
#include "shell/welcome_page.h"
#include "shell/widgets/drawing_access.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr const char* kSetupFilter = "Tervane  Flow Model(*.tvd)|*.tvd|All Files (*.*)|*||";
constexpr const char *kGeometry = "Window/Geometry", *kState = "Window/State", *kFrameLayout = "Window/Panes";

constexpr int kToldFor = 8000;  ///< Milliseconds for which the status line tells something.

bool IsDataFile(const QString& path) {
  const QString suffix = QFileInfo(path).suffix().toLower();
  return suffix.startsWith("nds") || QStringList{"nc", "tif", "tiff", "asc", "rev"}.contains(suffix);
}

/// Setups, and the libraries that setups use.
std::string OpenFilter() {
  std::string filter = "Tervane  Flow Model(*.tvd)|*.tvd|";
  for (const LibraryKind* kind : LibraryKinds())
    filter += std::string(kind->filter.substr(0, kind->filter.find("All Files")));
  filter += "Kinetra template files (*.kinetra)|*.kinetra|";
  return filter + "All Files (*.*)|*||";
}

const LibraryKind* KindOf(const QString& path) { return LibraryKindOf(FromQt(path)); }

QStringList DroppedFiles(const QMimeData* data) {
  QStringList paths;
  for (const QUrl& url : data->urls()) {
    const QString path = url.toLocalFile();
    if (url.isLocalFile() && (path.endsWith(".tvd", Qt::CaseInsensitive) || IsDataFile(path) || KindOf(path) ||
                              IsNamedAsTemplate(FromQt(path))))
      paths << path;
  }
  return paths;
}

}  // namespace

MainWindow::MainWindow(Program& program) : program_(program), host_(this, program.Settings()) {
  host_.SetReceiver(this);
  setWindowIcon(Theme::Get().Icon("quarzel"));
  setAcceptDrops(true);
  tabs_ = new QTabWidget;
  tabs_->setDocumentMode(true);
  tabs_->setTabsClosable(true);
  tabs_->setMovable(true);
  stack_ = new QStackedWidget;
  stack_->addWidget(tabs_);
  setCentralWidget(stack_);
  zoom_ = new QLabel;
  statusBar()->addPermanentWidget(zoom_);
  BuildMenus();
  connect(tabs_, &QTabWidget::currentChanged, this, &MainWindow::SyncCommands);
  connect(tabs_, &QTabWidget::tabCloseRequested, this, [this](int index) { CloseTab(tabs_->widget(index)); });
  connect(&Theme::Get(), &Theme::Changed, this, &MainWindow::Restyle);
  resize(Theme::Get().Scaled(1180), Theme::Get().Scaled(780));
  restoreGeometry(program_.Settings().value(kGeometry).toByteArray());
  restoreState(program_.Settings().value(kState).toByteArray());
  Restyle();
}

MainWindow::~MainWindow() {
  // Documents speak to the window while they go.
  while (tabs_->count() > 0) delete tabs_->widget(0);
}

DocumentFrame* MainWindow::Frame() const { return qobject_cast<DocumentFrame*>(tabs_->currentWidget()); }

DataViewer* MainWindow::Viewer() const { return qobject_cast<DataViewer*>(tabs_->currentWidget()); }

DocumentFrame* MainWindow::AddFrame(std::unique_ptr<EditSession> session) {
  const bool isNew = session->Path().empty();
  const QString name = isNew ? tr("Untitled %1").arg(++newDocuments_) : QString();
  if (!isNew) program_.AddRecentFile(ToQt(session->Path()));
  auto* frame = new DocumentFrame(std::move(session), name, host_, program_);
  frame->RestoreLayout(program_.Settings().value(kFrameLayout).toByteArray());
  frame->RestoreBranches(program_.Branches(ToQt(frame->Session().Path())));
  frame->Run().SetSaver([this, frame] {
    tabs_->setCurrentWidget(frame);
    return SaveDocument();
  });
  connect(frame, &DocumentFrame::StateChanged, this, &MainWindow::SyncCommands);
  connect(frame, &DocumentFrame::SaveAsWanted, this, &MainWindow::SaveDocumentAs);
  connect(
      frame, &DocumentFrame::ReloadWanted, this, [this, frame] { ReloadDocument(frame); }, Qt::QueuedConnection);
  connect(frame, &DocumentFrame::ChangesWanted, this, [this, frame] { ShowChanges(*frame); });
  connect(frame, &DocumentFrame::Told, this, &MainWindow::Tell);
  tabs_->setCurrentIndex(tabs_->addTab(frame, frame->Title()));
  frame->FocusNextPane();
  SyncCommands();
  return frame;
}

bool MainWindow::Receive(const Message& message) {
  const auto* path = std::get_if<std::string>(&message.lParam);
  if (message.name != kMainWindowMessage || message.wParam != kOpenFile || !path) return false;
  const QString file = ToQt(*path);
  DocumentFrame* const sender = Frame();
  if (sender && IsNamedAsPassport(*path)) return CompareRunWith(*sender, *path);
  const bool isSetup = file.endsWith(".tvd", Qt::CaseInsensitive);
  // The setup answers once, and what it answers is kept as long as the file is edited.
  const auto answer = std::make_shared<CTvnFlowModelData>();
  if (sender)
    for (const int request : {kAskLayers, kAskDomain}) sender->Receive({kFrameMessage, request, answer.get()});
  if (!(isSetup ? OpenDocument(file) : EditDataFile(file))) return false;
  if (auto* editor = qobject_cast<GridEditor*>(tabs_->currentWidget()); editor && sender) {
    editor->PutOverMaps([setup = QPointer(sender)](MapContent& map) {
      if (setup) AddBackdrop(setup->Session().Document().Root(), map);
    });
    editor->KeepBackdrop(ExchangeBackdrop(*answer));
  }
  if (DataViewer* viewer = Viewer(); viewer && sender)
    viewer->PutOverMaps([setup = QPointer(sender)](MapContent& map) {
      if (setup) AddBackdrop(setup->Session().Document().Root(), map);
    });
  return true;
}

void MainWindow::Tell(const QString& text) {
  statusBar()->showMessage(text, kToldFor);
  Announce(*statusBar(), text);
}

void MainWindow::NewDocument() { AddFrame(EditSession::New(program_.RecoveryFolder())); }

bool MainWindow::OpenDocument(const QString& path) {
  const std::string file = FromQt(QFileInfo(path).absoluteFilePath());
  for (int i = 0; i < tabs_->count(); ++i) {
    const auto* frame = qobject_cast<DocumentFrame*>(tabs_->widget(i));
    if (!frame) continue;
    if (frame->Session().Path() == file || IsSameFile(frame->Session().Path(), file)) {
      tabs_->setCurrentIndex(i);
      return true;
    }
  }
  std::string error;
  auto session = EditSession::Open(file, program_.RecoveryFolder(), error);
  if (!session) {
    host_.ShowMessage(error, Host::Icon::Error);
    return false;
  }
  const bool mayRecover = !session->IsReadOnly();
  DocumentFrame* frame = AddFrame(std::move(session));
  const auto recovery = mayRecover ? FindRecovery(file, program_.RecoveryFolder()) : std::nullopt;
  if (recovery) {
    const QString time = QLocale().toString(QDateTime::fromSecsSinceEpoch(
        std::chrono::duration_cast<std::chrono::seconds>(recovery->time.time_since_epoch()).count()));
    frame->ShowBanner(tr("Changes to this setup that were never saved are left from %1.").arg(time),
                      {{tr("Re&cover"),
                        [this, frame, recovery = *recovery] {
                          QTimer::singleShot(0, this, [this, frame, recovery] {
                            if (!CloseDocument(frame)) return;
                            std::string why;
                            if (auto recovered = EditSession::Recover(recovery, program_.RecoveryFolder(), why))
                              AddFrame(std::move(recovered))->Log(tr("Recovered from %1").arg(ToQt(recovery.autosave)));
                            else
                              host_.ShowMessage(why, Host::Icon::Error);
                          });
                        }},
                       {tr("Throw &Away"), [this, recovery = *recovery] {
                          std::string why;
                          if (!DiscardRecovery(recovery, why)) host_.ShowMessage(why, Host::Icon::Error);
                        }}});
  }
  return true;
}

void MainWindow::OfferRecoveries() {
  std::vector<Recovery> found = FindRecoveries(program_.RecoveryFolder());
  // Of a setup that is open, here or elsewhere, its own banner asks.
  std::erase_if(found, [](const Recovery& recovery) { return !recovery.setup.empty() && HolderOf(recovery.setup); });
  if (found.empty()) return;
  QStringList names;
  for (const Recovery& recovery : found)
    names << (recovery.setup.empty() ? tr("a setup that was never saved") : ToQt(recovery.setup));
  const std::string question = FromQt(
      tr("The editor ended before these were saved:\n\n%1\n\nOpen what is left of them? They stay where they are "
         "if you do not.")
          .arg(names.join("\n")));
  if (host_.Ask(question, Host::Icon::Question, Host::Buttons::YesNo) != Host::Answer::Yes) return;
  for (const Recovery& recovery : found) {
    std::string error;
    if (auto session = EditSession::Recover(recovery, program_.RecoveryFolder(), error))
      AddFrame(std::move(session));
    else
      host_.ShowMessage(error, Host::Icon::Error);
  }
}

bool MainWindow::SaveDocument() {
  DocumentFrame* frame = Frame();
  if (!frame) return false;
  frame->Commit();
  EditSession& session = frame->Session();
  if (session.Path().empty() || session.IsReadOnly()) return SaveDocumentAs();
  if (session.CheckDisk() == EditSession::OnDisk::Changed) return SaveBesideChange(*frame);
  return frame->Save(session.Path());
}

bool MainWindow::SaveBesideChange(DocumentFrame& frame) {
  const auto answer = host_.Choose(tr("Another program has changed %1 since it was read.").arg(frame.Name()),
                                   tr("The differences tell what your save would take back. To reload is to lose your "
                                      "own changes; saved under another name, both stay."),
                                   {tr("&Differences…"), tr("&Reload"), tr("Save &As…")});
  if (!answer) return false;
  switch (*answer) {
    case 0:
      return ShowChanges(frame);
    case 1:
      // Later: who wants the save still works with the document.
      emit frame.ReloadWanted();
      return false;
    default:
      return SaveDocumentAs();
  }
}

bool MainWindow::SaveDocumentAs() {
  DocumentFrame* frame = Frame();
  if (!frame) return false;
  frame->Commit();
  const std::string current =
      frame->Session().Path().empty() ? FromQt(frame->Name() + ".tvd") : frame->Session().Path();
  const auto path = host_.AskFileToSave({"Save As", kSetupFilter, "tvd", current});
  return path && frame->Save(*path);
}

bool MainWindow::OpenFile(const QString& path) {
  if (Frame() && IsNamedAsPassport(FromQt(path)))
    return CompareRunWith(*Frame(), FromQt(QFileInfo(path).absoluteFilePath()));
  return IsDataFile(path) || KindOf(path) || IsNamedAsTemplate(FromQt(path)) ? ShowDataFile(path) : OpenDocument(path);
}

void MainWindow::ReloadDocument(DocumentFrame* frame) {
  const QString path = ToQt(frame->Session().Path());
  const std::string place = frame->CurrentPath();
  if (!MayDropText(*frame)) return frame->CheckDisk();
  if (frame->Session().IsModified() && frame->Session().HasChangesToSave() &&
      host_.Ask(FromQt(tr("Throw your own changes to %1 away and read the file again?").arg(frame->Name())),
                Host::Icon::Warning, Host::Buttons::YesNo) != Host::Answer::Yes) {
    frame->CheckDisk();
    return;
  }
  // What cannot be read takes nothing away.
  CFlowModelDoc probe;
  if (!probe.OnOpenDocument(frame->Session().Path())) {
    host_.ShowMessage(probe.Error(), Host::Icon::Error);
    return;
  }
  delete frame;
  if (OpenDocument(path) && Frame()) Frame()->GoToPath(place);
  SyncCommands();
}

bool MainWindow::ShowChanges(DocumentFrame& frame) {
  frame.Commit();
  EditSession& session = frame.Session();
  const bool isOther = session.CheckDisk() == EditSession::OnDisk::Changed;
  const FileStamp seen = StampOf(session.Path());
  std::string error;
  const std::vector<SetupDifference> differences = session.WhatWillBeSaved(error);
  if (!error.empty()) {
    host_.ShowMessage(error, Host::Icon::Error);
    return false;
  }
  using Save = ChangesDialog::Save;
  ChangesDialog dialog(differences, session.IsReadOnly() ? Save::No : isOther ? Save::OverAnother : Save::Yes, this);
  if (dialog.exec() != QDialog::Accepted) return false;
  // What came after the look is asked for anew.
  if (isOther && StampOf(session.Path()) == seen) session.AcceptDisk();
  return SaveDocument();
}

void MainWindow::Compare(DocumentFrame& frame) {
  if (const auto path = host_.AskFileToOpen({"Compare With", kSetupFilter, "tvd", frame.Session().Path()}))
    CompareWith(frame, *path);
}

bool MainWindow::CompareWith(DocumentFrame& frame, const std::string& path) {
  auto other = std::make_unique<CFlowModelDoc>();
  if (!other->OnOpenDocument(path)) {
    host_.ShowMessage(other->Error(), Host::Icon::Error);
    return false;
  }
  auto* view = new CompareView(frame.Session(), frame.Name(), std::move(other));
  connect(view, &CompareView::PlaceChosen, &frame, [this, &frame](const QString& place) {
    tabs_->setCurrentWidget(&frame);
    frame.GoToPath(FromQt(place));
  });
  // It shows the session of the frame.
  connect(&frame, &QObject::destroyed, view, [view] { delete view; });
  tabs_->setCurrentIndex(tabs_->addTab(view, view->Title()));
  SyncCommands();
  return true;
}

bool MainWindow::CompareRunWith(DocumentFrame& frame, const std::string& passport) {
  const CFlowModelDoc& document = frame.Session().Document();
  const ComparedRun own =
      ComparedRunOf(PassportFilesOf(ResolvedPath(document.getResultFolder(), {}), document.PathName()).passport);
  RunComparison runs;
  if (const FileResult read = ReadRuns(own, ComparedRunOf(passport), runs); !read.Ok()) {
    host_.ShowMessage(read.error, Host::Icon::Error);
    return false;
  }
  const auto compared = std::make_shared<Computed<RunComparison>>(
      "Comparing two runs", [runs, units = program_.Units()](RunComparison& comparison, ProgressPart progress) {
        comparison = runs;
        return CompareFigures(units, comparison, progress);
      });
  if (!host_.Compute(compared)) return false;
  if (!compared->Result()) {
    host_.ShowMessage(compared->Problem(), Host::Icon::Error);
    return false;
  }
  auto* view = new RunComparisonView(*compared->Result());
  tabs_->setCurrentIndex(tabs_->addTab(view, view->Title()));
  SyncCommands();
  return true;
}

bool MainWindow::CloseTab(QWidget* tab) {
  if (auto* frame = qobject_cast<DocumentFrame*>(tab)) return CloseDocument(frame);
  if (auto* editor = qobject_cast<EditTab*>(tab)) return CloseEditor(editor);
  delete tab;
  SyncCommands();
  return true;
}

bool MainWindow::MayDropText(DocumentFrame& frame) {
  if (!frame.HasUntakenText()) return true;
  frame.ShowText(true);
  return host_.Ask(FromQt(tr("The text of %1 holds lines that the setup has not taken; they are told below the text. "
                             "Give them up?")
                              .arg(frame.Name())),
                   Host::Icon::Warning, Host::Buttons::YesNo) == Host::Answer::Yes;
}

bool MainWindow::CloseDocument(DocumentFrame* frame) {
  if (!frame) return true;
  tabs_->setCurrentWidget(frame);
  frame->Commit();
  if (!MayDropText(*frame)) return false;
  if (frame->Session().HasChangesToSave()) {
    const int answer = AskForChanges(frame->Name());
    if (answer == QMessageBox::Save && !SaveDocument()) return false;
    if (answer != QMessageBox::Save && answer != QMessageBox::Discard) return false;
  }
  if (frame->Run().IsExecuting() &&
      host_.Ask(FromQt(tr("An engine runs %1. Close the setup and let the engine run on? How it ended is told when the "
                          "setup is opened again.")
                           .arg(frame->Name())),
                Host::Icon::Question, Host::Buttons::YesNo) != Host::Answer::Yes)
    return false;
  program_.Settings().setValue(kFrameLayout, frame->SaveLayout());
  if (const std::string& path = frame->Session().Path(); !path.empty())
    program_.KeepBranches(ToQt(path), frame->Branches());
  delete frame;
  SyncCommands();
  return true;
}

void MainWindow::closeEvent(QCloseEvent* event) {
  while (tabs_->count() > 0) {
    if (!CloseTab(tabs_->widget(0))) {
      event->ignore();
      return;
    }
  }
  program_.Settings().setValue(kGeometry, saveGeometry());
  program_.Settings().setValue(kState, saveState());
  event->accept();
}

void MainWindow::changeEvent(QEvent* event) {
  QMainWindow::changeEvent(event);
  if (event->type() != QEvent::ActivationChange || !isActiveWindow()) return;
  if (Frame()) Frame()->CheckDisk();
  if (Frame()) Frame()->CheckTemplates();
  if (Viewer()) Viewer()->Reload(false);
  if (Editor()) Editor()->CheckDisk();
  if (auto* shown = qobject_cast<TemplateTab*>(tabs_->currentWidget())) shown->Reload();
}

void MainWindow::dragEnterEvent(QDragEnterEvent* event) {
  if (!DroppedFiles(event->mimeData()).isEmpty()) event->acceptProposedAction();
}

void MainWindow::dropEvent(QDropEvent* event) {
  event->acceptProposedAction();
  for (const QString& path : DroppedFiles(event->mimeData())) OpenFile(path);
}

void MainWindow::SetZoom(double zoom) {
  Theme::Get().SetZoom(zoom);
  program_.Settings().setValue("Zoom", Theme::Get().Zoom());
}

void MainWindow::Restyle() {
  RestyleCommands();
  const int size = Theme::Get().Scaled(18);
  for (QToolBar* bar : {standardBar_, modelBar_}) bar->setIconSize(QSize(size, size));
  // A menu bar keeps the font with which it was made.
  menuBar()->setFont(QApplication::font());
  zoom_->setText(QString("%1 %").arg(qRound(Theme::Get().Zoom() * 100)));
  if (welcome_) stack_->removeWidget(welcome_);
  delete welcome_;
  welcome_ = new WelcomePage;
  stack_->addWidget(welcome_);
  connect(welcome_, &WelcomePage::NewWanted, this, &MainWindow::NewDocument);
  connect(welcome_, &WelcomePage::FileWanted, this, &MainWindow::OpenDocument);
  connect(welcome_, &WelcomePage::OpenWanted, this, [this] {
    if (const auto path = host_.AskFileToOpen({"Open", OpenFilter(), "tvd", {}})) OpenFile(ToQt(*path));
  });
  for (int i = 0; i < tabs_->count(); ++i)
    if (auto* frame = qobject_cast<DocumentFrame*>(tabs_->widget(i)))
      frame->Redraw();
    else if (auto* editor = qobject_cast<EditTab*>(tabs_->widget(i)))
      editor->Redraw();
    else if (auto* shown = qobject_cast<TemplateTab*>(tabs_->widget(i)))
      shown->Redraw();
  SyncCommands();
}

}  // namespace tervane
