// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/parts/plot_content.h"

#include <algorithm>
#include <cmath>
#include <deque>
#include <limits>

#include <fmt/format.h>

#include "geometry/grid_outline.h"
#include "overlays/overlays.h"
#include "pages/parts/backdrop.h"
#include "platform/paths.h"
#include "simspec/periods.h"
#include "spatial/domain.h"

namespace tervane {

namespace {

constexpr std::size_t kMostValues = 2'000'000;

/// How much of a large file the data are, so that a chart of a hundred small series keeps them all.
double ShareOfFile(const auto& /*data*/) { return 1; }
double ShareOfFile(const FileSeries& series) {
  return std::max(static_cast<double>(series.times.size()) / static_cast<double>(kMostValues), 1 / 128.0);
}

/// What was read from files lately, shared by all pages: asked for at every change of a page, read once.
template <class Key, class Data>
class RecentFiles {
 public:
  using Result = std::shared_ptr<Computed<Data>>;

  template <class Maker>
  Result Get(Key key, const std::string& path, Maker maker) {
    const auto found = std::ranges::find(entries_, key, &Entry::key);
    if (found != entries_.end()) {
      std::rotate(entries_.begin(), found, found + 1);
      return entries_.front().result;
    }
    auto result = std::make_shared<Computed<Data>>(fmt::format("Reading {}", FileNameOf(path)), std::move(maker));
    entries_.push_front({std::move(key), result});
    LetGo();
    return result;
  }

 private:
  struct Entry {
    Key key;
    Result result;

    /// Somebody shows it, or waits for it.
    bool IsInUse() const {
      return result.use_count() > 1 || (result->IsDone() && result->Result() && result->Result().use_count() > 1);
    }
  };

  /// Forgets what has not been asked for for the longest time. What is in use needs its memory anyway, and a map of
  /// many files would never be complete if they drove each other out.
  void LetGo() {
    double files = 0;
    std::erase_if(entries_, [&](const Entry& entry) {
      if (entry.IsInUse()) return false;
      files += entry.result->Result() ? ShareOfFile(*entry.result->Result()) : 0;
      return files > kMostFiles;
    });
  }

  static constexpr double kMostFiles = 8;
  std::deque<Entry> entries_;
};

/// The values of an item over all times.
FileResult ReadSeries(const std::string& path, int number, FileSeries& series, ProgressPart progress) {
  DataFile file;
  const auto refused = [](std::string reason) { return FileResult{std::move(reason), {}}; };
  if (std::string problem = file.Open(path); !problem.empty()) return refused(std::move(problem));
  if (number < 1 || number > static_cast<int>(file.Items().size()))
    return refused(fmt::format("there is no item {}: the file has {}", number, file.Items().size()));
  const DataItem& item = file.Items()[static_cast<std::size_t>(number - 1)];
  if (item.dimensions != 0 || !file.Time().hasDates) return refused("It is no time series.");
  if (file.Time().steps > kMostValues)
    return refused(fmt::format("It has {} steps, too many to be shown.", file.Time().steps));
  std::vector<float> values(file.Time().steps);
  if (std::string problem = file.Read({number, 0, values.size(), {}}, values, {}, progress); !problem.empty())
    return refused(std::move(problem));
  series.name = item.name;
  series.unit = ShortUnitOf(item);
  series.itemType = item.itemType;
  series.scale = item.scale;
  series.isStepped = item.valueType == ValueType::StepAccumulated || item.valueType == ValueType::MeanStep;
  series.times.Change().reserve(values.size());
  series.values.Change().reserve(values.size());
  for (std::size_t step = 0; step < values.size(); ++step) {
    series.times.push_back(file.Time().Stamp(step));
    series.values.push_back(values[step] == kDeleteValue ? std::numeric_limits<double>::quiet_NaN()
                                                         : static_cast<double>(values[step]));
  }
  return {};
}

struct FileKey {
  std::string path;
  std::vector<FileStamp> stamps;
  int item = 0;           ///< Or the unit of coordinates.
  std::string attribute;  ///< Of a shape file.
  GridSlice slice;

  bool operator==(const FileKey&) const = default;
};

/// The lines around the cells of a grid that hold a value.
std::shared_ptr<Computed<CTvnShapeData>> RecentOutline(const std::string& path, int item) {
  static RecentFiles<FileKey, CTvnShapeData> outlines;
  return outlines.Get({path, {StampOf(path)}, item, {}, {}}, path,
                      [path, item](CTvnShapeData& outline, ProgressPart progress) {
                        CTvn2DOrthoRotatedGridData grid;
                        FileResult read = ReadGridData(path, item, grid, progress);
                        if (read.Ok()) MakeOutline(grid, outline);
                        return read;
                      });
}

}  // namespace

std::shared_ptr<ComputedGrid> RecentGrid(const std::string& path, int item, const GridSlice& slice) {
  static RecentFiles<FileKey, CTvn2DOrthoRotatedGridData> grids;
  return grids.Get({path, {StampOf(path)}, item, {}, slice}, path,
                   [path, item, slice](CTvn2DOrthoRotatedGridData& grid, ProgressPart progress) {
                     return ReadGridData(path, item, grid, progress, slice);
                   });
}

std::shared_ptr<Computed<CTvnShapeData>> RecentShapes(const std::string& path, const std::string& attribute,
                                                      int axisUnit) {
  static RecentFiles<FileKey, CTvnShapeData> files;
  return files.Get({path, StampsOfShape(path), axisUnit, attribute, {}}, path,
                   [path, attribute, axisUnit](CTvnShapeData& shapes, ProgressPart progress) {
                     shapes.SetAxisLengthUnit(axisUnit);
                     return attribute.empty() ? shapes.ReadShapeFile(path, progress)
                                              : shapes.ReadShapeAndDbfFile(path, attribute, progress);
                   });
}

MapContent GridMap(const CYbSEKvfBase& node, std::shared_ptr<const CTvn2DOrthoRotatedGridData> grid,
                   const std::string& problem) {
  MapContent map;
  map.message = problem;
  if (!grid) return map;
  GridLayer layer;
  layer.isCodes = grid->ItemType() == quantity::kCode;
  layer.grid = std::move(grid);
  if (const COverlaysKvf* overlays = node.Important(kOverlays))
    layer.transparency = static_cast<double>(overlays->CurrentTransparency());
  map.grids.push_back(std::move(layer));
  AddBackdrop(node, map);
  return map;
}

void AddBackdrop(const CYbSEKvfBase& node, MapContent& map) {
  AddDomainOutline(node, map);
  const COverlaysKvf* overlays = node.Important(kOverlays);
  if (!overlays) return;
  map.below = BuildPlotOverlays(overlays->Background(), map.awaited);
  map.above = BuildPlotOverlays(overlays->Foreground(), map.awaited);
}

void AddDomainOutline(const CYbSEKvfBase& node, MapContent& map) {
  const CCatchmentKvf* domain = node.Important(kDomain);
  for (const CYbSEKvfBase* above = &node; domain && above; above = above->GetParent())
    if (above == domain) domain = nullptr;
  if (!domain) return;
  const auto show = [&map](const std::shared_ptr<Computed<CTvnShapeData>>& outline) {
    map.domain = NowOrAwaited(outline, map.awaited);
  };
  const bool isShape = domain->Type == CCatchmentKvf::kShapeFile;
  const CData2DShpFile& shape = domain->ShapeFile();
  const CTvnData2DNdsFile& grid = domain->GridFile();
  if (isShape && !shape.File.IsEmpty() && shape.WhyNotValid().empty())
    show(RecentShapes(shape.File.Absolute(), {}, domain->ShapeAxisUnit));
  if (!isShape && !grid.File.IsEmpty() && grid.WhyNotValid().empty())
    show(RecentOutline(grid.File.Absolute(), grid.SelectedItem()));
}

MapContent GridMap(const CYbSEKvfBase& node, const std::shared_ptr<ComputedGrid>& grid) {
  if (!grid) return GridMap(node, nullptr, std::string());
  if (grid->IsDone()) return GridMap(node, grid->Result(), grid->Problem());
  MapContent map;
  map.awaited.push_back(grid);
  return map;
}

MapContent GridFileMap(const CYbSEKvfBase& node, const std::string& path, int item, const GridSlice& slice) {
  return GridMap(node, RecentGrid(path, item, slice));
}

MapContent FileMap(const DataFileNode& file, const GridSlice& slice) {
  if (file.File.IsEmpty()) return GridMap(file, nullptr, "No file is chosen.");
  if (const std::string why = file.WhyNotValid(); !why.empty()) return GridMap(file, nullptr, why);
  return GridFileMap(file, file.File.Absolute(), file.SelectedItem(), slice);
}

MapContent ShapeFileMap(const CData2DShpFile& file, int axisUnit) {
  MapContent map;
  if (file.File.IsEmpty()) {
    map.message = "No file is chosen.";
    return map;
  }
  map.message = file.WhyNotValid();
  if (!map.message.empty()) return map;
  const auto shapes = RecentShapes(file.File.Absolute(), file.Attribute(), axisUnit);
  if (auto data = NowOrAwaited(shapes, map.awaited)) {
    map.shapes.push_back({std::move(data), {}});
    AddBackdrop(file, map);
  } else if (shapes->IsDone()) {
    map.message = shapes->Problem();
  }
  return map;
}

std::shared_ptr<Computed<FileSeries>> RecentSeries(const std::string& path, int item) {
  static RecentFiles<FileKey, FileSeries> files;
  return files.Get(
      {path, {StampOf(path)}, item, {}, {}}, path,
      [path, item](FileSeries& series, ProgressPart progress) { return ReadSeries(path, item, series, progress); });
}

Series InUserUnit(const FileSeries& series, const DisplayUnits* units) {
  Series shown = series;
  const ItemType* const type = series.itemType == quantity::kUndefined ? nullptr : FindItemType(series.itemType);
  if (!type || !series.scale) return shown;
  const Unit& unit = units ? units->UnitOf(*type) : BaseUnit(*type);
  const auto conversion = ConversionBetween(*series.scale, unit.scale);
  if (!conversion) return shown;
  shown.unit = unit.abbreviation;
  // In the same unit the values are taken along as they are: they may be many.
  const bool isSame = (*conversion)(0) == 0 && (*conversion)(1) == 1;
  if (!isSame)
    for (double& value : shown.values.Change()) value = (*conversion)(value);
  return shown;
}

SeriesContent FileChart(const DataFileNode& node) {
  SeriesContent chart;
  if (node.File.IsEmpty()) {
    chart.message = "No file is chosen.";
    return chart;
  }
  if (const auto* period = node.Important(kSimulationPeriod))
    chart.period = {period->GetSimStartDate(), period->SIMEND};
  const auto series = RecentSeries(node.File.Absolute(), node.SelectedItem());
  if (const auto data = NowOrAwaited(series, chart.awaited))
    chart.series.push_back(*data);
  else if (series->IsDone())
    chart.message = series->Problem();
  return chart;
}

std::string ShortUnitOf(const DataItem& item) {
  const Unit* unit = FindUnit(item.unitKey);
  return unit ? std::string(unit->abbreviation) : item.unitText;
}

}  // namespace tervane
