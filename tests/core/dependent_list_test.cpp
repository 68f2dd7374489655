// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/dependent_list.h"

#include <random>
#include <set>

#include <gmock/gmock.h>

#include "tests/core/node_tree.h"

namespace tervane::dependent_list_test {
namespace {

using test::LoadText;
using test::Root;
using test::Saved;
using test::ValueNode;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::UnorderedElementsAre;

class MasterItem : public CYbSEKvfGroupBase, public CSpeciesItemBase {
 public:
  explicit MasterItem(CYbSEKvfBase* parent) : CYbSEKvfGroupBase("MasterItem", "Item_%d", parent) {}

  const std::string& GetName() const override { return name_; }
  void SetName(const std::string& name) override { RenameLinked(name_ = name); }
  void ReadData(KvfNode* section) override {
    CYbSEKvfGroupBase::ReadData(section);
    SetName(name_);
    dynamic_cast<CSpeciesListBase*>(GetParent())->LinkNewItem(this);
  }

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys("Name", name_); }

 private:
  std::string name_;
};

class Master : public CTvnMasterList<MasterItem, CSpeciesListBase> {
 public:
  explicit Master(CYbSEKvfBase* parent) : CTvnMasterList("Master", "Master", "New_", parent) {
    GetRoot()->RegisterImportantNode(this, "MASTER");
  }
};

class Entry : public CYbSEKvfGroupBase, public CSpeciesItemBase {
 public:
  Entry(const std::string& name, CYbSEKvfBase* parent) : CYbSEKvfGroupBase(name, "Entry_%d", parent), name_(name) {}

  int Value = 0;
  int Told = 0;  ///< The number that the latest change of the master told.

  const std::string& GetName() const override { return name_; }
  void SetName(const std::string& name) override { name_ = name; }
  void OnMasterChanged(CTvnDependentListBase* /*list*/, int number) override { Told = number; }

 protected:
  void ExchangeKeys(KeyExchange& keys) override {
    keys("Name", name_);
    keys("Value", Value);
  }

 private:
  std::string name_;
};

/// Has a child of its own at either side of the entries that it starts with.
class Dependent : public CTvnDependentList<CYbSEKvfGroupBase, Entry, CSpeciesListBase> {
 public:
  explicit Dependent(CYbSEKvfBase* parent) : CTvnDependentList("Dependent", "Dependent", "MASTER", parent) {
    NewChild<ValueNode>("Front");
    FollowMaster();
    NewChild<ValueNode>("Back");
  }
  void RefreshDependents() override { ++Refreshed; }
  int Refreshed = 0;

  std::vector<Entry*> Entries() const {
    std::vector<Entry*> entries;
    for (CYbSEKvfBase* child = GetFirstChild(); child; child = GetNextChild(child))
      if (auto* entry = dynamic_cast<Entry*>(child)) entries.push_back(entry);
    return entries;
  }
  /// "-" for the children that are no entries.
  std::string Names() const {
    std::string names;
    for (CYbSEKvfBase* child = GetFirstChild(); child; child = GetNextChild(child)) {
      const auto* entry = dynamic_cast<Entry*>(child);
      names += (names.empty() ? "" : " ") + (entry ? entry->GetName() : "-");
    }
    return names;
  }
};

class DependentList : public testing::Test {
 public:
  Root root;
  Master* master = root.NewChild<Master>();
  Dependent* first = root.NewChild<Dependent>();
  CYbSEKvfBase* group = root.NewChild<ValueNode>("Group");
  Dependent* second = group->NewChild<Dependent>();

  /// Order, identities, names and links agree with the master.
  void ExpectInStep() {
    for (Dependent* dependent : {first, second}) {
      const auto entries = dependent->Entries();
      ASSERT_EQ(entries.size(), static_cast<std::size_t>(master->GetItemCount()));
      for (std::size_t i = 0; i < entries.size(); ++i) {
        MasterItem* item = master->GetItem(static_cast<int>(i) + 1);
        ASSERT_EQ(entries[i]->GetId(), item->GetId());
        ASSERT_EQ(entries[i]->GetName(), item->GetName());
        ASSERT_EQ(dependent->FindDependentItem(item->GetId()), entries[i]);
        ASSERT_EQ(master->FindDependentItem(item->GetId()), item);
        ASSERT_THAT(item->LinkedItems(), UnorderedElementsAre(first->Entries()[i], second->Entries()[i]));
      }
    }
  }
};

TEST_F(DependentList, EveryChangeOfTheMasterReachesAllDependentsInPlace) {
  std::mt19937 random(1);
  std::set<std::string> defaultNames;
  for (int step = 0; step < 2000; ++step) {
    const int count = master->GetItemCount();
    const int number = static_cast<int>(random() % static_cast<unsigned>(count + 4)) - 1;  // Also out of range.
    const auto what = random() % 7;
    if (what == 0) master->AddItem();
    if (what == 1) master->InsertItem(number, 1);
    MasterItem* made = master->GetItemCount() > count ? master->GetItem(what == 0 ? count + 1 : number) : nullptr;
    if (what == 2) master->DeleteItem(number, static_cast<int>(random() % 2) + 1);
    if (what == 3) master->MoveItemUp(number, 1);
    if (what == 4) master->MoveItemDown(number, 1);
    if (what == 5 && master->GetItem(number)) master->GetItem(number)->SetName("N" + std::to_string(step));
    if (what == 6 && count > 8) {
      master->SetItemCount(std::min(number, count), 1);
      defaultNames.clear();
    }
    if (made) {
      EXPECT_TRUE(defaultNames.insert(made->GetName()).second) << made->GetName() << " came back";
      first->Entries()[static_cast<std::size_t>(made->GetNumberWhatAmI()) - 1]->Value = made->GetId();
    }
    ExpectInStep();
    for (const Entry* entry : first->Entries()) ASSERT_EQ(entry->Value, entry->GetId());  // Moved with it.
  }
}

TEST_F(DependentList, OtherChildrenOfTheDependentKeepTheirPlaces) {
  master->AddItem();
  first->NewChild<ValueNode>("Between");
  master->AddItem();
  master->AddItem();
  EXPECT_EQ(first->Names(), "- - New_1 - New_2 New_3");
  master->MoveItemUp(2, 1);
  master->MoveItemUp(3, 1);
  EXPECT_EQ(first->Names(), "- - New_2 - New_3 New_1");
  master->InsertItem(1, 1);
  EXPECT_EQ(first->Names(), "- - New_4 - New_2 New_3 New_1");
  master->DeleteItem(1, 1);
  EXPECT_EQ(first->Names(), "- - - New_2 New_3 New_1");
}

TEST_F(DependentList, ALateDependentStartsCompleteAndFollows) {
  master->AddItem();
  master->AddItem();
  auto late = std::make_unique<Dependent>(&root);
  EXPECT_EQ(late->Names(), "- New_1 New_2 -");
  EXPECT_EQ(late->Entries()[1]->GetId(), master->GetItem(2)->GetId());
  master->AddItem();
  master->GetItem(1)->SetName("N");
  EXPECT_EQ(late->Names(), "- N New_2 - New_3");
  // Nothing of the master leads to it once it is gone.
  late.reset();
  EXPECT_EQ(master->DependentLists().size(), 2U);
  master->GetItem(1)->SetName("M");
  ExpectInStep();
}

TEST_F(DependentList, ASetupIsReadWithTheValuesOnTheirEntriesAndReadAgain) {
  const std::string text =  // The third entry is of nobody.
      "section Master { YbSEKvfListItemCount = 2; section Item_1 { Name = \"A\"; } section Item_2 { Name = \"B\"; } } "
      "section Dependent { section Entry_4 { Name = \"B\"; Value = 22; } section Entry_5 { Name = \"C\"; Value = 33; } "
      "}";
  // Entries without a section are named in place.
  LoadText(root,
           "section Master { YbSEKvfListItemCount = 3; section Item_1 { Name = \"New_3\"; } "
           "section Item_3 { Name = \"C\"; } }");
  EXPECT_EQ(first->Names(), "- - New_3 New_4 C");
  ExpectInStep();
  for (int time = 0; time < 2; ++time) {  // Also over a longer one.
    EXPECT_THAT(LoadText(root, text), IsEmpty());
    EXPECT_EQ(first->Entries()[1]->Told, 2);
    ExpectInStep();
  }
  master->GetItem(1)->SetName("N");
  root.RemoveChild(group).reset();
  EXPECT_EQ(Saved(root),
            "section Master { Touched = 0; YbSEKvfListItemCount = 2; section Item_1 { Touched = 0; Name = \"N\"; } "
            "section Item_2 { Touched = 0; Name = \"B\"; } } section Dependent { Touched = 0; "
            "section Front { Touched = 0; Value = 7; } section Back { Touched = 0; Value = 7; } "
            "section Entry_3 { Touched = 0; Name = \"N\"; Value = 0; } "
            "section Entry_4 { Touched = 0; Name = \"B\"; Value = 22; } }");
}

TEST_F(DependentList, ADefaultNameDoesNotComeBackAndIsNotTaken) {
  struct Case {
    std::vector<std::string> fromFile;
    std::vector<int> deletes;  ///< From what stands then.
    const char* name;
  };
  const Case cases[] = {{{}, {}, "New_1"},
                        {{"New_1", "New_2", "New_3"}, {2}, "New_4"},
                        {{"New_1", "New_2", "New_3"}, {3, 2}, "New_4"},
                        {{"New_4", "New_3"}, {}, "New_5"},
                        {{"A", "NEW_3"}, {}, "New_4"}};
  for (const Case& c : cases) {
    Root tree;
    auto* list = tree.NewChild<Master>();
    list->SetItemCount(static_cast<int>(c.fromFile.size()), 1);
    for (std::size_t i = 0; i < c.fromFile.size(); ++i) list->GetItem(static_cast<int>(i) + 1)->SetName(c.fromFile[i]);
    for (const int number : c.deletes) list->DeleteItem(number, 1);
    EXPECT_EQ(list->AddItem()->GetName(), c.name) << testing::PrintToString(c.fromFile);
    EXPECT_NE(list->GetItem(1)->GetId(), master->AddItem()->GetId());  // Unique over all trees.
  }
}

TEST_F(DependentList, NodesDieInAnyOrder) {
  for (int i = 0; i < 3; ++i) master->AddItem();
  // A dependent, alone and with its group.
  root.RemoveChild(first).reset();
  master->GetItem(1)->SetName("N");
  master->DeleteItem(1, 1);
  root.RemoveChild(group).reset();
  master->DeleteItem(1, 1);
  EXPECT_THAT(master->DependentLists(), IsEmpty());
  EXPECT_THAT(master->GetItem(1)->LinkedItems(), IsEmpty());
  // The master before its dependents, which then follow nobody.
  auto* orphan = root.NewChild<Dependent>();
  root.RemoveChild(master).reset();
  EXPECT_EQ(orphan->Names(), "- New_3 -");
  EXPECT_EQ(root.NewChild<Dependent>()->Names(), "- -");
  // Last of all the tree, with a dependent in front of its master.
  auto* late = root.NewChild<Master>();
  late->AddItem();
  root.SwapChilds(late, root.NewChild<Dependent>());
}

TEST_F(DependentList, ARefreshReachesAllDependentsAndThenWhoListens) {
  static std::string log;
  log.clear();
  struct Listener : CTvnDependentListBase {
    explicit Listener(int number) : Number(number) {}
    void OnNotify(int value, void* object) override {
      log += std::to_string(Number) + ":" + std::to_string(value) + (object == this ? " self, " : ", ");
    }
    int Number;
  } one(1), two(2), below(3);
  master->AddListener(&one);
  master->AddListener(&two);
  master->AddListener(&one);
  one.AddListener(&below);
  master->Notify(5, &two);
  EXPECT_EQ(std::exchange(log, ""), "1:5, 3:5, 2:5 self, 1:5, 3:5, ");
  master->RemoveListener(&one);  // The first of its entries alone.
  master->RemoveListener(&below);
  master->RefreshDependents();
  EXPECT_EQ(log, "2:0, 1:0, 3:0, ");
  EXPECT_EQ(first->Refreshed + second->Refreshed, 2);
}

}  // namespace
}  // namespace tervane::dependent_list_test
