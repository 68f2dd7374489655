// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/raster_file.h"

#include <algorithm>
#include <charconv>
#include <new>
#include <utility>

#include <fmt/format.h>

#include "data/datafile.h"
#include "data/netcdf.h"
#include "data/raster/raster_module.h"
#include "geometry/cart.h"
#include "platform/item_types.h"
#include "platform/paths.h"
#include "platform/program_module.h"
#include "platform/text.h"

namespace tervane {

namespace {

struct LoadedModule {
  raster::Module* module = nullptr;
  std::string problem;
};

LoadedModule LoadRasterModule() {
  ProgramModule loaded = LoadProgramModule(raster::kModuleName, raster::kEntryName, "reads rasters");
  if (!loaded.entry) return {nullptr, std::move(loaded.problem)};
  raster::Module* const module = reinterpret_cast<raster::Entry>(loaded.entry)(raster::kInterface);
  return {module, module ? std::string() : OtherVersionOf(raster::kModuleName)};
}

/// The lock of netCDF must be held, here and wherever the module is called: GDAL's driver for netCDF shares the
/// library.
const LoadedModule& TheModule() {
  static const LoadedModule loaded = LoadRasterModule();
  return loaded;
}

int NumberOr(std::string_view text, int otherwise) {
  int number = 0;
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
  return error == std::errc() && end == text.data() + text.size() ? number : otherwise;
}

std::string Joined(const std::vector<std::string>& names) {
  constexpr std::size_t kMostShown = 10;
  std::string text;
  for (std::size_t i = 0; i < std::min(names.size(), kMostShown); ++i) text += (i > 0 ? ", " : "") + names[i];
  return text + (names.size() > kMostShown ? ", ..." : "");
}

RasterBand BandOf(const raster::StoredBand& stored, int number, std::size_t count, std::string_view path) {
  RasterBand band;
  band.number = number;
  band.name = Trimmed(stored.description);
  if (band.name.empty() || FirstInvalidUtf8(band.name)) {
    band.name = count == 1 ? std::string(BaseNameOf(path)) : fmt::format("{} {}", BaseNameOf(path), number);
  }
  band.unitText = Trimmed(stored.unit);
  band.isWhole = stored.isWhole;
  band.itemType = NumberOr(stored.itemType, quantity::kUndefined);
  if (FindItemType(band.itemType) == nullptr) band.itemType = quantity::kUndefined;
  band.unitKey = NumberOr(stored.unitKey, 0);
  if (FindUnit(band.unitKey) == nullptr) band.unitKey = 0;
  return band;
}

/// Sets the place by what is stored; tells in notes where it stays unknown.
void Place(const raster::StoredRaster& stored, RasterFacts& facts, bool& isNorthFirst) {
  facts.geometry.nx = stored.nx;
  facts.geometry.ny = stored.ny;
  isNorthFirst = true;
  if (stored.transform.empty()) {
    facts.notes.emplace_back("it does not tell where it lies");
    return;
  }
  if (!PlaceByGeoTransform(stored.transform, facts.geometry, isNorthFirst)) {
    facts.notes.emplace_back("its cells are no rectangles, so that its place is unknown");
    return;
  }
  if (!IsLocalPlane(stored.projection)) facts.geometry.projection = stored.projection;
  facts.geometry.isGeographical = CYbMapProjection(facts.geometry.projection).IsGeographical();
}

}  // namespace

struct RasterFile::State {
  std::string path;
  RasterFacts facts;
  bool isNorthFirst = true;
  std::unique_ptr<raster::OpenRaster> raster;

  ~State() {
    const netcdf::Lock lock;
    raster.reset();
  }
};

RasterFile::RasterFile() : state_(std::make_unique<State>()) {}
RasterFile::RasterFile(RasterFile&& other) noexcept = default;
RasterFile& RasterFile::operator=(RasterFile&& other) noexcept = default;
RasterFile::~RasterFile() = default;

const RasterFacts& RasterFile::Facts() const { return state_->facts; }

std::string RasterFile::Open(const std::string& path) {
  if (std::string reason = WhyNotReadable(path); !reason.empty()) return reason;
  const auto refused = [&](const std::string& reason) { return fmt::format("cannot read {}: {}", path, reason); };
  bool isClassicNetcdf = false;
  // GDAL reads what was cut off such a file as zeros.
  const std::string cut = netcdf::WhyClassicFileIsBad(path, isClassicNetcdf);
  if (isClassicNetcdf && !cut.empty()) return refused(cut);
  auto state = std::make_unique<State>();
  state->path = path;
  raster::StoredRaster stored;
  std::string reason;
  {
    const netcdf::Lock lock;
    const LoadedModule& loaded = TheModule();
    if (loaded.module == nullptr) return refused(loaded.problem);
    // An absolute path, because others may be names that GDAL gives a meaning of its own.
    state->raster = loaded.module->Open(AbsoluteFromHere(path), stored, reason);
  }
  if (!state->raster) {
    // The file was named already.
    reason = Trimmed(Replaced(reason, AbsoluteFromHere(path) + ":", ""));
    if (reason.empty() && isClassicNetcdf) reason = "it holds no grid that can be read as a raster";
    return refused(reason.empty() ? "it is neither a data file nor a raster of a kind that is known here" : reason);
  }
  if (stored.bands.empty()) {
    return refused(
        stored.parts.empty()
            ? "it has no bands"
            : fmt::format("it holds several rasters ({}); write the one that is wanted into a file of its own",
                          Joined(stored.parts)));
  }
  RasterFacts& facts = state->facts;
  facts.format = stored.format;
  Place(stored, facts, state->isNorthFirst);
  int number = 0;
  for (const raster::StoredBand& band : stored.bands) {
    ++number;
    if (band.isComplex) {
      facts.notes.push_back(fmt::format("band {} is left out: it has complex numbers", number));
    } else {
      facts.bands.push_back(BandOf(band, number, stored.bands.size(), path));
    }
  }
  if (facts.bands.empty()) return refused("it has complex numbers alone");
  state_ = std::move(state);
  return {};
}

std::string RasterFile::Read(int band, const CellWindow& window, std::span<float> values) const {
  const auto refused = [&](const std::string& reason) {
    return fmt::format("cannot read {}: {}", state_->path, reason);
  };
  const RasterFacts& facts = state_->facts;
  if (std::ranges::none_of(facts.bands, [&](const RasterBand& other) { return other.number == band; })) {
    return refused(fmt::format("there is no band {}: the raster has {}", band, facts.bands.size()));
  }
  const bool isInside = window.i >= 0 && window.j >= 0 && window.nx > 0 && window.ny > 0 &&
                        window.nx <= facts.geometry.nx - window.i && window.ny <= facts.geometry.ny - window.j;
  if (!isInside || values.size() != window.CellCount()) return refused("the part that was asked for is not in it");
  const bool isTurned = state_->isNorthFirst;
  const raster::StoredWindow stored{window.i, isTurned ? facts.geometry.ny - window.j - window.ny : window.j, window.nx,
                                    window.ny};
  try {
    const netcdf::Lock lock;
    const std::string reason = state_->raster->Read(band, stored, kDeleteValue, values);
    if (!reason.empty()) return refused(reason);
  } catch (const std::bad_alloc&) {
    return refused("it needs more than the free memory");
  }
  if (!isTurned) return {};
  const auto width = static_cast<std::ptrdiff_t>(window.nx);
  auto low = values.begin(), high = values.end() - width;
  for (; low < high; low += width, high -= width) std::swap_ranges(low, low + width, high);
  return {};
}

FileResult WriteGeoTiff(const std::string& path, const NewRaster& raster, std::span<const float> values) {
  const auto failed = [&](const std::string& reason) {
    return FileResult{fmt::format("cannot write {}: {}", path, reason), {}};
  };
  const FileGeometry& geometry = raster.geometry;
  const auto nx = static_cast<std::size_t>(geometry.nx), ny = static_cast<std::size_t>(geometry.ny);
  if (geometry.nx < 1 || geometry.ny < 1 || nx * ny != values.size()) return failed("it has no cells");
  raster::StoredRaster stored;
  stored.nx = geometry.nx;
  stored.ny = geometry.ny;
  if (geometry.IsPlaced()) stored.transform = GeoTransformOf(geometry, true);
  if (!CYbMapProjection(geometry.projection).IsLocal()) stored.projection = geometry.projection;
  raster::StoredBand& band = stored.bands.emplace_back();
  band.description = raster.name;
  const Unit* unit = FindUnit(raster.unitKey);
  band.unit = unit != nullptr ? std::string(unit->udunits.empty() ? unit->text : unit->udunits) : raster.unitText;
  if (raster.itemType != quantity::kUndefined) band.itemType = std::to_string(raster.itemType);
  if (raster.unitKey != 0) band.unitKey = std::to_string(raster.unitKey);
  try {
    std::vector<float> turned(values.size());
    for (std::size_t row = 0; row < ny; ++row)
      std::ranges::copy(values.subspan(row * nx, nx), turned.end() - static_cast<std::ptrdiff_t>((row + 1) * nx));
    FileReplacement replacement;
    if (FileResult begun = replacement.Begin(path); !begun.Ok()) return begun;
    {
      const netcdf::Lock lock;
      const LoadedModule& loaded = TheModule();
      if (loaded.module == nullptr) return failed(loaded.problem);
      const std::string reason = loaded.module->WriteGeoTiff(replacement.TemporaryPath(), stored, kDeleteValue, turned);
      if (!reason.empty()) return failed(reason + "; the file is unchanged");
    }
    return replacement.Commit();
  } catch (const std::bad_alloc&) {
    return failed("it needs more than the free memory");
  }
}

}  // namespace tervane
