// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// How a file of commands offers them: a function over the command line, and a row in `kFiles` of command_line.cpp.
#pragma once

#include <functional>
#include <memory>
#include <string>

#include "cli/command_line.h"
#include "cli/commands.h"
#include "cli/parts/command.h"

namespace tervane {

/// The command line while its commands are being offered. What a command writes its options into is shared by the
/// functions that are handed over, and lives as long as they do.
class CommandOffers {
 public:
  CommandOffers(CLI::App& app, Streams streams, int& status) : app_(app), streams_(streams), status_(status) {}

  Streams Output() const { return streams_; }
  /// The whole, for the completion.
  const CLI::App& Whole() const { return app_; }

  /// A command, or with `family` one of several under its name; `run` gives an `ExitStatus`.
  Command Offer(const char* name, const char* description, std::function<int()> run, const Command* family = nullptr);
  /// A name under which several commands stand.
  Command Family(const char* name, const char* description);

 private:
  CLI::App& app_;
  Streams streams_;
  int& status_;
};

// Options that several commands have, told once.

inline void AddSetup(Command& command, std::string& file) { command.Add("FILE", file, "The setup (.tvd)").Required(); }
/// A quantity by its code or its name, in any case; an unknown one is refused with those that come near.
CommandOption AddQuantity(Command& command, int& itemType);

// The files of commands, in the order of the help.

void OfferFileCommands(CommandOffers& offers);
void OfferConvertCommand(CommandOffers& offers);
void OfferCheckCommand(CommandOffers& offers);
void OfferTreeCommands(CommandOffers& offers);
void OfferWhyCommand(CommandOffers& offers);
void OfferPageCommand(CommandOffers& offers);
void OfferGroundCommands(CommandOffers& offers);
void OfferValueCommands(CommandOffers& offers);
void OfferNotesCommands(CommandOffers& offers);
void OfferJournalCommand(CommandOffers& offers);
void OfferDiffCommand(CommandOffers& offers);
void OfferClimateCommand(CommandOffers& offers);
void OfferKeysCommand(CommandOffers& offers);
void OfferReportCommand(CommandOffers& offers);
void OfferRunCommand(CommandOffers& offers);
void OfferDataCommands(CommandOffers& offers);
/// Below the family `import`.
void OfferSeriesImport(CommandOffers& offers, const Command& family);
void OfferGridImport(CommandOffers& offers, const Command& family);
void OfferRiverImport(CommandOffers& offers, const Command& family);
void OfferWellImport(CommandOffers& offers, const Command& family);
void OfferExportCommands(CommandOffers& offers);
void OfferModflow6Export(CommandOffers& offers, const Command& family);
void OfferResultsCommands(CommandOffers& offers);
void OfferCompletion(CommandOffers& offers);

}  // namespace tervane
