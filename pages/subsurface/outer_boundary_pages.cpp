// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/subsurface/outer_boundary_pages.h"

#include <limits>

#include <fmt/format.h>

#include "forms/map_question.h"
#include "forms/table_of.h"
#include "pages/subsurface/boundary_picture.h"
#include "pages/subsurface/boundary_value.h"
#include "platform/item_types.h"
#include "subsurface/boundary.h"
#include "subsurface/pages.h"

namespace tervane {

namespace {

using Segment = CGeoDataBoundCondItemKvf;

constexpr int kSegmentsMove = kTreeRebuilt | kDataChanged | kOrderChanged | kRefreshPlots;

/// The segments of a boundary, which stand in the order of the boundary.
class CGeoDataBoundCondListDlg : public PageOf<CGeoDataBoundCondListKvf> {
 public:
  CGeoDataBoundCondListDlg(CYbSEKvfBase& node, const PageContext& context)
      : PageOf(node, context), picture_(Node(), BoundaryPicture::By::Type), question_(Context().syncSoon) {}

  /// Sorts the segments after an action that moved one, as a part of it.
  void SetData() override;

 protected:
  void Describe(PageForm& form) override;

 private:
  using Table = TableOf<Segment>;
  void Coordinate(Table& table, const char* head, const char* key, double Segment::*member);
  void NextCoordinate(Table& table, const char* head, double Segment::*member) const;
  void AskStart(const Segment& segment);
  bool Sort() { return Node().GetItemCount() > 1 && Node().LoadDomain() && Node().SortSegments(); }
  MapContent Map();

  BoundaryPicture picture_;
  MapQuestion question_;
  bool isMoved_ = false;
};

/// A coordinate as a cell shows it: empty while it is undefined.
double Shown(double coordinate) {
  return coordinate == Segment::GetUndefinedValue() ? std::numeric_limits<double>::quiet_NaN() : coordinate;
}

void CGeoDataBoundCondListDlg::SetData() {
  if (std::exchange(isMoved_, false)) Sort();
}

void CGeoDataBoundCondListDlg::Coordinate(Table& table, const char* head, const char* key, double Segment::*member) {
  table
      .Value(
          head, [member](const Segment& segment) { return Shown(segment.*member); },
          [this, member](Segment& segment, double value) {
            segment.*member = value;
            isMoved_ = true;
          })
      .Key(key)
      .Width(120)
      .Quantity(quantity::kMapCoordinate)
      .Format("%.2f")
      .Hint(kSegmentsMove);
}

void CGeoDataBoundCondListDlg::NextCoordinate(Table& table, const char* head, double Segment::*member) const {
  table.Value(head, [&n = Node(), member](const Segment& segment) { return Shown(n.Next(segment).*member); })
      .Width(120)
      .Quantity(quantity::kMapCoordinate)
      .Format("%.2f");
}

void CGeoDataBoundCondListDlg::Describe(PageForm& form) {
  CGeoDataBoundCondListKvf& n = Node();
  form.MendWhenShown("Sort Segments", [this] { return Sort(); });
  auto table = std::make_shared<Table>(n);
  table->ItemName("Segment");
  table->KeepOrder();
  const auto extent = [this](const Segment& segment) {
    const auto told = picture_.ExtentOf(segment);
    return told ? fmt::format("{:.0f} m along the boundary, {:.1f} % of it", told->length, 100 * told->share)
                : std::string();
  };
  table->Value("Segment\nname", &Segment::Name).Width(110).ToolTipOf(extent).Hint(kTreeRebuilt | kDataChanged);
  CellChoices types;
  for (const KeyChoice& type : Segment::kBoundaryTypes) types.emplace_back(type.value, std::string(type.text));
  table
      ->Choice(
          "Type", [](const Segment& segment) { return segment.BoundaryType; },
          [](Segment& segment, int type) { segment.SetBoundaryType(type); }, types)
      .Key("BoundaryType")
      .Width(95)
      .ToolTipOf(extent)
      .Hint(kDataChanged | kRefreshPlots);
  table->Button("", "", [this](const Segment& segment) { AskStart(segment); })
      .Icon("target")
      .ToolTip("Select point in the plot")
      .Width(30);
  Coordinate(*table, "From X coordinate", "X", &Segment::X);
  Coordinate(*table, "From Y coordinate", "Y", &Segment::Y);
  NextCoordinate(*table, "To X coordinate", &Segment::X);
  NextCoordinate(*table, "To Y coordinate", &Segment::Y);
  form.Table(table);
  form.Map([this] { return Map(); });
}

void CGeoDataBoundCondListDlg::AskStart(const Segment& segment) {
  question_.AskPoint(fmt::format("Click where segment {} starts. Esc gives up.", segment.GetAbbreviatedTitle()),
                     [this, serial = segment.Serial()](MapPoint start) {
                       for (int number = 1; number <= Node().GetItemCount(); ++number) {
                         Segment& asked = *Node().GetItem(number);
                         if (asked.Serial() != serial) continue;
                         asked.X = start.x;
                         asked.Y = start.y;
                         Sort();
                         return UpdateDoc(kSegmentsMove, "Select Point of Segment");
                       }
                     });
}

MapContent CGeoDataBoundCondListDlg::Map() {
  MapContent map = picture_.Map();
  question_.PutOn(map);
  return map;
}

/// A segment with its value.
class CGeoDataBoundCondItemDlg : public PageOf<Segment> {
 public:
  CGeoDataBoundCondItemDlg(CYbSEKvfBase& node, const PageContext& context) : PageOf(node, context) {
    if (auto* boundary = dynamic_cast<CGeoDataBoundCondListKvf*>(Node().GetParent()))
      picture_.emplace(*boundary, BoundaryPicture::By::Number);
  }

 protected:
  void Describe(PageForm& form) override;

 private:
  MapContent Map();

  std::optional<BoundaryPicture> picture_;
};

void CGeoDataBoundCondItemDlg::Describe(PageForm& form) {
  Segment& n = Node();
  const auto words = [](std::vector<int> boundaries, int first, int last) {
    return BoundaryValue::Words{std::move(boundaries), first, last, "Value:", "Time Series File:"};
  };
  const BoundaryValue value{
      .boundary = n,
      .itemType = [&n] { return n.GetBoundaryQuantity(); },
      .typeLabel = "Data Type",
      .gridFilter = "Time varying file (*.nds2) |*.nds2|All Files (*.*) |*.*||",
      .words = {words({Segment::kFixedHead}, Segment::kInitialValue, Segment::kGridSeries),
                words({Segment::kFlux, Segment::kGradient}, Segment::kConstant, Segment::kSeries)}};
  form.Text("Segment Name:", n.Name).Hint(kTreeRebuilt | kDataChanged);
  form.Choice("Boundary Type:", n.BoundaryType).Revalidates().Then([&n] {
    return n.SetBoundaryType(n.BoundaryType), static_cast<int>(kRefreshPlots);
  });
  DescribeBoundaryValue(form, *this, value);
  ChartOfBoundary(form, value);
  form.Map([this] { return Map(); }).Caption("Its place on the boundary");
}

MapContent CGeoDataBoundCondItemDlg::Map() {
  if (!picture_) return {};
  MapContent map = picture_->Map();
  const int number = Node().GetParent()->GetNumberWhatIs(&Node());
  if (!map.grids.empty()) map.grids.front().highlighted.code = static_cast<float>(number);
  if (!map.points.empty()) map.points.front().highlighted.place = static_cast<std::size_t>(number - 1);
  return map;
}

}  // namespace

std::span<const PageRow> OuterBoundaryPages() {
  static constexpr PageRow kRows[] = {
      PageIs<CGeoDataBoundCondListDlg, CGeoDataBoundCondListKvf>(kOuterBoundaryPage),
      PageIs<CGeoDataBoundCondItemDlg, Segment>(kBoundarySegmentPage),
  };
  return kRows;
}

}  // namespace tervane
