/* Copyright (C) 2026 the Tervane developers */
/* SPDX-License-Identifier: GPL-3.0-or-later */

/*
 * The operations of tervane.h under the names that programs know them by from earlier: GetSimPeriod is
 * `tervane_GetSimPeriod`. As there, all give 1, and 0 when a node or a value is not there.
 */
#pragma once

#include "tervane.h"

static inline int tervane_OpenFile(const char* path, tervane_setup* setup) {
  return tervane_open(path, setup) == TERVANE_OK;
}
/** Always 1; whether it was saved is asked of `tervane_last_error`. */
static inline int tervane_SaveFile(tervane_setup setup, const char* path) {
  (void)tervane_save(setup, path);
  return 1;
}
static inline int tervane_GetNds2Kvf(tervane_setup setup, const char* important_name, const char* section, char* path,
                                     size_t size) {
  return tervane_grid_path(setup, important_name, section, path, size, NULL) == TERVANE_OK;
}
static inline int tervane_GetSimPeriod(tervane_setup setup, double* start, double* end) {
  return tervane_get_sim_period(setup, start, end) == TERVANE_OK;
}
static inline int tervane_SetSimPeriod(tervane_setup setup, double start, double end) {
  return tervane_set_sim_period(setup, start, end) == TERVANE_OK;
}
static inline int tervane_GetTimeStepInfo(tervane_setup setup, float* initial, float* overland, float* unsaturated,
                                          float* saturated) {
  return tervane_get_time_steps(setup, initial, overland, unsaturated, saturated) == TERVANE_OK;
}
static inline int tervane_SetTimeStepInfo(tervane_setup setup, float initial, float overland, float unsaturated,
                                          float saturated) {
  return tervane_set_time_steps(setup, initial, overland, unsaturated, saturated) == TERVANE_OK;
}
static inline int tervane_GetTSIncrementRate(tervane_setup setup, double* rate) {
  return tervane_get_increment_rate(setup, rate) == TERVANE_OK;
}
static inline int tervane_SetTSIncrementRate(tervane_setup setup, double rate) {
  return tervane_set_increment_rate(setup, rate) == TERVANE_OK;
}
static inline int tervane_GetPrecipitationDependentTS(tervane_setup setup, double* precipitation, double* infiltration,
                                                      double* threshold) {
  return tervane_get_precipitation_steps(setup, precipitation, infiltration, threshold) == TERVANE_OK;
}
static inline int tervane_SetPrecipitationDependentTS(tervane_setup setup, double precipitation, double infiltration,
                                                      double threshold) {
  return tervane_set_precipitation_steps(setup, precipitation, infiltration, threshold) == TERVANE_OK;
}

/* A pair for each quantity: GetManningNumNds2 and SetManningNumNds2. */
#define TERVANE_GRID_NAMES(name, grid)                                                                 \
  static inline int tervane_Get##name##Nds2(tervane_setup setup, char* file, size_t size, int* item) { \
    return tervane_get_grid_file(setup, grid, file, size, NULL, item) == TERVANE_OK;                   \
  }                                                                                                    \
  static inline int tervane_Set##name##Nds2(tervane_setup setup, const char* file) {                   \
    return tervane_set_grid_file(setup, grid, file) == TERVANE_OK;                                     \
  }
TERVANE_GRID_NAMES(DetentionStorage, TERVANE_DETENTION_STORAGE)
TERVANE_GRID_NAMES(ManningNum, TERVANE_MANNING_NUMBER)
TERVANE_GRID_NAMES(OLLeakageCoeff, TERVANE_OVERLAND_LEAKAGE)
TERVANE_GRID_NAMES(PavedRunoffCoeff, TERVANE_PAVED_RUNOFF)
TERVANE_GRID_NAMES(UZSoilDistribution, TERVANE_SOIL_DISTRIBUTION)

static inline int tervane_GetSimulationPeriod(tervane_climate climate, double* start, double* end) {
  return tervane_climate_period(climate, start, end) == TERVANE_OK;
}
static inline int tervane_GetLongLat(tervane_climate climate, double* longitude, double* latitude) {
  return tervane_climate_lon_lat(climate, longitude, latitude) == TERVANE_OK;
}

/* Nine for each family: GetNoPrecValues and the others. What cannot be counted counts 0. */
#define TERVANE_CLIMATE_NAMES(name, family)                                                                           \
  static inline int tervane_GetNo##name##Values(tervane_climate climate) {                                            \
    int count = 0;                                                                                                    \
    (void)tervane_climate_value_count(climate, family, &count);                                                       \
    return count;                                                                                                     \
  }                                                                                                                   \
  static inline int tervane_GetNo##name##TimeSeries(tervane_climate climate) {                                        \
    int count = 0;                                                                                                    \
    (void)tervane_climate_series_count(climate, family, &count);                                                      \
    return count;                                                                                                     \
  }                                                                                                                   \
  static inline int tervane_GetNo##name##GridSeries(tervane_climate climate) {                                        \
    int count = 0;                                                                                                    \
    (void)tervane_climate_grid_count(climate, family, &count);                                                        \
    return count;                                                                                                     \
  }                                                                                                                   \
  static inline int tervane_Get##name##Values(tervane_climate climate, int i, float* value) {                         \
    return tervane_climate_get_value(climate, family, i, value) == TERVANE_OK;                                        \
  }                                                                                                                   \
  static inline int tervane_Set##name##Values(tervane_climate climate, int i, float value) {                          \
    return tervane_climate_set_value(climate, family, i, value) == TERVANE_OK;                                        \
  }                                                                                                                   \
  static inline int tervane_Get##name##FileItem(tervane_climate climate, int i, char* file, size_t size, int* item) { \
    return tervane_climate_get_series(climate, family, i, file, size, NULL, item) == TERVANE_OK;                      \
  }                                                                                                                   \
  static inline int tervane_Set##name##File(tervane_climate climate, int i, const char* file) {                       \
    return tervane_climate_set_series(climate, family, i, file) == TERVANE_OK;                                        \
  }                                                                                                                   \
  static inline int tervane_Get##name##GridFileItem(tervane_climate climate, int i, char* file, size_t size,          \
                                                    int* item) {                                                      \
    return tervane_climate_get_grid(climate, family, i, file, size, NULL, item) == TERVANE_OK;                        \
  }                                                                                                                   \
  static inline int tervane_Set##name##GridFile(tervane_climate climate, int i, const char* file) {                   \
    return tervane_climate_set_grid(climate, family, i, file) == TERVANE_OK;                                          \
  }
TERVANE_CLIMATE_NAMES(Prec, TERVANE_PRECIPITATION)
TERVANE_CLIMATE_NAMES(Evap, TERVANE_EVAPORATION)
TERVANE_CLIMATE_NAMES(Temp, TERVANE_TEMPERATURE)
