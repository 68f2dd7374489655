// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/data2d.h"

#include <algorithm>
#include <thread>

#include <fmt/format.h>

#include "geometry/grid_polygons.h"
#include "platform/file_cache.h"
#include "platform/item_types.h"
#include "platform/paths.h"
#include "platform/units.h"
#include "simspec/conditions.h"
#include "spatial/domain.h"
#include "spatial/pages.h"

namespace tervane {

namespace {

constexpr KeyChoice kSources[] = {{CData2DKvf::kUniform, "Uniform"},
                                  {CData2DKvf::kGridFile, "Grid file (.nds2)"},
                                  {CData2DKvf::kShapeFile, "Point/Line (.shp)"},
                                  {CData2DKvf::kXyzFile, "Point XYZ(.txt)"}};
constexpr KeyChoice kInterpolationMethods[] = {
    {0, "Bilinear"}, {1, "Triangular"}, {2, "Inverse Distance"}, {3, "Inverse Distance Squared"}};

int FirstUnit(int itemType) {
  const ItemType* found = FindItemType(itemType);
  return found ? BaseUnit(*found).key : kDimensionlessUnit;
}

InterpolationOptions OnAllCores(ProgressPart progress) {
  InterpolationOptions work;
  work.threads = std::max(1, static_cast<int>(std::thread::hardware_concurrency()));
  work.progress = progress;
  return work;
}

}  // namespace

FileResult BuildGrid(const GridSource& source, ProgressPart progress, CTvn2DOrthoRotatedGridData& grid) {
  // The file's own geometry counts; nothing is resampled.
  if (source.type == CData2DKvf::kGridFile) return ReadGridData(source.file, source.item, grid, progress);
  const bool isXyz = source.type == CData2DKvf::kXyzFile;
  if (source.itemType == quantity::kCode && !isXyz) {
    PolygonFile polygons;
    polygons.path = source.file;
    polygons.attribute = source.attribute;
    polygons.axisUnit = source.axisUnit;
    polygons.gapFill = source.gapFill;
    ZoneTable zones;
    return grid.CreateGridData_GIS_Polygon(source.geometry, kUsualDeleteValue, polygons, zones, progress);
  }
  ScatteredFile points;
  points.path = source.file;
  points.isXyz = isXyz;
  points.attribute = source.attribute;
  points.axisUnit = source.axisUnit;
  points.itemUnit = source.itemUnit;
  points.itemType = source.itemType;
  InterpolationOptions options = OnAllCores(progress);
  options.method = static_cast<InterpolationMethod>(source.interpMethod);
  options.searchRadius = source.searchRadius;
  return grid.CreateGridData_GIS(source.geometry, kUsualDeleteValue, points, options);
}

GridSource CodesOfGrid(const CTvnData2DNdsFile& file) {
  GridSource source;
  source.type = CData2DKvf::kGridFile;
  source.file = file.File.Absolute();
  source.stamps = StampsOf(source.file);
  source.item = file.SelectedItem();
  source.itemType = quantity::kCode;
  return source;
}

GridSource CodesOfPolygons(const CData2DShpFile& file, int axisUnit, std::string gapFill) {
  GridSource source;
  source.type = CData2DKvf::kShapeFile;
  source.file = file.File.Absolute();
  source.stamps = StampsOfShape(source.file);
  source.attribute = file.Attribute();
  source.axisUnit = axisUnit;
  source.itemType = quantity::kCode;
  source.gapFill = std::move(gapFill);
  if (const auto* domain = file.Important(kDomain)) source.geometry = domain->GetModelGeometry();
  return source;
}

CData2DKvf::CData2DKvf(Data2DKind kind, CYbSEKvfBase* parent)
    : CTvnKvfBase(kind.title, kind.section, parent),
      FixedValue(kind.fixedValue),
      ShapeAxisUnit(FirstUnit(quantity::kMapCoordinate)),
      ShapeItemUnit(FirstUnit(kind.itemType)),
      RelativeToGround(kind.relativeToGround == Data2DKind::RelativeToGround::On),
      kind_(std::move(kind)),
      gridFile_(NewChild<CTvnData2DNdsFile>(kind_.itemType)),
      shapeFile_(NewChild<CData2DShpFile>()),
      xyzFile_(NewChild<CData2DXyzFile>()) {
  SetClassName(kind_.className);
  SetAbbreviatedTitle(kind_.shortTitle);
  SetPage(kData2DPage);
  gridFile_->UsedWhen(Is(Type, kGridFile));
  shapeFile_->UsedWhen(Is(Type, kShapeFile));
  xyzFile_->UsedWhen(Is(Type, kXyzFile));
  shapeFile_->SetPolygonShape(IsCode());
  shapeFile_->SetLineShape(!IsCode());
  shapeFile_->SetPointShape(!IsCode());
  IsCode() ? shapeFile_->UseWholeField() : shapeFile_->UseRealField();
  shapeFile_->SetAxisUnit(ShapeAxisUnit);
  xyzFile_->SetAxisUnit(ShapeAxisUnit);
  gridFile_->SetItemTypeBy([this] { return GetItemType(); });
}

CData2DKvf::CData2DKvf(Data2DKind kind, Condition takesPart, CYbSEKvfBase* parent)
    : CData2DKvf(std::move(kind), parent) {
  TakesPartWhen(std::move(takesPart));
}

void CData2DKvf::ExchangeKeys(KeyExchange& keys) {
  keys("Type", Type).OneOf(kSources);
  keys("FixedValue", FixedValue).Quantity([this] { return GetItemType(); });
  keys("InterpMethod", InterpMethod).OneOf(kInterpolationMethods);
  // Files of before version 4 were all interpolated bilinearly, whatever they say.
  if (keys.Section() && keys.DocVersion() < 4) InterpMethod = 0;
  keys("SearchRadius", SearchRadius).Quantity(quantity::kHorizontalLength);
  keys("ShowGridData", ShowGridData);
  keys("ShowShapeData", ShowShapeData);
  keys("ShapeAxisUnit", ShapeAxisUnit);
  keys("ShapeItemUnit", ShapeItemUnit);
  if (HasRelativeToGround()) keys("RelativeToGround", RelativeToGround);
}

int CData2DKvf::GetItemType() const {
  return HasRelativeToGround() && RelativeToGround ? quantity::kHeightAboveGround : kind_.itemType;
}

std::string CData2DKvf::GetNdsItemName() const {
  return ItemNameOf(gridFile_->File.Absolute(), gridFile_->SelectedItem());
}

std::string CData2DKvf::WhyFileNotValid() const {
  return Type == kGridFile ? gridFile_->WhyNotValid() : Type == kShapeFile ? shapeFile_->WhyNotValid() : std::string();
}

GridSource CData2DKvf::CurrentSource() const {
  GridSource source;
  source.type = Type;
  if (Type == kUniform) return source;
  const FileName& file = Type == kGridFile ? gridFile_->File : Type == kShapeFile ? shapeFile_->File : xyzFile_->File;
  source.file = file.Absolute();
  source.stamps = Type == kShapeFile ? StampsOfShape(source.file) : StampsOf(source.file);
  if (Type == kGridFile) {
    source.item = gridFile_->SelectedItem();
    return source;
  }
  if (Type == kShapeFile) source.attribute = shapeFile_->Attribute();
  source.interpMethod = InterpMethod;
  source.searchRadius = SearchRadius;
  source.axisUnit = ShapeAxisUnit;
  source.itemUnit = ShapeItemUnit;
  source.itemType = kind_.itemType;
  if (const auto* domain = Important(kDomain)) source.geometry = domain->GetModelGeometry();
  return source;
}

std::shared_ptr<CTvn2DOrthoRotatedGridData> CData2DKvf::CreateGridData(std::string* problem) const {
  const GridSource source = CurrentSource();
  if (source.type == kUniform) return nullptr;
  auto grid = std::make_shared<CTvn2DOrthoRotatedGridData>();
  FileResult result{WhyFileNotValid(), {}};
  if (result.Ok()) result = BuildGrid(source, {}, *grid);
  if (problem) *problem = result.error;
  if (!result.Ok()) return nullptr;
  if (source.type == kShapeFile) grid->SetItemName(GetTitle());
  return grid;
}

std::shared_ptr<ComputedGrid> CData2DKvf::GridComputation() {
  GridSource source = CurrentSource();
  if (source.type == kUniform) return nullptr;
  if (!WhyFileNotValid().empty()) {
    kept_.reset();
    return nullptr;
  }
  if (!kept_ || !(kept_->source == source)) {
    const char* const verb = source.type == kGridFile ? "Reading" : IsCode() ? "Computing codes of" : "Interpolating";
    const std::string name = source.type == kShapeFile ? GetTitle() : std::string();
    auto made = std::make_shared<ComputedGrid>(fmt::format("{} {}", verb, FileNameOf(source.file)),
                                               [source, name](CTvn2DOrthoRotatedGridData& grid, ProgressPart progress) {
                                                 FileResult result = BuildGrid(source, progress, grid);
                                                 if (!name.empty()) grid.SetItemName(name);
                                                 return result;
                                               });
    kept_ = {std::move(source), std::move(made)};
  }
  return kept_->computation;
}

std::shared_ptr<const CTvn2DOrthoRotatedGridData> CData2DKvf::GetGridData(std::string* problem) {
  const auto grid = GridComputation();
  if (problem) *problem = WhyFileNotValid();
  if (!grid) return nullptr;
  grid->Run();
  if (problem) *problem = grid->Problem();
  return grid->Result();
}

std::shared_ptr<Computed<CTvnShapeData>> CData2DKvf::ShapeComputation() {
  if (Type != kShapeFile && Type != kXyzFile) return nullptr;
  if (!WhyFileNotValid().empty()) {
    keptShapes_.reset();
    return nullptr;
  }
  GridSource source = CurrentSource();
  if (!keptShapes_ || !(keptShapes_->source == source)) {
    auto made = std::make_shared<Computed<CTvnShapeData>>(
        fmt::format("Reading {}", FileNameOf(source.file)), [source](CTvnShapeData& shapes, ProgressPart progress) {
          if (source.type == kXyzFile) return ReadXyzShapes(source.file, source.axisUnit, shapes, progress);
          shapes.SetAxisLengthUnit(source.axisUnit);
          return shapes.ReadShapeAndDbfFile(source.file, source.attribute, progress);
        });
    keptShapes_ = {std::move(source), std::move(made)};
  }
  return keptShapes_->computation;
}

std::shared_ptr<const CYbShapeData> CData2DKvf::GetShapeData(std::string* problem) {
  const auto shapes = ShapeComputation();
  if (problem) *problem = WhyFileNotValid();
  if (!shapes) return nullptr;
  shapes->Run();
  if (problem) *problem = shapes->Problem();
  return shapes->Result();
}

void CData2DKvf::SetGridDataValid(int valid) {
  if (!valid) kept_.reset();
}

void CData2DKvf::SetShapeDataValid(int valid) {
  if (!valid) keptShapes_.reset();
}

// ---- Who takes part

CData2DKvf* NewTopography(CYbSEKvfBase& parent) {
  const Condition allBySubcatchments =
      Component(&CModelCompKvf::OL) && Method(&CModelCompKvf::OL_ModelType, kSubcatchmentOverland) &&
      Component(&CModelCompKvf::SZ) && Method(&CModelCompKvf::SZ_ModelType, kLinearReservoir);
  return parent.NewChild<CData2DKvf>(Data2DKind{.className = "CTopographyKvf",
                                                .section = "Topography",
                                                .title = "Topography",
                                                .itemType = quantity::kElevation,
                                                .fixedValue = 10},
                                     !OwnEngine() || Component(&CModelCompKvf::UZ) || !allBySubcatchments);
}

CData2DKvf* NewNetRainfallFraction(CYbSEKvfBase& parent) {
  return parent.NewChild<CData2DKvf>(Data2DKind{.className = "CDummyEvapoTransKvf",
                                                .section = "NetRainfallFraction",
                                                .title = "Net Rainfall Fraction",
                                                .itemType = quantity::kFraction,
                                                .fixedValue = 1},
                                     OwnEngine() && !Component(&CModelCompKvf::ET));
}

CData2DKvf* NewGroundwaterTable(CYbSEKvfBase& parent) {
  return parent.NewChild<CData2DKvf>(
      Data2DKind{.className = "CDummySatZoneKvf",
                 .section = "GroundwaterTable",
                 .title = "Groundwater table for lower UZ boundary",
                 .itemType = quantity::kElevation,
                 .fixedValue = -0.9F,
                 .relativeToGround = Data2DKind::RelativeToGround::On},
      OwnEngine() && Component(&CModelCompKvf::UZ) &&
          (!Component(&CModelCompKvf::SZ) || Method(&CModelCompKvf::SZ_ModelType, kLinearReservoir)));
}

CData2DKvf* NewInfiltrationFraction(CYbSEKvfBase& parent) {
  return parent.NewChild<CData2DKvf>(
      Data2DKind{.className = "CDummyUnSatZoneKvf",
                 .section = "InfiltrationFraction",
                 .title = "Infiltration Fraction",
                 .itemType = quantity::kFraction,
                 .fixedValue = 1},
      OwnEngine() && !Component(&CModelCompKvf::UZ) && Component(&CModelCompKvf::SZ) && Component(&CModelCompKvf::OL));
}

}  // namespace tervane
