// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What the functions that read a setup into a flow model share. There is one function for each package; each tells the
// report of the inputs that it takes, and gives false, with an error in the log, where the model cannot be made.
#pragma once

#include <map>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "core/node.h"
#include "modelcells/model_layers.h"
#include "modelcells/work_log.h"
#include "modflow6/export_report.h"
#include "modflow6/flow_model.h"
#include "modflow6/modflow6_export.h"
#include "spatial/data_use.h"

namespace tervane {

class CData2DKvf;
class CSatZoneKvf;

}  // namespace tervane

namespace tervane::modflow6 {

inline constexpr double kSecondsOfDay = 86400;

/// Means of series over the stress periods.
class SeriesOverPeriods {
 public:
  explicit SeriesOverPeriods(const std::vector<Period>& periods);

  /// The mean over each period in SI units, of amounts over steps their rate. Why not, where a period is not covered; a
  /// small part that is missing is told in `note`.
  FileResult Means(const std::string& path, int item, std::vector<double>& means);
  /// That of a constant or a series; a constant is in the base unit of the item type.
  FileResult Means(const ForcingSeries& series, int itemType, std::vector<double>& means);
  /// The mean of an item of grids over a period, likewise.
  FileResult MeanGrid(const std::string& path, int item, std::size_t period, CTvn2DOrthoRotatedGridData& mean) const;

 private:
  std::string NameOf(std::size_t period) const;

  const std::vector<Period>& periods_;
  std::map<std::pair<std::string, int>, std::vector<double>> known_;
};

/// From the base unit of an item type to the unit of SI.
double SiFactorOf(int itemType);

struct Building {
  CYbSEKvfGlobalBase& root;
  const CSatZoneKvf& zone;
  const CTvn2DOrthoRotatedGridData& domain;
  const ModelLayers& levels;
  const Modflow6Options& options;
  WorkLog& log;
  ExportReport& report;
  FlowModel& model;
  SeriesOverPeriods series{model.periods};

  /// An error of a node: the model cannot be made.
  bool Fail(const CYbSEKvfBase& node, const std::string& why) const;
  void Tell(Fate fate, const CYbSEKvfBase& node, std::string text, std::string_view key = {}) const;
  /// The values of a quantity on the cells in SI units; `kDeleteValue` where it has none.
  bool Take(const CData2DKvf& quantity, LayerValues& values) const;

  std::size_t CellCount() const { return domain.Geometry().CellCount(); }
};

/// Periods, TDIS and the transient flags of STO.
bool BuildPeriods(Building& building);
/// DIS: layers with their names, levels and states of cells.
bool BuildDiscretization(Building& building);
/// NPF, STO and IC: what the ground is and where the heads begin.
bool BuildGround(Building& building);
/// CHD, GHB and rates over the boundaries of layers.
bool BuildBoundaries(Building& building);
/// WEL
bool BuildWells(Building& building);
/// DRN
bool BuildDrains(Building& building);
/// What is left out of rivers, and why.
bool BuildRivers(Building& building);
/// RCH
bool BuildRecharge(Building& building);
/// EVT, where an old file has brought what it needs.
bool BuildEvapotranspiration(Building& building);
/// IMS
bool BuildSolver(Building& building);
/// OC
bool BuildOutput(Building& building);

}  // namespace tervane::modflow6
