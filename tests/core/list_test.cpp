// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/list.h"

#include <gmock/gmock.h>

#include "tests/core/node_tree.h"

namespace tervane {
namespace {

using test::LoadText;
using test::Root;
using test::SavedLines;
using test::SectionNames;
using test::ValueNode;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

class Item : public ValueNode {
 public:
  explicit Item(CYbSEKvfBase* parent) : ValueNode("Item_%d", parent) {}
  void SetDefault() override { Value = 7; }
};

/// Items are told apart by their value, which is their serial number.
class Items : public CYbSEKvfListBase<Item> {
 public:
  explicit Items(CYbSEKvfBase* parent) : Items("Items", parent) {}
  Items(std::string section, CYbSEKvfBase* parent) : CYbSEKvfListBase("Items", std::move(section), parent) {}

  std::unique_ptr<Item> NewItem() override {
    auto item = CYbSEKvfListBase::NewItem();
    item->Value = ++made_;
    return item;
  }
  std::vector<int> Values() const {
    std::vector<int> values;
    for (int number = 1; number <= GetItemCount(); ++number) values.push_back(GetItem(number)->Value);
    return values;
  }
  int HasOwnCount = 0;

 protected:
  void ExchangeKeys(KeyExchange& keys) override {
    if (HasOwnCount) keys.Count("NoOfItems", *this);
  }

 private:
  int made_ = 0;
};

class ItemsOfTable : public Items {
 public:
  explicit ItemsOfTable(CYbSEKvfBase* parent) : Items("Row_%d", parent) {}
};
using Table = CYbSEKvfListBase<ItemsOfTable>;

/// Works in the section of its list.
class SectionlessItem : public ValueNode {
 public:
  explicit SectionlessItem(CYbSEKvfBase* parent) : ValueNode("", parent) { NewChild<ValueNode>("Below"); }
};

void ResizeTo(Items& list, int count) { list.SetItemCount(count, 1); }

// ---- File

TEST(List, TheSavedCountIsThatOfTheNumberedItemSections) {
  Root root;
  auto* list = root.NewChild<Items>();
  list->HasOwnCount = 1;
  list->NewChild<ValueNode>("Plain");
  ResizeTo(*list, 3);
  list->MoveItemUp(3, 1);
  EXPECT_THAT(SavedLines(root), ElementsAre("section Items {", "Touched = 0", "YbSEKvfListItemCount = 3",
                                            "NoOfItems = 3", "section Plain {", "Touched = 0", "Value = 7", "}",  //
                                            "section Item_1 {", "Touched = 0", "Value = 1", "}",                  //
                                            "section Item_2 {", "Touched = 0", "Value = 3", "}",                  //
                                            "section Item_3 {", "Touched = 0", "Value = 2", "}", "}"));
}

TEST(List, TheCountOfAFileDecidesAndItsFaultsLeaveNotes) {
  struct Case {
    const char* content;
    std::vector<int> values;
    const char* note;  ///< Part of the only one; empty for none.
  };
  const char* missing = "Items:YbSEKvfListItemCount: 3 of 5 items have no section: they are at their defaults";
  for (const Case& c :
       {Case{"YbSEKvfListItemCount = 2\n section Item_1 { Value = 11 } section Item_2 { Value = 12 }", {11, 12}, ""},
        {"section Item_1 { Value = 11 } section Item_3 { Value = 13 }", {11, 2}, "1 of 2 items"},  // As it was made.
        {"YbSEKvfListItemCount = 5\n section Item_2 { Value = 12 } section Item_4 { Value = 14 }",
         {1, 12, 3, 14, 5},
         missing},
        {"YbSEKvfListItemCount = 0\n section Item_1 { Value = 11 }", {}, ""},
        {"YbSEKvfListItemCount = -1", {}, "Items:YbSEKvfListItemCount: a count of -1 reads as 0"},
        {"YbSEKvfListItemCount = \"3\"\n section Item_1 {} section Item_2 {}", {1, 2}, "\"3\" stands where"},
        {"YbSEKvfListItemCount = 3\n NoOfItems = 1\n section Item_1 { Value = 11 }", {11}, ""},  // The later wins.
        {"NoOfItems = 1\n section Item_1 { Value = 11 }", {11}, ""},
        {"NoOfItems = -9", {}, "Items:NoOfItems: a count of -9 reads as 0"}}) {
    Root root;
    auto* list = root.NewChild<Items>();
    list->HasOwnCount = 1;
    ResizeTo(*list, 2);
    const auto notes = LoadText(root, std::string("section Items { ") + c.content + " }");
    EXPECT_EQ(list->Values(), c.values) << c.content;
    if (*c.note)
      EXPECT_THAT(notes, ElementsAre(HasSubstr(c.note))) << c.content;
    else
      EXPECT_THAT(notes, IsEmpty()) << c.content;
  }
}

TEST(List, AnEnormousCountIsCutToAMillion) {
  class Light : public CYbSEKvfListBase<CTvnKvfBase> {
   public:
    explicit Light(CYbSEKvfBase* parent) : CYbSEKvfListBase("Light", "Light", parent) {}
    std::unique_ptr<CTvnKvfBase> NewItem() override { return std::make_unique<CTvnKvfBase>("", "", this); }
  };
  Root root;
  auto* list = root.NewChild<Light>();
  EXPECT_THAT(LoadText(root, "section Light { Touched = 1\n YbSEKvfListItemCount = 2147483647 }"),
              ElementsAre("Light:YbSEKvfListItemCount: a count of 2147483647 is cut to 1000000"));
  EXPECT_EQ(list->GetItemCount(), 1'000'000);
}

TEST(List, ItemsThatHaveNoSectionByDesignAreNotMissing) {
  Root root;
  auto* list = root.NewChild<CYbSEKvfListBase<SectionlessItem>>("List", "List");
  EXPECT_THAT(LoadText(root, "section List { YbSEKvfListItemCount = 1\n section Below { Value = 3 } }"), IsEmpty());
  EXPECT_EQ(static_cast<ValueNode*>(list->GetItem(1)->GetFirstChild())->Value, 3);
}

// ---- Items

TEST(List, ItemsAreAddedInsertedDeletedAndMoved) {
  struct Case {
    const char* what;
    int count;
    std::function<bool(Items&)> operation;
    std::vector<int> values;
    bool result = true;
  };
  const auto done = [](auto operation) { return [operation](Items& list) { return operation(list), true; }; };
  for (const Case& c : {Case{"grow", 1, done([](Items& l) { l.SetItemCount(3, 1); }), {1, 2, 3}},
                        {"shrink", 3, done([](Items& l) { l.SetItemCount(1, 1); }), {1}},
                        {"negative count", 3, done([](Items& l) { l.SetItemCount(-4, 1); }), {}},
                        {"add to none", 0, [](Items& l) { return l.AddItem() == l.GetItem(1); }, {1}},
                        {"add", 2, [](Items& l) { return l.AddItem() == l.GetItem(3); }, {1, 2, 3}},
                        {"delete first", 3, done([](Items& l) { l.DeleteItem(1, 1); }), {2, 3}},
                        {"delete last", 3, done([](Items& l) { l.DeleteItem(3, 1); }), {1, 2}},
                        {"delete 0", 2, done([](Items& l) { l.DeleteItem(0, 1); }), {1, 2}},
                        {"delete behind", 2, done([](Items& l) { l.DeleteItem(3, 1); }), {1, 2}},
                        {"insert first", 2, done([](Items& l) { l.InsertItem(1, 1); }), {3, 1, 2}},
                        {"insert last", 2, done([](Items& l) { l.InsertItem(2, 1); }), {1, 3, 2}},
                        {"insert behind", 2, done([](Items& l) { l.InsertItem(3, 1); }), {1, 2}},
                        {"insert into none", 0, done([](Items& l) { l.InsertItem(1, 1); }), {}},
                        {"up", 3, [](Items& l) { return l.MoveItemUp(3, 1); }, {1, 3, 2}},
                        {"up first", 3, [](Items& l) { return l.MoveItemUp(1, 1); }, {1, 2, 3}, false},
                        {"up behind", 3, [](Items& l) { return l.MoveItemUp(4, 1); }, {1, 2, 3}, false},
                        {"up of level 2", 3, [](Items& l) { return l.MoveItemUp(2, 2); }, {1, 2, 3}, false},
                        {"down", 3, [](Items& l) { return l.MoveItemDown(1, 1); }, {2, 1, 3}},
                        {"down last", 3, [](Items& l) { return l.MoveItemDown(3, 1); }, {1, 2, 3}, false},
                        {"down 0", 3, [](Items& l) { return l.MoveItemDown(0, 1); }, {1, 2, 3}, false},
                        {"down of level 0", 3, [](Items& l) { return l.MoveItemDown(1, 0); }, {1, 2, 3}, false},
                        {"level 2 without lists", 2, done([](Items& l) { l.SetItemCount(5, 2); }), {1, 2}}}) {
    Root root;
    auto* list = root.NewChild<Items>();
    ResizeTo(*list, c.count);
    EXPECT_EQ(c.operation(*list), c.result) << c.what;
    EXPECT_EQ(list->Values(), c.values) << c.what;
  }
}

TEST(List, PlainChildrenStandBeforeItemsAndAreNotNumbered) {
  Root root;
  auto* list = root.NewChild<Items>();
  ResizeTo(*list, 2);
  auto* plain = list->NewChild<ValueNode>("Plain");
  list->NewChild<ValueNode>("Plain too");
  EXPECT_THAT(SectionNames(*list), ElementsAre("Plain", "Plain too", "Item_1", "Item_2"));
  EXPECT_EQ(list->GetChildCount(), 2);
  EXPECT_EQ(list->GetChild(1), list->GetItem(1));
  EXPECT_EQ(list->GetChild(0), nullptr);
  EXPECT_EQ(list->GetItem(3), nullptr);
  EXPECT_EQ(list->GetNumberWhatIs(plain), -1);
  EXPECT_EQ(list->GetNumberWhatIs(list), -1);

  // A number follows a move at once.
  Item* item = list->GetItem(2);
  list->MoveItemUp(2, 1);
  EXPECT_EQ(item->GetNumberWhatAmI(), 1);
  list->RemoveChild(plain);
  EXPECT_EQ(item->GetNumberWhatAmI(), 1);
  const auto removed = list->RemoveChild(item);
  EXPECT_EQ(list->GetItemCount(), 1);
  EXPECT_EQ(item->GetNumberWhatAmI(), -1);
  EXPECT_THAT(SectionNames(*list), ElementsAre("Plain too", "Item_1"));
}

TEST(List, WhatIsAddedToATouchedListIsTouched) {
  for (const bool inserts : {false, true}) {
    for (const bool touched : {false, true}) {
      Root root;
      auto* list = root.NewChild<Items>();
      LoadText(root, std::string("section Items { Touched = ") + (touched ? "1" : "0") +
                         "\n YbSEKvfListItemCount = 1\n section Item_1 { Touched = 0 } }");
      auto* plain = list->NewChild<ValueNode>("Plain");
      EXPECT_EQ(list->GetItem(1)->GetHasBeenTouched(), 0);
      ResizeTo(*list, 1);
      EXPECT_EQ(list->GetItem(1)->GetHasBeenTouched(), 0);  // Nothing was added.
      inserts ? list->InsertItem(1, 1) : static_cast<void>(list->AddItem());
      // The new item, the old one and the plain child.
      EXPECT_EQ(list->GetItem(1)->GetHasBeenTouched(), touched);
      EXPECT_EQ(list->GetItem(2)->GetHasBeenTouched(), touched);
      EXPECT_EQ(plain->GetHasBeenTouched(), touched);
    }
  }
}

TEST(List, AnItemThatIsReadKeepsTheTouchedFlagOfItsSection) {
  Root root;
  auto* list = root.NewChild<Items>();
  LoadText(root, "section Items { Touched = 1\n YbSEKvfListItemCount = 2\n section Item_1 { Touched = 0 } }");
  EXPECT_EQ(list->GetItem(1)->GetHasBeenTouched(), 0);
  EXPECT_EQ(list->GetItem(2)->GetHasBeenTouched(), 1);
}

TEST(List, AHigherLevelReachesTheItemsThatAreLists) {
  Root root;
  auto* table = root.NewChild<Table>("Table", "Table");
  table->SetItemCount(2, 1);
  const auto rows = [&] { return std::vector{table->GetItem(1)->Values(), table->GetItem(2)->Values()}; };
  table->SetItemCount(3, 2);
  EXPECT_EQ(rows(), (std::vector<std::vector<int>>{{1, 2, 3}, {1, 2, 3}}));
  table->GetItem(1)->DeleteItem(1, 1);
  table->DeleteItem(3, 2);
  EXPECT_EQ(rows(), (std::vector<std::vector<int>>{{2, 3}, {1, 2}}));
  table->InsertItem(2, 2);
  EXPECT_EQ(rows(), (std::vector<std::vector<int>>{{2, 4, 3}, {1, 4, 2}}));
  EXPECT_FALSE(table->MoveItemUp(2, 2));
  table->SetItemCount(5, 3);  // The rows' items are no lists.
  EXPECT_EQ(rows(), (std::vector<std::vector<int>>{{2, 4, 3}, {1, 4, 2}}));
  EXPECT_EQ(table->GetItemCount(), 2);
}

TEST(List, ASyncedListFollowsAtItsLevelUntilItIsTakenOut) {
  Root root;
  auto* list = root.NewChild<Items>();
  auto* same = root.NewChild<Items>("Same");
  auto* table = root.NewChild<Table>("Table", "Table");
  table->SetItemCount(1, 1);
  Items* row = table->GetItem(1);
  list->RegisterSyncedList(same, 1);
  list->RegisterSyncedList(table, 2);
  ResizeTo(*list, 3);
  list->MoveItemUp(3, 1);  // Not at level 2.
  EXPECT_EQ(same->Values(), (std::vector{1, 3, 2}));
  EXPECT_EQ(row->Values(), (std::vector{1, 2, 3}));
  list->MoveItemDown(1, 1);
  list->DeleteItem(2, 1);
  list->InsertItem(1, 1);
  EXPECT_EQ(same->Values(), list->Values());
  EXPECT_EQ(row->Values(), (std::vector{4, 1, 3}));
  same->AddItem();
  list->DeleteItem(4, 1);  // What is out of range here may be there.
  EXPECT_EQ(same->GetItemCount(), 3);
  list->RegisterSyncedList(same, 1);
  list->UnregisterSyncedList(same);
  ResizeTo(*list, 1);
  EXPECT_EQ(same->GetItemCount(), 1);
  list->UnregisterSyncedList(same);
  list->UnregisterSyncedList(same);
  ResizeTo(*list, 2);
  EXPECT_EQ(same->GetItemCount(), 1);
  EXPECT_EQ(row->GetItemCount(), 2);
}

TEST(List, ItemDefaultsAreLeftAloneInATouchedListUnlessForced) {
  struct Case {
    bool touched;
    int level, force;
    bool resetsItems, resetsBelow;
  };
  for (const Case& c : {Case{false, 1, 0, true, false},
                        {true, 1, 0, false, false},
                        {true, 1, 1, true, false},
                        {false, 2, 0, false, true},
                        {true, 2, 0, false, false},
                        {false, 3, 1, false, false}}) {
    Root root;
    auto* list = root.NewChild<Items>();
    auto* table = root.NewChild<Table>("Table", "Table");
    list->AddItem();
    table->AddItem()->AddItem();
    table->GetItem(1)->Touch();  // Forced below.
    if (c.touched) root.TouchAllChildren();
    list->SetItemDefaults(c.level, c.force);
    table->SetItemDefaults(c.level, c.force);
    EXPECT_EQ(list->GetItem(1)->Value, c.resetsItems ? 7 : 1);
    EXPECT_EQ(table->GetItem(1)->GetItem(1)->Value, c.resetsBelow ? 7 : 1);
  }
}

TEST(List, ItemsDieFromTheTail) {
  class Mourned : public CTvnKvfBase {
   public:
    explicit Mourned(CYbSEKvfBase* parent) : CTvnKvfBase("", "Item_%d", parent) {}
    ~Mourned() override { Log->push_back(Serial); }
    int Serial = 0;
    std::vector<int>* Log = nullptr;
  };
  std::vector<int> log;
  {
    Root root;
    auto* list = root.NewChild<CYbSEKvfListBase<Mourned>>("List", "List");
    for (int serial = 1; serial <= 4; ++serial) {
      Mourned* item = list->AddItem();
      item->Serial = serial;
      item->Log = &log;
    }
    list->SetItemCount(3, 1);
  }
  EXPECT_THAT(log, ElementsAre(4, 3, 2, 1));
}

}  // namespace
}  // namespace tervane
