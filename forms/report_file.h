// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "platform/files.h"

namespace tervane {

/// A report in HTML as a page shows it.
struct ReportFile {
  std::string path;
  FileStamp stamp;
  std::string html;     ///< Empty where there is a message.
  std::string message;  ///< Why nothing is shown, with what to do.
  std::string remark;   ///< What of the page is not shown here, since it needs a browser; empty for nothing.

  bool MayBeOpened() const { return stamp != FileStamp(); }
};

/// Reads the file at a path; an empty path is a report that is not there yet.
ReportFile ReadReport(const std::string& path);
/// "statistics.html, 12 KB", or the message; and the remark.
std::string Summary(const ReportFile& report);

}  // namespace tervane
