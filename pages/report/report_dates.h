// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <string_view>

namespace tervane {

/// How a report writes dates.
struct ReportDates {
  enum class Style { Iso, English, German, French };

  Style style = Style::Iso;

  /// The text with its dates (2000-01-31, 2000-01-31 12:00, 2000/01/31 12:00) in that style. A date that is a part of a
  /// name, such as that of a file, stays.
  std::string In(std::string_view text) const;
};

}  // namespace tervane
