// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Where images lie on a map, as files beside them tell.
#pragma once

#include <optional>
#include <string>

#include "core/host.h"
#include "core/node.h"

namespace tervane {

/// The corners that a parameter file tells: `x0`, `y0`, `x1` and `y1` of the section `World_Coordinates`. Nothing, and
/// the user is told why, when it tells none.
std::optional<DataArea> ReadImagePlace(const std::string& path, Host& host);

/// The place of an image by its geo-reference: a parameter file (bmpw, jpgw, gifw, pngw, tifw), a world file (bpw, jpw,
/// giw, pnw, tiw), or an image that tells its own place (tif, tiff). Nothing for a file of another kind, and, told to
/// the user, for one that cannot be read.
std::optional<DataArea> ReadGeoReference(const std::string& path, const std::string& image, Host& host);

}  // namespace tervane
