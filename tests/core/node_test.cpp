// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/node.h"

#include <gmock/gmock.h>

#include "core/list.h"
#include "core/walked_node.h"
#include "tests/core/node_tree.h"

namespace tervane::node_test {
namespace {

using test::LoadText;
using test::Root;
using test::Saved;
using test::SectionNames;
using test::ValueGroup;
using test::ValueNode;
using testing::ElementsAre;
using testing::IsEmpty;

class ValueList : public CYbSEKvfListBase<ValueNode> {
 public:
  explicit ValueList(CYbSEKvfBase* parent) : CYbSEKvfListBase("List", "List", parent) {}
  int Value = 1;

  std::unique_ptr<ValueNode> NewItem() override { return std::make_unique<ValueNode>("Item_%d", this); }

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys("Value", Value); }
};

// ---- File

TEST(Node, ASectionHoldsTouchedUsedFlagCountKeysPropertiesAndChildrenAndReadsThemBack) {
  Root root;
  root.WritesUsedFlags = 1;
  auto* list = root.NewChild<ValueList>();
  list->AddProperty(std::make_unique<ValueNode>("Property", list));
  list->NewChild<ValueNode>("Plain")->Used = 0;
  list->AddItem();
  list->Touch();
  const std::string before =
      "section List { Touched = 1; IsDataUsedInSetup = 1; YbSEKvfListItemCount = 1; Value = 1; "
      "section Property { Touched = 0; IsDataUsedInSetup = 1; Value = 7; } "
      "section Plain { Touched = 0; IsDataUsedInSetup = 0; Value = 7; } "
      "section Item_1 { Touched = 0; IsDataUsedInSetup = 1; Value = 7; } }";
  EXPECT_EQ(Saved(root), before);
  const std::string other =
      "section List { Touched = 0; YbSEKvfListItemCount = 2; Value = 5; section Property { Touched = 1; Value = 4; } "
      "section Plain { Touched = 1; Value = 3; } section Item_1 { Touched = 1; Value = 2; } "
      "section Item_2 { Touched = 0; Value = 1; } }";
  root.TouchAllChildren();  // All below, not the node.
  EXPECT_EQ(root.GetHasBeenTouched(), 0);
  EXPECT_EQ(Saved(root), Replaced(before, "Touched = 0", "Touched = 1"));
  root.WritesUsedFlags = 0;
  EXPECT_THAT(LoadText(root, other), IsEmpty());
  EXPECT_EQ(Saved(root), other);
  root.Load(nullptr);
  EXPECT_EQ(Saved(root), other);
}

TEST(Node, EachNodeReadsAndWritesItsOwnSectionAlone) {
  Root root;
  root.NewChild<ValueNode>("Missing")->NewChild<ValueNode>("Below");
  auto* parent = root.NewChild<ValueNode>("Parent");
  auto* inside = parent->NewChild<ValueNode>("");  // Works in its parent's section.
  inside->NewChild<ValueNode>("Below");
  auto* group = parent->NewChild<ValueGroup>("");  // Has no data, but its children do.
  group->NewChild<ValueNode>("Under");
  for (const char* section : {"Unused", ""}) {
    for (CYbSEKvfBase* unused : std::initializer_list<CYbSEKvfBase*>{parent->NewChild<ValueNode>(section),
                                                                     parent->NewChild<ValueGroup>(section)}) {
      unused->NewChild<ValueNode>("OfUnused");
      unused->SetSectionUsed(0);
    }
  }
  EXPECT_THAT(
      LoadText(root,
               "section Below { Touched = 1; Value = 1; } section Parent { Touched = 1; Value = 3; "
               "section Below { Value = 4; } section Under { Value = 5; } "
               "section Unused { Value = 2; section OfUnused { Value = 2; } } section OfUnused { Value = 2; } }"),
      IsEmpty());
  EXPECT_EQ(inside->Value, 3);
  EXPECT_EQ(inside->GetHasBeenTouched(), 1);
  EXPECT_EQ(group->Value, 7);
  EXPECT_EQ(group->GetHasBeenTouched(), 0);
  inside->Value = 6;
  const std::string saved =
      "section Missing { Touched = 0; Value = 7; section Below { Touched = 0; Value = 7; } } "
      "section Parent { Touched = 1; Value = 3; Value = 6; section Below { Touched = 0; Value = 4; } "
      "section Under { Touched = 0; Value = 5; } }";
  EXPECT_EQ(Saved(root), saved);
  for (CYbSEKvfBase* node = parent->GetFirstChild(); node; node = parent->GetNextChild(node)) node->SetSectionUsed(1);
  EXPECT_THAT(Saved(root), testing::AllOf(testing::HasSubstr("section OfUnused { Touched = 0; Value = 7; }"),
                                          testing::Not(testing::HasSubstr("Value = 2"))));
}

TEST(Node, ThePlaceOrASetNumberGoesIntoTheSectionName) {
  Root root;
  for (const char* name : {"Item_%d", "Item_%d", "Source%dOf", "%d", "Plain", ""}) root.NewChild<ValueNode>(name);
  EXPECT_THAT(SectionNames(root), ElementsAre("Item_1", "Item_2", "Source3Of", "4", "Plain", ""));
  root.GetChild(1)->SetSectionNumber(12);
  EXPECT_EQ(root.GetChild(1)->FormattedSectionName(), "Item_12");
}

TEST(Node, LikeSectionsWithoutANumberAreToldApartByPlace) {
  Root root;
  root.NewChild<ValueNode>("Zone")->SetSectionUsed(0);  // Has no section, so takes no place.
  std::vector<ValueNode*> zones;
  for (int i = 0; i < 4; ++i) {
    zones.push_back(root.NewChild<ValueNode>("Zone"));
    root.NewChild<ValueNode>("Between");
  }
  const std::vector<int> orders[] = {{1, 2, 3, 7}, {3, 2, 1, 7}};
  for (const auto& values : orders) {
    LoadText(root,
             "section Zone { Value = 1; } section Zone { Value = 2; } section Between {} section Zone { Value = 3; }");
    for (std::size_t i = 0; i < 4; ++i) EXPECT_EQ(zones[i]->Value, values[i]);
    root.SwapChilds(zones[0], zones[2]);  // In another order they take each other's sections.
  }
}

// ---- Tree

TEST(Node, ImportantNodesAreFoundByNameUntilTheyAreTakenOutOrDie) {
  // Some die before and some after the root's table of names, which they leave as they die.
  struct Keeper : Root {
    std::shared_ptr<CYbSEKvfBase> retired;
  } root;
  auto* node = root.NewChild<ValueNode>("Node");
  auto* deep = node->NewChild<ValueGroup>("Deep");
  root.RegisterImportantNode(node, "NODE");
  root.RegisterImportantNode(deep, "DEEP");
  root.RegisterImportantNode(deep, "ALSO DEEP");
  EXPECT_EQ(root.GetImportantNode("deep"), nullptr);
  EXPECT_EQ(deep->Important(ImportantName<ValueNode>{"NODE"}), node);
  EXPECT_EQ(deep->Important(ImportantName<ValueGroup>{"NODE"}), nullptr);  // Of another class.
  root.UnregisterImportantNode("ALSO DEEP");
  EXPECT_EQ(root.GetImportantNode("ALSO DEEP"), nullptr);
  EXPECT_EQ(root.GetImportantNode("DEEP"), deep);

  // A later node takes the name over, and keeps it when the earlier one dies.
  auto* heir = root.NewChild<ValueNode>("Heir");
  root.RegisterImportantNode(heir, "NODE");
  root.RemoveChild(node).reset();
  EXPECT_EQ(root.GetImportantNode("NODE"), heir);
  EXPECT_EQ(root.GetImportantNode("DEEP"), nullptr);
  EXPECT_EQ(ValueNode(nullptr).Important(ImportantName<ValueNode>{"NODE"}), nullptr);
  root.retired = root.RemoveChild(heir);
  EXPECT_EQ(root.GetImportantNode("NODE"), heir);  // Lives on registered.
  root.AddProperty(std::make_unique<ValueNode>("Property", &root));
  root.RegisterImportantNode(root.GetProperty(1), "PROPERTY");
  EXPECT_EQ(root.GetProperty(2), nullptr);
}

TEST(Node, ChildrenAreNumberedFromOneSwappedAndRemoved) {
  Root root;
  std::vector<CYbSEKvfBase*> made;
  for (const char* name : {"A", "B", "C", "D"}) made.push_back(root.NewChild<ValueNode>(name));
  root.SwapChilds(made[0], made[2]);
  root.SwapChilds(made[0], nullptr);
  EXPECT_THAT(SectionNames(root), ElementsAre("C", "B", "A", "D"));
  EXPECT_EQ(root.GetChild(1), made[2]);
  EXPECT_EQ(root.GetChild(0), nullptr);
  EXPECT_EQ(root.GetChild(5), nullptr);
  EXPECT_EQ(root.GetNumberWhatIs(made[0]), 3);
  EXPECT_EQ(made[1]->GetNumberWhatIs(made[0]), -1);

  const auto removed = root.RemoveChild(made[2]);
  EXPECT_EQ(root.GetNumberWhatIs(made[2]), -1);
  EXPECT_EQ(root.GetNumberWhatIs(made[0]), 2);
  EXPECT_EQ(root.RemoveChild(made[2]), nullptr);
  EXPECT_EQ(root.RemoveChild(nullptr), nullptr);
  // A walk may remove the node whose follower it has.
  std::string visited;
  for (CYbSEKvfBase *child = root.GetFirstChild(), *next; child; child = next) {
    next = root.GetNextChild(child);
    visited += child->GetSectionName();
    if (child != made[0]) root.RemoveChild(child);
  }
  EXPECT_EQ(visited, "BAD");
  EXPECT_EQ(Saved(root), "section A { Touched = 0; Value = 7; }");
}

// ---- Validation and touching

TEST(Node, ValidationTellsOfErrorsHereAndBelowOfWhatTakesPart) {
  const Finding error{Severity::Error, "wrong", "Value", ""};
  const Finding warning{Severity::Warning, "odd", "Value", ""};
  struct Case {
    std::vector<Finding> finds;
    int validateData, used, parentUsed;
    std::size_t found;
    int valid;
  };
  const Case cases[] = {
      {{}, 1, 1, 1, 0, 1}, {{error}, 1, 1, 1, 1, 0}, {{warning}, 1, 1, 1, 1, 1}, {{warning, error}, 1, 1, 1, 2, 0},
      {{}, 0, 1, 1, 0, 0}, {{error}, 0, 0, 1, 0, 1}, {{error}, 0, 1, 0, 0, 1}};
  for (const Case& c : cases) {
    for (const bool isProperty : {false, true}) {
      Root root;
      auto* parent = root.NewChild<ValueNode>("Parent");
      auto owned = std::make_unique<ValueNode>("Node", parent);
      ValueNode* node = owned.get();
      isProperty ? parent->AddProperty(std::move(owned)) : parent->AddChild(std::move(owned));
      auto* brother = root.NewChild<ValueNode>("Brother");
      node->Finds = c.finds;
      node->DataIsValid = c.validateData;
      node->Used = c.used;
      parent->Used = c.parentUsed;
      for (int time = 0; time < 2; ++time) {  // Findings do not pile up.
        EXPECT_EQ(root.Validate(), c.valid);
        EXPECT_EQ(node->Findings().size(), c.found);
      }
      EXPECT_THAT((std::vector{node->Valid(), parent->Valid(), root.Valid()}), testing::Each(c.valid));
      EXPECT_EQ(brother->Valid(), 1);
      EXPECT_THAT(parent->Findings(), IsEmpty());
      node->Finds.clear();
      node->DataIsValid = 1;
      EXPECT_EQ(root.Valid(), c.valid);  // Until the next validation.
      node->SetRevalidateAll();
      EXPECT_TRUE(root.TakeRevalidateAll() && !root.TakeRevalidateAll());
      root.ReValidate();
      EXPECT_EQ(root.Valid(), 1);
      EXPECT_THAT(node->Findings(), IsEmpty());
    }
  }
}

// ---- Overview and paths

TEST(Node, TheOverviewHasALineForEachWrittenKeyOfTheNodesThatTakePart) {
  class Versioned : public ValueNode {
   public:
    using ValueNode::ValueNode;

   protected:
    void ExchangeKeys(KeyExchange& keys) override {
      keys("Name", Name);
      keys.Until(3, "Old", Value);
      keys.WriteOnly("New", 14);
    }
    std::string Name = "a b";
  };
  class Failing : public ValueNode {
   public:
    using ValueNode::ValueNode;
    int AddToOverview(std::vector<OverviewLine>&, int) override { return 0; }
  };
  Root root;
  auto* first = root.NewChild<Versioned>("First");
  auto* unused = root.NewChild<ValueNode>("Unused");
  unused->Used = 0;
  unused->NewChild<ValueNode>("BelowUnused");
  first->NewChild<ValueNode>("Below")->NewChild<ValueNode>("Deep");
  for (const int succeeds : {1, 0}) {
    if (!succeeds) first->NewChild<Failing>("Failing");  // All else is there all the same.
    std::vector<OverviewLine> lines;
    EXPECT_EQ(GenerateOverview(root, lines), succeeds);
    EXPECT_EQ(OverviewText(lines),
              " PAGE: Title of First\r\n       Name = \"a b\"\r\n       New = 14\r\n"
              "  PAGE: Title of Below\r\n        Value = 7\r\n"
              "   PAGE: Title of Deep\r\n         Value = 7\r\n");
  }
  // A heading stands where the title changes.
  EXPECT_EQ(OverviewText({{"A", 2, "x"}, {"A", 0, "y"}, {"B", 0, "z"}, {"A", 0, ""}}),
            "  PAGE: A\r\n        x\r\n      y\r\nPAGE: B\r\n      z\r\nPAGE: A\r\n      \r\n");
}

TEST(Node, APathLeadsToANode) {
  class Nameless : public CYbSEKvfGroupBase {
   public:
    using CYbSEKvfGroupBase::CYbSEKvfGroupBase;
  };
  Root root;
  auto* zones = root.NewChild<ValueNode>("Zones");
  auto* first = zones->NewChild<ValueNode>("Zone");
  zones->NewChild<ValueNode>("Other");
  auto* second = zones->NewChild<ValueNode>("Zone");
  auto* deep = root.NewChild<Nameless>("Title", "")->NewChild<ValueNode>("Deep");
  auto* list = root.NewChild<ValueList>();
  list->AddItem();
  list->AddItem();
  const std::pair<const char*, CYbSEKvfBase*> cases[] = {{"Zones/Zone", first},
                                                         {"Zones/Zone#2", second},
                                                         {"Zones/Zone#3", nullptr},
                                                         {"zones", nullptr},
                                                         {"Zones/Zone#2/Zone", nullptr},
                                                         {"Nameless/Deep", deep},
                                                         {"List/Item_3", nullptr},
                                                         {"List/Item_2#2", nullptr},
                                                         {"List/Item_2", list->GetItem(2)},
                                                         {"", &root}};
  for (const auto& [path, node] : cases) EXPECT_EQ(FindNode(root, ParseSetupPath(path).steps), node) << path;

  // Each node is found again under the path by which a walk tells of it.
  zones->Used = 0;
  std::vector<std::string> taking;
  WalkNodes(root, [&](const NodePlace& place) {
    EXPECT_EQ(FindNode(root, ParseSetupPath(place.path).steps), &place.node) << place.path;
    if (place.takesPart) taking.push_back(std::to_string(place.depth) + place.node.FormattedSectionName());
  });
  EXPECT_THAT(taking, ElementsAre("1", "2Deep", "1List", "2Item_1", "2Item_2"));

  // Also where siblings in front were not asked for.
  WalkedNode top(root);
  for (CYbSEKvfBase* child = root.GetFirstChild(); child; child = root.GetNextChild(child)) {
    WalkedNode place(top, *child);
    for (CYbSEKvfBase* below = child->GetFirstChild(); below; below = child->GetNextChild(below)) {
      if (below == first) continue;
      EXPECT_EQ(WalkedNode(place, *below).Path(), PathOf(*below));
    }
  }
}

}  // namespace
}  // namespace tervane::node_test
