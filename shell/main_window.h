// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QMainWindow>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "shell/qt_host.h"

class QLabel;
class QMenu;
class QStackedWidget;
class QTabWidget;
class QToolBar;

namespace tervane {

class CExecuteEngineFlagsKvf;
class DataViewer;
class DocumentFrame;
class EditSession;
class EditTab;
struct LibraryKind;
class Program;
class ReliefWindow;
class TemplateTab;
class WelcomePage;

/// The window of the program: documents in tabs, and the commands on them.
class MainWindow : public QMainWindow, public MessageReceiver {
  Q_OBJECT

 public:
  explicit MainWindow(Program& program);
  ~MainWindow() override;

  /// The document that is shown; null where there is none.
  DocumentFrame* Frame() const;
  void NewDocument();
  /// Opens a setup in a tab of its own, or shows the one in which it is open. False when it could not be opened; the
  /// user has been told why.
  bool OpenDocument(const QString& path);
  /// Asks for another setup, and shows in a tab how one that is open differs from it.
  void Compare(DocumentFrame& frame);
  /// The same with the setup of a file; false, with a message, where it cannot be read.
  bool CompareWith(DocumentFrame& frame, const std::string& path);
  /// Asks for a setup that was made from the same one as this, and for that one, and shows what comes of merging them.
  void Merge(DocumentFrame& frame);
  /// The same with these files; false, with a message, where they cannot be merged.
  bool MergeWith(DocumentFrame& frame, const std::string& theirs, const std::string& base);
  /// Shows the latest run of a document beside the one of a passport; false, with a message, where one cannot be read.
  bool CompareRunWith(DocumentFrame& frame, const std::string& passport);
  /// Shows a data file in a tab of its own, a text file in the desktop's editor. False when neither can be done; the
  /// user has been told why.
  bool ShowDataFile(const QString& path);
  /// Opens a data file to be edited in a tab of its own, or shows the one in which it is. What cannot be edited is
  /// shown as `ShowDataFile` does: what a run has stored, files of other forms, lines.
  bool EditDataFile(const QString& path);
  /// Opens a library of named entries in a tab of its own, or shows the one in which it is open.
  bool OpenLibrary(const LibraryKind& kind, const QString& path);
  /// Shows a process template in a tab of its own.
  bool ShowTemplate(const QString& path);
  /// Shows the ground of a setup from the side, in a window of its own.
  ReliefWindow* ShowGround(DocumentFrame& frame);
  /// Nobody is there to answer; see QtHost.
  void SetUnattended() { host_.SetUnattended(); }
  /// One of these, by the file's name.
  bool OpenFile(const QString& path);
  /// Opens files for pages of the setup that is shown.
  bool Receive(const Message& message) override;
  /// Offers what a crash left of setups that nobody opens by name.
  void OfferRecoveries();
  bool SaveDocument();
  bool SaveDocumentAs();
  /// The data file or library that is edited in the tab that is shown; null where there is none.
  EditTab* Editor() const;
  bool SaveEditor();
  bool SaveEditorAs();
  /// False when the user wants to go on with it.
  /// False where the user keeps what is typed in the text and not taken.
  bool MayDropText(DocumentFrame& frame);
  bool CloseDocument(DocumentFrame* frame);
  bool CloseEditor(EditTab* editor);
  /// The same of any tab.
  bool CloseTab(QWidget* tab);

 protected:
  void closeEvent(QCloseEvent* event) override;
  void changeEvent(QEvent* event) override;
  void dragEnterEvent(QDragEnterEvent* event) override;
  void dropEvent(QDropEvent* event) override;

 private:
  /// An action that is enabled only while its rule holds, and checked as its other rule says.
  struct Command {
    QAction* action;
    QString name;  ///< Without the letter's mark, and without what the action names besides.
    const char* icon;
    std::function<bool()> enabled;
    std::function<bool()> checked;
  };

  /// Tells something in the status line for a while.
  void Tell(const QString& text);

  // In main_menus.cpp.
  void BuildMenus();
  void BuildEditMenu();
  void BuildViewMenu();
  void BuildRunMenu();
  void BuildHelpMenu();
  Command& Add(QMenu* menu, const QString& text, const char* icon, const QKeySequence& keys, std::function<void()> run);
  /// A command on the current document.
  Command& AddForDocument(QMenu* menu, const QString& text, const char* icon, const QKeySequence& keys,
                          std::function<void(DocumentFrame&)> run);
  /// A command on the current document, or on the data file or library that is edited.
  Command& AddForEditor(QMenu* menu, const QString& text, const char* icon, const QKeySequence& keys,
                        std::function<void(DocumentFrame&)> ofDocument, std::function<void(EditTab&)> ofEditor);
  void FillRecentMenu();
  void FillWindowMenu();
  void SyncCommands();
  void RestyleCommands();

  /// The data file that is shown; null where there is none.
  DataViewer* Viewer() const;
  /// The tab of that class in which a file is open; null where there is none.
  template <class Tab>
  Tab* TabOf(const std::string& path) const;
  /// In the folder of the results of a setup, open or not: it tells of a run, and is not to be changed.
  bool IsStoredByRun(const std::string& path) const;
  /// Asks whether changes are to be saved before they go: a button of QMessageBox.
  int AskForChanges(const QString& name);
  /// Adds a tab that edits a file and shows it.
  void AddEditor(std::unique_ptr<EditTab> editor);
  DocumentFrame* AddFrame(std::unique_ptr<EditSession> session);
  void ReloadDocument(DocumentFrame* frame);
  /// Shows what a save would change; true when the user has then saved.
  bool ShowChanges(DocumentFrame& frame);
  /// Shows the document beside a setup that the user chooses.
  /// Asks what is to be done about a file that another program has changed; true when the document is saved then.
  bool SaveBesideChange(DocumentFrame& frame);
  void CopyToKeyboardWidget(const char* operation);
  void ToggleFlag(DocumentFrame& frame, int CExecuteEngineFlagsKvf::*flag, const QString& action);
  void ChooseEngineFolder();
  void SetZoom(double zoom);
  void Restyle();

  Program& program_;
  QtHost host_;
  std::vector<std::unique_ptr<Command>> commands_;
  QTabWidget* tabs_;
  QStackedWidget* stack_;
  WelcomePage* welcome_ = nullptr;
  QToolBar *standardBar_, *modelBar_;
  QMenu *recentMenu_ = nullptr, *windowMenu_ = nullptr;
  QAction* keys_ = nullptr;
  QLabel* zoom_;
  int newDocuments_ = 0;
};

}  // namespace tervane
