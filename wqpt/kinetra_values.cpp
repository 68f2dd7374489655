// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "wqpt/kinetra_values.h"

#include "platform/item_types.h"
#include "simspec/pages.h"
#include "spatial/pages.h"
#include "wqpt/kinetra_specification.h"
#include "wqpt/pages.h"

namespace tervane {

namespace {

Data2DKind ConstantKind(std::string_view className, std::string section) {
  return {.className = className,
          .section = std::move(section),
          .title = "Kinetra Constant",
          .itemType = quantity::kUndefined};
}

ForcingKind TemplateForcingKind(std::string_view className) {
  return {.className = className,
          .itemTypes = {quantity::kUndefined},
          .valueTypes = kMeansOrSums,
          .stationTitle = "2D Station Based Data",
          .page = &kStationBasedDataPage,
          .stationPage = &kStationPage};
}

const Data2DKind kTemplateLowerLevel{
    .className = "CData2DKvf", .section = "LowerLevel", .title = "Lower Level", .itemType = quantity::kElevation};

constexpr KinetraListKind kConstantLists{"Kinetra Constants", "KinetraConstants", "Kinetra_Constants.htm"};
constexpr KinetraListKind kForcingLists{"Kinetra Forcings", "KinetraForcings", "Kinetra_Forcings.htm"};

/// Rules are shared: each water quality layer has lists of its own.
const Condition& ActiveIn(ProcessTemplates::Compartment compartment) {
  static const Condition overland = CompartmentActive(ProcessTemplates::kOverland),
                         unsaturated = CompartmentActive(ProcessTemplates::kUnsaturated),
                         saturated = CompartmentActive(ProcessTemplates::kSaturated);
  return compartment == ProcessTemplates::kOverland      ? overland
         : compartment == ProcessTemplates::kUnsaturated ? unsaturated
                                                         : saturated;
}

}  // namespace

// ---- Items

KinetraConstantKvf::KinetraConstantKvf(std::string_view className, CYbSEKvfBase* parent)
    : KinetraValue("Kinetra constant, ", ConstantKind(className, "Constant_%d"), parent) {}

KinetraForcingKvf::KinetraForcingKvf(std::string_view className, CYbSEKvfBase* parent)
    : KinetraValue("Kinetra Forcing, ", TemplateForcingKind(className), std::string("Forcing"),
                   std::string("Forcing_%d"), parent) {}

CKinetraConstantsUZWQLayerItemKvf::CKinetraConstantsUZWQLayerItemKvf(const int& distribution, CYbSEKvfBase* parent)
    : NamedItemKvf("WQLayerItem", "Layer_%d", "Layer", parent) {
  SetHelp("Top.chm", "UZ_Layer.htm");
  SetPage(kHelpPage);
  TakesPartWhen(Is(distribution, kKinetraByLayers));
  NewChild<CData2DKvf>(kTemplateLowerLevel);
  NewChild<CData2DKvf>(ConstantKind("CData2DKvf", "LayerData2DWQ"));
}

CKinetraForcingsUZWQLayerItemKvf::CKinetraForcingsUZWQLayerItemKvf(const int& distribution, CYbSEKvfBase* parent)
    : NamedItemKvf("WQLayer", "Layer_%d", "Layer", parent) {
  SetHelp("Top.chm", "UZ_Layer.htm");
  SetPage(kHelpPage);
  TakesPartWhen(Is(distribution, kKinetraByLayers));
  NewChild<CData2DKvf>(kTemplateLowerLevel);
  NewChild<C2DStationBasedDataKvf>(TemplateForcingKind({}), "Kinetra Forcing", "LayerData2DWQ");
}

CKinetraConstantsUZWQLayerListKvf::CKinetraConstantsUZWQLayerListKvf(CYbSEKvfBase* parent)
    : KinetraValue(std::string(), std::string("KinetraConstant"), std::string("Constant_%d"), parent) {
  SetPage(kKinetraConstantLayersPage);
}

CKinetraForcingsUZWQLayerListKvf::CKinetraForcingsUZWQLayerListKvf(CYbSEKvfBase* parent)
    : KinetraValue("Kinetra layers for ", std::string("KinetraForcing"), std::string("Forcing_%d"), parent) {
  SetPage(kKinetraForcingLayersPage);
}

// ---- Lists

template <class Item>
KinetraListKvf<Item>::KinetraListKvf(const KinetraListKind& kind, Condition takesPart, CYbSEKvfBase* parent)
    : CYbSEKvfAbstractListBase<Item>(kind.title, kind.section, parent) {
  this->SetHelp("Top.chm", kind.helpPage);
  this->SetPage(kHelpPage);
  this->TakesPartWhen(std::move(takesPart));
}

CKinetraConstantsOLKvf::CKinetraConstantsOLKvf(CYbSEKvfBase* parent)
    : KinetraListKvf(kConstantLists, ActiveIn(ProcessTemplates::kOverland), parent) {}
std::unique_ptr<KinetraConstantKvf> CKinetraConstantsOLKvf::NewItem() {
  return std::make_unique<KinetraConstantKvf>("CKinetraConstantsOLItemKvf", this);
}

CKinetraForcingsOLKvf::CKinetraForcingsOLKvf(CYbSEKvfBase* parent)
    : KinetraListKvf(kForcingLists, ActiveIn(ProcessTemplates::kOverland), parent) {}
std::unique_ptr<KinetraForcingKvf> CKinetraForcingsOLKvf::NewItem() {
  return std::make_unique<KinetraForcingKvf>("CKinetraForcingsOLItemKvf", this);
}

CKinetraConstantsSZKvf::CKinetraConstantsSZKvf(CYbSEKvfBase* parent)
    : KinetraListKvf(kConstantLists, ActiveIn(ProcessTemplates::kSaturated), parent) {}
std::unique_ptr<KinetraConstantKvf> CKinetraConstantsSZKvf::NewItem() {
  return std::make_unique<KinetraConstantKvf>("CKinetraConstantsSZItemKvf", this);
}

CKinetraForcingsSZKvf::CKinetraForcingsSZKvf(CYbSEKvfBase* parent)
    : KinetraListKvf(kForcingLists, ActiveIn(ProcessTemplates::kSaturated), parent) {}
std::unique_ptr<KinetraForcingKvf> CKinetraForcingsSZKvf::NewItem() {
  return std::make_unique<KinetraForcingKvf>("CKinetraForcingsSZItemKvf", this);
}

CKinetraConstantsUZKvf::CKinetraConstantsUZKvf(CYbSEKvfBase* parent)
    : KinetraListKvf(kConstantLists, ActiveIn(ProcessTemplates::kUnsaturated), parent) {}
std::unique_ptr<CKinetraConstantsUZWQLayerListKvf> CKinetraConstantsUZKvf::NewItem() {
  return std::make_unique<CKinetraConstantsUZWQLayerListKvf>(this);
}

CKinetraForcingsUZKvf::CKinetraForcingsUZKvf(CYbSEKvfBase* parent)
    : KinetraListKvf(kForcingLists, ActiveIn(ProcessTemplates::kUnsaturated), parent) {}
std::unique_ptr<CKinetraForcingsUZWQLayerListKvf> CKinetraForcingsUZKvf::NewItem() {
  return std::make_unique<CKinetraForcingsUZWQLayerListKvf>(this);
}

}  // namespace tervane
