// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "wqpt/layer_values.h"

namespace tervane {

bool CWQLayerData2DKVF::Judge(bool mayBeZero) {
  const float value = GetValidationValue();
  const bool isValid = !IsDlgUsedInSetup() || value > 0 || (mayBeZero && value == 0);
  SetValidationMessage(isValid ? "" : "Valid Range: value must be greater than 0");
  return isValid;
}

bool JudgeLayerValues(const CYbSEKvfBase& entry, bool mayBeZero) {
  bool areValid = true;
  for (CYbSEKvfBase* child = entry.GetFirstChild(); child; child = entry.GetNextChild(child))
    if (auto* value = dynamic_cast<CWQLayerData2DKVF*>(child)) areValid = value->Judge(mayBeZero) && areValid;
  return areValid;
}

}  // namespace tervane
