// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/offers.h"
#include "cli/parts/json.h"
#include "cli/parts/setup_file.h"
#include "modflow6/modflow6_export.h"
#include "platform/os_process.h"
#include "platform/paths.h"

namespace tervane {

namespace {

struct Modflow6Command {
  std::string file, folder;
  modflow6::Modflow6Options options;
  bool json = false, binary = false;
};

/// Nothing is shown while it goes on; Ctrl+C ends it.
class QuietWork : public WorkLog {
 public:
  QuietWork() { os::KeepEndRequests(); }

  void Progress(int /*percent*/, std::string_view /*doing*/) override {}
  void Error(std::string_view /*place*/, std::string_view /*text*/) override {}
  void Warning(std::string_view /*place*/, std::string_view /*text*/) override {}
  bool IsCancelled() const override { return isCancelled_ = isCancelled_ || os::TakeEndRequests() > 0; }

 private:
  mutable bool isCancelled_ = false;
};

std::string EntryJson(const modflow6::ExportEntry& entry) {
  return JsonObject(
      {{"fate", JsonQuoted(NameOf(entry.fate))}, {"place", JsonQuoted(entry.place)}, {"text", JsonQuoted(entry.text)}});
}

int Run(const Modflow6Command& wanted, Streams streams) {
  CFlowModelDoc document;
  if (!OpenSetup(document, wanted.file, streams)) return kCouldNot;
  PrintLoadReportHint(document, streams);
  modflow6::Modflow6Options options = wanted.options;
  if (wanted.binary) options.arrays = modflow6::Modflow6Options::Arrays::Binary;
  modflow6::ExportReport report;
  QuietWork work;
  const FileResult exported = modflow6::ExportModflow6(document.Root(), std::string(BaseNameOf(wanted.file)),
                                                       ResolvedPath(wanted.folder, {}), options, work, report);
  if (!exported.Ok()) return Refuse(streams, exported.error);
  if (wanted.json) {
    std::vector<std::string> entries;
    for (const modflow6::ExportEntry& entry : report.Entries()) entries.push_back(EntryJson(entry));
    fmt::print(streams.out, "{}\n",
               JsonObject({{"folder", JsonQuoted(wanted.folder)}, {"inputs", JsonArray(entries)}}));
    return kDone;
  }
  fmt::print(streams.out, "{}\n{}: {}\n", report.Text(), wanted.folder, exported.note);
  return kDone;
}

}  // namespace

void OfferModflow6Export(CommandOffers& offers, const Command& family) {
  auto options = std::make_shared<Modflow6Command>();
  Command command = offers.Offer(
      "modflow6", "Write a setup with a Modflow engine as a model of MODFLOW 6",
      [offers, options] { return Run(*options, offers.Output()); }, &family);
  command.Add("SETUP", options->file, "The setup (.tvd)").Required();
  command.Add("DIR", options->folder, "The folder of the model; it is made where it is missing").Required();
  command.AddFlag("--binary", options->binary, "Write arrays in binary form; as text without it");
  using Thin = ModelLayers::ThinCells;
  command.AddChoice<Thin>("--thin", options->options.thinCells, {{"thicken", Thin::EndLower}, {"pass", Thin::Vanish}},
                          "What becomes of cells that are thinner than the setup's minimum: they are thickened "
                          "(without it), or passed through");
  command.AddFlag("--force", options->options.force, "Replace a model that is in the folder");
  command.AddFlag("--json", options->json, "Print what became of each input as JSON");
}

}  // namespace tervane
