// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "overlays/image_place.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cmath>

#include <fmt/format.h>

#include "core/kvf.h"
#include "data/raster_file.h"
#include "geometry/grid.h"
#include "platform/files.h"
#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

namespace {

constexpr std::array<std::string_view, 5> kParameterFiles{".bmpw", ".jpgw", ".gifw", ".pngw", ".tifw"};
/// The last four are what other programs call them.
constexpr std::array<std::string_view, 9> kWorldFiles{".bpw", ".jpw", ".giw", ".pnw", ".tiw",
                                                      ".jgw", ".gfw", ".pgw", ".tfw"};
constexpr std::array<std::string_view, 2> kOwnPlace{".tif", ".tiff"};

/// The six numbers of a world file; why not, where it has fewer or others.
std::string ReadWorldFile(const std::string& path, std::array<double, 6>& numbers) {
  constexpr std::size_t kLongestLine = 99;
  constexpr std::uint64_t kMostBytes = 64 << 10;
  if (StampOf(path).size > kMostBytes) return "it has more bytes than six lines";
  FileContent content;
  if (const FileResult read = ReadWholeFile(path, content); !read.Ok()) return read.error;
  std::string_view text = content.Text();
  for (std::size_t line = 0; line < numbers.size(); ++line) {
    if (text.empty()) return fmt::format("it ends in line {}, six lines were expected", line + 1);
    // A line that is too long goes on as the next one.
    const std::size_t end = std::min(text.find('\n'), kLongestLine);
    const std::string_view number = Trimmed(text.substr(0, end));
    text.remove_prefix(std::min(text.size(), end < text.size() && text[end] == '\n' ? end + 1 : end));
    const char* first = number.data() + (number.starts_with('+') ? 1 : 0);
    const auto [last, error] = std::from_chars(first, number.data() + number.size(), numbers[line]);
    const bool isIgnored = line == 1 || line == 2;
    if ((error != std::errc() || last != number.data() + number.size() || !std::isfinite(numbers[line])) && !isIgnored)
      return fmt::format("line {}: a number was expected", line + 1);
  }
  return {};
}

std::optional<DataArea> PlaceByWorldFile(const std::string& path, const std::string& image, Host& host) {
  const auto refuse = [&host](const std::string& file, const std::string& why) {
    host.ShowMessage(fmt::format("Could not load geo reference file\n\n{}: {}", file, why), Host::Icon::Error);
    return std::nullopt;
  };
  std::array<double, 6> numbers{};
  if (const std::string why = ReadWorldFile(path, numbers); !why.empty()) return refuse(path, why);
  RasterFile raster;
  if (image.empty()) return refuse(path, "the image must be chosen first, since its size is needed");
  if (const std::string why = raster.Open(image); !why.empty()) return refuse(image, why);
  const double a = numbers[0], e = numbers[3], c = numbers[4], f = numbers[5];
  const FileGeometry& size = raster.Facts().geometry;
  return DataArea{c - a * 0.5, (size.ny + 0.5) * e + f, (size.nx + 0.5) * a + c, f - e * 0.5};
}

std::optional<DataArea> OwnPlace(const std::string& path, Host& host) {
  RasterFile raster;
  if (const std::string why = raster.Open(path); !why.empty()) {
    host.ShowMessage(fmt::format("Could not load geo reference file\n\n{}", why), Host::Icon::Error);
    return std::nullopt;
  }
  const FileGeometry& geometry = raster.Facts().geometry;
  if (!geometry.IsPlaced()) {
    host.ShowMessage(path + " tells no place", Host::Icon::Error);
    return std::nullopt;
  }
  const Envelope box = EnvelopeOf(geometry);
  return DataArea{box.xMin, box.yMin, box.xMax, box.yMax};
}

}  // namespace

std::optional<DataArea> ReadImagePlace(const std::string& path, Host& host) {
  if (!FileExists(path)) {
    host.ShowMessage("Can not open file", Host::Icon::Error);
    return std::nullopt;
  }
  kvfGetErrorGlb();  // what an earlier reader left
  KvfFile* file = kvfLoadFile(path, 0);
  if (kvfGetErrorGlb() != kKvfNoError) {
    host.ShowMessage(kvfErrorText() + "\n\nSyntax error in file name:\n" + path, Host::Icon::Error);
    kvfClose(&file);
    return std::nullopt;
  }
  DataArea area;
  KvfNode* target = kvfTargetByNameNum(file, "QUARZEL_Graphical_Images", 1);
  KvfNode* place = kvfSectionByNameNum(target, "World_Coordinates", 1);
  const bool isRead = kvfGetParam(place, "x0", &area.x0, 1, 1) && kvfGetParam(place, "y0", &area.y0, 1, 1) &&
                      kvfGetParam(place, "x1", &area.x1, 1, 1) && kvfGetParam(place, "y1", &area.y1, 1, 1);
  kvfClose(&file);
  if (isRead) return area;
  host.ShowMessage(path + " tells no place: x0, y0, x1 and y1 were expected in World_Coordinates", Host::Icon::Error);
  return std::nullopt;
}

std::optional<DataArea> ReadGeoReference(const std::string& path, const std::string& image, Host& host) {
  const std::string extension = LowerCase(ExtensionOf(path));
  const auto isOneOf = [&extension](const auto& kinds) { return std::ranges::find(kinds, extension) != kinds.end(); };
  if (isOneOf(kParameterFiles)) return ReadImagePlace(path, host);
  if (isOneOf(kWorldFiles)) return PlaceByWorldFile(path, image, host);
  if (isOneOf(kOwnPlace)) return OwnPlace(path, host);
  return std::nullopt;
}

}  // namespace tervane
