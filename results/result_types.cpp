// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/result_types.h"

#include <algorithm>

#include <fmt/format.h>

#include "results/feature_rules.h"

namespace tervane {

namespace {

std::string ProblemOf(const TableCheck& check) {
  switch (check.fault) {
    case TableFault::kCodeTwice:
      return fmt::format("Programming error: new data type {} appears more than once in the DataArr array.",
                         check.code);
    case TableFault::kOldCodeTwice:
      return fmt::format(
          "Programming error: old data type {} appears more than once with the same sub datatype in the DataArr array.",
          check.code);
    case TableFault::kFileOutOfPlace:
      return "TvnResfiledata: inconsistency in the FileArr filecodes/index";
    case TableFault::kNone:
      break;
  }
  return {};
}

bool IsShownForUsers(const ResultDataType& type) { return type.isShown && !type.isHidden; }
bool IsHiddenForUsers(const ResultDataType& type) { return type.isShown && type.isHidden; }
bool IsExchanged(const ResultDataType& type) { return type.isExchangeInput || type.isExchangeOutput; }
bool IsShownAndExchanged(const ResultDataType& type) { return !type.isHidden && IsExchanged(type); }
bool IsHiddenAndExchanged(const ResultDataType& type) { return type.isHidden && IsExchanged(type); }

bool IsGridFile(int code) { return (code >= 1 && code <= 16) || (code >= 22 && code <= 29) || code == 31; }
bool IsPlainFile(int code) { return code == 17 || (code >= 19 && code <= 21) || code == 30; }

/// What stands behind the base name in the name of a type's file.
CatalogueAnswer<std::string> NamePart(const ResultDataType& type, const ResultFile* file) {
  constexpr int kOldResultsFile = 17;
  if (!file || (!IsGridFile(type.fileCode) && !IsPlainFile(type.fileCode)))
    return {{}, "Invalid filecode in GetResFileTypeforFileCode"};
  if (type.fileCode == kOldResultsFile) return {".frf"};
  if (IsPlainFile(type.fileCode)) return {fmt::format(".{}", file->suffix)};
  if (file->Dimensions() == 0)
    return {{},
            fmt::format("ERROR in TvnRes_MakeFileNameForDataType:\n- data type, NrOfDimensions : {} {}",
                        type.newDataType, file->Dimensions())};
  return {fmt::format("_{}.nds{}", file->suffix, file->Dimensions())};
}

}  // namespace

ResultCatalogue::ResultCatalogue(std::span<const ResultDataType> types, std::span<const ResultFile> files)
    : types_(types), files_(files), problem_(ProblemOf(CheckResultTables(types, files))) {
  if (!problem_.empty()) return;
  for (const ResultDataType& type : types_) {
    const auto place = static_cast<std::size_t>(std::max(type.newDataType, 0));
    if (byCode_.size() <= place) byCode_.resize(place + 1);
    byCode_[place] = &type;
    if (type.isMultiInstance) multiInstance_.push_back(&type);
  }
}

const ResultCatalogue& ResultCatalogue::Own() {
  static const ResultCatalogue own(AllResultTypes(), AllResultFiles());
  return own;
}

const ResultDataType* ResultCatalogue::Find(int code) const {
  return code > 0 && static_cast<std::size_t>(code) < byCode_.size() ? byCode_[static_cast<std::size_t>(code)]
                                                                     : nullptr;
}

const ResultFile* ResultCatalogue::FileOf(const ResultDataType& type) const {
  const auto place = static_cast<std::size_t>(type.fileCode);
  return type.fileCode >= 1 && place <= files_.size() ? &files_[place - 1] : nullptr;
}

std::vector<const ResultDataType*> ResultCatalogue::OfferedTypes(RequirementMask features) const {
  std::vector<const ResultDataType*> offered;
  for (const ResultDataType& type : types_)
    if (type.IsOffered() && type.ExistsFor(features)) offered.push_back(&type);
  return offered;
}

// ---- Which types exist for features

int ResultCatalogue::GetNoDatatypesforComponent(RequirementMask features) const {
  return static_cast<int>(OfferedTypes(features).size());
}

CatalogueAnswer<int> ResultCatalogue::Fill(std::string_view operation, Filter filter, RequirementMask features,
                                           std::span<int> codes) const {
  if (!problem_.empty()) return {0, problem_};
  std::size_t count = 0;
  for (const ResultDataType& type : types_) {
    if (!filter(type) || !type.ExistsFor(features)) continue;
    if (count == codes.size()) return {0, fmt::format("Programmimg error: ndim too small in call to {}", operation)};
    codes[count++] = type.newDataType;
  }
  return {static_cast<int>(count)};
}

CatalogueAnswer<int> ResultCatalogue::GetDatatypesforComponent(RequirementMask features, std::span<int> codes) const {
  return Fill("GetDatatypesforComponent", IsShownForUsers, features, codes);
}
CatalogueAnswer<int> ResultCatalogue::GetHiddenDatatypesforComponent(RequirementMask features,
                                                                     std::span<int> codes) const {
  return Fill("GetHiddenDatatypesforComponent", IsHiddenForUsers, features, codes);
}
CatalogueAnswer<int> ResultCatalogue::GetOpenMIDatatypesforComponent(RequirementMask features,
                                                                     std::span<int> codes) const {
  return Fill("GetOpenMIDatatypesforComponent", IsShownAndExchanged, features, codes);
}
CatalogueAnswer<int> ResultCatalogue::GetHiddenOpenMIDatatypesforComponent(RequirementMask features,
                                                                           std::span<int> codes) const {
  return Fill("GetHiddenOpenMIDatatypesforComponent", IsHiddenAndExchanged, features, codes);
}

// ---- By logicals

CatalogueAnswer<std::vector<int>> ResultCatalogue::ForLogicals(RequirementMask start, RequirementMask logicals,
                                                               Filter shown, Filter hidden) const {
  if (!problem_.empty()) return {{}, problem_};
  const auto mask = MaskOfLogicals(start, logicals);
  if (!mask.Ok()) return {{}, mask.error};
  CatalogueAnswer<std::vector<int>> answer;
  for (const Filter filter : {shown, hidden})
    for (const ResultDataType& type : types_)
      if (filter(type) && type.ExistsFor(mask.value)) answer.value.push_back(type.newDataType);
  answer.value.push_back(0);
  return answer;
}

CatalogueAnswer<std::vector<int>> ResultCatalogue::GetDatatypesForLogicals_OneBigger(RequirementMask logicals) const {
  return ForLogicals(feature::kWaterMovement, logicals, IsShownForUsers, IsHiddenForUsers);
}
CatalogueAnswer<std::vector<int>> ResultCatalogue::GetOpenMIDatatypesForLogicals_OneBigger(
    RequirementMask logicals) const {
  return ForLogicals(feature::kWaterMovement | feature::kExchange, logicals, IsShownAndExchanged, IsHiddenAndExchanged);
}
CatalogueAnswer<std::vector<int>> ResultCatalogue::GetOpenMIDatatypesForWQLogicals_OneBigger(
    RequirementMask logicals) const {
  return ForLogicals(feature::kWaterQuality | feature::kExchange | feature::kExchangeInWaterQuality, logicals,
                     IsShownAndExchanged, IsHiddenAndExchanged);
}

// ---- What a type is

template <class Get>
auto ResultCatalogue::Ask(std::string_view operation, int code, const Get& get) const {
  using Answer = CatalogueAnswer<std::invoke_result_t<Get, const ResultDataType&>>;
  if (!problem_.empty()) return Answer{{}, problem_};
  const ResultDataType* type = Find(code);
  if (!type)
    return Answer{{}, fmt::format("Program error : {} called with non-existing newdatatype : {}", operation, code)};
  return Answer{get(*type)};
}

CatalogueAnswer<std::string> ResultCatalogue::GetNameOfNewDataType(int code) const {
  return Ask("GetNameOfNewDataType", code, [](const ResultDataType& type) { return std::string(type.name); });
}
CatalogueAnswer<bool> ResultCatalogue::IsDataTypeWQInput(int code) const {
  return Ask("IsDataTypeWQInput", code, [](const ResultDataType& type) { return type.isWaterQualityInput; });
}
CatalogueAnswer<bool> ResultCatalogue::IsDataTypeWaterBalance(int code) const {
  return Ask("IsDataTypeWaterBalance", code, [](const ResultDataType& type) { return type.isWaterBalance; });
}
CatalogueAnswer<bool> ResultCatalogue::IsDataType3D(int code) const {
  return Ask("IsDataType3D", code, [](const ResultDataType& type) {
    return type.gridKind == ResultGridKind::kSaturatedLayers || type.gridKind == ResultGridKind::kUnsaturatedNodes;
  });
}
CatalogueAnswer<bool> ResultCatalogue::DataTypeDependsOn(int code, RequirementMask features) const {
  return Ask("DataTypeDependsOn", code, [features](const ResultDataType& type) {
    return type.isShown && std::ranges::any_of(type.alternatives, [features](RequirementMask alternative) {
             return alternative.IsEmpty() || (!ResultDataType::IsUnused(alternative) && alternative.Contains(features));
           });
  });
}
CatalogueAnswer<bool> ResultCatalogue::DataTypeRequires(int code, RequirementMask features) const {
  return Ask("DataTypeRequires", code, [features](const ResultDataType& type) {
    return std::ranges::any_of(type.alternatives, [features](RequirementMask alternative) {
      return !ResultDataType::IsUnused(alternative) && alternative.Contains(features);
    });
  });
}
CatalogueAnswer<bool> ResultCatalogue::TvnResData_IsDataTypeMultiInstanceType(int code) const {
  return Ask("TvnResData_IsDataTypeMultiInstanceType", code,
             [](const ResultDataType& type) { return type.isMultiInstance; });
}
CatalogueAnswer<bool> ResultCatalogue::TvnResData_IsDataTypeMultiSpeciesType(int code) const {
  return Ask("TvnResData_IsDataTypeMultiSpeciesType", code,
             [](const ResultDataType& type) { return type.isMultiSpecies; });
}
CatalogueAnswer<bool> ResultCatalogue::TvnResData_IsDataTypeOpenMIInputQuantity(int code) const {
  return Ask("TvnResData_IsDataTypeOpenMIInputQuantity", code,
             [](const ResultDataType& type) { return type.isExchangeInput; });
}
CatalogueAnswer<bool> ResultCatalogue::TvnResData_IsDataTypeOpenMIOutputQuantity(int code) const {
  return Ask("TvnResData_IsDataTypeOpenMIOutputQuantity", code,
             [](const ResultDataType& type) { return type.isExchangeOutput; });
}

int ResultCatalogue::GetNoSubTypesOfOldDataType(int oldDataType) const {
  return static_cast<int>(std::ranges::count(types_, oldDataType, &ResultDataType::oldDataType));
}

CatalogueAnswer<std::string> ResultCatalogue::TvnRes_MakeFileNameForDataType(const std::string& fifPath,
                                                                             int code) const {
  const auto part = Ask("TvnRes_MakeFileNameForDataType", code,
                        [this](const ResultDataType& type) { return NamePart(type, FileOf(type)); });
  if (!part.Ok()) return {{}, part.error};
  if (!part.value.Ok()) return {{}, part.value.error};
  // Engines write both kinds of slashes, one behind the other in one path.
  constexpr std::string_view kSlashes = "/\\";
  const std::string_view path = fifPath;
  const std::size_t slash = path.find_last_of(kSlashes);
  const bool hasFolder = slash != std::string_view::npos;
  std::string_view folder = path.substr(0, hasFolder ? slash : 0);
  folder = folder.substr(folder.find_last_of(kSlashes) + 1);
  const std::string_view file = hasFolder ? path.substr(slash + 1) : path;
  return {fmt::format("{}{}{}{}", folder, hasFolder ? "\\" : "", file.substr(0, file.rfind('.')), part.value.value)};
}

}  // namespace tervane
