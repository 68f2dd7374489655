// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/files.h"

#include <algorithm>
#include <atomic>
#include <charconv>
#include <chrono>
#include <filesystem>
#include <new>
#include <system_error>
#include <utility>

#include <fmt/format.h>

#include "platform/os.h"
#include "platform/paths.h"

namespace tervane {
namespace {

namespace fs = std::filesystem;

/// Why an operation failed, for the person who must act; empty means done.
using Reason = std::string;

Reason InWords(const std::error_code& error) {
  struct Words {
    std::errc code;
    const char* text;
  };
  static constexpr Words kWords[] = {
      {std::errc::no_space_on_device, "no space left on the device; free some or choose another place"},
      {std::errc::file_too_large, "the file would be larger than this system's limit on the size of files"},
      {std::errc::io_error, "the device reports an input or output error; choose another place and check the disk"},
      {std::errc::permission_denied, "permission denied"},
      {std::errc::operation_not_permitted, "permission denied"},
      {std::errc::read_only_file_system, "the file system is read-only; choose another place"},
      {std::errc::no_such_file_or_directory, "it does not exist"},
      {std::errc::not_a_directory, "a part of the path is a file, not a folder"},
      {std::errc::too_many_symbolic_link_levels, "its symbolic links lead in a circle"},
      {std::errc::filename_too_long, "the name is too long"},
      {std::errc::file_exists, "something with this name exists already; choose another name"},
      {std::errc::is_a_directory, "it is a folder, not a file"},
      {std::errc::too_many_files_open, "too many files are open"},
  };
  for (const Words& words : kWords) {
    if (error == words.code) return words.text;
  }
  return error.message();
}

/// Why something that is no regular file cannot be read or replaced as a whole.
Reason WhyNotRegular(bool isFolder) { return isFolder ? "it is a folder, not a file" : "it is not a regular file"; }

/// The system would take a path only up to a zero byte, and so another file than the one that was named.
Reason WhyNoPath(std::string_view path) {
  if (path.empty()) return "the name is empty";
  if (path.find('\0') != std::string_view::npos) return "the name contains a zero character";
  return {};
}

/// Follows symbolic links from the last name of `path` to where a file stands or can be created. Links among the
/// folders before it need no care: the system follows them.
std::error_code FollowLinks(fs::path& path) {
  // The system's own limit; a circle never ends.
  constexpr int kMostLinks = 40;
  for (int i = 0; i <= kMostLinks; ++i) {
    std::error_code error;
    const fs::file_type type = fs::symlink_status(path, error).type();
    if (type == fs::file_type::not_found) return {};
    if (type != fs::file_type::symlink) return error;
    const fs::path link = fs::read_symlink(path, error);
    if (error) return error;
    path = path.parent_path() / link;
  }
  return std::make_error_code(std::errc::too_many_symbolic_link_levels);
}

/// The folder of a file of the host, "." for a bare name.
fs::path HostFolderOf(const fs::path& path) {
  const fs::path folder = path.parent_path();
  return folder.empty() ? fs::path(".") : folder;
}

// Temporary files are named ".NAME.HOST-PROCESS-NUMBER.tmp": hidden, beside the target, and telling whose they are, so
// that what a killed process left behind can be removed without touching a file that another one is writing.

/// The part before HOST. Long names are cut, since the whole must fit into 255 bytes.
std::string TemporaryPrefix(const fs::path& target) {
  std::string name = TextOfPath(target.filename());
  if (name.size() > 180) {
    std::size_t end = 180;
    while (end > 0 && (static_cast<unsigned char>(name[end]) & 0xC0u) == 0x80u) --end;
    name.resize(end);
  }
  return "." + name + ".";
}

/// The host's name as eight hexadecimal digits (FNV-1a): folders may be shared between machines.
const std::string& HostMark() {
  static const std::string mark = [] {
    std::uint32_t hash = 2166136261u;
    for (const char c : os::HostName()) hash = (hash ^ static_cast<unsigned char>(c)) * 16777619u;
    return fmt::format("{:08x}", hash);
  }();
  return mark;
}

constexpr std::string_view kTemporaryEnd = ".tmp";

std::string NewTemporaryName(const fs::path& target) {
  static std::atomic<unsigned> counter{0};
  // The clock keeps names apart from those of an earlier process with the same number.
  const auto ticks = static_cast<std::uint64_t>(std::chrono::system_clock::now().time_since_epoch().count());
  return fmt::format("{}{}-{}-{:x}{:x}{}", TemporaryPrefix(target), HostMark(), os::ProcessId(), ticks, ++counter,
                     kTemporaryEnd);
}

/// The process that the name of a temporary file of this machine tells, or nothing when it is no such name.
std::optional<std::uint32_t> ProcessOfTemporary(std::string_view name, std::string_view prefix) {
  if (!name.starts_with(prefix) || !name.ends_with(kTemporaryEnd)) return std::nullopt;
  name.remove_prefix(prefix.size());
  if (!name.starts_with(HostMark()) || name.size() <= HostMark().size() || name[HostMark().size()] != '-') {
    return std::nullopt;
  }
  name.remove_prefix(HostMark().size() + 1);
  std::uint32_t process = 0;
  const std::from_chars_result read = std::from_chars(name.data(), name.data() + name.size(), process);
  const bool isWhole = read.ec == std::errc() && *read.ptr == '-';
  return isWhole ? std::optional(process) : std::nullopt;
}

/// Removes what killed processes left of earlier writes of the same target. What cannot be removed does no harm.
void RemoveStaleTemporaries(const fs::path& target) {
  const std::string prefix = TemporaryPrefix(target);
  std::error_code error;
  for (fs::directory_iterator it(HostFolderOf(target), error), end; !error && it != end; it.increment(error)) {
    const std::optional<std::uint32_t> process = ProcessOfTemporary(TextOfPath(it->path().filename()), prefix);
    if (!process || os::IsProcessAlive(*process)) continue;
    std::error_code ignored;
    fs::remove(it->path(), ignored);
  }
}

/// A file beside the target that vanishes unless it was renamed.
class TemporaryFile {
 public:
  TemporaryFile() = default;
  TemporaryFile(const TemporaryFile&) = delete;
  TemporaryFile& operator=(const TemporaryFile&) = delete;
  ~TemporaryFile() {
    if (path_.empty()) return;
    file = os::File();  // an open file cannot be removed everywhere
    std::error_code ignored;
    fs::remove(NativePath(path_), ignored);
  }

  void Create(const fs::path& target, os::File::Access access, std::error_code& error) {
    const fs::path folder = target.parent_path();
    do {
      path_ = TextOfPath(folder / NativePath(NewTemporaryName(target)));
      file = os::File::CreateNew(path_, access, error);
    } while (error == std::errc::file_exists);
    if (error) path_.clear();
  }

  const std::string& Path() const { return path_; }
  void WasRenamed() { path_.clear(); }

  os::File file;

 private:
  std::string path_;
};

/// Writes, compares the size, flushes and closes.
Reason WriteAndClose(os::File& file, std::string_view content) {
  std::error_code error;
  file.WriteAll(content, error);
  if (error) return InWords(error);
  const os::File::Status status = file.GetStatus(error);
  if (error) return InWords(error);
  if (status.size != content.size()) {
    return fmt::format("only {} of {} bytes were stored; choose another place", status.size, content.size());
  }
  file.Flush(error);
  if (!error) file.Close(error);
  return error ? InWords(error) : Reason();
}

using Rename = void (*)(const std::string& from, const std::string& to, std::error_code& error);

void AddNote(std::string& note, std::string_view text) {
  if (!note.empty()) note += "; ";
  note += text;
}

/// Makes a file beside `target`, with the attributes of `model` where that is open.
Reason CreateBeside(const fs::path& target, const os::File& model, TemporaryFile& temporary, std::string& note) {
  RemoveStaleTemporaries(target);
  std::error_code error;
  // A private file must not be readable by others for a moment.
  temporary.Create(target, model.IsOpen() ? os::File::Access::OwnerOnly : os::File::Access::AsMaskAllows, error);
  const std::string folder = TextOfPath(HostFolderOf(target));
  if (error == std::errc::permission_denied || error == std::errc::operation_not_permitted) {
    return fmt::format("no permission to create files in the folder {}", folder);
  }
  if (error == std::errc::no_such_file_or_directory) return fmt::format("the folder {} does not exist", folder);
  if (error) return InWords(error);

  std::string notKept;
  if (model.IsOpen()) temporary.file.TakeAttributesOf(model, notKept, error);
  if (error) return InWords(error);
  if (!notKept.empty()) AddNote(note, "not kept of the old file: " + notKept);
  return {};
}

/// Puts the closed temporary file in the target's place.
Reason PutInPlace(TemporaryFile& temporary, const fs::path& target, Rename rename, std::string& note) {
  std::error_code error;
  rename(temporary.Path(), TextOfPath(target), error);
  if (error) return InWords(error);
  temporary.WasRenamed();
  os::FlushFolder(TextOfPath(HostFolderOf(target)), error);
  // Too late for an error: the new file stands.
  if (error) AddNote(note, "the file is written, but its folder could not be flushed: " + InWords(error));
  return {};
}

/// Makes the content a file at `target` in one step, with the attributes of `model` where that is open.
Reason Publish(const fs::path& target, std::string_view content, os::File model, Rename rename, std::string& note) {
  TemporaryFile temporary;
  if (Reason reason = CreateBeside(target, model, temporary, note); !reason.empty()) return reason;
  model = os::File();  // an open file cannot be replaced everywhere
  if (Reason reason = WriteAndClose(temporary.file, content); !reason.empty()) return reason;
  return PutInPlace(temporary, target, rename, note);
}

/// Opens an existing file to be read whole, or to be replaced.
Reason OpenRegular(const std::string& path, os::File& file, os::File::Status& status) {
  // Asked before, since a mere opening disturbs processes that wait at a FIFO or a device, and after, since only that
  // is sure.
  std::error_code error;
  const fs::file_status before = fs::status(NativePath(path), error);
  if (fs::exists(before) && !fs::is_regular_file(before)) return WhyNotRegular(fs::is_directory(before));
  file = os::File::OpenForReading(path, error);
  if (!error) status = file.GetStatus(error);
  if (error) return InWords(error);
  return status.isRegular ? Reason() : WhyNotRegular(status.isFolder);
}

enum class ReadOutcome { Done, Failed, Shrunk, Grown };

ReadOutcome ReadOnce(const std::string& path, FileContent& content, ProgressPart progress, Reason& reason) {
  // A few milliseconds, if the file is at hand.
  constexpr std::size_t kPiece = std::size_t{1} << 24;
  os::File file;
  os::File::Status status;
  reason = OpenRegular(path, file, status);
  if (!reason.empty()) return ReadOutcome::Failed;
  const auto size = static_cast<std::size_t>(status.size);
  content = {};
  content.data = std::make_unique_for_overwrite<char[]>(size + FileContent::kNulsBehind);
  os::PreferLargePages(content.data.get(), size);
  std::error_code error;
  while (content.size < size) {
    const std::size_t done = file.Read(content.data.get() + content.size, std::min(size - content.size, kPiece), error);
    if (error || progress.IsCancelled()) {
      reason = error ? InWords(error) : kCancelled;
      return ReadOutcome::Failed;
    }
    if (done == 0) return ReadOutcome::Shrunk;
    content.size += done;
    progress.Report(static_cast<double>(content.size) / static_cast<double>(size));
  }
  std::fill_n(content.data.get() + size, FileContent::kNulsBehind, '\0');
  char more;
  return file.Read(&more, 1, error) == 0 ? ReadOutcome::Done : ReadOutcome::Grown;
}

Reason ReadRegular(const std::string& path, FileContent& content, ProgressPart progress) {
  if (Reason reason = WhyNoPath(path); !reason.empty()) return reason;
  constexpr int kAttempts = 3;
  Reason reason;
  ReadOutcome outcome = ReadOutcome::Failed;
  // Another program may be writing: begin again with the new size. A log that grows all the time is taken as it stood
  // when it was opened.
  for (int i = 0; i < kAttempts; ++i) {
    outcome = ReadOnce(path, content, progress, reason);
    if (outcome == ReadOutcome::Done || outcome == ReadOutcome::Failed) return reason;
  }
  return outcome == ReadOutcome::Grown ? Reason() : "another program is changing it; try again";
}

/// Finds out what stands at the target of a write. `old` stays closed when nothing does.
Reason OpenOldFile(const fs::path& target, os::File& old, os::File::Status& status) {
  std::error_code error;
  if (fs::symlink_status(target, error).type() == fs::file_type::not_found) {
    if (!target.has_filename()) return "the name of the file is missing";
    return {};
  }
  const std::string path = TextOfPath(target);
  if (Reason reason = OpenRegular(path, old, status); !reason.empty()) return reason;
  if (!os::MayWrite(path, error)) {
    return error == std::errc::read_only_file_system ? InWords(error)
                                                     : "it is write-protected; allow writing or choose another name";
  }
  return {};
}

}  // namespace

FileContent FileContent::Of(std::string_view text) {
  FileContent content;
  content.data = std::make_unique_for_overwrite<char[]>(text.size() + kNulsBehind);
  content.size = text.size();
  std::fill_n(std::copy(text.begin(), text.end(), content.data.get()), kNulsBehind, '\0');
  return content;
}

FileResult ReadWholeFile(const std::string& path, FileContent& content, ProgressPart progress) {
  FileResult result;
  try {
    const Reason reason = ReadRegular(path, content, progress);
    if (!reason.empty()) result.error = fmt::format("cannot read {}: {}", path, reason);
  } catch (const std::bad_alloc&) {
    result.error = fmt::format("cannot read {}: it is larger than the free memory", path);
  }
  if (!result.Ok()) content = {};
  return result;
}

namespace {

/// The file that a write is to replace, found and allowed, or why it may not be.
struct WriteTarget {
  fs::path path;
  os::File old;
  os::File::Status status;
  Reason reason;

  explicit WriteTarget(const std::string& name) : path(NativePath(name)), reason(WhyNoPath(name)) {
    if (reason.empty()) {
      if (const std::error_code error = FollowLinks(path)) reason = InWords(error);
    }
    if (reason.empty()) reason = OpenOldFile(path, old, status);
  }
};

FileResult OutcomeOfWrite(const std::string& path, const Reason& reason, const os::File::Status& old,
                          std::string note) {
  FileResult result;
  if (!reason.empty()) {
    result.error = fmt::format("cannot write {}: {}; {}", path, reason,
                               old.isRegular ? "the file is unchanged" : "nothing was written");
    return result;
  }
  result.note = std::move(note);
  if (old.links > 1) AddNote(result.note, "hard link: the other names of the file keep the old content");
  return result;
}

}  // namespace

FileResult WriteFileAtomically(const std::string& path, std::string_view content) {
  WriteTarget target(path);
  std::string note;
  if (target.reason.empty()) {
    target.reason = Publish(target.path, content, std::move(target.old), os::RenameOver, note);
  }
  return OutcomeOfWrite(path, target.reason, target.status, note);
}

void CreateWholeFile(const std::string& path, std::string_view content, std::error_code& error) {
  const fs::path target = NativePath(path);
  const auto fill = [&](os::File& file) {
    if (!error) file.WriteAll(content, error);
    if (!error) file.Flush(error);
    if (!error) file.Close(error);
  };
  RemoveStaleTemporaries(target);
  TemporaryFile temporary;
  temporary.Create(target, os::File::Access::AsMaskAllows, error);
  fill(temporary.file);
  if (error) return;
  os::RenameToNew(temporary.Path(), path, error);
  if (!error) return temporary.WasRenamed();
  if (error == std::errc::file_exists) return;
  // Some shared folders know no renaming that spares what stands there.
  os::File file = os::File::CreateNew(path, os::File::Access::AsMaskAllows, error);
  if (error) return;
  fill(file);
  std::error_code ignored;
  if (error) fs::remove(target, ignored);
}

std::string WhyNoOwnFile(const std::string& path) {
  std::error_code error;
  const fs::file_status status = fs::symlink_status(NativePath(path), error);
  if (!fs::exists(status) || fs::is_regular_file(status)) return {};
  return fs::is_symlink(status) ? "it is a symbolic link" : WhyNotRegular(fs::is_directory(status));
}

FileResult WriteOwnFileAtomically(const std::string& path, std::string_view content) {
  Reason reason = WhyNoPath(path);
  if (reason.empty()) reason = WhyNoOwnFile(path);
  os::File old;
  os::File::Status status;
  std::string note;
  if (reason.empty()) reason = OpenOldFile(NativePath(path), old, status);
  // The rename replaces a link that came into being meanwhile, and not what it leads to.
  if (reason.empty()) reason = Publish(NativePath(path), content, std::move(old), os::RenameOver, note);
  return OutcomeOfWrite(path, reason, status, note);
}

struct FileReplacement::State {
  std::string name;
  fs::path target;
  os::File::Status old;
  TemporaryFile temporary;
  std::string note;
};

FileReplacement::FileReplacement() = default;
FileReplacement::FileReplacement(FileReplacement&& other) noexcept = default;
FileReplacement& FileReplacement::operator=(FileReplacement&& other) noexcept = default;
FileReplacement::~FileReplacement() = default;

FileResult FileReplacement::Begin(const std::string& path) {
  WriteTarget target(path);
  auto state = std::make_unique<State>();
  state->name = path;
  state->target = target.path;
  state->old = target.status;
  if (target.reason.empty()) {
    target.reason = CreateBeside(target.path, target.old, state->temporary, state->note);
  }
  if (target.reason.empty()) state_ = std::move(state);
  return OutcomeOfWrite(path, target.reason, target.status, {});
}

const std::string& FileReplacement::TemporaryPath() const { return state_->temporary.Path(); }

FileResult FileReplacement::Commit() {
  const std::unique_ptr<State> state = std::move(state_);
  std::error_code error;
  state->temporary.file.Flush(error);
  if (!error) state->temporary.file.Close(error);
  const Reason reason =
      error ? InWords(error) : PutInPlace(state->temporary, state->target, os::RenameOver, state->note);
  return OutcomeOfWrite(state->name, reason, state->old, state->note);
}

std::string WhyNotReadable(const std::string& path) {
  os::File file;
  os::File::Status status;
  Reason reason = WhyNoPath(path);
  if (reason.empty()) reason = OpenRegular(path, file, status);
  return reason.empty() ? reason : fmt::format("cannot read {}: {}", path, reason);
}

FileResult CopyToNewFile(const std::string& from, const std::string& to) {
  FileContent content;
  FileResult result = ReadWholeFile(from, content);
  if (!result.Ok()) return result;
  os::File model;
  os::File::Status status;
  Reason reason = WhyNoPath(to);
  // Asked before as well as by the rename, so that no large file is written in vain.
  if (reason.empty() && FileExists(to)) reason = InWords(std::make_error_code(std::errc::file_exists));
  if (reason.empty()) reason = OpenRegular(from, model, status);
  if (reason.empty()) reason = Publish(NativePath(to), content.Text(), std::move(model), os::RenameToNew, result.note);
  if (!reason.empty()) result.error = fmt::format("cannot copy {} to {}: {}", from, to, reason);
  return result;
}

std::string RealPath(const std::string& path) {
  std::error_code error;
  const fs::path absolute = fs::absolute(NativePath(path), error);
  fs::path target = absolute;
  if (error || FollowLinks(target)) return TextOfPath(absolute);
  const fs::path folder = fs::canonical(HostFolderOf(target), error);
  return TextOfPath(error ? target : folder / target.filename());
}

FileStamp StampOf(const std::string& path) {
  FileStamp stamp;
  std::error_code error;
  const fs::path native = NativePath(path);
  stamp.exists = fs::exists(native, error);
  if (!stamp.exists) return stamp;
  if (fs::is_regular_file(native, error)) stamp.size = fs::file_size(native, error);
  stamp.time = fs::last_write_time(native, error);
  return stamp;
}

bool FileExists(const std::string& path) {
  std::error_code error;
  const fs::file_type type = fs::symlink_status(NativePath(path), error).type();
  return type != fs::file_type::not_found && type != fs::file_type::none;
}

bool IsSameFile(const std::string& a, const std::string& b) {
  std::error_code error;
  return fs::equivalent(NativePath(a), NativePath(b), error) && !error;
}

}  // namespace tervane
