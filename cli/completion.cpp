// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <CLI/CLI.hpp>
#include <fmt/format.h>

#include "cli/offers.h"
#include "platform/text.h"

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

/// A text between single quotes of the shell, in which a colon parts a word from its description.
std::string Quoted(std::string_view text) { return "'" + Replaced(Replaced(text, ":", "\\:"), "'", "'\\''") + "'"; }

/// Words with what they are for, as `_describe` takes them.
std::string Described(const CLI::App& app) {
  std::string rows;
  for (const CLI::App* each : app.get_subcommands([](const CLI::App*) { return true; }))
    rows += fmt::format(" {}:{}", each->get_name(), Quoted(each->get_description()));
  return rows;
}

std::string DescribedOptions(const CLI::App& app) {
  std::string rows;
  for (const CLI::Option* option : app.get_options())
    for (const std::string& name : option->get_lnames())
      rows += fmt::format(" --{}:{}", name, Quoted(option->get_description()));
  return rows;
}

/// The same for zsh, which tells what commands and options are for.
std::string ZshCompletion(const CLI::App& app) {
  std::string cases;
  for (const CLI::App* command : app.get_subcommands([](const CLI::App*) { return true; })) {
    cases += fmt::format("    {})\n      options=({})\n", command->get_name(), DescribedOptions(*command));
    const auto family = command->get_subcommands([](const CLI::App*) { return true; });
    if (!family.empty()) cases += fmt::format("      words_=({})\n", Described(*command));
    for (const CLI::App* each : family)
      cases += fmt::format("      [[ $words[3] == {} ]] && options=({})\n", each->get_name(), DescribedOptions(*each));
    cases += "      ;;\n";
  }
  return fmt::format(R"zsh(#compdef tervane
# zsh completion of tervane
_tervane() {{
  local -a commands options words_ places
  commands=({})
  if ((CURRENT == 2)); then
    _describe command commands
    return
  fi
  case $words[2] in
{}  esac
  if [[ $PREFIX == -* ]]; then
    _describe -o option options
  elif ((CURRENT == 3 && $#words_)); then
    _describe command words_
  elif ((CURRENT == 4)) && [[ $words[2] == (show|page|why|get|set) ]]; then
    places=(${{(f)"$(tervane tree $words[3] --all --paths 2>/dev/null)"}})
    compadd -S '' -- $places
  else
    _files
  fi
}}
if [[ $funcstack[1] == _tervane ]]; then _tervane "$@"; else compdef _tervane tervane; fi
)zsh",
                     Described(app), cases);
}

}  // namespace

void OfferCompletion(CommandOffers& offers) {
  auto isZsh = std::make_shared<bool>(false);
  offers
      .Offer("completion", "Print the completion script for a shell; use: source <(tervane completion)",
             [offers, isZsh] {
               offers.Output().out << (*isZsh ? ZshCompletion(offers.Whole()) : BashCompletion(offers.Whole()));
               return kDone;
             })
      .AddChoice("SHELL", *isZsh, {std::pair("bash", false), std::pair("zsh", true)}, "The shell, bash unless told");
}

}  // namespace tervane
