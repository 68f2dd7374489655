// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/recovery.h"

#include <algorithm>
#include <filesystem>

#include <fmt/format.h>

#include "document/flow_model_document.h"
#include "document/setup_lock.h"
#include "platform/os.h"
#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

namespace {

namespace fs = std::filesystem;

constexpr std::string_view kFirstLine = "# Unsaved changes, kept by the Flow Model editor; what follows is the setup\n";
constexpr std::string_view kLastLine = "\n# ----\n";
const std::string kComment = "# ";
constexpr std::string_view kExtension = ".tvd~";

/// The setup on disk as a save without changes would write it; empty when it cannot be read. Without a path that of a
/// new setup.
std::string TextWithoutChanges(const std::string& setup) {
  CFlowModelDoc document;
  std::string text, error;
  if (setup.empty() || document.OnOpenDocument(setup)) document.BuildText(document.Root().SetupFolder(), text, error);
  return text;
}

/// True when the autosave holds what the file does not.
bool HoldsChanges(const AutosaveContent& content, const std::string& setup) {
  FileContent onDisk;
  if (!setup.empty() && ReadWholeFile(setup, onDisk).Ok() && onDisk.Text() == content.text) return false;
  return content.text != TextWithoutChanges(setup);
}

std::chrono::system_clock::time_point TimeOf(const std::string& path) {
  const auto age = fs::file_time_type::clock::now() - StampOf(path).time;
  return std::chrono::system_clock::now() - std::chrono::duration_cast<std::chrono::system_clock::duration>(age);
}

/// The autosaves in a folder that hold changes and whose editors run no more.
template <class Wanted>
void CollectFrom(const std::string& folder, Wanted isWanted, std::vector<Recovery>& found) {
  std::error_code error;
  for (fs::directory_iterator it(NativePath(folder), error), end; !error && it != end; it.increment(error)) {
    const std::string path = TextOfPath(it->path());
    AutosaveContent content;
    std::string ignored;
    if (!path.ends_with(kExtension) || !ReadAutosave(path, content, ignored)) continue;
    if (isWanted(content) && !content.process.MayRun() && HoldsChanges(content, content.setup))
      found.push_back({path, content.setup, TimeOf(path)});
  }
}

void SortNewestFirst(std::vector<Recovery>& recoveries) {
  std::sort(recoveries.begin(), recoveries.end(), [](const Recovery& a, const Recovery& b) { return a.time > b.time; });
}

}  // namespace

bool ReadAutosave(const std::string& path, AutosaveContent& content, std::string& error) {
  FileContent file;
  if (const FileResult result = ReadWholeFile(path, file); !result.Ok()) {
    error = result.error;
    return false;
  }
  const std::string_view text = file.Text();
  const std::size_t end = text.find(kLastLine);
  if (!text.starts_with(kFirstLine) || end == std::string_view::npos) {
    error = fmt::format("{} holds no changes that this editor kept", path);
    return false;
  }
  const std::string_view lines = text.substr(kFirstLine.size(), end + 1 - kFirstLine.size());
  const std::optional<RunningProcess> process = ProcessOfLines(lines, kComment);
  if (!process) {
    error = fmt::format("{} does not tell who wrote it", path);
    return false;
  }
  content = {NamedValue(lines, kComment + "setup").value_or(""), NamedValue(lines, kComment + "based on").value_or(""),
             *process, std::string(text.substr(end + kLastLine.size()))};
  return true;
}

FileResult WriteAutosave(const std::string& path, const AutosaveContent& content) {
  std::string text =
      fmt::format("{}{}{}{}", kFirstLine, NamedLine(kComment + "setup", content.setup),
                  NamedLine(kComment + "based on", content.basedOn), ProcessLines(content.process, kComment));
  text.pop_back();
  text += kLastLine;
  text += content.text;

  // The setup may be one that others must not read: an atomic write keeps the access rights of what stands there.
  std::error_code error, ignored;
  const bool isNew = os::File::CreateNew(path, os::File::Access::OwnerOnly, error).IsOpen();
  FileResult result = WriteOwnFileAtomically(path, text);
  if (isNew && !result.Ok()) fs::remove(NativePath(path), ignored);
  return result;
}

std::string AutosaveBeside(const std::string& setup) { return RealPath(setup) + "~"; }

std::string NewAutosaveName(const std::string& setup, const std::string& recoveryFolder) {
  std::string name = "untitled";
  if (!setup.empty()) {
    const std::string real = RealPath(setup);
    // A long name would not fit with what comes behind it.
    std::string_view base = BaseNameOf(real);
    if (base.size() > 100) base = "setup";
    name = fmt::format("{}-{:016x}", base, HashOf(real));
  }
  const std::string stem = fmt::format("{}/{}-{}", recoveryFolder, name, os::ProcessId());
  std::string path = fmt::format("{}{}", stem, kExtension);
  for (int number = 2; FileExists(path); ++number) path = fmt::format("{}-{}{}", stem, number, kExtension);
  return path;
}

bool MayReplaceAutosave(const std::string& path, const std::string& setup) {
  if (!WhyNoOwnFile(path).empty()) return false;
  if (!FileExists(path)) return true;
  FileContent file;
  // A crash between making it and filling it.
  if (ReadWholeFile(path, file).Ok() && file.size == 0) return true;
  AutosaveContent content;
  std::string ignored;
  return ReadAutosave(path, content, ignored) && !content.process.MayRun() && !HoldsChanges(content, setup);
}

std::optional<Recovery> FindRecovery(const std::string& setup, const std::string& recoveryFolder) {
  std::vector<Recovery> found;
  const std::string real = RealPath(setup);
  CollectFrom(
      recoveryFolder,
      [&](const AutosaveContent& content) { return !content.setup.empty() && RealPath(content.setup) == real; }, found);
  const std::string beside = AutosaveBeside(setup);
  AutosaveContent content;
  std::string ignored;
  if (ReadAutosave(beside, content, ignored)) {
    // Only the holder of the setup's lock keeps an autosave there, so the lock shows whether an editor on another host
    // is at work. The folder may have been renamed: an autosave beside a setup belongs to that setup.
    const bool mayBeInUse = content.process.IsOnThisHost() ? content.process.MayRun() : HolderOf(setup).has_value();
    if (!mayBeInUse && HoldsChanges(content, setup))
      found.push_back({beside, TextOfPath(fs::absolute(NativePath(setup))), TimeOf(beside)});
  }
  if (found.empty()) return std::nullopt;
  SortNewestFirst(found);
  return std::move(found.front());
}

std::vector<Recovery> FindRecoveries(const std::string& recoveryFolder) {
  std::vector<Recovery> found;
  CollectFrom(
      recoveryFolder, [](const AutosaveContent&) { return true; }, found);
  SortNewestFirst(found);
  return found;
}

bool DiscardRecovery(const Recovery& recovery, std::string& error) {
  std::error_code failure;
  fs::remove(NativePath(recovery.autosave), failure);
  if (failure) error = fmt::format("cannot remove {}: {}", recovery.autosave, failure.message());
  return !failure;
}

}  // namespace tervane
