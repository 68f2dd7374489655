// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// A command of `tervane` on any bytes as a setup and the files beside it; the first letter tells which command. It ends
// with one of its statuses, has a reason when it could not, and changes none of the files that it only reads.
#include <algorithm>
#include <cstdint>
#include <sstream>
#include <string>
#include <vector>

#include "cli/command_line.h"
#include "fuzz/asked_items.h"
#include "fuzz/input_folder.h"
#include "platform/text.h"

namespace tervane {
namespace {

using fuzz::InputFolder;
using fuzz::Require;

/// A command with its words; one that begins with @ stands for the file of that extension.
struct Row {
  char letter;
  bool changesSetup;
  std::vector<std::string> words;
};

const std::vector<Row>& Rows() {
  static const std::vector<Row> rows = {
      {'a', false, {"check", "@.tvd", "--each"}},
      {'b', false, {"check", "@.tvd", "--json"}},
      {'c', false, {"check", "@.tvd", "--coverage"}},
      {'d', false, {"check", "@.tvd", "--fix", "--dry-run"}},
      {'e', true, {"check", "@.tvd", "--fix"}},
      {'f', false, {"tree", "@.tvd"}},
      {'g', false, {"show", "@.tvd"}},
      {'h', false, {"why", "@.tvd"}},
      {'i', false, {"convert", "@.tvd", "@.out.tvd", "--force"}},
      {'j', false, {"diff", "@.tvd", "@.b", "--json"}},
      {'k', false, {"merge", "@.a", "@.tvd", "@.b", "-o", "@.out.tvd", "--force", "--json"}},
      {'l', false, {"climate-change", "@.tvd", "--json"}},
      {'m', false, {"report", "@.tvd", "-o", "@.html", "--force"}},
      {'n', false, {"results", "cost", "@.tvd"}},
      {'o', false, {"results", "stats", "@.tvd"}},
      {'p', false, {"notes", "list", "@.tvd"}},
      {'q', true, {"notes", "add", "@.tvd", "SimSpec/SimTitle:Title", "why?", "--author", "me"}},
      {'r', false, {"journal", "@.tvd", "--csv"}},
      {'s', true, {"set", "@.tvd", "SimSpec/SimTitle:Title", "title"}},
      {'t', false, {"section", "@.tvd", "--from", "0,0", "--to", "100,100"}},
      {'u', false, {"column", "@.tvd", "--at", "10,10"}},
      {'v', false, {"export", "modflow6", "@.tvd", "@.mf6", "--force", "--json"}},
      {'w', false, {"import", "series", "@.tvd", "@.nds0", "--item", "100431", "--all-columns", "--force"}},
      {'x', false, {"import", "wells", "@.tvd", "@.wel", "--force"}},
      {'y', false, {"import", "river", "@.shp", "@.fvnwk", "--force"}},
      {'z', false, {"page", "@.tvd", "SimSpec/SimTitle"}},
  };
  return rows;
}

void Check(std::string_view input) {
  // Larger files tell nothing new, and cost time.
  constexpr std::size_t kLargest = 60'000;
  if (input.empty() || input.size() > kLargest) return;
  const auto row = std::ranges::find(Rows(), input.front(), &Row::letter);
  if (row == Rows().end() || fuzz::AsksForTooMuch(input.substr(1, input.find("\n@@.", 1) - 1))) return;
  const InputFolder folder(input.substr(1), ".tvd");
  std::vector<std::string> words;
  for (const std::string& word : row->words) words.push_back(word[0] == '@' ? folder.Path(word.substr(1)) : word);
  std::ostringstream out, err;
  const int status = RunCommandLine(words, out, err);
  Require(status == kDone || status == kFindings || status == kCouldNot, "a command has one of its statuses");
  Require(status != kCouldNot || !err.str().empty(), "what could not be done has a reason", row->words.front());
  Require(!FirstInvalidUtf8(out.str()), "results are UTF-8 text", out.str());
  Require(!FirstInvalidUtf8(err.str()), "messages are UTF-8 text", err.str());
  if (!row->changesSetup) folder.RequireUnchanged();
}

}  // namespace
}  // namespace tervane

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  tervane::Check({reinterpret_cast<const char*>(data), size});
  return 0;
}
