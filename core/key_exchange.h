// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <limits>
#include <string>
#include <string_view>
#include <type_traits>
#include <vector>

#include "core/file_name.h"
#include "core/key_facts.h"
#include "core/kvf.h"
#include "core/state_buffer.h"
#include "platform/dates.h"

namespace tervane {

class CYbSEKvfListBaseInterface;

/// What the reference of keys tells of one key.
struct KeyInfo {
  static constexpr int kNoLimit = std::numeric_limits<int>::max();

  std::string key;
  std::string section = {};      ///< The section in the node's own in which it stands; empty for most.
  std::string type;              ///< "int", "float", "double", "bool", "string", "filename", "date", "day".
  std::string defaultValue;      ///< As the file holds it.
  int since = -1;                ///< First document version in which the key is read.
  int until = kNoLimit;          ///< Last document version in which the key is read.
  bool written = true;           ///< False for keys of old files.
  const void* member = nullptr;  ///< The member that holds the value; null where none does.
  int inFile = 0;                ///< How much higher a whole number is in the file than in the member.
  KeyFacts facts = {};
};

/// A key that was just declared, for what is told behind it: `keys("Method", Method).OneOf(kMethods)`. Each of the
/// walks takes of it what it needs.
class DeclaredKey {
 public:
  /// The choices must outlive the declaration: a constant beside their enumeration.
  DeclaredKey& OneOf(KeyChoices choices) {
    return AddFacts([&](KeyFacts& facts) { facts.choices = choices; });
  }
  /// The file holds the base unit of the quantity.
  DeclaredKey& Quantity(int itemType) {
    return AddFacts([&](KeyFacts& facts) { facts.itemType = itemType; });
  }
  /// A quantity that the node's values decide: asked only by a walk that needs it.
  template <class Ask>
  requires std::is_invocable_r_v<int, const Ask&> DeclaredKey& Quantity(const Ask& ask) {
    return AddFacts([&](KeyFacts& facts) { facts.itemType = ask(); });
  }
  /// A unit that never changes.
  DeclaredKey& Unit(std::string_view text) {
    return AddFacts([&](KeyFacts& facts) { facts.unit = text; });
  }
  /// For a key that no page shows.
  DeclaredKey& Label(std::string_view text) {
    return AddFacts([&](KeyFacts& facts) { facts.label = text; });
  }
  DeclaredKey& Range(double least, double greatest) {
    return AddFacts([&](KeyFacts& facts) { facts.least = least, facts.greatest = greatest; });
  }
  DeclaredKey& AtLeast(double least) { return Range(least, std::numeric_limits<double>::infinity()); }
  DeclaredKey& Above(double least) {
    return AddFacts([&](KeyFacts& facts) { facts.least = least, facts.isLeastOutside = true; });
  }
  /// The member in which the node holds a value that is read and written through functions.
  DeclaredKey& HeldIn(const void* member) {
    if (member_) *member_ = member;
    return *this;
  }

 private:
  friend class KeyExchange;
  DeclaredKey() = default;
  DeclaredKey(KeyFacts* facts, const void** member) : facts_(facts), member_(member) {}

  template <class Change>
  DeclaredKey& AddFacts(const Change& change) {
    if (facts_) change(*facts_);
    return *this;
  }

  KeyFacts* facts_ = nullptr;
  const void** member_ = nullptr;
};

/// A text with two whole numbers behind it.
struct KeyLine {
  std::string text;
  int first = 0, second = 0;
};

/// The names of values that stand one behind the other in a section of their own; constants.
struct RepeatedKeys {
  std::string_view section;
  std::string_view count;
  std::string_view key;
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
  /// Makes a number of what would be kept. It may go from node to node.
  static KeyExchange Fingerprinting(StateFingerprint& fingerprint);

  /// Holds every number against what its declaration tells. `report` gets what is wrong, as a sentence; `isNumber` is
  /// false for a value that is no number at all. The walk ends with `Finish`.
  using StrayReport = std::function<void(std::string_view key, std::string text, bool isNumber)>;
  static KeyExchange Checking(StrayReport report);
  void Finish();

  bool IsReading() const { return section_ != nullptr || isRestoring_; }
  bool IsWriting() const { return file_ != nullptr && !keys_; }
  bool IsDescribing() const { return keys_ != nullptr; }
  /// Version of the document that is read, -1 for a file that holds none; only to be asked in reading.
  int DocVersion() const { return docVersion_; }
  /// The section in reading a file, null otherwise.
  KvfNode* Section() const { return section_; }

  template <class Value>
  DeclaredKey operator()(std::string_view key, Value& value) {
    Exchange({key}, value);
    return Declared();
  }

  /// `keys.Since(7)("Key", member)`: read in documents of version 7 and up, always written.
  auto Since(int version) {
    return [this, version](std::string_view key, auto& value) {
      Exchange({.key = key, .since = version}, value);
      return Declared();
    };
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
    Declared().HeldIn(nullptr);
  }
  /// Counted from 1 in the file and from 0 in memory.
  DeclaredKey FromOne(std::string_view key, int& value) {
    if (report_) return (*this)(key, value);
    // Unsigned, since a file may hold the lowest number.
    int inFile = static_cast<int>(static_cast<unsigned>(value) + 1U);
    if (Exchange({key}, inFile)) value = static_cast<int>(static_cast<unsigned>(inFile) - 1U);
    if (keys_) keys_->back().inFile = 1;
    return Declared().HeldIn(&value);
  }
  /// An absent key reads as 0, false or an empty text.
  template <class Value>
  DeclaredKey OrZero(std::string_view key, Value& value) {
    if (IsReading()) value = Value{};
    Exchange({key}, value);
    return Declared();
  }
  /// A value that is not a member: `get()` gives it for the file, `set(value)` takes it when the file has the key.
  template <class Get, class Set>
  DeclaredKey Custom(std::string_view key, const Get& get, const Set& set) {
    auto value = get();
    if (Exchange({key}, value)) set(value);
    return Declared().HeldIn(nullptr);
  }
  /// All parameters of one keyword, whole numbers or texts. One of another type leaves the values as they were.
  template <class Value>
  void Several(std::string_view key, std::vector<Value>& values);
  /// A name of a file with whole numbers behind it, which `numbers()` makes for each writing; they are never read.
  template <class Numbers>
  DeclaredKey FileWith(std::string_view key, FileName& file, const Numbers& numbers) {
    Exchange({key}, file);
    if (IsWriting())
      for (const int number : numbers()) kvfAddInt(file_, number);
    // Asked for, so that they are no unread values.
    const KvfNode* keyword = section_ ? kvfKeywordByNameNum(section_, key, 1) : nullptr;
    for (int place = 2, number = 0; keyword && place <= static_cast<int>(keyword->count); ++place)
      kvfGetParam(section_, key, &number, 1, place);
    return Declared();
  }
  /// Lines one behind the other, each under the same key, and their number in front of them. Without the number nothing
  /// is read.
  void Lines(std::string_view countKey, std::string_view key, std::vector<KeyLine>& lines);
  /// A section of its own, which holds values one behind the other, each under the same key, and their number. The
  /// number is never read; an absent section leaves the values alone.
  template <class Value>
  void Repeated(const RepeatedKeys& names, std::vector<Value>& values);
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
    if (report_) return Check(rule, value);
    if (state_ || fingerprint_) return ExchangeState(rule, value);
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
    if (fingerprint_) return fingerprint_->Put(value), false;
    if (!isRestoring_) return state_->Put(value), false;
    state_->Take(value);
    return true;
  }
  /// Whether the rule reads its key in this document; a key that is skipped is marked as known.
  bool Reads(const Rule& rule);
  void Describe(const Rule& rule, std::string_view type, const void* member);
  /// The key of which was just spoken; nothing is told of it but in describing.
  DeclaredKey Declared() {
    if (report_) return {&checked_.facts, &checked_.member};
    return keys_ && !keys_->empty() ? DeclaredKey(&keys_->back().facts, &keys_->back().member) : DeclaredKey();
  }

  /// The number is judged when the next one comes, since its facts are told behind it.
  template <class Value>
  bool Check(const Rule& rule, const Value& value) {
    Finish();
    if constexpr (std::is_same_v<Value, int> || std::is_floating_point_v<Value>) {
      if (rule.written && rule.since != KeyInfo::kNoLimit) {
        checked_.key.assign(rule.key);
        checked_.value = static_cast<double>(value);
      }
    }
    return false;
  }

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
  StateFingerprint* fingerprint_ = nullptr;
  bool isRestoring_ = false;
  StrayReport report_;
  struct {
    std::string key;  ///< Empty while there is nothing to judge. A copy: a declaration may make its key on the spot.
    double value = 0;
    KeyFacts facts;
    const void* member = nullptr;
  } checked_;
  std::shared_ptr<KvfFile> scratch_;  ///< Takes the values that are described.
  int docVersion_ = -1;
};

}  // namespace tervane
