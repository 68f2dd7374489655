// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <charconv>

#include <fmt/format.h>

#include "platform/files.h"
#include "platform/text.h"
#include "platform/text_fields.h"
#include "results/detailed_series.h"

namespace tervane {

namespace {

using ImportFields = std::vector<std::string_view>;

/// Empty fields disappear.
ImportFields ImportFieldsOf(std::string_view line) {
  ImportFields fields;
  while (!line.empty()) {
    const std::size_t end = line.find('\t');
    if (const std::string_view field = line.substr(0, end); !field.empty()) fields.push_back(field);
    line = end == std::string_view::npos ? std::string_view() : line.substr(end + 1);
  }
  return fields;
}

template <class Number>
bool ReadImportedNumber(std::string_view field, Number& number) {
  const std::string_view text = Trimmed(field);
  const auto result = std::from_chars(text.data(), text.data() + text.size(), number);
  return result.ec == std::errc() && result.ptr == text.data() + text.size();
}

/// Gives the member of a declared key the value of a field; false where it is no number.
bool TakeField(const KeyInfo& key, std::string_view field) {
  // The node that declared it is the caller's to change.
  void* member = const_cast<void*>(key.member);
  if (key.type == "string") {
    *static_cast<std::string*>(member) = field;
    return true;
  }
  if (key.type == "int") return ReadImportedNumber(field, *static_cast<int*>(member));
  if (key.type == "float") return ReadImportedNumber(field, *static_cast<float*>(member));
  return ReadImportedNumber(field, *static_cast<double*>(member));
}

/// Why a line gives no point; empty where the item has taken it.
std::string TakeImportLine(DetailedSeriesItem& item, std::string_view line, const std::string& setupFolder) {
  // A setup could not be saved with it.
  if (FirstInvalidUtf8(line)) return "it is no text in UTF-8: save the file in that form";
  std::vector<KeyInfo> keys;
  item.DescribeKeys(keys);
  const ImportFields fields = ImportFieldsOf(line);
  if (fields.size() < keys.size() + 2) return fmt::format("{} column{}", fields.size(), fields.size() == 1 ? "" : "s");
  for (std::size_t i = 0; i < keys.size(); ++i)
    if (!TakeField(keys[i], fields[i])) return fmt::format("{} is no number: {}", fields[i], keys[i].key);
  item.InclObserved = item.InclObserved == 1 ? 1 : 0;
  int number = 0;
  const std::string_view file = fields[keys.size()];
  if (!ReadImportedNumber(fields[keys.size() + 1], number))
    return fmt::format("{} is no number: the item of the file", fields[keys.size() + 1]);
  item.Observed().File = FileName(fmt::format("{}.nds0", file), setupFolder);
  item.Observed().Items = {number};
  return {};
}

}  // namespace

DetailedImport ImportDetailedPoints(CYbSEKvfListBaseInterface& list, const std::string& path,
                                    const std::string& setupFolder, std::string_view format) {
  FileContent content;
  if (const FileResult read = ReadWholeFile(path, content); !read.Ok()) return {0, 0, read.error};
  return ImportDetailedText(list, content.Text(), path, setupFolder, format);
}

DetailedImport ImportDetailedText(CYbSEKvfListBaseInterface& list, std::string_view text, const std::string& path,
                                  const std::string& setupFolder, std::string_view format) {
  if (const std::string why = WhyNoText(text); !why.empty())
    return {0, 0, fmt::format("{}\n\n{}: {}", format, path, why)};
  DetailedImport outcome;
  LineReader lines(text);
  for (std::string_view line; lines.Next(line);) {
    list.AddItemNode();
    auto& item = static_cast<DetailedSeriesItem&>(*list.GetItemNode(list.GetItemCount()));
    const std::string why = TakeImportLine(item, line, setupFolder);
    if (!why.empty()) {
      list.DeleteItem(list.GetItemCount(), 1);
      outcome.result = 0;
      outcome.message = fmt::format("{}\n\n{}, line {}: {}", format, path, lines.Number(), why);
      return outcome;
    }
    ++outcome.added;
  }
  return outcome;
}

}  // namespace tervane
