// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "document/flow_model_document.h"
#include "engine/engine_output.h"
#include "engine/report.h"
#include "geometry/grid.h"
#include "modelcells/model_grids.h"
#include "modelcells/model_layers.h"

namespace tervane {

class C2DStationBasedDataKvf;
class CCatchmentKvf;
class CData2DKvf;
class CSimPeriodKvf;
class CFMData0DFile;
class CFMSEKvfBase;
class CSZVerDiscrLayerKvf;
class CSZWellKvf;
class CSatZoneKvf;
class CUnSatInitConditionLayerListKvf;
class CVegetationKvf;
class CellValues;
class CDetailedTSOutputListKvf;
class CodedZonesKvf;
class DataFileNode;
class ExtentKvf;
class ForcingNode;
class VegetationCourse;

/// Puts everything that varies over the model area on the cells of the model, and reports what it made as a tree of
/// pages that mirrors the setup's. A kind of node is known here by its family alone, so that a new member of a family
/// needs nothing.
class Preprocessor {
 public:
  Preprocessor(CFlowModelDoc& document, EngineOutput& log);

  /// Leaves grids and report in the setup's result folder. False when something in use cannot be used, which the log
  /// tells; then the report of an earlier run stands.
  bool Run();

 private:
  bool CheckSetup();
  bool MakeResultFolder();
  bool MakeDomain();
  /// The computational layers, where the setup has some, in a file of their own.
  bool MakeLayers();

  /// Adds pages for what is below a node and takes part.
  void AddPagesBelow(CYbSEKvfBase& node, ReportPage& parent);
  /// Sets what the page of a node shows; false for a node that has nothing to show by itself.
  bool FillPage(CYbSEKvfBase& node, ReportPage& page);
  void ShowDomain(ReportPage& page);
  void ShowQuantity(CData2DKvf& quantity, ReportPage& page);
  void ShowExtent(ExtentKvf& extent, ReportPage& page);
  void ShowSoilValues(const CUnSatInitConditionLayerListKvf& values, ReportPage& page);
  void ShowZones(CodedZonesKvf& zones, ReportPage& page);
  /// What zones want or may take over time, a page each.
  void AddForcings(const ForcingNode& node, ReportPage& page);
  void ShowForcing(C2DStationBasedDataKvf& forcing, ReportPage& page);
  /// The network as lines, which the river model moves the water along.
  void ShowRiver(const CYbSEKvfBase& node, ReportPage& page);
  /// Where the computational layers begin and end.
  void ShowLayers(ReportPage& page);
  /// What holds in the cells of a computational layer.
  void ShowBoundaries(const CSZVerDiscrLayerKvf& layer, ReportPage& page);
  void ShowWells(const CSZWellKvf& wells, ReportPage& page);
  void ShowDetailedPoints(const CDetailedTSOutputListKvf& points, ReportPage& page);
  void ShowVegetation(CVegetationKvf& vegetation, ReportPage& page);
  /// The constants, both series on pages of their own, or which crop grows when.
  void ShowCourse(const VegetationCourse& course, ReportPage& page);
  /// A constant as text, or a series.
  void ShowSeries(bool isConstant, float value, int itemType, const CFMData0DFile& file, ReportPage& page);
  /// A map of the codes of zones or stations, which `owner` bears.
  void ShowZoneMap(CFMSEKvfBase& owner, const CellValues& areas, ReportPage& page);
  void ShowGrid(ModelGrid grid, ReportPage& page);
  /// The mean of the grids of a file over the simulation.
  void ShowMeanGrid(const DataFileNode& file, int itemType, ReportPage& page);
  std::string SummaryText() const;

  CFlowModelDoc& document_;
  EngineOutput& log_;
  const CCatchmentKvf* catchment_;
  const CSimPeriodKvf* period_;
  std::shared_ptr<const CTvn2DOrthoRotatedGridData> domain_;
  ModelGridFile grids_;
  ModelLayers layers_;
  Report report_;
};

}  // namespace tervane
