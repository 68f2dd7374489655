// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <fmt/format.h>

#include "cli/offers.h"

namespace tervane {

namespace {

std::string OptionNames(const CLI::App& app) {
  std::string names;
  for (const CLI::Option* option : app.get_options())
    for (const std::string& name : option->get_lnames()) names += fmt::format(" --{}", name);
  return names;
}

/// A script that completes the commands and options of the program, file names, and places of a setup.
std::string BashCompletion(const CLI::App& app) {
  std::string commands, cases;
  for (const CLI::App* command : app.get_subcommands({})) {
    commands += " " + command->get_name();
    std::string words, options = OptionNames(*command);
    for (const CLI::App* subcommand : command->get_subcommands({})) {
      words += " " + subcommand->get_name();
      options += OptionNames(*subcommand);
    }
    cases += fmt::format("    {}) options=\"{}\" words=\"{}\" ;;\n", command->get_name(), options.substr(1), words);
  }
  return fmt::format(R"bash(# bash completion of tervane: source <(tervane completion)
_tervane() {{
  local current="${{COMP_WORDS[COMP_CWORD]}}" command="${{COMP_WORDS[1]}}" options="" words=""
  COMPREPLY=()
  if ((COMP_CWORD == 1)); then
    mapfile -t COMPREPLY < <(compgen -W "{}{}" -- "$current")
    return
  fi
  case "$command" in
{}  esac
  if [[ "$current" == -* ]]; then
    mapfile -t COMPREPLY < <(compgen -W "$options" -- "$current")
  elif ((COMP_CWORD == 2)) && [ -n "$words" ]; then
    mapfile -t COMPREPLY < <(compgen -W "$words" -- "$current")
  elif ((COMP_CWORD == 3)) && [[ "$command" =~ ^(show|page|get|set)$ ]]; then
    local IFS=$'\n'
    mapfile -t COMPREPLY < <(compgen -W "$(tervane tree "${{COMP_WORDS[2]}}" --all --paths 2>/dev/null)" -- "$current")
  else
    mapfile -t COMPREPLY < <(compgen -f -- "$current")
  fi
}}
complete -o filenames -F _tervane tervane
)bash",
                     commands.substr(1), OptionNames(app), cases);
}

}  // namespace

void OfferCompletion(CommandOffers& offers) {
  offers.Command("completion", "Print the completion script for bash; use: source <(tervane completion)", [offers] {
    offers.Output().out << BashCompletion(offers.Whole());
    return kDone;
  });
}

}  // namespace tervane
