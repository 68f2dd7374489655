// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "surface/rivers.h"

#include "libraries/river_network.h"
#include "platform/item_types.h"
#include "platform/paths.h"
#include "platform/text.h"
#include "simspec/conditions.h"
#include "spatial/data2d.h"
#include "spatial/domain.h"
#include "surface/pages.h"

namespace tervane {

namespace {

const Data2DKind kFloodCodes{
    .className = "CRiverFloodCodesKvf", .section = "FloodCodes", .title = "Flood Codes", .itemType = quantity::kCode};
const Data2DKind kBathymetry{.className = "CRiverBathymetryKvf",
                             .section = "Bathymetry",
                             .title = "Bathymetry",
                             .itemType = quantity::kElevation,
                             .relativeToGround = Data2DKind::RelativeToGround::Off};

bool HasExtension(const FileName& file, std::string_view extension) {
  return EqualIgnoringCase(ExtensionOf(file.Text()), extension);
}

}  // namespace

// ---- With the own engine

CRiverKvf::CRiverKvf(CYbSEKvfBase* parent) : CYbSEKvfBase("Rivers and Lakes", "River", parent) {
  SetPage(kRiverPage);
  TakesPartWhen(OwnEngine() && Component(&CModelCompKvf::River));
  NewChild<CData2DKvf>(kFloodCodes, OnInParent(&CRiverKvf::FloodCodes));
  NewChild<CData2DKvf>(kBathymetry, OnInParent(&CRiverKvf::Bathymetry));
}

void CRiverKvf::ExchangeKeys(KeyExchange& keys) {
  keys("Filename", Filename);
  keys("FilenameWQ", FilenameWQ);
  keys("Bathymetry", Bathymetry);
  keys("FloodCodes", FloodCodes);
}

void CRiverKvf::SetRiverFile(FileName file) {
  // A project file leads to no network for them.
  if (HasExtension(file, ".fvproj") && HasExtension(Filename, ".fvsim"))
    for (const auto& layers : {kRiversInForeground, kRiversInBackground})
      if (auto* followers = Important(layers)) followers->StayWithRivers();
  Filename = std::move(file);
}

int CRiverKvf::ValidateData() {
  if (const std::string problem = WhyNotReadable(Filename.Absolute()); !problem.empty()) {
    AddError("Fvr simulation file (*.FVSIM) is missing", "Filename", Filename.IsEmpty() ? std::string() : problem);
    return 0;
  }
  return 1;
}

// ---- With Modflow

CRiverMFKvf::CRiverMFKvf(CYbSEKvfBase* parent) : CYbSEKvfBase("Rivers and Lakes", "RiverMF", parent) {
  SetPage(kModflowRiverPage);
  TakesPartWhen(!OwnEngine() && ModflowComponent(&CModModelCompKvf::River));
}

void CRiverMFKvf::ExchangeKeys(KeyExchange& keys) {
  keys("Filename", Filename);
  keys("IncludeMap", IncludeMap);
}

FileResult CRiverMFKvf::CreateNetworkFile(const std::string& path) const {
  const auto* domain = Important(kDomain);
  return CYbSimpleRiverData::Empty(domain ? domain->GetEnvelope() : Envelope()).WriteNetworkFile(path);
}

int CRiverMFKvf::ValidateData() {
  if (const std::string problem = WhyNotReadable(Filename.Absolute()); !problem.empty()) {
    AddError("The Fluvane River network file (fvnwk) is missing.", "Filename",
             Filename.IsEmpty() ? std::string() : problem);
    return 0;
  }
  return 1;
}

}  // namespace tervane
