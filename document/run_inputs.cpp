// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/run_inputs.h"

#include <algorithm>
#include <array>
#include <filesystem>
#include <unordered_set>

#include "core/open_kvf.h"
#include "execution/execute_flags.h"
#include "execution/run_passport.h"
#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

namespace {

/// Files of these names hold names of further inputs.
constexpr std::array<std::string_view, 5> kNamesFurther{".wel", ".etv", ".uzs", ".fvsim", ".fvnwk"};
/// Sections of what maps show and no engine reads.
constexpr std::array<std::string_view, 2> kOnlyShown{"Overlays", "ViewSettings"};
/// How far what names others is followed.
constexpr int kMostSteps = 4;

class InputCollector {
 public:
  explicit InputCollector(std::string results) : results_(std::move(results)) {}

  void Add(const std::string& path) {
    if (path.empty() || std::filesystem::is_directory(NativePath(path), ignored_) ||
        (!results_.empty() && path.starts_with(results_)) || !known_.insert(path).second)
      return;
    paths_.push_back(path);
    const std::string extension = LowerCase(ExtensionOf(path));
    if (extension == ".shp") {
      const std::string stem = path.substr(0, path.size() - extension.size());
      for (const char* beside : {".shx", ".dbf", ".prj", ".cpg"})
        if (FileExists(stem + beside)) Add(stem + beside);
    }
    if (std::ranges::find(kNamesFurther, extension) != kNamesFurther.end()) AddNamesIn(path);
  }
  /// All that a section names, but for parts that take no part.
  void AddNamesIn(const KvfSection& section, const std::string& folder) {
    for (const KvfNode* node = section.firstChild; node; node = node->next)
      if (node->IsKeyword() && node->Name() == "IsDataUsedInSetup" && node->count == 1 &&
          node->params[0].type == KvfType::Int && node->params[0].asInt == 0)
        return;
    for (const KvfNode* node = section.firstChild; node; node = node->next) {
      if (!node->IsKeyword()) {
        AddNamesIn(*AsSection(node), folder);
        continue;
      }
      for (std::uint32_t i = 0; i < node->count; ++i)
        if (node->params[i].type == KvfType::Filename && !EndsInSeparator(node->params[i].Text()) &&
            !node->params[i].Text().empty())
          Add(ResolvedPath(node->params[i].Text(), folder));
    }
  }
  std::vector<std::string> Take() { return std::move(paths_); }

 private:
  void AddNamesIn(const std::string& path) {
    if (steps_ >= kMostSteps) return;
    ++steps_;
    kvfGetErrorGlb();  // what an earlier reader left
    const OpenKvf file(kvfLoadFile(path, 0));
    if (kvfGetErrorGlb() == kKvfNoError) AddNamesIn(file->top, std::string(FolderOf(path)));
    --steps_;
  }

  std::error_code ignored_;
  std::string results_;
  std::unordered_set<std::string> known_;
  std::vector<std::string> paths_;
  int steps_ = 0;
};

}  // namespace

std::vector<std::string> InputsOf(const CFlowModelDoc& document) {
  InputCollector inputs(ResolvedPath(document.getResultFolder(), {}) + "/");
  inputs.Add(AbsoluteFromHere(document.PathName()));
  const std::string& folder = document.Root().SetupFolder();
  const OpenKvf file(document.BuildFile(folder));
  const KvfSection& setup = *AsSection(FindKvfNode(file->top, false, document.Root().GetTargetName()));
  for (const KvfNode* node = setup.firstChild; node; node = node->next)
    if (!node->IsKeyword() && std::ranges::find(kOnlyShown, node->Name()) == kOnlyShown.end())
      inputs.AddNamesIn(*AsSection(node), folder);
  return inputs.Take();
}

bool MakesResults(const CFlowModelDoc& document, const std::string& argument) {
  if (!argument.empty()) return argument != "/PP";
  const auto* flags = document.Root().Important(kExecuteFlags);
  return !flags || flags->WM != 0 || flags->WQ != 0;
}

void PreparePassport(const CFlowModelDoc& document, RunRequest& request) {
  if (BaseNameOf(request.engine) != "Tvn_Simulation" || !MakesResults(document, request.options)) return;
  request.inputs = InputsOf(document);
  std::string ignored;  // A setup that cannot be written has not come here: it was just saved.
  document.BuildText(std::string(FolderOf(PassportFilesOf(request.resultFolder, request.setup).setup)),
                     request.setupText, ignored);
}

}  // namespace tervane
