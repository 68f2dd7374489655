// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Rivers and lakes: which files of the river model a setup couples to, and which areas its rivers flood. With the own
// engine and with Modflow these are two nodes, of which one takes part.
#pragma once

#include <string>

#include "core/node.h"
#include "platform/files.h"
#include "simspec/river_files.h"

namespace tervane {

/// With the own engine: a river simulation. Flags are 0 or 1.
class CRiverKvf : public CYbSEKvfBase, public RiverFiles {
 public:
  explicit CRiverKvf(CYbSEKvfBase* parent);

  FileName Filename;    ///< The river simulation file; changed by `SetRiverFile` alone.
  FileName FilenameWQ;  ///< The same for water quality.
  // Areas that are flooded.
  int Bathymetry = 0;
  int FloodCodes = 0;

  const FileName& GetFilename() const override { return Filename; }
  const FileName& GetFilenameWQ() const override { return FilenameWQ; }
  /// Takes another river simulation file. Maps that draw the setup's rivers go on drawing the network of the old one
  /// where a project takes the place of a simulation.
  void SetRiverFile(FileName file);

  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// With a Modflow engine: a river network.
class CRiverMFKvf : public CYbSEKvfBase, public RiverNetworkFile {
 public:
  explicit CRiverMFKvf(CYbSEKvfBase* parent);

  FileName Filename;
  int IncludeMap = 0;  ///< The page shows the rivers on a map.

  const FileName& GetFilename() const override { return Filename; }
  void SetFilename(FileName file) { Filename = std::move(file); }
  /// Writes a network without branches, over the area of the model domain.
  FileResult CreateNetworkFile(const std::string& path) const;

  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

}  // namespace tervane
