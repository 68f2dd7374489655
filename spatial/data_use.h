// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What nodes report about the data that they use, for code that goes through the data of a whole setup without knowing
// the classes of nodes. All are copies of values: another thread may work on them.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "data/grid_files.h"
#include "geometry/grid.h"
#include "platform/files.h"
#include "platform/key_number.h"

namespace tervane {

/// A file that a node uses, and what is expected of it.
struct FileUse {
  enum class Kind { Data, Shape, Points };

  Kind kind = Kind::Data;
  std::string path;  ///< Absolute; empty while none is chosen.
  std::vector<FileStamp> stamps;
  int item = 1;             ///< Of a data file.
  std::string attribute;    ///< Of a shape file.
  int axisUnit = 1000;      ///< Of the coordinates of shapes and points, one of item 100187.
  bool isOverTime = false;  ///< It is to cover the simulation.
  bool isOverArea = false;  ///< It is to lie where the model domain lies.

  bool operator==(const FileUse&) const = default;
};

/// A node that names a file.
class FileUser {
 public:
  virtual ~FileUser() = default;
  /// Nothing while the node's owner does not use the file. As of the latest validation.
  virtual std::optional<FileUse> UsedFile() const = 0;
};

/// All that decides what grid a quantity has; grids of equal sources are equal.
struct GridSource {
  int type = 0;
  std::string file;
  std::vector<FileStamp> stamps;
  int item = 1;
  std::string attribute;
  int interpMethod = 0;
  KeyNumber<float> searchRadius = 0;
  int axisUnit = 0, itemUnit = 0, itemType = 0;
  GridGeometry geometry;
  std::string gapFill;  ///< The value of an attribute that cells outside all polygons get; empty for none.

  bool operator==(const GridSource&) const = default;
};

/// A node that has a value for each cell of the model. The file that it takes them from is named by a child.
class CellValues {
 public:
  virtual ~CellValues() = default;
  /// What decides the grid now.
  virtual GridSource CurrentSource() const = 0;
  /// The building of the grid, where the node keeps it for all who ask; else null.
  virtual std::shared_ptr<ComputedGrid> GridComputation() { return nullptr; }
  /// Cells without a value are meant: the node speaks of a part of the model.
  virtual bool MayLeaveCells() const { return false; }
};

/// A value that goes in a line from one time to another, in seconds since 1970-01-01.
struct ForcingLine {
  std::int64_t start = 0, end = 0;
  double first = 0, last = 0;

  bool operator==(const ForcingLine&) const = default;
};

/// A constant, lines over time, or an item of a file over time.
struct ForcingSeries {
  std::string name;  ///< Of the station; empty where there is only one.
  std::string id;    ///< The station's code in the grid of areas, or the value of its polygons.
  std::optional<KeyNumber<double>> constant;
  std::optional<std::vector<ForcingLine>> lines = {};
  std::string problem = {};  ///< Why nothing is known of it; empty where it is.
  std::string path;
  std::vector<FileStamp> stamps;
  int item = 1;

  bool operator==(const ForcingSeries&) const = default;
};

/// A quantity that drives the model over time.
struct Forcing {
  std::string title;
  int itemType = 0;  ///< Of its constants.
  std::vector<ForcingSeries> series;
  std::optional<GridSource> areas;        ///< Of the stations; nothing where one series or file serves all.
  std::optional<ForcingSeries> overGrid;  ///< One grid for each step, in the place of series.

  bool operator==(const Forcing&) const = default;
};

/// A list whose items hold for spans of stress periods, each from behind the one before it.
class StressPeriodSpans {
 public:
  virtual ~StressPeriodSpans() = default;
  /// The last period of each span, in the order of the items.
  virtual std::vector<int> SpanEnds() const = 0;
};

/// A node that holds one such quantity or more.
class ForcingNode {
 public:
  virtual ~ForcingNode() = default;
  virtual std::vector<Forcing> CurrentForcings() const = 0;
};

}  // namespace tervane
