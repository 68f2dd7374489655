// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "access/setup_keys.h"

#include <filesystem>

#include <gmock/gmock.h>

#include "access/key_units.h"
#include "access/setup_place.h"
#include "access/written_setup.h"
#include "core/kvf_writer.h"
#include "tests/support/setup.h"

namespace tervane::setup_keys_test {
namespace {

using testing::HasSubstr;

const std::string kExamples = TERVANE_SOURCE_DIR "/examples/";

/// Of the variants of one catchment the one with the most keys.
std::vector<std::string> Examples() {
  std::vector<std::string> files;
  for (const auto& entry : std::filesystem::recursive_directory_iterator(kExamples))
    if (entry.path().extension() == ".tvd" &&
        (entry.path().parent_path().filename() != "rhone" || entry.path().stem() == "rhone_quality"))
      files.push_back(entry.path().string());
  std::ranges::sort(files);
  return files;
}

std::vector<CYbSEKvfBase*> NodesOf(const CFlowModelDoc& document) {
  std::vector<CYbSEKvfBase*> nodes;
  WalkNodes(document.Root(), [&](const NodePlace& place) { nodes.push_back(&place.node); });
  return nodes;
}

std::vector<std::string> Lines(const auto& keys) {
  std::vector<std::string> lines;
  for (const KvfNode* key : keys) lines.push_back(std::string(key->Name()) + " = " + KvfValuesText(*key));
  std::ranges::sort(lines);
  return lines;
}

std::vector<std::string> Lines(const KvfSection& section) {
  std::vector<const KvfNode*> keys;
  for (const KvfNode* key = section.firstChild; key; key = key->next)
    if (key->IsKeyword()) keys.push_back(key);
  return Lines(keys);
}

std::string SetAt(CFlowModelDoc& document, const std::string& typedPath, std::string_view typed) {
  std::string problem;
  const SetupPath path = ParseSetupPath(typedPath);
  CYbSEKvfBase* node = FindNodeOrTell(document.Root(), path, typedPath, problem);
  return node ? SetupKeys(document).Set(*node, path.key, typed) : problem;
}

TEST(SetupKeys, AreThoseThatTheFileWouldHold) {
  for (const std::string& file : Examples()) {
    SCOPED_TRACE(file);
    CFlowModelDoc document;
    ASSERT_TRUE(document.OnOpenDocument(file)) << document.Error();
    const WrittenSetup written(document);
    SetupKeys keys(document);
    for (CYbSEKvfBase* node : NodesOf(document)) {
      const KvfSection* section = node->GetSectionName().empty() ? nullptr : written.SectionOf(*node);
      // Of results to store the file has the order of the catalogue.
      if (!section || PathOf(*node).starts_with("StoringOfResults/GridSeriesOutput")) continue;
      EXPECT_EQ(Lines(keys.KeysOf(*node)), Lines(*section)) << PathOf(*node);
    }
  }
}

// A value that is set anew must disturb nothing: neither other keys nor items, zones, stations and links.
TEST(SetupKeys, TakeTheValuesThatTheyHaveAndLeaveTheSetupAsItIs) {
  for (const std::string& file : Examples()) {
    SCOPED_TRACE(file);
    CFlowModelDoc document;
    ASSERT_TRUE(document.OnOpenDocument(file)) << document.Error();
    SetupKeys keys(document);
    const std::string before = test::SavedText(document);
    std::size_t refused = 0, taken = 0;
    for (CYbSEKvfBase* node : NodesOf(document)) {
      std::vector<std::pair<std::string, std::vector<PlainValue>>> values;
      for (const KvfNode* key : keys.KeysOf(*node)) {
        std::vector<PlainValue> own;
        for (std::uint32_t i = 0; i < key->count; ++i) own.push_back(PlainValueOf(key->params[i]));
        if (key->count > 1 && key->params[0].type == KvfType::Filename) own.resize(1);
        values.emplace_back(key->Name(), own);
      }
      for (const auto& [name, own] : values)
        (keys.Set(*node, {name, 1}, std::span(own)).empty() ? taken : refused) += 1;
    }
    EXPECT_EQ(test::SavedText(document), before);
    EXPECT_GT(taken, 3 * refused / 2);
  }
}

TEST(SetupKeys, TakeTypedValuesInPlace) {
  CFlowModelDoc document;
  const CYbSEKvfBase* node = FindNode(document.Root(), ParseSetupPath("SimSpec/SimTitle").steps);
  const struct {
    const char *path, *typed, *saved;
  } cases[] = {
      {"SimSpec/SimTitle:Title", "A, b", "A, b"},
      {"SimSpec:ModelType", "2", "2"},
      {"SimSpec/SimulationPeriod:SIMSTART", "2003-02-01", "2003, 2, 1, 0, 0"},
      {"SimSpec/CompControlParaTimeStep:InitialTimeStep", "2 days", "48"},
  };
  for (const auto& row : cases) {
    EXPECT_EQ(SetAt(document, row.path, row.typed), "") << row.path;
    EXPECT_EQ(test::ValueOf(document, row.path), row.saved);
  }
  EXPECT_EQ(FindNode(document.Root(), ParseSetupPath("SimSpec/SimTitle").steps), node);
}

TEST(SetupKeys, TellWhatTheyDoNotTake) {
  CFlowModelDoc document;
  const std::string before = test::SavedText(document);
  const struct {
    const char *path, *typed, *problem;
  } cases[] = {
      {"SimSpec:ModelTyp", "2", "there is no key ModelTyp here; did you mean ModelType?"},
      {"SimSpex:ModelType", "2", "there is no SimSpex here; did you mean SimSpec?"},
      {"SimSpec:ModelType", "two", "was expected"},
      {"SimSpec:Touched", "1", "it is made when the setup is saved"},
      {"ExtraParams:YbSEKvfListItemCount", "4", "insert or delete"},
      {"SimSpec/CompControlParaTimeStep:InitialTimeStep", "2 kg", "a unit that converts to hours"},
  };
  for (const auto& row : cases) EXPECT_THAT(SetAt(document, row.path, row.typed), HasSubstr(row.problem)) << row.path;
  EXPECT_EQ(test::SavedText(document), before);
}

TEST(SetupKeys, TakeValuesOfProgramsWhereNothingIsLost) {
  CFlowModelDoc document;
  SetupKeys keys(document);
  CYbSEKvfBase& node = *FindNode(document.Root(), ParseSetupPath("SimSpec").steps);
  const auto set = [&](PlainValue value) { return keys.Set(node, {"ModelType", 1}, std::span(&value, 1)); };
  EXPECT_EQ(set(std::int64_t{2}), "");
  EXPECT_EQ(set(3.0), "");
  EXPECT_THAT(set(2.5), HasSubstr("a whole number"));
  EXPECT_THAT(set(std::int64_t{1} << 40), HasSubstr("a whole number"));
  EXPECT_THAT(set(std::string("2")), HasSubstr("a number was expected"));
  EXPECT_EQ(test::ValueOf(document, "SimSpec:ModelType"), "3");
}

TEST(SetupKeys, OfAnOldFileAreTakenToo) {
  CFlowModelDoc document;
  ASSERT_TRUE(document.OpenText(test::SetupText(3, ""), "old.tvd")) << document.Error();
  SetupKeys reading(document);
  for (CYbSEKvfBase* node : NodesOf(document))
    for (const KvfNode* key : reading.KeysOf(*node))
      if (key->count == 1 && key->params[0].type == KvfType::Float) {
        const PlainValue value = 0.5;
        const std::string problem = SetupKeys(document).Set(*node, {std::string(key->Name()), 1}, {&value, 1});
        EXPECT_EQ(problem, "");
        break;
      }
}

TEST(KeyUnits, ConvertBothWays) {
  KeyFacts hours;
  hours.unit = "hours";
  std::string problem;
  const auto days = UnitsBetween(hours, "days", problem);
  ASSERT_TRUE(days) << problem;
  EXPECT_EQ(days->toOther(48), 2);
  EXPECT_EQ(days->fromOther(2), 48);
  for (const auto& [facts, unit, why] :
       {std::tuple(hours, "m", "does not convert"), std::tuple(hours, "no unit", "no unit that is known"),
        std::tuple(KeyFacts(), "m", "the key has no unit")}) {
    EXPECT_FALSE(UnitsBetween(facts, unit, problem));
    EXPECT_THAT(problem, HasSubstr(why));
  }
}

TEST(SetupKeys, WhatWasGivenOfANodeOutlivesThatMuchIsKept) {
  CFlowModelDoc document;
  SetupKeys keys(document);
  std::string problem;
  CYbSEKvfBase* title = FindNodeOrTell(document.Root(), ParseSetupPath("SimSpec/SimTitle"), "", problem);
  ASSERT_TRUE(title) << problem;
  ASSERT_EQ(keys.Set(*title, {"Description", 1}, std::string(std::size_t{20} << 20, 'x')), "");
  ASSERT_TRUE(keys.Find(*title, {"Title", 1}, problem)) << problem;
  // A change that these keys are not told of shows whether they were made anew.
  ASSERT_EQ(SetupKeys(document).Set(*title, {"Title", 1}, "new"), "");
  EXPECT_TRUE(keys.InfoOf(*title, "Title"));
  EXPECT_EQ(keys.Find(*title, {"Title", 1}, problem)->params[0].Text(), "");
  keys.Forget();
  EXPECT_EQ(keys.Find(*title, {"Title", 1}, problem)->params[0].Text(), "new");
}

}  // namespace
}  // namespace tervane::setup_keys_test
