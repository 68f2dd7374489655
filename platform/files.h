// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Reading and writing whole files so that nothing of the user's is lost.
#pragma once

#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "platform/progress.h"

namespace tervane {

/// The outcome of a file operation: empty `error` means done. The error names the path, says why in words and what to
/// do where that helps ("cannot write /data/x.tvd: no space left on the device; the file is unchanged").
struct FileResult {
  std::string error;
  std::string note;  ///< Done, but the user should know: "hard link: the other names keep the old content".

  bool Ok() const { return error.empty(); }
};

/// The bytes of a file, in one block without growth, followed by NULs: a reader may look at eight bytes from any place.
struct FileContent {
  static constexpr std::size_t kNulsBehind = 8;

  std::unique_ptr<char[]> data;
  std::size_t size = 0;

  static FileContent Of(std::string_view text);
  std::string_view Text() const { return {data.get(), size}; }
};

/// Reads a regular file whole. A folder, a FIFO or a device is refused at once, never waited for.
FileResult ReadWholeFile(const std::string& path, FileContent& content, ProgressPart progress = {});

/// Replaces the file's content in one step: afterwards the old or the new file stands whole, also after a crash or a
/// power cut. A new file is written beside it, compared in size, flushed, renamed over the target, and the folder is
/// flushed. Permissions, owner, group and extended attributes of an old file are kept; a symbolic link stays and its
/// target is replaced; a cycle of links, a folder and anything else that is no regular file are refused. When another
/// hard link names the old file, that name keeps the old content and the note says so. On any failure the old file
/// stands byte for byte and nothing is left beside it.
FileResult WriteFileAtomically(const std::string& path, std::string_view content);

/// Makes a file that must not exist yet (else `error` is `file_exists`), with its content from the first moment where
/// the file system can do that.
void CreateWholeFile(const std::string& path, std::string_view content, std::error_code& error);

/// The same for a file of the program's own, at whose name users keep nothing: a symbolic link is refused, so that no
/// file elsewhere is written.
FileResult WriteOwnFileAtomically(const std::string& path, std::string_view content);
/// Why the program's own file cannot stand there: something else does, such as a symbolic link, a folder or a FIFO.
/// Empty where a regular file or nothing stands.
std::string WhyNoOwnFile(const std::string& path);

/// A file that a library writes under a temporary name, put in place in one step like an atomic write. What was not
/// committed is removed.
class FileReplacement {
 public:
  FileReplacement();
  FileReplacement(FileReplacement&& other) noexcept;
  FileReplacement& operator=(FileReplacement&& other) noexcept;
  ~FileReplacement();

  /// Makes an empty file beside the target, with the attributes of an old file there; refuses what an atomic write
  /// refuses.
  FileResult Begin(const std::string& path);
  /// What the library may open and fill, not remove or replace; valid from `Begin` to `Commit`.
  const std::string& TemporaryPath() const;
  /// Flushes and renames. The library must have closed the file.
  FileResult Commit();

 private:
  struct State;
  std::unique_ptr<State> state_;
};

/// "" for a regular file that can be opened for reading, else "cannot read PATH: REASON".
std::string WhyNotReadable(const std::string& path);

/// Copies a file to a name that does not exist yet (an existing file is an error), flushed like an atomic write.
FileResult CopyToNewFile(const std::string& from, const std::string& to);

/// The absolute path of the file itself, without symbolic links: the same for all names that lead to one file. Nothing
/// needs to stand there yet.
std::string RealPath(const std::string& path);

/// A cheap sign: where two stamps of a path are equal, its file has hardly changed between.
struct FileStamp {
  bool exists = false;
  std::uint64_t size = 0;
  std::filesystem::file_time_type time;

  bool operator==(const FileStamp&) const = default;
};
FileStamp StampOf(const std::string& path);

/// True when something stands at the path (a broken link counts).
bool FileExists(const std::string& path);

/// True when both paths lead to the same file.
bool IsSameFile(const std::string& a, const std::string& b);

}  // namespace tervane
