// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <algorithm>
#include <string>
#include <vector>

#include "tests/simspec/test_setup.h"

namespace tervane::test {

/// A setup from sections on one line: a `;` ends each key.
class QualitySetup : public TestSetup {
 public:
  QualitySetup() = default;
  explicit QualitySetup(std::string sections, int version = 14) : TestSetup(Lines(std::move(sections)), version) {}

  /// The texts of the errors that a validation finds at a node.
  std::vector<std::string> ErrorsAt(const std::string& path) {
    auto& node = At<CYbSEKvfBase>(path);
    node.Validate();
    std::vector<std::string> texts;
    for (const Finding& finding : node.Findings())
      if (finding.severity == Severity::Error) texts.push_back(finding.text);
    return texts;
  }
  /// Whether each of the nodes takes part by its own rule: "101".
  std::string AreUsed(const std::vector<std::string>& paths) {
    std::string used;
    for (const std::string& path : paths) used += IsUsed(path) ? '1' : '0';
    return used;
  }

 private:
  static std::string Lines(std::string text) {
    std::ranges::replace(text, ';', '\n');
    return text;
  }
};

}  // namespace tervane::test
