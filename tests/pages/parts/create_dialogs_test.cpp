// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/parts/create_dialogs.h"

#include <functional>

#include <gmock/gmock.h>

#include "document/flow_model_document.h"
#include "platform/files.h"
#include "platform/units.h"
#include "spatial/data2d.h"
#include "tests/support/page_driver.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::create_dialogs_test {
namespace {

using testing::HasSubstr;

class CreateDialogs : public testing::Test {
 protected:
  CreateDialogs() { EXPECT_TRUE(document.OnSaveDocument(folder.File("setup.tvd"))); }

  /// A context whose dialogs are filled in by `fill` and accepted; what keeps a dialog open is put into `problem`.
  PageContext Context(std::function<void(PageForm&)> fill) {
    PageContext context{document, host, {}};
    context.displayUnits = &units;
    context.runDialog = [this, fill = std::move(fill)](const std::string&, CYbSEDlgBase& form,
                                                       const std::function<std::string()>& accept) {
      fill(form.Form());
      problem = accept();
      return problem.empty();
    };
    return context;
  }
  static Control& Find(PageForm& form, std::string_view label) {
    Control* found = nullptr;
    form.ForEach([&](Control& control) {
      if (!found && control.label == label) found = &control;
    });
    EXPECT_TRUE(found) << label;
    return *found;
  }

  test::TempFolder folder;
  CFlowModelDoc document;
  test::ScriptedHost host;
  DisplayUnits units;
  std::string problem;
};

TEST_F(CreateDialogs, AGridOfOneValueIsWrittenInTheUnitOfTheUser) {
  CData2DKvf& topography = *document.Root().Important(kTopography);
  const ItemType& elevation = *FindItemType(quantity::kElevation);
  ASSERT_TRUE(units.Choose(quantity::kElevation, elevation.unitKeys[1]));
  CData2DNdsCreateDlg dialog(Context([](PageForm& form) {
                               EXPECT_EQ(Find(form, "Fixed Value:").enter("2 m"), "");
                               EXPECT_EQ(Find(form, "NX:").enter("2"), "");
                             }),
                             0, topography, quantity::kElevation);
  const auto file = dialog.Run();
  ASSERT_TRUE(file) << problem;
  topography.Type = CData2DKvf::kGridFile;
  topography.GridFile().Choose(*file);
  const auto grid = topography.GetGridData(&problem);
  ASSERT_TRUE(grid) << problem;
  EXPECT_NEAR(grid->Value(1, 0), 2.0F, 1e-6F) << "a setup computes in the base unit";
  EXPECT_THAT(test::ReadFile(file->Absolute()), HasSubstr(std::string(FindUnit(elevation.unitKeys[1])->udunits)));
}

TEST_F(CreateDialogs, ADomainIsFittedToAShapeFileThatIsTypedOrMade) {
  CData2DShpCreateDlg dialog(Context([](PageForm&) {}), document.Root(), "ModelDomain");
  const auto file = dialog.Run();
  ASSERT_TRUE(file) << problem;
  EXPECT_EQ(file->Text(), "ModelDomain.shp");
  EXPECT_TRUE(FileExists(folder.File("ModelDomain.dbf")));

  test::PageDriver page(document, "Catchment");
  page.Enter("type", "1");
  page.Outside().Expect("Shape axis units", std::optional<int>());
  EXPECT_THAT(page.Enter("Filename:", TERVANE_SOURCE_DIR "/examples/rhone/domain.shp"), HasSubstr("unit"));
  EXPECT_EQ(page.Find("Filename:").Text(), "") << "giving up changes nothing";
  page.Outside().Expect("Shape axis units", std::optional(0));
  EXPECT_EQ(page.Enter("Filename:", TERVANE_SOURCE_DIR "/examples/rhone/domain.shp"), "");
  EXPECT_TRUE(page.Outside().IsDone());
  EXPECT_NE(page.Find("X0:").Text(), "0");

  page.Outside().Expect("Take Grid from File",
                        std::optional<std::string>(TERVANE_SOURCE_DIR "/examples/rhone/dem.tif"));
  page.Page().Press(page.Find("Take Grid from File..."));
  EXPECT_EQ(page.Find("NX:").Text() + " " + page.Find("NY:").Text() + " " + page.Find("Cell Size:").Text(),
            "142 97 1000");
  EXPECT_THAT(page.Find("Map Projection Type:").Text(), HasSubstr("UTM zone 32N"));
  EXPECT_EQ(page.Changes().back(), "1 Take Grid from File");
}

}  // namespace
}  // namespace tervane::create_dialogs_test
