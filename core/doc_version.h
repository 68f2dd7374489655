// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "core/node.h"

namespace tervane {

/// Version of the document: the one that was read, which the reading rules of old files ask, and the one that is
/// written.
class CFlowModelDocVersionKvf : public CTvnKvfBase {
 public:
  static constexpr int kWrittenVersion = 14;

  explicit CFlowModelDocVersionKvf(CYbSEKvfBase* parent)
      : CTvnKvfBase("FlowModelDocVersion", "FlowModelDocVersion", parent) {}

  /// -1 for a file that holds no version, and for a new document. A later version than ours reads like ours.
  int ReadVersion = -1;

 protected:
  void ExchangeKeys(KeyExchange& keys) override {
    if (keys.IsReading())
      keys.ReadOnly("Version", ReadVersion);
    else
      keys.WriteOnly("Version", kWrittenVersion);
  }
};
inline constexpr ImportantName<CFlowModelDocVersionKvf> kDocVersion{"DOCVERSION"};

}  // namespace tervane
