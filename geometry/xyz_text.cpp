// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "geometry/xyz_text.h"

#include <algorithm>
#include <new>

#include <fmt/format.h>

#include "platform/file_cache.h"
#include "platform/text.h"
#include "platform/text_fields.h"

namespace tervane {
namespace {

bool IsComment(std::string_view trimmed) {
  return trimmed.empty() || trimmed.front() == '#' || trimmed.front() == '!' || trimmed.front() == '%';
}

/// Reads x, y and z; gives why that fails.
std::string ReadPoint(std::string_view line, FieldRules rules, ScatteredPoint& point) {
  static constexpr const char* kNames[] = {"x", "y", "z"};
  double* const targets[] = {&point.x, &point.y, &point.z};
  for (std::size_t i = 0; i < 3; ++i) {
    const std::string_view field = NextField(line, rules);
    if (field.empty())
      return fmt::format("{} is missing: a point needs x, y and z, and there are {} numbers", kNames[i], i);
    if (!ReadNumber(field, rules, *targets[i]))
      return fmt::format("{} is \"{}\", which is no number", kNames[i], Shown(field));
  }
  return {};
}

/// True when the line begins with a number, so that it is meant to be a point.
bool BeginsWithNumber(std::string_view line, FieldRules rules) {
  double number = 0;
  return ReadNumber(NextField(line, rules), rules, number);
}

/// True for "330000,5 5090000,5 12,5": blanks separate at least three fields, and no comma stands at a blank.
bool HasCommasInsideNumbers(std::string_view line) {
  if (line.find(',') == std::string_view::npos) return false;
  int fields = 0;
  for (std::string_view rest = Trimmed(line); !rest.empty(); rest = Trimmed(rest)) {
    const std::string_view field = rest.substr(0, rest.find_first_of(" \t"));
    if (field.front() == ',' || field.back() == ',') return false;
    rest.remove_prefix(field.size());
    ++fields;
  }
  return fields >= 3;
}

FileResult ParseLines(std::string_view text, const std::string& path, std::vector<ScatteredPoint>& points,
                      ProgressPart progress) {
  if (const std::string reason = WhyNoText(text); !reason.empty()) {
    return {fmt::format("cannot read {}: {}", path, reason), {}};
  }
  LineReader lines(text);
  const LineProgress told(text, progress);
  FieldRules rules;
  std::string_view line;
  while (lines.Next(line)) {
    told.After(lines);
    if (IsComment(Trimmed(line))) continue;
    if (points.empty()) {
      rules.isCommaDecimal = line.find(';') != std::string_view::npos || HasCommasInsideNumbers(line);
      if (!BeginsWithNumber(line, rules)) continue;
      // The length of the first point tells about how many there are, so that the list seldom grows.
      points.reserve(text.size() / (line.size() + 1) + 1);
    }
    ScatteredPoint point;
    if (const std::string reason = ReadPoint(line, rules, point); !reason.empty()) {
      return {fmt::format("{}, line {}: {}", path, lines.Number(), reason), {}};
    }
    points.push_back(point);
  }
  if (points.empty()) return {fmt::format("{} holds no points: no line begins with a number", path), {}};
  return {};
}

}  // namespace

FileResult ParseXyz(std::string_view text, const std::string& path, std::vector<ScatteredPoint>& points,
                    ProgressPart progress) {
  points.clear();
  FileResult result;
  try {
    result = ParseLines(text, path, points, progress);
  } catch (const std::bad_alloc&) {
    result.error = fmt::format("cannot read {}: there is no memory for its points", path);
  } catch (const Cancelled&) {
    result.error = fmt::format("cannot read {}: {}", path, kCancelled);
  }
  if (!result.Ok()) points.clear();
  return result;
}

FileResult ReadXyzFile(const std::string& path, std::vector<ScatteredPoint>& points, ProgressPart progress) {
  constexpr double kReading = 0.2;
  points.clear();
  FileContent content;
  if (FileResult result = ReadWholeFile(path, content, progress.Part(0, kReading)); !result.Ok()) return result;
  return ParseXyz(content.Text(), path, points, progress.Part(kReading, 1));
}

std::shared_ptr<const XyzFacts> XyzFactsOf(const std::string& path) {
  static FileCache<XyzFacts> cache(kMostFacts);
  return cache.Get(path, "points", [&] {
    XyzFacts facts;
    std::vector<ScatteredPoint> points;
    facts.error = ReadXyzFile(path, points).error;
    facts.points = points.size();
    if (points.empty()) return facts;
    const ScatteredPoint& first = points.front();
    Envelope& box = facts.extent;
    box = {first.x, first.y, first.x, first.y};
    facts.smallest = facts.largest = first.z;
    for (const ScatteredPoint& point : points) {
      box = {std::min(box.xMin, point.x), std::min(box.yMin, point.y), std::max(box.xMax, point.x),
             std::max(box.yMax, point.y)};
      facts.smallest = std::min(facts.smallest, point.z);
      facts.largest = std::max(facts.largest, point.z);
    }
    return facts;
  });
}

}  // namespace tervane
