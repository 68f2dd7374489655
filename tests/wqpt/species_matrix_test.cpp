// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "wqpt/species_matrix.h"

#include <gmock/gmock.h>

#include "tests/wqpt/quality_setup.h"

namespace tervane::species_matrix_test {
namespace {

using test::QualitySetup;

/// What is not empty: "A/Sources: set: Ditch".
std::vector<std::string> Cells(QualitySetup& setup) {
  const SpeciesMatrix matrix = MatrixOfSpecies(setup.Root());
  std::vector<std::string> cells;
  for (const SpeciesRow& row : matrix.rows)
    for (std::size_t place = 0; place < row.uses.size(); ++place)
      if (row.uses[place].state != SpeciesUse::State::None)
        cells.push_back(row.name + "/" + matrix.places[place] + ": " + SpeciesUseText(row.uses[place]));
  for (const auto& [text, node] : matrix.withoutSpecies) cells.push_back("without: " + text);
  return cells;
}

TEST(SpeciesMatrix, TellsWhatTakesPartWhereAndWhatStandsAtItsDefault) {
  QualitySetup setup(
      "section SimSpec { section ModelComp { WQ = 1; OL = 1; SZ = 1; } } "
      "section ModelCompWQ { OL = 1; SZ = 1; IncludeProcesses = 1; } "
      "section Species { NumberOfSpecies = 3; section Species_1 { Name = \"A\"; } section Species_2 { Name = \"B\"; "
      "Type = 1; TypeStr = \"1\"; } section Species_3 { Name = \"C\"; } } "
      "section Processes { section Decay_Processes { NumberOfDecay = 2; section Decay_1 { Name = \"fast\"; Species = "
      "\"a\"; } section Decay_2 { Name = \"lost\"; Species = \"Z\"; } } "
      "section Sorption_Processes { NumberOfSorption = 1; section Sorption_1 { Name = \"held\"; Species = \"A\"; "
      "SorbedSpecies = \"B\"; } } } "
      "section Overland { section InitialMass { section Species_1 { Name = \"A\"; FixedValue = 3f; } } } "
      "section SaturatedZone { section SatWQLayers { NumberOfWQLayers = 2; section WQLayer_2 { section Decay_Processes "
      "{ section Decay_1 { Name = \"fast\"; section Half_Life { FixedValue = 7f; } } } } } } "
      "section Sources { NumberOfSources = 3; section Source_1 { SourceName = \"Ditch\"; Species = \"C\"; } "
      "section Source_2 { SourceName = \"Rain\"; Species = \"C\"; section Strength { section GLOBAL { FIXED_VALUE = "
      "2f; } } } section Source_3 { SourceName = \"Old\"; Species = \"Gone\"; } }");
  const auto cells = Cells(setup);
  for (const char* expected : {"A/Overland mass: set", "A/Overland decay: default: fast", "A/Soil decay: off: fast",
                               "A/Ground decay: set: fast", "A/Ground sorption: default: held", "B/Overland mass: off",
                               "B/Ground sorption: default: held", "C/Overland mass: default",
                               "C/Sources: set: Ditch, Rain", "without: lost: Z", "without: Old: Gone"})
    EXPECT_THAT(cells, testing::Contains(expected)) << testing::PrintToString(cells);
  for (const std::string& cell : cells) EXPECT_FALSE(cell.starts_with("C/Ground decay")) << cell;

  // The cell leads to what it tells of: the source that has a strength, the layer whose half life is set.
  const SpeciesMatrix matrix = MatrixOfSpecies(setup.Root());
  EXPECT_EQ(matrix.rows[2].uses.back().node, &setup.At<CYbSEKvfBase>("Sources/Source_2"));
}

}  // namespace
}  // namespace tervane::species_matrix_test
