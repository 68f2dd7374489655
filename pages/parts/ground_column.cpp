// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/parts/ground_column.h"

#include <algorithm>
#include <cmath>
#include <limits>

#include <fmt/format.h>

#include "libraries/soils.h"
#include "pages/parts/ground_level.h"
#include "subsurface/geology.h"
#include "subsurface/ground_layers.h"
#include "subsurface/saturated_zone.h"
#include "subsurface/two_layer_soils.h"

namespace tervane {

namespace {

constexpr double kNone = std::numeric_limits<double>::quiet_NaN();

ColumnPart Unknown(const char* kind, std::string name, double top, double bottom) {
  return {.kind = kind,
          .name = std::move(name),
          .top = top,
          .bottom = bottom,
          .thickness = top - bottom,
          .horizontalConductivity = kNone,
          .verticalConductivity = kNone,
          .specificYield = kNone,
          .specificStorage = kNone};
}

void AddRemark(ColumnPart& part, std::string_view text) {
  part.remark += fmt::format("{}{}", part.remark.empty() ? "" : " ", text);
}

/// The soils of a profile, with what their library tells of them.
void AddSoils(const CUZSoilProfilePropKvf& profile, double ground, std::vector<ColumnPart>& parts) {
  double above = ground;
  for (int number = 1; number <= profile.Soils().GetItemCount(); ++number) {
    const CUZSoilProfilePropLayerItemKvf& layer = *profile.Soils().GetItem(number);
    ColumnPart& part =
        parts.emplace_back(Unknown("Soil", layer.SoilID, above, ground - static_cast<double>(layer.Depth)));
    part.zone = profile.GetStationName();
    if (part.bottom > part.top) AddRemark(part, "It ends above the soil over it.");
    above = std::isnan(part.bottom) ? above : part.bottom;
    const auto soil = layer.DataBase.IsEmpty() ? std::nullopt : FindSoil(layer.DataBase.Absolute(), layer.SoilID);
    if (soil)
      part.verticalConductivity = soil->ks;
    else
      AddRemark(part, "No library has the soil.");
  }
}

/// What stands at one place, where all that it asks is computed.
class ColumnReader {
 public:
  ColumnReader(const CSatZoneKvf& zone, MapPoint place, Awaited& awaited)
      : zone_(zone), points_{{0, place}}, awaited_(awaited) {
    auto* topography = zone.Important(kTopography);
    if (topography) ground_ = At(*topography, kNone);
  }

  /// A level in metres.
  double At(CData2DKvf& quantity, double ground) {
    std::string problem;
    const auto level = LevelOf(quantity, awaited_, problem);
    return level ? ElevationsAlong(*level, points_, {ground}, GridSampling::Nearest).front() : kNone;
  }
  /// The value of a quantity of an item, in its base unit; none where the item has none that takes part.
  double Value(const CYbSEKvfBase& item, std::string_view section) {
    CData2DKvf* quantity = PropertyOf(item, section);
    if (!quantity || !quantity->IsDlgUsedInSetup()) return kNone;
    std::string problem;
    const auto level = LevelOf(*quantity, awaited_, problem);
    if (!level) return kNone;
    return level->grid ? ValuesAlong(*level->grid, points_, GridSampling::Nearest).front() : double{level->value};
  }

  GroundColumn Column(GroundSoils& soils) {
    GroundColumn column{.ground = ground_};
    if (const CodedZoneProp* soil = soils.At(points_.front().place, awaited_)) {
      column.soil = soil->GetStationName();
      AddSoil(*soil, column.parts);
    }
    AddGeology(column.parts);
    AddComputed(column.parts);
    return column;
  }

 private:
  void AddSoil(const CodedZoneProp& soil, std::vector<ColumnPart>& parts) const {
    if (const auto* profile = dynamic_cast<const CUZSoilProfilePropKvf*>(&soil)) {
      AddSoils(*profile, ground_, parts);
    } else if (const auto* layers = dynamic_cast<const CUZWetlandSoilPropKvf*>(&soil)) {
      // Its two layers are divided by the water, wherever that stands.
      ColumnPart& part = parts.emplace_back(Unknown("Soil", soil.GetStationName(), ground_, kNone));
      part.verticalConductivity = static_cast<double>(layers->Kint);
      part.zone = soil.GetStationName();
    }
  }

  void AddGeology(std::vector<ColumnPart>& parts) {
    double above = ground_;
    for (const GroundBody& layer : GeologicalLayersOf(zone_)) {
      ColumnPart& part = parts.emplace_back(PartOf("Layer", layer, above, BottomOf(layer)));
      if (part.bottom > above) AddRemark(part, "Its level lies above the one above it.");
      if (!std::isnan(part.bottom)) above = std::min(part.bottom, std::isnan(above) ? part.bottom : above);
    }
    for (const GroundBody& lense : GeologicalLensesOf(zone_)) {
      const double extent = lense.extent ? Value(*lense.node, "HorBoundary") : kNone;
      if (std::isnan(extent) || extent == 0) continue;
      parts.push_back(PartOf("Lens", lense, lense.top ? At(*lense.top, ground_) : kNone, BottomOf(lense)));
    }
  }

  void AddComputed(std::vector<ColumnPart>& parts) {
    double above = ground_;
    const std::vector<GroundBody> geology = GeologicalLayersOf(zone_);
    std::size_t number = 0;
    for (const GroundBody& layer : ComputationalLayersOf(zone_)) {
      // One that has no level of its own has that of the geological layer beside it.
      const GroundBody* levels = layer.bottom ? &layer : number < geology.size() ? &geology[number] : nullptr;
      ++number;
      ColumnPart part = Unknown("Computed", layer.name, above, levels ? BottomOf(*levels) : kNone);
      const double head = layer.head ? At(*layer.head, ground_) : kNone;
      const bool isAboveGround = head > ground_;
      if (!std::isnan(head))
        AddRemark(part, fmt::format("Initial head {:.6g} m{}.", head, isAboveGround ? ", above ground" : ""));
      if (part.thickness < static_cast<double>(zone_.MimimumLayerThickness))
        AddRemark(part, "Thinner than the minimum.");
      if (!std::isnan(part.bottom)) above = part.bottom;
      parts.push_back(std::move(part));
    }
  }

  double BottomOf(const GroundBody& body) { return body.bottom ? At(*body.bottom, ground_) : kNone; }

  ColumnPart PartOf(const char* kind, const GroundBody& body, double top, double bottom) {
    ColumnPart part = Unknown(kind, body.name, top, bottom);
    part.horizontalConductivity = Value(*body.node, "HorHydrCon");
    part.verticalConductivity = Value(*body.node, "VerHydrCon");
    part.specificYield = Value(*body.node, "SpecificYield");
    part.specificStorage = Value(*body.node, "StorageCoef");
    if (const double code = Value(*body.node, "GeoUnit"); !std::isnan(code)) TakeUnit(static_cast<int>(code), part);
    return part;
  }

  void TakeUnit(int code, ColumnPart& part) const {
    part.zone = std::to_string(code);
    const auto* units = zone_.Child<CGeoUnitsSZListKvf>();
    for (int number = 1; units && number <= units->GetItemCount(); ++number) {
      const CGeoUnitsSZItemKvf& unit = *units->GetItem(number);
      if (unit.SoilCode != code) continue;
      part.zone = fmt::format("{} ({})", unit.SoilName, code);
      part.horizontalConductivity = static_cast<double>(unit.HorConduc);
      part.verticalConductivity = static_cast<double>(unit.VerConduc);
      part.specificYield = static_cast<double>(unit.SpecYield);
      part.specificStorage = static_cast<double>(unit.StorageCoef);
      return;
    }
    AddRemark(part, "No unit has this code.");
  }

  const CSatZoneKvf& zone_;
  std::vector<SectionPoint> points_;
  Awaited& awaited_;
  double ground_ = kNone;
};

}  // namespace

GroundColumn ColumnAt(const CSatZoneKvf& zone, GroundSoils& soils, MapPoint place, Awaited& awaited) {
  return ColumnReader(zone, place, awaited).Column(soils);
}

}  // namespace tervane
