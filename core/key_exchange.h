// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <limits>
#include <string>
#include <string_view>
#include <vector>

#include "core/file_name.h"
#include "core/kvf.h"
#include "core/state_buffer.h"
#include "platform/dates.h"

namespace tervane {

class CYbSEKvfListBaseInterface;

/// What the reference of keys tells of one key.
struct KeyInfo {
  static constexpr int kNoLimit = std::numeric_limits<int>::max();

  std::string key;
  std::string type;              ///< "int", "float", "double", "bool", "string", "filename", "date", "day".
  std::string defaultValue;      ///< As the file holds it.
  int since = -1;                ///< First document version in which the key is read.
  int until = kNoLimit;          ///< Last document version in which the key is read.
  bool written = true;           ///< False for keys of old files.
  const void* member = nullptr;  ///< Address of the member that holds the value; of a passing value, no member's.
};

/// One walk over the keys of a node. A node declares its keys once, in `ExchangeKeys`, in the order of the file; the
/// same declaration reads them, writes them and describes them. The type of the member is the type in the file. An
/// absent key leaves its member alone.
class KeyExchange {
 public:
  static KeyExchange Reading(KvfNode* section, int docVersion);
  static KeyExchange Writing(KvfFile* file);
  /// Collects the keys with the members' present values as their defaults.
  static KeyExchange Describing(std::vector<KeyInfo>& keys, int docVersion);

  /// Keeps the members in memory, and puts them back; for undoing. Item counts are left out: the items themselves are
  /// kept.
  static KeyExchange Keeping(StateBuffer& state);
  static KeyExchange Restoring(StateBuffer& state);

  bool IsReading() const { return section_ != nullptr || isRestoring_; }
  bool IsWriting() const { return file_ != nullptr && !keys_; }
  bool IsDescribing() const { return keys_ != nullptr; }
  /// Version of the document that is read, -1 for a file that holds none; only to be asked in reading.
  int DocVersion() const { return docVersion_; }
  /// The section in reading a file, null otherwise.
  KvfNode* Section() const { return section_; }

  template <class Value>
  void operator()(std::string_view key, Value& value) {
    Exchange({key}, value);
  }

  /// `keys.Since(7)("Key", member)`: read in documents of version 7 and up, always written.
  auto Since(int version) {
    return [this, version](std::string_view key, auto& value) { Exchange({.key = key, .since = version}, value); };
  }
  /// A key of old files: read in documents up to that version, never written. True when it was read.
  template <class Value>
  bool Until(int version, std::string_view key, Value& value) {
    return Exchange({.key = key, .until = version, .written = false}, value);
  }
  template <class Value>
  void ReadOnly(std::string_view key, Value& value) {
    Exchange({.key = key, .written = false}, value);
  }
  template <class Value>
  void WriteOnly(std::string_view key, Value value) {
    Exchange({.key = key, .since = KeyInfo::kNoLimit}, value);
  }
  /// Counted from 1 in the file and from 0 in memory.
  void FromOne(std::string_view key, int& value) {
    // Unsigned, since a file may hold the lowest number.
    int inFile = static_cast<int>(static_cast<unsigned>(value) + 1U);
    if (Exchange({key}, inFile)) value = static_cast<int>(static_cast<unsigned>(inFile) - 1U);
  }
  /// An absent key reads as 0, false or an empty text.
  template <class Value>
  void OrZero(std::string_view key, Value& value) {
    if (IsReading()) value = Value{};
    Exchange({key}, value);
  }
  /// A value that is not a member: `get()` gives it for the file, `set(value)` takes it when the file has the key.
  template <class Get, class Set>
  void Custom(std::string_view key, const Get& get, const Set& set) {
    auto value = get();
    if (Exchange({key}, value)) set(value);
  }
  /// All parameters of one keyword, whole numbers or texts. One of another type leaves the values as they were.
  template <class Value>
  void Several(std::string_view key, std::vector<Value>& values);
  /// The date alone: year, month, day.
  void Day(std::string_view key, CYbDateTime& value);
  /// The number of items of a list; reading resizes it.
  void Count(std::string_view key, CYbSEKvfListBaseInterface& list);

 private:
  struct Rule {
    std::string_view key;
    int since = -1;
    int until = KeyInfo::kNoLimit;
    bool written = true;
  };

  KeyExchange() = default;

  /// True when a value was read.
  template <class Value>
  bool Exchange(const Rule& rule, Value& value) {
    if (state_) return ExchangeState(rule, value);
    if (IsReading()) return Reads(rule) && Read(rule.key, value);
    if (IsWriting() && !rule.written) return false;
    Write(rule.key, value);
    if (keys_) Describe(rule, TypeName(value), &value);
    return false;
  }
  /// What goes in one direction only is made from other values.
  template <class Value>
  bool ExchangeState(const Rule& rule, Value& value) {
    if (!rule.written || rule.since == KeyInfo::kNoLimit) return false;
    if (!isRestoring_) return state_->Put(value), false;
    state_->Take(value);
    return true;
  }
  /// Whether the rule reads its key in this document; a key that is skipped is marked as known.
  bool Reads(const Rule& rule);
  void Describe(const Rule& rule, std::string_view type, const void* member);

  template <class Number>
  bool Read(std::string_view key, Number& value) {
    return kvfGetParam(section_, key, &value, 1, 1) != 0;
  }
  bool Read(std::string_view key, FileName& value);
  bool Read(std::string_view key, CYbDateTime& value);
  template <class Number>
  void Write(std::string_view key, const Number& value) {
    kvfPutParam(file_, key, value);
  }
  void Write(std::string_view key, const FileName& value);
  void Write(std::string_view key, const CYbDateTime& value);

  static std::string_view TypeName(int) { return "int"; }
  static std::string_view TypeName(float) { return "float"; }
  static std::string_view TypeName(double) { return "double"; }
  static std::string_view TypeName(bool) { return "bool"; }
  static std::string_view TypeName(const std::string&) { return "string"; }
  static std::string_view TypeName(const FileName&) { return "filename"; }
  static std::string_view TypeName(const CYbDateTime&) { return "date"; }

  KvfNode* section_ = nullptr;
  KvfFile* file_ = nullptr;
  std::vector<KeyInfo>* keys_ = nullptr;
  StateBuffer* state_ = nullptr;
  bool isRestoring_ = false;
  std::shared_ptr<KvfFile> scratch_;  ///< Takes the values that are described.
  int docVersion_ = -1;
};

}  // namespace tervane
