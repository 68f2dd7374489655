// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/maps/map_view.h"

#include <utility>

#include "platform/item_types.h"
#include "shell/maps/map_canvas.h"

namespace tervane {

namespace {

constexpr const char* kHillshade = "Maps/Hillshade";

}  // namespace

MapView::MapView(Host& host, QWidget* parent) : PlotFrame(host, parent), canvas_(new MapCanvas) {
  connect(canvas_, &MapCanvas::PointedAt, this,
          [this](const QString& text) { SetStatus(text.isEmpty() ? canvas_->Summary() : text); });
  Hold({canvas_, [this](double factor) { canvas_->Zoom(factor); }, [this] { canvas_->Fit(); },
        [this](double pixelRatio) { return canvas_->Picture(pixelRatio); }});
  hillshade_ = AddCommand(tr("&Hillshade"), [this] {
    SetHillshade(hillshade_->isChecked());
    Outside().SetSetting(kHillshade, hillshade_->isChecked() ? "1" : "0");
  });
  hillshade_->setCheckable(true);
  hillshade_->setChecked(Outside().Setting(kHillshade) == "1");
}

void MapView::SetHillshade(bool isOn) {
  MapContent content = canvas_->Content();
  LightSlopes(content, isOn);
  canvas_->SetContent(std::move(content), &units_);
}

void MapView::LightSlopes(MapContent& content, bool isOn) {
  bool hasGround = false;
  for (GridLayer& layer : content.grids) {
    const bool isGround = !layer.isCodes && layer.grid->ItemType() == quantity::kElevation;
    layer.isHillshaded = isGround && isOn;
    hasGround = hasGround || isGround;
  }
  hillshade_->setVisible(hasGround);
}

void MapView::Show(MapContent content, const DisplayUnits* units) {
  const DisplayUnits chosen = units ? *units : DisplayUnits();
  LightSlopes(content, hillshade_->isChecked());
  if (isShown_ && chosen == units_ && LooksSame(content, canvas_->Content())) {
    canvas_->SetPicked(std::move(content.picked));
    canvas_->Ask(std::move(content.request));
    return;
  }
  isShown_ = true;
  units_ = chosen;
  std::optional<MapRequest> request = std::exchange(content.request, {});
  canvas_->SetContent(std::move(content), units);
  canvas_->Ask(std::move(request));
  SetStatus(canvas_->Summary());
}

void MapView::ShowWhenThere(const std::function<MapContent()>& content, const DisplayUnits* units) {
  MapContent now = Follow<MapContent>(content, [this, content, units] { ShowWhenThere(content, units); });
  if (!now.awaited.empty() && isShown_) return;
  // Nothing is said of an empty map that is still to come.
  if (!now.awaited.empty() && now.message.empty()) now.message = " ";
  now.awaited.clear();
  Show(std::move(now), units);
}

bool MapView::IsBusy() const { return PlotFrame::IsBusy() || canvas_->IsPreparing(); }

}  // namespace tervane
