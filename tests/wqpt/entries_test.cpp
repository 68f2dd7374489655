// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "wqpt/entries.h"

#include <random>

#include <gmock/gmock.h>

#include "core/undo.h"
#include "subsurface/computational_layers.h"
#include "tests/wqpt/quality_setup.h"
#include "wqpt/processes.h"
#include "wqpt/species_entries.h"
#include "wqpt/water_quality_layers.h"

namespace tervane::entries_test {
namespace {

using test::QualitySetup;

/// The names of the entries of a list, in their order.
template <class ItemBase>
std::vector<std::string> NamesOf(const CYbSEKvfBase& list) {
  std::vector<std::string> names;
  for (CYbSEKvfBase* child = list.GetFirstChild(); child; child = list.GetNextChild(child))
    if (const auto* entry = dynamic_cast<ItemBase*>(child)) names.push_back(entry->GetName());
  return names;
}

/// Every list of the tree that follows a master, in step with it: order, names, identities and links.
template <class ListBase>
int ExpectInStep(CYbSEKvfBase& root, CYbSEKvfBase& master) {
  using Item = typename ListBase::ItemBase;
  const auto names = NamesOf<Item>(master);
  int lists = 0;
  WalkNodes(root, [&](const NodePlace& place) {
    auto* list = dynamic_cast<ListBase*>(&place.node);
    if (!list || &place.node == &master) return;
    ++lists;
    EXPECT_EQ(NamesOf<Item>(place.node), names) << place.path;
    for (int number = 1; number <= master.GetChildCount(); ++number) {
      auto* item = dynamic_cast<Item*>(master.GetChild(number));
      Item* entry = list->FindDependentItem(item->GetId());
      EXPECT_EQ(std::ranges::count(item->LinkedItems(), entry), 1) << place.path;
    }
  });
  auto* masterList = dynamic_cast<ListBase*>(&master);
  EXPECT_EQ(masterList->DependentLists().size(), static_cast<std::size_t>(lists));
  for (int number = 1; number <= master.GetChildCount(); ++number) {
    const auto* item = dynamic_cast<Item*>(master.GetChild(number));
    EXPECT_EQ(item->LinkedItems().size(), static_cast<std::size_t>(lists));
  }
  return lists;
}

class Walk : public testing::Test {
 public:
  void ExpectAllInStep(QualitySetup& setup) {
    auto& processes = setup.At<CProcessesWQKvf>("Processes");
    EXPECT_GE(ExpectInStep<CSpeciesListBase>(setup.Root(), setup.At<CSpeciesListKvf>("Species")), 5);
    EXPECT_GE(ExpectInStep<CDecayListBase>(setup.Root(), processes.Decays()), 2);
    EXPECT_GE(ExpectInStep<CSorptionProcessesListBase>(setup.Root(), processes.Sorptions()), 1);
  }
  unsigned Random(unsigned below) { return static_cast<unsigned>(random_() % below); }

  /// Some change of a list: a row more or less, another place or name.
  template <class List>
  void ChangeList(List& list, int most) {
    const int count = list.GetItemCount();
    const int number = static_cast<int>(Random(static_cast<unsigned>(count) + 2));
    switch (Random(5)) {
      case 0:
        if (count < most) list.AddItem();
        break;
      case 1:
        if (count < most) list.InsertItem(number, 1);
        break;
      case 2:
        list.DeleteItem(number, 1);
        break;
      case 3:
        list.MoveItemUp(number, 1);
        break;
      default:
        list.MoveItemDown(number, 1);
    }
  }
  template <class List>
  void Rename(List& list) {
    if (auto* item = list.GetItem(static_cast<int>(Random(4)))) item->SetName("N" + std::to_string(Random(1000)));
  }
  void Change(QualitySetup& setup) {
    auto& species = setup.At<CSpeciesListKvf>("Species");
    auto& processes = setup.At<CProcessesWQKvf>("Processes");
    switch (Random(9)) {
      case 0:
        return ChangeList(species, 4);
      case 1:
        return ChangeList(processes.Decays(), 3);
      case 2:
        return ChangeList(processes.Sorptions(), 3);
      case 3:
        return ChangeList(setup.At<CWQLayerListKvf>("SaturatedZone/SatWQLayers"), 3);
      case 4:
        return ChangeList(setup.At<CSZVerDiscrLayerListKvf>("SaturatedZone/CompLayersSZ"), 3);
      case 5:
        return Rename(species);
      case 6:
        return Rename(processes.Decays());
      case 7:
        return Rename(processes.Sorptions());
      default:
        if (auto* item = species.GetItem(static_cast<int>(Random(4)))) {
          item->SetType(static_cast<int>(Random(4)));
          species.RefreshDependents();
        }
    }
  }

 private:
  std::mt19937 random_{7};
};

TEST_F(Walk, EditsUndoAndReloadsLeaveEveryDependentEqualToItsMaster) {
  auto setup = std::make_unique<QualitySetup>();
  auto undo = std::make_unique<UndoStack>(setup->Root());
  std::vector<std::string> texts{test::SavedText(*setup)};
  std::size_t at = 0;
  for (int step = 0; step < 400; ++step) {
    const unsigned what = Random(10);
    if (what == 0 && undo->Undo()) {
      ASSERT_EQ(test::SavedText(*setup), texts[--at]);
    } else if (what == 1 && undo->Redo()) {
      ASSERT_EQ(test::SavedText(*setup), texts[++at]);
    } else if (what == 2 && Random(4) == 0) {
      // What is saved is read again as it was.
      undo.reset();
      auto reloaded = std::make_unique<QualitySetup>();
      ASSERT_TRUE(reloaded->OpenText(texts[at], "/setups/x.tvd"));
      ASSERT_TRUE(reloaded->Report().IsEmpty());
      setup = std::move(reloaded);
      undo = std::make_unique<UndoStack>(setup->Root());
      ASSERT_EQ(test::SavedText(*setup), texts[at]);
      texts = {texts[at]};
      at = 0;
    } else {
      Change(*setup);
      if (undo->Commit("Change")) {
        texts.resize(++at);
        texts.push_back(test::SavedText(*setup));
      }
    }
    ExpectAllInStep(*setup);
    if (HasFailure()) FAIL() << "in step " << step;
  }
}

TEST(Entries, ValuesStayWithTheirSpeciesAndANewLayerStartsComplete) {
  QualitySetup setup(
      "section Species { NumberOfSpecies = 2; section Species_1 { Name = \"A\"; } section Species_2 { Name = \"B\"; "
      "Type = 1; } } section SaturatedZone { section CompLayersSZ { NumberOfLayers = 1; section Layer_1 { section "
      "Initial_Concentration { section Species_1 { FixedValue = 1f; } section Species_2 { FixedValue = 2f; } } } } }");
  const std::string group = "SaturatedZone/CompLayersSZ/Layer_1/Initial_Concentration";
  auto& species = setup.At<CSpeciesListKvf>("Species");
  auto& second = setup.At<CSatCompLayerInitConSpecy>(group + "/Species_2");
  EXPECT_EQ(second.GetItemType(), quantity::kSorbedConcentration);
  species.MoveItemUp(2, 1);
  EXPECT_EQ(setup.Written(group + "/Species_1:FixedValue"), "2f");
  EXPECT_EQ(setup.Written(group + "/Species_1:Name"), "\"B\"");

  auto& layers = setup.At<CSZVerDiscrLayerListKvf>("SaturatedZone/CompLayersSZ");
  layers.AddItem();
  EXPECT_EQ(
      NamesOf<CSpeciesItemBase>(setup.At<CYbSEKvfBase>("SaturatedZone/CompLayersSZ/Layer_2/Initial_Concentration")),
      (std::vector<std::string>{"B", "A"}));
  // Nothing leads to a layer that was deleted.
  const std::size_t links = species.GetItem(1)->LinkedItems().size();
  layers.DeleteItem(2, 1);
  EXPECT_EQ(species.GetItem(1)->LinkedItems().size(), links - 2);
}

TEST(Entries, AConcentrationFollowsItsSpeciesBetweenDissolvedAndSorbedAlone) {
  QualitySetup setup(
      "section Species { NumberOfSpecies = 1; section Species_1 { Name = \"A\"; } } section SaturatedZone { section "
      "CompLayersSZ { section Layer_1 { section Initial_Concentration { section Species_1 { FixedValue = 3f; } } } } "
      "}");
  const std::string place = "SaturatedZone/CompLayersSZ/Layer_1/Initial_Concentration/Species_1";
  auto& species = setup.At<CSpeciesListKvf>("Species");
  struct Case {
    int type, quantity;
    const char* used;
  };
  // A quantity of another type stays until the next load.
  for (const Case& c : {Case{1, quantity::kSorbedConcentration, "1"}, Case{0, quantity::kConcentration, "1"},
                        Case{2, quantity::kConcentration, "0"}, Case{3, quantity::kConcentration, "1"},
                        Case{1, quantity::kSorbedConcentration, "1"}, Case{3, quantity::kSorbedConcentration, "1"},
                        Case{0, quantity::kConcentration, "1"}}) {
    species.GetItem(1)->SetType(c.type);
    species.RefreshDependents();
    EXPECT_EQ(setup.At<CData2DKvf>(place).GetItemType(), c.quantity) << c.type;
    EXPECT_EQ(setup.AreUsed({place}), c.used) << c.type;
    EXPECT_EQ(setup.Written(place + ":FixedValue"), "3f");
  }
  EXPECT_EQ(setup.At<CData2DKvf>("Overland/InitialMass/Species_1").GetItemType(), quantity::kMassPerArea);
  species.GetItem(1)->SetType(CSpeciesItemKvf::kFixed);
  EXPECT_EQ(setup.At<CData2DKvf>("Overland/InitialMass/Species_1").GetItemType(), quantity::kUndefined);
}

TEST(Entries, WhatTakesPartByTheTypeOfTheSpecies) {
  QualitySetup setup("section Species { NumberOfSpecies = 1; section Species_1 { Name = \"A\"; } }");
  auto& species = *setup.At<CSpeciesListKvf>("Species").GetItem(1);
  for (const auto& [type, used] :
       {std::pair{0, "111"}, std::pair{1, "001"}, std::pair{2, "100"}, std::pair{3, "101"}, std::pair{4, "001"}}) {
    species.Type = type;
    EXPECT_EQ(setup.AreUsed({"Overland/InitialMass/Species_1", "Unsatzone/Macropore_Transfer_Coeff/Species_1",
                             "Unsatzone/Initial_Conditions/Initial_Concentration/Species_1"}),
              used)
        << type;
  }
}

TEST(Entries, TheIsothermAndTheKineticsTellWhichCoefficientsCount) {
  QualitySetup setup(
      "section Processes { section Sorption_Processes { NumberOfSorption = 1; section Sorption_1 { Name "
      "= \"S\"; } } }");
  auto& sorption = *setup.At<CProcessesWQKvf>("Processes").Sorptions().GetItem(1);
  struct Case {
    int isotherm, type, kinetics;
    const char* used;
  };
  for (const Case& c : {Case{0, 0, 1, "1000000"}, Case{1, 0, 0, "0110000"}, Case{2, 1, 0, "0001110"},
                        Case{0, 1, 1, "1000011"}, Case{7, 3, 1, "0000000"}}) {
    sorption.IsothermType = c.isotherm;
    sorption.Type = c.type;
    sorption.KineticType = c.kinetics;
    for (const char* zone : {"Unsatzone/", "SaturatedZone/SatWQLayers/WQLayer_1/"}) {
      std::vector<std::string> places;
      for (const char* section : {"Linear_Kd", "Freundlich_Kf", "Freundlich_n", "Langmuir_Alpha", "Langmuir_Beta",
                                  "KinSorpRate", "KinDeSorpRate"})
        places.push_back(std::string(zone) + "Sorption_Processes/Sorption_1/" + section);
      EXPECT_EQ(setup.AreUsed(places), c.used) << zone;
    }
  }
  EXPECT_EQ(setup.At<CYbSEKvfBase>("Unsatzone/Sorption_Processes/Sorption_1/Freundlich_n").GetAbbreviatedTitle(),
            "Freundlich n");
  EXPECT_EQ(setup.At<CYbSEKvfBase>("SaturatedZone/SatWQLayers/WQLayer_1/Sorption_Processes/Sorption_1/Freundlich_n")
                .GetAbbreviatedTitle(),
            "Freundlich N");
}

TEST(Entries, ValuesBelowTheirRangeAreRefused) {
  QualitySetup setup(
      "section SimSpec { section ModelComp { WQ = 1; UZ_ModelType = 0; } } section ModelCompWQ { OL = 1; UZ = 1; SZ = "
      "1; IncludeProcesses = 1; } section Species { NumberOfSpecies = 1; section Species_1 { Name = \"A\"; } } section "
      "Processes { section Decay_Processes { NumberOfDecay = 1; section Decay_1 { Name = \"D\"; Species = \"A\"; } } "
      "section Sorption_Processes { NumberOfSorption = 1; section Sorption_1 { Name = \"S\"; } } } section Unsatzone { "
      "Bypass = 2; } section SaturatedZone { MassTransferToImmobileWater = 1; }");
  const std::string layer = "SaturatedZone/SatWQLayers/WQLayer_1/";
  struct Case {
    std::string place, key;
    const char *wrong, *right, *error;
  };
  const Case cases[] = {
      {"Unsatzone/Decay_Processes/Decay_1/Half_Life", "uniform", "0", "0.1",
       "Invalid Data: Value must be greater than 0"},
      {"Unsatzone/Decay_Processes/Decay_1/Macropore_Half_Life", "uniform", "-1", "1",
       "Invalid Data: Value must be greater than 0"},
      {"Unsatzone/Sorption_Processes/Sorption_1/Linear_Kd", "uniform", "-1", "0",
       "Valid Range: Value must be greater than or equal 0."},
      {"Unsatzone/Macropore_Transfer_Coeff/Species_1", "uniform", "-1", "0",
       "Fixed Value invalid, Valid Range: greater than or equal 0."},
      {layer + "Decay_Processes/Decay_1/Half_Life", "fixed", "0", "1", "Valid Range: value must be greater than 0"},
      {layer + "Decay_Processes/Decay_1/Secondary_Half_Life", "fixed", "0", "1",
       "Valid Range: value must be greater than 0"},
      {layer + "Sorption_Processes/Sorption_1/Linear_Kd", "fixed", "-1", "0",
       "Valid Range: value must be greater than 0"},
      {layer + "Dual_Porosity_Transfer_Coeff/Species_1", "fixed", "-1", "0", "Valid Range: Greater than or equal 0."},
  };
  for (const Case& c : cases) {
    const auto set = [&](const char* value) {
      if (c.key == "fixed")
        setup.At<CData2DKvf>(c.place).FixedValue = std::stof(value);
      else
        setup.At<SoilValuesKvf>(c.place).Distribution_UniformValue = std::stod(value);
    };
    set(c.wrong);
    EXPECT_THAT(setup.ErrorsAt(c.place), testing::ElementsAre(c.error)) << c.place;
    set(c.right);
    EXPECT_THAT(setup.ErrorsAt(c.place), testing::IsEmpty()) << c.place;
  }
}

}  // namespace
}  // namespace tervane::entries_test
