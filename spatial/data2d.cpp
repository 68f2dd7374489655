// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/data2d.h"

#include <algorithm>
#include <thread>

#include <fmt/format.h>

#include "geometry/grid_polygons.h"
#include "platform/file_cache.h"
#include "platform/paths.h"
#include "platform/units.h"
#include "simspec/model_components.h"
#include "spatial/domain.h"
#include "spatial/pages.h"

namespace tervane {

namespace {

constexpr int kHeightAboveGround = 100364;

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
  if (source.itemType == kCodeItemType && !isXyz) {
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
  source.itemType = kCodeItemType;
  return source;
}

GridSource CodesOfPolygons(const CData2DShpFile& file, int axisUnit, std::string gapFill) {
  GridSource source;
  source.type = CData2DKvf::kShapeFile;
  source.file = file.File.Absolute();
  source.stamps = StampsOfShape(source.file);
  source.attribute = file.Attribute();
  source.axisUnit = axisUnit;
  source.itemType = kCodeItemType;
  source.gapFill = std::move(gapFill);
  if (const auto* domain = file.Important<CCatchmentKvf>("CATCHMENT")) source.geometry = domain->GetModelGeometry();
  return source;
}

CData2DKvf::CData2DKvf(Data2DKind kind, CYbSEKvfBase* parent)
    : CTvnKvfBase(kind.title, kind.section, parent),
      FixedValue(kind.fixedValue),
      ShapeAxisUnit(FirstUnit(kCoordinateItemType)),
      ShapeItemUnit(FirstUnit(kind.itemType)),
      RelativeToGround(kind.relativeToGround == Data2DKind::RelativeToGround::On),
      kind_(std::move(kind)),
      gridFile_(NewChild<CTvnData2DNdsFile>(kind_.itemType)),
      shapeFile_(NewChild<CData2DShpFile>()),
      xyzFile_(NewChild<CData2DXyzFile>()) {
  SetPage(kData2DPage);
  shapeFile_->SetPolygonShape(IsCode());
  shapeFile_->SetLineShape(!IsCode());
  shapeFile_->SetPointShape(!IsCode());
  IsCode() ? shapeFile_->UseWholeField() : shapeFile_->UseRealField();
  shapeFile_->SetAxisUnit(ShapeAxisUnit);
  xyzFile_->SetAxisUnit(ShapeAxisUnit);
  ValidateData();
}

void CData2DKvf::ExchangeKeys(KeyExchange& keys) {
  keys("Type", Type);
  keys("FixedValue", FixedValue);
  keys("InterpMethod", InterpMethod);
  // Files of before version 4 were all interpolated bilinearly, whatever they say.
  if (keys.Section() && keys.DocVersion() < 4) InterpMethod = 0;
  keys("SearchRadius", SearchRadius);
  keys("ShowGridData", ShowGridData);
  keys("ShowShapeData", ShowShapeData);
  keys("ShapeAxisUnit", ShapeAxisUnit);
  keys("ShapeItemUnit", ShapeItemUnit);
  if (HasRelativeToGround()) keys("RelativeToGround", RelativeToGround);
}

int CData2DKvf::GetItemType() const {
  return HasRelativeToGround() && RelativeToGround ? kHeightAboveGround : kind_.itemType;
}

int CData2DKvf::ValidateData() {
  gridFile_->SetItemType(GetItemType());
  gridFile_->SetFileUsed(Type == kGridFile);
  shapeFile_->SetValidateFlag(Type == kShapeFile);
  xyzFile_->SetFileUsed(Type == kXyzFile);
  return 1;
}

std::string CData2DKvf::GetNdsItemName() const {
  return ItemNameOf(gridFile_->File.Absolute(), gridFile_->SelectedItem());
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
  if (const auto* domain = Important<CCatchmentKvf>("CATCHMENT")) source.geometry = domain->GetModelGeometry();
  return source;
}

std::shared_ptr<CTvn2DOrthoRotatedGridData> CData2DKvf::CreateGridData(std::string* problem) const {
  const GridSource source = CurrentSource();
  if (source.type == kUniform) return nullptr;
  auto grid = std::make_shared<CTvn2DOrthoRotatedGridData>();
  const FileResult result = BuildGrid(source, {}, *grid);
  if (problem) *problem = result.error;
  if (!result.Ok()) return nullptr;
  if (source.type == kShapeFile) grid->SetItemName(GetTitle());
  return grid;
}

std::shared_ptr<ComputedGrid> CData2DKvf::GridComputation() {
  GridSource source = CurrentSource();
  if (source.type == kUniform) return nullptr;
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
  if (!grid) return nullptr;
  grid->Run();
  if (problem) *problem = grid->Problem();
  return grid->Result();
}

std::shared_ptr<Computed<CTvnShapeData>> CData2DKvf::ShapeComputation() {
  if (Type != kShapeFile && Type != kXyzFile) return nullptr;
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

int CTopographyKvf::IsDlgUsedInSetup() {
  const CModelCompKvf& c = ModelCompOf(*this);
  const bool allBySubcatchments = c.OL && c.OL_ModelType == 1 && c.SZ && c.SZ_ModelType == 1;
  return EngineOf(*this) != kEngineTervane || c.UZ || !allBySubcatchments;
}

int CDummyEvapoTransKvf::IsDlgUsedInSetup() { return EngineOf(*this) == kEngineTervane && !ModelCompOf(*this).ET; }

int CDummySatZoneKvf::IsDlgUsedInSetup() {
  const CModelCompKvf& c = ModelCompOf(*this);
  return EngineOf(*this) == kEngineTervane && c.UZ && (!c.SZ || c.SZ_ModelType == 1);
}

int CDummyUnSatZoneKvf::IsDlgUsedInSetup() {
  const CModelCompKvf& c = ModelCompOf(*this);
  return EngineOf(*this) == kEngineTervane && !c.UZ && c.SZ && c.OL;
}

}  // namespace tervane
