// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/document/modflow6_command.h"

#include <memory>

#include <fmt/format.h>

#include "modflow6/modflow6_export.h"
#include "platform/computation.h"
#include "platform/files.h"
#include "platform/paths.h"

namespace tervane {

namespace {

/// Lets a waiting user follow and cancel.
class FollowedWork : public WorkLog {
 public:
  explicit FollowedWork(ProgressPart progress) : progress_(progress) {}

  void Progress(int percent, std::string_view /*doing*/) override { progress_.Report(percent / 100.0); }
  void Error(std::string_view /*place*/, std::string_view /*text*/) override {}
  void Warning(std::string_view /*place*/, std::string_view /*text*/) override {}
  bool IsCancelled() const override { return progress_.IsCancelled(); }

 private:
  ProgressPart progress_;
};

struct Exported {
  std::string note;
};

/// The export of a copy of the setup, so that it touches no node that a page may show.
std::shared_ptr<Computed<Exported>> ExportOf(std::shared_ptr<CFlowModelDoc> copy, std::string name, std::string folder,
                                             modflow6::Modflow6Options options) {
  return std::make_shared<Computed<Exported>>(
      fmt::format("Writing {}", folder), [copy, name, folder, options](Exported& exported, ProgressPart progress) {
        FollowedWork work(progress);
        modflow6::ExportReport report;
        FileResult result = modflow6::ExportModflow6(copy->Root(), name, folder, options, work, report);
        exported.note = result.note;
        return result;
      });
}

}  // namespace

void ExportToModflow6(const CFlowModelDoc& document, Host& host) {
  const std::string setup = document.PathName();
  const std::string name(setup.empty() ? "model" : BaseNameOf(setup));
  constexpr const char* kModelFile = "mfsim.nam";
  const std::optional<std::string> chosen =
      host.AskFileToSave({"Export as MODFLOW 6: where its mfsim.nam goes", "MODFLOW 6 (mfsim.nam)|mfsim.nam||", "nam",
                          fmt::format("{}/{}_mf6/{}", FolderOf(setup), name, kModelFile)});
  if (!chosen) return;
  std::string text, error;
  const auto copy = std::make_shared<CFlowModelDoc>();
  if (!document.BuildText(std::string(FolderOf(setup)), text, error) || !copy->OpenText(text, setup))
    return host.ShowMessage(error.empty() ? copy->Error() : error, Host::Icon::Error);
  const std::string folder(FolderOf(*chosen));
  modflow6::Modflow6Options options;
  // Whoever chose a file that is there has said that it may be replaced.
  options.force = FileExists(*chosen);
  const auto exporting = ExportOf(copy, name, folder, options);
  if (!host.Compute(exporting)) return;
  if (!exporting->Result())
    return host.ShowMessage(fmt::format("The setup was not exported. {}", exporting->Problem()), Host::Icon::Error);
  const Host::Answer answer =
      host.Ask(fmt::format("{} is a model of MODFLOW 6 now: {}.\nOpen the account of all inputs?", folder,
                           exporting->Result()->note),
               Host::Icon::Question, Host::Buttons::YesNo);
  if (answer == Host::Answer::Yes) host.OpenBrowser(fmt::format("file://{}/{}", folder, modflow6::kReportFile));
}

}  // namespace tervane
