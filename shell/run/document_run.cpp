// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/run/document_run.h"

#include <QDateTime>
#include <QFileInfo>
#include <QGuiApplication>

#include "document/run_inputs.h"
#include "execution/engine_search.h"
#include "platform/files.h"
#include "shell/run/run_panel.h"
#include "shell/widgets/qt_text.h"

namespace tervane {

namespace {

/// Milliseconds between looks at what the engine has said: short enough to look alive.
constexpr int kTick = 50;

}  // namespace

DocumentRun::DocumentRun(EditSession& session, Host& host, QWidget* window)
    : session_(session), host_(host), window_(window) {
  connect(&tick_, &QTimer::timeout, this, &DocumentRun::Tick);
  session_.Document().SetEngineShell(this);
}

DocumentRun::~DocumentRun() {
  session_.Document().SetEngineShell(nullptr);
  delete progressWindow_;
}

void DocumentRun::AddToLog(const QString& line) {
  log_.Add(FromQt(QTime::currentTime().toString("HH:mm:ss  ") + line));
  emit Moved();
}

QString DocumentRun::Duration() const {
  if (state_.begun == 0) return {};
  return ToQt(DurationText((state_.HasEnded() ? state_.ended : NowInMilliseconds()) - state_.begun));
}

QString DocumentRun::Name() const { return name_; }

bool DocumentRun::HasChanges() const { return session_.Path().empty() || session_.IsModified(); }

bool DocumentRun::IsShiftHeld() const { return QGuiApplication::keyboardModifiers().testFlag(Qt::ShiftModifier); }

void DocumentRun::Start(const CYbSimpleLaunch& launch, bool showsProgress) {
  std::string problem;
  SetupRun run;
  std::optional<RunRequest> request = RequestOf(launch, session_.Document().getResultFolder(),
                                                EnginePlaces::Here(host_.Setting(kEnginePathSetting)), problem);
  if (request) PreparePassport(session_.Document(), *request);
  if (!request || !run.Start(*request, problem)) {
    AddToLog(tr("Not run: %1").arg(Translated(problem)));
    host_.ShowMessage(problem, Host::Icon::Error);
    return;
  }
  AddToLog(tr("Run: %1").arg(ToQt(request->engine + " " + request->setup + " " + request->options).trimmed()));
  Follow(std::move(run), false);
  if (showsProgress) ShowProgress();
}

void DocumentRun::FindRun() {
  if (isGoing_ || session_.Path().empty()) return;
  SetupRun run;
  // The end of a run that was followed here is told already, whatever stands in its files.
  if (!run.Find(RunFilesOf(session_.Document().getResultFolder(), session_.Path())) || run.State().id == state_.id)
    return;
  const bool goesOn = MayStillRun(run.State());
  AddToLog(goesOn ? tr("A run of this setup goes on") : tr("A run of this setup has ended"));
  Follow(std::move(run), true);
}

void DocumentRun::Follow(SetupRun run, bool wasFound) {
  logFile_ = ToQt(run.Files().log);
  state_ = run.State();
  name_ = QFileInfo(ToQt(state_.setup)).fileName();
  riverLog_ = {};
  messages_.clear();
  progress_.reset();
  sentence_.clear();
  stops_ = 0;
  isGoing_ = true;
  wasFound_ = wasFound;
  ranOn_ = StateThatRuns();
  follower_ = std::make_unique<RunFollower>(std::move(run));
  tick_.start(kTick);
  emit MessagesCame();
  emit Begun();
}

std::optional<std::uint64_t> DocumentRun::StateThatRuns() const {
  const UndoStack& steps = session_.Steps();
  if (!wasFound_) return steps.StateNumber();
  // Of a run that was started elsewhere the file's time alone is known.
  const auto saved = std::chrono::file_clock::to_sys(StampOf(session_.Path()).time).time_since_epoch();
  const bool isOlder = std::chrono::duration_cast<std::chrono::milliseconds>(saved).count() <= state_.begun;
  return isOlder && steps.IsSaved() ? std::optional(steps.StateNumber()) : std::nullopt;
}

QString DocumentRun::WhyOutOfDate() const {
  if (state_.begun == 0 || ranOn_ == session_.Steps().StateNumber()) return {};
  const QDateTime begun = QDateTime::fromMSecsSinceEpoch(state_.begun);
  const bool isToday = begun.date() == QDate::currentDate();
  return tr("from the run of %1, the setup has changed since")
      .arg(begun.toString(isToday ? "HH:mm" : "yyyy-MM-dd HH:mm"));
}

void DocumentRun::Tick() {
  RunNews news = follower_->Take();
  state_ = std::move(news.state);
  log_.Add(std::move(news.log));
  riverLog_.Add(std::move(news.extraLog));
  if (news.progress) progress_ = std::move(news.progress);
  messages_.insert(messages_.end(), news.messages.begin(), news.messages.end());
  if (!news.messages.empty()) emit MessagesCame();
  if (news.outcome != RunOutcome::GoingOn) return End(news.outcome);
  emit Moved();
  if (!news.trouble.empty()) host_.ShowMessage(news.trouble, Host::Icon::Error);
}

void DocumentRun::End(RunOutcome outcome) {
  tick_.stop();
  isGoing_ = false;
  sentence_ = ToQt(OutcomeSentence(state_));
  AddToLog(sentence_);
  if (progressWindow_) progressWindow_->deleteLater();
  emit Ended(outcome == RunOutcome::Done, wasFound_);
}

void DocumentRun::Stop() {
  if (!isGoing_) return;
  const QString question =
      stops_ == 0 ? tr("Stop the engine that runs %1? What it has computed up to now may not be complete.").arg(name_)
                  : tr("The engine was asked to stop and has not ended yet. End it by force?");
  if (host_.Ask(FromQt(question), Host::Icon::Question, Host::Buttons::YesNo) != Host::Answer::Yes || !isGoing_) return;
  ++stops_;
  follower_->Stop();
  emit Moved();
}

void DocumentRun::ShowProgress() {
  if (!isGoing_) return;
  if (!progressWindow_) progressWindow_ = new RunWindow(*this, window_);
  progressWindow_->show();
  progressWindow_->raise();
}

void DocumentRun::Settle() {
  if (!isGoing_) return;
  follower_->WaitForFirstLook(std::chrono::seconds(2));
  Tick();
}

}  // namespace tervane
