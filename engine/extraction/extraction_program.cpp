// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "engine/extraction/extraction_program.h"

#include <charconv>
#include <optional>

#include <fmt/format.h>
#include <fmt/ranges.h>

#include "document/flow_model_document.h"
#include "engine/engine_output.h"
#include "results/result_nodes.h"
#include "wqpt/extractions.h"

namespace tervane {

namespace {

constexpr int kAllJobs = -1;

struct ExtractionOrder {
  std::string setup;
  int kind = -1;
  int job = kAllJobs;
};

std::optional<ExtractionOrder> OrderOf(const std::vector<std::string>& arguments) {
  ExtractionOrder order;
  for (std::size_t i = 0; i < arguments.size(); ++i) {
    int* number = arguments[i] == "/Engine" ? &order.kind : arguments[i] == "/SelPostProc" ? &order.job : nullptr;
    if (!number) {
      if (!order.setup.empty()) return {};
      order.setup = arguments[i];
      continue;
    }
    if (++i == arguments.size()) return {};
    const std::string& text = arguments[i];
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), *number);
    if (error != std::errc() || end != text.data() + text.size()) return {};
  }
  if (order.setup.empty() || (order.kind != 0 && order.kind != 1)) return {};
  return order;
}

/// A filter in words; empty where it lets everything through.
template <class Value>
void TellFilter(EngineOutput& log, const char* what, int isBy, int isAll, const std::vector<Value>& listed) {
  if (!isBy) return;
  log.Line(isAll ? fmt::format("  by {}: all", what) : fmt::format("  by {}: {}", what, fmt::join(listed, ", ")));
}

void Tell(const CResultsPTRegExtractionItemKvf& job, EngineOutput& log) {
  log.Line(job.AllLayerExtractionCheck ? "  particles of all layers"
                                       : fmt::format("  particles of layers {} to {}", job.TopLayer, job.BottomLayer));
  if (!job.AllRelDateExtractionCheck)
    log.Line(
        fmt::format("  released between {} and {}", job.StartDate.Format("%Y-%m-%d"), job.EndDate.Format("%Y-%m-%d")));
  if (!job.AllTrvTimesExtrCheck) log.Line(fmt::format("  that travelled {} to {} years", job.StartYear, job.EndYear));
  if (job.OnlyRemovedByWellCheck) log.Line("  removed ones alone");
  std::vector<std::string> sinks;
  for (const int code : job.SinkCodes) sinks.emplace_back(TextOf(kSinkCodes, code));
  TellFilter(log, "destination well", job.ExtrByWellCheck, job.ExtrAllWellsCheck, job.WellNames);
  TellFilter(log, "destination sink", job.ExtrBySinkCodeCheck, job.ExtrAllSinkCodesCheck, sinks);
  TellFilter(log, "destination well field", job.ExtrByWellFieldCheck, job.ExtrAllWellFieldsCheck, job.WellFieldNames);
  TellFilter(log, "destination registration code", job.ExtrByRegCodeCheck, job.ExtrAllRegCodesCheck, job.RegCodes);
  log.Line(fmt::format("  into {}{}", job.SeparateFilesCheck ? "a shape file for each item" : "one shape file",
                       job.AdditionalTextFile ? " and a text file" : ""));
}

void Tell(const CResultsPTPathlineExtractionItemKvf& job, EngineOutput& log) {
  log.Line(job.ExtrAllParticlesCheck ? "  all particles"
                                     : fmt::format("  particles {}", fmt::join(job.ParticleIDs, ", ")));
  if (job.CreateTextFile) log.Line("  into a text file");
  if (job.CreateXMLFile) log.Line(job.CompressedXMLFormat ? "  into a compressed XML file" : "  into an XML file");
}

template <class List>
EngineStatus TellJobs(const List* list, const char* kind, int chosen, EngineOutput& log) {
  const int count = list ? list->GetItemCount() : 0;
  if (count == 0 || chosen == 0 || chosen < kAllJobs || chosen > count) {
    log.Error({}, fmt::format("the setup has no {} extraction{}", kind,
                              chosen == kAllJobs ? std::string() : fmt::format(" of number {}", chosen)));
    return kEngineFailed;
  }
  for (int number = 1; number <= count; ++number) {
    if (chosen != kAllJobs && chosen != number) continue;
    log.Progress(100 * (number - 1) / count, fmt::format("{}, a {} extraction", list->GetItem(number)->Name, kind));
    Tell(*list->GetItem(number), log);
  }
  log.Line("This program makes no files: it tells what an extraction would take.");
  log.Progress(100, "Done");
  return kEngineDone;
}

}  // namespace

EngineStatus RunExtractionProgram(const std::vector<std::string>& arguments, std::ostream& out) {
  EngineOutput log(out);
  const std::optional<ExtractionOrder> order = OrderOf(arguments);
  if (!order) {
    log.Error({}, "usage: PTRetrieval_Launch SETUP.tvd /Engine 0|1 /SelPostProc NUMBER|-1");
    return kEngineCouldNot;
  }
  CFlowModelDoc document;
  if (!document.OnOpenDocument(order->setup)) {
    log.Error({}, document.Error());
    return kEngineFailed;
  }
  const auto* processing = document.Root().Important(kPostProcessing);
  if (!processing) return kEngineFailed;
  return order->kind == 0 ? TellJobs(processing->Child<CResultsPTRegExtractionKvf>(), "registration", order->job, log)
                          : TellJobs(processing->Child<CResultsPTPathlineExtractionKvf>(), "pathline", order->job, log);
}

}  // namespace tervane
