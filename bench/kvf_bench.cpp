// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Reading and writing of a large parameter file, beside RapidJSON and pugixml with the same content.
#include <cmath>
#include <cstring>
#include <memory>
#include <string>
#include <vector>

#include <fmt/format.h>
#include <malloc.h>
#include <pugixml.hpp>
#include <rapidjson/document.h>
#include <rapidjson/prettywriter.h>
#include <rapidjson/stringbuffer.h>

#include "bench/example_file.h"
#include "bench/median_table.h"
#include "core/kvf_parser.h"
#include "core/kvf_writer.h"
#include "platform/os.h"

namespace tervane::bench {

namespace {

/// Like opening a file, whose text is read into the file's own buffer: the copy counts.
std::unique_ptr<KvfFile> ReadKvf(const std::string& text) {
  auto file = std::make_unique<KvfFile>();
  file->text = FileContent::Of(text);
  if (!ParseKvf(*file)) fmt::print("the example is not read: {}\n", file->syntaxError.message);
  return file;
}

std::string WriteKvf(const KvfFile& file) {
  std::string text, error;
  if (!WriteKvfText(file, text, error)) fmt::print("the example is not written: {}\n", error);
  return text;
}

// ---- JSON

using Json = rapidjson::Document;

std::unique_ptr<Json> ReadJson(const std::string& text) {
  auto document = std::make_unique<Json>();
  document->Parse<rapidjson::kParseFullPrecisionFlag>(text.data(), text.size());
  if (document->HasParseError()) fmt::print("the example is no JSON\n");
  return document;
}

std::unique_ptr<rapidjson::StringBuffer> WriteJson(const Json& document) {
  auto buffer = std::make_unique<rapidjson::StringBuffer>();
  rapidjson::PrettyWriter writer(*buffer);
  writer.SetIndent(' ', 2);
  writer.SetFormatOptions(rapidjson::kFormatSingleLineArray);
  document.Accept(writer);
  return buffer;
}

void AddToSum(const rapidjson::Value& value, ContentSum& sum) {
  if (value.IsObject()) {
    for (const auto& member : value.GetObject()) AddToSum(member.value, sum);
  } else if (value.IsArray()) {
    for (const rapidjson::Value& element : value.GetArray()) AddToSum(element, sum);
  } else {
    ++sum.values;
    if (value.IsString())
      sum.textBytes += value.GetStringLength();
    else if (value.IsBool())
      sum.trues += value.GetBool();
    else
      sum.numbers += value.GetDouble();
  }
}

// ---- XML

/// Converts every value of the tree, as a reader of parameters must.
void AddToSum(pugi::xml_node parent, ContentSum& sum) {
  for (const pugi::xml_node node : parent.children()) {
    const pugi::xml_attribute type = node.first_attribute();
    if (!type) {
      AddToSum(node, sum);
      continue;
    }
    ++sum.values;
    const pugi::xml_text text = node.text();
    switch (*type.value()) {
      case 'i':
        sum.numbers += text.as_int();
        break;
      case 'f':
        sum.numbers += static_cast<double>(text.as_float());
        break;
      case 'd':
        sum.numbers += text.as_double();
        break;
      case 'b':
        sum.trues += text.as_bool();
        break;
      default:
        sum.textBytes += std::strlen(text.get());
    }
  }
}

struct XmlContent {
  pugi::xml_document document;
  ContentSum sum;
};

std::unique_ptr<XmlContent> ReadXml(const std::string& text) {
  auto content = std::make_unique<XmlContent>();
  if (!content->document.load_buffer(text.data(), text.size())) fmt::print("the example is no XML\n");
  AddToSum(content->document, content->sum);
  return content;
}

// ---- Checks and memory

/// The content of one form; it must be that of the parameter file, but for floats, which JSON holds as doubles.
void PrintSum(std::string_view form, std::size_t bytes, const ContentSum& sum, const ContentSum& expected) {
  fmt::print("{:<16} {:>10} bytes, {} values, numbers add up to {:.3f}\n", form, bytes, sum.values, sum.numbers);
  if (sum.values != expected.values || sum.textBytes != expected.textBytes || sum.trues != expected.trues ||
      std::abs(sum.numbers - expected.numbers) > 1e-9 * expected.numbers)
    fmt::print("WRONG: the content is not that of the parameter file\n");
}

/// Bytes that the allocator has handed out, its own overhead included.
std::size_t BytesInUse() {
  const struct mallinfo2 info = mallinfo2();
  return info.uordblks + info.hblkhd;
}

void PrintMemory(const std::string& text) {
  malloc_trim(0);
  const std::size_t usedBefore = BytesInUse();
  const std::uint64_t residentBefore = os::ResidentMemory();
  const std::unique_ptr<KvfFile> file = ReadKvf(text);
  const auto perByte = [&](std::uint64_t bytes) {
    return static_cast<double>(bytes) / static_cast<double>(text.size());
  };
  const double used = perByte(BytesInUse() - usedBefore);
  const double resident = perByte(os::ResidentMemory() - residentBefore);
  fmt::print("\n{:<76} {:>7} {:>7}\n", "memory of a read file, its text included, for each byte of text", "found",
             "limit");
  fmt::print("{:<76} {:>7.2f} {:>7.2f}  {}\n", "allocated", used, 4.0, Verdict(used, 4));
  fmt::print("{:<76} {:>7.2f} {:>7.2f}  {}\n", "growth of the resident memory", resident, 4.0, Verdict(resident, 4));
}

int Run(int argc, char** argv) {
  std::string kvf, compactJson, indentedJson, xml;
  {
    const std::unique_ptr<KvfFile> example = MakeExampleFile();
    kvf = WriteKvf(*example);
    compactJson = AsCompactJson(*example);
    indentedJson = AsIndentedJson(*example);
    xml = AsXml(*example);
  }
  PrintMemory(kvf);

  const std::unique_ptr<KvfFile> file = ReadKvf(kvf);
  const std::unique_ptr<Json> json = ReadJson(compactJson);
  ContentSum kvfSum, jsonSum;
  AddToSum(file->top, kvfSum);
  AddToSum(*json, jsonSum);
  fmt::print("\n");
  PrintSum("parameter file", kvf.size(), kvfSum, kvfSum);
  PrintSum("JSON compact", compactJson.size(), jsonSum, kvfSum);
  PrintSum("JSON indented", indentedJson.size(), jsonSum, kvfSum);
  PrintSum("XML compact", xml.size(), ReadXml(xml)->sum, kvfSum);
  fmt::print("written: parameter file {} bytes, JSON indented {} bytes\n", WriteKvf(*file).size(),
             WriteJson(*json)->GetSize());
  if (WriteKvf(*file) != kvf) fmt::print("WRONG: the file does not come back as it was read\n");

  MedianTable table(21);
  table.Add("read parameter file", [&] { return ReadKvf(kvf); });
  table.Add("read compact JSON", [&] { return ReadJson(compactJson); });
  table.Add("read indented JSON", [&] { return ReadJson(indentedJson); });
  table.Add("read and convert XML", [&] { return ReadXml(xml); });
  table.Add("write parameter file", [&] { return WriteKvf(*file); });
  table.Add("write indented JSON", [&] { return WriteJson(*json); });
  table.Limit("read parameter file", "read compact JSON", 1.3);
  table.Limit("read parameter file", "read indented JSON", 1.3);
  table.Limit("read parameter file", "read and convert XML", 0.7);
  table.Limit("write parameter file", "write indented JSON", 1.0);
  table.Run(argc, argv);
  return 0;
}

}  // namespace

}  // namespace tervane::bench

int main(int argc, char** argv) { return tervane::bench::Run(argc, argv); }
