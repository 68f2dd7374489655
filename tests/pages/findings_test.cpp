// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/findings.h"

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "document/flow_model_document.h"
#include "tests/support/setup.h"

namespace tervane::findings_test {
namespace {

TEST(Findings, OfAllOriginsStandInOneListAndLeadToTheirNodes) {
  CFlowModelDoc document;
  ASSERT_TRUE(document.OpenText(test::SetupText(14, R"(section SimSpec {
  Foo = 1
  section ModelComp {
    WQ = 1
  }
}
section ModelCompWQ {
  UZ = 1
  OL = "yes"
  section Strange {
  }
}
section Unknown {
}
)"),
                                "a.tvd"));
  std::vector<std::string> lines;
  for (const SetupFinding& finding : FindingsOf(document)) {
    std::string node = "nowhere";
    WalkNodes(document.Root(), [&](const NodePlace& place) {
      if (place.node.Serial() == finding.serial) node = place.path;
    });
    lines.push_back(
        fmt::format("{} {} {}:{} {}", KindName(finding.kind), finding.line, finding.path, finding.key, node));
  }
  EXPECT_THAT(lines, testing::ElementsAre("note 13 ModelCompWQ:OL ModelCompWQ", "error 0 ModelCompWQ:UZ ModelCompWQ",
                                          "error 0 Catchment/NDS_2D_DATA_FILE:FILE_NAME Catchment/NDS_2D_DATA_FILE",
                                          "unread 6 SimSpec:Foo: SimSpec", "unread 14 ModelCompWQ/Strange: ModelCompWQ",
                                          "unread 17 Unknown: nowhere"));
}

TEST(Findings, OfOneCauseAreOneGroup) {
  using Kind = SetupFinding::Kind;
  const std::vector<FindingGroup> groups = GroupFindings({
      {Kind::Warning, "Climate/Rain/STATION_1/FILE", "does not cover", "NAME", "it ends early", 0, 11},
      {Kind::Error, "Climate/Rain/STATION_2/FILE", "does not cover", "NAME", "it ends early", 0, 12},
      {Kind::Warning, "Climate/Rain/STATION_12/FILE", "does not cover", "NAME", "it ends early", 0, 13},
      {Kind::Warning, "Climate/Rain/STATION_3/FILE", "does not cover", "NAME", "it begins late", 0, 14},
      {Kind::Warning, "Climate/Snow/STATION_1/FILE", "does not cover", "NAME", "it ends early", 0, 15},
      {Kind::Note, "Climate", "odd", "A", {}, 7, 16},
      {Kind::Note, "Climate", "odd", "A", {}, 9, 16},
  });
  std::vector<std::string> lines;
  for (const FindingGroup& group : groups) lines.push_back(group.Place() + ": " + group.Text());
  EXPECT_THAT(lines, testing::ElementsAre("Climate/Rain/STATION_*/FILE:NAME: does not cover (it ends early): 2 places",
                                          "Climate/Rain/STATION_2/FILE:NAME: does not cover (it ends early)",
                                          "Climate/Rain/STATION_3/FILE:NAME: does not cover (it begins late)",
                                          "Climate/Snow/STATION_1/FILE:NAME: does not cover (it ends early)",
                                          "Climate:A: odd", "Climate:A: odd"));
  EXPECT_EQ(groups[0].findings[1].serial, 13u);
}

TEST(Findings, WhatAnEngineSaysOfAKeyJoinsTheFindingThatIsThere) {
  CFlowModelDoc document;  // its domain has no file
  const auto said = [&](const std::string& whyPast) {
    std::vector<SetupFinding> findings = FindingsOf(document);
    AddEngineMessages(document,
                      {{true, "Catchment/NDS_2D_DATA_FILE:FILE_NAME", "cannot be read"},
                       {true, "Catchment/NDS_2D_DATA_FILE:FILE_NAME", findings.at(0).text},
                       {false, "SimSpec/SimTitle:Title", "is odd"},
                       {true, "Nowhere:Key", "hm"}},
                      whyPast, findings);
    std::vector<std::string> lines;
    for (const SetupFinding& finding : findings)
      lines.push_back(fmt::format("{}{} {}:{}: {}", finding.isPast ? "past " : "", KindName(finding.kind), finding.path,
                                  finding.key, finding.detail));
    return lines;
  };
  EXPECT_THAT(said({}), testing::ElementsAre(
                            "error Catchment/NDS_2D_DATA_FILE:FILE_NAME: no file is chosen; the engine: cannot be read",
                            "warning SimSpec/SimTitle:Title: told by the engine", "error :: told by the engine"));
  EXPECT_THAT(
      said("changed since"),
      testing::ElementsAre("error Catchment/NDS_2D_DATA_FILE:FILE_NAME: no file is chosen",
                           "past warning SimSpec/SimTitle:Title: changed since", "past error :: changed since"));
}

}  // namespace
}  // namespace tervane::findings_test
