// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/report/report_language.h"

#include "languages/languages.h"

namespace tervane {

namespace {

struct ReportTranslator {
  const Translations& catalogue;

  void operator()(std::string& text) const { text = InLanguage(catalogue, text); }
  void operator()(std::vector<std::string>& texts) const {
    for (std::string& text : texts) (*this)(text);
  }
  void operator()(ReportHeading& heading) const { (*this)(heading.text); }
  void operator()(ReportText& text) const { (*this)(text.text); }
  void operator()(ReportTable& table) const {
    (*this)(table.heads);
    for (std::vector<std::string>& row : table.rows) (*this)(row);
  }
  void operator()(ReportPicture& picture) const {
    (*this)(picture.caption);
    // "<text x="5" y="9">Elevation</text>"
    constexpr std::string_view kEnd = "</text>";
    std::string svg;
    std::string_view rest = picture.svg;
    for (;;) {
      const std::size_t tag = rest.find("<text"), begin = rest.find('>', tag);
      const std::size_t end = begin == std::string_view::npos ? begin : rest.find(kEnd, begin);
      if (end == std::string_view::npos) break;
      svg += rest.substr(0, begin + 1);
      svg += InLanguage(catalogue, std::string(rest.substr(begin + 1, end - begin - 1)));
      rest.remove_prefix(end);
    }
    picture.svg = svg.append(rest);
  }
};

}  // namespace

void TranslateReport(Report& report, std::string_view language) {
  const ReportTranslator translate{CatalogueOf(language)};
  if (translate.catalogue.Texts().empty()) return;
  report.language = language;
  // The title is the user's.
  translate(report.file);
  for (ReportSection& section : report.sections) {
    translate(section.title);
    for (ReportBlock& block : section.blocks) std::visit(translate, block);
  }
}

}  // namespace tervane
