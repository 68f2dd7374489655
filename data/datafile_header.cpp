// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/datafile_header.h"

#include <algorithm>
#include <cmath>
#include <utility>

#include <fmt/format.h>

#include "data/cf_time.h"
#include "data/netcdf.h"
#include "platform/item_types.h"
#include "platform/text.h"

namespace tervane {

namespace {

using netcdf::IntAttribute;
using netcdf::NumbersAttribute;
using netcdf::TextAttribute;

/// Longer axes are refused before memory is asked.
constexpr std::size_t kMostAlongAxis = 10'000'000;
constexpr std::size_t kMostSteps = 50'000'000;
enum class Role { Unknown, X, Y, Z, Time };

struct Variable {
  int id = 0;
  std::string name;
  nc_type type = NC_NAT;
  std::vector<int> dimensions;

  bool IsNumeric() const { return type >= NC_BYTE && type <= NC_UINT64 && type != NC_CHAR; }
};

struct FileDimension {
  std::string name;
  std::size_t length = 0;
  Role role = Role::Unknown;
  const Variable* coordinates = nullptr;  ///< The variable of its name, if any.
};

Role RoleOfName(std::string_view name) {
  struct Names {
    Role role;
    std::string_view names;
  };
  constexpr Names kNames[] = {{Role::X, " x lon longitude easting rlon "},
                              {Role::Y, " y lat latitude northing rlat "},
                              {Role::Z, " z lev level layer depth height altitude "},
                              {Role::Time, " time t "}};
  const std::string wanted = fmt::format(" {} ", LowerCase(name));
  for (const Names& names : kNames)
    if (names.names.find(wanted) != std::string_view::npos) return names.role;
  return Role::Unknown;
}

/// True for "degrees_north" and its other spellings; the direction is "north" or "N".
bool IsDegrees(std::string_view units, std::string_view direction) {
  if (!units.starts_with("degree") || !units.ends_with(direction)) return false;
  const std::string_view between = units.substr(6, units.size() - 6 - direction.size());
  return between.empty() || between == "s" || between == "_" || between == "s_";
}

/// Reads the header of a file into items, times and notes.
class HeaderReader {
 public:
  HeaderReader(int file, DataFileHeader& header)
      : file_(file), items_(header.items), storages_(header.storages), time_(header.time), notes_(header.notes) {}

  /// Why the file cannot be used; "" when it can.
  std::string Read() {
    if (std::string error = ReadInventory(); !error.empty()) return error;
    for (const Variable& variable : variables_) {
      if (IsAuxiliary(variable)) continue;
      if (std::string error = ReadItem(variable); !error.empty()) return error;
    }
    if (items_.empty()) return "it holds no item: no variable has values over time, a line or a grid";
    SortByNumber();
    return ReadTimes();
  }

 private:
  std::string ReadInventory() {
    int dimensionCount = 0, variableCount = 0, groupCount = 0;
    if (const int status = netcdf::Library().nc_inq(file_, &dimensionCount, &variableCount, nullptr, nullptr)) {
      return netcdf::InWords(status);
    }
    if (netcdf::Library().nc_inq_grps(file_, &groupCount, nullptr) == NC_NOERR && groupCount > 0) {
      notes_.push_back("its groups of variables are not read: only what stands outside groups");
    }
    std::vector<int> ids(static_cast<std::size_t>(dimensionCount));
    if (const int status = netcdf::Library().nc_inq_dimids(file_, &dimensionCount, ids.data(), 0))
      return netcdf::InWords(status);
    char name[NC_MAX_NAME + 1] = {};
    for (const int id : ids) {
      FileDimension dimension;
      if (const int status = netcdf::Library().nc_inq_dim(file_, id, name, &dimension.length))
        return netcdf::InWords(status);
      dimension.name = name;
      dimensions_.emplace_back(id, dimension);
    }
    variables_.reserve(static_cast<std::size_t>(variableCount));
    for (int id = 0; id < variableCount; ++id) {
      Variable variable;
      variable.id = id;
      int count = 0;
      if (const int status = netcdf::Library().nc_inq_varndims(file_, id, &count)) return netcdf::InWords(status);
      variable.dimensions.resize(static_cast<std::size_t>(count));
      if (const int status = netcdf::Library().nc_inq_var(file_, id, name, &variable.type, nullptr,
                                                          variable.dimensions.data(), nullptr)) {
        return netcdf::InWords(status);
      }
      variable.name = name;
      variables_.push_back(std::move(variable));
    }
    for (auto& [id, dimension] : dimensions_) {
      for (const Variable& variable : variables_) {
        if (variable.name == dimension.name && variable.dimensions == std::vector{id})
          dimension.coordinates = &variable;
      }
      dimension.role = RoleOf(dimension);
    }
    for (const Variable& variable : variables_) {
      // Latitudes and longitudes of each cell, borders of cells and the like belong to items, and are none.
      for (const char* attribute : {"bounds", "coordinates", "grid_mapping", "climatology", "ancillary_variables"}) {
        std::string names = TextAttribute(file_, variable.id, attribute);
        std::ranges::replace(names, ':', ' ');
        for (std::string_view rest = Trimmed(names); !rest.empty(); rest = Trimmed(rest)) {
          const std::string_view word = rest.substr(0, rest.find(' '));
          auxiliary_.emplace_back(word);
          rest.remove_prefix(word.size());
        }
      }
    }
    return {};
  }

  Role RoleOf(const FileDimension& dimension) const {
    if (dimension.coordinates == nullptr) return RoleOfName(dimension.name);
    const int id = dimension.coordinates->id;
    const std::string units = TextAttribute(file_, id, "units");
    const std::string standardName = TextAttribute(file_, id, "standard_name");
    const std::string axis = TextAttribute(file_, id, "axis");
    if (axis == "T" || standardName == "time" || AreTimeUnits(units)) return Role::Time;
    if (axis == "X" || standardName == "projection_x_coordinate" || standardName == "longitude" ||
        standardName == "grid_longitude" || IsDegrees(units, "east") || IsDegrees(units, "E")) {
      return Role::X;
    }
    if (axis == "Y" || standardName == "projection_y_coordinate" || standardName == "latitude" ||
        standardName == "grid_latitude" || IsDegrees(units, "north") || IsDegrees(units, "N")) {
      return Role::Y;
    }
    if (axis == "Z" || !TextAttribute(file_, id, "positive").empty()) return Role::Z;
    return RoleOfName(dimension.name);
  }

  const FileDimension& DimensionOf(int id) const {
    return std::ranges::find(dimensions_, id, &std::pair<int, FileDimension>::first)->second;
  }

  bool IsAuxiliary(const Variable& variable) const {
    if (variable.dimensions.empty() || !variable.IsNumeric()) return true;
    const bool isCoordinate =
        std::ranges::any_of(dimensions_, [&](const auto& entry) { return entry.second.coordinates == &variable; });
    return isCoordinate || std::ranges::find(auxiliary_, variable.name) != auxiliary_.end();
  }

  /// Finds out which dimension is which. "" or why the variable is no item.
  std::string FindDimensions(const Variable& variable, ItemStorage& storage) const {
    std::vector<int> spatial;
    bool hasX = false, hasY = false;
    for (std::size_t i = 0; i < variable.dimensions.size(); ++i) {
      const FileDimension& dimension = DimensionOf(variable.dimensions[i]);
      storage.lengths.push_back(dimension.length);
      if (dimension.role == Role::Time) {
        if (storage.time >= 0) return "it has two dimensions of time";
        storage.time = static_cast<int>(i);
        continue;
      }
      if (dimension.role == Role::Unknown && dimension.length == 1) continue;
      spatial.push_back(static_cast<int>(i));
      hasX = hasX || dimension.role == Role::X;
      hasY = hasY || dimension.role == Role::Y;
    }
    if (spatial.size() > 3) {
      // A height or a member that is the only one tells nothing apart.
      std::erase_if(spatial, [&](int i) {
        const Role role = DimensionOf(variable.dimensions[static_cast<std::size_t>(i)]).role;
        return storage.lengths[static_cast<std::size_t>(i)] == 1 && role != Role::X && role != Role::Y;
      });
      if (spatial.size() > 3) return "it has more than three dimensions beside time";
    }
    if (hasX && hasY) {
      for (const int i : spatial) {
        const Role role = DimensionOf(variable.dimensions[static_cast<std::size_t>(i)]).role;
        int& place = role == Role::X ? storage.x : role == Role::Y ? storage.y : storage.z;
        if (place >= 0) return "two of its dimensions are of the same direction";
        place = i;
      }
      return {};
    }
    // Without names that tell, the order does: layers, rows, columns.
    int* const places[] = {&storage.x, &storage.y, &storage.z};
    for (std::size_t i = 0; i < spatial.size(); ++i) *places[i] = spatial[spatial.size() - 1 - i];
    return {};
  }

  std::string ReadItem(const Variable& variable) {
    ItemStorage storage;
    storage.variable = variable.id;
    storage.type = variable.type;
    int layout = NC_CONTIGUOUS;
    storage.chunk.resize(variable.dimensions.size());
    if (netcdf::Library().nc_inq_var_chunking(file_, variable.id, &layout, storage.chunk.data()) != NC_NOERR ||
        layout != NC_CHUNKED)
      storage.chunk.clear();
    if (const std::string reason = FindDimensions(variable, storage); !reason.empty()) {
      notes_.push_back(fmt::format("the variable {} is left out: {}", variable.name, reason));
      return {};
    }
    if (storage.time >= 0) {
      const int id = variable.dimensions[static_cast<std::size_t>(storage.time)];
      if (!timeDimension_) timeDimension_ = id;
      if (*timeDimension_ != id) {
        notes_.push_back(fmt::format("the variable {} is left out: it has another time axis than {}", variable.name,
                                     items_.empty() ? "others" : items_.front().name));
        return {};
      }
    }
    DataItem item;
    item.hasTime = storage.time >= 0;
    item.dimensions = (storage.x >= 0) + (storage.y >= 0) + (storage.z >= 0);
    const auto lengthAt = [&](int place) {
      return place < 0 ? std::size_t{1} : storage.lengths[static_cast<std::size_t>(place)];
    };
    for (const int place : {storage.x, storage.y, storage.z}) {
      const std::size_t length = lengthAt(place);
      if (length == 0) {
        notes_.push_back(fmt::format("the variable {} is left out: it has no cells", variable.name));
        return {};
      }
      if (length > kMostAlongAxis) {
        return fmt::format("the variable {} has {} cells in one direction; at most {} can be read", variable.name,
                           length, kMostAlongAxis);
      }
    }
    // Three factors of at most 1e7 cannot overflow a double, and the limit is far below its exact whole numbers.
    const double cells = static_cast<double>(lengthAt(storage.x)) * static_cast<double>(lengthAt(storage.y)) *
                         static_cast<double>(lengthAt(storage.z));
    if (cells > static_cast<double>(kMostCells)) {
      return fmt::format("the variable {} has {:.0f} cells; at most {} can be read; cut the grid into parts",
                         variable.name, cells, kMostCells);
    }
    item.geometry.nx = static_cast<int>(lengthAt(storage.x));
    item.geometry.ny = static_cast<int>(lengthAt(storage.y));
    item.geometry.nz = static_cast<int>(lengthAt(storage.z));
    ReadMeaning(variable, item);
    ReadStorage(variable, storage);
    ReadPlace(variable, item, storage);
    items_.push_back(std::move(item));
    storages_.push_back(std::move(storage));
    numbers_.push_back(IntAttribute(file_, variable.id, "item_number").value_or(0));
    return {};
  }

  /// Name, item type, unit and value type.
  void ReadMeaning(const Variable& variable, DataItem& item) {
    const int id = variable.id;
    item.name = TextAttribute(file_, id, "long_name");
    if (item.name.empty() || FirstInvalidUtf8(item.name)) item.name = variable.name;
    item.itemType = IntAttribute(file_, id, "item_type").value_or(quantity::kUndefined);
    if (FindItemType(item.itemType) == nullptr) {
      notes_.push_back(fmt::format("the item {} has the item type {}, which is unknown: it is read as undefined",
                                   item.name, item.itemType));
      item.itemType = quantity::kUndefined;
    }
    if (std::string note = SetUnit(item, TextAttribute(file_, id, "units"), IntAttribute(file_, id, "unit_key"));
        !note.empty()) {
      notes_.push_back(std::move(note));
    }
    const std::optional<int> type = IntAttribute(file_, id, "value_type");
    if (type && *type >= 0 && *type <= 3) {
      item.valueType = static_cast<ValueType>(*type);
    } else {
      const std::string methods = TextAttribute(file_, id, "cell_methods");
      if (methods.find("time: mean") != std::string::npos) item.valueType = ValueType::MeanStep;
      if (methods.find("time: sum") != std::string::npos) item.valueType = ValueType::StepAccumulated;
    }
  }

  void ReadStorage(const Variable& variable, ItemStorage& storage) const {
    const int id = variable.id;
    const auto number = [&](const char* name, double otherwise) {
      const std::vector<double> numbers = NumbersAttribute(file_, id, name);
      return numbers.size() == 1 && std::isfinite(numbers[0]) ? numbers[0] : otherwise;
    };
    storage.scale = number("scale_factor", 1);
    storage.offset = number("add_offset", 0);
    const bool isSmallSigned = variable.type == NC_BYTE || variable.type == NC_SHORT || variable.type == NC_INT;
    storage.isUnsigned = isSmallSigned && EqualIgnoringCase(TextAttribute(file_, id, "_Unsigned"), "true");
    storage.missing = NumbersAttribute(file_, id, "_FillValue");
    if (storage.missing.empty() && variable.type != NC_BYTE && variable.type != NC_UBYTE) {
      // What the library puts where nothing was written.
      constexpr double kFills[] = {0,
                                   0,
                                   0,
                                   NC_FILL_SHORT,
                                   NC_FILL_INT,
                                   static_cast<double>(NC_FILL_FLOAT),
                                   NC_FILL_DOUBLE,
                                   0,
                                   NC_FILL_USHORT,
                                   NC_FILL_UINT,
                                   static_cast<double>(NC_FILL_INT64),
                                   static_cast<double>(NC_FILL_UINT64)};
      storage.missing.push_back(kFills[variable.type]);
      storage.isFillAssumed = true;
    }
    for (const double value : NumbersAttribute(file_, id, "missing_value")) storage.missing.push_back(value);
    std::vector<double> range = NumbersAttribute(file_, id, "valid_range");
    if (range.size() != 2) range = {number("valid_min", storage.validFrom), number("valid_max", storage.validTo)};
    storage.validFrom = range[0];
    storage.validTo = range[1];
    storage.range = NumbersAttribute(file_, id, "actual_range");
    if (storage.range.size() != 2) storage.range.clear();
    const std::vector<double> count = NumbersAttribute(file_, id, "value_count");
    if (count.size() == 1 && count[0] >= 0 && count[0] < 1e18) storage.count = static_cast<std::uint64_t>(count[0]);
  }

  /// The values along one of the variable's dimensions.
  EvenAxis ReadAxis(const Variable& variable, int place, const std::string& item, bool& isGeographical) {
    const FileDimension& dimension = DimensionOf(variable.dimensions[static_cast<std::size_t>(place)]);
    EvenAxis axis;
    isGeographical = false;
    if (dimension.coordinates == nullptr) {
      axis.error = "it has no coordinates";
      return axis;
    }
    const Variable& coordinates = *dimension.coordinates;
    if (!coordinates.IsNumeric()) {
      axis.error = "its coordinates are no numbers";
      return axis;
    }
    std::vector<double> values(dimension.length);
    if (const int status = netcdf::Library().nc_get_var_double(file_, coordinates.id, values.data())) {
      axis.error = netcdf::InWords(status);
      return axis;
    }
    axis = FindSpacing(values, coordinates.type == NC_FLOAT);
    const std::string units = TextAttribute(file_, coordinates.id, "units");
    for (const char* direction : {"east", "north", "E", "N"})
      isGeographical = isGeographical || IsDegrees(units, direction);
    if (isGeographical || units.empty() || units == "m" || !axis.error.empty()) return axis;
    const std::optional<ParsedUnit> unit = ParseUnit(units);
    if (!unit || unit->scale.dimension != Dimension::Length) {
      axis.error = fmt::format("it is in \"{}\", which is no length", units);
      return axis;
    }
    const double factor = unit->scale.numerator / unit->scale.denominator;
    for (double* number : {&axis.first, &axis.last, &axis.spacing}) *number *= factor;
    if (factor != 1) notes_.push_back(fmt::format("the coordinates of {} are converted from {} to m", item, units));
    return axis;
  }

  /// Sets the place of the cells by coordinates, or by the transform of the grid mapping.
  void ReadPlace(const Variable& variable, DataItem& item, ItemStorage& storage) {
    if (item.dimensions == 0) return;
    FileGeometry& geometry = item.geometry;
    std::string mappingName = TextAttribute(file_, variable.id, "grid_mapping");
    mappingName = mappingName.substr(0, mappingName.find(':'));
    std::optional<GeoTransform> transform;
    int mapping = -1;
    if (!mappingName.empty() && netcdf::Library().nc_inq_varid(file_, mappingName.c_str(), &mapping) == NC_NOERR) {
      std::string wkt = TextAttribute(file_, mapping, "crs_wkt");
      if (wkt.empty()) wkt = TextAttribute(file_, mapping, "spatial_ref");
      if (!IsLocalPlane(wkt)) geometry.projection = wkt;
      geometry.isGeographical = IsGeographicalWkt(wkt);
      transform = ParseGeoTransform(TextAttribute(file_, mapping, "GeoTransform"));
      if (wkt.empty() && TextAttribute(file_, mapping, "grid_mapping_name") != "latitude_longitude") {
        notes_.push_back(
            fmt::format("the projection of {} is told by parameters alone, which are not read", item.name));
      }
    }
    ReadVertical(variable, storage);

    FileGeometry byTransform = geometry;
    bool isNorthFirst = false;
    const bool hasTransform = transform && PlaceByGeoTransform(*transform, byTransform, isNorthFirst);
    bool isXGeographical = false, isYGeographical = false;
    EvenAxis x = ReadAxis(variable, storage.x, item.name, isXGeographical);
    EvenAxis y;
    if (storage.y >= 0) y = ReadAxis(variable, storage.y, item.name, isYGeographical);
    const bool hasCoordinates = x.error.empty() && y.error.empty();
    if (!hasCoordinates) {
      if (hasTransform) {
        geometry = byTransform;
        storage.isYTurned = isNorthFirst;
      } else {
        notes_.push_back(fmt::format("the place of {} is unknown: {}: {}", item.name, x.error.empty() ? "y" : "x",
                                     x.error.empty() ? y.error : x.error));
      }
      return;
    }
    geometry.isGeographical = geometry.isGeographical || (isXGeographical && isYGeographical);
    storage.isXTurned = x.spacing < 0;
    storage.isYTurned = y.spacing < 0;
    // One row or column does not tell its height or width.
    if (x.spacing == 0) x.spacing = hasTransform ? byTransform.cellSize : y.spacing;
    if (y.spacing == 0) y.spacing = hasTransform ? byTransform.cellHeight : x.spacing;
    geometry.cellSize = std::abs(x.spacing);
    geometry.cellHeight = std::abs(y.spacing);
    geometry.x0 = std::min(x.first, x.last) - geometry.cellSize / 2;
    geometry.y0 = storage.y < 0 ? 0 : std::min(y.first, y.last) - geometry.cellHeight / 2;
    // The transform holds the numbers as they were given, where both tell the same.
    const double tolerance = 1e-3 * geometry.cellSize;
    if (hasTransform && byTransform.rotation == 0 && std::abs(byTransform.x0 - geometry.x0) <= tolerance &&
        std::abs(byTransform.y0 - geometry.y0) <= tolerance &&
        std::abs(byTransform.cellSize - geometry.cellSize) * geometry.nx <= tolerance) {
      byTransform.isGeographical = geometry.isGeographical;
      geometry = byTransform;
    }
    if (!geometry.IsPlaced()) {
      notes_.push_back(fmt::format("the place of {} is unknown: the size of its cells is not told", item.name));
    }
  }

  /// Finds out whether layer 0 is the top.
  void ReadVertical(const Variable& variable, ItemStorage& storage) const {
    if (storage.z < 0) return;
    const FileDimension& dimension = DimensionOf(variable.dimensions[static_cast<std::size_t>(storage.z)]);
    if (dimension.coordinates == nullptr || !dimension.coordinates->IsNumeric()) return;
    const std::string positive = LowerCase(TextAttribute(file_, dimension.coordinates->id, "positive"));
    if (positive != "up" && positive != "down") return;
    std::vector<double> values(dimension.length);
    if (netcdf::Library().nc_get_var_double(file_, dimension.coordinates->id, values.data()) != NC_NOERR) return;
    const bool isAscending = values.back() >= values.front();
    storage.isZTurned = isAscending == (positive == "down");
  }

  /// Items that are numbered 1 to n stand in that order, others in the file's.
  void SortByNumber() {
    std::vector<std::size_t> order(items_.size(), items_.size());
    for (std::size_t i = 0; i < numbers_.size(); ++i) {
      const auto number = static_cast<std::size_t>(std::max(numbers_[i], 0));
      if (number < 1 || number > order.size() || order[number - 1] != items_.size()) return;
      order[number - 1] = i;
    }
    std::vector<DataItem> items;
    std::vector<ItemStorage> storages;
    for (const std::size_t i : order) {
      items.push_back(std::move(items_[i]));
      storages.push_back(std::move(storages_[i]));
    }
    items_ = std::move(items);
    storages_ = std::move(storages);
  }

  std::string ReadTimes() {
    if (!timeDimension_) return {};
    const FileDimension& dimension = DimensionOf(*timeDimension_);
    time_.steps = dimension.length;
    if (time_.steps > kMostSteps) {
      return fmt::format("it tells of {} time steps; at most {} can be read", time_.steps, kMostSteps);
    }
    if (time_.steps == 0) notes_.push_back("it has no time steps");
    if (dimension.coordinates == nullptr) {
      notes_.push_back(fmt::format("the dimension {} has no variable that tells the times", dimension.name));
      return {};
    }
    const Variable& variable = *dimension.coordinates;
    if (!variable.IsNumeric()) return fmt::format("the times in {} are no numbers", variable.name);
    const std::string unitText = TextAttribute(file_, variable.id, "units");
    const CfTimeUnits units = ParseCfTimeUnits(unitText, TextAttribute(file_, variable.id, "calendar"));
    if (!units.error.empty()) return units.error;
    time_.hasDates = true;
    if (time_.steps == 0) return {};
    std::vector<double> values(time_.steps);
    if (const int status = netcdf::Library().nc_get_var_double(file_, variable.id, values.data()))
      return netcdf::InWords(status);
    if (std::string error = ReadBounds(variable, units, values); !error.empty()) return error;
    const std::vector<double> fill = NumbersAttribute(file_, variable.id, "_FillValue");
    time_.stamps.reserve(values.size());
    for (std::size_t i = 0; i < values.size(); ++i) {
      const bool isMissing = !fill.empty() && values[i] == fill[0];
      const std::optional<std::int64_t> stamp = isMissing ? std::nullopt : units.SecondsSinceEpoch(values[i]);
      if (!stamp) {
        return fmt::format("the time of step {} is {}, which is no date of the years 1 to 9999", i + 1,
                           isMissing ? "missing" : fmt::format("{} {}", ShortestNumber(values[i]), unitText));
      }
      if (!time_.stamps.empty() && *stamp <= time_.stamps.back()) {
        return fmt::format("the time of step {}, {}, is not later than that of step {}, {}; sort the steps by time",
                           i + 1, CYbDateTime::FromSecondsSinceEpoch(*stamp).Format("%Y-%m-%d %H:%M:%S"), i,
                           time_.Stamp(i - 1).Format("%Y-%m-%d %H:%M:%S"));
      }
      time_.stamps.push_back(*stamp);
    }
    if (time_.steps < 2) return {};
    const std::int64_t step = time_.stamps[1] - time_.stamps[0];
    bool isEquidistant = true;
    for (std::size_t i = 2; i < time_.stamps.size() && isEquidistant; ++i)
      isEquidistant = time_.stamps[i] - time_.stamps[i - 1] == step;
    if (isEquidistant) time_.stepSeconds = step;
    return {};
  }

  /// Takes the begin of the first interval and, where no value is an instantaneous one, the ends of intervals as
  /// stamps.
  std::string ReadBounds(const Variable& time, const CfTimeUnits& units, std::vector<double>& values) {
    const std::string name = TextAttribute(file_, time.id, "bounds");
    const auto bounds = std::ranges::find(variables_, name, &Variable::name);
    if (bounds == variables_.end() || !bounds->IsNumeric() || bounds->dimensions.size() != 2) return {};
    if (bounds->dimensions[0] != *timeDimension_ || DimensionOf(bounds->dimensions[1]).length != 2) return {};
    std::vector<double> pairs(2 * values.size());
    if (const int status = netcdf::Library().nc_get_var_double(file_, bounds->id, pairs.data()))
      return netcdf::InWords(status);
    if (const std::optional<std::int64_t> begin = units.SecondsSinceEpoch(std::min(pairs[0], pairs[1]))) {
      time_.begin = CYbDateTime::FromSecondsSinceEpoch(*begin);
    }
    const bool areIntervals = std::ranges::none_of(
        items_, [](const DataItem& item) { return item.hasTime && item.valueType == ValueType::Instantaneous; });
    if (!areIntervals) return {};
    bool areMoved = false;
    for (std::size_t i = 0; i < values.size(); ++i) {
      const double end = std::max(pairs[2 * i], pairs[2 * i + 1]);
      if (!std::isfinite(end)) return fmt::format("the interval of step {} is missing in {}", i + 1, name);
      areMoved = areMoved || units.SecondsSinceEpoch(values[i]) != units.SecondsSinceEpoch(end);
      values[i] = end;
    }
    if (areMoved) notes_.push_back("its stamps do not stand at the ends of their intervals: the ends are taken");
    return {};
  }

  int file_;
  std::vector<DataItem>& items_;
  std::vector<ItemStorage>& storages_;
  TimeAxis& time_;
  std::vector<std::string>& notes_;
  std::vector<std::pair<int, FileDimension>> dimensions_;
  std::vector<Variable> variables_;
  std::vector<std::string> auxiliary_;
  std::vector<int> numbers_;
  std::optional<int> timeDimension_;
};

}  // namespace

std::string SetUnit(DataItem& item, std::string unitText, std::optional<int> unitKey) {
  item.unitText = std::move(unitText);
  const Unit* unit = FindUnit(unitKey.value_or(-1));
  // Another program may have converted the values and changed the text alone: the text counts.
  const bool isSame = unit != nullptr && (item.unitText == unit->udunits || item.unitText == unit->text);
  if (isSame || item.unitText.empty()) {
    if (unit == nullptr) unit = FindUnit(kDimensionlessUnit);
    item.unitKey = unit->key;
    item.scale = unit->scale;
    item.unitText = unit->text;
  } else if (const std::optional<ParsedUnit> parsed = ParseUnit(item.unitText)) {
    item.scale = parsed->scale;
    if (parsed->unit != nullptr) item.unitKey = parsed->unit->key;
  }
  if (item.itemType == quantity::kUndefined) return {};
  const ItemType& type = *FindItemType(item.itemType);
  if (item.scale && item.scale->dimension == BaseUnit(type).scale.dimension) return {};
  return fmt::format("the item {} has the unit \"{}\", which is none of {}", item.name, item.unitText, type.name);
}

std::string ReadHeader(int file, DataFileHeader& header) { return HeaderReader(file, header).Read(); }

}  // namespace tervane
