// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The choice of a vegetation in a library of vegetations.
#pragma once

#include <string>
#include <vector>

#include "core/condition.h"
#include "core/node.h"
#include "libraries/vegetations.h"

namespace tervane {

/// A vegetation property file and the vegetation that is chosen in it.
class CTvnVegPropFile : public CTvnKvfBase {
 public:
  explicit CTvnVegPropFile(CYbSEKvfBase* parent) : CTvnKvfBase("Vegetation property file", "VEG_PROP_FILE", parent) {}

  FileName File;
  std::vector<std::string> VegetationNames{std::string()};  ///< The first counts.

  std::string VegetationName() const { return VegetationNames.empty() ? std::string() : VegetationNames.front(); }
  /// Keeps the names behind the first.
  void SetVegetationName(std::string name);
  void Choose(FileName file, std::string vegetation);

  /// The owner's rule, asked whenever it matters.
  void UsedWhen(Condition rule) { usedWhen_ = std::move(rule); }
  bool IsFileUsed() const { return usedWhen_.Holds(*this); }

  /// The stages of the vegetation in time order; none where there is no such file or vegetation.
  CTvnVegPropStageDataList Stages() const;
  /// Tells why there is no such file or vegetation, while it is used.
  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  Condition usedWhen_;
};

}  // namespace tervane
