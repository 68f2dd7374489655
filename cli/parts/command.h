// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// A command and its options, without the parser's header, which costs each file that includes it seconds to compile.
#pragma once

#include <cstddef>
#include <functional>
#include <initializer_list>
#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace CLI {
class App;
class Option;
}  // namespace CLI

namespace tervane {

/// An option of a command, to say more of it. A name that begins with "-" makes an option, any other an argument.
class CommandOption {
 public:
  explicit CommandOption(CLI::Option* option) : option_(option) {}

  CommandOption& Required();
  /// The option of this name must be given, too.
  CommandOption& Needs(const char* name);
  /// The other must not be given, too.
  CommandOption& Excludes(const CommandOption& other);
  CommandOption& Positive();
  CommandOption& NotNegative();
  /// One value for each time the option is given.
  CommandOption& OneAtATime();

 private:
  CLI::Option* option_;
};

/// A command of the program. What its options are written into must live as long as the command.
class Command {
 public:
  explicit Command(CLI::App* app) : app_(app) {}

  CommandOption Add(const char* name, std::string& value, const char* description);
  CommandOption Add(const char* name, int& value, const char* description);
  CommandOption Add(const char* name, std::optional<int>& value, const char* description);
  CommandOption Add(const char* name, double& value, const char* description);
  CommandOption Add(const char* name, std::vector<std::string>& values, const char* description);
  /// `take` gets the typed text and tells why it is refused; empty when it is not.
  CommandOption AddTaken(const char* name, std::function<std::string(const std::string&)> take,
                         const char* description);
  /// True when it is given.
  CommandOption AddFlag(const char* name, bool& value, const char* description);
  CommandOption AddFlag(const char* name, std::function<void()> given, const char* description);
  /// One of these words, each with its value.
  template <class Choice, class Value>
  CommandOption AddChoice(const char* name, Value& value, std::initializer_list<std::pair<const char*, Choice>> choices,
                          const char* description) {
    std::vector<std::string> words;
    std::vector<Choice> values;
    for (const auto& [word, choice] : choices) {
      words.emplace_back(word);
      values.push_back(choice);
    }
    return AddWords(
        name, words, [&value, values](std::size_t chosen) { value = values[chosen]; }, description);
  }
  /// Text below the options in the command's help.
  void Footer(const char* text);

 private:
  friend class CommandOffers;

  CommandOption AddWords(const char* name, const std::vector<std::string>& words,
                         const std::function<void(std::size_t)>& choose, const char* description);

  CLI::App* app_;
};

}  // namespace tervane
