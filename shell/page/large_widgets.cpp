// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <QHBoxLayout>

#include "forms/plots.h"
#include "overlays/dropped_layer.h"
#include "pages/parts/ground_section.h"
#include "shell/charts/depth_columns.h"
#include "shell/charts/section_view.h"
#include "shell/charts/series_plot.h"
#include "shell/maps/map_canvas.h"
#include "shell/maps/map_view.h"
#include "shell/page/control_widgets.h"
#include "shell/page/table_view.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"
#include "spatial/domain.h"
#include "subsurface/saturated_zone.h"

namespace tervane {

namespace {

class TableWidget : public ControlWidget {
 public:
  TableWidget(CYbSEDlgBase& page, Control& control) : ControlWidget(page, control) {
    MakeLabel();
    table_ = new TableView(page, control);
    connect(table_, &TableView::UnitChosen, this, &ControlWidget::UnitChosen);
    MakeField(table_, true);
  }
  bool GrowsDown() const override { return true; }
  bool GrowsRight() const override { return true; }
  int WantedWidth() const override { return table_->WantedWidth(); }
  QWidget* FocusTarget() const override { return table_->FocusTarget(); }
  void Commit() override { table_->Commit(); }

 protected:
  void SyncValue() override { table_->Sync(); }

 private:
  TableView* table_;
};

class MapWidget : public ControlWidget {
 public:
  MapWidget(CYbSEDlgBase& page, Control& control) : ControlWidget(page, control), soils_(page.Node()) {
    MakeLabel();
    view_ = new MapView(page.Outside());
    view_->SetGround([this, &page] { return GroundOf(page); });
    view_->SetModelCells([&page]() -> std::optional<GridGeometry> {
      const auto* domain = page.Node().Important(kDomain);
      return domain ? std::optional(domain->GetModelGeometry()) : std::nullopt;
    });
    // Maps of libraries have no backdrop.
    if (page.Node().Important(kBackgroundOverlays))
      view_->TakeDrops(IsLayerFile, [&page](const std::vector<std::string>& paths) {
        for (const std::string& path : paths) AddLayerOf(page.Node(), path, page.Outside());
        page.UpdateDoc(kDataChanged | kTreeRebuilt | kRefreshPlots, paths.size() == 1 ? "Add Layer" : "Add Layers");
      });
    MakeField(view_, true);
  }
  bool GrowsDown() const override { return true; }
  bool GrowsRight() const override { return true; }
  QWidget* FocusTarget() const override { return &view_->Canvas(); }

 protected:
  void SyncValue() override {
    if (Described().IsShown())
      view_->ShowWhenThere(Described().map, Described().displayUnits);
    else
      view_->StopWaiting();
  }

 private:
  /// What the page's section would cut, else the ground of the setup.
  SectionContent GroundOf(CYbSEDlgBase& page) {
    for (const auto& control : page.Form().Controls())
      if (control->kind == ControlKind::Section) return control->section();
    const auto* zone = page.Node().Important(kSaturatedZone);
    return zone ? SectionOf(*zone, soils_) : SectionContent();
  }

  GroundSoils soils_;
  MapView* view_;
};

class ChartWidget : public ControlWidget {
 public:
  ChartWidget(CYbSEDlgBase& page, Control& control) : ControlWidget(page, control) {
    MakeLabel();
    plot_ = new SeriesPlot(page.Outside());
    MakeField(plot_, true);
  }
  bool GrowsDown() const override { return true; }
  bool GrowsRight() const override { return true; }
  QWidget* FocusTarget() const override { return plot_->FocusTarget(); }

 protected:
  void SyncValue() override {
    if (Described().IsShown())
      plot_->ShowWhenThere(Described().chart);
    else
      plot_->StopWaiting();
  }

 private:
  SeriesPlot* plot_;
};

class SectionWidget : public ControlWidget {
 public:
  SectionWidget(CYbSEDlgBase& page, Control& control) : ControlWidget(page, control) {
    MakeLabel();
    view_ = new SectionView(page.Outside());
    MakeField(view_, true);
  }
  bool GrowsDown() const override { return true; }
  bool GrowsRight() const override { return true; }
  QWidget* FocusTarget() const override { return view_->FocusTarget(); }

 protected:
  void SyncValue() override {
    if (Described().IsShown())
      view_->ShowWhenThere(Described().section, Described().displayUnits);
    else
      view_->StopWaiting();
  }

 private:
  SectionView* view_;
};

class DepthsWidget : public ControlWidget {
 public:
  DepthsWidget(CYbSEDlgBase& page, Control& control) : ControlWidget(page, control) {
    MakeLabel();
    view_ = new DepthColumns;
    MakeField(view_, true);
  }
  bool GrowsDown() const override { return true; }
  bool GrowsRight() const override { return true; }
  QWidget* FocusTarget() const override { return view_; }

 protected:
  void SyncValue() override { view_->Show(Described().depths(), Described().displayUnits); }

 private:
  DepthColumns* view_;
};

}  // namespace

std::unique_ptr<ControlWidget> MakeLargeWidget(CYbSEDlgBase& page, Control& control) {
  switch (control.kind) {
    case ControlKind::Table:
      return std::make_unique<TableWidget>(page, control);
    case ControlKind::Map:
      return std::make_unique<MapWidget>(page, control);
    case ControlKind::Chart:
      return std::make_unique<ChartWidget>(page, control);
    case ControlKind::Section:
      return std::make_unique<SectionWidget>(page, control);
    case ControlKind::Depths:
      return std::make_unique<DepthsWidget>(page, control);
    default:
      return nullptr;
  }
}

}  // namespace tervane
