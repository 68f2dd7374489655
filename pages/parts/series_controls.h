// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <string>
#include <vector>

#include "forms/page.h"
#include "spatial/file_nodes.h"

namespace tervane {

/// What a first file of a series begins with: one value, of one of these quantities. Without value types all are
/// offered.
struct FirstSeries {
  const float& value;
  std::vector<int> itemTypes = {};
  std::vector<int> valueTypes = {};
  const char* quantity = "";                           ///< Where the page has several: told in the title of the file.
  std::function<std::vector<int>()> itemTypesBy = {};  ///< Asked instead, where other values decide them.
};

/// The controls of a file of a series: the file, and buttons that show it and make a first one.
void DescribeSeriesFile(PageForm& form, const CYbSEDlgBase& page, const std::string& label, CFMData0DFile& file,
                        FirstSeries first, const Condition& isShown);

}  // namespace tervane
