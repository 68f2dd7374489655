// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Between the text of a library and its entries.
#include <algorithm>
#include <cmath>

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
      library_.atEnd = kept_.Take();
      // Behind the last of all nothing tells where a comment stands.
      if (!target->next) library_.atEnd += IndentedLines(kInTarget, kept_.CommentsUntil(KeptText::kEndOfFile));
    }
    library_.behindTarget = kept_.Take() + IndentedLines(kTop, kept_.CommentsUntil(KeptText::kEndOfFile));
    return isFound;
  }

 private:
  bool IsEntry(const KvfNode& node) const {
    const std::string_view prefix = kind_.sectionPattern.substr(0, kind_.sectionPattern.find("%d"));
    const std::string_view name = node.Name();
    return !node.IsKeyword() && name.size() > prefix.size() && name.starts_with(prefix) &&
           std::ranges::all_of(name.substr(prefix.size()), [](char c) { return c >= '0' && c <= '9'; });
  }

  void ReadTarget(const KvfSection& target) {
    library_.entries.reserve(target.count);
    for (const KvfNode* node = target.firstChild; node; node = node->next) {
      if (IsEntry(*node))
        ReadEntry(*AsSection(node));
      else
        kept_.Keep(*node, kInTarget);
    }
  }

  void ReadEntry(const KvfSection& section) {
    LibraryEntry& entry = library_.entries.emplace_back(library_.NewEntry({}));
    entry.fields.front().isThere = false;
    entry.line = static_cast<int>(section.line);
    TakeContext(section, entry.context);
    entry.rows.reserve(section.count);
    for (const KvfNode* node = section.firstChild; node; node = node->next)
      if (!node->IsKeyword() || !(ReadField(*node, entry) || ReadRow(*node, entry))) kept_.Keep(*node, kInSection);
    entry.atEnd = kept_.Take();
  }

  bool ReadField(const KvfNode& keyword, LibraryEntry& entry) {
    const auto found = std::ranges::find(kind_.fields, keyword.Name(), &LibraryField::key);
    if (found == kind_.fields.end()) return false;
    LibraryText& field = entry.fields[static_cast<std::size_t>(found - kind_.fields.begin())];
    if (field.isThere) return Refuse(keyword, "it is there twice; the first is used");
    if (keyword.count != 1 || keyword.params[0].type != KvfType::String)
      return Refuse(keyword, "one text in quotes was expected");
    field.text = keyword.params[0].Text();
    field.isThere = true;
    TakeContext(keyword, field.context);
    return true;
  }

  bool ReadRow(const KvfNode& keyword, LibraryEntry& entry) {
    if (keyword.Name() != kind_.rowKey) return false;
    const std::size_t count = kind_.columns.size();
    bool isRow = keyword.count >= count;
    for (std::size_t i = 0; i < count && isRow; ++i) {
      const KvfType type = keyword.params[i].type;
      isRow = type == KvfType::Int || type == KvfType::Double || type == KvfType::Float;
    }
    if (!isRow) {
      std::string heads;
      for (const LibraryColumn& column : kind_.columns)
        heads += fmt::format("{}{}", heads.empty() ? "" : ", ", column.head);
      return Refuse(keyword, fmt::format("{} numbers were expected: {}", count, heads));
    }
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

void AppendEntry(std::string& text, const LibraryKind& kind, const LibraryEntry& entry, std::size_t number) {
  const std::string_view prefix = kind.sectionPattern.substr(0, kind.sectionPattern.find("%d"));
  AppendLine(text, kInTarget, fmt::format("section {}{} {{", prefix, number), entry.context);
  for (std::size_t i = 0; i < kind.fields.size(); ++i) {
    const LibraryText& field = entry.fields[i];
    if (field.isThere || !field.text.empty())
      AppendLine(text, kInSection, fmt::format("{} = {}", kind.fields[i].key, KvfTextValue(field.text)), field.context);
  }
  for (const LibraryRow& row : entry.rows) {
    std::string line = fmt::format("{} = ", kind.rowKey);
    for (std::size_t i = 0; i < kind.columns.size(); ++i)
      line += (i > 0 ? ", " : "") + NumberValue(kind.columns[i], row.values[i]);
    AppendLine(text, kInSection, line + row.more, row.context);
  }
  text += entry.atEnd + IndentedLine(kInTarget, "}\n");
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
  std::size_t number = 0;
  for (const LibraryEntry& entry : library.entries) AppendEntry(text, kind, entry, ++number);
  text += library.atEnd + "}\n" + library.behindTarget;
  // What a later reading would refuse must not take the place of a good file.
  KvfFile read;
  error.clear();
  if (!ParseKvf(FileContent::Of(text), read)) error = read.syntaxError.message;
  return text;
}

}  // namespace tervane
