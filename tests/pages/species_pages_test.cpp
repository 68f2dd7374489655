// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/species_pages.h"

#include <gmock/gmock.h>

#include "core/undo.h"
#include "simspec/model_components.h"
#include "tests/support/page_driver.h"
#include "tests/support/setup.h"
#include "wqpt/processes.h"
#include "wqpt/sources.h"

namespace tervane::species_pages_test {
namespace {

using testing::ElementsAre;

class SpeciesPages : public testing::Test {
 public:
  SpeciesPages() {
    components.WQ = 1;
    for (const char* name : {"Atrazine", "Nitrate"}) species.AddItem()->SetName(name);
  }
  CFlowModelDoc document;
  CModelCompKvf& components = *document.Root().Important(kModelComponents);
  CSpeciesListKvf& species = *document.Root().Important(kSpecies);
  CProcessesWQ_DecayListKvf& decays = *document.Root().Important(kDecays);
  CSourcesWQListKvf& sources = *document.Root().Important(kSources);
};

TEST_F(SpeciesPages, AMetaboliteComesWithTheDecayOfItsSpeciesInOneStep) {
  test::PageDriver page(document, "Species");
  UndoStack undo(document.Root());
  page.Page().ChooseRow(page.Find(""), 1);
  page.Page().Press(page.Find("Add Metabolite"));
  EXPECT_THAT(species.Names(), ElementsAre("Atrazine", "Nitrate", "Atrazine metabolite"));
  ASSERT_EQ(decays.GetItemCount(), 1);
  EXPECT_EQ(decays.GetItem(1)->Species, "Atrazine");
  EXPECT_EQ(decays.GetItem(1)->GetName(), "Atrazine to Atrazine metabolite");
  undo.Commit("Add Metabolite");
  // A second one is another species; the decay stands.
  page.Page().Press(page.Find("Add Metabolite"));
  EXPECT_EQ(species.GetItemName(4), "Atrazine metabolite 2");
  EXPECT_EQ(decays.GetItemCount(), 1);
  undo.Commit("Add Metabolite");
  undo.Undo();
  undo.Undo();
  EXPECT_THAT(species.Names(), ElementsAre("Atrazine", "Nitrate"));
  EXPECT_EQ(decays.GetItemCount(), 0);
}

TEST_F(SpeciesPages, ASpeciesGoesWithWhatNamesItAfterAQuestion) {
  decays.AddItem()->Species = "nitrate";
  decays.AddItem()->Species = "Atrazine";
  sources.AddItem()->Species = "Nitrate";
  test::PageDriver page(document, "Species");
  page.Page().ChooseRow(page.Find(""), 2);
  page.Outside().Expect("Nitrate is named by\n\nDecay_1\nSource", Host::Answer::No);
  page.Page().Press(page.Find("Delete Species and What Names It"));
  EXPECT_EQ(species.GetItemCount(), 2);
  page.Outside().Expect("Delete these too?", Host::Answer::Yes);
  page.Page().Press(page.Find("Delete Species and What Names It"));
  EXPECT_THAT(species.Names(), ElementsAre("Atrazine"));
  EXPECT_EQ(decays.GetItemCount(), 1);
  EXPECT_EQ(decays.GetItem(1)->Species, "Atrazine");
  EXPECT_EQ(sources.GetItemCount(), 0);
  EXPECT_TRUE(page.Outside().IsDone());
}

TEST_F(SpeciesPages, ATypeTellsWhichCellsCountAndWhereTheSpeciesTakesPart) {
  document.Root().Important(kWaterQualityComponents)->OL = 1;
  test::PageDriver page(document, "Species");
  Control& table = page.Find("");
  const std::string solubility = "Solubility in Surface Water";
  EXPECT_THAT(page.Text(), testing::HasSubstr(solubility));
  EXPECT_EQ(page.Page().EnterCell(table, 1, 3, "1"), "");
  EXPECT_EQ(species.GetItem(1)->TypeStr, "1");
  EXPECT_THAT(page.Text(), testing::HasSubstr("Atrazine | Sorbed | 1e+08 (read only)"));
  EXPECT_THAT(page.Text(), testing::HasSubstr("Atrazine | off |"));
  EXPECT_THAT(page.Text(), testing::HasSubstr("Nitrate | default |"));
  components.ADPTRadio = kParticleTracking;
  EXPECT_NE(page.Page().EnterCell(table, 2, 2, "Other"), "");
}

}  // namespace
}  // namespace tervane::species_pages_test
