// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <string_view>

#include "document/flow_model_document.h"

namespace tervane::test {

/// A setup of that document version whose target holds `sections`; version -1 leaves the version out.
std::string SetupText(int version, std::string_view sections);

/// The setup as it would be saved in the folder of its path.
std::string SavedText(const CFlowModelDoc& document);

/// The value of a key as it would be saved, as a person reads it ("" when the key is not there).
std::string ValueOf(const CFlowModelDoc& document, std::string_view path);

}  // namespace tervane::test
