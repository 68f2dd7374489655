// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Any bytes as a setup. What opens must be written as a text that opens again, of which nothing stays unread, and that
// is written again byte for byte.
#include <cstdint>
#include <string>

#include "document/flow_model_document.h"
#include "fuzz/asked_items.h"
#include "fuzz/require.h"

namespace tervane {
namespace {

using fuzz::Require;

constexpr const char* kPath = "/setups/fuzzed.tvd";
constexpr const char* kFolder = "/setups";

void Check(std::string_view input) {
  if (fuzz::AsksForTooMuch(input)) return;
  CFlowModelDoc first;
  if (!first.OpenText(input, kPath)) return Require(!first.Error().empty(), "a refused setup has a reason");
  const int valid = first.Root().Validate();
  std::vector<OverviewLine> overview;
  GenerateOverview(first.Root(), overview);
  std::string text, error;
  Require(first.BuildText(kFolder, text, error), "what was opened can be written", error);

  CFlowModelDoc second;
  Require(second.OpenText(text, kPath), "what was written opens", second.Error());
  for (const KvfUnread& unread : second.Report().unread)
    Require(false, "what was written is read", unread.path + ": " + unread.text);
  Require(second.Root().Validate() == valid, "a written setup is as valid as it was", text);
  std::string again;
  Require(second.BuildText(kFolder, again, error), "what was opened can be written", error);
  Require(text == again, "the text is the same the second time", text + "\n---- and then:\n" + again);
}

}  // namespace
}  // namespace tervane

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  tervane::Check({reinterpret_cast<const char*>(data), size});
  return 0;
}
