// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/geo_data.h"

#include <map>
#include <mutex>

#include <fmt/format.h>

#include "simspec/conditions.h"

namespace tervane {

Condition GroundParametersBy(int distribution) {
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

namespace {

/// The rule of a quantity of water movement, made once for each way to tell parameters: layers have many of them.
const Condition& WaterMovementBy(int distribution) {
  static std::map<int, Condition> rules;
  static std::mutex mutex;
  const std::lock_guard lock(mutex);
  const auto [place, isNew] = rules.try_emplace(distribution);
  if (isNew) place->second = Component(&CModelCompKvf::WM) && GroundParametersBy(distribution);
  return place->second;
}

}  // namespace

CGeoDataWM2DKvf::CGeoDataWM2DKvf(Data2DKind kind, int distribution, CYbSEKvfBase* parent)
    : JudgedData2DKvf(std::move(kind), WaterMovementBy(distribution), parent) {}

int JudgedData2DKvf::ValidateData() {
  const int isValid = CData2DKvf::ValidateData();
  if (CYbSEKvfBase* parent = GetParent(); parent && !IsValidatedWithParent()) parent->ValidateData();
  if (!HasValidationMessage()) return isValid;
  // Beside the text, which is the same for all, stand the parent's name and its own.
  const CYbSEKvfBase* parent = GetParent();
  const std::string place = parent ? parent->GetAbbreviatedTitle() : std::string();
  AddError(message_, "FixedValue", place.empty() ? GetTitle() : fmt::format("{}, {}", place, GetTitle()));
  return 0;
}

}  // namespace tervane
