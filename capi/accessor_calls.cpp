// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <array>

#include "capi/calls.h"

namespace tervane::capi {

namespace {

// ---- A few parameters of a setup

using Accessor = CTVNKvfAccessor;

tervane_result CallAccessor(tervane_setup setup, std::string_view what, const std::function<int(Accessor&)>& ask) {
  return CallWith(setup, [&](SetupObject& object) {
    if (!object.accessor) object.accessor = std::make_unique<Accessor>();
    object.accessor->HookKvf(&object.setup.Root());
    object.setup.Keys().Forget();
    NeedThere(ask(*object.accessor), what);
  });
}

/// The two operations of a grid file.
struct GridFile {
  int (Accessor::*get)(std::string& file, int& item) const;
  int (Accessor::*set)(const std::string& file);
};
constexpr std::array<GridFile, 5> kGridFiles{{
    {&Accessor::GetDetentionStorageNds2, &Accessor::SetDetentionStorageNds2},
    {&Accessor::GetManningNumNds2, &Accessor::SetManningNumNds2},
    {&Accessor::GetOLLeakageCoeffNds2, &Accessor::SetOLLeakageCoeffNds2},
    {&Accessor::GetPavedRunoffCoeffNds2, &Accessor::SetPavedRunoffCoeffNds2},
    {&Accessor::GetUZSoilDistributionNds2, &Accessor::SetUZSoilDistributionNds2},
}};

// ---- The climate

using Climate = CClimateChange_TVN;

/// The operations of a quantity of climate.
struct Family {
  int (Climate::*valueCount)();
  int (Climate::*seriesCount)();
  int (Climate::*gridCount)();
  int (Climate::*getValue)(int, float&) const;
  int (Climate::*setValue)(int, float);
  int (Climate::*getSeries)(int, std::string&, int&) const;
  int (Climate::*setSeries)(int, const std::string&);
  int (Climate::*getGrid)(int, std::string&, int&) const;
  int (Climate::*setGrid)(int, const std::string&);
};
constexpr std::array<Family, kClimateFamilyCount> kFamilies{{
    {&Climate::GetNoPrecValues, &Climate::GetNoPrecTimeSeries, &Climate::GetNoPrecGridSeries, &Climate::GetPrecValues,
     &Climate::SetPrecValues, &Climate::GetPrecFileItem, &Climate::SetPrecFile, &Climate::GetPrecGridFileItem,
     &Climate::SetPrecGridFile},
    {&Climate::GetNoEvapValues, &Climate::GetNoEvapTimeSeries, &Climate::GetNoEvapGridSeries, &Climate::GetEvapValues,
     &Climate::SetEvapValues, &Climate::GetEvapFileItem, &Climate::SetEvapFile, &Climate::GetEvapGridFileItem,
     &Climate::SetEvapGridFile},
    {&Climate::GetNoTempValues, &Climate::GetNoTempTimeSeries, &Climate::GetNoTempGridSeries, &Climate::GetTempValues,
     &Climate::SetTempValues, &Climate::GetTempFileItem, &Climate::SetTempFile, &Climate::GetTempGridFileItem,
     &Climate::SetTempGridFile},
}};

/// A row of a table by a number of the caller's.
template <class Table>
const auto& RowAt(const Table& table, int number) {
  if (number < 0 || number >= static_cast<int>(table.size())) Refuse(TERVANE_ARGUMENT, "there is no such quantity");
  return table[static_cast<std::size_t>(number)];
}

tervane_result CallClimate(tervane_climate climate, const std::function<void(Climate&)>& ask) {
  return CallWith(
      climate, [&](ClimateObject& object) { ask(object.climate); }, nullptr);
}

using Count = int (Climate::*Family::*)();
tervane_result CountOf(tervane_climate climate, int family, Count operation, int* count) {
  return CallClimate(climate, [&](Climate& object) {
    Need({count});
    *count = (object.*(RowAt(kFamilies, family).*operation))();
  });
}

using GetFile = int (Climate::*Family::*)(int, std::string&, int&) const;
tervane_result FileOf(tervane_climate climate, int family, GetFile operation, int number, char* buffer, size_t size,
                      size_t* length, int* item) {
  return CallClimate(climate, [&](Climate& object) {
    std::string file;
    int chosen = 0;
    NeedThere((object.*(RowAt(kFamilies, family).*operation))(number, file, chosen), "such file");
    if (item) *item = chosen;
    Give(file, buffer, size, length);
  });
}

using SetFile = int (Climate::*Family::*)(int, const std::string&);
tervane_result ChooseFile(tervane_climate climate, int family, SetFile operation, int number, const char* path) {
  return CallClimate(climate, [&](Climate& object) {
    Need({path});
    NeedThere((object.*(RowAt(kFamilies, family).*operation))(number, path), "place for such a file");
  });
}

}  // namespace

}  // namespace tervane::capi

using namespace tervane;
using namespace tervane::capi;

extern "C" {

tervane_result tervane_get_sim_period(tervane_setup setup, double* start, double* end) {
  return CallAccessor(setup, "simulation period", [&](Accessor& accessor) {
    Need({start, end});
    return accessor.GetSimPeriod(*start, *end);
  });
}

tervane_result tervane_set_sim_period(tervane_setup setup, double start, double end) {
  return CallAccessor(setup, "place for such dates",
                      [&](Accessor& accessor) { return accessor.SetSimPeriod(start, end); });
}

tervane_result tervane_get_time_steps(tervane_setup setup, float* initial, float* overland, float* unsaturated,
                                      float* saturated) {
  return CallAccessor(setup, "time steps", [&](Accessor& accessor) {
    Need({initial, overland, unsaturated, saturated});
    return accessor.GetTimeStepInfo(*initial, *overland, *unsaturated, *saturated);
  });
}

tervane_result tervane_set_time_steps(tervane_setup setup, float initial, float overland, float unsaturated,
                                      float saturated) {
  return CallAccessor(setup, "time steps", [&](Accessor& accessor) {
    return accessor.SetTimeStepInfo(initial, overland, unsaturated, saturated);
  });
}

tervane_result tervane_get_increment_rate(tervane_setup setup, double* rate) {
  return CallAccessor(setup, "increment rate", [&](Accessor& accessor) {
    Need({rate});
    return accessor.GetTSIncrementRate(*rate);
  });
}

tervane_result tervane_set_increment_rate(tervane_setup setup, double rate) {
  return CallAccessor(setup, "increment rate", [&](Accessor& accessor) { return accessor.SetTSIncrementRate(rate); });
}

tervane_result tervane_get_precipitation_steps(tervane_setup setup, double* precipitation, double* infiltration,
                                               double* threshold) {
  return CallAccessor(setup, "time steps", [&](Accessor& accessor) {
    Need({precipitation, infiltration, threshold});
    return accessor.GetPrecipitationDependentTS(*precipitation, *infiltration, *threshold);
  });
}

tervane_result tervane_set_precipitation_steps(tervane_setup setup, double precipitation, double infiltration,
                                               double threshold) {
  return CallAccessor(setup, "time steps", [&](Accessor& accessor) {
    return accessor.SetPrecipitationDependentTS(precipitation, infiltration, threshold);
  });
}

tervane_result tervane_get_grid_file(tervane_setup setup, int grid, char* buffer, size_t size, size_t* length,
                                     int* item) {
  std::string file;
  const tervane_result result = CallAccessor(setup, "grid file for it", [&](Accessor& accessor) {
    int chosen = 0;
    const int isThere = (accessor.*RowAt(kGridFiles, grid).get)(file, chosen);
    if (isThere && item) *item = chosen;
    return isThere;
  });
  return result != TERVANE_OK ? result : Call([&] { Give(file, buffer, size, length); });
}

tervane_result tervane_set_grid_file(tervane_setup setup, int grid, const char* path) {
  return CallAccessor(setup, "place for such a file", [&](Accessor& accessor) {
    Need({path});
    return (accessor.*RowAt(kGridFiles, grid).set)(path);
  });
}

tervane_result tervane_grid_path(tervane_setup setup, const char* important_name, const char* section, char* buffer,
                                 size_t size, size_t* length) {
  return CallAccessor(setup, "such quantity", [&](Accessor& accessor) {
    Need({important_name, section});
    const CData2DKvf* node = accessor.GetNds2Kvf(important_name, section);
    if (node) Give(PathOf(*node), buffer, size, length);
    return node != nullptr;
  });
}

tervane_result tervane_climate_open(const char* path, tervane_climate* climate) {
  return Call([&] {
    Need({path, climate});
    auto object = std::make_shared<ClimateObject>();
    if (!object->climate.OpenFile(path)) Refuse(TERVANE_FAILED, object->climate.Error());
    *climate = Climates().Add(std::move(object));
  });
}

tervane_result tervane_climate_copy(tervane_climate climate, tervane_climate* copy) {
  return CallClimate(climate, [&](Climate& object) {
    Need({copy});
    auto made = std::make_shared<ClimateObject>();
    made->climate = object;
    *copy = Climates().Add(std::move(made));
  });
}

tervane_result tervane_climate_save(tervane_climate climate, const char* path) {
  return CallClimate(climate, [&](Climate& object) {
    Need({path});
    object.SaveFile(path);
    if (!object.Error().empty()) Refuse(TERVANE_FAILED, object.Error());
  });
}

tervane_result tervane_climate_close(tervane_climate climate) {
  return CallClimate(climate, [&](Climate&) { Climates().Remove(climate); });
}

tervane_result tervane_climate_period(tervane_climate climate, double* start, double* end) {
  return CallClimate(climate, [&](Climate& object) {
    Need({start, end});
    NeedThere(object.GetSimulationPeriod(*start, *end), "simulation period");
  });
}

tervane_result tervane_climate_lon_lat(tervane_climate climate, double* longitude, double* latitude) {
  return CallClimate(climate, [&](Climate& object) {
    Need({longitude, latitude});
    NeedThere(object.GetLongLat(*longitude, *latitude), "place on the earth");
  });
}

tervane_result tervane_climate_value_count(tervane_climate climate, int family, int* count) {
  return CountOf(climate, family, &Family::valueCount, count);
}

tervane_result tervane_climate_series_count(tervane_climate climate, int family, int* count) {
  return CountOf(climate, family, &Family::seriesCount, count);
}

tervane_result tervane_climate_grid_count(tervane_climate climate, int family, int* count) {
  return CountOf(climate, family, &Family::gridCount, count);
}

tervane_result tervane_climate_get_value(tervane_climate climate, int family, int number, float* value) {
  return CallClimate(climate, [&](Climate& object) {
    Need({value});
    NeedThere((object.*RowAt(kFamilies, family).getValue)(number, *value), "such value");
  });
}

tervane_result tervane_climate_set_value(tervane_climate climate, int family, int number, float value) {
  return CallClimate(climate, [&](Climate& object) {
    NeedThere((object.*RowAt(kFamilies, family).setValue)(number, value), "such value");
  });
}

tervane_result tervane_climate_get_series(tervane_climate climate, int family, int number, char* buffer, size_t size,
                                          size_t* length, int* item) {
  return FileOf(climate, family, &Family::getSeries, number, buffer, size, length, item);
}

tervane_result tervane_climate_set_series(tervane_climate climate, int family, int number, const char* path) {
  return ChooseFile(climate, family, &Family::setSeries, number, path);
}

tervane_result tervane_climate_get_grid(tervane_climate climate, int family, int number, char* buffer, size_t size,
                                        size_t* length, int* item) {
  return FileOf(climate, family, &Family::getGrid, number, buffer, size, length, item);
}

tervane_result tervane_climate_set_grid(tervane_climate climate, int family, int number, const char* path) {
  return ChooseFile(climate, family, &Family::setGrid, number, path);
}

}  // extern "C"
