// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/document.h"

#include <fmt/format.h>

#include "core/doc_version.h"
#include "core/kvf_parser.h"
#include "core/kvf_writer.h"
#include "platform/files.h"
#include "platform/paths.h"

namespace tervane {

namespace {

/// Closes a file at the end of a scope.
struct OpenFile {
  KvfFile* file;
  ~OpenFile() { kvfClose(&file); }
};

}  // namespace

CYbSEDocument::CYbSEDocument(std::unique_ptr<CYbSEKvfGlobalBase> root) : root_(std::move(root)) {}

bool CYbSEDocument::OnOpenDocument(const std::string& path) {
  kvfGetErrorGlb();  // what an earlier reader left
  KvfFile* file = kvfLoadFile(path, 0);
  if (kvfGetErrorGlb() != kKvfNoError) {
    error_ = kvfErrorText();
    kvfClose(&file);
    return false;
  }
  return LoadTree(file, path);
}

bool CYbSEDocument::OpenText(std::string_view text, const std::string& path) {
  KvfFile* file = kvfCreate();
  file->path = path;
  if (!path.empty()) file->folder = FolderOf(AbsoluteFromHere(path));
  if (!ParseKvf(FileContent::Of(text), *file)) {
    error_ = fmt::format("{}:{}", path, file->syntaxError.message);
    kvfClose(&file);
    return false;
  }
  return LoadTree(file, path);
}

bool CYbSEDocument::LoadTree(KvfFile* file, const std::string& path) {
  const OpenFile closer{file};
  if (!kvfTargetByNameNum(file, root_->GetTargetName(), 1)) {
    const KvfNode* first = file->top.firstChild;
    error_ = fmt::format("{}:{}:1: target {} was expected: target {} is no setup", path, static_cast<int>(first->line),
                         root_->GetTargetName(), first->Name());
    return false;
  }
  path_ = path;
  header_ = file->header;
  root_->SetSetupFolder(file->folder);
  root_->Load(&file->top);

  int useCustom = 0;
  std::string folder;
  if (const char* resultRoot = kvfGetProjectResultRoot(file)) projectResultRoot_ = FileName(resultRoot, file->folder);
  kvfGetCustomResultFolder(file, &useCustom, &folder);
  UseCustomResultFolder = useCustom != 0;
  CustomResultFolder = FileName(folder, file->folder);

  for (KvfPlacedNote& note : CollectNotes(*file))
    report_.entries.push_back(
        {LoadReport::Kind::Note, note.line, std::move(note.path), std::move(note.key), std::move(note.text)});
  report_.unread = CollectUnread(*file);
  original_.path = path;
  original_.version = root_->ReadDocVersion();
  original_.mustBeKept = !report_.IsEmpty() || original_.version != CFlowModelDocVersionKvf::kWrittenVersion;
  OnLoaded();
  modified_ = false;
  return true;
}

KvfFile* CYbSEDocument::BuildFile(const std::string& folder) const {
  KvfFile* file = kvfCreate();
  file->folder = folder;
  root_->Save(file);
  if (!projectResultRoot_.IsEmpty()) kvfSetProjectResultRoot(file, projectResultRoot_.TextIn(folder));
  if (UseCustomResultFolder || !CustomResultFolder.IsEmpty())
    kvfSetCustomResultFolder(file, UseCustomResultFolder, CustomResultFolder.TextIn(folder));
  return file;
}

bool CYbSEDocument::BuildText(const std::string& folder, std::string& text, std::string& error) const {
  const OpenFile built{BuildFile(folder)};
  built.file->header = header_;
  return WriteKvfText(*built.file, text, error);
}

bool CYbSEDocument::IsOriginal(const std::string& path) const {
  return FileExists(path) && (path == original_.path || IsSameFile(path, original_.path));
}

bool CYbSEDocument::KeepOriginal() {
  const std::string& path = original_.path;
  const int version = original_.version;
  const std::string folder(FolderOf(path));
  const std::string stem = fmt::format("{}{}{}.v{}", folder, folder.empty() || EndsInSeparator(folder) ? "" : "/",
                                       BaseNameOf(path), version < 0 ? "none" : std::to_string(version));
  std::string copy = fmt::format("{}{}", stem, ExtensionOf(path));
  for (int number = 2; FileExists(copy); ++number) copy = fmt::format("{}.{}{}", stem, number, ExtensionOf(path));
  if (const FileResult result = CopyToNewFile(path, copy); !result.Ok()) {
    error_ = fmt::format("the original could not be kept, so nothing was saved: {}", result.error);
    return false;
  }
  saveNotes_.push_back(fmt::format("the file as it was is kept as {}", copy));
  return true;
}

bool CYbSEDocument::OnSaveDocument(const std::string& path) {
  saveNotes_.clear();
  std::string text, reason;
  if (!BuildText(std::string(FolderOf(AbsoluteFromHere(path))), text, reason)) {
    error_ = fmt::format("cannot write {}: {}", path, reason);
    return false;
  }
  const bool overwritesOriginal = original_.mustBeKept && IsOriginal(path);
  if (overwritesOriginal && !KeepOriginal()) return false;
  const FileResult result = WriteFileAtomically(path, text);
  if (!result.Ok()) {
    error_ = result.error;
    return false;
  }
  if (!result.note.empty()) saveNotes_.push_back(result.note);
  // Also where it was gone: what stands in its place now is this document's.
  if (overwritesOriginal || path == original_.path) original_.mustBeKept = false;
  path_ = path;
  root_->SetSetupFolder(std::string(FolderOf(AbsoluteFromHere(path))));
  modified_ = false;
  return true;
}

void CYbSEDocument::RunEnginePrg2(int showsProgress, const char* /*text*/, int, int, int, int) {
  if (engineShell_) engineShell_->Start(launch_, showsProgress != 0);
}

std::string CYbSEDocument::getResultFolder() const {
  if (UseCustomResultFolder && !CustomResultFolder.IsEmpty()) return CustomResultFolder.Absolute();
  const std::string setupFolder(FolderOf(AbsoluteFromHere(path_)));
  return ResolvedPath(fmt::format("{}_results", BaseNameOf(path_)),
                      projectResultRoot_.IsEmpty() ? setupFolder : projectResultRoot_.Absolute());
}

}  // namespace tervane
