// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/text_outline.h"

#include <algorithm>

#include <fmt/format.h>

#include "core/kvf_parser.h"
#include "platform/text.h"

namespace tervane {

namespace {

/// The name of a section of which this is the first line; empty where it is none.
std::string NameInHeader(std::string_view line) {
  KvfFile file;
  const std::string whole = fmt::format("target T {{\n{}\n}}\n}}\n", line);
  const KvfSection* target = ParseKvf(FileContent::Of(whole), file) ? AsSection(file.top.firstChild) : nullptr;
  return target && target->firstChild ? std::string(target->firstChild->Name()) : std::string();
}

}  // namespace

bool BeginsSection(std::string_view line) {
  const std::string_view text = Trimmed(line);
  return text.ends_with('{') && (text.starts_with("section ") || text.starts_with("target "));
}

bool EndsSection(std::string_view line) { return Trimmed(line) == "}"; }

TextOutline::TextOutline(std::string text) : text_(std::move(text)) {
  std::vector<int> open;
  for (std::size_t start = 0;;) {
    const std::size_t found = text_.find('\n', start);
    const std::size_t end = found == std::string::npos ? text_.size() : found;
    const std::string_view line(text_.data() + start, end - start);
    const int number = LineCount();
    starts_.push_back(static_cast<std::uint32_t>(start));
    if (BeginsSection(line)) {
      sections_.push_back({number, number, open.empty() ? kNone : open.back()});
      open.push_back(static_cast<int>(sections_.size()) - 1);
    } else if (!open.empty() && EndsSection(line)) {
      sections_[static_cast<std::size_t>(open.back())].end = number;
      open.pop_back();
    }
    if (found == std::string::npos) break;
    start = end + 1;
  }
}

std::string_view TextOutline::Line(int line) const {
  std::string_view text = Lines(line, line);
  if (text.ends_with('\n')) text.remove_suffix(1);
  return text;
}

std::string_view TextOutline::Lines(int first, int last) const {
  if (first < 0 || last < first || first >= LineCount()) return {};
  const std::size_t start = starts_[static_cast<std::size_t>(first)];
  const std::size_t end = last + 1 < LineCount() ? starts_[static_cast<std::size_t>(last) + 1] : text_.size();
  return std::string_view(text_).substr(start, end - start);
}

int TextOutline::SectionAround(int first, int last) const {
  const auto behind = std::upper_bound(sections_.begin(), sections_.end(), first,
                                       [](int line, const Section& section) { return line < section.begin; });
  int number = static_cast<int>(behind - sections_.begin()) - 1;
  while (number != kNone) {
    const Section& section = sections_[static_cast<std::size_t>(number)];
    if (section.begin < first && last < section.end) break;
    number = section.parent;
  }
  return number;
}

std::vector<PathStep> TextOutline::StepsTo(int section) const {
  std::vector<PathStep> steps;
  while (section != kNone) {
    const Section& own = sections_[static_cast<std::size_t>(section)];
    if (own.parent == kNone) break;
    const std::string_view header = Trimmed(Line(own.begin));
    int instance = 1;
    for (int other = own.parent + 1; other < section; ++other)
      if (const Section& sibling = sections_[static_cast<std::size_t>(other)];
          sibling.parent == own.parent && Trimmed(Line(sibling.begin)) == header)
        ++instance;
    steps.push_back({NameInHeader(header), instance});
    section = own.parent;
  }
  std::reverse(steps.begin(), steps.end());
  return steps;
}

int TextOutline::Find(const std::vector<PathStep>& steps) const {
  if (sections_.empty()) return kNone;
  int found = 0;
  for (const PathStep& step : steps) {
    const int parent = found;
    found = kNone;
    int instance = 0;
    const int end = sections_[static_cast<std::size_t>(parent)].end;
    for (std::size_t i = static_cast<std::size_t>(parent) + 1; i < sections_.size() && sections_[i].begin < end; ++i) {
      if (sections_[i].parent != parent) continue;
      const std::string_view header = Line(sections_[i].begin);
      if (header.find(step.name) == std::string_view::npos || NameInHeader(header) != step.name) continue;
      if (++instance != step.instance) continue;
      found = static_cast<int>(i);
      break;
    }
    if (found == kNone) break;
  }
  return found;
}

int TextOutline::LineOf(int section, std::string_view key) const {
  const Section& own = sections_[static_cast<std::size_t>(section)];
  int depth = 0;
  for (int line = own.begin + 1; line < own.end && !key.empty(); ++line) {
    const std::string_view text = Line(line);
    if (BeginsSection(text)) ++depth;
    if (EndsSection(text)) --depth;
    if (depth > 0) continue;
    const std::string_view name = Trimmed(text.substr(0, text.find('=')));
    if (name == key || (name.size() == key.size() + 2 && name.front() == '"' && name.substr(1, key.size()) == key))
      return line;
  }
  return own.begin;
}

}  // namespace tervane
