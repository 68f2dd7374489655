// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Map projections, as texts: WKT of any age and make, "EPSG:32632", "+proj=utm +zone=32", or a register's name. Each
// thread works alone; nothing is printed.
#pragma once

#include <memory>
#include <string>

#include "platform/files.h"

namespace tervane {

/// What the system asks of the text of a projection.
class CYbMapProjection {
 public:
  explicit CYbMapProjection(std::string text) : text_(std::move(text)) {}

  /// The text of a projection by its number; 1 is a local plane in metres without a place on the globe. Empty for a
  /// number that is not known.
  static std::string IDtoProjectionString(int id);

  /// Why the text is no coordinate system, in words that begin with the text; empty when it is one. An empty text
  /// counts as a local plane.
  std::string Problem() const;
  /// True when coordinates are angles; false for a text that is no coordinate system.
  bool IsGeographical() const;
  /// True when the system has no place on the globe.
  bool IsLocal() const;
  /// The name of the system to be shown ("WGS 84 / UTM zone 32N"); the text itself where there is none.
  std::string Name() const;
  /// True when both texts mean the same plane or angles, whatever their wording; also when both are the same text.
  bool IsSameAs(const CYbMapProjection& other) const;

  const std::string& Text() const { return text_; }

 private:
  std::string text_;
};

/// Turns points of a projection into longitude and latitude. May be used in any thread, but in one at a time.
class CYbCartography {
 public:
  /// A point (longitude, latitude) and a rotation are for grids that tell their place so; a grid here tells it in its
  /// own coordinates, and all three are 0.
  CYbCartography(const std::string& projection, double longitude, double latitude, double rotation);
  ~CYbCartography();
  CYbCartography(const CYbCartography&) = delete;
  CYbCartography& operator=(const CYbCartography&) = delete;

  /// Why no point can be converted (no coordinate system, a local plane), or empty.
  const std::string& Problem() const { return problem_; }
  /// Degrees on the WGS 84 ellipsoid, east and north positive. False where the projection has no such point; then
  /// the outs stay as they were.
  bool Proj2Geo(double x, double y, double& longitude, double& latitude) const;

 private:
  struct Transformation;
  std::unique_ptr<Transformation> transformation_;
  std::string problem_;
};

/// Turns points of one projection into those of another. May be used in any thread, but in one at a time.
class CYbProjectionChange {
 public:
  /// Both must be coordinate systems with a place on the globe; else `Problem` tells.
  CYbProjectionChange(const std::string& from, const std::string& to);
  ~CYbProjectionChange();
  CYbProjectionChange(const CYbProjectionChange&) = delete;
  CYbProjectionChange& operator=(const CYbProjectionChange&) = delete;

  const std::string& Problem() const { return problem_; }
  /// Longitude stands before latitude. False where the other projection has no such point; then the outs stay.
  bool Forward(double& x, double& y) const { return Convert(x, y, true); }
  bool Back(double& x, double& y) const { return Convert(x, y, false); }

 private:
  bool Convert(double& x, double& y, bool isForward) const;

  struct Transformation;
  std::unique_ptr<Transformation> transformation_;
  std::string problem_;
};

/// Reads the text of a projection file (.prj). A text that is no coordinate system is an error; `text` holds it all the
/// same.
FileResult ReadProjectionFile(const std::string& path, std::string& text);

}  // namespace tervane
