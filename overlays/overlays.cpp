// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "overlays/overlays.h"

#include <array>

#include <fmt/format.h>

#include "libraries/river_network.h"
#include "overlays/pages.h"
#include "platform/file_cache.h"
#include "platform/item_types.h"
#include "platform/paths.h"
#include "platform/text.h"
#include "platform/units.h"
#include "simspec/model_components.h"
#include "subsurface/wells.h"

namespace tervane {

namespace {

/// A name that ends in a separator names no file.
void FileKey(KeyExchange& keys, const char* key, FileName& file) {
  keys(key, file);
  if (keys.IsReading() && EndsInSeparator(file.Text())) file = FileName();
}

void ColorKeys(KeyExchange& keys, const std::string& key, OverlayColor& color) {
  keys(key + "R", color.r);
  keys(key + "G", color.g);
  keys(key + "B", color.b);
}

struct KindText {
  const char* name;
  std::string title;
  const PageClass* page;
};
constexpr std::array kRiverSources{KeyChoice{COverlayRiverKvf::kOfSetup, "The river network of the setup"},
                                   KeyChoice{COverlayRiverKvf::kOwnFile, "A file"}};
constexpr std::array kWellSources{KeyChoice{COverlayWellKvf::kOfSetup, "The wells of the setup"},
                                  KeyChoice{COverlayWellKvf::kOwnFile, "A file"}};

const std::array kKinds{
    KindText{"Image", "Image Overlay", &kImageOverlayPage}, KindText{"Grid", "Grid Overlay", &kGridOverlayPage},
    KindText{"Shape", "Shape Overlay", &kShapeOverlayPage}, KindText{"River", "River Overlay", &kRiverOverlayPage},
    KindText{"Well", "Well Overlay", &kWellOverlayPage}};

const KindText* KindOf(int type) {
  return type >= 1 && type <= static_cast<int>(kKinds.size()) ? &kKinds[static_cast<std::size_t>(type - 1)] : nullptr;
}

}  // namespace

// ---- Kinds

void COverlayBMPKvf::ExchangeKeys(KeyExchange& keys) {
  FileKey(keys, "Filename", Filename);
  keys("BMP_X0", BMP_X0).Quantity(quantity::kMapCoordinate);
  keys("BMP_X1", BMP_X1).Quantity(quantity::kMapCoordinate);
  keys("BMP_Y0", BMP_Y0).Quantity(quantity::kMapCoordinate);
  keys("BMP_Y1", BMP_Y1).Quantity(quantity::kMapCoordinate);
  keys("BMP_TransparentColor", BMP_TransparentColor);
  keys("BMP_DisplayStyle", BMP_DisplayStyle);
  keys("Display", Display);
}

COverlayGridKvf::COverlayGridKvf(CYbSEKvfBase* parent)
    : OverlayLayer("OverlayGrid", "OverlayGrid", parent), file_(NewChild<CTvnData2DNdsFile>()) {
  file_->UsedWhen(Condition::Sentence("the overlay is a grid", [this](const CYbSEKvfBase&) {
    const auto* item = dynamic_cast<const COverlayItemKvf*>(GetParent());
    return item && item->Type == COverlayItemKvf::kGrid;
  }));
  file_->SetDomainCheck(0);
}

void COverlayGridKvf::ExchangeKeys(KeyExchange& keys) {
  keys("Transparency", Transparency);
  keys("Display", Display);
}

COverlayShapeKvf::COverlayShapeKvf(CYbSEKvfBase* parent)
    : OverlayLayer("Shape overlay", "OverlayShape", parent),
      ShapeAxisUnit(BaseUnit(*FindItemType(quantity::kMapCoordinate)).key) {}

void COverlayShapeKvf::ExchangeKeys(KeyExchange& keys) {
  FileKey(keys, "Filename", Filename);
  keys("ItemDescr", ItemDescr);
  keys("ShapeAxisUnit", ShapeAxisUnit);
  keys("PointSize", PointSize).Unit("mm");
  keys("PointStyle", PointStyle);
  keys("PointType", PointType);
  ColorKeys(keys, "PointColor", PointColor);
  ColorKeys(keys, "PointTextColor", PointTextColor);
  keys("LineThickness", LineThickness).Unit("mm");
  keys("LineStyle", LineStyle);
  keys("PolygonStyle", PolygonStyle);
  ColorKeys(keys, "LineColor", LineColor);
  ColorKeys(keys, "LineTextColor", LineTextColor);
  keys("LineTextColorOption", LineTextColorOption);
  keys("ShowLineText", ShowLineText);
  keys("PointTextBackground", PointTextBackground);
  keys("LineTextBackground", LineTextBackground);
  keys("PointTextColorOption", PointTextColorOption);
  keys("ShowPointText", ShowPointText);
  keys("Display", Display);
}

void COverlayRiverKvf::ExchangeKeys(KeyExchange& keys) {
  keys("SourceFvrNwkType", SourceFvrNwkType).OneOf(kRiverSources);
  FileKey(keys, "FvrNwkFilename_Specified", FvrNwkFilename_Specified);
  keys("Display", Display);
}

FileName COverlayRiverKvf::DrawnFile() const {
  return SourceFvrNwkType == kOfSetup ? RiverFileOfSetup(*this) : FvrNwkFilename_Specified;
}

FileName COverlayRiverKvf::ShownFile() const {
  FileName file = DrawnFile();
  // Only a simulation leads on.
  if (SourceFvrNwkType != kOfSetup || EngineOf(*this) != kEngineTervane ||
      !EqualIgnoringCase(ExtensionOf(file.Text()), ".fvsim"))
    return file;
  static FileCache<NamedNetwork> networks(kMostFacts);
  const auto named = networks.Get(file.Absolute(), {}, [&] { return NetworkOfSimulation(file.Absolute()); });
  const std::string folder = GetRoot() ? GetRoot()->SetupFolder() : std::string();
  return named->problem.empty() ? FileName::Picked(named->path, folder) : FileName();
}

FileName COverlayRiverKvf::GetRiverFile() {
  if (SourceFvrNwkType != kOfSetup || EngineOf(*this) != kEngineTervane) return DrawnFile();
  if (!EqualIgnoringCase(ExtensionOf(DrawnFile().Text()), ".fvsim")) return {};
  FvrNwkFilename_Specified = ShownFile();
  SourceFvrNwkType = kOwnFile;
  return FvrNwkFilename_Specified;
}

void COverlayWellKvf::ExchangeKeys(KeyExchange& keys) {
  FileKey(keys, "WellFilename", WellFilename);
  keys("Display", Display);
  keys("Lables", Lables);
  keys("SourceWellType", SourceWellType).OneOf(kWellSources);
}

FileName COverlayWellKvf::ShownFile() const {
  if (SourceWellType != kOfSetup) return WellFilename;
  const bool isByReservoirs = ModelCompOf(*this).SZ_ModelType == 1;
  const auto* wells = isByReservoirs ? Important(kReservoirWells) : Important(kWells);
  return wells ? wells->GetFilename() : FileName();
}

// ---- Layers

COverlayItemKvf::COverlayItemKvf(CYbSEKvfBase* parent) : CTvnKvfBase("OverlayItem", "OverlayItem_%d", parent) {
  NewChild<COverlayBMPKvf>();
  NewChild<COverlayGridKvf>();
  NewChild<COverlayShapeKvf>();
  NewChild<COverlayRiverKvf>();
  NewChild<COverlayWellKvf>();
}

OverlayLayer* COverlayItemKvf::Layer() const {
  return KindOf(Type) ? dynamic_cast<OverlayLayer*>(GetChild(Type)) : nullptr;
}

const std::string& COverlayItemKvf::GetTitle() const {
  const KindText* kind = KindOf(Type);
  return kind ? kind->title : CTvnKvfBase::GetTitle();
}

const PageClass* COverlayItemKvf::GetDlgRuntimeClass(int treeId) const {
  const KindText* kind = KindOf(Type);
  return kind && treeId == kSetupDataTree ? kind->page : nullptr;
}

const std::string& COverlayItemKvf::GetAbbreviatedTitle() const {
  const KindText* kind = KindOf(Type);
  const OverlayLayer* layer = Layer();
  shownTitle_.clear();
  if (kind && layer) {
    const std::string path = layer->ShownFile().Text();
    const std::string name = fmt::format("{}{}", BaseNameOf(path), ExtensionOf(path));
    shownTitle_ =
        fmt::format("{}{}: {}", layer->Display ? "" : "Disabled ", kind->name, path.empty() ? "Unknown" : name);
  }
  return shownTitle_;
}

COverlayListKvf::COverlayListKvf(std::string title, CYbSEKvfBase* parent) : CYbSEKvfListBase(title, title, parent) {
  SetPage(kOverlayListPage);
}

void COverlayListKvf::StayWithRivers() {
  for (int number = 1; number <= GetItemCount(); ++number) {
    const COverlayItemKvf& item = *GetItem(number);
    auto* river = dynamic_cast<COverlayRiverKvf*>(item.Layer());
    if (!river || river->SourceFvrNwkType != COverlayRiverKvf::kOfSetup) continue;
    river->FvrNwkFilename_Specified = river->GetRiverFile();
    river->SourceFvrNwkType = COverlayRiverKvf::kOwnFile;
  }
}

void COverlayCurrentLayerGridKvf::ExchangeKeys(KeyExchange& keys) {
  // Once there were five steps.
  constexpr std::array kSteps{0.19F, 0.25F, 0.38F, 0.5F, 0.62F};
  int step = -1;
  keys.ReadOnly("Transparency", step);
  if (keys.Section() && step >= 0 && step < static_cast<int>(kSteps.size()))
    TransparencyVal = kSteps[static_cast<std::size_t>(step)];
  keys("TransparencyVal", TransparencyVal);
}

COverlayCurrentLayerKvf::COverlayCurrentLayerKvf(CYbSEKvfBase* parent)
    : CYbSEKvfGroupBase("Current Layer", "Current_Layer", parent) {
  NewImportantChild<COverlayCurrentLayerGridKvf>(kCurrentLayerGrid);
}

// ---- All of them

COverlaysKvf::COverlaysKvf(CYbSEKvfBase* parent)
    : CTvnKvfGroupBase("Display", "Overlays", parent),
      foreground_(NewImportantChild<COverlayListKvf>(kForegroundOverlays, "Foreground")),
      background_(NewImportantChild<COverlayListKvf>(kBackgroundOverlays, "Background")) {
  NewChild<COverlayCurrentLayerKvf>();
  SetPage(kDisplayPage);
}

void COverlaysKvf::ExchangeState(KeyExchange& keys) {
  CTvnKvfGroupBase::ExchangeState(keys);
  for (double* corner : {&x0, &y0, &x1, &y1}) keys("corner", *corner);
}

float COverlaysKvf::CurrentTransparency() const {
  const auto* grid = Important(kCurrentLayerGrid);
  return grid ? grid->TransparencyVal : 0.5F;
}

void COverlaysKvf::SetArea(const DataArea& area) {
  x0 = area.x0;
  y0 = area.y0;
  x1 = area.x1;
  y1 = area.y1;
  if (auto* root = dynamic_cast<CTvnKvfGlobalBase*>(GetRoot()))
    if (root->SetMaxDataArea(area)) root->SetDefaultDataArea(area);
}

void COverlaysKvf::AdoptDomain(const Envelope& domain) {
  if (UseModelDomain) SetArea({domain.xMin, domain.yMin, domain.xMax, domain.yMax});
}

int COverlaysKvf::ValidateData() {
  auto* root = dynamic_cast<CTvnKvfGlobalBase*>(GetRoot());
  if (const auto* domain = Important(kDomain)) AdoptDomain(domain->GetEnvelope());
  if (!root) return 1;
  int isUndefined = 0;
  root->IsUndefined(isUndefined);
  if (UseModelDomain && isUndefined) root->SetDefaultDataArea({x0, y0, x1, y1});
  const DataArea& area = root->GetMaxDataArea();
  x0 = area.x0;
  y0 = area.y0;
  x1 = area.x1;
  y1 = area.y1;
  return 1;
}

}  // namespace tervane
