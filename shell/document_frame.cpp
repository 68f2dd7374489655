// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/document_frame.h"

#include <QApplication>
#include <QDataStream>
#include <QFileInfo>
#include <QIODevice>
#include <QScreen>
#include <QSplitter>
#include <QTabBar>
#include <QTabWidget>
#include <QVBoxLayout>
#include <algorithm>

#include "core/doc_version.h"
#include "core/path.h"
#include "document/coverage_board.h"
#include "document/editor_exchange.h"
#include "document/overview.h"
#include "document/view_settings.h"
#include "forms/page.h"
#include "pages/findings.h"
#include "pages/place_names.h"
#include "pages/tree_entries.h"
#include "shell/find_panel.h"
#include "shell/findings_view.h"
#include "shell/node_tree.h"
#include "shell/page/form_dialog.h"
#include "shell/page/page_view.h"
#include "shell/program.h"
#include "shell/qt_host.h"
#include "shell/run/document_run.h"
#include "shell/run/log_view.h"
#include "shell/run/run_panel.h"
#include "shell/text/text_view.h"
#include "shell/widgets/drawing_access.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"
#include "wqpt/kinetra_specification.h"

namespace tervane {

namespace {

constexpr int kTreeWidth = 300, kPageWidth = 750, kPageHeight = 480, kBottomHeight = 110;
constexpr int kAutosaveDelay = 2000;      ///< Milliseconds after the last change.
constexpr int kDiskInterval = 3000;       ///< Milliseconds between looks at the file on disk.
constexpr int kProcessedInterval = 1000;  ///< The same at the preprocessor's report.
constexpr std::size_t kMostVisited = 200;

CYbSEKvfBase* NodeBelow(CYbSEKvfBase& node, std::uint64_t serial) {
  if (node.Serial() == serial) return &node;
  for (CYbSEKvfBase* child = node.GetFirstChild(); child; child = node.GetNextChild(child))
    if (CYbSEKvfBase* found = NodeBelow(*child, serial)) return found;
  return nullptr;
}

/// Where a page stands: "Setup Data > Climate".
QString PlaceText(CYbSEKvfBase& node) {
  QStringList steps{node.GetDlgRuntimeClass(kSetupDataTree)       ? DocumentFrame::tr("Setup Data")
                    : node.GetDlgRuntimeClass(kProcessedDataTree) ? DocumentFrame::tr("Processed Data")
                    : node.GetDlgRuntimeClass(kResultsTree)       ? DocumentFrame::tr("Results")
                                                                  : DocumentFrame::tr("Tools")};
  if (node.GetParent())
    for (const std::string& title : PlaceNames::TitlesTo(*node.GetParent())) steps << Translated(title);
  return steps.join(" > ");
}

/// At a large zoom the trees give way to the page.
int TreeWidthIn(int all) {
  const int wanted = Theme::Get().Scaled(kTreeWidth);
  return std::clamp(all - Theme::Get().Scaled(kPageWidth), std::min(wanted, kTreeWidth), wanted);
}

}  // namespace

DocumentFrame::DocumentFrame(std::unique_ptr<EditSession> session, const QString& name, QtHost& host, Program& program)
    : session_(std::move(session)), name_(name), host_(host), program_(program) {
  all_ = new QVBoxLayout(this);
  all_->setContentsMargins(0, 0, 0, 0);
  all_->setSpacing(0);
  run_ = std::make_unique<DocumentRun>(*session_, host_, this);
  BuildBody();
  FollowRun();
  session_->Listen([this](int hint) { Refresh(hint); });
  autosave_.setSingleShot(true);
  connect(&autosave_, &QTimer::timeout, this, &DocumentFrame::RunAutosave);
  connect(&disk_, &QTimer::timeout, this, &DocumentFrame::CheckDisk);
  connect(&disk_, &QTimer::timeout, this, &DocumentFrame::CheckTemplates);
  disk_.start(kDiskInterval);
  connect(&processed_, &QTimer::timeout, this, &DocumentFrame::CheckProcessedData);
  processed_.start(kProcessedInterval);

  if (CPreprocessedDataManager* report = session_->Document().AttachPreprocessorReport()) report->Load();
  ShowProcessedDataNews();
  Refresh(kDataChanged);
  if (trees_.front()->topLevelItemCount() > 0) trees_.front()->setCurrentItem(trees_.front()->topLevelItem(0));
  if (session_->IsReadOnly())
    ShowBanner(tr("Read-only: %1.").arg(Translated(session_->ReadOnlyReason())),
               {{tr("Save &As…"), [this] { emit SaveAsWanted(); }}});
  ShowLoadReport();
  run_->FindRun();
}

DocumentFrame::~DocumentFrame() {
  // Pages speak of nodes: they go before the document does.
  delete columns_;
}

void DocumentFrame::BuildBody() {
  const Theme& theme = Theme::Get();
  builtZoom_ = theme.Zoom();
  treeTabs_ = new QTabWidget;
  treeTabs_->setDocumentMode(true);
  // Where the trees are narrow their names are cut, and all three can be chosen.
  treeTabs_->setElideMode(Qt::ElideRight);
  treeTabs_->setUsesScrollButtons(false);
  const auto tree = [&](int id, const QString& title, const QString& emptyText) {
    auto* made = new NodeTree(id, emptyText);
    made->setAccessibleName(title);
    treeTabs_->addTab(made, title);
    trees_.push_back(made);
    connect(made, &NodeTree::NodeChosen, this, [this](quint64 serial) { GoTo(serial); });
    connect(made, &NodeTree::WhyAsked, this, &DocumentFrame::ShowWhyHere);
    connect(made, &NodeTree::TabbedOn, this, &DocumentFrame::FocusNextPane);
  };
  trees_.clear();
  tree(kSetupDataTree, tr("Setup Data"), tr("No part of the setup takes part."));
  tree(kProcessedDataTree, tr("Processed Data"),
       tr("Nothing yet: the preprocessor has left no report beside this setup."));
  tree(kResultsTree, tr("Results"), tr("Nothing yet: no simulation has left results for this setup."));
  connect(treeTabs_, &QTabWidget::tabBarClicked, this, [this](int tab) {
    if (tab >= 0) ShowTree(tab);
  });
  connect(treeTabs_, &QTabWidget::currentChanged, this, [this](int tab) {
    if (treeTabs_->tabBar()->hasFocus()) ShowTree(tab);
  });
  find_ = new FindPanel(session_->Document(), treeTabs_);
  connect(find_, &FindPanel::HitChosen, this, [this](quint64 serial, const QString& control) {
    // Where the text names no control the first one takes what is typed.
    if (GoTo(serial, FromQt(control)) && control.isEmpty() && page_) page_->FocusOn({});
  });
  connect(find_, &FindPanel::Left, this, [this] { treeTabs_->currentWidget()->setFocus(); });

  pagePlace_ = new QWidget;
  auto* place = new QVBoxLayout(pagePlace_);
  place->setContentsMargins(0, 0, 0, 0);
  BuildMiddle();

  bottomTabs_ = new QTabWidget;
  bottomTabs_->setDocumentMode(true);
  findings_ = new FindingsView(session_->Document());
  connect(findings_, &FindingsView::FindingChosen, this,
          [this](const SetupFinding& finding) { GoTo(finding.serial, finding.key); });
  connect(findings_, &FindingsView::FixChosen, this, &DocumentFrame::Fix);
  connect(findings_, &FindingsView::MendChosen, this, [this](quint64 serial, const Mend& mend) {
    Commit();
    CYbSEKvfBase* node = NodeOf(serial);
    auto* offers = dynamic_cast<OffersMends*>(node);
    if (!offers) return;
    offers->TakeMend(mend);
    node->SetRevalidateAll();
    session_->UpdateDoc(*node, kTreeRebuilt | kDataChanged, mend.text);
  });
  findings_->setAccessibleName(tr("Findings"));
  bottomTabs_->addTab(findings_, tr("Findings"));
  BuildNotes();
  BuildJournal();
  log_ =
      new LogView(run_->Log(), tr("What happens to this document, and what an engine that runs it says, stands here."));
  log_->SetFile([this] { return run_->LogFile(); });
  log_->setAccessibleName(tr("Execution Log"));
  bottomTabs_->addTab(log_, tr("Execution Log"));
  riverLog_ = new LogView(run_->RiverLog(), tr("What the river engine says during a run stands here."));
  riverLog_->setAccessibleName(tr("Fluvane Execution Log"));
  bottomTabs_->addTab(riverLog_, tr("Fluvane Execution Log"));
  auto* bottom = new QWidget;
  auto* below = new QVBoxLayout(bottom);
  below->setContentsMargins(0, 0, 0, 0);
  below->setSpacing(0);
  below->addWidget(bottomTabs_, 1);

  rows_ = new QSplitter(Qt::Vertical);
  rows_->addWidget(middle_);
  rows_->addWidget(bottom);
  rows_->setStretchFactor(0, 1);
  rows_->setSizes({theme.Scaled(kPageHeight), theme.Scaled(kBottomHeight)});
  rows_->setChildrenCollapsible(false);
  columns_ = new QSplitter(Qt::Horizontal);
  columns_->addWidget(find_);
  columns_->addWidget(rows_);
  columns_->setStretchFactor(1, 1);
  columns_->setSizes({TreeWidthIn(screen()->availableSize().width()), theme.Scaled(kPageWidth)});
  columns_->setChildrenCollapsible(false);
  all_->insertWidget(0, columns_, 1);
  // All bars stand at the foot.
  delete runPanel_;
  all_->addWidget(runPanel_ = new RunPanel(*run_));
}

void DocumentFrame::Redraw() {
  Commit();
  const QByteArray layout = SaveLayout();
  const std::uint64_t current = current_;
  const QStringList branches = Branches();
  const int tab = treeTabs_->currentIndex(), bottom = bottomTabs_->currentIndex();
  const bool isText = IsTextShown();
  const QString typed = text_->HasTyping() ? text_->Text().toPlainText() : QString();
  delete columns_;
  current_ = 0;
  BuildBody();
  RestoreLayout(layout);
  treeTabs_->setCurrentIndex(tab);
  bottomTabs_->setCurrentIndex(bottom);
  RestoreBranches(branches);
  Refresh(kDataChanged);
  isGoing_ = true;
  GoTo(current);
  isGoing_ = false;
  ShowText(isText);
  if (!typed.isEmpty()) text_->Resume(typed);
}

QString DocumentFrame::Name() const {
  return session_->Path().empty() ? name_ : QFileInfo(ToQt(session_->Path())).fileName();
}

QString DocumentFrame::Title() const {
  QString title = Name();
  if (session_->IsReadOnly()) title += tr(" (read-only)");
  return session_->IsModified() ? title + " *" : title;
}

// ---- The place that is shown

CYbSEKvfBase* DocumentFrame::NodeOf(std::uint64_t serial) const {
  return serial ? NodeBelow(session_->Document().Root(), serial) : nullptr;
}

bool DocumentFrame::GoTo(std::uint64_t serial, const std::string& control) {
  CYbSEKvfBase* node = NodeOf(serial);
  const CYbSEKvfBase* wanted = node;
  // A node without a page shows on the page of a node above it.
  while (node && !PageClassOf(*node)) node = node->GetParent();
  if (!node) return false;
  if (node->Serial() != current_ || !page_) {
    Commit();
    ShowPage(*node, control);
  } else if (!control.empty() && !IsTextShown()) {
    page_->FocusOn(control);
  }
  FollowInText(*wanted, control);
  return true;
}

bool DocumentFrame::GoToPath(const std::string& path) {
  const SetupPath parsed = ParseSetupPath(path);
  const CYbSEKvfBase* node = FindNode(session_->Document().Root(), parsed.steps);
  return node && node->GetParent() && GoTo(node->Serial(), parsed.key.name);
}

bool DocumentFrame::PressButton(const std::string& label) {
  if (!page_) return false;
  CYbSEDlgBase& page = page_->Page();
  Control* button = nullptr;
  page.Form().ForEach([&](Control& control) {
    if (control.label == label && control.press && control.IsShown()) button = &control;
  });
  if (button) page.Press(*button);
  return button != nullptr;
}

bool DocumentFrame::AnswerOnMap(const std::string& answer) {
  const std::size_t equals = answer.find('=');
  if (!page_ || equals == std::string::npos) return false;
  std::vector<MapPoint> points;
  for (const QString& place : ToQt(answer.substr(equals + 1)).split(' ', Qt::SkipEmptyParts)) {
    const QStringList numbers = place.split(',');
    bool isX = false, isY = false;
    if (numbers.size() == 2) points.push_back({numbers[0].toDouble(&isX), numbers[1].toDouble(&isY)});
    if (!isX || !isY) return false;
  }
  if (!PressButton(answer.substr(0, equals))) return false;
  std::optional<MapRequest> request;
  page_->Page().Form().ForEach([&](Control& control) {
    if (control.kind == ControlKind::Map && control.IsShown() && !request) request = control.map().request;
  });
  const bool isAnswer = request && points.size() >= (request->kind == MapRequest::Kind::Line ? 2U : 1U);
  if (isAnswer)
    request->taken(points);
  else if (request && request->givenUp)
    request->givenUp();
  page_->Sync();
  return isAnswer;
}

bool DocumentFrame::Receive(const Message& message) { return AnswerEditor(session_->Document(), message, host_); }

void DocumentFrame::ShowPage(CYbSEKvfBase& node, const std::string& control) {
  const PageClass* pageClass = PageClassOf(node);
  PageContext context{session_->Document(), host_,
                      [this, &node](int hint, const std::string& action, const void* source) {
                        session_->UpdateDoc(node, hint, action, source, page_ ? page_->NameOf(source) : std::string());
                      }};
  context.displayUnits = &program_.Units();
  context.isReplacement = isRebuilding_ || isStepping_;
  context.syncSoon = [this] {
    QTimer::singleShot(0, this, [this] {
      if (page_) page_->Sync();
    });
  };
  context.selectNode = [this](const CYbSEKvfBase& other) {
    QTimer::singleShot(0, this, [this, serial = other.Serial()] { GoTo(serial); });
  };
  context.runDialog = [this](const std::string& title, CYbSEDlgBase& form, const std::function<std::string()>& accept) {
    return FormDialog(Translated(title), form, accept, this).exec() == QDialog::Accepted;
  };
  auto made = MakePage(*pageClass, node, context);
  if (!made) return;
  const bool isFirstVisit = node.GetHasBeenTouched() == 0;
  node.Touch();
  if (isFirstVisit) text_->Follow();
  if (page_) {
    // What the user did in it may have led here: its own code is still to return to.
    page_->hide();
    page_->deleteLater();
  }
  page_ = new PageView(std::move(made), PlaceText(node), ToQt(PathOf(node)));
  connect(page_, &PageView::WhyAsked, this, [this](const Control* asked) {
    ShowWhy(tr("Why Is This Grey?"), {WhyEnabled(session_->Document(), page_->Page().Form(), *asked)},
            tr("can be changed, since"), tr("cannot be changed, since"));
  });
  OfferFixesOnPage();
  ShowNotesOnPage();
  connect(page_, &PageView::NoteWanted, this,
          [this](quint64 serial, const QString& key) { AddNote(serial, FromQt(key)); });
  connect(page_, &PageView::UnitChosen, this, [this](int itemType, int unit) {
    program_.ChooseUnit(itemType, unit);
    page_->Sync();
  });
  pagePlace_->layout()->addWidget(page_);
  current_ = node.Serial();
  if (!isRebuilding_) lostPage_.clear();
  above_.clear();
  for (const CYbSEKvfBase* parent = node.GetParent(); parent; parent = parent->GetParent())
    above_.push_back(parent->Serial());
  SelectInTrees(current_);
  if (!isGoing_) Remember(current_);
  if (!control.empty() && !IsTextShown()) page_->FocusOn(control);
  emit StateChanged();
}

bool DocumentFrame::SelectInTrees(std::uint64_t serial) {
  NodeTree* shown = nullptr;
  for (NodeTree* tree : trees_)
    if (tree->Select(serial) && (!shown || tree == treeTabs_->currentWidget())) shown = tree;
  if (shown) treeTabs_->setCurrentWidget(shown);
  return shown != nullptr;
}

void DocumentFrame::Remember(std::uint64_t serial) {
  visited_.resize(static_cast<std::size_t>(place_ + 1));
  if (visited_.empty() || visited_.back() != serial) visited_.push_back(serial);
  if (visited_.size() > kMostVisited) visited_.erase(visited_.begin());
  place_ = static_cast<std::ptrdiff_t>(visited_.size()) - 1;
}

bool DocumentFrame::CanGo(int by) const {
  const std::ptrdiff_t to = place_ + by;
  return to >= 0 && to < static_cast<std::ptrdiff_t>(visited_.size());
}

void DocumentFrame::Go(int by) {
  isGoing_ = true;
  // Nodes that are no more are passed over.
  while (CanGo(by)) {
    place_ += by;
    if (GoTo(visited_[static_cast<std::size_t>(place_)])) break;
  }
  isGoing_ = false;
  emit StateChanged();
}

std::string DocumentFrame::CurrentPath() const {
  const CYbSEKvfBase* node = NodeOf(current_);
  return node ? PathOf(*node) : std::string();
}

void DocumentFrame::LeaveGoneNode() {
  if (!current_ || SelectInTrees(current_)) return;
  // Some pages stand in no tree and are reached by a command alone.
  CYbSEKvfBase* node = NodeOf(current_);
  const CYbSEKvfBase& root = session_->Document().Root();
  if (node && (node == root.Important(kOverview) || node == root.Important(kCoverage))) return;
  for (const std::uint64_t serial : std::vector(above_))
    if (trees_.front()->Select(serial) && GoTo(serial)) return;
  if (trees_.front()->topLevelItemCount() > 0) trees_.front()->setCurrentItem(trees_.front()->topLevelItem(0));
}

bool DocumentFrame::OnHelp() { return page_ && page_->Page().OnHelp(); }

void DocumentFrame::StepFinding(int by) {
  bottomTabs_->setCurrentWidget(findings_);
  findings_->Step(by);
}

void DocumentFrame::FocusNextPane() {
  const QWidget* focus = QApplication::focusWidget();
  const auto holds = [focus](const QWidget* pane) { return focus && (pane == focus || pane->isAncestorOf(focus)); };
  if (holds(find_) && IsTextShown()) {
    text_->Text().setFocus();
  } else if (holds(find_) && page_) {
    page_->FocusOn({});
    // A page may have nothing that takes the keyboard.
    if (QApplication::focusWidget() == focus) bottomTabs_->currentWidget()->setFocus();
  } else if (holds(middle_)) {
    if (IsTextShown() || !page_ || !page_->FocusOnPlot()) bottomTabs_->currentWidget()->setFocus();
  } else if (!find_->FocusOnHits()) {
    treeTabs_->currentWidget()->setFocus();
  }
}

// ---- Editing

void DocumentFrame::Refresh(int hint) {
  CGlobal& root = session_->Document().Global();
  const auto* settings = root.Important(kViewSettings);
  for (NodeTree* tree : trees_) tree->Sync(root, !settings || settings->ShowValidationIcons != 0);
  ShowFindings();
  ShowNotes();
  ShowJournal();
  if (page_) LeaveGoneNode();
  if (page_) page_->Sync();
  text_->Follow();
  if (hint & ~(kDataChanged | kRefreshPlots)) find_->Forget();
  if (session_->NeedsAutosave()) autosave_.start(kAutosaveDelay);
  emit StateChanged();
}

void DocumentFrame::RefreshPlots() {
  Commit();
  if (page_) page_->Page().OnRefresh();
  Change(session_->Document().Root(), kRefreshPlots, tr("Refresh"));
}

void DocumentFrame::FollowFiles() {
  Commit();
  session_->Document().Root().SetRevalidateAll();
  RefreshPlots();
}

void DocumentFrame::Commit() {
  if (page_) page_->Commit();
  text_->Commit();
}

void DocumentFrame::Change(CYbSEKvfBase& node, int hint, const QString& action) {
  session_->UpdateDoc(node, hint, FromQt(action));
}

bool DocumentFrame::Save(const std::string& path) {
  Commit();
  if (!session_->SaveAs(path)) {
    Log(tr("Not saved: %1").arg(Translated(session_->Error())));
    host_.ShowMessage(session_->Error(), Host::Icon::Error);
    return false;
  }
  Log(tr("Saved as %1").arg(ToQt(path)));
  emit Told(tr("Saved as %1").arg(ToQt(path)));
  for (const std::string& note : session_->Document().SaveNotes()) Log(Translated(note));
  if (diskBanner_) diskBanner_->deleteLater();
  program_.AddRecentFile(ToQt(path));
  Refresh(kDataChanged);
  return true;
}

void DocumentFrame::ShowBanner(const QString& text, const std::vector<Banner::Answer>& answers) {
  AddBanner(new Banner(text, answers));
}

void DocumentFrame::AddBanner(Banner* banner) {
  // At the foot: what comes while somebody works must move nothing.
  all_->addWidget(banner);
  Announce(*banner, banner->accessibleName());
}

void DocumentFrame::ShowLoadReport() {
  const LoadReport& report = session_->Document().Report();
  for (const LoadReport::Entry& entry : report.entries)
    if (entry.kind == LoadReport::Kind::Warning) host_.ShowMessage(entry.text, Host::Icon::Warning);
  const int version = session_->Document().Global().ReadDocVersion();
  if (!session_->Path().empty() && version != CFlowModelDocVersionKvf::kWrittenVersion && report.unread.empty()) {
    const QString written = version < 0 ? tr("an unnumbered version") : tr("version %1").arg(version);
    ShowBanner(tr("This file was written by %1 and is saved as version %2. The first save keeps the file as it was "
                  "beside the new one.")
                   .arg(written)
                   .arg(CFlowModelDocVersionKvf::kWrittenVersion),
               {{tr("What will &be saved…"), [this] { emit ChangesWanted(); }}});
  }
  if (report.unread.empty()) return;
  ShowBanner(
      tr("Things in this file that the editor does not know: %1. They are listed below; the first save keeps the "
         "file as it was beside the new one.")
          .arg(report.unread.size()),
      {{tr("What will &be saved…"), [this] { emit ChangesWanted(); }}});
}

void DocumentFrame::CheckDisk() {
  run_->FindRun();
  if (diskBanner_ || session_->Path().empty()) return;
  const EditSession::OnDisk state = session_->CheckDisk();
  if (state == EditSession::OnDisk::AsKnown) return;
  const bool isGone = state == EditSession::OnDisk::Gone;
  std::vector<Banner::Answer> answers;
  if (!isGone) {
    answers.push_back({tr("Re&load"), [this] { emit ReloadWanted(); }});
    answers.push_back({tr("&Differences…"), [this] { emit ChangesWanted(); }});
  }
  answers.push_back({tr("&Keep Mine"), [this] { session_->AcceptDisk(); }});
  diskBanner_ = new Banner(isGone ? tr("The file is no more on disk. A save writes it anew.")
                                  : tr("Another program has changed the file on disk."),
                           answers);
  AddBanner(diskBanner_);
}

void DocumentFrame::CheckTemplates() {
  auto* templates = session_->Document().Root().Important(kKinetraSpecification);
  if (!templates) return;
  std::map<std::string, FileStamp> changed;
  QStringList names;
  for (const std::string& path : templates->TemplatesOtherOnDisk()) {
    changed[path] = StampOf(path);
    names << QFileInfo(ToQt(path)).fileName();
  }
  if (changed == changedTemplates_) return;
  changedTemplates_ = changed;
  if (templateBanner_) {
    templateBanner_->hide();
    templateBanner_->deleteLater();
  }
  // Its own page tells the same.
  if (page_) page_->Sync();
  if (changed.empty()) return;
  templateBanner_ = new Banner(names.size() == 1 ? tr("The template %1 has changed on disk.").arg(names.front())
                                                 : tr("The templates %1 have changed on disk.").arg(names.join(", ")),
                               {{tr("Re&fresh"),
                                 [this, templates] {
                                   Commit();
                                   templates->RefreshTemplates();
                                   templates->SetRevalidateAll();
                                   session_->UpdateDoc(*templates, kTreeRebuilt | kDataChanged, "Refresh Templates");
                                 }},
                                {tr("&Not Now"), [] {}}});
  AddBanner(templateBanner_);
}

void DocumentFrame::RunAutosave() {
  if (!session_->NeedsAutosave()) return;
  if (const std::string trouble = session_->Autosave(); !trouble.empty())
    Log(tr("The changes could not be kept for a recovery: %1").arg(ToQt(trouble)));
}

void DocumentFrame::Log(const QString& line) { run_->AddToLog(line); }

QByteArray DocumentFrame::SaveLayout() const {
  QByteArray layout;
  QDataStream stream(&layout, QIODevice::WriteOnly);
  stream << columns_->sizes() << rows_->sizes() << builtZoom_;
  return layout;
}

void DocumentFrame::RestoreLayout(const QByteArray& layout) {
  QList<int> columns, rows;
  double zoom = 0;
  QDataStream stream(layout);
  stream >> columns >> rows >> zoom;
  if (columns.size() != 2 || rows.size() != 2 || zoom <= 0) return;
  // The panes at the edges keep their share of the texts; the page has the rest.
  const auto restore = [&](QSplitter& splitter, const QList<int>& sizes, int edge) {
    const int all = sizes[0] + sizes[1];
    int kept = std::min(qRound(sizes[edge] * builtZoom_ / zoom), all / 2);
    if (edge == 0 && zoom != builtZoom_) kept = std::min(kept, TreeWidthIn(all));
    splitter.setSizes(edge == 0 ? QList<int>{kept, all - kept} : QList<int>{all - kept, kept});
  };
  restore(*columns_, columns, 0);
  restore(*rows_, rows, 1);
}

QStringList DocumentFrame::Branches() const {
  QStringList branches;
  for (const NodeTree* tree : trees_) branches << tree->Branches();
  return branches;
}

void DocumentFrame::RestoreBranches(const QStringList& branches) {
  for (NodeTree* tree : trees_) tree->RestoreBranches(branches);
}

}  // namespace tervane
