// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The geology of the saturated zone: units with parameters of their own, layers from the top down, and lenses in them.
#pragma once

#include <string>

#include "core/list.h"
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
  /// Takes the next number of the saturated zone.
  explicit CGeoLayerSZItemKvf(CYbSEKvfBase* parent);

  int id = 0;  ///< No two layers of a setup ever had the same.

  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// A body inside the layers.
class CGeoLenseSZItemKvf : public NamedItemKvf {
 public:
  explicit CGeoLenseSZItemKvf(CYbSEKvfBase* parent);
};

/// A list of items with names, which other lists take them from.
template <class Item>
class NamedListKvf : public CYbSEKvfListBase<Item>, public CYbSEItemNameSource {
 public:
  using CYbSEKvfListBase<Item>::CYbSEKvfListBase;

  std::string GetItemName(int number) const override {
    const Item* item = this->GetItem(number);
    return item ? item->Name : std::string();
  }

 protected:
  /// A new list of layers has one.
  void BeginWithAquifer() {
    this->SetItemCount(1, 1);
    this->GetItem(1)->Name = "Aquifer";
  }
};

class CGeoLayerSZKvf : public NamedListKvf<CGeoLayerSZItemKvf> {
 public:
  explicit CGeoLayerSZKvf(CYbSEKvfBase* parent);

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys.Count("NumberOfLayers", *this); }
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
