// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "core/node.h"

namespace tervane {

/// An item that a user names: a layer, a lens, a drain. The name is its short title.
class NamedItemKvf : public CYbSEKvfGroupBase {
 public:
  /// `name` is what a new one is called.
  NamedItemKvf(std::string title, std::string section, std::string name, CYbSEKvfBase* parent)
      : CYbSEKvfGroupBase(std::move(title), std::move(section), parent), Name(std::move(name)) {}

  std::string Name;

  const std::string& GetAbbreviatedTitle() const override { return Name; }
  void SetAbbreviatedTitle(std::string title) override { Name = std::move(title); }

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys("Name", Name); }
};

}  // namespace tervane
