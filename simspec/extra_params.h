// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "core/list.h"
#include "simspec/pages.h"

namespace tervane {

/// A parameter that the engine knows and the editor does not.
class CExtraParamsItemKvf : public CTvnKvfBase {
 public:
  explicit CExtraParamsItemKvf(CYbSEKvfBase* parent) : CTvnKvfBase("ExtraParam", "ExtraParam_%d", parent) {}

  enum Kind : int { kFloat = 0, kInteger = 1, kBool = 2, kText = 3, kFilename = 4 };
  static constexpr KeyChoice kKinds[] = {
      {kFloat, "Float"}, {kInteger, "Integer"}, {kBool, "Bool"}, {kText, "Text"}, {kFilename, "Filename"}};

  std::string Name;
  int Type = kFloat;
  // One value of each kind, so that a change of the type back and forth loses nothing; the file holds the current one.
  double FloatValue = 0;
  int IntegerValue = 0;
  int BoolValue = 0;
  std::string TextValue;
  FileName FilenameValue;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
  void ExchangeState(KeyExchange& keys) override;
};

/// The free list of extra parameters for the engine.
class CExtraParamsKvf : public CYbSEKvfListBase<CExtraParamsItemKvf>, public CYbSEItemNameSource {
 public:
  explicit CExtraParamsKvf(CYbSEKvfBase* parent) : CYbSEKvfListBase("Extra Parameters", "ExtraParams", parent) {
    SetPage(kExtraParamsPage);
  }

  int GetSectionUsed() const override;
  std::string GetItemName(int number) const override;
  /// Tells of review notes that cannot be read.
  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys.Count("NoOfParams", *this); }
};

}  // namespace tervane
