// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The geology of the saturated zone: units with parameters of their own, layers from the top down, and lenses in them.
#pragma once

#include <string>

#include "core/named_item.h"
#include "subsurface/ground_properties.h"

namespace tervane {

/// A geological unit: a code of the layers' unit maps, with its parameters.
class CGeoUnitsSZItemKvf : public CYbSEKvfBase {
 public:
  explicit CGeoUnitsSZItemKvf(CYbSEKvfBase* parent) : CYbSEKvfBase("GeoUnit", "GeoUnit_%d", parent) {}

  std::string SoilName;
  int SoilCode = 1;
  float HorConduc = 0.0001f;
  float VerConduc = 0.0001f;
  float SpecYield = 0.2f;
  float StorageCoef = 0.0001f;
  float Porosity = 0.2f;
  float MatrixPorosity = 0.05f;
  float BulkDensity = 1700;
  // Dispersivities, as those of a layer.
  float LHH = 0;
  float THH = 0;
  float TVH = 0;
  float LVV = 0;
  float THV = 0;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

class CGeoUnitsSZListKvf : public CYbSEKvfListBase<CGeoUnitsSZItemKvf> {
 public:
  explicit CGeoUnitsSZListKvf(CYbSEKvfBase* parent);

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys.Count("NumberOfGeoUnits", *this); }
};

/// A geological layer: it reaches from the level of the one above, or the ground, down to its own.
class CGeoLayerSZItemKvf : public NamedItemKvf {
 public:
  explicit CGeoLayerSZItemKvf(CYbSEKvfBase* parent);

  int id = 0;  ///< No two layers of a setup ever had the same.

  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// Gives the values, files and options of a layer's properties to another one, whose lower level stays.
void CopyProperties(const CGeoLayerSZItemKvf& from, CGeoLayerSZItemKvf& to);

/// A body inside the layers.
class CGeoLenseSZItemKvf : public NamedItemKvf {
 public:
  explicit CGeoLenseSZItemKvf(CYbSEKvfBase* parent);
};

class CGeoLayerSZKvf : public NamedListKvf<CGeoLayerSZItemKvf> {
 public:
  /// Layers take their numbers from the counter `nextId` of the owner.
  CGeoLayerSZKvf(int& nextId, CYbSEKvfBase* parent);

  /// A layer with a number of its own. One that never stands in the list, made by `NewItem`, takes none.
  std::unique_ptr<CYbSEKvfBase> NewItemNode() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys.Count("NumberOfLayers", *this); }

 private:
  int& nextId_;
};
inline constexpr ImportantName<CGeoLayerSZKvf> kGeologicalLayers{"SZGEOLAYERS"};

class CGeoLenseSZKvf : public NamedListKvf<CGeoLenseSZItemKvf> {
 public:
  explicit CGeoLenseSZKvf(CYbSEKvfBase* parent);

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys.Count("NumberOfLenses", *this); }
};
inline constexpr ImportantName<CGeoLenseSZKvf> kGeologicalLenses{"SZGEOLENSES"};

}  // namespace tervane
