// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "core/node.h"
#include "simspec/model_components.h"

namespace tervane {

/// The root of the simulation specification; its own key is the engine.
class CBasicParaKvf : public CTvnKvfBase {
 public:
  explicit CBasicParaKvf(CYbSEKvfBase* parent);

  int ModelType = 0;  ///< One of `Engine`.
  int UsesExtraParams = 1;

  void ReadData(KvfNode* section) override;
  /// The engine shows with the components below.
  int AddToOverview(std::vector<OverviewLine>& /*lines*/, int /*level*/) override { return 1; }

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys("ModelType", ModelType).OneOf(kEngines); }
};
inline constexpr ImportantName<CBasicParaKvf> kBasicParameters{"BASICPARAMETERS"};

}  // namespace tervane
