// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/datafile_update.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <limits>
#include <new>
#include <set>
#include <unordered_map>
#include <utility>

#include <fmt/format.h>

#include "data/cf_time.h"
#include "data/datafile_header.h"
#include "data/netcdf.h"
#include "platform/os.h"
#include "platform/paths.h"

namespace tervane {

namespace {

std::string InWordsOf(const std::error_code& error) { return error.message(); }

/// Fills an empty file with the bytes of another one. "" or why not. Throws `Cancelled`.
std::string CopyInto(os::File& source, const std::string& to, ProgressPart progress) {
  constexpr std::size_t kPiece = std::size_t{1} << 20;
  std::error_code error;
  os::File target;
  const auto size = static_cast<double>(source.GetStatus(error).size);
  if (!error) source.Seek(0, error);
  if (!error) target = os::File::OpenOrCreate(to, error);
  std::vector<char> piece(kPiece);
  for (double done = 0; !error;) {
    progress.ThrowIfCancelled();
    const std::size_t read = source.Read(piece.data(), piece.size(), error);
    if (error || read == 0) break;
    target.WriteAll({piece.data(), read}, error);
    progress.Report((done += static_cast<double>(read)) / std::max(size, 1.0));
  }
  if (!error) target.Close(error);
  return error ? InWordsOf(error) : std::string();
}

/// Opens a file of the library for reading or writing. The lock must be held.
int OpenNetcdf(const std::string& path, int mode, netcdf::Handle& file) {
  std::size_t buffer = netcdf::kBufferSize;
  int id = -1;
  const int status = netcdf::Library().nc__open(AbsoluteFromHere(path).c_str(), mode, &buffer, &id);
  if (status == NC_NOERR) file = netcdf::Handle(id);
  return status;
}

std::string WhyNotStored(const ItemStorage& storage) {
  if (storage.IsPacked()) return "its values are packed into whole numbers";
  if (storage.type != NC_FLOAT && storage.type != NC_DOUBLE) return "its values are stored as whole numbers";
  if (!storage.IsInOrder()) return "its values are stored in another order than layers, rows and columns";
  return {};
}

/// Writes values into a part of a variable. The lock must be held.
int PutPart(int file, const ItemStorage& storage, std::span<const std::size_t> start,
            std::span<const std::size_t> count, std::span<const float> values) {
  std::vector<double> numbers(values.size());
  if (const int status =
          netcdf::Library().nc_get_vara_double(file, storage.variable, start.data(), count.data(), numbers.data()))
    return status;
  numbers = storage.Stored(values, numbers);
  return netcdf::Library().nc_put_vara_double(file, storage.variable, start.data(), count.data(), numbers.data());
}

std::string NameOfVariable(int file, int variable) {
  char name[NC_MAX_NAME + 1] = {};
  netcdf::Library().nc_inq_var(file, variable, name, nullptr, nullptr, nullptr, nullptr);
  return name;
}

std::vector<int> DimensionsOf(int file, int variable) {
  int count = 0;
  netcdf::Library().nc_inq_varndims(file, variable, &count);
  std::vector<int> dimensions(static_cast<std::size_t>(count));
  netcdf::Library().nc_inq_vardimid(file, variable, dimensions.data());
  return dimensions;
}

/// The time dimension of the items, its variable and that of its bounds; -1 for none.
struct TimeVariables {
  int dimension = -1, time = -1, bounds = -1;
};
TimeVariables FindTime(int file, const DataFileHeader& header) {
  TimeVariables found;
  for (const ItemStorage& storage : header.storages)
    if (storage.time >= 0)
      found.dimension = DimensionsOf(file, storage.variable)[static_cast<std::size_t>(storage.time)];
  if (found.dimension < 0) return found;
  char name[NC_MAX_NAME + 1] = {};
  std::size_t length = 0;
  netcdf::Library().nc_inq_dim(file, found.dimension, name, &length);
  if (netcdf::Library().nc_inq_varid(file, name, &found.time) != NC_NOERR) found.time = -1;
  if (found.time < 0) return found;
  const std::string bounds = netcdf::TextAttribute(file, found.time, "bounds");
  if (bounds.empty() || netcdf::Library().nc_inq_varid(file, bounds.c_str(), &found.bounds) != NC_NOERR)
    found.bounds = -1;
  return found;
}

std::string WhyNoOtherTimesIn(int file, const DataFileHeader& header) {
  if (std::ranges::any_of(header.items, [](const DataItem& item) { return item.dimensions > 0 || !item.hasTime; }))
    return "it holds more than series";
  if (!header.time.hasDates) return "its steps have no dates";
  for (std::size_t i = 0; i < header.items.size(); ++i)
    if (const std::string why = WhyNotStored(header.storages[i]); !why.empty())
      return fmt::format("{}: {}", header.items[i].name, why);
  const TimeVariables time = FindTime(file, header);
  int variables = 0, groups = 0;
  netcdf::Library().nc_inq(file, nullptr, &variables, nullptr, nullptr);
  if (netcdf::Library().nc_inq_grps(file, &groups, nullptr) == NC_NOERR && groups > 0)
    return "it holds groups of variables";
  for (int id = 0; id < variables; ++id) {
    nc_type type = NC_NAT;
    netcdf::Library().nc_inq_var(file, id, nullptr, &type, nullptr, nullptr, nullptr);
    if (type > NC_STRING) return fmt::format("its variable {} has a type of its own", NameOfVariable(file, id));
    if (id == time.time || id == time.bounds || std::ranges::count(header.storages, id, &ItemStorage::variable))
      continue;
    if (std::ranges::count(DimensionsOf(file, id), time.dimension))
      return fmt::format("its variable {} has values for each time, too", NameOfVariable(file, id));
  }
  return {};
}

/// Brings a stored range and count up to date, in the types that they have. The lock must be held.
int PutStatistics(int file, int variable, const ValueSummary& summary) {
  const auto put = [&](const char* name, std::span<const double> numbers) -> int {
    nc_type type = NC_NAT;
    std::size_t length = 0;
    if (netcdf::Library().nc_inq_att(file, variable, name, &type, &length) != NC_NOERR || length != numbers.size())
      return NC_NOERR;
    return netcdf::Library().nc_put_att_double(file, variable, name, type, length, numbers.data());
  };
  std::array<double, 2> range{static_cast<double>(summary.smallest), static_cast<double>(summary.largest)};
  if (summary.count == 0) range.fill(std::numeric_limits<double>::quiet_NaN());
  const double count = static_cast<double>(summary.count);
  const int status = put("actual_range", range);
  return status == NC_NOERR ? put("value_count", {&count, 1}) : status;
}

/// Copies all attributes of a variable but those named. The lock must be held.
int CopyAttributes(int from, int variable, int to, int target, const std::set<std::string>& but = {}) {
  int count = 0;
  if (variable == NC_GLOBAL)
    netcdf::Library().nc_inq(from, nullptr, nullptr, &count, nullptr);
  else
    netcdf::Library().nc_inq_varnatts(from, variable, &count);
  for (int number = 0; number < count; ++number) {
    char name[NC_MAX_NAME + 1] = {};
    if (const int status = netcdf::Library().nc_inq_attname(from, variable, number, name)) return status;
    if (but.contains(name)) continue;
    if (const int status = netcdf::Library().nc_copy_att(from, variable, name, to, target)) return status;
  }
  return NC_NOERR;
}

}  // namespace

FileUpdateFacts UpdateFactsOf(const std::string& path) {
  FileUpdateFacts facts;
  DataFile readable;
  facts.whyNot = readable.Open(path);
  if (!facts.whyNot.empty()) return facts;
  DataFileHeader header;
  const netcdf::Lock lock;
  netcdf::Handle file;
  if (!netcdf::WhyNoLibrary().empty() || OpenNetcdf(path, NC_NOWRITE, file) != NC_NOERR ||
      !ReadHeader(file.Id(), header).empty()) {
    facts.whyNot = "it is a raster of another form; import it to have it as a data file that can be changed";
    return facts;
  }
  for (const ItemStorage& storage : header.storages)
    facts.items.push_back({WhyNotStored(storage), storage.validFrom, storage.validTo});
  facts.whyNoOtherTimes = WhyNoOtherTimesIn(file.Id(), header);
  return facts;
}

struct DataFileUpdate::State {
  std::string to;
  FileReplacement replacement;
  netcdf::Handle file;
  DataFileHeader header;
  std::set<int> changed;  ///< Numbers of items.

  ~State() { netcdf::CloseLocked(file); }

  std::string Fail(const std::string& reason) const {
    return fmt::format("cannot write {}: {}; nothing was written", to, reason);
  }
  const ItemStorage* StorageOf(int item) {
    if (item < 1 || static_cast<std::size_t>(item) > header.storages.size()) return nullptr;
    changed.insert(item);
    return &header.storages[static_cast<std::size_t>(item - 1)];
  }
};

DataFileUpdate::DataFileUpdate() : state_(std::make_unique<State>()) {}
DataFileUpdate::~DataFileUpdate() = default;

std::string DataFileUpdate::Begin(os::File& from, const std::string& to, ProgressPart progress) {
  auto state = std::make_unique<State>();
  state->to = to;
  if (FileResult begun = state->replacement.Begin(to); !begun.Ok()) return begun.error;
  try {
    if (const std::string reason = CopyInto(from, state->replacement.TemporaryPath(), progress); !reason.empty())
      return state->Fail(reason);
  } catch (const Cancelled&) {
    return state->Fail(kCancelled);
  }
  {
    const netcdf::Lock lock;
    if (!netcdf::WhyNoLibrary().empty()) return netcdf::WhyNoLibrary();
    if (const int status = OpenNetcdf(state->replacement.TemporaryPath(), NC_WRITE, state->file))
      return state->Fail(netcdf::InWords(status));
    if (const std::string reason = ReadHeader(state->file.Id(), state->header); !reason.empty())
      return state->Fail(reason);
  }
  state_ = std::move(state);
  return {};
}

std::string DataFileUpdate::PutLayer(int item, const GridSlice& slice, std::span<const float> values,
                                     const std::function<bool(int row)>& isChanged, ProgressPart progress) {
  State& state = *state_;
  const ItemStorage* storage = state.StorageOf(item);
  if (!storage) return state.Fail(fmt::format("there is no item {}", item));
  if (const std::string why = WhyNotStored(*storage); !why.empty()) return state.Fail(why);
  const FileGeometry& geometry = state.header.items[static_cast<std::size_t>(item - 1)].geometry;
  const auto nx = static_cast<std::size_t>(geometry.nx);
  if (values.size() != nx * static_cast<std::size_t>(geometry.ny)) return state.Fail("a layer has another size");
  std::vector<std::size_t> start(storage->lengths.size(), 0), count(storage->lengths.size(), 1);
  const auto at = [](int place) { return static_cast<std::size_t>(place); };
  if (storage->time >= 0) start[at(storage->time)] = slice.step;
  if (storage->z >= 0) start[at(storage->z)] = at(slice.layer);
  if (storage->x >= 0) count[at(storage->x)] = nx;
  // Packed pieces are written as a whole, and plain rows some at a time, so that nobody waits long for the lock.
  constexpr std::size_t kPiece = std::size_t{1} << 18;
  std::size_t band = std::max<std::size_t>(kPiece / nx, 1);
  if (!storage->chunk.empty() && storage->y >= 0) band = std::max<std::size_t>(storage->chunk[at(storage->y)], 1);
  const std::size_t rows = static_cast<std::size_t>(geometry.ny);
  // In the file's order.
  const auto rowAt = [&](std::size_t stored) { return storage->isYTurned ? rows - 1 - stored : stored; };
  std::vector<float> piece;
  for (std::size_t first = 0; first < rows; first += band) {
    if (progress.IsCancelled()) return state.Fail(kCancelled);
    progress.Report(static_cast<double>(first) / static_cast<double>(rows));
    const std::size_t last = std::min(first + band, rows);
    bool isAny = false;
    for (std::size_t row = first; row < last && !isAny; ++row) isAny = isChanged(static_cast<int>(rowAt(row)));
    if (!isAny) continue;
    piece.clear();
    for (std::size_t row = first; row < last; ++row) {
      const std::span<const float> stored = values.subspan(rowAt(row) * nx, nx);
      piece.insert(piece.end(), stored.begin(), stored.end());
    }
    if (storage->y >= 0) {
      start[at(storage->y)] = first;
      count[at(storage->y)] = last - first;
    }
    const netcdf::Lock lock;
    const int status = PutPart(state.file.Id(), *storage, start, count, piece);
    if (status != NC_NOERR) return state.Fail(netcdf::InWords(status));
  }
  return {};
}

std::string DataFileUpdate::PutSeries(int item, std::span<const float> values) {
  State& state = *state_;
  const ItemStorage* storage = state.StorageOf(item);
  if (!storage) return state.Fail(fmt::format("there is no item {}", item));
  if (const std::string why = WhyNotStored(*storage); !why.empty()) return state.Fail(why);
  if (storage->time < 0 || values.size() != storage->lengths[static_cast<std::size_t>(storage->time)])
    return state.Fail("a series has another length");
  std::vector<std::size_t> start(storage->lengths.size(), 0), count = storage->lengths;
  const netcdf::Lock lock;
  const int status = PutPart(state.file.Id(), *storage, start, count, values);
  return status == NC_NOERR ? std::string() : state.Fail(netcdf::InWords(status));
}

FileResult DataFileUpdate::Finish(ProgressPart progress) {
  const std::unique_ptr<State> state = std::exchange(state_, std::make_unique<State>());
  if (!state->file.IsOpen()) return {"no file is being changed", {}};
  const std::string temporary = state->replacement.TemporaryPath();
  {
    const netcdf::Lock lock;
    if (const int status = state->file.Close()) return {state->Fail(netcdf::InWords(status)), {}};
  }
  std::vector<std::pair<int, ValueSummary>> summaries;
  {
    DataFile written;
    if (const std::string error = written.Open(temporary); !error.empty()) return {state->Fail(error), {}};
    for (const int item : state->changed) {
      if (state->header.storages[static_cast<std::size_t>(item - 1)].range.empty()) continue;
      auto& [variable, summary] =
          summaries.emplace_back(state->header.storages[static_cast<std::size_t>(item - 1)].variable, ValueSummary());
      const DataItem& facts = written.Items()[static_cast<std::size_t>(item - 1)];
      ValueSelection part;
      part.item = item;
      const std::size_t steps = facts.hasTime ? written.Time().steps : 1;
      if (facts.dimensions == 0) part.steps = steps;
      std::vector<float> values(written.SizeOf(part));
      for (; part.step < steps; part.step += part.steps) {
        progress.Report(static_cast<double>(part.step) / static_cast<double>(steps));
        if (progress.IsCancelled()) return {state->Fail(kCancelled), {}};
        if (const std::string error = written.Read(part, values); !error.empty()) return {state->Fail(error), {}};
        summary.AddRange(values);
      }
    }
  }
  if (!summaries.empty()) {
    const netcdf::Lock lock;
    int status = OpenNetcdf(temporary, NC_WRITE, state->file);
    for (const auto& [variable, summary] : summaries)
      if (status == NC_NOERR) status = PutStatistics(state->file.Id(), variable, summary);
    const int closed = state->file.IsOpen() ? state->file.Close() : NC_NOERR;
    if (status != NC_NOERR || closed != NC_NOERR)
      return {state->Fail(netcdf::InWords(status != NC_NOERR ? status : closed)), {}};
  }
  bool isClassic = false;
  if (const std::string reason = netcdf::WhyClassicFileIsBad(temporary, isClassic); !reason.empty())
    return {state->Fail(reason), {}};
  return state->replacement.Commit();
}

// ---- Series with other times

namespace {

/// Makes the file anew. The lock must be held.
class SeriesRewriter {
 public:
  SeriesRewriter(int from, int to, const DataFileHeader& header, const RewrittenSeries& series)
      : from_(from), to_(to), header_(header), series_(series), time_(FindTime(from, header)) {}

  int Rewrite() {
    if (const int status = Define()) return status;
    return PutValues();
  }

 private:
  int Define() {
    int dimensions = 0, variables = 0, unlimited = -1;
    if (const int status = netcdf::Library().nc_inq(from_, &dimensions, &variables, nullptr, &unlimited)) return status;
    if (const int status = CopyAttributes(from_, NC_GLOBAL, to_, NC_GLOBAL)) return status;
    std::vector<int> ids(static_cast<std::size_t>(dimensions));
    if (const int status = netcdf::Library().nc_inq_dimids(from_, &dimensions, ids.data(), 0)) return status;
    int most = -1;
    for (const int id : ids) most = std::max(most, id);
    dimensions_.assign(static_cast<std::size_t>(most + 1), -1);
    for (const int id : ids) {
      char name[NC_MAX_NAME + 1] = {};
      std::size_t length = 0;
      if (const int status = netcdf::Library().nc_inq_dim(from_, id, name, &length)) return status;
      if (id == time_.dimension) length = series_.stamps.size();
      if (id == unlimited) length = NC_UNLIMITED;
      if (const int status =
              netcdf::Library().nc_def_dim(to_, name, length, &dimensions_[static_cast<std::size_t>(id)]))
        return status;
    }
    for (int id = 0; id < variables; ++id)
      if (const int status = DefineVariable(id)) return status;
    return netcdf::Library().nc_enddef(to_);
  }

  int DefineVariable(int id) {
    nc_type type = NC_NAT;
    if (const int status = netcdf::Library().nc_inq_var(from_, id, nullptr, &type, nullptr, nullptr, nullptr))
      return status;
    const std::string name = NameOfVariable(from_, id);
    std::vector<int> shape = DimensionsOf(from_, id);
    for (int& dimension : shape) dimension = dimensions_[static_cast<std::size_t>(dimension)];
    const bool isTime = id == time_.time || id == time_.bounds;
    int made = -1;
    if (const int status = netcdf::Library().nc_def_var(to_, name.c_str(), isTime ? NC_DOUBLE : type,
                                                        static_cast<int>(shape.size()), shape.data(), &made))
      return status;
    // What tells of numbers of another type, or of times that are none any more, goes.
    static const std::set<std::string> kOfNumbers{"_FillValue",  "missing_value", "valid_min",    "valid_max",
                                                  "valid_range", "actual_range",  "scale_factor", "add_offset"};
    if (const int status = CopyAttributes(from_, id, to_, made, isTime ? kOfNumbers : std::set<std::string>()))
      return status;
    int isShuffled = 0, isPacked = 0, level = 0, layout = NC_CONTIGUOUS;
    std::vector<std::size_t> chunk(shape.size());
    if (!shape.empty() && netcdf::Library().nc_inq_var_chunking(from_, id, &layout, chunk.data()) == NC_NOERR &&
        layout == NC_CHUNKED) {
      // A piece is not longer than a dimension that cannot grow.
      for (std::size_t place = 0; place < shape.size(); ++place) {
        std::size_t length = 0;
        netcdf::Library().nc_inq_dim(to_, shape[place], nullptr, &length);
        if (length > 0) chunk[place] = std::min(chunk[place], length);
      }
      if (const int status = netcdf::Library().nc_def_var_chunking(to_, made, NC_CHUNKED, chunk.data())) return status;
    }
    if (netcdf::Library().nc_inq_var_deflate(from_, id, &isShuffled, &isPacked, &level) == NC_NOERR && isPacked)
      return netcdf::Library().nc_def_var_deflate(to_, made, isShuffled, isPacked, level);
    return NC_NOERR;
  }

  int PutValues() {
    int variables = 0;
    netcdf::Library().nc_inq(from_, nullptr, &variables, nullptr, nullptr);
    for (int id = 0; id < variables; ++id) {
      int made = -1;
      if (const int status = netcdf::Library().nc_inq_varid(to_, NameOfVariable(from_, id).c_str(), &made))
        return status;
      const auto item = std::ranges::find(header_.storages, id, &ItemStorage::variable);
      int status = NC_NOERR;
      if (id == time_.time)
        status = PutTimes(made, false);
      else if (id == time_.bounds)
        status = PutTimes(made, true);
      else if (item != header_.storages.end())
        status = PutItem(made, static_cast<std::size_t>(item - header_.storages.begin()));
      else
        status = CopyValues(id, made);
      if (status != NC_NOERR) return status;
    }
    return NC_NOERR;
  }

  int PutTimes(int made, bool areBounds) {
    const CfTimeUnits units = ParseCfTimeUnits(netcdf::TextAttribute(from_, time_.time, "units"),
                                               netcdf::TextAttribute(from_, time_.time, "calendar"));
    const auto stored = [&](std::int64_t stamp) {
      return (static_cast<double>(stamp) - units.epoch) / units.secondsPerUnit;
    };
    const std::vector<std::int64_t>& stamps = series_.stamps;
    std::vector<double> numbers;
    for (std::size_t i = 0; i < stamps.size(); ++i) {
      const std::int64_t step = stamps.size() > 1 ? stamps[1] - stamps[0] : 0;
      if (areBounds) numbers.push_back(stored(i > 0 ? stamps[i - 1] : series_.begin.value_or(stamps[0] - step)));
      numbers.push_back(stored(stamps[i]));
    }
    const std::array<std::size_t, 2> start{0, 0}, count{stamps.size(), 2};
    return netcdf::Library().nc_put_vara_double(to_, made, start.data(), count.data(), numbers.data());
  }

  int PutItem(int made, std::size_t item) {
    const ItemStorage& storage = header_.storages[item];
    std::vector<std::size_t> start(storage.lengths.size(), 0), count = storage.lengths;
    std::vector<double> old(count[static_cast<std::size_t>(storage.time)]);
    if (!old.empty())
      if (const int status =
              netcdf::Library().nc_get_vara_double(from_, storage.variable, start.data(), count.data(), old.data()))
        return status;
    // Values that have moved to other rows keep all their digits.
    const std::vector<float> meant = storage.Meant(old);
    std::unordered_map<float, double> numberOf;
    for (std::size_t i = 0; i < old.size(); ++i) numberOf.emplace(meant[i], old[i]);
    std::vector<double> stored;
    for (const float value : series_.items[item]) {
      const auto found = numberOf.find(value);
      stored.push_back(found != numberOf.end() ? found->second : storage.Stored(value));
    }
    count[static_cast<std::size_t>(storage.time)] = stored.size();
    if (const int status = netcdf::Library().nc_put_vara_double(to_, made, start.data(), count.data(), stored.data()))
      return status;
    ValueSummary summary;
    summary.AddRange(series_.items[item]);
    return PutStatistics(to_, made, summary);
  }

  /// Of a variable without times, in its own type.
  int CopyValues(int id, int made) {
    constexpr std::array<std::size_t, 13> kSizes{0, 1, 1, 2, 4, 4, 8, 1, 2, 4, 8, 8, sizeof(char*)};
    nc_type type = NC_NAT;
    netcdf::Library().nc_inq_var(from_, id, nullptr, &type, nullptr, nullptr, nullptr);
    std::size_t count = 1;
    for (const int dimension : DimensionsOf(from_, id)) {
      std::size_t length = 0;
      netcdf::Library().nc_inq_dim(from_, dimension, nullptr, &length);
      count *= length;
    }
    if (count == 0) return NC_NOERR;
    // Numbers of eight bytes need their place.
    std::vector<double> values((count * kSizes[static_cast<std::size_t>(type)] + 7) / 8);
    if (const int status = netcdf::Library().nc_get_var(from_, id, values.data())) return status;
    const int status = netcdf::Library().nc_put_var(to_, made, values.data());
    if (type == NC_STRING) netcdf::Library().nc_free_string(count, reinterpret_cast<char**>(values.data()));
    return status;
  }

  int from_, to_;
  const DataFileHeader& header_;
  const RewrittenSeries& series_;
  TimeVariables time_;
  std::vector<int> dimensions_;  ///< Of the new file, by the number in the old one.
};

int FormatFlags(int file) {
  int format = NC_FORMAT_64BIT_OFFSET;
  netcdf::Library().nc_inq_format(file, &format);
  switch (format) {
    case NC_FORMAT_CLASSIC:
      return 0;
    case NC_FORMAT_NETCDF4:
      return NC_NETCDF4;
    case NC_FORMAT_NETCDF4_CLASSIC:
      return NC_NETCDF4 | NC_CLASSIC_MODEL;
    case NC_FORMAT_CDF5:
      return NC_64BIT_DATA;
    default:
      return NC_64BIT_OFFSET;
  }
}

}  // namespace

FileResult RewriteSeries(os::File& from, const std::string& to, const RewrittenSeries& series, ProgressPart progress) {
  const auto refused = [&](const std::string& reason) {
    return FileResult{fmt::format("cannot write {}: {}; nothing was written", to, reason), {}};
  };
  if (series.stamps.empty()) return refused("it would have no steps");
  for (std::size_t i = 1; i < series.stamps.size(); ++i)
    if (series.stamps[i] <= series.stamps[i - 1])
      return refused(fmt::format("step {} is not later than the one before", i + 1));
  // The second one is a copy to read from, and never takes the place of anything.
  FileReplacement replacement, original;
  if (FileResult begun = replacement.Begin(to); !begun.Ok()) return begun;
  if (FileResult begun = original.Begin(to); !begun.Ok()) return begun;
  try {
    if (const std::string reason = CopyInto(from, original.TemporaryPath(), progress); !reason.empty())
      return refused(reason);
  } catch (const Cancelled&) {
    return refused(kCancelled);
  }
  {
    DataFile check;
    if (const std::string error = check.Open(original.TemporaryPath()); !error.empty()) return refused(error);
    const netcdf::Lock lock;
    netcdf::Handle source, made;
    DataFileHeader header;
    if (const int status = OpenNetcdf(original.TemporaryPath(), NC_NOWRITE, source))
      return refused(netcdf::InWords(status));
    if (const std::string reason = ReadHeader(source.Id(), header); !reason.empty()) return refused(reason);
    if (const std::string reason = WhyNoOtherTimesIn(source.Id(), header); !reason.empty()) return refused(reason);
    if (header.items.size() != series.items.size()) return refused("it holds another number of series");
    for (const std::vector<float>& values : series.items)
      if (values.size() != series.stamps.size()) return refused("a series has another length than the times");
    std::size_t buffer = netcdf::kBufferSize;
    int id = -1, old = 0;
    int status = netcdf::Library().nc__create(AbsoluteFromHere(replacement.TemporaryPath()).c_str(),
                                              NC_CLOBBER | FormatFlags(source.Id()), 0, &buffer, &id);
    if (status == NC_NOERR) {
      made = netcdf::Handle(id);
      status = netcdf::Library().nc_set_fill(id, NC_NOFILL, &old);
    }
    if (status == NC_NOERR) status = SeriesRewriter(source.Id(), id, header, series).Rewrite();
    const int closed = made.IsOpen() ? made.Close() : NC_NOERR;
    if (status == NC_NOERR) status = closed;
    if (status != NC_NOERR) return refused(netcdf::InWords(status));
  }
  bool isClassic = false;
  if (const std::string reason = netcdf::WhyClassicFileIsBad(replacement.TemporaryPath(), isClassic); !reason.empty())
    return refused(reason);
  if (progress.IsCancelled()) return refused(kCancelled);
  return replacement.Commit();
}

}  // namespace tervane
