// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/library_editor.h"

#include <stdexcept>

#include <gmock/gmock.h>

#include "libraries/soils.h"
#include "libraries/vegetations.h"
#include "tests/support/page_driver.h"
#include "tests/support/temp_folder.h"

namespace tervane::library_editor_test {
namespace {

using testing::HasSubstr;

class EditedLibrary : public testing::Test {
 protected:
  test::TempFolder folder_;
  const std::string path_ = folder_.Write("c.etv",
                                          "target TERVANE_VEGETATION {\n"
                                          "section Vegetation_1 {\nName = \"Maize\"\nSource = \"FAO 56\"\n"
                                          "Stage = 100, 4.0, 1.0, 1.2\nStage = 0, 0.1, 0.2, nan\n}\n"
                                          "section Notes {\n}\n"
                                          "section Vegetation_2 {\nName = \"Grass\"\nStage = 0, 2.0, 0.5, 1.0\n}\n}\n");
  LibraryEditor editor_{kVegetationLibrary, path_};
  NobodyToAsk host_;
  std::unique_ptr<CYbSEDlgBase> page_ = editor_.MakePage(
      host_, [] {}, [] {});
  Control& Name() { return *page_->Form().Controls()[0]; }
  const std::string& NameOf(std::size_t entry) { return editor_.Content().entries[entry].Name(); }
};

TEST_F(EditedLibrary, PageShowsTheChosenEntry) {
  EXPECT_THAT(FormText(page_->Form()), HasSubstr("\"Name:\" = Maize"));
  EXPECT_THAT(FormText(page_->Form()), HasSubstr("\"Day\" | \"LAI\" | \"RD [m]\" | \"Kc\"\n"
                                                 "  100 | 4 | 1 | 1.2\n"
                                                 "  0 | 0.1 | 0.2 | \n"));
  EXPECT_THAT(FormText(page_->Form()),
              HasSubstr("3 series, 6 values, in 3 charts, over Day. Values are linear between"));
  ASSERT_EQ(page_->Node().Findings().size(), 2u);
  EXPECT_THAT(page_->Node().Findings()[0].text, HasSubstr("Stage 2: Kc is missing"));
  EXPECT_THAT(page_->Node().Findings()[1].text, HasSubstr("Stage 2: Day 0 stands behind 100"));
  editor_.Choose(1);
  EXPECT_THAT(FormText(page_->Form()), HasSubstr("\"Name:\" = Grass"));
  EXPECT_THAT(page_->Node().Findings()[0].text, HasSubstr("Maize: Stage 2"));
  EXPECT_FALSE(editor_.IsModified());
}

TEST_F(EditedLibrary, TypingInQuickSuccessionIsOneStep) {
  for (const char* name : {"M", "Ma", "Maize "}) EXPECT_EQ(page_->Enter(Name(), name), "");
  EXPECT_EQ(editor_.UndoName(), "Change Name");
  editor_.Undo();
  EXPECT_EQ(NameOf(0), "Maize");
  EXPECT_FALSE(editor_.CanUndo());
  EXPECT_FALSE(editor_.IsModified());
  editor_.Redo();
  EXPECT_EQ(NameOf(0), "Maize ");
  editor_.Choose(1);
  EXPECT_EQ(page_->Enter(Name(), "Maize "), "");
  EXPECT_THAT(page_->Node().Findings()[0].text, HasSubstr("has the same name"));
  editor_.Undo();
  EXPECT_EQ(NameOf(0), "Maize ");
  EXPECT_EQ(NameOf(1), "Grass");
}

TEST_F(EditedLibrary, ADeletedEntryLeavesWhatIsNotItsOwnAndComesBackWhole) {
  const Library before = editor_.Content();
  editor_.Choose(1);
  editor_.Delete();
  EXPECT_EQ(editor_.Current(), 0u);
  ASSERT_TRUE(editor_.Save(folder_.File("d.etv")).Ok());
  EXPECT_THAT(test::ReadFile(folder_.File("d.etv")), HasSubstr("section Notes"));
  editor_.Undo();
  EXPECT_TRUE(editor_.IsModified());
  EXPECT_EQ(editor_.Content().entries, before.entries);
  while (!editor_.Content().entries.empty()) editor_.Delete();
  EXPECT_THAT(FormText(page_->Form()), HasSubstr("The library has no vegetations."));
  EXPECT_EQ(page_->Enter(Name(), "x"), "this value cannot be changed here");
}

TEST(EditedSoils, ATextureIsOneStepAndModelsShowTheirOwnNumbers) {
  const test::TempFolder folder;
  LibraryEditor editor(kSoilLibrary, folder.Write("a.uzs", "target TERVANE_SOILS {\n}\n"));
  test::ScriptedHost host;
  const auto page = editor.MakePage(
      host, [] {}, [] {});
  const auto find = [&](std::string_view label) -> Control& {
    for (const auto& control : page->Form().Controls())
      if (control->label == label) return *control;
    throw std::runtime_error("no " + std::string(label));
  };
  editor.Add();
  host.Expect("Texture", std::optional(3));
  page->Press(find("Set from Texture"));
  EXPECT_EQ(host.Items().rows[3].cells.front(), "Loam");
  EXPECT_EQ(editor.UndoName(), "Set from Texture");
  EXPECT_FALSE(editor.HasFindings());
  EXPECT_EQ(find("Alpha:").Text(), "3.6");
  EXPECT_THAT(FormText(page->Form()), HasSubstr("2 series, 242 values, in 2 charts, over Suction"));
  EXPECT_EQ(page->Enter(find("n:"), "1"), "n is 1, a number above 1 and up to 20 was expected");
  // Another model has other numbers.
  EXPECT_EQ(page->Enter(find("Retention:"), "2"), "");
  EXPECT_FALSE(find("Alpha:").IsShown());
  EXPECT_TRUE(find("b:").IsShown());
  EXPECT_FALSE(editor.HasFindings());
  editor.Undo();
  editor.Undo();
  EXPECT_EQ(find("Source:").Text(), "");
  host.Expect("Texture", std::optional<int>());
  page->Press(find("Set from Texture"));
  EXPECT_EQ(editor.UndoName(), "Add Soil");
}

TEST(EditedSoils, AModelThatIsChosenIsReadAgainAndTheRefusedLineStaysAsAComment) {
  test::TempFolder folder;
  const std::string path = folder.Write("a.uzs",
                                        "target TERVANE_SOILS {\nsection Soil_1 {\nName = \"Loam\"\n"
                                        "Retention = \"van genuchten\", 0.43, 0.078, 3.6, 1.56  # of 1998\n"
                                        "Retention = 7\n"
                                        "Conductivity = \"Mualem\", 2.889e-6, 0.5\nBulkDensity = 1500.0\n}\n}\n");
  LibraryEditor editor(kSoilLibrary, path);
  NobodyToAsk host;
  const auto page = editor.MakePage(
      host, [] {}, [] {});
  const auto control = [&](const std::string& label) -> Control& {
    for (const auto& each : page->Form().Controls())
      if (each->label == label && each->IsShown()) return *each;
    throw std::runtime_error(label);
  };
  // Another value leaves the line as it stands.
  ASSERT_EQ(page->Enter(control("Bulk density:"), "1600"), "");
  ASSERT_TRUE(editor.Save(path).Ok());
  EXPECT_THAT(test::ReadFile(path), HasSubstr("\n    Retention = \"van genuchten\", 0.43"));
  EXPECT_FALSE(FindSoil(path, "Loam"));

  ASSERT_EQ(page->Enter(control("Retention:"), "2"), "");
  EXPECT_THAT(page->Node().Findings(), testing::IsEmpty());
  ASSERT_TRUE(editor.Save(path).Ok());
  EXPECT_THAT(test::ReadFile(path), HasSubstr("\n    Retention = \"Campbell\""));
  EXPECT_THAT(test::ReadFile(path), HasSubstr("    # Retention = \"van genuchten\", 0.43, 0.078, 3.6, 1.56\n"));
  EXPECT_THAT(test::ReadFile(path), HasSubstr("    # Retention = 7\n"));
  EXPECT_THAT(test::ReadFile(path), HasSubstr("# of 1998\n"));
  ASSERT_TRUE(FindSoil(path, "Loam"));
  EXPECT_EQ(FindSoil(path, "Loam")->retention, Soil::Retention::Campbell);
  editor.Undo();
  EXPECT_FALSE(page->Node().Findings().empty());
}

}  // namespace
}  // namespace tervane::library_editor_test
