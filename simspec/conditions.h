// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The conditions that families of nodes ask of the model components. What a setup lacks is as in a new one.
#pragma once

#include "core/condition.h"
#include "simspec/model_components.h"

namespace tervane {

/// The own engine is chosen.
Condition OwnEngine();
/// One of those engines is chosen, values of `Engine`.
Condition WithEngine(std::vector<int> engines);
/// One of the three Modflow engines is chosen.
Condition AnyModflow();

/// A component of the own engine is on, whatever the engine: `Component(&CModelCompKvf::UZ)`.
Condition Component(int CModelCompKvf::*flag);
/// A component of the own engine is modelled by that method, whatever the engine and whether it is on or not.
Condition Method(int CModelCompKvf::*method, int value);
/// The same with a Modflow engine.
Condition ModflowComponent(int CModModelCompKvf::*flag);
Condition ModflowMethod(int CModModelCompKvf::*method, int value);
/// Flow below ground is modelled with Modflow in one of those ways, values of `SubsurfaceMethod`, whatever the engine.
Condition SubsurfaceIs(std::vector<int> methods);

/// Water quality has a component.
Condition WaterQualityComponent(int CModelCompWQKvf::*flag);
/// Processes of that type are modelled in water quality, a value of `ProcessType`.
Condition WaterQualityProcesses(int processType);

/// A key of the parent, which is a `Parent`: `OnInParent(&CModelCompWQKvf::IncludeProcesses)`.
template <class Parent>
Condition OnInParent(int Parent::*flag) {
  return On<Parent>([](const CYbSEKvfBase& node) { return dynamic_cast<const Parent*>(node.GetParent()); }, flag);
}
template <class Parent>
Condition IsInParent(int Parent::*member, std::vector<int> values) {
  return Is<Parent>([](const CYbSEKvfBase& node) { return dynamic_cast<const Parent*>(node.GetParent()); }, member,
                    std::move(values));
}

}  // namespace tervane
