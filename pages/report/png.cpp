// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/report/png.h"

#include <array>
#include <string_view>

#include <zlib.h>

namespace tervane {

namespace {

void AddBigEndian(std::string& bytes, std::uint32_t number) {
  for (int shift = 24; shift >= 0; shift -= 8) bytes += static_cast<char>(number >> shift & 0xffU);
}

const Bytef* AsBytes(std::string_view text) { return reinterpret_cast<const Bytef*>(text.data()); }

void AddChunk(std::string& png, std::string_view kind, std::string_view content) {
  AddBigEndian(png, static_cast<std::uint32_t>(content.size()));
  const std::size_t begin = png.size();
  png += kind;
  png += content;
  const std::string_view checked = std::string_view(png).substr(begin);
  AddBigEndian(png, static_cast<std::uint32_t>(crc32(0, AsBytes(checked), static_cast<uInt>(checked.size()))));
}

}  // namespace

std::string PngOf(const IndexedImage& image) {
  std::string png("\x89PNG\r\n\x1a\n", 8), header, palette, rows;
  AddBigEndian(header, static_cast<std::uint32_t>(image.width));
  AddBigEndian(header, static_cast<std::uint32_t>(image.height));
  // 8 bits of a palette, no interlacing.
  header += std::string("\x08\x03\x00\x00\x00", 5);
  AddChunk(png, "IHDR", header);
  for (const unsigned color : image.colors)
    for (int shift = 16; shift >= 0; shift -= 8) palette += static_cast<char>(color >> shift & 0xffU);
  AddChunk(png, "PLTE", palette);
  AddChunk(png, "tRNS", std::string_view("\0", 1));
  const auto width = static_cast<std::size_t>(image.width);
  for (std::size_t row = 0; row < static_cast<std::size_t>(image.height); ++row) {
    // No filter.
    rows += '\0';
    rows.append(reinterpret_cast<const char*>(image.pixels.data()) + row * width, width);
  }
  uLongf size = compressBound(static_cast<uLong>(rows.size()));
  std::string packed(size, '\0');
  compress2(reinterpret_cast<Bytef*>(packed.data()), &size, AsBytes(rows), static_cast<uLong>(rows.size()), 9);
  packed.resize(size);
  AddChunk(png, "IDAT", packed);
  AddChunk(png, "IEND", {});
  return png;
}

std::string Base64(std::string_view bytes) {
  constexpr std::string_view kDigits = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";
  std::string text;
  for (std::size_t place = 0; place < bytes.size(); place += 3) {
    std::uint32_t three = 0;
    for (std::size_t i = 0; i < 3; ++i)
      three = three << 8U | (place + i < bytes.size() ? static_cast<unsigned char>(bytes[place + i]) : 0U);
    for (std::size_t i = 0; i < 4; ++i)
      text += place + i <= bytes.size() ? kDigits[three >> (18 - 6 * i) & 0x3fU] : '=';
  }
  return text;
}

}  // namespace tervane
