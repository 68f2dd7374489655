// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// How the time of each command grows with a setup in which much is wrong: stations whose files are missing, and extra
// parameters with numbers that are none.
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <ostream>
#include <string>
#include <vector>

#include <fmt/format.h>
#include <unistd.h>

#include "bench/median_table.h"
#include "cli/command_line.h"
#include "document/edit_session.h"
#include "pages/findings.h"
#include "pages/tree_entries.h"

namespace tervane::bench {

namespace {

constexpr int kFew = 1'000;
constexpr int kMany = 10'000;

/// A setup with so many stations, each with a file that does not exist, and as many extra parameters.
std::string FaultySetup(int count) {
  std::string text = fmt::format(
      "target TERVANE_FLOWMODEL {{\n  section FlowModelDocVersion {{\n    Version = 14\n  }}\n"
      "  section ExtraParams {{\n    NoOfParams = {}\n",
      count);
  for (int number = 1; number <= count; ++number)
    text += fmt::format("    section ExtraParam_{} {{\n      Name = \"parameter {}\"\n      Value = nan\n    }}\n",
                        number, number);
  text += fmt::format(
      "  }}\n  section Climate {{\n    section PrecipitationRate {{\n      DistributionType = 2\n"
      "      section STATION_BASED {{\n        NO_TIMESERIES = {}\n      }}\n",
      count);
  for (int number = 1; number <= count; ++number)
    text += fmt::format(
        "      section TIME_SERIES_{} {{\n        NAME = \"Gauge {}\"\n        GRIDCODEID = \"{}\"\n"
        "        TYPE = 2\n        section TIME_SERIES_FILE {{\n          FILE_NAME = file "
        "\"gauge_{}.nds0\"\n        }}\n      }}\n",
        number, number, number, number);
  return text + "    }\n  }\n}\n";
}

/// Takes what is written and keeps nothing.
class NowhereBuffer : public std::streambuf {
 protected:
  std::streamsize xsputn(const char*, std::streamsize size) override { return size; }
  int_type overflow(int_type character) override { return traits_type::not_eof(character); }
};

int RunQuietly(const std::vector<std::string>& arguments) {
  NowhereBuffer nowhere;
  std::ostream out(&nowhere), err(&nowhere);
  return RunCommandLine(arguments, out, err);
}

std::size_t OpenAsTheDesktop(const std::string& file) {
  std::string error;
  const auto session = EditSession::Open(file, {}, error);
  if (!session) fmt::print("not opened: {}\n", error);
  return session
             ? FindingsOf(session->Document()).size() + TreeEntries(session->Document().Root(), kSetupDataTree).size()
             : 0;
}

}  // namespace

}  // namespace tervane::bench

int main(int argc, char** argv) {
  using namespace tervane::bench;
  const std::string folder =
      (std::filesystem::temp_directory_path() / fmt::format("tervane_commands_{}", getpid())).string();
  std::filesystem::create_directory(folder);
  MedianTable table(7);
  for (const int count : {kFew, kMany}) {
    const std::string file = fmt::format("{}/{}.tvd", folder, count), size = fmt::format(", {} stations", count);
    std::ofstream(file) << FaultySetup(count);
    const std::string other = file + ".other.tvd", station = "Climate/PrecipitationRate/TIME_SERIES_7";
    std::filesystem::copy_file(file, other);
    const std::vector<std::vector<std::string>> commands{{"check", file},
                                                         {"check", file, "--each"},
                                                         {"check", file, "--json"},
                                                         {"check", file, "--coverage"},
                                                         {"tree", file, "--all"},
                                                         {"tree", file, "--json"},
                                                         {"show", file},
                                                         {"show", file, "--json"},
                                                         {"get", file, station + ":NAME"},
                                                         {"set", file, station + ":NAME", "a name"},
                                                         {"page", file, station},
                                                         {"page", file, "ExtraParams"},
                                                         {"why", file},
                                                         {"why", file, station},
                                                         {"diff", file, other},
                                                         {"convert", file, other, "--force"}};
    for (const auto& command : commands) {
      std::string name;
      for (const std::string& word : command)
        if (word != file && word != other) name += (name.empty() ? "" : " ") + word;
      table.Add(name + size, [command] { return tervane::bench::RunQuietly(command); });
      if (count == kMany) table.Limit(name + size, name + fmt::format(", {} stations", kFew), 11);
    }
    table.Add("open in the desktop" + size, [file] { return tervane::bench::OpenAsTheDesktop(file); });
    if (count == kMany) {
      table.Limit("open in the desktop" + size, fmt::format("open in the desktop, {} stations", kFew), 11);
      table.LimitTime("check" + size, 300);
      table.LimitTime("open in the desktop" + size, 1000);
    }
  }
  table.Run(argc, argv);
  std::filesystem::remove_all(folder);
  return 0;
}
