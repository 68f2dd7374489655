// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/translations.h"

#include <algorithm>
#include <iterator>
#include <utility>

namespace tervane {

namespace {

/// Values in values in values, as a list in a text has them.
constexpr int kDeepest = 50;

/// Below that, a template says little by itself.
constexpr std::size_t kFewLetters = 4;

/// The context of texts that come finished.
constexpr std::string_view kFinished = "Pages";

/// As gettext joins them.
std::string InContext(std::string_view context, std::string_view english) {
  return std::string(context).append(1, '\x04').append(english);
}

bool IsPlaceholder(std::string_view text, std::size_t at) {
  return text[at] == '%' && at + 1 < text.size() && text[at + 1] >= '1' && text[at + 1] <= '9';
}

bool IsLetterByte(char c) {
  return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || static_cast<unsigned char>(c) >= 0x80;
}

std::vector<char> PlaceholdersOf(std::string_view text) {
  std::vector<char> found;
  for (std::size_t i = 0; i < text.size(); ++i)
    if (IsPlaceholder(text, i)) found.push_back(text[++i]);
  return found;
}

/// The text between the quotes; nothing when they or an escape are wrong.
std::optional<std::string> Unquoted(std::string_view text) {
  if (text.size() < 2 || text.front() != '"' || text.back() != '"') return {};
  text = text.substr(1, text.size() - 2);
  std::string plain;
  for (std::size_t i = 0; i < text.size(); ++i) {
    if (text[i] == '"') return {};
    if (text[i] != '\\') {
      plain += text[i];
      continue;
    }
    if (++i == text.size()) return {};
    constexpr std::string_view kEscapes = "nrt\"\\", kMeant = "\n\r\t\"\\";
    const std::size_t escape = kEscapes.find(text[i]);
    if (escape == std::string_view::npos) return {};
    plain += kMeant[escape];
  }
  return plain;
}

/// The values of a finished text; nothing when it is not of this form.
std::optional<std::vector<std::string_view>> ValuesIn(std::string_view text, const std::vector<std::string>& literals) {
  if (!text.starts_with(literals.front())) return {};
  text.remove_prefix(literals.front().size());
  if (!text.ends_with(literals.back())) return {};
  text.remove_suffix(literals.back().size());
  std::vector<std::string_view> values;
  for (std::size_t i = 1; i + 1 < literals.size(); ++i) {
    const std::size_t at = text.find(literals[i]);
    if (at == std::string_view::npos) return {};
    values.push_back(text.substr(0, at));
    text.remove_prefix(at + literals[i].size());
  }
  values.push_back(text);
  return values;
}

}  // namespace

Translations::Translations(std::string_view catalogue) {
  std::string context, english, translated;
  std::string* current = nullptr;
  int line = 0, begin = 0;
  const auto take = [&] {
    if (!english.empty() && !translated.empty()) Take(context, english, translated, begin);
    for (std::string* part : {&context, &english, &translated}) part->clear();
    current = nullptr;
  };
  while (!catalogue.empty() && problem_.empty()) {
    ++line;
    const std::size_t end = std::min(catalogue.find('\n'), catalogue.size());
    std::string_view text = catalogue.substr(0, end);
    catalogue.remove_prefix(std::min(end + 1, catalogue.size()));
    if (text.ends_with('\r')) text.remove_suffix(1);
    if (text.starts_with('#')) continue;
    const bool isContext = text.starts_with("msgctxt "), isEnglish = text.starts_with("msgid ");
    if (text.empty() || isContext || (isEnglish && current != &context)) take();
    if (text.empty()) continue;
    if (isContext || isEnglish) {
      current = isContext ? &context : &english;
      begin = line;
    } else if (text.starts_with("msgstr ")) {
      current = &translated;
    }
    if (!text.starts_with('"')) text.remove_prefix(std::min(text.find(' ') + 1, text.size()));
    const std::optional<std::string> plain = Unquoted(text);
    if (!current || !plain)
      Refuse(line, "msgctxt, msgid, msgstr or a text in quotes was expected");
    else
      *current += *plain;
  }
  if (problem_.empty()) take();
  SortTemplates();
}

void Translations::SortTemplates() {
  std::ranges::stable_sort(templates_, [](const Template& a, const Template& b) { return a.length > b.length; });
  for (std::uint32_t i = 0; i < templates_.size(); ++i) {
    const std::string &first = templates_[i].literals.front(), &last = templates_[i].literals.back();
    if (!first.empty())
      byFirst_[static_cast<unsigned char>(first.front())].push_back(i);
    else
      byLast_[last.empty() ? 0 : static_cast<unsigned char>(last.back())].push_back(i);
  }
}

void Translations::AddPairs(std::string_view text, Pairs& pairs) {
  for (std::size_t i = 1; i < text.size(); ++i)
    pairs.set((static_cast<unsigned char>(text[i - 1]) * 31U + static_cast<unsigned char>(text[i])) % 256);
}

std::vector<std::string> Translations::Templates() const {
  std::vector<std::string> texts;
  for (const Template& each : templates_) texts.push_back(each.english);
  return texts;
}

void Translations::Take(const std::string& context, const std::string& english, const std::string& translated,
                        int line) {
  std::vector<char> wanted = PlaceholdersOf(english), given = PlaceholdersOf(translated);
  const bool isTemplate = context == kFinished && !wanted.empty();
  if (isTemplate)
    for (std::size_t i = 0; i < wanted.size(); ++i)
      if (wanted[i] != static_cast<char>('1' + i)) return Refuse(line, "%1, %2 ... in this order were expected");
  std::ranges::sort(wanted);
  std::ranges::sort(given);
  if (wanted != given) return Refuse(line, "the translation has other place holders than the text");
  const bool isOfItsOwn = !context.empty() && context != kFinished;
  if (!exact_.emplace(isOfItsOwn ? InContext(context, english) : english, translated).second)
    return Refuse(line, "this text has an entry already");
  texts_.push_back(english);
  if (!isTemplate) return;
  Template made;
  made.english = english;
  made.translated = translated;
  made.literals.emplace_back();
  for (std::size_t i = 0; i < english.size(); ++i) {
    if (IsPlaceholder(english, i)) {
      ++i;
      made.literals.emplace_back();
    } else {
      made.literals.back() += english[i];
      if (IsLetterByte(english[i])) ++made.letters;
      ++made.length;
    }
  }
  for (const std::string& literal : made.literals) AddPairs(literal, made.pairs);
  templates_.push_back(std::move(made));
}

void Translations::Refuse(int line, const std::string& why) {
  if (problem_.empty()) problem_ = "line " + std::to_string(line) + ": " + why;
}

std::optional<std::string> Translations::Exact(std::string_view english, std::string_view context) const {
  if (!context.empty())
    if (const auto own = exact_.find(InContext(context, english)); own != exact_.end()) return own->second;
  const auto found = exact_.find(std::string(english));
  return found == exact_.end() ? std::nullopt : std::optional(found->second);
}

std::optional<std::string> Translations::Finished(std::string_view english, int depth) const {
  if (auto found = Exact(english)) return found;
  // Numbers and dates are many.
  if (depth > kDeepest || std::ranges::none_of(english, IsLetterByte)) return {};
  const bool isOfLines = english.find('\n') != std::string_view::npos;
  Pairs pairs;
  AddPairs(english, pairs);
  // The three lists as one, in the order of the templates.
  const std::vector<std::uint32_t>* lists[] = {&byFirst_[static_cast<unsigned char>(english.front())],
                                               &byLast_[static_cast<unsigned char>(english.back())], &byLast_[0]};
  std::size_t next[std::size(lists)] = {};
  for (;;) {
    std::size_t list = std::size(lists);
    for (std::size_t i = 0; i < std::size(lists); ++i)
      if (next[i] < lists[i]->size() && (list == std::size(lists) || (*lists[i])[next[i]] < (*lists[list])[next[list]]))
        list = i;
    if (list == std::size(lists)) break;
    const Template& candidate = templates_[(*lists[list])[next[list]++]];
    // What joins texts joins those of one line.
    const bool isJoint = candidate.letters < kFewLetters && candidate.literals.size() > 2;
    if ((isJoint && isOfLines) || (candidate.pairs & ~pairs).any()) continue;
    if (auto found = ByTemplate(candidate, english, depth)) return found;
  }
  return ByLines(english, depth);
}

std::optional<std::string> Translations::ByTemplate(const Template& candidate, std::string_view english,
                                                    int depth) const {
  const auto values = ValuesIn(english, candidate.literals);
  if (!values) return {};
  std::size_t translated = 0, numbers = 0;
  std::vector<std::string> told;
  for (const std::string_view value : *values) {
    auto found = Finished(value, depth + 1);
    if (found) ++translated;
    if (!found && !value.empty() && value.front() >= '0' && value.front() <= '9') ++numbers;
    told.push_back(found ? std::move(*found) : std::string(value));
  }
  if (candidate.letters == 0 && translated == 0) return {};
  if (candidate.letters > 0 && candidate.letters < kFewLetters && translated + numbers < told.size()) return {};
  std::string text;
  for (std::size_t i = 0; i < candidate.translated.size(); ++i) {
    if (IsPlaceholder(candidate.translated, i))
      text += told[static_cast<std::size_t>(candidate.translated[++i] - '1')];
    else
      text += candidate.translated[i];
  }
  return text;
}

std::optional<std::string> Translations::ByLines(std::string_view english, int depth) const {
  if (english.find('\n') == std::string_view::npos) return {};
  std::string text;
  bool isTold = false;
  for (;;) {
    const std::size_t end = english.find('\n');
    const std::string_view line = english.substr(0, end);
    const auto found = Finished(line, depth + 1);
    isTold = isTold || found;
    text += found ? std::string_view(*found) : line;
    if (end == std::string_view::npos) break;
    text += '\n';
    english.remove_prefix(end + 1);
  }
  return isTold ? std::optional(std::move(text)) : std::nullopt;
}

}  // namespace tervane
