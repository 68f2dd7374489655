// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>

#include "forms/date_question.h"
#include "forms/page.h"
#include "forms/table_of.h"
#include "surface/crop_list.h"

namespace tervane {

/// The table of a sequence of crops, and the chart of what it comes to.
class CropControls {
 public:
  CropControls(CVegetationListKvf& crops, const CYbSEDlgBase& page);

  /// `chartLabel` stands in front of what the chart comes to in words.
  void Describe(PageForm& form, const char* chartLabel, const Condition& isShown);

 private:
  std::shared_ptr<TableOf<CVegetationItemKvf>> CVegetationGrid() const;
  void SelectVegetation(CVegetationItemKvf& crop) const;
  void MoveStart(CVegetationItemKvf& crop, const CYbDateTime& date) const;
  void AskStart();
  SeriesContent Chart() const;

  CVegetationListKvf& crops_;
  const CYbSEDlgBase& page_;
  std::shared_ptr<TableOf<CVegetationItemKvf>> table_;
  DateQuestion question_;
};

}  // namespace tervane
