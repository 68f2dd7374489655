// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/maps/map_view.h"

#include <utility>

#include "shell/maps/map_canvas.h"

namespace tervane {

MapView::MapView(Host& host, QWidget* parent) : PlotFrame(host, parent), canvas_(new MapCanvas) {
  connect(canvas_, &MapCanvas::PointedAt, this,
          [this](const QString& text) { SetStatus(text.isEmpty() ? canvas_->Summary() : text); });
  Hold({canvas_, [this](double factor) { canvas_->Zoom(factor); }, [this] { canvas_->Fit(); },
        [this](double pixelRatio) { return canvas_->Picture(pixelRatio); }});
}

void MapView::Show(MapContent content, const DisplayUnits* units) {
  const DisplayUnits chosen = units ? *units : DisplayUnits();
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
