// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/text_pieces.h"

#include <fmt/format.h>

#include "platform/text.h"

namespace tervane {

namespace {

bool IsContinuation(char byte) { return (static_cast<unsigned char>(byte) & 0xc0) == 0x80; }

/// Whether more bytes could make a character of these.
bool IsBeginOfCharacter(std::string_view bytes) {
  const auto lead = static_cast<unsigned char>(bytes.front());
  const std::size_t length = lead >= 0xf0 ? 4 : lead >= 0xe0 ? 3 : lead >= 0xc2 ? 2 : 0;
  if (bytes.size() >= length || lead > 0xf4) return false;
  for (const char byte : bytes.substr(1))
    if (!IsContinuation(byte)) return false;
  return true;
}

std::string Latin1AsUtf8(char byte) {
  const auto code = static_cast<unsigned char>(byte);
  return {static_cast<char>(0xc0 | code >> 6), static_cast<char>(0x80 | (code & 0x3f))};
}

}  // namespace

std::string TextPieces::Open(const std::string& path) {
  *this = {};
  path_ = path;
  std::error_code error;
  file_ = os::File::OpenForReading(path, error);
  if (error) return fmt::format("cannot read {}: {}", path, error.message());
  const os::File::Status status = file_.GetStatus(error);
  if (error || !status.isRegular)
    return fmt::format("cannot read {}: {}", path, error ? error.message() : "it is no file");
  size_ = status.size;
  isAtEnd_ = false;
  return {};
}

std::string TextPieces::Next(std::size_t bytes) {
  std::string text;
  while (text.empty() && !isAtEnd_) {
    const std::size_t before = undecoded_.size();
    undecoded_.resize(before + bytes);
    std::error_code error;
    const std::size_t count = file_.Read(undecoded_.data() + before, bytes, error);
    undecoded_.resize(before + (error ? 0 : count));
    place_ += error ? 0 : count;
    isAtEnd_ = error || count == 0;
    if (error) error_ = fmt::format("cannot read {} beyond byte {}: {}", path_, place_, error.message());
    text = Decode();
  }
  return text;
}

std::string TextPieces::Decode() {
  std::string text;
  std::string_view rest = undecoded_;
  while (!rest.empty()) {
    const std::size_t valid = FirstInvalidUtf8(rest).value_or(rest.size());
    Append(rest.substr(0, valid), text);
    rest.remove_prefix(valid);
    if (rest.empty() || (!isAtEnd_ && IsBeginOfCharacter(rest))) break;
    Append(Latin1AsUtf8(rest.front()), text);
    rest.remove_prefix(1);
  }
  undecoded_.erase(0, undecoded_.size() - rest.size());
  return text;
}

void TextPieces::Append(std::string_view text, std::string& to) {
  for (const char byte : text) {
    if (lineLength_ >= kLongestLine && !IsContinuation(byte) && byte != '\n') {
      to += '\n';
      lineLength_ = 0;
    }
    to += byte;
    lineLength_ = byte == '\n' ? 0 : lineLength_ + 1;
  }
}

}  // namespace tervane
