// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "surface/crop_calendar.h"

#include <algorithm>

#include <fmt/format.h>
#include <fmt/ranges.h>
#include <gmock/gmock.h>

#include "surface/vegetation_file.h"

namespace tervane::crop_calendar_test {
namespace {

const CYbDateTime kBegin{2001, 1, 1};

CYbDateTime Day(double day) { return kBegin + CYbDateTimeSpan::Days(day); }

/// A crop by the days of its start and its length.
struct Crop {
  double start, length;
  bool isValid = true, hasDate = true;
};

/// Entries as the letter of their crop and their day: "a0 b100 a200".
std::string Entries(const std::vector<Crop>& crops, int mode, double end) {
  std::vector<std::unique_ptr<CTvnVegPropFile>> files;
  std::vector<PlannedCrop> planned;
  for (const Crop& crop : crops) {
    files.push_back(std::make_unique<CTvnVegPropFile>(nullptr));
    planned.push_back({files.back().get(), crop.hasDate ? Day(crop.start) : CYbDateTime(),
                       CYbDateTimeSpan::Days(crop.length), crop.isValid});
  }
  const CropCalendar calendar = BuildVegCalendar(planned, mode, Day(end));
  EXPECT_FALSE(calendar.isCut);
  std::vector<std::string> entries;
  for (const CTvnVegFileData& entry : calendar.entries) {
    const auto place = std::ranges::find(files, entry.file, &std::unique_ptr<CTvnVegPropFile>::get) - files.begin();
    entries.push_back(fmt::format("{}{}", static_cast<char>('a' + place), (entry.start - kBegin).InDays()));
  }
  return fmt::format("{}", fmt::join(entries, " "));
}

TEST(CropCalendar, CropsAreRepeatedAsTheModeTells) {
  const std::vector<Crop> two{{0, 40}, {100, 50}};
  const struct {
    const char* what;
    std::vector<Crop> crops;
    int mode;
    double end;
    const char* entries;
  } cases[] = {
      {"no crops", {}, 1, 100, ""},
      {"each once", two, 0, 1000, "a0 b100"},
      {"each until the next, the last to the end", two, 1, 260, "a0 a40 a80 b100 b150 b200 b250"},
      {"the sequence", two, 2, 400, "a0 b100 a150 b250 a300"},
      {"each until the next, then the sequence", two, 3, 400, "a0 a40 a80 b100 a150 a190 a230 b250 a300 a340 a380"},
      // The time that is left must be greater than the length.
      {"250 days before the end", {{0, 100}}, 1, 250, "a0 a100 a200"},
      {"200 days before the end", {{0, 100}}, 1, 200, "a0 a100"},
      {"one crop as a sequence", {{0, 100}}, 2, 250, "a0 a100 a200"},
      {"one crop, then as a sequence", {{0, 100}}, 3, 250, "a0 a100 a200"},
      // A crop is repeated up to the end where the next one begins behind it.
      {"the next one is too late", {{0, 40}, {300, 40}}, 1, 100, "a0 a40 a80"},
      {"the next one is too late for the sequence", {{0, 40}, {300, 40}}, 3, 100, "a0 a40 a80"},
      {"the crops fill the time", {{0, 50}, {100, 50}}, 1, 150, "a0 a50 b100"},
      {"without a length", {{0, 0}, {100, 0}}, 1, 1000, "a0 b100"},
      {"a sequence without a length", {{0, 0}}, 2, 1000, "a0"},
      {"a sequence whose last has no length", {{0, 40}, {100, 0}}, 2, 250, "a0 b100 a100 b200 a200"},
      {"at one date", {{0, 40}, {0, 60}}, 0, 100, "a0 b0"},
      // List order, not the order of dates.
      {"backwards", {{100, 40}, {0, 40}}, 0, 1000, "a100 b0"},
      {"backwards and repeated", {{100, 40}, {0, 40}}, 1, 130, "a100 b0 b40 b80 b120"},
      {"at the end", {{0, 40}, {100, 40}, {50, 40}}, 0, 100, "a0"},
      {"behind the end", {{101, 40}, {0, 40}}, 0, 100, ""},
      {"of a fraction of a day", {{0, 40}}, 1, 80.5, "a0 a40 a80"},
      {"no date", {{0, 40, true, false}, {10, 40}, {0, 0, true, false}, {60, 40}}, 0, 100, "b10 d60"},
      {"no date and not valid", {{10, 40}, {0, 0, false, false}, {60, 40}}, 0, 100, "a10 c60"},
      // A calendar begins with a valid crop, and goes on with any.
      {"not valid at first", {{0, 40, false}, {10, 40}, {60, 0, false}, {80, 40}}, 0, 100, "b10 c60 d80"},
      {"none valid", {{0, 40, false}, {10, 40, false}}, 0, 100, ""},
      {"a mode of no meaning", two, -1, 1000, "a0 b100"},
  };
  for (const auto& c : cases) EXPECT_EQ(Entries(c.crops, c.mode, c.end), c.entries) << c.what;
}

TEST(CropCalendar, EndsWhereItIsTooLongAndWithoutAnEnd) {
  const PlannedCrop daily{nullptr, CYbDateTime(1, 1, 1), CYbDateTimeSpan::Days(1), true};
  EXPECT_TRUE(BuildVegCalendar({&daily, 1}, kEachEntry, CYbDateTime()).entries.empty());
  for (const int mode : {kEachEntry, kEntireScheme, kEntriesThenScheme}) {
    const CropCalendar calendar = BuildVegCalendar({&daily, 1}, mode, CYbDateTime(9999, 12, 31));
    EXPECT_TRUE(calendar.isCut);
    EXPECT_EQ(calendar.entries.size(), CropCalendar::kMostEntries);
  }
}

}  // namespace
}  // namespace tervane::crop_calendar_test
