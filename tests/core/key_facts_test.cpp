// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/key_facts.h"

#include <cmath>
#include <limits>

#include <gmock/gmock.h>

#include "core/node.h"

namespace tervane::key_facts_test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

constexpr KeyChoice kMethods[] = {{0, "Richards"}, {1, "Gravity"}, {3, "Hidden", false}};

TEST(KeyFacts, TellWhatIsWrongWithAValue) {
  const KeyFacts any, method{.choices = kMethods}, fraction{.least = 0, .greatest = 1}, count{.least = 1},
      factor{.least = 0.01, .greatest = 0.99}, step{.least = 0, .isLeastOutside = true};
  const struct {
    const KeyFacts& facts;
    double value;
    const char* wrong;
  } cases[] = {
      {any, -1e30, ""},
      {any, std::nan(""), "The value nan is no finite number."},
      {fraction, -std::numeric_limits<double>::infinity(), "The value -inf is no finite number."},
      {method, 1, ""},
      {method, 3, ""},  // What pages do not offer may stand in a file.
      {method, 2, "The value 2 is none of its choices: 0 (Richards), 1 (Gravity), 3 (Hidden)."},
      {fraction, 1, ""},
      {fraction, 1.25, "The value 1.25 is outside its range: 0 to 1."},
      {count, 0, "The value 0 is outside its range: 1 or more."},
      {step, 1e-9, ""},
      {step, 0, "The value 0 is outside its range: above 0."},
      // Limits of single precision are those that people write.
      {factor, static_cast<double>(0.99F), ""},
      {factor, static_cast<double>(0.01F), ""},
      {factor, 0.995, "The value 0.995 is outside its range: 0.01 to 0.99."},
  };
  for (const auto& c : cases) EXPECT_EQ(WhyStray(c.facts, c.value), c.wrong) << c.value;
}

/// A node whose declaration uses every word that a value may be told by.
struct Told : CTvnKvfBase {
  explicit Told(CYbSEKvfBase* parent) : CTvnKvfBase("Told", "Told", parent) {}
  int method = 0, fromOne = 1, through = 1;
  float length = 1, share = 0.5F;
  double free = 0;

 protected:
  void ExchangeKeys(KeyExchange& keys) override {
    keys("Method", method).OneOf(kMethods);
    keys.FromOne("FromOne", fromOne).OneOf(kMethods);
    keys.Custom(
            "Through", [&] { return through; }, [&](int value) { through = value; })
        .Range(0, 1)
        .HeldIn(&through);
    keys.Since(5)("Length", length).Quantity(100180).AtLeast(0);
    keys("Share ", share).Unit("[-]").Range(0, 1);
    keys("Free", free);
    double old = -5;
    keys.Until(4, "Old", old);
    keys.WriteOnly("Written", 7);
  }
};

TEST(KeyFacts, AreDescribedWithTheMemberThatHoldsTheValue) {
  Told node(nullptr);
  std::vector<KeyInfo> keys;
  node.DescribeKeys(keys);
  ASSERT_EQ(keys.size(), 8U);
  const void* members[] = {&node.method, &node.fromOne, &node.through, &node.length, &node.share, &node.free};
  for (std::size_t i = 0; i < std::size(members); ++i) EXPECT_EQ(keys[i].member, members[i]) << keys[i].key;
  EXPECT_EQ(keys[7].member, nullptr);
  EXPECT_EQ(keys[1].inFile, 1);
  EXPECT_EQ(keys[1].facts.choices.size(), 3U);
  EXPECT_EQ(keys[3].facts.itemType, 100180);
  EXPECT_EQ(keys[4].facts.unit, "[-]");
}

TEST(KeyFacts, OfStrayValuesBecomeFindings) {
  const auto findings = [](const Told& node) {
    std::vector<std::string> texts;
    for (const Finding& finding : node.Findings())
      texts.push_back(std::string(NameOf(finding.severity)) + " " + finding.key);
    return texts;
  };
  Told node(nullptr);
  EXPECT_TRUE(node.Validate());
  EXPECT_THAT(node.Findings(), IsEmpty());
  node.method = 2;
  node.fromOne = 4;
  node.through = -1;
  node.length = -0.5F;
  node.share = 2;
  EXPECT_TRUE(node.Validate()) << "a warning leaves a node valid";
  EXPECT_THAT(findings(node),
              ElementsAre("warning Method", "warning FromOne", "warning Through", "warning Length", "warning Share"));
  EXPECT_EQ(node.Findings()[1].text, "The value 4 is none of its choices: 0 (Richards), 1 (Gravity), 3 (Hidden).");
  node.free = std::nan("");
  EXPECT_FALSE(node.Validate()) << "no engine computes with what is no number";
  EXPECT_THAT(findings(node), testing::Contains("error Free"));
}

}  // namespace
}  // namespace tervane::key_facts_test
