// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/support/setup.h"

#include <stdexcept>

#include <fmt/format.h>

#include "core/kvf_writer.h"
#include "core/path.h"
#include "platform/paths.h"

namespace tervane::test {

std::string SetupText(int version, std::string_view sections) {
  const std::string versionSection =
      version < 0 ? "" : fmt::format("section FlowModelDocVersion {{\nVersion = {}\n}}\n", version);
  return fmt::format("target TERVANE_FLOWMODEL {{\n{}{}\n}}\n", versionSection, sections);
}

std::string SavedText(const CFlowModelDoc& document) {
  std::string text, error;
  if (!document.BuildText(std::string(FolderOf(AbsoluteFromHere(document.PathName()))), text, error))
    throw std::runtime_error(error);
  return text;
}

std::string ValueOf(const CFlowModelDoc& document, std::string_view path) {
  KvfFile* file = document.BuildFile(std::string(FolderOf(AbsoluteFromHere(document.PathName()))));
  const SetupPath place = ParseSetupPath(path);
  KvfSection* section = AsSection(FindKvfNode(file->top, false, document.Root().GetTargetName()));
  for (const PathStep& step : place.steps)
    section =
        section ? AsSection(FindKvfNode(*section, false, step.name, static_cast<std::size_t>(step.instance))) : nullptr;
  const KvfNode* key = section ? FindKvfNode(*section, true, place.key.name) : nullptr;
  std::string value = key ? PlainValuesText(*key) : std::string();
  kvfClose(&file);
  return value;
}

}  // namespace tervane::test
