// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/saturated_zone_reload.h"

#include <array>
#include <string_view>

#include "core/list.h"

namespace tervane {

namespace {

/// Sections of the two lists of computational layers, in the order of their second reading.
constexpr std::array<std::string_view, 2> kLayerLists{"CompLayersSZ", "CompLayersGeoSZ"};
constexpr std::string_view kInternalBoundary = "InternalBoundary";

void ReloadItem(CYbSEKvfBase& item, KvfNode* listSection) {
  KvfNode* section = listSection;
  if (!item.GetSectionName().empty()) {
    section = kvfSectionByNameNum(listSection, item.FormattedSectionName(), 1);
    if (!section) return;
    item.ReadData(section);
  }
  for (CYbSEKvfBase* child = item.GetFirstChild(); child; child = item.GetNextChild(child))
    if (child->GetSectionName() != kInternalBoundary) child->Load(section);
}

}  // namespace

void ReloadSaturatedZone(CYbSEKvfBase& saturatedZone, KvfNode* target) {
  if (!saturatedZone.GetSectionUsed()) return;
  KvfNode* section = kvfSectionByNameNum(target, saturatedZone.FormattedSectionName(), 1);
  if (!section) return;
  saturatedZone.ReadTouched(section);
  saturatedZone.ReadData(section);
  for (int number = 1; number <= saturatedZone.GetPropertyCount(); ++number)
    saturatedZone.GetProperty(number)->Load(section);

  std::array<CYbSEKvfListBaseInterface*, kLayerLists.size()> lists{};
  for (CYbSEKvfBase* child = saturatedZone.GetFirstChild(); child; child = saturatedZone.GetNextChild(child)) {
    const auto found = std::find(kLayerLists.begin(), kLayerLists.end(), child->GetSectionName());
    auto* list = found == kLayerLists.end() ? nullptr : dynamic_cast<CYbSEKvfListBaseInterface*>(child);
    if (list)
      lists[static_cast<std::size_t>(found - kLayerLists.begin())] = list;
    else
      child->Load(section);
  }
  for (CYbSEKvfListBaseInterface* list : lists) {
    KvfNode* listSection = list ? kvfSectionByNameNum(section, list->FormattedSectionName(), 1) : nullptr;
    if (!listSection) continue;
    for (int number = 1; number <= list->GetItemCount(); ++number) ReloadItem(*list->GetItemNode(number), listSection);
  }
}

}  // namespace tervane
