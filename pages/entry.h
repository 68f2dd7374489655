// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Values as people type them, for controls and cells alike. Each gives what was expected when the text is no such
// value, and then leaves the value as it was.
#pragma once

#include <string>

#include "core/file_name.h"
#include "core/node.h"
#include "platform/dates.h"

namespace tervane {

std::string EnterValue(int& value, const std::string& typed);
std::string EnterValue(float& value, const std::string& typed);
std::string EnterValue(double& value, const std::string& typed);
std::string EnterValue(std::string& value, const std::string& typed);
/// A date, also of days alone: "2000/01/31 12:00", "2000-01-31".
std::string EnterValue(CYbDateTime& value, const std::string& typed);
/// A name that is typed stays as it is; an absolute one at or below the setup's folder becomes relative.
std::string EnterValue(FileName& value, const std::string& typed, const CYbSEKvfBase& node);

}  // namespace tervane
