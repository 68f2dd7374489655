// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/units.h"

#include <algorithm>
#include <atomic>
#include <clocale>
#include <cmath>
#include <cstdlib>
#include <memory>
#include <random>
#include <set>
#include <sstream>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

#include <gtest/gtest.h>
#include <udunits2.h>

#include "platform/item_types.h"
#include "platform/text.h"
#include "tests/support/temp_folder.h"

/// The C library's setlocale never frees the folders of LOCPATH, which the leak sanitizer sees or not by chance.
extern "C" const char* __lsan_default_suppressions() { return "leak:__argz_add_sep\n"; }

namespace tervane::units_test {
namespace {

const ItemType& Item(int code) {
  const ItemType* itemType = FindItemType(code);
  return itemType ? *itemType : throw std::out_of_range("no item type " + std::to_string(code));
}

const Unit& UnitOf(int key) {
  const Unit* unit = FindUnit(key);
  return unit ? *unit : throw std::out_of_range("no unit " + std::to_string(key));
}

/// The rows of a table, which stand apart by '|' or line ends, each as its fields, which stand apart by ';'.
std::vector<std::vector<std::string>> Rows(std::string_view table) {
  std::vector<std::vector<std::string>> rows;
  for (std::size_t end = 0; !table.empty(); table.remove_prefix(std::min(table.size(), end + 1))) {
    end = std::min(table.find_first_of("|\n"), table.size());
    if (end == 0) continue;
    std::vector<std::string>& row = rows.emplace_back(1);
    for (const char c : table.substr(0, end))
      c == ';' ? static_cast<void>(row.emplace_back()) : row.back().push_back(c);
  }
  return rows;
}

TEST(UnitTable, CodesKeysAndNamesAreUniqueAndUnitsOfAnItemTypeMeasureTheSame) {
  std::set<int> codes, keys, used;
  std::set<std::string_view> names, texts;
  for (const Unit& unit : AllUnits()) {
    EXPECT_TRUE(keys.insert(unit.key).second && texts.insert(unit.text).second) << unit.key << " " << unit.text;
    EXPECT_EQ(FindUnit(unit.key), &unit);
  }
  for (const ItemType& itemType : AllItemTypes()) {
    EXPECT_TRUE(codes.insert(itemType.code).second && names.insert(itemType.name).second) << itemType.name;
    EXPECT_EQ(FindItemType(itemType.code), &itemType);
    ASSERT_FALSE(itemType.unitKeys.empty()) << itemType.name;
    EXPECT_EQ(std::set<int>(itemType.unitKeys.begin(), itemType.unitKeys.end()).size(), itemType.unitKeys.size());
    for (const int key : itemType.unitKeys) {
      const Unit& unit = UnitOf(key);
      used.insert(key);
      EXPECT_EQ(unit.scale.dimension, BaseUnit(itemType).scale.dimension) << itemType.name << ": " << unit.text;
      EXPECT_EQ(FindUnitByText(itemType, unit.text), &unit);
      EXPECT_TRUE(AllowsUnit(itemType, key));
    }
  }
  EXPECT_EQ(used, keys);
  for (const int code : {-1, 0, 998, 100002, 1100187, 2147483647}) EXPECT_EQ(FindItemType(code), nullptr) << code;
  for (const int key : {-1, 1, 999, 1999, 99004, 99014, -2147483647}) EXPECT_EQ(FindUnit(key), nullptr) << key;
  EXPECT_FALSE(AllowsUnit(Item(quantity::kMapCoordinate), 1400));
  for (const char* text : {"second", ""}) EXPECT_EQ(FindUnitByText(Item(quantity::kMapCoordinate), text), nullptr);
}

// Result files and templates store these quantities in these units, setups store numbers in the base unit, and some
// defaults only make sense in one unit: Manning number 10, lapse rate -0.649.
TEST(UnitTable, QuantitiesOfFilesKeepTheirUnits) {
  std::istringstream pairs(R"(
      999/99000 999/0 999/99013 100000/1000 100001/1800 100004/1002 100005/1002 100006/2800 100006/2802 100007/2203
      100016/2000 100017/2200 100017/2203 100023/99000 100025/99000 100026/3200 100030/3700 100035/1600 100058/99000
      100061/2004 100062/2004 100062/2000 100080/4700 100091/1403 100134/99000 100143/1000 100144/99000 100145/99000
      100146/1002 100146/1000 100150/2900 100151/4503 100153/4701 100178/3400 100180/1000 100182/2004 100187/1000
      100189/3300 100190/3003 100203/6600 100212/1402 100217/1000 100239/99000 100241/4500 100241/4501 100274/2000
      100280/1000 100292/99000 100313/1000 100324/1000 100353/1000 100355/3000 100356/99000 100357/99000 100358/2004
      100359/2004 100361/2004 100361/2000 100362/2900 100363/4701 100364/1000 100365/1800 100366/1000 100367/1000
      100368/99000 100370/99013 100371/2900 100374/3000 100375/99000 100376/2004 100377/99000 100378/2004 100378/2000
      100380/1000 100381/1002 100382/99000 100383/99000 100384/2004 100385/99000 100386/1002 100387/2004 100388/4402
      100389/99011 100390/1002 100392/1002 100392/1000 100393/4403 100394/99013 100395/99000 100396/99013 100397/4502
      100398/99000 100399/1403 100399/1404 100400/2000 100405/99005 100409/6101 100431/2004 100431/2000 100437/4400
      100452/4200 100453/4600 100455/4800 100456/99000 100457/1403 100458/1000 100514/1000 110050/3500 110051/3600
      110200/3100 110210/2200 110220/1000 110230/1600)");
  int code = 0, key = 0, last = 0, count = 0;
  std::set<int> codes;
  for (char slash = 0; pairs >> code >> slash >> key; last = code, ++count) {
    codes.insert(code);
    // The first of an item type is its base unit, others are allowed too.
    EXPECT_TRUE(code == last ? AllowsUnit(Item(code), key) : BaseUnit(Item(code)).key == key) << code << " " << key;
  }
  EXPECT_EQ(count, 113);
  // Each quantity of the table stands above: one that is added is added there too.
  EXPECT_EQ(codes.size(), AllItemTypes().size());
}

TEST(UnitTable, KeysOfFilesKeepTheirMeaning) {
  const auto rows = Rows(R"(0;undefined|1000;meter|1002;millimeter|1400;second|1402;hour|1403;day|1404;year
1600;cubic meter|1800;cubic meter per second|2000;meter per second|2004;millimeter per day
2200;kilogram per cubic meter|2203;gram per cubic meter|2800;degree Celsius|2802;kelvin|3100;second per meter
3200;square meter|4400;gram per square meter|4402;metric ton per hectare|4403;kilogram per hectare
4500;gram per square meter per second|4501;gram per square meter per day|4502;kilogram per hectare per day
4503;metric ton per hectare per day|4700;cubic meter per second per meter|6101;hectopascal
6600;watt per square meter|99000;dimensionless|99005;gram per gram|99011;cubic meter per cubic meter|99013;integer)");
  ASSERT_EQ(rows.size(), 31u);
  for (const auto& row : rows) EXPECT_EQ(UnitOf(std::stoi(row[0])).text, row.at(1));
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
        EXPECT_NEAR(Convert(value, a, b), expected, 1e-12 * std::abs(expected)) << a.text << " to " << b.text;
        ++compared;
      }
    }
  }
  EXPECT_GT(compared, 1500);
}

TEST(Units, ConversionKeepsWholeNumbersAndFractionsOfTenExact) {
  const auto rows = Rows(R"(5;1001;1000;5000|3;1002;1000;0.003|7;1006;1000;0.07|1;1003;1004;12|1;1005;1003;5280
1;1403;1400;86400|1;1404;1403;365|24;2004;2001;1|5;2203;2201;5|1;2200;2203;1000|20;2800;2802;293.15
293.15;2802;2800;20|32;2801;2800;0|0;2800;2801;32|100;2800;2801;212|-40;2801;2800;-40|1;99001;99000;0.01
2;4402;4403;2000|1;3204;3203;43560|1;4402;4401;0.1|86.4;4701;4702;7464960.000000001|0.1;1000;1000;0.1|0.1;2802;2802;0.1
1;4800;4801;1000)");
  ASSERT_EQ(rows.size(), 24u);
  for (const auto& row : rows)
    EXPECT_EQ(Convert(std::stod(row[0]), UnitOf(std::stoi(row[1])), UnitOf(std::stoi(row[2]))), std::stod(row[3]))
        << row[0] << " " << row[1] << " to " << row[2];
  EXPECT_EQ(ConversionBetween(UnitOf(1000).scale, UnitOf(1400).scale), std::nullopt);
  EXPECT_EQ(ConversionBetween(UnitOf(2000).scale, UnitOf(3100).scale), std::nullopt);
  // UDUNITS knows no cube root of a foot.
  EXPECT_NEAR(Convert(30, UnitOf(3700), UnitOf(3701)), 30 / std::cbrt(0.3048), 1e-13);
}

TEST(ParseUnit, EveryTextAbbreviationAndUdunitsTextOfTheTableIsItsUnit) {
  for (const Unit& unit : AllUnits()) {
    for (const std::string_view text : {unit.text, unit.abbreviation}) {
      if (text.empty()) continue;
      const auto parsed = ParseUnit(text);
      ASSERT_TRUE(parsed) << text;
      EXPECT_EQ(parsed->unit, &unit) << text;
    }
    if (unit.udunits.empty()) continue;
    const auto parsed = ParseUnit(unit.udunits);
    ASSERT_TRUE(parsed) << unit.udunits;
    const auto conversion = ConversionBetween(parsed->scale, unit.scale);
    ASSERT_TRUE(conversion) << unit.udunits;
    EXPECT_NEAR((*conversion)(1), 1, 1e-12) << unit.udunits;
  }
}

TEST(ParseUnit, UnitsAreReadAsUsersTypeAndFilesNameThem) {
  const auto rows = Rows(R"(km;1001| km ;1001|Meter;1000|meters;1000|feet;1003|ftUS;1007|mm/hour;2001|mm/h;2001
mm/hr;2001|mm h-1;2001|mm·h⁻¹;2001|mm/d;2004|mm d-1;2004|mm/a;2006|m3/s;1800|m³/s;1800|m^3/s;1800|m^3 s-1;1800
m**3 / s;1800|m³ s⁻¹;1800|Cubic Meter per Second;1800|m3 s^-1;1800|cfs;1804|ft3/s;1804|mgd;1806|degC;2800|°C;2800
℃;2800|C;2800|celsius;2800|°F;2801|K;2802|µg/l;2202|μg/l;2202|ug/L;2202|mg/l;2201|kg m-3;2200|m2;3200|W m-2;6600
hPa;6101|mbar;6103|%;99001|percent;99001|‰;99002|1;99000|;99000|-;99000|1/s;2900|s-1;2900|1/d;2902|10^6 m3;1602
m^(1/3)/s;3700|m1/3/s;3700|a;1404|s m-1;3100)");
  ASSERT_EQ(rows.size(), 55u);
  for (const auto& row : rows) {
    const auto parsed = ParseUnit(row[0]);
    ASSERT_TRUE(parsed && parsed->unit) << row[0];
    EXPECT_EQ(parsed->unit->key, std::stoi(row.at(1))) << row[0] << ": " << parsed->unit->text;
  }
}

TEST(ParseUnit, UnitsOutsideTheTableConvertAllTheSame) {
  const auto rows = Rows(R"(yard;1000;10;9.144|10 km;1000;2;20000|l/s/ha;2004;1;8.64|um;1002;500;0.5
mK;2800;273150;0|week;1403;2;14|kg/day/km2;4504;86400e6;1|degR;2802;180;100)");
  ASSERT_EQ(rows.size(), 8u);
  for (const auto& row : rows) {
    const auto parsed = ParseUnit(row[0]);
    ASSERT_TRUE(parsed) << row[0];
    EXPECT_EQ(parsed->unit, nullptr) << row[0];
    const auto conversion = ConversionBetween(parsed->scale, UnitOf(std::stoi(row[1])).scale);
    ASSERT_TRUE(conversion) << row[0];
    const double expected = std::stod(row[3]);
    EXPECT_NEAR((*conversion)(std::stod(row[2])), expected, 1e-9 * std::max(1.0, std::abs(expected))) << row[0];
  }
}

TEST(ParseUnit, WhatIsNoUnitOfOursIsRefused) {
  for (const char* text : {"xyz", "m/", "km//h", "days since 2000-01-01", "m s", "volt", "lg(re 1 m)", "0 m", "-1 m",
                           "1e400 m", "1e-400 m", "m\xFF", "\xC3", "Mg/L/L/L", "m^999", "5,3 m"})
    EXPECT_FALSE(ParseUnit(text)) << text;
  for (const std::string& text : {std::string("m\0m", 3), std::string(100000, '('), std::string(100000, 'm')})
    EXPECT_FALSE(ParseUnit(text)) << text.front();
}

TEST(ParseUnit, ThreadsMayAskAtOnce) {
  std::atomic<int> wrong{0};
  const auto ask = [&] {
    for (int i = 1; i <= 300; ++i) {
      const auto parsed = ParseUnit(std::to_string(i) + " yard");
      if (!parsed || std::abs(parsed->scale.numerator - i * 0.9144) > 1e-9) ++wrong;
    }
  };
  std::vector<std::jthread> threads;
  for (int i = 0; i < 4; ++i) threads.emplace_back(ask);
  threads.clear();
  EXPECT_EQ(wrong, 0);
}

TEST(ParseQuantity, ANumberAloneIsInTheDisplayUnitAndATypedUnitCounts) {
  // The last row has a display unit that is not allowed: the base unit takes its place.
  const auto rows = Rows(R"(5;100180;1000;5|5;100180;1002;0.005|5 km;100180;1002;5000|5km;100180;1000;5000
  +5   km  ;100180;1000;5000|-0.9;100180;1000;-0.9|−0.9;100180;1000;-0.9|.5;100180;1000;0.5|1.;100180;1000;1
1e3;100180;1000;1000|1E+3 mm;100180;1000;1|5e3m;100180;1000;5000|1 mm/h;100431;2004;24|1;100431;2001;24
3 m^3 s-1;100001;1801;3|3;100001;1801;0.003|20 degC;100006;2800;20|293.15 K;100006;2800;20|32;100006;2801;0
50 °F;100006;2800;10|35 %;100377;99000;0.35|35%;100377;99000;0.35|35;100377;99001;0.35|5 -;100377;99000;5
2 1/s;100362;2900;2|1.8 1/h;100362;2900;0.0005|2 /s;100362;2900;2|1 %/100 m;100190;3004;1
-6.49 °C/km;100189;3300;-0.649|3 10^6 m3;100035;1600;3e6|1 acre ft;100035;1600;1233.48183754752|14;100091;1403;14
2 weeks;100091;1403;14|25 m^(1/3)/s;100030;3700;25|7;100370;99013;7|-3;100370;99013;-3|1.7 g/cm3;100017;2200;1700
3;999;99000;3|7;100180;1400;7)");
  ASSERT_EQ(rows.size(), 39u);
  for (const auto& row : rows) {
    const ParsedQuantity parsed = ParseQuantity(row[0], Item(std::stoi(row[1])), std::stoi(row[2]));
    EXPECT_EQ(parsed.error, "") << row[0];
    EXPECT_NEAR(parsed.value, std::stod(row[3]), 1e-15 * std::abs(std::stod(row[3]))) << row[0];
  }
  EXPECT_EQ(ParseQuantity("5\u202Fm", Item(100180), 1002).value, 5);
}

TEST(ParseQuantity, AnErrorSaysWhatIsWrongAndWhatIsAllowed) {
  struct Case {
    int itemType;
    const char* texts;   ///< Apart by '|'; what is wrong in a text stands behind ';'.
    std::string reason;  ///< With # for the text and @ for what is wrong.
  };
  const Case cases[] = {
      {100180, "  |\t", "Elevation: a number was expected"},
      {100180, "abc|km|-|--5|+-5|inf|-nan", "\"#\": a number was expected"},
      {100180, "1,5|,5|1,000.5 m", "\"#\": use a point for decimals, as in 1.5, and nothing between thousands"},
      {100180, "5 kg;kg|5 xyz;xyz|1 000;000|5 m 30;m 30|5*10 m;*10 m|5 m*10;m*10|5-3 m;-3 m",
       "\"#\": \"@\" is no unit of Elevation, which takes m, cm, mm, ft, in and what converts to them"},
      {100370, "5 m", "\"#\": Code has no unit"},
      {100370, "2.5|3e9", "\"#\": Code takes a whole number of at most 9 digits"},
      {100180, "1e999", "\"#\" is too large or too small"},
      {100180, "1e306 km", "\"#\" is too large"},
  };
  for (const Case& c : cases)
    for (const auto& row : Rows(c.texts)) {
      const ParsedQuantity parsed = ParseQuantity(row[0], Item(c.itemType), BaseUnit(Item(c.itemType)).key);
      EXPECT_EQ(parsed.error, Replaced(Replaced(c.reason, "#", row[0]), "@", row.back()));
      EXPECT_EQ(parsed.value, 0) << row[0];
    }
  EXPECT_EQ(ParseQuantity("", Item(100180), 1000).error, "Elevation: a number was expected");
  EXPECT_FALSE(ParseQuantity("5 s/m", Item(100274), 2000).Ok());  // A resistance is no velocity.
}

TEST(FormatQuantity, ShowsTheValueInTheDisplayUnitInTheGivenFormat) {
  // The last row has a display unit that is not allowed: the base unit takes its place.
  const auto rows = Rows(R"(1234.5678;100180;1000;%.6g;1234.57|1234.5678;100180;1002;%.2f;1234567.80
1234567;100187;1000;%.6g;1.23457e+06|1234567;100187;1000;%.2f;1234567.00|1234567;100187;1000;;1234567
0.100000001;100180;1000;%.6g;0.1|0.1;100180;1000;%g;0.1|0.00001;100400;2000;%e;1.000000e-05
0.00001;100400;2000;%.1e;1.0e-05|24;100431;2001;%.6g;1|0.35;100377;99001;%.6g;35|0;100006;2801;%.6g;32
2.5;100370;99013;%d;3|-0.2;100370;99013;%d;0|123456789;100370;99013;%d;123456789|inf;100180;1000;%.6g;inf
5;100180;1400;%.6g;5)");
  ASSERT_EQ(rows.size(), 17u);
  for (const auto& row : rows)
    EXPECT_EQ(FormatQuantity(std::stod(row[0]), Item(std::stoi(row[1])), std::stoi(row[2]), row[3]), row.at(4))
        << row[0] << " " << row[3];
  EXPECT_EQ(FormatQuantity(-1e300, Item(100180), 1000, "%.3f").size(), std::string("-.000").size() + 301);
  EXPECT_EQ(FormatQuantity(0.1 + 0.2, Item(100180), 1000), "0.3");
}

TEST(FormatQuantity, WhatIsShownReadsBackToTheSameValueAndATypedNumberIsShownAsItWasTyped) {
  std::mt19937_64 random(11);
  std::uniform_real_distribution<double> digits(-1000, 1000);
  for (const ItemType& itemType : AllItemTypes()) {
    const bool isWhole = BaseUnit(itemType).key == kWholeNumberUnit;
    for (const int key : itemType.unitKeys) {
      SCOPED_TRACE(std::string(itemType.name) + " " + std::to_string(key));
      for (int i = 0; i < 20; ++i) {
        const double value = isWhole ? std::round(digits(random)) : digits(random) * std::pow(10, i % 7 - 3);
        // An offset of a temperature costs the digits that it has more than the value.
        const double tolerance = 1e-14 * (std::abs(value) + std::abs(UnitOf(key).scale.offset));
        const std::string text = FormatQuantity(value, itemType, key, "");
        const ParsedQuantity parsed = ParseQuantity(text, itemType, key);
        ASSERT_EQ(parsed.error, "") << value;
        ASSERT_NEAR(parsed.value, value, tolerance);
        const std::string withUnit = text + " " + std::string(UnitOf(key).abbreviation);
        ASSERT_NEAR(ParseQuantity(withUnit, itemType, itemType.unitKeys.front()).value, value, tolerance) << withUnit;
      }
      for (const char* text : {"0.3", "5", "12.345", "-7.5", "1e-05"})
        if (!isWhole) {
          EXPECT_EQ(FormatQuantity(ParseQuantity(text, itemType, key).value, itemType, key), text);
        }
    }
  }
}

TEST(DisplayUnits, OnlyAllowedUnitsCanBeChosenAndWithoutAChoiceTheBaseUnitIsShown) {
  DisplayUnits units;
  EXPECT_EQ(units.UnitKey(100180), 1000);
  EXPECT_EQ(units.UnitOf(Item(100431)).key, 2004);
  EXPECT_EQ(units.UnitKey(4711), kDimensionlessUnit);
  EXPECT_EQ(units.Text(), "");
  EXPECT_TRUE(units.Choose(100180, 1003) && units.Choose(100431, 2001));
  EXPECT_FALSE(units.Choose(100180, 1400) || units.Choose(100180, 4711) || units.Choose(4711, 1000));
  EXPECT_EQ(units.UnitKey(100180), 1003);
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
struct UnitsInAFreshProcess : testing::Test {
  UnitsInAFreshProcess() { GTEST_FLAG_SET(death_test_style, "threadsafe"); }
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
}  // namespace tervane::units_test
