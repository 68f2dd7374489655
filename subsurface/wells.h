// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "core/node.h"
#include "platform/files.h"

namespace tervane {

/// The pumping wells of a setup, which stand in a well parameter file (.WEL). One class serves the saturated zone on a
/// grid and that of reservoirs.
class CSZWellKvf : public CYbSEKvfBase {
 public:
  /// `areIncluded` is the owner's flag that says so.
  CSZWellKvf(const int& areIncluded, CYbSEKvfBase* parent);

  FileName Filename;
  int IncludeMap = 0;  ///< The page shows the wells on a map.

  const FileName& GetFilename() const { return Filename; }
  void SetFilename(FileName file) { Filename = std::move(file); }
  /// `FractureWells` of the saturated zone on a grid; 0 where there is none.
  int GetFractureWells() const;
  void SetFractureWells(int flag);
  /// Writes a file without wells over the area of the model domain.
  FileResult CreateWellFile(const std::string& path) const;

  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};
inline constexpr ImportantName<CSZWellKvf> kWells{"SZWELLS"};
inline constexpr ImportantName<CSZWellKvf> kReservoirWells{"SZWELLS_SUBCATCHMENT"};

/// Whether the setup has fracture wells, a value of `FractureWells`: 0 where the wells of the method in use take no
/// part.
int FractureWellsInUse(const CYbSEKvfBase& node);

}  // namespace tervane
