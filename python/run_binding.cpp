// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <pybind11/stl.h>

#include "document/run_inputs.h"
#include "execution/engine_line.h"
#include "execution/run_log.h"
#include "execution/setup_run.h"
#include "platform/paths.h"
#include "python/bindings.h"
#include "results/result_catalogue_file.h"
#include "results/statistics_report.h"
#include "simspec/periods.h"

namespace py = pybind11;
using namespace py::literals;

namespace tervane::python {

namespace {

/// A run that goes on without anybody: what is asked of it is read from its files.
struct Run {
  explicit Run(SetupRun started) : run(std::move(started)), log(run.Files().log) {}

  SetupRun run;
  LogReader log;
  LineCutter cutter;
};

/// Starts an engine for a document that is on disk.
class Starter : public EngineShell {
 public:
  Starter(const CFlowModelDoc& document, const std::string& engines) : document_(document), engines_(engines) {}

  Host& Outside() override { return nobody_; }
  bool HasChanges() const override { return false; }
  bool DoFileSave() override { return false; }
  bool IsShiftHeld() const override { return false; }
  bool IsExecuting() const override { return false; }
  void Start(const CYbSimpleLaunch& launch, bool /*showsProgress*/) override {
    const EnginePlaces places = engines_.empty() ? EnginePlaces::Here({}) : EnginePlaces::Only(engines_);
    std::optional<RunRequest> request = RequestOf(launch, document_.getResultFolder(), places, problem);
    if (request) PreparePassport(document_, *request);
    isStarted = request && run.Start(*request, problem);
  }

  SetupRun run;
  bool isStarted = false;
  std::string problem = "nothing was started";

 private:
  const CFlowModelDoc& document_;
  const std::string& engines_;
  NobodyToAsk nobody_;
};

std::shared_ptr<Run> StartRun(OpenSetup& setup, const std::string& part, const std::string& engines) {
  CFlowModelDoc& document = setup.Document();
  if (document.PathName().empty()) Raise("SetupError", "the setup was never saved: save it before it runs");
  Starter starter(document, engines);
  document.SetEngineShell(&starter);
  document.RunEngine(part);
  document.SetEngineShell(nullptr);
  setup.Keys().Forget();
  if (!starter.isStarted) Raise("RunError", starter.problem);
  return std::make_shared<Run>(std::move(starter.run));
}

/// The lines that came since the last call; at the end also one that was not ended.
std::vector<std::string> LinesOf(Run& run, bool isOver) {
  constexpr std::size_t kBlock = std::size_t{256} << 10;
  std::vector<std::string> lines;
  const auto take = [&lines](const LogPiece& piece) {
    for (std::size_t i = 0; i < piece.Count(); ++i) lines.emplace_back(piece.Line(i));
  };
  // Before the engine was started, the log is that of an earlier run.
  if (run.run.State().program)
    for (std::string bytes = run.log.Read(kBlock); !bytes.empty(); bytes = run.log.Read(kBlock))
      take(run.cutter.Cut(bytes));
  if (isOver) take(run.cutter.Rest());
  return lines;
}

py::dict StateOf(const Run& run) {
  const RunState& state = run.run.State();
  return py::dict("outcome"_a = std::string(OutcomeName(run.run.Outcome())), "text"_a = OutcomeSentence(state),
                  "engine"_a = state.engine, "log"_a = run.run.Files().log,
                  "seconds"_a = state.HasEnded() ? static_cast<double>(state.ended - state.begun) / 1000 : 0.0);
}

py::object MeaningOf(const std::string& line) {
  if (const auto progress = EngineProgressOf(line))
    return py::make_tuple("progress", progress->percent, progress->text);
  if (const auto message = EngineMessageOf(line))
    return py::make_tuple(message->isError ? "error" : "warning", message->place, message->text);
  return py::none();
}

py::tuple StoredResults(OpenSetup& setup) {
  const CFlowModelDoc& document = setup.Document();
  std::vector<CatalogueProblem> problems;
  const CatalogueFiles files{ResolvedPath(document.SimulationCatalogue(), {}),
                             ResolvedPath(document.WaterQualityCatalogue(), {})};
  py::list items, texts;
  for (const StoredItem& item : ReadCatalogues(ModelCompOf(document.Root()), files, problems).items)
    items.append(
        py::dict("name"_a = item.name, "path"_a = item.path, "item"_a = item.item, "data_type"_a = item.dataType));
  for (const CatalogueProblem& problem : problems) texts.append(problem.path + ": " + problem.text);
  return py::make_tuple(items, texts);
}

struct NamedFigure {
  const char* name;
  std::optional<double> RunStatistics::*figure;
};
constexpr NamedFigure kFigures[] = {
    {"mean_error", &RunStatistics::meanError},
    {"mean_absolute_error", &RunStatistics::meanAbsoluteError},
    {"root_mean_square_error", &RunStatistics::rootMeanSquareError},
    {"residual_deviation", &RunStatistics::residualDeviation},
    {"correlation", &RunStatistics::correlation},
    {"nash_sutcliffe", &RunStatistics::nashSutcliffe},
    {"kling_gupta", &RunStatistics::klingGupta},
    {"percent_bias", &RunStatistics::percentBias},
};

py::list StatisticsOfRun(OpenSetup& setup, std::optional<std::int64_t> start, std::optional<std::int64_t> end) {
  const CFlowModelDoc& document = setup.Document();
  ComparedPeriod period;
  if (const auto* simulation = document.Root().Important(kSimulationPeriod))
    period = {simulation->GetSimStartDate(), simulation->SIMEND};
  if (start) period.start = CYbDateTime::FromSecondsSinceEpoch(*start);
  if (end) period.end = CYbDateTime::FromSecondsSinceEpoch(*end);
  std::vector<DetailedPoint> points;
  const FileResult read = ReadDetailedPoints(ResolvedPath(document.PreprocessorReport(), {}), points);
  RaiseProblem(read.error);
  StatisticsTable table;
  {
    const py::gil_scoped_release others;
    ComputeStatistics(points, period, DisplayUnits(), table);
  }
  RaiseProblem(table.stopped);
  py::list rows;
  for (const PointStatistics& row : table.rows) {
    py::dict figures("name"_a = row.point.name, "data_type"_a = row.point.dataType, "unit"_a = row.unit,
                     "x"_a = row.point.x, "y"_a = row.point.y, "layer"_a = row.point.layer,
                     "pairs"_a = row.figures.pairs, "problem"_a = row.problem);
    for (const NamedFigure& named : kFigures) figures[named.name] = row.figures.*named.figure;
    rows.append(figures);
  }
  return rows;
}

}  // namespace

void BindRuns(py::module_& module) {
  py::class_<Run, std::shared_ptr<Run>>(module, "Run")
      .def("look", [](Run& run) { return run.run.Look(); })
      .def("lines", &LinesOf, "is_over"_a)
      .def("state", &StateOf)
      .def("stop", [](Run& run) { return run.run.Stop(); })
      .def("mark_reported", [](Run& run) { run.run.MarkReported(); });
  module.def("start_run", &StartRun, "setup"_a, "part"_a, "engines"_a);
  module.def("meaning_of", &MeaningOf, "line"_a);
  module.def("stored_results", &StoredResults, "setup"_a);
  module.def("statistics", &StatisticsOfRun, "setup"_a, "start"_a, "end"_a);
}

}  // namespace tervane::python
