// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/template_view.h"

#include <gmock/gmock.h>

#include "forms/table_form.h"
#include "tests/support/temp_folder.h"

namespace tervane::template_view_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;

const std::string kOxygen = TERVANE_SOURCE_DIR "/examples/oxygen.kinetra";

/// The page of a template, worked as a user works it.
class Shown {
 public:
  explicit Shown(TemplateView& view) : page_(view.MakePage(host_, [this] { ++syncs; })) {}

  TableForm& Table() const {
    for (const auto& control : page_->Form().Controls())
      if (control->table) return *control->table;
    throw std::logic_error("no table");
  }
  std::string Choose(int kind) {
    Control& choice = *page_->Form().Controls().front();
    page_->Enter(choice, choice.OptionValue(kind));
    page_->Form().Follow();
    return choice.Options()[static_cast<std::size_t>(kind)];
  }
  std::vector<std::string> Heads() const {
    std::vector<std::string> heads;
    for (int column = 1; column <= Table().ColumnCount(); ++column) heads.push_back(Table().Head(column));
    return heads;
  }

  int syncs = 0;

 private:
  NobodyToAsk host_;
  std::unique_ptr<CYbSEDlgBase> page_;
};

TEST(TemplateView, ShowsAllDeclarationsOrThoseOfOneKindWithTheirOwnColumns) {
  TemplateView view(kOxygen);
  ASSERT_EQ(view.Problem(), "");
  Shown shown(view);
  const int all = shown.Table().RowCount();
  EXPECT_EQ(shown.Table().ShownCell(1, 2), "Oxygen");
  EXPECT_EQ(shown.Choose(1), "State variables (4)");
  EXPECT_EQ(shown.syncs, 1);
  EXPECT_EQ(shown.Table().RowCount(), 4);
  EXPECT_THAT(shown.Heads(), ElementsAre("Symbol", "Description", "Unit", "Default", "Minimum", "Maximum", "Expression",
                                         "Type", "Stored", "Scope"));
  int others = 0;
  for (int kind = 2; kind <= 6; ++kind) {
    shown.Choose(kind);
    others += shown.Table().RowCount();
  }
  EXPECT_EQ(others + 4, all);
  EXPECT_THAT(shown.Heads(), ElementsAre("Description", "Unit", "Expression", "Type", "Stored", "Scope"));
}

TEST(TemplateView, IsFilteredSortedAndCopiedAsOtherTables) {
  TemplateView view(kOxygen);
  Shown shown(view);
  shown.Choose(1);
  TableForm& table = shown.Table();
  table.SortBy(1);
  EXPECT_EQ(table.ShownCell(1, 1), "Ammonium");
  table.Filter("nitrite");
  ASSERT_EQ(table.RowCount(), 1);
  EXPECT_THAT(table.CopyText({1, 1, 1, 5}), HasSubstr("Nitrate\tNitrogen of nitrate; nitrite is not told apart\t"));
  EXPECT_TRUE(table.IsReadOnly(1, 1));
}

TEST(TemplateView, FollowsTheDiskAndTellsWhatIsWrong) {
  const test::TempFolder folder;
  const std::string path = folder.Write("a.kinetra",
                                        "target KINETRA_SETUP {\nsection CONSTANTS {\nsection CONSTANT_1 {\n"
                                        "SYMBOL = \"k\"\nDEFAULT_VALUE = 0.5\n}\n}\n}\n");
  TemplateView view(path);
  EXPECT_FALSE(view.Reopen());
  {
    Shown shown(view);
    ASSERT_EQ(shown.Table().RowCount(), 1);
    EXPECT_EQ(shown.Table().CopyText({1, 1, 1, 7}), "Constant\tk\t\t-\t0.5\t\tuser\n");
  }
  folder.Write("a.kinetra", "target OTHER {\n}\n");
  EXPECT_TRUE(view.Reopen());
  EXPECT_THAT(view.Problem(), HasSubstr("holds no target KINETRA_SETUP"));
  EXPECT_EQ(Shown(view).Table().RowCount(), 0);
}

}  // namespace
}  // namespace tervane::template_view_test
