// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// A MODFLOW 6 model of groundwater flow as plain arrays: what the functions that read the setup fill, one for each
// package, and the writers of packages write. Lengths are metres, times days. Cells are counted as in grids: row 0 is
// the southern one.
#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "geometry/grid.h"
#include "platform/dates.h"
#include "platform/files.h"

namespace tervane::modflow6 {

/// A value for each cell of a layer; one for all cells where it holds one only.
class LayerValues {
 public:
  LayerValues() = default;
  explicit LayerValues(float uniform) : values_{uniform} {}
  explicit LayerValues(std::vector<float> values) : values_(std::move(values)) {}

  bool IsEmpty() const { return values_.empty(); }
  bool IsUniform() const { return values_.size() == 1; }
  float At(std::size_t cell) const { return values_[IsUniform() ? 0 : cell]; }
  std::vector<float>& Values() { return values_; }

 private:
  std::vector<float> values_;
};

/// What a cell is in IDOMAIN.
enum CellState : std::int8_t { kPassedThrough = -1, kInactive = 0, kActive = 1 };

struct Layer {
  std::string name;
  std::vector<float> top, bottom;  ///< By cell.
  std::vector<std::int8_t> state;  ///< `CellState` by cell.
  LayerValues conductivity;        ///< Along rows.
  LayerValues acrossRows;          ///< Its ratio to the one along rows; empty where it is 1 everywhere.
  LayerValues vertical;            ///< Conductivity upright.
  LayerValues specificStorage, specificYield;
  LayerValues initialHead;
  LayerValues wetting;  ///< WETDRY; empty without rewetting.

  bool IsActive(std::size_t cell) const { return state[cell] > 0; }
};

/// How an engine that finds its steps itself goes through a period (ATS).
struct AdaptiveSteps {
  double first = 1, least = 1e-5, most = 1000, growth = 2, cut = 5;
};

struct Period {
  CYbDateTime start, end;
  double days = 1;
  int steps = 1;
  double multiplier = 1;
  bool isSteady = false;
  std::optional<AdaptiveSteps> adaptive = {};
  std::string saving = "ALL";  ///< Which steps are saved, as OC says it.
};

/// A cell with a value or two of a boundary package.
struct StressEntry {
  std::uint32_t cell;
  std::uint16_t layer;  ///< From 0 at the top.
  std::uint16_t name;   ///< Place of its name in the package.
  double value;         ///< Head, elevation or rate.
  double conductance;   ///< Only where the package has one.
};

/// Constant heads, heads behind a conductance, drains, or rates.
struct StressPackage {
  std::string_view kind;  ///< "CHD", "GHB", "DRN", "WEL".
  std::string name;       ///< Of the package and of its file's end; at most 16 characters.
  bool savesFlows = false;
  std::vector<std::string> names;
  /// Entries that hold from that period (from 0) to the next one that is named.
  std::map<std::size_t, std::vector<StressEntry>> entries = {};

  bool HasConductance() const { return kind == "GHB" || kind == "DRN"; }
  bool IsEmpty() const;
  std::size_t MostEntries() const;
};

/// Rates over the area of the model (RCH, EVT), made period by period as they are written.
struct AreaStress {
  /// Values by cell that hold from that period (from 0) on.
  using Spans = std::map<std::size_t, std::vector<float>>;

  bool isFixedToCell = false;  ///< Cells below take nothing in the place of one that is inactive.
  bool savesFlows = false;
  Spans layers = {};    ///< From 1; without them the uppermost.
  Spans surfaces = {};  ///< Of EVT alone: elevations at which the rate is full.
  Spans depths = {};    ///< Of EVT alone: below the surface, at which it ends.
  /// The rate by cell in metres a day. False in `isNew` for one that is as in the period before.
  std::function<FileResult(std::size_t period, std::vector<float>& rates, bool& isNew)> rates;
};

/// Numbers of IMS.
struct Solver {
  int outerIterations = 100, innerIterations = 100;
  double headChange = 1e-3;
  double residual = 1e-2;
  double relaxation = 0;
  bool isNewton = false;
  std::string printing = "SUMMARY";
};

struct OutputControl {
  bool savesHead = true, printsHead = false, savesBudget = false, printsBudget = true, savesCellFlows = false;
};

struct Rewetting {
  double factor = 1;
};

struct FlowModel {
  std::string name;   ///< At most 16 characters.
  std::string title;  ///< For people.
  GridGeometry geometry;
  std::vector<Layer> layers;
  std::vector<Period> periods;
  bool hasStorage = true;
  std::optional<Rewetting> rewetting;
  std::vector<StressPackage> stresses;
  std::optional<AreaStress> recharge, evapotranspiration;
  Solver solver;
  OutputControl output;

  double CellArea() const { return geometry.cellSize * geometry.cellSize; }
};

}  // namespace tervane::modflow6
