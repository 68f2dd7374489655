// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/place_names.h"

#include <algorithm>
#include <optional>

#include <fmt/format.h>
#include <fmt/ranges.h>

#include "core/path.h"
#include "document/key_reference.h"
#include "forms/page.h"
#include "pages/tree_entries.h"
#include "platform/text.h"

namespace tervane {

namespace {

constexpr std::string_view kStep = " > ";

/// A page on which labels are read is asked nothing.
NobodyToAsk theNobody;

}  // namespace

std::string SpokenLabel(std::string_view label) {
  std::string text = Replaced(label, "\n", " ");
  std::string_view spoken = Trimmed(text);
  if (spoken.ends_with(':')) spoken.remove_suffix(1);
  return std::string(Trimmed(spoken));
}

std::string CalledBy(const KeyFacts& facts, const std::string& key) {
  return facts.label.empty() ? key : SpokenLabel(facts.label);
}

std::string NameOf(const Control& control) {
  // A number whose label is a control of its own, since it follows another rule, tells it in its tool tip.
  return SpokenLabel(control.label.empty() && control.kind == ControlKind::Number ? control.toolTip : control.label);
}

/// What the controls of a page are called: by their labels, without one by that of the control in front in the row.
class PlaceNames::Labels {
 public:
  void Look(PageForm& form) {
    form.ForEach([this](const Control& control) {
      const std::string own = NameOf(control);
      if (!own.empty()) before_ = own;
      if (control.key.empty() || !control.node) return;
      // A choice without a label belongs to what stands in front of it in its row.
      const bool isMethod = own.empty() && control.beside;
      labels_.push_back({control.node, control.key, isMethod ? fmt::format("The method of {}", before_) : own});
    });
  }
  /// Nothing where no control has the key.
  std::optional<std::string> Find(const CYbSEKvfBase& node, const std::string& key) const {
    for (const auto& known : labels_)
      if (known.node == &node && known.key == key) return known.label;
    return std::nullopt;
  }

 private:
  struct Known {
    const CYbSEKvfBase* node;
    std::string key, label;
  };
  std::vector<Known> labels_;
  std::string before_;
};

PlaceNames::PlaceNames(CYbSEDocument& document) : document_(document) {}

PlaceNames::~PlaceNames() = default;

CYbSEKvfBase* PlaceNames::PageNodeOf(CYbSEKvfBase& node) {
  CYbSEKvfBase* shown = &node;
  while (shown && !PageClassOf(*shown)) shown = shown->GetParent();
  return shown;
}

std::vector<std::string> PlaceNames::TitlesTo(CYbSEKvfBase& node) {
  std::vector<std::string> titles;
  for (const CYbSEKvfBase* above = &node; above; above = above->GetParent())
    if (PageClassOf(*above)) titles.insert(titles.begin(), ShortTitle(*above));
  return titles;
}

std::string PlaceNames::LabelOf(CYbSEKvfBase& shown, const CYbSEKvfBase& node, const std::string& key,
                                const KeyFacts& facts) {
  auto found = labels_.find(&shown);
  if (found == labels_.end()) {
    found = labels_.emplace(&shown, Labels()).first;
    const auto page = MakePageToRead(*PageClassOf(shown), shown, {document_, theNobody, {}});
    if (page) found->second.Look(page->Form());
  }
  return found->second.Find(node, key).value_or(CalledBy(facts, key));
}

std::string PlaceNames::Of(CYbSEKvfBase& node, const std::string& path, const std::string& key) {
  std::string place = fmt::format("{}", fmt::join(TitlesTo(node), kStep));
  CYbSEKvfBase* shown = PageNodeOf(node);
  if (key.empty() || !shown) return key.empty() ? place : JoinPath(place, key);
  const auto [known, isNew] = byKind_.try_emplace({NumberlessPath(path), key});
  if (isNew) {
    std::vector<KeyInfo> described;
    node.DescribeKeys(described);
    const auto info = std::ranges::find_if(described, [&](const KeyInfo& each) { return Trimmed(each.key) == key; });
    known->second = LabelOf(*shown, node, key, info == described.end() ? KeyFacts() : info->facts);
  }
  return known->second.empty() ? place : fmt::format("{}{}{}", place, kStep, known->second);
}

std::string PlaceNames::OfAll(const std::vector<CYbSEKvfBase*>& nodes) {
  std::vector<std::string> common;
  for (std::size_t i = 0; i < nodes.size(); ++i) {
    const std::vector<std::string> titles = nodes[i] ? TitlesTo(*nodes[i]) : std::vector<std::string>();
    if (i == 0) common = titles;
    const auto end = std::ranges::mismatch(common, titles).in1;
    common.erase(end, common.end());
  }
  return fmt::format("{}", fmt::join(common, kStep));
}

}  // namespace tervane
