// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "simspec/periods.h"

#include <cmath>

#include <fmt/format.h>

namespace tervane {

// ---- CSimPeriodKvf

CYbDateTime CSimPeriodKvf::GetSimStartDate() const {
  if (HotStart && SimStartFromHotStartDate)
    if (const CYbDateTime hotStart = CYbDateTime::Parse(HotStartDate, kHotStartFormat); hotStart.IsValid())
      return hotStart;
  return SIMSTART;
}

int CSimPeriodKvf::ValidateData() {
  const CYbDateTime start = GetSimStartDate();
  if (!start.IsValid() || !SIMEND.IsValid()) {
    AddError("The simulation period has a date that is none", SIMEND.IsValid() ? "SIMSTART" : "SIMEND");
    return 0;
  }
  if (SIMEND == start) AddWarning("The simulation ends when it begins", "SIMEND");
  if (SIMEND >= start) return 1;
  AddError(
      "The simulation ends before it begins", "SIMEND",
      fmt::format("it begins at {} and ends at {}", start.Format("%Y-%m-%d %H:%M"), SIMEND.Format("%Y-%m-%d %H:%M")));
  return 0;
}

void CSimPeriodKvf::ExchangeKeys(KeyExchange& keys) {
  keys("HotStart", HotStart);
  keys("HotStartResultFile", HotStartResultFile);
  // A text that is no date is written as five zeros.
  keys.Custom(
      "HotStartDate",
      [&] {
        const CYbDateTime date = CYbDateTime::Parse(HotStartDate, kHotStartFormat);
        return date.IsValid() ? date : CYbDateTime();
      },
      [&](const CYbDateTime& date) { HotStartDate = date.Format(kHotStartFormat); });
  keys("HotStartDateIndex", HotStartDateIndex);
  keys("SimStartFromHotStartDate", SimStartFromHotStartDate);
  // The engine gets the effective start; the held one survives.
  keys.Custom(
      "SIMSTART", [&] { return GetSimStartDate(); }, [&](const CYbDateTime& date) { SIMSTART = date; });
  keys("SIMEND", SIMEND);
}

void CSimPeriodKvf::ExchangeState(KeyExchange& keys) {
  CTvnKvfBase::ExchangeState(keys);
  keys("own start", SIMSTART);
  keys("text of the hot start date", HotStartDate);
  keys.Several("hot start dates", HotStartDates);
}

namespace {

/// The dates at which a catalogue holds a stored state, or nothing when it holds none.
struct HotStartData {
  CYbDateTime start;
  CYbDateTime end;
  CYbDateTimeSpan interval;
};

CYbDateTime ReadDate(KvfNode* section, const char* key) {
  int year = 0, month = 1, day = 1, hour = 0, minute = 0;
  kvfGetListParam(section, key, 1, "iiiii", &year, &month, &day, &hour, &minute);
  return {year, month, day, hour, minute};
}

bool ReadHotStartData(KvfFile* file, HotStartData& data) {
  constexpr int firstVersionWithHotStart = 1002;
  int version = 0, hasData = 0;
  double hours = 0;
  KvfNode* target = kvfTargetByNameNum(file, "TVDRES", 1);
  KvfNode* general = kvfSectionByNameNum(target, "general", 1);
  kvfGetParam(kvfSectionByNameNum(general, "version", 1), "VersionNumber", &version, 1, 1);
  if (version < firstVersionWithHotStart) return false;
  KvfNode* period = kvfSectionByNameNum(target, "OutputPeriodAndMaxTimestep", 1);
  kvfGetParam(period, "HotStartData", &hasData, 1, 1);
  if (hasData != 1) return false;
  kvfGetParam(period, "HotstartStoringTimestep_Hrs", &hours, 1, 1);
  data.interval = std::isfinite(hours) ? CYbDateTimeSpan::Days(hours / 24) : CYbDateTimeSpan{};
  data.start = ReadDate(period, "StartDate");
  data.end = ReadDate(period, "EndDate");
  return true;
}

}  // namespace

int CSimPeriodKvf::LoadHotStartDates(const std::string& path) {
  HotStartDates.clear();
  if (!HotStart || path.empty()) return 0;
  kvfGetErrorGlb();  // what an earlier reader left
  KvfFile* file = kvfLoadFile(path, 1);
  HotStartData data;
  const bool isRead = kvfGetErrorGlb() == kKvfNoError && ReadHotStartData(file, data);
  kvfClose(&file);
  if (!isRead) return 0;
  // A catalogue of a century of hours is the longest that is sensible; a damaged one must not fill the memory.
  constexpr std::size_t mostDates = 1'000'000;
  if (data.interval.seconds > 0)
    for (CYbDateTime date = data.start + data.interval;
         date.IsValid() && date <= data.end && HotStartDates.size() < mostDates; date = date + data.interval)
      HotStartDates.push_back(date.Format("%Y/%m/%d %H:%M:%S"));
  return 1;
}

// ---- Periods on flow results

namespace {

constexpr KeyChoice kRecyclings[] = {{CSimPeriodOnFlowBase::kNoRecycling, "No recycling on flow results"},
                                     {CSimPeriodOnFlowBase::kRecycling, "Recycling on flow results"},
                                     {CSimPeriodOnFlowBase::kConstantFlowField, "Constant Water Movement Flow Field"}};

}  // namespace

CSimPeriodOnFlowBase::CSimPeriodOnFlowBase(std::string title, std::string abbreviatedTitle, std::string section,
                                           CYbSEKvfBase* parent)
    : CTvnKvfBase(std::move(title), std::move(section), parent) {
  SetAbbreviatedTitle(std::move(abbreviatedTitle));
  if (const auto* period = Important(kSimulationPeriod)) {
    SimStart = CycleRestartDate = period->GetSimStartDate();
    SimEnd = CycleEndDate = FlowFieldSolutionDate = period->SIMEND;
  }
}

void CSimPeriodOnFlowBase::ExchangeKeys(KeyExchange& keys) {
  keys("SimStart", SimStart);
  keys("SimEnd", SimEnd);
  keys("RecyclingType", RecyclingType).OneOf(kRecyclings);
  keys("CycleRestartDate", CycleRestartDate);
  keys("CycleEndDate", CycleEndDate);
  keys("FlowFieldSolutionDate", FlowFieldSolutionDate);
}

int CSimPeriodOnFlowBase::ValidateData() {
  CYbDateTime start, end;
  if (const auto* period = Important(kSimulationPeriod)) {
    start = period->GetSimStartDate();
    end = period->SIMEND;
  }
  bool valid = true;
  const auto require = [&](bool holds, const char* key, const char* error) {
    if (holds) return;
    AddError(error, key);
    valid = false;
  };
  const auto isWithin = [&](const CYbDateTime& date) { return date >= start && date <= end; };
  switch (RecyclingType) {
    case 0:
      require(SimStart >= start, "SimStart",
              "Water Quality Start Date can't be before Water Movement Simulation Start Date.");
      require(SimEnd <= end, "SimEnd", "Water Quality End Date can't be after Water Movement Simulation End Date.");
      break;
    case 1:
      require(isWithin(SimStart), "SimStart",
              "Water Quality Start Date must be between Water Movement Simulation Start Date and Simulation End Date.");
      require(
          isWithin(CycleRestartDate), "CycleRestartDate",
          "Water Quality Cycle Restart Date must be between Water Movement Simulation Start Date and Simulation End "
          "Date.");
      require(isWithin(CycleEndDate), "CycleEndDate",
              "Water Quality Cycle End Date must be between Water Movement Simulation Start Date and Simulation End "
              "Date.");
      break;
    case 2:
      require(isWithin(FlowFieldSolutionDate), "FlowFieldSolutionDate",
              "Water Quality Flow Field Date must be between Water Movement Simulation Start Date and Simulation End "
              "Date.");
      break;
    default:
      break;
  }
  return valid;
}

}  // namespace tervane
