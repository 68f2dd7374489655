// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "access/setup_accessor.h"

#include "access/ole_date.h"
#include "simspec/basic_parameters.h"
#include "simspec/periods.h"
#include "simspec/time_step_control.h"
#include "spatial/zone_source.h"

namespace tervane {

const CTVNKvfAccessor::Place CTVNKvfAccessor::kDetentionStorage{"Overland", "DetentionStorage"},
    CTVNKvfAccessor::kManningNum{"Overland", "Manning"}, CTVNKvfAccessor::kOLLeakageCoeff{"Overland", "LeakageCoeff"},
    // Before version 14 it stood with the land use, as PavedRunoffCoefficient.
    CTVNKvfAccessor::kPavedRunoffCoeff{"DRRUNOFFCOEFFICIENT", ""},
    CTVNKvfAccessor::kSoilDistribution{"Unsatzone", "UZSoilProfiles"};

namespace {

CCompControlParaTimeStepKvf* TimeStepsOf(const CGlobal& root) {
  const auto* parameters = root.Important(kBasicParameters);
  return parameters ? parameters->Child<CCompControlParaTimeStepKvf>() : nullptr;
}

CYbSEKvfBase* ChildOf(const CYbSEKvfBase* parent, std::string_view section) {
  for (CYbSEKvfBase* child = parent ? parent->GetFirstChild() : nullptr; child; child = parent->GetNextChild(child))
    if (child->GetSectionName() == section) return child;
  return nullptr;
}

}  // namespace

CData2DKvf* CTVNKvfAccessor::GetNds2Kvf(std::string_view importantName, std::string_view section) const {
  return dynamic_cast<CData2DKvf*>(ChildOf(Root().GetImportantNode(importantName), section));
}

CTVNKvfAccessor::Source CTVNKvfAccessor::At(const Place& place) const {
  CYbSEKvfBase* node = Root().GetImportantNode(place.importantName);
  if (!place.section.empty()) node = ChildOf(node, place.section);
  if (const auto* quantity = dynamic_cast<const CData2DKvf*>(node))
    return {&quantity->GridFile(), quantity->Type == CData2DKvf::kGridFile};
  if (const auto* zones = dynamic_cast<const ZoneSource*>(node))
    return {&zones->GridFile(), zones->Type == ZoneSource::kGridCodes};
  return {};
}

int CTVNKvfAccessor::GetFile(const Place& place, std::string& file, int& item) const {
  const Source source = At(place);
  if (!source.file || !source.isInForce) return 0;
  file = source.file->File.IsEmpty() ? std::string() : source.file->File.Absolute();
  item = source.file->SelectedItem();
  return 1;
}

int CTVNKvfAccessor::SetFile(const Place& place, const std::string& file) {
  const Source source = At(place);
  if (!source.file) return 0;
  source.file->Choose(FileName::Picked(file, Root().SetupFolder()));
  return 1;
}

int CTVNKvfAccessor::GetSimPeriod(double& start, double& end) const {
  const auto* period = Root().Important(kSimulationPeriod);
  if (!period) return 0;
  start = OleDateOf(period->SIMSTART);
  end = OleDateOf(period->SIMEND);
  return 1;
}

int CTVNKvfAccessor::SetSimPeriod(double start, double end) {
  auto* period = Root().Important(kSimulationPeriod);
  const CYbDateTime from = FromOleDate(start), until = FromOleDate(end);
  if (!period || !from.IsValid() || !until.IsValid()) return 0;
  period->SIMSTART = from;
  period->SIMEND = until;
  return 1;
}

int CTVNKvfAccessor::GetTimeStepInfo(float& initial, float& overland, float& unsaturated, float& saturated) const {
  const auto* steps = TimeStepsOf(Root());
  if (!steps) return 0;
  initial = steps->InitialTimeStep;
  overland = steps->MaxAllowedOLTimeStep;
  unsaturated = steps->MaxAllowedUZTimeStep;
  saturated = steps->MaxAllowedSZTimeStep;
  return 1;
}

int CTVNKvfAccessor::SetTimeStepInfo(float initial, float overland, float unsaturated, float saturated) {
  auto* steps = TimeStepsOf(Root());
  if (!steps) return 0;
  steps->InitialTimeStep = initial;
  steps->MaxAllowedOLTimeStep = overland;
  steps->MaxAllowedUZTimeStep = unsaturated;
  steps->MaxAllowedSZTimeStep = saturated;
  return 1;
}

int CTVNKvfAccessor::GetTSIncrementRate(double& rate) const {
  const auto* steps = TimeStepsOf(Root());
  if (!steps) return 0;
  rate = static_cast<double>(steps->IncrementRate);
  return 1;
}

int CTVNKvfAccessor::SetTSIncrementRate(double rate) {
  auto* steps = TimeStepsOf(Root());
  if (!steps) return 0;
  steps->IncrementRate = static_cast<float>(rate);
  return 1;
}

int CTVNKvfAccessor::GetPrecipitationDependentTS(double& precipitation, double& infiltration, double& threshold) const {
  const auto* steps = TimeStepsOf(Root());
  if (!steps) return 0;
  precipitation = static_cast<double>(steps->MaxPrecDepthPerTimeStep);
  infiltration = static_cast<double>(steps->MaxInfiltDepthPerTimeStep);
  threshold = static_cast<double>(steps->PrecThresholdRate);
  return 1;
}

int CTVNKvfAccessor::SetPrecipitationDependentTS(double precipitation, double infiltration, double threshold) {
  auto* steps = TimeStepsOf(Root());
  if (!steps) return 0;
  steps->MaxPrecDepthPerTimeStep = static_cast<float>(precipitation);
  steps->MaxInfiltDepthPerTimeStep = static_cast<float>(infiltration);
  steps->PrecThresholdRate = static_cast<float>(threshold);
  return 1;
}

}  // namespace tervane
