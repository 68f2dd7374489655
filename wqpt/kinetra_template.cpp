// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "wqpt/kinetra_template.h"

#include <algorithm>
#include <set>

#include <fmt/format.h>

#include "core/kvf.h"
#include "platform/item_types.h"
#include "platform/text.h"
#include "platform/units.h"

namespace tervane {

namespace {

using Kind = KinetraItemKind;

constexpr const char* kTarget = "KINETRA_SETUP";
/// Forcings that are the user's, whatever the file says.
constexpr int kForcingsOfUsers[] = {5, 6, 23};

constexpr KinetraSection kTemplateSections[] = {
    {"STATE_VARIABLES", "STATE_VARIABLE_{}", Kind::StateVariable, "State variable", "State variables",
     &KinetraTemplate::stateVariables},
    {"CONSTANTS", "CONSTANT_{}", Kind::Constant, "Constant", "Constants", &KinetraTemplate::constants},
    {"FORCINGS", "FORCING_{}", Kind::Forcing, "Forcing", "Forcings", &KinetraTemplate::forcings},
    {"AUXILIARY_VARIABLES", "AUXILIARY_VARIABLE_{}", Kind::Auxiliary, "Auxiliary variable", "Auxiliary variables",
     &KinetraTemplate::auxiliaries},
    {"PROCESSES", "PROCESS_{}", Kind::Process, "Process", "Processes", &KinetraTemplate::processes},
    {"DERIVED_OUTPUTS", "DERIVED_OUTPUT_{}", Kind::DerivedOutput, "Derived output", "Derived outputs",
     &KinetraTemplate::derivedOutputs}};
constexpr const char* kEquations = "STATE_VARIABLE_EQUATIONS";
constexpr const char* kEquation = "STATE_VARIABLE_EQUATION_{}";

std::string TextAt(KvfNode* section, const char* key) {
  std::string text;
  kvfGetParam(section, key, &text, 1, 1);
  return text;
}

std::string WithoutQuotes(std::string text) {
  std::erase(text, '"');
  return text;
}

bool SaysYes(KvfNode* section, const char* key) { return EqualIgnoringCase(TextAt(section, key), "YES"); }

CKinetraSolverItem ReadItem(KvfNode* section, Kind kind) {
  CKinetraSolverItem item;
  item.kind = kind;
  const bool isGiven = IsGiven(kind), isValue = isGiven || kind == Kind::StateVariable;
  if (kind != Kind::DerivedOutput) item.symbol = TextAt(section, "SYMBOL");
  kvfGetParam(section, "ID", &item.id, 1, 1);
  item.description = TextAt(section, "DESCRIPTION");
  item.onlineHelp = TextAt(section, "ONLINE_HELP");
  item.documentation = TextAt(section, "DOCUMENTATION");
  item.isOutput =
      kind == Kind::StateVariable || kind == Kind::DerivedOutput || (!isGiven && SaysYes(section, "OUTPUT"));
  item.unitText = TextAt(section, "UNIT");
  if (isValue) {
    kvfGetParam(section, "QTY_TYPE", &item.quantity, 1, 1);
    const ItemType* known = FindItemType(item.quantity);
    if (!known) item.quantity = quantity::kUndefined;
    // What has no quantity has the unit that the file tells.
    const bool hasUnit = known && (item.quantity != quantity::kUndefined || item.unitText.empty());
    if (hasUnit && !BaseUnit(*known).abbreviation.empty()) item.unitText = BaseUnit(*known).abbreviation;
    kvfGetParam(section, "DEFAULT_VALUE", &item.defaultValue, 1, 1);
    kvfGetParam(section, "MIN_VALUE", &item.minimum, 1, 1);
    kvfGetParam(section, "MAX_VALUE", &item.maximum, 1, 1);
  } else {
    item.expression = WithoutQuotes(TextAt(section, "EXPRESSION"));
  }
  if (kind == Kind::StateVariable) item.typeText = TextAt(section, "TRANSPORT");
  if (kind == Kind::Process) item.typeText = TextAt(section, "PROCESS_TYPE");
  if (kind == Kind::DerivedOutput) item.typeText = TextAt(section, "FORMAT");
  if (isGiven) {
    kvfGetParam(section, "BUILT_IN_ID", &item.builtInId, 1, 1);
    item.isUserSpecified =
        SaysYes(section, "IS_USER_SPECIFIED") ||
        (kind == Kind::Forcing && std::ranges::find(kForcingsOfUsers, item.builtInId) != std::end(kForcingsOfUsers));
  }
  item.scope = TextAt(section, "SCOPE");
  constexpr int kNowhere = 0, kHorizontal = 2, kInWaterColumn = 3;
  if (kind == Kind::StateVariable)
    item.spatialKind = item.scope == "WC" ? kInWaterColumn : kHorizontal;
  else
    item.spatialKind = TextAt(section, "SPATIAL_VARIATION") == "NONE" ? kNowhere : kHorizontal;
  return item;
}

int SectionCount(KvfNode* section) {
  int count = 0;
  for (int number = 1; KvfNode* node = kvfNodeByNum(section, number); ++number) count += kvfIsSection(node);
  return count;
}

/// Calls `take` with the numbered sections from 1 on, until a number is missing. Gives what is left behind that.
std::string ForEachNumbered(KvfNode* section, const char* name, const auto& take) {
  for (int number = 1;; ++number) {
    const std::string wanted = fmt::format(fmt::runtime(name), number);
    KvfNode* found = kvfSectionByNameNum(section, wanted, 1);
    if (found) {
      take(found);
      continue;
    }
    const int left = SectionCount(section) - (number - 1);
    if (left <= 0) return {};
    return fmt::format("{} is missing, so that {} behind it {} not read", wanted,
                       left == 1 ? "1 section" : fmt::format("{} sections", left), left == 1 ? "is" : "are");
  }
}

void ReadEquation(KvfNode* section, KinetraTemplate& read) {
  for (CKinetraSolverItem& variable : read.stateVariables) {
    std::string expression;
    if (!kvfGetParam(section, variable.symbol, &expression, 1, 1)) continue;
    variable.expression = WithoutQuotes(std::move(expression));
    return;
  }
}

KinetraTemplate ReadTemplate(const std::string& path) {
  KinetraTemplate read;
  KvfFile* file = kvfLoadFile(path, 1);
  if (kvfGetErrorGlb() != kKvfNoError) {
    read.problem = kvfErrorText();
    if (file) kvfClose(&file);
    return read;
  }
  if (KvfNode* target = kvfTargetByNameNum(file, kTarget, 1)) {
    for (const KinetraSection& row : kTemplateSections) {
      const std::string gap =
          ForEachNumbered(kvfSectionByNameNum(target, row.section, 1), row.item,
                          [&](KvfNode* section) { (read.*row.items).push_back(ReadItem(section, row.kind)); });
      if (read.gap.empty()) read.gap = gap;
    }
    ForEachNumbered(kvfSectionByNameNum(target, kEquations, 1), kEquation,
                    [&](KvfNode* section) { ReadEquation(section, read); });
  } else {
    read.problem = fmt::format("{}: the file holds no target {}", path, kTarget);
  }
  kvfClose(&file);
  return read;
}

}  // namespace

std::vector<int> KinetraTemplate::Transported() const {
  std::vector<int> places;
  for (std::size_t place = 0; place < stateVariables.size(); ++place)
    if (stateVariables[place].typeText == "ADVECTION_DISPERSION") places.push_back(static_cast<int>(place));
  return places;
}

std::vector<const CKinetraSolverItem*> KinetraTemplate::Outputs() const {
  std::vector<const CKinetraSolverItem*> outputs;
  for (const auto* items : {&auxiliaries, &processes, &derivedOutputs})
    for (const CKinetraSolverItem& item : *items)
      if (item.isOutput) outputs.push_back(&item);
  return outputs;
}

std::vector<std::string> KinetraTemplate::Oddities() const {
  std::vector<std::string> odd;
  std::set<std::string> symbols;
  for (const auto* items : {&stateVariables, &constants, &forcings, &auxiliaries, &processes})
    for (const CKinetraSolverItem& item : *items)
      if (!item.symbol.empty() && !symbols.insert(LowerCase(item.symbol)).second)
        odd.push_back(fmt::format("the symbol {} is declared more than once, or in another case: the first one counts",
                                  item.symbol));
  return odd;
}

std::span<const KinetraSection> KinetraSections() { return kTemplateSections; }

std::shared_ptr<const KinetraTemplate> ReadKinetraTemplate(const std::string& path) {
  static FileCache<KinetraTemplate> cache(100);
  if (path.empty()) return std::make_shared<const KinetraTemplate>();
  // Taken before the reading: what is written meanwhile makes another file of it.
  const FileStamps stamps = StampsOf(path);
  return cache.Get(path, "template", stamps, [&] {
    KinetraTemplate read = ReadTemplate(path);
    read.path = path;
    read.stamps = stamps;
    return read;
  });
}

}  // namespace tervane
