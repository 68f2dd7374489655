// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Where each species of a setup takes part, and by which values.
#pragma once

#include <string>
#include <vector>

#include "core/node.h"

namespace tervane {

/// What a species has at one place of the setup.
struct SpeciesUse {
  enum class State {
    None,     ///< Nothing names the species here.
    Off,      ///< What is here takes no part.
    Default,  ///< It takes part, and all its values stand at their defaults.
    Set,      ///< It takes part with values of the user's.
  };
  State state = State::None;
  CYbSEKvfBase* node = nullptr;    ///< The first that stands for the species here; null for `None`.
  bool isOfUsedList = false;       ///< The list that holds the node takes part.
  std::vector<std::string> names;  ///< Of the processes or sources that name the species.
};
/// "", "off", "default", "set", with the names behind it.
std::string SpeciesUseText(const SpeciesUse& use);

/// A species, with its use at each place.
struct SpeciesRow {
  std::string name;
  std::vector<SpeciesUse> uses;  ///< One for each title of `places`.
};
struct SpeciesMatrix {
  std::vector<std::string> places;  ///< "Overland mass", "Soil decay", ...
  std::vector<SpeciesRow> rows;     ///< In the order of the species.
  /// Processes and sources whose species the setup does not have: what they are called, and the node.
  std::vector<std::pair<std::string, CYbSEKvfBase*>> withoutSpecies;
};
SpeciesMatrix MatrixOfSpecies(CYbSEKvfBase& root);
/// The titles of the places, whatever the setup.
std::vector<std::string> PlacesOfSpecies();

}  // namespace tervane
