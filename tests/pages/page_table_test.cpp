// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/page_table.h"

#include <filesystem>
#include <fstream>
#include <map>

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "tests/support/page_driver.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::page_table_test {
namespace {

namespace fs = std::filesystem;

const fs::path kPages = fs::path(TERVANE_SOURCE_DIR) / "tests/pages";

/// A setup in which every component and option that shows a control is on. Each family of pages has its sections in a
/// file of its own.
std::string FullSetup() {
  std::string sections;
  for (const auto& entry : fs::recursive_directory_iterator(kPages))
    if (entry.path().filename() == "full_setup.tvd") sections += test::ReadFile(entry.path().string());
  return test::SetupText(14, sections);
}

/// The pages of all nodes as text, by the folder of their family, each under the path of its node.
std::map<std::string, std::string> AllPages(CFlowModelDoc& document) {
  std::map<std::string, std::string> texts;
  test::ScriptedHost host;
  WalkNodes(document.Root(), [&](const NodePlace& place) {
    const PageClass* pageClass = place.node.GetDlgRuntimeClass(kSetupDataTree);
    // Help pages are texts of their own.
    if (!pageClass || pageClass->name == "CTvnHelpView") return;
    const auto page = MakePage(*pageClass, place.node, {document, host, {}});
    ASSERT_TRUE(page) << place.path << " names a page that nobody makes";
    texts[std::string(PageFamilyOf(*pageClass))] +=
        fmt::format("== {} ({}, {})\n{}", place.path, pageClass->name, pageClass->resource, FormText(page->Form()));
  });
  return texts;
}

TEST(PageTable, EveryPageShowsWhatItsStoredTextShows) {
  const struct {
    const char* file;
    std::string setup;
  } cases[] = {{"new_setup.txt", test::SetupText(14, "")}, {"full_setup.txt", FullSetup()}};
  for (const auto& c : cases) {
    CFlowModelDoc document;
    ASSERT_TRUE(document.OpenText(c.setup, "/data/a.tvd")) << document.Error();
    ASSERT_TRUE(document.Report().IsEmpty());
    for (const auto& [family, text] : AllPages(document)) {
      const fs::path stored = kPages / family / c.file;
      SCOPED_TRACE(stored);
      // TERVANE_STORE_PAGES=1 stores the texts anew, when a page was changed on purpose: look at the difference.
      if (std::getenv("TERVANE_STORE_PAGES")) std::ofstream(stored, std::ios::binary) << text;
      EXPECT_EQ(test::ReadFile(stored.string()), text);
    }
  }
}

TEST(PageTable, EveryControlOverAValueOfTheSetupKnowsItsKey) {
  CFlowModelDoc document;
  ASSERT_TRUE(document.OpenText(FullSetup(), "/data/a.tvd"));
  test::ScriptedHost host;
  int known = 0, columns = 0;
  WalkNodes(document.Root(), [&](const NodePlace& place) {
    const PageClass* pageClass = place.node.GetDlgRuntimeClass(kSetupDataTree);
    if (!pageClass) return;
    const auto page = MakePage(*pageClass, place.node, {document, host, {}});
    page->Form().ForEach([&](const Control& control) {
      // The corners of the maps are kept with the view settings, which have no page.
      if (!control.enter || control.hint == kViewOnly || place.path == "Overlays") return;
      EXPECT_NE(control.key, "") << place.path << ": " << control.label;
      ++known;
    });
    page->Form().ForEach([&](const Control& control) {
      if (!control.table || control.table->IsShownOnly()) return;
      for (const TableColumn& column : control.table->Columns()) {
        if (!column.set) continue;
        EXPECT_NE(column.key, "") << place.path << ": column " << column.head;
        ++columns;
      }
    });
  });
  EXPECT_GT(known, 200);
  EXPECT_GE(columns, 3);
}

TEST(PageTable, ShowingAPageChangesNothing) {
  CFlowModelDoc document;
  ASSERT_TRUE(document.OpenText(FullSetup(), "/data/a.tvd"));
  const std::string before = test::SavedText(document);
  AllPages(document);
  EXPECT_EQ(test::SavedText(document), before);
}

TEST(PageTable, EveryControlTakesItsOwnText) {
  CFlowModelDoc document;
  ASSERT_TRUE(document.OpenText(FullSetup(), "/data/a.tvd"));
  const std::string before = test::SavedText(document);
  test::ScriptedHost host;
  int controls = 0;
  WalkNodes(document.Root(), [&](const NodePlace& place) {
    const PageClass* pageClass = place.node.GetDlgRuntimeClass(kSetupDataTree);
    const auto page = pageClass ? MakePage(*pageClass, place.node, {document, host, {}}) : nullptr;
    if (!page) return;
    page->Form().ForEach([&](Control& control) {
      // A date list without dates shows none of its options.
      if (!control.enter || !control.IsEnabled() || control.Text() == "-1" || control.Text() == "Invalid DateTime.")
        return;
      EXPECT_EQ(control.enter(control.Text()), "") << place.path << " " << control.label;
      ++controls;
    });
  });
  EXPECT_GT(controls, 90);
  EXPECT_EQ(test::SavedText(document), before);
}

}  // namespace
}  // namespace tervane::page_table_test
