// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/ground_window.h"

#include <QPointer>
#include <memory>

#include "document/flow_model_document.h"
#include "pages/parts/ground_section.h"
#include "shell/relief/relief_window.h"
#include "subsurface/saturated_zone.h"

namespace tervane {

ReliefWindow* OpenGroundWindow(DocumentFrame& frame, Host& host, const DisplayUnits& units) {
  auto* window = new ReliefWindow(&frame, host, ReliefWindow::tr("3D View of %1").arg(frame.Name()));
  // A document that is read anew has other nodes.
  struct Asked {
    const CSatZoneKvf* zone = nullptr;
    std::unique_ptr<GroundSoils> soils;
  };
  const auto ground = [asked = std::make_shared<Asked>(), setup = QPointer<DocumentFrame>(&frame)]() -> SectionContent {
    const auto* zone = setup ? setup->Session().Document().Root().Important(kSaturatedZone) : nullptr;
    if (!zone) return {};
    if (asked->zone != zone) *asked = {zone, std::make_unique<GroundSoils>(*zone)};
    return SectionOf(*zone, *asked->soils);
  };
  window->Show(ReliefOf(ground), PaintGround, units);
  window->show();
  return window;
}

}  // namespace tervane
