// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Any bytes as a text of points for series. What stops an import is told with its line, the points before it stand, and
// a setup with them is written as a text that opens again and is the same the second time.
#include <cstdint>
#include <string>

#include "document/flow_model_document.h"
#include "fuzz/require.h"
#include "results/detailed_series.h"
#include "results/storing.h"

namespace tervane {
namespace {

using fuzz::Require;

constexpr const char* kFolder = "/setups";

template <class List>
void Import(List& list, std::string_view input) {
  const DetailedImport done = ImportDetailedText(list, input, "/points.txt", kFolder, "Import file");
  Require(done.added == list.GetItemCount(), "each point that was added is there");
  Require((done.result == 0) == !done.message.empty(), "what stops an import is told", done.message);
  for (int number = 1; number <= list.GetItemCount(); ++number) {
    const auto& item = *list.GetItem(number);
    Require(item.InclObserved == 0 || item.InclObserved == 1, "observed values belong to a point or not");
    Require(item.Observed().Items.size() == 1, "a point has one item of its file");
  }
}

void Check(std::string_view input) {
  // Longer texts tell nothing new, and cost time.
  constexpr std::size_t kLongest = std::size_t{1} << 16;
  if (input.size() > kLongest) return;
  CFlowModelDoc first;
  auto& storing = *first.Root().Important(kStoringResults);
  Import(*storing.Child<CDetailedTSOutputListKvf>(), input);
  Import(*storing.Child<CDetailedFvrTSOutputListKvf>(), input);
  first.Root().Validate();
  std::string text, again, error;
  const bool isWritten = first.BuildText(kFolder, text, error);
  Require(isWritten, "imported points can be written", error);
  CFlowModelDoc second;
  Require(second.OpenText(text, "/setups/fuzzed.tvd"), "what was written opens", second.Error());
  Require(second.BuildText(kFolder, again, error), "what was opened can be written", error);
  Require(text == again, "the text is the same the second time", text + "\n---- and then:\n" + again);
}

}  // namespace
}  // namespace tervane

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  tervane::Check({reinterpret_cast<const char*>(data), size});
  return 0;
}
