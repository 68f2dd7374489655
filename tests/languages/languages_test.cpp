// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "languages/languages.h"

#include <filesystem>
#include <map>
#include <set>

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "document/flow_model_document.h"
#include "forms/page.h"
#include "forms/table_form.h"
#include "pages/tree_entries.h"
#include "platform/text.h"
#include "platform/units.h"
#include "tests/support/rich_setups.h"
#include "tests/support/setup.h"

namespace tervane::languages_test {
namespace {

const Translations& German() { return CatalogueOf("de"); }

/// Names and signs that are the same in both languages.
bool IsSameInGerman(const std::string& text) {
  static const std::set<std::string> same = {
      "-", ":", "GeoScene3D", "RK4", "RKQC",        "R",   "R2",   "KGE",   "MAE", "ME",  "PBIAS [%]", "RMSE", "STDres",
      "X", "Y", "X0:",        "Y0:", "(0.01-0.99)", "n =", "dt =", "Parks", "LHH", "LVV", "TVH",       "THH",  "THV"};
  return text.empty() || same.contains(text);
}

/// What pages of setups show, each text with the place where it was seen first.
class ShownTexts {
 public:
  void AddPages(CFlowModelDoc& document) {
    NobodyToAsk host;
    WalkNodes(document.Root(), [&](const NodePlace& place) {
      for (const int tree : {kSetupDataTree, kProcessedDataTree, kResultsTree}) {
        const PageClass* page = place.node.GetDlgRuntimeClass(tree);
        if (!page) continue;
        place_ = place.path;
        Add(place.node.GetTitle());
        Add(ShortTitle(place.node));
        const auto made = MakePageToRead(*page, place.node, {document, host, {}});
        if (made) made->Form().ForEach([this](const Control& control) { AddControl(control); });
      }
    });
  }

  void AddFindings(CFlowModelDoc& document) {
    WalkNodes(document.Root(), [&](const NodePlace& place) {
      place_ = "finding of " + place.path;
      for (const Finding& finding : place.node.Findings()) {
        Add(finding.text);
        Add(finding.detail);
      }
    });
  }

  /// Those that stay English, each with its place.
  std::vector<std::string> English() const {
    std::vector<std::string> texts;
    for (const auto& [text, place] : texts_)
      if (!German().Finished(text)) texts.push_back(fmt::format("{}: {}", place, Replaced(text, "\n", "\\n")));
    return texts;
  }

 private:
  void AddControl(const Control& control) {
    for (const std::string* text : {&control.label, &control.toolTip}) Add(*text);
    for (const std::string& option : control.Options()) Add(option);
    if (control.kind == ControlKind::Notice) Add(control.Text());
    if (!control.table) return;
    Add(control.table->ToAllRowsCommand());
    for (const TableColumn& column : control.table->Columns()) {
      Add(column.head);
      Add(column.toolTip);
      for (const CellChoice& choice : column.choices) Add(choice.text);
    }
  }
  void Add(const std::string& text) {
    if (!IsSameInGerman(text)) texts_.emplace(text, place_);
  }

  std::string place_;
  std::map<std::string, std::string> texts_;
};

std::vector<std::string> Examples() {
  std::vector<std::string> paths;
  for (const auto& entry : std::filesystem::recursive_directory_iterator(std::string(TERVANE_SOURCE_DIR) + "/examples"))
    if (entry.path().extension() == ".tvd") paths.push_back(entry.path().string());
  return paths;
}

TEST(Languages, CataloguesReadWithoutAFaultAndEnglishNeedsNone) {
  EXPECT_EQ(German().Problem(), "");
  EXPECT_GT(German().Texts().size(), 1000u);
  EXPECT_TRUE(CatalogueOf("en").Texts().empty());
  EXPECT_TRUE(CatalogueOf("xx").Texts().empty());
  EXPECT_EQ(LanguageCodes(), "en or de");
}

TEST(Languages, NoTemplateTakesTheTextsOfAnother) {
  for (const std::string& text : German().Templates()) {
    std::string english = text, german = *German().Exact(text);
    for (char number = '1'; number <= '9'; ++number) {
      const std::string place{'%', number}, value = fmt::format("0{}x", number);
      english = Replaced(english, place, value);
      german = Replaced(german, place, value);
    }
    const auto found = German().Finished(english);
    // Without a letter of its own it says nothing of values that are no texts.
    EXPECT_EQ(found.value_or(german), german) << text;
  }
}

TEST(Languages, PagesShowNoTextThatHasNoGerman) {
  ShownTexts shown;
  for (const char* sections : test::kRichSetups) {
    CFlowModelDoc document;
    ASSERT_TRUE(document.OpenText(test::SetupText(14, sections), "a.tvd"));
    shown.AddPages(document);
  }
  EXPECT_THAT(shown.English(), testing::IsEmpty());
}

TEST(Languages, FindingsOfTheExamplesAreGerman) {
  ShownTexts shown;
  for (const std::string& path : Examples()) {
    CFlowModelDoc document;
    if (document.OnOpenDocument(path)) shown.AddFindings(document);
  }
  EXPECT_THAT(shown.English(), testing::IsEmpty());
}

TEST(Languages, UnitsAndQuantitiesHaveGermanNames) {
  for (const Unit& unit : AllUnits()) EXPECT_TRUE(German().Exact(unit.text)) << unit.text;
  for (const ItemType& itemType : AllItemTypes()) EXPECT_TRUE(German().Exact(itemType.name)) << itemType.name;
}

}  // namespace
}  // namespace tervane::languages_test
