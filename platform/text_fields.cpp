// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/text_fields.h"

#include "platform/text.h"

namespace tervane {

std::string Shown(std::string_view field) {
  constexpr std::size_t kMost = 40;
  std::string shown(field.substr(0, kMost));
  if (FirstInvalidUtf8(shown)) {
    for (char& c : shown)
      if (static_cast<unsigned char>(c) >= 0x80) c = '?';
  }
  for (char& c : shown)
    if (static_cast<unsigned char>(c) < 0x20 || c == 0x7f) c = '?';
  return field.size() > kMost ? shown + "..." : shown;
}

std::string WhyNoText(std::string_view text) {
  if (text.starts_with("\xFF\xFE") || text.starts_with("\xFE\xFF")) return "it is UTF-16; save it as UTF-8 or ASCII";
  // Text has no zero byte; its first lines are enough to tell.
  if (text.substr(0, 4096).find('\0') != std::string_view::npos) return "it is no text";
  return {};
}

}  // namespace tervane
