// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Where data files lie by what they tell of themselves, held against the model domain.
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "core/node.h"
#include "geometry/grid.h"
#include "spatial/data_use.h"

namespace tervane {

/// Where the values of a file lie.
struct FilePlace {
  bool isKnown = false;            ///< The file can be read, and its values have a place.
  std::optional<Envelope> extent;  ///< In metres, or degrees where `isGeographical`.
  bool isGeographical = false;
  bool isUnplaced = false;     ///< It can be read, but does not tell where its cells lie.
  std::string projection;      ///< Its text; empty where the file tells none.
  std::string projectionFile;  ///< The file that would tell it and is not there; empty for others.
};
FilePlace LocateFile(const FileUse& use);

/// The grid of the model; nothing while its domain names no file that can be read.
std::optional<GridGeometry> DomainGeometryOf(const CYbSEKvfBase& node);

/// What a user should know of where a file lies: no findings where all is as it should be. Warnings are another
/// projection than the domain's, degrees, and no overlap; a note is a file that tells no projection.
std::vector<Finding> FindMisplacement(const FilePlace& place, const GridGeometry& domain);

}  // namespace tervane
