// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The log of an engine while it grows: read in pieces, cut into lines, its end kept for the screen.
#pragma once

#include <cstddef>
#include <cstdint>
#include <deque>
#include <string>
#include <string_view>
#include <vector>

#include "platform/os.h"

namespace tervane {

/// Reads a file that another program writes, from its first byte on. A file that is put in its place, or that has
/// become shorter, is read from its beginning.
class LogReader {
 public:
  explicit LogReader(std::string path) : path_(std::move(path)) {}

  const std::string& Path() const { return path_; }
  /// Up to `most` bytes of what was added since the last call; none at the present end, or while there is no file.
  std::string Read(std::size_t most);

 private:
  bool Open();

  std::string path_;
  os::File file_;
  os::File::Status opened_;
  std::uint64_t place_ = 0;
};

/// Some lines in one block of memory, without their ends.
class LogPiece {
 public:
  std::size_t Count() const { return ends_.size(); }
  std::size_t Bytes() const { return text_.size(); }
  std::size_t Longest() const { return longest_; }
  std::string_view Line(std::size_t index) const;

  /// Adds to the line that is not ended yet.
  void Append(std::string_view text) { text_ += text; }
  void EndLine();
  void Add(const LogPiece& other);

 private:
  std::string text_;
  std::vector<std::size_t> ends_;
  std::size_t longest_ = 0;
};

/// Cuts what an engine prints into lines. A carriage return ends a line too, since some engines draw over their last
/// line. Of a very long line only the beginning is kept.
class LineCutter {
 public:
  static constexpr std::size_t kLongestLine = 2000;

  /// The lines that have ended.
  LogPiece Cut(std::string_view bytes);
  /// What stands behind the last line end, as a line.
  LogPiece Rest();

 private:
  void Take(std::string_view part, LogPiece& lines);
  void EndLine(LogPiece& lines);

  std::string begun_;  ///< Of the line that has not ended.
  bool isCut_ = false;
  bool endsInReturn_ = false;
};

/// The last lines of a log.
class LogTail {
 public:
  /// At least the last of `kMostLines` are kept, as long as all together have no more than `kMostBytes`.
  static constexpr std::size_t kMostLines = 100'000, kMostBytes = 64u << 20;

  void Add(LogPiece piece);
  void Add(std::string_view line);
  void Add(LogTail other);

  std::size_t Count() const { return count_; }
  bool IsEmpty() const { return count_ == 0; }
  std::string_view Line(std::size_t index) const;
  /// How many lines stood before the first one that is kept.
  std::uint64_t Dropped() const { return dropped_; }
  /// Bytes of the longest line that ever came.
  std::size_t Longest() const { return longest_; }

 private:
  struct Placed {
    std::uint64_t first;  ///< Number of its first line among all lines that ever came.
    LogPiece piece;
  };
  std::deque<Placed> pieces_;
  std::size_t count_ = 0, bytes_ = 0, longest_ = 0;
  std::uint64_t dropped_ = 0;
};

}  // namespace tervane
