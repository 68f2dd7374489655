// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/river_simulation_file.h"

#include "core/kvf.h"
#include "platform/text.h"

namespace tervane {

int RewriteRiverSimulationFile(const std::string& path, std::string_view resultRoot, int useCustomFolder,
                               std::string_view customFolder, std::string& error) {
  kvfGetErrorGlb();  // what an earlier reader left
  KvfFile* old = kvfLoadFile(path, 1);
  if (kvfGetErrorGlb() != kKvfNoError) {
    error = kvfErrorText();
    kvfClose(&old);
    return -1;
  }
  KvfFile* file = kvfCreate();
  for (int n = 1; n <= kvfGetNoTargets(old); ++n) {
    KvfNode* target = kvfTargetByNum(old, n);
    const char* name = kvfGetName(target);
    if (EqualIgnoringCase(name, "SYSTEM")) continue;
    kvfAddTarget(file, target->WrittenName());
    kvfEndSection(file);
    kvfCopy(target, kvfTargetByNum(file, kvfGetNoTargets(file)));
  }
  kvfClose(&old);
  kvfSetProjectResultRoot(file, resultRoot);
  kvfSetCustomResultFolder(file, useCustomFolder, customFolder);
  kvfWrite(file, path);
  kvfClose(&file);
  if (kvfGetErrorGlb() == kKvfNoError) return 0;
  error = kvfErrorText();
  return -1;
}

}  // namespace tervane
