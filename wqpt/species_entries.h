// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What follows the species: initial masses and concentrations, and the coefficients of mass transfer.
#pragma once

#include "spatial/cell_totals.h"
#include "wqpt/entries.h"
#include "wqpt/soil_values.h"
#include "wqpt/species.h"

namespace tervane {

/// The quantity of the concentration of a species of that type.
int ConcentrationQuantity(int speciesType);

// ---- Over ground

/// The mass of a species on the ground. A species without a defined phase has a value without a unit.
class CInitialMassItem : public NamedEntry<CData2DKvf, CSpeciesItemBase> {
 public:
  CInitialMassItem(std::string name, CYbSEKvfBase* parent);

  int GetItemType() const override;
};

class COverlandSpeciesKvf : public EntriesKvf<CInitialMassItem, CSpeciesListBase>, public TotalsOfQuantities {
 public:
  explicit COverlandSpeciesKvf(CYbSEKvfBase* parent);

  std::optional<CellTotals> TotalsOf(CData2DKvf& quantity) const override;
};

// ---- In the soil

class CMacroporeTransferCoeffItemKvf : public NamedEntry<SoilValuesKvf, CSpeciesItemBase> {
 public:
  CMacroporeTransferCoeffItemKvf(std::string name, CYbSEKvfBase* parent);
};

class CMacroporeTransferCoeff : public EntriesKvf<CMacroporeTransferCoeffItemKvf, CSpeciesListBase> {
 public:
  explicit CMacroporeTransferCoeff(CYbSEKvfBase* parent);
};

/// The concentration of a species in the soil; its quantity follows the type of the species.
class CUnSatInitConcenSpecyKvf : public NamedEntry<SoilValuesKvf, CSpeciesItemBase> {
 public:
  CUnSatInitConcenSpecyKvf(std::string name, CYbSEKvfBase* parent);

  int GetItemType() const override;
  /// The parent's title and the name.
  const std::string& GetTitle() const override;

 private:
  mutable std::string shownTitle_;
};

class CUnSatInitConcenKvf : public EntriesKvf<CUnSatInitConcenSpecyKvf, CSpeciesListBase> {
 public:
  explicit CUnSatInitConcenKvf(CYbSEKvfBase* parent);
};

// ---- In the saturated zone

/// The transfer of a species to immobile water in a water quality layer.
class CWQLayerSpecyKvf : public NamedEntry<CData2DKvf, CSpeciesItemBase> {
 public:
  CWQLayerSpecyKvf(std::string name, CYbSEKvfBase* parent);

  int ValidateData() override;
};

class CDualPorosityTransferCoeffListKvf : public EntriesKvf<CWQLayerSpecyKvf, CSpeciesListBase> {
 public:
  explicit CDualPorosityTransferCoeffListKvf(CYbSEKvfBase* parent);
};

/// The concentration of a species in a computational layer. Its quantity is that of the species when the entry was
/// made, until the species goes over from dissolved to sorbed or back.
class CSatCompLayerInitConSpecy : public NamedEntry<CData2DKvf, CSpeciesItemBase> {
 public:
  CSatCompLayerInitConSpecy(std::string name, CYbSEKvfBase* parent);

  int GetItemType() const override { return itemType_; }
  /// Takes the quantity of a new entry's species, with its first unit.
  void BeginWith(int speciesType);
  /// Takes the quantity of a species that has become dissolved or sorbed; all other values stay.
  void FitSpecies(int speciesType);

 protected:
  void ExchangeState(KeyExchange& keys) override;

 private:
  int itemType_ = quantity::kConcentration;
};

/// The concentrations of all species in a computational layer, in its pores or in immobile water.
class ConcentrationsKvf : public EntriesKvf<CSatCompLayerInitConSpecy, CSpeciesListBase> {
 public:
  using EntriesKvf::EntriesKvf;

  CSpeciesItemBase* CreateDependentItem(int id, const std::string& name) override;
  void RefreshDependents() override;
};

class CSatCompLayersInitConcentrationKvf : public ConcentrationsKvf {
 public:
  explicit CSatCompLayersInitConcentrationKvf(CYbSEKvfBase* parent);
};

class CSatCompLayersInitImmobileConcentrationKvf : public ConcentrationsKvf {
 public:
  explicit CSatCompLayersInitImmobileConcentrationKvf(CYbSEKvfBase* parent);
};

}  // namespace tervane
