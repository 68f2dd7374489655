// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// How long the report of a real catchment takes, beside the check of its setup, which any report begins with.
#include <filesystem>
#include <string>

#include <fmt/format.h>
#include <unistd.h>

#include "bench/median_table.h"
#include "document/flow_model_document.h"
#include "pages/findings.h"
#include "pages/report/report_html.h"

namespace tervane::bench {

namespace {

const std::string kRhone = TERVANE_SOURCE_DIR "/examples/rhone/rhone.tvd";

std::size_t Check() {
  CFlowModelDoc document;
  return document.OnOpenDocument(kRhone) ? FindingsOf(document).size() : 0;
}

std::size_t WriteReport(const std::string& path) {
  CFlowModelDoc document;
  if (!document.OnOpenDocument(kRhone)) return 0;
  const FileResult written = WriteReportHtml(path, MakeReport(document, {}));
  if (!written.Ok()) fmt::print("{}\n", written.error);
  return written.error.size();
}

}  // namespace

}  // namespace tervane::bench

int main(int argc, char** argv) {
  using namespace tervane::bench;
  const std::string path =
      (std::filesystem::temp_directory_path() / fmt::format("tervane_report_{}.html", getpid())).string();
  MedianTable table(5);
  table.Add("check of the Rhone", [] { return Check(); });
  table.Add("report of the Rhone", [path] { return WriteReport(path); });
  table.LimitTime("report of the Rhone", 5000);
  table.Run(argc, argv);
  std::filesystem::remove(path);
  return 0;
}
