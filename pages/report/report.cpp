// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/report/report.h"

#include <algorithm>
#include <chrono>
#include <ctime>

#include <fmt/chrono.h>
#include <fmt/format.h>

#include "execution/run_passport.h"
#include "forms/page.h"
#include "languages/languages.h"
#include "pages/findings.h"
#include "pages/place_names.h"
#include "pages/report/report_language.h"
#include "pages/tree_entries.h"
#include "platform/paths.h"
#include "platform/suggestion.h"
#include "platform/text.h"
#include "platform/version.h"
#include "simspec/basic_parameters.h"
#include "simspec/review_notes.h"
#include "simspec/titles.h"
#include "spatial/coverage.h"
#include "spatial/domain.h"

namespace tervane {

namespace {

constexpr ReportSectionKind kSections[] = {
    {"model", "What is simulated", "title, description, period, components and engine", ReportModel},
    {"domain", "Model domain and grid", "where the model lies, and its ground", ReportDomain},
    {"values", "Values that differ from the defaults", "of every page, with units and the default", ReportValues},
    {"inputs", "Inputs", "maps and charts of the data", ReportInputs},
    {"coverage", "Data coverage", "whether the data cover simulation and domain, and forcings year by year",
     ReportCoverage},
    {"findings", "Findings and notes", "what a check finds", ReportFindings},
    {"notes", "Review notes", "what reviewers have noted, with answers and states", ReportNotes},
    {"run", "The latest run", "its passport: when, by whom, of which files", ReportRun},
};

const CSimTitleKvf* TitleOf(const CYbSEDocument& document) {
  const auto* basics = document.Root().Important(kBasicParameters);
  return basics ? basics->Child<CSimTitleKvf>() : nullptr;
}

std::string SizeInWords(const std::string& bytes) {
  const double size = std::strtod(bytes.c_str(), nullptr);
  if (size < 1e4) return bytes + " bytes";
  return size < 1e7 ? fmt::format("{:.0f} kB", size / 1e3) : fmt::format("{:.0f} MB", size / 1e6);
}

}  // namespace

std::span<const ReportSectionKind> ReportSections() { return kSections; }

Report MakeReport(CFlowModelDoc& document, const ReportOptions& options) {
  Report report;
  const auto* title = TitleOf(document);
  report.title = title && !title->Title.empty() ? title->Title : std::string(BaseNameOf(document.PathName()));
  // Where it lies is nobody's business outside; the passport of the run tells it.
  report.file = FileNameOf(document.PathName());
  const FileStamp stamp = StampOf(document.PathName());
  if (stamp.exists) {
    const auto saved = std::chrono::time_point_cast<std::chrono::seconds>(std::chrono::file_clock::to_sys(stamp.time));
    report.file += options.dates.In(fmt::format(
        ", saved {:%Y-%m-%d %H:%M}", fmt::localtime(static_cast<std::time_t>(saved.time_since_epoch().count()))));
  }
  report.logo = options.logo;
  const std::time_t now = std::chrono::system_clock::to_time_t(std::chrono::system_clock::now());
  report.made = options.dates.In(fmt::format("{:%Y-%m-%d %H:%M}, Tervane {}", fmt::localtime(now), kProgramVersion));
  ReportContext context{document, options.dates};
  for (const ReportSectionKind& kind : kSections) {
    if (!options.sections.empty() && std::ranges::find(options.sections, kind.name) == options.sections.end()) continue;
    ReportSection section{std::string(kind.name), std::string(kind.title), {}};
    kind.make(context, section.blocks);
    if (!section.blocks.empty()) report.sections.push_back(std::move(section));
  }
  TranslateReport(report, options.language);
  return report;
}

std::string TakeReportSections(std::string_view typed, ReportOptions& options) {
  std::vector<std::string> known;
  for (const ReportSectionKind& kind : kSections) known.emplace_back(kind.name);
  options.sections.clear();
  while (!typed.empty()) {
    const std::size_t end = std::min(typed.find(','), typed.size());
    std::string name(Trimmed(typed.substr(0, end)));
    typed.remove_prefix(std::min(end + 1, typed.size()));
    if (std::ranges::find(known, name) == known.end())
      return fmt::format("a report has no section {}{}", name, Suggestion(name, known));
    options.sections.push_back(std::move(name));
  }
  return {};
}

std::string TakeReportDates(std::string_view typed, ReportOptions& options) {
  using Style = ReportDates::Style;
  for (const auto& [name, style] : {std::pair<std::string_view, Style>{"iso", Style::Iso},
                                    {"en", Style::English},
                                    {"de", Style::German},
                                    {"fr", Style::French}})
    if (typed == name) return options.dates.style = style, std::string();
  return fmt::format("{} is none of iso, en, de and fr", typed);
}

std::string TakeReportLanguage(std::string_view typed, ReportOptions& options) {
  if (!IsLanguage(typed)) return fmt::format("{} is none of the languages: {}", typed, LanguageCodes());
  options.language = typed;
  return {};
}

std::string ReportSectionsFooter() {
  std::string footer = "SECTIONS, in the order of the report:";
  for (const ReportSectionKind& kind : kSections) footer += fmt::format("\n  {:<10}{}", kind.name, kind.tells);
  return footer;
}

void ReportModel(ReportContext& context, std::vector<ReportBlock>& blocks) {
  const auto* title = TitleOf(context.document);
  if (title && !title->Description.empty()) blocks.push_back(ReportText{title->Description});
  const std::vector<TreeEntry> entries = TreeEntries(context.document.Root(), kSetupDataTree);
  if (entries.empty()) return;
  // The first page sums the setup up.
  NobodyToAsk host;
  const auto page = MakePageToRead(*entries.front().page, *entries.front().node, {context.document, host, {}});
  if (!page) return;
  ReportTable table;
  page->Form().ForEach([&](Control& control) {
    const std::string label = SpokenLabel(control.label), text = control.Text();
    if (control.kind != ControlKind::Shown || label == "Next step" || text.empty()) return;
    table.rows.push_back({label, context.dates.In(text)});
  });
  if (!table.rows.empty()) blocks.push_back(std::move(table));
}

void ReportFindings(ReportContext& context, std::vector<ReportBlock>& blocks) {
  std::vector<SetupFinding> findings = FindingsOf(context.document);
  std::ranges::stable_sort(findings, {}, &SetupFinding::kind);
  if (findings.empty()) {
    blocks.push_back(ReportText{"A check of the setup finds nothing."});
    return;
  }
  PlaceNames names(context.document);
  ReportTable table{{"Kind", "Place", "Finding"}, {}};
  for (const FindingGroup& group : GroupFindings(std::move(findings))) {
    const SetupFinding& first = group.First();
    CYbSEKvfBase* node = FindNode(context.document.Root(), ParseSetupPath(first.path).steps);
    const bool isKnown = group.IsOne() && node && first.kind != SetupFinding::Kind::Unread;
    std::string place = isKnown ? names.Of(*node, first.path, first.key) : group.Place();
    if (first.line > 0) place += fmt::format(" (line {})", first.line);
    table.rows.push_back({std::string(KindName(first.kind)), std::move(place), context.dates.In(group.Text())});
  }
  blocks.push_back(std::move(table));
}

void ReportNotes(ReportContext& context, std::vector<ReportBlock>& blocks) {
  CYbSEKvfGlobalBase& root = context.document.Root();
  const auto* list = root.Child<CExtraParamsKvf>();
  if (!list) return;
  PlaceNames names(context.document);
  ReportTable table{{"State", "Place", "Note", "By"}, {}};
  for (const ReviewNote& note : ReviewNotesOf(*list)) {
    CYbSEKvfBase* node = NodeOfReviewNote(root, note);
    std::string place = note.place.empty() ? "The whole setup" : fmt::format("{} (gone)", note.place);
    if (node && node != &root) place = names.Of(*node, PathOf(*node), ParseSetupPath(note.place).key.name);
    const auto by = [&](const auto& said) { return fmt::format("{}, {}", said.author, context.dates.In(said.date)); };
    table.rows.push_back({std::string(NameOf(note.state)), std::move(place), note.text, by(note)});
    for (const ReviewAnswer& answer : note.answers) table.rows.push_back({"answer", {}, answer.text, by(answer)});
  }
  if (!table.rows.empty()) blocks.push_back(std::move(table));
}

void ReportCoverage(ReportContext& context, std::vector<ReportBlock>& blocks) {
  CoverageBoard board;
  ComputeCoverage(AskCoverage(context.document.Root()), nullptr, board);
  const auto dated = [&](const std::string& text) { return context.dates.In(text); };
  ReportTable files{{"State", "Data", "File", "Item", "Values", "Simulation", "Domain"}, {}};
  for (const CoverageRow& row : board.rows) {
    std::vector<std::string> cells{std::string(NameOf(row.state)),
                                   row.file.title,
                                   std::string(FileNameOf(row.file.use.path)),
                                   row.item,
                                   dated(row.PeriodText()),
                                   row.problem.empty() ? dated(row.TimeText()) : row.problem,
                                   row.AreaText()};
    // What many stations take from one file and say alike stands once.
    std::vector<std::string> last = files.rows.empty() ? std::vector<std::string>() : files.rows.back();
    if (!last.empty()) last[3] = cells[3], last[1] = cells[1];
    if (last == cells) {
      if (files.rows.back()[3] != cells[3] && !files.rows.back()[3].ends_with("…")) files.rows.back()[3] += ", …";
      continue;
    }
    files.rows.push_back(std::move(cells));
  }
  if (!files.rows.empty()) blocks.push_back(std::move(files));
  for (const ForcingTotals& totals : board.forcings) {
    if (totals.columns.empty()) continue;
    blocks.push_back(ReportHeading{fmt::format("{}: {}", totals.forcing.forcing.title, totals.Heading())});
    ReportTable table{{"Period"}, {}};
    // Of many stations the domain says what counts.
    constexpr std::size_t kMostColumns = 8;
    const auto domain = std::ranges::find(totals.columns, "domain", &ForcingTotals::Column::name);
    const bool isDomain = totals.columns.size() > kMostColumns && domain != totals.columns.end();
    const std::size_t first = isDomain ? static_cast<std::size_t>(domain - totals.columns.begin()) : 0;
    const std::size_t end = isDomain ? first + 1 : std::min(kMostColumns, totals.columns.size());
    for (std::size_t column = first; column < end; ++column) table.heads.push_back(totals.ColumnText(column));
    for (std::size_t period = 0; period < board.periods.size(); ++period) {
      auto& row = table.rows.emplace_back(std::vector<std::string>{board.periods[period].name});
      for (std::size_t column = first; column < end; ++column)
        row.push_back(totals.ValueText(column, period, board.periods[period].span, totals.Decimals()));
    }
    blocks.push_back(std::move(table));
  }
}

void ReportRun(ReportContext& context, std::vector<ReportBlock>& blocks) {
  const CFlowModelDoc& document = context.document;
  std::string problem;
  const auto passport =
      ReadPassport(PassportFilesOf(document.getResultFolder(), document.PathName()).passport, problem);
  if (!passport) {
    blocks.push_back(ReportText{problem.empty() ? "No simulation has left results for this setup." : problem, true});
    return;
  }
  ReportTable table;
  for (const auto& [name, value] : {std::pair<const char*, const std::string&>{"Setup", passport->setup},
                                    {"Engine", passport->engine},
                                    {"Begun (UTC)", passport->begun},
                                    {"Ended (UTC)", passport->ended},
                                    {"Outcome", passport->outcome},
                                    {"User", passport->user},
                                    {"Host", passport->host},
                                    {"Program", passport->program}})
    if (!value.empty())
      table.rows.push_back({name, std::string_view(name).ends_with("(UTC)") ? context.dates.In(value) : value});
  blocks.push_back(std::move(table));
  const std::vector<InputChange> changes = ChangedInputs(*passport, true);
  ReportTable inputs{{"Input", "Size", "Hash", "Since"}, {}};
  for (const PassportInput& input : passport->inputs) {
    const auto change = std::ranges::find(changes, input.path, &InputChange::path);
    inputs.rows.push_back({RelativePath(input.path, FolderOf(AbsoluteFromHere(document.PathName()))),
                           input.size.empty() ? std::string("was not there") : SizeInWords(input.size), input.hash,
                           change == changes.end() ? std::string("as it was") : std::string(NameOf(change->fate))});
  }
  if (!inputs.rows.empty()) blocks.push_back(std::move(inputs));
}

}  // namespace tervane
