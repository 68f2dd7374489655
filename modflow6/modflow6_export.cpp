// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "modflow6/modflow6_export.h"

#include <filesystem>

#include <fmt/format.h>

#include "modflow6/building.h"
#include "modflow6/model_files.h"
#include "platform/paths.h"
#include "platform/progress.h"
#include "platform/text.h"
#include "simspec/basic_parameters.h"
#include "simspec/model_components.h"
#include "simspec/titles.h"
#include "spatial/domain.h"
#include "subsurface/saturated_zone.h"

namespace tervane::modflow6 {

namespace {

namespace fs = std::filesystem;

/// Passes on what is told, keeps the first error for the caller, and makes entries of warnings.
class ReportingLog : public WorkLog {
 public:
  ReportingLog(WorkLog& log, ExportReport& report) : log_(log), report_(report) {}

  void Progress(int percent, std::string_view doing) override { log_.Progress(percent, doing); }
  void Error(std::string_view place, std::string_view text) override {
    if (error_.empty()) error_ = place.empty() ? std::string(text) : fmt::format("{}: {}", place, text);
  }
  void Warning(std::string_view place, std::string_view text) override {
    report_.Add(Fate::Changed, std::string(place), std::string(text));
  }
  bool IsCancelled() const override { return log_.IsCancelled(); }

  const std::string& FirstError() const { return error_; }

 private:
  WorkLog& log_;
  ExportReport& report_;
  std::string error_;
};

/// The name of a model: letters, digits, `-` and `_`, at most 16.
std::string ModelNameOf(std::string_view setupName) {
  constexpr std::size_t kMost = 16;
  std::string name;
  for (const char c : LowerCase(setupName)) {
    const bool isPlain = (c >= 'a' && c <= 'z') || (c >= '0' && c <= '9') || c == '-' || c == '_';
    if (name.size() < kMost) name += isPlain ? c : '_';
  }
  return name.empty() ? "model" : name;
}

/// A folder for what is written, beside the place where it goes in the end; it goes with this object.
class ScratchFolder {
 public:
  explicit ScratchFolder(const std::string& target) : path_(target + ".writing") {
    for (int number = 2; fs::exists(NativePath(path_)); ++number) path_ = fmt::format("{}.writing{}", target, number);
  }
  ~ScratchFolder() {
    std::error_code ignored;
    fs::remove_all(NativePath(path_), ignored);
  }
  ScratchFolder(const ScratchFolder&) = delete;
  ScratchFolder& operator=(const ScratchFolder&) = delete;

  const std::string& Path() const { return path_; }
  std::string Make() const {
    std::error_code error;
    fs::create_directories(NativePath(path_), error);
    return error ? fmt::format("cannot make the folder {}: {}", path_, error.message()) : std::string();
  }

 private:
  std::string path_;
};

/// Puts the written files in their place. Each is whole, whatever happens between two of them; the file of names that
/// makes a model of them comes last.
std::string MoveInto(const std::string& folder, const ScratchFolder& from, const std::vector<std::string>& files) {
  std::error_code error;
  // A new folder comes in one step.
  if (!fs::exists(NativePath(folder), error)) {
    fs::rename(NativePath(from.Path()), NativePath(folder), error);
    return error ? fmt::format("cannot write {}: {}", folder, error.message()) : std::string();
  }
  fs::create_directories(NativePath(folder + "/arrays"), error);
  for (const std::string& file : files) {
    if (!error) fs::rename(NativePath(from.Path() + "/" + file), NativePath(folder + "/" + file), error);
    if (error) return fmt::format("cannot write {}/{}: {}", folder, file, error.message());
  }
  return {};
}

/// Why the folder cannot take a model; empty where it can.
std::string WhyNotInto(const std::string& folder, bool force) {
  std::error_code error;
  const fs::path path = NativePath(folder);
  if (!fs::exists(path, error)) return {};
  if (!fs::is_directory(path, error)) return fmt::format("{} is a file: name a folder", folder);
  if (!force && fs::exists(path / "mfsim.nam", error))
    return fmt::format("{} holds a model: name another folder, or replace it with --force", folder);
  return {};
}

/// What a setup must have to become a model; empty where it has.
std::string WhyNoModel(const CYbSEKvfGlobalBase& root) {
  const auto* basics = root.Important(kBasicParameters);
  const auto* components = root.Important(kModflowComponents);
  if (!basics || !components || !root.Important(kSaturatedZone)) return "the setup is not complete";
  if (basics->ModelType == kEngineTervane)
    return "the setup is for the engine Tervane: choose a Modflow engine as its numeric engine first";
  if (components->Subsurface == 0) return "the setup models no flow below ground: include it first";
  return {};
}

bool Build(Building& building) {
  constexpr bool (*kFunctions[])(Building&) = {
      BuildPeriods,  BuildDiscretization,     BuildGround, BuildBoundaries, BuildWells, BuildDrains, BuildRivers,
      BuildRecharge, BuildEvapotranspiration, BuildOutput, BuildSolver};
  constexpr int kBegin = 10, kEnd = 50;
  int done = 0;
  for (const auto function : kFunctions) {
    if (building.log.IsCancelled()) return false;
    building.log.Progress(kBegin + (kEnd - kBegin) * done++ / static_cast<int>(std::size(kFunctions)),
                          "Reading the setup");
    if (!function(building)) return false;
  }
  return true;
}

FileResult Failed(std::string error) { return {std::move(error), {}}; }

}  // namespace

FileResult ExportModflow6(CYbSEKvfGlobalBase& root, const std::string& setupName, const std::string& folder,
                          const Modflow6Options& options, WorkLog& log, ExportReport& report) {
  if (std::string why = WhyNotInto(folder, options.force); !why.empty()) return Failed(std::move(why));
  if (std::string why = WhyNoModel(root); !why.empty()) return Failed(std::move(why));
  // The last period and the last spans end where validation says.
  root.Validate();
  auto& zone = *root.Important(kSaturatedZone);
  std::string problem = "the setup has no domain: choose a file for it";
  auto* catchment = root.Important(kDomain);
  const auto domain = catchment ? catchment->GetDomainGrid(&problem) : nullptr;
  if (!domain) return Failed(catchment ? fmt::format("{}: {}", PathOf(*catchment), problem) : problem);

  ReportingLog reporting(log, report);
  const auto failed = [&] {
    if (log.IsCancelled()) return Failed(kCancelled);
    return Failed(reporting.FirstError().empty() ? "the setup is not complete" : reporting.FirstError());
  };
  reporting.Progress(5, "Levels");
  ModelLayers levels;
  if (!levels.Make(zone, *domain, reporting, options.thinCells)) return failed();
  if (levels.IsEmpty())
    return Failed(
        fmt::format("{}:TypeOfVerDiscr: the setup tells no levels of computational layers: define them by "
                    "geological layers or by lower levels",
                    PathOf(zone)));
  FlowModel model;
  model.name = ModelNameOf(setupName);
  model.title = setupName;
  const CYbSEKvfBase* basics = root.Important(kBasicParameters);
  if (const auto* title = basics->Child<CSimTitleKvf>(); title && !title->Title.empty()) {
    model.title = title->Title;
    report.Add(Fate::Carried, PathOf(*title), "the first line of each file");
  }
  model.geometry = domain->Geometry();
  Building building{root, zone, *domain, levels, options, reporting, report, model};
  if (!Build(building)) return failed();
  report.LeaveOutTheRest(root);

  const ScratchFolder scratch(folder);
  if (std::string error = scratch.Make(); !error.empty()) return Failed(std::move(error));
  std::vector<std::string> written;
  if (FileResult result = WriteModelFiles(model, scratch.Path(), options.arrays, reporting, written); !result.Ok())
    return result;
  const FileResult told =
      WriteFileAtomically(fmt::format("{}/{}", scratch.Path(), kReportFile),
                          fmt::format("What became of {} as a model of MODFLOW 6\n\n{}", setupName, report.Text()));
  if (!told.Ok()) return told;
  written.insert(written.begin(), kReportFile);
  if (log.IsCancelled()) return Failed(kCancelled);
  if (std::string error = MoveInto(folder, scratch, written); !error.empty()) return Failed(std::move(error));
  log.Progress(100, "Done");
  return {{},
          fmt::format("{} inputs were carried over, {} changed, {} left out", report.Count(Fate::Carried),
                      report.Count(Fate::Changed), report.Count(Fate::LeftOut))};
}

}  // namespace tervane::modflow6
