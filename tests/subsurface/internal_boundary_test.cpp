// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/internal_boundary.h"

#include <gmock/gmock.h>

#include "core/kvf.h"
#include "simspec/basic_parameters.h"
#include "tests/simspec/test_setup.h"

namespace tervane::internal_boundary_test {
namespace {

using Zone = CSZVerDiscrInternalBoundaryPropKvf;

/// Boundaries in a setup of their own, one zone among them.
struct Boundaries {
  test::TestSetup setup;
  CSZVerDiscrInternalBoundaryKvf& all = *setup.Root().NewChild<CSZVerDiscrInternalBoundaryKvf>();
  std::shared_ptr<CFMSEKvfGroupBase> made = all.CreateStationItem();
  Zone& zone = dynamic_cast<Zone&>(*made);

  Boundaries() { all.AddChild(made); }
  std::string Used() const {
    std::string names;
    for (CYbSEKvfBase* child = zone.GetFirstChild(); child; child = zone.GetNextChild(child)) {
      const auto* file = dynamic_cast<const DataFileNode*>(child);
      const bool isUsed = file ? file->IsFileUsed() : child->IsDlgUsedInSetup() != 0;
      if (isUsed) names += (names.empty() ? "" : " ") + child->GetSectionName();
    }
    return names;
  }
};

TEST(InternalBoundary, AnotherTypeCorrectsHowTheValueIsGiven) {
  const struct {
    int from, to, corrected;
  } cases[] = {{3, 2, 0}, {3, 3, 1}, {3, 4, 3}, {0, 3, 1}, {0, 5, 0}, {0, 4, 1}, {2, 2, 2}, {3, 1, 3}, {3, 6, 3}};
  for (const auto& c : cases) {
    Boundaries boundaries;
    boundaries.zone.Type = c.from;
    boundaries.zone.SetBoundaryType(c.to);
    EXPECT_EQ(boundaries.zone.Type, c.corrected) << c.from << " to " << c.to;
  }
}

TEST(InternalBoundary, TypesDecideWhichFilesAndMapsTakePart) {
  const struct {
    int boundary, type, leakage;
    const char* used;
    int item;
  } cases[] = {
      {Zone::kNone, Zone::kSeries, 0, "", quantity::kUndefined},
      {Zone::kInactive, Zone::kGridSeries, 1, "", quantity::kUndefined},
      {Zone::kFixedHead, Zone::kSeries, 1, "TIME_SERIES_FILE", quantity::kElevation},
      {Zone::kFixedHeadDrain, Zone::kGridSeries, 0, "NDS_2D_DATA_FILE", quantity::kElevation},
      {Zone::kHeadControlledFlux, Zone::kConstant, 0, "Conductance", quantity::kElevation},
      {Zone::kDrain, Zone::kConstant, 1, "LeakCoef", quantity::kElevation},
      {Zone::kRiver, Zone::kSeries, 1, "TIME_SERIES_FILE LeakCoef RiverBottomElevation", quantity::kElevation},
  };
  for (const auto& c : cases) {
    Boundaries boundaries;
    boundaries.zone.BoundaryType = c.boundary;
    boundaries.zone.Type = c.type;
    boundaries.zone.HeadControlLeakage = c.leakage;
    EXPECT_EQ(boundaries.Used(), c.used);
    EXPECT_EQ(boundaries.zone.GetBoundaryItemType(), c.item);
  }
}

TEST(InternalBoundary, AnUnfitEngineAndAConductanceThatVariesAreErrors) {
  Boundaries boundaries;
  Zone& zone = boundaries.zone;
  auto& basics = *boundaries.setup.Root().Important(kBasicParameters);
  zone.BoundaryType = Zone::kFixedHeadDrain;
  EXPECT_EQ(zone.Validate(), 1);
  basics.ModelType = kEngineModflow96;
  EXPECT_EQ(zone.Validate(), 0);
  ASSERT_FALSE(zone.Findings().empty());
  EXPECT_EQ(zone.Findings()[0].text, "Fixed head drain is only allow for Tervane");

  zone.BoundaryType = Zone::kHeadControlledFlux;
  auto* conductance = zone.Child<CSZVerDiscrInternalBoundaryPropConducKvf>();
  EXPECT_EQ(zone.Validate(), 1);
  conductance->Type = CData2DKvf::kGridFile;
  EXPECT_EQ(zone.Validate(), 0);
  EXPECT_EQ(conductance->Findings().back().text, "Only fixed value allowed");
  zone.HeadControlLeakage = Zone::kLeakageCoefficient;
  EXPECT_EQ(zone.Validate(), 1);
}

TEST(InternalBoundary, KeysAreWrittenInTheirOrderAndTheSourceIsNotShifted) {
  test::TestSetup setup;
  auto& all = *setup.Root().NewChild<CSZVerDiscrInternalBoundaryKvf>();
  ASSERT_TRUE(setup.OpenText(test::SetupText(14,
                                             "section InternalBoundary {\nType = 1\nNoInternalBoundaries = 1\n"
                                             "section InternalBoundaryProp {\nInternalBoundarySecNumber = 5\n"
                                             "ID = \"lake\"\nGridCode = \"4\"\nBoundaryType = 5\nType = 2\n}\n}"),
                             "/setups/x.tvd"));
  EXPECT_TRUE(all.UsesGridCodes());
  EXPECT_EQ(setup.WrittenKeys("InternalBoundary"), "Type=1 ShapeAxisUnit=1000 NoInternalBoundaries=1");
  EXPECT_EQ(setup.WrittenKeys("InternalBoundary/InternalBoundaryProp"),
            "InternalBoundarySecNumber=1 ID=\"lake\" GridCode=\"4\" FixedValue=0f BoundaryType=5 Type=2 "
            "HeadControlLeakage=0");
  EXPECT_EQ(ZoneItems(all).front()->GetAbbreviatedTitle(), "lake");
}

}  // namespace
}  // namespace tervane::internal_boundary_test
