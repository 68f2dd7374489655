// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <cmath>

#include <fmt/format.h>
#include <pybind11/numpy.h>
#include <pybind11/stl.h>

#include "data/datafile_writer.h"
#include "document/setup_lock.h"
#include "platform/key_number.h"
#include "python/bindings.h"

namespace py = pybind11;
using namespace py::literals;

namespace tervane::python {

namespace {

std::shared_ptr<DataFile> OpenFile(const std::string& path) {
  auto file = std::make_shared<DataFile>();
  std::string problem;
  {
    const py::gil_scoped_release others;
    problem = file->Open(path);
  }
  RaiseProblem(problem);
  return file;
}

const DataItem& ItemAt(const DataFile& file, int number) {
  if (number < 1 || number > static_cast<int>(file.Items().size()))
    Raise("KeyNotFound",
          fmt::format("{}: there is no item {}: the file has {}", file.Path(), number, file.Items().size()));
  return file.Items()[static_cast<std::size_t>(number) - 1];
}

/// Codes of soils, zones or the domain: whole numbers that stand for something.
bool HoldsCodes(const DataItem& item) {
  const ItemType* type = FindItemType(item.itemType);
  return type && BaseUnit(*type).key == kWholeNumberUnit;
}

py::dict DictOf(const DataItem& item) {
  const FileGeometry& place = item.geometry;
  return py::dict("name"_a = item.name, "item_type"_a = item.itemType, "unit"_a = item.unitText,
                  "value_type"_a = std::string(ValueTypeText(item.valueType)), "dimensions"_a = item.dimensions,
                  "has_codes"_a = HoldsCodes(item), "has_time"_a = item.hasTime, "nx"_a = place.nx, "ny"_a = place.ny,
                  "nz"_a = place.nz, "x0"_a = place.x0, "y0"_a = place.y0, "cell_size"_a = place.cellSize,
                  "cell_height"_a = place.cellHeight, "rotation"_a = place.rotation, "projection"_a = place.projection,
                  "is_geographical"_a = place.isGeographical);
}

/// What turns the file's values into those that are asked for; nothing where they stay.
std::optional<UnitConversion> ConversionOf(const DataFile& file, const DataItem& item,
                                           const std::optional<std::string>& unit) {
  const ItemType* type = FindItemType(item.itemType);
  std::optional<UnitScale> wanted;
  if (unit) {
    const std::optional<ParsedUnit> parsed = ParseUnit(*unit);
    if (!parsed) Raise("UnitError", fmt::format("{} is no unit that is known", *unit));
    if (!item.scale) Raise("UnitError", fmt::format("{}: the unit of {} is not known", file.Path(), item.name));
    wanted = parsed->scale;
  } else if (type && item.scale && item.itemType != quantity::kUndefined) {
    wanted = BaseUnit(*type).scale;
  }
  if (!wanted) return std::nullopt;
  const auto conversion = ConversionBetween(*item.scale, *wanted);
  if (!conversion)
    Raise("UnitError", fmt::format("{}: {} in {} does not convert to {}", file.Path(), item.name, item.unitText,
                                   unit ? *unit : std::string(BaseUnit(*type).text)));
  // Most files hold what is asked for.
  const bool isSame = SameNumber((*conversion)(0), 0) && SameNumber((*conversion)(1), 1);
  return isSame ? std::nullopt : conversion;
}

/// The values of steps as (time, z, y, x), less the axes that the item does not have; missing ones are no numbers. They
/// are read in pieces that stay close at hand until they are converted.
py::array_t<float> Read(const DataFile& file, int number, std::size_t first, std::size_t steps,
                        std::optional<int> layer, const std::optional<std::string>& unit) {
  const DataItem& item = ItemAt(file, number);
  const std::size_t there = item.hasTime ? file.Time().steps : 1;
  if (first > there || steps > there - first) throw py::index_error("there is no such step");
  if (layer && (*layer < 0 || *layer >= item.geometry.nz)) throw py::index_error("there is no such layer");
  const std::optional<UnitConversion> conversion = ConversionOf(file, item, unit);
  std::vector<py::ssize_t> shape{static_cast<py::ssize_t>(steps)};
  if (item.dimensions == 3 && !layer) shape.push_back(item.geometry.nz);
  if (item.dimensions >= 2) shape.push_back(item.geometry.ny);
  if (item.dimensions >= 1) shape.push_back(item.geometry.nx);
  py::array_t<float> values(shape);
  const std::span<float> all(values.mutable_data(), static_cast<std::size_t>(values.size()));
  std::string problem;
  {
    const py::gil_scoped_release others;
    constexpr std::size_t kPiece = std::size_t{1} << 18;
    const std::size_t cells = layer ? item.CellsOfLayer() : item.Cells();
    const std::size_t atOnce = std::max<std::size_t>(kPiece / std::max<std::size_t>(cells, 1), 1);
    for (std::size_t step = 0; step < steps && problem.empty(); step += atOnce) {
      const std::size_t count = std::min(atOnce, steps - step);
      const std::span<float> piece = all.subspan(step * cells, count * cells);
      problem = file.Read({number, first + step, count, layer}, piece);
      constexpr float missing = std::numeric_limits<float>::quiet_NaN();
      if (!conversion)
        for (float& value : piece) value = value == kDeleteValue ? missing : value;
      else
        for (float& value : piece)
          value = value == kDeleteValue ? missing : static_cast<float>((*conversion)(static_cast<double>(value)));
    }
  }
  RaiseProblem(problem);
  return values;
}

py::array_t<std::int64_t> Stamps(const DataFile& file) {
  const std::vector<std::int64_t>& stamps = file.Time().stamps;
  return py::array_t<std::int64_t>(static_cast<py::ssize_t>(stamps.size()), stamps.data());
}

py::dict StatisticsOfItem(const DataFile& file, int number) {
  ItemAt(file, number);
  ItemStatistics statistics;
  std::string problem;
  {
    const py::gil_scoped_release others;
    problem = file.Statistics(number, statistics);
  }
  RaiseProblem(problem);
  return py::dict("smallest"_a = statistics.smallest, "largest"_a = statistics.largest);
}

/// The values of one item, (time, z, y, x) less the axes that it does not have, one behind the other.
void WriteFile(const std::string& path, const py::array_t<float, py::array::c_style | py::array::forcecast>& values,
               const py::dict& item, const py::array_t<std::int64_t, py::array::c_style | py::array::forcecast>& stamps,
               std::optional<std::int64_t> begin) {
  if (const std::optional<LockHolder> holder = HolderOf(path))
    Raise("SetupError", path + ": " + HolderSentence(*holder));
  NewDataFile content;
  content.dimensions = item["dimensions"].cast<int>();
  FileGeometry& place = content.geometry;
  place.nx = item["nx"].cast<int>();
  place.ny = item["ny"].cast<int>();
  place.nz = item["nz"].cast<int>();
  place.x0 = item["x0"].cast<double>();
  place.y0 = item["y0"].cast<double>();
  place.cellSize = place.cellHeight = item["cell_size"].cast<double>();
  place.rotation = item["rotation"].cast<double>();
  place.projection = item["projection"].cast<std::string>();
  const auto quantityName = item["item_type"].cast<std::string>();
  const ItemType* type = FindItemType(quantityName);
  if (!type) Raise("ValueRefused", fmt::format("there is no quantity {}", quantityName));
  int unitKey = BaseUnit(*type).key;
  if (const auto unit = item["unit"].cast<std::string>(); !unit.empty()) {
    const std::optional<ParsedUnit> parsed = ParseUnit(unit);
    if (!parsed || !parsed->unit || !AllowsUnit(*type, parsed->unit->key))
      Raise("UnitError", fmt::format("{} is no unit of {}", unit, type->name));
    unitKey = parsed->unit->key;
  }
  content.items = {
      {item["name"].cast<std::string>(), type->code, unitKey, static_cast<ValueType>(item["value_type"].cast<int>())}};
  content.hasTime = stamps.size() > 0;
  if (begin) content.begin = CYbDateTime::FromSecondsSinceEpoch(*begin);
  const auto steps = static_cast<std::size_t>(content.hasTime ? stamps.size() : 1);
  const std::size_t cells =
      static_cast<std::size_t>(place.nx) * static_cast<std::size_t>(place.ny) * static_cast<std::size_t>(place.nz);
  if (static_cast<std::size_t>(values.size()) != steps * cells)
    Raise("ValueRefused", fmt::format("{} values were expected, not {}", steps * cells, values.size()));
  const std::span<const float> all(values.data(), steps * cells);
  const std::int64_t* const seconds = stamps.data();
  std::string problem;
  {
    const py::gil_scoped_release others;
    DataFileWriter writer;
    problem = writer.Create(path, content);
    for (std::size_t step = 0; step < steps && problem.empty(); ++step) {
      if (content.hasTime) problem = writer.AddStep(CYbDateTime::FromSecondsSinceEpoch(seconds[step]));
      if (problem.empty()) problem = writer.Put(1, all.subspan(step * cells, cells));
    }
    if (problem.empty()) problem = writer.Finish().error;
  }
  RaiseProblem(problem);
}

}  // namespace

void BindDataFiles(py::module_& module) {
  py::class_<DataFile, std::shared_ptr<DataFile>>(module, "DataFile")
      .def_property_readonly("path", &DataFile::Path)
      .def_property_readonly("notes", &DataFile::Notes)
      .def_property_readonly("steps", [](const DataFile& file) { return file.Time().steps; })
      .def_property_readonly("begin",
                             [](const DataFile& file) -> std::optional<std::int64_t> {
                               if (!file.Time().begin) return std::nullopt;
                               return file.Time().begin->SecondsSinceEpoch();
                             })
      .def("items",
           [](const DataFile& file) {
             py::list items;
             for (const DataItem& item : file.Items()) items.append(DictOf(item));
             return items;
           })
      .def("stamps", &Stamps)
      .def("read", &Read, "item"_a, "first"_a, "steps"_a, "layer"_a, "unit"_a)
      .def("statistics", &StatisticsOfItem, "item"_a);
  module.def("open_data_file", &OpenFile, "path"_a);
  module.def("write_data_file", &WriteFile, "path"_a, "values"_a, "item"_a, "stamps"_a, "begin"_a);
}

}  // namespace tervane::python
