// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Any bytes into the parser. What parses must come back from its own text as the same tree, and every look-up in it
// must find what a plain walk finds. What does not parse must have a place and one readable line of reason.
#include <algorithm>
#include <bit>
#include <cmath>
#include <cstdint>
#include <string>

#include "core/kvf.h"
#include "core/kvf_parser.h"
#include "core/kvf_writer.h"
#include "fuzz/require.h"
#include "platform/text.h"

namespace tervane {
namespace {

using fuzz::Require;

/// A parsed file, closed at the end of a scope.
struct Parsed {
  explicit Parsed(std::string_view text) : file(kvfCreate()) {
    file->folder = "/setups";
    file->path = "/setups/fuzzed.tvd";
    ok = ParseKvf(FileContent::Of(text), *file);
  }
  ~Parsed() { kvfClose(&file); }
  Parsed(const Parsed&) = delete;
  Parsed& operator=(const Parsed&) = delete;

  KvfFile* file;
  bool ok;
};

bool SameValue(const KvfParam& a, const KvfParam& b) {
  if (a.type != b.type) return false;
  switch (a.type) {
    case KvfType::Int:
      return a.asInt == b.asInt;
    case KvfType::Float:
      return (std::isnan(a.asFloat) && std::isnan(b.asFloat)) ||
             std::bit_cast<std::uint32_t>(a.asFloat) == std::bit_cast<std::uint32_t>(b.asFloat);
    case KvfType::Double:
      return (std::isnan(a.asDouble) && std::isnan(b.asDouble)) ||
             std::bit_cast<std::uint64_t>(a.asDouble) == std::bit_cast<std::uint64_t>(b.asDouble);
    case KvfType::Bool:
      return a.asBool == b.asBool;
    case KvfType::String:
    case KvfType::Filename:
      return a.Text() == b.Text();
  }
  return false;
}

bool SameNodes(const KvfSection& a, const KvfSection& b) {
  const KvfNode* y = b.firstChild;
  for (const KvfNode* x = a.firstChild; x; x = x->next, y = y->next) {
    if (!y || x->kind != y->kind || x->WrittenName() != y->WrittenName() || x->count != y->count) return false;
    if (const KvfSection* section = AsSection(x)) {
      if (!SameNodes(*section, *AsSection(y))) return false;
    } else if (!std::equal(x->params, x->params + x->count, y->params, SameValue)) {
      return false;
    }
  }
  return !y;
}

void ReadKeyword(KvfNode* section, KvfNode* keyword) {
  const std::string_view key = keyword->Name();
  // One more than there are: asking for what is missing must be harmless.
  for (int position = 0; position <= static_cast<int>(std::min(keyword->count, 20u)) + 1; ++position) {
    KvfParam* param = kvfParamByNum(keyword, position);
    Require((param != nullptr) == (position >= 1 && position <= static_cast<int>(keyword->count)),
            "a parameter is found by its position", key);
    kvfGetString(param);
    kvfGetFilename(param);
    kvfGetResultFilename(param);
  }
  char path[kKvfPathBuffer];
  kvfGetResultFilenamePath(kvfParamByNum(keyword, 1), path);
  int whole = 0, other = 0;
  float single = 0;
  double number = 0;
  bool flag = false;
  std::string text;
  kvfGetParam(section, key, &whole, 1, 1);
  kvfGetParam(section, key, &single, 1, 1);
  kvfGetParam(section, key, &number, 1, 1);
  kvfGetParam(section, key, &flag, 1, 1);
  kvfGetParam(section, key, &text, 1, 1);
  kvfGetParamFilename(section, key, &text, 1, 1);
  kvfGetListParam(section, key, 1, "sii", &text, &whole, &other);
}

void LookUp(KvfSection& section) {
  int number = 0, keywords = 0;
  for (KvfNode* node = section.firstChild; node; node = node->next) {
    Require(kvfNodeByNum(&section, ++number) == node, "a node is found by its number", node->Name());
    Require(std::string_view(kvfGetName(node)) == node->Name(), "a name is a C string");
    const bool isKeyword = node->IsKeyword();
    int instance = 1;
    for (const KvfNode* before = section.firstChild; before != node; before = before->next)
      if (before->IsKeyword() == isKeyword && before->Name() == node->Name()) ++instance;
    const KvfNode* found = isKeyword ? kvfKeywordByNameNum(&section, node->Name(), instance)
                                     : kvfSectionByNameNum(&section, node->Name(), instance);
    Require(found == node, "a node is found by its name and instance", node->Name());
    if (isKeyword) {
      Require(kvfKeywordByNum(&section, ++keywords) == node, "a keyword is found by its number", node->Name());
      ReadKeyword(&section, node);
    } else {
      LookUp(*AsSection(node));
    }
  }
  Require(kvfGetNoNodes(&section) == number && !kvfNodeByNum(&section, number + 1), "the nodes are counted");
  Require(!kvfKeywordByNum(&section, keywords + 1), "the keywords are counted");
}

void CheckSyntaxError(const KvfSyntaxError& error) {
  Require(error.line >= 1 && error.column >= 1, "a syntax error has a place", error.message);
  Require(!error.message.empty() && !FirstInvalidUtf8(error.message), "a message is UTF-8 text", error.message);
  Require(std::none_of(error.message.begin(), error.message.end(),
                       [](char c) { return static_cast<unsigned char>(c) < 0x20; }),
          "a message is one line without control characters", error.message);
}

void Check(std::string_view input) {
  const Parsed first(input);
  if (!first.ok) return CheckSyntaxError(first.file->syntaxError);
  std::string text, error;
  Require(WriteKvfText(*first.file, text, error), "what was read can be written", error);

  const Parsed second(text);
  Require(second.ok, "what was written can be read", second.file->syntaxError.message);
  Require(SameNodes(first.file->top, second.file->top), "the tree comes back from its text", text);
  std::string again;
  Require(WriteKvfText(*second.file, again, error), "what was read can be written", error);
  Require(text == again, "the text is the same the second time", again);

  for (const KvfUnread& unread : CollectUnread(*first.file))
    Require(!FirstInvalidUtf8(unread.text) && !FirstInvalidUtf8(unread.path), "a report is UTF-8 text", unread.text);
  LookUp(first.file->top);
  CollectNotes(*first.file);
  CollectUnread(*first.file);
}

}  // namespace
}  // namespace tervane

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  tervane::Check({reinterpret_cast<const char*>(data), size});
  return 0;
}
