// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "core/fixes.h"

namespace tervane {

/// What a file's node finds where a usable file is too short.
inline constexpr const char* kNotCovering = "The file does not cover the simulation";
/// What it finds where a file lies in another system of coordinates.
inline constexpr const char* kOtherProjection = "The file has another projection than the model domain";
/// What it finds where that system is none of a plane.
inline constexpr const char* kInDegrees = "The coordinates of the file are in degrees";

/// Of a file that can be read, but whose chosen item or attribute is none that the node can use: the only one it can.
extern const FixKind kOnlyItem;
/// Of files that do not cover the simulation: the simulation within what all of them cover.
extern const FixKind kPeriodOfData;
/// Of the shapes of the domain: their projection becomes that of the model.
extern const FixKind kProjectionOfShapes;

}  // namespace tervane
