// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/surface/overland_pages.h"

#include <functional>

#include <gmock/gmock.h>

#include "simspec/control_parameters.h"
#include "simspec/model_components.h"
#include "surface/overland.h"
#include "tests/support/page_driver.h"
#include "tests/support/temp_folder.h"

namespace tervane::overland_pages_test {
namespace {

TEST(OverlandPages, AnExchangeIsReducedOnlyWhereThereIsOne) {
  constexpr const char *kReduced = "Reduced vertical exchange in specified areas",
                       *kPonded = "In specified areas, reduce exchange only for ponded areas",
                       *kPaved = "Reduce vertical exchange by paved area fraction";
  CFlowModelDoc document;
  auto& components = *document.Root().Important(kModelComponents);
  auto& control = *document.Root().Important(kOverlandControl);
  test::PageDriver page(document, "Overland");
  const auto enabled = [&] {
    std::string text;
    for (const char* label : {kReduced, kPonded, kPaved}) text += page.IsEnabled(label) ? '1' : '0';
    return text;
  };
  const struct {
    const char* what;
    std::function<void()> change;
    const char* expected;
  } steps[] = {
      {"new", [] {}, "100"},
      {"ticked", [&] { page.Enter(kReduced, "1"); }, "101"},
      {"explicit without multicells", [&] { control.SolverOption = 1; }, "101"},
      {"with multicells", [&] { control.Multicell = 1; }, "111"},
      {"another solver", [&] { control.SolverOption = 0; }, "101"},
      {"without any ground", [&] { components.UZ = components.SZ = 0, control.SolverOption = 1; }, "001"},
      {"with a ground of reservoirs", [&] { components.SZ = components.SZ_ModelType = 1; }, "001"},
      {"with a ground of cells", [&] { components.SZ_ModelType = 0; }, "111"},
      {"not ticked", [&] { page.Enter(kReduced, "0"); }, "100"},
  };
  for (const auto& step : steps) {
    step.change();
    EXPECT_EQ(enabled(), step.expected) << step.what;
  }
}

TEST(OverlandPages, DrainageOptionsAreStoredByTheirPlace) {
  CFlowModelDoc document;
  auto& drainage = *document.Root().Important(kPondedDrainage);
  test::PageDriver page(document, "Overland/Drainage");
  Control& options = page.Find("DrainageOption");
  for (int place = 0; place < 4; ++place) {
    EXPECT_EQ(page.Page().Enter(options, options.OptionValue(place)), "");
    EXPECT_EQ(drainage.DrainageOption, place + 1);
  }
}

TEST(OverlandPages, AShapeFileOfPondedAreasIsAskedForInWordsOfItsOwn) {
  CFlowModelDoc document;
  const test::TempFolder folder;
  auto& areas =
      dynamic_cast<CPondedWaterExchangeKvf&>(*document.Root().Important(kOverland)->Child<CPondedWaterExchangeKvf>());
  test::PageDriver page(document, "Overland/OnlyReducedContactInPonded");
  page.Enter("Data Type:", "1");
  page.Outside().Expect("Select shape file", std::optional<std::string>());
  page.Page().Browse(page.Find("Shape Distribution File:"));
  EXPECT_TRUE(page.Outside().IsDone());
  EXPECT_FALSE(page.Find("Edit...").IsShown());
  // Both choices stay where the exchange is reduced everywhere, and no zone is made.
  page.Enter("Spatial Distribution:", "0");
  EXPECT_TRUE(page.Find("Data Type:").IsShown());
  EXPECT_FALSE(page.Find("Shape Distribution File:").IsShown());
  EXPECT_TRUE(ZoneItems(areas).empty());
}

}  // namespace
}  // namespace tervane::overland_pages_test
