// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The processes that change species: decay, and sorption between a dissolved and a sorbed species. Lists in each
// compartment follow these two.
#pragma once

#include <string>

#include "wqpt/species.h"

namespace tervane {

/// A process of either list: a name, and a species that it works on.
template <class ItemBase>
class ProcessItemKvf : public CYbSEKvfGroupBase, public ItemBase, public OffersMends {
 public:
  using CYbSEKvfGroupBase::CYbSEKvfGroupBase;

  std::string Species;  ///< By name; it may be gone.

  const std::string& GetName() const override { return name_; }
  void SetName(const std::string& name) override { this->RenameLinked(name_ = name); }
  const std::string& GetTitle() const override { return name_.empty() ? CYbSEKvfGroupBase::GetTitle() : name_; }
  const std::string& GetAbbreviatedTitle() const override { return name_; }
  void SetAbbreviatedTitle(std::string title) override { SetName(title); }

  /// Tells all that follows the process.
  void OnMasterChanged(CTvnDependentListBase* list, int number) override {
    for (ItemBase* linked : this->LinkedItems()) linked->OnMasterChanged(list, number);
  }

 protected:
  std::string name_;
};

/// A decay. Flags are 0 or 1.
class CProcessesWQ_DecayItemKvf : public ProcessItemKvf<CDencyItemBase> {
 public:
  explicit CProcessesWQ_DecayItemKvf(CYbSEKvfBase* parent);

  int IsTemperatureDependant = 0;
  int IsWaterContentDependant = 0;
  float Temperature = 20;
  float TemperatureExponent = 0.01F;
  float WaterContentExponent = 1;

  void ReadData(KvfNode* section) override;
  int ValidateData() override;
  /// The species that may decay, for one that is gone.
  std::vector<Mend> MendsOf(const Finding& finding) const override;
  void TakeMend(const Mend& mend) override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// The list, "DECAY_LIST". It listens to the species.
class CProcessesWQ_DecayListKvf : public CTvnMasterList<CProcessesWQ_DecayItemKvf, CDecayListBase>,
                                  public DecayProcessList {
 public:
  explicit CProcessesWQ_DecayListKvf(CYbSEKvfBase* parent);
  ~CProcessesWQ_DecayListKvf() override;

  bool IsAnyTemperatureDependent() const override;
  /// Tells each process the place of its species among the species, 0 when it is gone.
  void OnNotify(int value, void* object) override;
  void Load(KvfNode* parentSection) override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys.Count("NumberOfDecay", *this); }

 private:
  bool isLoading_ = false;
};
inline constexpr ImportantName<CProcessesWQ_DecayListKvf> kDecays{"DECAY_LIST"};

/// A sorption.
class CProcessesWQ_SorptionItemKvf : public ProcessItemKvf<CSorptionProcessesItemBase> {
 public:
  explicit CProcessesWQ_SorptionItemKvf(CYbSEKvfBase* parent);

  enum SorptionType : int { kEquilibrium = 0, kEquilibriumKinetic = 1, kFiltration = 2, kColloidSource = 3 };
  enum Isotherm : int { kLinear = 0, kFreundlich = 1, kLangmuir = 2 };
  enum Kinetics : int { kNoHysteresis = 0, kHysteresis = 1 };

  int Type = kEquilibrium;
  std::string SorbedSpecies;
  int IsothermType = kLinear;
  int KineticType = kNoHysteresis;
  float EQSorptionFraction = 0.7F;
  float BiasFactor = 0;

  void ReadData(KvfNode* section) override;
  int ValidateData() override;
  /// The dissolved or the sorbed species, for one that is gone.
  std::vector<Mend> MendsOf(const Finding& finding) const override;
  void TakeMend(const Mend& mend) override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// The first two, and those of colloids.
inline constexpr KeyChoice kSorptionTypes[] = {
    {CProcessesWQ_SorptionItemKvf::kEquilibrium, "Equilibrium"},
    {CProcessesWQ_SorptionItemKvf::kEquilibriumKinetic, "Equilibrium Kinetic"},
    {CProcessesWQ_SorptionItemKvf::kFiltration, "Filtration"},
    {CProcessesWQ_SorptionItemKvf::kColloidSource, "Colloid Source"}};
inline constexpr std::size_t kSorptionTypesWithoutColloids = 2;

/// The list, "SORPTION_LIST".
class CProcessesWQ_SorptionListKvf : public CTvnMasterList<CProcessesWQ_SorptionItemKvf, CSorptionProcessesListBase> {
 public:
  explicit CProcessesWQ_SorptionListKvf(CYbSEKvfBase* parent);

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys.Count("NumberOfSorption", *this); }
};
inline constexpr ImportantName<CProcessesWQ_SorptionListKvf> kSorptions{"SORPTION_LIST"};

/// Both.
class CProcessesWQKvf : public CYbSEKvfGroupBase {
 public:
  explicit CProcessesWQKvf(CYbSEKvfBase* parent);

  CProcessesWQ_DecayListKvf& Decays() const { return *decays_; }
  CProcessesWQ_SorptionListKvf& Sorptions() const { return *sorptions_; }

 private:
  CProcessesWQ_DecayListKvf* decays_;
  CProcessesWQ_SorptionListKvf* sorptions_;
};
inline constexpr ImportantName<CProcessesWQKvf> kProcesses{"PROCESSESWQ"};

/// Sorption and decay are modelled.
Condition SorptionAndDecayModelled();
Condition AnyDecay();
Condition AnySorption();

}  // namespace tervane
