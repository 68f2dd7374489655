// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/raster/raster_module.h"

#include <algorithm>
#include <cmath>
#include <cstring>
#include <limits>
#include <type_traits>
#include <utility>

#include <cpl_conv.h>
#include <cpl_error.h>
#include <cpl_string.h>
#include <cpl_vsi.h>
#include <fmt/format.h>
#include <gdal.h>
#include <ogr_spatialref.h>

#include "platform/module_export.h"

namespace tervane::raster {

namespace {

constexpr const char* kItemType = "item_type";
constexpr const char* kUnitKey = "unit_key";

/// While it lives, GDAL's errors of this thread come here instead of to the terminal.
class Errors {
 public:
  Errors() { CPLPushErrorHandlerEx(&Errors::Take, this); }
  ~Errors() { CPLPopErrorHandler(); }
  Errors(const Errors&) = delete;
  Errors& operator=(const Errors&) = delete;

  /// True when something failed, whatever the call returned.
  bool HasFailed() const { return failed_; }
  bool IsOutOfMemory() const { return isOutOfMemory_; }
  /// The first failure, which is the cause of those behind it.
  const std::string& First() const { return first_; }

 private:
  static void CPL_STDCALL Take(CPLErr kind, CPLErrorNum number, const char* text) {
    auto* const self = static_cast<Errors*>(CPLGetErrorHandlerUserData());
    if (kind < CE_Failure || self->failed_) return;
    self->failed_ = true;
    self->isOutOfMemory_ = number == CPLE_OutOfMemory;
    self->first_ = text;
    std::replace(self->first_.begin(), self->first_.end(), '\n', ' ');
  }

  bool failed_ = false, isOutOfMemory_ = false;
  std::string first_;
};

struct DatasetCloser {
  void operator()(GDALDatasetH dataset) const { GDALClose(dataset); }
};
using Dataset = std::unique_ptr<void, DatasetCloser>;

struct SystemCloser {
  void operator()(OGRSpatialReferenceH system) const { OSRDestroySpatialReference(system); }
};
using System = std::unique_ptr<std::remove_pointer_t<OGRSpatialReferenceH>, SystemCloser>;

std::string Text(const char* text) { return text != nullptr ? text : ""; }

std::string PlaneOf(GDALDatasetH dataset) {
  const OGRSpatialReferenceH stored = GDALGetSpatialRef(dataset);
  if (stored == nullptr) return {};
  const System plane(OSRClone(stored));
  OSRStripVertical(plane.get());
  char* text = nullptr;
  OSRExportToWkt(plane.get(), &text);
  std::string wkt = Text(text);
  CPLFree(text);
  return wkt;
}

/// The names of the rasters within a file, "NETCDF:"a.nc":rain" without what is the same in all.
std::vector<std::string> PartsOf(GDALDatasetH dataset) {
  std::vector<std::string> parts;
  char** const list = GDALGetMetadata(dataset, "SUBDATASETS");
  for (int i = 1;; ++i) {
    const char* name = CSLFetchNameValue(list, fmt::format("SUBDATASET_{}_NAME", i).c_str());
    if (name == nullptr) return parts;
    const char* const last = std::strrchr(name, ':');
    parts.emplace_back(last != nullptr ? last + 1 : name);
  }
}

/// GDAL reads what was cut off a file of this format as zeros; its values stand there as they are, without a header.
std::string WhyRawFileIsCut(GDALDatasetH dataset, const std::string& path) {
  if (Text(GDALGetDriverShortName(GDALGetDatasetDriver(dataset))) != "ENVI") return {};
  if (Text(GDALGetMetadataItem(dataset, "file_compression", "ENVI")) == "1") return {};
  VSIStatBufL status;
  if (VSIStatL(path.c_str(), &status) != 0) return {};
  double needed = 0;
  for (int i = 1; i <= GDALGetRasterCount(dataset); ++i)
    needed += GDALGetDataTypeSizeBytes(GDALGetRasterDataType(GDALGetRasterBand(dataset, i)));
  needed *= static_cast<double>(GDALGetRasterXSize(dataset)) * GDALGetRasterYSize(dataset);
  if (static_cast<double>(status.st_size) >= needed) return {};
  return fmt::format("it is cut: it has {} bytes, its header tells of {:.0f}; get the file again",
                     static_cast<long long>(status.st_size), needed);
}

StoredBand BandOf(GDALRasterBandH band) {
  StoredBand facts;
  facts.description = Text(GDALGetDescription(band));
  facts.unit = Text(GDALGetRasterUnitType(band));
  facts.itemType = Text(GDALGetMetadataItem(band, kItemType, nullptr));
  facts.unitKey = Text(GDALGetMetadataItem(band, kUnitKey, nullptr));
  const GDALDataType type = GDALGetRasterDataType(band);
  facts.isComplex = GDALDataTypeIsComplex(type) != 0;
  facts.isWhole = GDALDataTypeIsInteger(type) != 0;
  return facts;
}

class GdalRaster : public OpenRaster {
 public:
  explicit GdalRaster(Dataset dataset) : dataset_(std::move(dataset)) {}

  std::string Read(int number, const StoredWindow& window, float missing, std::span<float> values) override;

 private:
  Dataset dataset_;
};

std::string GdalRaster::Read(int number, const StoredWindow& window, float missing, std::span<float> values) {
  const Errors errors;
  const GDALRasterBandH band = GDALGetRasterBand(dataset_.get(), number);
  if (band == nullptr) return fmt::format("there is no band {}", number);
  const double scale = GDALGetRasterScale(band, nullptr), offset = GDALGetRasterOffset(band, nullptr);
  const GDALRasterBandH mask =
      (GDALGetMaskFlags(band) & GMF_ALL_VALID) == 0 ? GDALGetMaskBand(band) : GDALRasterBandH{};
  // Some rows at a time keep the buffers small, whatever the window.
  constexpr int kPiece = 1 << 18;
  const int rows = std::clamp(kPiece / window.nx, 1, window.ny);
  const auto width = static_cast<std::size_t>(window.nx);
  std::vector<double> numbers(width * static_cast<std::size_t>(rows));
  std::vector<unsigned char> isThere(mask != nullptr ? numbers.size() : 0);
  for (int row = 0; row < window.ny; row += rows) {
    const int count = std::min(rows, window.ny - row);
    const auto read = [&](GDALRasterBandH from, void* to, GDALDataType type) {
      return GDALRasterIO(from, GF_Read, window.x, window.y + row, window.nx, count, to, window.nx, count, type, 0, 0);
    };
    const bool isRead = read(band, numbers.data(), GDT_Float64) == CE_None &&
                        (mask == nullptr || read(mask, isThere.data(), GDT_Byte) == CE_None);
    if (errors.IsOutOfMemory()) return "it needs more than the free memory";
    if (!isRead || errors.HasFailed()) {
      return fmt::format("it is cut or damaged ({}); get the file again", errors.First());
    }
    float* target = values.data() + width * static_cast<std::size_t>(row);
    for (std::size_t i = 0; i < width * static_cast<std::size_t>(count); ++i) {
      const double value = numbers[i] * scale + offset;
      const bool isValue = std::isfinite(value) && (mask == nullptr || isThere[i] != 0);
      if (isValue && std::abs(value) > static_cast<double>(std::numeric_limits<float>::max())) {
        return "a value is too large for single precision";
      }
      *target++ = isValue ? static_cast<float>(value) : missing;
    }
  }
  return {};
}

/// While it lives, nothing is written beside a raster that the raster cannot hold itself.
class NoSideFiles {
 public:
  NoSideFiles() { CPLSetThreadLocalConfigOption(kOption, "NO"); }
  ~NoSideFiles() { CPLSetThreadLocalConfigOption(kOption, nullptr); }
  NoSideFiles(const NoSideFiles&) = delete;
  NoSideFiles& operator=(const NoSideFiles&) = delete;

 private:
  static constexpr const char* kOption = "GDAL_PAM_ENABLED";
};

class GdalModule : public Module {
 public:
  GdalModule() {
    const Errors quiet;
    // What a library would only mumble about, and fill with something, is an error here.
    CPLSetConfigOption("GDAL_ERROR_ON_LIBJPEG_WARNING", "TRUE");
    CPLSetConfigOption("RAW_CHECK_FILE_SIZE", "YES");
    GDALAllRegister();
  }

  std::unique_ptr<OpenRaster> Open(const std::string& path, StoredRaster& facts, std::string& reason) override;
  std::string WriteGeoTiff(const std::string& path, const StoredRaster& raster, float missing,
                           std::span<const float> values) override;
};

std::unique_ptr<OpenRaster> GdalModule::Open(const std::string& path, StoredRaster& facts, std::string& reason) {
  const Errors errors;
  Dataset dataset(GDALOpenEx(path.c_str(), GDAL_OF_RASTER | GDAL_OF_READONLY, nullptr, nullptr, nullptr));
  if (!dataset) {
    if (errors.HasFailed())
      reason = fmt::format("it is damaged or of a kind that is not known here ({})", errors.First());
    return nullptr;
  }
  reason = WhyRawFileIsCut(dataset.get(), path);
  if (!reason.empty()) return nullptr;
  facts.format = Text(GDALGetDriverLongName(GDALGetDatasetDriver(dataset.get())));
  facts.nx = GDALGetRasterXSize(dataset.get());
  facts.ny = GDALGetRasterYSize(dataset.get());
  facts.transform.assign(6, 0.0);
  if (GDALGetGeoTransform(dataset.get(), facts.transform.data()) != CE_None) facts.transform.clear();
  facts.projection = PlaneOf(dataset.get());
  for (int i = 1; i <= GDALGetRasterCount(dataset.get()); ++i)
    facts.bands.push_back(BandOf(GDALGetRasterBand(dataset.get(), i)));
  if (facts.bands.empty()) facts.parts = PartsOf(dataset.get());
  return std::make_unique<GdalRaster>(std::move(dataset));
}

std::string GdalModule::WriteGeoTiff(const std::string& path, const StoredRaster& raster, float missing,
                                     std::span<const float> values) {
  const Errors errors;
  const NoSideFiles noSideFiles;
  const auto failed = [&] { return errors.HasFailed() ? errors.First() : std::string("the GeoTIFF driver failed"); };
  const GDALDriverH driver = GDALGetDriverByName("GTiff");
  if (driver == nullptr) return "this build of GDAL has no GeoTIFF driver";
  // The predictor is the one for numbers with a fraction.
  const char* const options[] = {"COMPRESS=DEFLATE", "PREDICTOR=3", "BIGTIFF=IF_SAFER", nullptr};
  Dataset dataset(GDALCreate(driver, path.c_str(), raster.nx, raster.ny, 1, GDT_Float32, options));
  if (!dataset) return failed();
  std::vector<double> transform = raster.transform;
  if (!transform.empty()) GDALSetGeoTransform(dataset.get(), transform.data());
  if (!raster.projection.empty()) {
    OGRSpatialReference system;
    // A text is a text here, never the name of a file or an address.
    const char* const textAlone[] = {"ALLOW_NETWORK_ACCESS=NO", "ALLOW_FILE_ACCESS=NO", nullptr};
    if (system.SetFromUserInput(raster.projection.c_str(), textAlone) != OGRERR_NONE) {
      return fmt::format("GDAL does not know the projection ({})", failed());
    }
    GDALSetSpatialRef(dataset.get(), OGRSpatialReference::ToHandle(&system));
  }
  const GDALRasterBandH band = GDALGetRasterBand(dataset.get(), 1);
  const StoredBand& facts = raster.bands.front();
  GDALSetDescription(band, facts.description.c_str());
  GDALSetRasterUnitType(band, facts.unit.c_str());
  if (!facts.itemType.empty()) GDALSetMetadataItem(band, kItemType, facts.itemType.c_str(), nullptr);
  if (!facts.unitKey.empty()) GDALSetMetadataItem(band, kUnitKey, facts.unitKey.c_str(), nullptr);
  GDALSetRasterNoDataValue(band, static_cast<double>(missing));
  const CPLErr written = GDALRasterIO(band, GF_Write, 0, 0, raster.nx, raster.ny, const_cast<float*>(values.data()),
                                      raster.nx, raster.ny, GDT_Float32, 0, 0);
  // Much is written only now; closing returns nothing, so that the handler tells.
  dataset.reset();
  return written != CE_None || errors.HasFailed() ? failed() : std::string();
}

}  // namespace

}  // namespace tervane::raster

extern "C" TERVANE_EXPORT tervane::raster::Module* TervaneRasterModule(int interface);

tervane::raster::Module* TervaneRasterModule(int interface) {
  if (interface != tervane::raster::kInterface) return nullptr;
  static tervane::raster::GdalModule module;
  return &module;
}
