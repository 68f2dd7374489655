// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "core/node.h"

namespace tervane {

/// Settings of the editor's views that are stored with the setup; the zoom areas themselves are the root's.
class CViewSettingsKvf : public CTvnKvfBase {
 public:
  explicit CViewSettingsKvf(CYbSEKvfBase* parent) : CTvnKvfBase("ViewSettings", "ViewSettings", parent) {}

  int ShowValidationIcons = 1;  ///< Marks of invalid nodes are shown in the trees.

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};
inline constexpr ImportantName<CViewSettingsKvf> kViewSettings{"VIEWSETTINGS"};

}  // namespace tervane
