// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Between the text of a library and its entries.
#include <algorithm>
#include <cmath>
#include <limits>
#include <span>

#include <fmt/format.h>

#include "core/kvf_parser.h"
#include "core/kvf_writer.h"
#include "libraries/kept_text.h"
#include "libraries/library.h"
#include "platform/text.h"

namespace tervane {

namespace {

class LibraryReader {
 public:
  LibraryReader(const KvfFile& file, Library& library) : file_(file), library_(library), kind_(*library.kind) {}

  /// False when there is no target of the kind.
  bool Read() {
    library_.header = file_.header;
    bool isFound = false;
    for (const KvfNode* node = file_.top.firstChild; node; node = node->next) {
      const KvfSection* target = AsSection(node);
      if (isFound || !target || target->Name() != kind_.target) {
        kept_.Keep(*node, kTop);
        continue;
      }
      isFound = true;
      library_.beforeTarget = kept_.Take() + IndentedLines(kTop, kept_.CommentsUntil(static_cast<int>(target->line)));
      ReadTarget(*target);
      (kind_.section.empty() ? library_.atEnd : library_.behindSection) += kept_.Take();
      // Behind the last of all nothing tells where a comment stands.
      if (!target->next) library_.atEnd += IndentedLines(kInTarget, kept_.CommentsUntil(KeptText::kEndOfFile));
    }
    library_.behindTarget = kept_.Take() + IndentedLines(kTop, kept_.CommentsUntil(KeptText::kEndOfFile));
    return isFound;
  }

 private:
  bool IsEntry(const KvfNode& node) const {
    return !node.IsKeyword() && IsNumberedName(node.Name(), kind_.sectionPattern);
  }

  void ReadTarget(const KvfSection& target) {
    if (kind_.section.empty()) return ReadEntries(target, kInTarget);
    bool isFound = false;
    for (const KvfNode* node = target.firstChild; node; node = node->next) {
      const KvfSection* section = AsSection(node);
      if (isFound || !section || section->Name() != kind_.section) {
        kept_.Keep(*node, kInTarget);
        continue;
      }
      isFound = true;
      kept_.KeepCommentsUntil(static_cast<int>(section->line), kInTarget);
      library_.beforeSection = kept_.Take();
      ReadEntries(*section, kInSection);
      library_.atEnd = kept_.Take();
    }
    library_.behindSection = kept_.Take();
  }

  void ReadEntries(const KvfSection& parent, int level) {
    level_ = level;
    library_.entries.reserve(parent.count);
    for (const KvfNode* node = parent.firstChild; node; node = node->next) {
      if (IsEntry(*node))
        ReadEntry(*AsSection(node));
      else if (!IsCount(*node, kind_.countKey))
        kept_.Keep(*node, level);
    }
  }

  static bool IsCount(const KvfNode& node, std::string_view key) {
    return !key.empty() && node.IsKeyword() && node.Name() == key;
  }

  void ReadEntry(const KvfSection& section) {
    LibraryEntry& entry = library_.entries.emplace_back(library_.NewEntry({}));
    for (LibraryText& field : entry.fields) field = {};
    entry.line = static_cast<int>(section.line);
    TakeContext(section, entry.context);
    entry.rows.reserve(section.count);
    for (const KvfNode* node = section.firstChild; node; node = node->next) {
      const bool isTaken = node->IsKeyword()
                               ? IsCount(*node, kind_.rowCountKey) || ReadField(*node, entry) || ReadRow(*node, entry)
                               : ReadRowSection(*AsSection(node), entry);
      if (!isTaken) kept_.Keep(*node, level_ + 1);
    }
    entry.atEnd = kept_.Take();
  }

  bool ReadField(const KvfNode& keyword, LibraryEntry& entry) {
    const auto found = std::ranges::find(kind_.fields, keyword.Name(), &LibraryField::key);
    if (found == kind_.fields.end()) return false;
    const auto number = static_cast<std::size_t>(found - kind_.fields.begin());
    LibraryText& field = entry.fields[number];
    if (field.isThere) return Refuse(keyword, "it is there twice; the first is used");
    if (!found->models.empty()) return ReadNumbers(keyword, number, field);
    if (keyword.count != 1 || keyword.params[0].type != KvfType::String)
      return RefuseField(keyword, number, "one text in quotes was expected");
    field.text = keyword.params[0].Text();
    field.isThere = true;
    TakeContext(keyword, field.context);
    return true;
  }

  /// Whether a keyword has a number for each column from that value on.
  static bool HasNumbers(const KvfNode& keyword, std::uint32_t first, std::size_t count) {
    return keyword.count >= first + count &&
           std::all_of(keyword.params + first, keyword.params + first + count, IsKvfNumber);
  }
  static std::string NumbersExpected(std::span<const LibraryColumn> columns) {
    std::string heads;
    for (const LibraryColumn& column : columns) heads += fmt::format("{}{}", heads.empty() ? "" : ", ", column.head);
    return columns.size() == 1 ? fmt::format("a number was expected: {}", heads)
                               : fmt::format("{} numbers were expected: {}", columns.size(), heads);
  }

  /// A model's name and its parameters, or numbers alone.
  bool ReadNumbers(const KvfNode& keyword, std::size_t number, LibraryText& field) {
    const LibraryField& declared = kind_.fields[number];
    const bool isNamed = !declared.models.front().name.empty();
    const bool hasName = keyword.count > 0 && keyword.params[0].type == KvfType::String;
    const LibraryModel* model = ModelOf(declared, isNamed && hasName ? keyword.params[0].Text() : std::string_view());
    if (!model) {
      std::string names;
      for (const LibraryModel& known : declared.models)
        names += fmt::format("{}\"{}\"", names.empty() ? "" : ", ", known.name);
      return RefuseField(keyword, number,
                         fmt::format("a model and its parameters were expected; models are {}", names));
    }
    const std::uint32_t first = isNamed ? 1 : 0;
    const std::size_t count = model->parameters.size();
    if (!HasNumbers(keyword, first, count)) return RefuseField(keyword, number, NumbersExpected(model->parameters));
    field.text = model->name;
    field.isThere = true;
    for (std::size_t i = first; i < first + count; ++i) field.numbers.emplace_back(KvfNumber(keyword.params[i]));
    for (std::size_t i = first + count; i < keyword.count; ++i) field.more += ", " + KvfValueText(keyword.params[i]);
    TakeContext(keyword, field.context);
    return true;
  }

  bool IsRowSection(const KvfSection& section) const {
    return kind_.HasRowSections() && IsNumberedName(section.Name(), kind_.rowKey);
  }

  bool ReadRowSection(const KvfSection& section, LibraryEntry& entry) {
    if (!IsRowSection(section)) return false;
    LibraryRow& row = entry.rows.emplace_back();
    row.line = static_cast<int>(section.line);
    row.values.fill(std::numeric_limits<double>::quiet_NaN());
    TakeContext(section, row.context);
    for (const KvfNode* node = section.firstChild; node; node = node->next)
      if (!ReadPartOfRow(*node, row)) kept_.Keep(*node, level_ + 2);
    kept_.KeepCommentsUntil(KeptText::LastLineOf(section) + 1, level_ + 2);
    row.more = kept_.Take();
    return true;
  }

  bool ReadPartOfRow(const KvfNode& node, LibraryRow& row) {
    if (!node.IsKeyword()) return false;
    if (!kind_.rowFile.key.empty() && node.Name() == kind_.rowFile.key) {
      const bool isFile = node.count >= 1 && node.params[0].IsText();
      if (!isFile || (node.count > 1 && node.params[1].type != KvfType::Int))
        return Refuse(node, "a file and the number of an item were expected");
      row.file = node.params[0].Text();
      if (node.count > 1) row.item = node.params[1].asInt;
      return true;
    }
    const auto column = std::ranges::find(kind_.columns, node.Name(), &LibraryColumn::key);
    if (column == kind_.columns.end()) return false;
    if (!HasNumbers(node, 0, 1)) return Refuse(node, "a number was expected");
    row.values[static_cast<std::size_t>(column - kind_.columns.begin())] = KvfNumber(node.params[0]);
    return true;
  }

  bool ReadRow(const KvfNode& keyword, LibraryEntry& entry) {
    if (keyword.Name() != kind_.rowKey) return false;
    const std::size_t count = kind_.columns.size();
    if (!HasNumbers(keyword, 0, count)) return Refuse(keyword, NumbersExpected(kind_.columns));
    LibraryRow& row = entry.rows.emplace_back();
    row.line = static_cast<int>(keyword.line);
    for (std::size_t i = 0; i < count; ++i) row.values[i] = KvfNumber(keyword.params[i]);
    for (std::size_t i = count; i < keyword.count; ++i) row.more += ", " + KvfValueText(keyword.params[i]);
    TakeContext(keyword, row.context);
    return true;
  }

  /// Tells of what cannot be taken; it is kept as it stands.
  bool Refuse(const KvfNode& keyword, std::string_view why) {
    library_.entries.back().refused.push_back(
        {static_cast<int>(keyword.line), fmt::format("{} = {}: {}", keyword.Name(), KvfValuesText(keyword), why)});
    return false;
  }

  /// The same of a field, which is left without.
  bool RefuseField(const KvfNode& keyword, std::size_t field, std::string_view why) {
    Refuse(keyword, why);
    library_.entries.back().refused.back().field = field;
    library_.entries.back().refused.back().kept = KvfNodeText(keyword, level_ + 1);
    return false;
  }

  void TakeContext(const KvfNode& node, LibraryContext& context) {
    const int line = static_cast<int>(node.line);
    if (std::string others = kept_.Take(); !others.empty()) context.others = std::move(others);
    context.comment = kept_.CommentsUntil(line);
    context.behind = kept_.CommentOn(line);
  }

  const KvfFile& file_;
  Library& library_;
  const LibraryKind& kind_;
  KeptText kept_{file_};
  int level_ = kInTarget;  ///< Of the sections of entries.
};

// ---- Writing

std::string NumberValue(const LibraryColumn& column, double value) {
  KvfParam param;
  // What is no whole number stays what it is: its finding says so.
  if (column.isWhole && value == std::floor(value) && std::abs(value) < 2e9) {
    param.asInt = static_cast<std::int32_t>(value);
  } else {
    param.type = KvfType::Double;
    param.asDouble = value;
  }
  return KvfValueText(param);
}

void AppendLine(std::string& text, int level, const std::string& line, const LibraryContext& context) {
  text += context.others + IndentedLines(level, context.comment);
  text += IndentedLine(level, line);
  if (!context.behind.empty()) text += "  " + context.behind;
  text += '\n';
}

std::string FieldValue(const LibraryField& declared, const LibraryText& field) {
  const LibraryModel* model = ModelOf(declared, field.text);
  if (!model) return KvfTextValue(field.text);
  std::string value = model->name.empty() ? std::string() : KvfTextValue(field.text);
  for (std::size_t i = 0; i < field.numbers.size(); ++i)
    value += (value.empty() ? "" : ", ") + NumberValue(model->parameters[i], field.numbers[i]);
  return value + field.more;
}

void AppendRowSection(std::string& text, const LibraryKind& kind, const LibraryRow& row, std::size_t number,
                      int level) {
  AppendLine(text, level, fmt::format("section {} {{", NumberedName(kind.rowKey, number)), row.context);
  for (std::size_t i = 0; i < kind.columns.size(); ++i)
    if (!std::isnan(row.values[i]))
      text += IndentedLine(level + 1,
                           fmt::format("{} = {}\n", kind.columns[i].key, NumberValue(kind.columns[i], row.values[i])));
  if (!row.file.empty()) {
    KvfParam file;
    file.type = KvfType::Filename;
    file.text = row.file.data();
    file.length = static_cast<std::uint32_t>(row.file.size());
    text += IndentedLine(level + 1, fmt::format("{} = {}, {}\n", kind.rowFile.key, KvfValueText(file), row.item));
  }
  text += row.more + IndentedLine(level, "}\n");
}

void AppendEntry(std::string& text, const LibraryKind& kind, const LibraryEntry& entry, std::size_t number, int level) {
  AppendLine(text, level, fmt::format("section {} {{", NumberedName(kind.sectionPattern, number)), entry.context);
  for (std::size_t i = 0; i < kind.fields.size(); ++i) {
    const LibraryText& field = entry.fields[i];
    if (field.isThere || !field.text.empty())
      AppendLine(text, level + 1, fmt::format("{} = {}", kind.fields[i].key, FieldValue(kind.fields[i], field)),
                 field.context);
  }
  if (!kind.rowCountKey.empty())
    text += IndentedLine(level + 1, fmt::format("{} = {}\n", kind.rowCountKey, entry.rows.size()));
  std::size_t place = 0;
  for (const LibraryRow& row : entry.rows) {
    ++place;
    if (kind.HasRowSections()) {
      AppendRowSection(text, kind, row, place, level + 1);
      continue;
    }
    std::string line = fmt::format("{} = ", kind.rowKey);
    for (std::size_t i = 0; i < kind.columns.size(); ++i)
      line += (i > 0 ? ", " : "") + NumberValue(kind.columns[i], row.values[i]);
    AppendLine(text, level + 1, line + row.more, row.context);
  }
  text += entry.atEnd + IndentedLine(level, "}\n");
}

}  // namespace

std::string ParseLibrary(const FileContent& text, const std::string& path, Library& library) {
  library = Library(*library.kind);
  KvfFile file;
  file.path = path;
  if (!ParseKvf(text, file)) return fmt::format("{}:{}", path, file.syntaxError.message);
  LibraryReader reader(file, library);
  if (reader.Read()) return {};
  library = Library(*library.kind);
  return fmt::format("{} is no {}: it has no target {}", path, library.kind->name, library.kind->target);
}

std::string LibraryFileText(const Library& library, std::string& error) {
  const LibraryKind& kind = *library.kind;
  std::string text = library.header + library.beforeTarget + fmt::format("target {} {{\n", kind.target);
  const int level = kind.section.empty() ? kInTarget : kInSection;
  if (!kind.section.empty())
    text += library.beforeSection + IndentedLine(kInTarget, fmt::format("section {} {{\n", kind.section));
  if (!kind.countKey.empty())
    text += IndentedLine(level, fmt::format("{} = {}\n", kind.countKey, library.entries.size()));
  std::size_t number = 0;
  for (const LibraryEntry& entry : library.entries) AppendEntry(text, kind, entry, ++number, level);
  text += library.atEnd;
  if (!kind.section.empty()) text += IndentedLine(kInTarget, "}\n") + library.behindSection;
  text += "}\n" + library.behindTarget;
  // What a later reading would refuse must not take the place of a good file.
  KvfFile read;
  error.clear();
  if (!ParseKvf(FileContent::Of(text), read)) error = read.syntaxError.message;
  return text;
}

}  // namespace tervane
