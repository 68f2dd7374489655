// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/why.h"

#include <algorithm>

#include <fmt/format.h>
#include <fmt/ranges.h>

#include "core/path.h"
#include "forms/page.h"
#include "pages/place_names.h"
#include "pages/tree_entries.h"
#include "platform/text.h"

namespace tervane {

namespace {

/// Puts facts into words, each with the page that has its control.
class Explainer {
 public:
  explicit Explainer(CYbSEDocument& document) : document_(document), names_(document) {}

  /// `keys` know the members of the asking page; null elsewhere.
  Reason InWords(const ConditionFact& fact, const CYbSEKvfBase& asker, BoundKeys* keys = nullptr) {
    Reason reason = Demanded(fact, asker, keys);
    reason.isAlternative = fact.isAlternative;
    if (fact.isAlternative) reason.text.insert(0, "or ");
    return reason;
  }

 private:
  Reason Demanded(const ConditionFact& fact, const CYbSEKvfBase& asker, BoundKeys* keys) {
    Reason reason;
    reason.holds = fact.holds;
    if (!fact.sentence.empty() || !fact.member) {
      const char* must = fact.holds ? "" : "must be so: ";
      const char* negated = fact.isNegated ? (fact.holds ? "it is not so that " : "must not be so: ") : must;
      reason.text = fmt::format("{}{}", fact.isNegated ? negated : must, fact.sentence);
      return reason;
    }
    BoundKeys own;
    if (!keys) keys = &own;
    keys->Add(fact.node ? *fact.node : asker);
    const BoundKeys::Place* place = keys->Find(fact.member);
    if (!place) {
      reason.text = fact.holds ? "a value of this page is as it must be" : "a value of this page must be another";
      return reason;
    }
    reason.path = PathOf(*place->node);
    reason.key = place->key;
    CYbSEKvfBase* shown = PageNodeOf(*place->node, reason);
    const std::string label =
        shown ? names_.LabelOf(*shown, *place->node, place->key, place->facts) : CalledBy(place->facts, place->key);
    reason.text = Demand(label, fact, place->facts);
    return reason;
  }

  static std::string Demand(const std::string& label, const ConditionFact& fact, const KeyFacts& facts) {
    const char* verb = fact.holds ? "is" : "must be";
    if (fact.isFlag) return fmt::format("{} {} {}", label, verb, fact.isNegated ? "off" : "on");
    std::vector<std::string> values;
    for (const int value : fact.values) {
      const std::string_view text = TextOf(facts.choices, value);
      values.push_back(text.empty() ? std::to_string(value) : std::string(text));
    }
    const std::string_view negation = fact.isNegated ? (fact.holds ? " not" : "") : "";
    const std::string_view refused = fact.isNegated && !fact.holds ? "must not be" : verb;
    const std::string choice = fmt::format("{}", fmt::join(values, " or "));
    return label.empty() ? fmt::format("{} {}{} chosen", choice, refused, negation)
                         : fmt::format("{} {}{} {}", label, refused, negation, choice);
  }

  /// The nearest node from here up whose page is shown.
  CYbSEKvfBase* PageNodeOf(const CYbSEKvfBase& node, Reason& reason) const {
    CYbSEKvfBase* found = FindNode(document_.Root(), ParseSetupPath(PathOf(node)).steps);
    CYbSEKvfBase* shown = found ? PlaceNames::PageNodeOf(*found) : nullptr;
    if (!shown) return nullptr;
    reason.page = ShortTitle(*shown);
    reason.serial = shown->Serial();
    return shown;
  }

  CYbSEDocument& document_;
  PlaceNames names_;
};

void Explain(Explainer& explainer, CYbSEKvfBase& node, Explanation& why) {
  const bool takesPart = node.IsDlgUsedInSetup() != 0;
  for (const ConditionFact& fact : node.TakesPartRule().Why(node)) {
    Reason reason = explainer.InWords(fact, node);
    const bool isNew = std::ranges::none_of(why.reasons, [&](const Reason& told) { return told.text == reason.text; });
    if (isNew && reason.holds == takesPart) why.reasons.push_back(std::move(reason));
  }
}

}  // namespace

std::string Explanation::Text(std::string_view yes, std::string_view no) const {
  std::string text = fmt::format("{} {}{}", subject, holds ? yes : no, reasons.empty() ? "." : ":");
  for (const Reason& reason : reasons) text += fmt::format("\n{}", reason.text);
  return text;
}

Explanation WhyTakesPart(CYbSEDocument& document, CYbSEKvfBase& node) {
  Explainer explainer(document);
  Explanation why{ShortTitle(node), node.IsDataUsedInSetup() != 0, {}};
  // Of a node that takes part all rules count, of one that does not those that say no.
  for (CYbSEKvfBase* above = &node; above && above->GetParent(); above = above->GetParent())
    if (why.holds || !above->IsDlgUsedInSetup()) Explain(explainer, *above, why);
  return why;
}

Explanation WhyEnabled(CYbSEDocument& document, PageForm& form, const Control& control) {
  Explainer explainer(document);
  Explanation why{SpokenLabel(control.label.empty() ? control.key : control.label), control.IsEnabled(), {}};
  for (const ConditionFact& fact : control.enabledWhen.Why(*control.pageNode))
    why.reasons.push_back(explainer.InWords(fact, form.Node(), &form.Keys()));
  return why;
}

std::vector<MissingNode> WhatIsMissing(CYbSEDocument& document) {
  Explainer explainer(document);
  std::vector<MissingNode> missing;
  // Below a node that takes no part nothing does: its own line says enough.
  std::vector<std::string> above;
  WalkNodes(document.Root(), [&](const NodePlace& place) {
    if (place.takesPart || !place.node.HoldsSetup() || !PageClassOf(place.node)) return;
    const bool isBelow =
        std::ranges::any_of(above, [&](const std::string& path) { return place.path.starts_with(path + "/"); });
    if (isBelow) return;
    above.push_back(place.path);
    MissingNode node{place.path, place.node.Serial(), {ShortTitle(place.node), false, {}}};
    Explain(explainer, place.node, node.why);
    if (!node.why.reasons.empty()) missing.push_back(std::move(node));
  });
  return missing;
}

}  // namespace tervane
