// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "surface/crop_course.h"

#include <cmath>
#include <map>

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "surface/vegetation_file.h"

namespace tervane::crop_course_test {
namespace {

constexpr std::int64_t kDay = 86'400;

/// Crops of a calendar by the letter of their vegetation and their day, in a period of 100 days from day 0 on.
class CropDevelopments : public testing::Test {
 protected:
  CropDevelopments() {
    // LAI and root depth grow together.
    stages_[&files_.at("a")] = {{0, 0, 0, 1}, {20, 4, 2, 1}, {40, 4, 2, 1}};
    stages_[&files_.at("b")] = {{0, 1, 0.5, 1}, {10, 3, 1.5, 1}};
    stages_[&files_.at("none")] = {};
    stages_[&files_.at("late")] = {{5, 1, 0.5, 1}, {10, 2, 1, 1}};
  }

  CropDevelopment Develop(const std::vector<std::pair<const char*, int>>& crops) {
    CTvnVegFileDataList calendar;
    for (const auto& [name, day] : crops)
      calendar.push_back({&files_.at(name), CYbDateTime::FromSecondsSinceEpoch(day * kDay)});
    return DevelopmentOf(calendar, [&](const CTvnVegPropFile& file) -> const auto& { return stages_.at(&file); },
                         {0, 100 * kDay});
  }
  /// "a 0-40, gap 40-60": the stretches in days.
  std::string Stretches(const std::vector<std::pair<const char*, int>>& crops) {
    std::string text;
    for (const CropStretch& stretch : Develop(crops).stretches) {
      std::string what = stretch.kind == CropStretch::Kind::Gap       ? "gap"
                         : stretch.kind == CropStretch::Kind::Overlap ? "over "
                                                                      : "";
      for (const auto& [name, file] : files_)
        if (&file == stretch.file) what += name;
      text +=
          fmt::format("{}{} {}-{}", text.empty() ? "" : ", ", what, stretch.span.start / kDay, stretch.span.end / kDay);
    }
    return text;
  }
  /// "0:0 20:4": LAI by days; the root depth is half of it.
  std::string Course(const std::vector<std::pair<const char*, int>>& crops) {
    const CropCourse course = Develop(crops).course;
    std::string text;
    for (std::size_t i = 0; i < course.times.size(); ++i) {
      text += fmt::format("{}{}:{:.3g}", text.empty() ? "" : " ", course.times[i] / kDay, course.lai[i]);
      const double half = course.rootDepth[i] * 2;
      EXPECT_TRUE(std::abs(half - course.lai[i]) < 1e-9 || (std::isnan(half) && std::isnan(course.lai[i]))) << text;
    }
    return text;
  }

  std::map<std::string, CTvnVegPropFile> files_ = [] {
    std::map<std::string, CTvnVegPropFile> files;
    for (const char* name : {"a", "b", "none", "late"}) files.try_emplace(name, nullptr);
    return files;
  }();
  std::map<const CTvnVegPropFile*, CTvnVegPropStageDataList> stages_;
};

TEST_F(CropDevelopments, TellWhenWhichCropGrowsWithGapsAndOverlaps) {
  const struct {
    std::vector<std::pair<const char*, int>> crops;
    const char* stretches;
  } cases[] = {
      {{}, "gap 0-100"},
      {{{"a", 0}}, "a 0-40, gap 40-100"},
      {{{"a", 10}, {"b", 50}}, "gap 0-10, a 10-50, b 50-60, gap 60-100"},
      {{{"a", 0}, {"b", 30}}, "a 0-30, b 30-40, over a 30-40, gap 40-100"},
      {{{"a", -20}, {"a", 80}}, "a 0-20, gap 20-80, a 80-100"},
      {{{"a", -50}}, "gap 0-100"},
      {{{"b", 5}, {"a", 5}}, "gap 0-5, a 5-45, over b 5-15, gap 45-100"},
      // Also where dates run backwards.
      {{{"b", 50}, {"a", 10}}, "gap 0-10, a 10-50, b 50-60, gap 60-100"},
      {{{"none", 20}, {"b", 90}}, "gap 0-20, gap 20-90, b 90-100"},
  };
  for (const auto& c : cases) EXPECT_EQ(Stretches(c.crops), c.stretches);
}

TEST_F(CropDevelopments, AreLinearBetweenStagesAndCutAtThePeriodAndAtTheNextCrop) {
  const struct {
    std::vector<std::pair<const char*, int>> crops;
    const char* course;
  } cases[] = {
      {{}, ""},
      {{{"a", 10}}, "10:0 30:4 50:4 50:nan"},
      {{{"a", 0}, {"b", 60}}, "0:0 20:4 40:4 40:nan 60:1 70:3 70:nan"},
      {{{"a", 0}, {"b", 40}}, "0:0 20:4 40:4 40:1 50:3 50:nan"},
      // Cut by the next one, on the way up.
      {{{"a", 0}, {"b", 10}}, "0:0 10:2 10:1 20:3 20:nan"},
      {{{"a", -10}, {"a", 95}}, "0:2 10:4 30:4 30:nan 95:0 100:1"},
      // Both borders lie between two stages.
      {{{"a", -5}, {"b", 5}}, "0:1 5:2 5:1 15:3 15:nan"},
      // Nothing is known before a first stage that is not day 0.
      {{{"late", 20}}, "25:1 30:2 30:nan"},
      {{{"none", 20}}, ""},
  };
  for (const auto& c : cases) EXPECT_EQ(Course(c.crops), c.course);
}

}  // namespace
}  // namespace tervane::crop_course_test
