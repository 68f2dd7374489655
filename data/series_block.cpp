// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/series_block.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <new>

#include <fmt/format.h>

#include "data/datafile_header.h"
#include "data/netcdf.h"
#include "platform/paths.h"

namespace tervane {

namespace {

/// The library reads so much at one time and keeps it, so that the values of all series in it are there.
constexpr std::size_t kKept = std::size_t{1} << 20;

/// An open file with the buffer of its own that a walk through all series needs.
class SeriesBlocks {
 public:
  explicit SeriesBlocks(const std::string& path) {
    const netcdf::Lock lock;
    problem_ = netcdf::WhyNoLibrary();
    if (!problem_.empty()) return;
    int id = -1;
    std::size_t buffer = kKept;
    if (const int status = netcdf::Library().nc__open(AbsoluteFromHere(path).c_str(), NC_NOWRITE, &buffer, &id)) {
      problem_ = netcdf::InWords(status);
      return;
    }
    file_ = netcdf::Handle(id);
    problem_ = ReadHeader(id, header_);
  }
  ~SeriesBlocks() { netcdf::CloseLocked(file_); }
  SeriesBlocks(const SeriesBlocks&) = delete;
  SeriesBlocks& operator=(const SeriesBlocks&) = delete;

  const std::string& Problem() const { return problem_; }
  std::size_t Steps() const { return header_.time.steps; }
  bool IsSeries(int item) const {
    if (item < 1 || static_cast<std::size_t>(item) > header_.items.size()) return false;
    const ItemStorage& storage = StorageOf(item);
    return header_.items[static_cast<std::size_t>(item - 1)].dimensions == 0 && storage.time >= 0;
  }
  /// Packed pieces are unpacked as a whole: a series of them is read at once.
  std::size_t StepsAtOnce() const {
    const bool isPacked =
        std::ranges::any_of(header_.storages, [](const auto& storage) { return !storage.chunk.empty(); });
    const std::size_t step = sizeof(float) * std::max<std::size_t>(1, header_.items.size());
    return isPacked ? Steps() : std::clamp<std::size_t>(kKept / step, 1, Steps());
  }
  /// Values of an item from a step on. "" or why not.
  std::string Read(int item, std::size_t step, std::span<float> values) {
    const ItemStorage& storage = StorageOf(item);
    std::vector<std::size_t> start(storage.lengths.size(), 0), count(storage.lengths.size(), 1);
    start[static_cast<std::size_t>(storage.time)] = step;
    count[static_cast<std::size_t>(storage.time)] = values.size();
    const bool isPlain = storage.type == NC_FLOAT && !storage.IsPacked();
    if (!isPlain) stored_.resize(values.size());
    {
      const netcdf::Lock lock;
      const int id = file_.Id(), variable = storage.variable;
      const netcdf::Calls& library = netcdf::Library();
      const int status = isPlain ? library.nc_get_vara_float(id, variable, start.data(), count.data(), values.data())
                                 : library.nc_get_vara_double(id, variable, start.data(), count.data(), stored_.data());
      if (status != NC_NOERR) return netcdf::InWords(status);
    }
    if (isPlain) {
      storage.MarkMissing(values);
      return {};
    }
    for (std::size_t i = 0; i < values.size(); ++i) {
      const double value = storage.Unpacked(stored_[i]);
      if (std::abs(value) > static_cast<double>(std::numeric_limits<float>::max()))
        return "a value is too large for single precision";
      values[i] = std::isnan(value) ? kDeleteValue : static_cast<float>(value);
    }
    return {};
  }

 private:
  const ItemStorage& StorageOf(int item) const { return header_.storages[static_cast<std::size_t>(item - 1)]; }

  std::string problem_;
  netcdf::Handle file_;
  DataFileHeader header_;
  std::vector<double> stored_;
};

}  // namespace

std::string ReadSeriesTogether(const std::string& path, std::span<const int> items,
                               std::vector<std::vector<float>>& values, ProgressPart progress) {
  const auto refused = [&](const std::string& reason) { return fmt::format("cannot read {}: {}", path, reason); };
  try {
    SeriesBlocks blocks(path);
    if (!blocks.Problem().empty()) return refused(blocks.Problem());
    for (const int item : items)
      if (!blocks.IsSeries(item)) return refused(fmt::format("item {} is no time series", item));
    const std::size_t steps = blocks.Steps(), atOnce = std::max<std::size_t>(blocks.StepsAtOnce(), 1);
    values.assign(items.size(), std::vector<float>(steps));
    for (std::size_t step = 0; step < steps; step += atOnce) {
      const std::size_t count = std::min(atOnce, steps - step);
      for (std::size_t i = 0; i < items.size(); ++i) {
        progress.ThrowIfCancelled();
        if (std::string reason = blocks.Read(items[i], step, std::span(values[i]).subspan(step, count));
            !reason.empty())
          return refused(reason);
      }
      progress.Report(static_cast<double>(step) / static_cast<double>(steps));
    }
  } catch (const std::bad_alloc&) {
    return refused("it needs more than the free memory");
  } catch (const Cancelled&) {
    return refused(kCancelled);
  }
  return {};
}

}  // namespace tervane
