// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Setups from small texts, and what they would write.
#pragma once

#include <stdexcept>
#include <string>

#include "core/kvf_writer.h"
#include "core/path.h"
#include "document/flow_model_document.h"

namespace tervane::test {

inline constexpr int kNoVersion = -1;

/// A new setup, or one that is read from the sections of its target.
class TestSetup : public CFlowModelDoc {
 public:
  TestSetup() = default;
  explicit TestSetup(const std::string& sections, int version = 14) {
    std::string text = "target TERVANE_FLOWMODEL {\n";
    if (version != kNoVersion) text += "section FlowModelDocVersion {\nVersion = " + std::to_string(version) + "\n}\n";
    if (!OpenText(text + sections + "\n}\n", "/setups/x.tvd")) throw std::runtime_error(Error());
  }

  /// The node at a path; a missing one fails the test.
  template <class Node>
  Node& At(const std::string& path) {
    return dynamic_cast<Node&>(*FindNode(Root(), ParseSetupPath(path).steps));
  }
  bool IsUsed(const std::string& path) { return At<CYbSEKvfBase>(path).IsDlgUsedInSetup() != 0; }

  /// The value of "Section/Section:Key" as the file would hold it; empty when it would not.
  std::string Written(const std::string& place) const {
    const SetupPath path = ParseSetupPath(place);
    KvfFile* file = BuildFile("/setups");
    KvfNode* section = kvfTargetByNameNum(file, "TERVANE_FLOWMODEL", 1);
    for (const PathStep& step : path.steps) section = kvfSectionByNameNum(section, step.name, step.instance);
    const KvfNode* keyword = kvfKeywordByNameNum(section, path.key.name, 1);
    std::string value = keyword ? KvfValuesText(*keyword) : std::string();
    kvfClose(&file);
    return value;
  }
  /// The keys of a section in the order of the file, without those that every section has.
  std::string WrittenKeys(const std::string& path) const {
    KvfFile* file = BuildFile("/setups");
    KvfNode* section = kvfTargetByNameNum(file, "TERVANE_FLOWMODEL", 1);
    for (const PathStep& step : ParseSetupPath(path).steps) section = kvfSectionByNameNum(section, step.name, 1);
    std::string keys;
    for (int n = 3; const KvfNode* keyword = kvfKeywordByNum(section, n); ++n)
      keys += (keys.empty() ? "" : " ") + std::string(keyword->WrittenName()) + "=" + KvfValuesText(*keyword);
    kvfClose(&file);
    return keys;
  }
};

}  // namespace tervane::test
