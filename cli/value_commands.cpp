// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <charconv>
#include <optional>
#include <vector>

#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/offers.h"
#include "cli/setup_file.h"
#include "core/kvf_writer.h"
#include "platform/text.h"

namespace tervane {

int GetCommand(const std::string& file, const std::string& typed, Streams streams) {
  CFlowModelDoc document;
  if (!OpenSetup(document, file, streams)) return kCouldNot;
  PrintLoadReportHint(document, streams);
  const SetupPath path = ParseSetupPath(typed);
  const CYbSEKvfBase* node = FindNodeOrReport(document, path, typed, streams);
  if (!node) return kCouldNot;
  const WrittenSetup written(document);
  KvfSection* section = written.SectionOf(*node);
  const KvfNode* key = section ? FindKeyOrReport(*section, path.key, typed, streams) : nullptr;
  if (!key) return kCouldNot;
  fmt::print(streams.out, "{}\n", PlainValuesText(*key));
  return kDone;
}

namespace {

struct ValueOptions {
  std::string file, path, value;
  bool force = false;
};

template <class Number>
bool ReadNumber(std::string_view text, Number& number) {
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
  return error == std::errc() && end == text.data() + text.size() && !text.empty();
}

/// Takes a typed value in the type that the key has; gives what was expected when it is none.
std::string TakeValue(std::string_view text, KvfFile& file, KvfParam& param) {
  switch (param.type) {
    case KvfType::Int:
      return ReadNumber(text, param.asInt) ? "" : "a whole number from -2147483648 to 2147483647";
    case KvfType::Float:
      if (text.ends_with('f') && !text.ends_with("inf")) text.remove_suffix(1);
      return ReadNumber(text, param.asFloat) ? "" : "a number that fits a float";
    case KvfType::Double:
      return ReadNumber(text, param.asDouble) ? "" : "a number";
    case KvfType::Bool:
      param.asBool = text == "true";
      return text == "true" || text == "false" ? "" : "true or false";
    case KvfType::String:
    case KvfType::Filename:
      if (FirstInvalidUtf8(text)) return "a text in UTF-8";
      file.SetText(param, text);
      return "";
  }
  return "";
}

/// The parts of a typed value: as many as the key has values. A date may be typed as 2000-01-31 12:00.
std::vector<std::string_view> SplitValue(std::string_view value, std::uint32_t count) {
  std::vector<std::string_view> parts;
  if (count == 1) return {value};
  const std::string_view separators = value.find(',') != std::string_view::npos ? "," : "-T: ";
  while (true) {
    const std::size_t end = value.find_first_of(separators);
    parts.push_back(Trimmed(value.substr(0, end)));
    if (end == std::string_view::npos) return parts;
    value.remove_prefix(end + 1);
  }
}

std::string TakeValues(std::string_view value, KvfFile& file, KvfNode& key) {
  const std::vector<std::string_view> parts = SplitValue(value, key.count);
  if (parts.size() != key.count) return fmt::format("{} values separated by commas", key.count);
  for (std::uint32_t i = 0; i < key.count; ++i)
    if (std::string expected = TakeValue(parts[i], file, key.params[i]); !expected.empty()) return expected;
  return {};
}

int SetCommand(const std::string& file, const std::string& typed, const std::string& value, bool force,
               Streams streams) {
  if (RefuseHeld(file, force, streams)) return kCouldNot;
  CFlowModelDoc document;
  if (!OpenSetup(document, file, streams)) return kCouldNot;
  PrintLoadReport(document, streams);
  const SetupPath path = ParseSetupPath(typed);
  const CYbSEKvfBase* node = FindNodeOrReport(document, path, typed, streams);
  if (!node) return kCouldNot;

  // The value is put where the file would hold it, and that file is read as any other: so a key means here what it
  // means to the nodes.
  const WrittenSetup written(document);
  KvfSection* section = written.SectionOf(*node);
  KvfNode* key = section ? FindKeyOrReport(*section, path.key, typed, streams) : nullptr;
  if (!key) return kCouldNot;
  if (const std::string expected = TakeValues(value, written.File(), *key); !expected.empty()) {
    fmt::print(streams.err, "{} = {}: {} was expected\n", typed, value, expected);
    return kCouldNot;
  }
  const std::string wanted = KvfValuesText(*key);
  std::string text, error;
  CFlowModelDoc changed;
  if (!WriteKvfText(written.File(), text, error) || !changed.OpenText(text, file)) {
    fmt::print(streams.err, "{} = {}: {}\n", typed, value, error.empty() ? changed.Error() : error);
    return kCouldNot;
  }
  const WrittenSetup result(changed);
  const CYbSEKvfBase* changedNode = FindNode(changed.Root(), path.steps);
  KvfSection* changedSection = changedNode ? result.SectionOf(*changedNode) : nullptr;
  const KvfNode* taken = changedSection ? FindKvfNode(*changedSection, true, Trimmed(path.key.name),
                                                      static_cast<std::size_t>(path.key.instance))
                                        : nullptr;
  if (!taken || KvfValuesText(*taken) != wanted) {
    fmt::print(streams.err, "{} = {}: the setup does not take this value: it would be saved as {}\n", typed, value,
               taken ? PlainValuesText(*taken) : "nothing");
    return kCouldNot;
  }
  changed.Continue(document);
  if (!changed.OnSaveDocument(file)) {
    fmt::print(streams.err, "{}\n", changed.Error());
    return kCouldNot;
  }
  for (const std::string& note : changed.SaveNotes()) fmt::print(streams.err, "{}: {}\n", file, note);
  return kDone;
}

}  // namespace

void OfferValueCommands(CommandOffers& offers) {
  auto options = std::make_shared<ValueOptions>();
  CLI::App* get = offers.Command("get", "Print the value of a key, as it would be saved", [offers, options] {
    return GetCommand(options->file, options->path, offers.Output());
  });
  CLI::App* set = offers.Command("set", "Change the value of a key and save the setup", [offers, options] {
    return SetCommand(options->file, options->path, options->value, options->force, offers.Output());
  });
  for (CLI::App* command : {get, set}) {
    AddSetup(command, options->file);
    command->add_option("PATH", options->path, "The key, as SECTION/SECTION:KEY")->required();
  }
  set->add_option("VALUE", options->value, "The value; several separated by commas; dates also as 2000-01-31 12:00")
      ->required();
  set->add_flag("--force", options->force, "Also where an editor has the setup open");
}

}  // namespace tervane
