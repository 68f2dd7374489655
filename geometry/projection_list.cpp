// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "geometry/projection_list.h"

#include <algorithm>
#include <memory>
#include <utility>

#include "geometry/proj_calls.h"
#include "platform/text.h"

namespace tervane {

namespace {

using projections::Context;
using projections::Library;
using projections::MakeContext;

/// A system with all that is sought in it, in lower case.
struct Entry {
  KnownProjection projection;
  std::string code, name, place;
};

std::vector<Entry> ReadRegister() {
  std::vector<Entry> entries;
  const Context context = MakeContext();
  int count = 0;
  PROJ_CRS_INFO** const list = Library().proj_get_crs_info_list_from_database(context.get(), "EPSG", nullptr, &count);
  const auto text = [](const char* of) { return std::string(of ? of : ""); };
  for (int i = 0; list && i < count; ++i) {
    const PROJ_CRS_INFO& info = *list[i];
    const bool isGeographical = info.type == PJ_TYPE_GEOGRAPHIC_2D_CRS;
    if ((!isGeographical && info.type != PJ_TYPE_PROJECTED_CRS) || info.deprecated) continue;
    KnownProjection known{"EPSG:" + text(info.code), text(info.name), text(info.area_name), isGeographical};
    Entry entry{known, LowerCase(known.code), LowerCase(known.name), LowerCase(known.place)};
    entries.push_back(std::move(entry));
  }
  Library().proj_crs_info_list_destroy(list);
  return entries;
}

/// How well a word is met: 0 best, 3 not at all.
int Distance(const Entry& entry, const std::string& word) {
  if (entry.code == word || entry.code.substr(entry.code.find(':') + 1) == word) return 0;
  if (entry.name.find(word) != std::string::npos) return 1;
  if (entry.place.find(word) != std::string::npos) return 2;
  return 3;
}

bool IsInCommonUse(std::string_view name) { return name.starts_with("WGS 84") || name.starts_with("ETRS89"); }

}  // namespace

std::vector<KnownProjection> FindProjections(std::string_view typed, std::size_t most, std::string& problem) {
  problem = projections::WhyNoLibrary();
  if (!problem.empty()) return {};
  static const std::vector<Entry> entries = ReadRegister();
  if (entries.empty()) problem = "the register of coordinate systems cannot be read";
  std::vector<std::string> words;
  const std::string lower = LowerCase(typed);
  for (std::string_view rest = Trimmed(lower); !rest.empty(); rest = Trimmed(rest)) {
    const std::size_t end = std::min(rest.find_first_of(" \t,/"), rest.size());
    if (end > 0) words.emplace_back(rest.substr(0, end));
    rest.remove_prefix(std::min(end + 1, rest.size()));
  }
  std::vector<std::pair<int, const Entry*>> found;
  for (const Entry& entry : entries) {
    int all = 0;
    bool isMet = !words.empty();
    for (const std::string& word : words) {
      const int distance = Distance(entry, word);
      isMet = isMet && distance < 3;
      all += distance;
    }
    // Maps are drawn in planes: angles stand behind. In front of its likes stands what data of today are told in.
    const int likely = (entry.projection.isGeographical ? 2 : 0) + (IsInCommonUse(entry.projection.name) ? 0 : 1);
    if (isMet) found.emplace_back(4 * all + likely, &entry);
  }
  std::ranges::stable_sort(found, {}, &std::pair<int, const Entry*>::first);
  std::vector<KnownProjection> result;
  for (std::size_t i = 0; i < std::min(most, found.size()); ++i) result.push_back(found[i].second->projection);
  return result;
}

std::string ProjectionTextOf(const std::string& code) {
  if (!projections::WhyNoLibrary().empty()) return {};
  const Context context = MakeContext();
  PJ* const system = Library().proj_create(context.get(), code.c_str());
  const char* text = nullptr;
  const char* const options[] = {"MULTILINE=NO", nullptr};
  if (system && Library().proj_is_crs(system))
    text = Library().proj_as_wkt(context.get(), system, PJ_WKT1_ESRI, options);
  std::string result = text ? text : "";
  Library().proj_destroy(system);
  return result;
}

}  // namespace tervane
