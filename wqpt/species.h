// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The species of a water quality simulation. Many lists in the tree follow this one: one value for each species.
#pragma once

#include <string>
#include <vector>

#include "core/dependent_list.h"
#include "core/mends.h"
#include "simspec/water_quality_processes.h"

namespace tervane {

/// A species. Flags are 0 or 1.
class CSpeciesItemKvf : public CYbSEKvfGroupBase, public CSpeciesItemBase {
 public:
  explicit CSpeciesItemKvf(CYbSEKvfBase* parent);

  enum SpeciesType : int { kDissolved = 0, kSorbed = 1, kSuspended = 2, kFixed = 3 };
  /// What is written in the place of an uptake factor that stands for none.
  static constexpr float kNoUptakeFactor = 1.1754944e-38F;

  int Include = 1;
  int Type = kDissolved;
  std::string TypeStr;  ///< The cell of the type as it was last stored; empty in a new species.
  float SolubilityinSurfaceWater = 1e8F;
  int TypeforColloids = 0;
  float PlantUptakeTransFactor = 0;

  /// Stores a type as the cell of a table does. The dependents follow when the list is told to refresh them.
  void SetType(int type);

  const std::string& GetName() const override { return name_; }
  /// Renames what follows the species too, and the first decay and the first sorption that name it.
  void SetName(const std::string& name) override;
  const std::string& GetTitle() const override { return name_.empty() ? CYbSEKvfGroupBase::GetTitle() : name_; }
  const std::string& GetAbbreviatedTitle() const override { return name_; }
  void SetAbbreviatedTitle(std::string title) override { SetName(title); }

  void ReadData(KvfNode* section) override;
  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  std::string name_;
};

inline constexpr KeyChoice kSpeciesTypeChoices[] = {{CSpeciesItemKvf::kDissolved, "Dissolved"},
                                                    {CSpeciesItemKvf::kSorbed, "Sorbed"},
                                                    {CSpeciesItemKvf::kSuspended, "Suspended"},
                                                    {CSpeciesItemKvf::kFixed, "Fixed (undefined)"}};

/// The list, "SPECIES_LIST".
class CSpeciesListKvf : public CTvnMasterList<CSpeciesItemKvf, CSpeciesListBase>,
                        public CYbSEItemNameSource,
                        public SpeciesTypes {
 public:
  explicit CSpeciesListKvf(CYbSEKvfBase* parent);

  bool HasSpeciesOfType(int type) const override;
  std::string GetItemName(int number) const override;
  /// The first species of that name, in any case; null where there is none.
  CSpeciesItemKvf* FindByName(const std::string& name) const;
  /// The names in the order of the list, of all species or of those of a type.
  std::vector<std::string> Names() const;
  std::vector<std::string> NamesOfType(int type) const;
  std::vector<std::string> NamesWithoutType(int type) const;

  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys.Count("NumberOfSpecies", *this); }
};
inline constexpr ImportantName<CSpeciesListKvf> kSpecies{"SPECIES_LIST"};

/// A name for that key of a node, of these species, in the place of one that is gone.
std::vector<Mend> MendsByNames(const std::string& key, const std::vector<std::string>& names);

/// The species that an entry follows; null for any other node, and where the species are gone.
CSpeciesItemKvf* SpeciesOf(const CYbSEKvfBase& entry);
/// The species that the asking entry follows has one of those types.
Condition SpeciesTypeIs(std::vector<int> types);
/// The setup has a species.
Condition AnySpecies();

}  // namespace tervane
