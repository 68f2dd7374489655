// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <cmath>

#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/offers.h"
#include "cli/parts/json.h"
#include "core/doc_version.h"
#include "core/list.h"
#include "document/key_reference.h"
#include "platform/text.h"

namespace tervane {

namespace {

struct KeysOptions {
  bool markdown = false, json = false;
};

/// The versions of documents in which a key is read, where there is a limit.
std::string Versions(const KeyInfo& key) {
  std::string text;
  if (key.since != KeyInfo::kNoLimit && key.since > 0) text = fmt::format("from version {}", key.since);
  if (key.until != KeyInfo::kNoLimit) text = fmt::format("up to version {}", key.until);
  if (!key.written) text += text.empty() ? "read only" : ", read only";
  return text;
}

/// The choices with the numbers that the file holds, the unit and the range.
std::string Facts(const KeyInfo& key) {
  std::vector<std::string> parts;
  for (const KeyChoice& choice : key.facts.choices)
    parts.push_back(fmt::format("{} {}", choice.value + key.inFile, choice.text));
  if (!key.facts.UnitText().empty()) parts.emplace_back(key.facts.UnitText());
  if (key.facts.HasRange()) parts.push_back(key.facts.RangeText());
  return fmt::format("{}", fmt::join(parts, "; "));
}

std::string WithoutTableMarks(std::string_view text) { return Replaced(text, "|", "\\|"); }

void WriteMarkdown(const KeySection& section, std::ostream& out) {
  fmt::print(out, "\n## {}\n\n{} (`{}`)\n\n", section.path, section.title, section.className);
  if (section.isList) fmt::print(out, "A list: begins with `{}` (int).\n\n", CYbSEKvfListBaseInterface::kItemCountKey);
  if (section.keys.empty()) return;
  fmt::print(out, "| Key | Type | Default | Versions | Values |\n|---|---|---|---|---|\n");
  for (const KeyInfo& key : section.keys)
    fmt::print(out, "| `{}` | {} | {} | {} | {} |\n", key.key, key.type,
               key.defaultValue.empty() ? "" : fmt::format("`{}`", WithoutTableMarks(key.defaultValue)), Versions(key),
               WithoutTableMarks(Facts(key)));
}

void WriteText(const KeySection& section, std::ostream& out) {
  for (const KeyInfo& key : section.keys)
    fmt::print(out, "{}:{}\t{}\t{}\t{}\t{}\n", section.path, Trimmed(key.key), key.type, key.defaultValue,
               Versions(key), Facts(key));
}

std::string Json(const KeySection& section, const KeyInfo& key) {
  const auto version = [](int number, int none) { return number == none ? std::string() : std::to_string(number); };
  const auto optional = [](std::string_view text) { return text.empty() ? std::string() : JsonQuoted(text); };
  const auto limit = [](double number) { return std::isfinite(number) ? ShortestNumber(number) : std::string(); };
  std::vector<std::string> choices;
  for (const KeyChoice& choice : key.facts.choices)
    choices.push_back(
        JsonObject({{"value", std::to_string(choice.value + key.inFile)}, {"text", JsonQuoted(choice.text)}}));
  return JsonObject({{"path", JsonQuoted(section.path)},
                     {"key", JsonQuoted(Trimmed(key.key))},
                     {"class", JsonQuoted(section.className)},
                     {"type", JsonQuoted(key.type)},
                     {"default", optional(key.defaultValue)},
                     {"since", key.since > 0 ? version(key.since, KeyInfo::kNoLimit) : ""},
                     {"until", version(key.until, KeyInfo::kNoLimit)},
                     {"written", JsonBool(key.written)},
                     {"choices", choices.empty() ? "" : JsonArray(choices)},
                     {"unit", optional(key.facts.UnitText())},
                     {"least", limit(key.facts.least)},
                     {"greatest", limit(key.facts.greatest)}});
}

int KeysCommand(const KeysOptions& options, Streams streams) {
  const KeyReference reference;
  if (options.json) {
    std::vector<std::string> keys;
    for (const KeySection& section : reference.Sections())
      for (const KeyInfo& key : section.keys) keys.push_back(Json(section, key));
    fmt::print(streams.out, "{}\n", JsonObject({{"keys", JsonArray(keys)}}));
    return kDone;
  }
  if (options.markdown)
    fmt::print(streams.out,
               "# Keys of a setup\n\nDocument version {}. Every section begins with `Touched` (int, whether its page "
               "was visited) and `IsDataUsedInSetup` (int, computed at every save).\n",
               CFlowModelDocVersionKvf::kWrittenVersion);
  else
    fmt::print(streams.out, "PLACE\tTYPE\tDEFAULT\tVERSIONS\tVALUES\n");
  for (const KeySection& section : reference.Sections())
    options.markdown ? WriteMarkdown(section, streams.out) : WriteText(section, streams.out);
  return kDone;
}

}  // namespace

void OfferKeysCommand(CommandOffers& offers) {
  auto options = std::make_shared<KeysOptions>();
  Command keys = offers.Offer("keys", "List all keys with place, type, default and values",
                              [offers, options] { return KeysCommand(*options, offers.Output()); });
  CommandOption markdown = keys.AddFlag("--markdown", options->markdown, "As a page of the manual");
  keys.AddFlag("--json", options->json, "As JSON").Excludes(markdown);
}

}  // namespace tervane
