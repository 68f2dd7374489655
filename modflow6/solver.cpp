// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <algorithm>

#include <fmt/format.h>

#include "modflow6/building.h"
#include "simspec/basic_parameters.h"
#include "simspec/modflow_solvers.h"
#include "subsurface/saturated_zone.h"

namespace tervane::modflow6 {

namespace {

/// How IMS names what a solver tells.
std::string PrintingOf(int output) {
  return output == kNoSolverOutput ? "NONE" : output == kConvergence ? "SUMMARY" : "ALL";
}

template <class Node>
const Node& SolverIn(const CYbSEKvfBase& control) {
  return *control.Child<Node>();
}

}  // namespace

bool BuildSolver(Building& building) {
  const auto* control = building.root.Important(kBasicParameters)->Child<CCompControlParaModKvf>();
  Solver& solver = building.model.solver;
  const CYbSEKvfBase* used = nullptr;
  std::string left;
  switch (control->SolverOption) {
    case kSolverPCG2: {
      const auto& pcg = SolverIn<CCompControlParaModPCG2Kvf>(*control);
      used = &pcg;
      solver.outerIterations = pcg.MXITER;
      solver.innerIterations = pcg.ITER1;
      solver.headChange = static_cast<double>(pcg.HCLOSE);
      solver.residual = static_cast<double>(pcg.RCLOSE);
      // IMS takes no more than 1.
      solver.relaxation = std::clamp(static_cast<double>(pcg.RELAX), 0.0, 1.0);
      solver.printing = PrintingOf(pcg.MUTPCG);
      left = "DAMP";
      break;
    }
    case kSolverPCG4: {
      const auto& pcg = SolverIn<CCompControlParaModPCG4Kvf>(*control);
      used = &pcg;
      solver.outerIterations = pcg.MXITER;
      solver.innerIterations = pcg.ITERI;
      solver.headChange = static_cast<double>(pcg.HCLOSE);
      solver.isNewton |= pcg.UseNewtonRaphson != 0;
      solver.printing = PrintingOf(pcg.OutputFromSolver);
      left = "BFACT, RESRED, MNORTH, ApplyDampening";
      break;
    }
    case kSolverSIP: {
      const auto& sip = SolverIn<CCompControlParaModSIPKvf>(*control);
      used = &sip;
      solver.outerIterations = sip.MXITER;
      solver.headChange = static_cast<double>(sip.HCLOSE);
      left = "NPARM, ACCL, WSEED";
      break;
    }
    case kSolverLMG: {
      const auto& lmg = SolverIn<CCompControlParaModLMGKvf>(*control);
      used = &lmg;
      solver.outerIterations = lmg.MXITER;
      solver.innerIterations = lmg.MXCYC;
      left = "BCLOSE, DAMP, DUP, DLOW, storages";
      break;
    }
    default: {
      const auto& sor = SolverIn<CCompControlParaModSORKvf>(*control);
      used = &sor;
      solver.outerIterations = sor.MXITER;
      solver.headChange = static_cast<double>(sor.HCLOSE);
      left = "ACCL";
    }
  }
  solver.outerIterations = std::max(1, solver.outerIterations);
  solver.innerIterations = std::max(1, solver.innerIterations);
  building.Tell(
      Fate::Changed, *control,
      fmt::format("IMS takes the place of {}, with its iterations and criteria, without {}", used->GetTitle(), left));
  if (solver.isNewton && building.model.rewetting) {
    building.model.rewetting.reset();
    building.Tell(Fate::LeftOut, building.zone, "with Newton-Raphson no cell falls dry: NPF rewets none", "Threshold");
  }
  if (auto* packages = building.root.Important(kBasicParameters)->Child<CCompControlParaModPackageKvf>();
      packages && packages->IsDataUsedInSetup() != 0) {
    if (building.model.rewetting) building.Tell(Fate::Carried, *packages, "NPF rewets with that factor", "HDRY2");
    building.Tell(Fate::LeftOut, *packages, "dry cells get the head 1e30", "HDRY");
  }
  return true;
}

}  // namespace tervane::modflow6
