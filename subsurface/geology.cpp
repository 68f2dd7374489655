// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/geology.h"

#include <array>

#include "simspec/pages.h"
#include "subsurface/pages.h"
#include "subsurface/saturated_zone.h"

namespace tervane {

namespace {

using namespace quantity;
using Rule = GroundProperty::Rule;
using Range = GroundProperty::Range;

constexpr std::array kLayerProperties{
    GroundProperty{"LowerLevel", "Lower Level", Rule::Always, kElevation, 0, true},
    GroundProperty{"GeoUnit", "Geological Unit Distribution", Rule::ByUnits, kCode},
    GroundProperty{"HorHydrCon", "Horizontal Hydraulic Conductivity", Rule::ByLayers, kHydraulicConductivity, 0.0001f,
                   false, "Horizontal Hydraulic Conductivity"},
    GroundProperty{"VerHydrCon", "Vertical Hydraulic Conductivity", Rule::ByLayers, kHydraulicConductivity, 0.0001f,
                   false, "Vertical Hydraulic Conductivity"},
    GroundProperty{"SpecificYield", "Specific Yield", Rule::ByLayers, kSpecificYield, 0.2f, false, "", Range::Fraction},
    GroundProperty{"StorageCoef", "Storage Coefficient", Rule::ByLayers, kSpecificStorage, 0.0001f, false,
                   "Specific Storage", Range::Fraction},
    GroundProperty{"Porosity", "Porosity", Rule::Porosity, kPorosity, 0.2f, false, "", Range::Fraction},
    GroundProperty{"MatrixPorosity", "Matrix Porosity", Rule::MatrixPorosity, kPorosity, 0.05f, false,
                   "Matrix Porosity", Range::Fraction},
    GroundProperty{"BulkDensity", "Bulk Density", Rule::BulkDensity, kBulkDensity, 1700},
    GroundProperty{"LHHDispCoeff", "Longitudinal Dispersivity", Rule::HorizontalDispersivity, kDispersivity, 0, false,
                   "Longitudinal Dispersivity", Range::AboveZero},
    GroundProperty{"THHDispCoeff", "Transverse Dispersivity", Rule::HorizontalDispersivity, kDispersivity, 0, false,
                   "Transverse Dispersivity", Range::AboveZero},
    GroundProperty{"TVHDispCoeff", "Transverse Dispersivity in the Vertical direction for Horizontal flow",
                   Rule::VerticalDispersivity, kDispersivity, 0, false,
                   "Transverse Dispersivity in the Vertical direction for Horizontal flow", Range::AboveZero},
    GroundProperty{"LVVDispCoeff", "Longitudinal Dispersivity for Vertical flow", Rule::VerticalDispersivity,
                   kDispersivity, 0, false, "Longitudinal Dispersivity for Vertical flow", Range::AboveZero},
    GroundProperty{"THVDispCoeff", "Transverse Dispersivity in the Horizontal direction for Vertical flow",
                   Rule::VerticalDispersivity, kDispersivity, 0, false,
                   "Transverse Dispersivity in the Horizontal direction for Vertical flow", Range::AboveZero},
    GroundProperty{"HydrHeadUsedForAirFlow", "Hydraulic head used as ref. for air flow simulation",
                   Rule::AirFlowOfLayers, kElevation},
    GroundProperty{"HorizontalAnisotropyRatio", "Horizontal Anisotropy Ratio", Rule::Anisotropy, kFraction},
    GroundProperty{"VanGenuchtenAlpha", "Van Genuchten Alpha", Rule::VanGenuchten, kExponentOrCoefficient},
    GroundProperty{"VanGenuchtenBeta", "Van Genuchten Beta", Rule::VanGenuchten, kExponentOrCoefficient},
    GroundProperty{"ResidualSaturation", "Residual Saturation", Rule::VanGenuchten, kWaterContent},
    GroundProperty{"BrooksCoreyRelativePermeabilityExponent", "Brooks-Corey Relative Permeability Exponent",
                   Rule::BrooksCorey, kExponentOrCoefficient}};

/// A property of lenses that layers have as well. Lenses have no short titles and judge nothing.
constexpr GroundProperty AsInLayers(std::string_view section) {
  for (GroundProperty row : kLayerProperties) {
    if (section != row.section) continue;
    row.shortTitle = "";
    row.range = Range::None;
    return row;
  }
  throw "layers have no such property";
}

constexpr std::array kLenseProperties{
    GroundProperty{"HorBoundary", "Horizontal Extent", Rule::Always, kCode},
    GroundProperty{"UpperLevel", "Upper Level", Rule::Always, kElevation, 0, true},
    AsInLayers("LowerLevel"),
    AsInLayers("GeoUnit"),
    AsInLayers("HorHydrCon"),
    AsInLayers("VerHydrCon"),
    AsInLayers("SpecificYield"),
    AsInLayers("StorageCoef"),
    AsInLayers("HydrHeadUsedForAirFlow"),
    GroundProperty{"WettingThreshold", "Wetting Threshold (combined with a flag)", Rule::Rewetting, kWaterDepth},
    AsInLayers("HorizontalAnisotropyRatio"),
    AsInLayers("VanGenuchtenAlpha"),
    AsInLayers("VanGenuchtenBeta"),
    AsInLayers("ResidualSaturation"),
    AsInLayers("BrooksCoreyRelativePermeabilityExponent"),
    AsInLayers("Porosity"),
    AsInLayers("MatrixPorosity"),
    AsInLayers("BulkDensity"),
    AsInLayers("LHHDispCoeff"),
    AsInLayers("THHDispCoeff"),
    AsInLayers("TVHDispCoeff"),
    AsInLayers("LVVDispCoeff"),
    AsInLayers("THVDispCoeff")};

void CopyValues(const CData2DKvf& from, CData2DKvf& to) {
  to.Type = from.Type;
  to.FixedValue = from.FixedValue;
  to.InterpMethod = from.InterpMethod;
  to.SearchRadius = from.SearchRadius;
  to.ShowGridData = from.ShowGridData;
  to.ShowShapeData = from.ShowShapeData;
  to.ShapeAxisUnit = from.ShapeAxisUnit;
  to.ShapeItemUnit = from.ShapeItemUnit;
  to.RelativeToGround = from.RelativeToGround;
  to.GridFile().File = from.GridFile().File;
  to.GridFile().Items = from.GridFile().Items;
  to.ShapeFile().Choose(from.ShapeFile().File, from.ShapeFile().Attribute());
  to.XyzFile().File = from.XyzFile().File;
}

}  // namespace

// ---- Units

void CGeoUnitsSZItemKvf::ExchangeKeys(KeyExchange& keys) {
  keys("SoilName", SoilName);
  keys("SoilCode", SoilCode);
  keys("HorConduc", HorConduc).Quantity(kHydraulicConductivity);
  keys("VerConduc", VerConduc).Quantity(kHydraulicConductivity);
  keys("SpecYield", SpecYield).Quantity(kSpecificYield);
  keys("StorageCoef", StorageCoef).Quantity(kSpecificStorage);
  keys("Porosity", Porosity).Quantity(kPorosity);
  keys("MatrixPorosity", MatrixPorosity).Quantity(kPorosity);
  keys("BulkDensity", BulkDensity).Quantity(kBulkDensity);
  keys("LHH", LHH).Quantity(kDispersivity);
  keys("THH", THH).Quantity(kDispersivity);
  keys("TVH", TVH).Quantity(kDispersivity);
  keys("LVV", LVV).Quantity(kDispersivity);
  keys("THV", THV).Quantity(kDispersivity);
}

CGeoUnitsSZListKvf::CGeoUnitsSZListKvf(CYbSEKvfBase* parent)
    : CYbSEKvfListBase("Geological units", "GeoUnitsSZProperties", parent) {
  SetPage(kGeologicalUnitsPage);
  TakesPartWhen(GroundParametersBy(CSatZoneKvf::kByUnits));
}

// ---- Layers and lenses

CGeoLayerSZItemKvf::CGeoLayerSZItemKvf(CYbSEKvfBase* parent)
    : NamedItemKvf("GeoLayerSZItem", "Layer_%d", "Layer", parent) {
  SetHelp("Top.chm", "Geological_Layer.htm");
  SetPage(kHelpPage);
  MakeProperties(*this, kLayerProperties, false);
}

int CGeoLayerSZItemKvf::ValidateData() { return JudgeProperties(*this, kLayerProperties) ? 1 : 0; }

void CGeoLayerSZItemKvf::ExchangeKeys(KeyExchange& keys) {
  NamedItemKvf::ExchangeKeys(keys);
  keys("id", id);
}

void CopyProperties(const CGeoLayerSZItemKvf& from, CGeoLayerSZItemKvf& to) {
  for (const GroundProperty& row : kLayerProperties)
    if (std::string_view(row.section) != "LowerLevel")
      CopyValues(*PropertyOf(from, row.section), *PropertyOf(to, row.section));
}

CGeoLenseSZItemKvf::CGeoLenseSZItemKvf(CYbSEKvfBase* parent)
    : NamedItemKvf("GeoLenseSZItem", "Lense_%d", "Lense", parent) {
  SetHelp("Top.chm", "Geological_Lense.htm");
  SetPage(kHelpPage);
  MakeProperties(*this, kLenseProperties, true);
}

CGeoLayerSZKvf::CGeoLayerSZKvf(int& nextId, CYbSEKvfBase* parent)
    : NamedListKvf("Geological Layers", "GeoLayersSZ", parent), nextId_(nextId) {
  SetPage(kGeologicalLayersPage);
  BeginWithAquifer();
}

std::unique_ptr<CYbSEKvfBase> CGeoLayerSZKvf::NewItemNode() {
  auto layer = NewItem();
  layer->id = nextId_;
  // A file may hold the highest number.
  nextId_ = static_cast<int>(static_cast<unsigned>(nextId_) + 1U);
  return layer;
}

CGeoLenseSZKvf::CGeoLenseSZKvf(CYbSEKvfBase* parent) : NamedListKvf("Geological Lenses", "GeoLensesSZ", parent) {
  SetPage(kGeologicalLensesPage);
}

}  // namespace tervane
