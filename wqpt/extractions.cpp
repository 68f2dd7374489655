// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "wqpt/extractions.h"

#include "simspec/conditions.h"
#include "simspec/pages.h"
#include "simspec/periods.h"
#include "wqpt/pages.h"

namespace tervane {

namespace {

/// The computational layers, whose number a new job takes.
constexpr ImportantName<CYbSEKvfListBaseInterface> kCountedLayers{"VER_DISCR_LAYER_GEO"};

constexpr RepeatedKeys kWellNames{"WellNames", "NumberOfWellNames", "wellname"};
constexpr RepeatedKeys kWellFieldNames{"WellfieldNames", "NumberOfWellFieldNames", "wellfieldname"};
constexpr RepeatedKeys kRegistrationCodeKeys{"RegCodes", "NumberOfRegCodes", "regcode"};
constexpr RepeatedKeys kSinkCodeKeys{"SinkCodes", "NumberOfSinkCodes", "sinkcode"};
constexpr RepeatedKeys kParticles{"Particle_IDs", "NumberOfParticleIDs", "id"};

Condition ExtractionsOffered() {
  return Component(&CModelCompKvf::WQ) && Method(&CModelCompKvf::ADPTRadio, kParticleTracking);
}

}  // namespace

ExtractionItemKvf::ExtractionItemKvf(std::string title, CYbSEKvfBase* parent)
    : CYbSEKvfGroupBase(std::move(title), "Extraction_%d", parent) {}

void ExtractionItemKvf::ExchangeKeys(KeyExchange& keys) {
  keys("Name", Name);
  keys("Comment", Comment);
}

// ---- Registrations

CResultsPTRegExtractionItemKvf::CResultsPTRegExtractionItemKvf(CYbSEKvfBase* parent)
    : ExtractionItemKvf("ResultsPTRegExtractionItem", parent) {
  SetPage(kRegistrationExtractionPage);
  if (const auto* layers = Important(kCountedLayers)) BottomLayer = layers->GetItemCount();
  if (const auto* period = Important(kParticleTrackingPeriod)) {
    StartDate = period->SimStart;
    EndDate = period->SimEnd;
    constexpr float kDaysOfYear = 365;
    EndYear = static_cast<float>((EndDate - StartDate).InDays()) / kDaysOfYear;
  }
}

void CResultsPTRegExtractionItemKvf::ExchangeKeys(KeyExchange& keys) {
  ExtractionItemKvf::ExchangeKeys(keys);
  keys("SeparateFilesCheck", SeparateFilesCheck);
  keys("SepatateLayerFilesCheck", SepatateLayerFilesCheck);
  keys("AdditionalTextFile", AdditionalTextFile);
  keys("AllLayerExtractionCheck", AllLayerExtractionCheck);
  keys("TopLayer", TopLayer);
  keys("BottomLayer", BottomLayer);
  keys("AllRelDateExtractionCheck", AllRelDateExtractionCheck);
  keys("AllTrvTimesExtrCheck", AllTrvTimesExtrCheck);
  keys.Day("StartDate", StartDate);
  keys.Day("EndDate", EndDate);
  keys("StartYear", StartYear).Unit("years");
  keys("EndYear", EndYear).Unit("years");
  keys("OnlyRemovedByWellCheck", OnlyRemovedByWellCheck);
  keys("ExtrByWellCheck", ExtrByWellCheck);
  keys("ExtrAllWellsCheck", ExtrAllWellsCheck);
  keys("ExtrBySinkCodeCheck", ExtrBySinkCodeCheck);
  keys("ExtrAllSinkCodesCheck", ExtrAllSinkCodesCheck);
  keys("ExtrByWellFieldCheck", ExtrByWellFieldCheck);
  keys("ExtrAllWellFieldsCheck", ExtrAllWellFieldsCheck);
  keys("ExtrByRegCodeCheck", ExtrByRegCodeCheck);
  keys("ExtrAllRegCodesCheck", ExtrAllRegCodesCheck);
  keys.Repeated(kWellNames, WellNames);
  keys.Repeated(kWellFieldNames, WellFieldNames);
  keys.Repeated(kRegistrationCodeKeys, RegCodes);
  keys.Repeated(kSinkCodeKeys, SinkCodes);
}

CResultsPTRegExtractionKvf::CResultsPTRegExtractionKvf(CYbSEKvfBase* parent)
    : ExtractionListKvf("PT Registration Extraction", "PT_Reg_Extraction", parent) {
  SetPage(kRegistrationExtractionsPage);
  TakesPartWhen(ExtractionsOffered());
}

// ---- Pathlines

CResultsPTPathlineExtractionItemKvf::CResultsPTPathlineExtractionItemKvf(CYbSEKvfBase* parent)
    : ExtractionItemKvf("ResultsPTPathlineExtractionItem", parent) {
  SetPage(kPathlineExtractionPage);
}

void CResultsPTPathlineExtractionItemKvf::ExchangeKeys(KeyExchange& keys) {
  ExtractionItemKvf::ExchangeKeys(keys);
  keys("CreateTextFile", CreateTextFile);
  // Files without the key make none; a new job does.
  keys.OrZero("CreateXMLFile", CreateXMLFile);
  keys("CompressedXMLFormat", CompressedXMLFormat);
  keys("ExtrAllParticlesCheck", ExtrAllParticlesCheck);
  keys.Repeated(kParticles, ParticleIDs);
}

CResultsPTPathlineExtractionKvf::CResultsPTPathlineExtractionKvf(CYbSEKvfBase* parent)
    : ExtractionListKvf("PT Pathline Extraction", "PT_Pathline_Extraction", parent) {
  SetPage(kPathlineExtractionsPage);
  TakesPartWhen(ExtractionsOffered());
}

void CResultsPTPathlineExtractionKvf::ExchangeKeys(KeyExchange& keys) {
  keys.WriteOnly("NumberOfExtractions", GetItemCount());
}

}  // namespace tervane
