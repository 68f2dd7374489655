// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/geo_scene.h"

#include <algorithm>
#include <array>
#include <cstdlib>
#include <limits>
#include <vector>

#include <fmt/format.h>

#include "core/open_kvf.h"
#include "data/datafile.h"
#include "overlays/overlays.h"
#include "platform/files.h"
#include "platform/os_process.h"
#include "platform/paths.h"
#include "results/pages.h"
#include "results/scene_xml.h"
#include "spatial/domain.h"
#include "subsurface/saturated_zone.h"
#include "subsurface/wells.h"

namespace tervane {

namespace {

constexpr KeyChoice kLayerTypes[] = {{CGeoScene3DKvf::kComputational, "Show computational layers"},
                                     {CGeoScene3DKvf::kGeological, "Show geological layers"}};

struct SceneColor {
  int red, green, blue;
};
constexpr std::array kSurfaceColors{SceneColor{0, 0, 255}, SceneColor{50, 150, 250}};
constexpr std::array kHeadColors{SceneColor{0, 166, 166}, SceneColor{0, 196, 110}, SceneColor{0, 226, 55},
                                 SceneColor{0, 255, 0},   SceneColor{85, 255, 0},  SceneColor{170, 255, 0},
                                 SceneColor{255, 255, 0}, SceneColor{255, 170, 0}};

struct Surface {
  std::string name, path;
  int item = 0;
};

/// Surfaces with their extremes, which begin at the smallest number above 0: below it no largest value is known.
struct Surfaces {
  std::vector<Surface> all;
  double smallest = std::numeric_limits<double>::max(), largest = std::numeric_limits<double>::min();
};

std::string AddSurfaces(const std::string& path, Surfaces& surfaces) {
  DataFile file;
  if (!file.Open(ResolvedPath(path, {})).empty()) return fmt::format("Could not open file for reading:\n{}", path);
  if (file.Items().empty()) return fmt::format("No items found is file: \n{}", path);
  int number = 0;
  for (const DataItem& item : file.Items()) {
    ItemStatistics statistics;
    if (!file.Statistics(++number, statistics).empty())
      return fmt::format("Could not open file for reading:\n{}", path);
    surfaces.all.push_back({item.name, path, number});
    // What is no number widens nothing.
    if (statistics.smallest < surfaces.smallest) surfaces.smallest = statistics.smallest;
    if (statistics.largest > surfaces.largest) surfaces.largest = statistics.largest;
  }
  return {};
}

/// Puts a scene into a file.
class SceneWriter {
 public:
  SceneWriter(KvfFile* file, const CGeoScene3DKvf& node, const std::string& stem)
      : file_(file), node_(node), stem_(stem) {}

  /// "" or why there is none.
  std::string Write() {
    if (std::string problem = Collect(); !problem.empty()) return problem;
    kvfAddTarget(file_, "OrvikParameterFile");
    kvfAddSection(file_, "Surfaces");
    for (std::size_t i = surfaces_.all.size(); i-- > 0;) PutSurface(i);
    kvfEndSection(file_);
    if (node_.IsOfResults()) PutHeads();
    PutScene();
    const auto* zone = node_.Important(kSaturatedZone);
    std::string problem;
    if (zone && zone->Wells) problem = PutWells();
    kvfEndSection(file_);
    return problem;
  }

 private:
  std::string Collect() {
    if (const auto* domain = node_.Important(kDomain)) extent_ = domain->GetEnvelope();
    const std::string layers = stem_ + "_CompLayers.nds2";
    if (node_.LayerType == CGeoScene3DKvf::kGeological) {
      if (std::string problem = AddSurfaces(stem_ + "_GeoLayers.nds2", surfaces_); !problem.empty()) return problem;
      const std::string lenses = stem_ + "_GeoLenses.nds2";
      if (node_.ShowLenses && FileExists(ResolvedPath(lenses, {})))
        if (std::string problem = AddSurfaces(lenses, surfaces_); !problem.empty()) return problem;
    } else if (std::string problem = AddSurfaces(layers, surfaces_); !problem.empty()) {
      return problem;
    }
    if (surfaces_.all.empty()) return "No surfaces found in nds2-file(s)";
    Surfaces computed;
    if (node_.IsOfResults())
      if (std::string problem = AddSurfaces(layers, computed); !problem.empty()) return problem;
    for (std::size_t i = computed.all.size(); i-- > 1;)
      heads_.push_back({i, "Head elevation: " + computed.all[i].name});
    for (const COverlayListKvf* list : {node_.Important(kForegroundOverlays), node_.Important(kBackgroundOverlays)})
      for (int number = 1; list && number <= list->GetItemCount(); ++number)
        if (const auto* image = dynamic_cast<const COverlayBMPKvf*>(list->GetItem(number)->Layer()))
          images_.push_back(image);
    return {};
  }

  void PutExtent(const Envelope& extent) const {
    kvfPutParam(file_, "MinX", extent.xMin);
    kvfPutParam(file_, "MaxX", extent.xMax);
    kvfPutParam(file_, "MinY", extent.yMin);
    kvfPutParam(file_, "MaxY", extent.yMax);
  }
  void PutPlace(const COverlayBMPKvf& image) const {
    PutExtent({image.BMP_X0, image.BMP_Y0, image.BMP_X1, image.BMP_Y1});
  }
  void PutFile(const char* key, const std::string& path) const { kvfPutParam(file_, key, path); }
  static std::string PathOfImage(const COverlayBMPKvf& image) {
    return image.Filename.IsEmpty() ? std::string() : image.Filename.Absolute();
  }

  template <std::size_t n>
  void PutColored(const std::array<SceneColor, n>& colors) const {
    kvfAddSection(file_, "Bitmap");
    PutExtent(extent_);
    kvfPutParam(file_, "BitmapMode", 1);
    kvfAddSection(file_, "ColorScale");
    kvfAddSection(file_, "Colors");
    for (std::size_t i = 0; i < n; ++i) {
      kvfAddSection(file_, "Color");
      kvfPutParam(file_, "Value",
                  surfaces_.smallest +
                      static_cast<double>(i) * (surfaces_.largest - surfaces_.smallest) / static_cast<double>(n - 1));
      kvfPutParam(file_, "Red", colors[i].red);
      kvfPutParam(file_, "Green", colors[i].green);
      kvfPutParam(file_, "Blue", colors[i].blue);
      kvfEndSection(file_);
    }
    for (int section = 0; section < 3; ++section) kvfEndSection(file_);
  }

  void PutSurface(std::size_t place) const {
    const Surface& surface = surfaces_.all[place];
    kvfAddSection(file_, "Surface");
    kvfPutParam(file_, "DisplayName", surface.name);
    kvfPutParam(file_, "Alpha", 1 - node_.Transparency);
    if (place == 0 && !images_.empty()) {
      const COverlayBMPKvf& image = *images_.front();
      kvfAddSection(file_, "Bitmap");
      kvfPutParam(file_, "BitmapMode", 0);
      PutPlace(image);
      PutFile("BitmapFileName", PathOfImage(image));
      kvfEndSection(file_);
    } else {
      PutColored(kSurfaceColors);
    }
    kvfAddSection(file_, "Grid");
    PutFile("GridFileName", surface.path);
    kvfPutParam(file_, "ItemIndex", surface.item);
    kvfEndSection(file_);
    kvfEndSection(file_);
  }

  void PutHeads() const {
    kvfAddSection(file_, "SurfaceTSs");
    for (const Head& head : heads_) {
      kvfAddSection(file_, "SurfaceTS");
      kvfPutParam(file_, "DisplayName", head.name);
      kvfPutParam(file_, "Alpha", 1.0);
      PutColored(kHeadColors);
      kvfAddSection(file_, "GridTS");
      PutFile("GridFileName", stem_ + "_3DSZ.nds3");
      kvfPutParam(file_, "ItemIndex", 1);
      kvfPutParam(file_, "LayerIndex", static_cast<int>(head.layer) - 1);
      kvfEndSection(file_);
      kvfEndSection(file_);
    }
    kvfEndSection(file_);
    kvfAddSection(file_, "Animations");
    kvfAddSection(file_, "Animation");
    kvfPutParam(file_, "DisplayName", "Animation of Head elevation");
    kvfPutParam(file_, "ShowEvery", node_.UseAllTimeSteps ? 1 : node_.ShowEveryTimeStep);
    kvfAddSection(file_, "ActiveTimeSeries");
    for (const Head& head : heads_) {
      kvfAddSection(file_, "TimeSeries");
      kvfPutParam(file_, "DisplayName", head.name);
      kvfEndSection(file_);
    }
    for (int section = 0; section < 3; ++section) kvfEndSection(file_);
  }

  void PutScene() const {
    kvfAddSection(file_, "Scene");
    kvfAddSection(file_, "SceneExtent");
    PutExtent(extent_);
    kvfEndSection(file_);
    kvfPutParam(file_, "VerticalScale", node_.VerticalExaggerationFactor);
    kvfPutParam(file_, "CameraElevation", (surfaces_.smallest + surfaces_.largest) * 0.5);
    kvfPutParam(file_, "TerrainSurfaceName", surfaces_.all.front().name);
    kvfAddSection(file_, "Maps");
    int number = 0;
    for (const COverlayBMPKvf* image : images_) {
      if (!image->Display) continue;
      kvfAddSection(file_, fmt::format("Map{}", ++number));
      PutPlace(*image);
      PutFile("BitmapFileName", PathOfImage(*image));
      kvfEndSection(file_);
    }
    kvfEndSection(file_);
    kvfEndSection(file_);
  }

  std::string PutWells() const {
    const auto* wells = node_.Important(kWells);
    if (!wells || wells->Filename.IsEmpty()) return "Missing data for saturated zone. Well file is not specified";
    kvfAddSection(file_, "Wells");
    kvfPutParam(file_, "DisplayName", "Wells");
    PutExtent(extent_);
    PutFile("WellFileName", wells->Filename.Absolute());
    kvfPutParam(file_, "LabelVisible", 1);
    kvfPutParam(file_, "FilterStartAngle", 0);
    kvfPutParam(file_, "FilterStopAngle", 360);
    kvfEndSection(file_);
    return {};
  }

  /// The heads above a computational layer, from the lowest up.
  struct Head {
    std::size_t layer;
    std::string name;
  };

  KvfFile* file_;
  const CGeoScene3DKvf& node_;
  std::string stem_;
  Surfaces surfaces_;
  std::vector<Head> heads_;
  std::vector<const COverlayBMPKvf*> images_;
  Envelope extent_{};
};

}  // namespace

std::string GeoSceneProgram() {
  if (const std::string registered = os::RegisteredServerFolder("{5EBEA2A1-F0B2-491F-B83F-A16FE46B2E69}");
      !registered.empty())
    return ResolvedPath("GS3Orvik.exe", registered);
  const char* named = std::getenv("TERVANE_GEOSCENE3D");
  return named ? named : "";
}

CGeoScene3DKvf::CGeoScene3DKvf(int mode, CYbSEKvfBase* parent)
    : CTvnKvfBase("GeoScene3D", "GeoScene3D", parent), mode_(mode), hasViewer_(!GeoSceneProgram().empty()) {}

const PageClass* CGeoScene3DKvf::GetDlgRuntimeClass(int treeId) const {
  return treeId == (IsOfResults() ? kResultsTree : kSetupDataTree) ? &kGeoScenePage : nullptr;
}

void CGeoScene3DKvf::ExchangeKeys(KeyExchange& keys) {
  keys("VerticalExaggerationFactor", VerticalExaggerationFactor);
  keys("LayerType", LayerType).OneOf(kLayerTypes);
  keys("ShowLenses", ShowLenses);
  keys("UseAllTimeSteps", UseAllTimeSteps);
  keys("ShowEveryTimeStep", ShowEveryTimeStep).Range(1, 999999999);
  keys("Transparency", Transparency).Range(0, 1);
}

std::string CGeoScene3DKvf::WriteScene(const std::string& stem, const std::string& path) const {
  const OpenKvf file(kvfCreate());
  if (std::string problem = SceneWriter(file.get(), *this, stem).Write(); !problem.empty()) return problem;
  const FileResult written = WriteFileAtomically(ResolvedPath(path, {}), SceneXml(*file));
  return written.Ok() ? std::string()
                      : fmt::format("Could not open XML configuration file : {}\n{}\n", path, written.error);
}

}  // namespace tervane
