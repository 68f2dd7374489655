// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "access/file_merge.h"

#include <fmt/format.h>

#include "core/kvf_writer.h"
#include "core/open_kvf.h"
#include "document/flow_model_document.h"

namespace tervane {

namespace {

/// A setup as its file stands; null with the problem where it cannot be read.
OpenKvf ReadAsItStands(const std::string& path, std::string& problem) {
  kvfGetErrorGlb();  // what an earlier reader left
  OpenKvf file(kvfLoadFile(path, 0));
  if (kvfGetErrorGlb() == kKvfNoError) return file;
  problem = fmt::format("{}: {}", path, kvfErrorText());
  return nullptr;
}

}  // namespace

FileMerge MergeSetupFiles(const std::string& base, const std::string& mine, const std::string& theirs,
                          const std::string& path, const MergeChoices& choices) {
  FileMerge merge{};
  std::string& problem = merge.result.problem;
  OpenKvf files[3];
  const std::string* const names[] = {&base, &mine, &theirs};
  for (std::size_t i = 0; i < 3; ++i)
    if (files[i] = ReadAsItStands(*names[i], problem); !files[i]) return merge;
  const OpenKvf merged(kvfCreate());
  merge.result = MergeSetups(*files[0], *files[1], *files[2], *merged, choices);
  if (!problem.empty() || !WriteKvfText(*merged, merge.text, problem)) return merge;
  CFlowModelDoc document;
  if (!document.OpenText(merge.text, path)) problem = document.Error();
  merge.comments = files[1]->comments.size() + files[2]->comments.size();
  return merge;
}

}  // namespace tervane
