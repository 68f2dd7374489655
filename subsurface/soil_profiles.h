// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Profiles of the soil: which soil of a library lies how deep, and into which cells the column is divided.
#pragma once

#include <string>

#include "spatial/zones.h"

namespace tervane {

/// A soil of a library, down to a depth.
class CUZSoilProfilePropLayerItemKvf : public CYbSEKvfBase {
 public:
  explicit CUZSoilProfilePropLayerItemKvf(CYbSEKvfBase* parent)
      : CYbSEKvfBase("UZ Soil profile property layer item", "UZSoilProfilePropLayerItem%d", parent) {}

  float Depth = 1;  ///< Of its lower side.
  std::string SoilID;
  FileName DataBase;

  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

class CUZSoilProfilePropLayerListKvf : public CYbSEKvfListBase<CUZSoilProfilePropLayerItemKvf> {
 public:
  explicit CUZSoilProfilePropLayerListKvf(CYbSEKvfBase* parent);

  /// Where the lowest soil ends; 0 without soils.
  double Bottom() const;

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys.Count("NumberOfLayers", *this); }
};

/// Cells of one height that lie on each other.
class CUZSoilProfilePropDiscrItemKvf : public CYbSEKvfBase {
 public:
  explicit CUZSoilProfilePropDiscrItemKvf(CYbSEKvfBase* parent)
      : CYbSEKvfBase("UZSoilProfilePropDiscr", "UZSoilProfilePropDiscr%d", parent) {}

  float CellHeight = 0.2f;
  int NoCells = 5;
  double Dispersivity = 0;

  double Height() const { return static_cast<double>(NoCells) * static_cast<double>(CellHeight); }
  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

class CUZSoilProfilePropDiscrListKvf : public CYbSEKvfListBase<CUZSoilProfilePropDiscrItemKvf> {
 public:
  explicit CUZSoilProfilePropDiscrListKvf(CYbSEKvfBase* parent);

  /// Where the lowest cell ends.
  double Bottom() const;

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys.Count("NumberOfDiscr", *this); }
};

/// What decides how much water passes the soil by.
struct BypassConstants {
  float BYP;   ///< The largest fraction.
  float THR1;  ///< The water content below which less passes by.
  float THR2;  ///< The water content below which nothing does.

  void Exchange(KeyExchange& keys);
};

/// A profile.
class CUZSoilProfilePropKvf : public CodedZoneProp, public BypassConstants {
 public:
  explicit CUZSoilProfilePropKvf(CYbSEKvfBase* parent);

  CUZSoilProfilePropLayerListKvf& Soils() const { return *soils_; }
  CUZSoilProfilePropDiscrListKvf& Cells() const { return *cells_; }

  /// Where soils and cells end, if not at the same depth; empty where they do.
  std::string WhyEndsDiffer() const;
  /// Notes that.
  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  CUZSoilProfilePropLayerListKvf* soils_;
  CUZSoilProfilePropDiscrListKvf* cells_;
};

/// The profiles of the model area.
class CUZSoilProfileKvf : public CodedZonesKvf {
 public:
  explicit CUZSoilProfileKvf(CYbSEKvfBase* parent);
};

}  // namespace tervane
