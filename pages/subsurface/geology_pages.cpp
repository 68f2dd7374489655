// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/subsurface/geology_pages.h"

#include <fmt/format.h>

#include "forms/rows_in_step.h"
#include "forms/table_of.h"
#include "pages/parts/ground_views.h"
#include "subsurface/computational_layers.h"
#include "subsurface/geology.h"
#include "subsurface/pages.h"
#include "subsurface/saturated_zone.h"

namespace tervane {

namespace {

constexpr int kRowsChange = kTreeRebuilt | kDataChanged;

void DescribeUnits(PageForm& form, CGeoUnitsSZListKvf& n) {
  using Unit = CGeoUnitsSZItemKvf;
  auto table = std::make_shared<TableOf<Unit>>(n);
  table->ItemName("Unit");
  const auto number = [&](const char* head, float Unit::*member) {
    return table->Value(head, member).Width(95).Format("%.6g");
  };
  const auto forTransport = [&](const char* head, float Unit::*member, TransportProperty property) {
    number(head, member).ShownWhen([&n, needed = TransportNeeds(property)] { return needed.Holds(n); });
  };
  table->Value("Soil\nname", &Unit::SoilName).Width(110);
  table->Value("Soil\ncode", &Unit::SoilCode).Width(55);
  number("Horizontal\nconductivity", &Unit::HorConduc);
  number("Vertical\nconductivity", &Unit::VerConduc);
  number("Specific\nyield", &Unit::SpecYield);
  number("Specific\nstorage", &Unit::StorageCoef);
  forTransport("Porosity", &Unit::Porosity, TransportProperty::Porosity);
  forTransport("Matrix\nPorosity", &Unit::MatrixPorosity, TransportProperty::MatrixPorosity);
  forTransport("Bulk\nDensity", &Unit::BulkDensity, TransportProperty::BulkDensity);
  forTransport("LHH", &Unit::LHH, TransportProperty::HorizontalDispersivity);
  forTransport("THH", &Unit::THH, TransportProperty::HorizontalDispersivity);
  forTransport("TVH", &Unit::TVH, TransportProperty::VerticalDispersivity);
  forTransport("LVV", &Unit::LVV, TransportProperty::VerticalDispersivity);
  forTransport("THV", &Unit::THV, TransportProperty::VerticalDispersivity);
  form.Table(table);
}

/// The geological layers, whose rows drive the computational layers that follow them.
class CGeoLayerSZDlg : public PageOf<CGeoLayerSZKvf> {
 public:
  using PageOf::PageOf;

 protected:
  void Describe(PageForm& form) override;

 private:
  void CopyToAll(CGeoLayerSZItemKvf& from);

  std::shared_ptr<TableOf<CGeoLayerSZItemKvf>> table_;
  GroundViews ground_{*this};
};

void CGeoLayerSZDlg::Describe(PageForm& form) {
  CGeoLayerSZKvf& n = Node();
  auto* followers = n.Important(kComputationalLayersOfGeology);
  if (!followers) return;
  table_ =
      std::make_shared<TableOf<CGeoLayerSZItemKvf>>(std::make_shared<RowsInStep<CGeoLayerSZItemKvf>>(n, *followers));
  table_->ItemName("Layer");
  table_->ReportCurrentRow();
  table_
      ->Value(
          "Name", [](const CGeoLayerSZItemKvf& layer) { return layer.Name; },
          [&n, followers](CGeoLayerSZItemKvf& layer, const std::string& name) {
            layer.Name = name;
            if (auto* follower = followers->GetItem(n.GetNumberWhatIs(&layer))) follower->Name = name;
          })
      .Key("Name")
      .Width(180)
      .Hint(kRowsChange);
  form.Table(table_);
  form.Button("Copy Properties to All Layers",
              [this] {
                if (CGeoLayerSZItemKvf* layer = table_->Current()) CopyToAll(*layer);
              })
      .ToolTip("Gives all properties of the current layer but its lower level to the other layers")
      .EnabledWhen("there is a current layer, and another one",
                   [this] { return table_->Current() && Node().GetItemCount() > 1; });

  const auto differ = [&n, followers] { return n.GetItemCount() != followers->GetItemCount(); };
  form.Notice([&n, followers] {
        return fmt::format("Geological layers: {}. Computational layers that follow them: {}.", n.GetItemCount(),
                           followers->GetItemCount());
      })
      .ShownWhen("the lists differ", differ);
  form.Button("Bring in Step",
              [this, &n, followers] {
                followers->BringInStep(n);
                n.SetRevalidateAll();
                UpdateDoc(kRowsChange, "Bring Layers in Step");
              })
      .ToolTip("Adds computational layers at the end, or takes those away that have no geological layer")
      .ShownWhen("the lists differ", differ);
  ground_.Describe(form);
}

void CGeoLayerSZDlg::CopyToAll(CGeoLayerSZItemKvf& from) {
  for (int number = 1; number <= Node().GetItemCount(); ++number)
    if (CGeoLayerSZItemKvf* to = Node().GetItem(number); to != &from) CopyProperties(from, *to);
  Node().SetRevalidateAll();
  UpdateDoc(kDataChanged, fmt::format("Copy Properties of {}", from.Name));
}

void DescribeLenses(PageForm& form, CGeoLenseSZKvf& n) {
  auto table = std::make_shared<TableOf<CGeoLenseSZItemKvf>>(n);
  table->ItemName("Lense");
  table->Value("Name", &CGeoLenseSZItemKvf::Name).Width(180).Hint(kRowsChange);
  form.Table(table);
}

}  // namespace

std::span<const PageRow> GeologyPages() {
  static constexpr PageRow kRows[] = {
      DescribedBy<DescribeUnits>(kGeologicalUnitsPage),
      PageIs<CGeoLayerSZDlg, CGeoLayerSZKvf>(kGeologicalLayersPage),
      DescribedWithGround<DescribeLenses>(kGeologicalLensesPage),
  };
  return kRows;
}

}  // namespace tervane
