// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/condition.h"

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "core/node.h"

namespace tervane::condition_test {
namespace {

using testing::ElementsAre;

struct Flags : CTvnKvfBase {
  explicit Flags(CYbSEKvfBase* parent) : CTvnKvfBase("Flags", "Flags", parent) {}
  int on = 1, off = 0, method = 2;
  bool yes = true;
};

/// "+" in front of what holds, "or" where another way begins; the values that were asked for.
std::vector<std::string> Facts(const Condition& condition, const Flags& asker) {
  std::vector<std::string> texts;
  for (const ConditionFact& fact : condition.Why(asker)) {
    std::string asked = fact.sentence;
    if (fact.member == &asker.on) asked = "on";
    if (fact.member == &asker.off) asked = "off";
    if (fact.member == &asker.method) asked = fmt::format("method {}", fact.values.front());
    if (fact.member == &asker.yes) asked = "yes";
    texts.push_back(fmt::format("{}{}{}{}", fact.isAlternative ? "or " : "", fact.holds ? "+" : "-",
                                fact.isNegated ? "not " : "", asked));
  }
  return texts;
}

TEST(Condition, AnswersAndTellsWhatDecides) {
  Flags n(nullptr);
  const Condition never = Condition::Sentence("never", [](const CYbSEKvfBase&) { return false; });
  const struct {
    Condition condition;
    bool holds;
    std::vector<std::string> facts;
  } cases[] = {
      {Condition(), true, {}},
      {On(n.on), true, {"+on"}},
      {On(n.yes), true, {"+yes"}},
      {!On(n.on), false, {"-not on"}},
      {Is(n.method, {1, 2}), true, {"+method 1"}},
      {Is(n.method, 3), false, {"-method 3"}},
      // Of an and that fails only what is missing; of an or that holds only what makes it so.
      {On(n.on) && On(n.off) && never, false, {"-off", "-never"}},
      {On(n.on) && On(n.yes), true, {"+on", "+yes"}},
      {On(n.off) || On(n.on), true, {"+on"}},
      {On(n.off) || never, false, {"-off", "or -never"}},
      {(On(n.off) && never) || Is(n.method, 3), false, {"-off", "-never", "or -method 3"}},
      {!(On(n.on) && On(n.yes)), false, {"-not on", "or -not yes"}},
      {!(On(n.on) && On(n.off)), true, {"+not off"}},
      {!(On(n.on) || On(n.off)), false, {"-not on"}},
      {!!On(n.on), true, {"+on"}},
      // What always holds adds nothing.
      {Condition() && On(n.off), false, {"-off"}},
      {Condition() || On(n.off), true, {}},
      {!Condition(), false, {"-this is never so"}},
  };
  for (std::size_t i = 0; i < std::size(cases); ++i) {
    SCOPED_TRACE(i);
    EXPECT_EQ(cases[i].condition.Holds(n), cases[i].holds);
    EXPECT_EQ(Facts(cases[i].condition, n), cases[i].facts);
  }
}

TEST(Condition, FollowsTheValuesAndTheNodeThatIsFound) {
  Flags n(nullptr);
  const Condition off = On(n.off);
  EXPECT_FALSE(off.Holds(n));
  n.off = 5;
  EXPECT_TRUE(off.Holds(n));

  const Flags* found = nullptr;
  const Condition ofOther = Is<Flags>([&](const CYbSEKvfBase&) { return found; }, &Flags::method, {2});
  EXPECT_FALSE(ofOther.Holds(n)) << "there is no such node";
  EXPECT_FALSE((!ofOther).Why(n).front().holds == false);
  Flags other(nullptr);
  found = &other;
  EXPECT_TRUE(ofOther.Holds(n));
  EXPECT_EQ(ofOther.Why(n).front().node, &other);
}

TEST(Condition, OfANodeDecidesWhetherItTakesPart) {
  Flags parent(nullptr);
  Flags& child = *parent.NewChild<Flags>();
  child.TakesPartWhen(On(parent.off));
  EXPECT_EQ(child.IsDataUsedInSetup(), 0);
  parent.off = 1;
  EXPECT_EQ(child.IsDataUsedInSetup(), 1);
  parent.TakesPartWhen(On(child.off));
  EXPECT_EQ(child.IsDataUsedInSetup(), 0) << "the node above it does not";
}

}  // namespace
}  // namespace tervane::condition_test
