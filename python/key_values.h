// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <string>

#include "python/bindings.h"

namespace tervane::python {

/// The value of a key: a number, a text, true or false, a date, or a list.
pybind11::object ValueOf(OpenSetup& setup, CYbSEKvfBase& node, const PathStep& key,
                         const std::optional<std::string>& unit);
/// Gives a key another value. Texts are taken as people type them.
void SetValue(OpenSetup& setup, CYbSEKvfBase& node, const PathStep& key, const pybind11::object& value,
              const std::optional<std::string>& unit);
/// Values of any kind behind each other.
std::vector<PlainValue> PlainValuesOf(const pybind11::object& values);
pybind11::object ToPython(const PlainValue& value);

}  // namespace tervane::python
