// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "execution/engine_line.h"

#include <fmt/format.h>
#include <gtest/gtest.h>

#include "tests/support/split_at_arrow.h"

namespace tervane::engine_line_test {
namespace {

std::string Understood(const std::string& line) {
  if (const auto progress = EngineProgressOf(line)) return fmt::format("{} [{}]", progress->percent, progress->text);
  const auto message = EngineMessageOf(line);
  if (!message) return "text";
  return fmt::format("{} [{}] [{}]", message->isError ? "error" : "warning", message->place, message->text);
}

TEST(EngineLine, IsUnderstoodByItsForm) {
  for (const char* row : {
           "progress 42 time step 17 => 42 [time step 17]",
           "progress 42.5% of the period => 42.5 [of the period]",
           "progress 0 => 0 []",
           "progress 100 => 100 []",
           "progress 101 => text",
           "progress -1 => text",
           "progress nan => text",
           "progress 1e400 => text",
           "progress 12x => text",
           "progress  => text",
           " progress 42 => text",
           "progressing 42 => text",
           "error: SimSpec/SimTitle:Title: is empty => error [SimSpec/SimTitle:Title] [is empty]",
           "warning: Climate: rain: none => warning [Climate] [rain: none]",
           R"(error: "Zone: north"/Well#2:Name: bad => error ["Zone: north"/Well#2:Name] [bad])",
           "error: out of memory => error [] [out of memory]",
           "error:  => error [] []",
           "error:no blank => text",
           "an error: none => text",
           " => text",
       }) {
    const auto [line, expected] = test::SplitAtArrow(row);
    EXPECT_EQ(Understood(line), expected) << row;
  }
}

}  // namespace
}  // namespace tervane::engine_line_test
