/* Copyright (C) 2026 the Tervane developers */
/* SPDX-License-Identifier: GPL-3.0-or-later */

/*
 * Setups of the integrated catchment model Tervane, for programs in C and in languages that call C.
 *
 * Every operation gives a result, TERVANE_OK when it is done; `tervane_last_error` tells why it is not. Texts are
 * UTF-8. Paths into a setup are section names joined by '/', with "#n" behind a name for the n-th of equal names and
 * ":KEY" behind for a key: "SimSpec/SimTitle:Title". Items of lists count from 1. Numbers are in the unit in which the
 * file holds them, unless another one is named.
 *
 * A handle that was closed, or never was one, is refused and harms nothing. A setup may be used by one thread at a
 * time; a call that comes while another thread uses it gives TERVANE_BUSY. Nothing is written before a setup is saved.
 */
#pragma once

#include <stddef.h>
#include <stdint.h>

#if defined(_WIN32)
#define TERVANE_API __declspec(dllexport)
#else
#define TERVANE_API __attribute__((visibility("default")))
#endif

#ifdef __cplusplus
extern "C" {
#endif

/** Counted up when an operation is taken away or changes its meaning. */
#define TERVANE_ABI 1

typedef enum tervane_result {
  TERVANE_OK = 0,
  TERVANE_FAILED = 1,    /**< It could not be done: a file, a lock, what a setup does not allow. */
  TERVANE_NO_HANDLE = 2, /**< The handle was closed, or is none of this kind. */
  TERVANE_BUSY = 3,      /**< Another thread uses the setup. */
  TERVANE_NOT_THERE = 4, /**< The setup has no such place, key, item or value. */
  TERVANE_REFUSED = 5,   /**< The key does not take the value, or the unit does not fit. */
  TERVANE_TOO_SMALL = 6, /**< The buffer is too small: `length` tells what is needed. */
  TERVANE_ARGUMENT = 7,  /**< A null where none may be, or a number that counts nothing. */
  TERVANE_NO_MEMORY = 8
} tervane_result;

/** A setup. 0 is none. */
typedef uint64_t tervane_setup;
/** The climate of a setup of its own, with the definition of where its values stand. 0 is none. */
typedef uint64_t tervane_climate;

/** The version of the library, "0.1.0". */
TERVANE_API const char* tervane_version(void);
/** The TERVANE_ABI of the library, to be held against that of the header. */
TERVANE_API int tervane_abi(void);
/** Why the latest call of this thread was not done; empty when it was. It stays until the next call of this thread. */
TERVANE_API const char* tervane_last_error(void);

/* ---- Setups */

/** Makes a setup at its defaults. */
TERVANE_API tervane_result tervane_new(tervane_setup* setup);
/** Reads a setup of any document version. */
TERVANE_API tervane_result tervane_open(const char* path, tervane_setup* setup);
/** Makes a second setup that is alike and was never saved. */
TERVANE_API tervane_result tervane_copy(tervane_setup setup, tervane_setup* copy);
/** Writes it in one step; a null path is that of the setup. What an editor holds, or another program has changed
 *  meanwhile, is not written over. */
TERVANE_API tervane_result tervane_save(tervane_setup setup, const char* path);
/** Gives the handle back. What was not saved is gone. */
TERVANE_API tervane_result tervane_close(tervane_setup setup);

/* Texts are written into `buffer` with a NUL behind, where they fit into `size` bytes; `length`, which may be null, is
 * how many there are without the NUL. */

/** The value of a key as the file would hold it: several with commas between, texts without quotes. */
TERVANE_API tervane_result tervane_get_text(tervane_setup setup, const char* path, char* buffer, size_t size,
                                            size_t* length);
/** Gives a key a value, typed as the file holds it or as people do: the text of a choice, "2 days", "2001-03-31". */
TERVANE_API tervane_result tervane_set_text(tervane_setup setup, const char* path, const char* value);
/** A number in a unit ("m", "mm/day"); a null unit is that of the file. True and false are 1 and 0. */
TERVANE_API tervane_result tervane_get_number(tervane_setup setup, const char* path, const char* unit, double* value);
TERVANE_API tervane_result tervane_set_number(tervane_setup setup, const char* path, const char* unit, double value);

/** How many items a list, or node with zones, has. */
TERVANE_API tervane_result tervane_item_count(tervane_setup setup, const char* path, int* count);
/** Makes an item in front of that number, from 1; behind all others where there is none. `item`, which may be null,
 * gets the path of the new item, as texts do; where it is too small nothing is made. */
TERVANE_API tervane_result tervane_insert_item(tervane_setup setup, const char* path, int number, char* item,
                                               size_t size, size_t* length);
TERVANE_API tervane_result tervane_delete_item(tervane_setup setup, const char* path, int number);
/** The path of an item. */
TERVANE_API tervane_result tervane_item_path(tervane_setup setup, const char* path, int number, char* buffer,
                                             size_t size, size_t* length);
/** 1 when the node at the path takes part in the setup, else 0. */
TERVANE_API tervane_result tervane_takes_part(tervane_setup setup, const char* path, int* takes_part);

typedef enum tervane_severity {
  TERVANE_ERROR = 0,
  TERVANE_WARNING = 1,
  TERVANE_NOTE = 2,
  TERVANE_UNREAD = 3 /**< Stands in the file and is read by nothing. */
} tervane_severity;
/** What is wrong with a setup. The texts live as long as the call that gets them. */
typedef struct tervane_finding {
  tervane_severity severity;
  const char* path;
  const char* key; /**< May be empty. */
  const char* text;
  const char* detail; /**< The reason behind the text; may be empty. */
  int line;           /**< Of the file that was read; 0 when it speaks of none. */
} tervane_finding;
/** Called for each finding in turn, with the caller's `context`, after the setup was validated. */
typedef void (*tervane_finding_sink)(const tervane_finding* finding, void* context);
/** Validates the whole setup. */
TERVANE_API tervane_result tervane_validate(tervane_setup setup, tervane_finding_sink sink, void* context);

/** Called for each difference in turn: "SimSpec:ModelType", "0", "2". A section that one setup lacks has an empty text
 *  there. */
typedef void (*tervane_difference_sink)(const char* place, const char* from, const char* to, void* context);
TERVANE_API tervane_result tervane_diff(tervane_setup from, tervane_setup to, tervane_difference_sink sink,
                                        void* context);
/** Writes into `out`, which must not be there, what comes of two setup files that were made from one; `conflicts` is
 * how many things both have changed in different ways, which are as in `mine`. */
TERVANE_API tervane_result tervane_merge(const char* base, const char* mine, const char* theirs, const char* out,
                                         int* conflicts);

/* ---- A few parameters by themselves. Dates are days since 1899-12-30, steps are in hours. */

TERVANE_API tervane_result tervane_get_sim_period(tervane_setup setup, double* start, double* end);
TERVANE_API tervane_result tervane_set_sim_period(tervane_setup setup, double start, double end);
/** The initial time step, and the greatest ones of overland flow, unsaturated and saturated zone. */
TERVANE_API tervane_result tervane_get_time_steps(tervane_setup setup, float* initial, float* overland,
                                                  float* unsaturated, float* saturated);
TERVANE_API tervane_result tervane_set_time_steps(tervane_setup setup, float initial, float overland, float unsaturated,
                                                  float saturated);
TERVANE_API tervane_result tervane_get_increment_rate(tervane_setup setup, double* rate);
TERVANE_API tervane_result tervane_set_increment_rate(tervane_setup setup, double rate);
/** The greatest depths of precipitation and infiltration in a time step, and the rate of precipitation from which on a
 *  step begins with it. */
TERVANE_API tervane_result tervane_get_precipitation_steps(tervane_setup setup, double* precipitation,
                                                           double* infiltration, double* threshold);
TERVANE_API tervane_result tervane_set_precipitation_steps(tervane_setup setup, double precipitation,
                                                           double infiltration, double threshold);

/** Quantities that may be given by a grid file: what operations take as `grid`. */
typedef enum tervane_grid {
  TERVANE_DETENTION_STORAGE = 0,
  TERVANE_MANNING_NUMBER = 1,
  TERVANE_OVERLAND_LEAKAGE = 2,
  TERVANE_PAVED_RUNOFF = 3,
  TERVANE_SOIL_DISTRIBUTION = 4
} tervane_grid;
/** Answers where the quantity is given by a grid file. */
TERVANE_API tervane_result tervane_get_grid_file(tervane_setup setup, int grid, char* buffer, size_t size,
                                                 size_t* length, int* item);
/** Selects item 1 of the file, and leaves the quantity's source as it is. */
TERVANE_API tervane_result tervane_set_grid_file(tervane_setup setup, int grid, const char* path);
/** The path of the child with that section of the node with that important name, where it is a quantity over the area:
 *  "Overland", "Manning". */
TERVANE_API tervane_result tervane_grid_path(tervane_setup setup, const char* important_name, const char* section,
                                             char* buffer, size_t size, size_t* length);

/* ---- The climate of a setup, and where it stands */

typedef enum tervane_family {
  TERVANE_PRECIPITATION = 0,
  TERVANE_EVAPORATION = 1,
  TERVANE_TEMPERATURE = 2
} tervane_family;

/** Reads a setup of its own. When the last of its copies is closed, CCDefinition_TVN.def is written beside the setup: a
 *  section for each family that was counted, which tells where its values stand. Count a family in the order values,
 *  series, grids. */
TERVANE_API tervane_result tervane_climate_open(const char* path, tervane_climate* climate);
/** A second handle of the same. */
TERVANE_API tervane_result tervane_climate_copy(tervane_climate climate, tervane_climate* copy);
TERVANE_API tervane_result tervane_climate_save(tervane_climate climate, const char* path);
TERVANE_API tervane_result tervane_climate_close(tervane_climate climate);
TERVANE_API tervane_result tervane_climate_period(tervane_climate climate, double* start, double* end);
/** Of the origin of the model; TERVANE_NOT_THERE and both 0 with a local projection. */
TERVANE_API tervane_result tervane_climate_lon_lat(tervane_climate climate, double* longitude, double* latitude);
TERVANE_API tervane_result tervane_climate_value_count(tervane_climate climate, int family, int* count);
TERVANE_API tervane_result tervane_climate_series_count(tervane_climate climate, int family, int* count);
TERVANE_API tervane_result tervane_climate_grid_count(tervane_climate climate, int family, int* count);
TERVANE_API tervane_result tervane_climate_get_value(tervane_climate climate, int family, int number, float* value);
TERVANE_API tervane_result tervane_climate_set_value(tervane_climate climate, int family, int number, float value);
TERVANE_API tervane_result tervane_climate_get_series(tervane_climate climate, int family, int number, char* buffer,
                                                      size_t size, size_t* length, int* item);
TERVANE_API tervane_result tervane_climate_set_series(tervane_climate climate, int family, int number,
                                                      const char* path);
TERVANE_API tervane_result tervane_climate_get_grid(tervane_climate climate, int family, int number, char* buffer,
                                                    size_t size, size_t* length, int* item);
TERVANE_API tervane_result tervane_climate_set_grid(tervane_climate climate, int family, int number, const char* path);

#ifdef __cplusplus
}
#endif
