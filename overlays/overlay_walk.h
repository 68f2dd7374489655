// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The layers of the backdrop as the parameter files of other programs hold them: one walk for all of these files, which
// differ in order, names and meanings.
#pragma once

#include <string_view>

#include "core/kvf.h"
#include "overlays/overlays.h"

namespace tervane {

/// How a file holds the backdrop.
struct OverlayFileForm {
  std::string_view nameKey;  ///< The keyword of a layer's file, with the number of its kind in front.
  // The numbers of kinds; the file has no place for a kind below 0.
  int imageKind = -1, shapeKind = -1, riverKind = -1;
  bool fromLast = false;      ///< The layers stand from the last to the first.
  bool countsEvery = false;   ///< Also a layer that the file has no place for takes a number in the drawing order.
  bool tellsDisplay = false;  ///< Layers have a `Display` of their own; else parts of a shape tell whether it is shown.
  bool imagesHaveUnit = false;  ///< Images have an axis unit.
  bool tellsPlacement = false;  ///< Shapes have a conversion and a projection.
  enum class Attribute { Never, WhenGiven, Always } attribute = Attribute::Never;  ///< Behind the name of a shape file.
  std::string_view imageCornerPrefix;  ///< In front of `x0`, `y0`, `x1` and `y1`.
  std::string_view lineTitle;          ///< Of a shape's lines; empty for the title of the layer.
  bool hasPoints = false;              ///< Shapes have a section for points, too.
  bool joinsTexts = false;             ///< Texts of points and of lines are one, in the colour of the latter.
  bool hasTwoBackgrounds = false;      ///< The background of texts is 1, opaque, or 2, transparent, and nothing else.
};
extern const OverlayFileForm kGridStateForm, kResultViewerForm, kNetworkEditorForm;

/// Writes the layers of a list that the file has a place for. Where every layer counts, `counter` is the number of the
/// latest layer in the drawing order, else that of the next one.
void WriteOverlays(KvfFile* file, const COverlayListKvf& list, const OverlayFileForm& form, int& counter);

}  // namespace tervane
