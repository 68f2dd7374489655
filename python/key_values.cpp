// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "python/key_values.h"

#include <charconv>
#include <typeindex>
#include <unordered_map>

#include <datetime.h>

#include "access/key_units.h"
#include "platform/text.h"

namespace py = pybind11;

namespace tervane::python {

namespace {

/// What the numbers or texts of a key are together.
enum class Form : std::uint8_t { Single, List, Date, Day };

struct KeyOfClass {
  std::type_index type;
  std::string_view key;
  bool operator==(const KeyOfClass&) const = default;
};
struct HashOfKey {
  std::size_t operator()(const KeyOfClass& key) const {
    return key.type.hash_code() * 31 + std::hash<std::string_view>()(key.key);
  }
};

/// Known once for all nodes of a class.
Form FormOf(OpenSetup& setup, CYbSEKvfBase& node, std::string_view key) {
  static auto& names = *new std::deque<std::string>;
  static auto& known = *new std::unordered_map<KeyOfClass, Form, HashOfKey>;
  const auto found = known.find({typeid(node), key});
  if (found != known.end()) return found->second;
  const std::optional<KeyInfo> info = setup.Keys().InfoOf(node, key);
  const std::string type = info ? info->type : std::string();
  const Form form = type == "date"                           ? Form::Date
                    : type == "day"                          ? Form::Day
                    : type.find("list") != std::string::npos ? Form::List
                                                             : Form::Single;
  known.emplace(KeyOfClass{typeid(node), names.emplace_back(key)}, form);
  return form;
}

/// The double that is written as the float is: 0.03, not 0.029999999329447746.
double AsWritten(float value) {
  char text[32];
  const auto [end, error] = std::to_chars(text, text + sizeof text, value);
  double number = static_cast<double>(value);
  if (error == std::errc()) std::from_chars(text, end, number);
  return number;
}

void ImportDates() {
  if (!PyDateTimeAPI) PyDateTime_IMPORT;
}

/// Numbers that name no date stay numbers.
py::object DateOf(const KvfNode& keyword, Form form) {
  ImportDates();
  int n[5] = {};
  for (std::uint32_t i = 0; i < std::min(keyword.count, 5U); ++i) n[i] = keyword.params[i].asInt;
  if (!CYbDateTime(n[0], n[1], n[2], n[3], n[4]).IsValid()) {
    py::list numbers;
    for (std::uint32_t i = 0; i < keyword.count; ++i) numbers.append(keyword.params[i].asInt);
    return numbers;
  }
  return py::reinterpret_steal<py::object>(form == Form::Date
                                               ? PyDateTime_FromDateAndTime(n[0], n[1], n[2], n[3], n[4], 0, 0)
                                               : PyDate_FromDate(n[0], n[1], n[2]));
}

py::object ParamToPython(const KvfParam& param) {
  if (param.type == KvfType::Float) return py::float_(AsWritten(param.asFloat));
  return ToPython(PlainValueOf(param));
}

KeyUnits UnitsOf(OpenSetup& setup, CYbSEKvfBase& node, const PathStep& key, const std::string& unit) {
  std::string problem;
  const std::optional<KeyInfo> info = setup.Keys().InfoOf(node, Trimmed(key.name));
  const std::optional<KeyUnits> units = UnitsBetween(info ? info->facts : KeyFacts(), unit, problem);
  if (!units) Raise("UnitError", PathOf(node) + ":" + key.name + ": " + problem);
  return *units;
}

double NumberOf(const py::handle& value) {
  const double number = PyFloat_AsDouble(value.ptr());
  if (PyErr_Occurred()) throw py::error_already_set();
  return number;
}

PlainValue PlainValueFrom(const py::handle& value) {
  if (PyBool_Check(value.ptr())) return value.ptr() == Py_True;
  if (PyUnicode_Check(value.ptr())) return value.cast<std::string>();
  if (PyFloat_Check(value.ptr())) return NumberOf(value);
  if (PyIndex_Check(value.ptr())) {
    const auto whole = py::reinterpret_steal<py::object>(PyNumber_Index(value.ptr()));
    const long long number = whole ? PyLong_AsLongLong(whole.ptr()) : -1;
    if (PyErr_Occurred()) throw py::error_already_set();
    return std::int64_t{number};
  }
  if (py::hasattr(value, "__fspath__")) return value.attr("__fspath__")().cast<std::string>();
  return NumberOf(value);
}

}  // namespace

py::object ToPython(const PlainValue& value) {
  if (const auto* text = std::get_if<std::string>(&value)) return py::str(*text);
  if (const auto* truth = std::get_if<bool>(&value)) return py::bool_(*truth);
  if (const auto* whole = std::get_if<std::int64_t>(&value)) return py::int_(*whole);
  return py::float_(std::get<double>(value));
}

py::object ValueOf(OpenSetup& setup, CYbSEKvfBase& node, const PathStep& key, const std::optional<std::string>& unit) {
  std::string problem;
  const KvfNode* keyword = setup.Keys().Find(node, key, problem);
  if (!keyword) Raise("KeyNotFound", problem);
  const bool isReal =
      keyword->count == 1 && (keyword->params[0].type == KvfType::Float || keyword->params[0].type == KvfType::Double);
  const bool isFile = keyword->count > 0 && keyword->params[0].type == KvfType::Filename;
  if (unit) {
    const KeyUnits units = UnitsOf(setup, node, key, *unit);
    if (!isReal) Raise("UnitError", PathOf(node) + ":" + key.name + ": it holds no number with a unit");
    const KvfParam& param = keyword->params[0];
    return py::float_(units.toOther(param.type == KvfType::Float ? AsWritten(param.asFloat) : param.asDouble));
  }
  // Numbers behind the name of a file are made when it is saved.
  if (isReal || isFile) return ParamToPython(keyword->params[0]);
  const Form form = FormOf(setup, node, keyword->Name());
  if (form == Form::Date || form == Form::Day) return DateOf(*keyword, form);
  if (form == Form::Single && keyword->count == 1) return ParamToPython(keyword->params[0]);
  py::list values;
  for (std::uint32_t i = 0; i < keyword->count; ++i) values.append(ParamToPython(keyword->params[i]));
  return values;
}

std::vector<PlainValue> PlainValuesOf(const py::object& values) {
  std::vector<PlainValue> plain;
  for (const py::handle value : values) plain.push_back(PlainValueFrom(value));
  return plain;
}

void SetValue(OpenSetup& setup, CYbSEKvfBase& node, const PathStep& key, const py::object& value,
              const std::optional<std::string>& unit) {
  ImportDates();
  std::string problem;
  const KvfNode* keyword = setup.Keys().Find(node, key, problem);
  if (!keyword) Raise("KeyNotFound", problem);
  std::vector<PlainValue> values;
  if (unit) {
    values = {UnitsOf(setup, node, key, *unit).fromOther(NumberOf(value))};
  } else if (PyUnicode_Check(value.ptr())) {
    problem = setup.Keys().Set(node, key, std::string_view(value.cast<std::string>()));
    if (!problem.empty()) Raise("ValueRefused", problem);
    return;
  } else if (PyDate_Check(value.ptr())) {
    const bool hasTime = PyDateTime_Check(value.ptr());
    const auto refuse = [&](const char* why) { Raise("ValueRefused", PathOf(node) + ":" + key.name + ": " + why); };
    const Form form = FormOf(setup, node, keyword->Name());
    if (form != Form::Date && form != Form::Day) refuse("it holds no date");
    if (hasTime && !value.attr("tzinfo").is_none()) refuse("a date without a time zone was expected");
    if (hasTime && (PyDateTime_DATE_GET_SECOND(value.ptr()) != 0 || PyDateTime_DATE_GET_MICROSECOND(value.ptr()) != 0))
      refuse("a date in whole minutes was expected");
    if (hasTime && form == Form::Day &&
        (PyDateTime_DATE_GET_HOUR(value.ptr()) != 0 || PyDateTime_DATE_GET_MINUTE(value.ptr()) != 0))
      refuse("a day without a time was expected");
    const int numbers[] = {PyDateTime_GET_YEAR(value.ptr()), PyDateTime_GET_MONTH(value.ptr()),
                           PyDateTime_GET_DAY(value.ptr()), hasTime ? PyDateTime_DATE_GET_HOUR(value.ptr()) : 0,
                           hasTime ? PyDateTime_DATE_GET_MINUTE(value.ptr()) : 0};
    for (std::uint32_t i = 0; i < std::min(keyword->count, 5U); ++i) values.emplace_back(std::int64_t{numbers[i]});
  } else if (py::isinstance<py::sequence>(value) || (py::hasattr(value, "__iter__") && !PyIndex_Check(value.ptr()))) {
    values = PlainValuesOf(value);
  } else {
    values = {PlainValueFrom(value)};
  }
  problem = setup.Keys().Set(node, key, std::span<const PlainValue>(values));
  if (!problem.empty()) Raise("ValueRefused", problem);
}

}  // namespace tervane::python
