// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "libraries/wells.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <optional>
#include <string_view>

#include <fmt/format.h>

#include "core/kvf_writer.h"
#include "data/csv_reader.h"
#include "libraries/kept_text.h"
#include "platform/file_cache.h"
#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

namespace {

constexpr double kFar = 1e9;  ///< Coordinates and elevations of any map are smaller.

constexpr LibraryColumn kX[] = {{"X", "m", "On the map, to the east", false, -kFar, kFar}};
constexpr LibraryColumn kY[] = {{"Y", "m", "On the map, to the north", false, -kFar, kFar}};
constexpr LibraryColumn kLevel[] = {{"Level", "m", "Elevation of the ground at the well", false, -kFar, kFar}};
constexpr LibraryColumn kDepth[] = {{"Depth", "m", "From the ground to the bottom of the well", false, 0, kFar}};
constexpr LibraryModel kXAlone[] = {{"", kX}}, kYAlone[] = {{"", kY}}, kLevelAlone[] = {{"", kLevel}},
                       kDepthAlone[] = {{"", kDepth}};

enum WellFieldNumber { kWellName, kXField, kYField, kLevelField, kDepthField, kWellField };
constexpr LibraryField kWellFields[] = {
    {"Name", "Name:", "The name by which others know the well"},
    {"X", "X:", "", kXAlone},
    {"Y", "Y:", "", kYAlone},
    {"Level", "Ground level:", "", kLevelAlone},
    {"Depth", "Depth:", "", kDepthAlone},
    {"Field", "Well field:", "The well field that the well belongs to"},
};

enum FilterColumn { kFilterTop, kFilterBottom };
constexpr LibraryColumn kFilterColumns[] = {
    {"Top", "m", "Elevation of the upper end of the filter", false, -kFar, kFar, 0, "Top"},
    {"Bottom", "m", "Elevation of the lower end of the filter", false, -kFar, kFar, 0, "Bottom"},
};

std::string WhyWrongFilter(const LibraryEntry& well, const LibraryRow& filter) {
  const double top = filter.values[kFilterTop], bottom = filter.values[kFilterBottom];
  if (top <= bottom) return fmt::format("its top, {:.6g} m, does not lie above its bottom, {:.6g} m", top, bottom);
  const double ground = well.Number(kLevelField), end = ground - well.Number(kDepthField);
  if (bottom < end)
    return fmt::format("it reaches down to {:.6g} m, below the bottom of the well at {:.6g} m", bottom, end);
  if (top > ground) return fmt::format("it begins at {:.6g} m, above the ground at {:.6g} m", top, ground);
  return {};
}

}  // namespace

constexpr LibraryKind kWellLibrary{
    .name = "well parameter file",
    .entryName = "well",
    .entryNames = "wells",
    .rowName = "filter",
    .rowNames = "filters",
    .extension = "WEL",
    .filter = "Well parameter file (*.WEL)|*.WEL||",
    .target = "WEL_CFG",
    .sectionPattern = "Well_%d",
    .fields = kWellFields,
    .rowKey = "Filter_%d",
    .columns = kFilterColumns,
    .section = "WELLDATA",
    .countKey = "NoWells",
    .rowCountKey = "NoFilters",
    .rowFile = {"TimeSeries", "Abstraction", "Series of what is pumped from the filter"},
    .whyWrongRow = WhyWrongFilter,
};

CTvnWellData WellOf(const LibraryEntry& entry, const std::string& folder) {
  CTvnWellData well{.name = entry.Name(),
                    .place = {entry.Number(kXField), entry.Number(kYField)},
                    .level = entry.Number(kLevelField),
                    .depth = entry.Number(kDepthField),
                    .field = entry.fields[kWellField].text};
  for (const LibraryRow& row : entry.rows)
    well.filters.push_back({row.values[kFilterTop], row.values[kFilterBottom], FileName(row.file, folder), row.item});
  return well;
}

std::vector<CTvnWellData> WellsOf(const Library& library) {
  std::vector<CTvnWellData> wells;
  wells.reserve(library.entries.size());
  for (const LibraryEntry& entry : library.entries) wells.push_back(WellOf(entry, library.folder));
  return wells;
}

std::partial_ordering CTvnWellData::operator<=>(const CTvnWellData& other) const {
  if (const auto names = name <=> other.name; names != 0) return names;
  if (const auto columns = place.x <=> other.place.x; columns != 0) return columns;
  if (const auto rows = place.y <=> other.place.y; rows != 0) return rows;
  return level <=> other.level;
}

bool CTvnWellDataList::LoadWellDataFile(const std::string& path) {
  static FileCache<std::vector<CTvnWellData>> cache(kMostFacts);
  const auto reading = ReadLibraryOnce(kWellLibrary, path);
  problem_ = reading->problem;
  wells_ = problem_.empty() ? cache.Get(path, {}, [&] { return WellsOf(reading->library); })
                            : std::make_shared<const std::vector<CTvnWellData>>();
  return problem_.empty();
}

std::vector<CTvnAbstraction> TvnGetAbstractionFileList(const std::string& path) {
  std::vector<CTvnAbstraction> abstractions;
  CTvnWellDataList list;
  list.LoadWellDataFile(path);
  for (const CTvnWellData& well : list.Wells()) {
    int number = 0;
    for (const CTvnWellFilter& filter : well.filters) {
      ++number;
      if (!filter.timeSeries.IsEmpty())
        abstractions.push_back({well.name, number, filter.timeSeries.Absolute(), filter.item});
    }
  }
  return abstractions;
}

std::string ReadWellTable(const std::string& path, WellImport& import) {
  FileContent content;
  if (const FileResult read = ReadWholeFile(path, content); !read.Ok()) return read.error;
  CsvReader reader(content.Text(), false);
  std::vector<std::string> cells;
  if (!reader.Next(cells)) return fmt::format("{} is empty", path);

  constexpr std::string_view kHeads[] = {"name", "x", "y", "level", "depth", "field", "top", "bottom", "file", "item"};
  constexpr std::size_t kNeeded = 5;
  enum Head : std::size_t { kNameHead, kXHead, kFieldHead = 5, kTopHead, kBottomHead, kFileHead, kItemHead };
  std::array<std::optional<std::size_t>, std::size(kHeads)> columns;
  for (std::size_t head = 0; head < columns.size(); ++head) {
    const auto found = std::ranges::find_if(
        cells, [&](const std::string& cell) { return EqualIgnoringCase(Trimmed(cell), kHeads[head]); });
    if (found != cells.end())
      columns[head] = static_cast<std::size_t>(found - cells.begin());
    else if (head < kNeeded)
      return fmt::format("{}:1: there is no column \"{}\"; the columns are named name, x, y, level, depth", path,
                         kHeads[head]);
  }
  const auto text = [&](std::size_t head) -> std::string {
    const auto column = columns[head];
    return column && *column < cells.size() ? std::string(Trimmed(cells[*column])) : std::string();
  };
  import.wells.folder = FolderOf(path);
  while (reader.Next(cells)) {
    const auto number = [&](std::size_t head) { return ParseCsvNumber(text(head), !reader.SeparatesByComma()); };
    const auto refuse = [&](std::string why) {
      import.notes.push_back(fmt::format("{}:{}: {}", path, reader.Line(), why));
    };
    const std::string name = text(kNameHead);
    if (name.empty()) {
      refuse("the well has no name");
      continue;
    }
    auto place = import.wells.Find(name);
    if (!place) {
      LibraryEntry well = import.wells.NewEntry(name);
      bool isWhole = true;
      for (std::size_t field = kXField; field <= kDepthField && isWhole; ++field) {
        const std::size_t head = kXHead + (field - kXField);
        const auto value = number(head);
        isWhole = value.has_value();
        if (!isWhole)
          refuse(fmt::format("{} of {} is \"{}\", a number was expected", kHeads[head], name, text(head)));
        else
          well.fields[field].numbers[0] = *value;
      }
      if (!isWhole) continue;
      well.fields[kWellField].text = text(kFieldHead);
      import.wells.entries.push_back(std::move(well));
      place = import.wells.entries.size() - 1;
    }
    if (text(kTopHead).empty() && text(kBottomHead).empty()) continue;
    const auto top = number(kTopHead), bottom = number(kBottomHead);
    if (!top || !bottom) {
      refuse(fmt::format("top and bottom of a filter of {} are \"{}\" and \"{}\", numbers were expected", name,
                         text(kTopHead), text(kBottomHead)));
      continue;
    }
    LibraryRow filter;
    filter.values[kFilterTop] = *top;
    filter.values[kFilterBottom] = *bottom;
    filter.file = text(kFileHead);
    if (const auto item = number(kItemHead)) {
      constexpr double kMostItems = 1'000'000;
      if (*item < 1 || *item > kMostItems || *item != std::trunc(*item)) {
        refuse(fmt::format("the item of {} is \"{}\", a whole number from 1 was expected", name, text(kItemHead)));
        continue;
      }
      filter.item = static_cast<int>(*item);
    }
    import.wells.entries[*place].rows.push_back(std::move(filter));
  }
  if (reader.IsQuoteOpen()) return fmt::format("{}:{}: a quote is not closed", path, reader.Line());
  return import.wells.entries.empty() ? fmt::format("{} has no wells", path) : std::string();
}

FileResult WriteEmptyWellFile(const std::string& path, const Envelope& area) {
  KvfFile file;
  const auto section = [&](KvfSection& parent, std::string_view name) -> KvfSection& {
    return *file.AddSection(parent, KvfKind::Section, name);
  };
  const auto target = [&](std::string_view name) -> KvfSection& {
    return *file.AddSection(file.top, KvfKind::Target, name);
  };
  const auto add = [&](KvfSection& parent, std::string_view key, int value) {
    file.BeginKeyword(parent, key);
    file.AddParam(KvfType::Int).asInt = value;
  };
  KvfSection& geometry = section(target("MAP"), "GEOMETRY");
  AddCorners(file, geometry, area);
  file.BeginKeyword(geometry, "OverlayFilename");
  file.SetText(file.AddParam(KvfType::Filename), "");
  KvfSection& shown = section(target("SOIL"), "DEFAULT_DATA");
  add(shown, "SoilTextOn", 1);
  add(shown, "MapTextOn", 1);

  KvfSection& wells = target("WEL_CFG");
  constexpr struct {
    std::string_view section, count, more = {};
  } kSections[] = {{"WELLDATA", "NoWells", "IncludeFractureWell"},
                   {"WELLFIELD", "NoWellFields"},
                   {"Foreground", "NumberOfLayers"},
                   {"Background", "NumberOfLayers"}};
  for (const auto& row : kSections) {
    KvfSection& part = section(wells, row.section);
    add(part, "Touched", 0);
    add(part, row.count, 0);
    if (!row.more.empty()) add(part, row.more, 0);
  }
  std::string text, error;
  if (!WriteKvfText(file, text, error)) return {error, {}};
  return WriteFileAtomically(path, text);
}

}  // namespace tervane
