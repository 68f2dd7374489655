// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Quantities of the soil: uniform, given layer by layer, or a grid of three dimensions.
#pragma once

#include "core/list.h"
#include "core/named_item.h"
#include "spatial/data2d.h"

namespace tervane {

class CUnSatInitConditionLayerListKvf;

/// The values of a layer of the soil. Its title is made of those of the list and of the layer, its quantity is the
/// list's.
class CUnSatInitConLayerSubKvf : public CData2DKvf {
 public:
  CUnSatInitConLayerSubKvf(const CUnSatInitConditionLayerListKvf& list, CYbSEKvfBase* parent);

  const std::string& GetTitle() const override;
  int GetItemType() const override;

 private:
  const CUnSatInitConditionLayerListKvf& list_;
  mutable std::string shownTitle_;
};

/// A layer, down to its lower level.
class CUnSatInitConditionLayerItemKvf : public NamedItemKvf {
 public:
  CUnSatInitConditionLayerItemKvf(const CUnSatInitConditionLayerListKvf& list, CYbSEKvfBase* parent);
};

/// A quantity of the soil, layer by layer. What it is a quantity of is told by the class that derives from it.
class CUnSatInitConditionLayerListKvf : public CYbSEKvfAbstractListBase<CUnSatInitConditionLayerItemKvf> {
 public:
  CUnSatInitConditionLayerListKvf(std::string title, std::string section, CYbSEKvfBase* parent);

  enum Distribution : int { kUniform = 0, kByLayers = 1, kFullyDistributed = 2 };

  int DistributionType = kUniform;
  double Distribution_UniformValue = 0;

  /// The quantity.
  virtual int GetItemType() const = 0;
  /// Whether pages offer a grid of three dimensions.
  bool MayBeFullyDistributed() const;
  CUZData3DNdsFile& GridFile() const { return *gridFile_; }

  std::unique_ptr<CUnSatInitConditionLayerItemKvf> NewItem() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  CUZData3DNdsFile* gridFile_;
};

}  // namespace tervane
