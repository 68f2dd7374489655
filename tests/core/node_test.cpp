// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/node.h"

#include <gmock/gmock.h>

#include "core/list.h"
#include "tests/core/node_tree.h"

namespace tervane {
namespace {

using test::LoadText;
using test::Root;
using test::SavedLines;
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

TEST(Node, ASectionHoldsTouchedUsedFlagCountKeysPropertiesAndChildrenInThisOrder) {
  Root root;
  root.WritesUsedFlags = 1;
  auto* list = root.NewChild<ValueList>();
  list->AddProperty(std::make_unique<ValueNode>("Property", list));
  list->NewChild<ValueNode>("Plain")->Used = 0;
  list->AddItem();
  list->Touch();
  EXPECT_THAT(SavedLines(root),
              ElementsAre("section List {", "Touched = 1", "IsDataUsedInSetup = 1", "YbSEKvfListItemCount = 1",
                          "Value = 1",  //
                          "section Property {", "Touched = 0", "IsDataUsedInSetup = 1", "Value = 7", "}",
                          "section Plain {", "Touched = 0", "IsDataUsedInSetup = 0", "Value = 7", "}",
                          "section Item_1 {", "Touched = 0", "IsDataUsedInSetup = 1", "Value = 7", "}", "}"));
}

TEST(Node, LoadReadsAllThatSaveWroteAndTheUsedFlagOnlyWhereTheRootWantsIt) {
  Root written;
  auto* list = written.NewChild<ValueList>();
  list->AddProperty(std::make_unique<ValueNode>("Property", list));
  list->AddItem()->Value = 3;
  list->GetItem(1)->Touch();
  const auto* text =
      "section List { Touched = 0\n YbSEKvfListItemCount = 1\n Value = 5\n"
      "section Property { Touched = 1\n Value = 4 }\n section Item_1 { Touched = 1\n Value = 3 } }";
  EXPECT_THAT(LoadText(written, text), IsEmpty());
  EXPECT_THAT(SavedLines(written), ElementsAre("section List {", "Touched = 0", "YbSEKvfListItemCount = 1", "Value = 5",
                                               "section Property {", "Touched = 1", "Value = 4", "}",  //
                                               "section Item_1 {", "Touched = 1", "Value = 3", "}", "}"));
}

TEST(Node, AMissingSectionLeavesItAndAllBelowAtTheirDefaults) {
  Root root;
  auto* missing = root.NewChild<ValueNode>("Missing");
  auto* below = missing->NewChild<ValueNode>("Below");
  auto* behind = root.NewChild<ValueNode>("Behind");
  EXPECT_THAT(LoadText(root, "section Below { Touched = 1\n Value = 1 } section Behind { Touched = 1\n Value = 2 }"),
              IsEmpty());
  EXPECT_EQ(missing->Value, 7);
  EXPECT_EQ(missing->GetHasBeenTouched(), 0);
  EXPECT_EQ(below->Value, 7);
  EXPECT_EQ(below->GetHasBeenTouched(), 0);
  EXPECT_EQ(behind->Value, 2);

  root.Load(nullptr);
  EXPECT_EQ(behind->Value, 2);
}

TEST(Node, ANodeWithoutASectionWorksInItsParentsSection) {
  Root root;
  auto* parent = root.NewChild<ValueNode>("Parent");
  auto* inside = parent->NewChild<ValueNode>("");
  inside->NewChild<ValueNode>("Below");
  LoadText(root, "section Parent { Touched = 1\n Value = 3\n section Below { Value = 4 } }");
  EXPECT_EQ(inside->Value, 3);
  EXPECT_EQ(inside->GetHasBeenTouched(), 1);
  inside->Value = 5;
  EXPECT_THAT(SavedLines(root), ElementsAre("section Parent {", "Touched = 1", "Value = 3", "Value = 5",
                                            "section Below {", "Touched = 0", "Value = 4", "}", "}"));
}

TEST(Node, AGroupWithoutASectionHasNoDataButItsChildrenWorkInItsParentsSection) {
  Root root;
  auto* parent = root.NewChild<ValueNode>("Parent");
  auto* group = parent->NewChild<ValueGroup>("");
  auto* below = group->NewChild<ValueNode>("Below");
  LoadText(root, "section Parent { Touched = 1\n Value = 3\n section Below { Value = 4 } }");
  EXPECT_EQ(group->Value, 7);
  EXPECT_EQ(group->GetHasBeenTouched(), 0);
  EXPECT_EQ(below->Value, 4);
  EXPECT_THAT(SavedLines(root), ElementsAre("section Parent {", "Touched = 1", "Value = 3", "section Below {",
                                            "Touched = 0", "Value = 4", "}", "}"));
}

TEST(Node, ANodeWhoseSectionIsNotUsedNeitherReadsNorWrites) {
  for (const char* section : {"Unused", ""}) {
    Root root;
    auto* parent = root.NewChild<ValueNode>("Parent");
    auto* node = parent->NewChild<ValueNode>(section);
    auto* group = parent->NewChild<ValueGroup>(section);
    auto* below = node->NewChild<ValueNode>("Below");
    group->NewChild<ValueNode>("Below");
    node->SetSectionUsed(0);
    group->SetSectionUsed(0);
    LoadText(root,
             "section Parent { Value = 1\n section Unused { Value = 2\n section Below { Value = 3 } }"
             " section Below { Value = 4 } }");
    EXPECT_EQ(node->Value, 7);
    EXPECT_EQ(below->Value, 7);
    EXPECT_THAT(SavedLines(root), ElementsAre("section Parent {", "Touched = 0", "Value = 1", "}")) << section;
  }
}

TEST(Node, TheNumberGoesIntoTheSectionName) {
  struct Case {
    const char* section;
    int setNumber;  ///< 0: not set.
    const char* expected;
  };
  for (const Case& c : {Case{"Item_%d", 0, "Item_2"},
                        {"Item_%d", 12, "Item_12"},
                        {"Source%dOf", 0, "Source2Of"},
                        {"%d", 3, "3"},
                        {"Plain", 5, "Plain"},
                        {"", 5, ""}}) {
    Root root;
    root.NewChild<ValueNode>("First");
    auto* node = root.NewChild<ValueNode>(c.section);
    if (c.setNumber) node->SetSectionNumber(c.setNumber);
    EXPECT_EQ(node->FormattedSectionName(), c.expected);
    EXPECT_EQ(node->GetSectionName(), c.section);
    EXPECT_EQ(node->GetNumberWhatAmI(), c.setNumber ? c.setNumber : 2);
  }
}

TEST(Node, LikeSectionsWithoutANumberAreToldApartByPlace) {
  Root root;
  root.NewChild<ValueNode>("Zone")->SetSectionUsed(0);  // Has no section, so takes no place.
  std::vector<ValueNode*> zones;
  for (int i = 0; i < 4; ++i) {
    zones.push_back(root.NewChild<ValueNode>("Zone"));
    root.NewChild<ValueNode>("Between");
  }
  LoadText(root,
           "section Zone { Value = 1 } section Between { Value = 9 } section Zone { Value = 2 }"
           " section Zone { Touched = 1\n Value = 3 }");
  const auto values = [&] {
    std::vector<int> result;
    for (const ValueNode* zone : zones) result.push_back(zone->Value);
    return result;
  };
  EXPECT_THAT(values(), ElementsAre(1, 2, 3, 7));

  // In another order they take each other's sections.
  root.SwapChilds(zones[0], zones[2]);
  LoadText(root, "section Zone { Value = 1 } section Zone { Value = 2 } section Zone { Value = 3 }");
  EXPECT_THAT(values(), ElementsAre(3, 2, 1, 7));
}

TEST(Node, AnOldSectionNameCanBeReadAndTheNewOneWritten) {
  class Renamed : public ValueNode {
   public:
    explicit Renamed(CYbSEKvfBase* parent) : ValueNode("New", parent) {}
    void Load(KvfNode* parentSection) override {
      SectionName("Old");
      ValueNode::Load(parentSection);
      SectionName("New");
    }
  };
  Root root;
  root.NewChild<Renamed>();
  LoadText(root, "section Old { Value = 4 } section New { Value = 5 }");
  EXPECT_THAT(SavedLines(root), ElementsAre("section New {", "Touched = 0", "Value = 4", "}"));
}

// ---- Tree

TEST(Node, ImportantNodesAreFoundByNameUntilTheyAreTakenOutOrDie) {
  Root root;
  auto* node = root.NewChild<ValueNode>("Node");
  auto* deep = node->NewChild<ValueGroup>("Deep");
  root.RegisterImportantNode(node, "NODE");
  root.RegisterImportantNode(deep, "DEEP");
  root.RegisterImportantNode(deep, "ALSO DEEP");
  EXPECT_EQ(root.GetImportantNode("DEEP"), deep);
  EXPECT_EQ(root.GetImportantNode("deep"), nullptr);
  EXPECT_EQ(root.GetImportantNode("unknown"), nullptr);
  EXPECT_EQ(deep->Important<ValueNode>("NODE"), node);
  EXPECT_EQ(deep->Important<ValueGroup>("NODE"), nullptr);  // Of another class.
  root.UnregisterImportantNode("ALSO DEEP");
  EXPECT_EQ(root.GetImportantNode("ALSO DEEP"), nullptr);
  EXPECT_EQ(root.GetImportantNode("DEEP"), deep);

  // A later node takes the name over, and keeps it when the earlier one dies.
  auto* heir = root.NewChild<ValueNode>("Heir");
  root.RegisterImportantNode(heir, "NODE");
  root.RemoveChild(node).reset();
  EXPECT_EQ(root.GetImportantNode("NODE"), heir);
  EXPECT_EQ(root.GetImportantNode("DEEP"), nullptr);
  EXPECT_EQ(ValueNode(nullptr).Important<ValueNode>("NODE"), nullptr);
}

TEST(Node, ARemovedChildLivesOnRegisteredButIsNotSaved) {
  Root root;
  auto* first = root.NewChild<ValueNode>("First");
  auto* second = root.NewChild<ValueNode>("Second");
  root.RegisterImportantNode(first, "FIRST");
  const auto removed = root.RemoveChild(first);
  EXPECT_EQ(removed.get(), first);
  EXPECT_EQ(root.GetImportantNode("FIRST"), first);
  EXPECT_EQ(first->GetParent(), &root);
  EXPECT_THAT(SectionNames(root), ElementsAre("Second"));
  EXPECT_THAT(SavedLines(root), ElementsAre("section Second {", "Touched = 0", "Value = 7", "}"));
  EXPECT_EQ(root.RemoveChild(first), nullptr);
  EXPECT_EQ(root.RemoveChild(nullptr), nullptr);
  EXPECT_EQ(root.GetNumberWhatIs(first), -1);
  EXPECT_EQ(root.GetNumberWhatIs(second), 1);
}

TEST(Node, ImportantNodesMayDieWithTheRootAsPropertiesOrRemoved) {
  // They die before and after the root's table of names, which they leave as they die.
  struct Keeper : Root {
    std::shared_ptr<CYbSEKvfBase> retired;
  } root;
  auto* node = root.NewChild<ValueNode>("Node");
  root.RegisterImportantNode(node, "NODE");
  root.retired = root.RemoveChild(node);
  auto property = std::make_unique<ValueNode>("Property", &root);
  root.RegisterImportantNode(property.get(), "PROPERTY");
  root.AddProperty(std::move(property));
  EXPECT_EQ(root.GetProperty(1), root.GetImportantNode("PROPERTY"));
  EXPECT_EQ(root.GetProperty(2), nullptr);
}

TEST(Node, AWalkMayRemoveTheNodeWhoseFollowerItHas) {
  Root root;
  for (const char* name : {"A", "B", "C", "D"}) root.NewChild<ValueNode>(name);
  std::vector<std::string> visited;
  for (CYbSEKvfBase* child = root.GetFirstChild(); child;) {
    CYbSEKvfBase* next = root.GetNextChild(child);
    visited.push_back(child->GetSectionName());
    if (visited.back() != "C") root.RemoveChild(child);
    child = next;
  }
  EXPECT_THAT(visited, ElementsAre("A", "B", "C", "D"));
  EXPECT_THAT(SectionNames(root), ElementsAre("C"));
}

TEST(Node, ChildrenAreNumberedFromOne) {
  Root root;
  auto* a = root.NewChild<ValueNode>("A");
  auto* b = root.NewChild<ValueNode>("B");
  auto* c = root.NewChild<ValueNode>("C");
  root.SwapChilds(a, c);
  EXPECT_THAT(SectionNames(root), ElementsAre("C", "B", "A"));
  EXPECT_EQ(root.GetChild(1), c);
  EXPECT_EQ(root.GetChild(0), nullptr);
  EXPECT_EQ(root.GetChild(4), nullptr);
  EXPECT_EQ(root.GetNumberWhatIs(a), 3);
  EXPECT_EQ(root.GetNumberWhatIs(nullptr), -1);
  EXPECT_EQ(b->GetNumberWhatIs(a), -1);
  root.SwapChilds(a, nullptr);
  EXPECT_EQ(root.GetNextChild(a), nullptr);
  EXPECT_EQ(root.GetChildCount(), 3);
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
  for (const Case& c : {Case{{}, 1, 1, 1, 0, 1},
                        {{error}, 1, 1, 1, 1, 0},
                        {{warning}, 1, 1, 1, 1, 1},
                        {{warning, error}, 1, 1, 1, 2, 0},
                        {{}, 0, 1, 1, 0, 0},  // Not valid, without a text.
                        {{error}, 0, 0, 1, 0, 1},
                        {{error}, 0, 1, 0, 0, 1}}) {
    Root root;
    auto* parent = root.NewChild<ValueNode>("Parent");
    auto* node = parent->NewChild<ValueNode>("Node");
    auto* brother = root.NewChild<ValueNode>("Brother");
    node->Finds = c.finds;
    node->DataIsValid = c.validateData;
    node->Used = c.used;
    parent->Used = c.parentUsed;
    for (int time = 0; time < 2; ++time) {  // Findings do not pile up.
      EXPECT_EQ(root.Validate(), c.valid);
      EXPECT_EQ(node->Findings().size(), c.found);
    }
    EXPECT_EQ(node->Valid(), c.valid);
    EXPECT_EQ(parent->Valid(), c.valid);
    EXPECT_EQ(root.Valid(), c.valid);
    EXPECT_EQ(brother->Valid(), 1);
    EXPECT_THAT(parent->Findings(), IsEmpty());
    node->Finds.clear();
    node->DataIsValid = 1;
    EXPECT_EQ(root.Valid(), c.valid);  // Until the next validation.
    root.ReValidate();
    EXPECT_EQ(root.Valid(), 1);
    EXPECT_THAT(node->Findings(), IsEmpty());
  }
}

TEST(Node, AWrongPropertyMakesItsNodeInvalid) {
  Root root;
  auto property = std::make_unique<ValueNode>("Property", &root);
  property->DataIsValid = 0;
  root.AddProperty(std::move(property));
  EXPECT_EQ(root.Validate(), 0);
}

TEST(Node, AValidationOfTheWholeTreeIsAskedForOnce) {
  Root root;
  root.NewChild<ValueNode>("Node")->SetRevalidateAll();
  EXPECT_TRUE(root.TakeRevalidateAll());
  EXPECT_FALSE(root.TakeRevalidateAll());
}

TEST(Node, TouchingAllChildrenReachesAllBelowButNotTheNode) {
  Root root;
  auto* node = root.NewChild<ValueNode>("Node");
  auto* child = node->NewChild<ValueNode>("Child");
  auto* below = child->NewChild<ValueNode>("Below");
  node->AddProperty(std::make_unique<ValueNode>("Property", node));
  node->TouchAllChildren();
  EXPECT_EQ(node->GetHasBeenTouched(), 0);
  EXPECT_EQ(child->GetHasBeenTouched(), 1);
  EXPECT_EQ(below->GetHasBeenTouched(), 1);
  EXPECT_EQ(node->GetProperty(1)->GetHasBeenTouched(), 1);
  node->Touch();
  EXPECT_EQ(node->GetHasBeenTouched(), 1);
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
  Root root;
  auto* first = root.NewChild<Versioned>("First");
  first->NewChild<ValueNode>("Below")->NewChild<ValueNode>("Deep");
  auto* unused = root.NewChild<ValueNode>("Unused");
  unused->Used = 0;
  unused->NewChild<ValueNode>("BelowUnused");
  std::vector<OverviewLine> lines;
  EXPECT_EQ(GenerateOverview(root, lines), 1);
  EXPECT_EQ(OverviewText(lines),
            " PAGE: Title of First\r\n       Name = \"a b\"\r\n       New = 14\r\n"
            "  PAGE: Title of Below\r\n        Value = 7\r\n"
            "   PAGE: Title of Deep\r\n         Value = 7\r\n");
}

TEST(Node, AHeadingStandsInTheOverviewWhereTheTitleChanges) {
  EXPECT_EQ(OverviewText({{"A", 2, "x"}, {"A", 0, "y"}, {"B", 0, "z"}, {"A", 0, ""}}),
            "  PAGE: A\r\n        x\r\n      y\r\nPAGE: B\r\n      z\r\nPAGE: A\r\n      \r\n");
  EXPECT_EQ(OverviewText({}), "");
}

TEST(Node, AFailingNodeFailsTheOverviewAndTheRestIsThere) {
  class Failing : public ValueNode {
   public:
    using ValueNode::ValueNode;
    int AddToOverview(std::vector<OverviewLine>&, int) override { return 0; }
  };
  Root root;
  root.NewChild<Failing>("Failing");
  root.NewChild<ValueNode>("Rest");
  std::vector<OverviewLine> lines;
  EXPECT_EQ(GenerateOverview(root, lines), 0);
  EXPECT_EQ(lines.size(), 1U);
}

TEST(Node, APathLeadsToANode) {
  Root root;
  auto* zones = root.NewChild<ValueNode>("Zones");
  auto* first = zones->NewChild<ValueNode>("Zone");
  zones->NewChild<ValueNode>("Other");
  auto* second = zones->NewChild<ValueNode>("Zone");
  class Nameless : public CYbSEKvfGroupBase {
   public:
    using CYbSEKvfGroupBase::CYbSEKvfGroupBase;
  };
  auto* nameless = root.NewChild<Nameless>("Title", "");
  auto* deep = nameless->NewChild<ValueNode>("Deep");
  auto* list = root.NewChild<ValueList>();
  list->AddItem();
  list->AddItem();
  struct Case {
    std::string path;
    CYbSEKvfBase* node;
  };
  for (const Case& c : {Case{"Zones/Zone", first},
                        {"Zones/Zone#2", second},
                        {"Zones/Zone#3", nullptr},
                        {"Zones/Zone#2/Zone", nullptr},
                        {"List/Item_2", list->GetItem(2)},
                        {"List/Item_3", nullptr},
                        {"List/Item_2#2", nullptr},
                        {"Nameless/Deep", deep},
                        {"zones", nullptr}})
    EXPECT_EQ(FindNode(root, ParseSetupPath(c.path).steps), c.node) << c.path;
  EXPECT_EQ(FindNode(root, {}), &root);

  // Each node is found again under the path by which a walk tells of it.
  zones->Used = 0;
  std::vector<std::string> taking;
  WalkNodes(root, [&](const NodePlace& place) {
    EXPECT_EQ(FindNode(root, ParseSetupPath(place.path).steps), &place.node) << place.path;
    if (place.takesPart) taking.push_back(std::to_string(place.depth) + place.node.FormattedSectionName());
  });
  EXPECT_THAT(taking, ElementsAre("1", "2Deep", "1List", "2Item_1", "2Item_2"));
}

}  // namespace
}  // namespace tervane
