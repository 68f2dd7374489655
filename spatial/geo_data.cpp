// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/geo_data.h"

#include "simspec/conditions.h"

namespace tervane {

namespace {

Condition WithParametersBy(int distribution) {
  if (distribution == CGeoDataWM2DKvf::kAnyDistribution) return {};
  return Condition::OfKey(
      [](const CYbSEKvfBase& node) -> Condition::KeyOfNode {
        const auto* ground = node.Important(kGroundParameters);
        if (!ground) return {nullptr, nullptr, 0};
        const int& type = ground->TypeOfGeoParaDistribution();
        return {dynamic_cast<const CYbSEKvfBase*>(ground), &type, type};
      },
      {distribution}, false);
}

}  // namespace

CGeoDataWM2DKvf::CGeoDataWM2DKvf(Data2DKind kind, int distribution, CYbSEKvfBase* parent)
    : CData2DKvf(std::move(kind), Component(&CModelCompKvf::WM) && WithParametersBy(distribution), parent) {}

int CGeoDataWM2DKvf::ValidateData() {
  const int isValid = CData2DKvf::ValidateData();
  if (CYbSEKvfBase* parent = GetParent()) parent->ValidateData();
  if (!HasErrorText()) return isValid;
  AddError(errorText_);
  return 0;
}

}  // namespace tervane
