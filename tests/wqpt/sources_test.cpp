// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "wqpt/sources.h"

#include <gmock/gmock.h>

#include "core/undo.h"
#include "tests/wqpt/quality_setup.h"
#include "wqpt/species.h"

namespace tervane::sources_test {
namespace {

using test::QualitySetup;
using testing::ElementsAre;

const std::string kOneSource = "section Sources { NumberOfSources = 1; section Source_1 { SourceName = \"S\"; } }";

TEST(Sources, TheTypeTellsWhatTheStrengthIs) {
  QualitySetup setup(kOneSource);
  auto& source = *setup.At<CSourcesWQListKvf>("Sources").GetItem(1);
  const auto types = [&source] { return source.Strength().Global().SeriesFile().ItemTypes; };
  EXPECT_EQ(setup.WrittenKeys("Sources/Source_1"),
            "SourceName=\"S\" Species=\"Specie\" Location=0 SourceType=0 ExtentType=1");
  EXPECT_THAT(types(), ElementsAre(quantity::kConcentration));
  UndoStack undo(setup.Root());
  source.SetSourceType(2);
  EXPECT_THAT(types(), ElementsAre(quantity::kMassRate, quantity::kMass));
  EXPECT_EQ(source.Strength().GetItemType(), quantity::kMassRate);
  EXPECT_THAT(source.Strength().Kind().valueTypes, ElementsAre(3, 2));
  undo.Commit("Change Type");
  // One that is none leaves the strength as it was.
  source.SetSourceType(17);
  EXPECT_THAT(types(), ElementsAre(quantity::kMassRate, quantity::kMass));
  undo.Commit("Change Type");
  undo.Undo();
  undo.Undo();
  EXPECT_THAT(types(), ElementsAre(quantity::kConcentration));
  EXPECT_THAT(source.Strength().Kind().valueTypes, ElementsAre(0));
}

TEST(Sources, WhatTakesPartByPlace) {
  QualitySetup setup(kOneSource);
  auto& source = *setup.At<CSourcesWQListKvf>("Sources").GetItem(1);
  const std::string path = "Sources/Source_1/";
  const std::vector<std::string> parts{path + "Extent", path + "TopElevation", path + "BottomElevation",
                                       path + "Strength"};
  EXPECT_EQ(setup.AreUsed(parts), "1001");
  source.Location = CSourceWQItemKvf::kSubsurface;
  source.ExtentType = kFullDomain;
  EXPECT_EQ(setup.AreUsed(parts), "0111");
  // Another location keeps the type.
  source.SetSourceType(3);
  source.Location = CSourceWQItemKvf::kSurface;
  EXPECT_EQ(setup.Written("Sources/Source_1:SourceType"), "3");
}

TEST(Sources, ANewOneIsOfTheFirstSpeciesUnlessThatHasNoPhase) {
  QualitySetup setup(
      "section Species { NumberOfSpecies = 1; section Species_1 { Name = \"Nitrate\"; } } "
      "section Sources { NumberOfSources = 0; }");
  auto& sources = setup.At<CSourcesWQListKvf>("Sources");
  EXPECT_EQ(sources.AddItem()->Species, "Nitrate");
  setup.At<CSpeciesListKvf>("Species").GetItem(1)->Type = CSpeciesItemKvf::kFixed;
  sources.InsertItem(1, 1);
  EXPECT_EQ(sources.GetItem(1)->Species, "Specie");
}

TEST(Sources, TheExtentNamesOneOfTwoFiles) {
  QualitySetup setup(kOneSource);
  auto& extent = setup.At<ExtentKvf>("Sources/Source_1/Extent");
  EXPECT_EQ(setup.WrittenKeys("Sources/Source_1/Extent").substr(0, 7), "type=1 ");
  EXPECT_TRUE(extent.GridFile().IsFileUsed());
  extent.type = ExtentKvf::kShapeFile;
  EXPECT_FALSE(extent.GridFile().IsFileUsed());
  EXPECT_TRUE(extent.ShapeFile().IsFileUsed());
}

}  // namespace
}  // namespace tervane::sources_test
