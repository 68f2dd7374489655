// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "overlays/dropped_layer.h"

#include <algorithm>
#include <array>

#include "overlays/image_place.h"
#include "platform/files.h"
#include "platform/paths.h"
#include "platform/text.h"
#include "spatial/domain.h"

namespace tervane {

namespace {

/// A kind of files with what is shown of it, and for images the endings of geo-references.
struct LayerFile {
  std::string_view extension;
  COverlayItemKvf::Kind kind;
  std::array<std::string_view, 3> places = {};

  bool IsBelow() const { return kind == COverlayItemKvf::kImage || kind == COverlayItemKvf::kGrid; }
};
constexpr std::array kLayerFiles{
    LayerFile{".bmp", COverlayItemKvf::kImage, {".bmpw", ".bpw", {}}},
    LayerFile{".jpg", COverlayItemKvf::kImage, {".jpgw", ".jpw", ".jgw"}},
    LayerFile{".jpeg", COverlayItemKvf::kImage, {".jpgw", ".jpw", ".jgw"}},
    LayerFile{".gif", COverlayItemKvf::kImage, {".gifw", ".giw", ".gfw"}},
    LayerFile{".png", COverlayItemKvf::kImage, {".pngw", ".pnw", ".pgw"}},
    LayerFile{".tif", COverlayItemKvf::kImage, {".tifw", ".tiw", ".tfw"}},
    LayerFile{".tiff", COverlayItemKvf::kImage, {".tifw", ".tiw", ".tfw"}},
    LayerFile{".nds2", COverlayItemKvf::kGrid},
    LayerFile{".shp", COverlayItemKvf::kShape},
    LayerFile{".fvnwk", COverlayItemKvf::kRiver},
    LayerFile{".fvproj", COverlayItemKvf::kRiver},
    LayerFile{".wel", COverlayItemKvf::kWell},
};

const LayerFile* LayerFileOf(std::string_view path) {
  const std::string extension = LowerCase(ExtensionOf(path));
  const auto* found = std::ranges::find(kLayerFiles, extension, &LayerFile::extension);
  return found == kLayerFiles.end() ? nullptr : found;
}

/// The area of an image by what tells it; nothing where nothing does.
std::optional<DataArea> PlaceOf(const std::string& image, const LayerFile& file, Host& host) {
  const std::string stem = image.substr(0, image.size() - ExtensionOf(image).size());
  for (const std::string_view extension : file.places)
    if (const std::string reference = stem + std::string(extension); !extension.empty() && FileExists(reference))
      return ReadGeoReference(reference, image, host);
  return file.extension.starts_with(".tif") ? ReadGeoReference(image, image, host) : std::nullopt;
}

void PlaceImage(COverlayBMPKvf& image, const std::string& path, const LayerFile& file, Host& host) {
  std::optional<DataArea> place = PlaceOf(path, file, host);
  if (const auto* domain = image.Important(kDomain); domain && !place) {
    const Envelope area = domain->GetEnvelope();
    place = DataArea{area.xMin, area.yMin, area.xMax, area.yMax};
  }
  if (!place) return;
  image.BMP_X0 = place->x0;
  image.BMP_X1 = place->x1;
  image.BMP_Y0 = place->y0;
  image.BMP_Y1 = place->y1;
}

}  // namespace

bool IsLayerFile(std::string_view path) { return LayerFileOf(path) != nullptr; }

COverlayItemKvf* AddLayerOf(const CYbSEKvfBase& node, const std::string& path, Host& host) {
  const LayerFile* file = LayerFileOf(path);
  auto* list = file ? node.Important(file->IsBelow() ? kBackgroundOverlays : kForegroundOverlays) : nullptr;
  if (!list) return nullptr;
  COverlayItemKvf& item = *list->AddItem();
  item.Type = file->kind;
  const FileName name = FileName::Picked(path, list->GetRoot()->SetupFolder());
  OverlayLayer* layer = item.Layer();
  if (auto* image = dynamic_cast<COverlayBMPKvf*>(layer)) {
    image->Filename = name;
    PlaceImage(*image, path, *file, host);
  } else if (auto* grid = dynamic_cast<COverlayGridKvf*>(layer)) {
    grid->GridFile().Choose(name);
  } else if (auto* shape = dynamic_cast<COverlayShapeKvf*>(layer)) {
    shape->Filename = name;
  } else if (auto* river = dynamic_cast<COverlayRiverKvf*>(layer)) {
    river->SourceFvrNwkType = COverlayRiverKvf::kOwnFile;
    river->FvrNwkFilename_Specified = name;
  } else if (auto* wells = dynamic_cast<COverlayWellKvf*>(layer)) {
    wells->SourceWellType = COverlayWellKvf::kOwnFile;
    wells->WellFilename = name;
  }
  return &item;
}

}  // namespace tervane
