// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/parts/table_of_zones.h"

#include <algorithm>
#include <limits>
#include <map>
#include <set>

#include <fmt/format.h>

#include "data/datafile_facts.h"
#include "pages/parts/file_controls.h"
#include "platform/item_types.h"
#include "platform/text.h"
#include "simspec/periods.h"
#include "spatial/data2d.h"

namespace tervane {

namespace {

constexpr double kUnknown = std::numeric_limits<double>::quiet_NaN();

std::vector<CodedZoneProp*> ZonesOfSource(const ZoneSource& source) {
  std::vector<CodedZoneProp*> zones;
  for (CFMSEKvfGroupBase* item : ZoneItems(source.Owner()))
    if (auto* zone = dynamic_cast<CodedZoneProp*>(item)) zones.push_back(zone);
  return zones;
}

/// The series of a file to choose from.
CellChoices ItemsOf(const DataFileNode& file) {
  CellChoices choices;
  if (file.File.IsEmpty()) return choices;
  const auto facts = DataFileFactsOf(file.File.Absolute());
  for (std::size_t i = 0; i < facts->items.size(); ++i)
    if (facts->items[i].dimensions == 0) choices.emplace_back(static_cast<int>(i) + 1, facts->items[i].name);
  return choices;
}

}  // namespace

TableOfZones::TableOfZones(const ZoneSource& zones, StationColumns columns)
    : zones_(zones), columns_(std::move(columns)) {}

void TableOfZones::Describe(PageForm& form, const CYbSEDlgBase& page) {
  if (!zones_.HasZones()) return;
  auto table =
      std::make_shared<Table>(std::make_shared<ArrangedRows<CodedZoneProp>>([this] { return ZonesOfSource(zones_); }));
  table->ItemName(columns_.series ? "Station" : "Zone");
  table->KeepRows();
  table
      ->Button("", "",
               [&page](const CodedZoneProp& zone) {
                 if (page.Context().selectNode) page.Context().selectNode(zone);
               })
      .Icon("forward")
      .ToolTip("Shows its page")
      .Width(30);
  DescribeWho(*table);
  if (columns_.series) DescribeSeries(*table);
  DescribeArea(*table);
  form.Table(std::move(table)).ShownWhen("there are zones", [this] {
    return zones_.IsInForce() && !ZonesOfSource(zones_).empty();
  });
  form.Notice([this] { return remark_; }).ShownWhen("there is something to tell", [this] {
    return zones_.IsInForce() && !remark_.empty();
  });
}

void TableOfZones::DescribeWho(Table& table) {
  const std::vector<CodedZoneProp*> zones = ZonesOfSource(zones_);
  const auto keyOf = [&zones](ZonePart part, const char* usual) {
    return zones.empty() ? std::string(usual) : std::string(zones.front()->KeyOf(part));
  };
  table
      .Value(
          "Name", [](const CodedZoneProp& zone) { return zone.NAME; },
          [](CodedZoneProp& zone, const std::string& name) {
            zone.NAME = name;
            zone.SetAbbreviatedTitle(name);
          })
      .Key(keyOf(ZonePart::Name, "Name"))
      .Width(115)
      .Hint(kTreeRebuilt | kDataChanged);
  table
      .Value(
          "Code", [](const CodedZoneProp& zone) { return zone.GRIDCODEID; },
          [this](CodedZoneProp& zone, const std::string& id) { return Rename(zone, id); })
      .Key(keyOf(ZonePart::Id, "GRIDCODEID"))
      .Width(55)
      .Hint(kTreeRebuilt | kDataChanged | kRefreshPlots)
      .ToolTip("The grid code, or the value of the polygon, that it stands for");
}

std::string TableOfZones::Rename(CodedZoneProp& zone, const std::string& id) {
  if (id.empty()) return "a code was expected";
  constexpr std::size_t kMostDigits = 9;
  const bool isCode = id.size() <= kMostDigits && id.front() != '0' && std::ranges::all_of(id, IsDigit);
  if (zones_.UsesGridCodes() && !isCode) return "a whole number above 0 was expected";
  if (id == zone.GRIDCODEID) return {};
  if (countOfId_.empty())
    for (const CodedZoneProp* each : ZonesOfSource(zones_)) ++countOfId_[each->GRIDCODEID];
  if (countOfId_[id] > 0) return "a code was expected that no other has";
  --countOfId_[zone.GRIDCODEID];
  ++countOfId_[id];
  zone.SetStationId(id);
  return {};
}

void TableOfZones::DescribeSeries(Table& table) {
  const auto series = columns_.series;
  table
      .Value(
          "File",
          [series](CodedZoneProp& station) {
            const CFMData0DFile* file = series(station);
            return file ? CellValue(file->File) : CellValue(NoCell{"this station has a constant value"});
          },
          [series](CodedZoneProp& station, const CellValue& value) {
            // What was chosen in another file says nothing of this one.
            if (CFMData0DFile* file = series(station)) file->Choose(std::get<FileName>(value));
          })
      .Key("FILE_NAME")
      .Width(120)
      .Filter(kSeriesFileFilter)
      .DefaultExtension("nds0");
  table
      .Choice(
          "Item",
          [series](CodedZoneProp& station) {
            const CFMData0DFile* file = series(station);
            return file ? file->SelectedItem() : 0;
          },
          [series](CodedZoneProp& station, int item) {
            if (CFMData0DFile* file = series(station)) file->Items = {item};
          },
          [series](CodedZoneProp& station) {
            const CFMData0DFile* file = series(station);
            return file ? ItemsOf(*file) : CellChoices();
          })
      .Key("ITEM_NUMBERS")
      .Width(110)
      .GreyWhen([series](CodedZoneProp& station) { return series(station) == nullptr; });
  if (columns_.elevation)
    table
        .Value("Elevation",
               [elevation = columns_.elevation](CodedZoneProp& station) { return CellPlace(elevation(station)); })
        .Width(80)
        .Quantity(quantity::kElevation)
        .Key("Elevation")
        .ShownWhen(columns_.hasElevation);
  const TotalForm form = TotalFormOf(columns_.itemType, ValueType::MeanStep);
  const std::string unit = form.isTotal ? form.unit + "/day" : form.unit;
  const auto meanOf = [this, series](CodedZoneProp& station) -> const SeriesMeans::Mean* {
    const CFMData0DFile* file = series(station);
    if (!file || !means_ || file->File.IsEmpty()) return nullptr;
    const auto found = means_->means.find({file->File.Absolute(), file->SelectedItem()});
    return found == means_->means.end() ? nullptr : &found->second;
  };
  table
      .Value("Mean",
             [meanOf](CodedZoneProp& station) {
               const SeriesMeans::Mean* mean = meanOf(station);
               return mean ? mean->value : kUnknown;
             })
      .Width(85)
      .Unit(unit)
      .ShownAs([meanOf, unit](CodedZoneProp& station) {
        const SeriesMeans::Mean* mean = meanOf(station);
        if (!mean) return std::string();
        return mean->unit == unit ? fmt::format("{:.2f}", mean->value)
                                  : fmt::format("{:.2f} {}", mean->value, mean->unit);
      })
      .ToolTip("Of its series over the simulation");
}

double TableOfZones::CellsOf(const CodedZoneProp& zone) const {
  if (!areas_) return kUnknown;
  const auto found = areas_->cells.cellsOfId.find(zone.GRIDCODEID);
  return found == areas_->cells.cellsOfId.end() ? 0 : static_cast<double>(found->second);
}

void TableOfZones::DescribeArea(Table& table) {
  table.Value("Cells", [this](const CodedZoneProp& zone) { return CellsOf(zone); })
      .Width(55)
      .Format("%.0f")
      .ToolTip("Of the model domain");
  // A station's share says as much, and its table is wide.
  if (!columns_.series)
    table
        .Value("Area",
               [this](const CodedZoneProp& zone) { return areas_ ? CellsOf(zone) * areas_->cellArea / 1e6 : kUnknown; })
        .Width(75)
        .Unit("km²")
        .Format("%.2f");
  table
      .Value("Share",
             [this](const CodedZoneProp& zone) {
               return areas_ && areas_->allCells > 0 ? 100 * CellsOf(zone) / static_cast<double>(areas_->allCells)
                                                     : kUnknown;
             })
      .Width(70)
      .Unit("%")
      .Format("%.2f")
      .ToolTip("Of the cells of the model domain");
  table
      .Value("Ground",
             [this](const CodedZoneProp& zone) {
               if (!areas_) return kUnknown;
               const auto found = areas_->groundOfId.find(zone.GRIDCODEID);
               return found == areas_->groundOfId.end() ? kUnknown : found->second;
             })
      .Width(75)
      .Quantity(quantity::kElevation)
      .Format("%.1f")
      .ToolTip("The mean elevation of the topography in its cells");
}

bool TableOfZones::FollowAreas(Awaited& awaited) {
  std::shared_ptr<const ZoneAreas> areas;
  std::string remark;
  const GridSource source = zones_.CurrentSource();
  const DomainSource domain = AskDomain(*zones_.Owner().GetRoot());
  // Without either file there is nothing to tell, and the page says elsewhere that one is missing.
  if (zones_.HasZones() && !source.file.empty() && !domain.file.empty()) {
    std::shared_ptr<ComputedGrid> ground;
    if (auto* topography = zones_.Owner().Important(kTopography);
        topography && topography->Type != CData2DKvf::kUniform && topography->WhyFileNotValid().empty())
      ground = topography->GridComputation();
    const auto elevations = ground ? NowOrAwaited(ground, awaited) : nullptr;
    if (ground && !ground->IsDone()) return false;
    if (!areasToBe_ || !(source == source_) || !(domain == domain_) || ground != ground_) {
      source_ = source;
      domain_ = domain;
      ground_ = ground;
      areasToBe_ = std::make_shared<Computed<ZoneAreas>>(
          "Counting the cells of the zones", [source, domain, elevations](ZoneAreas& found, ProgressPart progress) {
            return ComputeZoneAreas(domain, source, elevations.get(), progress, found);
          });
    }
    areas = NowOrAwaited(areasToBe_, awaited);
    // What was shown stays until the new areas are there.
    if (!areas && !areasToBe_->IsDone()) return false;
    if (!areas) remark = areasToBe_->Problem();
    if (areas && areas->cells.withoutId > 0)
      remark =
          fmt::format("{} of {} cells of the model domain belong to no zone.", areas->cells.withoutId, areas->allCells);
  }
  const bool isOther = areas != areas_ || remark != remark_;
  areas_ = std::move(areas);
  remark_ = std::move(remark);
  return isOther;
}

std::vector<SeriesOfFile> TableOfZones::UsedSeries() const {
  std::vector<SeriesOfFile> used;
  std::map<std::string, FileStamp> stamps;
  std::set<std::pair<std::string, int>> told;
  for (CodedZoneProp* station : ZonesOfSource(zones_)) {
    const CFMData0DFile* file = columns_.series(*station);
    if (!file || file->File.IsEmpty()) continue;
    std::string path = file->File.Absolute();
    if (!told.emplace(path, file->SelectedItem()).second) continue;
    auto found = stamps.find(path);
    if (found == stamps.end()) found = stamps.emplace(path, StampOf(path)).first;
    used.push_back({std::move(path), found->second, file->SelectedItem()});
  }
  return used;
}

bool TableOfZones::FollowMeans(Awaited& awaited) {
  const auto* period = zones_.Owner().Important(kSimulationPeriod);
  if (!columns_.series || !period || !zones_.IsInForce()) return false;
  const CYbDateTime start = period->GetSimStartDate(), end = period->SIMEND;
  const TimeSpan simulation{start.IsValid() ? start.SecondsSinceEpoch() : 0,
                            end.IsValid() ? end.SecondsSinceEpoch() : 0};
  std::vector<SeriesOfFile> used = UsedSeries();
  if (!meansToBe_ || used != used_ || !(simulation == simulation_)) {
    used_ = std::move(used);
    simulation_ = simulation;
    meansToBe_ = std::make_shared<Computed<SeriesMeans>>(
        "Reading the series of the stations", [series = used_, simulation](SeriesMeans& means, ProgressPart progress) {
          return ComputeMeans(series, simulation, progress, means);
        });
  }
  const auto means = NowOrAwaited(meansToBe_, awaited);
  if (!means && !meansToBe_->IsDone()) return false;
  const bool isOther = means != means_;
  means_ = means;
  return isOther;
}

bool TableOfZones::Follow(Awaited& awaited) {
  countOfId_.clear();
  const bool areOtherAreas = FollowAreas(awaited), areOtherMeans = FollowMeans(awaited);
  return areOtherAreas || areOtherMeans;
}

}  // namespace tervane
