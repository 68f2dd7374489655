// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "access/repeated_key.h"

#include "core/kvf_writer.h"
#include "forms/entry.h"
#include "platform/text.h"

namespace tervane {

namespace {

KvfSection* SectionOf(const WrittenSetup& written, CFlowModelDoc& document, const RepeatedKey& key) {
  const CYbSEKvfBase* node = FindNode(document.Root(), key.node);
  KvfSection* section = node ? written.SectionOf(*node) : nullptr;
  return section ? AsSection(FindKvfNode(*section, false, key.section)) : nullptr;
}

std::vector<std::string> SplitAtCommas(std::string_view typed) {
  std::vector<std::string> values;
  while (!Trimmed(typed).empty()) {
    const std::size_t comma = typed.find(',');
    values.emplace_back(Trimmed(typed.substr(0, comma)));
    typed = comma == std::string_view::npos ? std::string_view() : typed.substr(comma + 1);
  }
  return values;
}

}  // namespace

std::optional<RepeatedKey> FindRepeatedKey(CFlowModelDoc& document, const SetupPath& path) {
  if (path.steps.size() < 2 || !path.error.empty() || FindNode(document.Root(), path.steps)) return std::nullopt;
  RepeatedKey found{
      {path.steps.begin(), path.steps.end() - 1}, path.steps.back().name, std::string(Trimmed(path.key.name))};
  // The section is written also where it holds no value.
  const WrittenSetup written(document);
  const KvfSection* section = found.key.empty() ? nullptr : SectionOf(written, document, found);
  return section ? std::optional(found) : std::nullopt;
}

std::vector<std::string> ValuesOf(const WrittenSetup& written, CFlowModelDoc& document, const RepeatedKey& key) {
  std::vector<std::string> values;
  KvfSection* section = SectionOf(written, document, key);
  for (std::size_t n = 1; section; ++n) {
    const KvfNode* found = FindKvfNode(*section, true, key.key, n);
    if (!found) break;
    values.push_back(KvfValuesText(*found));
  }
  return values;
}

bool TakeValues(const WrittenSetup& written, CFlowModelDoc& document, const RepeatedKey& key, std::string_view typed,
                bool areNumbers) {
  KvfSection* section = SectionOf(written, document, key);
  if (!section) return false;
  KvfFile& file = written.File();
  // The number of values is made when the setup is saved.
  file.Clear(*section);
  for (const std::string& value : SplitAtCommas(typed)) {
    int number = 0;
    if (areNumbers ? !EnterValue(number, value).empty() : FirstInvalidUtf8(value).has_value()) return false;
    file.BeginKeyword(*section, key.key);
    KvfParam& param = file.AddParam(areNumbers ? KvfType::Int : KvfType::String);
    if (areNumbers)
      param.asInt = number;
    else
      file.SetText(param, value);
  }
  return true;
}

}  // namespace tervane
