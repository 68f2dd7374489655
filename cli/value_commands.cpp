// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <cmath>
#include <memory>
#include <vector>

#include <fmt/format.h>
#include <fmt/ostream.h>
#include <fmt/ranges.h>

#include "access/repeated_key.h"
#include "access/setup_change.h"
#include "cli/offers.h"
#include "cli/parts/json.h"
#include "cli/parts/setup_file.h"
#include "core/kvf_writer.h"
#include "document/key_reference.h"
#include "platform/text.h"

namespace tervane {

namespace {

std::string JsonRepeated(const RepeatedKey& key, const std::vector<std::string>& values) {
  return JsonObject({{"key", JsonQuoted(key.key)}, {"values", JsonArray(values)}});
}

}  // namespace

int GetCommand(const std::string& file, const std::string& typed, bool json, Streams streams) {
  CFlowModelDoc document;
  if (!OpenSetup(document, file, streams)) return kCouldNot;
  PrintLoadReportHint(document, streams);
  const SetupPath path = ParseSetupPath(typed);
  if (const auto repeated = FindRepeatedKey(document, path)) {
    const std::vector<std::string> values = ValuesOf(WrittenSetup(document), document, *repeated);
    if (json)
      fmt::print(streams.out, "{}\n", JsonRepeated(*repeated, values));
    else
      fmt::print(streams.out, "{}\n", fmt::join(values, ", "));
    return kDone;
  }
  const CYbSEKvfBase* node = FindNodeOrReport(document, path, typed, streams);
  if (!node) return kCouldNot;
  const WrittenSetup written(document);
  KvfSection* section = written.SectionOf(*node);
  const KvfNode* key = section ? FindKeyOrReport(*section, path.key, typed, streams) : nullptr;
  if (!key) return kCouldNot;
  if (json)
    fmt::print(streams.out, "{}\n", JsonKey(*key, PathOf(*node), KeyReference()));
  else
    fmt::print(streams.out, "{}\n", PlainValuesText(*key));
  return kDone;
}

namespace {

struct ValueOptions {
  std::string file, path, value;
  std::vector<std::string> more;  ///< Further keys, each with its value behind it.
  bool force = false, json = false;
};

/// What the setup finds of a key that was changed.
void PrintFindings(const CFlowModelDoc& document, const TypedChange& change, Streams streams) {
  const SetupPath path = ParseSetupPath(change.path);
  const CYbSEKvfBase* node = FindNode(document.Root(), path.steps);
  if (!node) return;
  for (const Finding& finding : node->Findings())
    if (finding.key == Trimmed(path.key.name))
      fmt::print(streams.err, "{}: {}: {}{}\n", change.path, NameOf(finding.severity), OneLine(finding.text),
                 finding.detail.empty() ? std::string() : fmt::format(" ({})", OneLine(finding.detail)));
}

int SetCommand(const std::string& file, const std::vector<TypedChange>& changes, bool force, Streams streams) {
  SetupLock lock;
  if (!HoldSetup(lock, file, force, streams)) return kCouldNot;
  auto document = std::make_unique<CFlowModelDoc>();
  if (!OpenSetup(*document, file, streams)) return kCouldNot;
  PrintLoadReport(*document, streams);
  for (const TypedChange& change : changes) {
    std::string problem;
    document = ReadWithChange(*document, change, problem);
    if (!document) return Refuse(streams, problem);
  }
  if (!SaveSetup(*document, file, "set", streams)) return kCouldNot;
  for (const TypedChange& change : changes) PrintFindings(*document, change, streams);
  return kDone;
}

std::string JsonValue(const KvfParam& param) {
  switch (param.type) {
    case KvfType::Int:
      return std::to_string(param.asInt);
    case KvfType::Float:
      // JSON knows no number that is none.
      return std::isfinite(param.asFloat) ? ShortestNumber(param.asFloat) : JsonQuoted(ShortestNumber(param.asFloat));
    case KvfType::Double:
      return std::isfinite(param.asDouble) ? ShortestNumber(param.asDouble)
                                           : JsonQuoted(ShortestNumber(param.asDouble));
    case KvfType::Bool:
      return JsonBool(param.asBool);
    default:
      return JsonQuoted(param.Text());
  }
}

}  // namespace

std::string JsonKey(const KvfNode& keyword, std::string_view sectionPath, const KeyReference& reference) {
  std::vector<std::string> values;
  for (std::uint32_t i = 0; i < keyword.count; ++i) values.push_back(JsonValue(keyword.params[i]));
  const auto optional = [](std::string_view text) { return text.empty() ? std::string() : JsonQuoted(text); };
  const KeyInfo* info = reference.Find(sectionPath, keyword.Name());
  const bool hasChoices = info && !info->facts.choices.empty();
  const std::string_view meaning = reference.MeaningOf(sectionPath, keyword.Name(), KvfValuesText(keyword));
  return JsonObject({{"key", JsonQuoted(keyword.Name())},
                     {"values", JsonArray(values)},
                     {"text", hasChoices ? optional(meaning) : ""},
                     {"unit", hasChoices ? "" : optional(meaning)},
                     {"default", optional(reference.DefaultOf(sectionPath, keyword.Name()))}});
}

void OfferValueCommands(CommandOffers& offers) {
  auto options = std::make_shared<ValueOptions>();
  Command get = offers.Offer("get", "Print the value of a key, as it would be saved", [offers, options] {
    return GetCommand(options->file, options->path, options->json, offers.Output());
  });
  Command set = offers.Offer("set", "Change the values of keys and save the setup", [offers, options] {
    if (options->more.size() % 2 != 0)
      return Refuse(offers.Output(), fmt::format("{}: a value was expected behind this key", options->more.back()));
    std::vector<TypedChange> changes{{options->path, options->value}};
    for (std::size_t i = 0; i < options->more.size(); i += 2)
      changes.push_back({options->more[i], options->more[i + 1]});
    return SetCommand(options->file, changes, options->force, offers.Output());
  });
  for (Command* command : {&get, &set}) {
    AddSetup(*command, options->file);
    command->Add("PATH", options->path, "The key, as SECTION/SECTION:KEY").Required();
  }
  get.AddFlag("--json", options->json, "As JSON, with its meaning and its default");
  set.Add("VALUE", options->value, "The value; see VALUES").Required();
  set.Add("MORE", options->more, "Further keys, each with its value behind it; all are changed, or none");
  set.Footer(
      "VALUES. As the file holds them, several separated by commas; as a page takes them: the text of a choice\n"
      "(\"Richards equation\"), a number with a unit (\"2 days\"), a date (2000-01-31, \"2000-01-31 12:00\"), a list "
      "(3, 4).");
  set.AddFlag("--force", options->force, "Also where an editor has the setup open");
}

}  // namespace tervane
