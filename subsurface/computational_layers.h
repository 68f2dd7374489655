// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What the saturated zone is divided into from the top down for the computation. A setup holds two lists side by side,
// of which one counts: layers that follow the geological ones, and layers with lower levels of their own. Each layer
// has its initial conditions and its boundary.
#pragma once

#include "core/named_item.h"
#include "subsurface/boundary.h"

namespace tervane {

class CGeoLayerSZKvf;

class CSZVerDiscrLayerKvf : public NamedItemKvf {
 public:
  int id = -1;

  CGeoDataBoundCondListKvf& OuterBoundary() const { return *outerBoundary_; }

 protected:
  CSZVerDiscrLayerKvf(std::string title, const char* helpPage, CYbSEKvfBase* parent);
  /// The initial conditions, the boundaries, and what the Modflow engines ask for.
  void MakeConditions();

 private:
  CGeoDataBoundCondListKvf* outerBoundary_ = nullptr;
};

// ---- Layers that follow the geological layers

class CSZVerDiscrLayerGeoItemKvf : public CSZVerDiscrLayerKvf {
 public:
  explicit CSZVerDiscrLayerGeoItemKvf(CYbSEKvfBase* parent);

  // No page shows these; they are kept as the file has them.
  int ModLayAvg = 0;
  int ModLayCon = 0;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// Row by row the geological layers' list: who changes one by rows changes the other. A file's counts stand for
/// themselves.
class CSZVerDiscrLayerGeoListKvf : public NamedListKvf<CSZVerDiscrLayerGeoItemKvf> {
 public:
  explicit CSZVerDiscrLayerGeoListKvf(CYbSEKvfBase* parent);

  /// Takes the number and the names of the geological layers; further layers go, with their conditions.
  void BringInStep(const CGeoLayerSZKvf& geology);

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys.Count("NumberOfLayers", *this); }
};
inline constexpr ImportantName<CSZVerDiscrLayerGeoListKvf> kComputationalLayersOfGeology{"VER_DISCR_LAYER_GEO"};

// ---- Layers with lower levels of their own

class CSZVerDiscrLayerItemKvf : public CSZVerDiscrLayerKvf {
 public:
  explicit CSZVerDiscrLayerItemKvf(CYbSEKvfBase* parent);

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

class CSZVerDiscrLayerListKvf : public NamedListKvf<CSZVerDiscrLayerItemKvf> {
 public:
  explicit CSZVerDiscrLayerListKvf(CYbSEKvfBase* parent);

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys.Count("NumberOfLayers", *this); }
};

}  // namespace tervane
