// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The catalogue of all that engines can store: what it is called, its unit, the result file that it goes to, and the
// features of a model that bring it in. Nobody else lists results. The types stand in result_types.txt.
#pragma once

#include <array>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "results/catalogue_answer.h"
#include "results/requirement_mask.h"

namespace tervane {

/// What a value stands for in time.
enum class ResultValueType : int { kInstantaneous = 0, kMeanOfStep = 3 };

/// On what the values of a type lie.
enum class ResultGridKind : int {
  kNone = 0,
  kCells = 1,
  kUnsaturatedColumns = 2,
  kSaturatedLayers = 4,
  kUnsaturatedNodes = 5,
  kWaterQualityUnsaturatedNodes = 6,
  kRiverLinks = 7,
  kSaturatedBoundaryCells = 8,
  kRiverLevelPoints = 9,
  kRiverDischargePoints = 10,
  kReservoirSubcatchments = 11,
  kSimpleOverlandAreas = 12,
  kMultiCellGrid = 13,
  kSingleValues = 14,
};

/// Which storing interval governs a file; the values are the engines'.
enum class StoringClass : int {
  kPrecipitation = 1,
  kOverland = 2,
  kHeads = 3,
  kRiverExchange = 4,
  kFluxes = 5,
  kOldResults = 6,
  kHotStart = 7,
  kWaterQualityUnsaturated = 8,
  kWaterQualityOverland = 9,
  kWaterQualitySaturated = 10,
};

/// A type that engines can store.
struct ResultDataType {
  int newDataType = 0;  ///< Its code, which setups hold.
  int oldDataType = 0;  ///< An older code, unique with the sub type.
  int subType = 0;
  std::string_view name;
  int quantity = 0;  ///< 999 where it is undefined.
  int unit = 0;      ///< A unit key.
  ResultValueType valueType = ResultValueType::kInstantaneous;
  ResultGridKind gridKind = ResultGridKind::kNone;
  int fileCode = 0;  ///< A row of the result files; `kNoResultFile` for none.
  /// What brings it in: each alternative by itself. See `IsUnused`.
  std::array<RequirementMask, 4> alternatives = {};
  bool isHidden = false;  ///< Engines store it by themselves when it is needed.
  bool isWaterQualityInput = false;
  bool isWaterBalance = false;
  bool isMultiInstance = false;
  bool isMultiSpecies = false;
  bool isShown = true;  ///< False for what is only exchanged with other models.
  bool isExchangeInput = false;
  bool isExchangeOutput = false;

  static constexpr RequirementMask kUnused{~std::uint64_t{0}};
  /// The masks of a type without alternatives bring it into no setup.
  static constexpr bool IsUnused(RequirementMask alternative) { return alternative == kUnused; }
  /// An alternative is used, and the features hold all of it.
  constexpr bool ExistsFor(RequirementMask features) const { return AlternativeFor(features) >= 0; }
  /// The first alternative that the features fulfil, from 0; -1 for none.
  constexpr int AlternativeFor(RequirementMask features) const {
    for (std::size_t i = 0; i < alternatives.size(); ++i)
      if (!IsUnused(alternatives[i]) && features.Contains(alternatives[i])) return static_cast<int>(i);
    return -1;
  }
  /// Users may choose it.
  constexpr bool IsOffered() const { return isShown && !isHidden; }
};

inline constexpr int kNoResultFile = 32;

/// A result file.
struct ResultFile {
  int code = 0;  ///< Its place from 1.
  std::string_view description = {};
  std::string_view suffix = {};
  int dimensionCode = 0;
  int gridCode = 0;
  StoringClass storingClass = StoringClass::kPrecipitation;

  /// 2 or 3; 0 for a file without a grid.
  constexpr int Dimensions() const {
    switch (dimensionCode) {
      case 1:
      case 2:
      case 3:
      case 13:
        return 2;
      case 4:
      case 5:
      case 6:
      case 8:
        return 3;
      default:
        return 0;
    }
  }
};

/// The two tables, constants of the program.
std::span<const ResultDataType> AllResultTypes();
std::span<const ResultFile> AllResultFiles();

/// The tables with all that is asked of them. At first use they are held against their rules.
class ResultCatalogue {
 public:
  ResultCatalogue(std::span<const ResultDataType> types, std::span<const ResultFile> files);
  /// That of this program.
  static const ResultCatalogue& Own();

  /// Why the tables contradict themselves; empty where they do not. Every operation fails with it.
  const std::string& Problem() const { return problem_; }
  /// Null where there is none of that code.
  const ResultDataType* Find(int code) const;
  std::span<const ResultDataType> Types() const { return types_; }
  /// The file of a type; null where it has none.
  const ResultFile* FileOf(const ResultDataType& type) const;
  std::span<const ResultDataType* const> MultiInstanceTypes() const { return multiInstance_; }
  /// The types that users may choose, or those that engines store by themselves, in the order of the table.
  std::vector<const ResultDataType*> OfferedTypes(RequirementMask features) const;

  // ---- How many types, and which, exist for features; the codes must have room

  int GetNoDatatypesforComponent(RequirementMask features) const;
  CatalogueAnswer<int> GetDatatypesforComponent(RequirementMask features, std::span<int> codes) const;
  CatalogueAnswer<int> GetHiddenDatatypesforComponent(RequirementMask features, std::span<int> codes) const;
  CatalogueAnswer<int> GetOpenMIDatatypesforComponent(RequirementMask features, std::span<int> codes) const;
  CatalogueAnswer<int> GetHiddenOpenMIDatatypesforComponent(RequirementMask features, std::span<int> codes) const;

  // ---- For callers that know which features are meant, not whether they go together. The codes of the shown types,
  // those of the hidden ones, and one entry more, 0.

  CatalogueAnswer<std::vector<int>> GetDatatypesForLogicals_OneBigger(RequirementMask logicals) const;
  CatalogueAnswer<std::vector<int>> GetOpenMIDatatypesForLogicals_OneBigger(RequirementMask logicals) const;
  /// The same for what is exchanged in a water quality run.
  CatalogueAnswer<std::vector<int>> GetOpenMIDatatypesForWQLogicals_OneBigger(RequirementMask logicals) const;

  // ---- What a type is

  CatalogueAnswer<std::string> GetNameOfNewDataType(int code) const;
  CatalogueAnswer<bool> IsDataTypeWQInput(int code) const;
  CatalogueAnswer<bool> IsDataTypeWaterBalance(int code) const;
  /// A place of it has a depth.
  CatalogueAnswer<bool> IsDataType3D(int code) const;
  /// It is shown and always there, or an alternative holds all the features.
  CatalogueAnswer<bool> DataTypeDependsOn(int code, RequirementMask features) const;
  /// An alternative holds all the features, whether the type is shown or not.
  CatalogueAnswer<bool> DataTypeRequires(int code, RequirementMask features) const;
  CatalogueAnswer<bool> TvnResData_IsDataTypeMultiInstanceType(int code) const;
  CatalogueAnswer<bool> TvnResData_IsDataTypeMultiSpeciesType(int code) const;
  CatalogueAnswer<bool> TvnResData_IsDataTypeOpenMIInputQuantity(int code) const;
  CatalogueAnswer<bool> TvnResData_IsDataTypeOpenMIOutputQuantity(int code) const;
  int GetNoSubTypesOfOldDataType(int oldDataType) const;

  /// The file that holds a type, with its last folder in front and a backslash between, by the path of the index that
  /// engines leave beside their results.
  CatalogueAnswer<std::string> TvnRes_MakeFileNameForDataType(const std::string& fifPath, int code) const;

 private:
  using Filter = bool (*)(const ResultDataType& type);
  CatalogueAnswer<int> Fill(std::string_view operation, Filter filter, RequirementMask features,
                            std::span<int> codes) const;
  CatalogueAnswer<std::vector<int>> ForLogicals(RequirementMask start, RequirementMask logicals, Filter shown,
                                                Filter hidden) const;
  template <class Get>
  auto Ask(std::string_view operation, int code, const Get& get) const;

  std::span<const ResultDataType> types_;
  std::span<const ResultFile> files_;
  std::string problem_;
  std::vector<const ResultDataType*> byCode_;
  std::vector<const ResultDataType*> multiInstance_;
};

// What breaks the rules of the tables.
enum class TableFault { kNone, kCodeTwice, kOldCodeTwice, kFileOutOfPlace };
struct TableCheck {
  TableFault fault = TableFault::kNone;
  int code = 0;
};
/// The first fault of the tables, which the compiler asks, too.
constexpr TableCheck CheckResultTables(std::span<const ResultDataType> types, std::span<const ResultFile> files) {
  for (std::size_t i = 0; i < types.size(); ++i)
    for (std::size_t j = 0; j < i; ++j)
      if (types[i].newDataType == types[j].newDataType) return {TableFault::kCodeTwice, types[i].newDataType};
  for (std::size_t i = 0; i < types.size(); ++i)
    for (std::size_t j = 0; j < i; ++j)
      if (types[i].oldDataType == types[j].oldDataType && types[i].subType == types[j].subType)
        return {TableFault::kOldCodeTwice, types[i].oldDataType};
  for (std::size_t i = 0; i < files.size(); ++i)
    if (files[i].code != static_cast<int>(i) + 1) return {TableFault::kFileOutOfPlace, files[i].code};
  return {};
}

}  // namespace tervane
