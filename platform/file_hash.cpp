// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/file_hash.h"

#include <fstream>
#include <memory>

#include <fmt/format.h>

#include "platform/paths.h"

#define XXH_INLINE_ALL
#include <xxhash.h>

namespace tervane {

FileResult HashFile(const std::string& path, std::string& hash, ProgressPart progress) {
  if (std::string problem = WhyNotReadable(path); !problem.empty()) return {std::move(problem), {}};
  std::ifstream file(NativePath(path), std::ios::binary);
  const std::unique_ptr<XXH3_state_t, decltype(&XXH3_freeState)> state(XXH3_createState(), XXH3_freeState);
  XXH3_128bits_reset(state.get());
  constexpr std::size_t kBlock = 1u << 20;
  const auto block = std::make_unique<char[]>(kBlock);
  const auto whole = static_cast<double>(StampOf(path).size);
  double done = 0;
  while (file) {
    if (progress.IsCancelled()) return {"cancelled", {}};
    file.read(block.get(), kBlock);
    XXH3_128bits_update(state.get(), block.get(), static_cast<std::size_t>(file.gcount()));
    done += static_cast<double>(file.gcount());
    if (whole > 0) progress.Report(done / whole);
  }
  if (!file.eof()) return {fmt::format("cannot read {}: reading stopped", path), {}};
  const XXH128_hash_t digest = XXH3_128bits_digest(state.get());
  hash = fmt::format("{:016x}{:016x}", digest.high64, digest.low64);
  return {};
}

}  // namespace tervane
