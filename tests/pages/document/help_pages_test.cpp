// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/document/help_pages.h"

#include <algorithm>
#include <cctype>
#include <set>
#include <string>

#include <gmock/gmock.h>

namespace tervane::help_pages_test {
namespace {

struct Heading {
  std::string_view page, heading;
};

constexpr Heading kHeadings[] = {
    {"Computational_Layer.htm", "Computational Layers"},
    {"Dual_Porosity.htm", "Dual Porosity Transfer Coefficient"},
    {"Geological_Layer.htm", "Geological Layers"},
    {"Geological_Lense.htm", "Geological Lenses"},
    {"Initial_Concentration.htm", "Initial Concentration"},
    {"Initial_Conditions.htm", "Initial Conditions"},
    {"Initial_Mass.htm", "Initial Mass (per Species)"},
    {"Initial_Secondary_Concentration.htm", "Initial Secondary Concentration"},
    {"Kinetra_Constants.htm", "Kinetra Constants"},
    {"Kinetra_Forcings.htm", "Kinetra Forcings"},
    {"Lower_Level_Layer.htm", "Lower Level"},
    {"Macropore_Transfer_Coeff.htm", "Macropore Transfer Coefficient"},
    {"OL_DecayProcess.htm", "Overland Flow Decay Process"},
    {"OL_DecayProcesses.htm", "Overland Flow Decay Processes"},
    {"PT_Registration_Lense.htm", "PT Registration Lenses"},
    {"Tvn.htm", "Tervane"},
    {"UZ_DecayProcess.htm", "Unsaturated Zone Decay Process"},
    {"UZ_DecayProcesses.htm", "Unsaturated Zone Decay Processes"},
    {"UZ_Initial_Concentration.htm", "Unsaturated Zone - Initial Concentration"},
    {"UZ_Layer.htm", "Unsaturated Layers"},
    {"UZ_Sorption_Process.htm", "Unsaturated Zone Sorption Process"},
    {"UZ_Sorption_Processes.htm", "Unsaturated Zone Sorption Processes"},
    {"WQ_DecayProcess.htm", "Water Quality Decay Process"},
    {"WQ_DecayProcesses.htm", "Water Quality Decay Processes"},
    {"WQ_Layer.htm", "Water Quality Layers"},
    {"WQ_Sorption_Process.htm", "Sorption Process"},
    {"WQ_Sorption_Processes.htm", "Sorption Processes"},
    {"WQ_Source.htm", "Water Quality Sources"},
    {"default.htm", "No information for this treenode"},
};

/// The text between the first <element> and its end; empty where there is none.
std::string_view Content(std::string_view page, const std::string& element) {
  const std::string begin = "<" + element + ">";
  const auto from = page.find(begin);
  const auto to = page.find("</" + element + ">");
  if (from == page.npos || to == page.npos) return {};
  return page.substr(from + begin.size(), to - from - begin.size());
}

/// What is wrong with the tags and signs of a page; empty when nothing is. A small part of HTML, with every element
/// closed.
std::string FaultOfTags(std::string_view page) {
  static const std::set<std::string_view> kKnown = {"a",  "b", "body", "h1",    "h2", "head", "html",  "i",  "li",
                                                    "ol", "p", "sup",  "table", "td", "th",   "title", "tr", "ul"};
  std::vector<std::string_view> open;
  const auto around = [&](std::size_t at) { return std::string(page.substr(at, 40)); };
  for (std::size_t at = page.find_first_of("<>&"); at != page.npos; at = page.find_first_of("<>&", at)) {
    if (page[at] == '&') {
      const auto end = page.find(';', at);
      if (end == page.npos || end - at > 8) return "not an entity: " + around(at);
      at = end;
      continue;
    }
    if (page[at] == '>') return "a sign > that ends no tag: " + around(at);
    const auto end = page.find('>', at);
    if (end == page.npos) return "a tag without end: " + around(at);
    const std::string_view tag = page.substr(at + 1, end - at - 1);
    const std::size_t next = end + 1;
    if (tag == "!DOCTYPE html" || tag == "meta charset=\"utf-8\"") {
      at = next;
      continue;
    }
    if (std::ranges::count(tag, '"') % 2 != 0) return "a quotation mark without end: " + around(at);
    if (tag.starts_with('/')) {
      if (open.empty() || open.back() != tag.substr(1)) return "closes what is not open: " + around(at);
      open.pop_back();
    } else {
      const std::string_view element = tag.substr(0, tag.find(' '));
      if (!kKnown.contains(element)) return "not an element of our pages: " + around(at);
      if (element == "p" && std::ranges::count(open, element) > 0) return "a paragraph in a paragraph: " + around(at);
      open.push_back(element);
    }
    at = next;
  }
  return open.empty() ? "" : "not closed: " + std::string(open.back());
}

TEST(HelpPages, AreThoseThatTheEntriesOfTheTreeName) {
  std::vector<std::string_view> expected;
  for (const Heading& row : kHeadings) expected.push_back(row.page);
  EXPECT_EQ(HelpPageNames(), expected);
}

TEST(HelpPages, HaveTheirHeadingAsTitleAndOnTop) {
  for (const auto& [name, heading] : kHeadings) {
    SCOPED_TRACE(name);
    const std::string_view* page = FindHelpPage(name);
    ASSERT_TRUE(page);
    EXPECT_EQ(Content(*page, "title"), heading);
    EXPECT_EQ(Content(*page, "h1"), heading);
    EXPECT_EQ(page->find("<h1>"), page->rfind("<h1>"));
  }
}

TEST(HelpPages, AnUnknownNameGivesNone) {
  for (const char* name : {"", "Top.chm", "tvn.htm", "Tvn.htm ", "Tvn", "help/Tvn.htm", "..", "Default.htm"})
    EXPECT_FALSE(FindHelpPage(name)) << name;
}

TEST(HelpPages, CloseWhatTheyOpen) {
  for (const std::string_view name : HelpPageNames()) EXPECT_EQ(FaultOfTags(*FindHelpPage(name)), "") << name;
}

TEST(HelpPages, TheCheckOfTagsFindsFaults) {
  for (const char* page : {"<p>a", "a</p>", "<p><b>a</p></b>", "<p>1 > 0</p>", "<p>a & b</p>", "<p", "<img>",
                           "<p><p>a</p></p>", "<a href=\"b>c</a>"})
    EXPECT_NE(FaultOfTags(page), "") << page;
  EXPECT_EQ(FaultOfTags("<p>a &amp; <b>b</b></p>"), "");
}

TEST(HelpPages, LinkToEachOtherAndToNothingElse) {
  for (const std::string_view name : HelpPageNames()) {
    SCOPED_TRACE(name);
    const std::string_view page = *FindHelpPage(name);
    for (const char* outside : {"http", "src=", "<script", "<style", "url("})
      EXPECT_EQ(page.find(outside), page.npos) << outside;
    constexpr std::string_view kLink = "href=\"";
    for (auto at = page.find(kLink); at != page.npos; at = page.find(kLink, at + 1)) {
      const auto target = page.substr(at + kLink.size(), page.find('"', at + kLink.size()) - at - kLink.size());
      EXPECT_TRUE(FindHelpPage(target)) << target;
      EXPECT_NE(target, name) << "leads to itself";
    }
  }
}

TEST(HelpPages, EveryTopicIsReachedFromTheWelcomePage) {
  std::set<std::string_view> reached = {"Tvn.htm"};
  for (std::size_t before = 0; before != reached.size();) {
    before = reached.size();
    for (const std::string_view from : std::set(reached))
      for (const std::string_view name : HelpPageNames())
        if (FindHelpPage(from)->find("href=\"" + std::string(name) + "\"") != std::string_view::npos)
          reached.insert(name);
  }
  for (const std::string_view name : HelpPageNames())
    EXPECT_TRUE(reached.contains(name) || name == "default.htm") << name;
}

TEST(HelpPages, SayEnoughToHelp) {
  for (const std::string_view name : HelpPageNames()) {
    const std::string_view page = *FindHelpPage(name);
    EXPECT_GE(std::ranges::count_if(page, [](unsigned char c) { return std::isspace(c); }), 70) << name;
    EXPECT_TRUE(page.ends_with("</html>\n")) << name;
  }
}

}  // namespace
}  // namespace tervane::help_pages_test
