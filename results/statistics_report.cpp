// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/statistics_report.h"

#include <cmath>
#include <fstream>
#include <iterator>
#include <span>

#include <fmt/format.h>

#include "geometry/shapes.h"
#include "platform/item_types.h"
#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

namespace {

constexpr std::string_view kPageDateFormat = "%Y/%m/%d  %H:%M";
constexpr std::string_view kBlank = "&nbsp;";

/// A figure of the table: its head, the attribute of its shape, and where it stands. Attributes have ten characters.
struct FigureColumn {
  const char* head;
  const char* attribute;
  std::optional<double> RunStatistics::*figure;
};
constexpr FigureColumn kFigures[] = {
    {"ME", "ME", &RunStatistics::meanError},
    {"MAE", "MAE", &RunStatistics::meanAbsoluteError},
    {"RMSE", "RMSE", &RunStatistics::rootMeanSquareError},
    {"STDres", "STDres", &RunStatistics::residualDeviation},
    {"R(Correlation)", "R_Correlat", &RunStatistics::correlation},
    {"R2(Nash_Sutcliffe)", "R2_Nash_Su", &RunStatistics::nashSutcliffe},
};

constexpr int kTextWidth = 40, kLayerWidth = 5, kFigureWidth = 12, kFigureDecimals = 4;

std::string EscapedHtml(std::string_view text) {
  std::string escaped = Replaced(text, "&", "&amp;");
  escaped = Replaced(escaped, "<", "&lt;");
  return Replaced(escaped, ">", "&gt;");
}

void AddCell(std::string& page, std::string_view text) {
  fmt::format_to(std::back_inserter(page), "  <td>{}</td>\n", text.empty() ? kBlank : text);
}

double InUserUnit(double metres, const DisplayUnits& units) {
  const ItemType& position = *FindItemType(quantity::kPosition);
  return Convert(metres, BaseUnit(position), units.UnitOf(position));
}

/// The text within so many bytes, cut between characters.
std::string CutText(const std::string& text, std::size_t bytes) {
  if (text.size() <= bytes) return text;
  std::size_t end = bytes;
  while (end > 0 && (static_cast<unsigned char>(text[end]) & 0xC0U) == 0x80U) --end;
  return text.substr(0, end);
}

/// What its column holds, else no value.
ShapeValue FigureValue(const std::optional<double>& figure) {
  if (!figure || !std::isfinite(*figure)) return {};
  if (fmt::formatted_size("{:.{}f}", *figure, kFigureDecimals) > kFigureWidth) return {};
  return *figure;
}

FileResult WriteShapes(const StatisticsTable& table, const DisplayUnits& units, const std::string& path) {
  std::vector<ShapeField> columns = {{"Name", AttributeKind::Text, kTextWidth},
                                     {"Data_type", AttributeKind::Text, kTextWidth},
                                     {"Layer", AttributeKind::Whole, kLayerWidth}};
  for (const FigureColumn& column : kFigures)
    columns.push_back({column.attribute, AttributeKind::Real, kFigureWidth, kFigureDecimals});
  CTvnShapeData shapes;
  shapes.Create(ShapeKind::Point, std::move(columns), {});
  shapes.SetAxisLengthUnit(units.UnitKey(quantity::kPosition));
  for (const PointStatistics& row : table.rows) {
    Shape shape;
    shape.points = {{row.point.x, row.point.y}};
    const bool fits = fmt::formatted_size("{}", row.point.layer) <= kLayerWidth;
    shape.values = {CutText(row.point.name, kTextWidth), CutText(row.point.dataType, kTextWidth),
                    fits ? ShapeValue(std::int64_t{row.point.layer}) : ShapeValue()};
    for (const FigureColumn& column : kFigures) shape.values.push_back(FigureValue(row.figures.*column.figure));
    shapes.AddShape(std::move(shape));
  }
  FileResult written = shapes.SaveShapeFile(path);
  if (!written.Ok()) {
    const std::string attributes = path.substr(0, path.size() - ExtensionOf(path).size()) + ".dbf";
    const bool isTable = written.error.find(attributes) != std::string::npos;
    written.error = fmt::format("Error creating {} file:\n{}\n\n{}", isTable ? "dbf" : "shape",
                                isTable ? attributes : path, written.error);
  }
  return written;
}

}  // namespace

FileResult ComputeStatistics(const std::vector<DetailedPoint>& points, const ComparedPeriod& period,
                             const DisplayUnits& units, StatisticsTable& table, ProgressPart progress) {
  table = {period, {}, {}};
  PointComparer comparer(period, units);
  const double count = static_cast<double>(points.size());
  for (std::size_t i = 0; i < points.size(); ++i) {
    const double begin = static_cast<double>(i) / count;
    if (progress.IsCancelled()) return {kCancelled, {}};
    progress.Report(begin);
    if (!points[i].includesObserved) continue;
    PointComparison comparison =
        comparer.CompareFirst(std::span(points).subspan(i), progress.Part(begin, static_cast<double>(i + 1) / count));
    if (progress.IsCancelled()) return {kCancelled, {}};
    if (comparison.isUnreadable) {
      table.stopped = comparison.problem;
      return {};
    }
    table.rows.push_back({points[i], comparison.unit, comparison.figures, comparison.problem});
  }
  return {};
}

StatisticsFiles StatisticsFilesBeside(const std::string& report) {
  const std::string stem = report.substr(0, report.size() - ExtensionOf(report).size()) + "_Stat";
  return {stem + ".Html", stem + ".shp"};
}

std::string StatisticsPage(const StatisticsTable& table, const DisplayUnits& units) {
  std::string page = "<html>\n<body>\n<table border=1>\n";
  page += fmt::format("Start date for statistical analysis: {}<br />\n", table.period.start.Format(kPageDateFormat));
  page += fmt::format("End date for statistical analysis  : {}<br />\n", table.period.end.Format(kPageDateFormat));
  page += "<tr>\n";
  for (const char* head : {"Name", "Data type", "X", "Y", "Layer"}) AddCell(page, head);
  for (const FigureColumn& column : kFigures) AddCell(page, column.head);
  page += "</tr>\n";
  for (const PointStatistics& row : table.rows) {
    page += "<tr>\n";
    AddCell(page, EscapedHtml(row.point.name));
    AddCell(page, EscapedHtml(row.point.dataType));
    AddCell(page, FormatNumber(InUserUnit(row.point.x, units), "%g"));
    AddCell(page, FormatNumber(InUserUnit(row.point.y, units), "%g"));
    AddCell(page, row.point.layer >= 1 ? std::to_string(row.point.layer) : std::string());
    for (const FigureColumn& column : kFigures) {
      const std::optional<double>& figure = row.figures.*column.figure;
      AddCell(page, figure ? FormatNumber(*figure, "%g") : std::string());
    }
    page += "</tr>\n";
  }
  if (table.stopped.empty()) page += "</table>\n</body>\n</html>\n";
  return page;
}

FileResult WriteStatistics(const StatisticsTable& table, const DisplayUnits& units, const StatisticsFiles& files) {
  const auto refused = [&](const std::string& reason) {
    return FileResult{fmt::format("Could not open ASCII-file for writing:\n\n{}\n\n{}", files.html, reason), {}};
  };
  FileReplacement page;
  if (const FileResult begun = page.Begin(files.html); !begun.Ok()) return refused(begun.error);
  {
    const std::string text = StatisticsPage(table, units);
    std::ofstream stream(NativePath(page.TemporaryPath()), std::ios::binary);
    stream.write(text.data(), static_cast<std::streamsize>(text.size()));
    stream.close();
    if (!stream) return refused("the disk may be full; nothing was written");
  }
  FileResult result = WriteShapes(table, units, files.shape);
  if (!result.Ok()) return result;
  const FileResult committed = page.Commit();
  if (!committed.Ok()) return refused(committed.error);
  if (!committed.note.empty()) result.note += (result.note.empty() ? "" : "\n") + committed.note;
  return result;
}

}  // namespace tervane
