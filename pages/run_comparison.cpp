// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/run_comparison.h"

#include <algorithm>
#include <tuple>
#include <utility>

#include <fmt/format.h>

#include "document/setup_merge.h"
#include "execution/run_passport.h"
#include "platform/paths.h"
#include "simspec/periods.h"

namespace tervane {

namespace {

constexpr std::string_view kPassportEnd = "_Passport.kvf";

FileResult ReadTitle(const ComparedRun& files, std::string& title) {
  std::string problem;
  const std::optional<RunPassport> passport = ReadPassport(files.passport, problem);
  if (!passport) return {problem.empty() ? fmt::format("{} is not there.", files.passport) : problem, {}};
  title = fmt::format("{}, {} UTC", FileNameOf(passport->setup), passport->begun);
  return {};
}

/// The time that both setups simulate.
std::optional<ComparedPeriod> CommonPeriod(const CFlowModelDoc& first, const CFlowModelDoc& second) {
  const auto *a = first.Root().Important(kSimulationPeriod), *b = second.Root().Important(kSimulationPeriod);
  if (!a || !b) return std::nullopt;
  const ComparedPeriod period{std::max(a->GetSimStartDate(), b->GetSimStartDate()), std::min(a->SIMEND, b->SIMEND)};
  return period.start < period.end ? std::optional(period) : std::nullopt;
}

bool IsSamePoint(const ComparedPoint& a, const DetailedPoint& b) {
  return a.name == b.name && a.dataType == b.dataType && a.layer == b.layer;
}

}  // namespace

bool IsNamedAsPassport(std::string_view path) { return path.ends_with(kPassportEnd); }

ComparedRun ComparedRunOf(const std::string& passport) {
  const std::string stem = passport.substr(0, passport.size() - kPassportEnd.size());
  return {passport, stem + "_Passport.tvd", stem + "_PreProcessed.kvf"};
}

std::optional<double> ComparedPoint::Difference(std::optional<double> RunStatistics::*figure) const {
  if (!first || !second || !((*first).*figure) || !((*second).*figure)) return std::nullopt;
  return *((*second).*figure) - *((*first).*figure);
}

FileResult ReadRuns(const ComparedRun& first, const ComparedRun& second, RunComparison& comparison) {
  if (FileResult read = ReadTitle(first, comparison.firstTitle); !read.Ok()) return read;
  if (FileResult read = ReadTitle(second, comparison.secondTitle); !read.Ok()) return read;
  CFlowModelDoc before, after;
  for (auto [document, files] : {std::pair(&before, &first), std::pair(&after, &second)})
    if (!document->OnOpenDocument(files->setup)) comparison.setupProblem = document->Error();
  if (!comparison.setupProblem.empty()) {
    comparison.pointsProblem = "Without both setups nobody knows which time to compare.";
    return {};
  }
  comparison.differences = DifferencesBetween(before, after);
  const std::optional<ComparedPeriod> period = CommonPeriod(before, after);
  if (!period) {
    comparison.pointsProblem = "The runs have no time in common.";
    return {};
  }
  comparison.period = *period;
  for (auto [files, points] :
       {std::pair(&first, &comparison.firstPoints), std::pair(&second, &comparison.secondPoints)})
    if (const FileResult read = ReadDetailedPoints(files->report, *points); !read.Ok())
      comparison.pointsProblem = read.error;
  return {};
}

FileResult CompareFigures(const DisplayUnits& units, RunComparison& comparison, ProgressPart progress) {
  StatisticsTable before, after;
  for (auto [points, table, part] : {std::tuple(&comparison.firstPoints, &before, progress.Part(0, 0.5)),
                                     std::tuple(&comparison.secondPoints, &after, progress.Part(0.5, 1))}) {
    if (FileResult made = ComputeStatistics(*points, comparison.period, units, *table, part); !made.Ok()) return made;
    if (comparison.pointsProblem.empty()) comparison.pointsProblem = table->stopped;
  }
  for (const PointStatistics& row : before.rows)
    comparison.points.push_back({row.point.name, row.point.dataType, row.unit, row.point.layer, row.figures, {}});
  for (const PointStatistics& row : after.rows) {
    const auto same = std::ranges::find_if(
        comparison.points, [&](const ComparedPoint& point) { return IsSamePoint(point, row.point) && !point.second; });
    if (same != comparison.points.end())
      same->second = row.figures;
    else
      comparison.points.push_back({row.point.name, row.point.dataType, row.unit, row.point.layer, {}, row.figures});
  }
  if (comparison.points.empty() && comparison.pointsProblem.empty())
    comparison.pointsProblem = "Neither run has a point with observed values.";
  return {};
}

}  // namespace tervane
