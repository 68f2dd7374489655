// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/state_buffer.h"

#include <set>

#include <gtest/gtest.h>

namespace tervane::state_buffer_test {
namespace {

std::uint64_t FingerprintOf(const auto&... values) {
  StateFingerprint fingerprint;
  (fingerprint.Put(values), ...);
  return fingerprint.Number();
}

TEST(StateFingerprint, EveryByteOfATextCounts) {
  std::set<std::uint64_t> found;
  std::size_t texts = 0;
  for (std::size_t size = 0; size <= 40; ++size) {
    std::string text(size, 'a');
    found.insert(FingerprintOf(text)), ++texts;
    for (std::size_t place = 0; place < size; ++place) {
      text[place] = 'b';
      found.insert(FingerprintOf(text)), ++texts;
      text[place] = 'a';
    }
  }
  EXPECT_EQ(found.size(), texts);
}

TEST(StateFingerprint, ValuesCountWithTheirPlacesAndBits) {
  using Text = std::string;
  const std::uint64_t different[] = {
      FingerprintOf(1, 2),
      FingerprintOf(2, 1),
      FingerprintOf(1, 2, 0),
      FingerprintOf(0.0, 1.0F),
      FingerprintOf(-0.0, 1.0F),
      FingerprintOf(Text("ab"), Text("c")),
      FingerprintOf(Text("a"), Text("bc")),
      FingerprintOf(Text("a"), Text()),
      FingerprintOf(Text(), Text("a")),
      FingerprintOf(FileName("a", "/b")),
      FingerprintOf(FileName("a", "/c")),
      FingerprintOf(std::vector{1, 2, 3}),
      FingerprintOf(std::vector{1, 3, 2}),
      FingerprintOf(CYbDateTime(2000, 1, 2, 3, 4, 5)),
      FingerprintOf(CYbDateTime(2000, 1, 2, 3, 4, 6)),
  };
  EXPECT_EQ(std::set(std::begin(different), std::end(different)).size(), std::size(different));
}

}  // namespace
}  // namespace tervane::state_buffer_test
