// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/condition.h"

#include <algorithm>

namespace tervane {

struct Condition::Part {
  enum class Kind { Key, Sentence, And, Or, Not };

  Kind kind = Kind::Key;
  FindKey find;
  std::vector<int> values;
  bool isFlag = false;
  std::string sentence;
  std::function<bool(const CYbSEKvfBase&)> says;
  std::shared_ptr<const Part> a, b;

  bool Holds(const CYbSEKvfBase& asker) const {
    switch (kind) {
      case Kind::Key: {
        const std::optional<int> value = find(asker).value;
        if (!value) return false;
        return isFlag ? *value != 0 : std::ranges::find(values, *value) != values.end();
      }
      case Kind::Sentence:
        return says(asker);
      case Kind::And:
        return a->Holds(asker) && b->Holds(asker);
      case Kind::Or:
        return a->Holds(asker) || b->Holds(asker);
      case Kind::Not:
        return !a->Holds(asker);
    }
    return false;
  }
};

bool Condition::Holds(const CYbSEKvfBase& asker) const { return !part_ || part_->Holds(asker); }

Condition Condition::OfKey(FindKey find, std::vector<int> values, bool isFlag) {
  auto part = std::make_shared<Part>();
  part->find = std::move(find);
  part->values = std::move(values);
  part->isFlag = isFlag;
  Condition condition;
  condition.part_ = std::move(part);
  return condition;
}

Condition Condition::Sentence(std::string sentence, std::function<bool(const CYbSEKvfBase&)> holds) {
  auto part = std::make_shared<Part>();
  part->kind = Part::Kind::Sentence;
  part->sentence = std::move(sentence);
  part->says = std::move(holds);
  Condition condition;
  condition.part_ = std::move(part);
  return condition;
}

Condition Condition::Join(bool isAnd, const Condition& a, const Condition& b) {
  // What always holds adds nothing to an and, and leaves nothing to ask of an or.
  if (!a.part_) return isAnd ? b : a;
  if (!b.part_) return isAnd ? a : b;
  auto part = std::make_shared<Part>();
  part->kind = isAnd ? Part::Kind::And : Part::Kind::Or;
  part->a = a.part_;
  part->b = b.part_;
  Condition joined;
  joined.part_ = std::move(part);
  return joined;
}

Condition Condition::operator!() const {
  if (!part_) return Sentence("this is never so", [](const CYbSEKvfBase&) { return false; });
  auto part = std::make_shared<Part>();
  part->kind = Part::Kind::Not;
  part->a = part_;
  Condition negated;
  negated.part_ = std::move(part);
  return negated;
}

std::vector<ConditionFact> Condition::Why(const CYbSEKvfBase& asker) const {
  std::vector<ConditionFact> facts;
  if (part_) Collect(*part_, asker, false, facts);
  return facts;
}

/// Adds the facts that decide the part: of an and that holds both sides, of one that does not those that fail; of an or
/// the other way round.
void Condition::Collect(const Part& part, const CYbSEKvfBase& asker, bool isNegated,
                        std::vector<ConditionFact>& facts) {
  using Kind = Part::Kind;
  const bool holds = part.Holds(asker);
  switch (part.kind) {
    case Kind::Not:
      Collect(*part.a, asker, !isNegated, facts);
      break;
    case Kind::And:
    case Kind::Or: {
      const bool needsBoth = (part.kind == Kind::And) == holds;
      const std::size_t before = facts.size();
      if (needsBoth || part.a->Holds(asker) == holds) Collect(*part.a, asker, isNegated, facts);
      const std::size_t first = facts.size();
      if (needsBoth || part.b->Holds(asker) == holds) Collect(*part.b, asker, isNegated, facts);
      // Both sides say no where one of them would do.
      const bool isEither = needsBoth && holds == isNegated;
      if (isEither && before < first && first < facts.size()) facts[first].isAlternative = true;
      break;
    }
    case Kind::Key: {
      const KeyOfNode key = part.find(asker);
      facts.push_back({.holds = holds != isNegated,
                       .node = key.node,
                       .member = key.member,
                       .values = part.values,
                       .isFlag = part.isFlag,
                       .isNegated = isNegated});
      break;
    }
    case Kind::Sentence:
      facts.push_back({.holds = holds != isNegated, .isNegated = isNegated, .sentence = part.sentence});
      break;
  }
}

namespace {

template <class Value>
Condition::FindKey ValueAt(const Value& value) {
  return [&value](const CYbSEKvfBase&) { return Condition::KeyOfNode{nullptr, &value, static_cast<int>(value)}; };
}

}  // namespace

Condition On(const int& flag) { return Condition::OfKey(ValueAt(flag), {}, true); }
Condition On(const bool& flag) { return Condition::OfKey(ValueAt(flag), {}, true); }
Condition Is(const int& value, std::vector<int> values) {
  return Condition::OfKey(ValueAt(value), std::move(values), false);
}

}  // namespace tervane
