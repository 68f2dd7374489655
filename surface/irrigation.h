// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Irrigation: which areas are watered from which sources, how much water they want, and whose want comes first.
#pragma once

#include <span>
#include <string>
#include <vector>

#include "core/list.h"
#include "spatial/data2d.h"
#include "spatial/data_use.h"
#include "spatial/zones.h"

namespace tervane {

// ---- Command areas

/// The series that caps what a source may deliver. Setups written before version 9 hold none.
class CIrrCommandAreaData0DFile : public CFMData0DFile {
 public:
  using CFMData0DFile::CFMData0DFile;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// A source of water. It keeps the values of all four kinds; its kind says which count. Flags are 0 or 1.
class CIrrCommandAreasPropSourceItemKvf : public CYbSEKvfBase {
 public:
  explicit CIrrCommandAreasPropSourceItemKvf(CYbSEKvfBase* parent);

  enum Kind : int { kRiver = 1, kSingleWell = 2, kShallowWell = 3, kExternal = 4 };
  enum Application : int { kSprinkler = 1, kDrip = 2, kSheet = 3 };
  enum Directness : int { kDirect = 1, kOnSheet = 2 };

  int SourceTypeCode = kRiver;
  int WaterApplication = kSprinkler;
  int DirectApplication = kDirect;

  // A reach of a river.
  std::string RiverNameRS;
  float UpstreamChainageRS = 0;
  float DownstreamChainageRS = 0;
  float CapacityRS = 0;
  int UseThresholdDischargeRateRS = 1;
  float ThresholdDischargeRateStopRS = 0;
  float ThresholdDischargeRateRestartRS = 0;
  int UseThresholdStageRS = 0;
  float ThresholdStageStopRS = 0;
  float ThresholdStageRestartRS = 0;

  // One well at a place.
  float WellXposSIWS = 0;
  float WellYposSIWS = 0;
  float ScreenTopDepthSIWS = 0;
  float CapacitySIWS = 0;
  float ThresholdDepthSIWS = 0;
  float ScreenBottomDepthSIWS = 0;

  // Wells all over the area.
  float ScreenTopDepthSWS = 0;
  float ThresholdDepthSWS = 0;
  float CapacitySWS = 0;
  float ScreenBottomDepthSWS = 0;

  // Water from outside the model.
  float CapacityES = 0;

  int IrrigationLicenseIncluded = 0;  ///< A series caps what the source may deliver.

  CIrrCommandAreaData0DFile& LicenseFile() const { return *licenseFile_; }

  /// How water is applied, in the one choice that users see; two keys hold it.
  int ShownApplication() const { return DirectApplication == kDirect ? WaterApplication : kSheet; }
  void SetShownApplication(int application);

  /// Warns of a reach that the river network does not have.
  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  CIrrCommandAreaData0DFile* licenseFile_;
};

inline constexpr KeyChoice kSourceKinds[] = {{CIrrCommandAreasPropSourceItemKvf::kRiver, "River"},
                                             {CIrrCommandAreasPropSourceItemKvf::kSingleWell, "Single well"},
                                             {CIrrCommandAreasPropSourceItemKvf::kShallowWell, "Shallow well"},
                                             {CIrrCommandAreasPropSourceItemKvf::kExternal, "External"}};
inline constexpr KeyChoice kShownApplications[] = {{CIrrCommandAreasPropSourceItemKvf::kSprinkler, "Sprinkler"},
                                                   {CIrrCommandAreasPropSourceItemKvf::kDrip, "Drip"},
                                                   {CIrrCommandAreasPropSourceItemKvf::kSheet, "Sheet"}};

/// The sources of an area, in the order in which they are drawn on. A new list has one.
class CIrrCommandAreasPropSourceListKvf : public CYbSEKvfListBase<CIrrCommandAreasPropSourceItemKvf> {
 public:
  explicit CIrrCommandAreasPropSourceListKvf(CYbSEKvfBase* parent);

  /// A setup that does not count the sources has none.
  void LoadSize(KvfNode* /*section*/) override { SetItemCount(0, 1); }
  void SaveSize(KvfFile* /*file*/) override {}

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys.Count("NumberOfSources", *this); }
};

/// An area with sources of its own.
class CIrrCommandAreasPropKvf : public CodedZoneProp {
 public:
  explicit CIrrCommandAreasPropKvf(CYbSEKvfBase* parent);

  CIrrCommandAreasPropSourceListKvf& Sources() const { return *sources_; }
  /// Whether a source waters another area than this one.
  bool HasSheetApplication() const;

 private:
  CIrrCommandAreasPropSourceListKvf* sources_;
};

/// The areas that are watered. What drives the model over time is the licenses of their sources.
class CIrrCommandAreasKvf : public CodedZonesKvf, public ForcingNode {
 public:
  explicit CIrrCommandAreasKvf(CYbSEKvfBase* parent);

  std::vector<Forcing> CurrentForcings() const override;
};

// ---- Demands

class CIrrDemandPropKvf;

/// A value of a demand: what a kind of demand asks for, as a constant or as a series.
struct DemandValue {
  int demandType;
  std::string_view key;  ///< Of the constant.
  float CIrrDemandPropKvf::*constant;
  int itemType;
  const char* fileSection;
  const char *constantLabel, *fileLabel;
  const char* chartTitle;
};

/// A zone with a way of its own to tell how much water is wanted.
class CIrrDemandPropKvf : public CodedZoneProp {
 public:
  explicit CIrrDemandPropKvf(CYbSEKvfBase* parent);

  enum Kind : int { kUserSpecified = 1, kMaxAllowedDeficit = 2, kCropStressFactor = 3, kPondingDepth = 4 };
  enum Reference : int { kSaturated = 1, kFieldCapacity = 2 };
  enum Temporal : int { kConstant = 1, kSeries = 2, kVegetationProperties = 3 };

  int DemandType = kUserSpecified;
  int DemandReferenceMoistureContent = kSaturated;
  int TYPE = kConstant;
  float DemandMoistureDeficitStartConst = 0;
  float DemandMoistureDeficitEndConst = 0;
  float DemandConstValue = 0;
  float CropStressFactorConstValue = 0;
  float PondingDepthConstValue = 0;

  /// All values, in the order of their files.
  static std::span<const DemandValue> Values();
  CFMData0DFile& FileOf(const DemandValue& value) const;
  /// The file of the demand's kind, for an allowed deficit that at which irrigation begins; null for an unknown kind.
  CFMData0DFile* GetDemandFile() const;
  /// The file of the deficit at which irrigation ends; null for other kinds.
  CFMData0DFile* GetDemandEndFile() const;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  CFMData0DFile* DemandFile(std::size_t place) const;
};

/// The zones of demand.
class CIrrDemandKvf : public CodedZonesKvf, public ForcingNode {
 public:
  explicit CIrrDemandKvf(CYbSEKvfBase* parent);

  /// One for each kind of value that a zone asks for.
  std::vector<Forcing> CurrentForcings() const override;
};

// ---- Priorities

/// Codes of whose demand comes first: a map of zones without properties.
class CIrrPrioritiesKvf : public CodedZonesKvf {
 public:
  explicit CIrrPrioritiesKvf(CYbSEKvfBase* parent);
};

}  // namespace tervane
