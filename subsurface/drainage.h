// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Drains that take water out of the saturated zone where its head stands above their level: for the own engine one set
// of maps, for Modflow a list of named drains.
#pragma once

#include <string>

#include "core/list.h"
#include "core/named_item.h"
#include "spatial/stations.h"

namespace tervane {

/// With the own engine.
class CDrainageSZKvf : public CYbSEKvfBase {
 public:
  explicit CDrainageSZKvf(CYbSEKvfBase* parent);

  enum Option : int { kNoDrainage = 0, kDownhill = 1, kByCodes = 2, kDistributed = 3, kRemoved = 4 };

  int DrainageOption = kDownhill;

  int GetOption() const { return DrainageOption; }
  /// Also what setups written before version 8 keep in the section of the saturated zone.
  void SetOption(int option) { DrainageOption = option; }

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};
inline constexpr ImportantName<CDrainageSZKvf> kDrainage{"DRAINAGE"};

/// A drain with a Modflow engine.
class CDrainageMFSZItemKvf : public NamedItemKvf {
 public:
  explicit CDrainageMFSZItemKvf(CYbSEKvfBase* parent);

  CTimeseriesConstKvf& TimeConstant() const { return *timeConstant_; }

 private:
  CTimeseriesConstKvf* timeConstant_;
};
/// That of the drain that was made last, of those that the list has.
inline constexpr ImportantName<CTimeseriesConstKvf> kDrainTimeConstant{"DRAINAGE_TIME_CONSTANT"};

class CDrainageMFSZKvf : public CYbSEKvfListBase<CDrainageMFSZItemKvf> {
 public:
  explicit CDrainageMFSZKvf(CYbSEKvfBase* parent);

  void SetItemCount(int count, int level) override;
  void DeleteItem(int number, int level) override;
  void InsertItem(int number, int level) override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys.Count("NumberOfLayers", *this); }
  void ExchangeState(KeyExchange& keys) override;

 private:
  /// Lets the drain answer that was made last, of those that are there now.
  void LetLatestAnswer();
};
inline constexpr ImportantName<CDrainageMFSZKvf> kModflowDrains{"DRAINAGE_MODFLOW"};

}  // namespace tervane
