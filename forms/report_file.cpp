// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "forms/report_file.h"

#include <array>
#include <string_view>
#include <utility>
#include <vector>

#include <fmt/format.h>
#include <fmt/ranges.h>

#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

namespace {

constexpr std::uint64_t kLargest = 8'000'000;  ///< Bytes that a simple view lays out in about a second.

/// What a page holds that only a browser shows.
std::string RemarkOf(std::string_view html) {
  constexpr std::array<std::pair<std::string_view, std::string_view>, 6> kParts{{{"<script", "scripts"},
                                                                                 {"<svg", "drawings"},
                                                                                 {"<canvas", "drawings"},
                                                                                 {"<iframe", "embedded pages"},
                                                                                 {"<video", "videos"},
                                                                                 {"display:flex", "its layout"}}};
  const std::string lower = LowerCase(html);
  std::vector<std::string_view> found;
  for (const auto& [mark, words] : kParts)
    if (lower.find(mark) != std::string::npos && (found.empty() || found.back() != words)) found.push_back(words);
  if (found.empty()) return {};
  return fmt::format("Not all of the report is shown here ({} are missing): open it in the browser to see it whole.",
                     fmt::join(found, ", "));
}

}  // namespace

ReportFile ReadReport(const std::string& path) {
  ReportFile report;
  report.path = path;
  if (path.empty()) {
    report.message = "There is no report yet.";
    return report;
  }
  report.stamp = StampOf(path);
  if (!report.stamp.exists) {
    report.message = fmt::format("There is no file {} in {}. It is written by a run, or was moved or deleted since.",
                                 FileNameOf(path), FolderOf(path));
    return report;
  }
  if (report.stamp.size > kLargest) {
    report.message = fmt::format("{} is too large to be shown here ({} MB): open it in the browser.", FileNameOf(path),
                                 report.stamp.size / 1'000'000);
    return report;
  }
  FileContent content;
  if (const FileResult result = ReadWholeFile(path, content); !result.Ok()) {
    report.stamp = {};
    report.message = result.error;
    return report;
  }
  report.html = std::string(content.Text());
  if (report.html.empty())
    report.message = fmt::format("{} is empty: it may still be written.", FileNameOf(path));
  else
    report.remark = RemarkOf(report.html);
  return report;
}

std::string Summary(const ReportFile& report) {
  std::string text = report.message.empty() ? fmt::format("{}, {} bytes", FileNameOf(report.path), report.html.size())
                                            : report.message;
  return report.remark.empty() ? text : text + " " + report.remark;
}

}  // namespace tervane
