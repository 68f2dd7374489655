// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Process templates: files that declare variables and the processes that change them.
#pragma once

#include <memory>
#include <span>
#include <string>
#include <vector>

#include "platform/file_cache.h"

namespace tervane {

/// What a section of a template declares.
enum class KinetraItemKind {
  StateVariable = 0,
  Constant = 1,
  Forcing = 2,
  Auxiliary = 3,
  Process = 4,
  DerivedOutput = 5
};

/// One declaration.
struct CKinetraSolverItem {
  KinetraItemKind kind = KinetraItemKind::StateVariable;
  std::string symbol;  ///< None of a derived output.
  int id = 0;
  std::string description, onlineHelp, documentation;
  bool isOutput = false;
  int quantity = 999;    ///< 999 also for one that is not known.
  std::string unitText;  ///< The abbreviation of the quantity's unit, or the file's own.
  double defaultValue = 0;
  double minimum = 1, maximum = 0;  ///< No range where the minimum is the greater one.
  std::string expression;
  std::string typeText;  ///< How a variable is transported, the type of a process, the format of an output.
  bool isUserSpecified = false;
  int builtInId = 0;
  std::string scope;
  int spatialKind = 0;

  /// Taken from the model: bound to a value of it.
  bool IsModelParameter() const {
    constexpr int kConstantOfModel = 54, kForcingOfModel = 55;
    return (kind == KinetraItemKind::Constant && builtInId == kConstantOfModel) ||
           (kind == KinetraItemKind::Forcing && builtInId == kForcingOfModel);
  }
};

/// What a template holds; never changed once it is read.
struct KinetraTemplate {
  std::vector<CKinetraSolverItem> stateVariables, constants, forcings, auxiliaries, processes, derivedOutputs;
  std::string problem;  ///< Why the file could not be read; empty for one that was, and where none is named.
  std::string gap;      ///< The first number that is missing, so that what stands behind it is not read; or empty.
  std::string path;
  FileStamps stamps;  ///< Of the file when it was read.

  /// Whether the file is another one than it was when it was read.
  bool IsOtherOnDisk() const { return !path.empty() && StampsOf(path) != stamps; }

  /// Places of the state variables that move with the water.
  std::vector<int> Transported() const;
  /// What is stored: of the auxiliaries, then of the processes those that say so, then all derived outputs.
  std::vector<const CKinetraSolverItem*> Outputs() const;
  /// What a reader should know: symbols that differ in case only.
  std::vector<std::string> Oddities() const;
};

/// A constant or forcing: its value is none of the template's.
constexpr bool IsGiven(KinetraItemKind kind) {
  return kind == KinetraItemKind::Constant || kind == KinetraItemKind::Forcing;
}

/// A kind of declarations: where a template holds it, and what it is called.
struct KinetraSection {
  const char *section, *item;  ///< `{}` stands for the number of the item.
  KinetraItemKind kind;
  const char *name, *names;
  std::vector<CKinetraSolverItem> KinetraTemplate::*items;
};
/// In the order of the file.
std::span<const KinetraSection> KinetraSections();

/// Reads a template. A file that is missing or no template gives an empty one with its problem. Two who name one file
/// get the same content, until the file changes.
std::shared_ptr<const KinetraTemplate> ReadKinetraTemplate(const std::string& path);

}  // namespace tervane
