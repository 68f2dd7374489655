// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "core/node.h"

namespace tervane {

/// What a plain run does. The node has no page: the menu shows it.
class CExecuteEngineFlagsKvf : public CTvnKvfBase {
 public:
  explicit CExecuteEngineFlagsKvf(CYbSEKvfBase* parent)
      : CTvnKvfBase("ExecuteEngineFlagsKvf", "ExecuteEngineFlagsKvf", parent) {}

  int PP = 1;  ///< Preprocessor.
  int WM = 1;  ///< Water movement.
  int WQ = 0;  ///< Water quality; written as 0 while the components have none.

  int IsDlgUsedInSetup() override { return 0; }

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
  void ExchangeState(KeyExchange& keys) override {
    CTvnKvfBase::ExchangeState(keys);
    keys("own water quality flag", WQ);
  }
};
inline constexpr ImportantName<CExecuteEngineFlagsKvf> kExecuteFlags{"EXECUTE_ENGINE_FLAGS"};

}  // namespace tervane
