// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What a setup stores: the catalogue, the rows of types with their forecast, and thousands of points for series.
#include <algorithm>
#include <filesystem>
#include <memory>
#include <string>

#include <fmt/format.h>
#include <unistd.h>

#include "bench/median_table.h"
#include "document/edit_session.h"
#include "forms/page.h"
#include "forms/plots.h"
#include "pages/page_table.h"
#include "platform/files.h"
#include "results/detailed_series.h"
#include "results/pages.h"
#include "results/storing.h"
#include "results/storing_cost.h"

namespace tervane::bench {

namespace {

namespace fs = std::filesystem;

constexpr int kPoints = 10'000;
constexpr int kRowsInSight = 60;

/// The page with its map, and of its table the rows that a window has room for.
std::size_t ShowPage(CYbSEDlgBase& page) {
  std::size_t shown = 0;
  page.SetData();
  page.Form().ForEach([&](Control& control) {
    if (control.map) shown += control.map().points.size();
    if (!control.table) return;
    TableForm& table = *control.table;
    table.Follow();
    for (int row = 1; row <= std::min(table.RowCount(), kRowsInSight); ++row)
      for (int column = 1; column <= table.ColumnCount(); ++column) shown += table.ShownCell(row, column).size();
  });
  if (shown == 0) fmt::print("WRONG: the page shows nothing\n");
  return shown;
}

int Run(int argc, char** argv) {
  const fs::path folder = fs::temp_directory_path() / fmt::format("tervane_storing_bench_{}", getpid());
  fs::create_directories(folder);
  MedianTable table(11);
  const auto limited = [&table](const std::string& name, double milliseconds, const auto& measured) {
    table.Add(name, measured);
    table.LimitTime(name, milliseconds);
  };

  const ResultCatalogue& own = ResultCatalogue::Own();
  limited("the catalogue is made and checked", 1,
          [] { return std::make_unique<ResultCatalogue>(AllResultTypes(), AllResultFiles()); });

  const auto session = EditSession::New({});
  CFlowModelDoc& setup = session->Document();
  auto& storing = *setup.Root().Important(kStoringResults);
  COutputGridSeriesListKvf& series = storing.GridSeries();
  for (const ResultDataType* type : own.OfferedTypes(series.BuildResultMask(false)))
    series.SetTicked(type->newDataType, true);
  limited("the rows of types", 1, [&series] { return series.Rows().size(); });
  limited("the rows and the forecast of all of them", 16,
          [&] { return ForecastCost(storing, series.Rows()).Text().size(); });

  std::string text;
  for (int number = 1; number <= kPoints; ++number)
    text +=
        fmt::format("P{}\t61\t1\t{}\t{}\t0\t0\tobserved/p{}\t1\n", number, 10 * number, 20 * (number % 100), number);
  const std::string path = (folder / "points.txt").string();
  if (const FileResult written = WriteFileAtomically(path, text); !written.Ok())
    fmt::print("WRONG: {}\n", written.error);
  const auto points = [&](const char* what) { return fmt::format("{} points are {}", kPoints, what); };
  table.Add(
      points("imported"), [] { return EditSession::New({}); },
      [path](const std::unique_ptr<EditSession>& into) {
        return into->Document()
            .Root()
            .Important(kStoringResults)
            ->Child<CDetailedTSOutputListKvf>()
            ->ImportFile(path, {})
            .added;
      });
  auto& list = *storing.Child<CDetailedTSOutputListKvf>();
  if (list.ImportFile(path, {}).added != kPoints) fmt::print("WRONG: not all points were imported\n");
  table.Add(points("checked"), [&list] { return list.Validate(); });
  NobodyToAsk nobody;
  const PageContext context{setup, nobody, {}};
  const auto page = MakePage(kDetailedSeriesPage, list, context);
  table.Add(points("shown"), [&page] { return ShowPage(*page); });
  for (const char* what : {"imported", "checked", "shown"}) table.LimitTime(points(what), 100);
  table.Run(argc, argv);
  fs::remove_all(folder);
  return 0;
}

}  // namespace

}  // namespace tervane::bench

int main(int argc, char** argv) { return tervane::bench::Run(argc, argv); }
