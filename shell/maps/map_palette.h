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
#include "shell/widgets/shown_unit.h"

namespace tervane {

/// Borders of 5 to 10 classes of one width around these values, ascending, at numbers that people like; of two equal
/// values that one alone.
std::vector<double> ClassBorders(double smallest, double largest);
/// A number with as many decimals as multiples of the step need.
QString NumberInSteps(double value, double step);

/// From low to high, `part` within 0 and 1; `Ramp::OfQuantity` as `Amounts`.
QRgb RampColor(double part, Ramp ramp = Ramp::Amounts);
/// Colours that are told apart side by side, one for each whole number from 0.
QRgb CodeColor(std::size_t ordinal);

struct LegendRow {
  QColor color;
  QString text;
};

/// What the legend says of one layer.
struct LegendBlock {
  static constexpr std::size_t kMostRows = 1000;  ///< Of kinds.

  QString title;
  std::vector<LegendRow> rows;  ///< From the top down.
  std::size_t hidden = 0;       ///< Kinds that are left out.
  bool isScale = false;         ///< The rows are classes of one scale, drawn without gaps.
  bool areLines = false;
  double opacity = 1;

  /// Adds a kind, or counts it where there are too many.
  void Add(const QColor& color, const QString& text);
};

/// "Elevation [m]"
QString TitleWithUnit(QString title, const std::string& unit);

/// Colours of numbers by a `ValueScale`.
class ValueColors {
 public:
  ValueColors() = default;
  /// `units` are the user's; null for base units.
  ValueColors(const ValueScale& scale, const std::vector<double>& values, const DisplayUnits* units);

  const LegendBlock& Legend() const { return legend_; }
  /// The place of the value's colour among `Colors`.
  std::size_t Number(double value) const;
  /// What a user reads of the value: its name, or the number with its unit.
  QString TextOf(double value) const;
  const std::vector<QColor>& Colors() const { return colors_; }

 private:
  void MakeKinds(const std::vector<double>& values);
  void MakeClasses(const std::vector<double>& values);

  std::vector<std::pair<double, std::string>> names_;
  ShownUnit unit_{0, 0, nullptr};
  std::vector<double> borders_;  ///< In the stored unit, one more than classes.
  std::vector<QColor> colors_;   ///< The last one is that of kinds without a name.
  LegendBlock legend_;
};

/// A colour for each value of a grid. Colours go by numbers from 1; 0 is an empty cell.
class MapPalette {
 public:
  static constexpr int kMostColors = 255;  ///< Codes beyond share colours.

  /// Looks through all cells, which takes its time for a large grid.
  static MapPalette Of(const GridLayer& layer, const DisplayUnits* units);

  std::uint8_t ColorNumber(float value) const;
  /// Splits each colour into as many, from its darkest to its lightest; `Shaded` tells them apart.
  static constexpr int kShades = 16;
  void MakeShades();
  std::uint8_t Shaded(std::uint8_t colorNumber, int shade) const {
    return colorNumber == 0 ? colorNumber : static_cast<std::uint8_t>(1 + (colorNumber - 1) * kShades + shade);
  }
  /// Opaque colours by their numbers, and a transparent one in front.
  const std::vector<QRgb>& Colors() const { return colors_; }
  /// What the user reads, from the top down: classes from the highest to the lowest, codes ascending.
  const LegendBlock& Legend() const { return legend_; }
  /// Single cells count: coarser levels must not lose them.
  bool KeepsSingleCells() const { return kind_ != Kind::Classes && kind_ != Kind::Scale; }

 private:
  enum class Kind { Classes, Scale, Codes, Highlighted, OwnClasses };

  void MakeClasses(const GridLayer& layer, const ShownUnit& unit);
  void MakeScale(const std::vector<ScaleClass>& classes, const ShownUnit& unit);
  void MakeCodes(const GridLayer& layer);
  void MakeHighlighted(const GridLayer& layer);
  void MakeOwnClasses(const std::vector<CellClass>& classes);

  Kind kind_ = Kind::Classes;
  float deleteValue_ = 0;
  std::vector<double> borders_;  ///< Of the classes, in the stored unit: one more than classes.
  double perClass_ = 0;          ///< Classes for one stored unit.
  std::vector<float> upTo_;      ///< The largest values of the classes of a scale with borders of its own.
  std::vector<unsigned> codes_;
  std::vector<std::uint8_t> colorOfCode_;  ///< By the code, of small codes.
  float highlighted_ = 0;
  std::vector<float> ownValues_;  ///< Of the classes that a layer has itself.
  std::vector<QRgb> colors_;
  LegendBlock legend_;
};

}  // namespace tervane
