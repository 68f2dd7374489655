// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <CLI/CLI.hpp>
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

/// The words behind a command, and the options of each.
std::string Cases(const CLI::App& command) {
  const auto subcommands = command.get_subcommands([](const CLI::App*) { return true; });
  if (subcommands.empty()) return fmt::format("options=\"{}\"", OptionNames(command).substr(1));
  std::string words, cases;
  for (const CLI::App* each : subcommands) {
    words += " " + each->get_name();
    cases += fmt::format("{}) {} ;; ", each->get_name(), Cases(*each));
  }
  return fmt::format("words=\"{}\" ; case \"${{words_[2]}}\" in {}esac", words, cases);
}

/// A script that completes the commands and options of the program, file names, places of a setup and their keys.
std::string BashCompletion(const CLI::App& app) {
  std::string commands, cases;
  for (const CLI::App* command : app.get_subcommands([](const CLI::App*) { return true; })) {
    commands += " " + command->get_name();
    cases += fmt::format("    {}) {} ;;\n", command->get_name(), Cases(*command));
  }
  return fmt::format(R"bash(# bash completion of tervane: source <(tervane completion)
_tervane() {{
  local current options="" words="" prefix="" words_=("${{COMP_WORDS[@]:0:COMP_CWORD+1}}")
  # The shell takes a colon for a word of its own: a key goes with its place.
  local last=$COMP_CWORD
  if [[ "${{words_[last]}}" == ":" ]]; then
    prefix="${{words_[last - 1]}}:" words_[last - 1]="${{words_[last - 1]}}:"
    last=$((last - 1))
  elif ((last > 1)) && [[ "${{words_[last - 1]}}" == ":" ]]; then
    prefix="${{words_[last - 2]}}:" words_[last - 2]="${{words_[last - 2]}}:${{words_[last]}}"
    last=$((last - 2))
  fi
  current="${{words_[last]}}"
  COMPREPLY=()
  if ((last == 1)); then
    mapfile -t COMPREPLY < <(compgen -W "{}{}" -- "$current")
    return
  fi
  case "${{words_[1]}}" in
{}  esac
  if [[ "$current" == -* ]]; then
    mapfile -t COMPREPLY < <(compgen -W "$options" -- "$current")
  elif ((last == 2)) && [ -n "$words" ]; then
    mapfile -t COMPREPLY < <(compgen -W "$words" -- "$current")
  elif [[ "${{words_[1]}}" =~ ^(show|page|why|get|set)$ ]] && ((last == 3)); then
    local IFS=$'\n' place="${{current%:*}}" offered
    if [[ "$current" == *:* ]]; then
      offered="$(tervane show "${{words_[2]}}" "$place" 2>/dev/null |
        awk -v place="$place:" 'NR > 1 && !/^  /{{exit}} / = /{{sub(/^ +/, ""); sub(/ = .*/, ""); print place $0}}')"
    else
      offered="$(tervane tree "${{words_[2]}}" --all --paths 2>/dev/null)"
    fi
    mapfile -t COMPREPLY < <(compgen -W "$offered" -- "$current")
    COMPREPLY=("${{COMPREPLY[@]#"$prefix"}}")
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
  offers.Offer("completion", "Print the completion script for bash; use: source <(tervane completion)", [offers] {
    offers.Output().out << BashCompletion(offers.Whole());
    return kDone;
  });
}

}  // namespace tervane
