// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Values of the model that process templates may take as constants or forcings, by the compartments in which they
// exist.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace tervane {

/// Bits of what a value needs, as engines know them.
enum KinetraNeeds : std::uint64_t {
  kNeedsOverland = 0x8,
  kNeedsUnsaturated = 0x20,
  kNeedsSaturated = 0x40,
  kNeedsMacropores = 0x400,
  kNeedsSecondaryPorosity = 0x400000000,
};

/// A value of the model.
struct KinetraParameter {
  int idCode = -1;
  std::string name = "Undefined";
  int quantity = 0;
  int unit = 0;  ///< A unit key.
  std::vector<std::uint64_t> alternatives = {};
};

/// The constants, or the forcings, of which an alternative needs nothing beyond the mask, in the order of the table.
std::vector<KinetraParameter> KinetraConstantsFor(std::uint64_t mask);
std::vector<KinetraParameter> KinetraForcingsFor(std::uint64_t mask);

// The same for callers that count.
int GetNoKinetraConstants(std::uint64_t mask);
int GetNoKinetraForcings(std::uint64_t mask);
/// The row of that number from 1; one without a name where there is none.
KinetraParameter GetKinetraConstant(std::uint64_t mask, int index);
KinetraParameter GetKinetraForcing(std::uint64_t mask, int index);

/// The parameter with that code, whatever its compartments; null where there is none.
const KinetraParameter* FindKinetraParameter(int idCode);

}  // namespace tervane
