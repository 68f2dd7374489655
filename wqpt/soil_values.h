// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Values of species and processes in the soil: uniform or layer by layer.
#pragma once

#include <string>
#include <string_view>

#include "spatial/soil_layers.h"

namespace tervane {

/// What makes one such value differ from the next: a constant row.
struct SoilValueKind {
  std::string_view className;
  const char* section;
  const char* title;
  const char* shortTitle;
  int itemType;
  double uniformValue = 0;  ///< The default.
  bool mayBeZero = true;
  const char* outside = "";  ///< What is said of a uniform value below what is valid.
};

class SoilValuesKvf : public CUnSatInitConditionLayerListKvf {
 public:
  /// `kind` must outlive the node.
  SoilValuesKvf(const SoilValueKind& kind, CYbSEKvfBase* parent);

  const SoilValueKind& Kind() const { return kind_; }
  int GetItemType() const override { return kind_.itemType; }
  int ValidateData() override;

 private:
  const SoilValueKind& kind_;
};

}  // namespace tervane
