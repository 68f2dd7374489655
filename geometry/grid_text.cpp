// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Reading grids from text.
#include <algorithm>
#include <array>
#include <cmath>
#include <limits>
#include <new>
#include <optional>

#include <fmt/format.h>

#include "geometry/grid.h"
#include "platform/text.h"
#include "platform/text_fields.h"

namespace tervane {
namespace {

/// What the heading of an ASCII grid can say.
struct Heading {
  std::optional<double> ncols, nrows, xllcorner, yllcorner, xllcenter, yllcenter, cellsize, nodata_value;

  /// The place of a name's value, or null when it is no name of a heading.
  std::optional<double>* Find(std::string_view name) {
    struct Row {
      std::string_view name;
      std::optional<double> Heading::*member;
    };
    static constexpr Row kRows[] = {
        {"ncols", &Heading::ncols},         {"nrows", &Heading::nrows},
        {"xllcorner", &Heading::xllcorner}, {"yllcorner", &Heading::yllcorner},
        {"xllcenter", &Heading::xllcenter}, {"yllcenter", &Heading::yllcenter},
        {"cellsize", &Heading::cellsize},   {"nodata_value", &Heading::nodata_value},
    };
    for (const Row& row : kRows) {
      if (EqualIgnoringCase(row.name, name)) return &(this->*row.member);
    }
    return nullptr;
  }
};

class GridTextReader {
 public:
  GridTextReader(std::string_view text, const GridGeometry& place, float deleteValue, ProgressPart progress)
      : geometry(place),
        size_(text.size()),
        lines_(text),
        told_(text, progress),
        progress_(progress),
        deleteValue_(deleteValue) {}

  /// Gives why the text is no grid.
  std::string Read() {
    std::string_view line;
    bool isLine = false;
    while ((isLine = lines_.Next(line))) {
      std::string_view fields = line;
      const std::string_view name = NextField(fields, rules_);
      if (name.empty()) continue;
      std::optional<double>* const value = heading_.Find(name);
      if (!value) break;
      double number = 0;
      const std::string_view field = NextField(fields, rules_);
      if (!ReadNumber(field, rules_, number))
        return At(fmt::format("{} is \"{}\", which is no number", name, Shown(field)));
      *value = number;
    }
    if (heading_.ncols.has_value() != heading_.nrows.has_value())
      return "ncols and nrows must both be given, or neither";
    if (!isLine) return "it holds no rows of numbers";
    if (std::string reason = TakeHeading(); !reason.empty()) return reason;
    // The file's first row is the northern one, the grid's first the southern: the order is turned at the end.
    do {
      told_.After(lines_);
      if (std::string reason = ReadRow(line); !reason.empty()) return reason;
    } while (lines_.Next(line));
    if (!heading_.ncols) geometry.ny = rows_;
    if (values.size() != geometry.CellCount()) {
      return fmt::format("it ends after {} values; {} by {} are {}", values.size(), geometry.nx, geometry.ny,
                         geometry.CellCount());
    }
    for (int south = 0, north = geometry.ny - 1; south < north; ++south, --north) {
      const auto row = [&](int j) { return values.begin() + static_cast<std::ptrdiff_t>(j) * geometry.nx; };
      std::swap_ranges(row(south), row(south) + geometry.nx, row(north));
    }
    return {};
  }

  GridGeometry geometry;
  std::vector<float> values;
  std::string note;

 private:
  std::string At(std::string_view reason) const { return fmt::format("line {}: {}", lines_.Number(), reason); }

  std::string TakeHeading() {
    geometry.ny = 1;
    geometry.nx = 1;
    if (heading_.ncols) {
      const double nx = *heading_.ncols, ny = *heading_.nrows;
      if (nx != std::floor(nx) || ny != std::floor(ny) || nx < 1 || ny < 1 || nx > kMostCells || ny > kMostCells) {
        return fmt::format("its heading tells {} by {} cells", nx, ny);
      }
      // Each value takes a digit and what stands behind it.
      if (nx * ny > static_cast<double>(size_ / 2 + 1)) {
        return fmt::format("its heading tells {} by {} cells; a file of {} bytes cannot hold them", nx, ny, size_);
      }
      geometry.nx = static_cast<int>(nx);
      geometry.ny = static_cast<int>(ny);
      values.reserve(geometry.CellCount());
    }
    const auto take = [this](const char* name, std::optional<double> value, double& target) {
      if (!value || *value == target) return;
      note += fmt::format("{}{} is {}, as the file says", note.empty() ? "" : "; ", name, *value);
      target = *value;
    };
    take("the cell size", heading_.cellsize, geometry.cellSize);
    const double half = geometry.cellSize / 2;
    const auto corner = [half](std::optional<double> atCorner, std::optional<double> atCentre) {
      return atCentre ? std::optional(*atCentre - half) : atCorner;
    };
    take("x0", corner(heading_.xllcorner, heading_.xllcenter), geometry.x0);
    take("y0", corner(heading_.yllcorner, heading_.yllcenter), geometry.y0);
    return geometry.Problem();
  }

  std::string ReadRow(std::string_view line) {
    // A row may be as long as the whole file.
    progress_.ThrowIfCancelled();
    const std::size_t before = values.size();
    for (std::string_view field = NextField(line, rules_); !field.empty(); field = NextField(line, rules_)) {
      double number = 0;
      if (!ReadNumber(field, rules_, number)) return At(fmt::format("\"{}\" is no number", Shown(field)));
      if (values.size() == (heading_.ncols ? geometry.CellCount() : kMostCells))
        return At("there are more values than cells");
      const auto value = static_cast<float>(number);
      if (!std::isfinite(value)) return At(fmt::format("{} is more than a grid can hold", number));
      values.push_back(heading_.nodata_value == number ? deleteValue_ : value);
    }
    const std::size_t count = values.size() - before;
    if (heading_.ncols || count == 0) return {};
    // Without a heading a line is a row.
    if (rows_++ == 0) geometry.nx = static_cast<int>(count);
    if (count != static_cast<std::size_t>(geometry.nx)) {
      return At(fmt::format("the row has {} numbers, the first one has {}", count, geometry.nx));
    }
    return {};
  }

  std::size_t size_;
  LineReader lines_;
  LineProgress told_;
  ProgressPart progress_;
  FieldRules rules_;
  Heading heading_;
  int rows_ = 0;
  float deleteValue_;
};

}  // namespace

FileResult CTvn2DOrthoRotatedGridData::ReadTextFile(const std::string& path, const GridGeometry& place,
                                                    float deleteValue, int itemUnit, int itemType,
                                                    ProgressPart progress) {
  constexpr double kReading = 0.2;
  FileContent content;
  FileResult result = ReadWholeFile(path, content, progress.Part(0, kReading));
  if (!result.Ok()) return result;
  std::string reason = WhyNoText(content.Text());
  try {
    GridTextReader reader(content.Text(), place, deleteValue, progress.Part(kReading, 1));
    if (reason.empty()) reason = reader.Read();
    if (reason.empty())
      reason = TakeValues(std::move(reader.geometry), std::move(reader.values), deleteValue, itemUnit, itemType);
    result.note = reader.note;
  } catch (const std::bad_alloc&) {
    reason = "there is no memory for its cells";
  } catch (const Cancelled&) {
    reason = kCancelled;
  }
  if (!reason.empty()) return {fmt::format("cannot read {} as a grid: {}", path, reason), {}};
  return result;
}

}  // namespace tervane
