// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Quantities that have one value for each cell of the model: a uniform value, a grid file, a shape file, or a text file
// of points.
#pragma once

#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "data/grid_files.h"
#include "geometry/grid.h"
#include "geometry/grid_interpolation.h"
#include "platform/item_types.h"
#include "spatial/data_use.h"
#include "spatial/file_nodes.h"

namespace tervane {

/// What makes one quantity of this kind differ from the next: a row, written where its owner makes it.
struct Data2DKind {
  std::string_view className;
  std::string section;
  std::string title;
  int itemType;          ///< `quantity::kCode` for codes, `quantity::kUndefined` for none.
  float fixedValue = 0;  ///< The default.
  enum class RelativeToGround { Never, Off, On } relativeToGround = RelativeToGround::Never;  ///< On, Off: the default.
  bool mayBeScattered = true;  ///< Whether shape and XYZ files are offered.
  bool mayLeaveCells = false;  ///< The quantity speaks of a part of the model; cells without a value are meant.
  std::string shortTitle = {};
};

/// Makes the grid of a source; it asks no node, so that another thread may do it. `grid` stays as it was on failure.
FileResult BuildGrid(const GridSource& source, ProgressPart progress, CTvn2DOrthoRotatedGridData& grid);

/// The source of the codes in a grid file.
GridSource CodesOfGrid(const CTvnData2DNdsFile& file);
/// The source of codes on the model's grid by the polygons of a file. `gapFill` is the value outside all of them.
GridSource CodesOfPolygons(const CData2DShpFile& file, int axisUnit, std::string gapFill);

class CData2DKvf : public CTvnKvfBase, public CellValues {
 public:
  CData2DKvf(Data2DKind kind, CYbSEKvfBase* parent);
  /// Makes one that takes part by a rule.
  CData2DKvf(Data2DKind kind, Condition takesPart, CYbSEKvfBase* parent);

  enum Source : int { kUniform = 0, kGridFile = 1, kShapeFile = 2, kXyzFile = 3 };

  int Type = kUniform;
  float FixedValue;      ///< For a code item a whole number.
  int InterpMethod = 2;  ///< 0 bilinear, 1 triangular, 2 inverse distance, 3 inverse distance squared.
  float SearchRadius = 1000;
  int ShowGridData = 1;
  int ShowShapeData = 1;
  int ShapeAxisUnit;         ///< Of the coordinates of shape and XYZ files, a unit key.
  int ShapeItemUnit;         ///< Of their values.
  int RelativeToGround = 0;  ///< The values are depths below ground; only where the kind has the option.

  const Data2DKind& Kind() const { return kind_; }
  bool HasRelativeToGround() const { return kind_.relativeToGround != Data2DKind::RelativeToGround::Never; }
  bool IsCode() const { return kind_.itemType == quantity::kCode; }
  bool IsInterpolated() const { return !IsCode(); }
  /// The item type of the values as they are: heights above ground where they are relative to it.
  virtual int GetItemType() const;

  CTvnData2DNdsFile& GridFile() const { return *gridFile_; }
  CData2DShpFile& ShapeFile() const { return *shapeFile_; }
  CData2DXyzFile& XyzFile() const { return *xyzFile_; }

  /// The name of the selected item of the grid file; empty when it cannot be read.
  std::string GetNdsItemName() const;

  /// Why the file in use cannot be used; empty for a valid one, for a text of points and for a uniform value.
  std::string WhyFileNotValid() const;

  GridSource CurrentSource() const override;
  /// The building of the grid: another one when what decides the grid has changed; null for a uniform value and for a
  /// file that is not valid. It asks no node.
  std::shared_ptr<ComputedGrid> GridComputation() override;
  bool MayLeaveCells() const override { return kind_.mayLeaveCells; }
  /// The grid, built here and now if it is not there yet; null for a uniform value and where it cannot be built, and
  /// then `problem` says why.
  std::shared_ptr<const CTvn2DOrthoRotatedGridData> GetGridData(std::string* problem = nullptr);
  /// A new grid; the one that is kept is left alone.
  std::shared_ptr<CTvn2DOrthoRotatedGridData> CreateGridData(std::string* problem = nullptr) const;
  /// The same of shapes or points as they are in their file; null for other sources and for a file that is not valid.
  std::shared_ptr<Computed<CTvnShapeData>> ShapeComputation();
  std::shared_ptr<const CYbShapeData> GetShapeData(std::string* problem = nullptr);
  /// With 0 the next call builds anew.
  void SetGridDataValid(int valid);
  void SetShapeDataValid(int valid);

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  Data2DKind kind_;
  CTvnData2DNdsFile* gridFile_;
  CData2DShpFile* shapeFile_;
  CData2DXyzFile* xyzFile_;

  template <class Data>
  struct Kept {
    GridSource source;
    std::shared_ptr<Computed<Data>> computation;
  };
  std::optional<Kept<CTvn2DOrthoRotatedGridData>> kept_;
  std::optional<Kept<CTvnShapeData>> keptShapes_;
};

/// The ground surface, a child of the root.
CData2DKvf* NewTopography(CYbSEKvfBase& parent);
inline constexpr ImportantName<CData2DKvf> kTopography{"TOPOGRAPHY"};

// What stands in for a process that is not modelled.

CData2DKvf* NewNetRainfallFraction(CYbSEKvfBase& parent);
CData2DKvf* NewGroundwaterTable(CYbSEKvfBase& parent);
CData2DKvf* NewInfiltrationFraction(CYbSEKvfBase& parent);

}  // namespace tervane
