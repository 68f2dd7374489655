// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <string>

#include "pages/report/report.h"

namespace tervane {

/// How pictures stand in the text: as what is written for the picture of that number, counted from 0.
using PictureInHtml = std::function<std::string(const ReportPicture& picture, std::size_t number)>;

/// One block of a section; `number` is that of a picture.
std::string ReportBlockInHtml(const ReportBlock& block, const PictureInHtml& picture, std::size_t number);

/// The body of a report: headings, paragraphs, tables and pictures.
std::string ReportBody(const Report& report, const PictureInHtml& picture);

/// The whole report as one page in HTML that needs no other file. The logo must be a PNG, JPEG, GIF or SVG of at most
/// 5 MB. The error tells why it is not, or why the file cannot be written; then the old one stands.
FileResult WriteReportHtml(const std::string& path, const Report& report);

/// The logo as it stands in a page, "data:image/png;base64,..."; empty for none. The error tells why it cannot be
/// taken.
FileResult LogoData(const Report& report, std::string& data);

}  // namespace tervane
