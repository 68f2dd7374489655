// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "overlays/grid_state.h"

#include <fmt/format.h>

#include "core/kvf.h"
#include "overlays/overlay_walk.h"
#include "platform/files.h"
#include "platform/paths.h"

namespace tervane {

namespace {

bool HasShownLayer(const COverlayListKvf& list) {
  for (int number = 1; number <= list.GetItemCount(); ++number) {
    const COverlayItemKvf& item = *list.GetItem(number);
    if (item.Type >= COverlayItemKvf::kImage && item.Type <= COverlayItemKvf::kRiver && item.Layer()->Display)
      return true;
  }
  return false;
}

}  // namespace

std::string PrepareGridState(const COverlaysKvf& overlays, const FileName& grid, std::optional<int> item, Host& host) {
  if (grid.IsEmpty()) {
    host.ShowMessage("Grid File Name is empty. Please select a Grid File or create a new Grid File before editing.",
                     Host::Icon::Warning);
    return {};
  }
  const std::string absolute = grid.Absolute();
  const std::string path = fmt::format("{}gsf", absolute.substr(0, absolute.size() - ExtensionOf(absolute).size() +
                                                                       (ExtensionOf(absolute).empty() ? 0 : 1)));
  if (FileExists(path) && host.Ask("Grid State File .gsf excist. Continue and overwrite excisting gsf file?.",
                                   Host::Icon::Question, Host::Buttons::YesNo) != Host::Answer::Yes)
    return {};

  KvfFile* file = kvfCreate();
  kvfAddTarget(file, "GRID_EDITOR");
  kvfAddSection(file, "GRID_DATA");
  kvfPutParamFilename(file, "FILE_NAME", absolute);
  if (item) kvfPutParam(file, "itemNo", *item);
  kvfEndSection(file);

  kvfAddSection(file, "IMAGE_FILES");
  int counter = -1;
  WriteOverlays(file, overlays.Background(), kGridStateForm, counter);
  const int behindBackground = ++counter;
  WriteOverlays(file, overlays.Foreground(), kGridStateForm, counter);
  ++counter;
  kvfEndSection(file);

  kvfAddSection(file, "GRID_EDIT_VIEW");
  kvfPutParam(file, "VIEW_TYPE", "CGridEditMapView");
  kvfPutParam(file, "View_Slice_Type", 0);
  const bool isShaded = HasShownLayer(overlays.Background());
  kvfPutParam(file, "View_Shading_Type", isShaded ? 1 : 0);
  if (isShaded) {
    kvfPutParam(file, "View_Box_Divider", 0);
    kvfPutParam(file, "View_Box_Transparency_Val", overlays.CurrentTransparency());
  }
  kvfPutListParam(file, "View_Overlay_Drawing_Order", "iiiii", behindBackground, counter, counter, counter, counter);
  kvfEndSection(file);
  kvfPutParam(file, "SelfDestruct", true);

  kvfWrite(file, path);
  const bool isWritten = kvfGetErrorGlb() == kKvfNoError;
  kvfClose(&file);
  return isWritten ? path : std::string();
}

}  // namespace tervane
