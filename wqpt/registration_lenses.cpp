// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "wqpt/registration_lenses.h"

#include <fmt/format.h>

#include "simspec/conditions.h"
#include "simspec/pages.h"
#include "wqpt/pages.h"

namespace tervane {

namespace {

const Data2DKind kParticleNumbers{.className = "CData2DParticleNumKvf",
                                  .section = "Initial_NumberOfParticles",
                                  .title = "Initial Number of Particles Per Cell",
                                  .itemType = quantity::kCode,
                                  .mayBeScattered = false};
const Data2DKind kRegistrationCodes{.className = "CData2DPTRegLayerKvf",
                                    .section = "PTRegistrationCodes",
                                    .title = "PT Registration codes",
                                    .itemType = quantity::kCode,
                                    .mayBeScattered = false};

Condition ParticlesTracked() { return OwnEngine() && Method(&CModelCompKvf::ADPTRadio, kParticleTracking); }

Condition ParticlesAre(int CModelCompPTKvf::*key, int value) {
  return Is<CModelCompPTKvf>([](const CYbSEKvfBase& node) { return node.Important(kParticleTrackingComponents); }, key,
                             {value});
}

int NumberOfNew(const CYbSEKvfBase* parent) {
  const auto* list = dynamic_cast<const CYbSEKvfListBaseInterface*>(parent);
  return list ? list->GetItemCount() + 1 : 1;
}

}  // namespace

CRegLensePTItemKvf::CRegLensePTItemKvf(CYbSEKvfBase* parent)
    : CYbSEKvfGroupBase("Lense", "Lense_%d", parent),
      LenseName(fmt::format("Zone{}", NumberOfNew(parent))),
      RegistrationCode(NumberOfNew(parent)) {
  SetHelp("Top.chm", "PT_Registration_Lense.htm");
  SetPage(kHelpPage);
  NewChild<ExtentKvf>("CRegLensePTExtentKvf", Is(ExtentType, kPartDomain));
  MakeExtentLevels(*this, {});
}

void CRegLensePTItemKvf::ExchangeKeys(KeyExchange& keys) {
  keys("LenseName", LenseName);
  keys("RegistrationCode", RegistrationCode);
  keys("ExtentType", ExtentType).OneOf(kExtentTypes);
}

CRegLensePTListKvf::CRegLensePTListKvf(CYbSEKvfBase* parent)
    : CYbSEKvfListBase("PT Registration Lenses", "PTRegistrationLenses", parent) {
  SetPage(kRegistrationLensesPage);
  TakesPartWhen(ParticlesTracked() &&
                ParticlesAre(&CModelCompPTKvf::RegistrationZoneRadio, CModelCompPTKvf::kByLenses));
}

bool IsParticleNumber(const CData2DKvf& quantity) { return quantity.Kind().className == kParticleNumbers.className; }

void MakeParticleValues(CYbSEKvfBase& layer) {
  // Rules are shared by all layers, of which there may be many.
  static const Condition kNumbers = ParticlesTracked() && Component(&CModelCompKvf::WQ) &&
                                    ParticlesAre(&CModelCompPTKvf::InitDensityRadio, CModelCompPTKvf::kByNumber);
  static const Condition kCodes =
      ParticlesTracked() && ParticlesAre(&CModelCompPTKvf::RegistrationZoneRadio, CModelCompPTKvf::kByLayers);
  layer.NewChild<CData2DKvf>(kParticleNumbers, kNumbers);
  layer.NewChild<CData2DKvf>(kRegistrationCodes, kCodes);
}

}  // namespace tervane
