// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What follows the sorption processes: seven coefficients of each, in the soil and in each water quality layer. The
// isotherm and the kinetics of the process tell which of them count.
#pragma once

#include "wqpt/entries.h"
#include "wqpt/processes.h"

namespace tervane {

using SorptionEntryKvf = NamedEntry<CYbSEKvfGroupBase, CSorptionProcessesItemBase>;

class CSorptionProcessesItemKvf : public SorptionEntryKvf {
 public:
  CSorptionProcessesItemKvf(std::string name, CYbSEKvfBase* parent);
};

class CSorptionProcessesKvf : public EntriesKvf<CSorptionProcessesItemKvf, CSorptionProcessesListBase> {
 public:
  explicit CSorptionProcessesKvf(CYbSEKvfBase* parent);
};

class CWQLayerSorptionProcessItemKvf : public SorptionEntryKvf {
 public:
  CWQLayerSorptionProcessItemKvf(std::string name, CYbSEKvfBase* parent);

  /// Judges the coefficients.
  int ValidateData() override;
};

class CWQLayerSorptionProcesses : public EntriesKvf<CWQLayerSorptionProcessItemKvf, CSorptionProcessesListBase> {
 public:
  explicit CWQLayerSorptionProcesses(CYbSEKvfBase* parent);
};

}  // namespace tervane
