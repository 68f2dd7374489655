// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// When a Modflow engine writes output, which of its packages write, and in which form.
#pragma once

#include <string>
#include <string_view>

#include "core/list.h"
#include "platform/dates.h"

namespace tervane {

/// What the output asks of the node "SATZONE".
class WellChoice {
 public:
  virtual ~WellChoice() = default;
  /// Whether wells are included.
  virtual const int& GetWells() const = 0;
};
inline constexpr ImportantName<WellChoice> kWellChoice{"SATZONE"};

/// A list of the output: its own count key decides, and a section without that key has no items.
template <class Item>
class ModflowOutputListKvf : public CYbSEKvfListBase<Item> {
 public:
  using CYbSEKvfListBase<Item>::CYbSEKvfListBase;

  void ReadData(KvfNode* section) override {
    if (!kvfKeywordByNameNum(section, kCountKey, 1)) this->SetItemCount(0, 1);
    CYbSEKvfListBase<Item>::ReadData(section);
  }

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys.Count(kCountKey, *this); }

 private:
  static constexpr std::string_view kCountKey = "NumberOfItems";
};

/// A date at which output is written; a new one is the end of the simulation.
class COutputModDateItemKvf : public CTvnKvfBase {
 public:
  explicit COutputModDateItemKvf(CYbSEKvfBase* list);

  CYbDateTime Date;

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys("Date", Date); }
};

class COutputModDatesListKvf : public ModflowOutputListKvf<COutputModDateItemKvf> {
 public:
  explicit COutputModDatesListKvf(CYbSEKvfBase* parent);

  int ValidateData() override;
};

/// A time step at which output is written.
class COutputModTimestepItemKvf : public CTvnKvfBase {
 public:
  explicit COutputModTimestepItemKvf(CYbSEKvfBase* list) : CTvnKvfBase("OutputTimestep", "OutputTimestep_%d", list) {}

  int StressPeriod = 1;
  float Timestep = 1;  ///< Within the period.

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

class COutputModTimestepListKvf : public ModflowOutputListKvf<COutputModTimestepItemKvf> {
 public:
  explicit COutputModTimestepListKvf(CYbSEKvfBase* parent);
};

/// What of a package is written.
class COutputModPackageItemKvf : public CTvnKvfBase {
 public:
  explicit COutputModPackageItemKvf(CYbSEKvfBase* list);

  std::string DataTypeID;  ///< The package's name for the engine.
  int ASCII = 0;
  int Binary = 0;

  // By the place in the list, whatever a file calls the package.
  std::string_view DisplayName() const;
  bool OffersAscii() const;
  bool OffersBinary() const;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// The packages; a new list has all that there are.
class COutputModPackageListKvf : public ModflowOutputListKvf<COutputModPackageItemKvf> {
 public:
  explicit COutputModPackageListKvf(CYbSEKvfBase* parent);
};

class COutputModKvf : public CTvnKvfBase {
 public:
  explicit COutputModKvf(CYbSEKvfBase* parent);

  enum OutputControl : int { kEquidistant = 0, kEveryNthTimeStep = 1, kSpecified = 2 };

  int OutputControlOption = kEquidistant;
  int StoringTimeStep = 10;  ///< Every how many time steps.
  float StoringTimeStepHours = 24;
  int ModPath = 0;  ///< Whether particles are to be tracked later.

  COutputModDatesListKvf& Dates() const { return *dates_; }
  COutputModTimestepListKvf& TimeSteps() const { return *timeSteps_; }
  COutputModPackageListKvf& Packages() const { return *packages_; }

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  COutputModDatesListKvf* dates_;
  COutputModTimestepListKvf* timeSteps_;
  COutputModPackageListKvf* packages_;
};

}  // namespace tervane
