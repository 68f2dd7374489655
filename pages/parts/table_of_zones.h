// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <string>
#include <unordered_map>
#include <utility>
#include <vector>

#include "forms/page.h"
#include "forms/plots.h"
#include "forms/table_of.h"
#include "spatial/domain_cells.h"
#include "spatial/series_totals.h"
#include "spatial/zone_source.h"

namespace tervane {

/// What stations of a kind have beside who they are; zones have none of it.
struct StationColumns {
  /// The series of a station; null for one that has a value instead.
  std::function<CFMData0DFile*(CodedZoneProp& station)> series = {};
  /// The elevation of a station, where `hasElevation` holds.
  std::function<float*(CodedZoneProp& station)> elevation = {};
  std::function<bool()> hasElevation = {};
  int itemType = 0;  ///< Of the series.
};

/// All zones or stations of a source in one table: who they are and what they use, to be changed and pasted in place,
/// with the area that each covers. What takes long is awaited by the map of its page.
class TableOfZones {
 public:
  explicit TableOfZones(const ZoneSource& zones, StationColumns columns = {});

  /// Also tells of cells without a zone, or why the areas are not known.
  void Describe(PageForm& form, const CYbSEDlgBase& page);
  /// Brings what is computed in step with the zones and their files; true when it is another than before.
  bool Follow(Awaited& awaited);

 private:
  using Table = TableOf<CodedZoneProp>;

  void DescribeWho(Table& table);
  void DescribeSeries(Table& table);
  void DescribeArea(Table& table);
  std::string Rename(CodedZoneProp& zone, const std::string& id);
  double CellsOf(const CodedZoneProp& zone) const;
  std::vector<SeriesOfFile> UsedSeries() const;
  bool FollowAreas(Awaited& awaited);
  bool FollowMeans(Awaited& awaited);

  const ZoneSource& zones_;
  StationColumns columns_;
  std::unordered_map<std::string, int> countOfId_;  ///< Of zones; empty until one is renamed.
  DomainSource domain_;
  GridSource source_;
  std::shared_ptr<ComputedGrid> ground_;
  std::shared_ptr<Computed<ZoneAreas>> areasToBe_;
  std::shared_ptr<const ZoneAreas> areas_;  ///< Null while nothing is known.
  std::string remark_;
  std::vector<SeriesOfFile> used_;
  TimeSpan simulation_;
  std::shared_ptr<Computed<SeriesMeans>> meansToBe_;
  std::shared_ptr<const SeriesMeans> means_;
};

}  // namespace tervane
