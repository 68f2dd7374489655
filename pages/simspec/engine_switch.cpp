// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/simspec/engine_switch.h"

#include <algorithm>

#include <fmt/format.h>

#include "core/path.h"
#include "document/key_reference.h"
#include "simspec/modflow_output.h"
#include "simspec/modflow_solvers.h"

namespace tervane {

namespace {

/// Whether the node or one below it holds a value that no new setup has.
bool HoldsOwnValues(CYbSEKvfBase& node) {
  std::vector<KeyInfo> keys;
  node.DescribeKeys(keys);
  const std::string path = PathOf(node);
  const bool differs = std::ranges::any_of(keys, [&](const KeyInfo& key) {
    const KeyInfo* declared = key.written ? KeyReference::Get().Find(path, key.key) : nullptr;
    // Dates follow the simulation, and packages are told apart by their names.
    if (!declared || key.type == "date" || key.key == "DataTypeID") return false;
    return declared->defaultValue != key.defaultValue;
  });
  if (differs) return true;
  for (CYbSEKvfBase* child = node.GetFirstChild(); child; child = node.GetNextChild(child))
    if (HoldsOwnValues(*child)) return true;
  return false;
}

/// The walk over what takes part now, asking what would with the other engine.
class Walk {
 public:
  Walk(CBasicParaKvf& basics, int engine) : basics_(basics), before_(basics.ModelType), engine_(engine) {}
  ~Walk() { basics_.ModelType = before_; }

  void Below(const CYbSEKvfBase& node, std::vector<std::string>& lines) {
    for (CYbSEKvfBase* child = node.GetFirstChild(); child; child = node.GetNextChild(child)) {
      if (!child->HoldsSetup() || !IsUsed(*child, before_)) continue;
      if (IsUsed(*child, engine_))
        Below(*child, lines);
      else if (HoldsOwnValues(*child))
        lines.push_back(NameOf(*child));
    }
  }

 private:
  bool IsUsed(CYbSEKvfBase& node, int engine) {
    // What any engine reads, whether or not its page is shown.
    if (dynamic_cast<CModModelCompKvf*>(&node)) return engine != kEngineTervane;
    basics_.ModelType = engine;
    const bool isUsed = node.IsDlgUsedInSetup() != 0;
    basics_.ModelType = before_;
    return isUsed;
  }
  std::string NameOf(const CYbSEKvfBase& node) const {
    if (dynamic_cast<const CModelCompKvf*>(&node) || dynamic_cast<const CModModelCompKvf*>(&node))
      return fmt::format("the components of {}", TextOf(kEngines, before_));
    return node.GetTitle();
  }

  CBasicParaKvf& basics_;
  const int before_, engine_;
};

/// Choices of parts that stay, which the other engine does not have.
void AddChoices(const CBasicParaKvf& basics, int engine, std::vector<std::string>& lines) {
  const int before = basics.ModelType;
  const bool staysModflow = before != kEngineTervane && engine != kEngineTervane;
  if (!staysModflow) return;
  const auto* solver = basics.Child<CCompControlParaModKvf>();
  if (solver && std::ranges::count(SolversOfEngine(before), solver->SolverOption) &&
      !std::ranges::count(SolversOfEngine(engine), solver->SolverOption))
    lines.push_back(fmt::format("the solver {}", TextOf(kModflowSolvers, solver->SolverOption)));
  if (before != kEngineModflowSurfact || engine == kEngineModflowSurfact) return;
  if (const auto* output = basics.GetRoot() ? basics.GetRoot()->Child<COutputModKvf>() : nullptr;
      output && output->OutputControlOption == COutputModKvf::kEquidistant && output->StoringTimeStepHours != 24)
    lines.push_back("output in equidistant time steps");
  const CModModelCompKvf& components = ModModelCompOf(basics);
  if (components.Recharge && components.Recharge_ModelType == kRechargeSeepageFace)
    lines.push_back(fmt::format("recharge as {}", TextOf(kRechargeMethods, kRechargeSeepageFace)));
  if (components.Subsurface && components.SubsurfaceModelType() >= kVariablySaturated)
    lines.push_back(fmt::format("{}", TextOf(kSubsurfaceMethods, components.SubsurfaceModelType())));
}

}  // namespace

std::vector<std::string> UnknownToEngine(CBasicParaKvf& basics, int engine) {
  std::vector<std::string> lines;
  // Nothing is known of an engine that is none.
  if (TextOf(kEngines, engine).empty()) return lines;
  if (basics.GetRoot()) Walk(basics, engine).Below(*basics.GetRoot(), lines);
  AddChoices(basics, engine, lines);
  return lines;
}

}  // namespace tervane
