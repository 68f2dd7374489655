// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/detailed_points.h"

#include <fmt/format.h>

#include "platform/paths.h"

namespace tervane {

namespace {

constexpr std::string_view kPointsSection = "DetailedTimeseriesOutput";

SeriesPlace ReadPlace(KvfNode* section, std::string_view fileKey, std::string_view itemKey) {
  SeriesPlace place;
  kvfGetParamFilename(section, fileKey, &place.path, 1, 1);
  kvfGetParam(section, itemKey, &place.item, 1, 1);
  return place;
}

DetailedPoint ReadPoint(KvfNode* section) {
  DetailedPoint point;
  kvfGetParam(section, "Name", &point.name, 1, 1);
  kvfGetParam(section, "DataTypeName", &point.dataType, 1, 1);
  kvfGetParam(section, "X", &point.x, 1, 1);
  kvfGetParam(section, "Y", &point.y, 1, 1);
  kvfGetParam(section, "iX", &point.column, 1, 1);
  kvfGetParam(section, "iY", &point.row, 1, 1);
  kvfGetParam(section, "iLay", &point.layer, 1, 1);
  point.simulated = ReadPlace(section, "SimDataFileName", "SimDataFileItemNo");
  int includesObserved = 0;
  kvfGetParam(section, "InclObsData", &includesObserved, 1, 1);
  point.includesObserved = includesObserved != 0;
  point.observed = ReadPlace(section, "ObsDataFileName", "ObsDataFileItemNo");
  return point;
}

}  // namespace

FileResult ReadDetailedPoints(const std::string& report, std::vector<DetailedPoint>& points) {
  points.clear();
  if (!FileExists(report)) return {fmt::format("Can not open file :\n{}", report), {}};
  kvfGetErrorGlb();  // what an earlier reader left
  KvfFile* file = kvfLoadFile(report, 0);
  if (const int error = kvfGetErrorGlb(); error != kKvfNoError) {
    kvfClose(&file);
    return {error == kKvfSyntaxError ? fmt::format("{}\n\nSyntax error in file: \n{}", kvfErrorText(), report)
                                     : fmt::format("Can not open file :\n{}\n\n{}", report, kvfErrorText()),
            {}};
  }
  KvfNode* section = kvfSectionByNameNum(kvfTargetByNameNum(file, "Extra_Data", 1), kPointsSection, 1);
  int count = 0;
  kvfGetParam(section, "NumberOfItems", &count, 1, 1);
  for (int number = 1; number <= count; ++number) {
    KvfNode* item = kvfSectionByNameNum(section, fmt::format("Item_{}", number), 1);
    if (!item) break;
    points.push_back(ReadPoint(item));
  }
  kvfClose(&file);
  return {};
}

void WriteDetailedPoints(KvfFile* file, const std::vector<DetailedPoint>& points, const std::string& folder) {
  const auto putPlace = [&](const SeriesPlace& place, std::string_view fileKey, std::string_view itemKey) {
    kvfPutParamFilename(file, fileKey, place.path.empty() ? std::string() : RelativePath(place.path, folder));
    kvfPutParam(file, itemKey, place.item);
  };
  kvfAddSection(file, kPointsSection);
  kvfPutParam(file, "NumberOfItems", static_cast<int>(points.size()));
  int number = 0;
  for (const DetailedPoint& point : points) {
    kvfAddSection(file, fmt::format("Item_{}", ++number));
    kvfPutParam(file, "Name", point.name);
    kvfPutParam(file, "DataTypeName", point.dataType);
    kvfPutParam(file, "X", point.x);
    kvfPutParam(file, "Y", point.y);
    kvfPutParam(file, "iX", point.column);
    kvfPutParam(file, "iY", point.row);
    kvfPutParam(file, "iLay", point.layer);
    putPlace(point.simulated, "SimDataFileName", "SimDataFileItemNo");
    kvfPutParam(file, "InclObsData", point.includesObserved ? 1 : 0);
    putPlace(point.observed, "ObsDataFileName", "ObsDataFileItemNo");
    kvfEndSection(file);
  }
  kvfEndSection(file);
}

}  // namespace tervane
