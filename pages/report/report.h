// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The report of a setup for its file and the client: what is simulated, what differs from the defaults, the inputs in
// maps and charts, findings, the latest run. Content alone; forms of files are made of it.
#pragma once

#include <functional>
#include <span>
#include <string>
#include <string_view>
#include <variant>
#include <vector>

#include "document/flow_model_document.h"
#include "pages/report/report_dates.h"

namespace tervane {

struct ReportHeading {
  std::string text;
};
struct ReportText {
  std::string text;
  bool isQuiet = false;  ///< A remark beside the matter.
};
struct ReportTable {
  std::vector<std::string> heads;
  std::vector<std::vector<std::string>> rows;
};
/// A drawing as SVG, whole in itself.
struct ReportPicture {
  std::string caption;
  std::string svg;
  int width = 0, height = 0;  ///< In pixels at 96 for an inch.
};
using ReportBlock = std::variant<ReportHeading, ReportText, ReportTable, ReportPicture>;

struct ReportSection {
  std::string name, title;
  std::vector<ReportBlock> blocks;
};

struct Report {
  std::string title, file, made;  ///< Of the simulation; the setup's file; when and by what the report was made.
  std::string logo;               ///< The path of a picture; empty for none.
  std::string language = "en";
  std::vector<ReportSection> sections;
};

/// What a section may ask for.
struct ReportContext {
  CFlowModelDoc& document;
  ReportDates dates;
};

/// A section of the report, declared once.
struct ReportSectionKind {
  std::string_view name;   ///< As the command line takes it.
  std::string_view title;  ///< Its heading.
  std::string_view tells;  ///< What it tells, for help.
  void (*make)(ReportContext& context, std::vector<ReportBlock>& blocks);
};
/// In the order of the report.
std::span<const ReportSectionKind> ReportSections();

struct ReportOptions {
  std::vector<std::string> sections;  ///< Names; all where there are none.
  std::string logo;
  ReportDates dates;
  std::string language = "en";
};

/// Makes the report of a setup as it is, its latest validation included. Sections without content are left out.
Report MakeReport(CFlowModelDoc& document, const ReportOptions& options);

// What is typed, for the programs: why it is refused, or nothing.
std::string TakeReportSections(std::string_view typed, ReportOptions& options);
std::string TakeReportDates(std::string_view typed, ReportOptions& options);
std::string TakeReportLanguage(std::string_view typed, ReportOptions& options);
/// The sections with what they tell, for help.
std::string ReportSectionsFooter();

// ---- Sections

void ReportModel(ReportContext& context, std::vector<ReportBlock>& blocks);
void ReportDomain(ReportContext& context, std::vector<ReportBlock>& blocks);
void ReportValues(ReportContext& context, std::vector<ReportBlock>& blocks);
void ReportInputs(ReportContext& context, std::vector<ReportBlock>& blocks);
void ReportNotes(ReportContext& context, std::vector<ReportBlock>& blocks);
void ReportCoverage(ReportContext& context, std::vector<ReportBlock>& blocks);
void ReportFindings(ReportContext& context, std::vector<ReportBlock>& blocks);
void ReportRun(ReportContext& context, std::vector<ReportBlock>& blocks);

}  // namespace tervane
