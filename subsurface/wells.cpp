// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/wells.h"

#include "libraries/wells.h"
#include "simspec/conditions.h"
#include "spatial/domain.h"
#include "subsurface/pages.h"
#include "subsurface/saturated_zone.h"

namespace tervane {

CSZWellKvf::CSZWellKvf(const int& areIncluded, CYbSEKvfBase* parent) : CYbSEKvfBase("Pumping Wells", "Well", parent) {
  SetPage(kWellsPage);
  TakesPartWhen(On(areIncluded));
}

void CSZWellKvf::ExchangeKeys(KeyExchange& keys) {
  keys("Filename", Filename);
  keys("IncludeMap", IncludeMap);
}

int CSZWellKvf::ValidateData() {
  if (Filename.IsEmpty()) {
    AddError("The pumping-well file is missing", "Filename");
    return 0;
  }
  return 1;
}

int CSZWellKvf::GetFractureWells() const {
  const auto* zone = Important(kSaturatedZone);
  return zone ? zone->FractureWells : 0;
}

void CSZWellKvf::SetFractureWells(int flag) {
  if (auto* zone = Important(kSaturatedZone)) zone->FractureWells = flag;
}

FileResult CSZWellKvf::CreateWellFile(const std::string& path) const {
  const auto* domain = Important(kDomain);
  return WriteEmptyWellFile(path, domain ? domain->GetEnvelope() : Envelope());
}

int FractureWellsInUse(const CYbSEKvfBase& node) {
  const bool byReservoirs = ModelCompOf(node).SZ_ModelType != kFiniteDifferenceSaturated;
  CSZWellKvf* wells = node.Important(byReservoirs ? kReservoirWells : kWells);
  return wells && wells->IsDlgUsedInSetup() ? wells->GetFractureWells() : 0;
}

}  // namespace tervane
