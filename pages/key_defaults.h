// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <string>
#include <unordered_map>
#include <vector>

#include "document/key_reference.h"
#include "forms/page_form.h"

namespace tervane {

/// What the declarations tell of the keys that the controls of a page show: for tool tips, and to go back to a default.
/// It knows controls by where they are, and so must not outlive them.
class KeyDefaults {
 public:
  /// Forgets what the nodes held when they were last looked at; to be called when they may have changed.
  void Look() { held_.clear(); }

  /// Default, range, stored unit and key, a line each; empty for a control that shows no key.
  std::string ToolTip(const Control& control);
  /// What is typed to give the key its default; nothing where it has it, or where none is declared. A file or a text
  /// has none: what is filled in is seen.
  std::optional<std::string> Reset(const Control& control);

 private:
  struct Known {
    std::string path;     ///< With the key.
    const KeyInfo* info;  ///< Null where the declarations have no such key.
  };
  const Known& Find(const Control& control);
  /// The value that the node holds now, as the file would.
  const std::string* Held(const Control& control);

  std::unordered_map<const Control*, Known> known_;
  std::unordered_map<const CYbSEKvfBase*, std::vector<KeyInfo>> held_;
};

}  // namespace tervane
