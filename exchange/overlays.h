// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "core/node.h"
#include "exchange/pages.h"

namespace tervane {

/// The backdrop of all maps and the area that they show.
class COverlaysKvf : public CTvnKvfGroupBase {
 public:
  explicit COverlaysKvf(CYbSEKvfBase* parent) : CTvnKvfGroupBase("Display", "Overlays", parent) {
    SetPage(kDisplayPage);
  }

  int UseModelDomain = 1;  ///< The maps show the model domain.

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys("UseModelDomain", UseModelDomain); }
};

}  // namespace tervane
