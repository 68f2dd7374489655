// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/grid_series.h"

#include <algorithm>
#include <map>

#include <fmt/format.h>

#include "platform/files.h"
#include "platform/paths.h"
#include "results/pages.h"
#include "results/storing.h"
#include "simspec/conditions.h"
#include "simspec/control_parameters.h"
#include "subsurface/saturated_zone.h"
#include "subsurface/unsaturated_zone.h"
#include "surface/climate.h"
#include "surface/land_use.h"
#include "surface/overland.h"

namespace tervane {

namespace {

constexpr int kLastVersionOfStoringSteps = 9;

void AddOverlandFeatures(const CYbSEKvfBase& node, RequirementMask& mask) {
  if (ModelCompOf(node).OL_ModelType != kFiniteDifferenceOverland) {
    mask |= feature::kSimpleOverland;
    return;
  }
  mask |= feature::kOverland | feature::kOverlandToUrban;
  const auto* control = node.Important(kOverlandControl);
  if (control && control->SolverOption == CCompControlParaOLKvf::kExplicit && control->Multicell)
    mask |= feature::kMultiCell;
  const auto* overland = node.Important(kOverland);
  if (overland && overland->Drainage) mask |= feature::kOverlandDrainage | feature::kDrainageRoute;
}

void AddUnsaturatedFeatures(const CYbSEKvfBase& node, RequirementMask& mask) {
  const int method = ModelCompOf(node).UZ_ModelType;
  if (method < kTwoLayer) mask |= feature::kUnsaturated;
  if (method == kTwoLayer) mask |= feature::kTwoLayer;
  const auto* zone = node.Important(kUnsaturatedZone);
  if (zone && zone->Bypass == CUnsatzoneKvf::kSimpleBypass) mask |= feature::kBypass;
  if (zone && zone->Bypass == CUnsatzoneKvf::kFullMacroporeFlow) mask |= feature::kMacropores;
}

void AddSaturatedFeatures(const CYbSEKvfBase& node, RequirementMask& mask) {
  const CModelCompKvf& components = ModelCompOf(node);
  if (!components.UZ) mask |= feature::kRechargeByLayers;
  if (components.SZ_ModelType != kFiniteDifferenceSaturated) {
    mask |= feature::kLinearReservoir;
    return;
  }
  mask |= feature::kSaturated | feature::kExtraction | feature::kGeneralHeadBoundary | feature::kSaturatedToUrban;
  const auto* zone = node.Important(kSaturatedZone);
  if (zone && zone->Drainage) mask |= feature::kSaturatedDrainage | feature::kDrainageRoute;
}

}  // namespace

// ---- What is required

RequiredTypes::RequiredTypes(const CStoringResultsKvf& storing) : waterBalance_(storing.WaterBalance != 0) {
  const CModelCompKvf& components = ModelCompOf(storing);
  if (!components.WQ) {
    allInput_ = storing.ADInputData && storing.AdRadio == CStoringResultsKvf::kAllFlow;
    saturatedInput_ = storing.ADInputData && storing.AdRadio == CStoringResultsKvf::kSaturatedFlow;
    return;
  }
  const auto* quality = storing.Important(kWaterQualityComponents);
  if (!components.UseCurrentWmSimulation || !quality) return;
  const bool isOfGrids = components.ADPTRadio == kAdvectionDispersion;
  allInput_ = isOfGrids && (quality->UZ || quality->OL);
  saturatedInput_ = components.ADPTRadio == kParticleTracking || (isOfGrids && quality->SZ && !allInput_);
}

bool RequiredTypes::IsWaterQualityInput(const ResultDataType& type) const {
  if (!type.isWaterQualityInput) return false;
  return allInput_ ||
         (saturatedInput_ && ResultCatalogue::Own().DataTypeDependsOn(type.newDataType, feature::kSaturated).value);
}

std::string RequiredTypes::For(const ResultDataType& type) const {
  std::string text;
  if (waterBalance_ && type.isWaterBalance) text += "Water Balance, ";
  if (IsWaterQualityInput(type)) text += "WQ Input, ";
  if (!text.empty()) text.resize(text.size() - 2);
  return text;
}

// ---- The list

COutputGridSeriesListKvf::COutputGridSeriesListKvf(CYbSEKvfBase* storing)
    : CYbSEKvfListBase("Grid Series Output", "GridSeriesOutput", storing) {
  SetPage(kGridSeriesPage);
  TakesPartWhen(OwnEngine());
}

const CStoringResultsKvf& COutputGridSeriesListKvf::Storing() const {
  return static_cast<const CStoringResultsKvf&>(*GetParent());
}

RequirementMask COutputGridSeriesListKvf::BuildResultMask(bool forTimeSeries) const {
  const CModelCompKvf& components = ModelCompOf(*this);
  RequirementMask mask = feature::kWaterMovement;
  if (forTimeSeries) mask |= feature::kSeriesOnly;
  const auto* climate = Important(kClimate);
  if (climate && climate->SM) mask |= feature::kSnowMelt;
  if (components.ET) mask |= feature::kEvapotranspiration;
  const auto* landUse = Important(kLandUse);
  if (landUse && landUse->Irrigation) mask |= feature::kIrrigation;
  if (components.OL) AddOverlandFeatures(*this, mask);
  if (components.River) mask |= feature::kRiver | feature::kInundation;
  if (components.UZ) AddUnsaturatedFeatures(*this, mask);
  if (components.SZ) AddSaturatedFeatures(*this, mask);
  if (mask.Contains(feature::kOverland) || mask.Contains(feature::kSaturated) || mask.Contains(feature::kUnsaturated))
    mask |= feature::kExchange;
  return mask;
}

std::vector<GridSeriesRow> COutputGridSeriesListKvf::Rows() const {
  const RequiredTypes required(Storing());
  const bool hasRun = !indexPath_.empty() && FileExists(ResolvedPath(indexPath_, {}));
  const ResultCatalogue& catalogue = ResultCatalogue::Own();
  std::vector<GridSeriesRow> rows;
  for (const ResultDataType* type : catalogue.OfferedTypes(BuildResultMask(false))) {
    GridSeriesRow& row = rows.emplace_back(GridSeriesRow{type, IsTicked(type->newDataType), required.For(*type)});
    if (hasRun) row.fileName = catalogue.TvnRes_MakeFileNameForDataType(indexPath_, type->newDataType).value;
  }
  return rows;
}

COutputGridSeriesListKvf::Items COutputGridSeriesListKvf::RefreshedChildren() const {
  std::map<int, const std::shared_ptr<CYbSEKvfBase>*> ticked;  // the first item of each type
  for (std::size_t place = plainChildren_; place < children_.size(); ++place)
    ticked.emplace(static_cast<const COutputGridSeriesItemKvf&>(*children_[place]).DataType, &children_[place]);
  Items refreshed(children_.begin(), children_.begin() + static_cast<std::ptrdiff_t>(plainChildren_));
  for (const ResultDataType* type : ResultCatalogue::Own().OfferedTypes(BuildResultMask(false)))
    if (const auto found = ticked.find(type->newDataType); found != ticked.end()) refreshed.push_back(*found->second);
  return refreshed;
}

bool COutputGridSeriesListKvf::RefreshItems() {
  Items refreshed = RefreshedChildren();
  if (refreshed == children_) return false;
  children_ = std::move(refreshed);
  return true;
}

bool COutputGridSeriesListKvf::IsTicked(int dataType) const {
  for (int number = 1; number <= GetItemCount(); ++number)
    if (GetItem(number)->DataType == dataType) return true;
  return false;
}

void COutputGridSeriesListKvf::SetTicked(int dataType, bool isTicked) {
  if (isTicked) {
    if (!IsTicked(dataType)) AddItem()->DataType = dataType;
    RefreshItems();
    return;
  }
  for (int number = GetItemCount(); number >= 1; --number)
    if (GetItem(number)->DataType == dataType) DeleteItem(number, 1);
}

std::vector<const ResultDataType*> COutputGridSeriesListKvf::SeriesTypes() const {
  return ResultCatalogue::Own().OfferedTypes(BuildResultMask(true));
}

const std::string& COutputGridSeriesListKvf::GetChoiceText() {
  const RequirementMask mask = BuildResultMask(true);
  if (mask == choicesAreOf_) return choiceText_;
  choicesAreOf_ = mask;
  choiceText_.clear();
  for (const ResultDataType* type : SeriesTypes())
    choiceText_ += fmt::format("{}\t{}\n", type->newDataType, type->name);
  return choiceText_;
}

void COutputGridSeriesListKvf::Save(KvfFile* file) {
  Items all = RefreshedChildren();
  std::swap(all, children_);
  CYbSEKvfListBase::Save(file);
  std::swap(all, children_);
}

void COutputGridSeriesListKvf::ExchangeKeys(KeyExchange& keys) {
  keys.Count("NumberOfItems", *this);
  // Old setups have all intervals here.
  auto& storing = static_cast<CStoringResultsKvf&>(*GetParent());
  float interval = 0;
  if (keys.Until(kLastVersionOfStoringSteps, "StoringTimeStep1", interval))
    storing.WM_OverlandFrequency = storing.WM_PrecFrequency = interval;
  if (keys.Until(kLastVersionOfStoringSteps, "StoringTimeStep2", interval)) storing.WM_FHeadsFrequency = interval;
  if (keys.Until(kLastVersionOfStoringSteps, "StoringTimeStep3", interval)) storing.WM_FluxesFrequency = interval;
}

}  // namespace tervane
