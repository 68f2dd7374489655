// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/parts/zone_area_table.h"

#include <fmt/format.h>

namespace tervane {

void ZoneAreaTable::Describe(PageForm& form, const CYbSEDlgBase& page) {
  if (!zones_.HasZones()) return;
  auto table = std::make_shared<TableOf<Row>>(rows_);
  table->ShowOnly();
  table->Value("Zone", [](const Row& row) { return row.name; }).Width(140).Link([this, &page](const Row& row) {
    const CFMSEKvfGroupBase* zone = zones_.SelectZoneByName(row.id);
    if (zone && page.Context().selectNode) page.Context().selectNode(*zone);
  });
  table->Value("Code", [](const Row& row) { return row.id; }).Width(60);
  table->Value("Area", [](const Row& row) { return row.area; }).Width(80).Unit("km²").Format("%.6g");
  table->Value("Share", [](const Row& row) { return row.share; })
      .Width(70)
      .Unit("%")
      .Format("%.2f")
      .ToolTip("Of the cells of the model domain");
  form.Table(std::move(table)).ShownWhen("the areas of the zones are known", [this] { return !rows_.empty(); });
  form.Notice([this] { return remark_; });
}

std::vector<ZoneAreaTable::Row> ZoneAreaTable::RowsOf(const ZoneAreas& areas) const {
  std::vector<Row> rows;
  for (const CFMSEKvfGroupBase* zone : ZoneItems(zones_)) {
    const auto found = areas.cells.cellsOfId.find(zone->GetStationId());
    const double cells = found == areas.cells.cellsOfId.end() ? 0 : static_cast<double>(found->second);
    rows.push_back({zone->GetStationName(), zone->GetStationId(), cells * areas.cellArea / 1e6,
                    areas.allCells > 0 ? 100 * cells / static_cast<double>(areas.allCells) : 0});
  }
  return rows;
}

bool ZoneAreaTable::Follow(Awaited& awaited) {
  std::vector<Row> rows;
  std::string remark;
  const GridSource source = zones_.CurrentSource();
  const DomainSource domain = AskDomain(*zones_.GetRoot());
  // Without either file there is nothing to tell, and the page says elsewhere that one is missing.
  if (zones_.HasZones() && !source.file.empty() && !domain.file.empty()) {
    if (!computation_ || !(source == source_) || !(domain == domain_)) {
      source_ = source;
      domain_ = domain;
      computation_ = std::make_shared<Computed<ZoneAreas>>("Counting the cells of the zones",
                                                           [source, domain](ZoneAreas& areas, ProgressPart progress) {
                                                             return ComputeZoneAreas(domain, source, progress, areas);
                                                           });
    }
    if (const auto areas = NowOrAwaited(computation_, awaited)) {
      rows = RowsOf(*areas);
      if (areas->cells.withoutId > 0)
        remark = fmt::format("{} of {} cells of the model domain belong to no zone.", areas->cells.withoutId,
                             areas->allCells);
    } else if (computation_->IsDone()) {
      remark = computation_->Problem();
    } else {
      // What was shown stays until the new areas are there.
      return false;
    }
  }
  const bool isOther = rows != rows_ || remark != remark_;
  rows_ = std::move(rows);
  remark_ = std::move(remark);
  return isOther;
}

}  // namespace tervane
