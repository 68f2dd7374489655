// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/ground_properties.h"

#include "simspec/conditions.h"
#include "simspec/water_quality_conditions.h"
#include "subsurface/saturated_zone.h"

namespace tervane {

namespace {

using Rule = GroundProperty::Rule;

/// A key of the saturated zone.
Condition KeyOfZone(int CSatZoneKvf::*member, std::vector<int> values) {
  return Is<CSatZoneKvf>([](const CYbSEKvfBase& node) { return node.Important(kSaturatedZone); }, member,
                         std::move(values));
}
Condition FlagOfZone(int CSatZoneKvf::*flag) {
  return On<CSatZoneKvf>([](const CYbSEKvfBase& node) { return node.Important(kSaturatedZone); }, flag);
}

Condition SorbedSpecies() {
  constexpr int kSorbed = 1;
  return Condition::Sentence("a species is sorbed", [](const CYbSEKvfBase& node) {
    const auto* species = node.Important(kSpeciesTypes);
    return species && species->HasSpeciesOfType(kSorbed);
  });
}

Condition BulkDensityTaken() {
  return TakenByTemplates("primary bulk density", ProcessTemplates::kPrimaryBulkDensity) ||
         TakenByTemplates("secondary bulk density", ProcessTemplates::kSecondaryBulkDensity);
}

Condition BelowGround(std::vector<int> methods) {
  return WithEngine({kEngineModflowSurfact}) && ModflowComponent(&CModModelCompKvf::Subsurface) &&
         SubsurfaceIs(std::move(methods));
}

Condition AmbientHeadGiven() {
  return AirFlowModelled() && KeyOfZone(&CSatZoneKvf::TypeAmbientWaterHeadInput, {CSatZoneKvf::kDistributedHead});
}

struct ClassAndRule {
  const char* className;
  Condition rule;
};
ClassAndRule MakeRule(Rule rule) {
  const auto transport = [](TransportProperty property) {
    return ClassAndRule{"CGeoDataAD2DKvf", TransportNeeds(property) && GroundParametersBy(CSatZoneKvf::kByLayers)};
  };
  switch (rule) {
    case Rule::Always:
    case Rule::ByUnits:
    case Rule::ByLayers:
      return {"CGeoDataWM2DKvf", {}};  // the class has its own
    case Rule::Porosity:
      return transport(TransportProperty::Porosity);
    case Rule::MatrixPorosity:
      return transport(TransportProperty::MatrixPorosity);
    case Rule::BulkDensity:
      return transport(TransportProperty::BulkDensity);
    case Rule::HorizontalDispersivity:
      return transport(TransportProperty::HorizontalDispersivity);
    case Rule::VerticalDispersivity:
      return transport(TransportProperty::VerticalDispersivity);
    case Rule::AirFlowOfLayers:
      return {"CGeoDataMod2DPWCKvf",
              AmbientHeadGiven() && KeyOfZone(&CSatZoneKvf::TypeOfVerDiscr, {CSatZoneKvf::kAsGeology})};
    case Rule::AirFlowOfComputation:
      return {"CGeoDataMod2DPWCKvf",
              AmbientHeadGiven() && !KeyOfZone(&CSatZoneKvf::TypeOfVerDiscr, {CSatZoneKvf::kAsGeology})};
    case Rule::Anisotropy:
      return {"CGeoDataMod2DAnisoKvf", AnyModflow()};
    case Rule::VanGenuchten:
      return {"CGeoDataMod2DVanGenuchtenKvf", VariablySaturated()};
    case Rule::BrooksCorey:
      return {"CGeoDataMod2DBrooksCoreyKvf",
              VariablySaturated() && KeyOfZone(&CSatZoneKvf::TypeOfRelPerm, {CSatZoneKvf::kBrooksCorey})};
    case Rule::Rewetting:
      return {"CGeoDataMod2DWETDRYKvf", AnyModflow() && ModflowComponent(&CModModelCompKvf::Subsurface) &&
                                            SubsurfaceIs({kWithRewetting}) && FlagOfZone(&CSatZoneKvf::Threshold)};
  }
  return {};
}

/// The same, made once: all layers share their rules.
const ClassAndRule& Told(Rule rule) {
  static const std::vector<ClassAndRule> told = [] {
    std::vector<ClassAndRule> made;
    for (int i = 0; i <= static_cast<int>(Rule::Rewetting); ++i) made.push_back(MakeRule(static_cast<Rule>(i)));
    return made;
  }();
  return told[static_cast<std::size_t>(rule)];
}

const char* WhyOutside(GroundProperty::Range range, float value) {
  switch (range) {
    case GroundProperty::Range::AboveZero:
      return value > 0 ? "" : "Valid Range: Must be Greater than 0";
    case GroundProperty::Range::Fraction:
      return value >= 0 && value <= 1 ? "" : "Valid Range: 0 to 1.0 inclusive";
    case GroundProperty::Range::None:
      break;
  }
  return "";
}

}  // namespace

Condition AirFlowModelled() { return BelowGround({kVariablySaturatedWithAir}); }
Condition VariablySaturated() { return BelowGround({kVariablySaturated, kVariablySaturatedWithAir}); }
Condition RewettingModelled() { return BelowGround({kWithRewetting}); }

Condition TransportNeeds(TransportProperty property) {
  const Condition water = OwnEngine() && Component(&CModelCompKvf::WQ);
  const Condition advection =
      Method(&CModelCompKvf::ADPTRadio, kAdvectionDispersion) && WaterQualityComponent(&CModelCompWQKvf::SZ);
  const Condition either = water && (advection || Method(&CModelCompKvf::ADPTRadio, kParticleTracking));
  switch (property) {
    case TransportProperty::Porosity:
      return either;
    case TransportProperty::MatrixPorosity:
      return water && advection && FlagOfZone(&CSatZoneKvf::MassTransferToImmobileWater);
    case TransportProperty::BulkDensity:
      return water && advection && (SorbedSpecies() || BulkDensityTaken());
    case TransportProperty::HorizontalDispersivity:
      return either && KeyOfZone(&CSatZoneKvf::DispersionOption, {CSatZoneKvf::kIsotropy, CSatZoneKvf::kAnisotropy});
    case TransportProperty::VerticalDispersivity:
      return either && KeyOfZone(&CSatZoneKvf::DispersionOption, {CSatZoneKvf::kAnisotropy});
  }
  return {};
}

void MakeProperties(CYbSEKvfBase& owner, std::span<const GroundProperty> rows, bool mayLeaveCells) {
  for (const GroundProperty& row : rows) {
    const ClassAndRule& told = Told(row.rule);
    using Relative = Data2DKind::RelativeToGround;
    Data2DKind kind{.className = told.className,
                    .section = row.section,
                    .title = row.title,
                    .itemType = row.itemType,
                    .fixedValue = row.fixedValue,
                    .relativeToGround = row.mayBeRelative ? Relative::Off : Relative::Never,
                    .mayLeaveCells = mayLeaveCells,
                    .shortTitle = row.shortTitle};
    switch (row.rule) {
      case Rule::Always:
        owner.NewChild<CGeoDataWM2DKvf>(std::move(kind), CGeoDataWM2DKvf::kAnyDistribution);
        break;
      case Rule::ByUnits:
        owner.NewChild<CGeoDataWM2DKvf>(std::move(kind), static_cast<int>(CSatZoneKvf::kByUnits));
        break;
      case Rule::ByLayers:
        owner.NewChild<CGeoDataWM2DKvf>(std::move(kind), static_cast<int>(CSatZoneKvf::kByLayers));
        break;
      case Rule::Porosity:
      case Rule::MatrixPorosity:
      case Rule::BulkDensity:
      case Rule::HorizontalDispersivity:
      case Rule::VerticalDispersivity:
        owner.NewChild<CGeoDataAD2DKvf>(std::move(kind), told.rule);
        break;
      default:
        owner.NewChild<CData2DKvf>(std::move(kind), told.rule);
    }
  }
}

bool JudgeProperties(const CYbSEKvfBase& owner, std::span<const GroundProperty> rows) {
  bool areValid = true;
  // The quantities stand in the order of their rows.
  auto row = rows.begin();
  for (CYbSEKvfBase* child = owner.GetFirstChild(); child && row != rows.end(); child = owner.GetNextChild(child)) {
    if (child->GetSectionName() != row->section) continue;
    const GroundProperty::Range range = row++->range;
    if (range == GroundProperty::Range::None) continue;
    auto* judged = dynamic_cast<CTvn2DKvfValidationAbstract*>(child);
    if (!judged) continue;
    std::string why = child->IsDlgUsedInSetup() ? WhyOutside(range, judged->GetValidationValue()) : "";
    areValid = areValid && why.empty();
    judged->SetValidationMessage(std::move(why));
  }
  return areValid;
}

CData2DKvf* PropertyOf(const CYbSEKvfBase& owner, std::string_view section) {
  for (CYbSEKvfBase* child = owner.GetFirstChild(); child; child = owner.GetNextChild(child))
    if (child->GetSectionName() == section) return dynamic_cast<CData2DKvf*>(child);
  return nullptr;
}

}  // namespace tervane
