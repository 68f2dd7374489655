// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The ground and the heads of a run as a scene of the program GeoScene3D.
#pragma once

#include <string>

#include "core/node.h"

namespace tervane {

/// The program that shows scenes: on Windows the one that is registered, elsewhere what the environment variable
/// TERVANE_GEOSCENE3D names. Empty where there is none.
std::string GeoSceneProgram();

/// How a scene is made. One node makes the scene of a preprocessed model, another one that of its results.
class CGeoScene3DKvf : public CTvnKvfBase {
 public:
  enum Mode : int { kOfModel = 0, kOfResults = 1 };
  CGeoScene3DKvf(int mode, CYbSEKvfBase* parent);

  enum Layers : int { kComputational = 0, kGeological = 1 };

  double VerticalExaggerationFactor = 30.0;
  int LayerType = kComputational;
  int ShowLenses = 0;
  int UseAllTimeSteps = 1;
  int ShowEveryTimeStep = 1;
  double Transparency = 0.3;

  bool IsOfResults() const { return mode_ == kOfResults; }
  /// When the viewer was there as this node was made.
  int IsDlgUsedInSetup() override { return hasViewer_ ? 1 : 0; }
  const PageClass* GetDlgRuntimeClass(int treeId) const override;

  /// Writes the scene. `stem` is the result folder and the name of the setup, as engines write it: what the grids of a
  /// run are called begins with it. "" or why there is no scene.
  std::string WriteScene(const std::string& stem, const std::string& path) const;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  int mode_;
  bool hasViewer_;
};

}  // namespace tervane
