// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Where the rows of a table come from. Rows count from 1.
#pragma once

#include <concepts>
#include <cstddef>
#include <functional>
#include <memory>
#include <optional>
#include <utility>
#include <vector>

#include "core/list.h"

namespace tervane {

/// The rows of a table without their class.
class TableRows {
 public:
  virtual ~TableRows() = default;

  virtual int Count() const = 0;
  /// What tells a row from all others, wherever it stands; null where nothing does.
  virtual const void* Identity(int /*row*/) const { return nullptr; }
  /// The node whose folder names of files are relative to; null where there is none.
  virtual const CYbSEKvfBase* Node(int /*row*/) const { return nullptr; }
  /// Whether rows can come, go and move.
  virtual bool CanChange() const { return false; }
  /// Appends a row.
  virtual void Add() {}
  /// Inserts one above a row that is there.
  virtual void Insert(int /*row*/) {}
  virtual void Delete(int /*row*/) {}
  virtual bool MoveUp(int /*row*/) { return false; }
  virtual bool MoveDown(int /*row*/) { return false; }

  /// Whether the user may look at the rows in another order, or at some of them.
  virtual bool CanArrange() const { return false; }
  /// Asks anew which rows there are; true when they are others than before, and then all are there in their own order.
  virtual bool Refresh() { return false; }
  /// Of all rows in their own order those of these numbers are there, in the order of the numbers; nothing for all.
  virtual void Arrange(const std::optional<std::vector<int>>& /*rows*/) {}
};

/// Rows of one class.
template <class Row>
class RowsOf : public TableRows {
 public:
  /// A row that is there.
  virtual Row& At(int row) const = 0;
  /// A row of no table, which stands for all: what its class declares of its keys is known where there are no rows.
  /// Null where rows declare nothing.
  virtual std::unique_ptr<Row> Sample() const { return nullptr; }
};

/// The items of a list node.
template <class Item>
class ListRows : public RowsOf<Item> {
 public:
  explicit ListRows(CYbSEKvfAbstractListBase<Item>& list) : list_(list) {}

  int Count() const override { return list_.GetItemCount(); }
  Item& At(int row) const override { return *list_.GetItem(row); }
  const void* Identity(int row) const override { return list_.GetItemNode(row); }
  const CYbSEKvfBase* Node(int row) const override { return list_.GetItemNode(row); }
  std::unique_ptr<Item> Sample() const override { return list_.NewItem(); }
  bool CanChange() const override { return true; }
  void Add() override { list_.AddItemNode(); }
  void Insert(int row) override { list_.InsertItem(row, 1); }
  void Delete(int row) override { list_.DeleteItem(row, 1); }
  bool MoveUp(int row) override { return list_.MoveItemUp(row, 1); }
  bool MoveDown(int row) override { return list_.MoveItemDown(row, 1); }

 private:
  CYbSEKvfAbstractListBase<Item>& list_;
};

/// Of the items of a list those for which a rule holds, as they were when the table was last brought in step. They
/// neither come nor go.
template <class Item>
class RowsThatHold : public RowsOf<Item> {
 public:
  RowsThatHold(CYbSEKvfAbstractListBase<Item>& list, std::function<bool(Item&)> rule)
      : list_(list), rule_(std::move(rule)) {
    RowsThatHold::Refresh();
  }

  int Count() const override { return static_cast<int>(shown_.size()); }
  Item& At(int row) const override { return *shown_[static_cast<std::size_t>(row - 1)]; }
  const void* Identity(int row) const override { return &At(row); }
  const CYbSEKvfBase* Node(int row) const override { return &At(row); }
  std::unique_ptr<Item> Sample() const override { return list_.NewItem(); }
  bool Refresh() override {
    std::vector<Item*> now;
    for (int number = 1; number <= list_.GetItemCount(); ++number)
      if (Item* item = list_.GetItem(number); rule_(*item)) now.push_back(item);
    return std::exchange(shown_, now) != now;
  }

 private:
  CYbSEKvfAbstractListBase<Item>& list_;
  std::function<bool(Item&)> rule_;
  std::vector<Item*> shown_;
};

/// Rows that stand elsewhere, which the user may look at in another order, or at some of them. They are kept as they
/// were when the table was last brought in step.
template <class Row>
class ArrangedRows : public RowsOf<Row> {
 public:
  using Source = std::function<std::vector<Row*>()>;
  explicit ArrangedRows(Source source) : source_(std::move(source)) { ArrangedRows::Refresh(); }

  int Count() const override { return static_cast<int>(shown_.size()); }
  Row& At(int row) const override { return *shown_[static_cast<std::size_t>(row - 1)]; }
  const void* Identity(int row) const override { return shown_[static_cast<std::size_t>(row - 1)]; }
  const CYbSEKvfBase* Node(int row) const override {
    if constexpr (std::derived_from<Row, CYbSEKvfBase>) return &At(row);
    return nullptr;
  }
  bool CanArrange() const override { return true; }
  bool Refresh() override {
    std::vector<Row*> now = source_();
    if (now == all_) return false;
    all_ = std::move(now);
    shown_ = all_;
    return true;
  }
  void Arrange(const std::optional<std::vector<int>>& rows) override {
    shown_ = all_;
    if (!rows) return;
    shown_.clear();
    for (const int row : *rows) shown_.push_back(all_[static_cast<std::size_t>(row - 1)]);
  }

 private:
  Source source_;
  std::vector<Row*> all_, shown_;
};

/// Plain values, which outlive the table.
template <class Row>
class ValueRows : public RowsOf<Row> {
 public:
  explicit ValueRows(std::vector<Row>& values) : values_(values) {}

  int Count() const override { return static_cast<int>(values_.size()); }
  Row& At(int row) const override { return values_[static_cast<std::size_t>(row - 1)]; }
  bool CanChange() const override { return std::default_initializable<Row>; }
  void Add() override { InsertAt(Count()); }
  void Insert(int row) override {
    if (IsThere(row)) InsertAt(row - 1);
  }
  void Delete(int row) override {
    if (IsThere(row)) values_.erase(values_.begin() + (row - 1));
  }
  bool MoveUp(int row) override { return Swap(row, row - 1); }
  bool MoveDown(int row) override { return Swap(row, row + 1); }

 private:
  bool IsThere(int row) const { return row >= 1 && row <= Count(); }
  void InsertAt(int place) {
    if constexpr (std::default_initializable<Row>) values_.insert(values_.begin() + place, Row());
  }
  bool Swap(int row, int other) {
    if (!IsThere(row) || !IsThere(other)) return false;
    std::swap(At(row), At(other));
    return true;
  }

  std::vector<Row>& values_;
};

}  // namespace tervane
