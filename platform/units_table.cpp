// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The tables of units and item types, data alone. The keys and codes stand in setups and data files: one that was given
// out keeps its meaning for good. To add a unit: one line in kUnits, and its key in the lists of the quantities that
// take it. The first key of a list is the unit in which values are stored, so it never changes either.
#include <algorithm>

#include "platform/item_types.h"
#include "platform/units.h"

namespace tervane {
namespace {

using enum Dimension;

// The legal definitions that the factors below are made of, as fractions of whole numbers.
constexpr double kInch = 127, kPerInch = 5000;  // 0.0254 m
constexpr double kFoot = 381, kPerFoot = 1250;  // 0.3048 m
constexpr double kFoot2 = kFoot * kFoot, kPerFoot2 = kPerFoot * kPerFoot;
constexpr double kFoot3 = kFoot2 * kFoot, kPerFoot3 = kPerFoot2 * kPerFoot;
constexpr double kAcreInFoot2 = 43560;
constexpr double kGallon = 473176473, kPerGallon = 125000000000;  // 231 cubic inches
constexpr double kPound = 45359237, kPerPound = 100000000;        // 0.45359237 kg
constexpr double kMinute = 60, kHour = 3600, kDay = 86400;
// A year is one of 365 days: the length that ages and transport times are counted in.
constexpr double kYear = 365 * kDay;

constexpr Unit kUnits[] = {
    {0, "undefined", "", {Ratio}, "", ""},

    {1000, "meter", "m", {Length}, "m", ""},
    {1001, "kilometer", "km", {Length, 1000}, "km", ""},
    {1002, "millimeter", "mm", {Length, 1, 1000}, "mm", ""},
    {1003, "foot", "ft", {Length, kFoot, kPerFoot}, "international_foot", "feet"},
    {1004, "inch", "in", {Length, kInch, kPerInch}, "inch", ""},
    {1005, "mile", "mi", {Length, kFoot * 5280, kPerFoot}, "international_mile", ""},
    {1006, "centimeter", "cm", {Length, 1, 100}, "cm", ""},
    {1007, "US survey foot", "ftUS", {Length, 1200, 3937}, "US_survey_foot", "US-ft|us-ft"},

    {1400, "second", "s", {Time}, "s", ""},
    {1401, "minute", "min", {Time, kMinute}, "min", ""},
    {1402, "hour", "h", {Time, kHour}, "h", ""},
    {1403, "day", "day", {Time, kDay}, "day", ""},
    {1404, "year", "year", {Time, kYear}, "common_year", "years|yr|a"},

    {1600, "cubic meter", "m³", {Volume}, "m3", ""},
    {1601, "liter", "l", {Volume, 1, 1000}, "liter", "L"},
    {1602, "million cubic meter", "10⁶ m³", {Volume, 1e6}, "1e6 m3", "Mm³|hm³|million m³"},
    {1603, "cubic foot", "ft³", {Volume, kFoot3, kPerFoot3}, "international_foot3", ""},
    {1604, "acre foot", "acre ft", {Volume, kAcreInFoot2* kFoot3, kPerFoot3}, "43560 international_foot3", "acre-ft"},

    {1800, "cubic meter per second", "m³/s", {VolumePerTime}, "m3 s-1", "cumec"},
    {1801, "liter per second", "l/s", {VolumePerTime, 1, 1000}, "liter s-1", "L/s"},
    {1802, "cubic meter per hour", "m³/h", {VolumePerTime, 1, kHour}, "m3 h-1", ""},
    {1803, "cubic meter per day", "m³/day", {VolumePerTime, 1, kDay}, "m3 day-1", ""},
    {1804, "cubic foot per second", "ft³/s", {VolumePerTime, kFoot3, kPerFoot3}, "international_foot3 s-1", "cfs"},
    {1805, "gallon per minute", "gal/min", {VolumePerTime, kGallon, kPerGallon* kMinute}, "231 inch3 min-1", "gpm"},
    {1806,
     "million gallon per day",
     "Mgal/day",
     {VolumePerTime, kGallon * 1e6, kPerGallon* kDay},
     "231e6 inch3 day-1",
     "mgd|MGD|Mgal/d"},
    {1807,
     "million cubic meter per year",
     "10⁶ m³/year",
     {VolumePerTime, 1e6, kYear},
     "1e6 m3 common_year-1",
     "Mm³/year|hm³/year|Mm³/a|hm³/a"},

    {2000, "meter per second", "m/s", {Velocity}, "m s-1", ""},
    {2001, "millimeter per hour", "mm/h", {Velocity, 1, 1000 * kHour}, "mm h-1", ""},
    {2002, "millimeter per second", "mm/s", {Velocity, 1, 1000}, "mm s-1", ""},
    {2003, "meter per day", "m/day", {Velocity, 1, kDay}, "m day-1", ""},
    {2004, "millimeter per day", "mm/day", {Velocity, 1, 1000 * kDay}, "mm day-1", ""},
    {2005, "centimeter per hour", "cm/h", {Velocity, 1, 100 * kHour}, "cm h-1", ""},
    {2006, "millimeter per year", "mm/year", {Velocity, 1, 1000 * kYear}, "mm common_year-1", "mm/a|mm/yr"},
    {2007, "inch per hour", "in/h", {Velocity, kInch, kPerInch* kHour}, "inch h-1", ""},
    {2008, "inch per day", "in/day", {Velocity, kInch, kPerInch* kDay}, "inch day-1", ""},
    {2009, "foot per second", "ft/s", {Velocity, kFoot, kPerFoot}, "international_foot s-1", ""},
    {2010, "foot per day", "ft/day", {Velocity, kFoot, kPerFoot* kDay}, "international_foot day-1", ""},
    {2011, "kilometer per hour", "km/h", {Velocity, 1000, kHour}, "km h-1", ""},
    {2012, "inch per year", "in/year", {Velocity, kInch, kPerInch* kYear}, "inch common_year-1", "in/a|in/yr"},

    {2200, "kilogram per cubic meter", "kg/m³", {MassPerVolume}, "kg m-3", ""},
    {2201, "milligram per liter", "mg/l", {MassPerVolume, 1, 1000}, "mg liter-1", "mg/L"},
    {2202, "microgram per liter", "µg/l", {MassPerVolume, 1, 1e6}, "ug liter-1", "µg/L"},
    {2203, "gram per cubic meter", "g/m³", {MassPerVolume, 1, 1000}, "g m-3", ""},
    {2204, "gram per cubic centimeter", "g/cm³", {MassPerVolume, 1000}, "g cm-3", ""},
    {2205, "milligram per cubic meter", "mg/m³", {MassPerVolume, 1, 1e6}, "mg m-3", ""},
    {2206,
     "pound per cubic foot",
     "lb/ft³",
     {MassPerVolume, kPound* kPerFoot3, kPerPound* kFoot3},
     "pound international_foot-3",
     ""},

    {2800, "degree Celsius", "°C", {Temperature}, "degC", "C"},
    {2801, "degree Fahrenheit", "°F", {Temperature, 5, 9, -32}, "degF", "F"},
    {2802, "kelvin", "K", {Temperature, 1, 1, -273.15}, "K", ""},

    {2900, "per second", "1/s", {PerTime}, "s-1", "/s"},
    {2901, "per hour", "1/h", {PerTime, 1, kHour}, "h-1", "/h"},
    {2902, "per day", "1/day", {PerTime, 1, kDay}, "day-1", "/day|/d"},
    {2903, "per year", "1/year", {PerTime, 1, kYear}, "common_year-1", "/year|1/a|1/yr"},

    {3000, "per meter", "1/m", {PerLength}, "m-1", "/m"},
    {3001, "per centimeter", "1/cm", {PerLength, 100}, "cm-1", "/cm"},
    {3002, "per foot", "1/ft", {PerLength, kPerFoot, kFoot}, "international_foot-1", "/ft"},
    {3003, "percent per 100 meter", "%/100 m", {PerLength, 1, 1e4}, "1e-4 m-1", "%/100m"},
    {3004, "percent per kilometer", "%/km", {PerLength, 1, 1e5}, "1e-5 m-1", ""},

    {3100, "second per meter", "s/m", {TimePerLength}, "s m-1", ""},
    {3101, "day per meter", "day/m", {TimePerLength, kDay}, "day m-1", ""},

    {3200, "square meter", "m²", {Area}, "m2", ""},
    {3201, "hectare", "ha", {Area, 1e4}, "hectare", ""},
    {3202, "square kilometer", "km²", {Area, 1e6}, "km2", ""},
    {3203, "square foot", "ft²", {Area, kFoot2, kPerFoot2}, "international_foot2", ""},
    {3204, "acre", "acre", {Area, kAcreInFoot2* kFoot2, kPerFoot2}, "43560 international_foot2", ""},

    {3300, "degree Celsius per 100 meter", "°C/100 m", {TemperaturePerLength, 1, 100}, "0.01 K m-1", "°C/100m|K/100 m"},
    {3301, "degree Celsius per meter", "°C/m", {TemperaturePerLength}, "K m-1", ""},
    {3302, "degree Celsius per kilometer", "°C/km", {TemperaturePerLength, 1, 1000}, "K km-1", ""},
    {3303,
     "degree Fahrenheit per 1000 foot",
     "°F/1000 ft",
     {TemperaturePerLength, 5 * kPerFoot, 9000 * kFoot},
     "degF (1000 international_foot)-1",
     "°F/1000ft"},

    {3400, "millimeter per degree Celsius per day", "mm/°C/day", {MeltPerDegree, 1, 1000 * kDay}, "mm K-1 day-1", ""},
    {3401, "millimeter per degree Celsius per hour", "mm/°C/h", {MeltPerDegree, 1, 1000 * kHour}, "mm K-1 h-1", ""},
    {3402,
     "inch per degree Fahrenheit per day",
     "in/°F/day",
     {MeltPerDegree, 9 * kInch, 5 * kPerInch* kDay},
     "inch degF-1 day-1",
     ""},

    {3500,
     "millimeter per day per watt per square meter",
     "mm/day/(W/m²)",
     {MeltPerRadiation, 1, 1000 * kDay},
     "mm day-1 W-1 m2",
     ""},
    {3501, "millimeter per megajoule per square meter", "mm/(MJ/m²)", {MeltPerRadiation, 1, 1e9}, "mm MJ-1 m2", ""},

    {3600, "per degree Celsius", "1/°C", {PerTemperature}, "K-1", "/°C"},
    {3601, "per degree Fahrenheit", "1/°F", {PerTemperature, 9, 5}, "degF-1", "/°F"},

    // UDUNITS has no roots. 1 ft^(1/3)/s is the cube root of 0.3048 m^(1/3)/s.
    {3700, "cube root of meter per second", "m^(1/3)/s", {Roughness}, "", "m^1/3/s|m1/3/s|m**(1/3)/s"},
    {3701,
     "cube root of foot per second",
     "ft^(1/3)/s",
     {Roughness, 0.67298438497550615},
     "",
     "ft^1/3/s|ft1/3/s|ft**(1/3)/s"},

    {4200, "gram", "g", {Mass, 1, 1000}, "g", ""},
    {4201, "kilogram", "kg", {Mass}, "kg", ""},
    {4202, "milligram", "mg", {Mass, 1, 1e6}, "mg", ""},
    {4203, "metric ton", "t", {Mass, 1000}, "tonne", "tonne"},
    {4204, "pound", "lb", {Mass, kPound, kPerPound}, "pound", ""},

    {4400, "gram per square meter", "g/m²", {MassPerArea, 1, 1000}, "g m-2", ""},
    {4401, "kilogram per square meter", "kg/m²", {MassPerArea}, "kg m-2", ""},
    {4402, "metric ton per hectare", "t/ha", {MassPerArea, 1, 10}, "tonne hectare-1", "tonne/ha"},
    {4403, "kilogram per hectare", "kg/ha", {MassPerArea, 1, 1e4}, "kg hectare-1", ""},
    {4404, "milligram per square meter", "mg/m²", {MassPerArea, 1, 1e6}, "mg m-2", ""},
    {4405,
     "pound per acre",
     "lb/acre",
     {MassPerArea, kPound* kPerFoot2, kPerPound* kAcreInFoot2* kFoot2},
     "pound (43560 international_foot2)-1",
     ""},

    {4500, "gram per square meter per second", "g/m²/s", {MassPerAreaAndTime, 1, 1000}, "g m-2 s-1", ""},
    {4501, "gram per square meter per day", "g/m²/day", {MassPerAreaAndTime, 1, 1000 * kDay}, "g m-2 day-1", ""},
    {4502, "kilogram per hectare per day", "kg/ha/day", {MassPerAreaAndTime, 1, 1e4 * kDay}, "kg hectare-1 day-1", ""},
    {4503,
     "metric ton per hectare per day",
     "t/ha/day",
     {MassPerAreaAndTime, 1, 10 * kDay},
     "tonne hectare-1 day-1",
     "tonne/ha/day"},
    {4504, "kilogram per square meter per second", "kg/m²/s", {MassPerAreaAndTime}, "kg m-2 s-1", ""},
    {4505,
     "kilogram per hectare per year",
     "kg/ha/year",
     {MassPerAreaAndTime, 1, 1e4 * kYear},
     "kg hectare-1 common_year-1",
     "kg/ha/a|kg/ha/yr"},

    {4600, "gram per second", "g/s", {MassPerTime, 1, 1000}, "g s-1", ""},
    {4601, "kilogram per second", "kg/s", {MassPerTime}, "kg s-1", ""},
    {4602, "gram per day", "g/day", {MassPerTime, 1, 1000 * kDay}, "g day-1", ""},
    {4603, "kilogram per day", "kg/day", {MassPerTime, 1, kDay}, "kg day-1", ""},
    {4604, "kilogram per year", "kg/year", {MassPerTime, 1, kYear}, "kg common_year-1", "kg/a|kg/yr"},

    {4700, "cubic meter per second per meter", "m³/s/m", {AreaPerTime}, "m3 s-1 m-1", ""},
    {4701, "square meter per second", "m²/s", {AreaPerTime}, "m2 s-1", ""},
    {4702, "square meter per day", "m²/day", {AreaPerTime, 1, kDay}, "m2 day-1", ""},
    {4703, "square centimeter per second", "cm²/s", {AreaPerTime, 1, 1e4}, "cm2 s-1", ""},
    {4704, "liter per second per meter", "l/s/m", {AreaPerTime, 1, 1000}, "liter s-1 m-1", "L/s/m"},
    {4705, "square foot per second", "ft²/s", {AreaPerTime, kFoot2, kPerFoot2}, "international_foot2 s-1", ""},
    {4706, "square foot per day", "ft²/day", {AreaPerTime, kFoot2, kPerFoot2* kDay}, "international_foot2 day-1", ""},

    {4800, "cubic meter per gram", "m³/g", {VolumePerMass, 1000}, "m3 g-1", ""},
    {4801, "cubic meter per kilogram", "m³/kg", {VolumePerMass}, "m3 kg-1", ""},
    {4802, "liter per kilogram", "l/kg", {VolumePerMass, 1, 1000}, "liter kg-1", "L/kg"},
    {4803, "cubic centimeter per gram", "cm³/g", {VolumePerMass, 1, 1000}, "cm3 g-1", "ml/g|mL/g"},

    {6100, "pascal", "Pa", {Pressure}, "Pa", ""},
    {6101, "hectopascal", "hPa", {Pressure, 100}, "hPa", ""},
    {6102, "kilopascal", "kPa", {Pressure, 1000}, "kPa", ""},
    {6103, "millibar", "mbar", {Pressure, 100}, "mbar", ""},
    {6104, "bar", "bar", {Pressure, 1e5}, "bar", ""},

    {6600, "watt per square meter", "W/m²", {PowerPerArea}, "W m-2", ""},
    {6601, "megajoule per square meter per day", "MJ/m²/day", {PowerPerArea, 1e6, kDay}, "MJ m-2 day-1", ""},
    {6602, "kilojoule per square meter per hour", "kJ/m²/h", {PowerPerArea, 1000, kHour}, "kJ m-2 h-1", ""},

    {99000, "dimensionless", "-", {Ratio}, "1", ""},
    {99001, "percent", "%", {Ratio, 1, 100}, "percent", ""},
    {99002, "per mille", "‰", {Ratio, 1, 1000}, "1e-3", "permille"},
    {99003, "parts per million", "ppm", {Ratio, 1, 1e6}, "1e-6", ""},
    {99005, "gram per gram", "g/g", {Ratio}, "g g-1", ""},
    {99006, "milligram per kilogram", "mg/kg", {Ratio, 1, 1e6}, "mg kg-1", ""},
    {99007, "microgram per kilogram", "µg/kg", {Ratio, 1, 1e9}, "ug kg-1", ""},
    {99008, "gram per kilogram", "g/kg", {Ratio, 1, 1000}, "g kg-1", ""},
    {99009, "meter per kilometer", "m/km", {Ratio, 1, 1000}, "m km-1", ""},
    {99011, "cubic meter per cubic meter", "m³/m³", {Ratio}, "m3 m-3", ""},
    {99013, "integer", "", {Ratio}, "1", ""},
};

constexpr int kUndefined[] = {99000, 99013, 0};
constexpr int kWholeNumbers[] = {99013};
constexpr int kNumbers[] = {99000};
constexpr int kFractions[] = {99000, 99001};
constexpr int kSlopes[] = {99000, 99001, 99002, 99009};
constexpr int kSolidVolumeFractions[] = {99011, 99001, 99003};
constexpr int kSorbedConcentrations[] = {99005, 99006, 99007, 99008};
constexpr int kLengths[] = {1000, 1001, 1002, 1006, 1003, 1004};
constexpr int kDistances[] = {1000, 1001, 1003, 1005};
constexpr int kMapLengths[] = {1000, 1001, 1003, 1007};
constexpr int kLevels[] = {1000, 1006, 1002, 1003, 1004};
constexpr int kDepthsOfWater[] = {1002, 1000, 1006, 1004, 1003};
constexpr int kAreas[] = {3200, 3201, 3202, 3203, 3204};
constexpr int kVolumes[] = {1600, 1601, 1602, 1603, 1604};
constexpr int kFlows[] = {1800, 1801, 1802, 1803, 1807, 1804, 1805, 1806};
constexpr int kFlowsPerWidth[] = {4700, 4704, 4702, 4705, 4706};
constexpr int kDispersionCoefficients[] = {4701, 4702, 4703, 4705, 4706};
constexpr int kVelocities[] = {2000, 2002, 2011, 2009};
constexpr int kConductivities[] = {2000, 2003, 2004, 2001, 2005, 2009, 2010};
constexpr int kWaterRates[] = {2004, 2001, 2006, 2003, 2000, 2007, 2008, 2012};
constexpr int kTimeSteps[] = {1402, 1400, 1401, 1403};
constexpr int kTimes[] = {1403, 1402, 1400, 1401, 1404};
constexpr int kRates[] = {2900, 2901, 2902, 2903};
constexpr int kPerLengths[] = {3000, 3001, 3002};
constexpr int kTemperatures[] = {2800, 2801, 2802};
constexpr int kTemperatureLapseRates[] = {3300, 3302, 3301, 3303};
constexpr int kPrecipitationLapseRates[] = {3003, 3004};
constexpr int kDegreeDayFactors[] = {3400, 3401, 3402};
constexpr int kRadiationMeltFactors[] = {3500, 3501};
constexpr int kPerDegrees[] = {3600, 3601};
constexpr int kManningNumbers[] = {3700, 3701};
constexpr int kResistances[] = {3100, 3101};
constexpr int kRadiation[] = {6600, 6601, 6602};
constexpr int kPressures[] = {6101, 6100, 6102, 6103, 6104};
constexpr int kConcentrations[] = {2203, 2200, 2201, 2202, 2205};
constexpr int kVapourDensities[] = {2200, 2203};
constexpr int kDensities[] = {2200, 2203, 2204, 2206};
constexpr int kMasses[] = {4200, 4201, 4202, 4203, 4204};
constexpr int kMassRates[] = {4600, 4601, 4602, 4603, 4604};
constexpr int kMassesPerArea[] = {4400, 4401, 4404, 4402, 4403, 4405};
constexpr int kErosionPerArea[] = {4402, 4403, 4401, 4400, 4405};
constexpr int kYields[] = {4403, 4402, 4401, 4400, 4405};
constexpr int kMassFluxes[] = {4500, 4501, 4504, 4502, 4503, 4505};
constexpr int kYieldRates[] = {4502, 4503, 4505, 4501};
constexpr int kErosionRates[] = {4503, 4502, 4505, 4504, 4500, 4501};
constexpr int kSorptionCoefficients[] = {4800, 4801, 4802, 4803};

constexpr ItemType kItemTypes[] = {
    {quantity::kUndefined, "Undefined", kUndefined},

    {quantity::kWaterLevel, "Water Level", kLevels},
    {quantity::kDischarge, "Discharge", kFlows},
    {quantity::kRainfall, "Rainfall", kDepthsOfWater},
    {quantity::kEvapotranspirationDepth, "Evapotranspiration Depth", kDepthsOfWater},
    {quantity::kTemperature, "Temperature", kTemperatures},
    {quantity::kConcentration, "Concentration", kConcentrations},
    {quantity::kFlowVelocity, "Flow Velocity", kVelocities},
    {quantity::kBulkDensity, "Bulk Density", kDensities},
    {quantity::kRelativeHumidity, "Relative Humidity", kFractions},
    {quantity::kSlope, "Slope", kSlopes},
    {quantity::kFlowArea, "Flow Area", kAreas},
    {quantity::kManningNumber, "Manning Number", kManningNumbers},
    {quantity::kWaterVolume, "Water Volume", kVolumes},
    {quantity::kSoilWaterContent, "Soil Water Content", kFractions},
    {quantity::kInfiltrationRate, "Infiltration Rate", kWaterRates},
    {quantity::kGroundwaterRechargeRate, "Groundwater Recharge Rate", kWaterRates},
    {quantity::kFlowPerWidth, "Flow per Width", kFlowsPerWidth},
    {quantity::kReservoirTimeConstant, "Reservoir Time Constant", kTimes},
    {quantity::kRillSlope, "Rill Slope", kSlopes},
    {quantity::kChainage, "Chainage", kDistances},
    {quantity::kFactor, "Factor", kNumbers},
    {quantity::kExponentOrCoefficient, "Exponent or Coefficient", kNumbers},
    {quantity::kStorageDepth, "Storage Depth", kDepthsOfWater},
    {quantity::kKineticRate, "Kinetic Rate", kRates},
    {quantity::kErosionRate, "Erosion Rate", kErosionRates},
    {quantity::kDispersionCoefficient, "Dispersion Coefficient", kDispersionCoefficients},
    {quantity::kDegreeDayCoefficient, "Degree-day Coefficient", kDegreeDayFactors},
    {quantity::kElevation, "Elevation", kLevels},
    {quantity::kEvapotranspiration, "Evapotranspiration", kWaterRates},
    {quantity::kMapCoordinate, "Map Coordinate", kMapLengths},
    {quantity::kTemperatureLapseRate, "Temperature Lapse Rate", kTemperatureLapseRates},
    {quantity::kPrecipitationLapseRate, "Precipitation Lapse Rate", kPrecipitationLapseRates},
    {quantity::kRadiationAndHeatFlux, "Radiation and Heat Flux", kRadiation},
    {quantity::kTimeStepLength, "Time Step Length", kTimeSteps},
    {quantity::kHorizontalLength, "Horizontal Length", kMapLengths},
    {quantity::kFraction, "Fraction", kFractions},
    {quantity::kMassFlux, "Mass Flux", kMassFluxes},
    {quantity::kWindSpeed, "Wind Speed", kVelocities},
    {quantity::kWaterDepth, "Water Depth", kLevels},
    {quantity::kPorosityOfPhase, "Porosity of Phase", kFractions},
    {quantity::kSlopeLength, "Slope Length", kLengths},
    {quantity::kSaturatedThickness, "Saturated Thickness", kLevels},
    {quantity::kPressureHead, "Pressure Head", kLevels},
    {quantity::kRootMassDistribution, "Root Mass Distribution", kPerLengths},
    {quantity::kTranspirationParameterC1, "Transpiration Parameter C1", kNumbers},
    {quantity::kTranspirationParameterC2, "Transpiration Parameter C2", kNumbers},
    {quantity::kTranspirationParameterC3, "Transpiration Parameter C3", kWaterRates},
    {quantity::kIrrigationDemand, "Irrigation Demand", kWaterRates},
    {quantity::kVerticalWaterFlux, "Vertical Water Flux", kWaterRates},
    {quantity::kLeakageCoefficient, "Leakage Coefficient", kRates},
    {quantity::kConductance, "Conductance", kDispersionCoefficients},
    {quantity::kHeightAboveGround, "Height above Ground", kLevels},
    {quantity::kGroundwaterAbstraction, "Groundwater Abstraction", kFlows},
    {quantity::kDepthBelowGround, "Depth below Ground", kLevels},
    {quantity::kLayerThickness, "Layer Thickness", kLevels},
    {quantity::kHeadGradient, "Head Gradient", kSlopes},
    {quantity::kCode, "Code", kWholeNumbers},
    {quantity::kDrainageTimeConstant, "Drainage Time Constant", kRates},
    {quantity::kSpecificStorage, "Specific Storage", kPerLengths},
    {quantity::kSpecificYield, "Specific Yield", kFractions},
    {quantity::kSoilWaterExchangeRate, "Soil Water Exchange Rate", kWaterRates},
    {quantity::kWaterContent, "Water Content", kFractions},
    {quantity::kWaterInputRate, "Water Input Rate", kWaterRates},
    {quantity::kRootDepth, "Root Depth", kLevels},
    {quantity::kRillDepth, "Rill Depth", kDepthsOfWater},
    {quantity::kYesOrNo, "Yes or No", kNumbers},
    {quantity::kLeafAreaIndex, "Leaf Area Index", kNumbers},
    {quantity::kIrrigationRate, "Irrigation Rate", kWaterRates},
    {quantity::kIrrigationIndex, "Irrigation Index", kNumbers},
    {quantity::kInterceptionStorage, "Interception Storage", kDepthsOfWater},
    {quantity::kEvapotranspirationRate, "Evapotranspiration Rate", kWaterRates},
    {quantity::kErodedMassPerArea, "Eroded Mass per Area", kErosionPerArea},
    {quantity::kSedimentConcentrationByVolume, "Sediment Concentration by Volume", kSolidVolumeFractions},
    {quantity::kSoilWaterError, "Soil Water Error", kDepthsOfWater},
    {quantity::kSoilWaterDeficit, "Soil Water Deficit", kDepthsOfWater},
    {quantity::kCropYield, "Crop Yield", kYields},
    {quantity::kCropType, "Crop Type", kWholeNumbers},
    {quantity::kCropStress, "Crop Stress", kNumbers},
    {quantity::kCropStage, "Crop Stage", kWholeNumbers},
    {quantity::kCropLossRate, "Crop Loss Rate", kYieldRates},
    {quantity::kCropIndex, "Crop Index", kNumbers},
    {quantity::kAge, "Age", kTimes},
    {quantity::kHydraulicConductivity, "Hydraulic Conductivity", kConductivities},
    {quantity::kSorbedConcentration, "Sorbed Concentration", kSorbedConcentrations},
    {quantity::kAirPressure, "Air Pressure", kPressures},
    {quantity::kPrecipitationRate, "Precipitation Rate", kWaterRates},
    {quantity::kMassPerArea, "Mass per Area", kMassesPerArea},
    {quantity::kMass, "Mass", kMasses},
    {quantity::kMassRate, "Mass Rate", kMassRates},
    {quantity::kSorptionCoefficient, "Sorption Coefficient", kSorptionCoefficients},
    {quantity::kPorosity, "Porosity", kFractions},
    {quantity::kHalfLife, "Half-life", kTimes},
    {quantity::kDispersivity, "Dispersivity", kLengths},
    {quantity::kPosition, "Position", kMapLengths},

    {quantity::kRadiationMeltCoefficient, "Radiation Melt Coefficient", kRadiationMeltFactors},
    {quantity::kRainHeatMeltCoefficient, "Rain Heat Melt Coefficient", kPerDegrees},
    {quantity::kResistance, "Resistance", kResistances},
    {quantity::kAbsoluteHumidity, "Absolute Humidity", kVapourDensities},
    {quantity::kSaturatedLayerThickness, "Saturated Layer Thickness", kLevels},
    {quantity::kCellVolume, "Cell Volume", kVolumes},
};

// Look-up halves the tables.
static_assert(std::ranges::is_sorted(kUnits, {}, &Unit::key));
static_assert(std::ranges::is_sorted(kItemTypes, {}, &ItemType::code));

}  // namespace

std::span<const ItemType> AllItemTypes() { return kItemTypes; }
std::span<const Unit> AllUnits() { return kUnits; }

}  // namespace tervane
