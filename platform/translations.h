// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <array>
#include <bitset>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace tervane {

/// English texts in another language, from a catalogue in the PO format of gettext: comments, msgctxt, msgid, msgstr.
/// Texts of pages and findings come finished, values in them; an entry of the context "Pages" that has %1, %2 ... (each
/// once and in this order in the English) is a template for these: the values go over to the other text, those that are
/// texts with a translation in it.
class Translations {
 public:
  Translations() = default;
  /// Takes the catalogue up to its first fault, of which Problem tells.
  explicit Translations(std::string_view catalogue);

  /// Empty, or the fault of the catalogue with its line.
  const std::string& Problem() const { return problem_; }
  /// The entry of a text as it stands in the sources; nothing when there is none. Where a text means two things, the
  /// sources tell which by a context, and that of the entry is the same.
  std::optional<std::string> Exact(std::string_view english, std::string_view context = {}) const;
  /// The same of a finished text of a page or finding: its own entry, that of the template with the most letters, or
  /// each of its lines by itself. A template of few letters joins texts: without a letter, as "%1:", it holds where
  /// one of its values has a text; with some, as "%1 to %2", where each has one or is a number or date.
  std::optional<std::string> Finished(std::string_view english) const { return Finished(english, 0); }
  /// The texts that have an entry, in the order of the catalogue.
  const std::vector<std::string>& Texts() const { return texts_; }
  /// The finished texts that are templates, those with the most letters first.
  std::vector<std::string> Templates() const;

 private:
  /// Which pairs of neighbouring bytes a text has: what lacks one of a template's is not of its form.
  using Pairs = std::bitset<256>;
  static void AddPairs(std::string_view text, Pairs& pairs);

  struct Template {
    std::string english;
    std::vector<std::string> literals;  ///< What stands before, between and behind the values.
    std::string translated;
    std::size_t length = 0;  ///< Of the literals.
    Pairs pairs;             ///< Of their bytes.
    std::size_t letters = 0;
  };

  void Take(const std::string& context, const std::string& english, const std::string& translated, int line);
  void Refuse(int line, const std::string& why);
  void SortTemplates();
  std::optional<std::string> Finished(std::string_view english, int depth) const;
  /// A text by a template; nothing when it is not of its form.
  std::optional<std::string> ByTemplate(const Template& candidate, std::string_view english, int depth) const;
  /// Each line by itself; nothing when none has a translation.
  std::optional<std::string> ByLines(std::string_view english, int depth) const;

  std::unordered_map<std::string, std::string> exact_;
  std::vector<Template> templates_;  ///< Those with the most letters first.
  /// Their numbers by the first byte that they begin with; of those that begin with a value by the last byte that they
  /// end with; 0 for a value at both ends. So a text is held against few of them.
  std::array<std::vector<std::uint32_t>, 256> byFirst_, byLast_;
  std::vector<std::string> texts_;
  std::string problem_;
};

}  // namespace tervane
