// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The ground as modellers check it: a section along a line that is drawn on the map, and the column below a place.
#pragma once

#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "forms/map_question.h"
#include "forms/page.h"
#include "forms/table_of.h"
#include "libraries/wells.h"
#include "pages/parts/section_tool.h"
#include "spatial/data2d.h"

namespace tervane {

class CSatZoneKvf;
struct GroundBody;

/// The level that a quantity tells, in the setup's way: by elevations or above ground. What still has to be computed
/// goes into `awaited`; nothing where there is no level, and then `problem` says why.
std::optional<Level> LevelOf(CData2DKvf& quantity, Awaited& awaited, std::string& problem);

/// A stretch of a column of the ground, in metres; NaN where nothing is known.
struct ColumnPart {
  std::string kind;  ///< "Layer", "Lens", "Computed".
  std::string name;
  double top = 0, bottom = 0, thickness = 0;
  double horizontalConductivity = 0, verticalConductivity = 0, specificYield = 0, specificStorage = 0;
  std::string unit = {};    ///< The geological unit, where those hold the parameters.
  std::string remark = {};  ///< What is odd: levels that cross, a head above ground.
};

/// The two views of one page: a part of it that lives with it.
class GroundViews {
 public:
  GroundViews(CYbSEDlgBase& page, const CSatZoneKvf& zone);

  /// Adds the buttons, the column, the map and the section.
  void Describe(PageForm& form);

 private:
  std::vector<std::string> MapNames() const;
  MapContent Map();
  MapContent ThicknessMap(std::size_t layer);
  SectionContent Section();
  /// The wells of the setup, where they take part.
  std::vector<CTvnWellData> Wells() const;
  void Probe(MapPoint place);

  CYbSEDlgBase& page_;
  const CSatZoneKvf& zone_;
  SectionTool section_;
  MapQuestion question_;
  int map_ = 0;  ///< 0 for the ground, else the number of the layer whose thickness is shown.
  std::optional<MapPoint> place_;
  std::string probeText_;
  std::vector<ColumnPart> column_;
  std::shared_ptr<TableOf<ColumnPart>> table_;
  struct Thickness;
  std::shared_ptr<Thickness> thickness_;  ///< As it was last shown.
};

}  // namespace tervane
