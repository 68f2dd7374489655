// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Rules that can say why: whether a node takes part, a file is used, a control is enabled or shown. A rule is a
// condition over keys, joined by `&&`, `||` and `!`; where no condition fits it is a sentence with a function.
#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace tervane {

class CYbSEKvfBase;
template <class Node>
struct ImportantName;

/// One thing that a condition asks, as it stands now.
struct ConditionFact {
  bool holds = false;                  ///< What the condition asks for is so, also of a negated one.
  const CYbSEKvfBase* node = nullptr;  ///< The node that holds the key; null where the asking node or its page knows.
  const void* member = nullptr;        ///< The key's member; null for a sentence.
  std::vector<int> values = {};        ///< The values that fulfil it, or with `isNegated` those that do not.
  bool isFlag = false;                 ///< On or off is asked, not a value.
  bool isNegated = false;
  bool isAlternative = false;  ///< Begins another way to what is missing: this, or what was told before.
  std::string sentence = {};   ///< In the place of a key.
};

/// A condition; without anything asked it always holds. Copies share what they ask.
class Condition {
 public:
  Condition() = default;

  /// Whether anything is asked.
  bool IsAlways() const { return part_ == nullptr; }
  /// `asker` is the node whose rule it is.
  bool Holds(const CYbSEKvfBase& asker) const;
  /// What decides: where it holds, the facts that make it so; where not, those that are missing.
  std::vector<ConditionFact> Why(const CYbSEKvfBase& asker) const;

  friend Condition operator&&(const Condition& a, const Condition& b) { return Join(true, a, b); }
  friend Condition operator||(const Condition& a, const Condition& b) { return Join(false, a, b); }
  Condition operator!() const;

  // ---- What is asked

  /// The member of the node that `find` gives is one of the values; where there is no such node, it is not.
  struct KeyOfNode {
    const CYbSEKvfBase* node = nullptr;
    const void* member = nullptr;
    std::optional<int> value = {};
  };
  using FindKey = std::function<KeyOfNode(const CYbSEKvfBase& asker)>;
  static Condition OfKey(FindKey find, std::vector<int> values, bool isFlag);
  /// A sentence that is true when the function says so: "a forcing is corrected for elevation".
  static Condition Sentence(std::string sentence, std::function<bool(const CYbSEKvfBase& asker)> holds);

 private:
  struct Part;
  static Condition Join(bool isAnd, const Condition& a, const Condition& b);
  static void Collect(const Part& part, const CYbSEKvfBase& asker, bool isNegated, std::vector<ConditionFact>& facts);

  std::shared_ptr<const Part> part_;
};

/// The flag is not 0; a flag of the asking node, or of a node that lives as long.
Condition On(const int& flag);
Condition On(const bool& flag);
/// The value is one of those.
Condition Is(const int& value, std::vector<int> values);
inline Condition Is(const int& value, int wanted) { return Is(value, std::vector{wanted}); }

/// The same of a member of a node that is found from the one that asks: `find(asker)` gives it, or null.
template <class Node>
Condition::FindKey MemberOf(std::function<const Node*(const CYbSEKvfBase&)> find, int Node::*member) {
  return [find = std::move(find), member](const CYbSEKvfBase& asker) {
    const Node* node = find(asker);
    return node ? Condition::KeyOfNode{node, &(node->*member), node->*member} : Condition::KeyOfNode{};
  };
}
template <class Node>
Condition Is(std::function<const Node*(const CYbSEKvfBase&)> find, int Node::*member, std::vector<int> values) {
  return Condition::OfKey(MemberOf(std::move(find), member), std::move(values), false);
}
template <class Node>
Condition On(std::function<const Node*(const CYbSEKvfBase&)> find, int Node::*member) {
  return Condition::OfKey(MemberOf(std::move(find), member), {}, true);
}

}  // namespace tervane
