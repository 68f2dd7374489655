// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "engine/report.h"

#include "core/kvf.h"
#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

namespace {

/// Puts one key, by the type of its value.
class KeyWriter {
 public:
  KeyWriter(KvfFile* file, const std::string& name, const std::string& folder)
      : file_(file), name_(name), folder_(folder) {}

  void operator()(int value) const { kvfPutParam(file_, name_, value); }
  void operator()(const std::string& value) const { kvfPutParam(file_, name_, value); }
  void operator()(const ReportFile& value) const {
    kvfPutParamFilename(file_, name_, RelativePath(value.path, folder_));
  }
  void operator()(const CYbDateTime& value) const {
    kvfPutListParam(file_, name_, "iiiiii", value.Year(), value.Month(), value.Day(), value.Hour(), value.Minute(),
                    value.Second());
  }

 private:
  KvfFile* file_;
  const std::string& name_;
  const std::string& folder_;
};

void PutPage(KvfFile* file, const ReportPage& page, const std::string& folder) {
  kvfAddSection(file, "PAGE");
  kvfPutParam(file, "TITLE", page.title);
  kvfPutParam(file, "Abbrev", page.abbreviatedTitle);
  kvfAddSection(file, page.kind);
  for (const auto& [name, value] : page.keys) std::visit(KeyWriter(file, name, folder), value);
  kvfEndSection(file);
  for (const ReportPage& child : page.pages) PutPage(file, child, folder);
  kvfEndSection(file);
}

}  // namespace

void ReportPage::ShowText(const std::string& text) {
  kind = report_kind::kText;
  // Pages take the two characters `\n` for a line end.
  keys = {{"Text", Replaced(text, "\n", "\\n")}};
}

void ReportPage::ShowGrid(const std::string& path, int item) {
  kind = report_kind::kGrid;
  keys = {{"Filename", ReportFile{path}}, {"ItemNo", item}};
}

void ReportPage::ShowLayers(const std::string& path, int item) {
  kind = report_kind::kLayers;
  keys = {{"Filename", ReportFile{path}}, {"ItemNo", item}};
}

void ReportPage::ShowShapes(const std::string& path, int axisUnit) {
  kind = report_kind::kShapes;
  keys = {{"Filename", ReportFile{path}}, {"enuAxisUnit", axisUnit}};
}

void ReportPage::ShowSeries(const std::string& path, int item, const CYbDateTime& start, const CYbDateTime& end) {
  kind = report_kind::kSeries;
  keys = {{"Filename", ReportFile{path}}, {"ItemNo", item}, {"StartDate", start}, {"EndDate", end}};
}

std::string WriteReport(const std::string& path, const Report& report) {
  const std::string folder(FolderOf(path));
  KvfFile* file = kvfCreate();
  kvfAddTarget(file, "PreProcessed_Data");
  PutPage(file, report.top, folder);
  kvfEndSection(file);

  kvfAddTarget(file, "Extra_Data");
  if (!report.topographyFile.empty()) {
    kvfAddSection(file, "Topography");
    kvfPutParamFilename(file, "Filename", RelativePath(report.topographyFile, folder));
    kvfPutParam(file, "ItemNo", report.topographyItem);
    kvfEndSection(file);
  }
  kvfAddSection(file, "LowerLevel");
  kvfPutParam(file, "SZ_Included", report.lowerLevelFile.empty() ? 0 : 1);
  if (!report.lowerLevelFile.empty()) {
    kvfPutParamFilename(file, "Filename", RelativePath(report.lowerLevelFile, folder));
    kvfPutParam(file, "ItemNo", report.lowerLevelItem);
    kvfPutParam(file, "NumberOfLayers", report.numberOfLayers);
  }
  kvfEndSection(file);
  WriteDetailedPoints(file, report.detailedPoints, folder);
  kvfEndSection(file);

  kvfWrite(file, path);
  kvfClose(&file);
  return kvfGetErrorGlb() == kKvfNoError ? std::string() : kvfErrorText();
}

}  // namespace tervane
