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

constexpr KinetraListKind kOverlandConstants{"Kinetra Constants", "KinetraConstants", "Kinetra_Constants.htm",
                                             "CKinetraConstantsOLItemKvf"};
constexpr KinetraListKind kOverlandForcings{"Kinetra Forcings", "KinetraForcings", "Kinetra_Forcings.htm",
                                            "CKinetraForcingsOLItemKvf"};
constexpr KinetraListKind kLayerConstants{"Kinetra Constants", "KinetraConstants", "Kinetra_Constants.htm",
                                          "CKinetraConstantsSZItemKvf"};
constexpr KinetraListKind kLayerForcings{"Kinetra Forcings", "KinetraForcings", "Kinetra_Forcings.htm",
                                         "CKinetraForcingsSZItemKvf"};
constexpr KinetraListKind kSoilConstants{"Kinetra Constants", "KinetraConstants", "Kinetra_Constants.htm",
                                         "CKinetraConstantsUZWQLayerListKvf"};
constexpr KinetraListKind kSoilForcings{"Kinetra Forcings", "KinetraForcings", "Kinetra_Forcings.htm",
                                        "CKinetraForcingsUZWQLayerListKvf"};

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

CKinetraConstantsUZWQLayerListKvf::CKinetraConstantsUZWQLayerListKvf(std::string_view className, CYbSEKvfBase* parent)
    : KinetraValue(std::string(), std::string("KinetraConstant"), std::string("Constant_%d"), parent) {
  SetClassName(className);
  SetPage(kKinetraConstantLayersPage);
}

CKinetraForcingsUZWQLayerListKvf::CKinetraForcingsUZWQLayerListKvf(std::string_view className, CYbSEKvfBase* parent)
    : KinetraValue("Kinetra layers for ", std::string("KinetraForcing"), std::string("Forcing_%d"), parent) {
  SetClassName(className);
  SetPage(kKinetraForcingLayersPage);
}

// ---- Lists

template <class Item>
KinetraListKvf<Item>::KinetraListKvf(const KinetraListKind& kind, Condition takesPart, CYbSEKvfBase* parent)
    : CYbSEKvfAbstractListBase<Item>(kind.title, kind.section, parent), itemClassName_(kind.itemClassName) {
  this->SetHelp("Top.chm", kind.helpPage);
  this->SetPage(kHelpPage);
  this->TakesPartWhen(std::move(takesPart));
}

CKinetraConstantsOLKvf::CKinetraConstantsOLKvf(CYbSEKvfBase* parent)
    : KinetraListKvf(kOverlandConstants, ActiveIn(ProcessTemplates::kOverland), parent) {}

CKinetraForcingsOLKvf::CKinetraForcingsOLKvf(CYbSEKvfBase* parent)
    : KinetraListKvf(kOverlandForcings, ActiveIn(ProcessTemplates::kOverland), parent) {}

CKinetraConstantsSZKvf::CKinetraConstantsSZKvf(CYbSEKvfBase* parent)
    : KinetraListKvf(kLayerConstants, ActiveIn(ProcessTemplates::kSaturated), parent) {}

CKinetraForcingsSZKvf::CKinetraForcingsSZKvf(CYbSEKvfBase* parent)
    : KinetraListKvf(kLayerForcings, ActiveIn(ProcessTemplates::kSaturated), parent) {}

CKinetraConstantsUZKvf::CKinetraConstantsUZKvf(CYbSEKvfBase* parent)
    : KinetraListKvf(kSoilConstants, ActiveIn(ProcessTemplates::kUnsaturated), parent) {}

CKinetraForcingsUZKvf::CKinetraForcingsUZKvf(CYbSEKvfBase* parent)
    : KinetraListKvf(kSoilForcings, ActiveIn(ProcessTemplates::kUnsaturated), parent) {}

}  // namespace tervane
