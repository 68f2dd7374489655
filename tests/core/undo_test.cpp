// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/undo.h"

#include <random>

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "core/dependent_list.h"
#include "simspec/basic_parameters.h"
#include "simspec/extra_params.h"
#include "simspec/model_components.h"
#include "simspec/periods.h"
#include "simspec/titles.h"
#include "tests/core/node_tree.h"
#include "tests/support/page_driver.h"
#include "tests/support/setup.h"

namespace tervane::undo_test {
namespace {

using test::PageDriver;
using test::SavedText;
using test::SetupText;
using test::ValueOf;

/// A setup of which a page was opened and a value typed, with undo.
class UndoOfASetup : public testing::Test {
 protected:
  UndoOfASetup() {
    document.OpenText(SetupText(14,
                                "section ExtraParams {\nNoOfParams = 3\nsection ExtraParam_1 {\nName = \"a\"\n}\n"
                                "section ExtraParam_2 {\nName = \"b\"\n}\nsection ExtraParam_3 {\nName = \"c\"\n}\n}"),
                      "/data/a.tvd");
    undo.Reset();
  }

  CFlowModelDoc document;
  UndoStack undo{document.Root()};
};

TEST_F(UndoOfASetup, EveryKindOfChangeIsUndoneAndRedone) {
  auto& list = *document.Root().Child<CExtraParamsKvf>();
  auto& period = *document.Root().Important(kSimulationPeriod);
  auto& components = *document.Root().Important(kModflowComponents);
  document.Root().Important(kBasicParameters)->ModelType = 1;
  undo.Reset();
  const std::pair<const char*, std::function<void()>> changes[] = {
      {"type a title", [&] { PageDriver(document, "SimSpec/SimTitle").Enter("Simulation Title:", "Karup"); }},
      {"delete an item", [&] { list.DeleteItem(2, 1); }},
      {"insert an item", [&] { list.InsertItem(1, 1); }},
      {"move an item", [&] { list.MoveItemDown(1, 1); }},
      {"change the type of a value", [&] { list.GetItem(1)->Type = CExtraParamsItemKvf::kText; }},
      {"empty the list", [&] { list.SetItemCount(0, 1); }},
      {"change what the file does not hold",
       [&] {
         period.HotStart = period.SimStartFromHotStartDate = 1;
         period.HotStartDate = "2000/01/05 00:00";
       }},
      {"choose another kind of flow", [&] { components.ChooseVariablySaturated(1); }},
      {"change the area of the maps",
       [&] {
         document.Global().SetDefaultDataArea({1, 2, 3, 4});
       }},
  };
  std::vector<std::string> texts{SavedText(document)};
  for (const auto& [name, change] : changes) {
    change();
    EXPECT_TRUE(undo.Commit(name));
    EXPECT_EQ(undo.UndoName(), name);
    texts.push_back(SavedText(document));
    EXPECT_NE(texts.back(), texts[texts.size() - 2]) << name;
  }
  for (int round = 0; round < 2; ++round) {
    for (std::size_t step = std::size(changes); step-- > 0;) {
      EXPECT_EQ(undo.UndoName(), changes[step].first);
      ASSERT_TRUE(undo.Undo());
      EXPECT_EQ(SavedText(document), texts[step]) << changes[step].first;
    }
    EXPECT_FALSE(undo.Undo());
    for (std::size_t step = 0; step < std::size(changes); ++step) {
      EXPECT_EQ(undo.RedoName(), changes[step].first);
      ASSERT_TRUE(undo.Redo());
      EXPECT_EQ(SavedText(document), texts[step + 1]) << changes[step].first;
    }
    EXPECT_FALSE(undo.Redo());
  }
  // A new change ends what could be redone.
  undo.Undo();
  list.AddItem();
  EXPECT_TRUE(undo.Commit("another"));
  EXPECT_FALSE(undo.CanRedo());
}

TEST_F(UndoOfASetup, NothingChangedIsNoStepAndOneControlWithinASecondIsOne) {
  EXPECT_FALSE(undo.Commit("nothing"));
  const UndoStack::Time start{};
  int control = 0, other = 0;
  auto& title = *document.Root().Important(kBasicParameters)->Child<CSimTitleKvf>();
  const auto type = [&](const char* text, const void* source, int milliseconds) {
    title.Title = text;
    EXPECT_TRUE(undo.Commit("Change Title", source, start + std::chrono::milliseconds(milliseconds)));
  };
  type("K", &control, 0);
  type("Ka", &control, 500);
  type("Kar", &control, 1400);
  type("Karu", &control, 2500);  // later than a second after the last
  type("Karup", &other, 2600);
  const char* expected[] = {"Karu", "Kar", ""};
  for (const char* text : expected) {
    undo.Undo();
    EXPECT_EQ(title.Title, text);
  }
  EXPECT_FALSE(undo.CanUndo());
}

TEST_F(UndoOfASetup, StepsTellWhereTheyWereMadeAndStatesAreKnownAgain) {
  auto& title = *document.Root().Important(kBasicParameters)->Child<CSimTitleKvf>();
  const auto type = [&](const char* text, const char* control) {
    title.Title = text;
    EXPECT_TRUE(undo.Commit("Change Title", nullptr, {}, {title.Serial(), control}));
    return undo.StateNumber();
  };
  const std::uint64_t opened = undo.StateNumber();
  const std::uint64_t first = type("K", "Title"), second = type("Ka", "Other");
  EXPECT_EQ(undo.UndoPlace().control, "Other");
  EXPECT_EQ(undo.UndoPlace().node, title.Serial());
  undo.Undo();
  EXPECT_EQ(undo.StateNumber(), first);
  EXPECT_EQ(undo.RedoPlace().control, "Other");
  undo.Undo();
  EXPECT_EQ(undo.StateNumber(), opened);
  EXPECT_EQ(undo.UndoPlace().node, 0u);
  undo.Redo();
  undo.Redo();
  EXPECT_EQ(undo.StateNumber(), second);
  undo.Undo();
  EXPECT_NE(type("Kb", "Title"), second);  // another tree, as deep
}

TEST_F(UndoOfASetup, KnowsWhetherTheTreeIsAsItWasSaved) {
  auto& basics = *document.Root().Important(kBasicParameters);
  const auto change = [&](int engine) {
    basics.ModelType = engine;
    undo.Commit("Change Engine");
  };
  EXPECT_TRUE(undo.IsSaved());
  change(1);
  EXPECT_FALSE(undo.IsSaved());
  undo.MarkSaved();
  change(2);
  undo.Undo();
  EXPECT_TRUE(undo.IsSaved());
  undo.Undo();
  EXPECT_FALSE(undo.IsSaved());
  change(3);  // the saved state cannot be reached any more
  undo.Undo();
  EXPECT_FALSE(undo.IsSaved());
}

// ---- Links

class Master;

class Species : public CYbSEKvfGroupBase, public CSpeciesItemBase {
 public:
  explicit Species(CYbSEKvfBase* parent) : CYbSEKvfGroupBase("", "Species_%d", parent) {}
  const std::string& GetName() const override { return GetTitle(); }
  void SetName(const std::string& name) override {
    SetTitle(name);
    RenameLinked(name);
  }
};

class Master : public CTvnMasterList<Species, CSpeciesListBase> {
 public:
  explicit Master(CYbSEKvfBase* parent) : CTvnMasterList("", "Species", "Species_", parent) {
    GetRoot()->RegisterImportantNode(this, "SPECIES_LIST");
  }
};

class Entry : public CYbSEKvfGroupBase, public CSpeciesItemBase {
 public:
  Entry(const std::string& name, CYbSEKvfBase* parent) : CYbSEKvfGroupBase(name, "Entry_%d", parent) {}
  const std::string& GetName() const override { return GetTitle(); }
  void SetName(const std::string& name) override { SetTitle(name); }
};

class Dependent : public CTvnDependentList<CYbSEKvfGroupBase, Entry, CSpeciesListBase> {
 public:
  explicit Dependent(CYbSEKvfBase* parent) : CTvnDependentList("", "Dependent", "SPECIES_LIST", parent) {
    FollowMaster();
  }
  std::string Names() const {
    std::string names;
    for (int number = 1; number <= GetChildCount(); ++number) names += GetChild(number)->GetTitle() + " ";
    return names;
  }
};

TEST(Undo, WhatWasDeletedComesBackWithItsLinksInEveryDependent) {
  CYbSEKvfGlobalBase root("T");
  auto* master = root.NewChild<Master>();
  auto* first = root.NewChild<Dependent>();
  auto* second = root.NewChild<Dependent>();
  for (const char* name : {"N", "P", "K"}) master->AddItem()->SetName(name);
  UndoStack undo(root);
  master->DeleteItem(2, 1);
  ASSERT_TRUE(undo.Commit("Delete Species"));
  master->MoveItemUp(2, 1);
  ASSERT_TRUE(undo.Commit("Move Species"));
  EXPECT_EQ(first->Names(), "K N ");
  undo.Undo();
  undo.Undo();
  EXPECT_EQ(first->Names(), "N P K ");
  EXPECT_EQ(second->Names(), "N P K ");
  // The links are the old ones: a new name arrives, and a further deletion takes the entries along.
  master->GetItem(2)->SetName("phosphorus");
  EXPECT_EQ(second->Names(), "N phosphorus K ");
  master->DeleteItem(2, 1);
  EXPECT_EQ(first->Names(), "N K ");
  undo.Commit("again");
  undo.Undo();
  EXPECT_EQ(first->Names(), "N P K ");
  // An addition that is undone leaves no links behind.
  master->AddItem()->SetName("Cl");
  undo.Commit("Add Species");
  undo.Undo();
  EXPECT_EQ(first->Names(), "N P K ");
  for (int number = 1; number <= 3; ++number) EXPECT_EQ(master->GetItem(number)->LinkedItems().size(), 2u);
}

TEST(Undo, WhatComesBackBelowWhatTakesNoPartHasNoFindings) {
  test::Root root;
  auto* above = root.NewChild<test::ValueGroup>("Above");
  auto* item = above->NewChild<test::ValueNode>("Item");
  item->Finds = {{Severity::Warning, "odd", {}, {}}};
  UndoStack undo(root);
  root.Validate();
  ASSERT_EQ(item->Findings().size(), 1u);
  above->RemoveChild(item);
  ASSERT_TRUE(undo.Commit("Delete"));
  above->Used = 0;
  root.Validate();
  undo.Undo();
  root.Validate();
  EXPECT_TRUE(item->Findings().empty());
  above->Used = 1;
  root.Validate();
  EXPECT_EQ(item->Findings().size(), 1u);
}

// ---- Random walks

/// A number from 0 to below `count`.
std::size_t Below(std::mt19937& random, std::size_t count) {
  return std::uniform_int_distribution<std::size_t>(0, count - 1)(random);
}

/// Walks at random through edits, undo and redo: what `show` tells of the tree must come back exactly.
void Walk(UndoStack& undo, std::mt19937& random, int actions, const std::function<void()>& edit,
          const std::function<std::string()>& show) {
  std::vector<std::string> shown{show()};  // after each step that is done or can be redone
  std::size_t done = 0;
  for (int action = 0; action < actions; ++action) {
    const std::size_t choice = Below(random, 5);
    if (choice > 1) {
      edit();
      std::string after = show();
      // What a setup's file does not tell may have changed alone.
      if (undo.Commit("Edit")) {
        shown.resize(++done);
        shown.push_back(std::move(after));
      } else {
        ASSERT_EQ(after, shown[done]) << "missed after " << action << " actions";
      }
      continue;
    }
    if (choice == 0) {
      ASSERT_EQ(undo.Undo(), done > 0);
      if (done > 0) --done;
    } else {
      ASSERT_EQ(undo.Redo(), done + 1 < shown.size());
      if (done + 1 < shown.size()) ++done;
    }
    ASSERT_EQ(show(), shown[done]) << "after " << action << " actions";
  }
  while (undo.Undo()) ASSERT_EQ(show(), shown[--done]);
  while (undo.Redo()) ASSERT_EQ(show(), shown[++done]);
}

/// All that holds the setup, and the lists among it.
void Collect(CYbSEKvfBase& node, std::vector<CYbSEKvfBase*>& nodes, std::vector<CYbSEKvfListBaseInterface*>& lists) {
  if (!node.HoldsSetup()) return;
  nodes.push_back(&node);
  if (auto* list = dynamic_cast<CYbSEKvfListBaseInterface*>(&node)) lists.push_back(list);
  for (CYbSEKvfBase* child = node.GetFirstChild(); child; child = node.GetNextChild(child))
    Collect(*child, nodes, lists);
}

void ChangeKey(CYbSEKvfBase& node, std::mt19937& random) {
  std::vector<KeyInfo> keys;
  node.DescribeKeys(keys);
  std::erase_if(keys, [](const KeyInfo& key) { return !key.written || !key.member; });
  if (keys.empty()) return;
  const KeyInfo& key = keys[Below(random, keys.size())];
  void* member = const_cast<void*>(key.member);
  const int number = static_cast<int>(Below(random, 4));
  if (key.type == "int") *static_cast<int*>(member) = number;
  if (key.type == "float") *static_cast<float*>(member) = 0.5F * static_cast<float>(number);
  if (key.type == "double") *static_cast<double*>(member) = 0.5 * number;
  if (key.type == "bool") *static_cast<bool*>(member) = number > 1;
  if (key.type == "string") *static_cast<std::string*>(member) = std::string(static_cast<std::size_t>(number) * 9, 'x');
  if (key.type == "filename") *static_cast<FileName*>(member) = FileName(fmt::format("a{}.nds2", number), "/data");
}

void ChangeList(CYbSEKvfListBaseInterface& list, std::mt19937& random) {
  const int count = list.GetItemCount(), number = static_cast<int>(Below(random, static_cast<std::size_t>(count) + 1));
  switch (Below(random, 6)) {
    case 0:
      return list.SetItemCount(number, 1);
    case 1:
      return void(list.MoveItemUp(number, 1));
    case 2:
      return void(list.MoveItemDown(number, 1));
    case 3:
      return list.DeleteItem(number, 1);
    case 4:
      return list.InsertItem(number, 1);
    default:
      if (count < 4) list.AddItemNode();
  }
}

TEST_F(UndoOfASetup, ARandomWalkComesBackToEveryState) {
  std::mt19937 random(1);
  const auto edit = [&] {
    std::vector<CYbSEKvfBase*> nodes;
    std::vector<CYbSEKvfListBaseInterface*> lists;
    Collect(document.Root(), nodes, lists);
    // One step may hold several changes.
    for (std::size_t changes = Below(random, 3) + 1; changes > 0; --changes) {
      CYbSEKvfBase& node = *nodes[Below(random, nodes.size())];
      Below(random, 8) == 0 ? node.SetTitle(fmt::format("title {}", Below(random, 3))) : ChangeKey(node, random);
    }
    if (Below(random, 2) == 0) ChangeList(*lists[Below(random, lists.size())], random);
  };
  Walk(undo, random, 1000, edit, [this] { return SavedText(document); });
}

TEST(Undo, ARandomWalkKeepsLinksInEveryDependent) {
  CYbSEKvfGlobalBase root("T");
  auto* master = root.NewChild<Master>();
  const auto* first = root.NewChild<Dependent>();
  const auto* second = root.NewChild<Dependent>();
  UndoStack undo(root);
  std::mt19937 random(2);
  const auto edit = [&] {
    const int count = master->GetItemCount();
    if (count > 0 && Below(random, 3) == 0)
      master->GetItem(static_cast<int>(Below(random, static_cast<std::size_t>(count))) + 1)
          ->SetName(fmt::format("{}", Below(random, 100)));
    else
      ChangeList(*master, random);
  };
  const auto show = [&] {
    std::string names = first->Names();
    EXPECT_EQ(second->Names(), names);
    for (int number = 1; number <= master->GetItemCount(); ++number) {
      Species& species = *master->GetItem(number);
      EXPECT_EQ(species.GetName(), first->GetChild(number)->GetTitle());
      EXPECT_EQ(species.LinkedItems().size(), 2u);
      for (const CSpeciesItemBase* entry : species.LinkedItems()) names += entry->GetName() + " ";
    }
    return names;
  };
  Walk(undo, random, 5000, edit, show);
}

}  // namespace
}  // namespace tervane::undo_test
