// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/parts/ground_soils.h"

#include <cmath>
#include <utility>

#include <fmt/format.h>

#include "pages/parts/ground_level.h"
#include "platform/item_types.h"
#include "platform/paths.h"
#include "subsurface/two_layer_soils.h"
#include "subsurface/unsaturated_zone.h"

namespace tervane {

namespace {

/// The identity by which a zone is found in the codes of its source.
std::string IdIn(const AreaCodes& codes, const CFMSEKvfGroupBase& zone) {
  return codes.arePolygons ? zone.GetStationId() : std::to_string(zone.StationCode());
}

const CodedZoneProp* FirstZone(const CodedZonesKvf& zones) {
  const auto items = ZoneItems(zones);
  return items.empty() ? nullptr : dynamic_cast<const CodedZoneProp*>(items.front());
}

double DepthOf(const CFMSEKvfGroupBase& zone) {
  const auto* profile = dynamic_cast<const CUZSoilProfilePropKvf*>(&zone);
  return profile ? profile->Soils().Bottom() : 0;
}

/// The depth in each cell; empty where no zone lies.
std::shared_ptr<const CTvn2DOrthoRotatedGridData> DepthGrid(const AreaCodes& codes,
                                                            const std::map<std::string, double>& ofId) {
  constexpr int kMetre = 1000;
  std::map<float, float> ofCode;
  std::vector<float> values;
  values.reserve(codes.grid.Values().size());
  for (const float code : codes.grid.Values()) {
    float depth = kUsualDeleteValue;
    if (!codes.grid.IsEmptyValue(code)) {
      const auto [known, isNew] = ofCode.try_emplace(code, kUsualDeleteValue);
      if (isNew)
        if (const auto found = ofId.find(codes.IdOf(code)); found != ofId.end())
          known->second = static_cast<float>(found->second);
      depth = known->second;
    }
    values.push_back(depth);
  }
  auto grid = std::make_shared<CTvn2DOrthoRotatedGridData>();
  const std::string problem = grid->TakeValues(codes.grid.Geometry(), std::move(values), kUsualDeleteValue, kMetre,
                                               quantity::kDepthBelowGround);
  return problem.empty() ? grid : nullptr;
}

}  // namespace

const CodedZonesKvf* GroundSoils::Zones() const {
  const auto* unsaturated = node_.Important(kUnsaturatedZone);
  if (!unsaturated) return nullptr;
  CodedZonesKvf* const both[] = {unsaturated->Child<CUZSoilProfileKvf>(),
                                 unsaturated->Child<CUZWetlandSoilProfileKvf>()};
  for (CodedZonesKvf* zones : both)
    if (zones && zones->IsDataUsedInSetup()) return zones;
  return nullptr;
}

std::shared_ptr<const AreaCodes> GroundSoils::Codes(const CodedZonesKvf& zones, Awaited& awaited) {
  GridSource source = zones.CurrentSource();
  if (source.file.empty()) return nullptr;
  if (!codes_ || !(source == source_)) {
    codes_ = std::make_shared<Computed<AreaCodes>>(
        fmt::format("Reading {}", FileNameOf(source.file)),
        [source](AreaCodes& codes, ProgressPart progress) { return ReadAreaCodes(source, progress, codes); });
    source_ = std::move(source);
  }
  return NowOrAwaited(codes_, awaited);
}

const CodedZoneProp* GroundSoils::At(MapPoint place, Awaited& awaited) {
  const CodedZonesKvf* zones = Zones();
  if (!zones) return nullptr;
  if (!zones->IsInForce()) return FirstZone(*zones);
  const auto codes = Codes(*zones, awaited);
  if (!codes) return nullptr;
  const double code = ValuesAlong(codes->grid, {{0, place}}, GridSampling::Nearest).front();
  if (std::isnan(code)) return nullptr;
  const std::string id = codes->IdOf(static_cast<float>(code));
  for (const CFMSEKvfGroupBase* zone : ZoneItems(*zones))
    if (IdIn(*codes, *zone) == id) return dynamic_cast<const CodedZoneProp*>(zone);
  return nullptr;
}

std::optional<SectionCurve> GroundSoils::Bottom(Awaited& awaited) {
  const CodedZonesKvf* zones = Zones();
  if (!zones) return std::nullopt;
  SectionCurve curve{.name = "Bottom of soils", .level = {}, .isDashed = true, .isStepped = true};
  if (dynamic_cast<const CUZWetlandSoilProfileKvf*>(zones)) {
    std::string problem;
    CData2DKvf& depth = node_.Important(kUnsaturatedZone)->EtSurfaceDepth();
    const auto level = LevelOf(depth, awaited, problem);
    if (!level) return std::nullopt;
    curve.name = depth.GetTitle();
    curve.level = *level;
    curve.isStepped = false;
    return curve;
  }
  curve.level.reference = Level::Reference::BelowGround;
  if (!zones->IsInForce()) {
    const CodedZoneProp* zone = FirstZone(*zones);
    if (!zone) return std::nullopt;
    curve.level.value = DepthOf(*zone);
    return curve;
  }
  Depths now{.codes = Codes(*zones, awaited), .ofId = {}, .grid = nullptr};
  if (!now.codes) return std::nullopt;
  for (const CFMSEKvfGroupBase* zone : ZoneItems(*zones)) now.ofId[IdIn(*now.codes, *zone)] = DepthOf(*zone);
  if (now.codes != depths_.codes || now.ofId != depths_.ofId) {
    now.grid = DepthGrid(*now.codes, now.ofId);
    depths_ = std::move(now);
  }
  if (!depths_.grid) return std::nullopt;
  curve.level.grid = depths_.grid;
  return curve;
}

}  // namespace tervane
