// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// A large parameter file with values of all types, the same at every run, and the same content in other forms.
#pragma once

#include <cstddef>
#include <memory>
#include <string>

#include "core/kvf_tree.h"

namespace tervane::bench {

/// About 40,000 sections, four deep, with 600,000 keywords: 20 MB of text.
std::unique_ptr<KvfFile> MakeExampleFile();

/// Sections are objects, keywords are members, several values an array; without indentation or with ours.
std::string AsCompactJson(const KvfFile& file);
std::string AsIndentedJson(const KvfFile& file);

/// Sections and keywords are elements; the attribute `t` tells the type of a value: i, f, d, b, s (text) or n (name of
/// a file). Several values stand in elements `v`.
std::string AsXml(const KvfFile& file);

/// What a reader must find, whatever the form.
struct ContentSum {
  std::size_t values = 0;
  std::size_t textBytes = 0;
  std::size_t trues = 0;
  double numbers = 0;
};
void AddToSum(const KvfSection& section, ContentSum& sum);

}  // namespace tervane::bench
