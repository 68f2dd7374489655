// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "libraries/library.h"

#include <algorithm>
#include <cmath>
#include <unordered_map>

#include <fmt/format.h>

#include "core/file_name.h"
#include "platform/file_cache.h"
#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

namespace {

/// The first words of a name, for messages that list what a library has.
constexpr std::size_t kMostNames = 8;

std::string Quoted(std::string_view text) { return fmt::format("\"{}\"", text); }

std::string Capital(std::string_view word) {
  std::string text(word);
  if (!text.empty() && text[0] >= 'a' && text[0] <= 'z') text[0] = static_cast<char>(text[0] - 'a' + 'A');
  return text;
}

/// The findings of one entry but those of its name.
void CheckRows(const LibraryKind& kind, const LibraryEntry& entry, std::size_t place,
               std::vector<LibraryFinding>& findings) {
  const auto add = [&](std::optional<std::size_t> row, std::string text) {
    const int line = row && entry.rows[*row].line ? entry.rows[*row].line : entry.line;
    findings.push_back({Severity::Error, line, place, row, std::move(text)});
  };
  for (const LibraryRefusal& refusal : entry.refused)
    findings.push_back({Severity::Error, refusal.line, place, {}, refusal.text});
  const std::size_t before = findings.size();
  for (std::size_t i = 0; i < kind.fields.size(); ++i) {
    const LibraryField& field = kind.fields[i];
    const LibraryModel* model = ModelOf(field, entry.fields[i].text);
    if (!field.models.empty() && entry.fields[i].numbers.empty())
      add({}, fmt::format("{} is missing", field.key));
    else if (model)
      for (std::size_t parameter = 0; parameter < model->parameters.size(); ++parameter)
        if (std::string fault = WhyWrong(model->parameters[parameter], entry.Number(i, parameter)); !fault.empty())
          add({}, std::move(fault));
  }
  if (kind.whyWrongFields && findings.size() == before)
    if (std::string fault = kind.whyWrongFields(entry); !fault.empty()) add({}, std::move(fault));
  if (kind.HasRows() && !kind.HasRowSections() && entry.rows.empty())
    add({}, fmt::format("it has no {}", kind.rowNames));
  for (std::size_t i = 0; i < entry.rows.size(); ++i) {
    const LibraryRow& row = entry.rows[i];
    for (std::size_t column = 0; column < kind.columns.size(); ++column)
      if (std::string fault = WhyWrong(kind.columns[column], row.values[column]); !fault.empty())
        add(i, std::move(fault));
    if (kind.whyWrongRow)
      if (std::string fault = kind.whyWrongRow(entry, row); !fault.empty()) add(i, std::move(fault));
    if (!kind.HasRowSections() && i > 0 && row.values[0] < entry.rows[i - 1].values[0])
      add(i, fmt::format("{} {} stands behind {}", kind.columns[0].head, ShortestNumber(row.values[0]),
                         ShortestNumber(entry.rows[i - 1].values[0])));
  }
}

}  // namespace

bool LibraryRow::operator==(const LibraryRow& other) const {
  const auto isSame = [](double a, double b) { return a == b || (std::isnan(a) && std::isnan(b)); };
  return std::ranges::equal(values, other.values, isSame) && more == other.more && context == other.context &&
         line == other.line && file == other.file && item == other.item;
}

void LibraryEntry::DeleteRow(std::size_t row) {
  const std::string kept = std::move(rows[row].context.others);
  rows.erase(rows.begin() + static_cast<std::ptrdiff_t>(row));
  std::string& next = row < rows.size() ? rows[row].context.others : atEnd;
  next = kept + next;
}

void LibraryEntry::SetRefusedAside() {
  std::vector<std::string*> places{&atEnd};
  for (LibraryText& field : fields) places.push_back(&field.context.others);
  for (LibraryRow& row : rows) places.push_back(&row.context.others);
  std::erase_if(refused, [&](const LibraryRefusal& refusal) {
    if (refusal.kept.empty() || (!fields[refusal.field].isThere && fields[refusal.field].text.empty())) return false;
    for (std::string* place : places) {
      const std::size_t at = place->find(refusal.kept);
      if (at == std::string::npos) continue;
      place->insert(at + refusal.kept.find_first_not_of(' '), "# ");
      return true;
    }
    return false;
  });
}

LibraryEntry Library::NewEntry(std::string name) const {
  LibraryEntry entry;
  entry.fields.resize(kind->fields.size());
  entry.fields.front().text = std::move(name);
  entry.fields.front().isThere = true;
  for (std::size_t i = 0; i < kind->fields.size(); ++i)
    if (const LibraryField& field = kind->fields[i]; !field.models.empty())
      ChooseModel(field.models.front(), entry.fields[i]);
  return entry;
}

std::optional<std::size_t> Library::Find(std::string_view name) const {
  const auto found = std::ranges::find(entries, name, &LibraryEntry::Name);
  if (found == entries.end()) return std::nullopt;
  return static_cast<std::size_t>(found - entries.begin());
}

std::string Library::FreeName(const std::string& wanted) const {
  std::string name = wanted;
  for (int number = 2; Find(name); ++number) name = fmt::format("{} {}", wanted, number);
  return name;
}

void Library::DeleteEntry(std::size_t entry) {
  const std::string kept = std::move(entries[entry].context.others);
  entries.erase(entries.begin() + static_cast<std::ptrdiff_t>(entry));
  std::string& next = entry < entries.size() ? entries[entry].context.others : atEnd;
  next = kept + next;
}

std::string ReadLibrary(const std::string& path, Library& library) {
  FileContent content;
  if (const FileResult result = ReadWholeFile(path, content); !result.Ok()) return result.error;
  std::string problem = ParseLibrary(content, path, library);
  library.folder = FolderOf(path);
  return problem;
}

FileResult WriteLibrary(const std::string& path, const Library& library) {
  std::string error;
  Library rebased = library;
  const std::string folder(FolderOf(path));
  for (LibraryEntry& entry : rebased.entries)
    for (LibraryRow& row : entry.rows) row.file = FileName(row.file, library.folder).TextIn(folder);
  const std::string text = LibraryFileText(rebased, error);
  if (!error.empty()) return {fmt::format("cannot write {}: {}; the file is unchanged", path, error), {}};
  return WriteFileAtomically(path, text);
}

std::shared_ptr<const LibraryReading> ReadLibraryOnce(const LibraryKind& kind, const std::string& path) {
  static FileCache<LibraryReading> cache(kMostFacts);
  return cache.Get(path, std::string(kind.target), [&] {
    LibraryReading reading{Library(kind), {}, {}};
    reading.problem = ReadLibrary(path, reading.library);
    reading.findings = FindingsOf(reading.library);
    return reading;
  });
}

const LibraryModel* ModelOf(const LibraryField& field, std::string_view name) {
  const auto found = std::ranges::find(field.models, name, &LibraryModel::name);
  return found == field.models.end() ? nullptr : &*found;
}

void ChooseModel(const LibraryModel& model, LibraryText& text) {
  text.text = model.name;
  text.isThere = true;
  text.more.clear();
  text.numbers.clear();
  for (const LibraryColumn& parameter : model.parameters) text.numbers.emplace_back(parameter.initial);
}

std::string WhyWrong(const LibraryColumn& column, double value) {
  const std::string unit = column.unit.empty() ? std::string() : fmt::format(" {}", column.unit);
  std::string expected = fmt::format("a {}number ", column.isWhole ? "whole " : "");
  const bool hasMost = column.most < std::numeric_limits<double>::max();
  if (column.isLeastOutside)
    expected += fmt::format("above {}{}{}", ShortestNumber(column.least),
                            hasMost ? " and up to " + ShortestNumber(column.most) : std::string(), unit);
  else
    expected += hasMost
                    ? fmt::format("from {} to {}{}", ShortestNumber(column.least), ShortestNumber(column.most), unit)
                    : fmt::format("from {}{} on", ShortestNumber(column.least), unit);
  const bool isInside = (column.isLeastOutside ? value > column.least : value >= column.least) && value <= column.most;
  const bool isGood = isInside && (!column.isWhole || value == std::floor(value));
  if (isGood) return {};
  const std::string shown = std::isnan(value) ? std::string("missing") : ShortestNumber(value);
  return fmt::format("{} is {}, {} was expected", column.head, shown, expected);
}

std::string FirstFault(const LibraryKind& kind, const LibraryEntry& entry) {
  std::vector<LibraryFinding> findings;
  CheckRows(kind, entry, 0, findings);
  return findings.empty() ? std::string() : findings.front().text;
}

std::vector<LibraryFinding> FindingsOf(const Library& library) {
  const LibraryKind& kind = *library.kind;
  std::vector<LibraryFinding> findings;
  if (library.entries.empty())
    findings.push_back({Severity::Warning, 0, {}, {}, fmt::format("the library has no {}", kind.entryNames)});
  std::unordered_map<std::string_view, std::size_t> firsts;
  for (std::size_t place = 0; place < library.entries.size(); ++place) {
    const LibraryEntry& entry = library.entries[place];
    const auto add = [&](std::string text) {
      findings.push_back({Severity::Error, entry.line, place, {}, std::move(text)});
    };
    if (entry.Name().empty())
      add("it has no name");
    else if (const auto [first, isNew] = firsts.try_emplace(entry.Name(), place); !isNew)
      add(fmt::format("the {} {} has the same name; the first is used", kind.entryName, first->second + 1));
    CheckRows(kind, entry, place, findings);
  }
  return findings;
}

std::string FindingText(const std::string& path, const Library& library, const LibraryFinding& finding) {
  std::string text = path;
  if (finding.line > 0) text += fmt::format(":{}", finding.line);
  text += ": ";
  if (finding.entry && *finding.entry < library.entries.size()) {
    const std::string& name = library.entries[*finding.entry].Name();
    text += fmt::format("{} {}", Capital(library.kind->entryName),
                        name.empty() ? std::to_string(*finding.entry + 1) : Quoted(name));
    if (finding.row) text += fmt::format(", {} {}", library.kind->rowName, *finding.row + 1);
    text += ": ";
  }
  return text + finding.text;
}

std::string WhyNoEntry(const std::string& path, const Library& library, std::string_view name) {
  const LibraryKind& kind = *library.kind;
  const auto place = library.Find(name);
  if (!place) {
    std::string has;
    for (std::size_t i = 0; i < std::min(library.entries.size(), kMostNames); ++i)
      has += (i > 0 ? ", " : "") + library.entries[i].Name();
    if (library.entries.size() > kMostNames) has += fmt::format(" and {} more", library.entries.size() - kMostNames);
    return fmt::format("{} has no {} {}; it has {}", path, kind.entryName, Quoted(name), has.empty() ? "none" : has);
  }
  std::vector<LibraryFinding> findings;
  CheckRows(kind, library.entries[*place], *place, findings);
  return findings.empty() ? std::string() : FindingText(path, library, findings.front());
}

}  // namespace tervane
