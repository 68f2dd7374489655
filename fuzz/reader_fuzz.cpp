// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Any bytes as a file of each kind that is read, the first letter tells which. What cannot be read has a reason that
// can be shown, and every file is as it was.
#include <algorithm>
#include <cstdint>
#include <string>

#include "data/cf_time.h"
#include "data/datafile.h"
#include "data/file_geometry.h"
#include "data/grid_files.h"
#include "data/raster_file.h"
#include "data/series_csv.h"
#include "document/journal.h"
#include "document/recovery.h"
#include "execution/processed_river.h"
#include "execution/run_passport.h"
#include "execution/run_state.h"
#include "fuzz/input_folder.h"
#include "geometry/cart.h"
#include "geometry/grid.h"
#include "geometry/projection_list.h"
#include "geometry/shapes.h"
#include "geometry/xyz_text.h"
#include "libraries/library.h"
#include "libraries/library_kinds.h"
#include "libraries/river_network.h"
#include "libraries/soils.h"
#include "libraries/vegetations.h"
#include "libraries/wells.h"
#include "overlays/image_place.h"
#include "platform/dates.h"
#include "platform/text.h"
#include "platform/translations.h"
#include "platform/units.h"
#include "results/detailed_points.h"
#include "results/named_places.h"
#include "results/result_catalogue_file.h"
#include "results/viewed_setup.h"

namespace tervane {
namespace {

using fuzz::InputFolder;
using fuzz::Require;

/// Why a file was not read; empty when it was.
using Reason = std::string;

std::string TextAt(const std::string& path) {
  FileContent content;
  const FileResult read = ReadWholeFile(path, content);
  Require(read.Ok(), "a file that was just written can be read", read.error);
  return std::string(content.Text());
}

/// All values of a file, unless these are more than a test should read.
Reason ReadAllValues(const std::string& path) {
  DataFile file;
  if (Reason why = file.Open(path); !why.empty()) return why;
  constexpr std::size_t kMost = 100'000;
  std::vector<float> values;
  for (std::size_t item = 1; item <= std::min<std::size_t>(file.Items().size(), 8); ++item) {
    for (std::size_t step = 0; step < std::min<std::size_t>(file.Time().steps, 8); ++step) {
      const ValueSelection selection{.item = static_cast<int>(item), .step = step, .layer = {}};
      const std::size_t size = file.SizeOf(selection);
      if (size > kMost) break;
      values.assign(size, 0);
      if (Reason why = file.Read(selection, values); !why.empty()) return why;
    }
  }
  return {};
}

Reason ReadRaster(const std::string& path) {
  RasterFile file;
  if (Reason why = file.Open(path); !why.empty()) return why;
  const FileGeometry& geometry = file.Facts().geometry;
  const CellWindow window{.nx = std::min(geometry.nx, 64), .ny = std::min(geometry.ny, 64)};
  std::vector<float> values(window.CellCount());
  for (const RasterBand& band : file.Facts().bands)
    if (Reason why = file.Read(band.number, window, values); !why.empty()) return why;
  return {};
}

template <const LibraryKind& kKind>
Reason ReadAndWriteLibrary(const std::string& path) {
  Library library(kKind);
  if (Reason why = ReadLibrary(path, library); !why.empty()) return why;
  std::string error;
  const std::string text = LibraryFileText(library, error);
  Require(error.empty(), "a library that was read can be written", error);
  FileContent content = FileContent::Of(text);
  Library again(kKind);
  const std::string why = ParseLibrary(content, path, again);
  Require(why.empty(), "a library that was written can be read", why + "\n" + text);
  Require(again.entries == library.entries, "the entries come back", text);
  Require(LibraryFileText(again, error) == text, "the text is the same the second time", text);
  return {};
}

Reason ReadNetwork(const std::string& path) {
  CYbSimpleRiverData network;
  if (const FileResult read = network.ReadNetworkFile(path); !read.Ok()) return read.error;
  const bool isFaultless = network.Findings().empty();
  std::string error;
  const std::string text = network.NetworkText(error);
  if (!error.empty()) return error;
  CYbSimpleRiverData again;
  const std::string why = again.ParseNetwork(FileContent::Of(text), path);
  Require(why.empty(), "a network that was written can be read", why + "\n" + text);
  Require(!isFaultless || again.Findings().empty(), "writing makes no faults", text);
  Require(again.branches.size() == network.branches.size(), "the branches come back", text);
  return {};
}

Reason ReadShapes(const std::string& path) {
  CYbShapeData shapes;
  const FileResult plain = shapes.ReadShapeFile(path);
  const FileResult all = shapes.ReadShapeAndDbfFile(path, "");
  return plain.error + all.error;
}

Reason ReadTexts(const std::string& path) {
  const std::string text = TextAt(path);
  ParseUnit(text);
  ParseQuantity(text, "m");
  CYbDateTime::Parse(text, "%Y-%m-%d %H:%M:%S");
  ParseGeoTransform(text);
  const std::size_t half = text.size() / 2;
  return ParseCfTimeUnits(text.substr(0, half), text.substr(half)).error;
}

Reason ReadPasted(const std::string& path) {
  const CsvSeries series = ReadPastedSeries(TextAt(path));
  Require(series.stamps.size() == series.values.size(), "a date for each value");
  Require(std::ranges::is_sorted(series.stamps), "dates ascend");
  return series.error;
}

Reason ReadCsv(const std::string& path) {
  const std::string text = TextAt(path);
  Reason reasons;
  for (const std::string& column : CsvColumns(text)) reasons += ReadCsvSeries(text, column).error;
  return reasons;
}

Reason ReadJournalFile(const std::string& path) {
  const Journal journal = ReadJournal(path);
  for (const JournalStep& step : journal.steps) {
    std::string problem;
    const std::string line = WriteJournalLine(step);
    const std::optional<JournalStep> again = ReadJournalLine(Trimmed(line), problem);
    Require(again && *again == step, "a step comes back from its line", line);
  }
  JournalCsv(journal.steps);
  return {};
}

Reason ReadCatalogue(const std::string& path) {
  const Translations catalogue(TextAt(path));
  for (const std::string& text : catalogue.Texts()) catalogue.Finished(text);
  return catalogue.Problem();
}

struct Reader {
  char letter;
  std::string_view extension;
  Reason (*read)(const std::string& path);
};

constexpr Reader kReaders[] = {
    {'a', ".asc",
     [](const std::string& path) {
       CTvn2DOrthoRotatedGridData grid;
       GridGeometry place;
       place.cellSize = 10;
       return grid.ReadTextFile(path, place, -9999, 1000, 100180).error;
     }},
    {'c', ".csv", ReadCsv},
    {'d', ".nds2", ReadAllValues},
    {'e', ".etv", ReadAndWriteLibrary<kVegetationLibrary>},
    {'g', ".tif", ReadRaster},
    {'i', ".tfw",
     [](const std::string& path) {
       NobodyToAsk host;
       ReadGeoReference(path, path.substr(0, path.size() - 3) + "tif", host);
       ReadImagePlace(path, host);
       return Reason();
     }},
    {'j', ".journal", ReadJournalFile},
    {'k', ".tvdres",
     [](const std::string& path) {
       StoredItems stored;
       return ReadStoredItems(path, true, stored);
     }},
    {'l', ".po", ReadCatalogue},
    {'n', ".csv", [](const std::string& path) { return ReadNamedPlaces(path).problem; }},
    {'o', ".prj",
     [](const std::string& path) {
       std::string text, problem;
       FindProjections(TextAt(path).substr(0, 100), 20, problem);
       return ReadProjectionFile(path, text).error;
     }},
    {'p', ".csv", ReadPasted},
    {'r', ".fvnwk", ReadNetwork},
    {'s', ".shp", ReadShapes},
    {'t', ".txt", ReadTexts},
    {'u', ".uzs", ReadAndWriteLibrary<kSoilLibrary>},
    {'v', ".bin",
     [](const std::string& path) {
       ProcessedRiver river;
       return ReadProcessedRiver(path, river).message;
     }},
    {'w', ".kvf", ReadAndWriteLibrary<kWellLibrary>},
    {'x', ".xyz",
     [](const std::string& path) {
       std::vector<ScatteredPoint> points;
       return ReadXyzFile(path, points).error;
     }},
    {'y', ".kvf",
     [](const std::string& path) {
       std::string problem;
       ReadRunState(path, problem);
       ReadPassport(path, problem);
       std::vector<DetailedPoint> points;
       return problem + ReadDetailedPoints(path, points).error;
     }},
    {'z', ".tvd~",
     [](const std::string& path) {
       AutosaveContent content;
       std::string error;
       return ReadAutosave(path, content, error) ? Reason() : error + "no autosave";
     }},
    {'V', ".rev",
     [](const std::string& path) {
       ViewedSetup setup;
       return ReadViewedSetup(path, setup).error;
     }},
    {'W', ".csv",
     [](const std::string& path) {
       WellImport wells;
       return ReadWellTable(path, wells);
     }},
};

void Check(std::string_view input) {
  // Larger files tell nothing new, and cost time.
  constexpr std::size_t kLargest = std::size_t{1} << 17;
  if (input.empty() || input.size() > kLargest) return;
  const auto* reader = std::ranges::find(kReaders, input.front(), &Reader::letter);
  if (reader == std::end(kReaders)) return;
  const InputFolder folder(input.substr(1), reader->extension);
  reader->read(folder.Path(reader->extension));
  folder.RequireUnchanged();
}

}  // namespace
}  // namespace tervane

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  tervane::Check({reinterpret_cast<const char*>(data), size});
  return 0;
}
