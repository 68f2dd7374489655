// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "simspec/conditions.h"

#include "simspec/basic_parameters.h"

namespace tervane {

namespace {

const CModelCompKvf* Components(const CYbSEKvfBase& node) { return &ModelCompOf(node); }
const CModModelCompKvf* ModflowComponents(const CYbSEKvfBase& node) { return &ModModelCompOf(node); }
const CModelCompWQKvf* WaterQuality(const CYbSEKvfBase& node) { return node.Important(kWaterQualityComponents); }

}  // namespace

Condition WithEngine(std::vector<int> engines) {
  return Condition::OfKey(
      [](const CYbSEKvfBase& node) {
        const auto* basics = node.Important(kBasicParameters);
        return basics ? Condition::KeyOfNode{basics, &basics->ModelType, basics->ModelType}
                      : Condition::KeyOfNode{nullptr, nullptr, kEngineTervane};
      },
      std::move(engines), false);
}

Condition OwnEngine() { return WithEngine({kEngineTervane}); }

Condition AnyModflow() { return WithEngine({kEngineModflowSurfact, kEngineModflow96, kEngineModflow2000}); }

Condition Component(int CModelCompKvf::*flag) { return On<CModelCompKvf>(Components, flag); }

Condition Method(int CModelCompKvf::*method, int value) { return Is<CModelCompKvf>(Components, method, {value}); }

Condition ModflowComponent(int CModModelCompKvf::*flag) { return On<CModModelCompKvf>(ModflowComponents, flag); }

Condition ModflowMethod(int CModModelCompKvf::*method, int value) {
  return Is<CModModelCompKvf>(ModflowComponents, method, {value});
}

Condition WaterQualityComponent(int CModelCompWQKvf::*flag) { return On<CModelCompWQKvf>(WaterQuality, flag); }

Condition WaterQualityProcesses(int processType) {
  return Component(&CModelCompKvf::WQ) && WaterQualityComponent(&CModelCompWQKvf::IncludeProcesses) &&
         Is<CModelCompWQKvf>(WaterQuality, &CModelCompWQKvf::ProcessType, {processType});
}

}  // namespace tervane
