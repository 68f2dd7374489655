// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "execution/engine_line.h"

#include <charconv>

#include "platform/text.h"

namespace tervane {

namespace {

/// The place of the first ": " that stands in no quotes; npos when there is none.
std::size_t EndOfPlace(std::string_view text) {
  bool isQuoted = false;
  for (std::size_t i = 0; i + 1 < text.size(); ++i) {
    if (text[i] == '"') isQuoted = !isQuoted;
    if (!isQuoted && text[i] == ':' && text[i + 1] == ' ') return i;
  }
  return std::string_view::npos;
}

}  // namespace

std::optional<EngineProgress> EngineProgressOf(std::string_view line) {
  constexpr std::string_view kWord = "progress ";
  if (!line.starts_with(kWord)) return std::nullopt;
  const std::string_view rest = Trimmed(line.substr(kWord.size()));
  EngineProgress progress;
  const auto [end, error] = std::from_chars(rest.data(), rest.data() + rest.size(), progress.percent);
  if (error != std::errc() || !(progress.percent >= 0 && progress.percent <= 100)) return std::nullopt;
  std::string_view text = rest.substr(static_cast<std::size_t>(end - rest.data()));
  if (text.starts_with('%')) text.remove_prefix(1);
  if (!text.empty() && text.front() != ' ' && text.front() != '\t') return std::nullopt;
  progress.text = Trimmed(text);
  return progress;
}

std::optional<EngineMessage> EngineMessageOf(std::string_view line) {
  constexpr std::string_view kError = "error: ", kWarning = "warning: ";
  const bool isError = line.starts_with(kError);
  if (!isError && !line.starts_with(kWarning)) return std::nullopt;
  line.remove_prefix(isError ? kError.size() : kWarning.size());
  EngineMessage message{isError, {}, {}};
  const std::size_t end = EndOfPlace(line);
  if (end != std::string_view::npos) {
    message.place = Trimmed(line.substr(0, end));
    line.remove_prefix(end + 2);
  }
  message.text = Trimmed(line);
  return message;
}

}  // namespace tervane
