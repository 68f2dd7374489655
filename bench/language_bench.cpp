// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// How long the German of many findings takes, beside a plain search through all templates; and that of a page.
#include <string>
#include <utility>
#include <vector>

#include <fmt/format.h>

#include "bench/median_table.h"
#include "languages/languages.h"

namespace tervane::bench {

namespace {

constexpr int kFindings = 10'000;
constexpr std::size_t kLabels = 300;

/// As checks of large setups give them: fixed texts, texts with values, texts in texts, and names that nobody knows.
std::vector<std::string> Findings() {
  std::vector<std::string> texts;
  for (int i = 0; i < kFindings / 5; ++i) {
    texts.emplace_back("It gets no cell of the model: what it holds is used nowhere");
    texts.push_back(fmt::format("cannot read /data/gauges/gauge_{}.nds0: it does not exist", i));
    texts.push_back(
        fmt::format("the file covers 2012-01-01 to 20{:02}-01-01, the simulation runs to 2016-06-30", i % 16));
    texts.push_back(fmt::format("Tervane has no solver PCG{}.", i));
    texts.push_back(fmt::format("told of gauge {} by somebody, in words that no catalogue has", i));
  }
  return texts;
}

std::size_t Translate(const std::vector<std::string>& texts) {
  std::size_t length = 0;
  for (const std::string& text : texts) length += InLanguage(CatalogueOf("de"), text).size();
  return length;
}

/// What stands before, between and behind the values of each template.
std::vector<std::vector<std::string>> Templates() {
  std::vector<std::vector<std::string>> all;
  for (const std::string& text : CatalogueOf("de").Templates()) {
    std::vector<std::string> parts{""};
    for (std::size_t i = 0; i < text.size(); ++i) {
      const bool isValue = text[i] == '%' && i + 1 < text.size() && text[i + 1] >= '1' && text[i + 1] <= '9';
      if (isValue)
        parts.emplace_back(), ++i;
      else
        parts.back() += text[i];
    }
    all.push_back(std::move(parts));
  }
  return all;
}

/// The template that a text has, each held against it in their order. Values are left as they are.
std::size_t SearchAll(const std::vector<std::string>& texts, const std::vector<std::vector<std::string>>& templates) {
  std::size_t found = 0;
  for (const std::string& text : texts) {
    if (CatalogueOf("de").Exact(text)) continue;
    for (const std::vector<std::string>& parts : templates) {
      std::size_t at = 0;
      bool isOf = text.starts_with(parts.front()) && text.ends_with(parts.back());
      for (std::size_t i = 0; isOf && i < parts.size(); ++i) {
        at = text.find(parts[i], at);
        isOf = at != std::string::npos;
        if (isOf) at += parts[i].size();
      }
      if (isOf && ++found) break;
    }
  }
  return found;
}

}  // namespace

}  // namespace tervane::bench

int main(int argc, char** argv) {
  using namespace tervane;
  using namespace tervane::bench;
  const std::vector<std::string> findings = Findings();
  const auto templates = Templates();
  const std::vector<std::string>& known = CatalogueOf("de").Texts();
  const std::vector<std::string> labels(known.end() - kLabels, known.end());
  MedianTable table(9);
  table.Add("10,000 findings in German", [&] { return Translate(findings); });
  table.Add("a search through all templates for them", [&] { return SearchAll(findings, templates); });
  table.Add("300 labels of a page in German", [&] { return Translate(labels); });
  table.LimitTime("10,000 findings in German", 50);
  table.LimitTime("300 labels of a page in German", 1);
  table.Limit("10,000 findings in German", "a search through all templates for them", 1);
  table.Run(argc, argv);
  return 0;
}
