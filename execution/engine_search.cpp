// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "execution/engine_search.h"

#include <cstdlib>
#include <filesystem>
#include <vector>

#include <fmt/format.h>

#include "platform/beside_program.h"
#include "platform/files.h"
#include "platform/os.h"
#include "platform/os_process.h"
#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

namespace {

constexpr std::string_view kExtension = ".exe";
// As in PATH: a colon stands in names with a drive.
constexpr char kSeparator = std::filesystem::path::preferred_separator == '/' ? ':' : ';';

std::vector<std::string> FoldersOf(std::string_view list) {
  std::vector<std::string> folders;
  while (!list.empty()) {
    const std::string_view folder = Trimmed(list.substr(0, list.find(kSeparator)));
    if (!folder.empty()) folders.emplace_back(folder);
    list.remove_prefix(std::min(list.find(kSeparator), list.size() - 1) + 1);
  }
  return folders;
}

/// The bytes in front of a program, which tell for what system and processor it was built.
std::string HeaderOf(const std::string& path) {
  std::string header(20, '\0');
  std::error_code error;
  os::File file = os::File::OpenForReading(path, error);
  if (!error) header.resize(file.Read(header.data(), header.size(), error));
  return error ? std::string() : header;
}

constexpr std::string_view kElf =
    "\x7F"
    "ELF";

/// "x86-64"
std::string ProcessorOf(std::string_view elfHeader) {
  if (elfHeader.size() < 20) return "unknown";
  const bool isBigEndian = elfHeader[5] == 2;
  const auto byte = [&](std::size_t i) { return static_cast<unsigned char>(elfHeader[i]); };
  const int machine = isBigEndian ? byte(18) * 256 + byte(19) : byte(19) * 256 + byte(18);
  switch (machine) {
    case 3:
      return "x86";
    case 40:
      return "ARM";
    case 62:
      return "x86-64";
    case 183:
      return "AArch64";
    case 243:
      return "RISC-V";
    default:
      return fmt::format("number {}", machine);
  }
}

/// Why the system does not know a file as a program.
std::string WhyNoProgram(const std::string& path) {
  const std::string header = HeaderOf(path), own = HeaderOf(os::ProgramPath());
  if (header.empty()) return "the file is empty";
  if (header.starts_with(kElf) && own.starts_with(kElf) && ProcessorOf(header) != ProcessorOf(own))
    return fmt::format("it is built for another processor ({}; this computer has {}); install the engine for this one",
                       ProcessorOf(header), ProcessorOf(own));
  if (header.starts_with("MZ")) return "it is a program for Windows; install the engine for this system";
  if (header.starts_with(kElf)) return "the file is damaged or built for another system; install the engine anew";
  return "it is no program for this system; if it is a script, its first line must name what runs it, as #!/bin/sh";
}

}  // namespace

EnginePlaces EnginePlaces::Here(const std::string& setting) {
  const char* environment = std::getenv(kEnginesVariable);
  const std::string code = os::CodePath();
  // A library that other programs load may stand in a folder of its own.
  const std::string found = code == os::ProgramPath() ? std::string() : FindBesideProgram("engines");
  const std::string expected = code.empty() ? "" : fmt::format("{}/engines", FolderOf(code));
  return {setting, environment ? environment : "", found.empty() ? expected : found};
}

std::string FindEngine(std::string_view name, const EnginePlaces& places, std::string& problem) {
  problem.clear();
  std::string stem(name);
  if (EqualIgnoringCase(ExtensionOf(name), kExtension)) stem.resize(stem.size() - kExtension.size());
  std::string notStartable;
  for (const std::string* list : {&places.setting, &places.environment, &places.beside})
    for (const std::string& folder : list == &places.beside ? std::vector{*list} : FoldersOf(*list)) {
      if (folder.empty()) continue;
      for (const std::string& file : {stem, stem + std::string(kExtension)}) {
        const std::string path = AbsoluteFromHere(fmt::format("{}/{}", folder, file));
        if (os::MayStart(path)) return path;
        std::error_code ignored;
        if (notStartable.empty() && std::filesystem::is_regular_file(NativePath(path), ignored)) notStartable = path;
      }
    }
  if (!notStartable.empty()) {
    problem = fmt::format("{} may not be started: make it executable (chmod +x)", notStartable);
    return {};
  }
  if (places.IsOnly()) {
    problem = fmt::format("the engine {} was not found in {}: name the folder that has it", stem, places.setting);
    return {};
  }
  const auto told = [](const std::string& value) { return value.empty() ? "not set" : value; };
  problem = fmt::format(
      "the engine {} was not found. Looked for in the setting {} ({}), in {} of the environment ({}), and in {}. Put "
      "the folder of the engines into one of the first two, or the engine into the last.",
      stem, kEnginePathSetting, told(places.setting), kEnginesVariable, told(places.environment), places.beside);
  return {};
}

std::string WhyNotStarted(const std::string& program, const std::error_code& error) {
  std::string why = error.message();
  if (error == std::errc::executable_format_error)
    why = WhyNoProgram(program);
  else if (error == std::errc::permission_denied)
    why = "it may not be executed: make it executable (chmod +x), and see that its disk allows programs";
  else if (error == std::errc::no_such_file_or_directory && FileExists(program))
    why = "what starts it is missing: the program in its first line, or the loader that it was built for";
  return fmt::format("{} cannot be started: {}", program, why);
}

}  // namespace tervane
