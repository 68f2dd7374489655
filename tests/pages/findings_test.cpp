// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/findings.h"

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "document/flow_model_document.h"
#include "tests/support/setup.h"

namespace tervane {
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

}  // namespace
}  // namespace tervane
