// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Jobs that take particles out of the results of a run, for a program that runs afterwards: over registrations, and
// over whole pathlines.
#pragma once

#include <string>
#include <vector>

#include "core/list.h"
#include "platform/dates.h"

namespace tervane {

/// A job of either kind.
class ExtractionItemKvf : public CYbSEKvfGroupBase {
 public:
  explicit ExtractionItemKvf(std::string title, CYbSEKvfBase* parent);

  std::string Name;
  std::string Comment;

  const std::string& GetTitle() const override { return Name.empty() ? CYbSEKvfGroupBase::GetTitle() : Name; }
  const std::string& GetAbbreviatedTitle() const override { return Name; }
  void SetAbbreviatedTitle(std::string title) override { Name = std::move(title); }

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// The jobs of one kind. New ones get names by a counter of the process, which begins anew with each new list.
template <class Item>
class ExtractionListKvf : public CYbSEKvfListBase<Item> {
 public:
  ExtractionListKvf(std::string title, std::string section, CYbSEKvfBase* parent)
      : CYbSEKvfListBase<Item>(std::move(title), std::move(section), parent) {
    counter_ = 0;
  }

 private:
  /// One pass over all rows but the last; a name that was passed is not looked at again.
  void BeginItem(int number) override {
    ++counter_;
    for (int row = 1; row < this->GetItemCount(); ++row)
      if (this->GetItem(row)->Name == kBase + std::to_string(counter_)) ++counter_;
    this->GetItem(number)->Name = kBase + std::to_string(counter_);
  }

  static inline const std::string kBase = "Extraction_";
  static inline int counter_ = 0;
};

/// Particles that were registered. Flags are 0 or 1.
class CResultsPTRegExtractionItemKvf : public ExtractionItemKvf {
 public:
  /// Begins with all layers and all dates of the setup as it is.
  explicit CResultsPTRegExtractionItemKvf(CYbSEKvfBase* parent);

  int SeparateFilesCheck = 1;
  int SepatateLayerFilesCheck = 0;
  int AdditionalTextFile = 0;
  int AllLayerExtractionCheck = 1;
  int TopLayer = 1;
  int BottomLayer = 0;
  int AllRelDateExtractionCheck = 1;
  int AllTrvTimesExtrCheck = 1;
  CYbDateTime StartDate, EndDate;    ///< Of release.
  float StartYear = 0, EndYear = 0;  ///< Of travel times.
  int OnlyRemovedByWellCheck = 0;
  int ExtrByWellCheck = 0, ExtrAllWellsCheck = 1;
  int ExtrBySinkCodeCheck = 0, ExtrAllSinkCodesCheck = 1;
  int ExtrByWellFieldCheck = 0, ExtrAllWellFieldsCheck = 1;
  int ExtrByRegCodeCheck = 0, ExtrAllRegCodesCheck = 1;

  std::vector<std::string> WellNames, WellFieldNames;
  std::vector<int> RegCodes;
  std::vector<int> SinkCodes;  ///< Values of `kSinkCodes`.

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};
/// Where particles end.
inline constexpr KeyChoice kSinkCodes[] = {
    {0, "River"},          {1, "Drain to River"},  {2, "Drain to Boundary"}, {3, "Removed by Well"},
    {4, "Exchange to UZ"}, {5, "Fixed conc Cell"}, {6, "Fixed conc Source"}};

class CResultsPTRegExtractionKvf : public ExtractionListKvf<CResultsPTRegExtractionItemKvf> {
 public:
  explicit CResultsPTRegExtractionKvf(CYbSEKvfBase* parent);
};

/// Whole pathlines. Flags are 0 or 1.
class CResultsPTPathlineExtractionItemKvf : public ExtractionItemKvf {
 public:
  explicit CResultsPTPathlineExtractionItemKvf(CYbSEKvfBase* parent);

  int CreateTextFile = 1;
  int CreateXMLFile = 1;
  int CompressedXMLFormat = 1;
  int ExtrAllParticlesCheck = 0;
  std::vector<int> ParticleIDs;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

class CResultsPTPathlineExtractionKvf : public ExtractionListKvf<CResultsPTPathlineExtractionItemKvf> {
 public:
  explicit CResultsPTPathlineExtractionKvf(CYbSEKvfBase* parent);

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

}  // namespace tervane
