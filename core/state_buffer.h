// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <cstring>
#include <string>
#include <string_view>
#include <type_traits>
#include <vector>

#include "core/file_name.h"
#include "platform/dates.h"

namespace tervane {

/// Puts what is made of several values one after the other. `State` puts numbers and texts.
template <class State>
class PutsParts {
 public:
  void Put(const FileName& value) {
    static const std::string kNone;
    Self().Put(value.Text());
    // Most names are empty, and then mean the same in every folder.
    Self().Put(value.IsEmpty() ? kNone : value.Folder());
  }
  void Put(const CYbDateTime& value) {
    for (const int field : {value.Year(), value.Month(), value.Day(), value.Hour(), value.Minute(), value.Second()})
      Self().Put(field);
  }
  template <class Value>
  void Put(const std::vector<Value>& values) {
    Self().Put(values.size());
    for (const Value& value : values) Self().Put(value);
  }

 private:
  State& Self() { return static_cast<State&>(*this); }
};

/// A number of all values that are put, as they are in a `StateBuffer`. A single value that changes always gives
/// another number; of several at a time one in 2^64 cases would not.
class StateFingerprint : public PutsParts<StateFingerprint> {
 public:
  using PutsParts::Put;

  std::uint64_t Number() const { return number_; }
  void Clear() { number_ = 0; }

  template <class Value>
  requires(std::is_arithmetic_v<Value> || std::is_pointer_v<Value>) void Put(Value value) {
    std::uint64_t bits = 0;
    static_assert(sizeof value <= sizeof bits);
    std::memcpy(&bits, &value, sizeof value);
    // Each of the three can be taken back, so that no two values lead to one number.
    number_ = (number_ ^ bits) * 0x9E3779B97F4A7C15;
    number_ ^= number_ >> 29;
  }
  void Put(const std::string& value) {
    Put(value.size());
    // Eight bytes at a time; the last ones overlap those before them, since parts are slow to put together.
    const char* const begin = value.data();
    const char* const end = begin + value.size();
    if (value.size() >= 8) {
      for (const char* place = begin; place + 8 < end; place += 8) Put(Part<std::uint64_t>(place));
      Put(Part<std::uint64_t>(end - 8));
    } else if (value.size() >= 4) {
      Put(std::uint64_t{Part<std::uint32_t>(begin)} << 32 | Part<std::uint32_t>(end - 4));
    } else {
      for (const char* place = begin; place < end; ++place) Put(*place);
    }
  }

 private:
  template <class Number>
  static Number Part(const char* place) {
    Number number;
    std::memcpy(&number, place, sizeof number);
    return number;
  }

  std::uint64_t number_ = 0;
};

/// Values one behind the other as bytes: what a node holds, kept while the program runs. They are taken out in the
/// order in which they were put.
class StateBuffer : public PutsParts<StateBuffer> {
 public:
  using PutsParts::Put;

  StateBuffer() = default;
  explicit StateBuffer(std::string bytes) : bytes_(std::move(bytes)) {}

  const std::string& Bytes() const { return bytes_; }
  /// Empties the buffer and keeps its memory.
  void Clear() {
    bytes_.clear();
    taken_ = 0;
  }

  template <class Number>
  requires std::is_arithmetic_v<Number>
  void Put(Number value) {
    char bytes[sizeof value];
    std::memcpy(bytes, &value, sizeof value);
    bytes_.append(bytes, sizeof value);
  }
  void Put(const std::string& value) {
    Put(value.size());
    bytes_ += value;
  }

  template <class Number>
  requires std::is_arithmetic_v<Number>
  void Take(Number& value) {
    std::memcpy(&value, bytes_.data() + taken_, sizeof value);
    taken_ += sizeof value;
  }
  void Take(std::string& value) {
    std::size_t size = 0;
    Take(size);
    value.assign(bytes_, taken_, size);
    taken_ += size;
  }
  void Take(FileName& value) {
    std::string text, folder;
    Take(text);
    Take(folder);
    value = FileName(std::move(text), std::move(folder));
  }
  void Take(CYbDateTime& value) {
    int fields[6];
    for (int& field : fields) Take(field);
    value = CYbDateTime(fields[0], fields[1], fields[2], fields[3], fields[4], fields[5]);
  }
  template <class Value>
  void Take(std::vector<Value>& values) {
    std::size_t size = 0;
    Take(size);
    values.resize(size);
    for (Value& value : values) Take(value);
  }

 private:
  std::string bytes_;
  std::size_t taken_ = 0;
};

}  // namespace tervane
