// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Maps as files that know where they lie.
#pragma once

#include <QImage>
#include <string>

#include "forms/plots.h"
#include "platform/files.h"

namespace tervane {

/// The six lines that tell where an image of an area lies: the size of a pixel, twice 0 for no turn, and the centre of
/// the upper left pixel.
std::string WorldFileText(const Envelope& area, QSize pixels);
/// Writes a picture of an area as PNG, and beside it world files under the two endings by which programs look for one
/// (.pgw, .pnw). The image is written last, so that it never stands without its place.
FileResult WritePlacedPicture(const std::string& path, const QImage& picture, const Envelope& area);
/// Writes the values of a grid as GeoTIFF.
FileResult WriteValues(const std::string& path, const CTvn2DOrthoRotatedGridData& grid);

}  // namespace tervane
