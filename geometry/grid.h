// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Grids of square cells that may stand rotated on the map, with one number in each cell.
#pragma once

#include <cstddef>
#include <string>
#include <utility>
#include <vector>

#include "platform/files.h"
#include "platform/item_types.h"
#include "platform/key_number.h"
#include "platform/units.h"

namespace tervane {

struct InterpolationOptions;
struct PolygonFile;
struct ScatteredFile;
struct ZoneTable;

/// An axis-parallel rectangle on the map, in metres.
struct Envelope {
  double xMin = 0, yMin = 0, xMax = 0, yMax = 0;

  bool operator==(const Envelope& other) const {
    return SameNumber(xMin, other.xMin) && SameNumber(yMin, other.yMin) && SameNumber(xMax, other.xMax) &&
           SameNumber(yMax, other.yMax);
  }
};

struct MapPoint {
  double x = 0, y = 0;

  bool operator==(const MapPoint& other) const { return SameNumber(x, other.x) && SameNumber(y, other.y); }
};

/// Where a grid stands: (x0, y0) is the lower left corner of cell (0, 0), i counts along the grid's x axis, j along its
/// y axis, and the whole is turned about that corner. Lengths in metres.
struct GridGeometry {
  int nx = 0, ny = 0;
  double cellSize = 1;
  double x0 = 0, y0 = 0;
  double rotation = 0;  ///< Degrees, counter-clockwise.
  std::string projection;

  std::size_t CellCount() const { return static_cast<std::size_t>(nx) * static_cast<std::size_t>(ny); }
  /// Why no grid can stand there (no cells, more than `kMostCells`, a cell size that is not above 0, a number that is
  /// none), or empty.
  std::string Problem() const;

  bool operator==(const GridGeometry& other) const {
    return nx == other.nx && ny == other.ny && SameNumber(cellSize, other.cellSize) && SameNumber(x0, other.x0) &&
           SameNumber(y0, other.y0) && SameNumber(rotation, other.rotation) && projection == other.projection;
  }
};

inline constexpr std::size_t kMostCells = 400'000'000;
inline constexpr float kUsualDeleteValue = -1e-35f;

/// Turns points of the map into a grid's own coordinates and back. Own coordinates are counted in cells from the lower
/// left corner, so that cell (i, j) has its centre at (i + 0.5, j + 0.5). Quarter turns are exact.
class GridTransform {
 public:
  explicit GridTransform(const GridGeometry& geometry);

  MapPoint ToCells(MapPoint world) const {
    const double dx = world.x - x0_, dy = world.y - y0_;
    return {(dx * cos_ + dy * sin_) / cellSize_, (dy * cos_ - dx * sin_) / cellSize_};
  }
  MapPoint ToWorld(MapPoint cells) const {
    const double u = cells.x * cellSize_, v = cells.y * cellSize_;
    return {x0_ + u * cos_ - v * sin_, y0_ + u * sin_ + v * cos_};
  }

 private:
  double x0_, y0_, cellSize_, cos_, sin_;
};

/// A grid with its values: row 0 is the southern one, x runs fastest. A cell that holds the delete value, or no number
/// at all (NaN), is empty. A new grid has no cells.
///
/// What stands in files of grids is put in with `TakeValues` and got with the plain accessors; no file format is known
/// here but text.
class CTvn2DOrthoRotatedGridData {
 public:
  virtual ~CTvn2DOrthoRotatedGridData() = default;

  /// Fills all cells with one value. Gives why that cannot be done (`GridGeometry::Problem`, no memory), or nothing;
  /// then the grid is as it was.
  [[nodiscard]] std::string SetGridData(GridGeometry geometry, float value, float deleteValue, int itemUnit,
                                        int itemType);
  /// Takes values, one for each cell. Gives why not, as `SetGridData` does.
  [[nodiscard]] std::string TakeValues(GridGeometry geometry, std::vector<float> values, float deleteValue,
                                       int itemUnit, int itemType);

  /// Reads a grid from text. Either an ASCII grid (lines `ncols`, `nrows`, `xllcorner` or `xllcenter`, `yllcorner` or
  /// `yllcenter`, `cellsize`, `nodata_value`, in any case and order, the last five optional, then nx * ny numbers), or
  /// rows of numbers alone, each on a line and all of one length. The first row is the northern one. What the file says
  /// of cell size and corner counts before `place`, whose nx and ny are not asked; a note tells where they differ.
  /// Values stay in the unit of the file, which is `itemUnit`. Errors name file and line; then the grid is as it was.
  FileResult ReadTextFile(const std::string& path, const GridGeometry& place, float deleteValue, int itemUnit,
                          int itemType, ProgressPart progress = {});

  /// Interpolates the points of a shape or XYZ file; cells without a value are empty. The grid gets the base unit of
  /// the item type. See platform/grid_interpolation.h.
  FileResult CreateGridData_GIS(GridGeometry geometry, float deleteValue, const ScatteredFile& file,
                                const InterpolationOptions& options);
  /// Gives each cell the code of the polygon in which its centre lies. See platform/grid_polygons.h.
  FileResult CreateGridData_GIS_Polygon(GridGeometry geometry, float deleteValue, const PolygonFile& file,
                                        ZoneTable& zones, ProgressPart progress = {});
  /// Makes a model domain of the polygons of a file: 1 inside, 2 at the outer boundary, empty outside. See
  /// platform/grid_polygons.h.
  FileResult MakeCatchmentGriddataFromShapefile(const std::string& path, int axisUnit, GridGeometry geometry,
                                                ProgressPart progress = {});

  const GridGeometry& Geometry() const { return geometry_; }
  float DeleteValue() const { return deleteValue_; }
  /// Empty cells take the new delete value too. A cell that held just that value becomes empty.
  virtual void SetDeleteValue(float deleteValue);
  bool IsEmptyValue(float value) const { return value == deleteValue_ || value != value; }

  /// All values, to be read or painted; nx * ny of them.
  virtual float* GetData() { return values_.data(); }
  const std::vector<float>& Values() const { return values_; }
  float Value(int i, int j) const { return values_[Index(i, j)]; }

  const std::string& ItemName() const { return itemName_; }
  void SetItemName(std::string name) { itemName_ = std::move(name); }
  int ItemType() const { return itemType_; }
  int ItemUnit() const { return itemUnit_; }

  /// The distinct codes of the cells, ascending: values rounded to the nearest whole number. Empty cells and negative
  /// values, which are no codes, are left out. False when nothing is left.
  bool GetIntValues(std::vector<unsigned>& values) const;
  /// The largest and smallest value, rounded to whole numbers; false when all cells are empty.
  bool GetMaxMin(int& largest, int& smallest) const;
  /// The same unrounded.
  bool GetMaxMin(float& largest, float& smallest) const;
  /// The smallest axis-parallel rectangle around the grid.
  Envelope GetEnvelope() const;
  /// The point in cells from the lower left corner; the cell is the whole part, and may lie off the grid.
  void GetCellCoordFromXYWorldCoord(double x, double y, double& i, double& j) const;
  /// The centre of a cell on the map.
  MapPoint CellCentre(int i, int j) const;
  /// Any of the outs may be null.
  void GetXYAxisInfo(int* nx, int* ny, double* cellSize) const;

 private:
  std::size_t Index(int i, int j) const {
    return static_cast<std::size_t>(j) * static_cast<std::size_t>(geometry_.nx) + static_cast<std::size_t>(i);
  }

  GridGeometry geometry_;
  std::vector<float> values_;
  float deleteValue_ = kUsualDeleteValue;
  int itemUnit_ = 0;
  int itemType_ = quantity::kUndefined;
  std::string itemName_;
};

/// The smallest axis-parallel rectangle around a rotated grid.
Envelope EnvelopeOf(const GridGeometry& geometry);

}  // namespace tervane
