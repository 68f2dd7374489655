// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Paths as setups hold them: text that may come from another system. `/` and `\` both separate; a drive letter ("C:\x",
// "C:/x") or a share ("\\server\share") is absolute on every system. Nothing here touches the disk;
// AbsoluteFromHere asks for the process's working folder.
#pragma once

#include <filesystem>
#include <string>
#include <string_view>

namespace tervane {

/// True for "/x", "\x", "C:\x", "C:/x", "\\server\share" on every system; also for "C:x", which no folder can be put
/// before.
bool IsAbsolutePath(std::string_view path);

/// What to hand to the system to open `path`, which stands in a file of folder `folder`: the path itself when it is
/// absolute, else joined to the folder; `\` becomes `/`, and "." and ".." are resolved in the text. Empty stays empty.
std::string ResolvedPath(std::string_view path, std::string_view folder);

/// `path` (absolute) as a file in `folder` (absolute) should hold it: relative with `/` where a relative way exists
/// (same root, drive or share), else the absolute text with `/`.
std::string RelativePath(std::string_view path, std::string_view folder);

/// `path` (absolute) as a name that the user picked is stored by a setup in `folder` (absolute): relative with `/` when
/// it lies at or below the folder, else absolute with `/`.
std::string StoredPath(std::string_view path, std::string_view folder);

/// Folder part without the last separator ("" when there is none; "/" and "C:/" keep theirs), file name, extension with
/// its dot ("" when there is none; a leading dot begins no extension), and file name without extension.
std::string_view FolderOf(std::string_view path);
std::string_view FileNameOf(std::string_view path);
std::string_view ExtensionOf(std::string_view path);
std::string_view BaseNameOf(std::string_view path);

/// True when the text ends in `/` or `\`.
bool EndsInSeparator(std::string_view path);

/// The path made absolute against the process's working folder, with `/`.
std::string AbsoluteFromHere(std::string_view path);

/// UTF-8 text as a path of the host's file system, and back (with `/`).
std::filesystem::path NativePath(std::string_view path);
std::string TextOfPath(const std::filesystem::path& path);

}  // namespace tervane
