// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/search.h"

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "document/flow_model_document.h"
#include "tests/support/setup.h"

namespace tervane::search_test {
namespace {

using testing::Contains;
using testing::Not;

std::vector<std::string> Found(const SearchIndex& index, const char* typed, std::size_t most = 1000) {
  constexpr const char* kKinds[] = {"title", "label", "option", "key", "section"};
  std::vector<std::string> lines;
  for (const SearchHit& hit : index.Find(typed, most))
    lines.push_back(fmt::format("{} {}: {}", kKinds[static_cast<int>(hit.kind)], hit.path, hit.text));
  return lines;
}

TEST(Search, FindsTitlesLabelsOptionsAndKeysInAnyCase) {
  CFlowModelDoc document;
  const std::string before = test::SavedText(document);
  const SearchIndex index(document);
  const struct {
    const char *typed, *hit;
  } cases[] = {
      {"extra par", "title ExtraParams: Extra Parameters"},
      {"ExtraParams/", nullptr},
      {"simspec/simt", "title SimSpec/SimTitle: Simulation title"},
      {"numeric ENGINE", "label SimSpec: Numeric Engine"},
      {"engine numeric", "label SimSpec: Numeric Engine"},
      {"modflow 2000", "option SimSpec: MODFLOW 2000"},
      {"layer property", "option SimSpec: Layer Property Flow (LPF)"},                         // in a sub-form
      {"head change", "label SimSpec/CompControlParaOL: Maximum head change per iteration:"},  // in a group
      {"low-gradient flow reduction:",
       "label SimSpec/CompControlParaOL: Threshold gradient for applying low-gradient flow reduction:"},
      {"filename", "option ExtraParams: Filename"},                                       // in a table
      {"maxnoofiter", "label SimSpec/CompControlParaOL: Maximum number of iterations:"},  // one hit for both
      {"paraol:maxno", "label SimSpec/CompControlParaOL: Maximum number of iterations:"},
      {"CompControlParaOL", "title SimSpec/CompControlParaOL: OL Computational Control Parameters"},
      {"2d_data_file", "section Catchment/NDS_2D_DATA_FILE: NDS_2D_DATA_FILE"},  // without a page of its own
      {"file:item_num", "key Catchment/NDS_2D_DATA_FILE: ITEM_NUMBERS"},
      {"noofparams", "key ExtraParams: NoOfParams"},                    // without a control
      {"start period", "label SimSpec/SimulationPeriod: Start Date:"},  // a word of the title
      {"particle mass", nullptr},                                       // takes no part
      {"start xyzzy", nullptr},
      {" ", nullptr},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.typed);
    if (c.hit)
      EXPECT_THAT(Found(index, c.typed), Contains(c.hit));
    else
      EXPECT_THAT(Found(index, c.typed), testing::IsEmpty());
  }
  EXPECT_EQ(test::SavedText(document), before);
}

TEST(Search, TheBestComesFirstAndLeadsToItsControl) {
  CFlowModelDoc document;
  const SearchIndex index(document);
  const std::vector<std::string> hits = Found(index, "simulation", 4);
  ASSERT_EQ(hits.size(), 4u);
  EXPECT_EQ(hits.front().rfind("title ", 0), 0u);
  EXPECT_THAT(hits, Not(Contains(testing::StartsWith("key "))));
  const std::vector<SearchHit> engine = index.Find("numeric", 1);
  ASSERT_EQ(engine.size(), 1u);
  EXPECT_EQ(engine[0].key, "ModelType");
  EXPECT_EQ(engine[0].label, "Numeric Engine");
  const CYbSEKvfBase* node = FindNode(document.Root(), ParseSetupPath("SimSpec").steps);
  EXPECT_EQ(engine[0].serial, node->Serial());
}

}  // namespace
}  // namespace tervane::search_test
