// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "cli/command_line.h"

#include <algorithm>
#include <map>
#include <tuple>

#include <CLI/CLI.hpp>

#include "cli/commands.h"
#include "cli/completion.h"

namespace tervane {

namespace {

/// What the user typed.
struct Typed {
  std::string file, secondFile, path, value;
  bool all = false, coverage = false, force = false, json = false, markdown = false, paths = false;
};

}  // namespace

int RunCommandLine(const std::vector<std::string>& arguments, std::ostream& out, std::ostream& err) {
  CLI::App app{"Checks, shows and changes setups of the integrated catchment model Tervane.", "tervane"};
  app.footer(
      "A PATH is section names joined by /, with #n behind a name for the n-th of equal names and :KEY for a key:\n"
      "SimSpec/SimTitle:Title. Exit status: 0 done, 1 findings or differences, 2 could not.");
  app.require_subcommand(1);
  app.set_version_flag("--version", "tervane 0.1.0");

  Typed typed;
  const Streams streams{out, err};
  int status = kDone;
  const auto command = [&](const char* name, const char* description, auto run) {
    CLI::App* subcommand = app.add_subcommand(name, description);
    subcommand->callback([&status, run] { status = run(); });
    return subcommand;
  };
  const auto withFile = [&](CLI::App* subcommand) {
    subcommand->add_option("FILE", typed.file, "The setup (.tvd)")->required();
    return subcommand;
  };
  const auto withPath = [&](CLI::App* subcommand, const char* description) {
    return subcommand->add_option("PATH", typed.path, description);
  };

  CLI::App* create = withFile(
      command("new", "Write a setup with all defaults", [&] { return NewCommand(typed.file, typed.force, streams); }));
  create->add_flag("--force", typed.force, "Replace a file that exists, also where an editor has it open");

  CLI::App* check =
      withFile(command("check", "List errors, warnings, notes and what the file holds that nothing reads", [&] {
        return typed.coverage ? CoverageCommand(typed.file, typed.json, streams)
                              : CheckCommand(typed.file, typed.json, streams);
      }));
  check->add_flag("--json", typed.json, "As JSON");
  check->add_flag("--coverage", typed.coverage,
                  "Instead, how the data cover simulation and domain, and what the forcings come to each year");

  CLI::App* tree = withFile(command("tree", "List the nodes that take part", [&] {
    const TreeForm form = typed.json ? TreeForm::Json : typed.paths ? TreeForm::Paths : TreeForm::Text;
    return TreeCommand(typed.file, typed.all, form, streams);
  }));
  tree->add_flag("--all", typed.all, "Also the nodes that take no part");
  tree->add_flag("--paths", typed.paths, "One PATH a line");
  tree->add_flag("--json", typed.json, "As JSON");

  withPath(withFile(command("show", "Show nodes with their keys, as they would be saved",
                            [&] { return ShowCommand(typed.file, typed.path, streams); })),
           "The node; without it the whole setup");

  CLI::App* why = withFile(command("why", "Tell why a node takes part or not",
                                   [&] { return WhyCommand(typed.file, typed.path, typed.json, streams); }));
  withPath(why, "The node; without it all that is missing, and what would bring it");
  why->add_flag("--json", typed.json, "As JSON");

  withPath(withFile(command("page", "Show the page of a node as text, control by control",
                            [&] { return PageCommand(typed.file, typed.path, streams); })),
           "The node")
      ->required();

  withPath(withFile(command("get", "Print the value of a key, as it would be saved",
                            [&] { return GetCommand(typed.file, typed.path, streams); })),
           "The key, as SECTION/SECTION:KEY")
      ->required();

  CLI::App* set = withFile(command("set", "Change the value of a key and save the setup", [&] {
    return SetCommand(typed.file, typed.path, typed.value, typed.force, streams);
  }));
  withPath(set, "The key, as SECTION/SECTION:KEY")->required();
  set->add_option("VALUE", typed.value, "The value; several separated by commas; dates also as 2000-01-31 12:00")
      ->required();
  set->add_flag("--force", typed.force, "Also where an editor has the setup open");

  CLI::App* convert = command("convert", "Write a setup of any version as one of the present version",
                              [&] { return ConvertCommand(typed.file, typed.secondFile, typed.force, streams); });
  convert->add_option("IN", typed.file, "The setup to read")->required();
  convert->add_option("OUT", typed.secondFile, "The setup to write; when it is IN, the original is kept beside it")
      ->required();
  convert->add_flag("--force", typed.force, "Replace another file that exists, also where an editor has it open");

  CLI::App* diff = command("diff", "Compare two setups by section and key",
                           [&] { return DiffCommand(typed.file, typed.secondFile, typed.json, streams); });
  diff->add_option("A", typed.file, "The old setup")->required();
  diff->add_option("B", typed.secondFile, "The new setup")->required();
  diff->add_flag("--json", typed.json, "As JSON");

  command("keys", "List all keys with place, type and default", [&] {
    return KeysCommand(typed.markdown, streams);
  })->add_flag("--markdown", typed.markdown, "As a page of the manual");

  RunOptions runOptions;
  CLI::App* runs = withFile(command("run", "Run a setup with its engine and wait for the end", [&] {
    runOptions.file = typed.file;
    runOptions.json = typed.json;
    return RunCommand(runOptions, streams);
  }));
  runs->footer(
      "What the engine says goes to the output, how it ended to the error stream. Ctrl-C stops the engine. Exit "
      "status:\n"
      "0 done, 1 the engine failed or was stopped, 2 not started.");
  const auto part = [&](const char* name, const char* argument, const char* description) {
    return runs->add_flag_callback(
        name, [&runOptions, argument] { runOptions.argument = argument; }, description);
  };
  CLI::Option* preprocessor = part("--pp", "/PP", "The preprocessor alone, whatever the setup says");
  CLI::Option* waterMovement = part("--wm", "/WM", "Water movement alone")->excludes(preprocessor);
  part("--wq", "/WQ", "Water quality alone")->excludes(preprocessor)->excludes(waterMovement);
  runs->add_option("--engines", runOptions.engines,
                   "The folder of the engines; without it TERVANE_ENGINES, or engines/ beside the program");
  runs->add_flag("--json", typed.json, "How it ended as JSON; what the engine says goes to the error stream");

  CLI::App* data =
      app.add_subcommand("data", "Look into data files (.nds0 to .nds3, netCDF) and rasters (GeoTIFF, ...)");
  data->require_subcommand(1);
  const auto dataCommand = [&](const char* name, const char* description, auto run) {
    CLI::App* subcommand = data->add_subcommand(name, description);
    subcommand->callback([&status, run] { status = run(); });
    subcommand->add_option("FILE", typed.file, "The data file")->required();
    return subcommand;
  };
  dataCommand("info", "Tell items, times and place", [&] {
    return DataInfoCommand(typed.file, typed.json, streams);
  })->add_flag("--json", typed.json, "As JSON");
  dataCommand("stats", "Tell range, mean and missing values of each item",
              [&] { return DataStatsCommand(typed.file, streams); });

  CLI::App* import = app.add_subcommand("import", "Make data files of other files");
  import->require_subcommand(1);
  CLI::App* series = import->add_subcommand("series", "Make time series (.nds0) of columns of a table (CSV)");
  SeriesImport seriesImport;
  series->callback([&] { status = ImportSeriesCommand(seriesImport, streams); });
  series->add_option("CSV", seriesImport.in, "The table: names in its first line, ISO dates in its first column")
      ->required();
  series->add_option("OUT", seriesImport.out, "The data file to write")->required();
  series->add_option("--item", seriesImport.itemType, "The code of the item type")->required();
  CLI::Option* column = series->add_option("--column", seriesImport.columns,
                                           "The name of the column; not needed where there is only one. Given several "
                                           "times, each makes an item");
  column->allow_extra_args(false);
  series->add_flag("--all-columns", seriesImport.isEveryColumn, "An item of each column")->excludes(column);
  series->add_option("--unit", seriesImport.unit, "The unit of the values; the item type's base unit without it");
  const std::map<std::string, int> valueTypes{
      {"instantaneous", 0}, {"accumulated", 1}, {"step-accumulated", 2}, {"mean-step", 3}};
  series->add_option("--value-type", seriesImport.valueType, "How a value belongs to its stamp")
      ->transform(CLI::CheckedTransformer(valueTypes));
  const std::map<std::string, bool> stampPlaces{{"begin", true}, {"end", false}};
  series->add_option("--stamps", seriesImport.stampsAreBegins, "Which end of its interval a stamp is; end without it")
      ->transform(CLI::CheckedTransformer(stampPlaces));
  series->add_flag("--force", seriesImport.force, "Replace a file that exists");

  CLI::App* gridding =
      import->add_subcommand("grid", "Make a grid (.nds2) of a band of a raster (GeoTIFF, ASCII grid, ...)");
  gridding->footer(
      "UNITS. The values are in the unit of --unit, without it in the one that the raster names, without that in the\n"
      "item type's base unit. A unit that the item type has is kept with the values as they are; values in any other\n"
      "unit (feet for an elevation, say) are converted to the base unit.\n"
      "PLACE. Without --like the grid has the raster's own cells. With it a cell takes: the raster's value, where the\n"
      "cells agree; codes (item type 100370, or 999 with whole numbers of at most 100 values) from the nearest cell;\n"
      "else the average of the raster's cells in it, where two or more go across, or the bilinear value between them.\n"
      "Where both projections are known and differ, places are converted.");
  GridImport gridImport;
  gridding->callback([&] { status = ImportGridCommand(gridImport, streams); });
  gridding->add_option("RASTER", gridImport.in, "The raster, of any kind that GDAL reads")->required();
  gridding->add_option("OUT", gridImport.out, "The data file to write")->required();
  gridding->add_option("--item", gridImport.itemType, "The code of the item type")->required();
  gridding->add_option("--unit", gridImport.unit, "The unit of the raster's values; see UNITS");
  gridding->add_option("--band", gridImport.band, "The number of the band, from 1; not needed where there is only one")
      ->check(CLI::PositiveNumber);
  gridding->add_option("--like", gridImport.like, "A setup (.tvd), on whose model grid the values are put; see PLACE");
  const std::map<std::string, Resampling> methods{
      {"nearest", Resampling::Nearest}, {"bilinear", Resampling::Bilinear}, {"average", Resampling::Average}};
  gridding->add_option("--resample", gridImport.resampling, "How, with --like, instead of what PLACE tells")
      ->transform(CLI::CheckedTransformer(methods))
      ->needs("--like");
  gridding->add_flag("--force", gridImport.force, "Replace a file that exists");

  Export exported;
  CLI::App* exporting = command("export", "Write time series (.nds0) as a table (CSV), or a grid as GeoTIFF",
                                [&] { return ExportCommand(exported, streams); });
  exporting->add_option("FILE", exported.in, "The data file")->required();
  exporting->add_option("OUT", exported.out, "The file to write: a GeoTIFF when it ends in .tif, else a table")
      ->required();
  for (const auto& [name, number, description] :
       {std::tuple{"--item", &exported.item, "The item of a grid, from 1; the first without it"},
        std::tuple{"--step", &exported.step, "Its time step, from 1; the first without it"},
        std::tuple{"--layer", &exported.layer, "Its layer, from 1 at the bottom; the lowest without it"}}) {
    exporting->add_option(name, *number, description)->check(CLI::PositiveNumber)->each([&](const std::string&) {
      exported.isPartNamed = true;
    });
  }
  exporting->add_flag("--force", exported.force, "Replace a file that exists");

  command("completion", "Print the completion script for bash; use: source <(tervane completion)", [&] {
    out << BashCompletion(app);
    return kDone;
  });

  try {
    // CLI11 takes the arguments from the back.
    std::vector<std::string> reversed(arguments.rbegin(), arguments.rend());
    app.parse(reversed);
  } catch (const CLI::ParseError& error) {
    return app.exit(error, out, err) == 0 ? kDone : kCouldNot;
  }
  out.flush();
  if (!out) {
    err << "the results could not be written\n";
    return kCouldNot;
  }
  return status;
}

}  // namespace tervane
