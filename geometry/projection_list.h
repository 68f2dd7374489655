// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace tervane {

/// A coordinate system of the register.
struct KnownProjection {
  std::string code;   ///< "EPSG:32632"
  std::string name;   ///< "WGS 84 / UTM zone 32N"
  std::string place;  ///< Where it is used.
  bool isGeographical = false;
};

/// The systems that hold all typed words in code, name or place, whatever the case of ASCII letters: best first. Empty
/// where the register cannot be read; `problem` then says why.
std::vector<KnownProjection> FindProjections(std::string_view typed, std::size_t most, std::string& problem);

/// The text of a system by its code, as other programs read it (WKT); empty for a code that is not known.
std::string ProjectionTextOf(const std::string& code);

}  // namespace tervane
