// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "geometry/grid_polygons.h"

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <deque>
#include <map>
#include <new>
#include <utility>

#include <fmt/format.h>

#include "platform/item_types.h"
#include "platform/text_fields.h"

namespace tervane {
namespace {

/// The first row or column at or behind `limit` whose centre lies at or beyond it.
int FirstCentre(double limit, int count) {
  // Without a call of the library, of which a map would need millions.
  const double place = std::clamp(limit - 0.5, 0.0, static_cast<double>(count));
  const int whole = static_cast<int>(place);
  return whole < place ? whole + 1 : whole;
}

/// Most rows have a few crossings, for which the library's sort is slow.
template <class Iterator>
void SortFew(Iterator begin, Iterator end) {
  constexpr std::ptrdiff_t kFew = 16;
  if (end - begin > kFew) return std::sort(begin, end);
  for (Iterator next = begin; next != end; ++next) {
    const auto value = *next;
    Iterator place = next;
    for (; place != begin && value < place[-1]; --place) *place = place[-1];
    *place = value;
  }
}

}  // namespace

PolygonRaster::PolygonRaster(const GridGeometry& geometry, ProgressPart progress)
    : nx_(geometry.nx),
      ny_(geometry.ny),
      transform_(geometry),
      progress_(progress),
      rows_(static_cast<std::size_t>(ny_) + 1) {}

template <class Found>
void PolygonRaster::ForEdges(const Shape& shape, std::size_t first, std::size_t last, const Found& found) const {
  for (std::size_t part = first; part < last; ++part) {
    const std::size_t begin = shape.parts[part], end = shape.PartEnd(part);
    if (begin == end) continue;
    MapPoint before = transform_.ToCells(shape.points[end - 1]);
    for (std::size_t i = begin; i < end; ++i) {
      const MapPoint point = transform_.ToCells(shape.points[i]);
      // From the lower end always: polygons that share an edge find it at the same place, and no cell between them.
      const bool isUp = before.y < point.y;
      const MapPoint low = isUp ? before : point, high = isUp ? point : before;
      before = point;
      const int rowBegin = FirstCentre(low.y, ny_), rowEnd = FirstCentre(high.y, ny_);
      if (rowBegin < rowEnd) found(low, high, rowBegin, rowEnd);
      progress_.ThrowIfCancelled();
    }
  }
}

const std::vector<PolygonRaster::Span>& PolygonRaster::Spans(const Shape& shape, std::size_t first, std::size_t last) {
  spans_.clear();
  std::size_t crossings = 0;
  int lowest = ny_, highest = 0;
  ForEdges(shape, first, last, [&](MapPoint, MapPoint, int rowBegin, int rowEnd) {
    crossings += static_cast<std::size_t>(rowEnd - rowBegin);
    lowest = std::min(lowest, rowBegin);
    highest = std::max(highest, rowEnd);
    ++rows_[static_cast<std::size_t>(rowBegin)].moreEdges;
    --rows_[static_cast<std::size_t>(rowEnd)].moreEdges;
  });
  if (crossings == 0) return spans_;
  // A polygon that goes to and fro over a large grid crosses more rows than there is memory for at once.
  constexpr std::size_t kMostCrossings = 10'000'000;
  const auto bands = static_cast<int>(std::min(crossings / kMostCrossings + 1, static_cast<std::size_t>(ny_)));
  const int bandRows = (highest - lowest) / bands + 1;
  std::ptrdiff_t edges = 0;
  for (int begin = lowest; begin < highest; begin += bandRows)
    AddSpans(shape, first, last, begin, std::min(highest, begin + bandRows), edges);
  rows_[static_cast<std::size_t>(highest)].moreEdges = 0;
  return spans_;
}

void PolygonRaster::AddSpans(const Shape& shape, std::size_t first, std::size_t last, int begin, int end,
                             std::ptrdiff_t& edges) {
  std::ptrdiff_t count = 0;
  for (int j = begin; j < end; ++j) {
    Row& row = rows_[static_cast<std::size_t>(j)];
    row.crossingsEnd = count;
    count += edges += std::exchange(row.moreEdges, 0);
  }
  crossings_.resize(static_cast<std::size_t>(count));
  ForEdges(shape, first, last, [&](MapPoint low, MapPoint high, int rowBegin, int rowEnd) {
    const double slope = (high.x - low.x) / (high.y - low.y);
    for (int j = std::max(begin, rowBegin); j < std::min(end, rowEnd); ++j) {
      const std::ptrdiff_t at = rows_[static_cast<std::size_t>(j)].crossingsEnd++;
      crossings_[static_cast<std::size_t>(at)] = low.x + (j + 0.5 - low.y) * slope;
    }
  });
  auto rowBegin = crossings_.begin();
  for (int j = begin; j < end; ++j) {
    const auto rowEnd = crossings_.begin() + rows_[static_cast<std::size_t>(j)].crossingsEnd;
    progress_.ThrowIfCancelled();
    SortFew(rowBegin, rowEnd);
    for (; rowEnd - rowBegin >= 2; rowBegin += 2) {
      const int from = FirstCentre(rowBegin[0], nx_), to = FirstCentre(rowBegin[1], nx_);
      if (from < to) spans_.push_back({j, from, to});
    }
    rowBegin = rowEnd;
  }
}

namespace {

/// Puts codes into parts of rows, many at a time, and those of a few rows together: the cells stay in a fast cache
/// while one polygon after the other is put over them.
class SpanPainter {
 public:
  SpanPainter(const GridGeometry& geometry, std::vector<float>& values)
      : nx_(geometry.nx), values_(values), bands_(static_cast<std::size_t>((geometry.ny - 1) / kBandRows + 1)) {
    // Half as much memory as the grid takes, or little.
    mostSpans_ = std::max(values.size() * sizeof(float) / 2 / sizeof(Painted), std::size_t{1} << 16);
  }

  /// Later ones count where spans overlap.
  void Add(const PolygonRaster::Span& span, float code) {
    if (count_ == mostSpans_) Paint({});
    ++count_;
    bands_[static_cast<std::size_t>(span.j / kBandRows)].push_back(
        {span.j % kBandRows * nx_ + span.begin, span.end - span.begin, code});
  }
  void Paint(ProgressPart progress) {
    auto first = values_.begin();
    for (std::deque<Painted>& band : bands_) {
      for (const Painted& each : band) std::fill_n(first + each.begin, each.count, each.code);
      band.clear();
      progress.ThrowIfCancelled();
      // The last band may have fewer rows, and none follows it.
      if (&band != &bands_.back()) first += static_cast<std::ptrdiff_t>(kBandRows) * nx_;
    }
    count_ = 0;
    progress.Report(1);
  }

 private:
  /// Cells of a band, counted row by row.
  struct Painted {
    int begin, count;
    float code;
  };
  static constexpr int kBandRows = 8;

  int nx_;
  std::vector<float>& values_;
  std::vector<std::deque<Painted>> bands_;
  std::size_t count_ = 0, mostSpans_;
};

}  // namespace

void PutPolygons(const std::vector<Shape>& shapes, const std::vector<float>& codes, const GridGeometry& geometry,
                 float deleteValue, std::vector<float>& values, ProgressPart progress) {
  PolygonRaster raster(geometry, progress);
  SpanPainter painter(geometry, values);
  const ProgressPart finding = progress.Part(0, 0.7), painting = progress.Part(0.7, 1);
  for (std::size_t k = 0; k < shapes.size(); ++k) {
    finding.Report(static_cast<double>(k) / static_cast<double>(shapes.size()));
    if (codes[k] == deleteValue) continue;
    for (const PolygonRaster::Span& span : raster.Spans(shapes[k], 0, shapes[k].parts.size()))
      painter.Add(span, codes[k]);
  }
  painter.Paint(painting);
}

std::vector<float> DomainOfPolygons(const std::vector<Shape>& shapes, const GridGeometry& geometry,
                                    ProgressPart progress) {
  // What lies in any single ring is within an outer one.
  constexpr unsigned char kOuter = 1, kInside = 2;
  std::vector<unsigned char> marks(geometry.CellCount());
  PolygonRaster raster(geometry, progress);
  const auto mark = [&](const Shape& shape, std::size_t first, std::size_t last, unsigned char bits) {
    for (const PolygonRaster::Span& span : raster.Spans(shape, first, last)) {
      const auto row = marks.begin() + static_cast<std::ptrdiff_t>(span.j) * geometry.nx;
      for (auto it = row + span.begin; it != row + span.end; ++it) *it = static_cast<unsigned char>(*it | bits);
    }
  };
  const ProgressPart marking = progress.Part(0, 0.7), taking = progress.Part(0.7, 1);
  for (const Shape& shape : shapes) {
    marking.Report(static_cast<double>(&shape - shapes.data()) / static_cast<double>(shapes.size()));
    mark(shape, 0, shape.parts.size(), kInside | kOuter);
    for (std::size_t part = 0; shape.parts.size() > 1 && part < shape.parts.size(); ++part)
      mark(shape, part, part + 1, kOuter);
  }

  std::vector<float> values(geometry.CellCount(), kUsualDeleteValue);
  const std::ptrdiff_t nx = geometry.nx, ny = geometry.ny;
  for (std::ptrdiff_t j = 0; j < ny; ++j) {
    taking.ThrowIfCancelled();
    taking.Report(static_cast<double>(j) / static_cast<double>(ny));
    for (std::ptrdiff_t i = 0; i < nx; ++i) {
      const unsigned char* const cell = marks.data() + j * nx + i;
      if (!(*cell & kInside)) continue;
      const bool isAtEdge = i == 0 || j == 0 || i == nx - 1 || j == ny - 1;
      const bool isBoundary = isAtEdge || !cell[-1] || !cell[1] || !cell[-nx] || !cell[nx];
      values[static_cast<std::size_t>(j * nx + i)] = isBoundary ? 2.0f : 1.0f;
    }
  }
  return values;
}

namespace {

/// Above this a float does not hold every whole number.
constexpr std::int64_t kMostCode = 1 << 24;

/// Gives the shapes their codes and fills the table; gives why not.
std::string GiveCodes(const CYbShapeData& shapes, float deleteValue, ZoneTable& zones, std::vector<float>& codes,
                      std::size_t& left) {
  const bool isWhole = shapes.Columns().front().kind == AttributeKind::Whole;
  std::map<std::string, int> known;
  for (std::size_t k = 0; k < shapes.GetData().size(); ++k) {
    const Shape& shape = shapes.GetData()[k];
    codes.push_back(deleteValue);
    if (!shape.HasValue()) {
      left += !shape.points.empty();
      continue;
    }
    const std::string text = TextOf(shape.Value());
    const auto [zone, isNew] = known.try_emplace(text, static_cast<int>(known.size()) + 1);
    if (isWhole) {
      const std::int64_t code = std::get<std::int64_t>(shape.Value());
      if (std::abs(code) > kMostCode)
        return fmt::format("shape {}: the code {} is larger than {}", k + 1, code, kMostCode);
      zone->second = static_cast<int>(code);
    }
    codes.back() = static_cast<float>(zone->second);
    if (codes.back() == deleteValue)
      return fmt::format("shape {}: the code {} is the delete value", k + 1, zone->second);
    if (isNew) zones.zones.push_back({zone->second, text});
  }
  return {};
}

/// Reads a file of polygons, with the attribute unless that is null.
FileResult ReadPolygons(const std::string& path, const std::string* attribute, int axisUnit, CYbShapeData& shapes,
                        ProgressPart progress) {
  shapes.SetAxisLengthUnit(axisUnit);
  FileResult result =
      attribute ? shapes.ReadShapeAndDbfFile(path, *attribute, progress) : shapes.ReadShapeFile(path, progress);
  if (result.Ok() && shapes.Kind() != ShapeKind::Polygon) {
    const bool isLine = shapes.Kind() == ShapeKind::Line;
    return {fmt::format("{}: polygons were expected, the file holds {}", path, isLine ? "lines" : "points"), {}};
  }
  return result;
}

constexpr double kReadingShare = 0.3;

}  // namespace

FileResult CTvn2DOrthoRotatedGridData::CreateGridData_GIS_Polygon(GridGeometry geometry, float deleteValue,
                                                                  const PolygonFile& file, ZoneTable& zones,
                                                                  ProgressPart progress) {
  zones = {};
  const auto refused = [&file](std::string_view reason) {
    return FileResult{fmt::format("cannot use {}: {}", file.path, reason), {}};
  };
  if (const std::string problem = geometry.Problem(); !problem.empty()) return refused(problem);
  if (file.attribute.empty()) return refused("no attribute is selected");
  CYbShapeData shapes;
  FileResult result = ReadPolygons(file.path, &file.attribute, file.axisUnit, shapes, progress.Part(0, kReadingShare));
  if (!result.Ok()) return result;
  std::vector<float> codes;
  std::size_t left = 0;
  if (const std::string reason = GiveCodes(shapes, deleteValue, zones, codes, left); !reason.empty())
    return refused(reason);
  float fill = deleteValue;
  if (!file.gapFill.empty()) {
    const auto zone = std::find_if(zones.zones.begin(), zones.zones.end(),
                                   [&file](const ZoneTable::Zone& each) { return each.text == file.gapFill; });
    if (zone == zones.zones.end())
      return refused(fmt::format("no polygon has the value \"{}\" that is to fill the gaps", Shown(file.gapFill)));
    fill = static_cast<float>(zone->code);
  }
  try {
    std::vector<float> values(geometry.CellCount(), fill);
    PutPolygons(shapes.GetData(), codes, geometry, deleteValue, values, progress.Part(kReadingShare, 1));
    result.error = TakeValues(std::move(geometry), std::move(values), deleteValue, kWholeNumberUnit, quantity::kCode);
  } catch (const std::bad_alloc&) {
    return refused("there is no memory for the grid");
  } catch (const Cancelled&) {
    return refused(kCancelled);
  }
  if (left > 0)
    result.note += fmt::format("{}{} shapes without a value are left out", result.note.empty() ? "" : "; ", left);
  return result;
}

FileResult CTvn2DOrthoRotatedGridData::MakeCatchmentGriddataFromShapefile(const std::string& path, int axisUnit,
                                                                          GridGeometry geometry,
                                                                          ProgressPart progress) {
  const auto refused = [&path](std::string_view reason) {
    return FileResult{fmt::format("cannot use {}: {}", path, reason), {}};
  };
  if (const std::string problem = geometry.Problem(); !problem.empty()) return refused(problem);
  CTvnShapeData shapes;
  FileResult result = ReadPolygons(path, nullptr, axisUnit, shapes, progress.Part(0, kReadingShare));
  if (!result.Ok()) return result;
  Envelope extent;
  if (!shapes.GetTranscribingRect(extent)) return refused("it holds no polygon");
  try {
    std::vector<float> values = DomainOfPolygons(shapes.GetData(), geometry, progress.Part(kReadingShare, 1));
    if (std::all_of(values.begin(), values.end(), [](float value) { return value == kUsualDeleteValue; })) {
      const Envelope grid = EnvelopeOf(geometry);
      return refused(
          fmt::format("no cell of the grid (x {:.10g} to {:.10g}, y {:.10g} to {:.10g}) has its centre in a "
                      "polygon (x {:.10g} to {:.10g}, y {:.10g} to {:.10g}); check origin, cell size and unit",
                      grid.xMin, grid.xMax, grid.yMin, grid.yMax, extent.xMin, extent.xMax, extent.yMin, extent.yMax));
    }
    result.error =
        TakeValues(std::move(geometry), std::move(values), kUsualDeleteValue, kWholeNumberUnit, quantity::kCode);
  } catch (const std::bad_alloc&) {
    return refused("there is no memory for the grid");
  } catch (const Cancelled&) {
    return refused(kCancelled);
  }
  return result;
}

}  // namespace tervane
