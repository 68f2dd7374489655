// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/parts/passport_notice.h"

#include <fmt/format.h>

#include "document/flow_model_document.h"
#include "execution/run_passport.h"
#include "platform/paths.h"

namespace tervane {

namespace {

constexpr std::size_t kMostNames = 5;

PassportFiles FilesOf(const CYbSEDlgBase& page) {
  const CYbSEDocument& document = page.Context().document;
  return PassportFilesOf(ResolvedPath(document.getResultFolder(), {}), document.PathName());
}

/// "the setup, rain.nds0 (is gone) and 3 more files"
std::string ListOf(const std::vector<InputChange>& changes, const std::string& setup) {
  std::string list;
  for (std::size_t i = 0; i < std::min(changes.size(), kMostNames); ++i) {
    const InputChange& change = changes[i];
    if (i > 0) list += i + 1 == changes.size() ? " and " : ", ";
    list += change.path == setup ? "the setup" : std::string(FileNameOf(change.path));
    if (change.fate != InputFate::Changed) list += fmt::format(" ({})", NameOf(change.fate));
  }
  if (changes.size() > kMostNames) list += fmt::format(" and {} more files", changes.size() - kMostNames);
  return list;
}

/// Empty where nothing has. The page waits for no file to be read; the command line holds contents against each other.
std::string ChangesSince(const RunPassport& passport) {
  const std::vector<InputChange> changes = ChangedInputs(passport, true);
  return changes.empty() ? std::string()
                         : fmt::format("Written anew or gone since then: {}.", ListOf(changes, passport.setup));
}

/// Empty where nothing is known of the run.
std::string NoticeOf(const CYbSEDlgBase& page) {
  if (page.Context().document.PathName().empty()) return {};
  std::string problem;
  const std::optional<RunPassport> passport = ReadPassport(FilesOf(page).passport, problem);
  if (!passport) return problem;
  std::string text = fmt::format("Of the run that {} began on {}, {} UTC. {}", passport->user, passport->host,
                                 passport->begun, passport->outcome);
  if (const std::string changes = ChangesSince(*passport); !changes.empty()) text += "\n" + changes;
  return text;
}

/// Whether the preprocessor has run once more since the run ended, which leaves no passport of its own.
bool IsPreprocessedAnew(const CYbSEDlgBase& page, const RunPassport& passport) {
  const auto* document = dynamic_cast<const CFlowModelDoc*>(&page.Context().document);
  if (!document || passport.ended.empty()) return false;
  const FileStamp report = StampOf(ResolvedPath(document->PreprocessorReport(), {}));
  // To the second, as the passport tells it.
  return report.exists && TextOfTime(report.time).substr(0, passport.ended.size()) > passport.ended;
}

/// The same of the changes alone, for what the preprocessor made in that run.
std::string StaleNoticeOf(const CYbSEDlgBase& page) {
  if (page.Context().document.PathName().empty()) return {};
  std::string problem;
  const std::optional<RunPassport> passport = ReadPassport(FilesOf(page).passport, problem);
  if (!passport || IsPreprocessedAnew(page, *passport)) return {};
  const std::string changes = ChangesSince(*passport);
  return changes.empty() ? std::string() : fmt::format("This was made on {} UTC. {}", passport->begun, changes);
}

Condition HasPassport(const CYbSEDlgBase& page) {
  return Condition::Sentence("A run has left its passport", [&page](const CYbSEKvfBase&) {
    return !page.Context().document.PathName().empty() && FileExists(FilesOf(page).passport);
  });
}

}  // namespace

void DescribePassport(PageForm& form, const CYbSEDlgBase& page) {
  form.Notice([&page] { return NoticeOf(page); });
  form.Button("Open the Setup That Made This",
              [&page] {
                const std::string setup = FilesOf(page).setup;
                if (!FileExists(setup))
                  page.Context().host.ShowMessage("The run left no copy of its setup.", Host::Icon::Information);
                else
                  page.Outside().OpenInEditor(setup);
              })
      .ToolTip("Opens a copy of the setup as it was when the run began")
      .ShownWhen(HasPassport(page));
  form.Button(
          "Compare With Another Run...",
          [&page] {
            const auto passport = page.Context().host.AskFileToOpen(
                {"Compare With Another Run", "Passports of runs (*_Passport.kvf)|*_Passport.kvf|All Files (*.*)|*.*||",
                 "kvf", FilesOf(page).passport});
            if (passport) page.Outside().OpenInEditor(*passport);
          })
      .ToolTip("Shows what differs between the setups of two runs, and how well each agrees with what was observed")
      .ShownWhen(HasPassport(page))
      .Beside();
}

void DescribeStale(PageForm& form, const CYbSEDlgBase& page) {
  form.Notice([&page] { return StaleNoticeOf(page); });
}

}  // namespace tervane
