// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The sequence of crops that grow one after another.
#pragma once

#include <memory>

#include "core/list.h"
#include "surface/crop_calendar.h"
#include "surface/crop_course.h"
#include "surface/vegetation_file.h"

namespace tervane {

/// A crop: a vegetation of a library, and when it begins.
class CVegetationItemKvf : public CYbSEKvfBase {
 public:
  /// Begins with the simulation. `isUsed` says whether the sequence is in force.
  CVegetationItemKvf(const Condition& isUsed, CYbSEKvfBase* parent);

  CYbDateTime StartDate;  ///< At midnight.

  CTvnVegPropFile& VegPropFile() const { return *file_; }
  /// From the start of the crop to its last stage; 0 without stages.
  CYbDateTimeSpan Length() const;
  /// The end of the crop when it grows to its last stage; without stages its start. Not valid where the start is not,
  /// and never behind the last date that there is.
  CYbDateTime GetEndDate() const;
  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  CTvnVegPropFile* file_;
};

/// The date without its time; a date that is none stays as it is.
inline CYbDateTime Midnight(const CYbDateTime& date) { return {date.Year(), date.Month(), date.Day()}; }

/// The sequence, and how it is recycled.
class CVegetationListKvf : public CYbSEKvfAbstractListBase<CVegetationItemKvf> {
 public:
  CVegetationListKvf(Condition isUsed, CYbSEKvfBase* parent);

  int RecycleMode = kNoRecycling;

  std::unique_ptr<CVegetationItemKvf> NewItem() override;
  /// The crops up to the end of the simulation, as of the latest validation.
  CropCalendar BuildVegCalendar() const;
  /// What the crops come to over the simulation.
  CropDevelopment Development() const;
  /// Warns of a calendar that is cut.
  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  Condition isUsed_;
};

}  // namespace tervane
