// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The layers of the saturated zone that have coefficients of transfer, decay and sorption of their own.
#pragma once

#include "core/named_item.h"

namespace tervane {

/// A layer, down to its lower level.
class CWQLayerItemKvf : public NamedItemKvf {
 public:
  explicit CWQLayerItemKvf(CYbSEKvfBase* parent);
};

/// The layers, from the top down.
class CWQLayerListKvf : public NamedListKvf<CWQLayerItemKvf> {
 public:
  explicit CWQLayerListKvf(CYbSEKvfBase* parent);

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys.Count("NumberOfWQLayers", *this); }
  /// A layer of the user's is complete at once.
  void BeginItem(int number) override;
};
inline constexpr ImportantName<CWQLayerListKvf> kWaterQualityLayers{"WATERQUALITYLAYERS"};

}  // namespace tervane
