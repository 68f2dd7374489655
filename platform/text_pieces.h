// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <string>

#include "platform/os.h"

namespace tervane {

/// Reads a text file piece by piece, so that a log of any size can be looked into. What is no UTF-8 is read as Latin-1,
/// byte by byte, and a line of more than `kLongestLine` bytes is broken, since no view can show it.
class TextPieces {
 public:
  /// "" when the file is open, else why not; a folder or a pipe is refused at once.
  std::string Open(const std::string& path);

  /// The next piece as UTF-8, made of some `bytes` of the file and never half a character; empty at the end, and when
  /// the reading failed, which ends it.
  std::string Next(std::size_t bytes);
  bool IsAtEnd() const { return isAtEnd_; }
  /// Why the reading failed; empty when it did not.
  const std::string& Error() const { return error_; }
  /// Of the file when it was opened.
  std::uint64_t Size() const { return size_; }
  /// How far it was read.
  std::uint64_t Place() const { return place_; }

  static constexpr std::size_t kLongestLine = 20'000;

 private:
  /// Takes what can be told of the bytes that were read, and leaves the begin of a character that was cut.
  std::string Decode();
  void Append(std::string_view text, std::string& to);

  std::string path_, error_;
  os::File file_;
  std::string undecoded_;
  std::uint64_t size_ = 0, place_ = 0;
  std::size_t lineLength_ = 0;
  bool isAtEnd_ = true;
};

}  // namespace tervane
