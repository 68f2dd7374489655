// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The commands of the window: where they stand, when they can be given, and what they do.
#include <QActionGroup>
#include <QApplication>
#include <QClipboard>
#include <QFileDialog>
#include <QFileInfo>
#include <QLabel>
#include <QMenuBar>
#include <QMessageBox>
#include <QStackedWidget>
#include <QStatusBar>
#include <QTabWidget>
#include <QToolBar>
#include <QToolButton>

#include "document/coverage_board.h"
#include "document/edit_session.h"
#include "document/module.h"
#include "document/overview.h"
#include "document/view_settings.h"
#include "execution/engine_search.h"
#include "execution/execute_flags.h"
#include "languages/languages.h"
#include "pages/document/modflow6_command.h"
#include "shell/compare_view.h"
#include "shell/document_frame.h"
#include "shell/editors/data_viewer.h"
#include "shell/editors/edit_tab.h"
#include "shell/ground_window.h"
#include "shell/main_window.h"
#include "shell/merge_view.h"
#include "shell/page/table_view.h"
#include "shell/program.h"
#include "shell/run/document_run.h"
#include "shell/run_comparison_view.h"
#include "shell/template_tab.h"
#include "shell/welcome_page.h"
#include "shell/widgets/keys_dialog.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/shown_language.h"
#include "shell/widgets/theme.h"
#include "simspec/model_components.h"

namespace tervane {

namespace {

CExecuteEngineFlagsKvf& FlagsOf(const DocumentFrame& frame) {
  return *frame.Session().Document().Root().Important(kExecuteFlags);
}

CViewSettingsKvf& ViewSettingsOf(const DocumentFrame& frame) {
  return *frame.Session().Document().Root().Important(kViewSettings);
}

/// Shows the page of a node that stands in no tree.
template <class Node>
void GoToImportant(DocumentFrame& frame, ImportantName<Node> name) {
  if (const Node* node = frame.Session().Document().Root().Important(name)) frame.GoTo(node->Serial());
}

std::pair<QString, QString> TitleAndPath(const QWidget* tab) {
  if (const auto* frame = qobject_cast<const DocumentFrame*>(tab))
    return {frame->Title(), ToQt(frame->Session().Path())};
  if (const auto* editor = qobject_cast<const EditTab*>(tab)) return {editor->Title(), ToQt(editor->Path())};
  if (const auto* viewer = qobject_cast<const DataViewer*>(tab)) return {viewer->Title(), ToQt(viewer->Path())};
  if (const auto* shown = qobject_cast<const TemplateTab*>(tab)) return {shown->Title(), ToQt(shown->Path())};
  if (const auto* comparison = qobject_cast<const CompareView*>(tab)) return {comparison->Title(), comparison->Path()};
  if (const auto* runs = qobject_cast<const RunComparisonView*>(tab)) return {runs->Title(), {}};
  if (const auto* merge = qobject_cast<const MergeView*>(tab)) return {merge->Title(), {}};
  return {};
}

bool HasWaterQuality(const DocumentFrame& frame) {
  const auto* components = frame.Session().Document().Root().Important(kModelComponents);
  return components && components->WQ != 0;
}

}  // namespace

MainWindow::Command& MainWindow::Add(QMenu* menu, const QString& text, const char* icon, const QKeySequence& keys,
                                     std::function<void()> run) {
  auto* action = new QAction(text, this);
  action->setShortcut(keys);
  if (menu) menu->addAction(action);
  connect(action, &QAction::triggered, this, std::move(run));
  return *commands_.emplace_back(std::make_unique<Command>(Command{action, QString(text).remove('&'), icon, {}, {}}));
}

MainWindow::Command& MainWindow::AddForDocument(QMenu* menu, const QString& text, const char* icon,
                                                const QKeySequence& keys, std::function<void(DocumentFrame&)> run) {
  Command& command = Add(menu, text, icon, keys, [this, run = std::move(run)] {
    if (DocumentFrame* frame = Frame()) {
      frame->Commit();
      run(*frame);
    }
  });
  command.enabled = [this] { return Frame() != nullptr; };
  return command;
}

MainWindow::Command& MainWindow::AddForEditor(QMenu* menu, const QString& text, const char* icon,
                                              const QKeySequence& keys, std::function<void(DocumentFrame&)> ofDocument,
                                              std::function<void(EditTab&)> ofEditor) {
  Command& command =
      Add(menu, text, icon, keys, [this, ofDocument = std::move(ofDocument), ofEditor = std::move(ofEditor)] {
        if (DocumentFrame* frame = Frame()) {
          frame->Commit();
          ofDocument(*frame);
        } else if (EditTab* editor = Editor()) {
          editor->Commit();
          ofEditor(*editor);
        }
      });
  command.enabled = [this] { return Frame() || Editor(); };
  return command;
}

void MainWindow::BuildMenus() {
  standardBar_ = addToolBar(tr("Standard"));
  standardBar_->setObjectName("Standard");
  std::string barName;
  YbGetToolbarString(&barName, 0);
  modelBar_ = addToolBar(Translated(barName));
  modelBar_->setObjectName("Model");

  QMenu* file = menuBar()->addMenu(tr("&File"));
  Command& create = Add(file, tr("&New"), "new", QKeySequence::New, [this] { NewDocument(); });
  Command& open = Add(file, tr("&Open…"), "open", QKeySequence::Open, [this] { emit welcome_->OpenWanted(); });
  recentMenu_ = file->addMenu(tr("Open &Recent"));
  connect(recentMenu_, &QMenu::aboutToShow, this, &MainWindow::FillRecentMenu);
  file->addSeparator();
  Command& save = AddForEditor(
      file, tr("&Save"), "save", QKeySequence::Save, [this](DocumentFrame&) { SaveDocument(); },
      [this](EditTab&) { SaveEditor(); });
  AddForEditor(
      file, tr("Save &As…"), nullptr, QKeySequence(Qt::CTRL | Qt::SHIFT | Qt::Key_S),
      [this](DocumentFrame&) { SaveDocumentAs(); }, [this](EditTab&) { SaveEditorAs(); });
  AddForDocument(file, tr("&What will be saved…"), nullptr, QKeySequence(Qt::CTRL | Qt::ALT | Qt::Key_S),
                 [this](DocumentFrame& frame) { ShowChanges(frame); });
  AddForDocument(file, tr("Com&pare With…"), nullptr, {}, [this](DocumentFrame& frame) { Compare(frame); });
  AddForDocument(file, tr("Mer&ge With…"), nullptr, {}, [this](DocumentFrame& frame) { Merge(frame); });
  AddForDocument(file, tr("&Export as MODFLOW 6…"), nullptr, {},
                 [this](DocumentFrame& frame) { ExportToModflow6(frame.Session().Document(), host_); });
  file->addSeparator();
  Command& closeTab = Add(file, tr("&Close"), nullptr, QKeySequence(Qt::CTRL | Qt::Key_W),
                          [this] { CloseTab(tabs_->currentWidget()); });
  closeTab.enabled = [this] { return tabs_->count() > 0; };
  Add(file, tr("&Quit"), nullptr, QKeySequence(Qt::CTRL | Qt::Key_Q), [this] { close(); });
  standardBar_->addActions({create.action, open.action, save.action});
  standardBar_->addSeparator();

  BuildEditMenu();
  BuildViewMenu();
  BuildRunMenu();
  QMenu* tools = menuBar()->addMenu(tr("&Tools"));
  AddForDocument(tools, tr("Data &Coverage"), nullptr, QKeySequence(Qt::CTRL | Qt::SHIFT | Qt::Key_D),
                 [](DocumentFrame& frame) { GoToImportant(frame, kCoverage); });
  AddForDocument(tools, tr("What Is &Missing?"), nullptr, QKeySequence(Qt::CTRL | Qt::SHIFT | Qt::Key_M),
                 [](DocumentFrame& frame) { frame.ShowWhatIsMissing(); });
  AddForDocument(tools, tr("3D &View"), nullptr, QKeySequence(Qt::CTRL | Qt::SHIFT | Qt::Key_G),
                 [this](DocumentFrame& frame) { ShowGround(frame); });
  windowMenu_ = menuBar()->addMenu(tr("&Window"));
  connect(windowMenu_, &QMenu::aboutToShow, this, &MainWindow::FillWindowMenu);
  // Filled when it is opened; the keys work without that.
  Add(nullptr, tr("&Next Document"), nullptr, QKeySequence(Qt::CTRL | Qt::Key_Tab),
      [this] { tabs_->setCurrentIndex((tabs_->currentIndex() + 1) % std::max(1, tabs_->count())); });
  addAction(commands_.back()->action);
  Add(nullptr, tr("Next &Pane"), nullptr, QKeySequence(Qt::Key_F6), [this] {
    if (Frame()) Frame()->FocusNextPane();
  });
  addAction(commands_.back()->action);
  BuildHelpMenu();
}

ReliefWindow* MainWindow::ShowGround(DocumentFrame& frame) { return OpenGroundWindow(frame, host_, program_.Units()); }

void MainWindow::BuildEditMenu() {
  QMenu* edit = menuBar()->addMenu(tr("&Edit"));
  Command& undo = AddForEditor(
      edit, tr("&Undo"), "undo", QKeySequence::Undo, [](DocumentFrame& frame) { frame.Undo(); },
      [](EditTab& editor) { editor.Undo(); });
  undo.enabled = [this] { return Frame() ? Frame()->CanUndo() : Editor() && Editor()->File().CanUndo(); };
  Command& redo = AddForEditor(
      edit, tr("&Redo"), "redo", QKeySequence::Redo, [](DocumentFrame& frame) { frame.Redo(); },
      [](EditTab& editor) { editor.Redo(); });
  redo.enabled = [this] { return Frame() ? Frame()->CanRedo() : Editor() && Editor()->File().CanRedo(); };
  redo.action->setShortcuts({QKeySequence(Qt::CTRL | Qt::SHIFT | Qt::Key_Z), QKeySequence(Qt::CTRL | Qt::Key_Y)});
  undo.action->setObjectName("Undo");
  redo.action->setObjectName("Redo");
  edit->addSeparator();
  Command& values = Add(edit, tr("&Edit Values"), nullptr, QKeySequence(Qt::CTRL | Qt::Key_E), [this] {
    if (Viewer()) EditDataFile(ToQt(Viewer()->Path()));
  });
  values.enabled = [this] { return Viewer() != nullptr; };
  values.action->setToolTip(tr("Changes the data file that is shown"));
  edit->addSeparator();
  // The widgets have these keys themselves; the menu shows them, so that they are found.
  const auto forward = [&](const QString& text, const char* operation) {
    connect(edit->addAction(text), &QAction::triggered, this, [this, operation] { CopyToKeyboardWidget(operation); });
  };
  forward(tr("Cu&t\tCtrl+X"), "cut");
  forward(tr("&Copy\tCtrl+C"), "copy");
  forward(tr("&Paste\tCtrl+V"), "paste");
  forward(tr("Fill &Down\tCtrl+D"), "fillDown");
  edit->addSeparator();
  AddForDocument(edit, tr("&Find…"), "find", QKeySequence::Find, [](DocumentFrame& frame) { frame.StartFind(); });
  AddForDocument(edit, tr("Add &Note…"), "review", QKeySequence(Qt::CTRL | Qt::ALT | Qt::Key_N),
                 [](DocumentFrame& frame) { frame.AddNoteHere(); });
  AddForDocument(edit, tr("Copy Pat&h"), nullptr, QKeySequence(Qt::CTRL | Qt::SHIFT | Qt::Key_C),
                 [](DocumentFrame& frame) { QApplication::clipboard()->setText(ToQt(frame.CurrentPath())); });
  standardBar_->addActions({undo.action, redo.action});
  standardBar_->addSeparator();
}

void MainWindow::CopyToKeyboardWidget(const char* operation) {
  QWidget* focus = QApplication::focusWidget();
  for (QWidget* widget = focus; widget; widget = widget->parentWidget()) {
    if (auto* table = qobject_cast<TableView*>(widget); table && table->FocusTarget() == focus) {
      const QString wanted(operation);
      if (wanted == "cut") table->Cut();
      if (wanted == "copy") table->Copy();
      if (wanted == "paste") table->Paste();
      if (wanted == "fillDown") table->FillDown();
      return;
    }
  }
  // Every text field of the toolkit has slots of these names.
  if (focus && focus->metaObject()->indexOfMethod(QByteArray(operation) + "()") >= 0)
    QMetaObject::invokeMethod(focus, operation);
}

void MainWindow::BuildViewMenu() {
  QMenu* view = menuBar()->addMenu(tr("&View"));
  Command& back = AddForDocument(view, tr("&Back"), "back", QKeySequence(Qt::ALT | Qt::Key_Left),
                                 [](DocumentFrame& frame) { frame.Go(-1); });
  back.enabled = [this] { return Frame() && Frame()->CanGo(-1); };
  Command& forward = AddForDocument(view, tr("&Forward"), "forward", QKeySequence(Qt::ALT | Qt::Key_Right),
                                    [](DocumentFrame& frame) { frame.Go(1); });
  forward.enabled = [this] { return Frame() && Frame()->CanGo(1); };
  AddForDocument(view, tr("&Overview"), nullptr, QKeySequence(Qt::CTRL | Qt::Key_I),
                 [](DocumentFrame& frame) { GoToImportant(frame, kOverview); });
  Command& setupText = AddForDocument(view, tr("&Text of the Setup"), nullptr, QKeySequence(Qt::CTRL | Qt::Key_T),
                                      [](DocumentFrame& frame) { frame.ShowText(!frame.IsTextShown()); });
  setupText.checked = [this] { return Frame() && Frame()->IsTextShown(); };
  view->addSeparator();
  AddForDocument(view, tr("&Next Finding"), nullptr, QKeySequence(Qt::Key_F8),
                 [](DocumentFrame& frame) { frame.StepFinding(1); });
  AddForDocument(view, tr("&Previous Finding"), nullptr, QKeySequence(Qt::SHIFT | Qt::Key_F8),
                 [](DocumentFrame& frame) { frame.StepFinding(-1); });
  Command& marks = AddForDocument(view, tr("Show &Validation Icons"), nullptr, {}, [](DocumentFrame& frame) {
    CViewSettingsKvf& settings = ViewSettingsOf(frame);
    settings.ShowValidationIcons = settings.ShowValidationIcons ? 0 : 1;
    frame.Change(settings, kDataChanged, tr("Show Validation Icons"));
  });
  marks.checked = [this] { return Frame() && ViewSettingsOf(*Frame()).ShowValidationIcons != 0; };
  view->addSeparator();
  Command& zoomIn =
      Add(view, tr("&Zoom In"), nullptr, QKeySequence::ZoomIn, [this] { SetZoom(Theme::Get().Zoom() + 0.1); });
  // Where the plus sign needs the shift key.
  zoomIn.action->setShortcuts({QKeySequence(QKeySequence::ZoomIn), QKeySequence(Qt::CTRL | Qt::Key_Equal)});
  Add(view, tr("Zoom O&ut"), nullptr, QKeySequence::ZoomOut, [this] { SetZoom(Theme::Get().Zoom() - 0.1); });
  Add(view, tr("Actual &Size"), nullptr, QKeySequence(Qt::CTRL | Qt::Key_0), [this] { SetZoom(1); });
  QMenu* looks = view->addMenu(tr("App&earance"));
  auto* group = new QActionGroup(this);
  const auto look = [&](const QString& text, Theme::Appearance appearance) {
    Command& command = Add(looks, text, nullptr, {}, [this, appearance] {
      program_.Settings().setValue("Appearance", static_cast<int>(appearance));
      Theme::Get().SetAppearance(appearance);
    });
    command.checked = [appearance] { return Theme::Get().GetAppearance() == appearance; };
    group->addAction(command.action);
  };
  look(tr("As the &System"), Theme::Appearance::System);
  look(tr("&Light"), Theme::Appearance::Light);
  look(tr("&Dark"), Theme::Appearance::Dark);
  QMenu* languages = view->addMenu(tr("Lan&guage"));
  auto* shown = new QActionGroup(this);
  const auto language = [&](const QString& text, const QString& code) {
    Command& command = Add(languages, text, nullptr, {}, [this, code, name = QString(text).remove('&')] {
      program_.ChooseLanguage(code);
      Tell(tr("%1: shown from the next start of the program on.").arg(name));
    });
    command.checked = [this, code] { return program_.Language() == code; };
    shown->addAction(command.action);
  };
  language(tr("As the &System"), kSystemLanguage);
  for (const Language& each : Languages()) language("&" + ToQt(std::string(each.name)), ToQt(std::string(each.code)));
  standardBar_->addActions({back.action, forward.action});
}

void MainWindow::BuildRunMenu() {
  Command& refresh = Add(nullptr, tr("R&efresh"), "refresh", QKeySequence::Refresh, [this] {
    if (Frame()) Frame()->RefreshPlots();
    if (Viewer()) Viewer()->Reload(true);
    if (Editor()) Editor()->CheckDisk();
  });
  refresh.enabled = [this] { return tabs_->count() > 0; };
  refresh.action->setToolTip(tr("Refresh graphic"));
  // In a menu bar an icon would take the text's place, and its letter is that of the edit menu.
  Command& refreshInBar = Add(nullptr, tr("Refre&sh"), nullptr, {}, [&refresh] { refresh.action->trigger(); });
  refreshInBar.enabled = refresh.enabled;
  menuBar()->addAction(refreshInBar.action);

  QMenu* run = menuBar()->addMenu(tr("&Run"));
  const auto flag = [&](const QString& text, int CExecuteEngineFlagsKvf::*member) -> Command& {
    Command& command = AddForDocument(
        run, text, nullptr, {},
        [this, member, name = QString(text).remove('&')](DocumentFrame& frame) { ToggleFlag(frame, member, name); });
    command.checked = [this, member] { return Frame() && FlagsOf(*Frame()).*member != 0; };
    return command;
  };
  flag(tr("&Preprocessing"), &CExecuteEngineFlagsKvf::PP);
  flag(tr("&Water movement"), &CExecuteEngineFlagsKvf::WM);
  Command& quality = flag(tr("Water &quality"), &CExecuteEngineFlagsKvf::WQ);
  quality.enabled = [this] { return Frame() && HasWaterQuality(*Frame()); };
  quality.checked = [this] { return Frame() && HasWaterQuality(*Frame()) && FlagsOf(*Frame()).WQ != 0; };
  run->addSeparator();
  const auto execute = [](DocumentFrame& frame, const char* argument) {
    frame.Session().Document().RunEngine(argument);
  };
  Command& all = AddForDocument(run, tr("E&xecute..."), nullptr, QKeySequence(Qt::Key_F9),
                                [=](DocumentFrame& frame) { execute(frame, ""); });
  all.enabled = [this] { return Frame() && Frame()->Session().Document().IsExecuting() == 0; };
  // A key with Shift would hide the progress.
  const auto part = [&](const QString& text, const QString& shortText, const char* icon, const char* argument,
                        const QKeySequence& keys) {
    Command& command = AddForDocument(run, text, icon, keys, [=](DocumentFrame& frame) { execute(frame, argument); });
    command.action->setIconText(shortText);
    command.action->setToolTip(command.name);
    return command.action;
  };
  QAction* preprocessor = part(tr("Run p&reprocessor only"), tr("Preprocessor"), "run_preprocessor", "/PP",
                               QKeySequence(Qt::CTRL | Qt::Key_F9));
  QAction* movement = part(tr("Run water &movement only"), tr("Water movement"), "run_water_movement", "/WM", {});
  QAction* waterQuality = part(tr("R&un water quality only"), tr("Water quality"), "run_water_quality", "/WQ", {});
  run->addSeparator();
  const auto whileExecuting = [&](const QString& text, void (DocumentRun::*operation)()) {
    Command& command =
        AddForDocument(run, text, nullptr, {}, [operation](DocumentFrame& frame) { (frame.Run().*operation)(); });
    command.enabled = [this] { return Frame() && Frame()->Run().IsExecuting(); };
  };
  whileExecuting(tr("&Stop…"), &DocumentRun::Stop);
  whileExecuting(tr("S&how Progress"), &DocumentRun::ShowProgress);
  run->addSeparator();
  Add(run, tr("Folder of the &Engines…"), nullptr, {}, [this] { ChooseEngineFolder(); });

  modelBar_->addAction(refresh.action);
  modelBar_->addSeparator();
  modelBar_->addActions({preprocessor, movement});
  modelBar_->addSeparator();
  modelBar_->addAction(waterQuality);
  // What is run is read beside its picture.
  for (QAction* action : {preprocessor, movement, waterQuality})
    if (auto* button = qobject_cast<QToolButton*>(modelBar_->widgetForAction(action)))
      button->setToolButtonStyle(Qt::ToolButtonTextBesideIcon);
}

void MainWindow::ToggleFlag(DocumentFrame& frame, int CExecuteEngineFlagsKvf::*flag, const QString& action) {
  CExecuteEngineFlagsKvf& flags = FlagsOf(frame);
  flags.*flag = flags.*flag ? 0 : 1;
  frame.Change(flags, kDataChanged, tr("Change %1").arg(action));
}

void MainWindow::ChooseEngineFolder() {
  const QString current = program_.Settings().value(kEnginePathSetting).toString();
  const QString folder = QFileDialog::getExistingDirectory(this, tr("Folder of the Engines"), current);
  if (!folder.isEmpty()) program_.Settings().setValue(kEnginePathSetting, folder);
}

void MainWindow::BuildHelpMenu() {
  QMenu* help = menuBar()->addMenu(tr("&Help"));
  AddForDocument(help, tr("Help on This &Page"), nullptr, QKeySequence::HelpContents, [this](DocumentFrame& frame) {
    if (!frame.OnHelp()) keys_->trigger();
  });
  Command& keys = Add(help, tr("&Keys"), nullptr, {}, [this] {
    std::vector<KeyRow> rows;
    for (const auto& command : commands_)
      if (!command->action->shortcut().isEmpty())
        rows.push_back(
            {QKeySequence::listToString(command->action->shortcuts(), QKeySequence::NativeText).replace("; ", ", "),
             command->name});
    KeysDialog(rows, this).exec();
  });
  keys_ = keys.action;
  Add(help, tr("&About Quarzel"), nullptr, {}, [this] {
    QMessageBox::about(
        this, tr("About Quarzel"),
        tr("<h3>Quarzel %1</h3><p>The setup editor of the integrated catchment model Tervane.</p>"
           "<p>Copyright © 2026 the Tervane developers. Free software under the GNU General Public License, version 3 "
           "or later: you may use, change and share it; it comes without warranty.</p><p>Built on Qt %2, UDUNITS and "
           "fmt.</p>")
            .arg(QApplication::applicationVersion(), qVersion()));
  });
}

void MainWindow::FillRecentMenu() {
  recentMenu_->clear();
  const QStringList files = program_.RecentFiles();
  int number = 0;
  for (const QString& path : files)
    connect(recentMenu_->addAction(QString("&%1  %2").arg(++number % 10).arg(QString(path).replace("&", "&&"))),
            &QAction::triggered, this, [this, path] { OpenDocument(path); });
  if (files.isEmpty()) recentMenu_->addAction(tr("No setup was open yet"))->setEnabled(false);
  recentMenu_->addSeparator();
  QAction* forget = recentMenu_->addAction(tr("&Forget These"));
  forget->setEnabled(!files.isEmpty());
  connect(forget, &QAction::triggered, this, [this] {
    program_.ForgetRecentFiles();
    SyncCommands();
  });
}

void MainWindow::FillWindowMenu() {
  windowMenu_->clear();
  for (const auto& command : commands_)
    if (command->action->shortcut() == QKeySequence(Qt::CTRL | Qt::Key_Tab) ||
        command->action->shortcut() == QKeySequence(Qt::Key_F6))
      windowMenu_->addAction(command->action);
  windowMenu_->addSeparator();
  for (int i = 0; i < tabs_->count(); ++i) {
    QAction* action = windowMenu_->addAction(QString("&%1  %2").arg(i + 1).arg(tabs_->tabText(i)));
    action->setCheckable(true);
    action->setChecked(i == tabs_->currentIndex());
    connect(action, &QAction::triggered, this, [this, i] { tabs_->setCurrentIndex(i); });
  }
}

void MainWindow::SyncCommands() {
  for (const auto& command : commands_) {
    if (command->enabled) command->action->setEnabled(command->enabled());
    if (command->checked) {
      command->action->setCheckable(true);
      command->action->setChecked(command->checked());
    }
  }
  const DocumentFrame* current = Frame();
  const EditTab* editor = Editor();
  const auto named = [](const QString& text, const std::string& step) {
    return step.empty() ? text : QString("%1 %2").arg(text, Translated(step));
  };
  if (auto* undo = findChild<QAction*>("Undo"))
    undo->setText(named(tr("&Undo"), current  ? current->Session().Steps().UndoName()
                                     : editor ? editor->File().UndoName()
                                              : std::string()));
  if (auto* redo = findChild<QAction*>("Redo"))
    redo->setText(named(tr("&Redo"), current  ? current->Session().Steps().RedoName()
                                     : editor ? editor->File().RedoName()
                                              : std::string()));
  for (int i = 0; i < tabs_->count(); ++i) {
    const auto [title, path] = TitleAndPath(tabs_->widget(i));
    tabs_->setTabText(i, QString(title).replace("&", "&&"));
    tabs_->setTabToolTip(i, path);
  }
  const QString title = TitleAndPath(tabs_->currentWidget()).first;
  setWindowTitle(title.isEmpty() ? QString("Quarzel") : tr("%1 - Quarzel").arg(title));
  setWindowModified(false);
  if (welcome_) {
    if (tabs_->count() == 0) welcome_->Show(program_.RecentFiles());
    stack_->setCurrentWidget(tabs_->count() > 0 ? static_cast<QWidget*>(tabs_) : welcome_);
  }
  // The model's commands are of use only while a document is open.
  modelBar_->setEnabled(current != nullptr);
}

void MainWindow::RestyleCommands() {
  for (const auto& command : commands_)
    if (command->icon) command->action->setIcon(Theme::Get().Icon(command->icon));
}

}  // namespace tervane
