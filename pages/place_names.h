// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <map>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "core/document.h"

namespace tervane {

class Control;

/// Places of a setup in the words of its trees and pages: "Model Domain and Grid > Filename". What was once looked up
/// is kept, so that it is to be made anew when nodes have changed.
class PlaceNames {
 public:
  explicit PlaceNames(CYbSEDocument& document);
  ~PlaceNames();
  PlaceNames(const PlaceNames&) = delete;
  PlaceNames& operator=(const PlaceNames&) = delete;

  /// The nearest node from here up that has a page; null where there is none.
  static CYbSEKvfBase* PageNodeOf(CYbSEKvfBase& node);
  /// The titles of the nodes with pages from the top down to the page that shows the node; empty for the whole setup.
  static std::vector<std::string> TitlesTo(CYbSEKvfBase& node);

  /// What the control of a key is called on that page: its label, empty for a choice that has none. Where no control
  /// has it, as `CalledBy`.
  std::string LabelOf(CYbSEKvfBase& shown, const CYbSEKvfBase& node, const std::string& key, const KeyFacts& facts);
  /// The place of a node with that path, or of one of its keys; empty for the whole setup.
  std::string Of(CYbSEKvfBase& node, const std::string& path, const std::string& key);
  /// The place that several have in common.
  static std::string OfAll(const std::vector<CYbSEKvfBase*>& nodes);

 private:
  class Labels;

  CYbSEDocument& document_;
  std::unordered_map<const CYbSEKvfBase*, Labels> labels_;
  /// The same key is called the same on all pages of a kind, of which there may be very many.
  std::map<std::pair<std::string, std::string>, std::string> byKind_;
};

/// What a key is called by its declaration: its label there, or else its name.
std::string CalledBy(const KeyFacts& facts, const std::string& key);

/// A label as it is spoken of: without its colon, in one line.
std::string SpokenLabel(std::string_view label);
/// What a control is called, without the marks of a label.
std::string NameOf(const Control& control);

}  // namespace tervane
