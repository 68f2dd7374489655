// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <ostream>
#include <string>
#include <vector>

#include "data/grid_resampling.h"

namespace tervane {

/// Where a command writes: results to one, messages to the other.
struct Streams {
  std::ostream& out;
  std::ostream& err;
};

/// Tells why a command could not do its work; gives its exit status.
int Refuse(Streams streams, const std::string& reason);

/// True, with a message, when the file exists and is not to be replaced.
bool RefuseToReplace(const std::string& file, bool force, Streams streams);

// Each of the following gives an `ExitStatus`.

int NewCommand(const std::string& file, bool force, Streams streams);
int ConvertCommand(const std::string& in, const std::string& out, bool force, Streams streams);

int CheckCommand(const std::string& file, bool json, Streams streams);
/// Whether the data cover the simulation and the domain, and what the forcings come to.
int CoverageCommand(const std::string& file, bool json, Streams streams);

enum class TreeForm { Text, Paths, Json };
int TreeCommand(const std::string& file, bool all, TreeForm form, Streams streams);
int ShowCommand(const std::string& file, const std::string& path, Streams streams);

/// Why a node takes part or not; without a place all that is missing, and what would bring it.
int WhyCommand(const std::string& file, const std::string& path, bool json, Streams streams);

/// The page of a node as text.
int PageCommand(const std::string& file, const std::string& path, Streams streams);

int GetCommand(const std::string& file, const std::string& path, Streams streams);
int SetCommand(const std::string& file, const std::string& path, const std::string& value, bool force, Streams streams);

int DiffCommand(const std::string& from, const std::string& to, bool json, Streams streams);
int KeysCommand(bool markdown, Streams streams);

/// What `run` was asked for.
struct RunOptions {
  std::string file;
  std::string argument;  ///< "/PP", "/WM", "/WQ", or empty: what the setup says.
  std::string engines;   ///< Folders of engines; may be empty.
  bool json = false;
};
/// Runs a setup and waits for the end: done, findings when the engine failed, could not when it was not started.
int RunCommand(const RunOptions& options, Streams streams);

/// What a data file holds, by its header alone; also of shapes (.shp) and of texts of points (.txt, .xyz), read whole.
int DataInfoCommand(const std::string& path, bool json, Streams streams);
/// The range, mean and missing values of each item; reads the whole file.
int DataStatsCommand(const std::string& path, Streams streams);

/// What makes a data file of columns of a table.
struct SeriesImport {
  std::string in, out;
  int itemType = 0;
  std::vector<std::string> columns;  ///< None: the only one.
  bool isEveryColumn = false;
  std::string unit;
  int valueType = 0;
  bool stampsAreBegins = false;
  bool force = false;
};
int ImportSeriesCommand(const SeriesImport& import, Streams streams);
/// What makes a data file of a band of a raster.
struct GridImport {
  std::string in, out;
  int itemType = 0;
  int band = 0;  ///< 0: the only one.
  std::string unit;
  std::string like;                      ///< A setup, on whose model grid the values are put.
  std::optional<Resampling> resampling;  ///< Without one what suits.
  bool force = false;
};
int ImportGridCommand(const GridImport& import, Streams streams);

/// What of a data file is written for other programs.
struct Export {
  std::string in, out;
  int item = 1, step = 1, layer = 1;  ///< Of grids.
  bool isPartNamed = false;           ///< One of them was given.
  bool force = false;
};
/// Time series as a table, or a grid as GeoTIFF where `out` says so.
int ExportCommand(const Export& wanted, Streams streams);

}  // namespace tervane
