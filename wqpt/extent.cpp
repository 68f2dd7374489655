// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "wqpt/extent.h"

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

void ExtentKvf::ExchangeKeys(KeyExchange& keys) {
  keys("type", type).OneOf(kExtentSources);
  keys("ShapeAxisUnit", ShapeAxisUnit);
}

void MakeExtentLevels(CYbSEKvfBase& owner, const Condition& takePart) {
  for (const Data2DKind& kind : kExtentLevels) owner.NewChild<CData2DKvf>(kind, takePart);
}

}  // namespace tervane
