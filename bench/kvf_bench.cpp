// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Reading and writing of a large parameter file, beside RapidJSON and pugixml with the same content. All read from
// memory, where the text lies ready, and once more from a file.
#include <cmath>
#include <cstring>
#include <filesystem>
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
#include "core/kvf.h"
#include "core/kvf_parser.h"
#include "core/kvf_writer.h"
#include "platform/files.h"
#include "platform/os.h"

namespace tervane::bench {

namespace {

std::unique_ptr<KvfFile> ReadKvf(const FileContent& text) {
  auto file = std::make_unique<KvfFile>();
  if (!ParseKvf(text, *file)) fmt::print("the example is not read: {}\n", file->syntaxError.message);
  return file;
}

struct KvfCloser {
  void operator()(KvfFile* file) const { kvfClose(&file); }
};

std::unique_ptr<KvfFile, KvfCloser> OpenKvf(const std::string& path) {
  std::unique_ptr<KvfFile, KvfCloser> file(kvfLoadFile(path, 0));
  if (kvfGetErrorGlb() != kKvfNoError) fmt::print("the example is not opened: {}\n", kvfErrorText());
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

FileContent ReadFile(const std::string& path) {
  FileContent text;
  if (const FileResult result = ReadWholeFile(path, text); !result.Ok()) fmt::print("{}\n", result.error);
  return text;
}

std::unique_ptr<Json> OpenJson(const std::string& path) {
  const FileContent text = ReadFile(path);
  auto document = std::make_unique<Json>();
  document->Parse<rapidjson::kParseFullPrecisionFlag>(text.data.get(), text.size);
  if (document->HasParseError()) fmt::print("the example is no JSON\n");
  return document;
}

/// JSON whose texts stay where they were read.
struct JsonInPlace {
  FileContent text;
  Json document;
};

std::unique_ptr<JsonInPlace> OpenJsonInPlace(const std::string& path) {
  auto json = std::make_unique<JsonInPlace>();
  json->text = ReadFile(path);
  json->document.ParseInsitu<rapidjson::kParseFullPrecisionFlag>(json->text.data.get());
  if (json->document.HasParseError()) fmt::print("the example is no JSON\n");
  return json;
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

/// The limit of the bytes of memory for each byte of text.
constexpr double kMostMemory = 2.5;

void PrintMemory(const std::string& path) {
  // What the allocator keeps of freed memory is no part of a file, before as behind.
  malloc_trim(0);
  const std::size_t usedBefore = BytesInUse();
  const std::uint64_t residentBefore = os::ResidentMemory();
  const auto file = OpenKvf(path);
  malloc_trim(0);
  const auto perByte = [&](std::uint64_t bytes) {
    return static_cast<double>(bytes) / static_cast<double>(std::filesystem::file_size(path));
  };
  const double used = perByte(BytesInUse() - usedBefore);
  const double resident = perByte(os::ResidentMemory() - residentBefore);
  fmt::print("\n{:<76} {:>7} {:>7}\n", "memory of an open file, all included, for each byte of its text", "found",
             "limit");
  fmt::print("{:<76} {:>7.2f} {:>7.2f}  {}\n", "allocated", used, kMostMemory, Verdict(used, kMostMemory));
  fmt::print("{:<76} {:>7.2f} {:>7.2f}  {}\n", "growth of the resident memory", resident, kMostMemory,
             Verdict(resident, kMostMemory));
}

/// A file of a folder that vanishes with it.
class ExampleFolder {
 public:
  ExampleFolder() : path_(std::filesystem::temp_directory_path() / fmt::format("kvf_bench-{}", os::ProcessId())) {
    std::filesystem::create_directory(path_);
  }
  ~ExampleFolder() {
    std::error_code ignored;
    std::filesystem::remove_all(path_, ignored);
  }
  ExampleFolder(const ExampleFolder&) = delete;
  ExampleFolder& operator=(const ExampleFolder&) = delete;

  std::string Add(const std::string& name, const std::string& text) const {
    std::string path = (path_ / name).string();
    if (const FileResult result = WriteFileAtomically(path, text); !result.Ok()) fmt::print("{}\n", result.error);
    return path;
  }

 private:
  std::filesystem::path path_;
};

int Run(int argc, char** argv) {
  std::string kvf, compactJson, indentedJson, xml;
  {
    const std::unique_ptr<KvfFile> example = MakeExampleFile();
    kvf = WriteKvf(*example);
    compactJson = AsCompactJson(*example);
    indentedJson = AsIndentedJson(*example);
    xml = AsXml(*example);
  }
  const ExampleFolder folder;
  const std::string kvfPath = folder.Add("example.tvd", kvf);
  const std::string jsonPath = folder.Add("example.json", compactJson);
  PrintMemory(kvfPath);

  const FileContent kvfContent = FileContent::Of(kvf);
  const std::unique_ptr<KvfFile> file = ReadKvf(kvfContent);
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
  table.Add("read parameter file", [&] { return ReadKvf(kvfContent); });
  table.Add("read compact JSON", [&] { return ReadJson(compactJson); });
  table.Add("read indented JSON", [&] { return ReadJson(indentedJson); });
  table.Add("read and convert XML", [&] { return ReadXml(xml); });
  table.Add("open parameter file", [&] { return OpenKvf(kvfPath); });
  table.Add("open compact JSON", [&] { return OpenJson(jsonPath); });
  table.Add("open compact JSON in place", [&] { return OpenJsonInPlace(jsonPath); });
  table.Add("write parameter file", [&] { return WriteKvf(*file); });
  table.Add("write indented JSON", [&] { return WriteJson(*json); });
  table.Limit("read parameter file", "read compact JSON", 1.0);
  table.Limit("read parameter file", "read indented JSON", 1.0);
  table.Limit("read parameter file", "read and convert XML", 0.7);
  table.Limit("open parameter file", "open compact JSON", 1.0);
  table.Limit("open parameter file", "open compact JSON in place", 1.0);
  table.Limit("write parameter file", "write indented JSON", 0.8);
  table.Run(argc, argv);
  return 0;
}

}  // namespace

}  // namespace tervane::bench

int main(int argc, char** argv) { return tervane::bench::Run(argc, argv); }
