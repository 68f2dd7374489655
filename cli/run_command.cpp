// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <chrono>
#include <thread>
#include <vector>

#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/offers.h"
#include "cli/parts/difference_text.h"
#include "cli/parts/json.h"
#include "cli/parts/setup_file.h"
#include "document/run_inputs.h"
#include "execution/engine_line.h"
#include "execution/run_log.h"
#include "execution/run_passport.h"
#include "execution/setup_run.h"
#include "platform/os_process.h"
#include "platform/paths.h"

namespace tervane {

namespace {

/// What `run` was asked for.
struct RunOptions {
  std::string file;
  std::string argument;  ///< "/PP", "/WM", "/WQ", or empty: what the setup says.
  std::string engines;   ///< Folders of engines; may be empty.
  bool json = false;
  bool verify = false;
};

constexpr std::chrono::milliseconds kInterval{50};
constexpr std::size_t kBlock = 256u << 10;
constexpr std::size_t kMostMessages = 500;

/// Runs engines while the command waits.
class TerminalShell : public EngineShell {
 public:
  TerminalShell(const CFlowModelDoc& document, const RunOptions& options, Streams streams)
      : document_(document), options_(options), streams_(streams) {}

  int Status() const { return status_; }

  Host& Outside() override { return nobody_; }
  bool HasChanges() const override { return false; }
  bool DoFileSave() override { return false; }
  bool IsShiftHeld() const override { return false; }
  bool IsExecuting() const override { return false; }
  void Start(const CYbSimpleLaunch& launch, bool showsProgress) override;

 private:
  void Follow(SetupRun& run);
  void CopyLog(LogReader& log, LineCutter& cutter);
  /// Passes lines of the engine on, and keeps its messages.
  void Take(const LogPiece& lines);
  void Report(const SetupRun& run, const std::string& sentence);

  const CFlowModelDoc& document_;
  const RunOptions& options_;
  Streams streams_;
  NobodyToAsk nobody_;
  std::vector<EngineMessage> messages_;
  bool isInterrupted_ = false;
  int status_ = kCouldNot;
};

void TerminalShell::Start(const CYbSimpleLaunch& launch, bool /*showsProgress*/) {
  std::string problem;
  SetupRun run;
  const EnginePlaces places = options_.engines.empty() ? EnginePlaces::Here({}) : EnginePlaces::Only(options_.engines);
  std::optional<RunRequest> request = RequestOf(launch, document_.getResultFolder(), places, problem);
  if (request) PreparePassport(document_, *request);
  os::KeepEndRequests();
  if (!request || !run.Start(*request, problem)) {
    Report(run, problem);
    return;
  }
  Follow(run);
  run.MarkReported();
  const RunOutcome outcome = run.Outcome();
  if (outcome != RunOutcome::NotStarted) status_ = outcome == RunOutcome::Done ? kDone : kFindings;
  Report(run, OutcomeSentence(run.State()));
  if (isInterrupted_) status_ = kInterrupted;
}

void TerminalShell::Follow(SetupRun& run) {
  LogReader log(run.Files().log);
  LineCutter cutter;
  for (;;) {
    const bool isOver = !run.Look();
    // Before the engine was started, the log is that of an earlier run.
    if (run.State().program) CopyLog(log, cutter);
    if (isOver) break;
    for (int requests = os::TakeEndRequests(); requests > 0; --requests) {
      if (!isInterrupted_) fmt::print(streams_.err, "{}: stopping the engine\n", options_.file);
      isInterrupted_ = true;
      run.Stop();
    }
    std::this_thread::sleep_for(kInterval);
  }
  Take(cutter.Rest());
}

void TerminalShell::CopyLog(LogReader& log, LineCutter& cutter) {
  for (std::string bytes = log.Read(kBlock); !bytes.empty(); bytes = log.Read(kBlock)) Take(cutter.Cut(bytes));
  streams_.out.flush();
  streams_.err.flush();
}

void TerminalShell::Take(const LogPiece& lines) {
  for (std::size_t i = 0; i < lines.Count(); ++i) {
    const std::string_view line = lines.Line(i);
    // How far it is, is no result.
    const bool isResult = !options_.json && !EngineProgressOf(line);
    (isResult ? streams_.out : streams_.err) << line << '\n';
    if (messages_.size() >= kMostMessages) continue;
    if (std::optional<EngineMessage> message = EngineMessageOf(line)) messages_.push_back(std::move(*message));
  }
}

void TerminalShell::Report(const SetupRun& run, const std::string& sentence) {
  fmt::print(streams_.err, "{}: {}\n", options_.file, sentence);
  if (!options_.json) return;
  const RunState& state = run.State();
  const auto optional = [](const std::string& text) { return text.empty() ? std::string() : JsonQuoted(text); };
  const bool hasEnded = state.program && state.HasEnded();
  std::vector<std::string> findings;
  for (const EngineMessage& message : messages_)
    findings.push_back(JsonObject({{"severity", JsonQuoted(message.isError ? "error" : "warning")},
                                   {"place", optional(message.place)},
                                   {"text", JsonQuoted(message.text)}}));
  const RunOutcome outcome = status_ == kCouldNot ? RunOutcome::NotStarted : run.Outcome();
  fmt::print(streams_.out, "{}\n",
             JsonObject({{"setup", JsonQuoted(options_.file)},
                         {"outcome", JsonQuoted(OutcomeName(outcome))},
                         {"text", JsonQuoted(sentence)},
                         {"engine", optional(state.engine)},
                         {"options", optional(state.options)},
                         {"exitStatus", hasEnded && state.end.signal == 0 ? std::to_string(state.end.status) : ""},
                         {"signal", hasEnded && state.end.signal != 0 ? std::to_string(state.end.signal) : ""},
                         {"seconds", hasEnded ? fmt::format("{:.3f}", double(state.ended - state.begun) / 1000) : ""},
                         {"log", state.program ? JsonQuoted(run.Files().log) : ""},
                         {"findings", JsonArray(findings)}}));
}

// ---- Verifying

void PrintJson(const RunPassport& passport, const std::vector<InputChange>& changes,
               const std::vector<SetupDifference>& differences, Streams streams) {
  std::vector<std::string> inputs, ofSetup;
  for (const InputChange& change : changes)
    inputs.push_back(JsonObject({{"file", JsonQuoted(change.path)}, {"text", JsonQuoted(NameOf(change.fate))}}));
  for (const SetupDifference& difference : differences) ofSetup.push_back(DifferenceJson(difference));
  const auto optional = [](const std::string& text) { return text.empty() ? std::string() : JsonQuoted(text); };
  fmt::print(streams.out, "{}\n",
             JsonObject({{"begun", JsonQuoted(passport.begun)},
                         {"ended", optional(passport.ended)},
                         {"outcome", optional(passport.outcome)},
                         {"engine", JsonQuoted(passport.engine)},
                         {"options", optional(passport.options)},
                         {"user", JsonQuoted(passport.user)},
                         {"host", JsonQuoted(passport.host)},
                         {"inputs", JsonArray(inputs)},
                         {"differences", JsonArray(ofSetup)}}));
}

/// Tells what of the latest run's setup and inputs is no longer as it was, by their content.
int VerifyRun(const std::string& setup, bool json, Streams streams) {
  CFlowModelDoc document;
  if (!OpenSetup(document, setup, streams)) return kCouldNot;
  const PassportFiles files = PassportFilesOf(ResolvedPath(document.getResultFolder(), {}), document.PathName());
  std::string problem;
  const std::optional<RunPassport> passport = ReadPassport(files.passport, problem);
  if (!passport) {
    fmt::print(streams.err, "{}: {}\n", setup,
               problem.empty() ? "there are no results of a run that left a passport" : problem);
    return kCouldNot;
  }
  std::vector<InputChange> changes = ChangedInputs(*passport, false);
  std::vector<SetupDifference> differences;
  CFlowModelDoc before;
  if (FileExists(files.setup) && before.OnOpenDocument(files.setup)) {
    differences = CompareDocuments(before, document);
    // Its text may be another and mean the same.
    std::erase_if(changes, [&](const InputChange& change) {
      return change.path == passport->setup && change.fate == InputFate::Changed && differences.empty();
    });
  }
  const bool isSame = changes.empty() && differences.empty();
  if (json) {
    PrintJson(*passport, changes, differences, streams);
    return isSame ? kDone : kFindings;
  }
  fmt::print(streams.err, "{}: the results are of the run that began {} UTC on host {}. {}\n", setup, passport->begun,
             passport->host, passport->outcome.empty() ? "Its end is not known." : passport->outcome);
  for (const InputChange& change : changes) fmt::print(streams.out, "{}: {}\n", change.path, NameOf(change.fate));
  for (const SetupDifference& difference : differences) fmt::print(streams.out, "{}\n", DifferenceLine(difference));
  if (isSame) fmt::print(streams.err, "{}: setup and inputs are as they were\n", setup);
  return isSame ? kDone : kFindings;
}

int RunCommand(const RunOptions& options, Streams streams) {
  if (options.verify) return VerifyRun(options.file, options.json, streams);
  CFlowModelDoc document;
  if (!OpenSetup(document, options.file, streams)) return kCouldNot;
  TerminalShell shell(document, options, streams);
  document.SetEngineShell(&shell);
  document.RunEngine(options.argument);
  return shell.Status();
}

}  // namespace

void OfferRunCommand(CommandOffers& offers) {
  auto options = std::make_shared<RunOptions>();
  Command runs = offers.Offer("run", "Run a setup with its engine and wait for the end",
                              [offers, options] { return RunCommand(*options, offers.Output()); });
  AddSetup(runs, options->file);
  runs.Footer(
      "What the engine says goes to the output, how far it is and how it ended to the error stream. Ctrl-C stops the\n"
      "engine. Exit status:\n"
      "0 done, 1 the engine failed or was stopped, 2 not started.");
  const auto part = [&](const char* name, const char* argument, const char* description) {
    return runs.AddFlag(
        name, [options, argument] { options->argument = argument; }, description);
  };
  CommandOption preprocessor = part("--pp", "/PP", "The preprocessor alone, whatever the setup says");
  CommandOption waterMovement = part("--wm", "/WM", "Water movement alone").Excludes(preprocessor);
  part("--wq", "/WQ", "Water quality alone").Excludes(preprocessor).Excludes(waterMovement);
  runs.Add("--engines", options->engines,
           "The folder of the engines; without it TERVANE_ENGINES, or engines/ beside the program");
  runs.AddFlag("--verify", options->verify,
               "Run nothing: tell what has changed since the run that made the results, in the setup and in the files "
               "that it names; exit status 1 when something has");
  runs.AddFlag("--json", options->json, "How it ended as JSON; what the engine says goes to the error stream");
}

}  // namespace tervane
