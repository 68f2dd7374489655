// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/wqpt/source_pages.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include "forms/table_of.h"
#include "pages/parts/file_controls.h"
#include "pages/parts/plot_content.h"
#include "pages/wqpt/source_chart.h"
#include "wqpt/pages.h"
#include "wqpt/sources.h"
#include "wqpt/species.h"

namespace tervane {

namespace {

CellChoices TypesAt(CSourceWQItemKvf& source) {
  CellChoices choices;
  for (const SourceType& type : SourceTypes())
    if (type.location == source.Location) choices.emplace_back(type.code, std::string(type.text));
  return choices;
}

class CSourcesDlg : public PageOf<CSourcesWQListKvf> {
 public:
  using PageOf::PageOf;

 protected:
  void Describe(PageForm& form) override {
    DescribeTable(form);
    form.Notice([this] { return fmt::format("Not among the curves: {}", fmt::join(chart_.Left(), "; ")); })
        .ShownWhen("a source is not among the curves", [this] { return !chart_.Left().empty(); });
    form.Chart([this] { return chart_.Content(Node()); })
        .Caption("Sources over the time of the simulation")
        .ShownWhen("there are sources", [this] { return Node().GetItemCount() > 0; });
  }

 private:
  void DescribeTable(PageForm& form);

  SourceChart chart_;
};

void CSourcesDlg::DescribeTable(PageForm& form) {
  CSourcesWQListKvf& n = Node();
  using Source = CSourceWQItemKvf;
  constexpr int kRowsChange = kTreeRebuilt | kDataChanged;
  auto table = std::make_shared<TableOf<Source>>(n);
  table->ItemName("Source");
  table->Value("Source\nName", &Source::SourceName).Width(150).Hint(kRowsChange);
  table
      ->Choice("Species", &Source::Species,
               [&n](Source&) {
                 const auto* species = n.Important(kSpecies);
                 return CellChoices::Texts(species ? species->NamesWithoutType(CSpeciesItemKvf::kFixed)
                                                   : std::vector<std::string>());
               })
      .Width(130);
  table->Choice("Location", &Source::Location).Width(100).Hint(kRowsChange);
  table
      ->Choice(
          "Source\nType", [](const Source& source) { return source.Type; },
          [](Source& source, int code) { source.SetSourceType(code); }, TypesAt)
      .Key("SourceType")
      .Width(130)
      .ShownAs([](Source& source) {
        // A type of the other location has no text here.
        const CellChoices types = TypesAt(source);
        const int place = types.IndexOf(std::to_string(source.Type));
        return place < 0 ? std::string() : types[static_cast<std::size_t>(place)].text;
      })
      .Hint(kRowsChange);
  table->Choice("Extent\nType", &Source::ExtentType).Width(110).Hint(kRowsChange);
  form.Table(table);
}

void DescribeExtent(PageForm& form, ExtentKvf& n, CYbSEDlgBase& page) {
  const Condition byGrid = Is(n.type, ExtentKvf::kGridFile), byShape = Is(n.type, ExtentKvf::kShapeFile);
  form.Choice("Data Type:", n.type);
  form.DataFile("File Name:", n.GridFile())
      .Filter("Source extent files (*.nds2) |*.nds2|All Files (*.*) |*.*||")
      .DefaultExtension("nds2")
      .ShownWhen(byGrid);
  form.Button("Edit...", [&page, &n] { EditDataFile(page.Context(), n, n.GridFile().File); }).ShownWhen(byGrid);
  form.ShapeFile("Shape File:", n.ShapeFile())
      .Filter("Source extent shape file (*.shp) |*.shp|All Files (*.*) |*.*||")
      .ShownWhen(byShape);
  UnitKeyChoice(form, "Unit of X- and Y-axes", "ShapeAxisUnit", n.ShapeAxisUnit, quantity::kMapCoordinate)
      .ShownWhen(byShape);
  form.Map([&n, byShape] {
    return byShape.Holds(n) ? ShapeFileMap(n.ShapeFile(), n.ShapeAxisUnit) : FileMap(n.GridFile());
  });
}

}  // namespace

std::span<const PageRow> SourcePages() {
  static constexpr PageRow kRows[] = {
      PageIs<CSourcesDlg, CSourcesWQListKvf>(kSourcesPage),
      DescribedBy<DescribeExtent>(kExtentPage),
  };
  return kRows;
}

}  // namespace tervane
