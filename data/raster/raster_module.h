// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What stands between a program and the module with GDAL, which is loaded when a raster is first asked for. Everything
// here is as the raster stores it; platform/raster_file.h gives it our form. The module is not made for threads.
#pragma once

#include <memory>
#include <span>
#include <string>
#include <vector>

namespace tervane::raster {

/// Counts up with every change of this header, so that a module of another build is refused.
inline constexpr int kInterface = 1;
inline constexpr const char* kModuleName = "tervane_raster";
inline constexpr const char* kEntryName = "TervaneRasterModule";

struct StoredBand {
  std::string description, unit;
  /// What our own files tell of an item; empty in others.
  std::string itemType, unitKey;
  bool isWhole = false;    ///< Its numbers are stored as whole ones.
  bool isComplex = false;  ///< Such a band cannot be read.
};

struct StoredRaster {
  std::string format;  ///< "GeoTIFF", as GDAL names it.
  int nx = 0, ny = 0;
  std::vector<double> transform;  ///< Six numbers in GDAL's order; empty where the raster has no place.
  std::string projection;         ///< WKT of the plane, without heights; empty when there is none.
  std::vector<StoredBand> bands;
  std::vector<std::string> parts;  ///< Of a file of several rasters, which has no bands itself: their names.
};

/// A part of a raster, counted from the first stored column and row.
struct StoredWindow {
  int x = 0, y = 0, nx = 0, ny = 0;
};

class OpenRaster {
 public:
  virtual ~OpenRaster() = default;

  /// Reads a window of a band (from 1), row by row as stored. What the raster marks as missing, and what is not
  /// finite, is `missing`; scale and offset are applied. "" or why not.
  virtual std::string Read(int band, const StoredWindow& window, float missing, std::span<float> values) = 0;
};

class Module {
 public:
  virtual ~Module() = default;

  /// Null, with the reason or with none where no format knows the file.
  virtual std::unique_ptr<OpenRaster> Open(const std::string& path, StoredRaster& facts, std::string& reason) = 0;
  /// Writes the first band of a GeoTIFF over a file; `missing` stands for no value. "" or why not.
  virtual std::string WriteGeoTiff(const std::string& path, const StoredRaster& raster, float missing,
                                   std::span<const float> values) = 0;
};

/// The one function that the module exports. Null when it has another interface.
using Entry = Module* (*)(int interface);

}  // namespace tervane::raster
