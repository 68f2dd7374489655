// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "pages/report/report.h"
#include "platform/files.h"

namespace tervane {

/// Draws a report on pages of A4 and writes them as a PDF, in one step. The error tells why not; then the old file
/// stands.
FileResult WriteReportPdf(const std::string& path, const Report& report);

}  // namespace tervane
