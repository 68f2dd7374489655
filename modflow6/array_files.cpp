// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "modflow6/array_files.h"

#include <cerrno>
#include <charconv>
#include <cstdint>
#include <cstring>
#include <system_error>

#include <fmt/format.h>

#include "platform/paths.h"
#include "platform/progress.h"

namespace tervane::modflow6 {

// ---- Files

OutputFile::OutputFile(std::string path) : path_(std::move(path)), buffer_(1 << 20) {
  file_ = std::fopen(NativePath(path_).string().c_str(), "wb");
  if (!file_)
    problem_ = fmt::format("cannot write {}: {}", path_, std::generic_category().message(errno));
  else
    std::setvbuf(file_, buffer_.data(), _IOFBF, buffer_.size());
}

OutputFile::~OutputFile() {
  if (file_) std::fclose(file_);
}

void OutputFile::Write(std::string_view bytes) {
  if (!problem_.empty() || std::fwrite(bytes.data(), 1, bytes.size(), file_) == bytes.size()) return;
  problem_ = fmt::format("cannot write {}: {}", path_, std::generic_category().message(errno));
}

std::string OutputFile::Close() {
  if (file_ && std::fclose(file_) != 0 && problem_.empty())
    problem_ = fmt::format("cannot write {}: {}", path_, std::generic_category().message(errno));
  file_ = nullptr;
  return problem_;
}

// ---- Arrays

void AppendNumber(std::string& text, double value) {
  char digits[32];
  // Values come from single precision, whose shortest text is short.
  const auto single = static_cast<float>(value);
  const auto end = static_cast<double>(single) == value ? std::to_chars(digits, digits + sizeof digits, single)
                                                        : std::to_chars(digits, digits + sizeof digits, value);
  text.append(digits, end.ptr);
}

std::string ArrayFiles::Constant(int value) { return fmt::format("CONSTANT {}", value); }

std::string ArrayFiles::Constant(double value) {
  std::string line = "CONSTANT ";
  AppendNumber(line, value);
  return line;
}

namespace {

void AppendTo(std::string& text, int value) { fmt::format_to(std::back_inserter(text), "{}", value); }
void AppendTo(std::string& text, double value) { AppendNumber(text, value); }

template <class Value>
void AppendBytes(std::string& bytes, const Value& value) {
  char raw[sizeof value];
  std::memcpy(raw, &value, sizeof value);
  bytes.append(raw, sizeof value);
}

/// What stands in front of the values of a binary array.
std::string BinaryHeader(int columns, int rows, bool isWhole) {
  std::string header;
  AppendBytes(header, std::int32_t{1});
  AppendBytes(header, std::int32_t{1});
  AppendBytes(header, 1.0);
  AppendBytes(header, 1.0);
  header += isWhole ? "         INTEGER" : "            DATA";
  AppendBytes(header, static_cast<std::int32_t>(columns));
  AppendBytes(header, static_cast<std::int32_t>(rows));
  AppendBytes(header, std::int32_t{1});
  return header;
}

}  // namespace

template <class Number>
std::string ArrayFiles::Write(const std::string& name, const std::vector<Number>& values) {
  constexpr bool kIsWhole = std::is_same_v<Number, int>;
  const bool isBinary = form_ == Modflow6Options::Arrays::Binary;
  const std::string file = fmt::format("arrays/{}.{}", name, isBinary ? "bin" : "txt");
  OutputFile output(fmt::format("{}/{}", folder_, file));
  if (isBinary) output.Write(BinaryHeader(geometry_.nx, geometry_.ny, kIsWhole));
  std::string piece;
  const auto nx = static_cast<std::size_t>(geometry_.nx);
  for (std::size_t begin = 0; begin < values.size() && problem_.empty(); begin += nx) {
    if (log_.IsCancelled()) problem_ = kCancelled;
    piece.clear();
    for (std::size_t i = begin; i < begin + nx; ++i) {
      if (isBinary) {
        AppendBytes(piece, values[i]);
      } else {
        if (i > begin) piece += ' ';
        AppendTo(piece, values[i]);
      }
    }
    if (!isBinary) piece += '\n';
    output.Write(piece);
  }
  std::string problem = output.Close();
  if (problem_.empty()) problem_ = std::move(problem);
  written_.push_back(file);
  return fmt::format("OPEN/CLOSE '{}'{}", file, isBinary ? " (BINARY)" : "");
}

template std::string ArrayFiles::Write(const std::string& name, const std::vector<int>& values);
template std::string ArrayFiles::Write(const std::string& name, const std::vector<double>& values);

}  // namespace tervane::modflow6
