// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "platform/files.h"
#include "platform/progress.h"

namespace tervane {

/// A number by which the bytes of a file are known again: XXH3 with 128 bits, as 32 hexadecimal digits, which
/// `xxhsum -H2` prints too. It tells changes, and is no protection against somebody who means to deceive.
FileResult HashFile(const std::string& path, std::string& hash, ProgressPart progress = {});

}  // namespace tervane
