// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "libraries/wells.h"

#include <string_view>

#include "core/kvf_writer.h"
#include "libraries/kept_text.h"

namespace tervane {

FileResult WriteEmptyWellFile(const std::string& path, const Envelope& area) {
  KvfFile file;
  const auto section = [&](KvfSection& parent, std::string_view name) -> KvfSection& {
    return *file.AddSection(parent, KvfKind::Section, name);
  };
  const auto target = [&](std::string_view name) -> KvfSection& {
    return *file.AddSection(file.top, KvfKind::Target, name);
  };
  const auto add = [&](KvfSection& parent, std::string_view key, int value) {
    file.BeginKeyword(parent, key);
    file.AddParam(KvfType::Int).asInt = value;
  };
  KvfSection& geometry = section(target("MAP"), "GEOMETRY");
  AddCorners(file, geometry, area);
  file.BeginKeyword(geometry, "OverlayFilename");
  file.SetText(file.AddParam(KvfType::Filename), "");
  KvfSection& shown = section(target("SOIL"), "DEFAULT_DATA");
  add(shown, "SoilTextOn", 1);
  add(shown, "MapTextOn", 1);

  KvfSection& wells = target("WEL_CFG");
  constexpr struct {
    std::string_view section, count, more = {};
  } kSections[] = {{"WELLDATA", "NoWells", "IncludeFractureWell"},
                   {"WELLFIELD", "NoWellFields"},
                   {"Foreground", "NumberOfLayers"},
                   {"Background", "NumberOfLayers"}};
  for (const auto& row : kSections) {
    KvfSection& part = section(wells, row.section);
    add(part, "Touched", 0);
    add(part, row.count, 0);
    if (!row.more.empty()) add(part, row.more, 0);
  }
  std::string text, error;
  if (!WriteKvfText(file, text, error)) return {error, {}};
  return WriteFileAtomically(path, text);
}

}  // namespace tervane
