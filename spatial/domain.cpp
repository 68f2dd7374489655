// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/domain.h"

#include <algorithm>
#include <cmath>

#include <fmt/format.h>

#include "geometry/cart.h"
#include "platform/item_types.h"
#include "platform/paths.h"
#include "platform/text.h"
#include "platform/units.h"
#include "spatial/data2d.h"
#include "spatial/domain_boundary.h"
#include "spatial/pages.h"

namespace tervane {

namespace {

constexpr KeyChoice kDomainSources[] = {{CCatchmentKvf::kGridFile, "Catchment defined by Nds File"},
                                        {CCatchmentKvf::kShapeFile, "Catchment defined by Shape File"}};

/// The key of what keeps the grid from being made.
const char* KeyOfProblem(const GridGeometry& grid) {
  if (grid.nx <= 0) return "nxShp";
  if (grid.ny <= 0) return "nyShp";
  if (grid.CellCount() > kMostCells) return "nxShp";
  if (!(grid.cellSize > 0) || !std::isfinite(grid.cellSize)) return "sizeShp";
  if (!std::isfinite(grid.x0)) return "x0Shp";
  if (!std::isfinite(grid.y0)) return "y0Shp";
  return std::isfinite(grid.rotation) ? "sizeShp" : "rotationShp";
}

}  // namespace

CCatchmentKvf::CCatchmentKvf(CYbSEKvfBase* parent)
    : CTvnKvfBase("Model Domain and Grid", "Catchment", parent),
      MapProjShp(CYbMapProjection::IDtoProjectionString(1)),
      ShapeAxisUnit(BaseUnit(*FindItemType(quantity::kMapCoordinate)).key),
      gridFile_(NewChild<CTvnData2DNdsFile>(quantity::kCode)),
      shapeFile_(NewChild<CData2DShpFile>()) {
  SetPage(kCatchmentPage);
  gridFile_->SetDomainCheck(0);
  shapeFile_->SetAxisUnit(ShapeAxisUnit);
  shapeFile_->SetPolygonShape(1);
  shapeFile_->NeedNoAttribute();
  gridFile_->UsedWhen(Is(Type, kGridFile));
  shapeFile_->UsedWhen(Is(Type, kShapeFile));
}

void CCatchmentKvf::ExchangeKeys(KeyExchange& keys) {
  keys.FromOne("type", Type).OneOf(kDomainSources);
  keys("nxShp", nxShp);
  keys("nyShp", nyShp);
  keys("sizeShp", sizeShp).Quantity(quantity::kHorizontalLength);
  keys("x0Shp", x0Shp).Quantity(quantity::kHorizontalLength);
  keys("y0Shp", y0Shp).Quantity(quantity::kHorizontalLength);
  keys("MapProjShp", MapProjShp);
  keys("rotationShp", rotationShp).Unit("[Deg, Counter clockwise]");
  keys("ShapeAxisUnit", ShapeAxisUnit);
}

bool CCatchmentKvf::HasGeometry() const {
  if (Type == kShapeFile) return !shapeFile_->File.IsEmpty();
  GridGeometry geometry;
  return ReadGeoInfoFromNdsFile(gridFile_->File.Absolute(), gridFile_->SelectedItem(), geometry).Ok();
}

GridGeometry CCatchmentKvf::GetModelGeometry() const {
  if (Type == kShapeFile) return {nxShp, nyShp, sizeShp, x0Shp, y0Shp, rotationShp, MapProjShp};
  GridGeometry geometry;
  if (ReadGeoInfoFromNdsFile(gridFile_->File.Absolute(), gridFile_->SelectedItem(), geometry).Ok()) return geometry;
  return {50, 50, 1000.0, 0.0, 0.0, 0.0, CYbMapProjection::IDtoProjectionString(1)};
}

std::shared_ptr<CTvn2DOrthoRotatedGridData> CCatchmentKvf::GetDomainGrid(std::string* problem) const {
  if (Type == kShapeFile) return GetDomainFromShape(problem);
  auto grid = std::make_shared<CTvn2DOrthoRotatedGridData>();
  const FileResult result = ReadGridData(gridFile_->File.Absolute(), gridFile_->SelectedItem(), *grid);
  if (problem) *problem = result.error;
  return result.Ok() ? grid : nullptr;
}

std::shared_ptr<CTvn2DOrthoRotatedGridData> CCatchmentKvf::GetDomainFromShape(std::string* problem) const {
  auto grid = std::make_shared<CTvn2DOrthoRotatedGridData>();
  const FileResult result = BuildFromShape(CurrentShape(), {}, *grid);
  if (problem) *problem = result.error;
  return result.Ok() ? grid : nullptr;
}

CCatchmentKvf::ShapeSource CCatchmentKvf::CurrentShape() const {
  const std::string file = shapeFile_->File.Absolute();
  return {file, StampsOfShape(file), ShapeAxisUnit, {nxShp, nyShp, sizeShp, x0Shp, y0Shp, rotationShp, MapProjShp}};
}

FileResult CCatchmentKvf::BuildFromShape(const ShapeSource& source, ProgressPart progress,
                                         CTvn2DOrthoRotatedGridData& grid) {
  return grid.MakeCatchmentGriddataFromShapefile(source.file, source.axisUnit, source.geometry, progress);
}

std::shared_ptr<ComputedGrid> CCatchmentKvf::DomainFromShape() {
  ShapeSource source = CurrentShape();
  if (made_ && madeOf_ == source) return made_;
  made_ = std::make_shared<ComputedGrid>(fmt::format("Computing the domain of {}", FileNameOf(source.file)),
                                         [source](CTvn2DOrthoRotatedGridData& grid, ProgressPart progress) {
                                           return BuildFromShape(source, progress, grid);
                                         });
  madeOf_ = std::move(source);
  return made_;
}

namespace {

/// What a user can do about a boundary that cannot be followed, where that is one cell. The trace turns to the inside
/// first: it cuts each square corner, also the one in which it began, and then never comes back to its start.
std::string HowToClose(const CTvn2DOrthoRotatedGridData& domain) {
  const GridGeometry& geometry = domain.Geometry();
  CGeoDataBoundCondCatchmentData without;
  if (!without.TakeValues(geometry, domain.Values(), domain.DeleteValue(), domain.ItemUnit(), domain.ItemType())
           .empty())
    return {};
  for (int row = geometry.ny - 1; row >= 0; --row)
    for (int column = 0; column < geometry.nx; ++column) {
      if (domain.IsEmptyValue(domain.Value(column, row))) continue;
      // What is no boundary at all is told by the trace.
      if (std::floor(domain.Value(column, row) + 0.5F) != 2.0F) return {};
      const auto place = static_cast<std::size_t>(row) * static_cast<std::size_t>(geometry.nx);
      without.GetData()[place + static_cast<std::size_t>(column)] = domain.DeleteValue();
      std::string message;
      if (!without.PrepareBoundary(message)) return {};
      return fmt::format(
          "The line along the boundary begins in a corner, at column {}, row {} from the south, and passes it by on "
          "its "
          "way back. Leave this cell out of the domain: then the boundary can be followed.",
          column + 1, row + 1);
    }
  return {};
}

}  // namespace

std::shared_ptr<Computed<TracedDomain>> CCatchmentKvf::Traced() {
  const bool isShape = Type == kShapeFile;
  const GridSource file = isShape ? GridSource() : CodesOfGrid(*gridFile_);
  const std::shared_ptr<ComputedGrid> shape = isShape ? DomainFromShape() : nullptr;
  if (trace_.traced && trace_.file == file && trace_.shape == shape) return trace_.traced;
  trace_ = {file, shape,
            std::make_shared<Computed<TracedDomain>>(
                "Tracing the boundary of the model domain", [file, shape](TracedDomain& made, ProgressPart progress) {
                  CTvn2DOrthoRotatedGridData& grid = made.grid;
                  if (shape) {
                    shape->Run(progress);
                    if (!shape->Result()) return FileResult{shape->Problem(), {}};
                    grid = *shape->Result();
                  } else if (FileResult result = BuildGrid(file, progress, grid); !result.Ok()) {
                    return result;
                  }
                  if (made.grid.PrepareBoundary(made.fault)) return FileResult();
                  if (made.fault.empty())
                    made.fault = "The cells of the outer boundary make no closed line around the model";
                  if (const std::string advice = HowToClose(grid); !advice.empty()) made.fault += "\n" + advice;
                  return FileResult();
                })};
  return trace_.traced;
}

std::shared_ptr<const CYbShapeData> CCatchmentKvf::GetDomainShape(std::string* problem) const {
  auto shapes = std::make_shared<CTvnShapeData>();
  shapes->SetAxisLengthUnit(ShapeAxisUnit);
  const FileResult result = shapes->ReadShapeFile(shapeFile_->File.Absolute());
  if (problem) *problem = result.error;
  return result.Ok() ? shapes : nullptr;
}

bool CCatchmentKvf::ChooseShapeFile(FileName file, int axisUnit, std::string& problem) {
  shapeFile_->Choose(std::move(file), {});
  ShapeAxisUnit = axisUnit;
  return FitGrid(shapeFile_->File.Absolute(), problem);
}

bool CCatchmentKvf::TakeGrid(const std::string& path, std::string& problem) {
  if (LowerCase(ExtensionOf(path)) == ".shp") {
    if (!FitGrid(path, problem)) return false;
    rotationShp = 0;
    if (const auto facts = ShapeFactsOf(path); !facts->projection.empty()) MapProjShp = facts->projection;
    return true;
  }
  GridGeometry grid;
  const FileResult result = ReadGeoInfoFromNdsFile(path, 1, grid);
  problem = result.error;
  if (!result.Ok()) return false;
  nxShp = grid.nx;
  nyShp = grid.ny;
  sizeShp = grid.cellSize;
  x0Shp = grid.x0;
  y0Shp = grid.y0;
  rotationShp = grid.rotation;
  MapProjShp = grid.projection;
  return true;
}

bool CCatchmentKvf::FitGrid(const std::string& shapeFile, std::string& problem) {
  CTvnShapeData shapes;
  shapes.SetAxisLengthUnit(ShapeAxisUnit);
  const FileResult result = shapes.ReadShapeFile(shapeFile);
  Envelope box;
  if (!result.Ok() || !shapes.GetTranscribingRect(box)) {
    problem = result.Ok() ? "it holds no shapes" : result.error;
    return false;
  }
  x0Shp = box.xMin;
  y0Shp = box.yMin;
  if (nxShp >= 2 && nyShp >= 2)
    sizeShp = std::max(
        {std::trunc((box.xMax - box.xMin) / (nxShp - 1)), std::trunc((box.yMax - box.yMin) / (nyShp - 1)), 1.0});
  return true;
}

int CCatchmentKvf::ValidateData() {
  if (Type == kGridFile) {
    DomainFileFacts facts;
    switch (ReadDomainFacts(gridFile_->File.Absolute(), facts)) {
      case DomainFileState::Unreadable:  // the file's own node tells
        return 0;
      case DomainFileState::NoItem:
        return 1;
      case DomainFileState::BadItem:
        AddError("Error reading nds2 item. File must have one and only one item.", "FILE_NAME");
        return 0;
      case DomainFileState::NoStatistics:
        AddError("Error reading nds2 file.", "FILE_NAME");
        return 0;
      case DomainFileState::Read:
        break;
    }
    if (facts.smallest < 1.0 || facts.largest > 2.0) {
      AddError(
          "Error in nds2 file. Only 3 type of values is allowed. Delete values (typical = -1e-35), 1 = internal cell "
          "and 2 = outer boundary cell.",
          "FILE_NAME", fmt::format("its values are between {} and {}", facts.smallest, facts.largest));
      return 0;
    }
  }
  if (auto* maps = Important(kDomainFollower)) maps->AdoptDomain(GetEnvelope());
  const GridGeometry geometry = GetModelGeometry();
  if (const std::string problem = geometry.Problem(); !problem.empty())
    AddWarning("The grid of the model cannot be made", Type == kShapeFile ? KeyOfProblem(geometry) : "FILE_NAME",
               problem);
  const std::string& projection = geometry.projection;
  if (CYbMapProjection(projection).IsGeographical()) {
    AddError(projection + " is not supported by Tervane. Only projected coordinate systems are allowed", "MapProjShp");
    return 0;
  }
  return 1;
}

}  // namespace tervane
