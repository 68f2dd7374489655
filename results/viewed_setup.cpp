// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/viewed_setup.h"

#include <algorithm>
#include <cmath>
#include <string_view>

#include <fmt/format.h>

#include "core/kvf.h"
#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

namespace {

constexpr int kImage = 2, kShape = 3, kGrid = 6;

/// A layer of the file: its name, and what follows until the next name.
struct Entry {
  int kind = 0;
  std::string path, attribute;
  int axisUnit = 0;
  KvfNode* properties = nullptr;
};

std::vector<Entry> EntriesOf(KvfNode* files) {
  std::vector<Entry> entries;
  for (int number = 1; number <= kvfGetNoNodes(files); ++number) {
    KvfNode* node = kvfNodeByNum(files, number);
    const std::string_view name = kvfGetName(node);
    if (kvfIsKeyword(node) && name == "DataFileName") {
      const int instance = static_cast<int>(entries.size()) + 1;
      Entry entry;
      kvfGetParam(files, name, &entry.kind, instance, 1);
      kvfGetParamFilename(files, name, &entry.path, instance, 2);
      if (kvfParamByNum(node, 3)) kvfGetParam(files, name, &entry.attribute, instance, 3);
      entries.push_back(std::move(entry));
    } else if (!entries.empty() && kvfIsKeyword(node) && name == "AxisUnit") {
      if (const KvfParam* unit = kvfParamByNum(node, 1); kvfIsInt(unit)) entries.back().axisUnit = kvfGetInt(unit);
    } else if (!entries.empty() && kvfIsSection(node) && name == "PROPERTIES") {
      entries.back().properties = node;
    }
  }
  return entries;
}

template <class Value>
Value Get(KvfNode* section, std::string_view key, Value value, int position = 1) {
  if (section) kvfGetParam(section, key, &value, 1, position);
  return value;
}

int Part(KvfNode* section, std::string_view key) { return std::clamp(Get(section, key, 0), 0, 255); }

std::vector<ViewedClass> PaletteOf(KvfNode* section) {
  std::vector<ViewedClass> classes;
  constexpr std::string_view kKey = "RGB_Color_Value";
  for (int row = 1; kvfKeywordByNameNum(section, kKey, row); ++row) {
    ViewedClass one;
    int* const parts[] = {&one.color.red, &one.color.green, &one.color.blue};
    for (int i = 0; i < 3; ++i) {
      kvfGetParam(section, kKey, parts[i], row, i + 1);
      *parts[i] = std::clamp(*parts[i], 0, 255);
    }
    kvfGetParam(section, kKey, &one.upTo, row, 4);
    if (std::isfinite(one.upTo)) classes.push_back(one);
  }
  std::ranges::stable_sort(classes, {}, &ViewedClass::upTo);
  return classes;
}

ViewedGrid GridOf(const Entry& entry) {
  ViewedGrid grid;
  grid.path = entry.path;
  grid.item = Get(entry.properties, "ItemNo", grid.item);
  grid.layer = Get(entry.properties, "LayerNo", grid.layer);
  const double transparency = Get(entry.properties, "TransparencyIntensityVal", 0.0);
  // With no layer below it the result covers the paper, whatever is told of its transparency.
  constexpr int kShaded = 4;
  if (Get(entry.properties, "ShadingType", 0) == kShaded) grid.transparency = std::clamp(transparency, 0.0, 1.0);
  if (KvfNode* palette = kvfSectionByNameNum(entry.properties, "Quarzel_Palette_Definition", 1)) {
    grid.paletteTitle = Get(palette, "Palette_Title", std::string());
    grid.palette = PaletteOf(palette);
  }
  return grid;
}

ViewedFlow FlowOf(const Entry& entry) {
  ViewedFlow flow;
  flow.path = entry.path;
  flow.xItem = Get(entry.properties, "XItem", 0);
  flow.yItem = Get(entry.properties, "YItem", flow.xItem + 1);
  flow.layer = Get(entry.properties, "VectorLayerNo", 0);
  flow.isShown = Get(entry.properties, "VectorDraw", true);
  return flow;
}

ViewedOverlay OverlayOf(const Entry& entry) {
  ViewedOverlay overlay;
  overlay.path = entry.path;
  overlay.attribute = entry.attribute;
  overlay.axisUnit = entry.axisUnit;
  if (entry.kind == kImage) {
    overlay.kind = ViewedOverlay::Kind::Image;
    overlay.corners = {Get(entry.properties, "x0", 0.0), Get(entry.properties, "y0", 0.0),
                       Get(entry.properties, "x1", 0.0), Get(entry.properties, "y1", 0.0)};
    return overlay;
  }
  KvfNode* lines = kvfSectionByNameNum(entry.properties, "Quarzel_Shape_Polygon_Object", 1);
  overlay.isShown = Get(lines, "Base_Display_On", true);
  overlay.lineColor = static_cast<unsigned>(Part(lines, "Base_Col_Red") << 16 | Part(lines, "Base_Col_Green") << 8 |
                                            Part(lines, "Base_Col_Blue"));
  return overlay;
}

/// Why nothing was taken, or nothing.
std::string Take(KvfFile* file, ViewedSetup& setup) {
  KvfNode* target = kvfTargetByNameNum(file, "QUARZEL_RESULT_VIEWER", 1);
  if (!target) return "it has no target QUARZEL_RESULT_VIEWER: it is no setup of the result viewer";
  KvfNode* files = kvfSectionByNameNum(target, "RESULT_FILES", 1);
  if (!files) return "it has no section RESULT_FILES";
  if (KvfNode* area = kvfSectionByNameNum(target, "DATA_AREA", 1))
    setup.area = {Get(area, "x0", 0.0), Get(area, "y0", 0.0), Get(area, "x1", 0.0), Get(area, "y1", 0.0)};
  setup.currentStep = std::max(0, Get(kvfSectionByNameNum(target, "TIME_DEFINITION", 1), "CurrentTimeStep", 0));
  bool hasResult = false;
  for (const Entry& entry : EntriesOf(files)) {
    if (entry.path.empty()) {
      setup.notes.emplace_back("A layer without a file is left out.");
    } else if (entry.kind == kImage || entry.kind == kShape) {
      setup.overlays.push_back(OverlayOf(entry));
      setup.overlays.back().isForeground = hasResult;
    } else if (entry.kind == kGrid && Get(entry.properties, "VectorDisplay", false)) {
      setup.flow = FlowOf(entry);
    } else if (entry.kind == kGrid && !hasResult) {
      setup.result = GridOf(entry);
      hasResult = true;
    } else {
      setup.notes.push_back(fmt::format("{} is left out: {}.", FileNameOf(entry.path),
                                        entry.kind == kGrid
                                            ? "one result is shown at a time"
                                            : fmt::format("layers of kind {} are not known", entry.kind)));
    }
  }
  return hasResult ? std::string() : "it names no result (a DataFileName of kind 6)";
}

}  // namespace

bool IsNamedAsViewedSetup(std::string_view path) { return LowerCase(path).ends_with(".rev"); }

FileResult ReadViewedSetup(const std::string& path, ViewedSetup& setup) {
  if (std::string reason = WhyNotReadable(path); !reason.empty())
    return {fmt::format("cannot read {}: {}", path, reason), {}};
  kvfGetErrorGlb();  // what an earlier reader left
  KvfFile* file = kvfLoadFile(path, 0);
  ViewedSetup read;
  std::string reason;
  if (const int status = kvfGetErrorGlb(); status != kKvfNoError)
    reason = kvfErrorText();
  else if (reason = Take(file, read); !reason.empty())
    reason = fmt::format("{}: {}", path, reason);
  kvfClose(&file);
  kvfGetErrorGlb();
  if (!reason.empty()) return {std::move(reason), {}};
  setup = std::move(read);
  return {};
}

}  // namespace tervane
