// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Where the parts of the program are that are files of their own: modules, the runner, engines. This code may stand in
// the program, or in a library that another program has loaded.
#pragma once

#include <string>
#include <string_view>

namespace tervane {

namespace os {
/// Path of the shared library that this code is a part of; of the program where it is a part of that.
std::string CodePath();
}  // namespace os

/// The path of a file or folder that belongs to the program: beside it; for an engine in the folder above, where the
/// programs are; for a library in a folder of the program's name; for what the build tests in bin/. Empty when it is in
/// none of them.
std::string FindBesideProgram(std::string_view name);

}  // namespace tervane
