// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Setups from small texts, and what they would write.
#pragma once

#include <functional>
#include <stdexcept>
#include <string>

#include "core/kvf_writer.h"
#include "core/path.h"
#include "tests/support/setup.h"

namespace tervane::test {

/// A new setup, or one that is read from the sections of its target.
class TestSetup : public CFlowModelDoc {
 public:
  TestSetup() = default;
  explicit TestSetup(const std::string& sections, int version = 14) {
    if (!OpenText(SetupText(version, sections), "/setups/x.tvd")) throw std::runtime_error(Error());
  }

  /// The node at a path; a missing one fails the test.
  template <class Node>
  Node& At(const std::string& path) {
    return dynamic_cast<Node&>(*FindNode(Root(), ParseSetupPath(path).steps));
  }
  bool IsUsed(const std::string& path) { return At<CYbSEKvfBase>(path).IsDlgUsedInSetup() != 0; }

  /// The value of "Section/Section:Key" as the file would hold it; empty when it would not.
  std::string Written(const std::string& place) const {
    const std::string key = ParseSetupPath(place).key.name;
    std::string value;
    ForEachKey(place, [&](const KvfNode& keyword) {
      if (keyword.Name() == key) value = KvfValuesText(keyword);
    });
    return value;
  }
  /// The keys of a section in the order of the file, without those that every section has.
  std::string WrittenKeys(const std::string& path) const {
    std::string keys;
    int number = 0;
    ForEachKey(path, [&](const KvfNode& keyword) {
      if (++number < 3) return;
      keys += (keys.empty() ? "" : " ") + std::string(keyword.WrittenName()) + "=" + KvfValuesText(keyword);
    });
    return keys;
  }

 private:
  void ForEachKey(const std::string& place, const std::function<void(const KvfNode&)>& visit) const {
    KvfFile* file = BuildFile("/setups");
    KvfNode* section = kvfTargetByNameNum(file, "TERVANE_FLOWMODEL", 1);
    for (const PathStep& step : ParseSetupPath(place).steps)
      section = kvfSectionByNameNum(section, step.name, step.instance);
    for (int n = 1; const KvfNode* keyword = kvfKeywordByNum(section, n); ++n) visit(*keyword);
    kvfClose(&file);
  }
};

}  // namespace tervane::test
