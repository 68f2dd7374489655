// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What a document's window explains, and its quick fixes: where files are searched, what is asked before, one step of
// undo.
#include <QApplication>
#include <QDir>
#include <QFileDialog>

#include "fixes/quick_fixes.h"
#include "forms/page.h"
#include "pages/place_names.h"
#include "shell/document_frame.h"
#include "shell/page/page_view.h"
#include "shell/qt_host.h"
#include "shell/why_dialog.h"
#include "shell/widgets/qt_text.h"

namespace tervane {

namespace {

constexpr std::size_t kMostTold = 8;  ///< Lines of what changes, or of what is left.

QString TitleOf(const FixKind& kind) { return Translated(std::string(kind.title)); }

/// The first lines, and how many more there are.
QString FirstLines(const std::vector<QString>& lines) {
  QStringList told;
  for (std::size_t place = 0; place < std::min(lines.size(), kMostTold); ++place) told << lines[place];
  if (lines.size() > kMostTold)
    told << QApplication::translate("DocumentFrame", "and %1 more").arg(lines.size() - kMostTold);
  return told.join("\n");
}

std::vector<QString> ChangesInWords(const FixPlan& plan) {
  std::vector<QString> lines;
  for (const FixedValue& value : plan.values)
    lines.push_back(QString("%1: %2 → %3")
                        .arg(ToQt(value.key), value.before.empty() ? "–" : ToQt(value.before), ToQt(value.after)));
  return lines;
}

std::vector<QString> LeftInWords(const FixPlan& plan, CYbSEDocument& document) {
  std::vector<QString> lines;
  PlaceNames names(document);
  for (const LeftFinding& left : plan.left)
    lines.push_back(Translated(names.Of(*left.node, PathOf(*left.node), left.key)) + ": " + Translated(left.why));
  return lines;
}

}  // namespace

void DocumentFrame::OfferFixesOnPage() {
  const auto asFound = [](const CYbSEKvfBase& node, const Finding& finding) {
    return SetupFinding{
        SetupFinding::Kind::Error, PathOf(node), finding.text, finding.key, finding.detail, 0, node.Serial()};
  };
  page_->OfferFixes([this, asFound](CYbSEKvfBase& node, const Finding& finding) {
    const QuickFixes fixes(session_->Document());
    const auto kinds = fixes.KindsFor(node, asFound(node, finding));
    return kinds.empty() ? QString() : TitleOf(*kinds.front());
  });
  connect(page_, &PageView::FixAsked, this, [this, asFound](quint64 serial, const Finding& finding) {
    CYbSEKvfBase* node = NodeOf(serial);
    if (!node) return;
    const SetupFinding found = asFound(*node, finding);
    const QuickFixes fixes(session_->Document());
    const auto kinds = fixes.KindsFor(*node, found);
    if (!kinds.empty()) Fix(ToQt(std::string(kinds.front()->name)), {found});
  });
}

void DocumentFrame::Fix(const QString& kindName, const std::vector<SetupFinding>& findings) {
  Commit();
  CFlowModelDoc& document = session_->Document();
  QuickFixes fixes(document);
  const FixKind* kind = fixes.KindOf(FromQt(kindName));
  if (!kind) return;
  const std::vector<FoundAt> found = findings.empty() ? fixes.AllFoundFor(*kind) : fixes.FoundFor(*kind, findings);
  if (found.empty()) return;
  FixContext context{document.Root().SetupFolder()};
  FixPlan plan;
  std::shared_ptr<Computed<FilesByName>> search;
  for (;;) {
    if (QuickFixes::NeedsFiles(*kind) && !context.folder.empty()) {
      search = QuickFixes::SearchFor(found, context.folder);
      if (!host_.Compute(search)) return;
      context.files = search->Result().get();
    }
    plan = {};
    kind->plan(found, context, plan);
    if (!plan.values.empty() || !QuickFixes::NeedsFiles(*kind)) break;
    // The setup's own folder has none of them.
    if (!host_.Choose(tr("Nothing was found below %1.").arg(QDir::toNativeSeparators(ToQt(context.folder))),
                      FirstLines(LeftInWords(plan, document)), {tr("&Search Another Folder…")}))
      return;
    const QString folder = QFileDialog::getExistingDirectory(this, tr("Search Files Below"), ToQt(context.folder));
    if (folder.isEmpty()) return;
    context.folder = FromQt(folder);
  }
  const auto tellLeft = [&] {
    if (!plan.left.empty())
      host_.ShowMessage(FromQt(tr("Left as it was:") + "\n" + FirstLines(LeftInWords(plan, document))),
                        Host::Icon::Information);
  };
  if (plan.values.empty()) return tellLeft();
  if (plan.values.size() > 1 &&
      !host_.Choose(tr("Change %1 values?").arg(plan.values.size()), FirstLines(ChangesInWords(plan)), {tr("C&hange")}))
    return;
  for (const std::shared_ptr<Computation>& preparation : QuickFixes::PreparationsOf(plan))
    if (!host_.Compute(preparation)) return;
  QuickFixes::Apply(plan);
  if (plan.values.empty()) return tellLeft();
  document.Root().SetRevalidateAll();
  session_->UpdateDoc(document.Root(), kTreeRebuilt | kDataChanged, FromQt(TitleOf(*kind)));
  emit Told(plan.values.size() == 1 ? ChangesInWords(plan).front() : tr("%1 values changed").arg(plan.values.size()));
  tellLeft();
}

void DocumentFrame::ShowWhy(const QString& title, const std::vector<Explanation>& explanations, const QString& yes,
                            const QString& no) {
  WhyDialog dialog(title, explanations, yes, no, this);
  connect(&dialog, &WhyDialog::Chosen, this, [this](quint64 serial, const QString& key) { GoTo(serial, FromQt(key)); });
  dialog.exec();
}

void DocumentFrame::ShowWhyHere(quint64 serial) {
  if (CYbSEKvfBase* node = NodeOf(serial))
    ShowWhy(tr("Why Is This Here?"), {WhyTakesPart(session_->Document(), *node)}, tr("takes part, since"),
            tr("takes no part, since"));
}

void DocumentFrame::ShowWhatIsMissing() {
  std::vector<Explanation> explanations;
  for (MissingNode& missing : WhatIsMissing(session_->Document())) explanations.push_back(std::move(missing.why));
  ShowWhy(tr("What Is Missing?"), explanations, tr("takes part, since"), tr("takes no part. To bring it:"));
}

}  // namespace tervane
