// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/units.h"

#include <algorithm>
#include <clocale>
#include <cmath>
#include <cstdlib>
#include <limits>
#include <memory>
#include <random>
#include <set>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

#include <gmock/gmock.h>
#include <udunits2.h>

#include "tests/support/temp_folder.h"

namespace tervane {
namespace {

const ItemType& Item(int code) {
  const ItemType* itemType = FindItemType(code);
  if (itemType == nullptr) throw std::out_of_range("no item type " + std::to_string(code));
  return *itemType;
}

const Unit& UnitOf(int key) {
  const Unit* unit = FindUnit(key);
  if (unit == nullptr) throw std::out_of_range("no unit " + std::to_string(key));
  return *unit;
}

TEST(UnitTable, CodesKeysAndNamesAreUnique) {
  std::set<int> codes;
  std::set<std::string_view> names;
  for (const ItemType& itemType : AllItemTypes()) {
    EXPECT_TRUE(codes.insert(itemType.code).second) << itemType.code;
    EXPECT_TRUE(names.insert(itemType.name).second) << itemType.name;
    EXPECT_EQ(FindItemType(itemType.code), &itemType);
  }
  std::set<int> keys;
  std::set<std::string_view> texts, abbreviations;
  for (const Unit& unit : AllUnits()) {
    EXPECT_TRUE(keys.insert(unit.key).second) << unit.key;
    EXPECT_TRUE(texts.insert(unit.text).second) << unit.text;
    if (!unit.abbreviation.empty()) {
      EXPECT_TRUE(abbreviations.insert(unit.abbreviation).second) << unit.abbreviation;
    }
    EXPECT_EQ(FindUnit(unit.key), &unit);
  }
}

TEST(UnitTable, UnknownCodesAndKeysAreNotFound) {
  for (const int code : {-1, 0, 998, 100002, 100187 + 1000000, std::numeric_limits<int>::max()}) {
    EXPECT_EQ(FindItemType(code), nullptr) << code;
  }
  for (const int key : {-1, 1, 999, 1999, 99004, 99014, std::numeric_limits<int>::min()}) {
    EXPECT_EQ(FindUnit(key), nullptr) << key;
  }
}

TEST(UnitTable, UnitsOfAnItemTypeMeasureTheSameAndAreToldApart) {
  for (const ItemType& itemType : AllItemTypes()) {
    ASSERT_FALSE(itemType.unitKeys.empty()) << itemType.name;
    std::set<int> keys;
    for (const int key : itemType.unitKeys) {
      EXPECT_TRUE(keys.insert(key).second) << itemType.name << " has twice " << key;
      const Unit* unit = FindUnit(key);
      ASSERT_NE(unit, nullptr) << itemType.name << " " << key;
      EXPECT_EQ(unit->scale.dimension, BaseUnit(itemType).scale.dimension) << itemType.name << ": " << unit->text;
      EXPECT_EQ(FindUnitByText(itemType, unit->text), unit);
      EXPECT_TRUE(AllowsUnit(itemType, key));
    }
  }
  EXPECT_FALSE(AllowsUnit(Item(kCoordinateItemType), 1400));
  EXPECT_EQ(FindUnitByText(Item(kCoordinateItemType), "second"), nullptr);
  EXPECT_EQ(FindUnitByText(Item(kCoordinateItemType), ""), nullptr);
}

TEST(UnitTable, EveryUnitCanBeChosenSomewhere) {
  for (const Unit& unit : AllUnits()) {
    EXPECT_TRUE(std::ranges::any_of(AllItemTypes(), [&](const ItemType& i) { return AllowsUnit(i, unit.key); }))
        << unit.key << " " << unit.text;
  }
}

// Result files and templates store these quantities in these units, and setups store numbers in the base unit.
TEST(UnitTable, QuantitiesOfFilesKeepTheirUnits) {
  struct Case {
    int itemType;
    int baseUnit;
    std::vector<int> furtherUnits;
  };
  const Case cases[] = {
      {999, 99000, {0, 99013}},
      {100001, 1800, {}},
      {100006, 2800, {2802}},
      {100007, 2203, {}},
      {100016, 2000, {}},
      {100017, 2200, {2203}},
      {100023, 99000, {}},
      {100025, 99000, {}},
      {100026, 3200, {}},
      {100035, 1600, {}},
      {100061, 2004, {}},
      {100062, 2004, {2000}},
      {100080, 4700, {}},
      {100134, 99000, {}},
      {100144, 99000, {}},
      {100146, 1002, {1000}},
      {100151, 4503, {}},
      {100180, 1000, {}},
      {100203, 6600, {}},
      {100212, 1402, {}},
      {100217, 1000, {}},
      {100239, 99000, {}},
      {100241, 4500, {4501}},
      {100274, 2000, {}},
      {100280, 1000, {}},
      {100292, 99000, {}},
      {100324, 1000, {}},
      {100353, 1000, {}},
      {100361, 2004, {2000}},
      {100364, 1000, {}},
      {100365, 1800, {}},
      {100366, 1000, {}},
      {100370, 99013, {}},
      {100376, 2004, {}},
      {100377, 99000, {}},
      {100378, 2004, {2000}},
      {100380, 1000, {}},
      {100381, 1002, {}},
      {100382, 99000, {}},
      {100383, 99000, {}},
      {100384, 2004, {}},
      {100385, 99000, {}},
      {100386, 1002, {}},
      {100387, 2004, {}},
      {100388, 4402, {}},
      {100389, 99011, {}},
      {100390, 1002, {}},
      {100392, 1002, {1000}},
      {100393, 4403, {}},
      {100394, 99013, {}},
      {100395, 99000, {}},
      {100396, 99013, {}},
      {100397, 4502, {}},
      {100398, 99000, {}},
      {100399, 1403, {1404}},
      {100400, 2000, {}},
      {100405, 99005, {}},
      {100409, 6101, {}},
      {100431, 2004, {2000}},
      {100437, 4400, {}},
      {110200, 3100, {}},
      {110210, 2200, {}},
      {110220, 1000, {}},
      {110230, 1600, {}},
      // Lengths of the pages' tables, and defaults that only make sense in one unit.
      {100143, 1000, {}},
      {100187, 1000, {}},
      {100030, 3700, {}},  // Manning number 10
      {100091, 1403, {}},  // time constant 14 and 365
      {100355, 3000, {}},  // root distribution 0.25
      {100358, 2004, {}},  // C3 = 20
      {100362, 2900, {}},  // time constant 0.001
      {100178, 3400, {}},  // degree-day coefficient 2
      {100189, 3300, {}},  // lapse rate -0.649
  };
  for (const Case& c : cases) {
    const ItemType* itemType = FindItemType(c.itemType);
    ASSERT_NE(itemType, nullptr) << c.itemType;
    EXPECT_EQ(BaseUnit(*itemType).key, c.baseUnit) << itemType->name;
    for (const int key : c.furtherUnits) EXPECT_TRUE(AllowsUnit(*itemType, key)) << itemType->name << " " << key;
  }
}

TEST(UnitTable, KeysOfFilesKeepTheirMeaning) {
  struct Case {
    int key;
    const char* text;
  };
  const Case cases[] = {
      {0, "undefined"},
      {1000, "meter"},
      {1002, "millimeter"},
      {1400, "second"},
      {1402, "hour"},
      {1403, "day"},
      {1404, "year"},
      {1600, "cubic meter"},
      {1800, "cubic meter per second"},
      {2000, "meter per second"},
      {2004, "millimeter per day"},
      {2200, "kilogram per cubic meter"},
      {2203, "gram per cubic meter"},
      {2800, "degree Celsius"},
      {2802, "kelvin"},
      {3100, "second per meter"},
      {3200, "square meter"},
      {4400, "gram per square meter"},
      {4402, "metric ton per hectare"},
      {4403, "kilogram per hectare"},
      {4500, "gram per square meter per second"},
      {4501, "gram per square meter per day"},
      {4502, "kilogram per hectare per day"},
      {4503, "metric ton per hectare per day"},
      {4700, "cubic meter per second per meter"},
      {6101, "hectopascal"},
      {6600, "watt per square meter"},
      {99000, "dimensionless"},
      {99005, "gram per gram"},
      {99011, "cubic meter per cubic meter"},
      {99013, "integer"},
  };
  for (const Case& c : cases) EXPECT_EQ(UnitOf(c.key).text, c.text) << c.key;
}

struct UtFree {
  void operator()(ut_system* system) const { ut_free_system(system); }
  void operator()(ut_unit* unit) const { ut_free(unit); }
  void operator()(cv_converter* converter) const { cv_free(converter); }
};

TEST(UnitTable, FactorsAreThoseOfUdunits) {
  ut_set_error_message_handler(ut_ignore);
  const std::unique_ptr<ut_system, UtFree> system(ut_read_xml(nullptr));
  ASSERT_NE(system, nullptr);
  const auto parse = [&](const Unit& unit) {
    return std::unique_ptr<ut_unit, UtFree>(ut_parse(system.get(), std::string(unit.udunits).c_str(), UT_UTF8));
  };
  int compared = 0;
  for (const Unit& a : AllUnits()) {
    if (a.udunits.empty()) continue;
    const auto utA = parse(a);
    ASSERT_NE(utA, nullptr) << a.text << ": " << a.udunits;
    for (const Unit& b : AllUnits()) {
      if (b.udunits.empty() || b.scale.dimension != a.scale.dimension) continue;
      const auto utB = parse(b);
      ASSERT_NE(utB, nullptr) << b.text;
      const std::unique_ptr<cv_converter, UtFree> converter(ut_get_converter(utA.get(), utB.get()));
      ASSERT_NE(converter, nullptr) << a.text << " to " << b.text;
      for (const double value : {1.0, -3.75, 1234.5}) {
        const double expected = cv_convert_double(converter.get(), value);
        EXPECT_NEAR(Convert(value, a, b), expected, 1e-12 * std::abs(expected))
            << value << " " << a.text << " to " << b.text;
      }
      ++compared;
    }
  }
  EXPECT_GT(compared, 500);
}

TEST(Units, DifferentDimensionsDoNotConvert) {
  EXPECT_EQ(ConversionBetween(UnitOf(1000).scale, UnitOf(1400).scale), std::nullopt);
  EXPECT_EQ(ConversionBetween(UnitOf(2000).scale, UnitOf(3100).scale), std::nullopt);
}

TEST(Units, ConversionKeepsWholeNumbersAndFractionsOfTenExact) {
  struct Case {
    double value;
    int from;
    int to;
    double expected;
  };
  const Case cases[] = {
      {5, 1001, 1000, 5000},  {3, 1002, 1000, 0.003},   {7, 1006, 1000, 0.07},
      {1, 1003, 1004, 12},    {1, 1005, 1003, 5280},    {1, 1403, 1400, 86400},
      {1, 1404, 1403, 365},   {24, 2004, 2001, 1},      {5, 2203, 2201, 5},
      {1, 2200, 2203, 1000},  {20, 2800, 2802, 293.15}, {293.15, 2802, 2800, 20},
      {32, 2801, 2800, 0},    {0, 2800, 2801, 32},      {100, 2800, 2801, 212},
      {-40, 2801, 2800, -40}, {1, 99001, 99000, 0.01},  {2, 4402, 4403, 2000},
      {1, 3204, 3203, 43560}, {1, 4402, 4401, 0.1},     {86.4, 4701, 4702, 86.4 * 86400},
      {0.1, 1000, 1000, 0.1}, {0.1, 2802, 2802, 0.1},   {1, 4800, 4801, 1000},
  };
  for (const Case& c : cases) {
    EXPECT_EQ(Convert(c.value, UnitOf(c.from), UnitOf(c.to)), c.expected) << c.value << " " << UnitOf(c.from).text;
  }
}

TEST(Units, ManningNumbersConvertByTheCubeRootOfAFoot) {
  EXPECT_NEAR(Convert(1, UnitOf(3701), UnitOf(3700)), std::cbrt(0.3048), 1e-15);
  EXPECT_NEAR(Convert(30, UnitOf(3700), UnitOf(3701)), 30 / std::cbrt(0.3048), 1e-13);
}

TEST(ParseUnit, EveryTextAbbreviationAndUdunitsTextOfTheTableIsItsUnit) {
  for (const Unit& unit : AllUnits()) {
    const auto byText = ParseUnit(unit.text);
    ASSERT_TRUE(byText) << unit.text;
    EXPECT_EQ(byText->unit, &unit) << unit.text;
    if (!unit.abbreviation.empty()) {
      const auto byAbbreviation = ParseUnit(unit.abbreviation);
      ASSERT_TRUE(byAbbreviation) << unit.abbreviation;
      EXPECT_EQ(byAbbreviation->unit, &unit) << unit.abbreviation;
    }
    if (!unit.udunits.empty()) {
      const auto byUdunits = ParseUnit(unit.udunits);
      ASSERT_TRUE(byUdunits) << unit.udunits;
      const auto conversion = ConversionBetween(byUdunits->scale, unit.scale);
      ASSERT_TRUE(conversion) << unit.udunits;
      EXPECT_NEAR((*conversion)(1), 1, 1e-12) << unit.udunits;
    }
  }
}

TEST(ParseUnit, UnitsAreReadAsUsersTypeAndFilesNameThem) {
  struct Case {
    const char* text;
    int key;
  };
  const Case cases[] = {
      {"km", 1001},       {" km ", 1001},    {"Meter", 1000},
      {"meters", 1000},   {"feet", 1003},    {"ftUS", 1007},
      {"mm/hour", 2001},  {"mm/h", 2001},    {"mm/hr", 2001},
      {"mm h-1", 2001},   {"mm·h⁻¹", 2001},  {"mm/d", 2004},
      {"mm d-1", 2004},   {"mm/a", 2006},    {"m3/s", 1800},
      {"m³/s", 1800},     {"m^3/s", 1800},   {"m^3 s-1", 1800},
      {"m**3 / s", 1800}, {"m³ s⁻¹", 1800},  {"Cubic Meter per Second", 1800},
      {"m3 s^-1", 1800},  {"cfs", 1804},     {"ft3/s", 1804},
      {"mgd", 1806},      {"degC", 2800},    {"°C", 2800},
      {"℃", 2800},        {"C", 2800},       {"celsius", 2800},
      {"°F", 2801},       {"K", 2802},       {"µg/l", 2202},
      {"μg/l", 2202},     {"ug/L", 2202},    {"mg/l", 2201},
      {"kg m-3", 2200},   {"m2", 3200},      {"W m-2", 6600},
      {"hPa", 6101},      {"mbar", 6103},    {"%", 99001},
      {"percent", 99001}, {"‰", 99002},      {"1", 99000},
      {"", 99000},  // files of no unit
      {"-", 99000},       {"1/s", 2900},     {"s-1", 2900},
      {"1/d", 2902},      {"10^6 m3", 1602}, {"m^(1/3)/s", 3700},
      {"m1/3/s", 3700},   {"a", 1404},
  };
  for (const Case& c : cases) {
    const auto parsed = ParseUnit(c.text);
    ASSERT_TRUE(parsed) << c.text;
    ASSERT_NE(parsed->unit, nullptr) << c.text;
    EXPECT_EQ(parsed->unit->key, c.key) << c.text << ": " << parsed->unit->text;
  }
}

TEST(ParseUnit, UnitsOutsideTheTableConvertAllTheSame) {
  struct Case {
    const char* text;
    int to;
    double value;
    double expected;
  };
  const Case cases[] = {
      {"yard", 1000, 10, 9.144}, {"10 km", 1000, 2, 20000}, {"l/s/ha", 2004, 1, 8.64},        {"um", 1002, 500, 0.5},
      {"mK", 2800, 273150, 0},   {"week", 1403, 2, 14},     {"kg/day/km2", 4504, 86400e6, 1}, {"degR", 2802, 180, 100},
  };
  for (const Case& c : cases) {
    const auto parsed = ParseUnit(c.text);
    ASSERT_TRUE(parsed) << c.text;
    EXPECT_EQ(parsed->unit, nullptr) << c.text;
    const auto conversion = ConversionBetween(parsed->scale, UnitOf(c.to).scale);
    ASSERT_TRUE(conversion) << c.text;
    EXPECT_NEAR((*conversion)(c.value), c.expected, 1e-9 * std::max(1.0, std::abs(c.expected))) << c.text;
  }
}

TEST(ParseUnit, WhatIsNoUnitOfOursIsRefused) {
  for (const char* text : {"xyz", "m/", "km//h", "days since 2000-01-01", "m s", "volt", "lg(re 1 m)", "0 m", "-1 m",
                           "1e400 m", "1e-400 m", "m\xFF", "\xC3", "Mg/L/L/L", "m^999", "5,3 m"}) {
    EXPECT_FALSE(ParseUnit(text)) << text;
  }
  EXPECT_FALSE(ParseUnit(std::string_view("m\0m", 3)));
  EXPECT_FALSE(ParseUnit(std::string(100000, '(')));
  EXPECT_FALSE(ParseUnit(std::string(100000, 'm')));
}

TEST(ParseUnit, AResistanceIsNoVelocity) {
  const auto resistance = ParseUnit("s m-1");
  ASSERT_TRUE(resistance);
  EXPECT_EQ(resistance->scale.dimension, Dimension::TimePerLength);
  EXPECT_FALSE(ParseQuantity("5 s/m", Item(100274), 2000).Ok());
}

TEST(ParseUnit, ThreadsMayAskAtOnce) {
  std::vector<std::thread> threads;
  std::vector<int> wrong(4);
  for (int& count : wrong) {
    threads.emplace_back([&count] {
      for (int i = 1; i <= 300; ++i) {
        const auto parsed = ParseUnit(std::to_string(i) + " yard");
        if (!parsed || std::abs(parsed->scale.numerator - i * 0.9144) > 1e-9) ++count;
      }
    });
  }
  for (std::thread& thread : threads) thread.join();
  EXPECT_THAT(wrong, testing::Each(0));
}

TEST(ParseQuantity, ANumberAloneIsInTheDisplayUnitAndATypedUnitCounts) {
  struct Case {
    const char* text;
    int itemType;
    int displayUnit;
    double expected;
  };
  const Case cases[] = {
      {"5", 100180, 1000, 5},
      {"5", 100180, 1002, 0.005},
      {"5 km", 100180, 1002, 5000},
      {"5km", 100180, 1000, 5000},
      {"  +5   km  ", 100180, 1000, 5000},
      {"-0.9", 100180, 1000, -0.9},
      {"−0.9", 100180, 1000, -0.9},
      {".5", 100180, 1000, 0.5},
      {"1.", 100180, 1000, 1},
      {"1e3", 100180, 1000, 1000},
      {"1E+3 mm", 100180, 1000, 1},
      {"5e3m", 100180, 1000, 5000},
      {"5\u202Fm", 100180, 1000, 5},
      {"1 mm/h", 100431, 2004, 24},
      {"1 mm/hour", 100431, 2004, 24},
      {"1", 100431, 2001, 24},
      {"3 m^3 s-1", 100001, 1801, 3},
      {"3", 100001, 1801, 0.003},
      {"20 degC", 100006, 2800, 20},
      {"293.15 K", 100006, 2800, 20},
      {"32", 100006, 2801, 0},
      {"50 °F", 100006, 2800, 10},
      {"35 %", 100377, 99000, 0.35},
      {"35%", 100377, 99000, 0.35},
      {"35", 100377, 99001, 0.35},
      {"5 -", 100377, 99000, 5},
      {"2 1/s", 100362, 2900, 2},
      {"2 1/h", 100362, 2900, 2.0 / 3600},
      {"2 /s", 100362, 2900, 2},
      {"1 %/100 m", 100190, 3004, 1},
      {"-6.49 °C/km", 100189, 3300, -0.649},
      {"3 10^6 m3", 100035, 1600, 3e6},
      {"1 acre ft", 100035, 1600, 43560 * std::pow(0.3048, 3)},
      {"14", 100091, 1403, 14},
      {"2 weeks", 100091, 1403, 14},
      {"25 m^(1/3)/s", 100030, 3700, 25},
      {"7", 100370, 99013, 7},
      {"-3", 100370, 99013, -3},
      {"1.7 g/cm3", 100017, 2200, 1700},
      {"3", 999, 99000, 3},
      {"7", 100180, 1400, 7},  // a display unit that is not allowed: the base unit
  };
  for (const Case& c : cases) {
    const ParsedQuantity parsed = ParseQuantity(c.text, Item(c.itemType), c.displayUnit);
    EXPECT_EQ(parsed.error, "") << c.text;
    EXPECT_NEAR(parsed.value, c.expected, 1e-15 * std::abs(c.expected)) << c.text;
  }
}

TEST(ParseQuantity, AnErrorSaysWhatIsWrongAndWhatIsAllowed) {
  struct Case {
    const char* text;
    int itemType;
    const char* error;
  };
  const Case cases[] = {
      {"", 100180, "Elevation: a number was expected"},
      {"  ", 100180, "Elevation: a number was expected"},
      {"abc", 100180, "\"abc\": a number was expected"},
      {"km", 100180, "\"km\": a number was expected"},
      {"-", 100180, "\"-\": a number was expected"},
      {"--5", 100180, "\"--5\": a number was expected"},
      {"+-5", 100180, "\"+-5\": a number was expected"},
      {"inf", 100180, "\"inf\": a number was expected"},
      {"-nan", 100180, "\"-nan\": a number was expected"},
      {"1,5", 100180, "\"1,5\": use a point for decimals, as in 1.5, and nothing between thousands"},
      {",5", 100180, "\",5\": use a point for decimals, as in 1.5, and nothing between thousands"},
      {"1,000.5 m", 100180, "\"1,000.5 m\": use a point for decimals, as in 1.5, and nothing between thousands"},
      {"5 kg", 100180,
       "\"5 kg\": \"kg\" is no unit of Elevation, which takes m, cm, mm, ft, in and what converts to them"},
      {"5 xyz", 100180,
       "\"5 xyz\": \"xyz\" is no unit of Elevation, which takes m, cm, mm, ft, in and what converts to them"},
      {"1 000", 100180,
       "\"1 000\": \"000\" is no unit of Elevation, which takes m, cm, mm, ft, in and what converts to them"},
      {"5 m 30", 100180,
       "\"5 m 30\": \"m 30\" is no unit of Elevation, which takes m, cm, mm, ft, in and what converts to them"},
      {"5*10 m", 100180,
       "\"5*10 m\": \"*10 m\" is no unit of Elevation, which takes m, cm, mm, ft, in and what converts to them"},
      {"5 m*10", 100180,
       "\"5 m*10\": \"m*10\" is no unit of Elevation, which takes m, cm, mm, ft, in and what converts to them"},
      {"5-3 m", 100180,
       "\"5-3 m\": \"-3 m\" is no unit of Elevation, which takes m, cm, mm, ft, in and what converts to them"},
      {"5 m", 100370, "\"5 m\": Code has no unit"},
      {"2.5", 100370, "\"2.5\": Code takes a whole number of at most 9 digits"},
      {"3e9", 100370, "\"3e9\": Code takes a whole number of at most 9 digits"},
      {"1e999", 100180, "\"1e999\" is too large or too small"},
      {"1e306 km", 100180, "\"1e306 km\" is too large"},
  };
  for (const Case& c : cases) {
    const ParsedQuantity parsed = ParseQuantity(c.text, Item(c.itemType), BaseUnit(Item(c.itemType)).key);
    EXPECT_FALSE(parsed.Ok()) << c.text;
    EXPECT_EQ(parsed.error, c.error);
    EXPECT_EQ(parsed.value, 0) << c.text;
  }
}

TEST(FormatQuantity, ShowsTheValueInTheDisplayUnitInTheGivenFormat) {
  struct Case {
    double value;
    int itemType;
    int displayUnit;
    const char* format;
    const char* text;
  };
  const Case cases[] = {
      {1234.5678, 100180, 1000, "%.6g", "1234.57"},
      {1234.5678, 100180, 1000, "%.2f", "1234.57"},
      {1234.5678, 100180, 1002, "%.2f", "1234567.80"},
      {1234567, 100187, 1000, "%.6g", "1.23457e+06"},
      {1234567, 100187, 1000, "%.2f", "1234567.00"},
      {1234567, 100187, 1000, "", "1234567"},
      {0.1F, 100180, 1000, "%.6g", "0.1"},
      {0.1, 100180, 1000, "%g", "0.1"},
      {0.00001, 100400, 2000, "%e", "1.000000e-05"},
      {0.00001, 100400, 2000, "%.1e", "1.0e-05"},
      {24, 100431, 2001, "%.6g", "1"},
      {0.35, 100377, 99001, "%.6g", "35"},
      {0, 100006, 2801, "%.6g", "32"},
      {2.5, 100370, 99013, "%d", "3"},
      {-0.2, 100370, 99013, "%d", "0"},
      {123456789, 100370, 99013, "%d", "123456789"},
      {5, 100180, 1400, "%.6g", "5"},  // a display unit that is not allowed: the base unit
      {std::numeric_limits<double>::infinity(), 100180, 1000, "%.6g", "inf"},
  };
  for (const Case& c : cases) {
    const std::string text = FormatQuantity(c.value, Item(c.itemType), c.displayUnit, c.format);
    EXPECT_EQ(text, c.text) << c.value << " " << c.format;
  }
  EXPECT_EQ(FormatQuantity(-1e300, Item(100180), 1000, "%.3f").size(), std::string("-.000").size() + 301);
  EXPECT_EQ(FormatQuantity(0.1 + 0.2, Item(100180), 1000), "0.3");
}

TEST(FormatQuantity, WhatIsShownReadsBackToTheSameValue) {
  std::mt19937_64 random(11);
  std::uniform_real_distribution<double> digits(-1000, 1000);
  for (const ItemType& itemType : AllItemTypes()) {
    const bool isWhole = BaseUnit(itemType).key == kWholeNumberUnit;
    for (const int key : itemType.unitKeys) {
      for (int i = 0; i < 20; ++i) {
        const double value = isWhole ? std::round(digits(random)) : digits(random) * std::pow(10, i % 7 - 3);
        const ParsedQuantity shortest = ParseQuantity(FormatQuantity(value, itemType, key, ""), itemType, key);
        ASSERT_EQ(shortest.error, "") << itemType.name << " " << key << " " << value;
        // An offset of a temperature costs the digits that it has more than the value.
        const double offset = std::abs(UnitOf(key).scale.offset);
        ASSERT_NEAR(shortest.value, value, 1e-14 * (std::abs(value) + offset)) << itemType.name << " " << key;
        const std::string withUnit =
            FormatQuantity(value, itemType, key, "") + " " + std::string(UnitOf(key).abbreviation);
        ASSERT_NEAR(ParseQuantity(withUnit, itemType, itemType.unitKeys.front()).value, value,
                    1e-14 * (std::abs(value) + offset))
            << withUnit;
      }
    }
  }
}

TEST(FormatQuantity, ATypedNumberIsShownAsItWasTyped) {
  for (const ItemType& itemType : AllItemTypes()) {
    if (BaseUnit(itemType).key == kWholeNumberUnit) continue;
    for (const int key : itemType.unitKeys) {
      for (const char* text : {"0.3", "5", "12.345", "-7.5", "1e-05"}) {
        const ParsedQuantity parsed = ParseQuantity(text, itemType, key);
        EXPECT_EQ(FormatQuantity(parsed.value, itemType, key), text) << itemType.name << " " << key;
      }
    }
  }
}

TEST(DisplayUnits, WithoutAChoiceTheBaseUnitIsShown) {
  const DisplayUnits units;
  EXPECT_EQ(units.UnitKey(100180), 1000);
  EXPECT_EQ(units.UnitOf(Item(100431)).key, 2004);
  EXPECT_EQ(units.UnitKey(4711), kDimensionlessUnit);
  EXPECT_EQ(units.Text(), "");
}

TEST(DisplayUnits, OnlyAllowedUnitsCanBeChosen) {
  DisplayUnits units;
  EXPECT_TRUE(units.Choose(100180, 1003));
  EXPECT_FALSE(units.Choose(100180, 1400));
  EXPECT_FALSE(units.Choose(100180, 4711));
  EXPECT_FALSE(units.Choose(4711, 1000));
  EXPECT_EQ(units.UnitKey(100180), 1003);
  EXPECT_TRUE(units.Choose(100431, 2001));
  EXPECT_EQ(units.Text(), "100180=1003 100431=2001");
  units.Reset(100431);
  EXPECT_TRUE(units.Choose(100180, 1000));
  EXPECT_EQ(units, DisplayUnits());
}

TEST(DisplayUnits, TheTextOfTheSettingsReadsBack) {
  DisplayUnits units;
  units.Choose(100431, 2001);
  units.Choose(100180, 1003);
  std::string ignored = "old";
  EXPECT_EQ(DisplayUnits::FromText(units.Text(), ignored), units);
  EXPECT_EQ(ignored, "");

  const DisplayUnits mended = DisplayUnits::FromText(
      " 100180=1003\t4711=1 100431 =2004 100431=2001x \n 100431=2001 100280=1400 x=y 99999999999=1000 ", ignored);
  EXPECT_EQ(mended, units);
  EXPECT_EQ(ignored, "4711=1 100431 =2004 100431=2001x 100280=1400 x=y 99999999999=1000");
}

/// Runs in a process of its own, in which nothing has asked UDUNITS yet.
class UnitsInAFreshProcess : public testing::Test {
 protected:
  void SetUp() override { GTEST_FLAG_SET(death_test_style, "threadsafe"); }
};

bool ReadsUnits() {
  const auto yard = ParseUnit("0.5 yard");
  const ParsedQuantity quantity = ParseQuantity("1.5 yard", Item(100180), 1000);
  return yard && std::abs(yard->scale.numerator - 0.4572) < 1e-12 && quantity.Ok() &&
         std::abs(quantity.value - 1.3716) < 1e-12 && FormatQuantity(1.5, Item(100180), 1000) == "1.5";
}

TEST_F(UnitsInAFreshProcess, ALocaleWithADecimalCommaChangesNothing) {
  // No machine is sure to have such a locale installed. Categories other than numbers are left out, which localedef
  // reports and survives; the exit status below tells whether the locale came to be.
  const test::TempFolder folder;
  const std::string source = folder.Write("comma.src",
                                          "LC_NUMERIC\ndecimal_point \",\"\nthousands_sep \".\"\n"
                                          "grouping 3;3\nEND LC_NUMERIC\n");
  const std::string command = "localedef -c --quiet -i " + source + " -f ANSI_X3.4-1968 " + folder.File("comma");
  ASSERT_NE(std::system(command.c_str()), -1);
  setenv("LOCPATH", folder.Path().c_str(), 1);
  EXPECT_EXIT(
      {
        if (std::setlocale(LC_NUMERIC, "comma") == nullptr) std::exit(2);
        if (std::strtod("1,5", nullptr) != 1.5) std::exit(3);
        if (!ReadsUnits()) std::exit(4);
        std::exit(std::strtod("1,5", nullptr) == 1.5 ? 0 : 5);
      },
      testing::ExitedWithCode(0), "");
  unsetenv("LOCPATH");
}

TEST_F(UnitsInAFreshProcess, WithoutItsDatabaseTheTableStillServes) {
  EXPECT_EXIT(
      {
        setenv("UDUNITS2_XML_PATH", "/nowhere/udunits2.xml", 1);
        const bool table = ParseQuantity("5 km", Item(100180), 1000).value == 5000;
        std::exit(table && !ParseUnit("yard") ? 0 : 1);
      },
      testing::ExitedWithCode(0), "^$");
}

}  // namespace
}  // namespace tervane
