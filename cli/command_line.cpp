// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "cli/command_line.h"

#include <algorithm>
#include <array>
#include <new>
#include <span>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include <CLI/CLI.hpp>
#include <fmt/format.h>

#include "cli/offers.h"
#include "cli/parts/printable_stream.h"
#include "platform/os.h"
#include "platform/suggestion.h"
#include "platform/text.h"
#include "platform/units.h"
#include "platform/version.h"

namespace tervane {

namespace {

void OfferImports(CommandOffers& offers) {
  const Command family = offers.Family("import", "Make data files of other files");
  OfferSeriesImport(offers, family);
  OfferGridImport(offers, family);
  OfferRiverImport(offers, family);
  OfferWellImport(offers, family);
}

/// A file of commands is one row here, in the order of the help.
struct CommandFile {
  void (*offer)(CommandOffers&);
  /// Its commands, where they are used often and in numbers: a line that begins with one of them is understood without
  /// the others being offered, which takes as long as to check a small setup.
  std::array<std::string_view, 2> commands = {};
};
constexpr CommandFile kFiles[] = {
    {OfferFileCommands, {"new"}},
    {OfferCheckCommand, {"check"}},
    {OfferTreeCommands, {"tree", "show"}},
    {OfferWhyCommand, {"why"}},
    {OfferPageCommand, {"page"}},
    {OfferGroundCommands},
    {OfferValueCommands, {"get", "set"}},
    {OfferNotesCommands},
    {OfferJournalCommand},
    {OfferConvertCommand, {"convert"}},
    {OfferDiffCommand, {"diff"}},
    {OfferClimateCommand},
    {OfferKeysCommand},
    {OfferReportCommand, {"report"}},
    {OfferRunCommand, {"run"}},
    {OfferDataCommands},
    {OfferImports},
    {OfferExportCommands},
    {OfferResultsCommands},
    {OfferCompletion},
};

/// Offers the commands that the words may mean.
void OfferCommands(CommandOffers& offers, std::span<const std::string> words) {
  for (const CommandFile& file : kFiles)
    if (!words.empty() && !words.front().empty() &&
        std::ranges::find(file.commands, words.front()) != file.commands.end())
      return file.offer(offers);
  for (const CommandFile& file : kFiles) file.offer(offers);
}

/// Quantities whose names contain the typed word, for users who do not know the codes.
std::string NearQuantities(const std::string& typed) {
  std::string near;
  const std::string lower = LowerCase(Trimmed(typed));
  if (lower.empty()) return "such as Elevation (100180)";
  for (const ItemType& type : AllItemTypes()) {
    const std::string name = LowerCase(type.name);
    if (name.find(lower) != std::string::npos || lower.find(name) != std::string::npos)
      near += fmt::format("{}{} ({})", near.empty() ? "" : ", ", type.name, type.code);
  }
  return near.empty() ? "such as Elevation (100180)" : near;
}

}  // namespace

namespace {

/// Why the words do not begin with a command, or with one of a family; empty where they do.
std::string WhyNoCommand(const CLI::App& app, std::span<const std::string> words) {
  const std::vector<const CLI::App*> commands = app.get_subcommands([](const CLI::App*) { return true; });
  if (commands.empty() || words.empty() || words.front().starts_with('-')) return {};
  // One that has commands below it and takes words itself cannot tell a name that is meant as a command.
  const bool takesWords = !app.get_options([](const CLI::Option* option) { return option->get_positional(); }).empty();
  if (takesWords &&
      std::ranges::none_of(commands, [&](const CLI::App* command) { return command->get_name() == words.front(); }))
    return {};
  std::vector<std::string> names;
  for (const CLI::App* command : commands) {
    if (command->get_name() == words.front()) return WhyNoCommand(*command, words.subspan(1));
    names.push_back(command->get_name());
  }
  const std::string family = app.get_parent() ? app.get_name() + " " : std::string();
  return fmt::format("there is no command {}{}{} (tervane {}--help lists all)", family, words.front(),
                     Suggestion(words.front(), names), family);
}

}  // namespace

Command CommandOffers::Offer(const char* name, const char* description, std::function<int()> run,
                             const Command* family) {
  CLI::App* command = (family ? family->app_ : &app_)->add_subcommand(name, description);
  // CLI11 calls the commands above the one that is meant, too.
  command->callback([&status = status_, run = std::move(run), command] {
    if (command->get_subcommands().empty()) status = run();
  });
  return Command(command);
}

Command CommandOffers::Family(const char* name, const char* description) {
  CLI::App* family = app_.add_subcommand(name, description);
  family->require_subcommand(1);
  return Command(family);
}

CommandOption AddQuantity(Command& command, int& itemType) {
  const auto take = [&itemType](const std::string& typed) {
    const ItemType* type = FindItemType(typed);
    if (!type)
      return fmt::format("there is no item type {}: a code or a name was expected, {}", typed, NearQuantities(typed));
    itemType = type->code;
    return std::string();
  };
  return command.AddTaken("--item", take, "The quantity, by its code or name: 100431, \"Precipitation Rate\"");
}

int RunCommandLine(const std::vector<std::string>& arguments, std::ostream& plainOut, std::ostream& plainErr) {
  PrintableStream out(plainOut), err(plainErr);
  CLI::App app{"Checks, shows and changes setups of the integrated catchment model Tervane.", "tervane"};
  app.footer(
      "A PATH is section names joined by /, with #n behind a name for the n-th of equal names and :KEY for a key:\n"
      "SimSpec/SimTitle:Title. Exit status: 0 done, 1 findings or differences, 2 could not.");
  app.require_subcommand(1);
  app.set_version_flag("--version", "tervane " + ProgramBuild());

  int status = kDone;
  CommandOffers offers(app, {out, err}, status);
  OfferCommands(offers, arguments);

  if (const std::string why = WhyNoCommand(app, arguments); !why.empty()) return Refuse({out, err}, why);
  try {
    // CLI11 takes the arguments from the back.
    std::vector<std::string> reversed(arguments.rbegin(), arguments.rend());
    app.parse(reversed);
  } catch (const CLI::ParseError& error) {
    return app.exit(error, out, err) == 0 ? kDone : kCouldNot;
  } catch (const std::bad_alloc&) {
    err << "there is not enough memory for this: close other programs, or use a smaller file\n";
    return kCouldNot;
  }
  out.flush();
  if (!out) {
    // Who reads has what it wants.
    if (os::IsOutputClosed()) return status;
    err << "the results could not be written\n";
    return kCouldNot;
  }
  return status;
}

}  // namespace tervane
