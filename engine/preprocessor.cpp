// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "engine/preprocessor.h"

#include <algorithm>
#include <filesystem>
#include <utility>

#include <fmt/format.h>

#include "data/datafile.h"
#include "data/datafile_request.h"
#include "data/grid_files.h"
#include "engine/detailed_output.h"
#include "engine/modflow_report.h"
#include "engine/result_catalogue.h"
#include "geometry/grid_polygons.h"
#include "geometry/shapes.h"
#include "platform/item_types.h"
#include "platform/paths.h"
#include "platform/text.h"
#include "platform/units.h"
#include "simspec/periods.h"
#include "simspec/river_branches.h"
#include "simspec/river_files.h"
#include "spatial/data2d.h"
#include "spatial/domain.h"
#include "spatial/domain_boundary.h"
#include "spatial/owner_titles.h"
#include "spatial/soil_layers.h"
#include "spatial/stations.h"
#include "spatial/zones.h"
#include "subsurface/computational_layers.h"
#include "subsurface/saturated_zone.h"
#include "subsurface/wells.h"
#include "surface/stress_period_grids.h"
#include "surface/vegetation.h"
#include "wqpt/extent.h"

namespace tervane {

namespace {

std::string WithDetail(const Finding& finding) {
  return finding.detail.empty() ? finding.text : fmt::format("{} ({})", finding.text, finding.detail);
}

std::string FindingPath(const std::string& path, const Finding& finding) {
  return finding.key.empty() ? path : path + ":" + finding.key;
}

/// A value in the base unit of its quantity, with the unit.
std::string WithUnit(double value, int itemType) {
  const ItemType* type = FindItemType(itemType);
  if (!type) return FormatNumber(value, "%.6g");
  const std::string number = FormatQuantity(value, *type, BaseUnit(*type).key);
  const std::string_view unit = BaseUnit(*type).abbreviation;
  return unit.empty() || unit == "-" ? number : fmt::format("{} {}", number, unit);
}

/// When which crop grows, a line each.
std::string CropsText(const CropDevelopment& development) {
  constexpr std::size_t kMostLines = 1000;
  std::string text = development.problem;
  for (std::size_t i = 0; i < development.stretches.size(); ++i) {
    const CropStretch& stretch = development.stretches[i];
    if (i == kMostLines) return text + fmt::format("and {} lines more", development.stretches.size() - i);
    if (stretch.kind == CropStretch::Kind::Overlap) continue;
    text += fmt::format("{} to {}: {}\n", DateInWords(CYbDateTime::FromSecondsSinceEpoch(stretch.span.start)),
                        DateInWords(CYbDateTime::FromSecondsSinceEpoch(stretch.span.end)),
                        stretch.file ? stretch.file->VegetationName() : "no crop");
  }
  return text;
}

/// The mean of the steps of a file of grids that share some time with a period, or of all steps where the file has no
/// dates.
FileResult MeanOfSteps(const std::string& path, int number, const CYbDateTime& start, const CYbDateTime& end,
                       CTvn2DOrthoRotatedGridData& grid) {
  // The first step brings geometry and unit.
  if (FileResult read = ReadGridData(path, number, grid); !read.Ok()) return read;
  DataFile file;
  if (const std::string error = file.Open(path); !error.empty()) return {error, {}};
  const std::size_t cells = grid.Geometry().CellCount();
  std::vector<double> sums(cells, 0.0);
  std::vector<std::uint32_t> counts(cells, 0);
  std::vector<float> values(cells);
  for (std::size_t step = 0; step < file.Time().steps; ++step) {
    // A stamp is the end of its step.
    const bool isWithin =
        !file.Time().hasDates || (file.Time().Stamp(step) > start && (step == 0 || file.Time().Stamp(step - 1) < end));
    if (!isWithin) continue;
    if (const std::string error = file.Read({number, step, 1, {}}, values, grid.ItemType()); !error.empty())
      return {error, {}};
    for (std::size_t cell = 0; cell < cells; ++cell) {
      if (values[cell] == kDeleteValue) continue;
      sums[cell] += static_cast<double>(values[cell]);
      ++counts[cell];
    }
  }
  float* means = grid.GetData();
  for (std::size_t cell = 0; cell < cells; ++cell)
    means[cell] = counts[cell] ? static_cast<float>(sums[cell] / counts[cell]) : grid.DeleteValue();
  return {};
}

}  // namespace

Preprocessor::Preprocessor(CFlowModelDoc& document, EngineOutput& log)
    : document_(document),
      log_(log),
      catchment_(document.Root().Important(kDomain)),
      period_(document.Root().Important(kSimulationPeriod)),
      grids_(ResolvedPath(ResultFileName(document.getResultFolder(),
                                         std::string(BaseNameOf(document.PathName())) + "_PreProcessed", ".nds2"),
                          {})) {}

bool Preprocessor::Run() {
  log_.Progress(2, "Checking the setup");
  if (!CheckSetup() || !MakeResultFolder() || !MakeDomain() || !MakeLayers()) return false;
  report_.top.title = std::string(BaseNameOf(document_.PathName()));
  AddPagesBelow(document_.Root(), report_.top);
  if (!grids_.Write(*domain_, log_)) return false;
  log_.Progress(95, "Writing the report");
  report_.top.ShowText(SummaryText());
  const std::string path = ResolvedPath(document_.PreprocessorReport(), {});
  if (const std::string error = WriteReport(path, report_); !error.empty()) {
    log_.Error({}, error);
    return false;
  }
  log_.Line("wrote " + path);
  const std::string catalogue = ResolvedPath(document_.SimulationCatalogue(), {});
  if (const std::string error = WriteCatalogueOfInput(catalogue, grids_, report_.lowerLevelFile, *domain_);
      !error.empty())
    log_.Warning({}, error);
  else
    log_.Line("wrote " + catalogue);
  return true;
}

bool Preprocessor::CheckSetup() {
  WalkNodes(document_.Root(), [&](const NodePlace& place) {
    if (!place.takesPart) return;
    // A period that is not covered is a warning in the editor, and an error in a computation.
    const auto* file = dynamic_cast<const DataFileNode*>(&place.node);
    const bool isNeeded = file && file->IsFileUsed();
    const std::string problem =
        isNeeded ? WhyNotMet(file->File.Absolute(), file->Items, file->SelectionRequest()) : std::string();
    if (!problem.empty()) return log_.Error(place.path + ":FILE_NAME", problem);
    for (const Finding& finding : place.node.Findings()) {
      const std::string where = FindingPath(place.path, finding);
      if (finding.severity == Severity::Error) log_.Error(where, WithDetail(finding));
      if (finding.severity == Severity::Warning) log_.Warning(where, WithDetail(finding));
    }
  });
  return log_.Errors() == 0;
}

bool Preprocessor::MakeResultFolder() {
  const std::string folder(FolderOf(grids_.Path()));
  std::error_code error;
  std::filesystem::create_directories(NativePath(folder), error);
  if (error) log_.Error({}, fmt::format("cannot make the folder of the results, {}: {}", folder, error.message()));
  return !error;
}

bool Preprocessor::MakeDomain() {
  std::string problem = "the setup has no domain";
  if (catchment_) domain_ = catchment_->GetDomainGrid(&problem);
  if (!domain_) log_.Error(catchment_ ? PathOf(*catchment_) : std::string(), problem);
  return domain_ != nullptr;
}

bool Preprocessor::MakeLayers() {
  auto* zone = document_.Root().Important(kSaturatedZone);
  if (!zone || !zone->IsDataUsedInSetup()) return true;
  log_.Progress(5, "Computational layers");
  if (!layers_.Make(*zone, *domain_, log_)) return false;
  if (layers_.IsEmpty()) return true;
  const std::string path = fmt::format("{}/{}.nds3", FolderOf(grids_.Path()), BaseNameOf(grids_.Path()));
  const FileResult written = layers_.Write(path, *domain_);
  if (!written.Ok()) log_.Error({}, written.error);
  report_.lowerLevelFile = path;
  report_.lowerLevelItem = ModelLayers::kLowerLevels;
  report_.numberOfLayers = layers_.Count();
  return written.Ok();
}

// ---- Pages

void Preprocessor::AddPagesBelow(CYbSEKvfBase& node, ReportPage& parent) {
  for (CYbSEKvfBase* child = node.GetFirstChild(); child; child = node.GetNextChild(child)) {
    if (!child->IsDataUsedInSetup()) continue;
    ReportPage page;
    page.title = child->GetTitle();
    page.abbreviatedTitle = child->GetAbbreviatedTitle();
    const bool isFilled = FillPage(*child, page);
    AddPagesBelow(*child, page);
    if (isFilled || !page.pages.empty()) parent.pages.push_back(std::move(page));
  }
}

bool Preprocessor::FillPage(CYbSEKvfBase& node, ReportPage& page) {
  if (&node == catchment_) {
    ShowDomain(page);
  } else if (dynamic_cast<const RiverFiles*>(&node) || dynamic_cast<const RiverNetworkFile*>(&node)) {
    ShowRiver(node, page);
  } else if (dynamic_cast<const CSatZoneKvf*>(&node)) {
    ShowLayers(page);
  } else if (const auto* layer = dynamic_cast<const CSZVerDiscrLayerKvf*>(&node)) {
    ShowBoundaries(*layer, page);
  } else if (const auto* periods = dynamic_cast<const CStressPeriodsKvf*>(&node)) {
    page.ShowText(StressPeriodsText(*periods));
  } else if (const auto* output = dynamic_cast<const COutputModKvf*>(&node)) {
    page.ShowText(PackagesText(*output));
  } else if (const auto* spans = dynamic_cast<const CRechargeAndPondingModListKvf*>(&node)) {
    page.ShowText(SpansText(*spans));
  } else if (const auto* wells = dynamic_cast<const CSZWellKvf*>(&node)) {
    ShowWells(*wells, page);
  } else if (const auto* points = dynamic_cast<const CDetailedTSOutputListKvf*>(&node);
             points && points->GetItemCount() > 0) {
    ShowDetailedPoints(*points, page);
  } else if (auto* quantity = dynamic_cast<CData2DKvf*>(&node)) {
    ShowQuantity(*quantity, page);
  } else if (auto* extent = dynamic_cast<ExtentKvf*>(&node)) {
    ShowExtent(*extent, page);
  } else if (const auto* soil = dynamic_cast<const CUnSatInitConditionLayerListKvf*>(&node)) {
    ShowSoilValues(*soil, page);
  } else if (auto* zones = dynamic_cast<CodedZonesKvf*>(&node)) {
    ShowZones(*zones, page);
    if (const auto* driver = dynamic_cast<const ForcingNode*>(&node)) AddForcings(*driver, page);
  } else if (auto* forcing = dynamic_cast<C2DStationBasedDataKvf*>(&node)) {
    ShowForcing(*forcing, page);
  } else if (const auto* station = dynamic_cast<const C2DStationBasedDataTimeSeriesKvf*>(&node)) {
    page.title = station->GetStationName();
    const auto* owner = dynamic_cast<const C2DStationBasedDataKvf*>(station->GetParent());
    ShowSeries(station->TYPE == C2DStationBasedDataTimeSeriesKvf::kConstant, station->FIXED_VALUE,
               owner ? owner->GetItemType() : quantity::kUndefined, station->SeriesFile(), page);
  } else if (auto* vegetation = dynamic_cast<CVegetationKvf*>(&node)) {
    ShowVegetation(*vegetation, page);
  } else if (const auto* growth = dynamic_cast<const CVegetationTimeSeriesKvf*>(&node)) {
    page.title = growth->GetStationName();
    ShowCourse(*growth, page);
  } else if (const auto* series = dynamic_cast<const CTimeseriesConstKvf*>(&node)) {
    const CGlobalKvf& global = series->Global();
    ShowSeries(global.TYPE == CGlobalKvf::kConstant, global.FIXED_VALUE, series->GetItemType(), global.SeriesFile(),
               page);
  } else {
    return false;
  }
  return true;
}

void Preprocessor::ShowGrid(ModelGrid grid, ReportPage& page) {
  // In the list of all grids and in messages a quantity needs the name of what it is a part of.
  if (const CYbSEKvfBase* node = FindNode(document_.Root(), ParseSetupPath(grid.place).steps))
    grid.title = WithOwners(OwnersOf(*node), grid.title);
  page.ShowGrid(grids_.Path(), grids_.Add(std::move(grid)));
}

void Preprocessor::ShowRiver(const CYbSEKvfBase& node, ReportPage& page) {
  const RiverBranches branches = RiverBranches::Of(node);
  const RiverReading& river = branches.Reading();
  const auto cannotShow = [&](const std::string& problem) {
    log_.Warning(PathOf(node), problem);
    page.ShowText(problem);
  };
  if (!branches.AreKnown()) return cannotShow(river.problem.empty() ? "the river has no branches" : river.problem);
  for (const RiverFinding& finding : river.findings)
    log_.Warning(PathOf(node), FindingText(river.network.Path(), finding));
  CTvnShapeData lines;
  lines.Create(ShapeKind::Line, {{"NAME", AttributeKind::Text}}, domain_->Geometry().projection);
  for (const RiverBranch& branch : river.network.branches) {
    Shape line;
    for (const RiverPoint& point : branch.points) line.points.push_back(point.place);
    line.parts = {0};
    line.values = {branch.name};
    if (line.points.size() > 1) lines.AddShape(std::move(line));
  }
  const std::string path = fmt::format("{}/{}_Rivers.shp", FolderOf(grids_.Path()), BaseNameOf(grids_.Path()));
  if (const FileResult saved = lines.SaveShapeFile(path); !saved.Ok()) return cannotShow(saved.error);
  page.ShowShapes(path, BaseUnit(*FindItemType(quantity::kMapCoordinate)).key);
}

void Preprocessor::ShowDomain(ReportPage& page) {
  const auto copy = [this](CTvn2DOrthoRotatedGridData& grid) {
    grid = *domain_;
    return FileResult{};
  };
  const auto nameOfCode = [](int code) { return std::string(code == 2 ? "outer boundary" : "inside"); };
  ShowGrid({page.title, PathOf(*catchment_), quantity::kCode, copy, nameOfCode, false, {}, {}}, page);

  CGeoDataBoundCondCatchmentData boundary;
  std::string problem = boundary.TakeValues(domain_->Geometry(), domain_->Values(), domain_->DeleteValue(),
                                            domain_->ItemUnit(), domain_->ItemType());
  if (problem.empty() && boundary.PrepareBoundary(problem)) {
    ReportPage& child = page.pages.emplace_back();
    child.title = "Outer Boundary";
    child.ShowText(fmt::format(
        "The outer boundary has {} cells. It begins at column {}, row {} from the south and runs clockwise.",
        boundary.BoundaryCells.size(), boundary.StartCell.i + 1, boundary.StartCell.j + 1));
  } else {
    log_.Warning(PathOf(*catchment_), "the outer boundary cannot be traced" + (problem.empty() ? "" : ": " + problem));
  }
}

void Preprocessor::ShowLayers(ReportPage& page) {
  if (layers_.IsEmpty()) return page.ShowText("The setup tells no levels of computational layers.");
  page.pages.resize(2);
  page.pages[0].title = "Lower Levels of Computational Layers";
  page.pages[0].ShowLayers(report_.lowerLevelFile, ModelLayers::kLowerLevels);
  page.pages[1].title = "Upper Levels of Computational Layers";
  page.pages[1].ShowLayers(report_.lowerLevelFile, ModelLayers::kUpperLevels);
}

void Preprocessor::ShowBoundaries(const CSZVerDiscrLayerKvf& layer, ReportPage& page) {
  ReportPage& child = page.pages.emplace_back();
  child.title = "Boundary Codes";
  const auto make = [&layer, domain = domain_](CTvn2DOrthoRotatedGridData& grid) {
    return BoundaryCodes(layer, *domain, grid);
  };
  ShowGrid({fmt::format("Boundary Codes, {}", layer.GetAbbreviatedTitle()),
            PathOf(layer),
            quantity::kCode,
            make,
            boundary_code::NameOf,
            false,
            {},
            {}},
           child);
}

void Preprocessor::ShowWells(const CSZWellKvf& wells, ReportPage& page) {
  const std::string path = wells.Filename.IsEmpty() ? std::string() : wells.Filename.Absolute();
  page.ShowText(WellsOnModel(path, *domain_, layers_, PathOf(wells), log_));
}

void Preprocessor::ShowDetailedPoints(const CDetailedTSOutputListKvf& points, ReportPage& page) {
  // Beside the page on which a simulation shows them.
  const std::string shown = ResolvedPath(document_.DetailedTimeSeriesPage(), {});
  const std::string series = shown.substr(0, shown.size() - ExtensionOf(shown).size()) + ".nds0";
  report_.detailedPoints = PlaceDetailedPoints(points, *domain_, layers_, series, log_);
  page.ShowText(DetailedPointsText(report_.detailedPoints));
}

void Preprocessor::ShowQuantity(CData2DKvf& quantity, ReportPage& page) {
  ShowGrid({page.title,
            PathOf(quantity),
            quantity.GetItemType(),
            MakeQuantity(quantity, domain_->Geometry()),
            {},
            quantity.MayLeaveCells(),
            {},
            {}},
           page);
  if (&quantity != document_.Root().Important(kTopography)) return;
  report_.topographyFile = grids_.Path();
  report_.topographyItem = static_cast<int>(grids_.Grids().size());
}

void Preprocessor::ShowExtent(ExtentKvf& extent, ReportPage& page) {
  const auto make = [source = extent.CurrentSource(),
                     polygons = extent.GridComputation()](CTvn2DOrthoRotatedGridData& grid) -> FileResult {
    if (!polygons) return BuildGrid(source, {}, grid);
    polygons->Run();
    if (!polygons->Result()) return {polygons->Problem(), {}};
    grid = *polygons->Result();
    return {};
  };
  const auto nameOfCode = [](int) { return std::string("inside"); };
  ShowGrid({page.title, PathOf(extent), quantity::kCode, make, nameOfCode, true, {}, {}}, page);
}

void Preprocessor::ShowSoilValues(const CUnSatInitConditionLayerListKvf& values, ReportPage& page) {
  switch (values.DistributionType) {
    case CUnSatInitConditionLayerListKvf::kUniform:
      return page.ShowText(
          fmt::format("{} at all depths", WithUnit(values.Distribution_UniformValue, values.GetItemType())));
    case CUnSatInitConditionLayerListKvf::kByLayers:
      // The pages below have them.
      return page.ShowText(fmt::format("By layers: {}", values.GetItemCount()));
    default:
      return page.ShowLayers(values.GridFile().File.Absolute(), values.GridFile().SelectedItem());
  }
}

void Preprocessor::ShowZones(CodedZonesKvf& zones, ReportPage& page) {
  if (zones.Type == ZoneSource::kNone) return page.ShowText("There are no zones.");
  if (zones.DistributionType == CodedZonesKvf::kUniform) return page.ShowText("One zone for the whole area.");
  ShowZoneMap(zones, zones, page);
}

void Preprocessor::AddForcings(const ForcingNode& node, ReportPage& page) {
  for (const Forcing& forcing : node.CurrentForcings()) {
    for (const ForcingSeries& series : forcing.series) {
      ReportPage& child = page.pages.emplace_back();
      child.title = fmt::format("{}, {}", forcing.title, series.name);
      if (series.constant)
        child.ShowText(fmt::format("{}, constant", WithUnit(*series.constant, forcing.itemType)));
      else
        child.ShowSeries(series.path, series.item, period_->GetSimStartDate(), period_->SIMEND);
    }
  }
}

void Preprocessor::ShowForcing(C2DStationBasedDataKvf& forcing, ReportPage& page) {
  const CGlobalKvf& global = forcing.Global();
  switch (forcing.DistributionType) {
    case C2DStationBasedDataKvf::kStationBased:
      return ShowZoneMap(forcing, forcing.Stations(), page);
    case C2DStationBasedDataKvf::kFullyDistributed:
      return ShowMeanGrid(forcing.FullyDistributed().GridFile(), forcing.GetItemType(), page);
    default:
      return ShowSeries(global.TYPE == CGlobalKvf::kConstant, global.FIXED_VALUE, forcing.GetItemType(),
                        global.SeriesFile(), page);
  }
}

void Preprocessor::ShowMeanGrid(const DataFileNode& file, int itemType, ReportPage& page) {
  auto make = [path = file.File.Absolute(), item = file.SelectedItem(), start = period_->GetSimStartDate(),
               end = period_->SIMEND](CTvn2DOrthoRotatedGridData& grid) {
    return MeanOfSteps(path, item, start, end, grid);
  };
  page.title += ", mean of the time steps";
  ShowGrid({page.title, PathOf(file), itemType, std::move(make), {}, false, {}, {}}, page);
}

void Preprocessor::ShowVegetation(CVegetationKvf& vegetation, ReportPage& page) {
  switch (vegetation.DistributionType) {
    case CVegetationKvf::kStationBased:
      return ShowZoneMap(vegetation, vegetation.Stations(), page);
    case CVegetationKvf::kFullyDistributed: {
      const CVegetationFullyDistKvf& grids = vegetation.FullyDistributed();
      page.pages.resize(2);
      page.pages[0].title = "Leaf area index";
      ShowMeanGrid(grids.LaiFile(), quantity::kLeafAreaIndex, page.pages[0]);
      page.pages[1].title = "Root depth";
      return ShowMeanGrid(grids.RootDepthFile(), quantity::kRootDepth, page.pages[1]);
    }
    default:
      return ShowCourse(vegetation.Global(), page);
  }
}

void Preprocessor::ShowCourse(const VegetationCourse& course, ReportPage& page) {
  switch (course.TYPE) {
    case VegetationCourse::kTimeVarying:
      page.pages.resize(2);
      page.pages[0].title = "Leaf area index";
      ShowSeries(false, 0, quantity::kLeafAreaIndex, course.LaiFile(), page.pages[0]);
      page.pages[1].title = "Root depth";
      return ShowSeries(false, 0, quantity::kRootDepth, course.RootDepthFile(), page.pages[1]);
    case VegetationCourse::kCrops:
      return page.ShowText(CropsText(course.Crops().Development()));
    default:
      return page.ShowText(fmt::format("Leaf area index {}, root depth {}, constant",
                                       WithUnit(static_cast<double>(course.FIXED_VALUE_LAI), quantity::kLeafAreaIndex),
                                       WithUnit(static_cast<double>(course.FIXED_VALUE_RD), quantity::kRootDepth)));
  }
}

void Preprocessor::ShowSeries(bool isConstant, float value, int itemType, const CFMData0DFile& file, ReportPage& page) {
  if (isConstant)
    page.ShowText(fmt::format("{}, constant", WithUnit(static_cast<double>(value), itemType)));
  else
    page.ShowSeries(file.File.Absolute(), file.SelectedItem(), period_->GetSimStartDate(), period_->SIMEND);
}

void Preprocessor::ShowZoneMap(CFMSEKvfBase& owner, const CellValues& areas, ReportPage& page) {
  const auto table = std::make_shared<ZoneTable>();
  auto make = [source = areas.CurrentSource(), table](CTvn2DOrthoRotatedGridData& grid) {
    if (source.type == CData2DKvf::kGridFile) return ReadGridData(source.file, source.item, grid);
    const PolygonFile polygons{source.file, source.attribute, source.gapFill, source.axisUnit};
    return grid.CreateGridData_GIS_Polygon(source.geometry, kUsualDeleteValue, polygons, *table);
  };
  auto nameOfCode = [&owner, table](int code) -> std::string {
    std::string id = std::to_string(code);
    for (const ZoneTable::Zone& zone : table->zones)
      if (zone.code == code) id = zone.text;
    for (const CFMSEKvfGroupBase* item : ZoneItems(owner))
      if (item->GetStationId() == id) return item->GetStationName();
    return id;
  };
  ShowGrid({page.title,
            PathOf(owner),
            quantity::kCode,
            std::move(make),
            std::move(nameOfCode),
            areas.MayLeaveCells(),
            {},
            {}},
           page);
}

// ---- Summary

std::string Preprocessor::SummaryText() const {
  const GridGeometry& geometry = domain_->Geometry();
  const double cellArea = geometry.cellSize * geometry.cellSize / 1e6;
  std::string text = fmt::format("Preprocessed from {}\n\n", FileNameOf(document_.PathName()));
  text += fmt::format("Simulation period: {} to {}\n", DateInWords(period_->GetSimStartDate()),
                      DateInWords(period_->SIMEND));
  text += fmt::format("Model grid: {} x {} cells of {} m\n", geometry.nx, geometry.ny, geometry.cellSize);
  text += "\nQuantities on the model grid\n";
  for (const ModelGrid& grid : grids_.Grids()) {
    if (grid.values.count == 0) {
      text += fmt::format("{}: no values\n", grid.title);
    } else if (grid.nameOfCode) {
      const double cells = static_cast<double>(grid.values.count);
      text += fmt::format("{}: {:.6g} km2 in {} cells\n", grid.title, cells * cellArea, grid.values.count);
      for (const auto& [code, count] : grid.cellsOfCode)
        text +=
            fmt::format("    {}, {}: {:.6g} km2\n", code, grid.nameOfCode(code), static_cast<double>(count) * cellArea);
    } else if (grid.values.smallest == grid.values.largest) {
      text += fmt::format("{}: {} everywhere\n", grid.title,
                          WithUnit(static_cast<double>(grid.values.largest), grid.itemType));
    } else {
      text += fmt::format("{}: {} to {}, mean {}\n", grid.title,
                          WithUnit(static_cast<double>(grid.values.smallest), grid.itemType),
                          WithUnit(static_cast<double>(grid.values.largest), grid.itemType),
                          WithUnit(grid.values.Mean(), grid.itemType));
    }
  }
  text += log_.Warnings().empty() ? "\nNo warnings." : "\nWarnings\n";
  for (const std::string& warning : log_.Warnings()) text += warning + "\n";
  return text;
}

}  // namespace tervane
