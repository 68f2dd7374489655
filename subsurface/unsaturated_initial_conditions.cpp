// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/unsaturated_initial_conditions.h"

#include <algorithm>

#include "simspec/pages.h"
#include "simspec/water_quality_conditions.h"
#include "subsurface/pages.h"
#include "subsurface/unsaturated_zone.h"

namespace tervane {

namespace {

using InitialList = CUnSatInitConditionLayerListKvf;

constexpr KeyChoice kInitialDistributions[] = {{InitialList::kUniform, "Uniform"},
                                               {InitialList::kByLayers, "Layer based"},
                                               {InitialList::kFullyDistributed, "Fully distributed (.nds3)"}};
constexpr KeyChoice kInitialDistributionsWithoutGrid[] = {
    {InitialList::kUniform, "Uniform"},
    {InitialList::kByLayers, "Layer based"},
    {InitialList::kFullyDistributed, "Fully distributed (.nds3)", false}};

/// The sections of quantities that engines do not take as a grid.
constexpr std::string_view kSectionsWithoutGrid[] = {"Initial_Water_Content",
                                                     "Initial_Matrix_Potential",
                                                     "Species_%d",
                                                     "Half_Life",
                                                     "Macropore_Half_Life",
                                                     "Linear_Kd",
                                                     "Freundlich_Kf",
                                                     "Freundlich_n",
                                                     "Langmuir_Alpha",
                                                     "Langmuir_Beta",
                                                     "KinSorpRate",
                                                     "KinDeSorpRate"};

const Data2DKind kInitialLowerLevel{.className = "CData2DWQKvf",
                                    .section = "LowerLevel",
                                    .title = "Lower Level",
                                    .itemType = quantity::kElevation,
                                    .relativeToGround = Data2DKind::RelativeToGround::Off};

Data2DKind InitialLayerValues(int itemType) {
  return {.className = "CUnSatInitConLayerSubKvf", .section = "LayerData2DWQ", .title = {}, .itemType = itemType};
}

}  // namespace

// ---- A layer

CUnSatInitConLayerSubKvf::CUnSatInitConLayerSubKvf(int itemType, CYbSEKvfBase* parent)
    : CData2DKvf(InitialLayerValues(itemType), parent) {}

const std::string& CUnSatInitConLayerSubKvf::GetTitle() const {
  const CYbSEKvfBase* layer = GetParent();
  const CYbSEKvfBase* list = layer->GetParent();
  shownTitle_ = (list ? list->GetTitle() + ", " : std::string()) + layer->GetAbbreviatedTitle();
  return shownTitle_;
}

CUnSatInitConditionLayerItemKvf::CUnSatInitConditionLayerItemKvf(const InitialList& list, CYbSEKvfBase* parent)
    : NamedItemKvf("UnSatInitConditionLayerItem", "Layer_%d", "Layer", parent) {
  SetHelp("Top.chm", "UZ_Layer.htm");
  SetPage(kHelpPage);
  TakesPartWhen(Is(list.DistributionType, InitialList::kByLayers));
  NewChild<CData2DKvf>(kInitialLowerLevel);
  NewChild<CUnSatInitConLayerSubKvf>(list.GetItemType());
}

// ---- Layers

CUnSatInitConditionLayerListKvf::CUnSatInitConditionLayerListKvf(std::string title, std::string section,
                                                                 CYbSEKvfBase* parent)
    : CYbSEKvfAbstractListBase(std::move(title), std::move(section), parent), gridFile_(NewChild<CUZData3DNdsFile>()) {
  SetPage(kUnsaturatedInitialConditionPage);
  gridFile_->UsedWhen(Is(DistributionType, kFullyDistributed));
  gridFile_->SetItemTypeBy([this] { return GetItemType(); });
}

bool CUnSatInitConditionLayerListKvf::MayBeFullyDistributed() const {
  return std::ranges::find(kSectionsWithoutGrid, GetSectionName()) == std::end(kSectionsWithoutGrid);
}

std::unique_ptr<CUnSatInitConditionLayerItemKvf> CUnSatInitConditionLayerListKvf::NewItem() {
  return std::make_unique<CUnSatInitConditionLayerItemKvf>(*this, this);
}

void CUnSatInitConditionLayerListKvf::ExchangeKeys(KeyExchange& keys) {
  keys("DistributionType", DistributionType)
      .OneOf(MayBeFullyDistributed() ? KeyChoices(kInitialDistributions)
                                     : KeyChoices(kInitialDistributionsWithoutGrid));
  keys("Distribution_UniformValue", Distribution_UniformValue).Quantity(GetItemType());
  keys.Count("NumberOfLayers", *this);
}

// ---- The quantities

CUnSatInitMatrixPotenLayerListKvf::CUnSatInitMatrixPotenLayerListKvf(CYbSEKvfBase* parent)
    : CUnSatInitConditionLayerListKvf("Initial Matrix Potential", "Initial_Matrix_Potential", parent) {
  TakesPartWhen(UnsaturatedZoneIs(&CUnsatzoneKvf::InitialCondition, {CUnsatzoneKvf::kMatrixPotential}));
}

CUnSatInitWaterConLayerListKvf::CUnSatInitWaterConLayerListKvf(CYbSEKvfBase* parent)
    : CUnSatInitConditionLayerListKvf("Initial Water Content", "Initial_Water_Content", parent) {
  TakesPartWhen(UnsaturatedZoneIs(&CUnsatzoneKvf::InitialCondition, {CUnsatzoneKvf::kWaterContent}));
}

CUnSatInitSoilTempLayerListKvf::CUnSatInitSoilTempLayerListKvf(CYbSEKvfBase* parent)
    : CUnSatInitConditionLayerListKvf("Initial Soil Temperature", "Initial_Soil_Temperature", parent) {
  TakesPartWhen(SoilTemperatureNeeded(SoilCompartment::Unsaturated));
}

CUnSatInitConditionsKvf::CUnSatInitConditionsKvf(CYbSEKvfBase* parent)
    : CYbSEKvfGroupBase("Initial Conditions", "Initial_Conditions", parent) {
  SetHelp("Top.chm", "Initial_Conditions.htm");
  SetPage(kHelpPage);
  NewChild<CUnSatInitMatrixPotenLayerListKvf>();
  NewChild<CUnSatInitWaterConLayerListKvf>();
  NewChild<CUnSatInitSoilTempLayerListKvf>();
}

}  // namespace tervane
