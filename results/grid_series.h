// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The types that a simulation stores on grids. The nodes are the types that the user has ticked; what there is to tick
// follows from the setup and the catalogue whenever it is asked.
#pragma once

#include <string>
#include <vector>

#include "core/list.h"
#include "results/result_types.h"

namespace tervane {

class CStoringResultsKvf;

/// A type that the user has ticked.
class COutputGridSeriesItemKvf : public CTvnKvfBase {
 public:
  explicit COutputGridSeriesItemKvf(CYbSEKvfBase* list) : CTvnKvfBase("OutputGridSeriesItem", "Item_%d", list) {}

  int DataType = 0;  ///< A code of the catalogue.

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys("DataType", DataType).Label("Type"); }
};

/// A type that the setup can store.
struct GridSeriesRow {
  const ResultDataType* type = nullptr;
  bool isTicked = false;
  /// "Water Balance, WQ Input"; engines store such a type whether it is ticked or not. Empty where nothing needs it.
  std::string requiredFor = {};
  std::string fileName = {};  ///< Of a run that has been done; empty without one.

  bool IsStored() const { return isTicked || !requiredFor.empty(); }
  bool operator==(const GridSeriesRow&) const = default;
};

class COutputGridSeriesListKvf : public CYbSEKvfListBase<COutputGridSeriesItemKvf> {
 public:
  explicit COutputGridSeriesListKvf(CYbSEKvfBase* storing);

  /// The features of the setup as result types know them; those of water quality are not among them.
  RequirementMask BuildResultMask(bool forTimeSeries) const;

  /// The path of the index that engines leave beside their results.
  void SetIndexPath(std::string path) { indexPath_ = std::move(path); }
  /// What there is to tick, in the order of the catalogue.
  std::vector<GridSeriesRow> Rows() const;
  /// Brings the items in step with the setup: ticks of types that it cannot store go, the others stand in the order of
  /// the catalogue. True when that changed anything.
  bool RefreshItems();
  void SetTicked(int dataType, bool isTicked);
  bool IsTicked(int dataType) const;

  /// What series at points may be of: "61\tdepth of overland water\n" for each type.
  const std::string& GetChoiceText();
  std::vector<const ResultDataType*> SeriesTypes() const;

  /// Writes what a refresh would leave, and leaves the items as they are.
  void Save(KvfFile* file) override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  using Items = std::vector<std::shared_ptr<CYbSEKvfBase>>;
  /// The plain children, and of the items those that stay.
  Items RefreshedChildren() const;
  const CStoringResultsKvf& Storing() const;

  std::string indexPath_;
  std::string choiceText_;
  RequirementMask choicesAreOf_;  ///< The features of which the choice text was made.
};
inline constexpr ImportantName<COutputGridSeriesListKvf> kOutputGridSeries{"OUTPUTGRIDSERIES"};

/// What needs types of a setup beyond the ticks, as its rules are now.
class RequiredTypes {
 public:
  explicit RequiredTypes(const CStoringResultsKvf& storing);
  /// "Water Balance, WQ Input", or what of it holds.
  std::string For(const ResultDataType& type) const;

 private:
  bool IsWaterQualityInput(const ResultDataType& type) const;

  bool waterBalance_;
  bool allInput_ = false;        ///< Types that water quality reads.
  bool saturatedInput_ = false;  ///< Of those the ones of the saturated zone.
};

}  // namespace tervane
