// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/parts/plot_content.h"

#include <algorithm>

#include <gmock/gmock.h>

#include "platform/item_types.h"
#include "spatial/data2d.h"
#include "spatial/domain.h"
#include "tests/support/data_files.h"
#include "tests/support/page_driver.h"
#include "tests/support/temp_folder.h"

namespace tervane::plot_content_test {
namespace {

/// Around the line that shows where the model lies on the map of a page; nothing without it.
std::optional<Envelope> DomainOnPage(CFlowModelDoc& document, const char* path) {
  test::PageDriver page(document, path);
  const auto& controls = page.Page().Form().Controls();
  const auto map =
      std::ranges::find_if(controls, [](const auto& control) { return control->kind == ControlKind::Map; });
  if (map == controls.end()) return ADD_FAILURE() << path, std::nullopt;
  const MapContent content = Finished<MapContent>((*map)->map);
  if (!content.domain) return std::nullopt;
  Envelope around;
  EXPECT_TRUE(dynamic_cast<const CTvnShapeData&>(*content.domain).GetTranscribingRect(around));
  return around;
}

TEST(PlotContent, EachMapButThatOfTheDomainShowsWhereTheModelLies) {
  const test::TempFolder folder;
  const float none = kUsualDeleteValue;
  test::WriteGrid(folder.File("dem.nds2"), {4, 4, 10, 0, 0, 0, {}}, std::vector<float>(16, 5), quantity::kElevation);
  test::WriteGrid(folder.File("domain.nds2"), {3, 1, 10, 0, 10, 0, {}}, {none, 1, 2}, quantity::kCode);
  test::WriteShapes(folder.File("domain.shp"), ShapeKind::Polygon, AttributeKind::Whole, {std::int64_t{1}});
  CFlowModelDoc document;
  auto& ground = *document.Root().Important(kTopography);
  ground.Type = CData2DKvf::kGridFile;
  ground.GridFile().Choose(FileName("dem.nds2", folder.Path()));
  auto& domain = *document.Root().Important(kDomain);
  EXPECT_EQ(DomainOnPage(document, "Topography"), std::nullopt) << "no domain is chosen";

  domain.GridFile().Choose(FileName("domain.nds2", folder.Path()));
  EXPECT_EQ(DomainOnPage(document, "Topography"), (Envelope{10, 10, 30, 20}));
  EXPECT_EQ(DomainOnPage(document, "Catchment"), std::nullopt) << "it is the domain itself";
  test::WriteGrid(folder.File("domain.nds2"), {2, 1, 10, 0, 10, 0, {}}, {1, none}, quantity::kCode);
  EXPECT_EQ(DomainOnPage(document, "Topography"), (Envelope{0, 10, 10, 20})) << "the file is another one";
  folder.Write("domain.nds2", "nothing that can be read");
  EXPECT_EQ(DomainOnPage(document, "Topography"), std::nullopt);

  domain.Type = CCatchmentKvf::kShapeFile;
  domain.ShapeFile().File = FileName("domain.shp", folder.Path());
  EXPECT_EQ(DomainOnPage(document, "Topography"), (Envelope{0, 0, 10, 10}));
  EXPECT_EQ(DomainOnPage(document, "Catchment"), std::nullopt);
}

}  // namespace
}  // namespace tervane::plot_content_test
