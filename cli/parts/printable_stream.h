// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <ostream>
#include <streambuf>
#include <string>

namespace tervane {

/// Passes on what is written without what a terminal would obey: titles and names of files may hold anything. Whole
/// lines are passed on as they come, the rest when it is flushed.
class PrintableStream : public std::ostream {
 public:
  explicit PrintableStream(std::ostream& to) : std::ostream(nullptr), buffer_(to) { rdbuf(&buffer_); }
  ~PrintableStream() override { flush(); }

 private:
  class Buffer : public std::streambuf {
   public:
    explicit Buffer(std::ostream& to) : to_(to) {}

   protected:
    int_type overflow(int_type character) override;
    std::streamsize xsputn(const char* text, std::streamsize size) override;
    int sync() override;

   private:
    /// False when it cannot be written.
    bool PassOn(std::size_t size);

    std::ostream& to_;
    std::string waiting_;
  };

  Buffer buffer_;
};

}  // namespace tervane
