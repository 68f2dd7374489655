// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What the result files of a simulation will take on the disk, by the setup alone: cells and layers of each file, the
// steps that its storing interval makes of the simulation, and the types in it, at four bytes a value.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "results/grid_series.h"

namespace tervane {

class CStoringResultsKvf;

/// How much one type takes; without `bytes` nobody knows.
struct TypeCost {
  const ResultDataType* type = nullptr;
  std::optional<double> valuesOfStep;  ///< Cells times layers.
  std::optional<double> steps;
  std::string unknown = {};  ///< Why not: "the number of river points is not known".

  std::optional<double> Bytes() const;
};

/// The same for a file with all its stored types.
struct FileCost {
  const ResultFile* file = nullptr;
  int types = 0;
  int unknownTypes = 0;  ///< Of them, those that no number is known of.
  double bytes = 0;      ///< Of the others.
};

struct StoringCost {
  std::vector<TypeCost> types;  ///< What is stored: ticked and required types with a file.
  std::vector<FileCost> files;  ///< In the order of the result files.
  double bytes = 0;
  int unknownTypes = 0;

  /// "1.5 GB in 4 files, and 2 types of which nobody knows".
  std::string Text() const;
};

/// What decides the cost of all types; made once for many.
class CostOfTypes {
 public:
  explicit CostOfTypes(const CStoringResultsKvf& storing);
  TypeCost Of(const ResultDataType& type) const;

 private:
  std::optional<double> ValuesOf(const ResultDataType& type, std::string& unknown) const;

  const CStoringResultsKvf& storing_;
  double cells_ = 0;          ///< Of the grid around the domain, as files hold it.
  double layers_ = 0;         ///< Computational layers; 0 where their number is not known.
  double nodes_ = 0;          ///< Of the deepest soil profile; 0 where there is none.
  double cellsOfCoarse_ = 1;  ///< Of the finer grid in a cell of the model.
  double hours_ = 0;          ///< Of the simulation.
};

/// Of the rows of the list those that are stored.
StoringCost ForecastCost(const CStoringResultsKvf& storing, const std::vector<GridSeriesRow>& rows);

/// The free bytes where a folder is or will be; nothing where nobody tells.
std::optional<double> FreeBytesAt(const std::string& folder);
/// "512 bytes", "1.4 MB": of 1024 each.
std::string SizeInWords(double bytes);

}  // namespace tervane
