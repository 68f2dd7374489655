// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/list.h"

#include <random>

#include <gmock/gmock.h>

#include "tests/core/node_tree.h"

namespace tervane::list_test {
namespace {

using test::LoadText;
using test::Root;
using test::Saved;
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

/// Its items work in the section of the list.
class SectionlessItems : public CYbSEKvfListBase<CTvnKvfBase> {
 public:
  explicit SectionlessItems(CYbSEKvfBase* parent) : CYbSEKvfListBase("List", "List", parent) {}
  std::unique_ptr<CTvnKvfBase> NewItem() override { return std::make_unique<CTvnKvfBase>("", "", this); }
};

void ResizeTo(Items& list, int count) { list.SetItemCount(count, 1); }

// ---- File

TEST(List, TheCountOfAFileDecidesAndItsFaultsLeaveNotes) {
  struct Case {
    const char* content;
    std::vector<int> values;
    const char* note = nullptr;  ///< Part of the only one.
  };
  const char* missing = "Items:YbSEKvfListItemCount: 3 of 5 items have no section: they are at their defaults";
  for (const Case& c :
       {Case{"YbSEKvfListItemCount = 2; section Item_1 { Value = 11; } section Item_2 { Value = 12; }", {11, 12}},
        {"section Item_1 { Value = 11; } section Item_3 { Value = 13; }", {11, 2}, "1 of 2 items"},  // As it was made.
        {"YbSEKvfListItemCount = 5; section Item_2 { Value = 12; } section Item_4 {}", {1, 12, 3, 4, 5}, missing},
        {"YbSEKvfListItemCount = 0; section Item_1 {}", {}},
        {"YbSEKvfListItemCount = -1", {}, "Items:YbSEKvfListItemCount: a count of -1 reads as 0"},
        {"YbSEKvfListItemCount = \"3\"; section Item_1 {} section Item_2 {}", {1, 2}, "\"3\" stands where"},
        {"YbSEKvfListItemCount = 3; NoOfItems = 1; section Item_1 { Value = 11; }", {11}},  // The later wins.
        {"NoOfItems = 1; section Item_1 { Value = 11; }", {11}},
        {"NoOfItems = -9", {}, "Items:NoOfItems: a count of -9 reads as 0"}}) {
    Root root;
    auto* list = root.NewChild<Items>();
    list->HasOwnCount = 1;
    ResizeTo(*list, 2);
    const auto notes = LoadText(root, std::string("section Items { ") + c.content + " }");
    EXPECT_EQ(list->Values(), c.values) << c.content;
    EXPECT_EQ(notes.size(), c.note ? 1U : 0U) << c.content;
    EXPECT_THAT(notes, testing::Each(HasSubstr(c.note ? c.note : ""))) << c.content;
  }
}

std::string Sections(int count) {
  std::string sections;
  for (int number = 1; number <= count; ++number) sections += "section Item_" + std::to_string(number) + " {} ";
  return sections;
}

TEST(List, ACountAsksForFewItemsBeyondTheSectionsThatAreThere) {
  const struct {
    int count, sections, taken;
    const char* note;
  } cases[] = {
      {1000, 0, 1000, "1000 of 1000 items"},
      {2'000'000'000, 0, 1000, "YbSEKvfListItemCount: a count of 2000000000 is cut to 1000: the file has 0 sections"},
      {1010, 10, 1010, "1000 of 1010 items"},
      {1012, 11, 1011, "a count of 1012 is cut to 1011"},
      {2100, 2100, 2100, nullptr},
  };
  for (const auto& c : cases) {
    Root root;
    auto* list = root.NewChild<Items>();
    const auto notes = LoadText(
        root, "section Items { YbSEKvfListItemCount = " + std::to_string(c.count) + "; " + Sections(c.sections) + "}");
    EXPECT_EQ(list->GetItemCount(), c.taken) << c.count;
    EXPECT_EQ(notes.empty(), !c.note);
    if (!c.note) continue;
    EXPECT_THAT(notes, testing::Contains(HasSubstr(c.note)));
  }
}

TEST(List, AllCountsOfAFileTogetherAskForNoMoreThanMemoryHolds) {
  Root root;
  auto* table = root.NewChild<Table>("Table", "Table");
  std::string rows;
  for (int row = 1; row <= 300; ++row)
    rows += "section Row_" + std::to_string(row) + " { YbSEKvfListItemCount = 1000000000; } ";
  const auto notes = LoadText(root, "section Table { YbSEKvfListItemCount = 300; " + rows + "}");
  int items = 0;
  for (int row = 1; row <= 300; ++row) items += table->GetItem(row)->GetItemCount();
  EXPECT_EQ(items, kMostItemsWithoutSectionInFile);
  EXPECT_THAT(notes, testing::Contains("Table/Row_300:YbSEKvfListItemCount: a count of 1000000000 is cut to 0: the "
                                       "file has 0 sections for the items"));
}

TEST(List, ItemsWithoutASectionOfTheirOwnAreNotMissing) {
  Root root;
  auto* list = root.NewChild<SectionlessItems>();
  EXPECT_THAT(LoadText(root, "section List { Touched = 1; YbSEKvfListItemCount = 30; }"), IsEmpty());
  EXPECT_EQ(list->GetItemCount(), 30);
}

// ---- Items

TEST(List, ItemsAreAddedInsertedDeletedMovedAndASyncedListFollows) {
  Root root;
  auto* list = root.NewChild<Items>();
  auto* same = root.NewChild<Items>("Same");
  list->RegisterSyncedList(same, 1);
  std::mt19937 random(1);
  std::vector<int> model;
  int made = 0;
  for (int step = 0; step < 3000; ++step) {
    const int count = static_cast<int>(model.size());
    const int number = static_cast<int>(random() % (model.size() + 5)) - 2;  // Also out of range.
    const bool isThere = number >= 1 && number <= count;
    const auto at = model.begin() + (isThere ? number - 1 : 0);
    const auto what = random() % 6;
    if (what == 0) {
      EXPECT_EQ(list->AddItem()->GetNumberWhatAmI(), count + 1);
      model.push_back(++made);
    } else if (what == 1) {
      list->SetItemCount(number, 1);
      while (number < static_cast<int>(model.size()) && !model.empty()) model.pop_back();
      while (number > static_cast<int>(model.size())) model.push_back(++made);
    } else if (what == 2) {
      list->InsertItem(number, 1);
      if (isThere) model.insert(at, ++made);
    } else if (what == 3) {
      list->DeleteItem(number, 1);
      if (isThere) model.erase(at);
    } else if (what == 4) {
      EXPECT_EQ(list->MoveItemUp(number, 1), isThere && number > 1);
      if (isThere && number > 1) std::swap(*at, *(at - 1));
    } else {
      EXPECT_EQ(list->MoveItemDown(number, 1), isThere && number < count);
      if (isThere && number < count) std::swap(*at, *(at + 1));
    }
    ASSERT_EQ(list->Values(), model);
    ASSERT_EQ(same->Values(), list->Values());
  }
  ResizeTo(*list, 0);
  same->AddItem();
  list->DeleteItem(1, 1);  // What is out of range here may be there.
  EXPECT_EQ(same->GetItemCount(), 0);
  list->RegisterSyncedList(same, 1);
  for (const int count : {1, 2, 4}) {
    list->UnregisterSyncedList(same);  // One entry.
    ResizeTo(*list, count);
    EXPECT_EQ(same->GetItemCount(), 1);
  }
}

TEST(List, PlainChildrenStandBeforeItemsAndAreNotNumbered) {
  Root root;
  auto* list = root.NewChild<Items>();
  list->HasOwnCount = 1;
  ResizeTo(*list, 2);
  auto* plain = list->NewChild<ValueNode>("Plain");
  list->NewChild<ValueNode>("Plain too");
  EXPECT_EQ(Saved(root),
            "section Items { Touched = 0; YbSEKvfListItemCount = 2; NoOfItems = 2; "
            "section Plain { Touched = 0; Value = 7; } section \"Plain too\" { Touched = 0; Value = 7; } "
            "section Item_1 { Touched = 0; Value = 1; } section Item_2 { Touched = 0; Value = 2; } }");
  EXPECT_EQ(list->GetChild(1), list->GetItem(1));
  EXPECT_FALSE(list->GetChild(0) || list->GetItem(3));
  EXPECT_EQ(list->GetNumberWhatIs(plain), -1);
  EXPECT_EQ(list->GetNumberWhatIs(list), -1);

  // A number follows a move at once.
  Item* item = list->GetItem(2);
  list->MoveItemUp(2, 1);
  EXPECT_EQ(item->GetNumberWhatAmI(), 1);
  list->RemoveChild(plain);
  EXPECT_EQ(item->GetNumberWhatAmI(), 1);
  const auto removed = list->RemoveChild(item);
  EXPECT_EQ(item->GetNumberWhatAmI(), -1);
  EXPECT_THAT(SectionNames(*list), ElementsAre("Plain too", "Item_1"));
}

TEST(List, WhatIsAddedToATouchedListIsTouchedAndWhatIsReadIsNot) {
  for (const bool inserts : {false, true}) {
    for (const bool touched : {false, true}) {
      Root root;
      auto* list = root.NewChild<Items>();
      LoadText(root, std::string("section Items { Touched = ") + (touched ? "1" : "0") +
                         "; YbSEKvfListItemCount = 2; section Item_1 { Touched = 0; } }");
      auto* plain = list->NewChild<ValueNode>("Plain");
      ResizeTo(*list, 2);  // Nothing is added.
      EXPECT_EQ(list->GetItem(1)->GetHasBeenTouched(), 0);
      EXPECT_EQ(list->GetItem(2)->GetHasBeenTouched(), touched);  // Has no section.
      inserts ? list->InsertItem(1, 1) : static_cast<void>(list->AddItem());
      for (CYbSEKvfBase* child : {list->GetChild(1), list->GetChild(2), list->GetChild(3), list->GetFirstChild()})
        EXPECT_EQ(child->GetHasBeenTouched(), touched);
      EXPECT_EQ(list->GetFirstChild(), plain);
    }
  }
}

TEST(List, AHigherLevelReachesTheItemsThatAreLists) {
  Root root;
  auto* table = root.NewChild<Table>("Table", "Table");
  auto* list = root.NewChild<Items>();
  table->SetItemCount(2, 1);
  list->RegisterSyncedList(table, 2);
  const auto expectRows = [&](const std::vector<int>& first, const std::vector<int>& second) {
    EXPECT_EQ(table->GetItem(1)->Values(), first);
    EXPECT_EQ(table->GetItem(2)->Values(), second);
  };
  ResizeTo(*list, 3);
  expectRows({1, 2, 3}, {1, 2, 3});
  table->GetItem(1)->DeleteItem(1, 1);
  list->DeleteItem(3, 1);
  expectRows({2, 3}, {1, 2});
  table->InsertItem(2, 2);
  EXPECT_FALSE(table->MoveItemUp(2, 2) || table->MoveItemDown(1, 0));
  EXPECT_TRUE(list->MoveItemUp(2, 1));  // Not at level 2.
  table->SetItemCount(5, 3);            // The rows' items are no lists.
  expectRows({2, 4, 3}, {1, 4, 2});
  EXPECT_EQ(table->GetItemCount(), 2);
}

TEST(List, ItemDefaultsAreLeftAloneInATouchedListUnlessForced) {
  struct Case {
    bool touched;
    int level, force;
    bool resetsItems, resetsBelow;
  };
  const Case cases[] = {{false, 1, 0, true, false}, {true, 1, 0, false, false}, {true, 1, 1, true, false},
                        {false, 2, 0, false, true}, {true, 2, 0, false, false}, {false, 3, 1, false, false}};
  for (const Case& c : cases) {
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
  static std::vector<int> log;
  log.clear();
  struct Mourned : CTvnKvfBase {
    explicit Mourned(CYbSEKvfBase* parent) : CTvnKvfBase("", "Item_%d", parent) {}
    ~Mourned() override { log.push_back(Serial); }
    int Serial = 0;
  };
  {
    Root root;
    auto* list = root.NewChild<CYbSEKvfListBase<Mourned>>("List", "List");
    for (int serial = 1; serial <= 4; ++serial) list->AddItem()->Serial = serial;
    list->SetItemCount(3, 1);
  }
  EXPECT_THAT(log, ElementsAre(4, 3, 2, 1));
}

}  // namespace
}  // namespace tervane::list_test
