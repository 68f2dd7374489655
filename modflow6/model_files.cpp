// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "modflow6/model_files.h"

#include <algorithm>
#include <cmath>
#include <filesystem>
#include <set>

#include <fmt/format.h>

#include "data/datafile.h"
#include "modflow6/array_files.h"
#include "platform/paths.h"
#include "platform/progress.h"
#include "platform/text.h"

namespace tervane::modflow6 {

namespace {

std::string NumberText(double value) {
  std::string text;
  AppendNumber(text, value);
  return text;
}

/// The text of an input file: blocks of lines.
class BlockText {
 public:
  explicit BlockText(std::string_view title) { text_ = fmt::format("# {}\n", OneLine(std::string(title))); }

  void Begin(std::string_view name) { text_ += fmt::format("BEGIN {}\n", name), name_ = name; }
  void Line(std::string_view line) { text_ += fmt::format("  {}\n", line); }
  /// A line that stands while the flag holds.
  void Line(std::string_view line, bool flag) {
    if (flag) Line(line);
  }
  /// Ends the block; of "PERIOD 3" the name is all of it.
  void End() { text_ += fmt::format("END {}\n\n", name_); }
  /// The text so far, which is taken out.
  std::string Take() { return std::exchange(text_, {}); }
  std::string& Text() { return text_; }

 private:
  std::string text_, name_;
};

class ModelFiles {
 public:
  ModelFiles(const FlowModel& model, std::string folder, Modflow6Options::Arrays form, WorkLog& log,
             std::vector<std::string>& written)
      : model_(model),
        folder_(std::move(folder)),
        log_(log),
        written_(written),
        arrays_(model.geometry, folder_, form, log, written) {}

  std::string Write() {
    struct Step {
      const char* doing;
      std::string (ModelFiles::*write)();
    };
    constexpr Step kSteps[] = {
        {"Periods", &ModelFiles::WriteTdis},      {"Grid", &ModelFiles::WriteDis},
        {"Ground", &ModelFiles::WriteNpf},        {"Storage", &ModelFiles::WriteSto},
        {"Initial heads", &ModelFiles::WriteIc},  {"Boundaries", &ModelFiles::WriteStresses},
        {"Recharge", &ModelFiles::WriteRecharge}, {"Evapotranspiration", &ModelFiles::WriteEvapotranspiration},
        {"Solver", &ModelFiles::WriteIms},        {"Output control", &ModelFiles::WriteOutput},
        {"Names", &ModelFiles::WriteNames}};
    constexpr int kBegin = 50, kEnd = 99;
    int done = 0;
    for (const Step& step : kSteps) {
      if (log_.IsCancelled()) return kCancelled;
      log_.Progress(kBegin + (kEnd - kBegin) * done++ / static_cast<int>(std::size(kSteps)), step.doing);
      if (std::string problem = (this->*step.write)(); !problem.empty()) return problem;
      if (!arrays_.Problem().empty()) return arrays_.Problem();
    }
    return {};
  }

 private:
  std::string File(std::string_view extension) const { return fmt::format("{}.{}", model_.name, extension); }

  std::string Put(const std::string& file, std::string_view text) {
    OutputFile output(fmt::format("{}/{}", folder_, file));
    output.Write(text);
    written_.push_back(file);
    return output.Close();
  }
  BlockText NewText(std::string_view package) const {
    return BlockText(fmt::format("{} of {}", package, model_.title));
  }

  /// A package of the model, for its name file.
  void Register(std::string_view type, const std::string& file, std::string_view name) {
    packages_.push_back(fmt::format("{}6 {} {}", type, file, name));
  }

  // ---- Time

  std::string WriteTdis() {
    BlockText text = NewText("TDIS");
    const bool isAdaptive = std::ranges::any_of(model_.periods, [](const Period& p) { return p.adaptive.has_value(); });
    text.Begin("OPTIONS");
    text.Line("TIME_UNITS DAYS");
    text.Line(fmt::format("START_DATE_TIME {}", model_.periods.front().start.Format("%Y-%m-%dT%H:%M:%S")));
    text.Line(fmt::format("ATS6 FILEIN {}", File("ats")), isAdaptive);
    text.End();
    text.Begin("DIMENSIONS");
    text.Line(fmt::format("NPER {}", model_.periods.size()));
    text.End();
    text.Begin("PERIODDATA");
    for (const Period& period : model_.periods)
      text.Line(fmt::format("{} {} {}", NumberText(period.days), period.steps, NumberText(period.multiplier)));
    text.End();
    if (std::string problem = Put(File("tdis"), text.Take()); !problem.empty() || !isAdaptive) return problem;
    return WriteAts();
  }

  std::string WriteAts() {
    BlockText text = NewText("ATS");
    text.Begin("DIMENSIONS");
    text.Line(fmt::format("MAXATS {}", std::ranges::count_if(model_.periods, [](const Period& period) {
                            return period.adaptive.has_value();
                          })));
    text.End();
    text.Begin("PERIODDATA");
    for (std::size_t i = 0; i < model_.periods.size(); ++i)
      if (const auto& steps = model_.periods[i].adaptive)
        text.Line(fmt::format("{} {} {} {} {} {}", i + 1, NumberText(steps->first), NumberText(steps->least),
                              NumberText(steps->most), NumberText(steps->growth), NumberText(steps->cut)));
    text.End();
    return Put(File("ats"), text.Take());
  }

  // ---- Space

  /// An array with a value for each cell of each layer.
  template <class Number, class At>
  void Layered(BlockText& text, std::string_view keyword, const At& at) {
    text.Line(fmt::format("{} LAYERED", keyword));
    for (std::size_t i = 0; i < model_.layers.size(); ++i)
      text.Line("  " + arrays_.Add<Number>(fmt::format("{}_{}", LowerCase(keyword), i + 1),
                                           [&](std::size_t cell) { return at(model_.layers[i], cell); }));
  }

  std::string WriteDis() {
    const GridGeometry& grid = model_.geometry;
    BlockText text = NewText("DIS");
    text.Begin("OPTIONS");
    text.Line("LENGTH_UNITS METERS");
    text.Line(fmt::format("XORIGIN {}", NumberText(grid.x0)));
    text.Line(fmt::format("YORIGIN {}", NumberText(grid.y0)));
    text.Line(fmt::format("ANGROT {}", NumberText(grid.rotation)));
    text.End();
    text.Begin("DIMENSIONS");
    text.Line(fmt::format("NLAY {}", model_.layers.size()));
    text.Line(fmt::format("NROW {}", grid.ny));
    text.Line(fmt::format("NCOL {}", grid.nx));
    text.End();
    text.Begin("GRIDDATA");
    for (const char* side : {"DELR", "DELC"}) {
      text.Line(side);
      text.Line(fmt::format("  CONSTANT {}", NumberText(grid.cellSize)));
    }
    // Cells outside have levels that no one reads.
    const auto known = [](float level) { return level == kDeleteValue ? 0.0 : static_cast<double>(level); };
    text.Line("TOP");
    text.Line("  " + arrays_.Add<double>("top", [&](std::size_t cell) { return known(model_.layers[0].top[cell]); }));
    Layered<double>(text, "BOTM", [&](const Layer& layer, std::size_t cell) { return known(layer.bottom[cell]); });
    Layered<int>(text, "IDOMAIN", [](const Layer& layer, std::size_t cell) { return layer.state[cell]; });
    text.End();
    Register("DIS", File("dis"), "dis");
    return Put(File("dis"), text.Take());
  }

  std::string WriteNpf() {
    BlockText text = NewText("NPF");
    text.Begin("OPTIONS");
    text.Line("SAVE_FLOWS", model_.output.savesCellFlows);
    const bool isAnisotropic =
        std::ranges::any_of(model_.layers, [](const Layer& layer) { return !layer.acrossRows.IsEmpty(); });
    text.Line("K22OVERK", isAnisotropic);
    if (model_.rewetting)
      text.Line(fmt::format("REWET WETFCT {} IWETIT 1 IHDWET 0", NumberText(model_.rewetting->factor)));
    text.End();
    text.Begin("GRIDDATA");
    text.Line("ICELLTYPE");
    text.Line("  CONSTANT 1");
    Layered<double>(text, "K", [](const Layer& layer, std::size_t cell) { return layer.conductivity.At(cell); });
    if (isAnisotropic)
      Layered<double>(text, "K22", [](const Layer& layer, std::size_t cell) {
        return layer.acrossRows.IsEmpty() ? 1 : layer.acrossRows.At(cell);
      });
    Layered<double>(text, "K33", [](const Layer& layer, std::size_t cell) { return layer.vertical.At(cell); });
    if (model_.rewetting)
      Layered<double>(text, "WETDRY", [](const Layer& layer, std::size_t cell) { return layer.wetting.At(cell); });
    text.End();
    Register("NPF", File("npf"), "npf");
    return Put(File("npf"), text.Take());
  }

  std::string WriteSto() {
    if (!model_.hasStorage) return {};
    BlockText text = NewText("STO");
    text.Begin("OPTIONS");
    text.Line("SAVE_FLOWS", model_.output.savesCellFlows);
    text.End();
    text.Begin("GRIDDATA");
    text.Line("ICONVERT");
    text.Line("  CONSTANT 1");
    Layered<double>(text, "SS", [](const Layer& layer, std::size_t cell) { return layer.specificStorage.At(cell); });
    Layered<double>(text, "SY", [](const Layer& layer, std::size_t cell) { return layer.specificYield.At(cell); });
    text.End();
    for (std::size_t i = 0; i < model_.periods.size(); ++i) {
      const bool isSteady = model_.periods[i].isSteady;
      if (i > 0 && isSteady == model_.periods[i - 1].isSteady) continue;
      text.Begin(fmt::format("PERIOD {}", i + 1));
      text.Line(isSteady ? "STEADY-STATE" : "TRANSIENT");
      text.End();
    }
    Register("STO", File("sto"), "sto");
    return Put(File("sto"), text.Take());
  }

  std::string WriteIc() {
    BlockText text = NewText("IC");
    text.Begin("GRIDDATA");
    Layered<double>(text, "STRT", [](const Layer& layer, std::size_t cell) { return layer.initialHead.At(cell); });
    text.End();
    Register("IC", File("ic"), "ic");
    return Put(File("ic"), text.Take());
  }

  // ---- Boundaries

  std::string WriteStresses() {
    for (const StressPackage& package : model_.stresses)
      if (std::string problem = WriteStress(package); !problem.empty()) return problem;
    return {};
  }

  std::string WriteStress(const StressPackage& package) {
    const std::string file = File(package.name);
    OutputFile output(fmt::format("{}/{}", folder_, file));
    written_.push_back(file);
    Register(package.kind, file, package.name);
    BlockText text = NewText(package.kind);
    text.Begin("OPTIONS");
    text.Line("BOUNDNAMES");
    text.Line("SAVE_FLOWS", package.savesFlows);
    text.End();
    text.Begin("DIMENSIONS");
    text.Line(fmt::format("MAXBOUND {}", package.MostEntries()));
    text.End();
    std::vector<std::string> names;
    for (const std::string& name : package.names) names.push_back(QuotedName(name));
    const auto nx = static_cast<std::uint32_t>(model_.geometry.nx);
    for (const auto& [period, entries] : package.entries) {
      text.Begin(fmt::format("PERIOD {}", period + 1));
      std::size_t number = 0;
      for (const StressEntry& entry : entries) {
        constexpr std::size_t kEntriesAtOnce = 4096;
        if (++number % kEntriesAtOnce == 0) {
          if (log_.IsCancelled()) return kCancelled;
          output.Write(text.Take());
        }
        std::string& line = text.Text();
        fmt::format_to(std::back_inserter(line), "  {} {} {} ", entry.layer + 1,
                       model_.geometry.ny - static_cast<int>(entry.cell / nx), entry.cell % nx + 1);
        AppendNumber(line, entry.value);
        if (package.HasConductance()) {
          line += ' ';
          AppendNumber(line, entry.conductance);
        }
        line += ' ';
        line += names[entry.name];
        line += '\n';
      }
      text.End();
    }
    output.Write(text.Take());
    return output.Close();
  }

  /// A name of a boundary: at most 40 characters without quotes.
  static std::string QuotedName(const std::string& name) {
    constexpr std::size_t kMost = 40;
    std::string plain;
    for (const char c : name) plain += c == '\'' || c == '"' || static_cast<unsigned char>(c) < ' ' ? '_' : c;
    plain.resize(std::min(plain.size(), kMost));
    return "'" + plain + "'";
  }

  std::string WriteRecharge() {
    return model_.recharge ? WriteArea("RCH", "RECHARGE", *model_.recharge) : std::string();
  }
  std::string WriteEvapotranspiration() {
    return model_.evapotranspiration ? WriteArea("EVT", "RATE", *model_.evapotranspiration) : std::string();
  }

  std::string WriteArea(const std::string& type, const std::string& rateKeyword, const AreaStress& stress) {
    const std::string extension = LowerCase(type);
    BlockText text = NewText(type);
    text.Begin("OPTIONS");
    text.Line("READASARRAYS");
    text.Line("FIXED_CELL", stress.isFixedToCell);
    text.Line("SAVE_FLOWS", stress.savesFlows);
    text.End();
    std::vector<float> rates;
    for (std::size_t period = 0; period < model_.periods.size(); ++period) {
      bool isNew = true;
      if (FileResult made = stress.rates(period, rates, isNew); !made.Ok()) return made.error;
      if (log_.IsCancelled()) return kCancelled;
      std::vector<std::string> lines;
      const auto add = [&]<class Number>(const std::string& keyword, const std::vector<float>& values, Number) {
        lines.push_back(keyword);
        lines.push_back("  " + arrays_.Add<Number>(fmt::format("{}_{}_{}", extension, LowerCase(keyword), period + 1),
                                                   [&](std::size_t cell) { return values[cell]; }));
      };
      const auto addSpan = [&]<class Number>(const std::string& keyword, const AreaStress::Spans& spans,
                                             Number number) {
        if (const auto begins = spans.find(period); begins != spans.end()) add(keyword, begins->second, number);
      };
      addSpan(type == "RCH" ? "IRCH" : "IEVT", stress.layers, int{});
      addSpan("SURFACE", stress.surfaces, double{});
      if (isNew) add(rateKeyword, rates, double{});
      addSpan("DEPTH", stress.depths, double{});
      if (lines.empty()) continue;
      text.Begin(fmt::format("PERIOD {}", period + 1));
      for (const std::string& line : lines) text.Line(line);
      text.End();
      if (!arrays_.Problem().empty()) return arrays_.Problem();
    }
    Register(type, File(extension), extension);
    return Put(File(extension), text.Take());
  }

  // ---- Solver, output, names

  std::string WriteIms() {
    const Solver& solver = model_.solver;
    BlockText text = NewText("IMS");
    text.Begin("OPTIONS");
    text.Line(fmt::format("PRINT_OPTION {}", solver.printing));
    text.Line("COMPLEXITY COMPLEX", solver.isNewton);
    text.End();
    text.Begin("NONLINEAR");
    text.Line(fmt::format("OUTER_DVCLOSE {}", NumberText(solver.headChange)));
    text.Line(fmt::format("OUTER_MAXIMUM {}", solver.outerIterations));
    text.End();
    text.Begin("LINEAR");
    text.Line(fmt::format("INNER_MAXIMUM {}", solver.innerIterations));
    text.Line(fmt::format("INNER_DVCLOSE {}", NumberText(solver.headChange)));
    text.Line(fmt::format("INNER_RCLOSE {}", NumberText(solver.residual)));
    // Newton-Raphson makes the matrix unsymmetrical.
    text.Line(fmt::format("LINEAR_ACCELERATION {}", solver.isNewton ? "BICGSTAB" : "CG"));
    text.Line(fmt::format("RELAXATION_FACTOR {}", NumberText(solver.relaxation)));
    text.End();
    return Put(File("ims"), text.Take());
  }

  std::string WriteOutput() {
    const OutputControl& output = model_.output;
    BlockText text = NewText("OC");
    text.Begin("OPTIONS");
    text.Line(fmt::format("HEAD FILEOUT {}", File("hds")), output.savesHead);
    text.Line(fmt::format("BUDGET FILEOUT {}", File("cbc")), output.savesBudget);
    text.End();
    for (std::size_t i = 0; i < model_.periods.size(); ++i) {
      const std::string& saving = model_.periods[i].saving;
      if (i > 0 && saving == model_.periods[i - 1].saving) continue;
      text.Begin(fmt::format("PERIOD {}", i + 1));
      if (!saving.empty()) {
        text.Line("SAVE HEAD " + saving, output.savesHead);
        text.Line("SAVE BUDGET " + saving, output.savesBudget);
        text.Line("PRINT HEAD " + saving, output.printsHead);
        text.Line("PRINT BUDGET " + saving, output.printsBudget);
      }
      text.End();
    }
    Register("OC", File("oc"), "oc");
    return Put(File("oc"), text.Take());
  }

  std::string WriteNames() {
    BlockText model = NewText("GWF");
    model.Begin("OPTIONS");
    model.Line(fmt::format("LIST {}", File("lst")));
    model.Line("NEWTON UNDER_RELAXATION", model_.solver.isNewton);
    model.Line("SAVE_FLOWS", model_.output.savesCellFlows);
    model.End();
    model.Begin("PACKAGES");
    for (const std::string& package : packages_) model.Line(package);
    model.End();
    if (std::string problem = Put(File("nam"), model.Take()); !problem.empty()) return problem;

    BlockText simulation = NewText("Simulation");
    const auto block = [&simulation](std::string_view name, std::string_view line) {
      simulation.Begin(name);
      if (!line.empty()) simulation.Line(line);
      simulation.End();
    };
    block("OPTIONS", "");
    block("TIMING", "TDIS6 " + File("tdis"));
    block("MODELS", fmt::format("GWF6 {} {}", File("nam"), model_.name));
    block("EXCHANGES", "");
    block("SOLUTIONGROUP 1", fmt::format("IMS6 {} {}", File("ims"), model_.name));
    return Put("mfsim.nam", simulation.Take());
  }

  const FlowModel& model_;
  std::string folder_;
  WorkLog& log_;
  std::vector<std::string>& written_;
  ArrayFiles arrays_;
  std::vector<std::string> packages_;
};

}  // namespace

FileResult WriteModelFiles(const FlowModel& model, const std::string& folder, Modflow6Options::Arrays arrays,
                           WorkLog& log, std::vector<std::string>& written) {
  std::error_code error;
  std::filesystem::create_directories(NativePath(folder + "/arrays"), error);
  if (error) return {fmt::format("cannot make the folder {}/arrays: {}", folder, error.message()), {}};
  return {ModelFiles(model, folder, arrays, log, written).Write(), {}};
}

}  // namespace tervane::modflow6
