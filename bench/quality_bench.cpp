// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Setups of many species, processes and layers, each of which repeats the others, that are opened, saved and edited;
// and large process templates.
#include <filesystem>
#include <memory>
#include <string>
#include <vector>

#include <fmt/format.h>
#include <unistd.h>

#include "bench/median_table.h"
#include "bench/whole_setup.h"
#include "platform/files.h"
#include "simspec/model_components.h"
#include "subsurface/computational_layers.h"
#include "subsurface/saturated_zone.h"
#include "wqpt/kinetra_specification.h"
#include "wqpt/kinetra_template.h"
#include "wqpt/kinetra_values.h"
#include "wqpt/processes.h"
#include "wqpt/species.h"
#include "wqpt/water_quality_layers.h"

namespace tervane::bench {

namespace {

struct Size {
  const char* label;
  int species, decays, sorptions, qualityLayers, computationalLayers;
};
constexpr Size kSmall{"20 species", 20, 10, 10, 10, 10};
/// A tenth of the entries of the full one.
constexpr Size kTenth{"a tenth of the full size", 64, 32, 32, 16, 6};
constexpr Size kFull{"200 species", 200, 100, 100, 50, 20};

void Fill(CFlowModelDoc& setup, const Size& size) {
  CYbSEKvfGlobalBase& root = setup.Root();
  CProcessesWQKvf& processes = *root.Important(kProcesses);
  root.Important(kWaterQualityLayers)->SetItemCount(size.qualityLayers, 1);
  root.Important(kSaturatedZone)->OwnLayers().SetItemCount(size.computationalLayers, 1);
  for (int i = 0; i < size.species; ++i) root.Important(kSpecies)->AddItem();
  for (int i = 0; i < size.decays; ++i) processes.Decays().AddItem()->Species = fmt::format("Species_{}", i + 1);
  for (int i = 0; i < size.sorptions; ++i) processes.Sorptions().AddItem()->Species = fmt::format("Species_{}", i + 1);
}

/// Opened and saved.
struct StoredSetup {
  std::string label, text;
  CFlowModelDoc setup;

  StoredSetup(const Size& size, MedianTable& table) : label(size.label) {
    Fill(setup, size);
    text = TextOf(setup);
    fmt::print("{}: {} bytes, {} nodes\n", label, text.size(), NodesBelow(setup.Root()));
    table.Add(
        "open " + label, [] { return std::make_unique<CFlowModelDoc>(); },
        [this](auto& opened) {
          if (!opened->OpenText(text, "/setups/quality.tvd")) fmt::print("WRONG: not opened: {}\n", opened->Error());
          return opened.get();
        });
    table.Add("save " + label, [this] { return TextOf(setup); });
  }
};

struct EditedSpecies : EditedSetup {
  CSpeciesListKvf& species = *session->Document().Root().Important(kSpecies);

  /// What an edit of a value and one of the list may take, in milliseconds.
  EditedSpecies(const Size& size, double value, double structure, MedianTable& table) : EditedSetup(size.label) {
    Fill(session->Document(), size);
    session->UpdateDoc(species, 1, "Make Species");
    fmt::print("editing {}: {} MB\n", label, memory.Megabytes());
    Add(table, "type a value", value, 1, [this]() -> CYbSEKvfBase& {
      auto& topography = *session->Document().Root().Important(kTopography);
      topography.FixedValue += 1;
      return topography;
    });
    AddUndo(table, 2 * value);
    Add(table, "rename a species", structure, 1, [this]() -> CYbSEKvfBase& {
      CSpeciesItemKvf& item = *species.GetItem(1);
      item.SetName(item.GetName() + "x");
      return species;
    });
    Add(table, "move a species", structure, 1, [this]() -> CYbSEKvfBase& {
      species.MoveItemDown(1, 1);
      return species;
    });
    Add(table, "add a species", structure, 2, [this]() -> CYbSEKvfBase& {
      species.InsertItem(2, 1);
      return species;
    });
    Add(table, "delete a species", structure, 4, [this]() -> CYbSEKvfBase& {
      species.DeleteItem(2, 1);
      return species;
    });
  }
};

/// A template of so many constants and as many forcings.
std::string TemplateText(int each) {
  std::string text = "target KINETRA_SETUP {\n";
  for (const char* kind : {"CONSTANT", "FORCING"}) {
    text += fmt::format("section {}S {{\n", kind);
    for (int i = 1; i <= each; ++i)
      text += fmt::format(
          "section {0}_{1} {{\nSYMBOL = \"{2}{1}\"\nID = {1}\nDESCRIPTION = \"Number {1}\"\nUNIT = \"g/m^3\"\n"
          "DEFAULT_VALUE = 1\nMIN_VALUE = 0\nMAX_VALUE = 2\nSCOPE = \"WC\"\n}}\n",
          kind, i, kind[0]);
    text += "}\n";
  }
  return text + "}\n";
}

int Run(int argc, char** argv) {
  namespace fs = std::filesystem;
  const fs::path folder = fs::temp_directory_path() / fmt::format("tervane_quality_bench_{}", getpid());
  fs::create_directories(folder);

  MedianTable table(11);
  const StoredSetup small(kSmall, table), tenth(kTenth, table), full(kFull, table);
  table.LimitTime("open " + small.label, 100);
  table.LimitTime("open " + full.label, 2000);
  table.LimitTime("save " + full.label, 1500);
  for (const char* what : {"open ", "save "}) table.Limit(what + full.label, what + tenth.label, 20);
  const EditedSpecies editedSmall(kSmall, 20, 20, table), editedTenth(kTenth, 50, 100, table),
      editedFull(kFull, 50, 100, table);
  for (std::size_t i = 0; i < editedFull.names.size(); ++i) table.Limit(editedFull.names[i], editedTenth.names[i], 20);

  constexpr int kSymbols = 5000;
  int number = 0;
  const auto write = [&] {
    std::string path = (folder / fmt::format("large_{}.kinetra", ++number)).string();
    if (const FileResult written = WriteFileAtomically(path, TemplateText(kSymbols)); !written.Ok())
      fmt::print("WRONG: {}\n", written.error);
    return path;
  };
  // A file that was read before is known: each is another one.
  table.Add("read a template of 10,000 symbols", write,
            [](const std::string& path) { return ReadKinetraTemplate(path)->constants.size(); });
  table.LimitTime("read a template of 10,000 symbols", 50);
  const FileName known(write(), "/setups");
  const auto keepKnown = ReadKinetraTemplate(known.Absolute());
  const auto take = [&](CFlowModelDoc& setup) {
    setup.Root().Important(kKinetraSpecification)->SetTemplate(kKinetraOverland, known, true);
    const int count = setup.Root().Important(kKinetraConstantsOverland)->GetItemCount();
    if (count != kSymbols) fmt::print("WRONG: {} constants\n", count);
    return count;
  };
  table.Add(
      "take a template of 10,000 symbols", [] { return std::make_unique<CFlowModelDoc>(); },
      [&](auto& setup) { return take(*setup); });
  CFlowModelDoc inStep;
  inStep.Root().Important(kModelComponents)->WQ = 1;
  CModelCompWQKvf& quality = *inStep.Root().Important(kWaterQualityComponents);
  quality.OL = quality.IncludeProcesses = 1;
  quality.ProcessType = kKinetra;
  inStep.Root().Important(kKinetraSpecification)->Solver(kKinetraOverland).enabled = 1;
  take(inStep);
  table.Add("bring the values of 10,000 symbols in step",
            [&] { return inStep.Root().Important(kKinetraSpecification)->RefreshTemplates(); });
  table.LimitTime("bring the values of 10,000 symbols in step", 50);
  table.Run(argc, argv);
  fs::remove_all(folder);
  return 0;
}

}  // namespace

}  // namespace tervane::bench

int main(int argc, char** argv) { return tervane::bench::Run(argc, argv); }
