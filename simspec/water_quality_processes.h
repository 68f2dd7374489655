// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What nodes that drive the model ask of water quality. Where the tree has no such node, the answer is no.
#pragma once

#include "core/node.h"

namespace tervane {

/// The list of decay processes, "DECAY_LIST".
class DecayProcessList {
 public:
  virtual ~DecayProcessList() = default;
  /// Whether a process of the list depends on temperature.
  virtual bool IsAnyTemperatureDependent() const = 0;
};
inline constexpr ImportantName<DecayProcessList> kDecayProcesses{"DECAY_LIST"};

/// The process templates, "KINETRASPEC".
class ProcessTemplates {
 public:
  virtual ~ProcessTemplates() = default;
  /// Whether a template in use takes that input from the setup.
  virtual bool IsBuiltInUsed(int code) const = 0;

  /// Whether a template is in use in that compartment.
  virtual bool IsTemplateUsed(int compartment) const = 0;

  enum Compartment : int { kOverland = 1, kUnsaturated = 2, kSaturated = 4 };

  static constexpr int kPrimaryBulkDensity = 1110;
  static constexpr int kSecondaryBulkDensity = 1120;
  static constexpr int kAirTemperature = 2020;
  static constexpr int kSolarRadiation = 2030;
  static constexpr int kSoilTemperature = 2090;
};
inline constexpr ImportantName<ProcessTemplates> kProcessTemplates{"KINETRASPEC"};

/// The species, "SPECIES_LIST".
class SpeciesTypes {
 public:
  virtual ~SpeciesTypes() = default;
  /// Whether a species of the list has that `Type`.
  virtual bool HasSpeciesOfType(int type) const = 0;
};
inline constexpr ImportantName<SpeciesTypes> kSpeciesTypes{"SPECIES_LIST"};

}  // namespace tervane
