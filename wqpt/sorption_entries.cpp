// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "wqpt/sorption_entries.h"

#include <algorithm>

#include "simspec/conditions.h"
#include "wqpt/layer_values.h"
#include "wqpt/soil_values.h"

namespace tervane {

namespace {

using Sorption = CProcessesWQ_SorptionItemKvf;

constexpr EntriesKind kSoilSorptions{.section = "Sorption_Processes",
                                     .title = "Sorption Processes",
                                     .shortTitle = "",
                                     .helpPage = "UZ_Sorption_Processes.htm",
                                     .master = kSorptions.text};
constexpr EntriesKind kLayerSorptions{.section = "Sorption_Processes",
                                      .title = "Sorption Processes",
                                      .shortTitle = "",
                                      .helpPage = "WQ_Sorption_Processes.htm",
                                      .master = kSorptions.text};

/// The process that a coefficient's entry follows.
const Sorption* SorptionOf(const CYbSEKvfBase& coefficient) {
  const auto* entry = dynamic_cast<const CSorptionProcessesItemBase*>(coefficient.GetParent());
  auto* list = coefficient.Important(kSorptions);
  return entry && list ? static_cast<const Sorption*>(list->FindDependentItem(entry->GetId())) : nullptr;
}

enum class SorptionRule { Linear, Freundlich, Langmuir, Kinetic, Hysteresis };

const Condition& RuleOf(SorptionRule rule) {
  const auto isotherm = [](int type) { return Is<Sorption>(SorptionOf, &Sorption::IsothermType, {type}); };
  static const Condition kinetic = Is<Sorption>(SorptionOf, &Sorption::Type, {Sorption::kEquilibriumKinetic});
  static const Condition rules[] = {
      isotherm(Sorption::kLinear), isotherm(Sorption::kFreundlich), isotherm(Sorption::kLangmuir), kinetic,
      kinetic && Is<Sorption>(SorptionOf, &Sorption::KineticType, {Sorption::kHysteresis})};
  return rules[static_cast<std::size_t>(rule)];
}

/// A coefficient, in the words of both zones.
struct SorptionCoefficient {
  const char* section;
  SorptionRule rule;
  int itemType;
  const char *soilTitle, *soilShortTitle;
  const char *layerTitle, *layerShortTitle;
};
constexpr SorptionCoefficient kCoefficients[] = {
    {"Linear_Kd", SorptionRule::Linear, quantity::kSorptionCoefficient,
     "Linear Sorption Coefficient, Kd - Unsaturated Zone", "Linear Kd",
     "Linear Sorption Coefficient, Kd - Saturated Zone", "Linear Kd"},
    {"Freundlich_Kf", SorptionRule::Freundlich, quantity::kSorptionCoefficient,
     "Non-linear Freundlich Sorption Coefficient, Kf - Unsaturated Zone", "Freundlich Kf",
     "Non-linear Freundlich Sorption Coefficient, Kf - Saturated Zone", "Freundlich Kf"},
    {"Freundlich_n", SorptionRule::Freundlich, quantity::kExponentOrCoefficient,
     "Non-linear Freundlich Sorption Exponent, N - Unsaturated Zone", "Freundlich n",
     "Non-linear Freundlich Sorption Exponent, N - Saturated Zone", "Freundlich N"},
    {"Langmuir_Alpha", SorptionRule::Langmuir, quantity::kSorptionCoefficient,
     "Non-linear Langmuir Sorption Coefficient, Alpha - Unsaturated Zone", "Langmuir Alpha",
     "Non-linear Langmuir Sorption Coefficient, Alpha - Saturated Zone", "Langmuir Alpha"},
    {"Langmuir_Beta", SorptionRule::Langmuir, quantity::kSorbedConcentration,
     "Maximum Sorbed Solute Concentration (Langmuir Beta) - Unsaturated Zone", "Langmuir Beta",
     "Maximum Sorbed Solute Concentration (Langmuir Beta) - Saturated Zone", "Langmuir Beta"},
    {"KinSorpRate", SorptionRule::Kinetic, quantity::kKineticRate, "Kinetic Sorption rate in unsaturated zone",
     "Kinetic Sorption Rate", "Kinetic Sorption Rate", "Kinetic Sorption Rate"},
    {"KinDeSorpRate", SorptionRule::Hysteresis, quantity::kKineticRate, "Kinetic desorption rate in unsaturated zone",
     "Kinetic Desorption Rate", "Kinetic Desorption Rate", "Kinetic Desorption Rate"},
};

SoilValueKind SoilKind(const SorptionCoefficient& row) {
  return {.className = "CSorptionProcessesData",
          .section = row.section,
          .title = row.soilTitle,
          .shortTitle = row.soilShortTitle,
          .itemType = row.itemType,
          .outside = "Valid Range: Value must be greater than or equal 0."};
}

Data2DKind LayerKind(const SorptionCoefficient& row) {
  return {.className = "CWQLayerData2DKVF",
          .section = row.section,
          .title = row.layerTitle,
          .itemType = row.itemType,
          .shortTitle = row.layerShortTitle};
}

}  // namespace

CSorptionProcessesItemKvf::CSorptionProcessesItemKvf(std::string name, CYbSEKvfBase* parent)
    : NamedEntry(std::move(name), std::string(), "Sorption_%d", parent) {
  SetHelp("Top.chm", "UZ_Sorption_Process.htm");
  SetPage(kHelpPage);
  static const std::vector<SoilValueKind> kKinds = [] {
    std::vector<SoilValueKind> kinds;
    for (const SorptionCoefficient& row : kCoefficients) kinds.push_back(SoilKind(row));
    return kinds;
  }();
  for (std::size_t i = 0; i < kKinds.size(); ++i)
    NewChild<SoilValuesKvf>(kKinds[i])->TakesPartWhen(RuleOf(kCoefficients[i].rule));
}

CSorptionProcessesKvf::CSorptionProcessesKvf(CYbSEKvfBase* parent)
    : EntriesKvf(kSoilSorptions,
                 AnySorption() && Component(&CModelCompKvf::WQ) && Component(&CModelCompKvf::UZ) &&
                     SorptionAndDecayModelled() && WaterQualityComponent(&CModelCompWQKvf::UZ),
                 parent) {
  FollowMaster();
}

CWQLayerSorptionProcessItemKvf::CWQLayerSorptionProcessItemKvf(std::string name, CYbSEKvfBase* parent)
    : NamedEntry(std::move(name), std::string("Sorption"), "Sorption_%d", parent) {
  SetHelp("Top.chm", "WQ_Sorption_Process.htm");
  SetPage(kHelpPage);
  for (const SorptionCoefficient& row : kCoefficients) NewChild<CWQLayerData2DKVF>(LayerKind(row), RuleOf(row.rule));
}

int CWQLayerSorptionProcessItemKvf::ValidateData() { return JudgeLayerValues(*this, true); }

CWQLayerSorptionProcesses::CWQLayerSorptionProcesses(CYbSEKvfBase* parent)
    : EntriesKvf(kLayerSorptions, AnySorption() && SorptionAndDecayModelled(), parent) {
  FollowMaster();
}

}  // namespace tervane
