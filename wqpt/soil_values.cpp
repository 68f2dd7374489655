// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "wqpt/soil_values.h"

namespace tervane {

SoilValuesKvf::SoilValuesKvf(const SoilValueKind& kind, CYbSEKvfBase* parent)
    : CUnSatInitConditionLayerListKvf(kind.title, kind.section, parent), kind_(kind) {
  SetClassName(kind.className);
  SetAbbreviatedTitle(kind.shortTitle);
  Distribution_UniformValue = kind.uniformValue;
}

int SoilValuesKvf::ValidateData() {
  const int isValid = CUnSatInitConditionLayerListKvf::ValidateData();
  const double value = Distribution_UniformValue;
  if (*kind_.outside == '\0' || value > 0 || (kind_.mayBeZero && value == 0)) return isValid;
  AddError(kind_.outside, "Distribution_UniformValue");
  return 0;
}

}  // namespace tervane
