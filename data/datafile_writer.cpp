// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/datafile_writer.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <string_view>
#include <utility>

#include <fmt/format.h>

#include "data/netcdf.h"
#include "platform/files.h"
#include "platform/item_types.h"
#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

namespace {

constexpr const char* kWrittenTimeUnit = "seconds since 1970-01-01 00:00:00";

/// The first failure of a chain of calls; those behind it are not made.
class Calls {
 public:
  template <class Call>
  void operator()(Call call) {
    if (status_ == NC_NOERR) status_ = call();
  }
  int Status() const { return status_; }

 private:
  int status_ = NC_NOERR;
};

/// Defines what stands in a new file. The lock must be held.
class Definition {
 public:
  explicit Definition(int file) : file_(file) {}

  int Dimension(const char* name, std::size_t length) {
    int id = -1;
    call_([&] { return netcdf::Library().nc_def_dim(file_, name, length, &id); });
    return id;
  }
  int Variable(const std::string& name, nc_type type, const std::vector<int>& dimensions) {
    int id = -1;
    call_([&] {
      return netcdf::Library().nc_def_var(file_, name.c_str(), type, static_cast<int>(dimensions.size()),
                                          dimensions.data(), &id);
    });
    return id;
  }
  void Text(int variable, const char* name, std::string_view text) {
    call_([&] { return netcdf::Library().nc_put_att_text(file_, variable, name, text.size(), text.data()); });
  }
  void Int(int variable, const char* name, int value) {
    call_([&] { return netcdf::Library().nc_put_att_int(file_, variable, name, NC_INT, 1, &value); });
  }
  template <class Function>
  void Call(Function function) {
    call_(function);
  }
  int Status() const { return call_.Status(); }

 private:
  int file_;
  Calls call_;
};

/// The name of an item's variable: ASCII letters, digits and underscores, and none that is taken.
std::string VariableName(const std::string& item, std::vector<std::string>& taken) {
  std::string name;
  for (const char c : item) {
    const bool isPlain = (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9');
    if (isPlain) name += c;
    if (!isPlain && !name.empty() && name.back() != '_') name += '_';
  }
  constexpr std::size_t kLongest = 100;
  name.resize(std::min(name.size(), kLongest));
  if (name.ends_with('_')) name.pop_back();
  if (name.empty() || (name.front() >= '0' && name.front() <= '9')) name = "item_" + name;
  const auto isTaken = [&](const std::string& candidate) {
    return std::ranges::any_of(taken, [&](const std::string& other) { return EqualIgnoringCase(other, candidate); });
  };
  std::string free = name;
  for (int number = 2; isTaken(free); ++number) free = fmt::format("{}_{}", name, number);
  taken.push_back(free);
  return free;
}

/// How CF tells a value type.
std::string_view CellMethods(ValueType type) {
  constexpr std::string_view kTexts[] = {"time: point", "time: point (comment: accumulated since the start)",
                                         "time: sum", "time: mean"};
  return kTexts[static_cast<std::size_t>(type)];
}

/// Why a file with this content cannot be made; "" when it can.
std::string WhyImpossible(const NewDataFile& content) {
  const FileGeometry& geometry = content.geometry;
  if (content.dimensions < 0 || content.dimensions > 3) return "a data file has 0 to 3 dimensions";
  if (content.items.empty()) return "a data file needs an item";
  if (content.dimensions == 0 && !content.hasTime) return "a time series needs times";
  for (const NewItem& item : content.items) {
    if (item.name.empty() || FirstInvalidUtf8(item.name)) return "an item needs a name, in UTF-8";
    const ItemType* type = FindItemType(item.itemType);
    if (type == nullptr) return fmt::format("there is no item type {}", item.itemType);
    const Unit* unit = FindUnit(item.unitKey);
    if (unit == nullptr) return fmt::format("there is no unit {}", item.unitKey);
    // A value of undefined meaning may have any unit.
    if (item.itemType != quantity::kUndefined && !AllowsUnit(*type, item.unitKey)) {
      return fmt::format("{} is no unit of {}", unit->text, type->name);
    }
  }
  if (content.dimensions == 0) return {};
  if (geometry.nx < 1 || (content.dimensions > 1 && geometry.ny < 1) || (content.dimensions > 2 && geometry.nz < 1)) {
    return "a grid needs at least one cell in each direction";
  }
  const double cells = static_cast<double>(geometry.nx) * (content.dimensions > 1 ? geometry.ny : 1) *
                       (content.dimensions > 2 ? geometry.nz : 1);
  if (cells > static_cast<double>(kMostCells)) {
    return fmt::format("a grid of {:.0f} cells is too large; at most {} can be written", cells, kMostCells);
  }
  for (const double number : {geometry.x0, geometry.y0, geometry.rotation})
    if (!std::isfinite(number)) return "the corner and the rotation of a grid must be numbers";
  if (!(std::isfinite(geometry.cellSize) && geometry.cellSize > 0)) return "the cell size must be larger than 0";
  if (content.dimensions > 1 && geometry.cellHeight != 0 && geometry.cellHeight != geometry.cellSize) {
    return "the cells must be square";
  }
  return {};
}

}  // namespace

struct DataFileWriter::State {
  std::string path;
  NewDataFile content;
  FileReplacement replacement;
  netcdf::Handle file;
  int time = -1, bounds = -1;
  std::vector<int> variables;
  std::vector<ValueSummary> summaries;
  /// Layers of the present step that were put, for each item.
  std::vector<std::vector<bool>> isPut;
  std::optional<std::size_t> step;
  CYbDateTime stamp;
  /// Of the second step, when the first waits to know how long a step is.
  bool isFirstBoundOpen = false;
  std::string failure;  ///< The first one; nothing is written behind it.

  ~State() { netcdf::CloseLocked(file); }

  std::string Fail(const std::string& reason) {
    failure = fmt::format("cannot write {}: {}; nothing was written", path, reason);
    return failure;
  }
  int Define();
  std::string WhyStepIsIncomplete() const;
  std::string PutPart(int item, std::optional<int> layer, std::span<const float> values, ProgressPart progress = {});
  /// Puts rows of a layer piece by piece, so that nobody waits long for the lock. "" or why not.
  std::string PutRows(int variable, std::size_t layer, std::span<const float> values, ProgressPart progress);
};

/// Makes all dimensions, variables and attributes, and writes the coordinates. The lock must be held.
int DataFileWriter::State::Define() {
  const FileGeometry& geometry = content.geometry;
  const int dimensions = content.dimensions;
  const bool isGrid = dimensions > 1;
  const bool hasCoordinates = dimensions == 1 || geometry.rotation == 0;
  Definition define(file.Id());
  int old = 0;
  define.Call([&] { return netcdf::Library().nc_set_fill(file.Id(), NC_NOFILL, &old); });
  define.Text(NC_GLOBAL, "Conventions", "CF-1.8");

  std::vector<int> shape;
  const int timeDimension = content.hasTime ? define.Dimension("time", NC_UNLIMITED) : -1;
  if (content.hasTime) shape.push_back(timeDimension);
  const int z = dimensions > 2 ? define.Dimension("z", static_cast<std::size_t>(geometry.nz)) : -1;
  const int y = isGrid ? define.Dimension("y", static_cast<std::size_t>(geometry.ny)) : -1;
  const int x = dimensions > 0 ? define.Dimension("x", static_cast<std::size_t>(geometry.nx)) : -1;
  for (const int dimension : {z, y, x})
    if (dimension >= 0) shape.push_back(dimension);

  const bool hasIntervals = std::ranges::any_of(content.items, [](const NewItem& item) {
    return item.valueType == ValueType::StepAccumulated || item.valueType == ValueType::MeanStep;
  });
  if (content.hasTime) {
    time = define.Variable("time", NC_DOUBLE, {timeDimension});
    define.Text(time, "standard_name", "time");
    define.Text(time, "units", kWrittenTimeUnit);
    define.Text(time, "calendar", "proleptic_gregorian");
    define.Text(time, "axis", "T");
    if (hasIntervals) {
      define.Text(time, "bounds", "time_bnds");
      const int pair = define.Dimension("nv", 2);
      bounds = define.Variable("time_bnds", NC_DOUBLE, {timeDimension, pair});
    }
  }

  int zVariable = -1, yVariable = -1, xVariable = -1;
  if (z >= 0) {
    zVariable = define.Variable("z", NC_DOUBLE, {z});
    define.Text(zVariable, "long_name", "layer, counted from the bottom");
    define.Text(zVariable, "units", "1");
    define.Text(zVariable, "axis", "Z");
    define.Text(zVariable, "positive", "up");
  }
  if (hasCoordinates && isGrid) {
    yVariable = define.Variable("y", NC_DOUBLE, {y});
    define.Text(yVariable, "standard_name", geometry.isGeographical ? "latitude" : "projection_y_coordinate");
    define.Text(yVariable, "units", geometry.isGeographical ? "degrees_north" : "m");
    define.Text(yVariable, "axis", "Y");
  }
  if (hasCoordinates && x >= 0) {
    xVariable = define.Variable("x", NC_DOUBLE, {x});
    if (isGrid) {
      define.Text(xVariable, "standard_name", geometry.isGeographical ? "longitude" : "projection_x_coordinate");
    } else {
      define.Text(xVariable, "long_name", "distance along the line");
    }
    define.Text(xVariable, "units", isGrid && geometry.isGeographical ? "degrees_east" : "m");
    define.Text(xVariable, "axis", "X");
  }
  if (isGrid) {
    const int crs = define.Variable("crs", NC_INT, {});
    if (geometry.isGeographical) define.Text(crs, "grid_mapping_name", "latitude_longitude");
    define.Text(crs, "crs_wkt", geometry.projection.empty() ? kLocalPlaneWkt : std::string_view(geometry.projection));
    define.Text(crs, "GeoTransform", GeoTransformText(geometry));
  }

  std::vector<std::string> taken{"x", "y", "z", "time", "crs", "nv", "time_bnds"};
  int number = 0;
  for (const NewItem& item : content.items) {
    const int variable = define.Variable(VariableName(item.name, taken), NC_FLOAT, shape);
    variables.push_back(variable);
    const Unit& unit = *FindUnit(item.unitKey);
    define.Text(variable, "long_name", item.name);
    define.Text(variable, "units", unit.udunits.empty() ? unit.text : unit.udunits);
    define.Int(variable, "item_number", ++number);
    define.Int(variable, "item_type", item.itemType);
    define.Int(variable, "unit_key", item.unitKey);
    define.Int(variable, "value_type", static_cast<int>(item.valueType));
    if (content.hasTime) define.Text(variable, "cell_methods", CellMethods(item.valueType));
    if (isGrid) define.Text(variable, "grid_mapping", "crs");
    define.Call([&] {
      return netcdf::Library().nc_put_att_float(file.Id(), variable, "_FillValue", NC_FLOAT, 1, &kDeleteValue);
    });
    // Their values come at the end; their place is made here, since making it later would move all data.
    constexpr std::array<float, 2> kNoRange{};
    constexpr double kNoCount = 0;
    define.Call([&] {
      return netcdf::Library().nc_put_att_float(file.Id(), variable, "actual_range", NC_FLOAT, 2, kNoRange.data());
    });
    define.Call([&] {
      return netcdf::Library().nc_put_att_double(file.Id(), variable, "value_count", NC_DOUBLE, 1, &kNoCount);
    });
    if (content.isCompressed) {
      constexpr std::size_t kTile = 1024;
      std::vector<std::size_t> chunk;
      if (content.hasTime) chunk.push_back(dimensions == 0 ? kTile : 1);
      if (dimensions > 2) chunk.push_back(1);
      if (isGrid) chunk.push_back(std::min(kTile, static_cast<std::size_t>(geometry.ny)));
      if (dimensions > 0) chunk.push_back(std::min(kTile, static_cast<std::size_t>(geometry.nx)));
      define.Call([&] { return netcdf::Library().nc_def_var_chunking(file.Id(), variable, NC_CHUNKED, chunk.data()); });
      define.Call([&] { return netcdf::Library().nc_def_var_deflate(file.Id(), variable, 1, 1, 4); });
    }
  }
  define.Call([&] { return netcdf::Library().nc_enddef(file.Id()); });

  const auto putCentres = [&](int variable, int count, double first, double distance) {
    if (variable < 0) return;
    std::vector<double> centres(static_cast<std::size_t>(count));
    for (int i = 0; i < count; ++i) centres[static_cast<std::size_t>(i)] = first + distance * i;
    define.Call([&] { return netcdf::Library().nc_put_var_double(file.Id(), variable, centres.data()); });
  };
  putCentres(xVariable, geometry.nx, geometry.x0 + geometry.cellSize / 2, geometry.cellSize);
  putCentres(yVariable, geometry.ny, geometry.y0 + geometry.cellSize / 2, geometry.cellSize);
  putCentres(zVariable, geometry.nz, 1, 1);
  return define.Status();
}

std::string DataFileWriter::State::WhyStepIsIncomplete() const {
  for (std::size_t i = 0; i < isPut.size(); ++i) {
    const auto layer = std::ranges::find(isPut[i], false);
    if (layer == isPut[i].end()) continue;
    return fmt::format("step {} lacks the values of item {}{}", step.value_or(0) + 1, i + 1,
                       isPut[i].size() > 1 ? fmt::format(", layer {}", layer - isPut[i].begin() + 1) : "");
  }
  return {};
}

std::string DataFileWriter::State::PutRows(int variable, std::size_t layer, std::span<const float> values,
                                           ProgressPart progress) {
  constexpr std::size_t kPiece = std::size_t{1} << 16, kTileRows = 1024;
  std::vector<std::size_t> start, count;
  if (content.hasTime) {
    start.push_back(*step);
    count.push_back(1);
  }
  if (content.dimensions > 2) {
    start.push_back(layer);
    count.push_back(1);
  }
  const auto nx = static_cast<std::size_t>(content.geometry.nx), ny = static_cast<std::size_t>(content.geometry.ny);
  const std::size_t y = start.size();
  if (content.dimensions > 1) start.push_back(0), count.push_back(0);
  if (content.dimensions > 0) start.push_back(0), count.push_back(nx);
  const std::size_t atOnce = content.isCompressed ? kTileRows : std::max<std::size_t>(kPiece / nx, 1);
  for (std::size_t row = 0; row < ny; row += atOnce) {
    if (progress.IsCancelled()) return kCancelled;
    progress.Report(static_cast<double>(row) / static_cast<double>(ny));
    if (content.dimensions > 1) {
      start[y] = row;
      count[y] = std::min(atOnce, ny - row);
    }
    const netcdf::Lock lock;
    const int status =
        netcdf::Library().nc_put_vara_float(file.Id(), variable, start.data(), count.data(), values.data() + row * nx);
    if (status != NC_NOERR) return netcdf::InWords(status);
  }
  return {};
}

std::string DataFileWriter::State::PutPart(int item, std::optional<int> layer, std::span<const float> values,
                                           ProgressPart progress) {
  if (!failure.empty()) return failure;
  const auto refused = [&](const std::string& reason) { return Fail(reason); };
  if (item < 1 || static_cast<std::size_t>(item) > content.items.size()) {
    return refused(fmt::format("there is no item {}: the file has {}", item, content.items.size()));
  }
  if (content.hasTime && !step) return refused("no step was begun");
  const FileGeometry& geometry = content.geometry;
  const std::size_t index = static_cast<std::size_t>(item - 1);
  std::vector<bool>& done = isPut[index];
  if (layer && (*layer < 0 || static_cast<std::size_t>(*layer) >= done.size())) {
    return refused(fmt::format("there is no layer {}: the file has {}", *layer + 1, done.size()));
  }
  const std::size_t layerSize = static_cast<std::size_t>(geometry.nx) * static_cast<std::size_t>(geometry.ny);
  const std::size_t expected = layer ? layerSize : layerSize * done.size();
  if (values.size() != expected) {
    return refused(fmt::format("item {} takes {} values, {} were given", item, expected, values.size()));
  }
  const bool isDoubled = layer ? done[static_cast<std::size_t>(*layer)] : std::ranges::find(done, true) != done.end();
  if (isDoubled) return refused(fmt::format("item {} was put twice in step {}", item, step.value_or(0) + 1));

  std::vector<float> finite;
  if (!AreFinite(values)) {
    finite.assign(values.begin(), values.end());
    for (float& value : finite) value = std::isfinite(value) ? value : kDeleteValue;
    values = finite;
  }
  summaries[index].AddRange(values);

  const std::size_t first = layer ? static_cast<std::size_t>(*layer) : 0;
  const std::size_t layers = values.size() / layerSize;
  for (std::size_t i = 0; i < layers; ++i) {
    const auto all = static_cast<double>(layers);
    const std::string reason = PutRows(variables[index], first + i, values.subspan(i * layerSize, layerSize),
                                       progress.Part(static_cast<double>(i) / all, static_cast<double>(i + 1) / all));
    if (!reason.empty()) return refused(reason);
  }
  if (layer) {
    done[static_cast<std::size_t>(*layer)] = true;
  } else {
    done.assign(done.size(), true);
  }
  return {};
}

DataFileWriter::DataFileWriter() : state_(std::make_unique<State>()) {}
DataFileWriter::DataFileWriter(DataFileWriter&& other) noexcept = default;
DataFileWriter& DataFileWriter::operator=(DataFileWriter&& other) noexcept = default;
DataFileWriter::~DataFileWriter() = default;

std::string DataFileWriter::Create(const std::string& path, const NewDataFile& content) {
  auto state = std::make_unique<State>();
  state->path = path;
  state->content = content;
  FileGeometry& geometry = state->content.geometry;
  if (const std::string reason = WhyImpossible(content); !reason.empty()) return state->Fail(reason);
  if (content.dimensions < 3) geometry.nz = 1;
  if (content.dimensions < 2) geometry.ny = 1;
  if (content.dimensions < 1) geometry.nx = 1;
  geometry.cellHeight = geometry.cellSize;
  state->summaries.resize(content.items.size());
  state->isPut.assign(content.items.size(), std::vector<bool>(static_cast<std::size_t>(geometry.nz)));
  if (FileResult begun = state->replacement.Begin(path); !begun.Ok()) return begun.error;
  {
    const netcdf::Lock lock;
    if (!netcdf::WhyNoLibrary().empty()) return netcdf::WhyNoLibrary();
    int id = -1;
    // The library's own buffer is a few kB, and it seeks, reads and writes for each of them.
    std::size_t buffer = netcdf::kBufferSize;
    const int format = content.isCompressed ? NC_NETCDF4 : NC_64BIT_OFFSET;
    int status = netcdf::Library().nc__create(AbsoluteFromHere(state->replacement.TemporaryPath()).c_str(),
                                              NC_CLOBBER | format, 0, &buffer, &id);
    if (status == NC_NOERR) {
      state->file = netcdf::Handle(id);
      status = state->Define();
    }
    if (status != NC_NOERR) return state->Fail(netcdf::InWords(status));
  }
  state_ = std::move(state);
  return {};
}

std::string DataFileWriter::AddStep(const CYbDateTime& stamp) {
  State& state = *state_;
  if (!state.failure.empty()) return state.failure;
  if (!state.file.IsOpen()) return "no file is being written";
  if (!state.content.hasTime) return state.Fail("a file without times has one step");
  if (!stamp.IsValid()) return state.Fail("the stamp of a step is no date");
  if (state.step) {
    if (const std::string reason = state.WhyStepIsIncomplete(); !reason.empty()) return state.Fail(reason);
    if (stamp <= state.stamp) {
      return state.Fail(fmt::format("the step at {} is not later than the one before, at {}",
                                    stamp.Format("%Y-%m-%d %H:%M:%S"), state.stamp.Format("%Y-%m-%d %H:%M:%S")));
    }
  }
  const std::size_t step = state.step ? *state.step + 1 : 0;
  const auto seconds = static_cast<double>(stamp.SecondsSinceEpoch());
  Calls call;
  const netcdf::Lock lock;
  const int file = state.file.Id();
  call([&] { return netcdf::Library().nc_put_var1_double(file, state.time, &step, &seconds); });
  if (state.bounds >= 0) {
    const auto putBounds = [&](std::size_t at, double begin, double end) {
      const std::array<std::size_t, 2> start{at, 0}, count{1, 2};
      const std::array<double, 2> pair{begin, end};
      call([&] {
        return netcdf::Library().nc_put_vara_double(file, state.bounds, start.data(), count.data(), pair.data());
      });
    };
    if (step == 0) {
      const bool hasBegin = state.content.begin && *state.content.begin < stamp;
      state.isFirstBoundOpen = !hasBegin;
      putBounds(0, hasBegin ? static_cast<double>(state.content.begin->SecondsSinceEpoch()) : seconds, seconds);
    } else {
      const auto before = static_cast<double>(state.stamp.SecondsSinceEpoch());
      putBounds(step, before, seconds);
      // The first interval is as long as the second.
      if (state.isFirstBoundOpen) putBounds(0, before - (seconds - before), before);
      state.isFirstBoundOpen = false;
    }
  }
  if (call.Status() != NC_NOERR) return state.Fail(netcdf::InWords(call.Status()));
  state.step = step;
  state.stamp = stamp;
  for (std::vector<bool>& layers : state.isPut) layers.assign(layers.size(), false);
  return {};
}

std::string DataFileWriter::Put(int item, std::span<const float> values, ProgressPart progress) {
  return state_->file.IsOpen() ? state_->PutPart(item, std::nullopt, values, progress) : "no file is being written";
}

std::string DataFileWriter::PutLayer(int item, int layer, std::span<const float> values) {
  return state_->file.IsOpen() ? state_->PutPart(item, layer, values) : "no file is being written";
}

FileResult DataFileWriter::Finish(ProgressPart progress) {
  // What was written goes with the state, whatever happens.
  const std::unique_ptr<State> state = std::exchange(state_, std::make_unique<State>());
  FileResult result;
  result.error = state->failure;
  if (!result.Ok()) return result;
  if (!state->file.IsOpen()) return {"no file is being written", {}};
  if (state->content.hasTime && !state->step) return {state->Fail("no step was begun"), {}};
  if (const std::string reason = state->WhyStepIsIncomplete(); !reason.empty()) return {state->Fail(reason), {}};
  {
    const netcdf::Lock lock;
    Calls call;
    const int file = state->file.Id();
    for (std::size_t i = 0; i < state->variables.size(); ++i) {
      const ValueSummary& summary = state->summaries[i];
      const auto count = static_cast<double>(summary.count);
      std::array<float, 2> range{summary.smallest, summary.largest};
      if (summary.count == 0) range.fill(std::numeric_limits<float>::quiet_NaN());
      call([&] {
        return netcdf::Library().nc_put_att_float(file, state->variables[i], "actual_range", NC_FLOAT, 2, range.data());
      });
      call([&] {
        return netcdf::Library().nc_put_att_double(file, state->variables[i], "value_count", NC_DOUBLE, 1, &count);
      });
    }
    const int closed = state->file.Close();
    call([&] { return closed; });
    if (call.Status() != NC_NOERR) return {state->Fail(netcdf::InWords(call.Status())), {}};
  }
  // Asked of the file itself, in case that a network drive stored less than it said.
  bool isClassic = false;
  if (const std::string reason = netcdf::WhyClassicFileIsBad(state->replacement.TemporaryPath(), isClassic);
      !reason.empty()) {
    return {state->Fail(reason), {}};
  }
  if (progress.IsCancelled()) return {state->Fail(kCancelled), {}};
  return state->replacement.Commit();
}

}  // namespace tervane
