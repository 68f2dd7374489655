// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What grows where: the leaf area index and the root depth, as constants, over time, by a sequence of crops, or for
// each cell; and the parameters of evapotranspiration.
#pragma once

#include <array>
#include <memory>
#include <vector>

#include "spatial/data_use.h"
#include "spatial/file_nodes.h"
#include "spatial/station_owner.h"
#include "surface/crop_list.h"

namespace tervane {

/// Texts of the three forms in time; in the file one higher.
inline constexpr KeyChoice kVegetationForms[] = {
    {0, "Constant"}, {1, "Timeseries file"}, {2, "Vegetation property file (.etv)"}};
/// Texts of the distributions; in the file one higher.
inline constexpr KeyChoice kVegetationDistributions[] = {
    {0, "Uniform"}, {1, "Station based"}, {2, "Fully distributed", false}};

/// How vegetation develops, of the whole model or of one station, for the node to derive from: its keys, and the two
/// series and the sequence of crops as children of the node.
class VegetationCourse {
 public:
  enum Form : int { kConstant = 0, kTimeVarying = 1, kCrops = 2 };

  float FIXED_VALUE_LAI = 0;
  float FIXED_VALUE_RD = 0;
  int TYPE;

  CYbSEKvfBase& CourseNode() const { return node_; }
  CFMData0DFile& LaiFile() const { return *laiFile_; }
  CFMData0DFile& RootDepthFile() const { return *rootDepthFile_; }
  CVegetationListKvf& Crops() const { return *crops_; }
  /// The course is in force, and of that form.
  Condition IsOfForm(Form form) const { return isInForce_ && Is(TYPE, form); }

 protected:
  VegetationCourse(Form form, Condition isInForce, CYbSEKvfBase& node);
  ~VegetationCourse() = default;
  VegetationCourse(const VegetationCourse&) = delete;
  VegetationCourse& operator=(const VegetationCourse&) = delete;

  void ExchangeCourseKeys(KeyExchange& keys);

 private:
  CYbSEKvfBase& node_;
  Condition isInForce_;
  CFMData0DFile *laiFile_, *rootDepthFile_;
  CVegetationListKvf* crops_;
};

/// The vegetation of the whole model.
class CVegetationGlobalKvf : public CTvnKvfBase, public VegetationCourse {
 public:
  /// `distribution` is the owner's.
  CVegetationGlobalKvf(const int& distribution, CYbSEKvfBase* parent);

 protected:
  void ExchangeKeys(KeyExchange& keys) override { ExchangeCourseKeys(keys); }
};

/// The vegetation of a station.
class CVegetationTimeSeriesKvf : public StationKvf, public VegetationCourse {
 public:
  explicit CVegetationTimeSeriesKvf(CYbSEKvfBase* parent);

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// Grids of both quantities.
class CVegetationFullyDistKvf : public CTvnKvfBase {
 public:
  /// `distribution` is the owner's.
  CVegetationFullyDistKvf(const int& distribution, CYbSEKvfBase* parent);

  enum Temporal : int { kConstant = 0, kTimeVarying = 1 };
  int TYPE = kConstant;

  CFMData2DNdsFile& LaiFile() const { return *files_[0]; }
  CFMData2DNdsFile& RootDepthFile() const { return *files_[1]; }

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  std::array<CFMData2DNdsFile*, 2> files_;
};

/// The parameters of evapotranspiration.
struct EvapotranspirationParameters {
  double C1 = 0.3;
  double C2 = 0.2;
  double C3 = 20;
  double C_INT = 0.05;     ///< What leaves hold of rain, for each area of leaves.
  double A_ROOT = 0.25;    ///< How fast roots thin out with depth.
  double ETReduced = 1.0;  ///< The part of the deficit below which roots take up less.

  bool operator==(const EvapotranspirationParameters&) const = default;
};

/// The vegetation.
class CVegetationKvf : public StationOwnerKvf, public EvapotranspirationParameters, public ForcingNode {
 public:
  explicit CVegetationKvf(CYbSEKvfBase* parent);

  CVegetationGlobalKvf& Global() const { return *global_; }
  CVegetationFullyDistKvf& FullyDistributed() const { return *fully_; }

  std::shared_ptr<CFMSEKvfGroupBase> CreateStationItem() override;
  /// Both quantities. Grids that do not change drive nothing over time.
  std::vector<Forcing> CurrentForcings() const override;

 protected:
  KeyChoices Distributions() const override { return kVegetationDistributions; }
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  CVegetationGlobalKvf* global_;
  CVegetationFullyDistKvf* fully_;
};
inline constexpr ImportantName<CVegetationKvf> kVegetation{"VEGETATION"};

}  // namespace tervane
