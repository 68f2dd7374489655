// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "surface/stress_period_grids.h"

#include <fmt/format.h>

#include "simspec/stress_periods.h"
#include "surface/pages.h"

namespace tervane {

// ---- A span

CRechargeAndPondingModItemKvf::CRechargeAndPondingModItemKvf(const StressPeriodGridsKind& kind,
                                                             CRechargeAndPondingModListKvf* list)
    : CData2DKvf({.className = "CRechargeAndPondingModItemKvf",
                  .section = "STRESSPERIODSPAN_%d",
                  .title = std::string(kind.title),
                  .itemType = kind.itemType,
                  .relativeToGround = kind.relativeToGround},
                 list),
      StressPeriodTo(list->StressPeriodCount()),
      list_(*list) {}

int CRechargeAndPondingModItemKvf::StressPeriodFrom() const {
  const CRechargeAndPondingModItemKvf* before = list_.GetItem(list_.GetNumberWhatIs(this) - 1);
  return before ? before->StressPeriodTo + 1 : 1;
}

std::string CRechargeAndPondingModItemKvf::DatesText() const {
  const auto* periods = Important(kStressPeriods);
  if (!periods) return {};
  return fmt::format("From {} to {}", periods->GetDateText(StressPeriodFrom() - 1),
                     periods->GetDateText(StressPeriodTo));
}

void CRechargeAndPondingModItemKvf::TakeTitles() {
  const int from = StressPeriodFrom();
  SetTitle(fmt::format("{} for Stress Period {} to {}", list_.GetTitle(), from, StressPeriodTo));
  SetAbbreviatedTitle(fmt::format("StressP. {}-{}", from, StressPeriodTo));
}

void CRechargeAndPondingModItemKvf::ExchangeKeys(KeyExchange& keys) {
  keys("StressPeriodTo", StressPeriodTo).Label("To Stress Period");
  CData2DKvf::ExchangeKeys(keys);
}

void CRechargeAndPondingModItemKvf::ReadData(KvfNode* section) {
  CData2DKvf::ReadData(section);
  TakeTitles();
}

int CRechargeAndPondingModItemKvf::ValidateData() {
  TakeTitles();
  return CData2DKvf::ValidateData();
}

// ---- The list

CRechargeAndPondingModListKvf::CRechargeAndPondingModListKvf(const StressPeriodGridsKind& kind, Condition takesPart,
                                                             CYbSEKvfBase* parent)
    : CYbSEKvfAbstractListBase(std::string(kind.title), std::string(kind.section), parent), kind_(kind) {
  SetPage(kStressPeriodGridsPage);
  TakesPartWhen(std::move(takesPart));
}

std::unique_ptr<CRechargeAndPondingModItemKvf> CRechargeAndPondingModListKvf::NewItem() {
  return std::make_unique<CRechargeAndPondingModItemKvf>(kind_, this);
}

int CRechargeAndPondingModListKvf::StressPeriodCount() const {
  const auto* periods = Important(kStressPeriods);
  return periods ? periods->GetItemCount() : 0;
}

std::vector<int> CRechargeAndPondingModListKvf::SpanEnds() const {
  std::vector<int> ends;
  for (int number = 1; number <= GetItemCount(); ++number) ends.push_back(GetItem(number)->StressPeriodTo);
  return ends;
}

int CRechargeAndPondingModListKvf::ValidateData() {
  const int periods = StressPeriodCount();
  bool isValid = true;
  if (CRechargeAndPondingModItemKvf* last = GetItem(GetItemCount())) {
    const CRechargeAndPondingModItemKvf* before = GetItem(GetItemCount() - 1);
    const int endBefore = before ? before->StressPeriodTo : 1;
    if (last->StressPeriodTo > periods && endBefore > periods) {
      AddError("Last Stress period is not valid", {},
               fmt::format("the last span cannot begin behind period {} of {}", endBefore, periods));
      isValid = false;
    } else {
      last->StressPeriodTo = periods;
    }
  }
  int end = 0;
  for (int number = 1; number <= GetItemCount(); ++number) {
    const int to = GetItem(number)->StressPeriodTo;
    const auto fail = [&](const char* error) {
      AddError(error, {}, fmt::format("span {} goes from period {} to {} of {}", number, end + 1, to, periods));
      return 0;
    };
    if (end >= to) return fail("To must be greater than or equal to From");
    end = to;
    if (end > periods) return fail("To can not be greater than last Stress Period number");
  }
  return isValid;
}

}  // namespace tervane
