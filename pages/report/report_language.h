// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string_view>

#include "pages/report/report.h"

namespace tervane {

/// Puts the texts of a report into a language: titles, headings, heads and cells of tables, captions, and what stands
/// in pictures. What has no translation stays, as names and dates do.
void TranslateReport(Report& report, std::string_view language);

}  // namespace tervane
