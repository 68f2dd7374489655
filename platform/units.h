// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Quantities and their units: what a number of a setup or a data file means, in which units a user may see and type it,
// and how units turn into each other. Files hold the numeric codes; `platform/units_table.cpp` says what they mean.
#pragma once

#include <map>
#include <optional>
#include <span>
#include <string>
#include <string_view>

namespace tervane {

/// What a unit measures. Units turn into each other only within one dimension.
enum class Dimension {
  Ratio,
  Length,
  Area,
  Volume,
  Time,
  Velocity,
  VolumePerTime,
  AreaPerTime,
  PerTime,
  PerLength,
  TimePerLength,
  Temperature,
  TemperaturePerLength,
  PerTemperature,
  MeltPerDegree,     ///< Depth of melt per degree and time.
  MeltPerRadiation,  ///< Depth of melt per energy that falls on an area.
  Roughness,         ///< Manning's number M, cube root of a length per time.
  Mass,
  MassPerTime,
  MassPerVolume,
  MassPerArea,
  MassPerAreaAndTime,
  VolumePerMass,
  Pressure,
  PowerPerArea,
};

/// How a unit relates to the coherent SI unit of its dimension (degree Celsius for temperatures):
/// value in SI = (value + offset) * numerator / denominator. The factor is a fraction, so that 3 mm are the double
/// nearest to 0.003 m.
struct UnitScale {
  Dimension dimension = Dimension::Ratio;
  double numerator = 1;
  double denominator = 1;
  double offset = 0;
};

/// The way from one unit to another, made once for many values.
class UnitConversion {
 public:
  double operator()(double value) const { return (value + before_) * numerator_ / denominator_ + after_; }

 private:
  friend std::optional<UnitConversion> ConversionBetween(const UnitScale& from, const UnitScale& to);
  double before_ = 0;
  double numerator_ = 1;
  double denominator_ = 1;
  double after_ = 0;
};

/// Nothing when the units measure different things.
std::optional<UnitConversion> ConversionBetween(const UnitScale& from, const UnitScale& to);

/// A unit of the table.
struct Unit {
  int key = 0;
  std::string_view text;          ///< "cubic meter per second", what choice lists show.
  std::string_view abbreviation;  ///< "m³/s", what stands behind a number; empty where nothing does.
  UnitScale scale;
  std::string_view udunits;  ///< "m3 s-1" for data files; empty where UDUNITS cannot say it.
  std::string_view aliases;  ///< Further spellings that UDUNITS does not know, separated by '|'.
};

/// A quantity of the table. Values are stored in its base unit, the first of its units.
struct ItemType {
  int code = 0;
  std::string_view name;
  std::span<const int> unitKeys;  ///< In the order of choice lists; never empty.
};

inline constexpr int kDimensionlessUnit = 99000;
inline constexpr int kWholeNumberUnit = 99013;

/// Both tables, by ascending code or key.
std::span<const ItemType> AllItemTypes();
std::span<const Unit> AllUnits();

/// Null when the code or key is unknown.
const ItemType* FindItemType(int code);
/// The quantity of that code or name, "100431" or "precipitation rate", as people type it; null when there is none.
const ItemType* FindItemType(std::string_view codeOrName);
const Unit* FindUnit(int key);

const Unit& BaseUnit(const ItemType& itemType);
bool AllowsUnit(const ItemType& itemType, int unitKey);
/// The item type's unit with that text ("meter"), or null.
const Unit* FindUnitByText(const ItemType& itemType, std::string_view text);

/// Both units must be of one dimension, as those of one item type are.
inline double Convert(double value, const Unit& from, const Unit& to) {
  return ConversionBetween(from.scale, to.scale).value()(value);
}

/// A unit that a text names.
struct ParsedUnit {
  UnitScale scale;
  const Unit* unit = nullptr;  ///< The first unit of the table that is the same, if any.
};

/// Reads a unit as a user types it or a foreign file names it: by the table's texts (in any case), abbreviations and
/// aliases, also in ASCII ("m3/s", "degC"), else by UDUNITS ("m^3 s-1", "10 km"). Nothing when neither knows it, or
/// when it measures none of our dimensions. UDUNITS takes some 10 ms to load when it is first asked.
std::optional<ParsedUnit> ParseUnit(std::string_view text);

/// A number in an item type's base unit, or why there is none, in words for the user who typed it.
struct ParsedQuantity {
  double value = 0;
  std::string error;

  bool Ok() const { return error.empty(); }
};

/// Reads "5" (in the display unit), "5 km" or "5km" (in the typed unit). Decimals stand behind a point, whatever the
/// process's locale. An item type of whole numbers takes nothing else.
ParsedQuantity ParseQuantity(std::string_view text, const ItemType& itemType, int displayUnitKey);

/// The same for a number in the unit of that text, as a label shows it: "hours", "[m/d]". Only a text that is no number
/// alone makes anybody read the unit, which costs UDUNITS its time to load.
ParsedQuantity ParseQuantity(std::string_view text, std::string_view unit);

/// A number as a printf format of one number says, or for an empty one the shortest text that reads back to the same
/// bits; the decimal point is a point in every locale.
std::string FormatNumber(double value, std::string_view format);

/// A value in the base unit as a number in the display unit, without the unit. `format` is one of printf's for one
/// number, "%.6g" "%.2f" "%e" "%d" (rounded to a whole number), or empty for the shortest text that reads back to the
/// same bits; the decimal point is a point in every locale.
std::string FormatQuantity(double baseValue, const ItemType& itemType, int displayUnitKey,
                           std::string_view format = "%.6g");

/// The units in which a user wants to see quantities; the base unit where nothing was chosen.
class DisplayUnits {
 public:
  /// The unit's key; of an item type that is not in the table the dimensionless unit.
  int UnitKey(int itemType) const;
  const Unit& UnitOf(const ItemType& itemType) const;

  /// False, and nothing changes, when the item type does not allow the unit.
  bool Choose(int itemType, int unitKey);
  void Reset(int itemType) { chosen_.erase(itemType); }

  /// The choices that differ from the base units, for the settings: "100180=1003 100431=2001".
  std::string Text() const;
  /// What the text holds that is no choice, or a choice that the tables do not allow, is left out and put into
  /// `ignored`, separated by blanks.
  static DisplayUnits FromText(std::string_view text, std::string& ignored);

  bool operator==(const DisplayUnits&) const = default;

 private:
  std::map<int, int> chosen_;
};

}  // namespace tervane
