// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "libraries/river_network.h"

#include <gmock/gmock.h>

#include "platform/paths.h"
#include "tests/support/temp_folder.h"

namespace tervane::river_network_test {
namespace {

using test::ReadFile;
using test::TempFolder;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

std::string Network(const std::string& points, const std::string& branches) {
  return "target FLUVANE_Network_editor {\n  section POINTS {\n" + points + "  }\n  section BRANCHES {\n" + branches +
         "  }\n}\n";
}

CYbSimpleRiverData ParsedNetwork(const std::string& text) {
  CYbSimpleRiverData network;
  EXPECT_EQ(network.ParseNetwork(FileContent::Of(text), "a.fvnwk"), "");
  return network;
}

std::string Written(const CYbSimpleRiverData& network) {
  std::string error;
  std::string text = network.NetworkText(error);
  EXPECT_EQ(error, "");
  return text;
}

/// Comments and parts that mean nothing to a network, at every place that a file has.
constexpr const char* kFullNetwork =
    "# head\n"
    "target OTHER {\n"
    "  Key = 1\n"
    "}\n"
    "# of the target\n"
    "target FLUVANE_Network_editor {\n"
    "  Loose = 3\n"
    "  section FORMAT_VERSION {\n"
    "    verno = 112\n"
    "  }\n"
    "  section POINTS {\n"
    "    Datum = \"sea\"\n"
    "    Point = 1, 100.5, 200.0, 0.0\n"
    "    Point = 2, 100.5, 1200.0, 1000.0\n"
    "    Point = 4, 600.0, 1200.0, 1500.0\n"
    "    Point = 7, 0.0, 1200.0, 0.0\n"
    "  }\n"
    "  section BRANCHES {\n"
    "    section Branch_1 {\n"
    "      # of the Rhone\n"
    "      Name = \"Rho\\\"ne\"\n"
    "      TopoID = \"1990\"\n"
    "      Points = 1, 2, 4\n"
    "      Direction = 0\n"
    "      Upstream = \"\"\n"
    "      Downstream = \"\"\n"
    "    }\n"
    "    section Branch_2 {\n"
    "      Colour = 0.5f\n"
    "      Name = \"Fleschbach\"\n"
    "      TopoID = \"\"\n"
    "      Points = 7, 2\n"
    "      Direction = 0\n"
    "      Upstream = \"\"\n"
    "      Downstream = \"Rho\\\"ne\", 1000.0\n"
    "    }\n"
    "  }\n"
    "  # the weir of Fiesch\n"
    "  section WEIR {\n"
    "    section Weir_1 {\n"
    "      Crest = 540.2\n"
    "    }\n"
    "  }\n"
    "  section PUMPS {\n"
    "  }\n"
    "}\n"
    "target SYSTEM {\n"
    "}\n";

TEST(RiverNetwork, KeepsWhatItDoesNotKnowThroughARewrite) {
  const CYbSimpleRiverData network = ParsedNetwork(kFullNetwork);
  EXPECT_THAT(network.Findings(), IsEmpty());
  ASSERT_EQ(network.branches.size(), 2u);
  EXPECT_EQ(network.branches[0].name, "Rho\"ne");
  EXPECT_EQ(network.branches[0].Length(), 1499.5);
  EXPECT_EQ(network.branches[1].Chainages(), std::pair(0.0, 1000.0));
  EXPECT_EQ(network.branches[1].downstream, (RiverJunction{"Rho\"ne", 1000}));
  EXPECT_EQ(network.Extent(), (Envelope{0, 200, 600, 1200}));
  EXPECT_THAT(network.KeptSections(), ElementsAre("WEIR"));
  EXPECT_EQ(Written(network), kFullNetwork);
}

TEST(RiverNetwork, CommentsStayInTheirSectionAndBranch) {
  const CYbSimpleRiverData network = ParsedNetwork(
      "target FLUVANE_Network_Editor {\n  section POINTS {\n    # first\n    Point = 2, 1, 1, 5 # five\n"
      "    Point = 1, 0, 0, 0\n  }\n"
      "  section BRANCHES {\n    # of the branch\n    section Branch_9 {  # nine\n      Name = \"A\"\n"
      "      Points = 1, 2\n    }\n  }\n}\n# foot\n");
  EXPECT_EQ(
      Written(network),
      "target FLUVANE_Network_editor {\n  section POINTS {\n    # first\n    # five\n    Point = 1, 0.0, 0.0, 0.0\n"
      "    Point = 2, 1.0, 1.0, 5.0\n  }\n  section BRANCHES {\n    section Branch_1 {\n      # of the branch\n"
      "      # nine\n      Name = \"A\"\n      TopoID = \"\"\n      Points = 1, 2\n"
      "      Direction = 0\n      Upstream = \"\"\n      Downstream = \"\"\n    }\n  }\n}\n# foot\n");
}

TEST(RiverNetwork, TellsWhatIsWrongWithItsPlace) {
  const std::string good = "    Point = 1, 0, 0, 0\n    Point = 2, 10, 0, 10\n    Point = 3, 20, 0, 20\n";
  const auto branch = [](int number, const std::string& text) {
    return "    section Branch_" + std::to_string(number) + " {\n" + text + "    }\n";
  };
  const std::string a = branch(1, "Name = \"A\"\nPoints = 1, 2\n");
  const struct {
    std::string points, branches, finding;
  } kCases[] = {
      {"Point = 1, 2\n", "", "3: Point = 1, 2: a whole number, x, y and a chainage were expected"},
      {"Point = 1, 0, nan, 0\n", "", "3: point 1 has a number that is not finite"},
      {"Point = 1, 0, 0, 0\nPoint = 1, 5, 5, 5\n", "", "4: point 1 is there twice; that of line 3 is used"},
      {good, a, "5: point 3 belongs to no branch"},
      {good, branch(1, "Points = 1, 2, 3\n"), "8: a branch without a name"},
      {good, branch(1, "Name = \"A\"\nPoints = 1, 2, 3, 9\n"), "10: branch A: point 9 is in no section POINTS"},
      {good, branch(1, "Name = \"A\"\nPoints = 1, 2.5\n"), "10: Points = 1, 2.5: numbers of points were expected"},
      {good, branch(1, "Name = \"A\"\nPoints = 2\n"), "8: branch A: it has one point, two or more were expected"},
      {good, branch(1, "Name = \"A\"\n"), "8: branch A: it has no points, two or more were expected"},
      {good, a + branch(2, "Name = \"A\"\nPoints = 2, 3\n"), "12: branch A: another branch has that name, at line 8"},
      {good, branch(1, "Name = \"A\"\nPoints = 1, 3, 2\n"), "4: branch A: the chainage falls from 20 to 10 at point 2"},
      {good + "Point = 4, 30, 0, 20\n", branch(1, "Name = \"A\"\nPoints = 1, 2, 3, 4\n"),
       "6: branch A: the chainage does not rise from 20 to 20 at point 4"},
      {good, branch(1, "Name = \"A\"\nPoints = 1, 2, 3, 1\n"), "8: branch A: it comes to point 1 twice"},
      {good + "Point = 4, 0, 0, 40\n", branch(1, "Name = \"A\"\nPoints = 1, 2, 3, 4\n"),
       "9: branch A: it ends where it begins"},
      {good, branch(1, "Name = \"A\"\nPoints = 1, 2, 3\nDirection = 7\n"),
       "8: branch A: direction 7: 0 or 1 was expected"},
      {good, branch(1, "Name = \"A\"\nPoints = 1, 2, 3\nDownstream = \"B\", 0\n"),
       "8: branch A: its downstream end is joined to B, which is no branch"},
      {good, branch(1, "Name = \"A\"\nPoints = 1, 2, 3\nUpstream = \"A\", 0\n"),
       "8: branch A: its upstream end is joined to itself"},
      {good, branch(1, "Name = \"A\"\nPoints = 1, 2, 3\nUpstream = 4, 0\n"),
       "11: Upstream = 4, 0: the name of a branch and a chainage were expected"},
      {good, a + branch(2, "Name = \"B\"\nPoints = 2, 3\nDownstream = \"A\", 11\n"),
       "12: branch B: its downstream end is joined to A at 11, which goes from 0 to 10"},
      {good,
       branch(1, "Name = \"A\"\nPoints = 1, 2\nDownstream = \"B\", 10\n") +
           branch(2, "Name = \"B\"\nPoints = 2, 3\nDownstream = \"A\", 0\n"),
       "8: branch A: its water comes back to it: A, B, A"},
  };
  for (const auto& row : kCases) {
    const CYbSimpleRiverData network = ParsedNetwork(Network(row.points, row.branches));
    std::vector<std::string> texts;
    for (const RiverFinding& finding : network.Findings()) texts.push_back(FindingText("a.fvnwk", finding));
    EXPECT_THAT(texts, testing::Contains("a.fvnwk:" + row.finding)) << row.points << row.branches;
  }
}

TEST(RiverNetwork, WhatIsNoNetworkIsRefusedAndLeavesTheOldOne) {
  const TempFolder folder;
  CYbSimpleRiverData network = ParsedNetwork(kFullNetwork);
  for (const auto& [text, reason] :
       {std::pair("target FvRun {\n}\n", "is no river network: it has no target"),
        std::pair("target A {\n  section POINTS {\n", "a.fvnwk:3:1: "), std::pair("", "a.fvnwk:1:1: ")}) {
    EXPECT_THAT(network.ReadNetworkFile(folder.Write("a.fvnwk", text)).error, HasSubstr(reason));
    EXPECT_EQ(network.branches.size(), 2u);
  }
  EXPECT_THAT(network.ReadNetworkFile(folder.File("missing")).error, HasSubstr("cannot read"));
}

TEST(RiverNetwork, AFaultyNetworkIsNotWrittenOverWhatCouldNotBeRead) {
  const TempFolder folder;
  const std::string text = Network("    Point = 1, 2\n", "");
  const std::string path = folder.Write("a.fvnwk", text);
  CYbSimpleRiverData network;
  ASSERT_TRUE(network.ReadNetworkFile(path).Ok());
  network.TakeBranches({});
  EXPECT_THAT(network.WriteNetworkFile(path).error, HasSubstr("a.fvnwk:3: Point = 1, 2"));
  EXPECT_EQ(ReadFile(path), text);
}

TEST(RiverNetwork, OtherBranchesTakeThePlaceOfTheOldOnesAndStructuresStay) {
  CYbSimpleRiverData network = ParsedNetwork(kFullNetwork);
  network.TakeBranches(
      {{.name = "New", .topoId = {}, .points = {{.place = {1, 2}}, {.place = {4, 6}, .chainage = 5}}}});
  network.SetArea({0.9, -3.7, 1e12, 6});
  const CYbSimpleRiverData read = ParsedNetwork(Written(network));
  EXPECT_THAT(read.Findings(), IsEmpty());
  ASSERT_EQ(read.branches.size(), 1u);
  EXPECT_EQ(read.branches[0].points[1].place, (MapPoint{4, 6}));
  EXPECT_THAT(read.KeptSections(), ElementsAre("WEIR"));
  // Whole numbers, cut off towards zero and kept within what a file can hold.
  EXPECT_THAT(Written(network), HasSubstr("    x0 = 0\n    y0 = -3\n    x1 = 2147483647\n    y1 = 6\n"));
}

TEST(RiverNetwork, SimulationAndProjectFilesLeadToIt) {
  const TempFolder folder;
  folder.Write("net.fvnwk", kFullNetwork);
  const auto run = [](const std::string& target, const std::string& line) {
    return "target " + target + " {\n  section input {\n" + line + "  }\n}\n";
  };
  const struct {
    const char* name;
    std::string text;
    const char* problem;  ///< Empty where the network is found.
  } kCases[] = {
      {"a.fvsim", run("FvRun", "nwk = file \"net.fvnwk\"\n"), ""},
      {"b.FVSIM", run("FvRun", "nwk = \"./net.fvnwk\", 3\n"), ""},
      {"c.fvproj", run("FLUVANE_Project", "nwk = file \"net.fvnwk\"\n"), ""},
      {"d.fvproj", run("FvRun", "nwk = file \"net.fvnwk\"\n"), "d.fvproj is no river project file"},
      {"e.fvsim", run("FvRun", "nwk = file \"e.fvsim\"\n"), "e.fvsim:3: the file names itself as its river network"},
      {"f.fvsim", run("FvRun", "nwk = 3\n"), "f.fvsim:3: nwk names no file"},
      {"g.fvsim", run("FvRun", ""), "the keyword nwk in input is missing"},
      {"h.fvsim", run("FvRun", "nwk = file \"a.fvsim\"\n"), "a.fvsim is no river network"},
      {"i.fvsim", run("FvRun", "nwk = file \"missing.fvnwk\"\n"), "missing.fvnwk"},
      {"j.fvsim", "target FvRun {", "j.fvsim:1:"},
  };
  for (const auto& row : kCases) {
    const auto reading = ReadRiverOnce(folder.Write(row.name, row.text));
    EXPECT_THAT(reading->problem, HasSubstr(row.problem)) << row.name;
    EXPECT_EQ(reading->problem.empty(), *row.problem == 0) << row.name;
    EXPECT_EQ(reading->Find("Fleschbach") != nullptr, *row.problem == 0) << row.name;
  }
  // Nothing is known of other files, and that is no fault.
  for (const char* name : {"a.txt", ""}) EXPECT_EQ(ReadRiverOnce(name)->problem, "");
  // A project file that names another network is noticed.
  folder.Write("c.fvproj", run("FLUVANE_Project", "nwk = file \"other.fvnwk\"\n"));
  EXPECT_THAT(ReadRiverOnce(folder.File("c.fvproj"))->problem, HasSubstr("other.fvnwk"));
}

TEST(RiverNetwork, ANewOneHasTheSectionsOfItsEditor) {
  const std::string text = Written(CYbSimpleRiverData::Empty({100.7, 200, 300, 400.9}));
  std::vector<std::string> sections;
  for (std::size_t at = text.find("  section "); at != std::string::npos; at = text.find("  section ", at + 1))
    sections.push_back(text.substr(at + 10, text.find(' ', at + 10) - at - 10));
  EXPECT_THAT(sections, ElementsAre("FORMAT_VERSION", "DATA_AREA", "POINTS", "BRANCHES", "WEIR", "CULVERTS", "PUMPS",
                                    "REGULATING_STR", "CONTROL_STR", "DAMBREAK_STR", "CATCHMENT", "COMPUTATIONAL_SETUP",
                                    "TERVANECOUPLING", "CHANNELROUTING", "FLOOD_QQ", "FLOOD_HQ", "FLOOD_ORIFICE",
                                    "DIVERSION", "ALIGNMENTLINE", "BRIDGE", "JUNCTION", "USER_DEFINED", "TABULATED",
                                    "ENERGYBALANCE", "FLUVANE_ROUTING", "VORA12_HYDRAU", "LAYER_FILES"));
  EXPECT_THAT(text, HasSubstr("    verno = 112\n"));
  EXPECT_THAT(text, HasSubstr("    x0 = 100\n    y0 = 200\n    x1 = 300\n    y1 = 400\n"));
  EXPECT_THAT(text, HasSubstr("    SaveAllGridPoints = true\n"));
  EXPECT_THAT(ParsedNetwork(text).KeptSections(), IsEmpty());
}

}  // namespace
}  // namespace tervane::river_network_test
