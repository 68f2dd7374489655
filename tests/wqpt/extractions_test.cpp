// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "wqpt/extractions.h"

#include <gmock/gmock.h>

#include "tests/wqpt/quality_setup.h"

namespace tervane::extractions_test {
namespace {

using test::QualitySetup;
using testing::ElementsAre;
using testing::IsEmpty;

const std::string kJobs = "Results_Post_Processing/PT_Reg_Extraction";
const std::string kPaths = "Results_Post_Processing/PT_Pathline_Extraction";

TEST(Extractions, ANewJobBeginsWithAllLayersAndDatesOfTheSetup) {
  QualitySetup setup(
      "section ModelCompPT { section SimulationPeriodPT { SimStart = 2000, 3, 1, 0, 0; SimEnd = 2002, 3, 1, 12, 0; } } "
      "section SaturatedZone { section CompLayersGeoSZ { NumberOfLayers = 3; } }");
  auto& job = *setup.At<CResultsPTRegExtractionKvf>(kJobs).AddItem();
  EXPECT_EQ(job.BottomLayer, 3);
  EXPECT_EQ(job.EndYear, static_cast<float>(730.5) / 365.0F);
  EXPECT_EQ(setup.Written(kJobs + "/Extraction_1:StartDate"), "2000, 3, 1");
  EXPECT_EQ(setup.Written(kJobs + "/Extraction_1:EndDate"), "2002, 3, 1");
}

TEST(Extractions, ListedValuesAreReadUntilTheyRunOut) {
  QualitySetup setup(
      "section Results_Post_Processing { section PT_Reg_Extraction { YbSEKvfListItemCount = 1; section Extraction_1 { "
      "section WellNames { NumberOfWellNames = 9; wellname = \"A\"; wellname = \"B\"; } section SinkCodes { "
      "NumberOfSinkCodes = 2; } section RegCodes { regcode = 4; } } } section PT_Pathline_Extraction { "
      "YbSEKvfListItemCount = 1; section Extraction_1 { section Particle_IDs { id = 7; id = 9; } } } }");
  const auto& job = *setup.At<CResultsPTRegExtractionKvf>(kJobs).GetItem(1);
  EXPECT_THAT(job.WellNames, ElementsAre("A", "B"));
  EXPECT_THAT(job.SinkCodes, IsEmpty());
  EXPECT_THAT(job.RegCodes, ElementsAre(4));
  EXPECT_THAT(job.WellFieldNames, IsEmpty());
  const auto& path = *setup.At<CResultsPTPathlineExtractionKvf>(kPaths).GetItem(1);
  EXPECT_THAT(path.ParticleIDs, ElementsAre(7, 9));
  EXPECT_EQ(path.CreateXMLFile, 0);  // A file without the key makes none.
  EXPECT_TRUE(setup.Report().IsEmpty());
  EXPECT_EQ(setup.WrittenKeys(kJobs + "/Extraction_1/WellNames"), "wellname=\"B\"");
  EXPECT_EQ(setup.Written(kPaths + ":NumberOfExtractions"), "1");
}

TEST(Extractions, NamesAreCountedFromEachNewListOn) {
  QualitySetup setup(
      "section Results_Post_Processing { section PT_Pathline_Extraction { YbSEKvfListItemCount = 2; section "
      "Extraction_1 { Name = \"Extraction_2\"; } section Extraction_2 { Name = \"Extraction_1\"; } } }");
  auto& paths = setup.At<CResultsPTPathlineExtractionKvf>(kPaths);
  // One pass over the rows: the counter is at 2 when it meets the row of that number, which it has passed.
  EXPECT_EQ(paths.AddItem()->Name, "Extraction_2");
  EXPECT_EQ(paths.AddItem()->Name, "Extraction_3");
  EXPECT_EQ(setup.At<CResultsPTRegExtractionKvf>(kJobs).AddItem()->Name, "Extraction_1");
  EXPECT_EQ(paths.AddItem()->CreateXMLFile, 1);
}

}  // namespace
}  // namespace tervane::extractions_test
