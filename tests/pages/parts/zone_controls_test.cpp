// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/parts/zone_controls.h"

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "spatial/pages.h"
#include "tests/support/data_files.h"
#include "tests/support/page_driver.h"
#include "tests/support/temp_folder.h"

namespace tervane::zone_controls_test {
namespace {

using testing::ElementsAre;

constexpr KeyChoice kWithNone[] = {{-1, "None"}, {0, "Grid codes (.nds2)"}, {1, "Polygons (.shp)"}};
constexpr KeyChoice kOnlyCodes[] = {{0, "Grid codes (.nds2)"}, {1, "Polygons (.shp)", false}};
constexpr ZoneSourceWords kWords{.grid = "Areas File:", .shapeFilter = "Shapes (*.shp) |*.shp||"};

class AreaZone : public CodedZoneProp {
 public:
  explicit AreaZone(CYbSEKvfBase* parent) : CodedZoneProp(kZoneKeys, "Area", "Area", parent) {}
};

constexpr CodedZonesKind KindOf(ZoneSourceKind source, std::optional<int> distribution) {
  return {.className = "Areas",
          .title = "Areas",
          .section = "Areas",
          .source = source,
          .distribution = distribution,
          .makeZone = source.countKey.empty() ? nullptr : MakeZone<AreaZone>,
          .page = &kSubcatchmentPage};
}
constexpr CodedZonesKind kUsual = KindOf({.countKey = "NO_AREAS"}, 0);
constexpr CodedZonesKind kAlwaysDistributed =
    KindOf({.types = kWithNone, .type = ZoneSource::kNone, .hasGapFill = false, .countKey = "NO_AREAS"}, std::nullopt);
constexpr CodedZonesKind kMapOnly = KindOf({.types = kOnlyCodes, .hasGapFill = false}, 1);

class ZoneControls : public testing::Test {
 protected:
  std::unique_ptr<CYbSEDlgBase> PageOfKind(const CodedZonesKind& kind) {
    node = document.Root().NewChild<CodedZonesKvf>(kind);
    auto page = std::make_unique<ZonesPage<kWords>>(
        *node, PageContext{document, host, [this](int hint, const std::string& action, const void*) {
                             changes.push_back(fmt::format("{} {}", hint, action));
                           }});
    page->Initialize();
    return page;
  }
  static std::string Shown(const CYbSEDlgBase& page) {
    std::string labels;
    page.Form().ForEach([&](Control& control) {
      if (control.IsShown() && !control.label.empty()) labels += control.label + " ";
    });
    return labels;
  }

  test::TempFolder folder;
  CFlowModelDoc document;
  test::ScriptedHost host;
  std::vector<std::string> changes;
  CodedZonesKvf* node = nullptr;
};

TEST_F(ZoneControls, ShowWhatTheKindOfSourceHasAndItsStateAsksFor) {
  const std::string codes = "Areas File: Edit... Create... ",
                    polygons = "Shape Distribution File: Item Name: Units of X- and Y-axises: ",
                    distribution = "Spatial Distribution: ", type = "Data Type: ";
  const struct {
    const CodedZonesKind* kind;
    int distribution, type;
    std::string shown;
  } cases[] = {
      {&kUsual, 0, 0, distribution},
      {&kUsual, 1, 0, distribution + type + codes},
      {&kUsual, 1, 1, distribution + type + polygons + "Fill Gaps with: "},
      {&kAlwaysDistributed, 1, -1, type},
      {&kAlwaysDistributed, 1, 0, type + codes},
      {&kAlwaysDistributed, 1, 1, type + polygons},
      {&kMapOnly, 0, 0, distribution},
      {&kMapOnly, 1, 0, distribution + type + codes},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(fmt::format("{} {}", c.distribution, c.type));
    const auto page = PageOfKind(*c.kind);
    node->DistributionType = c.distribution;
    node->Type = c.type;
    EXPECT_EQ(Shown(*page), c.shown);
  }
}

TEST_F(ZoneControls, AGapFillerThatNoZoneBearsBecomesTheFirstWhenAUserSeesThePage) {
  for (const int type : {ZoneSource::kGridCodes, ZoneSource::kPolygons}) {
    node = document.Root().NewChild<CodedZonesKvf>(kUsual);
    node->DistributionType = CodedZonesKvf::kDistributed;
    node->Type = type;
    node->ShapeGapFillName = "gone";
    for (const char* name : {"forest", "meadow"}) {
      auto zone = std::make_shared<AreaZone>(node);
      zone->SetStationName(name);
      zone->SetAbbreviatedTitle(name);
      node->AddChild(std::move(zone));
    }
    changes.clear();
    const auto show = [this](bool isReplacement) {
      PageContext context{document, host,
                          [this](int, const std::string& action, const void*) { changes.push_back(action); }};
      context.isReplacement = isReplacement;
      ZonesPage<kWords>(*node, context).Initialize();
      return node->ShapeGapFillName;
    };
    EXPECT_EQ(show(true), "gone");  // A step that was undone would come again.
    EXPECT_EQ(show(false), type == ZoneSource::kPolygons ? "forest" : "gone");
    EXPECT_EQ(changes.size(), type == ZoneSource::kPolygons ? 1U : 0U);
  }
}

TEST_F(ZoneControls, AChosenFileBringsTheZonesInStepWhereThereAreAny) {
  test::WriteCodes(folder.File("codes.nds2"), {4, 2});
  const struct {
    const CodedZonesKind* kind;
    std::size_t zones;
    int hint;
    const char* gapFill;
  } cases[] = {{&kUsual, 2, kItemAdded | kOrderChanged, "Grid code = 2"},
               {&kAlwaysDistributed, 2, kItemAdded | kOrderChanged, ""},
               {&kMapOnly, 0, kDataChanged, ""}};
  for (const auto& c : cases) {
    const auto page = PageOfKind(*c.kind);
    node->DistributionType = CodedZonesKvf::kDistributed;
    node->Type = ZoneSource::kGridCodes;
    changes.clear();
    page->Form().ForEach([&](Control& control) {
      if (control.label == "Areas File:") page->Enter(control, folder.File("codes.nds2"));
    });
    EXPECT_EQ(ZoneItems(*node).size(), c.zones);
    EXPECT_EQ(node->ShapeGapFillName, c.gapFill);
    EXPECT_THAT(changes, ElementsAre(testing::StartsWith(fmt::format("{} ", c.hint | kDataChanged))));
  }
}

}  // namespace
}  // namespace tervane::zone_controls_test
