// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "access/setup_change.h"

#include <fmt/format.h>

#include "access/repeated_key.h"
#include "access/setup_place.h"
#include "access/typed_value.h"
#include "access/written_setup.h"
#include "core/kvf_writer.h"
#include "document/key_reference.h"
#include "document/setup_diff.h"
#include "platform/text.h"

namespace tervane {

namespace {

/// The document of what is written in the place of another; null, with the reason.
std::unique_ptr<CFlowModelDoc> ReadAnew(const WrittenSetup& written, const CFlowModelDoc& before, std::string& reason) {
  std::string text;
  if (!WriteKvfText(written.File(), text, reason)) return nullptr;
  auto document = std::make_unique<CFlowModelDoc>();
  if (document->OpenText(text, before.PathName())) return document;
  reason = document->Error();
  return nullptr;
}

std::unique_ptr<CFlowModelDoc> WithRepeated(CFlowModelDoc& document, const RepeatedKey& key, const std::string& typed,
                                            std::string& reason) {
  // The node takes one of the two.
  for (const bool areNumbers : {true, false}) {
    const WrittenSetup written(document);
    if (!TakeValues(written, document, key, typed, areNumbers)) continue;
    const std::vector<std::string> wanted = ValuesOf(written, document, key);
    auto changed = ReadAnew(written, document, reason);
    if (!changed) return nullptr;
    if (ValuesOf(WrittenSetup(*changed), *changed, key) == wanted) return changed;
  }
  reason = "the setup does not take these values: texts, or whole numbers, separated by commas were expected";
  return nullptr;
}

}  // namespace

std::unique_ptr<CFlowModelDoc> ReadWithChange(CFlowModelDoc& document, const TypedChange& change,
                                              std::string& problem) {
  const auto refuse = [&](std::string_view why) -> std::unique_ptr<CFlowModelDoc> {
    problem = fmt::format("{} = {}: {}", change.path, change.value, why);
    return nullptr;
  };
  std::string reason;
  const SetupPath path = ParseSetupPath(change.path);
  if (const auto repeated = FindRepeatedKey(document, path)) {
    auto changed = WithRepeated(document, *repeated, change.value, reason);
    if (!changed) return refuse(reason);
    changed->Continue(document);
    return changed;
  }
  const CYbSEKvfBase* node = FindNodeOrTell(document.Root(), path, change.path, problem);
  if (!node) return nullptr;
  const WrittenSetup written(document);
  KvfSection* section = written.SectionOf(*node);
  KvfNode* key = section ? FindKeyOrTell(*section, path.key, change.path, problem) : nullptr;
  if (!key) return nullptr;
  const KeyInfo* info = KeyReference::Get().Find(PathOf(*node), Trimmed(path.key.name));
  if (const std::string expected = TakeTyped(change.value, info, *section, *key); !expected.empty())
    return refuse(expected + " was expected");
  const std::string wanted = ComparedText(*key);
  auto changed = ReadAnew(written, document, reason);
  if (!changed) return refuse(reason);
  const WrittenSetup result(*changed);
  const CYbSEKvfBase* changedNode = FindNode(changed->Root(), path.steps);
  KvfSection* changedSection = changedNode ? result.SectionOf(*changedNode) : nullptr;
  const KvfNode* taken = changedSection ? FindKvfNode(*changedSection, true, Trimmed(path.key.name),
                                                      static_cast<std::size_t>(path.key.instance))
                                        : nullptr;
  if (!taken || ComparedText(*taken) != wanted)
    return refuse(fmt::format("the setup does not take this value: it would be saved as {}",
                              taken ? PlainValuesText(*taken) : "nothing"));
  changed->Continue(document);
  return changed;
}

}  // namespace tervane
