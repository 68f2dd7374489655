// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "forms/table_rows.h"

namespace tervane {

/// The items of a list whose rows drive another list as well: what is done with a row here is done with the row of the
/// same number there, as far as it has one. Nothing else keeps the two together.
template <class Item>
class RowsInStep : public ListRows<Item> {
 public:
  RowsInStep(CYbSEKvfAbstractListBase<Item>& list, CYbSEKvfListBaseInterface& driven)
      : ListRows<Item>(list), driven_(driven) {}

  void Add() override {
    ListRows<Item>::Add();
    driven_.AddItemNode();
  }
  void Insert(int row) override {
    ListRows<Item>::Insert(row);
    driven_.InsertItem(row, 1);
  }
  void Delete(int row) override {
    ListRows<Item>::Delete(row);
    driven_.DeleteItem(row, 1);
  }
  bool MoveUp(int row) override { return ListRows<Item>::MoveUp(row) && (driven_.MoveItemUp(row, 1), true); }
  bool MoveDown(int row) override { return ListRows<Item>::MoveDown(row) && (driven_.MoveItemDown(row, 1), true); }

 private:
  CYbSEKvfListBaseInterface& driven_;
};

}  // namespace tervane
