// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "cli/parts/command.h"

#include <algorithm>

#include <CLI/CLI.hpp>
#include <fmt/format.h>
#include <fmt/ranges.h>

namespace tervane {

CommandOption& CommandOption::Required() {
  option_->required();
  return *this;
}

CommandOption& CommandOption::Needs(const char* name) {
  option_->needs(name);
  return *this;
}

CommandOption& CommandOption::Excludes(const CommandOption& other) {
  option_->excludes(other.option_);
  return *this;
}

CommandOption& CommandOption::Positive() {
  option_->check(CLI::PositiveNumber);
  return *this;
}

CommandOption& CommandOption::NotNegative() {
  option_->check(CLI::NonNegativeNumber);
  return *this;
}

CommandOption& CommandOption::OneAtATime() {
  option_->allow_extra_args(false);
  return *this;
}

CommandOption Command::Add(const char* name, std::string& value, const char* description) {
  return CommandOption(app_->add_option(name, value, description));
}

CommandOption Command::Add(const char* name, int& value, const char* description) {
  return CommandOption(app_->add_option(name, value, description));
}

CommandOption Command::Add(const char* name, std::optional<int>& value, const char* description) {
  return CommandOption(app_->add_option(name, value, description));
}

CommandOption Command::Add(const char* name, double& value, const char* description) {
  return CommandOption(app_->add_option(name, value, description));
}

CommandOption Command::Add(const char* name, std::vector<std::string>& values, const char* description) {
  return CommandOption(app_->add_option(name, values, description));
}

CommandOption Command::AddTaken(const char* name, std::function<std::string(const std::string&)> take,
                                const char* description) {
  const auto parse = [name = std::string(name), take = std::move(take)](const std::string& typed) {
    if (const std::string why = take(typed); !why.empty()) throw CLI::ValidationError(name, why);
  };
  return CommandOption(app_->add_option_function<std::string>(name, parse, description));
}

CommandOption Command::AddFlag(const char* name, bool& value, const char* description) {
  return CommandOption(app_->add_flag(name, value, description));
}

CommandOption Command::AddFlag(const char* name, std::function<void()> given, const char* description) {
  return CommandOption(app_->add_flag_callback(name, std::move(given), description));
}

CommandOption Command::AddWords(const char* name, const std::vector<std::string>& words,
                                const std::function<void(std::size_t)>& choose, const char* description) {
  const auto take = [words, choose](const std::string& typed) {
    const auto found = std::ranges::find(words, typed);
    if (found == words.end())
      return fmt::format("{} was typed, one of these was expected: {}", typed, fmt::join(words, ", "));
    choose(static_cast<std::size_t>(found - words.begin()));
    return std::string();
  };
  const CommandOption option = AddTaken(name, take, description);
  app_->get_option(name)->type_name(fmt::format("{}", fmt::join(words, "|")));
  return option;
}

void Command::Footer(const char* text) { app_->footer(text); }

}  // namespace tervane
