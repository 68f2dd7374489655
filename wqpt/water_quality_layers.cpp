// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "wqpt/water_quality_layers.h"

#include "simspec/conditions.h"
#include "wqpt/decay_entries.h"
#include "wqpt/ground.h"
#include "wqpt/kinetra_specification.h"
#include "wqpt/kinetra_values.h"
#include "wqpt/pages.h"
#include "wqpt/sorption_entries.h"
#include "wqpt/species_entries.h"

namespace tervane {

namespace {

const Data2DKind kLayerLowerLevel{
    .className = "CData2DWQKvf", .section = "LowerLevel", .title = "Lower Level", .itemType = quantity::kElevation};

}  // namespace

CWQLayerItemKvf::CWQLayerItemKvf(CYbSEKvfBase* parent) : NamedItemKvf("WQLayerItem", "WQLayer_%d", "WQLayer", parent) {
  SetHelp("Top.chm", "WQ_Layer.htm");
  SetPage(kHelpPage);
  NewChild<CData2DKvf>(kLayerLowerLevel);
  NewChild<CDualPorosityTransferCoeffListKvf>();
  NewChild<CWQLayerDecayProcessesKvf>();
  NewChild<CWQLayerSorptionProcesses>();
  NewChild<CKinetraConstantsSZKvf>();
  NewChild<CKinetraForcingsSZKvf>();
}

CWQLayerListKvf::CWQLayerListKvf(CYbSEKvfBase* parent) : NamedListKvf("Water Quality Layers", "SatWQLayers", parent) {
  SetPage(kWaterQualityLayersPage);
  TakesPartWhen((Component(&CModelCompKvf::WQ) && WaterQualityComponent(&CModelCompWQKvf::SZ) &&
                 !Method(&CModelCompKvf::ADPTRadio, kParticleTracking) &&
                 (AnyDecay() || AnySorption() || ImmobileWaterModelled())) ||
                CompartmentActive(ProcessTemplates::kSaturated));
  SetItemCount(1, 1);
}

void CWQLayerListKvf::BeginItem(int /*number*/) {
  if (auto* templates = Important(kKinetraSpecification)) templates->CompleteLayers();
}

}  // namespace tervane
