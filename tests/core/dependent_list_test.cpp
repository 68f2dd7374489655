// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/dependent_list.h"

#include <gmock/gmock.h>

#include "tests/core/node_tree.h"

namespace tervane {
namespace {

using test::LoadText;
using test::Root;
using test::SavedLines;
using test::ValueNode;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::UnorderedElementsAre;

template <class ListBase>
class Master;

template <class ListBase>
class MasterItem : public CYbSEKvfGroupBase, public ListBase::ItemBase {
 public:
  explicit MasterItem(CYbSEKvfBase* parent) : CYbSEKvfGroupBase("MasterItem", "Item_%d", parent) {}

  const std::string& GetName() const override { return name_; }
  void SetName(const std::string& name) override {
    name_ = name;
    this->RenameLinked(name);
  }
  void OnMasterChanged(CTvnDependentListBase* list, int number) override {
    for (auto* item : this->LinkedItems()) item->OnMasterChanged(list, number);
  }
  void ReadData(KvfNode* section) override {
    CYbSEKvfGroupBase::ReadData(section);
    SetName(name_);
    static_cast<Master<ListBase>*>(GetParent())->LinkNewItem(this);
  }

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys("Name", name_); }

 private:
  std::string name_;
};

template <class ListBase>
class Master : public CTvnMasterList<MasterItem<ListBase>, ListBase> {
 public:
  explicit Master(CYbSEKvfBase* parent)
      : CTvnMasterList<MasterItem<ListBase>, ListBase>("Master", "Master", "New_", parent) {
    this->GetRoot()->RegisterImportantNode(this, "MASTER");
  }
  std::vector<std::string> Names() const {
    std::vector<std::string> names;
    for (int number = 1; number <= this->GetItemCount(); ++number) names.push_back(this->GetItem(number)->GetName());
    return names;
  }
};

template <class ListBase>
class Entry : public CYbSEKvfGroupBase, public ListBase::ItemBase {
 public:
  Entry(const std::string& name, CYbSEKvfBase* parent) : CYbSEKvfGroupBase(name, "Entry_%d", parent), name_(name) {}

  int Value = 0;
  int Told = 0;  ///< The number that the latest change of the master told.

  /// The place among the entries alone.
  int GetNumberWhatAmI() const override {
    int number = 0;
    for (CYbSEKvfBase* child = GetParent()->GetFirstChild(); child; child = GetParent()->GetNextChild(child)) {
      number += dynamic_cast<Entry*>(child) != nullptr;
      if (child == this) return number;
    }
    return -1;
  }
  const std::string& GetName() const override { return name_; }
  void SetName(const std::string& name) override {
    SetTitle(name);
    name_ = name;
  }
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
template <class ListBase>
class Dependent : public CTvnDependentList<CYbSEKvfGroupBase, Entry<ListBase>, ListBase> {
 public:
  using Base = CTvnDependentList<CYbSEKvfGroupBase, Entry<ListBase>, ListBase>;

  explicit Dependent(CYbSEKvfBase* parent) : Base("Dependent", "Dependent", "MASTER", parent) {
    this->template NewChild<ValueNode>("Front");
    this->FollowMaster();
    this->template NewChild<ValueNode>("Back");
  }
  void RefreshDependents() override { ++Refreshed; }
  int Refreshed = 0;

  std::vector<Entry<ListBase>*> Entries() const {
    std::vector<Entry<ListBase>*> entries;
    for (CYbSEKvfBase* child = this->GetFirstChild(); child; child = this->GetNextChild(child))
      if (auto* entry = dynamic_cast<Entry<ListBase>*>(child)) entries.push_back(entry);
    return entries;
  }
  /// "-" for the children that are no entries.
  std::string Names() const {
    std::string names;
    for (CYbSEKvfBase* child = this->GetFirstChild(); child; child = this->GetNextChild(child)) {
      const auto* entry = dynamic_cast<Entry<ListBase>*>(child);
      names += (names.empty() ? "" : " ") + (entry ? entry->GetName() : "-");
    }
    return names;
  }
};

template <class ListBase>
class DependentListTest : public testing::Test {
 public:
  using MasterList = Master<ListBase>;
  using DependentList = Dependent<ListBase>;

  Root root;
  MasterList* master = root.NewChild<MasterList>();
  DependentList* first = root.NewChild<DependentList>();
  CYbSEKvfBase* group = root.NewChild<ValueNode>("Group");
  DependentList* second = group->NewChild<DependentList>();

  /// Identities, titles, values and links agree with the master.
  void ExpectInStep() {
    for (DependentList* dependent : {first, second}) {
      const auto entries = dependent->Entries();
      ASSERT_EQ(entries.size(), static_cast<std::size_t>(master->GetItemCount()));
      for (std::size_t i = 0; i < entries.size(); ++i) {
        auto* item = master->GetItem(static_cast<int>(i) + 1);
        EXPECT_EQ(entries[i]->GetId(), item->GetId());
        EXPECT_EQ(entries[i]->GetName(), item->GetName());
        EXPECT_EQ(entries[i]->GetTitle(), item->GetName());
        EXPECT_EQ(dependent->FindDependentItem(item->GetId()), entries[i]);
      }
    }
    for (int number = 1; number <= master->GetItemCount(); ++number)
      EXPECT_THAT(master->GetItem(number)->LinkedItems(),
                  UnorderedElementsAre(first->Entries()[static_cast<std::size_t>(number) - 1],
                                       second->Entries()[static_cast<std::size_t>(number) - 1]));
  }
};
using ListBases = testing::Types<CSpeciesListBase, CDecayListBase, CSorptionProcessesListBase>;
TYPED_TEST_SUITE(DependentListTest, ListBases);

TYPED_TEST(DependentListTest, EveryChangeOfTheMasterReachesAllDependentsInPlace) {
  struct Case {
    const char* what;
    std::function<void(typename TestFixture::MasterList&)> change;
    const char* names;  ///< Of the dependent's children.
  };
  auto& list = *this->master;
  for (int i = 0; i < 3; ++i) list.AddItem();
  // Each builds on the one before.
  for (const Case& c : {Case{"as made", [](auto&) {}, "- - New_1 New_2 New_3"},
                        {"insert", [](auto& m) { m.InsertItem(1, 1); }, "- - New_4 New_1 New_2 New_3"},
                        {"up", [](auto& m) { m.MoveItemUp(3, 1); }, "- - New_4 New_2 New_1 New_3"},
                        {"down", [](auto& m) { m.MoveItemDown(1, 1); }, "- - New_2 New_4 New_1 New_3"},
                        {"up first", [](auto& m) { m.MoveItemUp(1, 1); }, "- - New_2 New_4 New_1 New_3"},
                        {"down last", [](auto& m) { m.MoveItemDown(4, 1); }, "- - New_2 New_4 New_1 New_3"},
                        {"down of level 2", [](auto& m) { m.MoveItemDown(1, 2); }, "- - New_2 New_4 New_1 New_3"},
                        {"rename", [](auto& m) { m.GetItem(2)->SetName("N"); }, "- - New_2 N New_1 New_3"},
                        {"delete", [](auto& m) { m.DeleteItem(3, 1); }, "- - New_2 N New_3"},
                        {"delete behind", [](auto& m) { m.DeleteItem(4, 1); }, "- - New_2 N New_3"},
                        {"insert behind", [](auto& m) { m.InsertItem(4, 1); }, "- - New_2 N New_3"},
                        {"delete of level 2", [](auto& m) { m.DeleteItem(1, 2); }, "- - New_2 N New_3"},
                        {"shrink", [](auto& m) { m.SetItemCount(1, 1); }, "- - New_2"},
                        {"empty", [](auto& m) { m.SetItemCount(0, 1); }, "- -"}}) {
    c.change(list);
    EXPECT_EQ(this->first->Names(), c.names) << c.what;
    EXPECT_EQ(this->second->Names(), c.names) << c.what;
    this->ExpectInStep();
  }
}

TYPED_TEST(DependentListTest, OtherChildrenOfTheDependentKeepTheirPlaces) {
  auto& list = *this->master;
  list.AddItem();
  this->first->template NewChild<ValueNode>("Between");
  list.AddItem();
  list.AddItem();
  EXPECT_EQ(this->first->Names(), "- - New_1 - New_2 New_3");
  list.MoveItemUp(2, 1);
  EXPECT_EQ(this->first->Names(), "- - New_2 - New_1 New_3");
  list.MoveItemUp(3, 1);
  EXPECT_EQ(this->first->Names(), "- - New_2 - New_3 New_1");
  list.InsertItem(1, 1);
  EXPECT_EQ(this->first->Names(), "- - New_4 - New_2 New_3 New_1");
  list.DeleteItem(1, 1);
  EXPECT_EQ(this->first->Names(), "- - - New_2 New_3 New_1");
  this->ExpectInStep();
}

TYPED_TEST(DependentListTest, AMoveKeepsTheValuesWithTheirEntries) {
  auto& list = *this->master;
  for (int value = 1; value <= 3; ++value) {
    list.AddItem();
    this->first->Entries().back()->Value = value;
  }
  list.MoveItemUp(3, 1);
  list.DeleteItem(1, 1);
  EXPECT_EQ(this->first->Entries()[0]->Value, 3);
  EXPECT_EQ(this->first->Entries()[1]->Value, 2);
}

TYPED_TEST(DependentListTest, ALateDependentStartsCompleteAndFollows) {
  auto& list = *this->master;
  list.AddItem();
  list.AddItem();
  auto late = std::make_unique<typename TestFixture::DependentList>(&this->root);
  EXPECT_EQ(late->Names(), "- New_1 New_2 -");
  EXPECT_EQ(late->Entries()[1]->GetId(), list.GetItem(2)->GetId());
  list.AddItem();
  list.GetItem(1)->SetName("N");
  EXPECT_EQ(late->Names(), "- N New_2 - New_3");

  // Nothing of the master leads to it once it is gone.
  late.reset();
  EXPECT_EQ(list.DependentLists().size(), 2U);
  list.GetItem(1)->SetName("M");
  this->ExpectInStep();
}

TYPED_TEST(DependentListTest, ASetupIsReadWithTheValuesOnTheirEntriesAndReadAgain) {
  const char* masterText =
      "section Master { YbSEKvfListItemCount = 2\n section Item_1 { Name = \"A\" }"
      " section Item_2 { Name = \"B\" } }\n";
  const char* dependentText =
      "section Dependent { section Entry_2 { Name = \"B\"\n Value = 22 }"
      " section Entry_3 { Name = \"C\"\n Value = 33 } }";  // Of nobody.
  for (int time = 0; time < 2; ++time) {
    EXPECT_THAT(LoadText(this->root, std::string(masterText) + dependentText), IsEmpty());
    EXPECT_EQ(this->first->Names(), "- - A B");
    ASSERT_EQ(this->first->Entries().size(), 2U);
    EXPECT_EQ(this->first->Entries()[0]->Value, 0);  // Has no section.
    EXPECT_EQ(this->first->Entries()[1]->Value, 22);
    EXPECT_EQ(this->first->Entries()[1]->Told, 2);
    this->ExpectInStep();
  }
  this->master->GetItem(1)->SetName("N");
  this->root.RemoveChild(this->group).reset();
  EXPECT_THAT(SavedLines(this->root),
              ElementsAre("section Master {", "Touched = 0", "YbSEKvfListItemCount = 2",         //
                          "section Item_1 {", "Touched = 0", "Name = \"N\"", "}",                //
                          "section Item_2 {", "Touched = 0", "Name = \"B\"", "}", "}",           //
                          "section Dependent {", "Touched = 0",                                  //
                          "section Front {", "Touched = 0", "Value = 7", "}",                    //
                          "section Back {", "Touched = 0", "Value = 7", "}",                     //
                          "section Entry_1 {", "Touched = 0", "Name = \"N\"", "Value = 0", "}",  //
                          "section Entry_2 {", "Touched = 0", "Name = \"B\"", "Value = 22", "}", "}"));
}

TYPED_TEST(DependentListTest, AShorterFileReadOverALongerSetupShrinksTheDependents) {
  for (int i = 0; i < 3; ++i) this->master->AddItem();
  LoadText(this->root, "section Master { YbSEKvfListItemCount = 1\n section Item_1 { Name = \"A\" } }");
  EXPECT_EQ(this->first->Names(), "- - A");
  this->ExpectInStep();
}

TYPED_TEST(DependentListTest, AMasterEntryWithoutASectionIsNamedAndLinkedInPlace) {
  LoadText(this->root,
           "section Master { YbSEKvfListItemCount = 3\n section Item_1 { Name = \"New_3\" }"
           " section Item_3 { Name = \"C\" } }");
  EXPECT_THAT(this->master->Names(), ElementsAre("New_3", "New_4", "C"));
  EXPECT_EQ(this->first->Names(), "- - New_3 New_4 C");
  this->ExpectInStep();
}

TYPED_TEST(DependentListTest, ADefaultNameDoesNotComeBackAndIsNotTaken) {
  struct Case {
    std::vector<std::string> fromFile;
    std::vector<int> deletes;  ///< From what stands then.
    const char* name;
  };
  for (const Case& c : {Case{{}, {}, "New_1"},
                        {{"New_1", "New_2"}, {}, "New_3"},
                        {{"New_1", "New_2", "New_3"}, {2}, "New_4"},
                        {{"New_1", "New_2", "New_3"}, {3, 2}, "New_4"},
                        {{"A", "New_3"}, {}, "New_4"},
                        {{"New_3", "New_4"}, {}, "New_5"},
                        {{"New_4", "New_3"}, {}, "New_5"},
                        {{"A", "NEW_3"}, {}, "New_4"}}) {
    Root tree;
    auto* list = tree.NewChild<typename TestFixture::MasterList>();
    list->SetItemCount(static_cast<int>(c.fromFile.size()), 1);
    for (std::size_t i = 0; i < c.fromFile.size(); ++i) list->GetItem(static_cast<int>(i) + 1)->SetName(c.fromFile[i]);
    for (const int number : c.deletes) list->DeleteItem(number, 1);
    EXPECT_EQ(list->AddItem()->GetName(), c.name) << testing::PrintToString(c.fromFile);
  }
  for (int i = 0; i < 3; ++i) this->master->AddItem();
  this->master->DeleteItem(2, 1);
  this->master->AddItem();
  this->master->DeleteItem(3, 1);
  this->master->InsertItem(1, 1);
  EXPECT_THAT(this->master->Names(), ElementsAre("New_5", "New_1", "New_3"));
}

TYPED_TEST(DependentListTest, IdentitiesAreUniqueOverAllTreesAndSurviveChanges) {
  Root other;
  auto* otherMaster = other.NewChild<typename TestFixture::MasterList>();
  const int id = this->master->AddItem()->GetId();
  EXPECT_NE(otherMaster->AddItem()->GetId(), id);
  EXPECT_NE(this->master->AddItem()->GetId(), id);
  this->master->MoveItemDown(1, 1);
  this->master->GetItem(2)->SetName("N");
  EXPECT_EQ(this->master->GetItem(2)->GetId(), id);
  EXPECT_EQ(this->master->FindDependentItem(id), this->master->GetItem(2));
  EXPECT_EQ(this->master->FindDependentItem(-1), nullptr);
  EXPECT_EQ(this->first->FindDependentItem(-1), nullptr);
}

TYPED_TEST(DependentListTest, NodesDieInAnyOrder) {
  for (int i = 0; i < 3; ++i) this->master->AddItem();
  // A dependent, alone and with its group.
  this->root.RemoveChild(this->first).reset();
  this->master->GetItem(1)->SetName("N");
  this->master->DeleteItem(1, 1);
  this->root.RemoveChild(this->group).reset();
  this->master->DeleteItem(1, 1);
  EXPECT_THAT(this->master->DependentLists(), IsEmpty());
  EXPECT_THAT(this->master->GetItem(1)->LinkedItems(), IsEmpty());
  // The master before its dependents, which then follow nobody.
  auto* orphan = this->root.template NewChild<typename TestFixture::DependentList>();
  this->root.RemoveChild(this->master).reset();
  EXPECT_EQ(orphan->Names(), "- New_3 -");
  auto* without = this->root.template NewChild<typename TestFixture::DependentList>();
  EXPECT_EQ(without->Names(), "- -");
  // Last of all the tree, with a dependent in front of its master.
  auto* late = this->root.template NewChild<typename TestFixture::MasterList>();
  late->AddItem();
  this->root.SwapChilds(late, this->root.template NewChild<typename TestFixture::DependentList>());
}

TYPED_TEST(DependentListTest, ARefreshReachesAllDependentsAndThenWhoListens) {
  struct Listener : CTvnDependentListBase {
    Listener(int number, std::vector<std::string>& log) : Number(number), Log(log) {}
    void OnNotify(int value, void* object) override {
      Log.push_back(std::to_string(Number) + ":" + std::to_string(value) + (object == this ? " self" : ""));
    }
    int Number;
    std::vector<std::string>& Log;
  };
  std::vector<std::string> log;
  Listener one(1, log), two(2, log), below(3, log);
  this->master->AddListener(&one);
  this->master->AddListener(&two);
  this->master->AddListener(&one);
  one.AddListener(&below);
  this->master->Notify(5, &two);
  EXPECT_THAT(log, ElementsAre("1:5", "3:5", "2:5 self", "1:5", "3:5"));

  log.clear();
  this->master->RemoveListener(&one);  // The first of its entries alone.
  this->master->RemoveListener(&below);
  this->master->RefreshDependents();
  EXPECT_THAT(log, ElementsAre("2:0", "1:0", "3:0"));
  EXPECT_EQ(this->first->Refreshed, 1);
  EXPECT_EQ(this->second->Refreshed, 1);
}

TYPED_TEST(DependentListTest, ANewEntryIsToldOfItsMasterAndAMasterEntryPassesChangesOn) {
  this->master->AddItem();
  this->master->AddItem();
  EXPECT_EQ(this->second->Entries()[0]->Told, 1);
  EXPECT_EQ(this->second->Entries()[1]->Told, 2);
  this->master->InsertItem(1, 1);
  EXPECT_EQ(this->second->Entries()[0]->Told, 1);
  this->master->GetItem(3)->OnMasterChanged(this->master, 9);
  EXPECT_EQ(this->first->Entries()[2]->Told, 9);
  EXPECT_EQ(this->second->Entries()[2]->Told, 9);
  EXPECT_EQ(this->second->Entries()[1]->Told, 1);
}

}  // namespace
}  // namespace tervane
