// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "simspec/basic_parameters.h"

#include "simspec/air_flow.h"
#include "simspec/control_parameters.h"
#include "simspec/model_components.h"
#include "simspec/modflow_solvers.h"
#include "simspec/pages.h"
#include "simspec/periods.h"
#include "simspec/stress_periods.h"
#include "simspec/time_step_control.h"
#include "simspec/titles.h"

namespace tervane {

CBasicParaKvf::CBasicParaKvf(CYbSEKvfBase* parent) : CTvnKvfBase("Simulation specification", "SimSpec", parent) {
  SetPage(kBasicParaPage);
  // Its children ask for the engine while they are made.
  if (GetRoot()) GetRoot()->RegisterImportantNode(this, kBasicParameters.text);
  NewImportantChild<CModelCompKvf>(kModelComponents);
  NewImportantChild<CModModelCompKvf>(kModflowComponents);
  NewChild<CSimTitleKvf>();
  NewImportantChild<CSimPeriodKvf>(kSimulationPeriod);
  NewImportantChild<CStressPeriodsKvf>(kStressPeriods);
  NewChild<CCompControlParaTimeStepKvf>();
  NewImportantChild<CCompControlParaOLKvf>(kOverlandControl);
  NewChild<CCompControlParaUZKvf>();
  NewChild<CCompControlParaSZKvf>();
  NewChild<CCompControlParaModPackageKvf>();
  NewChild<CAirFlowModKvf>();
  NewChild<CCompControlParaModKvf>();
}

void CBasicParaKvf::ReadData(KvfNode* section) {
  CTvnKvfBase::ReadData(section);
  // In files of version 1 the storing of results lies inside this section.
  if (GetRoot()->ReadDocVersion() == 1)
    if (CYbSEKvfBase* storing = GetRoot()->GetImportantNode("STORINGRESULTS")) storing->Load(section);
}

}  // namespace tervane
