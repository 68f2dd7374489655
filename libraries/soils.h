// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Soils: how much water they hold at a suction, and how well they conduct it.
#pragma once

#include <optional>
#include <span>
#include <string>
#include <string_view>

#include "libraries/library.h"

namespace tervane {

/// Soil property files (.uzs).
extern const LibraryKind kSoilLibrary;

/// A soil in one of the models. Suction is the negative pressure head, in metres.
struct Soil {
  enum class Retention { VanGenuchten, BrooksCorey, Campbell };
  enum class Conductivity { Mualem, PowerLaw };

  Retention retention = Retention::VanGenuchten;
  Conductivity conductivity = Conductivity::Mualem;
  double thetaS = 0;            ///< Water content at saturation.
  double thetaR = 0;            ///< Residual water content; 0 with Campbell.
  double alpha = 0;             ///< Of van Genuchten, per metre.
  double n = 0;                 ///< Of van Genuchten.
  double airEntry = 0;          ///< Of Brooks-Corey and Campbell: the suction in metres at which air begins to enter.
  double lambda = 0;            ///< The index of pore sizes of Brooks-Corey; with Campbell 1 / b.
  double ks = 0;                ///< Conductivity at saturation, in m/s.
  double poreConnectivity = 0;  ///< Of Mualem.
  double exponent = 0;          ///< Of the power law.
};

/// The soil of an entry; nothing where the entry has faults.
std::optional<Soil> SoilOf(const LibraryEntry& entry);

/// The part of the pores above the residual water content that is filled, from 0 to 1.
double EffectiveSaturation(const Soil& soil, double suction);
double WaterContent(const Soil& soil, double suction);
/// In m/s, at that suction.
double ConductivityAt(const Soil& soil, double suction);

/// The soil of that name in a file; nothing where it is not there or has faults.
std::optional<Soil> FindSoil(const std::string& path, std::string_view soil);
/// Whether a file is there and holds a soil of that name.
bool IsSoilDBFileValid(const std::string& path, std::string_view soil);
/// Why it does not; empty when it does.
std::string WhySoilNotValid(const std::string& path, std::string_view soil);
/// What is wrong with the numbers of a soil that is there; empty when nothing is.
std::string FaultOfSoil(const std::string& path, std::string_view soil);

/// The mean soil of a texture class of the USDA, in the model of van Genuchten.
struct SoilTexture {
  std::string_view name;
  double thetaR, thetaS, alpha, n;
  double ks;  ///< In cm/h, as it was published.
};
/// Averages of Carsel and Parrish (1988): Developing joint probability distributions of soil water retention
/// characteristics. Water Resources Research 24, tables 3 to 5.
std::span<const SoilTexture> SoilTextures();
/// Gives an entry the values of a class. The bulk density is that of grains of quartz with the pores of the class.
void SetFromTexture(LibraryEntry& soil, const SoilTexture& texture);

}  // namespace tervane
