// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/paths.h"

#include <algorithm>
#include <vector>

#include "platform/text.h"

namespace tervane {
namespace {

bool IsSeparator(char c) { return c == '/' || c == '\\'; }

bool BeginsWithDrive(std::string_view path) {
  const auto isLetter = [](char c) { return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z'); };
  return path.size() >= 2 && isLetter(path[0]) && path[1] == ':';
}

/// A path taken apart: its root ("/", "C:/", "C:", "//server/share/", "" for a relative path) and the names behind,
/// without "." and with ".." only where they lead out of a relative path.
struct PathParts {
  std::string root;
  std::vector<std::string_view> names;
  bool endsInSeparator = false;

  bool IsFromWindows() const { return root.size() > 1; }
  /// No folder of the process takes part ("C:x" depends on the folder of drive C).
  bool IsFullyAbsolute() const { return !root.empty() && root.back() == '/'; }
  std::string Text() const;
};

/// True when a relative way leads from one to the other.
bool ShareRoot(const PathParts& a, const PathParts& b) {
  return a.IsFullyAbsolute() && EqualIgnoringCase(a.root, b.root);
}

/// Takes the text up to the next separator, and all separators behind it, from the front of `path`.
std::string_view TakeName(std::string_view& path) {
  const std::size_t end = std::min(path.find_first_of("/\\"), path.size());
  const std::string_view name = path.substr(0, end);
  path.remove_prefix(std::min(path.find_first_not_of("/\\", end), path.size()));
  return name;
}

std::string TakeRoot(std::string_view& path) {
  if (BeginsWithDrive(path)) {
    std::string root(path.substr(0, 2));
    path.remove_prefix(2);
    if (!path.empty() && IsSeparator(path.front())) {
      root += '/';
      TakeName(path);
    }
    return root;
  }
  const std::size_t separators = std::min(path.find_first_not_of("/\\"), path.size());
  path.remove_prefix(separators);
  if (separators == 0) return "";
  if (separators != 2 || path.empty()) return "/";
  std::string root = "//";
  root.append(TakeName(path)).append("/");
  if (!path.empty()) root.append(TakeName(path)).append("/");
  return root;
}

PathParts Split(std::string_view path) {
  PathParts parts;
  parts.root = TakeRoot(path);
  parts.endsInSeparator = EndsInSeparator(path);
  const bool mayLeadOut = !parts.IsFullyAbsolute();
  while (!path.empty()) {
    const std::string_view name = TakeName(path);
    if (name == ".") continue;
    if (name != "..") {
      parts.names.push_back(name);
    } else if (!parts.names.empty() && parts.names.back() != "..") {
      parts.names.pop_back();
    } else if (mayLeadOut) {
      parts.names.push_back(name);
    }
  }
  return parts;
}

std::string PathParts::Text() const {
  std::string text = root;
  // A name like "C:x" at the front would be taken for a drive.
  if (root.empty() && !names.empty() && BeginsWithDrive(names.front())) text += "./";
  for (std::size_t i = 0; i < names.size(); ++i) {
    if (i > 0) text += '/';
    text += names[i];
  }
  if (text.empty()) text += '.';
  if (endsInSeparator && !EndsInSeparator(text)) text += '/';
  return text;
}

/// Number of leading names that both paths share. Windows tells no difference between capital and small letters.
std::size_t CommonNames(const PathParts& a, const PathParts& b) {
  const auto isSame = [&](std::string_view x, std::string_view y) {
    return a.IsFromWindows() ? EqualIgnoringCase(x, y) : x == y;
  };
  const auto differs = std::mismatch(a.names.begin(), a.names.end(), b.names.begin(), b.names.end(), isSame);
  return static_cast<std::size_t>(differs.first - a.names.begin());
}

std::string Relative(const PathParts& path, const PathParts& folder, std::size_t common) {
  PathParts way;
  way.endsInSeparator = path.endsInSeparator;
  way.names.assign(folder.names.size() - common, "..");
  way.names.insert(way.names.end(), path.names.begin() + static_cast<std::ptrdiff_t>(common), path.names.end());
  return way.Text();
}

}  // namespace

bool IsAbsolutePath(std::string_view path) {
  return BeginsWithDrive(path) || (!path.empty() && IsSeparator(path.front()));
}

std::string ResolvedPath(std::string_view path, std::string_view folder) {
  if (path.empty()) return "";
  if (IsAbsolutePath(path) || folder.empty()) return Split(path).Text();
  std::string joined(folder);
  if (!EndsInSeparator(joined)) joined += '/';
  return Split(joined.append(path)).Text();
}

std::string RelativePath(std::string_view path, std::string_view folder) {
  if (path.empty()) return "";
  const PathParts parts = Split(path);
  const PathParts folderParts = Split(folder);
  if (!ShareRoot(parts, folderParts)) return parts.Text();
  return Relative(parts, folderParts, CommonNames(parts, folderParts));
}

std::string StoredPath(std::string_view path, std::string_view folder) {
  if (path.empty()) return "";
  const PathParts parts = Split(path);
  const PathParts folderParts = Split(folder);
  const std::size_t common = CommonNames(parts, folderParts);
  const bool isBelow = ShareRoot(parts, folderParts) && common == folderParts.names.size();
  return isBelow ? Relative(parts, folderParts, common) : parts.Text();
}

std::string_view FolderOf(std::string_view path) {
  const std::size_t nameBegin = path.size() - FileNameOf(path).size();
  const std::string_view front = path.substr(0, nameBegin);
  const std::size_t end = front.find_last_not_of("/\\");
  if (end == std::string_view::npos) return front.substr(0, 1);
  const bool isDriveRoot = end == 1 && BeginsWithDrive(front);
  return front.substr(0, isDriveRoot ? std::min<std::size_t>(3, front.size()) : end + 1);
}

std::string_view FileNameOf(std::string_view path) {
  const std::size_t separator = path.find_last_of("/\\");
  if (separator != std::string_view::npos) return path.substr(separator + 1);
  return path.substr(BeginsWithDrive(path) ? 2 : 0);
}

std::string_view ExtensionOf(std::string_view path) {
  const std::string_view name = FileNameOf(path);
  const std::size_t dot = name.rfind('.');
  if (dot == std::string_view::npos || dot == 0 || name == "..") return {};
  return name.substr(dot);
}

std::string_view BaseNameOf(std::string_view path) {
  const std::string_view name = FileNameOf(path);
  return name.substr(0, name.size() - ExtensionOf(path).size());
}

bool EndsInSeparator(std::string_view path) { return !path.empty() && IsSeparator(path.back()); }

std::string AbsoluteFromHere(std::string_view path) {
  if (path.empty() || IsAbsolutePath(path)) return ResolvedPath(path, "");
  return ResolvedPath(path, TextOfPath(std::filesystem::current_path()));
}

std::filesystem::path NativePath(std::string_view path) { return {std::u8string(path.begin(), path.end())}; }

std::string TextOfPath(const std::filesystem::path& path) {
  const std::u8string text = path.generic_u8string();
  return {text.begin(), text.end()};
}

}  // namespace tervane
