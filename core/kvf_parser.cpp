// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The form of a parameter file:
//
//   file    = { comment | target }
//   target  = "target" name "{" { node } "}"
//   node    = "section" name "{" { node } "}"  |  name "=" [ value { "," value } ] end-of-line
//   name    = [A-Za-z_][A-Za-z0-9_.%-]*  |  string
//   value   = -12 | 2.0 | 1e9 | 6f | inf | nan | inff | nanf | true | false | string | "file" string
//   string  = '"' with the escapes \" \\ \n \r \t \u{hex} '"'
//   comment = "#" up to the end of the line
//
// Blanks and tabs may stand between all of these; line ends too, but neither in front of the name of a target or
// section, nor within a keyword, except behind a comma.
#include "core/kvf_parser.h"

#include <algorithm>
#include <charconv>
#include <cstring>

#include <fmt/format.h>

#include "core/kvf_chars.h"
#include "core/kvf_number.h"
#include "platform/text.h"

namespace tervane {

namespace {

/// Bytes of a line as they can be shown in a message: one line, no control characters, whole UTF-8 characters.
std::string Shown(std::string_view bytes) {
  std::string shown;
  for (const char c : bytes) {
    const auto byte = static_cast<unsigned char>(c);
    if (byte < 0x20 || byte == 0x7F)
      shown += fmt::format("\\x{:02X}", byte);
    else
      shown += c;
  }
  while (const auto bad = FirstInvalidUtf8(shown))
    shown.replace(*bad, 1, fmt::format("\\x{:02X}", static_cast<unsigned char>(shown[*bad])));
  return shown;
}

class Parser {
 public:
  Parser(const FileContent& text, KvfFile& file)
      : file_(file), text_(text.Text()), start_(text_.data()), end_(start_ + text_.size()), at_(start_) {}

  bool Parse() {
    if (!CheckEncoding()) return false;
    if (!ParseHeader()) return false;
    while (at_ != end_) {
      if (!ParseTarget()) return false;
      if (!SkipSpace()) return false;
    }
    file_.currentKeyword = nullptr;
    if (!file_.top.firstChild) return Fail(at_, "the file is empty: target NAME { was expected");
    return true;
  }

 private:
  // The text is followed by NULs, so eight bytes may always be looked at without asking for the end.

  bool Fail(const char* place, std::string_view expected) {
    const char* lineStart = place;
    while (lineStart != start_ && lineStart[-1] != '\n') --lineStart;
    const char* lineEnd = std::find(place, end_, '\n');
    KvfSyntaxError& error = file_.syntaxError;
    error.line = 1 + static_cast<int>(std::count(start_, lineStart, '\n'));
    const char* counted = error.line == 1 && HasByteOrderMark() ? lineStart + 3 : lineStart;
    error.column = 1;
    for (const char* c = std::min(counted, place); c != place; ++c)
      if ((static_cast<unsigned char>(*c) & 0xC0) != 0x80) ++error.column;

    // Enough of the line to find the place by eye.
    constexpr std::ptrdiff_t before = 60;
    constexpr std::ptrdiff_t behind = 20;
    const bool cutBefore = place - counted > before;
    const bool cutBehind = lineEnd - place > behind;
    const char* excerpt = cutBefore ? place - before : std::min(counted, place);
    const char* excerptEnd = cutBehind ? place + behind : lineEnd;
    const auto isInsideCharacter = [](char c) { return (static_cast<unsigned char>(c) & 0xC0) == 0x80; };
    for (int i = 0; i < 3 && cutBefore && isInsideCharacter(*excerpt); ++i) ++excerpt;
    for (int i = 0; i < 3 && cutBehind && excerptEnd != lineEnd && isInsideCharacter(*excerptEnd); ++i) ++excerptEnd;
    const std::string quoted = Shown(Trimmed({excerpt, static_cast<std::size_t>(excerptEnd - excerpt)}));
    error.message = fmt::format("{}:{}: ", error.line, error.column);
    if (!quoted.empty())
      error.message += fmt::format("{}{}{}: ", cutBefore ? "..." : "", quoted, cutBehind ? "..." : "");
    error.message += expected;
    return false;
  }

  bool HasByteOrderMark() const { return text_.size() >= 3 && std::memcmp(start_, "\xEF\xBB\xBF", 3) == 0; }

  bool CheckEncoding() {
    if (text_.size() > kKvfLargestText) return Fail(start_, "the file is larger than 4 GB");
    if (text_.size() >= 2 && (std::memcmp(start_, "\xFF\xFE", 2) == 0 || std::memcmp(start_, "\xFE\xFF", 2) == 0))
      return Fail(start_, "the file is UTF-16 text: UTF-8 was expected; save it as UTF-8");
    if (HasByteOrderMark()) at_ += 3;
    return true;
  }

  /// The comments in front of the first target, whole lines, are kept as one text.
  bool ParseHeader() {
    const char* header = at_;
    if (!SkipSpace()) return false;
    if (!commentEnd_) return true;
    const char* lineEnd = std::find(commentEnd_, end_, '\n');
    const std::string_view text(header, static_cast<std::size_t>((lineEnd == end_ ? end_ : lineEnd + 1) - header));
    file_.header = {file_.texts.Copy(text), text.size()};
    file_.comments.clear();
    return true;
  }

  // ---- Space

  void SkipBlanks() {
    const char* at = at_;
    while (*at == ' ' || *at == '\t') ++at;
    at_ = at;
  }

  /// The blanks in front of a line.
  void SkipIndentation() {
    const char* at = at_;
    for (int count = 8; count == 8; at += count) count = EightChars(at).Blanks();
    at_ = at;
    if (*at == '\t') SkipBlanks();
  }

  /// The end of a line; false where none stands.
  bool SkipLineEnd() {
    if (*at_ != '\n' && !(*at_ == '\r' && at_[1] == '\n')) return false;
    at_ += *at_ == '\n' ? 1 : 2;
    ++line_;
    return true;
  }

  /// Blanks, line ends and comments.
  bool SkipSpace() {
    for (;;) {
      SkipIndentation();
      // What nodes begin with lies above these.
      if (static_cast<unsigned char>(*at_) > '#') return true;
      if (SkipLineEnd()) continue;
      if (*at_ == '\r') return FailAtByte();
      if (*at_ != '#') return true;
      if (!SkipComment()) return false;
    }
  }

  bool SkipComment() {
    const char* comment = at_;
    bool ascii = true;
    for (;; ++at_) {
      if (Is(*at_, kComment)) continue;
      if (static_cast<unsigned char>(*at_) < 0x80) break;
      ascii = false;
    }
    if (*at_ != '\n' && !(*at_ == '\r' && at_[1] == '\n') && at_ != end_) return FailAtByte();
    const std::string_view text(comment, static_cast<std::size_t>(at_ - comment));
    file_.comments.push_back({static_cast<int>(line_), {file_.texts.Copy(text), text.size()}});
    commentEnd_ = at_;
    return ascii || CheckUtf8(comment, at_);
  }

  bool CheckUtf8(const char* from, const char* to) {
    const auto bad = FirstInvalidUtf8({from, static_cast<std::size_t>(to - from)});
    return !bad || Fail(from + *bad, "this byte is no UTF-8 text; save the file as UTF-8");
  }

  /// A byte that may stand nowhere, or nowhere but inside a string or a comment.
  bool FailAtByte() {
    const auto byte = static_cast<unsigned char>(*at_);
    if (at_ == end_) return Fail(at_, "the file ends here: it seems to be cut off");
    if (byte == 0) return Fail(at_, "a NUL byte: the file is no text or damaged");
    if (byte < 0x20 || byte == 0x7F)
      return Fail(at_, fmt::format("a control character (\\x{:02X}) is not allowed", byte));
    return Fail(at_, fmt::format("'{}' was not expected", Shown({at_, 1})));
  }

  // ---- Names, targets, sections

  // A name is handed on in its written form, with the blanks that its quotes may hold.

  bool ParseQuotedName(std::string_view& name) {
    const char* place = at_;
    bool isDecoded = false;
    if (!ParseString(name, isDecoded)) return false;
    const std::string_view text = Trimmed(name);
    if (text.empty()) return Fail(place, "a name was expected between the quotes");
    const auto before = static_cast<std::size_t>(text.data() - name.data());
    if (before > 255 || name.size() - text.size() - before > 255)
      return Fail(place, "a name with at most 255 blanks around it was expected");
    return true;
  }

  bool ParseName(std::string_view& name, std::string_view expected) {
    if (*at_ == '"') return ParseQuotedName(name);
    if (!Is(*at_, kNameStart)) return Fail(at_, expected);
    name = ScanWord(at_);
    return true;
  }

  bool ParseTarget() {
    const char* place = at_;
    if (!Is(*at_, kNameStart)) return *at_ == '}' ? Fail(at_, "a } without its {") : FailOutside(place);
    if (ScanWord(at_) != "target") return FailOutside(place);
    SkipBlanks();
    std::string_view name;
    if (!ParseName(name, "the name of the target was expected")) return false;
    return ParseBlock(file_.top, KvfKind::Target, name, 1);
  }

  bool FailOutside(const char* place) {
    const auto byte = static_cast<unsigned char>(*place);
    if (byte < 0x20 || byte == 0x7F || byte >= 0x80) {
      at_ = place;
      return byte >= 0x80 ? CheckUtf8(place, end_) && Fail(place, "target NAME { was expected") : FailAtByte();
    }
    return Fail(place, "target NAME { was expected");
  }

  /// `{ nodes }` of a target or section whose name has been read.
  bool ParseBlock(KvfSection& parent, KvfKind kind, std::string_view name, int depth) {
    const std::uint32_t line = line_;
    if (!SkipSpace()) return false;
    if (*at_ != '{') return Fail(at_, fmt::format("{{ was expected behind the name {}", Shown(Trimmed(name))));
    const char* brace = at_++;
    if (depth > kKvfDeepestNesting)
      return Fail(brace, fmt::format("sections nested deeper than {} are not read", kKvfDeepestNesting));
    KvfSection* section = file_.AddSection(parent, kind, name, line);
    for (;;) {
      if (!SkipSpace()) return false;
      if (*at_ == '}') break;
      if (!ParseNode(*section, depth)) return false;
    }
    ++at_;
    return true;
  }

  bool ParseNode(KvfSection& parent, int depth) {
    std::string_view name;
    const char* place = at_;
    if (*at_ == '"') {
      if (!ParseQuotedName(name)) return false;
      SkipBlanks();
    } else if (Is(*at_, kNameStart)) {
      name = ScanWord(at_);
      SkipBlanks();
      if (*at_ == '=') return ParseKeyword(parent, name);
      if (name == "section")
        return ParseName(name, "the name of the section was expected") &&
               ParseBlock(parent, KvfKind::Section, name, depth + 1);
      if (name == "target")
        return Fail(place, fmt::format("the }} that ends {} was expected before a target", Shown(parent.Name())));
    } else if (at_ == end_) {
      return Fail(at_, fmt::format("the file ends here: the }} that ends {} was expected", Shown(parent.Name())));
    } else {
      const auto byte = static_cast<unsigned char>(*at_);
      if (byte < 0x20 || byte == 0x7F) return FailAtByte();
      if (byte >= 0x80 && !CheckUtf8(at_, end_)) return false;
      return Fail(at_, "section NAME {, NAME = or } was expected");
    }
    if (*at_ == '=') return ParseKeyword(parent, name);
    return Fail(at_, fmt::format("= was expected behind the name {}", Shown(Trimmed(name))));
  }

  // ---- Values

  /// The values of a keyword, from its = up to the end of its line.
  bool ParseKeyword(KvfSection& parent, std::string_view name) {
    ++at_;
    file_.BeginKeyword(parent, name, line_);
    SkipBlanks();
    if (*at_ == '\n' || *at_ == '\r' || *at_ == '#' || at_ == end_) return EndLine();
    for (;;) {
      if (!ParseValue(file_.AddParam(KvfType::Int))) return false;
      SkipBlanks();
      if (*at_ != ',') return EndLine();
      ++at_;
      if (!SkipSpaceBehindComma()) return false;
    }
  }

  bool SkipSpaceBehindComma() {
    SkipBlanks();
    if (Is(*at_, kDigit)) return true;
    if (!SkipSpace()) return false;
    return (*at_ != '}' && at_ != end_) || Fail(at_, "a value was expected behind the comma");
  }

  bool EndLine() {
    if (SkipLineEnd()) return true;
    if (*at_ == '#') return SkipComment();
    return static_cast<unsigned char>(*at_) < 0x20 ? FailAtByte()
                                                   : Fail(at_, "a comma or the end of the line was expected");
  }

  bool ParseValue(KvfParam& value) {
    switch (*at_) {
      case '"':
        value.type = KvfType::String;
        return ParseText(value);
      case 't':
      case 'f':
      case 'i':
      case 'n':
        return ParseWord(value);
      default:
        return ParseNumber(value);
    }
  }

  bool ParseNumber(KvfParam& value) {
    const char* place = at_;
    const char* expected = ScanKvfNumber(at_, value);
    if (!expected) return true;
    return *expected == '\0' ? FailNoValue(place) : Fail(place, expected);
  }

  bool ParseText(KvfParam& value) {
    std::string_view text;
    bool isDecoded = false;
    if (!ParseString(text, isDecoded)) return false;
    value.text = isDecoded ? text.data() : file_.texts.Copy(text);
    value.length = static_cast<std::uint32_t>(text.size());
    return true;
  }

  bool ParseWord(KvfParam& value) {
    const char* place = at_;
    const std::string_view word = ScanWord(at_);
    if (word == "true" || word == "false") {
      value.type = KvfType::Bool;
      value.asBool = word == "true";
    } else if (word == "file") {
      SkipBlanks();
      if (*at_ != '"') return Fail(at_, "a file name in double quotes was expected behind file");
      value.type = KvfType::Filename;
      return ParseText(value);
    } else if (!kvf_number::TakeNotFinite(word, 1, value)) {
      return Fail(place, "a value was expected: a number, true, false, \"text\" or file \"name\"");
    }
    return Is(*at_, kDelimiter) ||
           Fail(place, "a value was expected: a number, true, false, \"text\" or file \"name\"");
  }

  bool FailNoValue(const char* place) {
    const auto byte = static_cast<unsigned char>(*place);
    if (byte < 0x20 || byte == 0x7F) {
      at_ = place;
      return FailAtByte();
    }
    if (byte >= 0x80 && !CheckUtf8(place, end_)) return false;
    return Fail(place, byte == '-' || byte == '+' || byte == '.'
                           ? "a number was expected"
                           : "a value was expected: a number, true, false, \"text\" or file \"name\"");
  }

  /// A string from its opening quote on: a view into the source, or decoded into the arena where it held escapes, with
  /// a NUL behind.
  bool ParseString(std::string_view& text, bool& isDecoded) {
    const char* quote = at_++;
    const char* begin = at_;
    bool ascii = true;
    for (;;) {
      SkipPlainChars();
      if (*at_ == '"') break;
      if (*at_ == '\\') {
        isDecoded = true;
        if (at_[1] == '"' || at_[1] == '\\') ++at_;
        ++at_;
      } else if (static_cast<unsigned char>(*at_) >= 0x80) {
        ascii = false;
        ++at_;
      } else if (at_ == end_ || *at_ == '\n' || *at_ == '\r') {
        return Fail(quote, "the closing \" of a text was expected on the same line");
      } else {
        return FailAtByte();
      }
    }
    text = {begin, static_cast<std::size_t>(at_ - begin)};
    ++at_;
    if (!ascii && !CheckUtf8(begin, at_)) return false;
    return !isDecoded || Unescape(text);
  }

  void SkipPlainChars() {
    const char* at = at_;
    for (int count = 8; count == 8; at += count) count = EightChars(at).PlainChars();
    at_ = at;
  }

  bool Unescape(std::string_view& text) {
    // An escape is longer than what it stands for, so a NUL fits behind.
    auto* decoded = static_cast<char*>(file_.texts.Allocate(text.size(), 1));
    char* out = decoded;
    const char* end = text.data() + text.size();
    for (const char* in = text.data(); in != end;) {
      if (*in != '\\') {
        *out++ = *in++;
        continue;
      }
      const char* escape = in++;
      switch (*in++) {
        case '"':
          *out++ = '"';
          break;
        case '\\':
          *out++ = '\\';
          break;
        case 'n':
          *out++ = '\n';
          break;
        case 'r':
          *out++ = '\r';
          break;
        case 't':
          *out++ = '\t';
          break;
        case 'u': {
          std::uint32_t code = 0;
          const char* hex = in + 1;
          if (*in != '{') return FailEscape(escape);
          const auto [hexEnd, error] = std::from_chars(hex, end, code, 16);
          if (error != std::errc() || hexEnd == end || *hexEnd != '}' || hexEnd - hex > 8) return FailEscape(escape);
          if (code == 0 || code > 0x10FFFF || (code >= 0xD800 && code < 0xE000))
            return Fail(escape, "\\u{...} with the number of a character (not 0) was expected");
          out = AppendUtf8(code, out);
          in = hexEnd + 1;
          break;
        }
        default:
          return FailEscape(escape);
      }
    }
    *out = '\0';
    text = {decoded, static_cast<std::size_t>(out - decoded)};
    return true;
  }

  bool FailEscape(const char* place) {
    return Fail(place,
                "an unknown escape: \\\" \\\\ \\n \\r \\t or \\u{hex} was expected (write \\\\ for a backslash)");
  }

  static char* AppendUtf8(std::uint32_t code, char* out) {
    const auto put = [&out](std::uint32_t byte) { *out++ = static_cast<char>(byte); };
    if (code < 0x80) {
      put(code);
    } else if (code < 0x800) {
      put(0xC0 | (code >> 6));
      put(0x80 | (code & 0x3F));
    } else if (code < 0x10000) {
      put(0xE0 | (code >> 12));
      put(0x80 | ((code >> 6) & 0x3F));
      put(0x80 | (code & 0x3F));
    } else {
      put(0xF0 | (code >> 18));
      put(0x80 | ((code >> 12) & 0x3F));
      put(0x80 | ((code >> 6) & 0x3F));
      put(0x80 | (code & 0x3F));
    }
    return out;
  }

  KvfFile& file_;
  const std::string_view text_;
  const char* const start_;
  const char* const end_;
  const char* at_;
  std::uint32_t line_ = 1;            ///< The line of `at_`.
  const char* commentEnd_ = nullptr;  ///< The end of the latest comment.
};

}  // namespace

bool ParseKvf(const FileContent& text, KvfFile& file) { return Parser(text, file).Parse(); }

}  // namespace tervane
