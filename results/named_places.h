// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Places of the map with names, out of files that know nothing of series: tables, point shapes, wells.
#pragma once

#include <string>
#include <vector>

#include "core/node.h"
#include "geometry/grid.h"

namespace tervane {

struct NamedPlaces {
  struct Place {
    std::string name;
    MapPoint place;
  };

  std::vector<Place> places;
  std::vector<std::string> notes;  ///< What was not taken, a line each.
  std::string problem;             ///< Why there are none.
};

/// Of a point shape file (`.shp`) the points with the text of their attribute NAME, or of the first one that is a text;
/// of any other file comma separated values with the columns name, x and y. Coordinates are in metres.
NamedPlaces ReadNamedPlaces(const std::string& path);

/// The wells that a setup pumps from, by the file of the saturated zone in use.
NamedPlaces WellPlacesOf(const CYbSEKvfBase& node);

}  // namespace tervane
