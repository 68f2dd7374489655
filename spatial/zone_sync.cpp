// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/zone_sync.h"

#include <algorithm>
#include <array>
#include <cstdlib>
#include <unordered_map>
#include <unordered_set>

#include <fmt/format.h>

#include "core/kvf_writer.h"
#include "data/grid_files.h"
#include "geometry/grid.h"
#include "geometry/shapes.h"
#include "platform/text.h"
#include "spatial/file_nodes.h"

namespace tervane {

namespace {

/// The whole number at the begin of a text, as C reads it.
int WholeNumberOf(const std::string& text) { return std::atoi(text.c_str()); }

std::string TitleOf(const std::string& id, bool areCodes) { return areCodes ? fmt::format("Grid code = {}", id) : id; }

void SetIdentity(CFMSEKvfGroupBase& item, const std::string& id, const std::string& title) {
  item.SetStationId(id);
  item.SetAbbreviatedTitle(title);
  item.SetStationName(title);
}

/// What an item holds with all below it, as the file would hold it; numbers that follow from its place are left out.
std::string ContentOf(CYbSEKvfBase& item) {
  KvfFile* file = kvfCreate();
  kvfAddTarget(file, "Item");
  item.Save(file);
  std::string text, content;
  AppendKvfNodes(file->top, 0, text);
  kvfClose(&file);
  for (std::string_view rest = text; !rest.empty();) {
    const std::size_t end = std::min(rest.find('\n'), rest.size() - 1) + 1;
    const std::string_view line = Trimmed(rest.substr(0, end));
    const bool isOfThePlace =
        std::ranges::any_of(std::array{"ProfileSecNumber", "Touched", "IsDataUsedInSetup", "section "},
                            [&](const char* start) { return line.starts_with(start); });
    if (!isOfThePlace) content += rest.substr(0, end);
    rest.remove_prefix(end);
  }
  return content;
}

/// Whether a user has worked on an item: it differs from one that was just made.
bool IsEdited(CFMSEKvfBase& owner, CFMSEKvfGroupBase& item) {
  const std::shared_ptr<CFMSEKvfGroupBase> fresh = owner.CreateStationItem();
  const std::string content = ContentOf(item), id = item.GetStationId();
  // It may have been made for a source of another kind than the present one.
  for (const std::string& title : {TitleOf(id, true), TitleOf(id, false), std::string("Global")}) {
    SetIdentity(*fresh, id, title);
    if (content == ContentOf(*fresh)) return false;
  }
  return true;
}

void RemoveAll(CFMSEKvfBase& owner, const std::vector<CFMSEKvfGroupBase*>& items) {
  // From the back, where the fewest children must move up.
  for (auto item = items.rbegin(); item != items.rend(); ++item) owner.RemoveChild(*item);
}

/// Sorts the items by their identities; true when they were not in order.
bool SortItems(CFMSEKvfBase& owner, bool asText) {
  const auto isLess = [asText](const CFMSEKvfGroupBase* a, const CFMSEKvfGroupBase* b) {
    if (asText) return a->GetStationId() < b->GetStationId();
    return std::atof(a->GetStationId().c_str()) < std::atof(b->GetStationId().c_str());
  };
  std::vector<CFMSEKvfGroupBase*> items = ZoneItems(owner);
  if (std::ranges::is_sorted(items, isLess)) return false;
  std::vector<CFMSEKvfGroupBase*> sorted = items;
  std::ranges::stable_sort(sorted, isLess);
  // Each swap puts one item at its place for good.
  std::unordered_map<CFMSEKvfGroupBase*, std::size_t> places;
  for (std::size_t i = 0; i < items.size(); ++i) places[items[i]] = i;
  for (std::size_t i = 0; i < sorted.size(); ++i) {
    if (items[i] == sorted[i]) continue;
    const std::size_t from = places[sorted[i]];
    owner.SwapChilds(items[i], items[from]);
    std::swap(items[i], items[from]);
    std::swap(places[items[i]], places[items[from]]);
  }
  return true;
}

/// The items that nothing found stands for, and what was found that no item stands for.
struct Matching {
  std::vector<std::string> added;
  std::vector<CFMSEKvfGroupBase*> removed;
};

Matching Match(const CFMSEKvfBase& owner, const FoundZones& found) {
  // Whole numbers and texts are looked up by one key each; items that match none go.
  const auto keyOf = [&](const std::string& id) { return found.areCodes ? std::to_string(WholeNumberOf(id)) : id; };
  std::unordered_map<std::string, bool> wanted;
  for (const std::string& id : found.ids) wanted.emplace(keyOf(id), false);
  Matching matching;
  for (CFMSEKvfGroupBase* item : ZoneItems(owner)) {
    const bool isCode = !found.areCodes || WholeNumberOf(item->GetStationId()) >= 0;
    const auto match = isCode ? wanted.find(keyOf(item->GetStationId())) : wanted.end();
    // Of several items of one identity the first is meant; the others are left alone like it.
    if (match == wanted.end())
      matching.removed.push_back(item);
    else
      match->second = true;
  }
  for (const std::string& id : found.ids) {
    const auto match = wanted.find(keyOf(id));
    if (!match->second) matching.added.push_back(id);
    match->second = true;
  }
  return matching;
}

}  // namespace

int CFMSEKvfGroupBase::StationCode() const { return WholeNumberOf(GetStationId()); }

FoundZones FindGridCodes(const std::string& file, int item, ProgressPart progress, const char* noValues) {
  FoundZones found;
  if (file.empty()) return found;
  CTvn2DOrthoRotatedGridData grid;
  if (const FileResult result = ReadGridData(file, item, grid, progress); !result.Ok()) {
    found.unreadable = result.error;
    return found;
  }
  std::vector<unsigned> codes;
  if (!grid.GetIntValues(codes)) found.message = noValues;
  for (const unsigned code : codes) found.ids.push_back(std::to_string(code));
  return found;
}

FoundZones FindPolygonValues(const std::string& file, const std::string& attribute, int axisUnit,
                             ProgressPart progress) {
  FoundZones found;
  found.areCodes = false;
  if (file.empty()) return found;
  CYbShapeData shapes;
  shapes.SetAxisLengthUnit(axisUnit);
  if (const FileResult result = shapes.ReadShapeAndDbfFile(file, attribute, progress); !result.Ok()) {
    found.unreadable = result.error;
    return found;
  }
  std::unordered_set<std::string> known;
  for (const Shape& shape : shapes.GetData()) {
    if (!shape.HasValue()) continue;
    std::string text = TextOf(shape.Value());
    found.sortAsText |= std::holds_alternative<std::string>(shape.Value());
    if (text.empty()) text = " ";
    if (known.insert(text).second) found.ids.push_back(std::move(text));
  }
  return found;
}

ZoneFinder CodeFinder(const DataFileNode& file, const char* noValues) {
  return [path = file.File.Absolute(), item = file.SelectedItem(), noValues](ProgressPart progress) {
    return FindGridCodes(path, item, progress, noValues);
  };
}

ZoneFinder PolygonFinder(const CData2DShpFile& file, int axisUnit) {
  return [path = file.File.Absolute(), attribute = file.Attribute(), axisUnit](ProgressPart progress) {
    return FindPolygonValues(path, attribute, axisUnit, progress);
  };
}

std::vector<CFMSEKvfGroupBase*> ZoneItems(const CFMSEKvfBase& owner) {
  std::vector<CFMSEKvfGroupBase*> items;
  for (CYbSEKvfBase* child = owner.GetFirstChild(); child; child = owner.GetNextChild(child))
    if (auto* item = dynamic_cast<CFMSEKvfGroupBase*>(child)) items.push_back(item);
  return items;
}

std::string IdOfItem(const CFMSEKvfBase& owner, const std::string& name) {
  for (const CFMSEKvfGroupBase* item : ZoneItems(owner))
    if (!name.empty() && item->GetStationName() == name) return item->GetStationId();
  return {};
}

std::vector<std::string> ZoneItemTitles(const CFMSEKvfBase& owner) {
  std::vector<std::string> titles;
  for (const CFMSEKvfGroupBase* item : ZoneItems(owner)) titles.push_back(item->GetStationName());
  return titles;
}

SyncPlan PlanSync(CFMSEKvfBase& owner, const FoundZones& found) {
  SyncPlan plan;
  if (!found.unreadable.empty() || !found.message.empty()) return plan;
  Matching matching = Match(owner, found);
  plan.added = std::move(matching.added);
  plan.removed = std::move(matching.removed);
  for (CFMSEKvfGroupBase* item : plan.removed)
    if (IsEdited(owner, *item)) plan.editedRemoved.push_back(item);
  return plan;
}

SyncPlan PlanGlobalItem(CFMSEKvfBase& owner) {
  SyncPlan plan;
  plan.removed = ZoneItems(owner);
  for (CFMSEKvfGroupBase* item : plan.removed)
    if (IsEdited(owner, *item)) plan.editedRemoved.push_back(item);
  return plan;
}

SyncResult SyncItems(CFMSEKvfBase& owner, const FoundZones& found) {
  if (!found.unreadable.empty() || !found.message.empty()) return kNothing;
  const Matching matching = Match(owner, found);
  for (const std::string& id : matching.added) {
    const std::shared_ptr<CFMSEKvfGroupBase> item = owner.CreateFoundItem();
    SetIdentity(*item, id, TitleOf(id, found.areCodes));
    owner.AddChild(item);
  }
  RemoveAll(owner, matching.removed);
  const bool wasReordered = SortItems(owner, found.sortAsText);
  if (!matching.added.empty()) return matching.removed.empty() ? kAdded : kAddedAndRemoved;
  return !matching.removed.empty() ? kRemoved : wasReordered ? kReordered : kNothing;
}

SyncResult MakeGlobalItem(CFMSEKvfBase& owner) {
  const std::vector<CFMSEKvfGroupBase*> before = ZoneItems(owner);
  RemoveAll(owner, before);
  const std::shared_ptr<CFMSEKvfGroupBase> item = owner.CreateStationItem();
  SetIdentity(*item, "Global", "Global");
  owner.AddChild(item);
  return before.empty() ? kAdded : kAddedAndRemoved;
}

}  // namespace tervane
