// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Pumping wells, in well parameter files (.WEL): where they stand, their filters, and what is pumped from each.
#pragma once

#include <compare>
#include <memory>
#include <string>
#include <vector>

#include "core/file_name.h"
#include "geometry/grid.h"
#include "libraries/library.h"

namespace tervane {

/// Well parameter files (.WEL).
extern const LibraryKind kWellLibrary;

/// A stretch of a well through which water comes in, with what is pumped from it.
struct CTvnWellFilter {
  double top = 0, bottom = 0;  ///< Elevations in metres.
  FileName timeSeries;         ///< Of the abstraction.
  int item = 1;

  bool operator==(const CTvnWellFilter&) const = default;
};

/// A well. Lists of wells are sorted and made unique by these comparisons: by name first.
struct CTvnWellData {
  std::string name;
  MapPoint place;
  double level = 0;   ///< Of the ground at the well, an elevation in metres.
  double depth = 0;   ///< From there to its bottom, in metres.
  std::string field;  ///< The well field that it belongs to; may be empty.
  std::vector<CTvnWellFilter> filters = {};

  double Bottom() const { return level - depth; }
  bool operator==(const CTvnWellData&) const = default;
  std::partial_ordering operator<=>(const CTvnWellData& other) const;
};

/// The wells of a library, and one of its entries; names of files are relative to `folder`.
std::vector<CTvnWellData> WellsOf(const Library& library);
CTvnWellData WellOf(const LibraryEntry& entry, const std::string& folder);

class CTvnWellDataList {
 public:
  /// Reads the wells of a file; false, with the reason in `Problem`, where there is none, and then the list is empty. A
  /// file that has not changed is not read again.
  bool LoadWellDataFile(const std::string& path);

  const std::vector<CTvnWellData>& Wells() const { return *wells_; }
  const std::string& Problem() const { return problem_; }

 private:
  /// There may be very many: all lists of a file share them.
  std::shared_ptr<const std::vector<CTvnWellData>> wells_ = std::make_shared<const std::vector<CTvnWellData>>();
  std::string problem_;
};

/// A series of an abstraction.
struct CTvnAbstraction {
  std::string well;
  int filter = 1;  ///< Its number in the well, from 1.
  std::string timeSeriesFile;
  int item = 1;

  bool operator==(const CTvnAbstraction&) const = default;
};
/// The abstractions of a well file, in its order; none of a file that cannot be read.
std::vector<CTvnAbstraction> TvnGetAbstractionFileList(const std::string& path);

/// Writes a file without wells over that area, in one step.
FileResult WriteEmptyWellFile(const std::string& path, const Envelope& area);

/// What a table of wells in a text file holds.
struct WellImport {
  Library wells{kWellLibrary};
  std::vector<std::string> notes;  ///< What was not taken: "line 7: ...".
};
/// Reads wells from comma separated values: columns of the names `name`, `x`, `y`, `level`, `depth`, and where they
/// are there `field`, `top`, `bottom`, `file`, `item`; a well that comes again has a further filter. Gives why there
/// are none.
std::string ReadWellTable(const std::string& path, WellImport& wells);

}  // namespace tervane
