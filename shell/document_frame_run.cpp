// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What a document's window shows of runs: the findings with what an engine told, how a run ended, the processed data.
#include <QApplication>
#include <QTabWidget>
#include <algorithm>

#include "document/flow_model_document.h"
#include "forms/page.h"
#include "pages/place_names.h"
#include "shell/document_frame.h"
#include "shell/findings_view.h"
#include "shell/node_tree.h"
#include "shell/page/page_view.h"
#include "shell/run/document_run.h"
#include "shell/run/log_view.h"
#include "shell/widgets/drawing_access.h"
#include "shell/widgets/qt_text.h"

namespace tervane {

namespace {

constexpr int kFindingsDelay = 300;  ///< Milliseconds for which messages of an engine gather.
constexpr int kProcessedTab = 1;     ///< Of the trees.

}  // namespace

void DocumentFrame::ShowFindings() {
  findingsLater_.stop();
  const QString whyPast = run_->WhyOutOfDate();
  std::vector<SetupFinding> findings = FindingsOf(session_->Document());
  AddEngineMessages(session_->Document(), run_->Messages(), FromQt(whyPast), findings);
  if (runBanner_) runBanner_->Age(whyPast.isEmpty() ? QString() : tr("The setup has changed since."));
  findings_->Show(std::move(findings));
  const int count = findings_->Count();
  const QString title = count ? tr("Findings (%1)").arg(count) : tr("Findings");
  const int tab = bottomTabs_->indexOf(findings_);
  if (title != bottomTabs_->tabText(tab)) Announce(*findings_, title);
  bottomTabs_->setTabText(tab, title);
}

// ---- The run

void DocumentFrame::FollowRun() {
  findingsLater_.setSingleShot(true);
  findingsLater_.setInterval(kFindingsDelay);
  connect(&findingsLater_, &QTimer::timeout, this, &DocumentFrame::ShowFindings);
  connect(run_.get(), &DocumentRun::Begun, this, [this] {
    bottomTabs_->setCurrentWidget(log_);
    riverLog_->Follow();
    emit StateChanged();
  });
  connect(run_.get(), &DocumentRun::Moved, this, [this] {
    log_->Follow();
    riverLog_->Follow();
  });
  connect(run_.get(), &DocumentRun::MessagesCame, this, [this] {
    if (!findingsLater_.isActive()) findingsLater_.start();
  });
  connect(run_.get(), &DocumentRun::Ended, this, &DocumentFrame::OnRunEnd);
}

void DocumentFrame::OnRunEnd(bool isDone, bool wasFound) {
  ShowFindings();
  CheckProcessedData();
  delete runBanner_;
  QString text = run_->Sentence();
  if (wasFound) text = tr("A run of this setup that was not started here: %1").arg(text);
  std::vector<Banner::Answer> answers;
  if (isDone) {
    if (trees_[kProcessedTab]->HasOwn())
      answers.push_back({tr("Show &Processed Data"), [this] { ShowTree(kProcessedTab); }});
  } else if (const auto error = FirstError()) {
    text += " " + error->text;
    answers.push_back(
        {tr("&Go to the Place"), [this, finding = error->finding] { GoTo(finding.serial, finding.key); }});
  }
  answers.push_back({tr("Show the L&og"), [this] { bottomTabs_->setCurrentWidget(log_); }});
  if (!isDone && !run_->Messages().empty())
    answers.push_back({tr("Show the Fi&ndings"), [this] { bottomTabs_->setCurrentWidget(findings_); }});
  runBanner_ = new Banner(text, answers, isDone ? Banner::Tone::Good : Banner::Tone::Bad);
  AddBanner(runBanner_);
  QApplication::alert(this);
  emit StateChanged();
}

std::optional<DocumentFrame::ToldError> DocumentFrame::FirstError() const {
  const auto& messages = run_->Messages();
  const auto first = std::ranges::find_if(messages, &EngineMessage::isError);
  if (first == messages.end()) return std::nullopt;
  const auto others = std::ranges::count_if(messages, &EngineMessage::isError) - 1;
  SetupFinding finding = FindingOf(session_->Document(), *first);
  QString text = Translated(finding.text);
  if (CYbSEKvfBase* node = NodeOf(finding.serial))
    text =
        QString("%1: %2").arg(Translated(PlaceNames(session_->Document()).Of(*node, finding.path, finding.key)), text);
  if (others > 0) text += tr(" (and %1 more)").arg(others);
  return ToldError{std::move(finding), text};
}

void DocumentFrame::ShowTree(int tab) {
  treeTabs_->setCurrentIndex(tab);
  NodeTree* tree = trees_[static_cast<std::size_t>(tab)];
  // The page that is shown may stand there already.
  if (!tree->IsAtOwn()) tree->ChooseLatest();
}

void DocumentFrame::Settle() {
  run_->Settle();
  ShowFindings();
}

// ---- Processed data

void DocumentFrame::RebuildProcessedData() {
  CPreprocessedDataManager* report = session_->Document().AttachPreprocessorReport();
  if (!report) return;
  auto* processed = session_->Document().Root().Important(kProcessedData);
  const CYbSEKvfBase* shown = NodeOf(current_);
  const CYbSEKvfBase* above = shown;
  while (above && above != processed) above = above->GetParent();
  const bool isShown = above != nullptr;
  std::string place;
  if (isShown) {
    place = shown == processed && !lostPage_.empty() ? lostPage_ : PathOf(*shown);
    // Pages speak of nodes: this one goes before its node does.
    delete page_;
    current_ = 0;
  }
  report->Load();
  ShowProcessedDataNews();
  Refresh(kItemDeleted | kItemAdded | kTreeRebuilt | kRefreshPlots | kDataChanged);
  if (!isShown) return;
  isRebuilding_ = isGoing_ = true;
  const bool isThere = GoToPath(place);
  lostPage_ = isThere ? std::string() : place;
  if (!isThere) GoTo(processed->Serial());
  if (place_ >= 0) visited_[static_cast<std::size_t>(place_)] = current_;
  isRebuilding_ = isGoing_ = false;
}

void DocumentFrame::CheckProcessedData() {
  // The pages of an open dialog or menu may be those that would be taken away.
  if (QApplication::activeModalWidget() || QApplication::activePopupWidget()) return;
  const CPreprocessedDataManager* report = session_->Document().AttachPreprocessorReport();
  if (!report) return;
  using OnDisk = CPreprocessedDataManager::OnDisk;
  const OnDisk state = report->CheckDisk();
  if (state == OnDisk::Changed) return RebuildProcessedData();
  if (isReportGone_ == (state == OnDisk::Gone)) return;
  isReportGone_ = state == OnDisk::Gone;
  if (page_) page_->Sync();
}

void DocumentFrame::ShowProcessedDataNews() {
  const CPreprocessedDataManager* report = session_->Document().AttachPreprocessorReport();
  const std::string problem = report ? report->Problem() : std::string();
  if (problem != toldProblem_ && !problem.empty()) Log(tr("Processed data: %1").arg(Translated(problem)));
  toldProblem_ = problem;
}

}  // namespace tervane
