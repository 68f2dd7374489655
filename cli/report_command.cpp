// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <chrono>
#include <filesystem>

#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/offers.h"
#include "cli/parts/setup_file.h"
#include "pages/report/report_html.h"
#include "platform/beside_program.h"
#include "platform/os_process.h"
#include "platform/paths.h"
#include "platform/running_process.h"
#include "platform/text.h"

namespace tervane {

namespace {

struct ReportCommandOptions {
  std::string setup, out, sections, dates = "iso", language;
  bool force = false;
  ReportOptions report;
};

/// The desktop draws pages for paper; the command line has no toolkit.
int WritePdf(const ReportCommandOptions& options, Streams streams) {
  const std::string desktop = FindBesideProgram("quarzel");
  if (desktop.empty())
    return Refuse(streams, "a PDF is drawn by quarzel, which is not beside this program: write an .html, and print it");
  // It says on the file what it has to say.
  std::string log;
  for (int number = 1; log.empty() || FileExists(log); ++number)
    log = fmt::format("{}.{}-{}.log", options.out, RunningProcess::This().process, number);
  os::ProgramStart start{
      desktop, {AbsoluteFromHere(options.setup), "--report", AbsoluteFromHere(options.out)}, {}, log};
  for (const auto& [name, value] : {std::pair<const char*, const std::string&>{"--report-sections", options.sections},
                                    {"--report-dates", options.dates},
                                    {"--language", options.language},
                                    {"--report-logo", options.report.logo}})
    if (!value.empty()) start.arguments.insert(start.arguments.end(), {name, value});
  os::ProgramTree program;
  std::error_code error;
  program.Start(start, error);
  if (error) return Refuse(streams, fmt::format("{}: {}", desktop, error.message()));
  while (!program.End()) program.Wait(std::chrono::milliseconds(500));
  FileContent said;
  ReadWholeFile(log, said);
  std::error_code ignored;
  std::filesystem::remove(NativePath(log), ignored);
  if (program.End()->status == 0 && program.End()->signal == 0) return kDone;
  return Refuse(streams, said.size > 0 ? Printable(Trimmed(said.Text())) : fmt::format("{} has failed", desktop));
}

int ReportCommand(const ReportCommandOptions& options, Streams streams) {
  const std::string extension = LowerCase(ExtensionOf(options.out));
  if (extension != ".html" && extension != ".htm" && extension != ".pdf")
    return Refuse(streams, options.out + ": a report is an .html or a .pdf");
  if (RefuseToReplace(options.out, options.force, streams)) return kCouldNot;
  CFlowModelDoc document;
  if (!OpenSetup(document, options.setup, streams)) return kCouldNot;
  if (extension == ".pdf") return WritePdf(options, streams);
  const FileResult written = WriteReportHtml(options.out, MakeReport(document, options.report));
  if (!written.Ok()) return Refuse(streams, written.error);
  if (!written.note.empty()) fmt::print(streams.err, "{}: {}\n", options.out, written.note);
  return kDone;
}

}  // namespace

void OfferReportCommand(CommandOffers& offers) {
  auto options = std::make_shared<ReportCommandOptions>();
  Command report = offers.Offer("report", "Write a report of a setup, for its file and the client",
                                [offers, options] { return ReportCommand(*options, offers.Output()); });
  AddSetup(report, options->setup);
  report.Add("-o,--output", options->out, "The report: .html, or .pdf where the desktop is installed").Required();
  report.AddTaken(
      "--sections",
      [options](const std::string& typed) {
        options->sections = typed;
        return TakeReportSections(typed, options->report);
      },
      "Some sections alone, as model,values,findings; see SECTIONS");
  report.Add("--logo", options->report.logo, "A picture at the head: .png, .jpg, .gif or .svg");
  report.AddTaken(
      "--dates",
      [options](const std::string& typed) {
        options->dates = typed;
        return TakeReportDates(typed, options->report);
      },
      "How dates are written: iso (2000-01-31), en, de or fr");
  report.AddTaken(
      "--language",
      [options](const std::string& typed) {
        options->language = typed;
        return TakeReportLanguage(typed, options->report);
      },
      "The language of its texts, en or de; names and what people wrote stay");
  report.AddFlag("--force", options->force, "Replaces a file of that name");
  static const std::string kFooter = ReportSectionsFooter();
  report.Footer(kFooter.c_str());
}

}  // namespace tervane
