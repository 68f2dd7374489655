// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "cli/parts/printable_stream.h"

#include "platform/text.h"

namespace tervane {

bool PrintableStream::Buffer::PassOn(std::size_t size) {
  to_ << Printable(std::string_view(waiting_).substr(0, size));
  waiting_.erase(0, size);
  return !to_.fail();
}

PrintableStream::Buffer::int_type PrintableStream::Buffer::overflow(int_type character) {
  if (traits_type::eq_int_type(character, traits_type::eof())) return traits_type::not_eof(character);
  const char byte = traits_type::to_char_type(character);
  return xsputn(&byte, 1) == 1 ? character : traits_type::eof();
}

std::streamsize PrintableStream::Buffer::xsputn(const char* text, std::streamsize size) {
  // Characters of several bytes may come in pieces, lines do not end within one.
  const std::string_view piece(text, static_cast<std::size_t>(size));
  const std::size_t end = piece.rfind('\n'), before = waiting_.size();
  waiting_ += piece;
  return end == std::string_view::npos || PassOn(before + end + 1) ? size : 0;
}

int PrintableStream::Buffer::sync() {
  const bool isWritten = PassOn(waiting_.size());
  to_.flush();
  return isWritten && !to_.fail() ? 0 : -1;
}

}  // namespace tervane
