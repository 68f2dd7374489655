// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QPointer>
#include <QStringList>
#include <QTimer>
#include <QWidget>
#include <cstdint>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "document/edit_session.h"
#include "pages/findings.h"
#include "pages/why.h"
#include "shell/widgets/banner.h"

class QSplitter;
class QTabWidget;
class QVBoxLayout;

namespace tervane {

class DocumentRun;
class FindPanel;
class FindingsView;
class JournalView;
class LogView;
class NodeTree;
class NotesView;
class PageView;
class Program;
class QtHost;
class RunPanel;
class TextView;

/// One document in its tab: the trees at the left, the page in the middle, findings and logs below.
class DocumentFrame : public QWidget, public MessageReceiver {
  Q_OBJECT

 public:
  /// `name` is how a setup is called that was never saved.
  DocumentFrame(std::unique_ptr<EditSession> session, const QString& name, QtHost& host, Program& program);
  ~DocumentFrame() override;

  EditSession& Session() const { return *session_; }
  /// The engine that runs the setup.
  DocumentRun& Run() const { return *run_; }
  /// The name of the file, with a star when there are changes to save.
  QString Title() const;
  QString Name() const;

  // ---- The place that is shown

  /// Shows a node's page, with the keyboard on the control of that key or label; false when it has no page.
  bool GoTo(std::uint64_t serial, const std::string& control = {});
  bool GoToPath(const std::string& path);
  /// Presses a button of the page by its label; false where the page shows none.
  bool PressButton(const std::string& label);
  /// Presses a button of the page and answers its question on the map: "Draw Section=0,0 100,50". False where the page
  /// has no such button, or it asks for something else.
  bool AnswerOnMap(const std::string& answer);
  bool CanGo(int by) const;
  /// Goes back (-1) or forward (1) among the visited nodes.
  void Go(int by);
  /// The path of the node that is shown; empty where there is none.
  std::string CurrentPath() const;
  /// Finds in the tree, or in the text where that is shown.
  void StartFind();
  /// The text of the setup stands in the place of the page, at the node of the page; the page comes back at the node
  /// of the cursor.
  void ShowText(bool isShown);
  bool IsTextShown() const;
  /// Whether the text holds lines that the setup has not taken and that would be lost with it.
  bool HasUntakenText() const;
  /// The page's own help; false when it has none.
  bool OnHelp();
  /// What takes no part, and what would bring it.
  void ShowWhatIsMissing();
  void StepFinding(int by);
  /// Shows the list of that title below the page; false where there is none.
  bool ShowBelow(const QString& title);
  /// Puts the keyboard into the next of: tree, page, findings.
  void FocusNextPane();

  // ---- Editing

  /// Hands over what was typed and not yet entered; to be called before every command.
  void Commit();
  /// Looks at the files of the shown page again, and draws all anew.
  void RefreshPlots();
  /// Looks anew at the files that the setup uses: another tab has changed one.
  void FollowFiles();
  /// Reads the preprocessor's report again and shows its pages anew; the page that is shown stays where the report
  /// still has it. The end of a run and a timer call it when the report has changed on disk.
  void RebuildProcessedData();
  void Undo();
  void Redo();
  bool CanUndo() const;
  bool CanRedo() const;
  /// A change that a menu makes in a node that has no page.
  void Change(CYbSEKvfBase& node, int hint, const QString& action);
  /// False when it failed; the user has been told why.
  bool Save(const std::string& path);

  void ShowBanner(const QString& text, const std::vector<Banner::Answer>& answers);
  void CheckDisk();
  /// Looks whether a process template in use has changed on disk, and offers to read it again.
  void CheckTemplates();
  /// Tries a kind of fix for these findings, or for all that it is for where there are none: asks where files are to be
  /// searched and whether many values are to be changed, and changes them in one step.
  void Fix(const QString& kind, const std::vector<SetupFinding>& findings);
  /// Asks for a review note at a node, or at a key of it, and adds it.
  void AddNote(std::uint64_t serial, const std::string& key);
  /// The same at the control or line that has the keyboard, else at the page.
  void AddNoteHere();
  void Log(const QString& line);
  /// Makes all anew that was computed from colours and sizes.
  void Redraw();

  /// Waits until what is known of a run is shown; for pictures.
  void Settle();

  QByteArray SaveLayout() const;
  void RestoreLayout(const QByteArray& layout);
  /// The branches of the trees that the user has opened and closed, to be given to a later window of the setup.
  QStringList Branches() const;
  void RestoreBranches(const QStringList& branches);
  /// Answers other editors about the setup.
  bool Receive(const Message& message) override;

 signals:
  /// The title, the place, or what can be undone is another one.
  void StateChanged();
  void SaveAsWanted();
  void ReloadWanted();
  void ChangesWanted();
  /// Something for the status line.
  void Told(const QString& text);

 private:
  void BuildBody();
  /// The page and, beside it, the text.
  void BuildMiddle();
  void FollowInText(const CYbSEKvfBase& node, const std::string& control);
  /// Undoes or redoes a step, and shows what that has changed.
  void Step(bool (EditSession::*step)(), StepPlace (UndoStack::*placeOf)() const,
            std::string (UndoStack::*nameOf)() const, const QString& told);
  void ShowWhyHere(quint64 serial);
  void OfferFixesOnPage();
  void ShowWhy(const QString& title, const std::vector<Explanation>& explanations, const QString& yes,
               const QString& no);
  void Refresh(int hint);
  void ShowPage(CYbSEKvfBase& node, const std::string& control);
  /// Looks whether the preprocessor's report is another one.
  void CheckProcessedData();
  void ShowProcessedDataNews();
  void Remember(std::uint64_t serial);
  /// Selects the node's entry, preferably in the tree that is shown; false when no tree has one.
  bool SelectInTrees(std::uint64_t serial);
  CYbSEKvfBase* NodeOf(std::uint64_t serial) const;
  /// When the node that is shown has left the setup: the nearest above it that is still there.
  void LeaveGoneNode();
  void AddBanner(Banner* banner);
  void RunAutosave();
  void ShowLoadReport();
  void FollowRun();
  void ShowFindings();
  void BuildNotes();
  void BuildJournal();
  /// Shows the journal as it is now, and tells when it cannot be written.
  void ShowJournal();
  /// Shows the notes in their list, in the trees and on the page.
  void ShowNotes();
  void ShowNotesOnPage();
  void OnRunEnd(bool isDone, bool wasFound);
  /// The first error that the engine has told in its latest run, as a sentence with its place and how many there are.
  struct ToldError {
    SetupFinding finding;
    QString text;
  };
  std::optional<ToldError> FirstError() const;
  /// Shows a tree with the page that was shown last of it, else its first one.
  void ShowTree(int tab);

  std::unique_ptr<EditSession> session_;
  QString name_;
  QtHost& host_;
  Program& program_;

  QVBoxLayout* all_;
  QSplitter* columns_ = nullptr;
  double builtZoom_ = 1;  ///< For which the panes have their sizes.
  QSplitter* rows_ = nullptr;
  QTabWidget* treeTabs_ = nullptr;
  QTabWidget* bottomTabs_ = nullptr;
  std::vector<NodeTree*> trees_;
  FindPanel* find_ = nullptr;
  FindingsView* findings_ = nullptr;
  NotesView* notes_ = nullptr;
  JournalView* journal_ = nullptr;
  std::map<std::pair<std::uint64_t, std::string>, QString> noted_;  ///< Notes that are not done, by node and key.
  std::unique_ptr<DocumentRun> run_;
  LogView *log_ = nullptr, *riverLog_ = nullptr;
  QTabWidget* middle_ = nullptr;
  TextView* text_ = nullptr;
  QWidget* pagePlace_ = nullptr;
  QPointer<PageView> page_;
  QPointer<Banner> diskBanner_, runBanner_, templateBanner_;
  std::map<std::string, FileStamp> changedTemplates_;  ///< As they were when they were offered.
  QPointer<RunPanel> runPanel_;

  std::uint64_t current_ = 0;
  std::vector<std::uint64_t> above_;    ///< The nodes above the one that is shown, nearest first.
  std::vector<std::uint64_t> visited_;  ///< For going back and forward.
  std::ptrdiff_t place_ = -1;           ///< Of the shown node in `visited_`.
  bool isGoing_ = false;
  bool isRebuilding_ = false;
  bool isStepping_ = false;  ///< A step is being undone or redone: what a page mends when it is shown would undo that.
  std::string lostPage_;  ///< The path of a page of processed data that a rebuild took away, until another is chosen.
  std::string toldProblem_;  ///< Of the report, as the log has it.
  bool isReportGone_ = false;
  QTimer autosave_, disk_, processed_, findingsLater_;
};

}  // namespace tervane
