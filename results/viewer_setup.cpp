// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/viewer_setup.h"

#include <algorithm>
#include <cmath>

#include <fmt/format.h>

#include "data/datafile_facts.h"
#include "overlays/overlay_walk.h"
#include "platform/text.h"
#include "results/viewer_palette.h"

namespace tervane {

namespace {

constexpr int kResultKind = 6;

/// The smallest and the largest value of an item.
struct ItemExtremes {
  double smallest = 0, largest = 1;
};

/// In the unit of that scale; what cannot be read is 0 and 1, in any unit.
ItemExtremes ExtremesOf(const std::string& path, int number, const std::optional<UnitScale>& fileScale,
                        const std::optional<UnitScale>& scale) {
  const auto range = ItemRangeOf(path, number);
  const double smallest = range->statistics.smallest, largest = range->statistics.largest;
  if (!range->error.empty() || !std::isfinite(smallest) || !std::isfinite(largest)) return {};
  const auto conversion = fileScale && scale ? ConversionBetween(*fileScale, *scale) : std::nullopt;
  if (!conversion) return {smallest, largest};
  return {(*conversion)(smallest), (*conversion)(largest)};
}

/// The layer of an item as its file counts, from the bottom; 0 where there are no layers.
int LayerInFile(const DataItem* item, int layerFromTop) {
  return item && item->dimensions == 3 ? item->geometry.nz - layerFromTop : 0;
}

/// Puts the parts of a setup file one behind the other.
class ViewerSetupWriter {
 public:
  ViewerSetupWriter(KvfFile* file, const ViewerSetup& setup)
      : file_(file), setup_(setup), facts_(DataFileFactsOf(setup.shown.path)) {}

  void PutHead() {
    kvfAddSection(file_, "FORMAT_VERSION");
    kvfPutParam(file_, "Verno", 100);
    kvfEndSection(file_);
    const DataArea& area = setup_.stored.area;
    kvfAddSection(file_, "DATA_AREA");
    kvfPutParam(file_, "x0", area.x0);
    kvfPutParam(file_, "y0", area.y0);
    kvfPutParam(file_, "x1", area.x1);
    kvfPutParam(file_, "y1", area.y1);
    kvfPutParam(file_, "UTMZone", setup_.stored.projection);
    kvfEndSection(file_);
    constexpr int kSeconds = 1400;
    kvfAddSection(file_, "TIME_DEFINITION");
    kvfPutParam(file_, "TimeStep", static_cast<double>(facts_->time.stepSeconds));
    kvfPutParam(file_, "TimeUnit", kSeconds);
    kvfPutParam(file_, "CurrentTimeStep", 0);
    kvfEndSection(file_);
  }

  void PutFiles() {
    kvfAddSection(file_, "RESULT_FILES");
    WriteOverlays(file_, setup_.overlays.Background(), kResultViewerForm, counter_);
    PutResult();
    const StoredItem* flow = setup_.stored.FirstOf(StoredItems::kFlowInX);
    if (setup_.withVectors && flow) PutVectors(*flow);
    WriteOverlays(file_, setup_.overlays.Foreground(), kResultViewerForm, counter_);
    kvfEndSection(file_);
  }

 private:
  void PutName(const StoredItem& item) {
    kvfAddKeyword(file_, "DataFileName");
    kvfAddInt(file_, kResultKind);
    kvfAddFilename(file_, item.path);
  }
  /// The places of grid, isolines and vectors in the drawing order.
  void PutDrawingOrder() {
    kvfPutListParam(file_, "OverlayDrawingOrder", "iii", counter_, counter_ + 2, counter_ + 1);
    counter_ += 3;
  }

  void PutResult() {
    const StoredItem& shown = setup_.shown;
    const DataItem* item = facts_->Item(shown.item);
    const ItemType* type = item ? FindItemType(item->itemType) : nullptr;
    const Unit* unit = type ? &setup_.units.UnitOf(*type) : nullptr;
    const std::optional<UnitScale> fileScale = item ? item->scale : std::nullopt;
    const ItemExtremes extremes =
        ExtremesOf(shown.path, shown.item, fileScale, unit ? std::optional(unit->scale) : std::nullopt);
    const std::string unitText = unit ? std::string(unit->text) : item ? item->unitText : std::string();

    PutName(shown);
    kvfPutParam(file_, "AxisUnit", 0);
    kvfAddSection(file_, "PROPERTIES");
    kvfPutParam(file_, "LayerNo", LayerInFile(item, setup_.layer));
    kvfPutParam(file_, "ItemNo", shown.item);
    kvfPutParam(file_, "ShadingType", setup_.overlays.Background().GetItemCount() > 0 ? 4 : 1);
    kvfPutParam(file_, "ColorMergingType", 2);
    kvfPutParam(file_, "TransparencyIntensityVal", setup_.overlays.CurrentTransparency());
    WriteResultPalette(file_, fmt::format("{} [{}]", shown.name, unitText),
                       ScaledRange(extremes.smallest, extremes.largest));
    kvfPutParam(file_, "VectorDisplay", false);
    kvfPutParam(file_, "VectorDraw", false);
    PutDrawingOrder();
    kvfEndSection(file_);
  }

  /// The length of an arrow, in metres of the map, for a flow of 1 in the base unit: the strongest flow is as long as
  /// 0.15 of the model.
  float ArrowScale(const StoredItem& flow, const DataFileFacts& facts) const {
    double peak = 0;
    for (const int number : {flow.item, flow.item + 1}) {
      const DataItem* item = facts.Item(number);
      const ItemType* type = item ? FindItemType(item->itemType) : nullptr;
      const ItemExtremes extremes = ExtremesOf(flow.path, number, item ? item->scale : std::nullopt,
                                               type ? std::optional(BaseUnit(*type).scale) : std::nullopt);
      peak = std::max({peak, std::abs(extremes.smallest), std::abs(extremes.largest)});
    }
    constexpr double kNoFlow = 1e-200;
    if (peak < kNoFlow) peak = 1;
    const DataArea& area = setup_.stored.area;
    return static_cast<float>(std::max(area.x1 - area.x0, area.y1 - area.y0) * static_cast<double>(0.15F) / peak);
  }

  void PutVectors(const StoredItem& flow) {
    const auto facts = DataFileFactsOf(flow.path);
    const int layer = LayerInFile(facts->Item(flow.item), setup_.layer);
    PutName(flow);
    kvfAddSection(file_, "PROPERTIES");
    kvfPutParam(file_, "Display", false);
    kvfPutParam(file_, "ShadingType", 1);
    kvfPutParam(file_, "ColorMergingType", 2);
    kvfPutParam(file_, "TransparencyIntensity", 0);
    for (const char* off : {"Isoline", "IsolineLabels", "ElementMesh"}) kvfPutParam(file_, off, false);
    kvfPutParam(file_, "Border", true);
    for (const char* off : {"BoxContourDivider", "DisplayColorLegend"}) kvfPutParam(file_, off, false);
    kvfPutParam(file_, "LayerNo", layer);
    kvfPutParam(file_, "ItemNo", flow.item);
    WriteVectorPalette(file_);
    kvfPutParam(file_, "VectorDisplay", true);
    kvfPutParam(file_, "VectorDraw", true);
    kvfPutParam(file_, "Scale", ArrowScale(flow, *facts));
    kvfPutParam(file_, "Cartesian", true);
    kvfPutParam(file_, "JSkip", 1);
    kvfPutParam(file_, "KSkip", 1);
    kvfPutParam(file_, "JFirst", 0);
    kvfPutParam(file_, "KFirst", 0);
    kvfPutParam(file_, "VectorLayerNo", layer);
    kvfPutParam(file_, "XItem", flow.item);
    kvfPutParam(file_, "YItem", flow.item + 1);
    PutDrawingOrder();
    kvfEndSection(file_);
  }

  KvfFile* file_;
  const ViewerSetup& setup_;
  std::shared_ptr<const DataFileFacts> facts_;
  int counter_ = 0;
};

}  // namespace

std::string ViewerSetupFile(const std::string& resultFolder, const std::string& itemName) {
  std::string path = Replaced(Trimmed(resultFolder), "/", "\\");
  if (!path.ends_with('\\')) path += '\\';
  for (const char letter : itemName)
    if (std::string_view("\\/<>:|?*^").find(letter) == std::string_view::npos) path += letter;
  return path + ".REV";
}

std::string WriteViewerSetup(const std::string& path, const ViewerSetup& setup) {
  kvfGetErrorGlb();  // what an earlier writer left
  KvfFile* file = kvfCreate();
  kvfAddTarget(file, "QUARZEL_RESULT_VIEWER");
  ViewerSetupWriter writer(file, setup);
  writer.PutHead();
  writer.PutFiles();
  kvfEndSection(file);
  kvfWrite(file, path);
  kvfClose(&file);
  return kvfGetErrorGlb() == kKvfNoError ? std::string()
                                         : fmt::format("Error while writing kvf input file:\n\n{}", kvfErrorText());
}

}  // namespace tervane
