// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <string_view>

#include "access/accessed_setup.h"
#include "spatial/data2d.h"

namespace tervane {

/// Reads and changes a few parameters of a setup for another program. All operations give 1, and 0 when a node or a
/// value is not there: then what was to be filled stays as it was.
class CTVNKvfAccessor {
 public:
  explicit CTVNKvfAccessor(Host* host = nullptr) : setup_(host) {}

  int OpenFile(const std::string& path) { return setup_.Open(path); }
  /// Always 1; whether it was saved is asked of `Error`.
  int SaveFile(const std::string& path) {
    setup_.Save(path);
    return 1;
  }
  const std::string& Error() const { return setup_.Error(); }
  void HookKvf(CGlobal* root) { setup_.Hook(root); }
  CGlobal& Root() const { return setup_.Root(); }

  /// The child with that section of an important node, where it is a quantity over the area; null where there is none.
  CData2DKvf* GetNds2Kvf(std::string_view importantName, std::string_view section) const;

  /// Begin and end of the simulation, in days since 1899-12-30.
  int GetSimPeriod(double& start, double& end) const;
  int SetSimPeriod(double start, double end);
  /// The initial time step and the greatest ones of overland flow, unsaturated and saturated zone, in hours.
  int GetTimeStepInfo(float& initial, float& overland, float& unsaturated, float& saturated) const;
  int SetTimeStepInfo(float initial, float overland, float unsaturated, float saturated);
  int GetTSIncrementRate(double& rate) const;
  int SetTSIncrementRate(double rate);
  /// The greatest depths of precipitation and infiltration in a time step, and the rate of precipitation from which on
  /// a step begins with it.
  int GetPrecipitationDependentTS(double& precipitation, double& infiltration, double& threshold) const;
  int SetPrecipitationDependentTS(double precipitation, double infiltration, double threshold);

  // Grid files. Reading answers where the quantity is given by one; writing selects item 1 of the file, and leaves the
  // quantity's source as it is.
  int GetDetentionStorageNds2(std::string& file, int& item) const { return GetFile(kDetentionStorage, file, item); }
  int SetDetentionStorageNds2(const std::string& file) { return SetFile(kDetentionStorage, file); }
  int GetManningNumNds2(std::string& file, int& item) const { return GetFile(kManningNum, file, item); }
  int SetManningNumNds2(const std::string& file) { return SetFile(kManningNum, file); }
  int GetOLLeakageCoeffNds2(std::string& file, int& item) const { return GetFile(kOLLeakageCoeff, file, item); }
  int SetOLLeakageCoeffNds2(const std::string& file) { return SetFile(kOLLeakageCoeff, file); }
  int GetPavedRunoffCoeffNds2(std::string& file, int& item) const { return GetFile(kPavedRunoffCoeff, file, item); }
  int SetPavedRunoffCoeffNds2(const std::string& file) { return SetFile(kPavedRunoffCoeff, file); }
  int GetUZSoilDistributionNds2(std::string& file, int& item) const { return GetFile(kSoilDistribution, file, item); }
  int SetUZSoilDistributionNds2(const std::string& file) { return SetFile(kSoilDistribution, file); }

 private:
  /// Where a grid file stands: the node of that name, or its child with that section.
  struct Place {
    std::string_view importantName, section;
  };
  static const Place kDetentionStorage, kManningNum, kOLLeakageCoeff, kPavedRunoffCoeff, kSoilDistribution;

  /// The file of a quantity or of zones, and whether it is their source; null where neither is there.
  struct Source {
    CTvnData2DNdsFile* file = nullptr;
    bool isInForce = false;
  };
  Source At(const Place& place) const;
  int GetFile(const Place& place, std::string& file, int& item) const;
  int SetFile(const Place& place, const std::string& file);

  AccessedSetup setup_;
};

}  // namespace tervane
