// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdio>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "geometry/grid.h"
#include "modelcells/work_log.h"
#include "modflow6/modflow6_export.h"
#include "platform/files.h"

namespace tervane::modflow6 {

/// A file that is written piece by piece. What went wrong first stays and is told at the end.
class OutputFile {
 public:
  explicit OutputFile(std::string path);
  ~OutputFile();
  OutputFile(const OutputFile&) = delete;
  OutputFile& operator=(const OutputFile&) = delete;

  void Write(std::string_view bytes);
  /// Closes the file; "" or why it is not as it should be.
  std::string Close();

 private:
  std::string path_, problem_;
  std::FILE* file_ = nullptr;
  std::vector<char> buffer_;
};

/// Writes arrays of the model's cells where a package asks for them.
class ArrayFiles {
 public:
  ArrayFiles(const GridGeometry& geometry, std::string folder, Modflow6Options::Arrays form, WorkLog& log,
             std::vector<std::string>& written)
      : geometry_(geometry), folder_(std::move(folder)), form_(form), log_(log), written_(written) {}

  /// The control line of an array: "CONSTANT 1", or the file that now holds it, of that name below `arrays/`. `at`
  /// gives the value of a cell, counted from the south.
  template <class Number, class At>
  std::string Add(const std::string& name, const At& at) {
    std::vector<Number> values(geometry_.CellCount());
    const auto nx = static_cast<std::size_t>(geometry_.nx), ny = static_cast<std::size_t>(geometry_.ny);
    bool isConstant = true;
    for (std::size_t row = 0; row < ny; ++row)
      for (std::size_t column = 0; column < nx; ++column) {
        Number& value = values[row * nx + column];
        value = static_cast<Number>(at((ny - 1 - row) * nx + column));
        isConstant &= value == values.front();
      }
    return isConstant ? Constant(values.front()) : Write(name, values);
  }

  /// Why an array could not be written; empty while all were.
  const std::string& Problem() const { return problem_; }

 private:
  static std::string Constant(int value);
  static std::string Constant(double value);
  template <class Number>
  std::string Write(const std::string& name, const std::vector<Number>& values);

  const GridGeometry& geometry_;
  std::string folder_;
  Modflow6Options::Arrays form_;
  WorkLog& log_;
  std::vector<std::string>& written_;
  std::string problem_;
};

/// The shortest text that reads back as that number, with a point or an exponent.
void AppendNumber(std::string& text, double value);

}  // namespace tervane::modflow6
