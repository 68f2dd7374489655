// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string_view>

#include "core/page_class.h"

namespace tervane {

/// The folder of the family that makes a page, "simspec"; empty when nobody makes it.
std::string_view PageFamilyOf(const PageClass& page);

}  // namespace tervane
