// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/datafile.h"

#include <algorithm>
#include <array>
#include <bit>
#include <cmath>
#include <functional>
#include <new>
#include <utility>

#include <fmt/format.h>

#include "data/datafile_header.h"
#include "data/netcdf.h"
#include "data/raster_file.h"
#include "platform/files.h"
#include "platform/item_types.h"
#include "platform/os.h"
#include "platform/paths.h"

namespace tervane {

namespace {

/// Values that are read and converted at one time, so few that they are still in the processor's cache in between.
constexpr std::size_t kReadPiece = std::size_t{1} << 16;

/// Whether a file is netCDF, by its first bytes, or too short for anything else; `reason` says what is wrong with one
/// that is not whole, as far as its header shows.
bool IsNetcdf(const std::string& path, std::string& reason) {
  bool isClassic = false;
  reason = netcdf::WhyClassicFileIsBad(path, isClassic);
  if (isClassic || !reason.empty()) return true;
  std::error_code error;
  os::File file = os::File::OpenForReading(path, error);
  std::array<char, 8> begin{};
  constexpr std::string_view kHdf5 = "\x89HDF\r\n\x1a\n";
  return !error && file.Read(begin.data(), begin.size(), error) == begin.size() &&
         std::string_view(begin.data(), begin.size()) == kHdf5;
}

/// The bands of a raster as items that hold at all times.
std::string HeaderOf(const RasterFacts& facts, DataFileHeader& header) {
  const double cells = static_cast<double>(facts.geometry.nx) * static_cast<double>(facts.geometry.ny);
  if (cells > static_cast<double>(kMostCells)) {
    return fmt::format("it has {:.0f} cells; at most {} can be read; cut it into parts, or import it on a model grid",
                       cells, kMostCells);
  }
  header.notes = facts.notes;
  for (const RasterBand& band : facts.bands) {
    DataItem& item = header.items.emplace_back();
    item.name = band.name;
    item.itemType = band.itemType;
    item.dimensions = 2;
    item.geometry = facts.geometry;
    const std::optional<int> unitKey = band.unitKey != 0 ? std::optional(band.unitKey) : std::nullopt;
    if (std::string note = SetUnit(item, band.unitText, unitKey); !note.empty())
      header.notes.push_back(std::move(note));
    header.storages.emplace_back().variable = band.number;
  }
  return {};
}

}  // namespace

std::string_view ValueTypeText(ValueType type) {
  constexpr std::string_view kTexts[] = {"instantaneous", "accumulated", "accumulated over the step",
                                         "mean over the step"};
  return kTexts[static_cast<std::size_t>(type)];
}

bool AreFinite(std::span<const float> values) {
  // Only what is not finite gives no zero when it is taken times 0. Sums side by side wait for nobody.
  constexpr std::size_t kSums = 32;
  std::array<float, kSums> sums{};
  std::size_t i = 0;
  for (; i + kSums <= values.size(); i += kSums)
    for (std::size_t k = 0; k < kSums; ++k) sums[k] += values[i + k] * 0.0F;
  for (; i < values.size(); ++i) sums[0] += values[i] * 0.0F;
  return std::ranges::all_of(sums, [](float sum) { return sum == 0; });
}

void ValueSummary::Add(std::span<const float> values) {
  AddRange(values);
  for (const float value : values) sum += value != kDeleteValue ? static_cast<double>(value) : 0.0;
}

void ValueSummary::AddRange(std::span<const float> values) {
  // Numbers of one sign are ordered as their bits are; the other half of the bits is turned for negative ones. Whole
  // numbers need no order of the steps, so that the processor takes many at a time.
  const auto key = [](float value) {
    const auto bits = std::bit_cast<std::int32_t>(value);
    return bits ^ ((bits >> 31) & std::numeric_limits<std::int32_t>::max());
  };
  const auto valueOf = [&](std::int32_t k) {
    return std::bit_cast<float>(k ^ ((k >> 31) & std::numeric_limits<std::int32_t>::max()));
  };
  constexpr std::int32_t kLast = std::numeric_limits<std::int32_t>::max();
  const std::int32_t none = key(kDeleteValue);
  std::int32_t least = key(smallest), most = key(largest);
  std::uint64_t added = 0;
  // In pieces that a small counter can hold.
  for (std::span<const float> rest = values; !rest.empty();) {
    const std::span<const float> piece = rest.first(std::min(rest.size(), kReadPiece));
    rest = rest.subspan(piece.size());
    std::int32_t counted = 0;
    for (const float value : piece) {
      const std::int32_t k = key(value);
      counted += k != none ? 1 : 0;
      least = std::min(least, k == none ? kLast : k);
      most = std::max(most, k == none ? -kLast : k);
    }
    added += static_cast<std::uint64_t>(counted);
  }
  smallest = valueOf(least);
  largest = valueOf(most);
  count += added;
  missing += values.size() - added;
}

void ValueSummary::Add(const ValueSummary& other) {
  smallest = std::min(smallest, other.smallest);
  largest = std::max(largest, other.largest);
  sum += other.sum;
  count += other.count;
  missing += other.missing;
}

struct DataFile::State {
  std::string path;
  netcdf::Handle file;
  std::optional<RasterFile> raster;  ///< Where the file is no netCDF.
  DataFileHeader header;

  ~State() { netcdf::CloseLocked(file); }

  /// Reads one step (and layer) that stands in the order of the buffer.
  std::string ReadInOrder(const ItemStorage& storage, std::vector<std::size_t> start, std::vector<std::size_t> count,
                          const CellWindow& cells, std::span<float> values, const UnitConversion* conversion,
                          ProgressPart progress) const;
  std::string ReadByBoxes(const ItemStorage& storage, const DataItem& item, std::size_t step, std::optional<int> layer,
                          const CellWindow& cells, std::span<float> values, const UnitConversion* conversion,
                          ProgressPart progress) const;
  /// Reads a band of a raster; the error names the file.
  std::string ReadRaster(const ItemStorage& storage, const DataItem& item, const CellWindow& cells,
                         std::span<float> values, const UnitConversion* conversion, ProgressPart progress) const;
};

namespace {

/// Converts values that are not missing. A result that no float holds is an error.
bool Convert(const UnitConversion& conversion, std::span<float> values) {
  bool fits = true;
  for (float& value : values) {
    if (value == kDeleteValue) continue;
    const double converted = conversion(static_cast<double>(value));
    fits = fits && std::abs(converted) <= static_cast<double>(std::numeric_limits<float>::max());
    value = static_cast<float>(converted);
  }
  return fits;
}

/// Where the values of a box, which come in the file's order, the last dimension the fastest, go in a buffer.
class BoxWalk {
 public:
  BoxWalk(const std::vector<std::size_t>& count, const std::vector<std::ptrdiff_t>& stride, std::ptrdiff_t first)
      : target_(first) {
    for (std::size_t i = count.size(); i > 0; --i)
      if (count[i - 1] > 1) dimensions_.push_back({count[i - 1], 0, stride[i - 1]});
  }

  std::size_t Next() {
    const auto place = static_cast<std::size_t>(target_);
    for (Along& along : dimensions_) {
      target_ += along.stride;
      if (++along.index < along.count) break;
      target_ -= along.stride * static_cast<std::ptrdiff_t>(along.count);
      along.index = 0;
    }
    return place;
  }

 private:
  struct Along {
    std::size_t count, index;
    std::ptrdiff_t stride;
  };
  std::vector<Along> dimensions_;  ///< The fastest first.
  std::ptrdiff_t target_;
};

constexpr const char* kTooLarge = "a value is too large for single precision in this unit";

/// Reads a box of values, which are in the file's order, piece by piece: other threads get the lock soon, and a
/// cancelled read ends soon.
class PieceReader {
 public:
  /// `convert` gets each piece of values, at most kReadPiece, soon after it was read.
  PieceReader(int file, const ItemStorage& storage, std::size_t size, ProgressPart progress,
              std::function<void(std::span<float>)> convert)
      : file_(file),
        storage_(storage),
        size_(static_cast<double>(size)),
        progress_(progress),
        convert_(std::move(convert)) {}

  struct Box {
    std::vector<std::size_t> start, count;
  };
  /// Dimensions before `d` have a count of 1 each. Gives the status of the library; throws `Cancelled`.
  int Read(std::size_t d, Box box, std::span<float> values) {
    if (values.size() <= kReadPiece || d == box.count.size()) return Get(box, values);
    const std::size_t all = box.count[d], inner = values.size() / all;
    std::size_t atOnce = std::max<std::size_t>(kReadPiece / inner, 1);
    // A stored piece is unpacked as a whole, so that it should be asked for once.
    if (!storage_.chunk.empty() && inner <= kReadPiece) atOnce = std::max(atOnce / Chunk(d) * Chunk(d), Chunk(d));
    if (!storage_.chunk.empty() && inner > kReadPiece) atOnce = d + 2 == box.count.size() ? Chunk(d) : 1;
    for (std::size_t done = 0; done < all; done += atOnce) {
      box.count[d] = std::min(atOnce, all - done);
      const std::span<float> piece = values.subspan(done * inner, box.count[d] * inner);
      const int status = box.count[d] == 1 ? Read(d + 1, box, piece) : Get(box, piece);
      if (status != NC_NOERR) return status;
      box.start[d] += atOnce;
    }
    return NC_NOERR;
  }

 private:
  std::size_t Chunk(std::size_t d) const { return std::max<std::size_t>(storage_.chunk[d], 1); }

  int Get(const Box& box, std::span<float> values) {
    const std::size_t columns = box.count.empty() ? 1 : box.count.back();
    const std::size_t width = storage_.chunk.empty() ? columns : Chunk(box.count.size() - 1);
    if (values.size() <= kReadPiece || width >= columns) return GetAtOnce(box, values);
    // Wide rows of packed pieces, one piece after the other.
    Box part = box;
    std::vector<float> read;
    for (std::size_t first = 0; first < columns; first += width) {
      const std::size_t count = part.count.back() = std::min(width, columns - first);
      read.resize(values.size() / columns * count);
      if (const int status = GetAtOnce(part, read); status != NC_NOERR) return status;
      for (std::size_t from = 0, to = first; from < read.size(); from += count, to += columns)
        std::copy_n(read.begin() + static_cast<std::ptrdiff_t>(from), count,
                    values.begin() + static_cast<std::ptrdiff_t>(to));
      part.start.back() += width;
    }
    return NC_NOERR;
  }

  int GetAtOnce(const Box& box, std::span<float> values) {
    progress_.ThrowIfCancelled();
    const int status = GetLocked(box, values);
    progress_.Report(static_cast<double>(done_ += values.size()) / size_);
    for (; status == NC_NOERR && !values.empty(); values = values.subspan(std::min(kReadPiece, values.size())))
      convert_(values.first(std::min(kReadPiece, values.size())));
    return status;
  }

  int GetLocked(const Box& box, std::span<float> values) {
    const netcdf::Lock lock;
    return netcdf::Library().nc_get_vara_float(file_, storage_.variable, box.start.data(), box.count.data(),
                                               values.data());
  }

  int file_;
  const ItemStorage& storage_;
  double size_;
  std::size_t done_ = 0;
  ProgressPart progress_;
  std::function<void(std::span<float>)> convert_;
};

}  // namespace

std::string DataFile::State::ReadInOrder(const ItemStorage& storage, std::vector<std::size_t> start,
                                         std::vector<std::size_t> count, const CellWindow& cells,
                                         std::span<float> values, const UnitConversion* conversion,
                                         ProgressPart progress) const {
  bool fits = true;
  PieceReader reader(file.Id(), storage, values.size(), progress, [&](std::span<float> piece) {
    storage.MarkMissing(piece);
    if (conversion != nullptr) fits = Convert(*conversion, piece) && fits;
  });
  if (const int status = reader.Read(0, {std::move(start), std::move(count)}, values)) return netcdf::InWords(status);
  if (storage.isYTurned) {
    const auto nx = static_cast<std::size_t>(cells.nx);
    const std::size_t layerSize = cells.CellCount();
    for (std::size_t layer = 0; layer < values.size(); layer += layerSize) {
      for (std::size_t low = layer, high = layer + layerSize - nx; low < high; low += nx, high -= nx)
        std::swap_ranges(values.begin() + static_cast<std::ptrdiff_t>(low),
                         values.begin() + static_cast<std::ptrdiff_t>(low + nx),
                         values.begin() + static_cast<std::ptrdiff_t>(high));
    }
  }
  return fits ? std::string() : kTooLarge;
}

std::string DataFile::State::ReadByBoxes(const ItemStorage& storage, const DataItem& item, std::size_t step,
                                         std::optional<int> layer, const CellWindow& cells, std::span<float> values,
                                         const UnitConversion* conversion, ProgressPart progress) const {
  const std::size_t rank = storage.lengths.size();
  std::vector<std::size_t> start(rank, 0), count(rank, 1);
  // How far apart neighbours along each dimension of the file stand in the buffer, and where the file's first goes.
  std::vector<std::ptrdiff_t> stride(rank, 0);
  std::ptrdiff_t origin = 0;
  std::size_t outermost = rank;
  const auto place = [&](int dimension, std::ptrdiff_t distance, bool isTurned, int first, int size) {
    if (dimension < 0) return;
    const auto d = static_cast<std::size_t>(dimension);
    count[d] = static_cast<std::size_t>(size);
    start[d] = isTurned ? storage.lengths[d] - static_cast<std::size_t>(first + size) : static_cast<std::size_t>(first);
    stride[d] = isTurned ? -distance : distance;
    if (isTurned) origin += distance * static_cast<std::ptrdiff_t>(size - 1);
    outermost = std::min(outermost, d);
  };
  place(storage.x, 1, storage.isXTurned, cells.i, cells.nx);
  place(storage.y, cells.nx, storage.isYTurned, cells.j, cells.ny);
  if (storage.z >= 0 && layer) {
    const auto z = static_cast<std::size_t>(storage.z);
    start[z] = storage.isZTurned ? storage.lengths[z] - 1 - static_cast<std::size_t>(*layer)
                                 : static_cast<std::size_t>(*layer);
  } else {
    place(storage.z, static_cast<std::ptrdiff_t>(cells.CellCount()), storage.isZTurned, 0, item.geometry.nz);
  }
  if (storage.time >= 0) {
    const auto time = static_cast<std::size_t>(storage.time);
    start[time] = step;
    // A series: its steps are what stands side by side.
    if (item.dimensions == 0) {
      count[time] = values.size();
      stride[time] = 1;
    }
  }

  // One slice of the outermost dimension at a time keeps the buffer of doubles small.
  const bool isSliced = outermost < rank && values.size() > kReadPiece;
  const std::size_t slices = isSliced ? std::exchange(count[outermost], 1) : 1;
  const std::size_t firstSlice = isSliced ? start[outermost] : 0;
  std::vector<double> box(values.size() / slices);
  bool fits = true;
  for (std::size_t slice = 0; slice < slices; ++slice) {
    progress.ThrowIfCancelled();
    progress.Report(static_cast<double>(slice) / static_cast<double>(slices));
    std::ptrdiff_t target = origin;
    if (isSliced) {
      start[outermost] = firstSlice + slice;
      target += stride[outermost] * static_cast<std::ptrdiff_t>(slice);
    }
    {
      const netcdf::Lock lock;
      if (const int status =
              netcdf::Library().nc_get_vara_double(file.Id(), storage.variable, start.data(), count.data(), box.data()))
        return netcdf::InWords(status);
    }
    BoxWalk walk(count, stride, target);
    for (const double stored : box) {
      double value = storage.Unpacked(stored);
      if (conversion != nullptr) value = (*conversion)(value);
      const bool isFloat = std::abs(value) <= static_cast<double>(std::numeric_limits<float>::max());
      fits = fits && (isFloat || std::isnan(value));
      values[walk.Next()] = isFloat ? static_cast<float>(value) : kDeleteValue;
    }
  }
  return fits ? std::string() : kTooLarge;
}

std::string DataFile::State::ReadRaster(const ItemStorage& storage, const DataItem& item, const CellWindow& cells,
                                        std::span<float> values, const UnitConversion* conversion,
                                        ProgressPart progress) const {
  constexpr int kRows = 256;  // as many as the pieces of most rasters have
  for (int j = 0; j < cells.ny; j += kRows) {
    progress.ThrowIfCancelled();
    progress.Report(static_cast<double>(j) / cells.ny);
    const CellWindow rows{cells.i, cells.j + j, cells.nx, std::min(kRows, cells.ny - j)};
    const std::size_t first = static_cast<std::size_t>(j) * static_cast<std::size_t>(cells.nx);
    std::string error = raster->Read(storage.variable, rows, values.subspan(first, rows.CellCount()));
    if (!error.empty()) return error;
  }
  if (conversion == nullptr || Convert(*conversion, values)) return {};
  return fmt::format("cannot read {}: item {}: {}", path, item.name, kTooLarge);
}

DataFile::DataFile() : state_(std::make_unique<State>()) {}
DataFile::DataFile(DataFile&& other) noexcept = default;
DataFile& DataFile::operator=(DataFile&& other) noexcept = default;
DataFile::~DataFile() = default;

std::string DataFile::Open(const std::string& path) {
  auto state = std::make_unique<State>();
  state->path = path;
  std::string reason = WhyNotReadable(path);
  if (!reason.empty()) return reason;
  try {
    if (!IsNetcdf(path, reason)) {
      state->raster.emplace();
      if (std::string error = state->raster->Open(path); !error.empty()) return error;
      reason = HeaderOf(state->raster->Facts(), state->header);
    } else if (reason.empty()) {
      const netcdf::Lock lock;
      int id = -1;
      // An absolute path, because the library takes others for addresses of the network. A file that is open to others
      // too is read straight into the buffer for conversion, without one more in between, and single numbers alone.
      std::size_t buffer = netcdf::kReadSize;
      if (!netcdf::WhyNoLibrary().empty()) return netcdf::WhyNoLibrary();
      const int status =
          netcdf::Library().nc__open(AbsoluteFromHere(path).c_str(), NC_NOWRITE | NC_SHARE, &buffer, &id);
      if (status == NC_NOERR) {
        state->file = netcdf::Handle(id);
        reason = ReadHeader(id, state->header);
      } else {
        reason = netcdf::InWords(status);
      }
    }
  } catch (const std::bad_alloc&) {
    reason = "it needs more than the free memory";
  }
  if (!reason.empty()) return fmt::format("cannot read {}: {}", path, reason);
  state_ = std::move(state);
  return {};
}

const std::string& DataFile::Path() const { return state_->path; }
const std::vector<DataItem>& DataFile::Items() const { return state_->header.items; }
const TimeAxis& DataFile::Time() const { return state_->header.time; }
const std::vector<std::string>& DataFile::Notes() const { return state_->header.notes; }

std::size_t DataFile::SizeOf(const ValueSelection& selection) const {
  if (selection.item < 1 || static_cast<std::size_t>(selection.item) > Items().size()) return 0;
  const DataItem& item = Items()[static_cast<std::size_t>(selection.item - 1)];
  const std::size_t cells = selection.cells ? selection.cells->CellCount() : item.CellsOfLayer();
  return selection.steps * cells * (selection.layer ? 1 : static_cast<std::size_t>(item.geometry.nz));
}

std::string DataFile::Read(const ValueSelection& selection, std::span<float> values, std::optional<int> inBaseUnitOf,
                           ProgressPart progress) const {
  const auto refused = [&](const std::string& reason) { return fmt::format("cannot read {}: {}", Path(), reason); };
  if (selection.item < 1 || static_cast<std::size_t>(selection.item) > Items().size()) {
    return refused(fmt::format("there is no item {}: the file has {}", selection.item, Items().size()));
  }
  const DataItem& item = Items()[static_cast<std::size_t>(selection.item - 1)];
  const ItemStorage& storage = state_->header.storages[static_cast<std::size_t>(selection.item - 1)];
  const std::size_t steps = item.hasTime ? state_->header.time.steps : 1;
  if (selection.step >= steps || selection.steps > steps - selection.step) {
    return refused(
        fmt::format("there is no step {}: the item {} has {}", selection.step + selection.steps, item.name, steps));
  }
  if (selection.layer && (*selection.layer < 0 || *selection.layer >= item.geometry.nz)) {
    return refused(
        fmt::format("there is no layer {}: the item {} has {}", *selection.layer + 1, item.name, item.geometry.nz));
  }
  const CellWindow cells = selection.cells.value_or(CellWindow{0, 0, item.geometry.nx, item.geometry.ny});
  if (selection.cells && (item.dimensions < 2 || cells.i < 0 || cells.j < 0 || cells.nx < 1 || cells.ny < 1 ||
                          cells.nx > item.geometry.nx - cells.i || cells.ny > item.geometry.ny - cells.j)) {
    return refused(fmt::format("the cells {}, {} to {}, {} do not lie on the grid of {}", cells.i, cells.j,
                               cells.i + cells.nx - 1, cells.j + cells.ny - 1, item.name));
  }
  if (values.size() != SizeOf(selection)) {
    return refused(fmt::format("{} values were asked for, {} are there", values.size(), SizeOf(selection)));
  }
  std::optional<UnitConversion> conversion;
  if (inBaseUnitOf && *inBaseUnitOf != quantity::kUndefined) {
    const ItemType* wanted = FindItemType(*inBaseUnitOf);
    if (wanted == nullptr) return refused(fmt::format("there is no item type {}", *inBaseUnitOf));
    const Unit& base = BaseUnit(*wanted);
    if (item.scale) conversion = ConversionBetween(*item.scale, base.scale);
    if (!conversion) {
      return refused(fmt::format("the item {} is in \"{}\", which does not convert to {}, the unit of {}", item.name,
                                 item.unitText, base.text, wanted->name));
    }
    // The same unit: its values stay as they are to the last bit.
    if ((*conversion)(1.0) == 1.0 && (*conversion)(0.0) == 0.0) conversion.reset();
  }

  const UnitConversion* converter = conversion ? &*conversion : nullptr;
  const bool isInOrder = storage.type == NC_FLOAT && !storage.IsPacked() && storage.IsInOrder();
  // A series is read in one call, grids step by step.
  const bool isSeries = item.dimensions == 0;
  const std::size_t calls = isSeries ? 1 : selection.steps;
  const std::size_t size = calls == 0 ? 0 : values.size() / calls;
  try {
    if (state_->raster && values.empty()) return {};
    if (state_->raster) return state_->ReadRaster(storage, item, cells, values, converter, progress);
    for (std::size_t i = 0; i < calls; ++i) {
      const std::span<float> part = values.subspan(i * size, size);
      const auto all = static_cast<double>(calls);
      const ProgressPart told = progress.Part(static_cast<double>(i) / all, static_cast<double>(i + 1) / all);
      std::string reason;
      if (isInOrder) {
        std::vector<std::size_t> start(storage.lengths.size(), 0), count = storage.lengths;
        if (storage.time >= 0) {
          start[static_cast<std::size_t>(storage.time)] = selection.step + i;
          count[static_cast<std::size_t>(storage.time)] = isSeries ? selection.steps : 1;
        }
        if (selection.layer && storage.z >= 0) {
          start[static_cast<std::size_t>(storage.z)] = static_cast<std::size_t>(*selection.layer);
          count[static_cast<std::size_t>(storage.z)] = 1;
        }
        if (selection.cells && storage.x >= 0 && storage.y >= 0) {
          // In the file's order, which may be from the north.
          const auto x = static_cast<std::size_t>(storage.x), y = static_cast<std::size_t>(storage.y);
          start[x] = static_cast<std::size_t>(cells.i);
          count[x] = static_cast<std::size_t>(cells.nx);
          count[y] = static_cast<std::size_t>(cells.ny);
          start[y] = storage.isYTurned ? storage.lengths[y] - static_cast<std::size_t>(cells.j + cells.ny)
                                       : static_cast<std::size_t>(cells.j);
        }
        reason = state_->ReadInOrder(storage, std::move(start), std::move(count), cells, part, converter, told);
      } else {
        reason = state_->ReadByBoxes(storage, item, selection.step + i, selection.layer, cells, part, converter, told);
      }
      if (!reason.empty()) {
        return refused(fmt::format("item {}, step {}: {}", selection.item, selection.step + i + 1, reason));
      }
    }
  } catch (const std::bad_alloc&) {
    return refused("it needs more than the free memory");
  } catch (const Cancelled&) {
    return refused(kCancelled);
  }
  return {};
}

std::optional<ItemStatistics> DataFile::StoredStatistics(int item) const {
  if (item < 1 || static_cast<std::size_t>(item) > Items().size()) return std::nullopt;
  const ItemStorage& storage = state_->header.storages[static_cast<std::size_t>(item - 1)];
  if (storage.range.empty()) return std::nullopt;
  return ItemStatistics{storage.range[0], storage.range[1], storage.count, true};
}

std::string DataFile::Statistics(int item, ItemStatistics& statistics) const {
  if (const auto stored = StoredStatistics(item)) {
    statistics = *stored;
    return {};
  }
  ValueSummary summary;
  ValueSelection whole;
  whole.item = item;
  const bool hasTime = SizeOf(whole) > 0 && Items()[static_cast<std::size_t>(item - 1)].hasTime;
  const std::size_t steps = hasTime ? Time().steps : 1;
  try {
    std::vector<float> values(SizeOf(whole));
    for (whole.step = 0; whole.step < steps; ++whole.step) {
      if (std::string error = Read(whole, values); !error.empty()) return error;
      summary.AddRange(values);
    }
  } catch (const std::bad_alloc&) {
    return fmt::format("cannot read {}: it needs more than the free memory", Path());
  }
  constexpr double kNone = std::numeric_limits<double>::quiet_NaN();
  statistics = {summary.count > 0 ? static_cast<double>(summary.smallest) : kNone,
                summary.count > 0 ? static_cast<double>(summary.largest) : kNone, summary.count, false};
  return {};
}

}  // namespace tervane
