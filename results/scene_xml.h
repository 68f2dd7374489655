// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "core/kvf.h"

namespace tervane {

/// A parameter file as XML, as the 3D viewer reads it: sections are elements, a keyword is one with its first value.
/// The bytes are Windows-1252, with references for what that lacks; of what XML reserves only `&` is escaped.
std::string SceneXml(const KvfFile& file);

}  // namespace tervane
