// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Where something is in space: a part of the model area between two levels.
#pragma once

#include <string_view>

#include "spatial/data2d.h"

namespace tervane {

/// The part of the model area: where a grid has codes, or polygons lie.
class ExtentKvf : public CYbSEKvfGroupBase, public CellValues {
 public:
  ExtentKvf(std::string_view className, Condition takesPart, CYbSEKvfBase* parent);

  enum Source : int { kGridFile = 1, kShapeFile = 2 };

  int type = kGridFile;
  int ShapeAxisUnit;  ///< Of the coordinates of shapes, a unit key.

  CTvnData2DNdsFile& GridFile() const { return *gridFile_; }
  CData2DShpFile& ShapeFile() const { return *shapeFile_; }

  GridSource CurrentSource() const override;
  /// Of polygons: code 1 in the cells of any of them, whatever their attributes. Null for a grid, which is read as it
  /// is.
  std::shared_ptr<ComputedGrid> GridComputation() override;
  bool MayLeaveCells() const override { return true; }

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  CTvnData2DNdsFile* gridFile_;
  CData2DShpFile* shapeFile_;
  /// The latest, while what decides it stays.
  GridSource keptSource_;
  std::shared_ptr<ComputedGrid> kept_;
};

/// How far something goes over the model area.
enum ExtentType : int { kFullDomain = 0, kPartDomain = 1 };
inline constexpr KeyChoice kExtentTypes[] = {{kFullDomain, "Full domain"}, {kPartDomain, "Part domain"}};

/// Makes the upper and the lower level of an owner.
void MakeExtentLevels(CYbSEKvfBase& owner, const Condition& takePart);

}  // namespace tervane
