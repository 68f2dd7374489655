// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <string>

#include "access/accessed_setup.h"
#include "access/climate_inputs.h"

namespace tervane {

/// Where definition files are written: this setting of the program, "C:\CCDefinition_TVN.def" on Windows without it,
/// and elsewhere CCDefinition_TVN.def beside the setup.
inline constexpr const char* kDefinitionSetting = "ClimateChange/DefinitionFile";

/// Tells another program what climate a setup has, lets it put other values and files in their places, and writes a
/// definition file that says where each of them stands. All operations give 1, and 0 when a value or file is not there.
///
/// A definition holds a section for each family, in the order of the calls; a family is counted in the order values,
/// series, grids. Copies share the setup and the definition, which is written once, when the last of them goes.
class CClimateChange_TVN {
 public:
  explicit CClimateChange_TVN(Host* host = nullptr);

  int OpenFile(const std::string& path);
  /// Always 1; whether it was saved is asked of `Error`.
  int SaveFile(const std::string& path);
  const std::string& Error() const;
  CGlobal& Root() const;
  /// Where the definition will be written; empty where no setup tells a place.
  std::string DefinitionFile() const;

  /// In days since 1899-12-30.
  int GetSimulationPeriod(double& start, double& end) const;
  /// Of the origin of the model; 0 and both 0 with a local projection.
  int GetLongLat(double& longitude, double& latitude) const;

  int GetNoPrecValues() { return CountValues(kPrec); }
  int GetNoPrecTimeSeries() { return CountSeries(kPrec); }
  int GetNoPrecGridSeries() { return CountGrids(kPrec); }
  int GetPrecValues(int i, float& value) const { return GetValue(kPrec, i, value); }
  int SetPrecValues(int i, float value) { return SetValue(kPrec, i, value); }
  int GetPrecFileItem(int i, std::string& file, int& item) const { return GetSeries(kPrec, i, file, item); }
  int SetPrecFile(int i, const std::string& file) { return SetSeries(kPrec, i, file); }
  int GetPrecGridFileItem(int i, std::string& file, int& item) const { return GetGrid(kPrec, i, file, item); }
  int SetPrecGridFile(int i, const std::string& file) { return SetGrid(kPrec, i, file); }

  int GetNoEvapValues() { return CountValues(kEvap); }
  int GetNoEvapTimeSeries() { return CountSeries(kEvap); }
  int GetNoEvapGridSeries() { return CountGrids(kEvap); }
  int GetEvapValues(int i, float& value) const { return GetValue(kEvap, i, value); }
  int SetEvapValues(int i, float value) { return SetValue(kEvap, i, value); }
  int GetEvapFileItem(int i, std::string& file, int& item) const { return GetSeries(kEvap, i, file, item); }
  int SetEvapFile(int i, const std::string& file) { return SetSeries(kEvap, i, file); }
  int GetEvapGridFileItem(int i, std::string& file, int& item) const { return GetGrid(kEvap, i, file, item); }
  int SetEvapGridFile(int i, const std::string& file) { return SetGrid(kEvap, i, file); }

  int GetNoTempValues() { return CountValues(kTemp); }
  int GetNoTempTimeSeries() { return CountSeries(kTemp); }
  int GetNoTempGridSeries() { return CountGrids(kTemp); }
  int GetTempValues(int i, float& value) const { return GetValue(kTemp, i, value); }
  int SetTempValues(int i, float value) { return SetValue(kTemp, i, value); }
  int GetTempFileItem(int i, std::string& file, int& item) const { return GetSeries(kTemp, i, file, item); }
  int SetTempFile(int i, const std::string& file) { return SetSeries(kTemp, i, file); }
  int GetTempGridFileItem(int i, std::string& file, int& item) const { return GetGrid(kTemp, i, file, item); }
  int SetTempGridFile(int i, const std::string& file) { return SetGrid(kTemp, i, file); }

 private:
  enum Family : std::size_t { kPrec, kEvap, kTemp };
  struct Shared;

  ClimateInputs Inputs(Family family) const { return {Root(), kClimateFamilies[family]}; }
  int CountValues(Family family);
  int CountSeries(Family family);
  int CountGrids(Family family);
  int GetValue(Family family, int i, float& value) const;
  int SetValue(Family family, int i, float value);
  int GetSeries(Family family, int i, std::string& file, int& item) const;
  int SetSeries(Family family, int i, const std::string& file);
  int GetGrid(Family family, int i, std::string& file, int& item) const;
  int SetGrid(Family family, int i, const std::string& file);
  DataFileNode* SeriesAt(Family family, int i) const;

  std::shared_ptr<Shared> shared_;
};

}  // namespace tervane
