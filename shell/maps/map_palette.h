// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The colours of a grid on a map and what its legend says of them.
#pragma once

#include <QColor>
#include <QString>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "forms/plots.h"
#include "platform/units.h"

namespace tervane {

/// The unit in which a user sees values that are stored in another one.
class ShownUnit {
 public:
  /// `units` are the user's; null for base units.
  ShownUnit(int itemType, int storedUnit, const DisplayUnits* units);

  double Shown(double stored) const { return toShown_(stored); }
  double Stored(double shown) const { return toStored_(shown); }
  /// "m³/s"; empty where nothing stands behind a number.
  const std::string& Text() const { return text_; }
  /// "412.5 m"
  QString Value(double stored) const;

 private:
  std::string text_;
  UnitConversion toShown_, toStored_;
};

/// The smallest of 1, 2, 2.5 or 5 times a power of ten that is not below.
double NiceStep(double atLeast);
/// Borders of 5 to 10 classes of one width around these values, ascending, at numbers that people like; of two equal
/// values that one alone.
std::vector<double> ClassBorders(double smallest, double largest);
/// A number with as many decimals as multiples of the step need.
QString NumberInSteps(double value, double step);

/// A colour for each value of a grid. Colours go by numbers from 1; 0 is an empty cell.
class MapPalette {
 public:
  struct Row {
    QColor color;
    QString text;
  };
  static constexpr int kMostColors = 255;  ///< Codes beyond share colours.
  static constexpr int kMostRows = 20;     ///< Of the codes in a legend.

  /// Looks through all cells, which takes its time for a large grid.
  static MapPalette Of(const GridLayer& layer, const DisplayUnits* units);

  std::uint8_t ColorNumber(float value) const;
  /// Opaque colours by their numbers, and a transparent one in front.
  const std::vector<QRgb>& Colors() const { return colors_; }
  /// What the user reads, from the top down: classes from the highest to the lowest, codes ascending.
  const std::vector<Row>& Legend() const { return legend_; }
  /// Codes that the legend leaves out.
  std::size_t HiddenCodes() const { return codes_.size() > kMostRows ? codes_.size() - kMostRows : 0; }
  /// The classes are parts of one scale, drawn without gaps.
  bool IsScale() const { return kind_ == Kind::Classes; }
  /// Single cells count: coarser levels must not lose them.
  bool KeepsSingleCells() const { return kind_ != Kind::Classes; }

 private:
  enum class Kind { Classes, Codes, Highlighted };

  void MakeClasses(const GridLayer& layer, const ShownUnit& unit);
  void MakeCodes(const CTvn2DOrthoRotatedGridData& grid);
  void MakeHighlighted(const GridLayer& layer);

  Kind kind_ = Kind::Classes;
  float deleteValue_ = 0;
  std::vector<double> borders_;  ///< Of the classes, in the stored unit: one more than classes.
  double perClass_ = 0;          ///< Classes for one stored unit.
  std::vector<unsigned> codes_;
  std::vector<std::uint8_t> colorOfCode_;  ///< By the code, of small codes.
  float highlighted_ = 0;
  std::vector<QRgb> colors_;
  std::vector<Row> legend_;
};

}  // namespace tervane
