// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QObject>
#include <QPointer>
#include <QString>
#include <QTimer>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "core/engine_shell.h"
#include "document/edit_session.h"
#include "execution/run_follower.h"

namespace tervane {

class RunWindow;

/// The run of a document: starts engines for it, follows them, and finds runs that others have started. Holds the logs
/// of the document.
class DocumentRun : public QObject, public EngineShell {
  Q_OBJECT

 public:
  DocumentRun(EditSession& session, Host& host, QWidget* window);
  ~DocumentRun() override;

  /// What saves the document; gives whether it is saved.
  void SetSaver(std::function<bool()> save) { save_ = std::move(save); }

  // ---- What is shown

  const LogTail& Log() const { return log_; }
  const LogTail& RiverLog() const { return riverLog_; }
  /// The file with all that the engine has printed in the latest run; empty before the first one.
  QString LogFile() const { return logFile_; }
  /// Adds a line with the time of day.
  void AddToLog(const QString& line);
  /// What the engine has said of the setup in the latest run.
  const std::vector<EngineMessage>& Messages() const { return messages_; }
  const std::optional<EngineProgress>& Progress() const { return progress_; }
  bool IsStopping() const { return stops_ > 0; }
  /// How long it runs, or has run.
  QString Duration() const;
  /// How the latest run ended; empty while it goes on.
  QString Sentence() const { return sentence_; }
  QString Name() const;
  /// What the latest run told may hold no more, and why: "from the run of 06:47, the setup has changed since". Empty
  /// while nothing has changed.
  QString WhyOutOfDate() const;

  // ---- Commands

  /// Looks for a run that goes on, or whose end nobody was told yet.
  void FindRun();
  /// Asks the user, then the engine.
  void Stop();
  void ShowProgress();
  /// Waits until the files of a run that was found were read once; for pictures.
  void Settle();

  // ---- For the document

  Host& Outside() override { return host_; }
  bool HasChanges() const override;
  bool DoFileSave() override { return save_ && save_(); }
  bool IsShiftHeld() const override;
  void Start(const CYbSimpleLaunch& launch, bool showsProgress) override;
  bool IsExecuting() const override { return isGoing_; }

 signals:
  void Begun();
  /// Lines, progress or time have changed.
  void Moved();
  void MessagesCame();
  void Ended(bool isDone, bool wasFound);

 private:
  void Follow(SetupRun run, bool wasFound);
  std::optional<std::uint64_t> StateThatRuns() const;
  void Tick();
  void End(RunOutcome outcome);

  EditSession& session_;
  Host& host_;
  QPointer<QWidget> window_;
  std::function<bool()> save_;
  LogTail log_, riverLog_;
  QString logFile_, name_, sentence_;
  std::vector<EngineMessage> messages_;
  std::optional<EngineProgress> progress_;
  std::unique_ptr<RunFollower> follower_;
  RunState state_;
  QPointer<RunWindow> progressWindow_;
  QTimer tick_;
  bool isGoing_ = false, wasFound_ = false;
  std::optional<std::uint64_t> ranOn_;  ///< The state of the setup that it runs; nothing where that is another one.
  int stops_ = 0;
};

}  // namespace tervane
