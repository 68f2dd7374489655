// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Quick fixes: what the program can mend of what a validation found. Each kind is declared once, beside the check that
// finds what it mends; `fixes/` gathers the kinds for the programs.
#pragma once

#include <functional>
#include <memory>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "core/node.h"
#include "platform/computation.h"

namespace tervane {

class FilesByName;

/// A finding at its node.
struct FoundAt {
  CYbSEKvfBase* node;  ///< Never null.
  std::string text, key, detail;
};

/// A value that a fix changes, in words, and the changing.
struct FixedValue {
  CYbSEKvfBase* node;
  std::string key, before, after;
  /// Why it could not be done; empty where it was.
  std::function<std::string()> apply;
  /// What takes long, such as the making of a file, and asks no node: it is done first, in any thread. Null where there
  /// is nothing. Values may share one.
  std::shared_ptr<Computation> preparation = nullptr;
};

/// Findings that a kind of fix leaves as they are, and why.
struct LeftFinding {
  CYbSEKvfBase* node;
  std::string key, why;
};

/// What is to be changed for some findings. Values of several findings that ask for the same are one.
struct FixPlan {
  std::vector<FixedValue> values;
  std::vector<LeftFinding> left;
};

/// What the making of a plan may ask for.
struct FixContext {
  std::string folder;                  ///< Below which files were searched; empty where none were.
  const FilesByName* files = nullptr;  ///< What was found there.
};

struct FixKind {
  std::string_view name;   ///< As the command line takes it: "moved-file".
  std::string_view title;  ///< "Find the File by Its Name".
  /// Whether the kind is for such a finding; quick, since menus ask it.
  std::function<bool(const FoundAt& found)> isFor;
  /// Plans for findings that the kind is for. Nothing is changed.
  std::function<void(std::span<const FoundAt> found, const FixContext& context, FixPlan& plan)> plan;
};

}  // namespace tervane
