// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/river_simulation_file.h"

#include <fmt/format.h>

#include "core/kvf.h"
#include "core/kvf_parser.h"
#include "libraries/kept_text.h"
#include "platform/files.h"
#include "platform/text.h"

namespace tervane {

namespace {

std::string ResultLocation(std::string_view resultRoot, int useCustomFolder, std::string_view customFolder) {
  KvfFile* file = kvfCreate();
  kvfSetProjectResultRoot(file, resultRoot);
  kvfSetCustomResultFolder(file, useCustomFolder, customFolder);
  std::string text = KvfNodeText(*file->top.firstChild, 0);
  kvfClose(&file);
  return text;
}

}  // namespace

int RewriteRiverSimulationFile(const std::string& path, std::string_view resultRoot, int useCustomFolder,
                               std::string_view customFolder, std::string& error) {
  FileContent content;
  if (FileResult read = ReadWholeFile(path, content); !read.Ok()) {
    error = std::move(read.error);
    return -1;
  }
  KvfFile old;
  if (!ParseKvf(content, old)) {
    error = fmt::format("{}:{}", path, old.syntaxError.message);
    return -1;
  }
  KeptText others(old);
  std::string location;
  for (const KvfNode* target = old.top.firstChild; target; target = target->next) {
    if (EqualIgnoringCase(target->Name(), "SYSTEM"))
      location += KvfNodeText(*target, 0);
    else
      others.Keep(*target, 0);
  }
  std::string wanted = ResultLocation(resultRoot, useCustomFolder, customFolder);
  if (location == wanted) return 0;
  others.KeepCommentsUntil(KeptText::kEndOfFile, 0);
  FileResult written = WriteFileAtomically(path, std::string(old.header) + others.Take() + wanted);
  error = std::move(written.error);
  return written.Ok() ? 0 : -1;
}

}  // namespace tervane
