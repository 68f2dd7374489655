// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The tables of the catalogue: the types out of their text, which the compiler reads, and the files.
#include <algorithm>

#include "result_types_text.h"
#include "results/result_types.h"

namespace tervane {
namespace {

constexpr std::string_view kShortSuffix = " simulation";

/// The part of a text up to a separator; the text goes on behind it.
constexpr std::string_view CutOff(std::string_view& text, std::string_view separator) {
  const std::size_t end = text.find(separator);
  const std::string_view part = text.substr(0, end);
  text = end == std::string_view::npos ? std::string_view() : text.substr(end + separator.size());
  return part;
}

constexpr int WholeNumber(std::string_view text) {
  if (text.empty()) throw "a number is missing";
  int number = 0;
  for (const char digit : text) {
    if (digit < '0' || digit > '9') throw "not a whole number";
    number = number * 10 + (digit - '0');
  }
  return number;
}

constexpr RequirementMask FeatureNamed(std::string_view word) {
  for (const ModelFeature& row : kModelFeatures)
    if (row.name == word || (row.name.ends_with(kShortSuffix) && row.name.starts_with(word) &&
                             row.name.size() == word.size() + kShortSuffix.size()))
      return row.bit;
  throw "there is no feature of that name";
}

constexpr std::array<RequirementMask, 4> ReadNeeds(std::string_view text) {
  std::array<RequirementMask, 4> alternatives;
  alternatives.fill(ResultDataType::kUnused);
  for (std::size_t count = 0; !text.empty(); ++count) {
    std::string_view way = CutOff(text, " or ");
    alternatives.at(count) = RequirementMask();
    while (!way.empty()) alternatives[count] |= FeatureNamed(CutOff(way, "+"));
  }
  return alternatives;
}

constexpr void ReadFlags(std::string_view flags, ResultDataType& type) {
  for (const char flag : flags) switch (flag) {
      case 'H':
        type.isHidden = true;
        break;
      case 'Q':
        type.isWaterQualityInput = true;
        break;
      case 'B':
        type.isWaterBalance = true;
        break;
      case 'I':
        type.isMultiInstance = true;
        break;
      case 'S':
        type.isMultiSpecies = true;
        break;
      case 'X':
        type.isShown = false;
        break;
      case 'i':
        type.isExchangeInput = true;
        break;
      case 'o':
        type.isExchangeOutput = true;
        break;
      default:
        throw "there is no such flag";
    }
}

constexpr ResultDataType ReadType(std::string_view line) {
  ResultDataType type;
  type.newDataType = WholeNumber(CutOff(line, "|"));
  type.oldDataType = WholeNumber(CutOff(line, "."));
  type.subType = WholeNumber(CutOff(line, "|"));
  type.name = CutOff(line, "|");
  type.quantity = WholeNumber(CutOff(line, "/"));
  type.unit = WholeNumber(CutOff(line, "|"));
  const std::string_view value = CutOff(line, "|");
  if (value != "I" && value != "M") throw "a value is I or M";
  type.valueType = value == "I" ? ResultValueType::kInstantaneous : ResultValueType::kMeanOfStep;
  type.gridKind = static_cast<ResultGridKind>(WholeNumber(CutOff(line, "|")));
  type.fileCode = WholeNumber(CutOff(line, "|"));
  ReadFlags(CutOff(line, "|"), type);
  type.alternatives = ReadNeeds(line);
  return type;
}

constexpr bool IsRow(std::string_view line) { return !line.empty() && !line.starts_with('#'); }

constexpr std::size_t CountRows(std::string_view text) {
  std::size_t count = 0;
  while (!text.empty()) count += IsRow(CutOff(text, "\n")) ? 1 : 0;
  return count;
}

template <std::size_t count>
constexpr std::array<ResultDataType, count> ReadTypes(std::string_view text) {
  std::array<ResultDataType, count> types;
  for (std::size_t i = 0; !text.empty();)
    if (const std::string_view line = CutOff(text, "\n"); IsRow(line)) types[i++] = ReadType(line);
  return types;
}

constexpr auto kResultTypes = ReadTypes<CountRows(kResultTypesText)>(kResultTypesText);

constexpr ResultFile kResultFiles[] = {
    {1, "Overland results", "overland", 1, 10001, StoringClass::kOverland},
    {2, "Old snowmelt results (D2nuz)", "snowmelt", 2, 10002, StoringClass::kPrecipitation},
    {3, "3D SZ results", "3DSZ", 4, 10005, StoringClass::kHeads},
    {4, "3D SZ flow results", "3DSZflow", 4, 10004, StoringClass::kFluxes},
    {5, "2D SZ results", "2DSZ", 1, 10001, StoringClass::kHeads},
    {6, "2D SZ flow results", "2DSZflow", 1, 10001, StoringClass::kFluxes},
    {7, "ET results", "ET_AllCells", 1, 10001, StoringClass::kPrecipitation},
    {8, "ET results", "ET_UzCells", 2, 10002, StoringClass::kPrecipitation},
    {9, "3D UZ results", "3DUZ", 5, 10003, StoringClass::kPrecipitation},
    {10, "2D UZ results", "2DUZ_AllCells", 1, 10001, StoringClass::kPrecipitation},
    {11, "2D UZ results", "2DUZ_UzCells", 2, 10002, StoringClass::kPrecipitation},
    {12, "Crop growth results", "cropgrowth", 1, 10001, StoringClass::kPrecipitation},
    {13, "Erosion results", "erosion", 1, 10001, StoringClass::kOverland},
    {14, "3D Irrigation results", "3Dirrigation", 4, 10006, StoringClass::kPrecipitation},
    {15, "2D Irrigation results", "2Dirrigation", 1, 10001, StoringClass::kPrecipitation},
    {16, "Wetland results", "wetland", 1, 10001, StoringClass::kPrecipitation},
    {17, "Extra results (old TVD binary)", "frf", 14, 0, StoringClass::kOldResults},
    {18, "3D SZ boundary data", "3DSZBnd", 8, -1, StoringClass::kHeads},
    {19, "LR (old TVD binary)", "LinearRes", 14, 0, StoringClass::kHeads},
    {20, "simple OC (old TVD binary)", "SimpleOL", 14, 0, StoringClass::kOverland},
    {21, "Hotstart data (old TVD binary)", "hot", 14, 0, StoringClass::kHotStart},
    {22, "WQ Overland results", "WQ_Overland", 1, 10001, StoringClass::kWaterQualityOverland},
    {23, "WQ 2D UZ results", "WQ_2DUZ", 3, 10002, StoringClass::kWaterQualityUnsaturated},
    {24, "WQ 3D UZ results", "WQ_3DUZ", 6, 10003, StoringClass::kWaterQualityUnsaturated},
    {25, "WQ SZ results", "WQ_3DSZ", 4, 10006, StoringClass::kWaterQualitySaturated},
    {26, "PT SZ results", "PT_3DSZ", 4, 10006, StoringClass::kWaterQualitySaturated},
    {27, "Snow Melt results", "SnowMelt", 1, 10001, StoringClass::kPrecipitation},
    {28, "WQ 2D SZ results", "WQ_2DSZ", 1, 10001, StoringClass::kWaterQualitySaturated},
    {29, "Overland Multi-Cell results", "OLMultiCell", 13, 0, StoringClass::kOverland},
    {30, "River exchange flows", "RivEx", 14, 0, StoringClass::kRiverExchange},
    {31, "", "Flood", 1, 1, StoringClass::kOverland},
};

// ---- What the tables must be

static_assert(CheckResultTables(kResultTypes, kResultFiles).fault == TableFault::kNone);
static_assert(std::ranges::all_of(kResultTypes,
                                  [](const ResultDataType& type) {
                                    return type.newDataType >= 1 &&
                                           type.newDataType <= static_cast<int>(std::size(kResultTypes)) &&
                                           type.subType >= 1 && !type.name.empty() && type.name.size() <= 128;
                                  }),
              "the codes are 1 to the number of types, and names have at most 128 bytes");
static_assert(std::ranges::all_of(kResultTypes,
                                  [](const ResultDataType& type) {
                                    return type.fileCode >= 1 && type.fileCode <= kNoResultFile;
                                  }),
              "each type names a row of the files, or none");

}  // namespace

std::span<const ResultDataType> AllResultTypes() { return kResultTypes; }
std::span<const ResultFile> AllResultFiles() { return kResultFiles; }

}  // namespace tervane
