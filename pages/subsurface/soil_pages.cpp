// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/subsurface/soil_pages.h"

#include <fmt/format.h>

#include "libraries/soils.h"
#include "pages/parts/zone_controls.h"
#include "platform/item_types.h"
#include "platform/text.h"
#include "simspec/conditions.h"
#include "subsurface/pages.h"
#include "subsurface/two_layer_soils.h"
#include "subsurface/unsaturated_zone.h"

namespace tervane {

namespace {

using SoilLayer = CUZSoilProfilePropLayerItemKvf;
using SoilCells = CUZSoilProfilePropDiscrItemKvf;

constexpr ZoneSourceWords kProfileWords{.gridFilter = kZoneGridFilter};
constexpr ZoneSourceWords kTwoLayerWords{
    .gridFilter = "UZ wetland soil profile distr.files (*.nds2) |*.nds2|All Files (*.*) |*.*||"};

void DescribeBypass(PageForm& form, BypassConstants& constants) {
  const Condition isSimple = UnsaturatedZoneIs(&CUnsatzoneKvf::Bypass, {CUnsatzoneKvf::kSimpleBypass});
  PageForm& group = form.Group("Bypass constants");
  group.Number("Maximum bypass fraction", constants.BYP).EnabledWhen(isSimple);
  group.Number("Water content for reduced\nbypass flow", constants.THR1).EnabledWhen(isSimple);
  group.Number("Limit on water content for\nbypass flow", constants.THR2).EnabledWhen(isSimple);
}

// ---- A profile

class CUZSoilProfilePropDlg : public PageOf<CUZSoilProfilePropKvf> {
 public:
  using PageOf::PageOf;

 protected:
  void Describe(PageForm& form) override;

 private:
  std::shared_ptr<TableOf<SoilLayer>> SoilTable() const;
  std::shared_ptr<TableOf<SoilCells>> CellTable() const;
  void SelectSoil(SoilLayer& layer) const;
  DepthContent Depths() const;
};

void CUZSoilProfilePropDlg::Describe(PageForm& form) {
  CUZSoilProfilePropKvf& n = Node();
  ZoneName(form, "Soil Profile:", n);
  ZoneIdentity(form, "profiles", n, ZonesOf(n));
  DescribeBypass(form, n);
  form.Group("Soil profile definition").Table(SoilTable());
  form.Group("Vertical discretization").Table(CellTable());
  form.Notice([&n] {
    const std::string differing = n.WhyEndsDiffer();
    return differing.empty() ? differing : fmt::format("Note: {}.", differing);
  });
  form.Depths([this] { return Depths(); }).Caption("Soils and cells");
  PlaceOfZone(form, n);
}

std::shared_ptr<TableOf<SoilLayer>> CUZSoilProfilePropDlg::SoilTable() const {
  CUZSoilProfilePropLayerListKvf& soils = Node().Soils();
  auto table = std::make_shared<TableOf<SoilLayer>>(soils);
  table->ItemName("Soil");
  table
      ->Value("From depth",
              [&soils](const SoilLayer& layer) {
                const SoilLayer* above = soils.GetItem(soils.GetNumberWhatIs(&layer) - 1);
                return above ? above->Depth : 0.0f;
              })
      .Quantity(quantity::kDepthBelowGround)
      .Format("%.6g")
      .Width(85)
      .GreyWhen([](SoilLayer&) { return true; });
  table->Value("To depth", &SoilLayer::Depth).Format("%.6g").Width(80);
  table->Value("Soil name", [](const SoilLayer& layer) { return layer.SoilID; })
      .Key("SoilID")
      .Width(120)
      .GreyWhen([](SoilLayer&) { return true; });
  table->Value("UZ Soil property file", [](SoilLayer& layer) -> FileName& { return layer.DataBase; })
      .Key("DataBase")
      .Width(200)
      .Filter(std::string(kSoilLibrary.filter))
      .DefaultExtension(std::string(kSoilLibrary.extension))
      .ToolTipOf([](SoilLayer& layer) { return layer.DataBase.Text(); });
  table->Button("", "...", [this](SoilLayer& layer) { SelectSoil(layer); })
      .Width(25)
      .ToolTip("Choose a soil of a library");
  table->Button("", "Edit", [this](SoilLayer& layer) { Outside().OpenInEditor(layer.DataBase.Absolute()); })
      .EnabledWhen([](SoilLayer& layer) { return !layer.DataBase.IsEmpty(); })
      .Width(25)
      .ToolTip("Edit the library");
  return table;
}

std::shared_ptr<TableOf<SoilCells>> CUZSoilProfilePropDlg::CellTable() const {
  CUZSoilProfilePropDiscrListKvf& list = Node().Cells();
  auto table = std::make_shared<TableOf<SoilCells>>(list);
  table->ItemName("Cells");
  table
      ->Running(
          "From depth", [] { return 0.0; },
          [&list](double depth, const SoilCells& cells) {
            const SoilCells* above = list.GetItem(list.GetNumberWhatIs(&cells) - 1);
            return above ? depth + above->Height() : depth;
          })
      .Quantity(quantity::kDepthBelowGround)
      .Format("%.6g")
      .Width(85);
  table
      ->Running(
          "To depth", [] { return 0.0; }, [](double depth, const SoilCells& cells) { return depth + cells.Height(); })
      .Quantity(quantity::kDepthBelowGround)
      .Format("%.6g")
      .Width(80);
  table->Value("Cell height", &SoilCells::CellHeight).Width(90);
  table->Value("No of cells", &SoilCells::NoCells).Width(80);
  const Condition withTransport = WaterQualityComponent(&CModelCompWQKvf::UZ);
  table->Value("Dispersivity", &SoilCells::Dispersivity).Width(95).ShownWhen([this, withTransport] {
    return withTransport.Holds(Node());
  });
  return table;
}

void CUZSoilProfilePropDlg::SelectSoil(SoilLayer& layer) const {
  const auto choice = Outside().SelectLibraryEntry(
      {kSoilLibrary, layer.DataBase.IsEmpty() ? std::string() : layer.DataBase.Absolute(), layer.SoilID});
  if (!choice) return;
  layer.DataBase = FileName::Picked(choice->file, Context().document.Root().SetupFolder());
  layer.SoilID = choice->entry;
  UpdateDoc(kDataChanged, "Choose Soil");
}

DepthContent CUZSoilProfilePropDlg::Depths() const {
  DepthContent content{{{"Soils", {}}, {"Cells", {}}}, {}};
  const CUZSoilProfilePropLayerListKvf& soils = Node().Soils();
  for (int number = 1; number <= soils.GetItemCount(); ++number) {
    const SoilLayer& layer = *soils.GetItem(number);
    content.columns[0].blocks.push_back(
        {layer.SoilID.empty() ? std::string("no soil") : layer.SoilID, static_cast<double>(layer.Depth)});
  }
  const CUZSoilProfilePropDiscrListKvf& list = Node().Cells();
  double depth = 0;
  for (int number = 1; number <= list.GetItemCount(); ++number) {
    const SoilCells& cells = *list.GetItem(number);
    depth += cells.Height();
    content.columns[1].blocks.push_back(
        {fmt::format("{} x {}", cells.NoCells, ShortestNumber(cells.CellHeight)), depth, cells.NoCells});
  }
  if (!(content.Bottom() > 0)) content.message = "Neither soils nor cells reach below the ground.";
  return content;
}

// ---- Soils of two layers

void DescribeTwoLayerSoil(PageForm& form, CUZWetlandSoilPropKvf& n) {
  ZoneName(form, "Soil ID:", n);
  ZoneIdentity(form, "soils", n, ZonesOf(n));
  form.Number("Water content at saturation", n.ThetaS);
  form.Number("Water content at field capacity", n.ThetaFC);
  form.Number("Water content at wilting point", n.ThetaWP);
  form.Number("Saturated hydraulic conductivity", n.Kint);
  form.Number("Soil Suction at wetting front", n.SoilSuction).EnabledWhen(GreenAndAmptUsed());
  DescribeBypass(form, n);
  PlaceOfZone(form, n);
}

}  // namespace

std::span<const PageRow> SoilPages() {
  static constexpr PageRow kRows[] = {
      PageIs<ZonesPage<kProfileWords>, CodedZonesKvf>(kSoilProfilesPage),
      PageIs<CUZSoilProfilePropDlg, CUZSoilProfilePropKvf>(kSoilProfilePage),
      PageIs<ZonesPage<kTwoLayerWords>, CodedZonesKvf>(kTwoLayerSoilsPage),
      DescribedBy<DescribeTwoLayerSoil>(kTwoLayerSoilPage),
  };
  return kRows;
}

}  // namespace tervane
