// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Files that become layers of the backdrop.
#pragma once

#include <string>
#include <string_view>

#include "core/host.h"
#include "overlays/overlays.h"

namespace tervane {

/// Whether a layer can show a file of that name.
bool IsLayerFile(std::string_view path);

/// Adds a layer that shows a file to the setup of the node: images and grids below the data, shapes, rivers and wells
/// above. An image takes its place from the image itself or from the geo-reference beside it; one that has neither lies
/// over the domain. Null where no layer can show the file, or the node is of no setup.
COverlayItemKvf* AddLayerOf(const CYbSEKvfBase& node, const std::string& path, Host& host);

}  // namespace tervane
