// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <string_view>

#include "core/kvf_tree.h"

namespace tervane {

/// The whole file as text, the header in front. False, with the reason in `error`, when a text in it is no UTF-8 or
/// holds a NUL, or sections are nested too deep: such a file could not be read again.
bool WriteKvfText(const KvfFile& file, std::string& text, std::string& error);

/// The children of a section as text, indented by `level` steps.
void AppendKvfNodes(const KvfSection& section, int level, std::string& text);
/// The same as a text of its own.
std::string KvfTextInside(const KvfSection& section);

/// One value as it stands in a file: `6f`, `"a \"text\""`, `file "maps/x.nds2"`.
std::string KvfValueText(const KvfParam& param);
/// All values of a keyword, separated by commas.
std::string KvfValuesText(const KvfNode& keyword);
/// The same for people and scripts: numbers without the `f` of a float, texts without quotes.
std::string PlainValuesText(const KvfNode& keyword);

}  // namespace tervane
