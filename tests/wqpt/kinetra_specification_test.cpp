// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "wqpt/kinetra_specification.h"

#include <regex>
#include <set>

#include <gmock/gmock.h>

#include "core/undo.h"
#include "tests/support/temp_folder.h"
#include "tests/wqpt/quality_setup.h"
#include "wqpt/kinetra_parameters.h"
#include "wqpt/kinetra_values.h"
#include "wqpt/species.h"

namespace tervane::kinetra_specification_test {
namespace {

using test::QualitySetup;
using testing::ElementsAre;
using testing::IsEmpty;

std::string Lines(std::string text) {
  std::ranges::replace(text, ';', '\n');
  return text;
}

/// A template with these sections.
std::string TemplateText(const std::string& sections) { return Lines("target KINETRA_SETUP { " + sections + " }"); }

const std::string kOxygen = TemplateText(
    "section STATE_VARIABLES { section STATE_VARIABLE_1 { SYMBOL = \"O2\"; QTY_TYPE = 100007; TRANSPORT = "
    "\"ADVECTION_DISPERSION\"; SCOPE = \"WC\"; } section STATE_VARIABLE_2 { SYMBOL = \"O2_2\"; } section "
    "STATE_VARIABLE_3 { SYMBOL = \"_2\"; } section STATE_VARIABLE_5 { SYMBOL = \"late\"; } } "
    "section CONSTANTS { section CONSTANT_1 { SYMBOL = \"k1\"; IS_USER_SPECIFIED = \"yes\"; QTY_TYPE = 4711; UNIT = "
    "\"per day\"; DEFAULT_VALUE = 0.5; } section CONSTANT_2 { SYMBOL = \"dens\"; BUILT_IN_ID = 54; } } "
    "section FORCINGS { section FORCING_1 { SYMBOL = \"temp\"; BUILT_IN_ID = 55; } section FORCING_2 { SYMBOL = "
    "\"light\"; BUILT_IN_ID = 23; IS_USER_SPECIFIED = \"NO\"; } } "
    "section PROCESSES { section PROCESS_1 { SYMBOL = \"p\"; EXPRESSION = \"k1 * \\\"O2\\\"\"; OUTPUT = \"yes\"; "
    "SPATIAL_VARIATION = \"HORISONTAL\"; } } "
    "section DERIVED_OUTPUTS { section DERIVED_OUTPUT_1 { EXPRESSION = \"2*p\"; } } "
    "section STATE_VARIABLE_EQUATIONS { section STATE_VARIABLE_EQUATION_1 { O2 = \"-\\\"p\\\"\"; } }");

class Kinetra : public testing::Test {
 public:
  /// A setup whose compartments of those keys take the template; they and water quality are on.
  std::string Sections(const std::string& compartments) {
    std::string keys;
    for (const char* zone : {"OL", "UZ", "SZ"})
      if (compartments.find(zone) != std::string::npos)
        keys += std::string("Kinetra_") + zone + " = 1; TemplateFile_" + zone + " = file \"" + path_ +
                "\", 1, 1, 1, 1, 1, 1; ";
    return "section SimSpec { section ModelComp { WQ = 1; } } section ModelCompWQ { OL = 1; UZ = 1; SZ = 1; "
           "IncludeProcesses = 1; ProcessType = 1; } section KinetraTemplateSpecification { " +
           keys;
  }
  std::vector<std::string> NamesIn(QualitySetup& setup, const std::string& path) {
    std::vector<std::string> names;
    auto& list = setup.At<CYbSEKvfListBaseInterface>(path);
    for (int number = 1; number <= list.GetItemCount(); ++number)
      names.push_back(list.GetItemNode(number)->GetAbbreviatedTitle());
    return names;
  }

  test::TempFolder folder_;
  std::string path_ = folder_.Write("oxygen.kinetra", kOxygen);
};

TEST_F(Kinetra, ATemplateIsReadDeclarationByDeclaration) {
  // What was written just now is not kept.
  std::filesystem::last_write_time(path_, std::filesystem::file_time_type::clock::now() - std::chrono::hours(1));
  const auto read = ReadKinetraTemplate(path_);
  ASSERT_EQ(read->problem, "");
  ASSERT_EQ(read->stateVariables.size(), 3U);  // Until a number is missing.
  EXPECT_EQ(read->stateVariables[0].spatialKind, 3);
  EXPECT_EQ(read->stateVariables[1].spatialKind, 2);
  EXPECT_EQ(read->stateVariables[0].expression, "-p");
  EXPECT_GT(read->stateVariables[0].minimum, read->stateVariables[0].maximum);  // No range.
  EXPECT_THAT(read->Transported(), ElementsAre(0));
  EXPECT_EQ(read->constants[0].quantity, 999);
  EXPECT_EQ(read->constants[0].unitText, "per day");
  EXPECT_TRUE(read->constants[0].isUserSpecified);
  EXPECT_EQ(read->constants[0].spatialKind, 2);
  EXPECT_TRUE(read->forcings[1].isUserSpecified);  // Whatever the file says.
  EXPECT_EQ(read->processes[0].expression, "k1 * O2");
  ASSERT_EQ(read->Outputs().size(), 2U);
  EXPECT_EQ(read->Outputs()[0]->symbol, "p");
  EXPECT_EQ(ReadKinetraTemplate(path_), read) << "two who name one file share it";
}

TEST_F(Kinetra, TheTemplateToBeginWithIsWhole) {
  const std::string path = TERVANE_SOURCE_DIR "/examples/oxygen.kinetra";
  const auto read = ReadKinetraTemplate(path);
  ASSERT_EQ(read->problem, "");
  EXPECT_THAT(read->Oddities(), IsEmpty());
  EXPECT_THAT(read->Transported(), ElementsAre(0, 1, 2, 3));
  EXPECT_EQ(read->derivedOutputs.size(), 2U);

  // Each value begins within its range, in a unit that it has; each expression names what is declared ahead of it.
  std::set<std::string> known = {"MAX", "EXP"};
  for (const auto* items : {&read->stateVariables, &read->constants, &read->forcings})
    for (const CKinetraSolverItem& item : *items) {
      SCOPED_TRACE(item.symbol);
      known.insert(item.symbol);
      if (item.minimum > item.maximum) continue;  // No range.
      EXPECT_GE(item.defaultValue, item.minimum);
      EXPECT_LE(item.defaultValue, item.maximum);
      EXPECT_EQ(item.isUserSpecified, item.kind != KinetraItemKind::StateVariable && !item.IsModelParameter());
    }
  const std::regex symbol("[A-Za-z][A-Za-z0-9]*|[0-9.]+(E[0-9]+)?");
  const auto check = [&](const CKinetraSolverItem& item) {
    SCOPED_TRACE(item.description);
    EXPECT_NE(item.expression, "");
    for (auto found = std::sregex_iterator(item.expression.begin(), item.expression.end(), symbol);
         found != std::sregex_iterator(); ++found)
      if (std::isalpha(static_cast<unsigned char>(found->str()[0])) != 0) {
        EXPECT_TRUE(known.contains(found->str())) << found->str();
      }
    if (!item.symbol.empty()) known.insert(item.symbol);
  };
  for (const auto* items : {&read->auxiliaries, &read->processes, &read->derivedOutputs, &read->stateVariables})
    std::ranges::for_each(*items, check);

  // It takes from the model what its compartment has.
  std::filesystem::copy_file(path, folder_.File("whole.kinetra"));
  path_ = folder_.File("whole.kinetra");
  QualitySetup setup(
      Sections("OL") +
      "section OL_Constants { NumberOfConstants = 1; Constant = \"Altitude\", 1030, 1000; } section OL_Forcings { "
      "NumberOfForcings = 2; Forcing = \"Temperature\", 2020, 2800; Forcing = \"Depth\", 2040, 1000; } } ");
  EXPECT_EQ(setup.At<CSpeciesListKvf>("Species").Names(),
            (std::vector<std::string>{"Oxygen", "Ammonium", "Nitrate", "OrganicMatter"}));
  EXPECT_THAT(NamesIn(setup, "Overland/KinetraForcings"), ElementsAre("Litter"));
  EXPECT_THAT(NamesIn(setup, "Overland/KinetraConstants"), testing::SizeIs(read->constants.size() - 1));
  const auto& spec = setup.At<CKinetraSpecKvf>("KinetraTemplateSpecification");
  for (const int code : {1030, 2020, 2040}) EXPECT_TRUE(spec.IsBuiltInUsed(code)) << code;
}

TEST_F(Kinetra, WhatIsNoTemplateIsEmptyAndSaysWhy) {
  const std::pair<const char*, const char*> cases[] = {
      {"target OTHER {\n}", "KINETRA_SETUP"}, {"target KINETRA_SETUP {\n", "1:"}, {"", "empty"}};
  int number = 0;
  for (const auto& [text, told] : cases) {
    const auto read = ReadKinetraTemplate(folder_.Write("t" + std::to_string(++number) + ".kinetra", text));
    EXPECT_THAT(read->problem, testing::HasSubstr(told));
    EXPECT_THAT(read->stateVariables, IsEmpty());
  }
  EXPECT_NE(ReadKinetraTemplate(folder_.File("none.kinetra"))->problem, "");
  EXPECT_NE(ReadKinetraTemplate(folder_.Path())->problem, "");
  EXPECT_EQ(ReadKinetraTemplate("")->problem, "");
  EXPECT_THAT(ReadKinetraTemplate(
                  folder_.Write("case.kinetra", TemplateText("section CONSTANTS { section CONSTANT_1 { SYMBOL = \"a\"; "
                                                             "} section CONSTANT_2 { SYMBOL = \"A\"; } }")))
                  ->Oddities(),
              ElementsAre(testing::HasSubstr("symbol A")));
  // Behind a number that is missing nothing is read, which is told.
  const auto cut = ReadKinetraTemplate(folder_.Write(
      "gap.kinetra", TemplateText("section CONSTANTS { section CONSTANT_1 { SYMBOL = \"a\"; } section CONSTANT_3 { "
                                  "SYMBOL = \"c\"; } section CONSTANT_4 { SYMBOL = \"d\"; } }")));
  EXPECT_THAT(cut->constants, testing::SizeIs(1));
  EXPECT_EQ(cut->gap, "CONSTANT_2 is missing, so that 2 sections behind it are not read");
}

TEST_F(Kinetra, OpeningBringsSpeciesAndValuesOfActiveCompartments) {
  QualitySetup setup(Sections("OL SZ") + "} ");
  EXPECT_FALSE(setup.IsModified());
  EXPECT_EQ(setup.At<CSpeciesListKvf>("Species").Names(), (std::vector<std::string>{"O2", "_2"}));
  EXPECT_EQ(NamesIn(setup, "Overland/KinetraConstants"), std::vector<std::string>{"k1"});
  EXPECT_EQ(NamesIn(setup, "Overland/KinetraForcings"), std::vector<std::string>{"light"});
  EXPECT_EQ(NamesIn(setup, "SaturatedZone/SatWQLayers/WQLayer_1/KinetraConstants"), std::vector<std::string>{"k1"});
  EXPECT_THAT(NamesIn(setup, "Unsatzone/KinetraConstants"), IsEmpty());
  EXPECT_EQ(setup.At<CYbSEKvfBase>("Overland/KinetraConstants/Constant_1").GetTitle(), "Kinetra constant, k1");
  EXPECT_EQ(setup.AreUsed({"KinetraTemplateSpecification", "Overland/KinetraConstants", "Unsatzone/KinetraConstants",
                           "SaturatedZone/SatWQLayers", "KinetraTemplateSpecification/UZ_Constants"}),
            "11010");
  EXPECT_THAT(setup.Report().entries, testing::SizeIs(6));
  setup.At<CYbSEKvfListBaseInterface>("SaturatedZone/SatWQLayers").AddItemNode();
  EXPECT_EQ(NamesIn(setup, "SaturatedZone/SatWQLayers/WQLayer_2/KinetraForcings"), std::vector<std::string>{"light"});
}

TEST_F(Kinetra, BindingsStayWithTheirSymbolsAndUndoBringsThemBack) {
  QualitySetup setup(
      Sections("OL") +
      "section OL_Constants { NumberOfConstants = 2; Constant = \"DENS\", 1110, 2203; Constant = "
      "\"gone\", 1, 2; } section OL_Forcings { NumberOfForcings = 1; Forcing = \"temp\", 2020, 2800; } } ");
  auto& spec = setup.At<CKinetraSpecKvf>("KinetraTemplateSpecification");
  std::string report;
  for (const LoadReport::Entry& entry : setup.Report().entries) report += entry.text + "\n";
  EXPECT_THAT(report, testing::HasSubstr("is not defined in the referenced Kinetra template file"));
  EXPECT_THAT(report, testing::HasSubstr("the template does not declare gone"));
  EXPECT_EQ(setup.WrittenKeys("KinetraTemplateSpecification/OL_Constants"),
            "NumberOfConstants=2 Constant=\"k1\", -1, -1 Constant=\"dens\", 1110, 2203");
  EXPECT_TRUE(spec.IsBuiltInUsed(1110));
  EXPECT_TRUE(spec.IsBuiltInUsed(2020));
  EXPECT_FALSE(spec.IsBuiltInUsed(2030));

  UndoStack undo(setup.Root());
  const std::string before = test::SavedText(setup);
  const std::string other = folder_.Write(
      "other.kinetra", TemplateText("section CONSTANTS { section CONSTANT_1 { SYMBOL = \"k9\"; IS_USER_SPECIFIED = "
                                    "\"YES\"; } section CONSTANT_2 { SYMBOL = \"Dens\"; BUILT_IN_ID = 54; } }"));
  spec.SetTemplate(kKinetraOverland, FileName(other, {}), true);
  undo.Commit("Change Template");
  EXPECT_EQ(spec.Solver(kKinetraOverland).constants[1].dataType, 1110);
  EXPECT_FALSE(spec.IsBuiltInUsed(2020));
  // Values of symbols that are gone stay.
  EXPECT_EQ(NamesIn(setup, "Overland/KinetraConstants"), (std::vector<std::string>{"k1", "k9"}));
  std::filesystem::remove(path_);
  undo.Undo();
  EXPECT_TRUE(spec.IsBuiltInUsed(2020));
  EXPECT_EQ(spec.Solver(kKinetraOverland).Content().constants.front().symbol, "k1");
  undo.Redo();
  EXPECT_FALSE(spec.IsBuiltInUsed(2020));
  // The same file in another case is no other one for overland flow.
  spec.SetTemplate(kKinetraOverland, FileName(LowerCase(other), {}), true);
  EXPECT_EQ(spec.Solver(kKinetraOverland).file.Text(), other);
}

TEST_F(Kinetra, TheTimeOfTheTemplateIsWrittenAndNeverRead) {
  QualitySetup setup(Sections("OL UZ") + "} ");
  const std::string place = "KinetraTemplateSpecification:TemplateFile_OL";
  EXPECT_THAT(setup.Written(place), testing::MatchesRegex(".*kinetra\", 20[0-9][0-9], [0-9]+, [0-9]+, .*"));
  std::filesystem::remove(path_);
  EXPECT_THAT(setup.Written(place), testing::EndsWith("-1, -1, -1, -1, -1, -1"));
  EXPECT_THAT(setup.Written("KinetraTemplateSpecification:TemplateFile_SZ"),
              testing::EndsWith("-1, -1, -1, -1, -1, -1"));
}

TEST_F(Kinetra, ParametersExistByCompartment) {
  const auto codes = [](std::uint64_t mask) {
    std::vector<int> found;
    for (int n = 1; n <= GetNoKinetraConstants(mask); ++n) found.push_back(GetKinetraConstant(mask, n).idCode);
    return found;
  };
  EXPECT_THAT(codes(kNeedsOverland), ElementsAre(1010, 1030, 1040));
  EXPECT_THAT(codes(kNeedsUnsaturated), ElementsAre(1010, 1020, 1030, 1050, 1060, 1070, 1110));
  EXPECT_THAT(codes(kNeedsUnsaturated | kNeedsMacropores),
              ElementsAre(1010, 1020, 1030, 1050, 1060, 1070, 1080, 1110, 1120));
  EXPECT_THAT(codes(kNeedsSaturated | kNeedsSecondaryPorosity),
              ElementsAre(1010, 1020, 1030, 1050, 1060, 1090, 1100, 1110, 1120));
  EXPECT_EQ(GetNoKinetraForcings(kNeedsSaturated), 8);
  EXPECT_EQ(GetKinetraForcing(kNeedsOverland, 99).name, "Undefined");
  EXPECT_EQ(GetKinetraForcing(kNeedsOverland, 0).idCode, -1);
  QualitySetup setup("section Unsatzone { Bypass = 2; } section SaturatedZone { MassTransferToImmobileWater = 1; }");
  EXPECT_EQ(setup.At<CKinetraCompSpecKvf>("KinetraTemplateSpecification/UZ_Forcings").Mask(),
            kNeedsUnsaturated | kNeedsMacropores);
  EXPECT_EQ(setup.At<CKinetraCompSpecKvf>("KinetraTemplateSpecification/SZ_Forcings").Mask(),
            kNeedsSaturated | kNeedsSecondaryPorosity);
}

}  // namespace
}  // namespace tervane::kinetra_specification_test
