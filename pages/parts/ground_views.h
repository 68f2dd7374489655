// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The ground as modellers check it: a section along a line that is drawn on the map, and the column below a place.
#pragma once

#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "forms/map_question.h"
#include "forms/page_rows.h"
#include "forms/table_of.h"
#include "pages/parts/ground_column.h"
#include "pages/parts/ground_soils.h"
#include "pages/parts/section_tool.h"

namespace tervane {

class CSatZoneKvf;

/// The two views of one page: a part of it that lives with it. The pages of the saturated zone, of its lists and of its
/// levels have them; on the page of another node there is nothing of them.
class GroundViews {
 public:
  explicit GroundViews(CYbSEDlgBase& page);

  /// Adds the buttons, the column, a map of the ground or of a layer's thickness, and the section.
  void Describe(PageForm& form);

  // For a page with a map of its own: the parts around it. `isOffered` says whether that map is shown.

  /// The buttons and the column.
  void DescribeButtons(PageForm& form, const Condition& isOffered);
  void DescribeSection(PageForm& form, const Condition& isOffered);
  /// What is drawn and asked for, and the wells.
  void PutOn(MapContent& map) const;

 private:
  std::shared_ptr<TableOf<ColumnPart>> ColumnTable();
  /// Something is known that a map can show.
  bool HasMap() const;
  std::vector<std::string> MapNames() const;
  MapContent Map();
  MapContent ThicknessMap(std::size_t layer);
  void Probe(MapPoint place);

  CYbSEDlgBase& page_;
  const CSatZoneKvf* zone_;  ///< Null where the node stands elsewhere.
  GroundSoils soils_;
  SectionTool section_;
  MapQuestion question_;
  int map_ = 0;  ///< 0 for the ground, else the number of the layer whose thickness is shown.
  std::optional<MapPoint> place_;
  std::string probeText_;
  std::vector<ColumnPart> column_;
  struct Thickness;
  std::shared_ptr<Thickness> thickness_;  ///< As it was last shown.
};

/// A page that a function describes, with both views below.
template <auto describe>
class GroundPage : public page_rows::FunctionPage<describe> {
 public:
  using page_rows::FunctionPage<describe>::FunctionPage;

 protected:
  void Describe(PageForm& form) override {
    page_rows::FunctionPage<describe>::Describe(form);
    ground_.Describe(form);
  }

 private:
  GroundViews ground_{*this};
};

/// As `DescribedBy`.
template <auto describe>
constexpr PageRow DescribedWithGround(const PageClass& page) {
  using Node = typename page_rows::NodeOf<decltype(describe)>::Type;
  return {page, page_rows::Make<GroundPage<describe>, Node>};
}

}  // namespace tervane
