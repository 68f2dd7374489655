// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// How layers of the backdrop are drawn, by the numbers under which a setup keeps it.
#pragma once

#include <array>
#include <string>

#include "core/key_facts.h"

namespace tervane {

enum PointMarker : int {
  kPlusMarker = 0,
  kCrossMarker = 1,
  kStarMarker = 2,
  kTriangleMarker = 3,
  kSquareMarker = 4,
  kDiamondMarker = 5,
  kRingMarker = 6,
  kFilledCircleMarker = 7,
  kFilledSquareMarker = 8,
  kFilledTriangleMarker = 9,
  kFilledDiamondMarker = 10,
};
inline constexpr std::array kPointMarkers{
    KeyChoice{kPlusMarker, "Plus"},
    KeyChoice{kCrossMarker, "Cross"},
    KeyChoice{kStarMarker, "Star"},
    KeyChoice{kTriangleMarker, "Triangle"},
    KeyChoice{kSquareMarker, "Square"},
    KeyChoice{kDiamondMarker, "Diamond"},
    KeyChoice{kRingMarker, "Circle"},
    KeyChoice{kFilledCircleMarker, "Filled circle"},
    KeyChoice{kFilledSquareMarker, "Filled square"},
    KeyChoice{kFilledTriangleMarker, "Filled triangle"},
    KeyChoice{kFilledDiamondMarker, "Filled diamond"},
};

enum PointEdge : int { kPlainPoints = 0, kEdgedPoints = 1 };
inline constexpr std::array kPointEdges{KeyChoice{kPlainPoints, "Plain"}, KeyChoice{kEdgedPoints, "With a white edge"}};

enum LineDash : int { kSolidLine = 0, kDashedLine = 1, kDottedLine = 2, kDashDotLine = 3, kDashDotDotLine = 4 };
inline constexpr std::array kLineDashes{
    KeyChoice{kSolidLine, "Solid"},
    KeyChoice{kDashedLine, "Dashes"},
    KeyChoice{kDottedLine, "Dots"},
    KeyChoice{kDashDotLine, "Dashes and dots"},
    KeyChoice{kDashDotDotLine, "Dashes and pairs of dots"},
};

enum PolygonFill : int { kOutlineOnly = 0, kVeiledPolygon = 1, kFilledPolygon = 2, kHatchedPolygon = 3 };
inline constexpr std::array kPolygonFills{
    KeyChoice{kOutlineOnly, "Outline"},
    KeyChoice{kVeiledPolygon, "Filled, transparent"},
    KeyChoice{kFilledPolygon, "Filled"},
    KeyChoice{kHatchedPolygon, "Hatched"},
};

enum TextColoring : int { kOwnTextColor = 0, kColorOfShape = 1 };
inline constexpr std::array kTextColorings{KeyChoice{kOwnTextColor, "Its own"},
                                           KeyChoice{kColorOfShape, "That of the shape"}};

/// The ground of a text; every other number than 1 is transparent.
enum TextGround : int { kOpaqueText = 1, kTransparentText = 2 };
inline constexpr std::array kTextGrounds{KeyChoice{kOpaqueText, "Opaque"}, KeyChoice{kTransparentText, "Transparent"}};

enum ImageColoring : int { kWholeImage = 0, kKeyedImage = 1, kGreyImage = 2, kKeyedGreyImage = 3 };
inline constexpr std::array kImageColorings{
    KeyChoice{kWholeImage, "All colours"},
    KeyChoice{kKeyedImage, "One colour is transparent"},
    KeyChoice{kGreyImage, "Grey"},
    KeyChoice{kKeyedGreyImage, "Grey, one colour is transparent"},
};

/// How the texts of shapes are drawn; colours are red, green, blue.
struct TextStyle {
  bool isShown = false;
  unsigned color = 0;
  bool isOpaque = true;

  bool operator==(const TextStyle&) const = default;
};

/// How shapes are drawn; sizes are in millimetres.
struct ShapeStyle {
  int marker = kFilledCircleMarker;
  bool hasEdge = false;
  double pointSize = 1;
  unsigned pointColor = 0;
  TextStyle pointText = {};
  int dash = kSolidLine;
  int fill = kOutlineOnly;
  double lineWidth = 0.3;
  unsigned lineColor = 0;
  TextStyle lineText = {};

  bool operator==(const ShapeStyle&) const = default;
};

}  // namespace tervane
