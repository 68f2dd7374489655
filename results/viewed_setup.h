// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What a setup file of the result viewer (.REV) asks to be shown.
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "core/node.h"
#include "platform/files.h"
#include "results/viewer_palette.h"

namespace tervane {

/// A class of a palette in the unit in which it was written, which the title names.
struct ViewedClass {
  PaletteColor color;
  double upTo = 0;

  bool operator==(const ViewedClass&) const = default;
};

/// An item of a data file.
struct ViewedGrid {
  std::string path;
  int item = 1;
  int layer = 0;  ///< As the file counts, from the bottom.
  double transparency = 0;
  std::string paletteTitle;
  std::vector<ViewedClass> palette;  ///< Ascending.
};

/// Flow as arrows.
struct ViewedFlow {
  std::string path;
  int xItem = 0, yItem = 0, layer = 0;
  bool isShown = true;
};

/// A layer of the backdrop.
struct ViewedOverlay {
  enum class Kind { Image, Shape };

  Kind kind = Kind::Shape;
  std::string path, attribute;
  int axisUnit = 0;
  bool isShown = true;
  unsigned lineColor = 0;     ///< Of a shape: red, green, blue.
  DataArea corners;           ///< Of an image.
  bool isForeground = false;  ///< Over the result.
};

struct ViewedSetup {
  DataArea area;
  int currentStep = 0;
  ViewedGrid result;
  std::optional<ViewedFlow> flow;
  std::vector<ViewedOverlay> overlays;  ///< From the bottom up.
  std::vector<std::string> notes;       ///< What was left out, and why.
};

bool IsNamedAsViewedSetup(std::string_view path);

/// Reads a setup file. Without a result to show it is refused; `setup` is then as it was.
FileResult ReadViewedSetup(const std::string& path, ViewedSetup& setup);

}  // namespace tervane
