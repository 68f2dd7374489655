// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Values of species and processes over the area of a water quality layer.
#pragma once

#include "spatial/geo_data.h"

namespace tervane {

/// A value that its parent judges: `Judge` there.
class CWQLayerData2DKVF : public JudgedData2DKvf {
 public:
  using JudgedData2DKvf::JudgedData2DKvf;

  /// Leaves a text where the value takes part and its uniform value is below what is valid; false then.
  bool Judge(bool mayBeZero);
};

/// Judges all values of an entry.
bool JudgeLayerValues(const CYbSEKvfBase& entry, bool mayBeZero);

}  // namespace tervane
