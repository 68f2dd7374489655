// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/module.h"

#include "document/flow_model_document.h"

namespace tervane {

int YbGetNumDocTemplates() { return 1; }

int YbGetEditorString(std::string* text) {
  if (!text) return 0;
  *text = CFlowModelDoc::kEditorName;
  return 1;
}

int YbGetNumToolbars() { return 1; }

int YbGetToolbarString(std::string* text, int toolbar) {
  if (!text || toolbar != 0) return 0;
  *text = "TERVANE Flowmodel Toolbar";
  return 1;
}

int YbGetBitmapId() { return 0; }

}  // namespace tervane
