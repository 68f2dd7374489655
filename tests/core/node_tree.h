// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Small trees of nodes, and the road between them and a text.
#pragma once

#include <functional>
#include <string>
#include <string_view>
#include <vector>

#include "core/kvf_parser.h"
#include "core/kvf_writer.h"
#include "core/node.h"
#include "platform/text.h"

namespace tervane::test {

class Root : public CYbSEKvfGlobalBase {
 public:
  Root() : CYbSEKvfGlobalBase("T") {}

  int WritesUsedFlags = 0;
  int Version = -1;

  int WriteUsedFlags() override { return WritesUsedFlags; }
  int ReadDocVersion() const override { return Version; }
};

/// A node with one key, over any base.
template <class Base>
class ValueNodeOn : public Base {
 public:
  explicit ValueNodeOn(CYbSEKvfBase* parent) : Base(parent) {}
  ValueNodeOn(std::string section, CYbSEKvfBase* parent) : Base("Title of " + section, section, parent) {}

  int Value = 7;
  int Used = 1;
  int DataIsValid = 1;  ///< What `ValidateData` gives.
  std::vector<Finding> Finds;

  int IsDlgUsedInSetup() override { return Used; }
  int ValidateData() override {
    for (const Finding& finding : Finds)
      finding.severity == Severity::Error ? this->AddError(finding.text, finding.key)
                                          : this->AddWarning(finding.text, finding.key);
    return DataIsValid;
  }

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys("Value", Value); }
};
using ValueNode = ValueNodeOn<CYbSEKvfBase>;
using ValueGroup = ValueNodeOn<CYbSEKvfGroupBase>;

/// What the tree would write, without the target's lines, on one line: a `;` ends each key.
inline std::string Saved(CYbSEKvfGlobalBase& root) {
  KvfFile* file = kvfCreate();
  root.Save(file);
  std::string text, error, saved;
  WriteKvfText(*file, text, error);
  kvfClose(&file);
  for (std::size_t start = text.find('\n') + 1, end; (end = text.find('\n', start)) + 1 < text.size();
       start = end + 1) {
    const std::string_view line = Trimmed(std::string_view(text).substr(start, end - start));
    saved += (saved.empty() ? "" : " ") + std::string(line) + (line.ends_with('{') || line == "}" ? "" : ";");
  }
  return saved;
}

/// Loads the content of the root's target, written as `Saved` gives it; gives the notes as "section/section:Key: text".
inline std::vector<std::string> LoadText(CYbSEKvfGlobalBase& root, const std::string& content) {
  KvfFile* file = kvfCreate();
  const std::string lines = Replaced(Replaced(content, "}", "\n}\n"), ";", "\n");
  file->folder = "/data";
  std::vector<std::string> notes;
  if (ParseKvf(FileContent::Of("target " + root.GetTargetName() + " {\n" + lines + "\n}"), *file)) {
    root.Load(&file->top);
    for (const KvfPlacedNote& note : CollectNotes(*file))
      notes.push_back(note.path + ":" + note.key + ": " + note.text);
  } else {
    notes.push_back(file->syntaxError.message);
  }
  kvfClose(&file);
  return notes;
}

inline std::vector<std::string> SectionNames(const CYbSEKvfBase& parent) {
  std::vector<std::string> names;
  for (CYbSEKvfBase* child = parent.GetFirstChild(); child; child = parent.GetNextChild(child))
    names.push_back(child->FormattedSectionName());
  return names;
}

}  // namespace tervane::test
