// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "execution/processed_river.h"

#include <bit>
#include <cmath>
#include <cstdint>
#include <cstring>

#include <fmt/format.h>

#include "platform/item_types.h"
#include "platform/units.h"

namespace tervane {

namespace {

/// Numbers of a file without padding, the lowest byte first.
class BinaryReader {
 public:
  explicit BinaryReader(std::string_view bytes) : bytes_(bytes) {}

  std::size_t Left() const { return bytes_.size() - place_; }
  std::size_t Place() const { return place_; }
  /// The next number; 0 behind the end.
  template <class Number>
  Number Next() {
    Number number{};
    if (Left() < sizeof number) {
      place_ = bytes_.size();
      return number;
    }
    unsigned char raw[sizeof number];
    for (std::size_t i = 0; i < sizeof raw; ++i) {
      const std::size_t to = std::endian::native == std::endian::little ? i : sizeof raw - 1 - i;
      raw[to] = static_cast<unsigned char>(bytes_[place_ + i]);
    }
    std::memcpy(&number, raw, sizeof number);
    place_ += sizeof number;
    return number;
  }
  std::string_view Bytes(std::size_t count) {
    const std::string_view taken = bytes_.substr(place_, count);
    place_ += taken.size();
    return taken;
  }

 private:
  std::string_view bytes_;
  std::size_t place_ = 0;
};

constexpr std::size_t kCountsSize = 5 * sizeof(std::int32_t);
constexpr std::size_t kPlaceSize = 4 * sizeof(double) + sizeof(float);
constexpr std::size_t kPointSize = sizeof(std::int32_t) + 2 * sizeof(double);

struct Header {
  std::int32_t nx = 0, ny = 0, points = 0, projectionLength = 0;
  GridGeometry geometry;
  float deleteValue = 0;
};

/// Why the counts cannot be those of a file of that size, or empty.
std::string ProblemOf(const Header& header, std::size_t fileSize) {
  const struct {
    const char* name;
    std::int32_t count;
  } counts[] = {{"NX", header.nx},
                {"NY", header.ny},
                {"the number of points", header.points},
                {"the length of the projection", header.projectionLength}};
  for (const auto& each : counts)
    if (each.count < 0) return fmt::format("{} is {}, a number below 0", each.name, each.count);
  // Each is below 2^31, so that only the product of the three could leave 64 bits.
  const std::uint64_t cells = static_cast<std::uint64_t>(header.nx) * static_cast<std::uint64_t>(header.ny);
  if (cells > kMostCells)
    return fmt::format("{} by {} cells are more than the {} million that a grid may have", header.nx, header.ny,
                       kMostCells / 1'000'000);
  const std::uint64_t expected = kCountsSize + static_cast<std::uint64_t>(header.projectionLength) + kPlaceSize +
                                 2 * sizeof(std::int32_t) * cells +
                                 kPointSize * static_cast<std::uint64_t>(header.points);
  if (expected == fileSize) return {};
  return fmt::format(
      "it has {} bytes, but NX {}, NY {}, {} points and a projection of {} bytes make {}: it is {}, or its counts are "
      "wrong",
      fileSize, header.nx, header.ny, header.points, header.projectionLength, expected,
      fileSize < expected ? "cut off" : "longer than that");
}

std::string ReadLinks(BinaryReader& reader, const Header& header,
                      std::shared_ptr<const CTvn2DOrthoRotatedGridData>& links) {
  std::vector<float> values(header.geometry.CellCount());
  for (float& value : values) value = static_cast<float>(reader.Next<std::int32_t>());
  auto grid = std::make_shared<CTvn2DOrthoRotatedGridData>();
  std::string problem =
      grid->TakeValues(header.geometry, std::move(values), header.deleteValue, kWholeNumberUnit, quantity::kCode);
  if (problem.empty()) links = std::move(grid);
  return problem;
}

std::string ReadBody(BinaryReader& reader, Header& header, ProcessedRiver& river) {
  std::string_view projection = reader.Bytes(static_cast<std::size_t>(header.projectionLength));
  projection = projection.substr(0, projection.find('\0'));
  header.geometry.projection = projection;
  header.geometry.nx = header.nx;
  header.geometry.ny = header.ny;
  header.geometry.cellSize = reader.Next<double>();
  header.geometry.x0 = reader.Next<double>();
  header.geometry.y0 = reader.Next<double>();
  header.geometry.rotation = reader.Next<double>();
  header.deleteValue = reader.Next<float>();
  if (header.nx > 0 && header.ny > 0) {
    for (auto* links : {&river.firstLinks, &river.secondLinks})
      if (std::string problem = ReadLinks(reader, header, *links); !problem.empty()) return problem;
  }
  for (int i = 1; i <= header.points; ++i) {
    river.flags.push_back(reader.Next<std::int32_t>());
    river.x.push_back(reader.Next<double>());
    river.y.push_back(reader.Next<double>());
    if (!std::isfinite(river.x.back()) || !std::isfinite(river.y.back()))
      return fmt::format("point {} (at byte {}) lies at ({}, {})", i, reader.Place() - kPointSize, river.x.back(),
                         river.y.back());
  }
  return {};
}

}  // namespace

RiverFileResult ReadProcessedRiver(const std::string& path, ProcessedRiver& river) {
  constexpr const char* kNotLoaded = "Could not load binary preprocessed River file: \n";
  FileContent content;
  if (const FileResult result = ReadWholeFile(path, content); !result.Ok())
    return {fmt::format("{}{}\n\n{}", kNotLoaded, path, result.error)};
  BinaryReader reader(content.Text());
  const auto notLoaded = [&](const std::string& reason) {
    return RiverFileResult{fmt::format("{}{}\n\n{}", kNotLoaded, path, reason)};
  };
  if (content.size < kCountsSize)
    return notLoaded(fmt::format("it has {} bytes, less than the {} of its counts", content.size, kCountsSize));
  if (const auto version = reader.Next<std::int32_t>(); version < 1)
    return {
        fmt::format("Error: Wrong version number found in binary preprocessed River file: \n{}\n\nIt is {}, and 1 "
                    "is the least.",
                    path, version)};
  Header header;
  header.nx = reader.Next<std::int32_t>();
  header.ny = reader.Next<std::int32_t>();
  header.points = reader.Next<std::int32_t>();
  header.projectionLength = reader.Next<std::int32_t>();
  if (const std::string problem = ProblemOf(header, content.size); !problem.empty()) return notLoaded(problem);
  ProcessedRiver read;
  if (const std::string problem = ReadBody(reader, header, read); !problem.empty()) return notLoaded(problem);
  river = std::move(read);
  return {};
}

// ---- What maps draw

namespace {

std::shared_ptr<CTvnShapeData> NewLines() {
  auto lines = std::make_shared<CTvnShapeData>();
  lines->Create(ShapeKind::Line, {{"KIND", AttributeKind::Text}}, {});
  return lines;
}

void AddLine(CTvnShapeData& lines, std::vector<MapPoint> points, const char* kind) {
  Shape line;
  line.points = std::move(points);
  line.parts = {0};
  line.values = {std::string(kind)};
  lines.AddShape(std::move(line));
}

/// Calls `found` for each run of cells that are not zero: from and behind, along a row or column of `count` cells.
template <class IsLink, class Found>
void ForEachRun(int count, const IsLink& isLink, const Found& found) {
  for (int from = 0; from < count; ++from) {
    if (!isLink(from)) continue;
    int behind = from + 1;
    while (behind < count && isLink(behind)) ++behind;
    found(from, behind);
    from = behind;
  }
}

}  // namespace

CProcDataRiverLinkOverlay::CProcDataRiverLinkOverlay(const CTvn2DOrthoRotatedGridData& firstLinks,
                                                     const CTvn2DOrthoRotatedGridData& secondLinks) {
  const GridGeometry& geometry = firstLinks.Geometry();
  const GridTransform transform(geometry);
  auto lines = NewLines();
  const auto add = [&](double fromI, double fromJ, double toI, double toJ) {
    AddLine(*lines, {transform.ToWorld({fromI, fromJ}), transform.ToWorld({toI, toJ})}, "river link");
  };
  // Links in a row are one line: it looks the same, and large networks are drawn with fewer.
  for (int i = 0; i < geometry.nx; ++i)
    ForEachRun(
        geometry.ny, [&](int j) { return firstLinks.Value(i, j) != 0; },
        [&](int from, int behind) { add(i + 1, from, i + 1, behind); });
  for (int j = 0; j < geometry.ny; ++j)
    ForEachRun(
        geometry.nx, [&](int i) { return secondLinks.Value(i, j) != 0; },
        [&](int from, int behind) { add(from, j + 1, behind, j + 1); });
  lines_ = std::move(lines);
}

CProcDataRiverPointOverlay::CProcDataRiverPointOverlay(const std::vector<int>& flags, const std::vector<double>& x,
                                                       const std::vector<double>& y) {
  constexpr int kBeginsBranch = 3;
  auto lines = NewLines();
  std::vector<MapPoint> branch;
  const auto finish = [&] {
    if (branch.size() > 1) AddLine(*lines, branch, "river");
    branch.clear();
  };
  for (std::size_t i = 0; i < flags.size(); ++i) {
    if (flags[i] == kBeginsBranch) finish();
    branch.push_back({x[i], y[i]});
  }
  finish();
  lines_ = std::move(lines);
}

}  // namespace tervane
