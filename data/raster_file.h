// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Rasters of other programs: what GDAL reads (GeoTIFF, ASCII grids, ...) in our form, and grids written as GeoTIFF.
// GDAL stands in a module beside the programs, which is loaded when it is first needed.
#pragma once

#include <memory>
#include <span>
#include <string>
#include <vector>

#include "data/file_geometry.h"
#include "platform/files.h"
#include "platform/item_types.h"
#include "platform/units.h"

namespace tervane {

struct RasterBand {
  int number = 1;        ///< In the file, from 1.
  std::string name;      ///< Never empty: the band's description, else the file's name, with the number if needed.
  std::string unitText;  ///< As the file names it; often empty.
  bool isWhole = false;  ///< Stored as whole numbers.
  int itemType = quantity::kUndefined;  ///< Named in our own files.
  int unitKey = 0;                      ///< Likewise; 0 when it is not named.
};

struct RasterFacts {
  std::string format;              ///< "GeoTIFF".
  FileGeometry geometry;           ///< Row 0 is the south, as everywhere; the projection is WKT, and may be empty.
  std::vector<RasterBand> bands;   ///< Those that can be read.
  std::vector<std::string> notes;  ///< What the user should know: bands that were left out, an unknown place.
};

/// An open raster. Opening reads what the file tells of itself; values are read when they are asked for. Errors name
/// the file, say what is wrong, and what to do.
class RasterFile {
 public:
  RasterFile();
  RasterFile(RasterFile&& other) noexcept;
  RasterFile& operator=(RasterFile&& other) noexcept;
  ~RasterFile();

  /// "" when the raster is open, else why not.
  std::string Open(const std::string& path);
  const RasterFacts& Facts() const;
  /// Reads a window of at most `kMostCells` cells of a band by its number: rows from the south, kDeleteValue where a
  /// value is missing.
  std::string Read(int band, const CellWindow& window, std::span<float> values) const;

 private:
  struct State;
  std::unique_ptr<State> state_;
};

/// What a new GeoTIFF is told beside its values.
struct NewRaster {
  FileGeometry geometry;
  std::string name;
  int itemType = quantity::kUndefined;
  int unitKey = kDimensionlessUnit;
  std::string unitText;  ///< Where the unit is none of the table's, and `unitKey` 0.
};

/// Writes a grid (rows from the south) as GeoTIFF, in place of a file of that name, in one step.
FileResult WriteGeoTiff(const std::string& path, const NewRaster& raster, std::span<const float> values);

}  // namespace tervane
