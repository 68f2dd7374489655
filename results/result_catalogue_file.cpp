// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/result_catalogue_file.h"

#include <algorithm>

#include <fmt/format.h>

#include "platform/files.h"
#include "platform/paths.h"
#include "results/result_types.h"

namespace tervane {

namespace {

constexpr int kFirstVersion = 1001;
/// A key of ours: other programs pass over it.
constexpr std::string_view kEngineKey = "Engine";
/// The depth of overland water comes with groundwater, too, whose flow it does not follow.
constexpr int kNeverWithVectors = 61;

/// The items stand one behind the other under one name; some programs number them.
KvfNode* ItemSection(KvfNode* items, int number) {
  KvfNode* section = kvfSectionByNameNum(items, "Item", number);
  return section ? section : kvfSectionByNameNum(items, fmt::format("Item_{}", number), 1);
}

void AddItems(KvfNode* section, std::vector<StoredItem>& items) {
  int count = 0;
  kvfGetParam(section, "NrofItems", &count, 1, 1);
  for (int number = 1; number <= count; ++number) {
    KvfNode* source = ItemSection(section, number);
    if (!source) break;
    StoredItem item;
    kvfGetParam(source, "Name", &item.name, 1, 1);
    kvfGetParamFilename(source, "Filename", &item.path, 1, 1);
    kvfGetParam(source, "Itemno", &item.item, 1, 1);
    kvfGetParam(source, "DataType", &item.dataType, 1, 1);
    if (!item.path.empty()) items.push_back(std::move(item));
  }
}

/// By whom a catalogue was written, where it tells that; empty for one that cannot be read.
std::string WriterOf(const std::string& path) {
  std::string engine;
  KvfFile* file = kvfLoadFile(path, 0);
  if (kvfGetErrorGlb() == kKvfNoError)
    kvfGetParam(kvfSectionByNameNum(kvfTargetByNameNum(file, "TVDRES", 1), "general", 1), kEngineKey, &engine, 1, 1);
  kvfClose(&file);
  return engine;
}

void MarkVectors(StoredItems& stored) {
  const bool hasFlow = stored.FirstOf(StoredItems::kFlowInX) && stored.FirstOf(StoredItems::kFlowInY);
  for (StoredItem& item : stored.items)
    item.mayHaveVectors = hasFlow && item.dataType != kNeverWithVectors &&
                          ResultCatalogue::Own().DataTypeRequires(item.dataType, feature::kSaturated).value;
}

std::string WhyNotOfVersion(int version, const std::string& path) {
  if (version >= kFirstVersion) return {};
  if (version > 0)
    return fmt::format(
        "The current catalogue file is from a simulation with Tervane version 2002:\n{}\n\nAutogeneration of result "
        "viewer files requires Tervane version 2003 or newer.",
        path);
  return fmt::format(
      "Error when reading version info from catalogue file:\n{}\n\nAutogeneration of result viewer files failed.",
      path);
}

}  // namespace

const StoredItem* StoredItems::FirstOf(int dataType) const {
  const auto found = std::find_if(items.begin(), items.end(),
                                  [dataType](const StoredItem& item) { return item.dataType == dataType; });
  return found == items.end() ? nullptr : &*found;
}

std::string ReadStoredItems(const std::string& path, bool clears, StoredItems& stored) {
  if (clears) stored.items.clear();
  if (path.empty() || !FileExists(path)) return {};
  kvfGetErrorGlb();  // what an earlier reader left
  KvfFile* file = kvfLoadFile(path, 0);
  if (const int error = kvfGetErrorGlb(); error != kKvfNoError) {
    kvfClose(&file);
    return error == kKvfSyntaxError
               ? fmt::format("{}\n\nSyntax error in file name catalogue file:\n{}", kvfErrorText(), path)
               : kvfErrorText();
  }
  KvfNode* target = kvfTargetByNameNum(file, "TVDRES", 1);
  int version = 0;
  kvfGetParam(kvfSectionByNameNum(kvfSectionByNameNum(target, "general", 1), "version", 1), "VersionNumber", &version,
              1, 1);
  std::string problem = WhyNotOfVersion(version, path);
  if (problem.empty()) {
    AddItems(kvfSectionByNameNum(target, "Items", 1), stored.items);
    KvfNode* area = kvfSectionByNameNum(target, "DATA_AREA", 1);
    stored.area = StoredItems().area;
    kvfGetParam(area, "x0", &stored.area.x0, 1, 1);
    kvfGetParam(area, "y0", &stored.area.y0, 1, 1);
    kvfGetParam(area, "x1", &stored.area.x1, 1, 1);
    kvfGetParam(area, "y1", &stored.area.y1, 1, 1);
    kvfGetParam(area, "MapProj", &stored.projection, 1, 1);
    MarkVectors(stored);
  }
  kvfClose(&file);
  return problem;
}

std::string WriteStoredItems(const std::string& path, const StoredItems& stored, const std::string& engine) {
  if (FileExists(path) && WriterOf(path) != engine)
    return fmt::format("{} is the catalogue of another engine, and stays as it is", path);
  const std::string folder(FolderOf(path));
  KvfFile* file = kvfCreate();
  kvfAddTarget(file, "TVDRES");
  kvfAddSection(file, "general");
  kvfPutParam(file, kEngineKey, engine);
  kvfAddSection(file, "version");
  kvfPutParam(file, "VersionNumber", kFirstVersion);
  kvfEndSection(file);
  kvfEndSection(file);
  kvfAddSection(file, "Items");
  kvfPutParam(file, "NrofItems", static_cast<int>(stored.items.size()));
  for (const StoredItem& item : stored.items) {
    kvfAddSection(file, "Item");
    kvfPutParam(file, "Name", item.name);
    kvfPutParamFilename(file, "Filename", RelativePath(item.path, folder));
    kvfPutParam(file, "Itemno", item.item);
    kvfPutParam(file, "DataType", item.dataType);
    kvfEndSection(file);
  }
  kvfEndSection(file);
  kvfAddSection(file, "DATA_AREA");
  kvfPutParam(file, "x0", stored.area.x0);
  kvfPutParam(file, "y0", stored.area.y0);
  kvfPutParam(file, "x1", stored.area.x1);
  kvfPutParam(file, "y1", stored.area.y1);
  kvfPutParam(file, "MapProj", stored.projection);
  kvfEndSection(file);
  kvfEndSection(file);
  kvfGetErrorGlb();  // what an earlier writer left
  kvfWrite(file, path);
  kvfClose(&file);
  return kvfGetErrorGlb() == kKvfNoError ? std::string() : kvfErrorText();
}

StoredItems ReadCatalogues(const CModelCompKvf& components, const CatalogueFiles& files,
                           std::vector<CatalogueProblem>& problems) {
  StoredItems stored;
  const auto read = [&](const std::string& path, bool clears) {
    if (std::string text = ReadStoredItems(path, clears, stored); !text.empty())
      problems.push_back({path, std::move(text)});
  };
  const bool usesAnother = components.WQ && !components.UseCurrentWmSimulation;
  read(usesAnother ? components.FilenameTvdRes.Absolute() : files.simulation, true);
  if (components.WQ) read(files.waterQuality, false);
  return stored;
}

}  // namespace tervane
