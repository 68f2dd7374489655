// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The climate that drives a setup, as programs that make scenarios see it: values, series and grids by their number.
#pragma once

#include <array>
#include <string>
#include <vector>

#include "core/kvf.h"
#include "document/global.h"
#include "spatial/stations.h"

namespace tervane {

/// A quantity of climate.
struct ClimateFamily {
  const char* name;     ///< For people and on the command line.
  const char* section;  ///< Of the definition file.
  ImportantName<C2DStationBasedDataKvf> node;
};
/// Precipitation, evapotranspiration, temperature.
inline constexpr std::size_t kClimateFamilyCount = 3;
extern const std::array<ClimateFamily, kClimateFamilyCount> kClimateFamilies;

/// A constant with the node that keeps it.
struct ClimateValue {
  float* value;
  CYbSEKvfBase* node;
};

/// The inputs of one quantity, by its distribution in force. A setup without the quantity has none.
class ClimateInputs {
 public:
  ClimateInputs(const CGlobal& root, const ClimateFamily& family);

  C2DStationBasedDataKvf* Node() const { return node_; }
  /// Constants: of the whole model, or of the stations that have one, in their order.
  std::vector<ClimateValue> Values() const;
  /// Files of series, likewise; those of stations also where they name no file.
  std::vector<DataFileNode*> Series() const;
  /// The same without those that name no file.
  std::vector<DataFileNode*> NamedSeries() const;
  /// The file of grids over time; null where there is none.
  DataFileNode* Grid() const;

 private:
  C2DStationBasedDataKvf* node_;
};

// Each writes into an open section where its inputs stand in a setup: the names of sections down to the node, and its
// keys. How many there are.
int DefineValues(KvfFile* definition, const ClimateInputs& inputs);
int DefineSeries(KvfFile* definition, const ClimateInputs& inputs);
int DefineGrids(KvfFile* definition, const ClimateInputs& inputs);
/// Writes a whole definition, with all families.
void DefineClimate(KvfFile* definition, const CGlobal& root);

}  // namespace tervane
