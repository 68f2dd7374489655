// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Keys that stand once for each value, in a section of their own that is no node:
// "PT_Reg_Extraction/Extraction_1/WellNames:wellname".
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "access/written_setup.h"

namespace tervane {

struct RepeatedKey {
  std::vector<PathStep> node;  ///< The steps to the node that declares it.
  std::string section, key;
};
/// Nothing where the path leads to a node, or to no such section.
std::optional<RepeatedKey> FindRepeatedKey(CFlowModelDoc& document, const SetupPath& path);

/// The values in the form of the file: whole numbers, or texts in quotes.
std::vector<std::string> ValuesOf(const WrittenSetup& written, CFlowModelDoc& document, const RepeatedKey& key);
/// Puts others in their place, typed with commas between them, as whole numbers or as texts; an empty text leaves none.
/// False for what is no whole number, or no text in UTF-8.
bool TakeValues(const WrittenSetup& written, CFlowModelDoc& document, const RepeatedKey& key, std::string_view typed,
                bool areNumbers);

}  // namespace tervane
