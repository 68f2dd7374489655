// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "surface/crop_list.h"

#include <chrono>
#include <map>
#include <string>
#include <unordered_map>
#include <utility>
#include <vector>

#include <fmt/format.h>

#include "data/datafile_request.h"
#include "simspec/periods.h"

namespace tervane {

namespace {

const CYbDateTime kLastDate{9999, 12, 31};

CYbDateTimeSpan LengthOf(const CTvnVegPropStageDataList& stages) {
  return CYbDateTimeSpan::Days(stages.empty() ? 0 : stages.back().DayStamp());
}

CYbDateTime Now() {
  const auto now = std::chrono::system_clock::now().time_since_epoch();
  return CYbDateTime::FromSecondsSinceEpoch(std::chrono::duration_cast<std::chrono::seconds>(now).count());
}

}  // namespace

// ---- A crop

CVegetationItemKvf::CVegetationItemKvf(const Condition& isUsed, CYbSEKvfBase* parent)
    : CYbSEKvfBase("New vegetation", "VegNo_%d", parent), file_(NewChild<CTvnVegPropFile>()) {
  const auto* period = Important(kSimulationPeriod);
  StartDate = Midnight(period ? period->GetSimStartDate() : Now());
  file_->UsedWhen(isUsed);
}

CYbDateTimeSpan CVegetationItemKvf::Length() const { return LengthOf(file_->Stages()); }

CYbDateTime CVegetationItemKvf::GetEndDate() const {
  if (!StartDate.IsValid()) return StartDate;
  const CYbDateTime end = StartDate + Length();
  return end.IsValid() ? end : kLastDate;
}

int CVegetationItemKvf::ValidateData() {
  if (!file_->IsFileUsed()) return 1;
  if (!StartDate.IsValid()) {
    AddError("The start date is no date: the crop is passed over", "STARTDATE");
    return 0;
  }
  const CTvnVegPropStageDataList stages = file_->Stages();
  if (!stages.empty() && stages.back().DayStamp() == 0)
    AddWarning("The crop has the length 0: it is never repeated", "STARTDATE");
  const auto* sequence = dynamic_cast<const CVegetationListKvf*>(GetParent());
  const auto* previous = sequence ? sequence->GetItem(sequence->GetNumberWhatIs(this) - 1) : nullptr;
  if (previous && previous->StartDate.IsValid() && StartDate < previous->StartDate)
    AddWarning("The crop begins before the one above it: crops are taken in the order of the list", "STARTDATE");
  const auto* period = Important(kSimulationPeriod);
  if (period && StartDate >= period->SIMEND)
    AddFinding({Severity::Note, "The crop and all below it are not used: it does not begin before the simulation ends",
                "STARTDATE", fmt::format("the simulation ends at {}", DateInWords(period->SIMEND))});
  return 1;
}

void CVegetationItemKvf::ExchangeKeys(KeyExchange& keys) { keys.Day("STARTDATE", StartDate); }

// ---- The sequence

CVegetationListKvf::CVegetationListKvf(Condition isUsed, CYbSEKvfBase* parent)
    : CYbSEKvfAbstractListBase("VegPropFile", "VEG_PROP_FILES", parent), isUsed_(std::move(isUsed)) {}

namespace {

/// The stages of crops, of which many may be one vegetation.
class StageLookup {
 public:
  const CTvnVegPropStageDataList& Of(const CTvnVegPropFile& file) {
    const auto [known, isNew] = byFile_.try_emplace(&file);
    if (!isNew) return *known->second;
    const auto [found, isRead] = byName_.try_emplace({file.File.Absolute(), file.VegetationName()});
    if (isRead) found->second = file.Stages();
    known->second = &found->second;
    return found->second;
  }

 private:
  std::map<std::pair<std::string, std::string>, CTvnVegPropStageDataList> byName_;
  std::unordered_map<const CTvnVegPropFile*, const CTvnVegPropStageDataList*> byFile_;
};

CropCalendar CalendarOf(const CVegetationListKvf& list, StageLookup& stages) {
  const auto* period = list.Important(kSimulationPeriod);
  if (!period) return {};
  std::vector<PlannedCrop> crops;
  for (int number = 1; number <= list.GetItemCount(); ++number) {
    const CVegetationItemKvf& item = *list.GetItem(number);
    crops.push_back({&item.VegPropFile(), item.StartDate, LengthOf(stages.Of(item.VegPropFile())), item.Valid() != 0});
  }
  return BuildVegCalendar(crops, list.RecycleMode, period->SIMEND);
}

}  // namespace

std::unique_ptr<CVegetationItemKvf> CVegetationListKvf::NewItem() {
  return std::make_unique<CVegetationItemKvf>(isUsed_, this);
}

CropCalendar CVegetationListKvf::BuildVegCalendar() const {
  StageLookup stages;
  return CalendarOf(*this, stages);
}

CropDevelopment CVegetationListKvf::Development() const {
  // Many more than there are pixels and days in any simulation.
  constexpr std::size_t kMostCrops = 20'000;
  CropDevelopment development;
  const auto* period = Important(kSimulationPeriod);
  const CYbDateTime start = period ? period->GetSimStartDate() : CYbDateTime();
  if (!start.IsValid() || period->SIMEND <= start) {
    development.problem = "the dates of the simulation are none, or in no order";
    return development;
  }
  StageLookup stages;
  const CropCalendar calendar = CalendarOf(*this, stages);
  if (calendar.entries.size() > kMostCrops) {
    development.problem = fmt::format("the calendar has {} crops, more than {}", calendar.entries.size(), kMostCrops);
    return development;
  }
  return DevelopmentOf(calendar.entries,
                       [&](const CTvnVegPropFile& file) -> const CTvnVegPropStageDataList& { return stages.Of(file); },
                       {start.SecondsSinceEpoch(), period->SIMEND.SecondsSinceEpoch()});
}

int CVegetationListKvf::ValidateData() {
  if (isUsed_.Holds(*this) && BuildVegCalendar().isCut)
    AddWarning(fmt::format("The calendar of crops has more than {} entries: what is behind them is left out",
                           CropCalendar::kMostEntries),
               "RecycleMode");
  return 1;
}

void CVegetationListKvf::ExchangeKeys(KeyExchange& keys) { keys("RecycleMode", RecycleMode).OneOf(kRecycleModes); }

}  // namespace tervane
