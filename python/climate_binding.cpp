// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <pybind11/stl.h>

#include "access/climate_scenario.h"
#include "core/open_kvf.h"
#include "python/bindings.h"

namespace py = pybind11;
using namespace py::literals;

namespace tervane::python {

namespace {

py::list ClimateOf(OpenSetup& setup) {
  py::list inputs;
  for (const ClimateFamily& family : kClimateFamilies) {
    const ClimateInputs climate(setup.Root(), family);
    const auto add = [&](const char* kind, const py::object& value, const py::object& file, const py::object& item) {
      inputs.append(
          py::dict("quantity"_a = family.name, "kind"_a = kind, "value"_a = value, "file"_a = file, "item"_a = item));
    };
    for (const ClimateValue& value : climate.Values())
      add("value", py::float_(static_cast<double>(*value.value)), py::none(), py::none());
    for (const DataFileNode* file : climate.NamedSeries())
      add("series", py::none(), py::str(file->File.Absolute()), py::int_(file->SelectedItem()));
    if (const DataFileNode* grid = climate.Grid())
      add("grids", py::none(), py::str(grid->File.Absolute()), py::int_(grid->SelectedItem()));
  }
  return inputs;
}

/// Rules by the names of quantities, each twelve factors and twelve shifts.
std::vector<std::string> ChangeClimate(
    OpenSetup& setup, const std::map<std::string, std::pair<std::array<double, 12>, std::array<double, 12>>>& rules,
    const std::string& folder) {
  ClimateScenario scenario;
  for (const auto& [name, rule] : rules) {
    const auto family = std::ranges::find_if(kClimateFamilies, [&](const auto& each) { return name == each.name; });
    if (family == kClimateFamilies.end())
      Raise("ValueRefused", name + " is none of precipitation, evapotranspiration and temperature");
    scenario[static_cast<std::size_t>(family - kClimateFamilies.begin())] = {rule.first, rule.second};
  }
  std::vector<std::string> changes;
  const std::string problem = ApplyClimateScenario(setup.Root(), scenario, folder, changes);
  setup.Keys().Forget();
  RaiseProblem(problem);
  return changes;
}

void WriteDefinition(OpenSetup& setup, const std::string& path) {
  const OpenKvf file(kvfCreate());
  kvfGetErrorGlb();  // what an earlier writer left
  DefineClimate(file.get(), setup.Root());
  kvfWrite(file.get(), path);
  if (kvfGetErrorGlb() != kKvfNoError) Raise("SetupError", kvfErrorText());
}

}  // namespace

void BindClimate(py::module_& module) {
  module.def("climate", &ClimateOf, "setup"_a);
  module.def("change_climate", &ChangeClimate, "setup"_a, "rules"_a, "folder"_a);
  module.def("write_climate_definition", &WriteDefinition, "setup"_a, "path"_a);
}

}  // namespace tervane::python
