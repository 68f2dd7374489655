// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/view_settings.h"

#include <string>

namespace tervane {

namespace {

/// True when an area was read: the flag of the file says that it is defined. Otherwise the four keys are skipped.
bool ExchangeArea(KeyExchange& keys, const std::string& name, DataArea& area) {
  int undefined = keys.IsReading() ? 1 : area.IsUndefined();
  keys(name + "Undefined", undefined);
  // The zeros of an undefined area may bear a sign, which reading would lose: they are written without.
  DataArea inFile = keys.IsReading() || undefined != 0 ? DataArea() : area;
  keys(name + "_X0", inFile.x0);
  keys(name + "_Y0", inFile.y0);
  keys(name + "_X1", inFile.x1);
  keys(name + "_Y1", inFile.y1);
  if (!keys.IsReading() || undefined != 0) return false;
  area = inFile;
  return true;
}

}  // namespace

void CViewSettingsKvf::ExchangeKeys(KeyExchange& keys) {
  keys("ShowValidationIcons", ShowValidationIcons);
  auto* root = dynamic_cast<CTvnKvfGlobalBase*>(GetRoot());
  DataArea defaultArea = root ? root->GetDefaultDataArea() : DataArea();
  if (ExchangeArea(keys, "DefaultZoomDataArea", defaultArea) && root) root->SetDefaultDataArea(defaultArea);
  DataArea maxArea = root ? root->GetMaxDataArea() : DataArea();
  if (ExchangeArea(keys, "MaxZoomDataArea", maxArea) && root) root->SetMaxDataArea(maxArea);
}

}  // namespace tervane
