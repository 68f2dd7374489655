// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/result_types.h"

#include <array>

#include <gtest/gtest.h>

#include "platform/units.h"
#include "results/feature_rules.h"

namespace tervane::result_types_test {
namespace {

// Nodes and methods of components bear these names, too.
using feature::kOverland;
using feature::kTwoLayer;

const ResultCatalogue& Own() { return ResultCatalogue::Own(); }

std::vector<int> CodesOf(CatalogueAnswer<int> (ResultCatalogue::*operation)(RequirementMask, std::span<int>) const,
                         RequirementMask features) {
  std::vector<int> codes(500);
  const auto answer = (Own().*operation)(features, codes);
  EXPECT_TRUE(answer.Ok()) << answer.error;
  codes.resize(static_cast<std::size_t>(answer.value));
  return codes;
}

TEST(ResultTypes, TheTableHoldsWhatItsTextTells) {
  ASSERT_EQ(Own().Problem(), "");
  ASSERT_EQ(Own().Types().size(), 371u);
  EXPECT_EQ(Own().Types().front().newDataType, 145);
  EXPECT_EQ(Own().Types().back().newDataType, 299);

  const ResultDataType& depth = *Own().Find(61);
  EXPECT_EQ(depth.name, "depth of overland water");
  EXPECT_EQ(std::pair(depth.oldDataType, depth.subType), std::pair(17, 1));
  EXPECT_EQ(std::pair(depth.quantity, depth.unit), std::pair(100280, 1000));
  EXPECT_EQ(depth.valueType, ResultValueType::kInstantaneous);
  EXPECT_EQ(depth.gridKind, ResultGridKind::kCells);
  EXPECT_TRUE(depth.isWaterQualityInput && depth.isWaterBalance && depth.isExchangeInput && depth.isExchangeOutput);
  EXPECT_FALSE(depth.isHidden || depth.isMultiInstance || depth.isMultiSpecies);
  EXPECT_TRUE(depth.isShown);
  EXPECT_EQ(Own().FileOf(depth)->suffix, "overland");
  const std::array<RequirementMask, 4> alternatives{
      feature::kWaterMovement | feature::kOverland, feature::kWaterMovement | feature::kSaturated,
      feature::kWaterMovement | feature::kSimpleOverland, ResultDataType::kUnused};
  EXPECT_EQ(depth.alternatives, alternatives);

  EXPECT_EQ(Own().Find(13)->name, "actual soil  evaporation") << "with two blanks";
  EXPECT_TRUE(Own().Find(92)->isHidden);
  EXPECT_FALSE(Own().Find(270)->isShown);
  EXPECT_EQ(Own().FileOf(*Own().Find(240)), nullptr);
  EXPECT_EQ(Own().Find(0), nullptr);
  EXPECT_EQ(Own().Find(372), nullptr);
  EXPECT_EQ(Own().GetNoSubTypesOfOldDataType(999010), 10);
  EXPECT_EQ(Own().MultiInstanceTypes().size(),
            static_cast<std::size_t>(std::ranges::count(Own().Types(), true, &ResultDataType::isMultiInstance)));
  EXPECT_GT(Own().MultiInstanceTypes().size(), 20u);
}

TEST(ResultTypes, EveryTypeHasAUnitOfItsQuantity) {
  for (const ResultDataType& type : Own().Types()) {
    const ItemType* quantity = FindItemType(type.quantity);
    ASSERT_TRUE(quantity) << type.newDataType;
    EXPECT_TRUE(FindUnit(type.unit)) << type.newDataType;
    EXPECT_TRUE(type.quantity == 999 || AllowsUnit(*quantity, type.unit)) << type.newDataType << " " << type.unit;
    EXPECT_TRUE(type.isShown || type.fileCode == kNoResultFile) << type.newDataType;
  }
}

TEST(ResultTypes, TablesThatContradictThemselvesAreTold) {
  ResultDataType type = *Own().Find(61), other = *Own().Find(62);
  const ResultFile files[] = {{1}, {2}}, shifted[] = {{1}, {3}};
  const auto problem = [&](const ResultDataType& second, std::span<const ResultFile> table) {
    const ResultDataType types[] = {type, second};
    const ResultCatalogue catalogue(types, table);
    EXPECT_EQ(catalogue.IsDataType3D(61).error, catalogue.Problem());
    return catalogue.Problem();
  };
  EXPECT_EQ(problem(other, files), "");
  EXPECT_EQ(problem(other, shifted), "TvnResfiledata: inconsistency in the FileArr filecodes/index");
  ResultDataType same = other;
  same.newDataType = 61;
  EXPECT_EQ(problem(same, files), "Programming error: new data type 61 appears more than once in the DataArr array.");
  same = other;
  same.oldDataType = 17;
  EXPECT_EQ(problem(same, files),
            "Programming error: old data type 17 appears more than once with the same sub datatype in the DataArr "
            "array.");
}

TEST(ResultTypes, FeaturesBringInTypes) {
  using namespace feature;
  struct Case {
    const char* what;
    RequirementMask features;
    std::vector<int> with, without;
  };
  const Case cases[] = {
      {"nothing but water movement", kWaterMovement, {10}, {61, 15, 145, 345}},
      {"no water movement", kOverland | kSaturated | kUnsaturated | kEvapotranspiration, {}, {10, 61, 15}},
      {"series know more", kOverland | kSeriesOnly, {145, 149}, {146, 10}},
      {"grids know less", kWaterMovement | kOverland, {61, 58}, {145, 149}},
      {"the second alternative", kWaterMovement | kTwoLayer | kEvapotranspiration, {15, 182, 17}, {13, 183, 119}},
      {"drainage of paved areas", kWaterMovement | kSaturatedDrainage | kPaved | kOverlandToUrban, {62}, {356}},
      {"a type without alternatives", RequirementMask(~std::uint64_t{0} >> 1), {61, 216}, {48, 54, 240, 92}},
  };
  for (const Case& one : cases) {
    SCOPED_TRACE(one.what);
    const std::vector<int> codes = CodesOf(&ResultCatalogue::GetDatatypesforComponent, one.features);
    EXPECT_EQ(static_cast<std::size_t>(Own().GetNoDatatypesforComponent(one.features)), codes.size());
    for (const int code : one.with) EXPECT_TRUE(std::ranges::find(codes, code) != codes.end()) << code;
    for (const int code : one.without) EXPECT_TRUE(std::ranges::find(codes, code) == codes.end()) << code;
  }
  // Each of the four lists has its types alone, in the order of the table.
  const RequirementMask river = kWaterMovement | kOverland | feature::kRiver;
  EXPECT_EQ(CodesOf(&ResultCatalogue::GetHiddenDatatypesforComponent, river),
            (std::vector{60, 92, 93, 94, 96, 249, 95, 347, 350, 351, 353, 354, 160, 161, 162, 165, 214, 215}));
  EXPECT_EQ(CodesOf(&ResultCatalogue::GetOpenMIDatatypesforComponent, kWaterMovement), (std::vector{10, 345, 346}));
  EXPECT_EQ(CodesOf(&ResultCatalogue::GetHiddenOpenMIDatatypesforComponent, river),
            (std::vector{60, 96, 249, 95, 347}));
}

TEST(ResultTypes, TooLittleRoomIsTold) {
  std::array<int, 1> codes{};
  const RequirementMask features = feature::kWaterMovement | feature::kOverland | feature::kRiver;
  EXPECT_EQ(Own().GetDatatypesforComponent(features, codes).error,
            "Programmimg error: ndim too small in call to GetDatatypesforComponent");
  EXPECT_EQ(Own().GetHiddenOpenMIDatatypesforComponent(features, codes).error,
            "Programmimg error: ndim too small in call to GetHiddenOpenMIDatatypesforComponent");
}

TEST(ResultTypes, ATypeIsAskedByItsCode) {
  using namespace feature;
  struct Case {
    CatalogueAnswer<bool> answer;
    bool expected;
  };
  const Case cases[] = {
      {Own().IsDataTypeWQInput(61), true},
      {Own().IsDataTypeWQInput(241), false},
      {Own().IsDataTypeWaterBalance(61), true},
      {Own().IsDataTypeWaterBalance(241), false},
      {Own().IsDataType3D(117), true},
      {Own().IsDataType3D(220), false},  // nodes of water quality have no depth
      {Own().IsDataType3D(61), false},
      {Own().DataTypeDependsOn(61, kSaturated), true},
      {Own().DataTypeDependsOn(58, kSaturated), false},
      {Own().DataTypeDependsOn(270, kSaturated), false},  // not shown
      {Own().DataTypeRequires(270, kSaturated), true},
      {Own().DataTypeRequires(48, kSaturated), false},  // its masks are unused, not full
      {Own().TvnResData_IsDataTypeMultiInstanceType(311), true},
      {Own().TvnResData_IsDataTypeMultiSpeciesType(311), false},
      {Own().TvnResData_IsDataTypeMultiSpeciesType(216), true},
      {Own().TvnResData_IsDataTypeOpenMIInputQuantity(346), true},
      {Own().TvnResData_IsDataTypeOpenMIOutputQuantity(346), false},
  };
  for (std::size_t i = 0; i < std::size(cases); ++i) {
    EXPECT_TRUE(cases[i].answer.Ok()) << i;
    EXPECT_EQ(cases[i].answer.value, cases[i].expected) << i;
  }
  EXPECT_EQ(Own().GetNameOfNewDataType(10).value, "precipitation rate");
  EXPECT_EQ(Own().GetNameOfNewDataType(999).error,
            "Program error : GetNameOfNewDataType called with non-existing newdatatype : 999");
  EXPECT_EQ(Own().DataTypeRequires(-1, kSaturated).error,
            "Program error : DataTypeRequires called with non-existing newdatatype : -1");

  ResultDataType always = *Own().Find(241);
  always.alternatives.fill(RequirementMask());
  const ResultCatalogue catalogue(std::span(&always, 1), AllResultFiles());
  EXPECT_EQ(catalogue.GetNoDatatypesforComponent({}), 1);
  EXPECT_TRUE(catalogue.DataTypeDependsOn(241, kSaturated).value);
  EXPECT_FALSE(catalogue.DataTypeRequires(241, kSaturated).value);
}

TEST(ResultTypes, NamesOfFilesFollowTheIndex) {
  struct Case {
    const char* index;
    int code;
    const char* file;
  };
  const Case cases[] = {
      {R"(D:\Work\Results\Run1.fif)", 61, R"(Results\Run1_overland.nds2)"},
      {R"(D:\Work\Results\Run1.fif)", 117, R"(Results\Run1_3DUZ.nds3)"},
      {R"(D:\Work\Results\Run1.fif)", 92, R"(Results\Run1.frf)"},
      {R"(D:\Work\Results\Run1.fif)", 350, R"(Results\Run1.RivEx)"},
      {R"(D:\Work\Results\Run1.fif)", 160, R"(Results\Run1.hot)"},
      {R"(D:\Work\Results\Run1.fif)", 307, R"(Results\Run1_OLMultiCell.nds2)"},
      {R"(/data/a.b/out\my.run.fif)", 369, R"(out\my.run_Flood.nds2)"},
      {"Run1.fif", 61, "Run1_overland.nds2"},
  };
  for (const Case& one : cases) {
    const auto answer = Own().TvnRes_MakeFileNameForDataType(one.index, one.code);
    EXPECT_EQ(answer.value, one.file) << answer.error;
  }
  EXPECT_EQ(Own().TvnRes_MakeFileNameForDataType("Run1.fif", 240).error,
            "Invalid filecode in GetResFileTypeforFileCode");
  EXPECT_EQ(Own().TvnRes_MakeFileNameForDataType("Run1.fif", 400).error,
            "Program error : TvnRes_MakeFileNameForDataType called with non-existing newdatatype : 400");

  const ResultFile flat[] = {{.code = 1, .suffix = "overland", .dimensionCode = 14}};
  const ResultCatalogue catalogue(std::span(Own().Find(61), 1), flat);
  EXPECT_EQ(catalogue.TvnRes_MakeFileNameForDataType("Run1.fif", 61).error,
            "ERROR in TvnRes_MakeFileNameForDataType:\n- data type, NrOfDimensions : 61 0");
}

TEST(ResultTypes, LogicalsListShownAndThenHiddenTypes) {
  using namespace feature;
  const RequirementMask logicals = kOverland | feature::kRiver;
  std::vector<int> expected = CodesOf(&ResultCatalogue::GetDatatypesforComponent, logicals | kWaterMovement);
  for (const int code : CodesOf(&ResultCatalogue::GetHiddenDatatypesforComponent, logicals | kWaterMovement))
    expected.push_back(code);
  expected.push_back(0);
  EXPECT_EQ(Own().GetDatatypesForLogicals_OneBigger(logicals).value, expected);
  EXPECT_EQ(Own().GetOpenMIDatatypesForLogicals_OneBigger({}).value, (std::vector{10, 345, 346, 0}));
  EXPECT_EQ(Own().GetOpenMIDatatypesForWQLogicals_OneBigger(feature::kRiver).value, (std::vector{289, 348, 0}));
  const auto broken = Own().GetDatatypesForLogicals_OneBigger(kEvapotranspiration);
  EXPECT_EQ(broken.error, "ET requires UZ");
  EXPECT_TRUE(broken.value.empty());
}

}  // namespace
}  // namespace tervane::result_types_test
