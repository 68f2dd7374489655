// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Where mass of species enters the model: with precipitation, on the ground, in the soil, in the ground.
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "core/list.h"
#include "core/mends.h"
#include "spatial/stations.h"
#include "wqpt/extent.h"

namespace tervane {

/// A kind of source: one code whatever the location, which another list offers for each.
struct SourceType {
  int code;
  std::string_view text;
  int location;
  std::vector<int> itemTypes;  ///< Of its strength.
  std::vector<int> valueTypes;
};
/// In the order in which each location offers them.
const std::vector<SourceType>& SourceTypes();

/// The strength of a source over time. What it is a quantity of follows the type of the source.
class CStrengthWQKvf : public C2DStationBasedDataKvf {
 public:
  explicit CStrengthWQKvf(CYbSEKvfBase* parent);
};

/// A source.
class CSourceWQItemKvf : public CYbSEKvfGroupBase, public OffersMends {
 public:
  explicit CSourceWQItemKvf(CYbSEKvfBase* parent);

  enum SourceLocation : int { kSurface = 0, kSubsurface = 1 };

  std::string SourceName = "Source";
  std::string Species = "Specie";  ///< By name; it may be gone.
  int Location = kSurface;
  int Type = 0;  ///< `SourceType`: a code of `SourceTypes`; a file may hold another one.
  int ExtentType = kPartDomain;

  /// Stores the code; the strength follows.
  void SetSourceType(int code);
  /// Gives the strength the quantities of the source's type. A type that is none leaves it as it is.
  void UpdateStrength();
  CStrengthWQKvf& Strength() const { return *strength_; }

  const std::string& GetTitle() const override;
  const std::string& GetAbbreviatedTitle() const override { return SourceName; }
  void SetAbbreviatedTitle(std::string title) override { SourceName = std::move(title); }
  void ReadData(KvfNode* section) override;
  /// Warnings alone: a type that is none or of the other location, a species that is gone.
  int ValidateData() override;
  /// The species that a source may be of, and the types of its location.
  std::vector<Mend> MendsOf(const Finding& finding) const override;
  void TakeMend(const Mend& mend) override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
  void ExchangeState(KeyExchange& keys) override;

 private:
  CStrengthWQKvf* strength_ = nullptr;
};

/// The sources, "SOURCES".
class CSourcesWQListKvf : public CYbSEKvfListBase<CSourceWQItemKvf>, public CYbSEItemNameSource {
 public:
  explicit CSourcesWQListKvf(CYbSEKvfBase* parent);

  std::string GetItemName(int number) const override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys.Count("NumberOfSources", *this); }
  /// A new source is of the first species, unless that has no defined phase.
  void BeginItem(int number) override;
};
inline constexpr ImportantName<CSourcesWQListKvf> kSources{"SOURCES"};

}  // namespace tervane
