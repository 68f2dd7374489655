// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <map>
#include <memory>
#include <optional>
#include <string>

#include "forms/plots.h"
#include "spatial/domain_cells.h"
#include "spatial/zones.h"

namespace tervane {

/// Which soil lies where and how deep it reaches, as sections and columns show it. It keeps what was computed.
class GroundSoils {
 public:
  /// `node` is any of the setup.
  explicit GroundSoils(const CYbSEKvfBase& node) : node_(node) {}

  /// The profile, or the soil of two layers, of a place: the one that takes part. Null where there is none, and while
  /// something has to be computed first.
  const CodedZoneProp* At(MapPoint place, Awaited& awaited);
  /// Where the soils of the profiles end; for soils of two layers, which have no depth of their own, how deep plants
  /// still get water. Nothing where the setup has no soils.
  std::optional<SectionCurve> Bottom(Awaited& awaited);

 private:
  const CodedZonesKvf* Zones() const;
  /// Null for one zone for all, and while they are not known.
  std::shared_ptr<const AreaCodes> Codes(const CodedZonesKvf& zones, Awaited& awaited);

  const CYbSEKvfBase& node_;
  GridSource source_;
  std::shared_ptr<Computed<AreaCodes>> codes_;
  struct Depths {
    std::shared_ptr<const AreaCodes> codes;
    std::map<std::string, double> ofId;
    std::shared_ptr<const CTvn2DOrthoRotatedGridData> grid;
  };
  Depths depths_;
};

}  // namespace tervane
