// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstring>
#include <string>
#include <string_view>
#include <type_traits>
#include <vector>

#include "core/file_name.h"
#include "platform/dates.h"

namespace tervane {

/// Values one behind the other as bytes: what a node holds, kept while the program runs. They are taken out in the
/// order in which they were put.
class StateBuffer {
 public:
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
  void Put(const FileName& value) {
    Put(value.Text());
    Put(value.Folder());
  }
  void Put(const CYbDateTime& value) {
    for (const int field : {value.Year(), value.Month(), value.Day(), value.Hour(), value.Minute(), value.Second()})
      Put(field);
  }
  template <class Value>
  void Put(const std::vector<Value>& values) {
    Put(values.size());
    for (const Value& value : values) Put(value);
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
