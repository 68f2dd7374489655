// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "geometry/shapes.h"

#include <filesystem>
#include <limits>
#include <string>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/support/temp_folder.h"

namespace tervane::shapes_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using Kind = AttributeKind;

const std::vector<ShapeField> kColumns = {{"CODE", Kind::Whole}, {"NAME", Kind::Text}, {"AREA", Kind::Real}};

/// Two zones, the first with a hole and in two parts, and between them a shape without points.
CTvnShapeData Zones() {
  CTvnShapeData zones;
  zones.Create(ShapeKind::Polygon, kColumns, "EPSG:32632");
  zones.AddShape({{{0, 0}, {0, 10}, {10, 10}, {10, 0}, {0, 0}, {4, 4}, {6, 4}, {6, 6}, {4, 4}},
                  {},
                  {},
                  {0, 5},
                  {std::int64_t{7}, "Höhe", 0.1}});
  zones.AddShape({{}, {}, {}, {}, {std::int64_t{-8}, std::monostate(), 1e-300}});
  zones.AddShape(
      {{{20, 0}, {20, 10}, {30, 10}, {20, 0}}, {}, {}, {0}, {std::int64_t{123456789012}, "b ", std::monostate()}});
  return zones;
}

std::string Save(const test::TempFolder& folder, const CTvnShapeData& shapes) {
  const FileResult result = shapes.SaveShapeFile(folder.File("zones.shp"));
  EXPECT_EQ(result.error, "");
  return folder.File("zones.shp");
}

void ExpectEqual(const CYbShapeData& read, const CYbShapeData& written) {
  EXPECT_EQ(read.Kind(), written.Kind());
  EXPECT_EQ(read.Columns(), written.Columns());
  EXPECT_EQ(read.Projection(), written.Projection());
  ASSERT_EQ(read.GetData().size(), written.GetData().size());
  for (std::size_t i = 0; i < read.GetData().size(); ++i) {
    const Shape &a = read.GetData()[i], &b = written.GetData()[i];
    EXPECT_TRUE(a.points == b.points && a.z == b.z && a.m == b.m && a.parts == b.parts && a.values == b.values) << i;
  }
}

TEST(Shapes, ComeBackAsTheyWereWritten) {
  const test::TempFolder folder;
  CTvnShapeData zones = Zones();
  CYbShapeData read;
  EXPECT_EQ(read.ReadShapeAndDbfFile(Save(folder, zones), "").error, "");
  // The format cuts the blanks behind a text, and has no text that is missing.
  CTvnShapeData expected;
  expected.Create(ShapeKind::Polygon, kColumns, "EPSG:32632");
  for (Shape shape : zones.GetData()) {
    if (std::holds_alternative<std::monostate>(shape.values[1])) shape.values[1] = "";
    if (shape.values[1] == ShapeValue("b ")) shape.values[1] = "b";
    expected.AddShape(shape);
  }
  ExpectEqual(read, expected);

  CTvnShapeData lines;
  lines.Create(ShapeKind::Line, {{"ID", Kind::Whole}}, "");
  lines.AddShape({{{1, 2}, {3, 4}, {5, 6}, {7, 8}}, {1, 2, 3, 4}, {9, 8, 7, 6}, {0, 2}, {std::int64_t{1}}});
  std::filesystem::remove(folder.File("zones.prj"));
  EXPECT_EQ(read.ReadShapeAndDbfFile(Save(folder, lines), "id").error, "");
  ExpectEqual(read, lines);
  Envelope rectangle;
  EXPECT_TRUE(lines.GetTranscribingRect(rectangle));
  EXPECT_EQ(rectangle, (Envelope{1, 2, 7, 8}));

  CTvnShapeData empty;
  EXPECT_EQ(read.ReadShapeAndDbfFile(Save(folder, empty), "ID").error, "");
  EXPECT_TRUE(read.GetData().empty());
  EXPECT_FALSE(empty.GetTranscribingRect(rectangle));
}

TEST(Shapes, TurnCoordinatesIntoMetresAndBack) {
  const test::TempFolder folder;
  CTvnShapeData points;
  points.Create(ShapeKind::Point, {}, "");
  points.AddShape({{{1500, -250}}, {}, {}, {0}, {}});
  points.SetAxisLengthUnit(1001);
  CYbShapeData read;
  EXPECT_EQ(read.ReadShapeFile(Save(folder, points)).error, "");
  EXPECT_THAT(read.GetData()[0].points, ElementsAre(MapPoint{1.5, -0.25}));
  read.SetAxisLengthUnit(1001);
  EXPECT_EQ(read.ReadShapeFile(folder.File("zones.shp")).error, "");
  EXPECT_THAT(read.GetData()[0].points, ElementsAre(MapPoint{1500, -250}));
  read.SetAxisLengthUnit(1400);
  EXPECT_THAT(read.ReadShapeFile(folder.File("zones.shp")).error, HasSubstr("no length"));
}

TEST(Shapes, TellWhatIsWrongWithAFile) {
  const struct {
    const char* file;
    std::string (*change)(std::string bytes);
    const char* error;
    const char* note;
  } rows[] = {
      {"zones.shx", nullptr, "", "zones.shx is missing; the index was made anew"},
      {"zones.prj", nullptr, "", ""},
      {"zones.dbf", nullptr, "zones.dbf does not exist", ""},
      {"zones.shp", nullptr, "zones.shp: it does not exist", ""},
      {"zones.shp", [](std::string b) { return b.substr(0, 60); }, "zones.shp: it has 60 bytes", ""},
      {"zones.shp", [](std::string b) { return b.substr(0, b.size() - 8); }, "zones.shp: it is cut", ""},
      {"zones.shp", [](std::string) { return std::string(200, 'x'); }, "no shape file", ""},
      {"zones.shx", [](std::string b) { return b.substr(0, 104); }, "zones.shx", ""},
      // Counts of parts (144) and points (148) of the first shape; the type of the file (32) and of the shape (108).
      {"zones.shp", [](std::string b) { return b.replace(144, 4, "\xFF\xFF\xFF\x7F"); }, "shape 1: ", ""},
      {"zones.shp", [](std::string b) { return b.replace(148, 4, "\xFF\xFF\xFF\x0F"); }, "shape 1: ", ""},
      {"zones.shp", [](std::string b) { return b.replace(156, 1, "\x09"); }, "shape 1: ", ""},
      {"zones.shx", [](std::string b) { return b.replace(32, 1, "\x1F"); }, "MultiPatch", ""},
      {"zones.shp", [](std::string b) { return b.replace(108, 1, "\x03"); }, "shape 1: it is of the type Arc", ""},
      {"zones.shp", [](std::string b) { return b.replace(166, 2, "\xF0\x7F"); }, "shape 1: point 1 has", ""},
      {"zones.dbf", [](std::string b) { return b.substr(0, b.size() - 30); }, "zones.dbf: it is cut", ""},
      {"zones.dbf", [](std::string b) { return b.replace(4, 1, "\x02"); }, "3 shapes, but", ""},
      {"zones.dbf", [](std::string b) { return b.replace(b.find("123456789012"), 3, "12x"); },
       "shape 3: its attribute CODE", ""},
      {"zones.dbf", [](std::string b) { return b.replace(b.find("\xC3\xB6"), 2, "\xF6\x20"); }, "", "Latin-1"},
  };
  for (const auto& row : rows) {
    const test::TempFolder folder;
    const std::string path = Save(folder, Zones());
    const std::string changed = folder.File(row.file);
    const std::string bytes = test::ReadFile(changed);
    std::filesystem::remove(changed);
    if (row.change) folder.Write(row.file, row.change(bytes));
    CYbShapeData read;
    const FileResult result = read.ReadShapeAndDbfFile(path, "");
    EXPECT_THAT(result.error, HasSubstr(row.error));
    EXPECT_EQ(result.error.empty(), row.error[0] == '\0') << result.error;
    EXPECT_THAT(result.note, HasSubstr(row.note));
    EXPECT_EQ(read.GetData().size(), result.Ok() ? 3u : 0u);
  }
}

TEST(Shapes, SurviveEveryChangedByte) {
  const test::TempFolder folder;
  const std::string path = Save(folder, Zones());
  for (const char* name : {"zones.shp", "zones.shx", "zones.dbf"}) {
    const std::string bytes = test::ReadFile(folder.File(name));
    for (std::size_t i = 0; i < bytes.size(); ++i) {
      std::string changed = bytes;
      changed[i] = "\x7F\xFF\x01"[i % 3];
      folder.Write(name, changed);
      CYbShapeData read;
      const FileResult result = read.ReadShapeAndDbfFile(path, "");
      EXPECT_TRUE(result.Ok() || result.error.find("zones") != std::string::npos) << result.error;
    }
    folder.Write(name, bytes);
  }
  // The lengths of the shapes lead from one to the next where there is no index: backwards, or nowhere.
  std::filesystem::remove(folder.File("zones.shx"));
  const std::string bytes = test::ReadFile(path);
  for (const char* length : {"\xFF\xFF\xFF\xFC", "\x7F\xFF\xFF\xFF"}) {
    folder.Write("zones.shp", std::string(bytes).replace(104, 4, length));
    CYbShapeData read;
    EXPECT_THAT(read.ReadShapeFile(path).error, HasSubstr("shape 1 is longer"));
  }
}

TEST(Shapes, AreCheckedAgainstARequest) {
  const test::TempFolder folder;
  const std::string path = Save(folder, Zones());
  const struct {
    ShapeRequest request;
    const char* attribute;
    const char* error;
  } rows[] = {
      {{}, "", ""},
      {{false, false, true, false, Kind::Whole}, "code", ""},
      {{false, false, true, false, Kind::Real}, "CODE", ""},
      {{false, false, true, false, Kind::Real}, "AREA", ""},
      {{true, true, false, false, {}}, "", "zones.shp: lines or points were expected, the file holds polygons"},
      {{false, false, true, false, Kind::Whole}, "NAME", "attribute NAME is text, a whole number was expected"},
      {{false, false, true, false, Kind::Whole},
       "AREA",
       "attribute AREA is a real number, a whole number was expected"},
      {{false, false, true, false, Kind::Whole}, "", "no attribute is selected"},
      {{false, false, true, false, Kind::Whole}, "DEPTH", "has no attribute DEPTH; it has: CODE, NAME, AREA"},
  };
  for (const auto& row : rows) {
    const FileResult result = CheckShapeFile(path, row.request, row.attribute);
    EXPECT_THAT(result.error, HasSubstr(row.error));
    EXPECT_EQ(result.Ok(), row.error[0] == '\0') << result.error;
  }
}

TEST(Shapes, TellWhatTheyAreWithoutBeingKept) {
  const test::TempFolder folder;
  const std::string path = Save(folder, Zones());
  const auto facts = ShapeFactsOf(path);
  EXPECT_EQ(facts->error, "");
  EXPECT_EQ(facts->fields, kColumns);
  EXPECT_EQ(facts->shapes, 3u);
  EXPECT_EQ(facts->withoutPoints, 1u);
  EXPECT_EQ(facts->extent, (Envelope{0, 0, 30, 10}));
  EXPECT_EQ(facts->projection, "EPSG:32632");
  // A table of other shapes, or none, is told apart from the shapes themselves.
  folder.Write("zones.dbf", test::ReadFile(folder.File("zones.dbf")).replace(4, 1, "\x02"));
  EXPECT_THAT(ShapeFactsOf(path)->tableProblem, HasSubstr("3 shapes, but"));
  EXPECT_EQ(CheckShapeFile(path, {}, "").error, "");
  EXPECT_THAT(CheckShapeFile(path, {false, false, true, false, Kind::Whole}, "CODE").error, HasSubstr("3 shapes, but"));
  std::filesystem::remove(folder.File("zones.dbf"));
  EXPECT_THAT(ShapeFactsOf(path)->tableProblem, HasSubstr("zones.dbf does not exist"));

  CTvnShapeData bow;
  bow.Create(ShapeKind::Polygon, {}, "");
  bow.AddShape({{{0, 0}, {4, 4}, {4, 0}, {0, 4}, {0, 0}}, {}, {}, {0}, {}});
  const FileResult checked = CheckShapeFile(Save(folder, bow), {}, "");
  EXPECT_EQ(checked.error, "");
  EXPECT_THAT(checked.note, HasSubstr("ring 1 crosses itself near 2, 2"));
  EXPECT_THAT(CheckShapeFile(Save(folder, CTvnShapeData()), {}, "").error, HasSubstr("holds no shape with points"));
}

TEST(Shapes, ThatCannotBeStoredAreNot) {
  const struct {
    Shape shape;
    const char* error;
  } rows[] = {
      {{{{0, 0}}, {}, {}, {0}, {std::int64_t{1}, std::string(255, 'x'), 1.0}},
       "shape 4: the text of NAME has 255 bytes"},
      {{{{0, 0}}, {}, {}, {0}, {1.5, "", 1.0}}, "shape 4: the value of CODE is not a whole number"},
      {{{{0, 0}}, {}, {}, {0}, {std::numeric_limits<std::int64_t>::min(), "", 1.0}}, "18 digits"},
      {{{{0, 0}}, {}, {}, {0}, {}}, "shape 4 has 0 values"},
      {{{{0, std::numeric_limits<double>::quiet_NaN()}}, {}, {}, {0}, {std::int64_t{1}, "", 1.0}},
       "shape 4 has a point"},
      {{{{0, 0}}, {1, 2}, {}, {0}, {std::int64_t{1}, "", 1.0}}, "shape 4 has not one z"},
  };
  for (const auto& row : rows) {
    const test::TempFolder folder;
    CTvnShapeData zones = Zones();
    zones.AddShape(row.shape);
    EXPECT_THAT(zones.SaveShapeFile(folder.File("zones.shp")).error, HasSubstr(row.error));
    EXPECT_TRUE(std::filesystem::is_empty(folder.Path()));
  }
}

TEST(Shapes, LeaveEveryOldFileWhenOneCannotBeWritten) {
  const test::TempFolder folder;
  const std::string path = Save(folder, Zones());
  const std::string shapes = test::ReadFile(path), table = test::ReadFile(folder.File("zones.dbf"));
  // A folder stands where the index is to be written, which is the last file but one.
  std::filesystem::remove(folder.File("zones.shx"));
  std::filesystem::create_directory(folder.File("zones.shx"));
  CTvnShapeData other;
  EXPECT_THAT(other.SaveShapeFile(path).error, HasSubstr("zones.shx"));
  EXPECT_EQ(test::ReadFile(path), shapes);
  EXPECT_EQ(test::ReadFile(folder.File("zones.dbf")), table);
  const auto files = std::filesystem::directory_iterator(folder.Path());
  EXPECT_EQ(std::distance(begin(files), end(files)), 5);
}

TEST(Shapes, HaveValuesAsTexts) {
  EXPECT_EQ(TextOf(ShapeValue("zone  ")), "zone");
  EXPECT_EQ(TextOf(ShapeValue(" ")), "");
  EXPECT_EQ(TextOf(ShapeValue(std::int64_t{-3})), "-3");
  EXPECT_EQ(TextOf(ShapeValue(3.0)), "3.000000");
  EXPECT_EQ(TextOf(ShapeValue()), "");
}

}  // namespace
}  // namespace tervane::shapes_test
