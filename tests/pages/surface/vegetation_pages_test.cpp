// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/surface/vegetation_pages.h"

#include <filesystem>

#include <fmt/format.h>
#include <fmt/ranges.h>
#include <gmock/gmock.h>

#include "pages/page_table.h"
#include "surface/pages.h"
#include "surface/vegetation.h"
#include "tests/support/page_driver.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::vegetation_pages_test {
namespace {

class VegetationPages : public testing::Test {
 protected:
  /// The labels of all controls that are shown, but of those that every state has.
  static std::string ShownLabels(CYbSEDlgBase& page) {
    std::vector<std::string> labels;
    page.Form().ForEach([&](const Control& control) {
      if (control.IsShown() && control.label != "Spatial Distribution:")
        labels.push_back(control.label.empty() ? std::string(NameOf(control.kind)) : control.label);
    });
    return fmt::format("{}", fmt::join(labels, " | "));
  }
  /// The page with a dialog in which `work` is done before it is accepted or given up.
  std::unique_ptr<CYbSEDlgBase> PageWithDialog(std::function<bool(const std::string& title, CYbSEDlgBase& form)> work) {
    PageContext context{document, host, [this](int hint, const std::string& action, const void*) {
                          changes.push_back(fmt::format("{} {}", hint, action));
                        }};
    context.runDialog = [work = std::move(work)](const std::string& title, CYbSEDlgBase& form,
                                                 const std::function<std::string()>& accept) {
      if (!work(title, form)) return false;
      EXPECT_EQ(accept(), "");
      return true;
    };
    return MakePage(kVegetationPage, vegetation, context);
  }
  static Control& Find(CYbSEDlgBase& page, std::string_view label, int number = 1) {
    Control* found = nullptr;
    page.Form().ForEach([&](Control& control) {
      if (control.label == label && number-- == 1) found = &control;
    });
    if (!found) throw std::runtime_error("no " + std::string(label));
    return *found;
  }

  test::TempFolder folder;
  test::ScriptedHost host;
  std::vector<std::string> changes;
  CFlowModelDoc document;
  CVegetationKvf& vegetation = *document.Root().Important(kVegetation);
};

TEST_F(VegetationPages, ShowWhatTheStateOfTheDataNeeds) {
  const struct {
    int distribution, type, stations;
    const char* labels;
  } cases[] = {
      {0, 0, 0, "Temporal Distribution: | LAI Constant Value: | RD Constant Value: | ET parameters ..."},
      {0, 1, 0,
       "Temporal Distribution: | LAI Timeseries File: | Edit... | Create... | RD Timeseries File: | Edit... | "
       "Create... | chart | ET parameters ..."},
      {0, 2, 0, "Temporal Distribution: | table | Start Date from Chart | Recycling Mode: | Crop development: | chart"},
      {1, 2, 0, "Data Type: | Station Based Distribution File: | Edit... | Create... | map | ET parameters ..."},
      {1, 2, 1,
       "Data Type: | Shape File: | Item Name: | X- and Y-axis Units: | Fill Gaps with: | map | ET parameters ..."},
      {2, 2, 0,
       "Temporal Distribution: | LAI Grid Distribution File: | LAI | RD Grid distribution file: | RD | "
       "ET parameters ..."},
  };
  test::PageDriver page(document, "LandUse/Vegetation");
  for (const auto& c : cases) {
    vegetation.DistributionType = c.distribution;
    vegetation.Global().TYPE = c.type;
    vegetation.Stations().TYPE = c.stations;
    EXPECT_EQ(ShownLabels(page.Page()), c.labels) << c.distribution << c.type << c.stations;
  }
  // What is not offered is still named in the file, and stays until something else is chosen.
  EXPECT_THAT(page.Find("Spatial Distribution:").Options(), testing::ElementsAre("Uniform", "Station based"));
  EXPECT_EQ(page.Find("Spatial Distribution:").Option(), -1);
  EXPECT_EQ(test::ValueOf(document, "LandUse/Vegetation:DistributionType"), "3");
}

TEST_F(VegetationPages, TheParametersChangeTogetherOrNotAtAll) {
  bool isAccepted = false;
  const auto page = PageWithDialog([&](const std::string& title, CYbSEDlgBase& form) {
    EXPECT_EQ(title, "Evapotranspiration parameters");
    EXPECT_EQ(form.Enter(Find(form, "C1"), "0.35"), "");
    EXPECT_EQ(form.Enter(Find(form, "Reduce ET from roots when UZ deficit fraction is below "), "0"), "");
    EXPECT_EQ(vegetation.C1, 0.3);
    return isAccepted;
  });
  page->Press(Find(*page, "ET parameters ..."));
  EXPECT_EQ(EvapotranspirationParameters(vegetation), EvapotranspirationParameters());
  EXPECT_TRUE(changes.empty());
  isAccepted = true;
  page->Press(Find(*page, "ET parameters ..."));
  EXPECT_EQ(vegetation.C1, 0.35);
  EXPECT_EQ(vegetation.ETReduced, 0);
  EXPECT_EQ(vegetation.C2, 0.2);
  EXPECT_THAT(changes, testing::ElementsAre("1 Change ET Parameters"));
}

TEST_F(VegetationPages, CreateBeginsWithTheConstantTheQuantityAndATitleOfItsOwn) {
  ASSERT_TRUE(document.OpenText(test::SetupText(14, ""), folder.File("a.tvd")));
  vegetation.Global().TYPE = VegetationCourse::kTimeVarying;
  vegetation.Global().FIXED_VALUE_LAI = 3;
  vegetation.Global().FIXED_VALUE_RD = 0.5F;
  const struct {
    int number;
    const char *quantity, *value, *file;
  } cases[] = {{1, "Leaf Area Index", "3", "Vegetation LAI.nds0"}, {2, "Root Depth", "0.5", "Vegetation RD.nds0"}};
  for (const auto& c : cases) {
    const auto page = PageWithDialog([&](const std::string&, CYbSEDlgBase& form) {
      EXPECT_EQ(Find(form, "Quantity:").Options(), std::vector<std::string>{c.quantity});
      EXPECT_EQ(Find(form, "Value:").Text(), c.value);
      return true;
    });
    page->Press(Find(*page, "Create...", c.number));
    EXPECT_TRUE(std::filesystem::exists(folder.File(c.file)));
  }
  EXPECT_EQ(vegetation.Global().RootDepthFile().File.Text(), "Vegetation RD.nds0");
  EXPECT_TRUE(vegetation.Validate());

  vegetation.DistributionType = CVegetationKvf::kStationBased;
  const auto page = PageWithDialog([&](const std::string&, CYbSEDlgBase& form) {
    EXPECT_EQ(Find(form, "Fixed Value:").Text(), "3");
    return false;
  });
  page->Press(Find(*page, "Create...", 3));
}

}  // namespace
}  // namespace tervane::vegetation_pages_test
