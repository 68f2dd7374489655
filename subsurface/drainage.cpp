// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/drainage.h"

#include "simspec/conditions.h"
#include "simspec/pages.h"
#include "spatial/geo_data.h"
#include "subsurface/pages.h"
#include "subsurface/saturated_zone.h"

namespace tervane {

namespace {

constexpr KeyChoice kSubsurfaceDrainageOptions[] = {
    {CDrainageSZKvf::kNoDrainage, "No drainage", false},
    {CDrainageSZKvf::kDownhill, "Drainage routed downhill based on adjacent drain levels"},
    {CDrainageSZKvf::kByCodes, "Drainage routing based on grid codes"},
    {CDrainageSZKvf::kDistributed, "Distributed drainage options"},
    {CDrainageSZKvf::kRemoved, "Drainage not routed, but removed from model"}};

const Data2DKind kDrainLevelKind{.className = "CDrainageLevelSZKvf",
                                 .section = "Level",
                                 .title = "Level",
                                 .itemType = quantity::kElevation,
                                 .relativeToGround = Data2DKind::RelativeToGround::Off};
const Data2DKind kTimeConstantKind{.className = "CDrainageTimeConstantSZKvf",
                                   .section = "TimeConstant",
                                   .title = "Time Constant",
                                   .itemType = quantity::kLeakageCoefficient};
const Data2DKind kDrainCodeKind{
    .className = "CDrainageCodesSZKvf", .section = "DrainCode", .title = "Drain Codes", .itemType = quantity::kCode};
const Data2DKind kDrainOptionKind{.className = "CDrainageDistributedSZKvf",
                                  .section = "DistributedOptionCode",
                                  .title = "Option Distribution",
                                  .itemType = quantity::kCode};

const Data2DKind kDrainCells{.className = "CGeoDataWM2DKvf",
                             .section = "Distribution",
                             .title = "Option Distribution",
                             .itemType = quantity::kCode,
                             .mayLeaveCells = true};
const Data2DKind kDrainLevel{.className = "CGeoDataWM2DKvf",
                             .section = "Level",
                             .title = "Level",
                             .itemType = quantity::kElevation,
                             .relativeToGround = Data2DKind::RelativeToGround::Off,
                             .mayLeaveCells = true};

Condition DrainageIncluded() { return OnInParent(&CSatZoneKvf::Drainage); }

}  // namespace

CDrainageSZKvf::CDrainageSZKvf(CYbSEKvfBase* parent) : CYbSEKvfBase("Drainage", "Drainage", parent) {
  SetPage(kDrainagePage);
  TakesPartWhen(OwnEngine() && DrainageIncluded());
  NewChild<CData2DKvf>(kDrainLevelKind);
  NewChild<CData2DKvf>(kTimeConstantKind, !Is(DrainageOption, kNoDrainage));
  NewChild<CData2DKvf>(kDrainCodeKind, Is(DrainageOption, {kByCodes, kDistributed}));
  NewChild<CData2DKvf>(kDrainOptionKind, Is(DrainageOption, kDistributed));
}

void CDrainageSZKvf::ExchangeKeys(KeyExchange& keys) {
  constexpr int kFirstVersionHere = 8;
  keys.Since(kFirstVersionHere)("DrainageOption", DrainageOption).OneOf(kSubsurfaceDrainageOptions);
}

CDrainageMFSZItemKvf::CDrainageMFSZItemKvf(CYbSEKvfBase* parent)
    : NamedItemKvf("Drainage_Modflow_Item", "Drainage_Modflow_%d", "Drain", parent) {
  SetHelp("Top.chm", "Tvn.htm");
  SetPage(kHelpPage);
  NewChild<CGeoDataWM2DKvf>(kDrainCells, CGeoDataWM2DKvf::kAnyDistribution);
  NewChild<CGeoDataWM2DKvf>(kDrainLevel, CGeoDataWM2DKvf::kAnyDistribution);
  // The list says which of all answers by their name: a drain that never came into the list must not.
  timeConstant_ = NewChild<CTimeseriesConstKvf>(quantity::kDrainageTimeConstant);
}

CDrainageMFSZKvf::CDrainageMFSZKvf(CYbSEKvfBase* parent) : CYbSEKvfListBase("Drainage", "Drainage_Modflow", parent) {
  SetPage(kModflowDrainsPage);
  TakesPartWhen(!OwnEngine() && DrainageIncluded());
}

void CDrainageMFSZKvf::SetItemCount(int count, int level) {
  CYbSEKvfListBase::SetItemCount(count, level);
  LetLatestAnswer();
}

void CDrainageMFSZKvf::DeleteItem(int number, int level) {
  CYbSEKvfListBase::DeleteItem(number, level);
  LetLatestAnswer();
}

void CDrainageMFSZKvf::InsertItem(int number, int level) {
  CYbSEKvfListBase::InsertItem(number, level);
  LetLatestAnswer();
}

void CDrainageMFSZKvf::ExchangeState(KeyExchange& keys) {
  CYbSEKvfListBase::ExchangeState(keys);
  // Undo and redo put the drains back before they come here.
  if (keys.IsReading()) LetLatestAnswer();
}

void CDrainageMFSZKvf::LetLatestAnswer() {
  if (!GetRoot()) return;
  const CDrainageMFSZItemKvf* latest = nullptr;
  for (int number = 1; number <= GetItemCount(); ++number)
    if (const CDrainageMFSZItemKvf* drain = GetItem(number); !latest || drain->Serial() > latest->Serial())
      latest = drain;
  if (latest)
    GetRoot()->RegisterImportantNode(&latest->TimeConstant(), kDrainTimeConstant.text);
  else
    GetRoot()->UnregisterImportantNode(kDrainTimeConstant.text);
}

}  // namespace tervane
