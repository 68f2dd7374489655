// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "forms/page.h"
#include "forms/plots.h"
#include "forms/table_of.h"
#include "spatial/domain_cells.h"
#include "spatial/zones.h"

namespace tervane {

/// A table of zones with the area and share of the model domain that each covers, for people to read and copy. What
/// takes long is awaited by the map of its page.
class ZoneAreaTable {
 public:
  explicit ZoneAreaTable(const CodedZonesKvf& zones) : zones_(zones) {}

  void Describe(PageForm& form, const CYbSEDlgBase& page);
  /// Brings the rows in step with the zones and their file; true when they are others than before.
  bool Follow(Awaited& awaited);

 private:
  struct Row {
    std::string name, id;
    double area = 0;   ///< Square kilometres.
    double share = 0;  ///< Percent of the domain.

    bool operator==(const Row&) const = default;
  };
  std::vector<Row> RowsOf(const ZoneAreas& areas) const;

  const CodedZonesKvf& zones_;
  std::vector<Row> rows_;
  std::string remark_;  ///< On cells without a zone, or why nothing is known.
  DomainSource domain_;
  GridSource source_;
  std::shared_ptr<Computed<ZoneAreas>> computation_;
};

}  // namespace tervane
