// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "simspec/modflow_output.h"

#include <ctime>

#include <fmt/chrono.h>
#include <fmt/format.h>

#include "simspec/conditions.h"
#include "simspec/pages.h"
#include "simspec/periods.h"

namespace tervane {

namespace {

constexpr KeyChoice kOutputControls[] = {{COutputModKvf::kEquidistant, "Equidistant time step output."},
                                         {COutputModKvf::kEveryNthTimeStep, "Write output every n'th time step"},
                                         {COutputModKvf::kSpecified, "Specified output dates"}};

/// A package, as each place of the list has it.
struct Package {
  std::string_view name, dataType;
  bool offersAscii, offersBinary;
};
constexpr std::string_view kRecharge = "RECHARGE", kEvapotranspiration = "EVAPOTRANSPIRATION", kDrain = "DRAIN",
                           kWell = "WELL";
constexpr Package kPackages[] = {{"Head", "HEAD", true, true},
                                 {"Drawdown", "DRAWDOWN", true, true},
                                 {"Water balace/budget", "BUDGET", true, false},
                                 {"Cell by cell", "BCF", true, true},
                                 {"Recharge", kRecharge, false, true},
                                 {"Evapotranspiration", kEvapotranspiration, false, true},
                                 {"Drainage", kDrain, true, true},
                                 {"Well/FWL", kWell, true, true}};

/// The package at the place of an item, or null.
const Package* PackageOf(const COutputModPackageItemKvf& item) {
  const auto place = static_cast<std::size_t>(item.GetParent()->GetNumberWhatIs(&item)) - 1;
  return place < std::size(kPackages) ? &kPackages[place] : nullptr;
}

Condition IsPackage(std::string_view dataType) {
  return Condition::Sentence(fmt::format("the package is {}", dataType), [dataType](const CYbSEKvfBase& node) {
    const auto* item = dynamic_cast<const COutputModPackageItemKvf*>(&node);
    return item && item->DataTypeID == dataType;
  });
}

Condition WithWells() {
  return Condition::OfKey(
      [](const CYbSEKvfBase& node) {
        const WellChoice* zone = node.Important(kWellChoice);
        return zone ? Condition::KeyOfNode{dynamic_cast<const CYbSEKvfBase*>(zone), &zone->GetWells(), zone->GetWells()}
                    : Condition::KeyOfNode{};
      },
      {}, true);
}

constexpr std::string_view kDateFormat = "%Y-%m-%d %H:%M";

/// The moment as a clock beside the computer shows it.
CYbDateTime Now() {
  return CYbDateTime::Parse(fmt::format("{:%Y-%m-%d %H:%M}", fmt::localtime(std::time(nullptr))), kDateFormat);
}

std::string TextOf(const CYbDateTime& date) { return date.Format(kDateFormat); }

}  // namespace

// ---- Dates

COutputModDateItemKvf::COutputModDateItemKvf(CYbSEKvfBase* list) : CTvnKvfBase("OutputDate", "OutputDate_%d", list) {
  const auto* period = Important(kSimulationPeriod);
  Date = period ? period->SIMEND : Now();
}

COutputModDatesListKvf::COutputModDatesListKvf(CYbSEKvfBase* parent)
    : ModflowOutputListKvf("Output Dates", "OutputDates", parent) {
  TakesPartWhen(WithEngine({kEngineModflowSurfact}) &&
                IsInParent(&COutputModKvf::OutputControlOption, {COutputModKvf::kSpecified}));
}

int COutputModDatesListKvf::ValidateData() {
  CYbDateTime start, end;
  if (const auto* period = Important(kSimulationPeriod)) {
    start = period->GetSimStartDate();
    end = period->SIMEND;
  }
  const auto fail = [this](const char* error, int number, std::string_view what, const CYbDateTime& bound) {
    AddError(error, {},
             fmt::format("output date {} is {}, {} {}", number, TextOf(GetItem(number)->Date), what, TextOf(bound)));
    return 0;
  };
  for (int number = 1; number <= GetItemCount(); ++number) {
    const CYbDateTime& date = GetItem(number)->Date;
    if (date < start)
      return fail(
          "At least one Output Date is before Simulation Start Date. All out dates dates must be after Simulation "
          "Start Date.",
          number, "the simulation starts at", start);
    if (date > end)
      return fail(
          "At least one Output Date is after Simulation End Date. All Output Dates must be before Simulation End Date.",
          number, "the simulation ends at", end);
    if (number > 1 && date <= GetItem(number - 1)->Date)
      return fail(
          "All Output Dates must be increasing. Select rows with wrong placed date and use arrow up and down to shift "
          "these rows to the right position.",
          number, "the one before it", GetItem(number - 1)->Date);
  }
  return 1;
}

// ---- Time steps

void COutputModTimestepItemKvf::ExchangeKeys(KeyExchange& keys) {
  if (keys.Section()) StressPeriod = 1;
  keys("StressPeriod", StressPeriod).Label("Stress period").AtLeast(1);
  keys("Timestep", Timestep).Label("Time step").AtLeast(1);
}

COutputModTimestepListKvf::COutputModTimestepListKvf(CYbSEKvfBase* parent)
    : ModflowOutputListKvf("Output Timesteps", "OutputTimesteps", parent) {
  TakesPartWhen(WithEngine({kEngineModflow96, kEngineModflow2000}));
}

// ---- Packages

COutputModPackageItemKvf::COutputModPackageItemKvf(CYbSEKvfBase* list)
    : CTvnKvfBase("PackageOutput", "PackageOutput_%d", list) {
  TakesPartWhen((!IsPackage(kRecharge) || ModflowComponent(&CModModelCompKvf::Recharge)) &&
                (!IsPackage(kEvapotranspiration) || ModflowComponent(&CModModelCompKvf::ET)) && !IsPackage(kDrain) &&
                (!IsPackage(kWell) || WithWells()));
}

std::string_view COutputModPackageItemKvf::DisplayName() const {
  const Package* package = PackageOf(*this);
  return package ? package->name : std::string_view();
}

bool COutputModPackageItemKvf::OffersAscii() const {
  const Package* package = PackageOf(*this);
  return !package || package->offersAscii;
}

bool COutputModPackageItemKvf::OffersBinary() const {
  const Package* package = PackageOf(*this);
  return !package || package->offersBinary;
}

void COutputModPackageItemKvf::ExchangeKeys(KeyExchange& keys) {
  keys("DataTypeID", DataTypeID);
  keys("ASCII", ASCII);
  keys("Binary", Binary);
}

COutputModPackageListKvf::COutputModPackageListKvf(CYbSEKvfBase* parent)
    : ModflowOutputListKvf("Packages Output", "PackagesOutput", parent) {
  SetItemCount(static_cast<int>(std::size(kPackages)), 1);
  for (int number = 1; number <= GetItemCount(); ++number) GetItem(number)->DataTypeID = kPackages[number - 1].dataType;
}

// ---- The whole

COutputModKvf::COutputModKvf(CYbSEKvfBase* parent)
    : CTvnKvfBase("Storing of results", "OutputModflow", parent),
      dates_(NewChild<COutputModDatesListKvf>()),
      timeSteps_(NewChild<COutputModTimestepListKvf>()),
      packages_(NewChild<COutputModPackageListKvf>()) {
  SetPage(kModflowOutputPage);
  TakesPartWhen(AnyModflow());
}

void COutputModKvf::ExchangeKeys(KeyExchange& keys) {
  keys("OutputControlOption", OutputControlOption).OneOf(kOutputControls);
  keys("StoringTimeStep", StoringTimeStep).AtLeast(1);
  keys("StoringTimeStepHours", StoringTimeStepHours).Unit("[hours]").Above(0);
  keys("ModPath", ModPath);
}

}  // namespace tervane
