// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <string>

#include "data/grid_files.h"
#include "geometry/grid.h"
#include "geometry/shapes.h"
#include "spatial/file_nodes.h"

namespace tervane {

/// What must follow when the model's domain is another one: the maps that show it.
class DomainFollower {
 public:
  virtual ~DomainFollower() = default;
  virtual void AdoptDomain(const Envelope& domain) = 0;
};
inline constexpr ImportantName<DomainFollower> kDomainFollower{"OVERLAY_DATA"};

struct TracedDomain;

/// The model domain and its grid: a grid file, or the polygons of a shape file on a grid that is given here. A cell of
/// the domain is empty outside, 1 inside, 2 at the outer boundary.
class CCatchmentKvf : public CTvnKvfBase {
 public:
  explicit CCatchmentKvf(CYbSEKvfBase* parent);

  enum Source : int { kGridFile = 0, kShapeFile = 1 };

  int Type = kGridFile;
  // With the shape source; the lower left corner is the origin.
  int nxShp = 200, nyShp = 200;
  double sizeShp = 1000.0;  ///< In metres.
  double x0Shp = 0.0, y0Shp = 0.0;
  std::string MapProjShp;
  double rotationShp = 0.0;  ///< Degrees, counter-clockwise.
  int ShapeAxisUnit;         ///< Of the shape file's coordinates, a unit key of item 100187.

  CTvnData2DNdsFile& GridFile() const { return *gridFile_; }
  CData2DShpFile& ShapeFile() const { return *shapeFile_; }

  /// False while no file that can be read tells where the model lies.
  bool HasGeometry() const;
  /// The grid on which the model works; without a readable file 50 by 50 cells of 1000 m at the origin.
  GridGeometry GetModelGeometry() const;
  /// The smallest axis-parallel rectangle around it.
  Envelope GetEnvelope() const { return EnvelopeOf(GetModelGeometry()); }
  /// The domain as a grid, built anew; null with the reason in `problem` when that is not possible.
  std::shared_ptr<CTvn2DOrthoRotatedGridData> GetDomainGrid(std::string* problem = nullptr) const;
  std::shared_ptr<CTvn2DOrthoRotatedGridData> GetDomainFromShape(std::string* problem = nullptr) const;
  /// The making of that: another one when what decides it has changed. It asks no node.
  std::shared_ptr<ComputedGrid> DomainFromShape();
  /// The domain with its outer boundary traced, for all that lie on it: another one when what decides the domain has
  /// changed. It asks no node. It has no result where the domain cannot be read.
  std::shared_ptr<Computed<TracedDomain>> Traced();
  /// The shape file, for drawing; null when it cannot be read.
  std::shared_ptr<const CYbShapeData> GetDomainShape(std::string* problem = nullptr) const;

  /// Takes a shape file with the unit of its coordinates, and puts the grid's corner and cell size where it lies.
  /// False, with the reason, when it cannot be read: the grid's values then stay.
  bool ChooseShapeFile(FileName file, int axisUnit, std::string& problem);

  /// Takes the grid of a raster, or one around the shapes of a file in the unit of the domain's shapes, with its
  /// projection where the file tells one. False, with the reason, when it cannot be read: nothing changes then.
  bool TakeGrid(const std::string& path, std::string& problem);

  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  /// Puts the corner and the cell size of the grid where the shapes lie.
  bool FitGrid(const std::string& shapeFile, std::string& problem);

  /// All that decides the domain of a shape file.
  struct ShapeSource {
    std::string file;
    std::vector<FileStamp> stamps;
    int axisUnit = 0;
    GridGeometry geometry;

    bool operator==(const ShapeSource&) const = default;
  };
  static FileResult BuildFromShape(const ShapeSource& source, ProgressPart progress, CTvn2DOrthoRotatedGridData& grid);
  ShapeSource CurrentShape() const;

  CTvnData2DNdsFile* gridFile_;
  CData2DShpFile* shapeFile_;
  ShapeSource madeOf_;
  std::shared_ptr<ComputedGrid> made_;
  /// What was traced: a grid file, or the domain of a shape file.
  struct {
    GridSource file;
    std::shared_ptr<ComputedGrid> shape;
    std::shared_ptr<Computed<TracedDomain>> traced;
  } trace_;
};
inline constexpr ImportantName<CCatchmentKvf> kDomain{"CATCHMENT"};

}  // namespace tervane
