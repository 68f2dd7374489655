// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/soil_layers.h"

#include <algorithm>

#include "simspec/pages.h"
#include "spatial/pages.h"

namespace tervane {

namespace {

using SoilList = CUnSatInitConditionLayerListKvf;

constexpr KeyChoice kSoilDistributions[] = {{SoilList::kUniform, "Uniform"},
                                            {SoilList::kByLayers, "Layer based"},
                                            {SoilList::kFullyDistributed, "Fully distributed (.nds3)"}};
constexpr KeyChoice kSoilDistributionsWithoutGrid[] = {
    {SoilList::kUniform, "Uniform"},
    {SoilList::kByLayers, "Layer based"},
    {SoilList::kFullyDistributed, "Fully distributed (.nds3)", false}};

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

const Data2DKind kSoilLowerLevel{.className = "CData2DWQKvf",
                                 .section = "LowerLevel",
                                 .title = "Lower Level",
                                 .itemType = quantity::kElevation,
                                 .relativeToGround = Data2DKind::RelativeToGround::Off};

Data2DKind SoilLayerValues(int itemType) {
  return {.className = "CUnSatInitConLayerSubKvf", .section = "LayerData2DWQ", .title = {}, .itemType = itemType};
}

}  // namespace

// ---- A layer

CUnSatInitConLayerSubKvf::CUnSatInitConLayerSubKvf(const SoilList& list, CYbSEKvfBase* parent)
    : CData2DKvf(SoilLayerValues(list.GetItemType()), parent), list_(list) {}

int CUnSatInitConLayerSubKvf::GetItemType() const { return list_.GetItemType(); }

const std::string& CUnSatInitConLayerSubKvf::GetTitle() const {
  const CYbSEKvfBase* layer = GetParent();
  const CYbSEKvfBase* list = layer->GetParent();
  shownTitle_ = (list ? list->GetTitle() + ", " : std::string()) + layer->GetAbbreviatedTitle();
  return shownTitle_;
}

CUnSatInitConditionLayerItemKvf::CUnSatInitConditionLayerItemKvf(const SoilList& list, CYbSEKvfBase* parent)
    : NamedItemKvf("UnSatInitConditionLayerItem", "Layer_%d", "Layer", parent) {
  SetHelp("Top.chm", "UZ_Layer.htm");
  SetPage(kHelpPage);
  TakesPartWhen(Is(list.DistributionType, SoilList::kByLayers));
  NewChild<CData2DKvf>(kSoilLowerLevel);
  NewChild<CUnSatInitConLayerSubKvf>(list);
}

// ---- Layers

CUnSatInitConditionLayerListKvf::CUnSatInitConditionLayerListKvf(std::string title, std::string section,
                                                                 CYbSEKvfBase* parent)
    : CYbSEKvfAbstractListBase(std::move(title), std::move(section), parent), gridFile_(NewChild<CUZData3DNdsFile>()) {
  SetPage(kSoilLayersPage);
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
      .OneOf(MayBeFullyDistributed() ? KeyChoices(kSoilDistributions) : KeyChoices(kSoilDistributionsWithoutGrid));
  keys("Distribution_UniformValue", Distribution_UniformValue).Quantity([this] { return GetItemType(); });
  keys.Count("NumberOfLayers", *this);
}

}  // namespace tervane
