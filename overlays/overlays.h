// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The backdrop of all maps: images, grids, shapes, rivers and wells below and above the data, and the area shown.
#pragma once

#include <string>

#include "core/list.h"
#include "simspec/river_files.h"
#include "spatial/domain.h"
#include "spatial/file_nodes.h"

namespace tervane {

/// A layer's file and whether it is shown.
class OverlayLayer : public CTvnKvfBase {
 public:
  using CTvnKvfBase::CTvnKvfBase;

  int Display = 1;
  /// The file that the layer names; empty when it has none.
  virtual const FileName& LayerFile() const = 0;
  /// The file that is shown: another one where the layer follows the setup; empty for none.
  virtual FileName ShownFile() const { return LayerFile(); }
};

class COverlayBMPKvf : public OverlayLayer {
 public:
  explicit COverlayBMPKvf(CYbSEKvfBase* parent) : OverlayLayer("Bitmap overlay", "OverlayBMP", parent) {}

  FileName Filename;
  double BMP_X0 = 0, BMP_X1 = 10000.0, BMP_Y0 = 0, BMP_Y1 = 10000.0;  ///< Left, right, bottom, top.
  int BMP_TransparentColor = 0xffffff;                                ///< Blue, green, red.
  int BMP_DisplayStyle = 0;

  const FileName& LayerFile() const override { return Filename; }

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

class COverlayGridKvf : public OverlayLayer {
 public:
  explicit COverlayGridKvf(CYbSEKvfBase* parent);

  float Transparency = 2.0F;

  CTvnData2DNdsFile& GridFile() const { return *file_; }
  const FileName& LayerFile() const override { return file_->File; }

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  CTvnData2DNdsFile* file_;
};

/// A colour, each part from 0 to 255.
struct OverlayColor {
  int r = 0, g = 0, b = 0;
};

class COverlayShapeKvf : public OverlayLayer {
 public:
  explicit COverlayShapeKvf(CYbSEKvfBase* parent);

  FileName Filename;
  std::string ItemDescr;   ///< The attribute that labels the shapes.
  int ShapeAxisUnit;       ///< Of the coordinates, a unit key of item 100187.
  float PointSize = 1.0F;  ///< Millimetres.
  int PointStyle = 0;
  int PointType = 7;
  OverlayColor PointColor, PointTextColor;
  float LineThickness = 0.3F;  ///< Millimetres.
  int LineStyle = 0;
  int PolygonStyle = 0;
  OverlayColor LineColor, LineTextColor;
  int LineTextColorOption = 0;
  int ShowLineText = 0;
  int PointTextBackground = 1, LineTextBackground = 1;  ///< 1 opaque.
  int PointTextColorOption = 0;
  int ShowPointText = 0;

  const FileName& LayerFile() const override { return Filename; }

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

class COverlayRiverKvf : public OverlayLayer {
 public:
  explicit COverlayRiverKvf(CYbSEKvfBase* parent) : OverlayLayer("River overlay", "OverlayRiver", parent) {}

  enum Source : int { kOfSetup = 0, kOwnFile = 1 };

  int SourceFvrNwkType = kOwnFile;
  FileName FvrNwkFilename_Specified;  ///< The own file.

  /// The file that leads to the network that is drawn; empty for none.
  FileName DrawnFile() const;
  /// The network, for one that is to stay with it: a layer that followed a river simulation keeps the network of that
  /// simulation as its own file from now on.
  FileName GetRiverFile();
  const FileName& LayerFile() const override { return FvrNwkFilename_Specified; }
  /// The network itself, also where a river simulation leads to it.
  FileName ShownFile() const override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

class COverlayWellKvf : public OverlayLayer {
 public:
  explicit COverlayWellKvf(CYbSEKvfBase* parent) : OverlayLayer("Well overlay", "OverlayWell", parent) {}

  enum Source : int { kOfSetup = 0, kOwnFile = 1 };

  FileName WellFilename;
  int Lables = 0;  ///< The wells' names are drawn.
  int SourceWellType = kOfSetup;

  const FileName& LayerFile() const override { return WellFilename; }
  /// Of the setup the wells of the saturated zone's method in use.
  FileName ShownFile() const override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// A layer of the backdrop. It holds all five kinds, so that a change of the kind loses nothing.
class COverlayItemKvf : public CTvnKvfBase {
 public:
  explicit COverlayItemKvf(CYbSEKvfBase* parent);

  enum Kind : int { kImage = 1, kGrid = 2, kShape = 3, kRiver = 4, kWell = 5 };

  int Type = kImage;

  /// The layer of the kind in force; null when the type is none.
  OverlayLayer* Layer() const;
  /// "Image Overlay"; that of any layer when the type is none.
  const std::string& GetTitle() const override;
  /// The page of the kind in force.
  const PageClass* GetDlgRuntimeClass(int treeId) const override;
  /// The kind, whether it is shown, and the file's name: "Disabled Grid: soil.nds2".
  const std::string& GetAbbreviatedTitle() const override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys("Type", Type); }

 private:
  mutable std::string shownTitle_;
};

/// The layers above or below the data.
class COverlayListKvf : public CYbSEKvfListBase<COverlayItemKvf>, public RiverFollowers {
 public:
  COverlayListKvf(std::string title, CYbSEKvfBase* parent);

  void StayWithRivers() override;
};
inline constexpr ImportantName<COverlayListKvf> kBackgroundOverlays{"BACKGROUND_OVERLAY_DATA"};
inline constexpr ImportantName<COverlayListKvf> kForegroundOverlays{"FOREGROUND_OVERLAY_DATA"};

/// How the data themselves are drawn.
class COverlayCurrentLayerGridKvf : public CTvnKvfBase {
 public:
  explicit COverlayCurrentLayerGridKvf(CYbSEKvfBase* parent) : CTvnKvfBase("Grid", "Grid", parent) {}

  float TransparencyVal = 0.5F;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};
inline constexpr ImportantName<COverlayCurrentLayerGridKvf> kCurrentLayerGrid{"OVERLAY_CURRENT_LAYER_GRID"};

class COverlayCurrentLayerKvf : public CYbSEKvfGroupBase {
 public:
  explicit COverlayCurrentLayerKvf(CYbSEKvfBase* parent);
};

/// The backdrop of all maps and the area that they show.
class COverlaysKvf : public CTvnKvfGroupBase, public DomainFollower {
 public:
  explicit COverlaysKvf(CYbSEKvfBase* parent);

  int UseModelDomain = 1;  ///< The maps show the model domain.
  // The shown area, which the root keeps and the view settings store.
  double x0 = 0, y0 = 0, x1 = 100.0, y1 = 100.0;

  COverlayListKvf& Foreground() const { return *foreground_; }
  COverlayListKvf& Background() const { return *background_; }
  /// Transparency of the data's grid.
  float CurrentTransparency() const;

  /// Sets one or all of the corners; the root is told, and its default area follows a change.
  void SetArea(const DataArea& area);
  void AdoptDomain(const Envelope& domain) override;

  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys("UseModelDomain", UseModelDomain); }
  void ExchangeState(KeyExchange& keys) override;

 private:
  COverlayListKvf* foreground_;
  COverlayListKvf* background_;
};
inline constexpr ImportantName<COverlaysKvf> kOverlays{kDomainFollower.text};

}  // namespace tervane
