// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/spatial/plot_content.h"

#include <algorithm>
#include <cmath>
#include <deque>
#include <limits>

#include <fmt/format.h>
#include <fmt/ranges.h>

#include "exchange/grid_state.h"
#include "exchange/overlays.h"
#include "platform/datafile.h"
#include "platform/grid_files.h"
#include "simspec/periods.h"

namespace tervane {

namespace {

constexpr std::size_t kMostValues = 2'000'000;

/// What was read from files lately, shared by all pages: asked for at every change of a page, read once.
template <class Key, class Data>
class RecentFiles {
 public:
  struct Entry {
    Key key;
    std::shared_ptr<const Data> data;
    std::string problem;
  };
  template <class Read>
  const Entry& Get(Key key, const Read& read) {
    const auto found = std::ranges::find(entries_, key, &Entry::key);
    if (found != entries_.end()) {
      std::rotate(entries_.begin(), found, found + 1);
      return entries_.front();
    }
    auto data = std::make_shared<Data>();
    FileResult result = read(*data);
    entries_.push_front({std::move(key), result.Ok() ? data : nullptr, std::move(result.error)});
    if (entries_.size() > kMostFiles) entries_.pop_back();
    return entries_.front();
  }

 private:
  static constexpr std::size_t kMostFiles = 8;
  std::deque<Entry> entries_;
};

struct FileKey {
  std::string path;
  FileStamp stamp;
  int item = 0;           ///< Or the unit of coordinates.
  std::string attribute;  ///< Of a shape file.

  bool operator==(const FileKey&) const = default;
};

using GridEntry = RecentFiles<FileKey, CTvn2DOrthoRotatedGridData>::Entry;
const GridEntry& RecentGrid(const std::string& path, int item) {
  static RecentFiles<FileKey, CTvn2DOrthoRotatedGridData> grids;
  return grids.Get({path, StampOf(path), item, {}},
                   [&](CTvn2DOrthoRotatedGridData& grid) { return ReadGridData(path, item, grid); });
}

using ShapeEntry = RecentFiles<FileKey, CTvnShapeData>::Entry;
const ShapeEntry& RecentShapes(const std::string& path, const std::string& attribute, int axisUnit) {
  static RecentFiles<FileKey, CTvnShapeData> files;
  return files.Get({path, StampOf(path), axisUnit, attribute}, [&](CTvnShapeData& shapes) {
    shapes.SetAxisLengthUnit(axisUnit);
    return attribute.empty() ? shapes.ReadShapeFile(path) : shapes.ReadShapeAndDbfFile(path, attribute);
  });
}

const COverlaysKvf* OverlaysOf(const CYbSEKvfBase& node) { return node.Important<COverlaysKvf>("OVERLAY_DATA"); }

/// Grids and shapes of a list of layers that are shown.
void AddLayers(const COverlayListKvf& list, MapContent& map) {
  for (int number = 1; number <= list.GetItemCount(); ++number) {
    const COverlayItemKvf& item = *list.GetItem(number);
    const OverlayLayer* layer = item.Layer();
    if (!layer || !layer->Display || layer->LayerFile().IsEmpty()) continue;
    if (const auto* grid = dynamic_cast<const COverlayGridKvf*>(layer)) {
      GridLayer drawn;
      drawn.grid = RecentGrid(grid->LayerFile().Absolute(), grid->GridFile().SelectedItem()).data;
      if (!drawn.grid) continue;
      drawn.withLegend = false;
      drawn.transparency = std::min(1.0, static_cast<double>(grid->Transparency));
      map.grids.push_back(std::move(drawn));
    } else if (const auto* shape = dynamic_cast<const COverlayShapeKvf*>(layer)) {
      if (auto data = RecentShapes(shape->LayerFile().Absolute(), {}, shape->ShapeAxisUnit).data)
        map.shapes.push_back({std::move(data), {}});
    }
  }
}

}  // namespace

MapContent GridMap(const CYbSEKvfBase& node, std::shared_ptr<const CTvn2DOrthoRotatedGridData> grid,
                   const std::string& problem) {
  MapContent map;
  map.message = problem;
  if (!grid) return map;
  const COverlaysKvf* overlays = OverlaysOf(node);
  if (overlays) AddLayers(overlays->Background(), map);
  GridLayer layer;
  layer.isCodes = grid->ItemType() == kCodeItemType;
  layer.grid = std::move(grid);
  if (!map.grids.empty() && overlays) layer.transparency = static_cast<double>(overlays->CurrentTransparency());
  // The data come first for what a user points at, whatever lies below them.
  map.grids.insert(map.grids.begin(), std::move(layer));
  if (overlays) AddLayers(overlays->Foreground(), map);
  return map;
}

MapContent FileMap(const DataFileNode& file) {
  if (file.File.IsEmpty()) return GridMap(file, nullptr, "No file is chosen.");
  const GridEntry& grid = RecentGrid(file.File.Absolute(), file.SelectedItem());
  return GridMap(file, grid.data, grid.problem);
}

MapContent ShapeFileMap(const CData2DShpFile& file, int axisUnit) {
  MapContent map;
  if (file.File.IsEmpty()) {
    map.message = "No file is chosen.";
    return map;
  }
  const ShapeEntry& shapes = RecentShapes(file.File.Absolute(), file.Attribute(), axisUnit);
  if (shapes.data)
    map.shapes.push_back({shapes.data, {}});
  else
    map.message = shapes.problem;
  return map;
}

SeriesContent FileChart(const DataFileNode& node) {
  SeriesContent chart;
  if (node.File.IsEmpty()) {
    chart.message = "No file is chosen.";
    return chart;
  }
  if (const auto* period = node.Important<CSimPeriodKvf>("SIMPERIOD"))
    chart.period = {period->GetSimStartDate(), period->SIMEND};
  DataFile file;
  chart.message = file.Open(node.File.Absolute());
  if (!chart.message.empty()) return chart;
  const int number = node.SelectedItem();
  if (number < 1 || number > static_cast<int>(file.Items().size())) {
    chart.message = fmt::format("there is no item {}: the file has {}", number, file.Items().size());
    return chart;
  }
  const DataItem& item = file.Items()[static_cast<std::size_t>(number - 1)];
  if (item.dimensions != 0 || !file.Time().hasDates) {
    chart.message = "It is no time series.";
    return chart;
  }
  if (file.Time().steps > kMostValues) {
    chart.message = fmt::format("It has {} steps, too many to be shown.", file.Time().steps);
    return chart;
  }
  std::vector<float> values(file.Time().steps);
  chart.message = file.Read({number, 0, values.size(), {}}, values);
  if (!chart.message.empty()) return chart;
  Series series;
  series.name = item.name;
  series.unit = item.unitText;
  series.isStepped = item.valueType == ValueType::StepAccumulated || item.valueType == ValueType::MeanStep;
  for (std::size_t step = 0; step < values.size(); ++step) {
    series.times.push_back(file.Time().Stamp(step));
    series.values.push_back(values[step] == kDeleteValue ? std::numeric_limits<double>::quiet_NaN()
                                                         : static_cast<double>(values[step]));
  }
  chart.series.push_back(std::move(series));
  return chart;
}

Control& UnitKeyChoice(PageForm& form, const std::string& label, const char* key, int& unitKey, int itemType) {
  const ItemType* type = FindItemType(itemType);
  std::vector<int> keys;
  std::vector<std::string> texts;
  for (const int unit : type ? type->unitKeys : std::span<const int>()) {
    keys.push_back(unit);
    texts.emplace_back(FindUnit(unit)->text);
  }
  return form
      .Choice(
          label,
          [&unitKey, keys] {
            const auto found = std::ranges::find(keys, unitKey);
            return found == keys.end() ? unitKey : static_cast<int>(found - keys.begin());
          },
          [&unitKey, keys](int choice) {
            if (choice >= 0 && choice < static_cast<int>(keys.size())) unitKey = keys[static_cast<std::size_t>(choice)];
          },
          std::move(texts))
      .Key(key);
}

Control& GapFillChoice(PageForm& form, std::string& filler, const CFMSEKvfBase& owner) {
  return form
      .Choice(
          "Fill Gaps with:",
          [&filler, &owner] {
            const std::vector<std::string> names = ZoneItemTitles(owner);
            return static_cast<int>(std::ranges::find(names, filler) - names.begin());
          },
          [&filler, &owner](int choice) {
            const std::vector<std::string> names = ZoneItemTitles(owner);
            if (choice >= 0 && choice < static_cast<int>(names.size()))
              filler = names[static_cast<std::size_t>(choice)];
          },
          [&filler, &owner] {
            std::vector<std::string> options = ZoneItemTitles(owner);
            // A name that nobody bears stands behind the others until another one is chosen.
            if (std::ranges::find(options, filler) == options.end())
              options.push_back(filler.empty() ? filler : filler + " (not in the list)");
            return options;
          })
      .Key("ShapeGapFillName");
}

void KeepGapFill(std::string& filler, const CFMSEKvfBase& owner) {
  const std::vector<std::string> names = ZoneItemTitles(owner);
  if (!names.empty() && std::ranges::find(names, filler) == names.end()) filler = names.front();
}

int SyncOrAsk(Host& host, const FoundZones& found, const SyncPlan& plan, const std::function<SyncResult()>& sync) {
  if (!found.unreadable.empty()) {
    host.Tell(fmt::format("{}\n\nThe zones stay as they are.", found.unreadable), Host::Icon::Warning);
    return kDataChanged;
  }
  if (!found.message.empty()) {
    host.Tell(found.message, Host::Icon::Warning);
    return kDataChanged;
  }
  if (!plan.editedRemoved.empty()) {
    std::vector<std::string> names;
    for (const CFMSEKvfGroupBase* zone : plan.editedRemoved) names.push_back(zone->GetStationName());
    const std::string question = fmt::format(
        "These hold values of yours and would be removed:\n\n{}\n\nRemove them? With No all stay as they are.",
        fmt::join(names, "\n"));
    if (host.Ask(question, Host::Icon::Question, Host::Buttons::YesNo) != Host::Answer::Yes) return kDataChanged;
  }
  switch (sync()) {
    case kAdded:
      return kItemAdded | kOrderChanged;
    case kRemoved:
      return kItemDeleted | kOrderChanged;
    case kAddedAndRemoved:
      return kItemDeleted | kItemAdded | kOrderChanged;
    case kReordered:
      return kOrderChanged;
    case kNothing:
      break;
  }
  return kDataChanged;
}

void EditDataFile(const PageContext& context, const CYbSEKvfBase& node, const FileName& file) {
  if (const COverlaysKvf* overlays = OverlaysOf(node)) {
    if (PrepareGridState(*overlays, file, std::nullopt, context.host).empty()) return;
  }
  if (context.openDataFile) context.openDataFile(file.Absolute());
}

bool MayCreateFile(const PageContext& context) {
  if (!context.document.PathName().empty()) return true;
  context.host.Tell("You must save your setup before you can create a file.", Host::Icon::Warning);
  return false;
}

}  // namespace tervane
