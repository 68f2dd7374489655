// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "access/climate_inputs.h"

#include <algorithm>

#include "platform/text.h"
#include "surface/climate.h"

namespace tervane {

const std::array<ClimateFamily, kClimateFamilyCount> kClimateFamilies{
    ClimateFamily{"precipitation", "Precipitation", kPrecipitation},
    ClimateFamily{"evapotranspiration", "Evaporation", kReferenceEvapotranspiration},
    ClimateFamily{"temperature", "Temperature", kAirTemperature},
};

namespace {

template <class Visit>
void ForEachStation(const C2DStationBasedDataKvf& node, Visit visit) {
  for (CYbSEKvfBase* child = node.GetFirstChild(); child; child = node.GetNextChild(child))
    if (auto* station = dynamic_cast<C2DStationBasedDataTimeSeriesKvf*>(child)) visit(*station);
}

}  // namespace

ClimateInputs::ClimateInputs(const CGlobal& root, const ClimateFamily& family) : node_(root.Important(family.node)) {}

std::vector<ClimateValue> ClimateInputs::Values() const {
  std::vector<ClimateValue> values;
  if (!node_) return values;
  CGlobalKvf& global = node_->Global();
  if (node_->DistributionType == StationOwnerKvf::kUniform && global.TYPE == CGlobalKvf::kConstant)
    values.push_back({&global.FIXED_VALUE, &global});
  if (node_->DistributionType == StationOwnerKvf::kStationBased)
    ForEachStation(*node_, [&](C2DStationBasedDataTimeSeriesKvf& station) {
      if (station.TYPE == C2DStationBasedDataTimeSeriesKvf::kConstant)
        values.push_back({&station.FIXED_VALUE, &station});
    });
  return values;
}

std::vector<DataFileNode*> ClimateInputs::Series() const {
  std::vector<DataFileNode*> series;
  if (!node_) return series;
  const CGlobalKvf& global = node_->Global();
  if (node_->DistributionType == StationOwnerKvf::kUniform && global.TYPE == CGlobalKvf::kTimeVarying)
    series.push_back(&global.SeriesFile());
  if (node_->DistributionType == StationOwnerKvf::kStationBased)
    ForEachStation(*node_, [&](const C2DStationBasedDataTimeSeriesKvf& station) {
      if (station.TYPE == C2DStationBasedDataTimeSeriesKvf::kTimeVarying) series.push_back(&station.SeriesFile());
    });
  return series;
}

std::vector<DataFileNode*> ClimateInputs::NamedSeries() const {
  std::vector<DataFileNode*> series = Series();
  std::erase_if(series, [](const DataFileNode* file) { return file->File.IsEmpty(); });
  return series;
}

DataFileNode* ClimateInputs::Grid() const {
  if (!node_ || node_->DistributionType != StationOwnerKvf::kFullyDistributed) return nullptr;
  DataFileNode& file = node_->FullyDistributed().GridFile();
  return file.File.IsEmpty() ? nullptr : &file;
}

// ---- Definitions

namespace {

/// The number of a station in its section; -1 for a node that is none.
int NumberOfStation(const CYbSEKvfBase& node) {
  return dynamic_cast<const StationKvf*>(&node) ? node.GetNumberWhatAmI() : -1;
}

/// Of a station `owner` is the node of its number.
void WritePlace(KvfFile* file, const CYbSEKvfBase& node, const CYbSEKvfBase& owner, const char* keyword,
                const std::vector<const char*>& keys) {
  const int number = NumberOfStation(owner);
  std::vector<const CYbSEKvfBase*> way;
  for (const CYbSEKvfBase* above = &node; above->GetParent(); above = above->GetParent()) way.push_back(above);
  kvfAddKeyword(file, keyword);
  for (auto step = way.rbegin(); step != way.rend(); ++step) {
    std::string name = (*step)->GetSectionName();
    if (name.empty()) continue;
    // Without a station names are taken as they stand.
    if (number != -1) name = Replaced(name, "%d", std::to_string(number));
    kvfAddString(file, name);
    kvfAddInt(file, 1);
  }
  kvfAddKeyword(file, "Para");
  for (const char* key : keys) kvfAddString(file, key);
}

const std::vector<const char*> kFileKeys{"FILE_NAME", "ITEM_NUMBERS"};

}  // namespace

int DefineValues(KvfFile* definition, const ClimateInputs& inputs) {
  const std::vector<ClimateValue> values = inputs.Values();
  for (const ClimateValue& value : values)
    WritePlace(definition, *value.node, *value.node, "Section_ConstValue", {"FIXED_VALUE"});
  return static_cast<int>(values.size());
}

int DefineSeries(KvfFile* definition, const ClimateInputs& inputs) {
  const std::vector<DataFileNode*> series = inputs.NamedSeries();
  for (const DataFileNode* file : series)
    WritePlace(definition, *file, *file->GetParent(), "Section_TimeSeries", kFileKeys);
  return static_cast<int>(series.size());
}

int DefineGrids(KvfFile* definition, const ClimateInputs& inputs) {
  const DataFileNode* grid = inputs.Grid();
  if (grid) WritePlace(definition, *grid, *grid->GetParent(), "Section_GridTimeSeries", kFileKeys);
  return grid ? 1 : 0;
}

void DefineClimate(KvfFile* definition, const CGlobal& root) {
  kvfAddTarget(definition, "CCCompare");
  for (const ClimateFamily& family : kClimateFamilies) {
    const ClimateInputs inputs(root, family);
    kvfAddSection(definition, family.section);
    DefineValues(definition, inputs);
    DefineSeries(definition, inputs);
    DefineGrids(definition, inputs);
    kvfEndSection(definition);
  }
  kvfEndSection(definition);
}

}  // namespace tervane
