// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "access/typed_value.h"
#include "core/open_kvf.h"
#include "document/flow_model_document.h"

namespace tervane {

/// The keys of the nodes of an open setup, one by one: as the file would hold them, and changed in place, so that the
/// nodes stay. What a node would write is kept until something changes, so that asking often costs little.
class SetupKeys {
 public:
  /// The document outlives this object. Who changes it by other means tells it by `Forget`.
  explicit SetupKeys(CFlowModelDoc& document) : document_(document) {}

  /// A key of a node; of one that has no section of its own, only what it holds itself. Null with the problem, which
  /// names what comes near. The keyword lives until something changes.
  const KvfNode* Find(CYbSEKvfBase& node, const PathStep& key, std::string& problem);
  /// All keys of a node in the order of the file.
  std::vector<const KvfNode*> KeysOf(CYbSEKvfBase& node);
  /// What is declared of a key; nothing for what every section has.
  std::optional<KeyInfo> InfoOf(CYbSEKvfBase& node, std::string_view key);

  /// Puts a value into the keyword of a section, as `TakeTyped` and `TakePlainValues` do; gives what was expected.
  using Take = std::function<std::string(const KeyInfo* info, KvfSection& section, KvfNode& keyword)>;
  /// Gives a key another value. The problem, and the node as it was, when there is no such key, the value is refused,
  /// or the setup would be saved with another one.
  std::string Set(CYbSEKvfBase& node, const PathStep& key, const Take& take);
  std::string Set(CYbSEKvfBase& node, const PathStep& key, std::string_view typed);
  std::string Set(CYbSEKvfBase& node, const PathStep& key, std::span<const PlainValue> values);

  /// The values that stand one behind the other under a key in a section of the node that is no node itself; nothing
  /// where there is no such section.
  std::optional<std::vector<PlainValue>> Repeated(CYbSEKvfBase& node, std::string_view section, std::string_view key);
  /// Puts others in their place. The problem, and the node as it was, when it does not take them.
  std::string SetRepeated(CYbSEKvfBase& node, std::string_view section, std::string_view key,
                          std::span<const PlainValue> values);

  /// The setup has got the folder of its first file: names of files that were set before start from there now.
  void TakeFolder();

  void Forget() { ++revision_; }
  /// Another number after each change that was told.
  std::uint64_t Revision() const { return revision_; }

 private:
  /// What a node itself writes, and what those below it write into its section.
  struct Part {
    CYbSEKvfBase* node;
    KvfSection* section;
  };
  using Parts = std::vector<Part>;

  const Parts& Written(CYbSEKvfBase& node);

  CFlowModelDoc& document_;
  std::uint64_t revision_ = 1;
  std::uint64_t keptRevision_ = 0;
  OpenKvf kept_;
  std::unordered_map<std::uint64_t, Parts> written_;  ///< By the serials of nodes, into `kept_`.
};

}  // namespace tervane
