// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What the pages of zones and stations have in common: the controls of the source of their areas, its map, and what
// follows when it changes.
#pragma once

#include <string>

#include "forms/page_rows.h"
#include "forms/plots.h"
#include "pages/parts/file_controls.h"
#include "pages/parts/table_of_zones.h"
#include "spatial/zones.h"

namespace tervane {

/// The filter of the grid files of most zones.
inline constexpr const char* kZoneGridFilter = "UZ soil profile distr.files (*.nds2) |*.nds2|All Files (*.*) |*.*||";

/// The words of a source's controls.
struct ZoneSourceWords {
  const char* type = "Data Type:";
  const char* grid = "Grid Distribution File:";
  const char* gridFilter = kGridFileFilter;
  const char* shape = "Shape Distribution File:";
  const char* shapeFilter = kShapeFileFilter;
  const char* shapeTitle = "";  ///< Of the dialog in which a shape file is chosen; empty for the usual one.
  const char* units = "Units of X- and Y-axises:";
  bool isEditBeside = true;        ///< The button stands beside the grid file; else it begins a row.
  bool isDomainWanted = false;     ///< An editor of the grid may ask for the domain.
  bool isTypeAlwaysShown = false;  ///< The kind of source is shown also where one zone serves the whole area.
  /// Of the cells of a new grid, by the node of the page; 1 where nothing is said.
  float (*newCode)(const CYbSEKvfBase& node) = nullptr;
};

/// The controls of the files of a source. The choice of the kind of source stands above them, told by the page.
void DescribeZoneSource(PageForm& form, const CYbSEDlgBase& page, ZoneSource& source, const ZoneSourceWords& words);

/// Brings the zones in step with their source while the user may watch, asking before work of the user's would be lost.
/// Gives the hints of what changed.
int SyncWithSource(Host& host, ZoneSource& source);
/// Looks at the files again, where they are in force; `action` is the name of that step.
void RefreshZones(const CYbSEDlgBase& page, ZoneSource& source, const std::string& action);

/// The map of the areas of a source, one of them standing out.
MapContent ZoneMap(const ZoneSource& source, const CFMSEKvfGroupBase* highlighted);
/// Lets a zone that the user points at on the map be shown.
void GoToPickedZone(MapContent& map, const CYbSEDlgBase& page, const ZoneSource& source);

/// The name of one zone.
void ZoneName(PageForm& form, const std::string& label, CodedZoneProp& zone);
/// The code or the polygon that a zone stands for. `zones` is what the areas are called; without a source neither
/// shows.
void ZoneIdentity(PageForm& form, const std::string& zones, const CodedZoneProp& zone, const ZoneSource* source,
                  const std::string& codeLabel = "Grid code value:");
/// The parent of a zone; null for one that stands elsewhere.
const CodedZonesKvf* ZonesOf(const CodedZoneProp& zone);
/// The map of all zones, this one standing out, where they are distributed.
void PlaceOfZone(PageForm& form, const CodedZoneProp& zone);

/// All controls of a parent of zones.
void DescribeZones(PageForm& form, const CYbSEDlgBase& page, CodedZonesKvf& zones, const ZoneSourceWords& words,
                   TableOfZones& areas);

/// The page of a parent of zones: `PageIs<ZonesPage<kWords>, CodedZonesKvf>(kPage)`.
template <const ZoneSourceWords& words>
class ZonesPage : public PageOf<CodedZonesKvf> {
 public:
  using PageOf::PageOf;

  void OnRefresh() override { RefreshZones(*this, Node(), "Refresh Zones"); }

 protected:
  void Describe(PageForm& form) override { DescribeZones(form, *this, Node(), words, areas_); }

 private:
  TableOfZones areas_{Node()};
};

}  // namespace tervane
