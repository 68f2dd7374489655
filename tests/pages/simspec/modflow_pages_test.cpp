// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/simspec/modflow_pages.h"

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "pages/page_table.h"
#include "simspec/basic_parameters.h"
#include "simspec/modflow_output.h"
#include "simspec/modflow_solvers.h"
#include "simspec/pages.h"
#include "tests/support/page_driver.h"
#include "tests/support/setup.h"

namespace tervane::modflow_pages_test {
namespace {

using test::PageDriver;
using test::SetupText;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::SizeIs;

constexpr const char* kSolverPath = "SimSpec/CompControlParaModSZ";
constexpr const char* kOutputPath = "OutputModflow";

/// A setup with an engine, a solver and an option of the output.
class OpenSetup : public CFlowModelDoc {
 public:
  explicit OpenSetup(int engine, int solver = 0, int output = 0) {
    Require(OpenText(SetupText(14, fmt::format("section SimSpec {{\nModelType = {}\nsection CompControlParaModSZ "
                                               "{{\nSolverOption = {}\n}}\n}}\nsection OutputModflow "
                                               "{{\nOutputControlOption = {}\n}}",
                                               engine, solver, output)),
                     "a.tvd"));
  }
  void SetEngine(int engine) const { Root().Important(kBasicParameters)->ModelType = engine; }
  std::string Value(const char* key) const { return test::ValueOf(*this, key); }

 private:
  static void Require(bool isOpen) {
    if (!isOpen) throw std::runtime_error("the setup cannot be opened");
  }
};

TEST(ModflowPages, AnEngineOffersItsSolvers) {
  const std::string sor = "Slice-Successive Overrelaxation (SOR)", sip = "Strongly Implicit Procedure (SIP)",
                    pcg4 = "Preconditioned Conjugate Gradient with Newton-Raphson (PCG4)",
                    pcg2 = "Preconditioned Conjugate Gradient (PCG2)", lmg = "Link Multi-Grid (LMG)";
  struct Case {
    int engine;
    std::vector<std::string> offered;
    std::vector<const char*> values;
  };
  const Case cases[] = {{1, {sor, sip, pcg4, pcg2}, {"0", "1", "2", "3"}},
                        {2, {sor, sip, pcg2}, {"0", "1", "3"}},
                        {3, {sor, sip, pcg2, lmg}, {"0", "1", "3", "4"}}};
  // A label of each solver alone, by the value of the option.
  const char* labels[] = {"Printout interval for maximum head change", "Number of iteration parameters",
                          "Backtracking factor", "Relaxation Parameter", "Budget closure criterion"};
  for (const Case& c : cases) {
    OpenSetup setup(c.engine);
    PageDriver page(setup, kSolverPath);
    EXPECT_EQ(page.Find("Solver").Options(), c.offered);
    for (std::size_t i = 0; i < c.values.size(); ++i) {
      EXPECT_EQ(page.Enter("Solver", std::to_string(i)), "");
      EXPECT_EQ(setup.Value("SimSpec/CompControlParaModSZ:SolverOption"), c.values[i]);
      EXPECT_EQ(page.Find("Solver").Text(), std::to_string(i));
      EXPECT_THAT(page.Text(), HasSubstr(labels[*c.values[i] - '0']));
    }
  }
}

TEST(ModflowPages, AChoiceThatTheEngineDoesNotHaveIsMendedWhenItsPageIsShown) {
  struct Case {
    const char* path;
    int engine, solver, output;
    const char *key, *before, *after;
  };
  const Case cases[] = {{kSolverPath, 2, 2, 0, "SimSpec/CompControlParaModSZ:SolverOption", "2", "0"},
                        {kSolverPath, 3, 7, 0, "SimSpec/CompControlParaModSZ:SolverOption", "7", "0"},
                        {kSolverPath, 1, 2, 0, "SimSpec/CompControlParaModSZ:SolverOption", "2", "2"},
                        {kSolverPath, 0, 2, 0, "SimSpec/CompControlParaModSZ:SolverOption", "2", "2"},
                        {kOutputPath, 2, 0, 0, "OutputModflow:OutputControlOption", "0", "1"},
                        {kOutputPath, 3, 0, 2, "OutputModflow:OutputControlOption", "2", "2"},
                        {kOutputPath, 1, 0, 0, "OutputModflow:OutputControlOption", "0", "0"}};
  for (const Case& c : cases) {
    OpenSetup setup(c.engine, c.solver, c.output);
    CYbSEKvfBase& node = *FindNode(setup.Root(), ParseSetupPath(c.path).steps);
    test::ScriptedHost host;
    MakePageToRead(*node.GetDlgRuntimeClass(kSetupDataTree), node, {setup, host, {}});
    EXPECT_EQ(setup.Value(c.key), c.before) << "to read a page changes nothing";
    PageDriver page(setup, c.path);
    EXPECT_EQ(setup.Value(c.key), c.after) << c.key;
    EXPECT_EQ(page.Changes().empty(), std::string(c.before) == c.after);
  }
}

TEST(ModflowPages, DampingAndStorageHaveFieldsOfTheirOwn) {
  OpenSetup setup(3, kSolverLMG);
  PageDriver page(setup, kSolverPath);
  const char *least = "Minimum damping value", *value = "Damping value (1.0 = no damping)";
  for (const auto& [kind, hasLimits, hasValue, inFile] :
       {std::tuple{"0", false, false, "-1f"}, {"1", true, false, "-2f"}, {"2", false, true, "0.5f"}}) {
    page.Enter(value, "0.5");
    page.Enter("DAMP", kind);
    EXPECT_EQ(page.IsEnabled(least), hasLimits);
    EXPECT_EQ(page.IsEnabled(value), hasValue);
    EXPECT_THAT(std::string(inFile), HasSubstr(setup.Value("SimSpec/CompControlParaModSZ/CompControlParaModLMG:DAMP")));
  }
  EXPECT_FALSE(page.IsEnabled("Storage for IG matrix"));
  page.Enter("Use defaults (recommended)", "0");
  EXPECT_TRUE(page.IsEnabled("Storage for IG matrix"));
  page.Enter("Storage for IG matrix", "7");
  page.Enter("Use defaults (recommended)", "1");
  EXPECT_EQ(page.Find("Storage for IG matrix").Text(), "5.4");
}

TEST(ModflowPages, PackagesFollowTheWayOfFlow) {
  struct Case {
    int engine, subsurface, type;
    bool weights, rewets;
  };
  const Case cases[] = {{1, 1, 0, false, false}, {1, 1, 1, false, true}, {1, 1, 2, true, false},
                        {1, 1, 3, true, false},  {2, 1, 1, false, true}, {2, 1, 0, false, false},
                        {3, 0, 1, false, false}, {1, 0, 2, false, false}};
  for (const Case& c : cases) {
    CFlowModelDoc document;
    ASSERT_TRUE(document.OpenText(
        SetupText(14, fmt::format("section SimSpec {{\nModelType = {}\nsection ModModelComp {{\nSubsurface = "
                                  "{}\nSubsurface_ModelType = {}\n}}\n}}",
                                  c.engine, c.subsurface, c.type)),
        "a.tvd"));
    PageDriver page(document, "SimSpec/CompControlParaModPackage");
    EXPECT_EQ(page.IsEnabled("WeightingRelPermOption"), c.weights) << c.engine << c.type;
    for (const char* label : {"Use wetting threshold for re-wetting cells", "Wetting factor (WETFCT)",
                              "Head assigned to cells that turns dry (HDRY)"})
      EXPECT_EQ(page.IsEnabled(label), c.rewets) << c.engine << c.type;
  }
}

/// The table of a page with that head of its first column.
TableForm& TableWith(PageDriver& page, std::string_view head) {
  TableForm* found = nullptr;
  page.Page().Form().ForEach([&](Control& control) {
    if (control.table && control.table->Head(1) == head) found = control.table.get();
  });
  if (!found) throw std::runtime_error("no table with " + std::string(head));
  return *found;
}

TEST(ModflowPages, OutputIsByDatesOrTimeStepsAsTheEngineHasIt) {
  OpenSetup setup(1, 0, 0);
  {
    PageDriver page(setup, kOutputPath);
    for (const auto& [option, dt, n, dates] :
         {std::tuple{"0", true, false, false}, {"1", false, true, false}, {"2", false, false, true}}) {
      page.Enter("OutputControlOption", option);
      EXPECT_EQ(page.IsEnabled("dt ="), dt);
      EXPECT_EQ(page.IsEnabled("n ="), n);
      page.Page().Form().ForEach([&](Control& control) {
        if (!control.table || control.table->Head(1) == "ASCII") return;
        EXPECT_EQ(control.IsShown(), control.table->Head(1) == "Output dates");
        if (control.IsShown()) {
          EXPECT_EQ(control.IsEnabled(), dates);
        }
      });
    }
    EXPECT_EQ(page.Find("OutputControlOption").Options()[2], "Specified output dates");
  }
  for (const int engine : {2, 3}) {
    setup.SetEngine(engine);
    PageDriver page(setup, kOutputPath);
    EXPECT_EQ(page.Find("OutputControlOption").Options()[2], "");
    EXPECT_FALSE(page.Find("OutputControlOption").IsOptionEnabled(0));
    EXPECT_TRUE(page.Find("OutputControlOption").IsOptionEnabled(2));
    EXPECT_FALSE(page.IsEnabled("dt ="));
    page.Page().Form().ForEach([&](Control& control) {
      if (control.table && control.table->Head(1) == "Stress period") {
        EXPECT_TRUE(control.IsShown() && control.IsEnabled());
      }
      if (control.table && control.table->Head(1) == "Output dates") {
        EXPECT_FALSE(control.IsShown());
      }
    });
  }
}

TEST(ModflowPages, PackagesThatTakeNoPartHaveNoRow) {
  OpenSetup setup(1);
  PageDriver page(setup, kOutputPath);
  TableForm& table = TableWith(page, "ASCII");
  const auto rows = [&table] {
    std::vector<std::string> heads;
    table.Follow();
    for (int row = 1; row <= table.RowCount(); ++row) heads.push_back(table.RowHead(row));
    return heads;
  };
  EXPECT_THAT(rows(), ElementsAre("Head", "Drawdown", "Water balace/budget", "Cell by cell"));
  setup.Root().Important(kModflowComponents)->Recharge = 1;
  EXPECT_THAT(rows(), ElementsAre("Head", "Drawdown", "Water balace/budget", "Cell by cell", "Recharge"));
  // One cell is a check, the next one empty.
  EXPECT_EQ(table.Enter(5, 2, "1"), "");
  EXPECT_NE(table.Enter(5, 1, "1"), "");
  EXPECT_EQ(table.Kind(5, 2), CellKind::Check);
  EXPECT_EQ(table.Cell(5, 1), "");
  EXPECT_EQ(setup.Value("OutputModflow/PackagesOutput/PackageOutput_5:Binary"), "1");
  EXPECT_FALSE(table.Allows(RowAction::Insert));
}

TEST(ModflowPages, OutputTakesDatesAndTimeSteps) {
  OpenSetup setup(1, 0, 2);
  PageDriver page(setup, kOutputPath);
  TableForm& dates = TableWith(page, "Output dates");
  EXPECT_NE(dates.InsertRows(0, 0), 0);
  EXPECT_EQ(dates.ShownCell(1, 1), "2000-02-01 00:00");
  EXPECT_EQ(dates.Enter(1, 1, "2030-01-02 03:04"), "");
  EXPECT_EQ(dates.ShownCell(1, 1), "2030-01-02 03:04");
  TableForm& steps = TableWith(page, "Stress period");
  EXPECT_NE(steps.InsertRows(0, 0), 0);
  EXPECT_EQ(steps.Enter(1, 1, "4"), "");
  EXPECT_NE(steps.Enter(1, 1, "-4"), "");
  EXPECT_NE(steps.Enter(1, 1, "1.5"), "");
  EXPECT_EQ(steps.Enter(1, 2, "1.5"), "");
  EXPECT_EQ(setup.Value("OutputModflow/OutputTimesteps/OutputTimestep_1:StressPeriod"), "4");
}

}  // namespace
}  // namespace tervane::modflow_pages_test
