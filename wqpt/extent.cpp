// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "wqpt/extent.h"

#include <fmt/format.h>

#include "geometry/grid_polygons.h"
#include "platform/paths.h"
#include "platform/units.h"
#include "wqpt/pages.h"

namespace tervane {

namespace {

constexpr KeyChoice kExtentSources[] = {{ExtentKvf::kGridFile, "Grid codes (.nds2)"},
                                        {ExtentKvf::kShapeFile, "Polygons (.shp)"}};

const Data2DKind kExtentLevels[] = {
    {.className = "CData2DWQKvf", .section = "TopElevation", .title = "Upper Level", .itemType = quantity::kElevation},
    {.className = "CData2DWQKvf",
     .section = "BottomElevation",
     .title = "Lower Level",
     .itemType = quantity::kElevation}};

constexpr float kInside = 1;

FileResult PutPolygonsOnGrid(const GridSource& source, ProgressPart progress, CTvn2DOrthoRotatedGridData& grid) {
  const auto refused = [&source](std::string_view why) {
    return FileResult{fmt::format("cannot use {}: {}", source.file, why), {}};
  };
  if (const std::string problem = source.geometry.Problem(); !problem.empty()) return refused(problem);
  CTvnShapeData shapes;
  shapes.SetAxisLengthUnit(source.axisUnit);
  constexpr double kReading = 0.5;
  FileResult read = shapes.ReadShapeFile(source.file, progress.Part(0, kReading));
  if (!read.Ok()) return read;
  if (shapes.Kind() != ShapeKind::Polygon) return refused("polygons were expected");
  try {
    std::vector<float> values(source.geometry.CellCount(), kUsualDeleteValue);
    const std::vector<float> codes(shapes.GetData().size(), kInside);
    PutPolygons(shapes.GetData(), codes, source.geometry, kUsualDeleteValue, values, progress.Part(kReading, 1));
    read.error =
        grid.TakeValues(source.geometry, std::move(values), kUsualDeleteValue, kWholeNumberUnit, quantity::kCode);
  } catch (const Cancelled&) {
    return refused("cancelled");
  }
  return read;
}

}  // namespace

ExtentKvf::ExtentKvf(std::string_view className, Condition takesPart, CYbSEKvfBase* parent)
    : CYbSEKvfGroupBase("Horizontal Extent", "Extent", parent),
      ShapeAxisUnit(BaseUnit(*FindItemType(quantity::kMapCoordinate)).key),
      gridFile_(NewChild<CTvnData2DNdsFile>(quantity::kCode)),
      shapeFile_(NewChild<CData2DShpFile>()) {
  SetClassName(className);
  SetPage(kExtentPage);
  TakesPartWhen(std::move(takesPart));
  gridFile_->UsedWhen(Is(type, kGridFile));
  shapeFile_->UsedWhen(Is(type, kShapeFile));
  shapeFile_->SetPolygonShape(1);
  shapeFile_->NeedNoAttribute();
  shapeFile_->SetAxisUnit(ShapeAxisUnit);
}

GridSource ExtentKvf::CurrentSource() const {
  return type == kShapeFile ? CodesOfPolygons(*shapeFile_, ShapeAxisUnit, {}) : CodesOfGrid(*gridFile_);
}

std::shared_ptr<ComputedGrid> ExtentKvf::GridComputation() {
  if (type != kShapeFile) return nullptr;
  GridSource source = CurrentSource();
  if (!kept_ || keptSource_ != source) {
    keptSource_ = source;
    kept_ = std::make_shared<ComputedGrid>(
        fmt::format("Computing codes of {}", FileNameOf(source.file)),
        [source = std::move(source)](CTvn2DOrthoRotatedGridData& grid, ProgressPart progress) {
          return PutPolygonsOnGrid(source, progress, grid);
        });
  }
  return kept_;
}

void ExtentKvf::ExchangeKeys(KeyExchange& keys) {
  keys("type", type).OneOf(kExtentSources);
  keys("ShapeAxisUnit", ShapeAxisUnit);
}

void MakeExtentLevels(CYbSEKvfBase& owner, const Condition& takePart) {
  for (const Data2DKind& kind : kExtentLevels) owner.NewChild<CData2DKvf>(kind, takePart);
}

}  // namespace tervane
