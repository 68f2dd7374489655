// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/result_catalogue_file.h"

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::result_catalogue_file_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

struct Item {
  const char* name;
  const char* file;
  int number, dataType;
};

std::string CatalogueText(int version, const std::vector<Item>& items, const std::string& sectionName = "Item") {
  std::string text = fmt::format(
      "target TVDRES {{\nsection general {{\nsection version {{\nVersionNumber = {}\n}}\n}}\nsection Items "
      "{{\nNrofItems "
      "= {}\n",
      version, items.size());
  int number = 0;
  for (const Item& item : items)
    text += fmt::format("section {} {{\nName = \"{}\"\nFilename = file \"{}\"\nItemno = {}\nDataType = {}\n}}\n",
                        sectionName.ends_with('_') ? fmt::format("{}{}", sectionName, ++number) : sectionName,
                        item.name, item.file, item.number, item.dataType);
  return text + "}\nsection DATA_AREA {\nx0 = 1.0\ny0 = 2.0\nx1 = 3.0\ny1 = 4.0\nMapProj = \"LOCAL\"\n}\n}\n";
}

std::vector<std::string> Names(const StoredItems& stored) {
  std::vector<std::string> names;
  for (const StoredItem& item : stored.items) names.push_back(item.name + (item.mayHaveVectors ? " with flow" : ""));
  return names;
}

struct CatalogueFile : testing::Test {
  test::TempFolder folder;
  StoredItems stored;
};

TEST_F(CatalogueFile, ItemsWithAFileAreTaken) {
  for (const char* name : {"Item", "Item_"}) {
    const std::string path = folder.Write(
        "a.tvdres",
        CatalogueText(1001, {{"head", "sub/a.nds3", 2, 80}, {"none", "", 1, 1}, {"depth", "b.nds2", 1, 61}}, name));
    EXPECT_EQ(ReadStoredItems(path, true, stored), "");
    EXPECT_THAT(Names(stored), ElementsAre("head", "depth")) << name;
    EXPECT_EQ(stored.items[0].path, folder.File("sub/a.nds3"));
    EXPECT_EQ(stored.items[0].item, 2);
    EXPECT_EQ(stored.area, (DataArea{1, 2, 3, 4}));
    EXPECT_EQ(stored.projection, "LOCAL");
  }
  // The second catalogue adds its items, and sets the area anew.
  std::string text = CatalogueText(1200, {{"salt", "c.nds2", 1, 1}});
  text.replace(text.find("DATA_AREA"), 9, "OTHER");
  const std::string second = folder.Write("b.TvdWQres", text);
  EXPECT_EQ(ReadStoredItems(second, false, stored), "");
  EXPECT_THAT(Names(stored), ElementsAre("head", "depth", "salt"));
  EXPECT_EQ(stored.area, (DataArea{0, 0, 100, 100}));
  // What is not there adds nothing, and clears all the same.
  EXPECT_EQ(ReadStoredItems(folder.File("none.tvdres"), false, stored), "");
  EXPECT_EQ(stored.items.size(), 3U);
  EXPECT_EQ(ReadStoredItems("", true, stored), "");
  EXPECT_THAT(stored.items, IsEmpty());
}

TEST_F(CatalogueFile, FlowIsDrawnOverGroundwaterWhereBothDirectionsAreStored) {
  const std::vector<Item> flows = {{"x", "a.nds3", 1, 102}, {"y", "a.nds3", 2, 103}};
  std::vector<Item> items = {{"depth", "a.nds2", 1, 61}, {"unknown", "a.nds2", 2, 99999}};
  EXPECT_EQ(ReadStoredItems(folder.Write("a.tvdres", CatalogueText(1001, items)), true, stored), "");
  EXPECT_THAT(Names(stored), ElementsAre("depth", "unknown"));
  items.push_back(flows[0]);
  EXPECT_EQ(ReadStoredItems(folder.Write("b.tvdres", CatalogueText(1001, items)), true, stored), "");
  EXPECT_THAT(Names(stored), ElementsAre("depth", "unknown", "x"));
  items.push_back(flows[1]);
  EXPECT_EQ(ReadStoredItems(folder.Write("c.tvdres", CatalogueText(1001, items)), true, stored), "");
  EXPECT_THAT(Names(stored), ElementsAre("depth", "unknown", "x with flow", "y with flow"));
}

TEST_F(CatalogueFile, VersionsAndTextsThatCannotBeUsedAreTold) {
  const struct {
    std::string text;
    const char* message;
  } cases[] = {
      {CatalogueText(1000, {{"a", "a.nds2", 1, 1}}), "is from a simulation with Tervane version 2002:\nPATH\n\nAuto"},
      {CatalogueText(1, {}), "requires Tervane version 2003 or newer."},
      {CatalogueText(0, {}), "Error when reading version info from catalogue file:\nPATH\n\nAutogeneration of"},
      {CatalogueText(-5, {}), "Error when reading version info"},
      {"target TVDRES {\n}\n", "Error when reading version info"},
      {"target Other {\n}\n", "Error when reading version info"},
      {CatalogueText(1001, {{"a", "a.nds2", 1, 1}}).substr(0, 150),
       "\n\nSyntax error in file name catalogue file:\nPATH"},
  };
  for (const auto& c : cases) {
    const std::string path = folder.Write("a.tvdres", c.text);
    std::string expected = c.message;
    if (const auto at = expected.find("PATH"); at != std::string::npos) expected.replace(at, 4, path);
    EXPECT_THAT(ReadStoredItems(path, true, stored), HasSubstr(expected));
    EXPECT_THAT(stored.items, IsEmpty());
  }
  // More are counted than there are.
  std::string counted = CatalogueText(1001, {{"a", "a.nds2", 1, 1}});
  counted.replace(counted.find("NrofItems = 1"), 13, "NrofItems = 2000000000");
  EXPECT_EQ(ReadStoredItems(folder.Write("many.tvdres", counted), true, stored), "");
  EXPECT_EQ(stored.items.size(), 1U);
}

TEST_F(CatalogueFile, WhatIsWrittenIsReadAgain) {
  stored.items = {{"head", folder.File("a.nds3"), 2, 80, false}, {"a \"b\"", folder.File("sub/b.nds2"), 1, 61, false}};
  stored.area = {1, 2, 3, 4};
  stored.projection = "LOCAL";
  const std::string path = folder.File("a.tvdres");
  for (int times = 0; times < 2; ++times) EXPECT_EQ(WriteStoredItems(path, stored, "mine"), "");
  StoredItems read;
  EXPECT_EQ(ReadStoredItems(path, true, read), "");
  EXPECT_EQ(read.items, stored.items);
  EXPECT_EQ(read.area, stored.area);
  EXPECT_EQ(read.projection, "LOCAL");
  // What another engine has left, or what is no catalogue at all, stays.
  for (const std::string& text : {CatalogueText(1001, {{"own", "a.nds2", 1, 1}}), std::string("notes")}) {
    folder.Write("a.tvdres", text);
    EXPECT_THAT(WriteStoredItems(path, stored, "mine"), HasSubstr("is the catalogue of another engine"));
    EXPECT_EQ(test::ReadFile(path), text);
  }
}

TEST_F(CatalogueFile, TheSetupTellsWhichCataloguesCount) {
  const CatalogueFiles files{folder.Write("own.tvdres", CatalogueText(1001, {{"own", "a.nds2", 1, 1}})),
                             folder.Write("own.TvdWQres", CatalogueText(1001, {{"quality", "a.nds2", 1, 1}}))};
  const std::string other = folder.Write("other.tvdres", CatalogueText(1001, {{"other", "a.nds2", 1, 1}}));
  CFlowModelDoc document;
  CModelCompKvf& components = *document.Root().Important(kModelComponents);
  components.FilenameTvdRes = FileName(other, {});
  std::vector<CatalogueProblem> problems;
  EXPECT_THAT(Names(ReadCatalogues(components, files, problems)), ElementsAre("own"));
  components.WQ = 1;
  EXPECT_THAT(Names(ReadCatalogues(components, files, problems)), ElementsAre("own", "quality"));
  components.UseCurrentWmSimulation = 0;
  EXPECT_THAT(Names(ReadCatalogues(components, files, problems)), ElementsAre("other", "quality"));
  EXPECT_THAT(problems, IsEmpty());
  folder.Write("own.TvdWQres", "target");
  EXPECT_THAT(Names(ReadCatalogues(components, files, problems)), ElementsAre("other"));
  ASSERT_EQ(problems.size(), 1U);
  EXPECT_EQ(problems[0].path, files.waterQuality);
}

}  // namespace
}  // namespace tervane::result_catalogue_file_test
