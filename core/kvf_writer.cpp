// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/kvf_writer.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cstring>
#include <type_traits>

#include <fmt/format.h>

#include "core/kvf_chars.h"
#include "platform/os.h"
#include "platform/text.h"

namespace tervane {

namespace {

/// Composes text in a small buffer that stays in the processor's cache, and appends it to a string piece by piece.
class TextWriter {
 public:
  explicit TextWriter(std::string& text) : text_(text) {}
  ~TextWriter() { Flush(); }
  TextWriter(const TextWriter&) = delete;
  TextWriter& operator=(const TextWriter&) = delete;

  void Put(char c) {
    if (out_ == buffer_.data() + buffer_.size()) Flush();
    *out_++ = c;
  }
  void Put(std::string_view piece) {
    char* place = Room(piece.size());
    if (!place) {
      text_ += piece;
      return;
    }
    std::memcpy(place, piece.data(), piece.size());
    out_ = place + piece.size();
  }
  template <std::size_t size>
  void Put(const char (&literal)[size]) {
    // The compiler knows the size and calls nobody.
    std::memcpy(Room(size), literal, size);
    out_ += size - 1;
  }
  void PutBlanks(std::size_t count) {
    constexpr std::string_view blanks = "                                ";
    for (; count > blanks.size(); count -= blanks.size()) Put(blanks);
    std::memcpy(Room(blanks.size()), blanks.data(), blanks.size());
    out_ += count;
  }
  /// A piece of at most `most` bytes, which `write(place)` writes; it gives the end.
  template <class Write>
  void PutWith(std::size_t most, const Write& write) {
    out_ = write(Room(most));
  }

  void Quoted(std::string_view value);
  void Name(const KvfNode& node);
  void Value(const KvfParam& param);
  void Values(const KvfNode& keyword);
  void Nodes(const KvfSection& section, std::size_t indent);

  /// Whether all texts so far were UTF-8.
  bool IsUtf8() const { return isUtf8_; }

 private:
  /// A text of any length that may hold any character.
  void AppendEscaped(std::string_view value);

  /// The place of the next bytes in the buffer, null (and the buffer empty) when they are more than it holds.
  char* Room(std::size_t size) {
    if (size > static_cast<std::size_t>(buffer_.data() + buffer_.size() - out_)) Flush();
    return size <= buffer_.size() ? out_ : nullptr;
  }
  void Flush() {
    text_.append(buffer_.data(), out_);
    out_ = buffer_.data();
  }

  std::string& text_;
  std::array<char, 4096> buffer_;
  char* out_ = buffer_.data();
  bool isUtf8_ = true;
};

void TextWriter::Quoted(std::string_view value) {
  // Nearly all texts are short and plain: they are copied as they are, then looked at in their new place. The quotes
  // behind end the look.
  constexpr std::size_t quotes = 8;
  if (char* place = Room(1 + value.size() + quotes)) {
    *place++ = '"';
    std::copy(value.begin(), value.end(), place);
    std::memset(place + value.size(), '"', quotes);
    std::size_t plain = 0;
    for (int count = 8; count == 8; plain += static_cast<std::size_t>(count))
      count = EightChars(place + plain).PlainChars();
    if (plain == value.size()) {
      out_ = place + plain + 1;
      return;
    }
  }
  Put('"');
  AppendEscaped(value);
  Put('"');
}

void TextWriter::AppendEscaped(std::string_view value) {
  // Texts stand between ASCII, so the whole is UTF-8 when each is.
  if (FirstInvalidUtf8(value)) isUtf8_ = false;
  while (!value.empty()) {
    const auto isUnescaped = [](char c) { return Is(c, kUnescaped); };
    const auto plain =
        static_cast<std::size_t>(std::find_if_not(value.begin(), value.end(), isUnescaped) - value.begin());
    Put(value.substr(0, plain));
    if (plain == value.size()) break;
    switch (const char c = value[plain]) {
      case '"':
        Put("\\\"");
        break;
      case '\\':
        Put("\\\\");
        break;
      case '\n':
        Put("\\n");
        break;
      case '\r':
        Put("\\r");
        break;
      case '\t':
        Put("\\t");
        break;
      default:
        Put(fmt::format("\\u{{{:x}}}", static_cast<unsigned char>(c)));
    }
    value.remove_prefix(plain + 1);
  }
}

void TextWriter::Name(const KvfNode& node) {
  if (node.name->isBare)
    Put(node.Name());
  else
    Quoted(node.WrittenName());
}

/// A float or double in its shortest form; a double that looks like a whole number gets a point.
template <class Number>
char* WriteReal(Number value, char* place) {
  char* end = ShortestNumber(value, place);
  if constexpr (std::is_same_v<Number, double>) {
    const auto isWhole = [](char c) { return Is(c, kDigit) || c == '-'; };
    if (std::all_of(place, end, isWhole)) {
      *end++ = '.';
      *end++ = '0';
    }
  } else {
    *end++ = 'f';
  }
  return end;
}

void TextWriter::Value(const KvfParam& param) {
  constexpr std::size_t most = kNumberBuffer + 2;
  switch (param.type) {
    case KvfType::Int:
      PutWith(most, [&](char* place) { return std::to_chars(place, place + most, param.asInt).ptr; });
      break;
    case KvfType::Float:
      PutWith(most, [&](char* place) { return WriteReal(param.asFloat, place); });
      break;
    case KvfType::Double:
      PutWith(most, [&](char* place) { return WriteReal(param.asDouble, place); });
      break;
    case KvfType::Bool:
      param.asBool ? Put("true") : Put("false");
      break;
    case KvfType::Filename:
      Put("file ");
      [[fallthrough]];
    case KvfType::String:
      Quoted(param.Text());
      break;
  }
}

void TextWriter::Values(const KvfNode& keyword) {
  for (std::uint32_t i = 0; i < keyword.count; ++i) {
    if (i > 0) Put(", ");
    Value(keyword.params[i]);
  }
}

void TextWriter::Nodes(const KvfSection& section, std::size_t indent) {
  for (const KvfNode* node = section.firstChild; node; node = node->next) {
    PutBlanks(indent);
    if (const KvfSection* child = AsSection(node)) {
      child->kind == KvfKind::Target ? Put("target ") : Put("section ");
      Name(*child);
      Put(" {\n");
      Nodes(*child, indent + 2);
      PutBlanks(indent);
      Put("}\n");
      continue;
    }
    Name(*node);
    node->count > 0 ? Put(" = ") : Put(" =");
    Values(*node);
    Put('\n');
  }
}

void AppendPlainValue(const KvfParam& param, std::string& text) {
  switch (param.type) {
    case KvfType::Float:
      text += ShortestNumber(param.asFloat);
      break;
    case KvfType::Double:
      text += ShortestNumber(param.asDouble);
      break;
    case KvfType::String:
    case KvfType::Filename:
      text += param.Text();
      break;
    default:
      text += KvfValueText(param);
  }
}

/// The place of the first text in the tree that is no UTF-8, as the name that holds it; empty when all is well.
std::string FindBadText(const KvfSection& section) {
  for (const KvfNode* node = section.firstChild; node; node = node->next) {
    if (FirstInvalidUtf8(node->WrittenName())) return fmt::format("a name in {}", section.Name());
    if (const KvfSection* child = AsSection(node)) {
      if (std::string found = FindBadText(*child); !found.empty()) return found;
      continue;
    }
    for (std::uint32_t i = 0; i < node->count; ++i)
      if (node->params[i].IsText() && FirstInvalidUtf8(node->params[i].Text()))
        return fmt::format("{} in {}", node->Name(), section.Name());
  }
  return {};
}

}  // namespace

void AppendKvfNodes(const KvfSection& section, int level, std::string& text) {
  TextWriter(text).Nodes(section, 2 * static_cast<std::size_t>(level));
}

std::string KvfTextInside(const KvfSection& section) {
  std::string text;
  AppendKvfNodes(section, 0, text);
  return text;
}

bool WriteKvfText(const KvfFile& file, std::string& text, std::string& error) {
  text.clear();
  if (!file.unwritable.empty()) {
    error = file.unwritable;
    return false;
  }
  // A node with its values takes somewhat more memory than its line without its texts.
  text.reserve(file.header.size() + file.nodes.Size() + file.texts.Size());
  os::PreferLargePages(text.data(), text.capacity());
  text = file.header;
  bool isUtf8 = true;
  {
    TextWriter writer(text);
    writer.Nodes(file.top, 0);
    isUtf8 = writer.IsUtf8();
  }
  if (!isUtf8) {
    text.clear();
    error = fmt::format("{} is no UTF-8 text", FindBadText(file.top));
    return false;
  }
  return true;
}

std::string KvfValueText(const KvfParam& param) {
  std::string text;
  TextWriter(text).Value(param);
  return text;
}

std::string KvfValuesText(const KvfNode& keyword) {
  std::string text;
  TextWriter(text).Values(keyword);
  return text;
}

std::string PlainValuesText(const KvfNode& keyword) {
  std::string text;
  for (std::uint32_t i = 0; i < keyword.count; ++i) {
    if (i > 0) text += ", ";
    AppendPlainValue(keyword.params[i], text);
  }
  return text;
}

}  // namespace tervane
