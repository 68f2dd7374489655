// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "bench/example_file.h"

#include <array>
#include <random>

#include <fmt/format.h>
#include <rapidjson/prettywriter.h>
#include <rapidjson/stringbuffer.h>

#include "core/kvf.h"
#include "core/kvf_writer.h"
#include "platform/text.h"

namespace tervane::bench {

namespace {

/// Makes the example. The standard's distributions differ from library to library; plain remainders do not.
class ExampleMaker {
 public:
  explicit ExampleMaker(KvfFile& file) : file_(&file) {}

  void Make() {
    kvfAddTarget(file_, "EXAMPLE");
    AddSections(0);
    kvfEndSection(file_);
  }

 private:
  struct Level {
    const char* name;
    int count;
  };
  static constexpr std::array<Level, 4> kLevels{{{"Catchment", 20}, {"River", 20}, {"Branch", 10}, {"Reach", 9}}};
  static constexpr int kKeywordsPerSection = 15;
  static constexpr std::array kKeys{
      "Area",     "Depth",      "Porosity",  "Length",  "Slope",    "Width",      "Roughness", "Active",
      "Storage",  "Leakage",    "Level",     "Type",    "Name",     "StartDate",  "EndDate",   "DataFile",
      "FileName", "Specific",   "XOrigin",   "YOrigin", "CellSize", "Rotation",   "Comment",   "TimeStep",
      "MaxStep",  "MinStep",    "Threshold", "Factor",  "Exponent", "Saturation", "Residual",  "Conduct",
      "Head",     "Flux",       "Capacity",  "Demand",  "Priority", "LinkId",     "ItemType",  "Species",
      "Decay",    "Dispersion", "Drain",     "Layers",  "Weighting"};

  std::size_t Random(std::size_t below) { return static_cast<std::size_t>(random_() % below); }
  template <std::size_t count>
  const char* OneOf(const std::array<const char*, count>& texts) {
    return texts[Random(count)];
  }

  void AddSections(std::size_t depth) {
    if (depth == kLevels.size()) return;
    for (int number = 1; number <= kLevels[depth].count; ++number) {
      kvfAddSection(file_, fmt::format("{}_{}", kLevels[depth].name, number));
      const std::size_t first = Random(kKeys.size());
      for (std::size_t i = 0; i < kKeywordsPerSection; ++i) AddKeyword(kKeys[(first + i) % kKeys.size()]);
      AddSections(depth + 1);
      kvfEndSection(file_);
    }
  }

  void AddKeyword(const char* key) {
    switch (Random(9)) {
      case 0:
        kvfPutParam(file_, key, static_cast<int>(Random(100'000)) - 1000);
        break;
      case 1:
        kvfPutParam(file_, key, static_cast<float>(Random(1'000'000)) * 1e-4f);
        break;
      case 2:  // a coordinate, with all its digits
        kvfPutParam(file_, key, static_cast<double>(random_() >> 11) * 0x1p-53 * 1e6);
        break;
      case 3:
        kvfPutParam(file_, key, static_cast<double>(Random(100'000)) / 100);
        break;
      case 4:
        kvfPutParam(file_, key, Random(2) == 1);
        break;
      case 5:
        kvfPutParam(file_, key,
                    OneOf(std::array{"upper branch", "Kinematic routing", "gauge 14", "", "Bräda å", "no flow"}));
        break;
      case 6:
        kvfPutParam(file_, key, OneOf(std::array{"the \"old\" weir", "gate\\lock", "two\nlines", "a\tb"}));
        break;
      case 7:
        kvfPutParamFilename(file_, key, fmt::format("maps/{}.nds2", Random(1000)));
        break;
      default:
        kvfPutListParam(file_, key, "iiiii", 1950 + static_cast<int>(Random(100)), 1 + static_cast<int>(Random(12)),
                        1 + static_cast<int>(Random(28)), static_cast<int>(Random(24)), static_cast<int>(Random(60)));
    }
  }

  KvfFile* file_;
  std::mt19937_64 random_{20'260'101};
};

// ---- JSON

/// The number with the same digits as in our form; a point tells a JSON reader that it is no whole number.
std::string NumberText(const KvfParam& value) {
  std::string text = KvfValueText(value);
  if (value.type != KvfType::Float) return text;
  text.pop_back();
  if (text.find_first_of(".e") == std::string::npos) text += ".0";
  return text;
}

template <class Writer>
void WriteJsonValue(const KvfParam& value, Writer& writer) {
  if (value.IsText()) {
    writer.String(value.text, value.length);
  } else if (value.type == KvfType::Bool) {
    writer.Bool(value.asBool);
  } else {
    const std::string text = NumberText(value);
    writer.RawValue(text.data(), text.size(), rapidjson::kNumberType);
  }
}

template <class Writer>
void WriteJsonSection(const KvfSection& section, Writer& writer) {
  writer.StartObject();
  for (const KvfNode* node = section.firstChild; node; node = node->next) {
    writer.Key(node->name->text, node->name->length);
    if (const KvfSection* child = AsSection(node)) {
      WriteJsonSection(*child, writer);
    } else if (node->count == 1) {
      WriteJsonValue(node->params[0], writer);
    } else {
      writer.StartArray();
      for (std::uint32_t i = 0; i < node->count; ++i) WriteJsonValue(node->params[i], writer);
      writer.EndArray();
    }
  }
  writer.EndObject();
}

// ---- XML

void AppendXmlText(std::string_view value, std::string& text) {
  for (const char c : value) {
    if (c == '&')
      text += "&amp;";
    else if (c == '<')
      text += "&lt;";
    else
      text += c;
  }
}

void AppendXmlValue(std::string_view element, const KvfParam& value, std::string& text) {
  constexpr std::string_view letters = "ifdbsn";
  text += fmt::format("<{} t=\"{}\">", element, letters[static_cast<std::size_t>(value.type)]);
  AppendXmlText(value.IsText() ? std::string(value.Text()) : NumberText(value), text);
  text += fmt::format("</{}>", element);
}

void AppendXmlSection(const KvfSection& section, std::string& text) {
  for (const KvfNode* node = section.firstChild; node; node = node->next) {
    const KvfSection* child = AsSection(node);
    if (!child && node->count == 1) {
      AppendXmlValue(node->Name(), node->params[0], text);
      continue;
    }
    text += fmt::format("<{}>", node->Name());
    if (child)
      AppendXmlSection(*child, text);
    else
      for (std::uint32_t i = 0; i < node->count; ++i) AppendXmlValue("v", node->params[i], text);
    text += fmt::format("</{}>", node->Name());
  }
}

void AddToSum(const KvfParam& value, ContentSum& sum) {
  ++sum.values;
  switch (value.type) {
    case KvfType::Int:
      sum.numbers += value.asInt;
      break;
    case KvfType::Float:
      sum.numbers += static_cast<double>(value.asFloat);
      break;
    case KvfType::Double:
      sum.numbers += value.asDouble;
      break;
    case KvfType::Bool:
      sum.trues += value.asBool;
      break;
    case KvfType::String:
    case KvfType::Filename:
      sum.textBytes += value.length;
      break;
  }
}

}  // namespace

std::unique_ptr<KvfFile> MakeExampleFile() {
  auto file = std::make_unique<KvfFile>();
  ExampleMaker(*file).Make();
  return file;
}

std::string AsCompactJson(const KvfFile& file) {
  rapidjson::StringBuffer buffer;
  rapidjson::Writer writer(buffer);
  WriteJsonSection(file.top, writer);
  return {buffer.GetString(), buffer.GetSize()};
}

std::string AsIndentedJson(const KvfFile& file) {
  rapidjson::StringBuffer buffer;
  rapidjson::PrettyWriter writer(buffer);
  writer.SetIndent(' ', 2);
  writer.SetFormatOptions(rapidjson::kFormatSingleLineArray);
  WriteJsonSection(file.top, writer);
  return {buffer.GetString(), buffer.GetSize()};
}

std::string AsXml(const KvfFile& file) {
  std::string text;
  AppendXmlSection(file.top, text);
  return text;
}

void AddToSum(const KvfSection& section, ContentSum& sum) {
  for (const KvfNode* node = section.firstChild; node; node = node->next) {
    if (const KvfSection* child = AsSection(node)) AddToSum(*child, sum);
    for (std::uint32_t i = 0; i < (node->IsKeyword() ? node->count : 0); ++i) AddToSum(node->params[i], sum);
  }
}

}  // namespace tervane::bench
