// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "execution/execute_flags.h"

#include "simspec/model_components.h"

namespace tervane {

void CExecuteEngineFlagsKvf::ExchangeKeys(KeyExchange& keys) {
  keys("PP", PP);
  keys("WM", WM);
  // The held flag comes back when the component does.
  keys.Custom(
      "WQ", [&] { return ModelCompOf(*this).WQ ? WQ : 0; }, [&](int flag) { WQ = flag; });
}

}  // namespace tervane
