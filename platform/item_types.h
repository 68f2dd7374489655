// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The quantities by name. Their codes stand in setups and data files: one that was given out keeps its meaning for
// good. What they are called for people, and their units, stands in units_table.cpp.
#pragma once

namespace tervane::quantity {

inline constexpr int kUndefined = 999;  ///< A value of any meaning, without a unit.
inline constexpr int kWaterLevel = 100000;
inline constexpr int kDischarge = 100001;
inline constexpr int kRainfall = 100004;
inline constexpr int kEvapotranspirationDepth = 100005;
inline constexpr int kTemperature = 100006;
inline constexpr int kConcentration = 100007;
inline constexpr int kFlowVelocity = 100016;
inline constexpr int kBulkDensity = 100017;
inline constexpr int kRelativeHumidity = 100023;
inline constexpr int kSlope = 100025;
inline constexpr int kFlowArea = 100026;
inline constexpr int kManningNumber = 100030;
inline constexpr int kWaterVolume = 100035;
inline constexpr int kSoilWaterContent = 100058;
inline constexpr int kInfiltrationRate = 100061;
inline constexpr int kGroundwaterRechargeRate = 100062;
inline constexpr int kFlowPerWidth = 100080;
inline constexpr int kReservoirTimeConstant = 100091;
inline constexpr int kRillSlope = 100134;
inline constexpr int kChainage = 100143;
inline constexpr int kFactor = 100144;
inline constexpr int kExponentOrCoefficient = 100145;
inline constexpr int kStorageDepth = 100146;
inline constexpr int kKineticRate = 100150;
inline constexpr int kErosionRate = 100151;
inline constexpr int kDispersionCoefficient = 100153;
inline constexpr int kDegreeDayCoefficient = 100178;
inline constexpr int kElevation = 100180;
inline constexpr int kEvapotranspiration = 100182;
inline constexpr int kMapCoordinate = 100187;  ///< X and Y on the map.
inline constexpr int kTemperatureLapseRate = 100189;
inline constexpr int kPrecipitationLapseRate = 100190;
inline constexpr int kRadiationAndHeatFlux = 100203;
inline constexpr int kTimeStepLength = 100212;
inline constexpr int kHorizontalLength = 100217;
inline constexpr int kFraction = 100239;
inline constexpr int kMassFlux = 100241;
inline constexpr int kWindSpeed = 100274;
inline constexpr int kWaterDepth = 100280;
inline constexpr int kPorosityOfPhase = 100292;
inline constexpr int kSlopeLength = 100313;
inline constexpr int kSaturatedThickness = 100324;
inline constexpr int kPressureHead = 100353;
inline constexpr int kRootMassDistribution = 100355;
inline constexpr int kTranspirationParameterC1 = 100356;
inline constexpr int kTranspirationParameterC2 = 100357;
inline constexpr int kTranspirationParameterC3 = 100358;
inline constexpr int kIrrigationDemand = 100359;
inline constexpr int kVerticalWaterFlux = 100361;
inline constexpr int kLeakageCoefficient = 100362;
inline constexpr int kConductance = 100363;
inline constexpr int kHeightAboveGround = 100364;
inline constexpr int kGroundwaterAbstraction = 100365;
inline constexpr int kDepthBelowGround = 100366;
inline constexpr int kLayerThickness = 100367;
inline constexpr int kHeadGradient = 100368;
inline constexpr int kCode = 100370;  ///< Whole-number codes.
inline constexpr int kDrainageTimeConstant = 100371;
inline constexpr int kSpecificStorage = 100374;
inline constexpr int kSpecificYield = 100375;
inline constexpr int kSoilWaterExchangeRate = 100376;
inline constexpr int kWaterContent = 100377;
inline constexpr int kWaterInputRate = 100378;
inline constexpr int kRootDepth = 100380;
inline constexpr int kRillDepth = 100381;
inline constexpr int kYesOrNo = 100382;
inline constexpr int kLeafAreaIndex = 100383;
inline constexpr int kIrrigationRate = 100384;
inline constexpr int kIrrigationIndex = 100385;
inline constexpr int kInterceptionStorage = 100386;
inline constexpr int kEvapotranspirationRate = 100387;
inline constexpr int kErodedMassPerArea = 100388;
inline constexpr int kSedimentConcentrationByVolume = 100389;
inline constexpr int kSoilWaterError = 100390;
inline constexpr int kSoilWaterDeficit = 100392;
inline constexpr int kCropYield = 100393;
inline constexpr int kCropType = 100394;
inline constexpr int kCropStress = 100395;
inline constexpr int kCropStage = 100396;
inline constexpr int kCropLossRate = 100397;
inline constexpr int kCropIndex = 100398;
inline constexpr int kAge = 100399;
inline constexpr int kHydraulicConductivity = 100400;
inline constexpr int kSorbedConcentration = 100405;
inline constexpr int kAirPressure = 100409;
inline constexpr int kPrecipitationRate = 100431;
inline constexpr int kMassPerArea = 100437;
inline constexpr int kMass = 100452;
inline constexpr int kMassRate = 100453;
inline constexpr int kSorptionCoefficient = 100455;
inline constexpr int kPorosity = 100456;
inline constexpr int kHalfLife = 100457;
inline constexpr int kDispersivity = 100458;
inline constexpr int kPosition = 100514;
inline constexpr int kRadiationMeltCoefficient = 110050;
inline constexpr int kRainHeatMeltCoefficient = 110051;
inline constexpr int kResistance = 110200;
inline constexpr int kAbsoluteHumidity = 110210;
inline constexpr int kSaturatedLayerThickness = 110220;
inline constexpr int kCellVolume = 110230;

}  // namespace tervane::quantity
