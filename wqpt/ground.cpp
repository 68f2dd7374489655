// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "wqpt/ground.h"

namespace tervane {

namespace {

/// A key that a narrow class of another node gives.
template <class Asked>
Condition KeyOf(ImportantName<Asked> name, const int& (Asked::*get)() const, std::vector<int> values, bool isFlag) {
  return Condition::OfKey(
      [name, get](const CYbSEKvfBase& node) -> Condition::KeyOfNode {
        const auto* asked = node.Important(name);
        if (!asked) return {};
        const int& value = (asked->*get)();
        return {dynamic_cast<const CYbSEKvfBase*>(asked), &value, value};
      },
      std::move(values), isFlag);
}

}  // namespace

Condition FullMacroporeFlow() {
  constexpr int kFull = 2;
  return KeyOf(kMacropores, &MacroporeChoice::GetBypass, {kFull}, false);
}

Condition ImmobileWaterModelled() {
  return KeyOf(kImmobileWater, &ImmobileWaterChoice::GetMassTransferToImmobileWater, {}, true);
}

}  // namespace tervane
