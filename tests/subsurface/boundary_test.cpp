// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/boundary.h"

#include <gmock/gmock.h>

#include "platform/item_types.h"
#include "spatial/domain.h"
#include "subsurface/computational_layers.h"
#include "subsurface/geology.h"
#include "subsurface/saturated_zone.h"
#include "tests/simspec/test_setup.h"
#include "tests/support/data_files.h"
#include "tests/support/temp_folder.h"

namespace tervane::boundary_test {
namespace {

using Segment = CGeoDataBoundCondItemKvf;

constexpr double kDiagonal = 141.4213562373095;

/// A setup on a domain of 6 by 5 cells of 100 m without its corners. The boundary is 14 cells, clockwise from the upper
/// left.
struct Ring : test::TestSetup {
  test::TempFolder folder;
  CCatchmentKvf& domain = At<CCatchmentKvf>("Catchment");
  CSatZoneKvf& zone = At<CSatZoneKvf>("SaturatedZone");
  CGeoDataBoundCondListKvf& boundary = zone.LayersOfGeology().GetItem(1)->OuterBoundary();

  Ring() { UseDomain(2.0F); }
  /// `first` is the code of the cell where the boundary begins.
  void UseDomain(float first) {
    const auto isEdge = [](int place, int last) { return place == 0 || place == last; };
    std::vector<float> codes;
    for (int j = 0; j < 5; ++j)
      for (int i = 0; i < 6; ++i) {
        const bool isCorner = isEdge(i, 5) && isEdge(j, 4);
        codes.push_back(isCorner ? kUsualDeleteValue : isEdge(i, 5) || isEdge(j, 4) ? 2.0F : 1.0F);
      }
    codes[4 * 6 + 1] = first;
    const std::string path = folder.File(first > 1 ? "domain.nds2" : "open.nds2");
    test::WriteGrid(path, {6, 5, 100, 0, 0, 0, "NON-UTM"}, codes, quantity::kCode);
    domain.GridFile().Choose(FileName(path, folder.Path()));
  }
  Segment& Add(double x, double y, int type = Segment::kFixedHead) {
    Segment& segment = *boundary.AddItem();
    segment.X = x;
    segment.Y = y;
    segment.BoundaryType = type;
    segment.Name = std::to_string(static_cast<int>(x)) + "," + std::to_string(static_cast<int>(y));
    return segment;
  }
  std::string Names() const {
    std::string names;
    for (int number = 1; number <= boundary.GetItemCount(); ++number)
      names += (number > 1 ? " " : "") + boundary.GetItem(number)->Name;
    return names;
  }
};

TEST(OuterBoundary, SegmentsAreSortedClockwiseOnceTheDomainIsTraced) {
  Ring setup;
  setup.Add(150, 50);                           // lower left
  setup.Add(450, 450);                          // upper right
  setup.Add(150, 450);                          // upper left
  setup.Add(450, 50);                           // lower right
  EXPECT_FALSE(setup.boundary.SortSegments());  // nothing is traced yet
  ASSERT_TRUE(setup.boundary.LoadDomain());
  EXPECT_TRUE(setup.boundary.SortSegments());
  EXPECT_EQ(setup.Names(), "150,450 450,450 450,50 150,50");
  EXPECT_FALSE(setup.boundary.SortSegments());
  // One without a point keeps them as they are.
  setup.boundary.MoveItemUp(4, 1);
  setup.boundary.GetItem(1)->X = Segment::GetUndefinedValue();
  EXPECT_FALSE(setup.boundary.SortSegments());
}

template <class... Lengths>
auto Along(Lengths... lengths) {
  return testing::ElementsAre(testing::DoubleNear(lengths, 1e-6)...);
}

TEST(OuterBoundary, LengthsGoAlongTheBoundaryAndAroundItsBeginning) {
  Ring setup;
  setup.Add(450, 450);
  setup.Add(450, 50);
  setup.Add(150, 50);
  ASSERT_TRUE(setup.boundary.LoadDomain());
  const auto lengths = [&] { return LengthsAlong(*setup.boundary.GetCatchmentData(), setup.boundary.Segments()); };
  EXPECT_THAT(lengths(), Along(200 + 2 * kDiagonal, 300, 500 + 2 * kDiagonal));
  setup.boundary.DeleteItem(2, 1);
  EXPECT_THAT(lengths(), Along(500 + 2 * kDiagonal, 500 + 2 * kDiagonal));
  setup.boundary.GetItem(2)->X = 460;  // the same cell as the first
  setup.boundary.GetItem(2)->Y = 440;
  EXPECT_THAT(lengths(), Along(0, 0));
  setup.boundary.DeleteItem(2, 1);
  EXPECT_THAT(lengths(), Along(1000 + 4 * kDiagonal));
}

TEST(OuterBoundary, ADomainIsTracedOnceForAllListsAndAgainWhenItIsAnother) {
  Ring setup;
  const auto first = setup.domain.Traced();
  CSZVerDiscrLayerGeoItemKvf& other = *setup.zone.LayersOfGeology().AddItem();
  EXPECT_TRUE(other.OuterBoundary().LoadDomain());
  EXPECT_TRUE(first->IsDone());
  EXPECT_EQ(setup.boundary.GetCatchmentData(), other.OuterBoundary().GetCatchmentData());
  setup.UseDomain(1.0F);
  EXPECT_NE(setup.domain.Traced(), first);
  EXPECT_FALSE(setup.boundary.LoadDomain());
}

TEST(OuterBoundary, ADomainThatCannotBeTracedIsTheSaturatedZonesWarningAndNoError) {
  Ring setup;
  setup.UseDomain(1.0F);
  EXPECT_EQ(setup.zone.Validate(), 1);
  EXPECT_THAT(setup.zone.Findings(), testing::IsEmpty());  // no segment needs it
  for (int layer = 0; layer < 2; ++layer) setup.zone.Layers().AddItem();
  for (int layer = 0; layer < 2; ++layer) setup.zone.LayersOfGeology().AddItem();
  for (int layer = 1; layer <= 3; ++layer) setup.zone.LayersOfGeology().GetItem(layer)->OuterBoundary().AddItem();
  EXPECT_EQ(setup.zone.Validate(), 1);
  ASSERT_EQ(setup.zone.Findings().size(), 1U);
  EXPECT_EQ(setup.zone.Findings()[0].severity, Severity::Warning);
  EXPECT_EQ(setup.zone.Findings()[0].detail, "Invalid value found at catchment boundary");
  EXPECT_FALSE(setup.boundary.DomainLoaded);
  // A file that is not there is told by its own node.
  setup.domain.GridFile().Choose(FileName(setup.folder.File("away.nds2"), setup.folder.Path()));
  EXPECT_EQ(setup.zone.Validate(), 1);
  EXPECT_THAT(setup.zone.Findings(), testing::IsEmpty());
  setup.UseDomain(2.0F);
  setup.zone.Validate();
  EXPECT_TRUE(setup.boundary.DomainLoaded);
}

TEST(OuterBoundary, AnotherTypeCorrectsHowTheValueIsGiven) {
  const struct {
    int from, to, corrected, item;
  } cases[] = {{3, 2, 1, quantity::kDischarge}, {0, 3, 1, quantity::kHeadGradient}, {2, 3, 2, quantity::kHeadGradient},
               {3, 1, 3, quantity::kElevation}, {0, 0, 0, quantity::kUndefined},    {-4, 2, 1, quantity::kDischarge}};
  for (const auto& c : cases) {
    Ring setup;
    Segment& segment = setup.Add(0, 0);
    segment.Type = c.from;
    segment.SetBoundaryType(c.to);
    EXPECT_EQ(segment.Type, c.corrected) << c.from << " to " << c.to;
    EXPECT_EQ(segment.GetBoundaryQuantity(), c.item);
  }
}

TEST(OuterBoundary, TypesDecideWhichFileIsUsed) {
  const struct {
    int boundary, type;
    bool series, grid;
  } cases[] = {{0, 2, false, false}, {0, 3, false, false}, {1, 2, true, false}, {1, 3, false, true},
               {2, 2, true, false},  {3, 3, false, false}, {1, 1, false, false}};
  Ring setup;
  Segment& segment = setup.Add(0, 0);
  for (const auto& c : cases) {
    segment.BoundaryType = c.boundary;
    segment.Type = c.type;
    EXPECT_EQ(segment.SeriesFile().IsFileUsed(), c.series) << c.boundary << c.type;
    EXPECT_EQ(segment.GridFile().IsFileUsed(), c.grid) << c.boundary << c.type;
  }
}

TEST(OuterBoundary, UnnamedSegmentsAreCalledByTheirNumbers) {
  Ring setup;
  for (int number = 0; number < 3; ++number) setup.Add(0, 0).Name.clear();
  setup.boundary.GetItem(2)->Name = "River side";
  EXPECT_EQ(setup.boundary.GetItem(1)->GetAbbreviatedTitle(), "1 to 2");
  EXPECT_EQ(setup.boundary.GetItem(2)->GetAbbreviatedTitle(), "River side");
  EXPECT_EQ(setup.boundary.GetItem(3)->GetAbbreviatedTitle(), "3 to 1");
}

TEST(OuterBoundary, CoordinatesThatStandForNoneAreReadByTheVersionOfTheFile) {
  const struct {
    int version;
    const char* x;
    bool isUndefined;
  } cases[] = {{12, "-1e-35", true},  {12, "-1.005e-35", true}, {12, "-1e-31", false},
               {13, "-1e-31", true},  {13, "-1.009e-31", true}, {13, "-1.02e-31", false},
               {14, "-1e-35", false}, {12, "0", false},         {14, "0", false}};
  for (const auto& c : cases) {
    test::TestSetup setup(
        std::string("section SaturatedZone {\nsection CompLayersGeoSZ {\nNumberOfLayers = 1\nsection Layer_1 {\n"
                    "section OuterBoundary {\nNumberOfBoundaryConditions = 1\nsection OuterBoundaryProp_1 {\nX = ") +
            c.x + "\nY = 7\nType = 9\n}\n}\n}\n}\n}",
        c.version);
    const auto& segment = setup.At<Segment>("SaturatedZone/CompLayersGeoSZ/Layer_1/OuterBoundary/OuterBoundaryProp_1");
    EXPECT_EQ(segment.X == Segment::GetUndefinedValue(), c.isUndefined) << c.version << " " << c.x;
    EXPECT_EQ(segment.HasPoint(), !c.isUndefined);
    EXPECT_EQ(segment.Y, 7);
    EXPECT_EQ(segment.Type, 9);  // reading repairs nothing
    if (!c.isUndefined) continue;
    // What is written means the same to the next reader.
    const std::string written =
        setup.Written("SaturatedZone/CompLayersGeoSZ/Layer_1/OuterBoundary/OuterBoundaryProp_1:X");
    EXPECT_NEAR(std::stod(written), -1e-31, 1e-33);
  }
}

}  // namespace
}  // namespace tervane::boundary_test
