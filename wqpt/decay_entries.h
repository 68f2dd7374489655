// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What follows the decay processes: a half life of each, over ground, in the soil, and in each water quality layer.
#pragma once

#include <initializer_list>
#include <vector>

#include "wqpt/entries.h"
#include "wqpt/processes.h"

namespace tervane {

/// An entry of a decay. Whether it takes part is told by the process list, and kept until the list tells it again.
class DecayEntryKvf : public NamedEntry<CYbSEKvfGroupBase, CDencyItemBase> {
 public:
  /// `types` are those of the species that decay in the compartment.
  DecayEntryKvf(std::string name, std::initializer_list<int> types, const char* helpPage, CYbSEKvfBase* parent);

  bool IsUsed() const { return isUsed_; }
  void OnMasterChanged(CTvnDependentListBase* list, int number) override;

 protected:
  void ExchangeState(KeyExchange& keys) override;

 private:
  std::vector<int> types_;
  bool isUsed_ = true;
};

// ---- Over ground

class CDecayProcessesItem : public DecayEntryKvf {
 public:
  CDecayProcessesItem(std::string name, CYbSEKvfBase* parent);
};

class CDecayProcessesKvf : public EntriesKvf<CDecayProcessesItem, CDecayListBase> {
 public:
  explicit CDecayProcessesKvf(CYbSEKvfBase* parent);
};

// ---- In the soil

class CDecayProcessChildKvf : public DecayEntryKvf {
 public:
  CDecayProcessChildKvf(std::string name, CYbSEKvfBase* parent);
};

class CDecayProcessListKvf : public EntriesKvf<CDecayProcessChildKvf, CDecayListBase> {
 public:
  explicit CDecayProcessListKvf(CYbSEKvfBase* parent);
};

// ---- In a water quality layer

class CWQLayerDecayProcessItemKvf : public DecayEntryKvf {
 public:
  CWQLayerDecayProcessItemKvf(std::string name, CYbSEKvfBase* parent);

  /// Judges the half lives.
  int ValidateData() override;
};

class CWQLayerDecayProcessesKvf : public EntriesKvf<CWQLayerDecayProcessItemKvf, CDecayListBase> {
 public:
  explicit CWQLayerDecayProcessesKvf(CYbSEKvfBase* parent);
};

}  // namespace tervane
