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
#include <array>
#include <charconv>
#include <cmath>
#include <cstring>
#include <limits>
#include <type_traits>
#include <utility>

#include <fmt/format.h>

#include "core/kvf_chars.h"
#include "platform/text.h"

namespace tervane {

namespace {

/// The value mantissa * 10^exponent where one rounding gives it, so that it is the same as of a careful conversion: the
/// mantissa and the power of ten are both numbers of that type. False for the rare others.
template <class Real>
bool RealOf(std::uint64_t mantissa, int exponent, bool negative, Real& value) {
  constexpr int largestExponent = std::is_same_v<Real, float> ? 10 : 22;
  static constexpr auto powers = [] {
    std::array<Real, largestExponent + 1> powersOfTen{1};
    for (std::size_t i = 1; i < powersOfTen.size(); ++i) powersOfTen[i] = powersOfTen[i - 1] * 10;
    return powersOfTen;
  }();
  if (mantissa > std::uint64_t{1} << std::numeric_limits<Real>::digits) return false;
  if (exponent < -largestExponent || exponent > largestExponent) return false;
  const Real whole = static_cast<Real>(mantissa);
  value = exponent < 0 ? whole / powers[static_cast<std::size_t>(-exponent)]
                       : whole * powers[static_cast<std::size_t>(exponent)];
  if (negative) value = -value;
  return true;
}

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
  explicit Parser(KvfFile& file)
      : file_(file), start_(file.text.data.get()), end_(start_ + file.text.size), at_(start_) {}

  bool Parse() {
    if (!CheckEncoding()) return false;
    const char* header = at_;
    if (!SkipSpace()) return false;
    file_.header = HeaderOf(header);
    file_.comments.clear();
    while (at_ != end_) {
      if (!ParseTarget()) return false;
      if (!SkipSpace()) return false;
    }
    if (!file_.top.firstChild) return Fail(at_, "the file is empty: target NAME { was expected");
    return true;
  }

 private:
  // The text is followed by a NUL, so one byte may always be looked at without asking for the end.

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

  bool HasByteOrderMark() const { return file_.text.size >= 3 && std::memcmp(start_, "\xEF\xBB\xBF", 3) == 0; }

  bool CheckEncoding() {
    if (file_.text.size > kKvfLargestText) return Fail(start_, "the file is larger than 4 GB");
    if (file_.text.size >= 2 && (std::memcmp(start_, "\xFF\xFE", 2) == 0 || std::memcmp(start_, "\xFE\xFF", 2) == 0))
      return Fail(start_, "the file is UTF-16 text: UTF-8 was expected; save it as UTF-8");
    if (HasByteOrderMark()) at_ += 3;
    return true;
  }

  /// The comments in front of the first target, whole lines.
  std::string_view HeaderOf(const char* header) const {
    if (file_.comments.empty()) return {};
    const char* last = start_ + file_.comments.back();
    const char* lineEnd = std::find(last, end_, '\n');
    return {header, static_cast<std::size_t>((lineEnd == end_ ? lineEnd : lineEnd + 1) - header)};
  }

  // ---- Space

  void SkipBlanks() {
    while (*at_ == ' ' || *at_ == '\t') ++at_;
  }

  /// The blanks in front of a line, eight in one step where there are so many.
  void SkipIndentation() {
    constexpr std::uint64_t eightBlanks = 0x2020'2020'2020'2020;
    for (std::uint64_t eight; end_ - at_ >= std::ptrdiff_t{sizeof eight}; at_ += sizeof eight) {
      std::memcpy(&eight, at_, sizeof eight);
      if (eight != eightBlanks) break;
    }
    SkipBlanks();
  }

  /// Blanks, line ends and comments.
  bool SkipSpace() {
    for (;;) {
      SkipIndentation();
      switch (*at_) {
        case '\n':
          ++at_;
          break;
        case '\r':
          if (at_[1] != '\n') return FailAtByte();
          at_ += 2;
          break;
        case '#':
          if (!SkipComment()) return false;
          break;
        default:
          return true;
      }
    }
  }

  bool SkipComment() {
    const char* comment = at_;
    file_.comments.push_back(static_cast<std::uint32_t>(comment - start_));
    bool ascii = true;
    for (;; ++at_) {
      if (Is(*at_, kComment)) continue;
      if (static_cast<unsigned char>(*at_) < 0x80) break;
      ascii = false;
    }
    if (*at_ != '\n' && !(*at_ == '\r' && at_[1] == '\n') && at_ != end_) return FailAtByte();
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

  struct Name {
    std::string_view text;
    std::uint8_t blanksBefore = 0;
    std::uint8_t blanksAfter = 0;
  };

  void TakeName(KvfNode& node, const Name& name) {
    node.nameText = name.text.data();
    node.nameLength = static_cast<std::uint32_t>(name.text.size());
    node.blanksBefore = name.blanksBefore;
    node.blanksAfter = name.blanksAfter;
  }

  std::string_view ScanWord() {
    const char* word = at_++;
    while (Is(*at_, kNameRest)) ++at_;
    return {word, static_cast<std::size_t>(at_ - word)};
  }

  bool ParseQuotedName(Name& name) {
    std::string_view text;
    const char* place = at_;
    if (!ParseString(text)) return false;
    name.text = Trimmed(text);
    if (name.text.empty()) return Fail(place, "a name was expected between the quotes");
    const std::ptrdiff_t before = name.text.data() - text.data();
    const std::ptrdiff_t after = static_cast<std::ptrdiff_t>(text.size() - name.text.size()) - before;
    if (before > 255 || after > 255) return Fail(place, "a name with at most 255 blanks around it was expected");
    name.blanksBefore = static_cast<std::uint8_t>(before);
    name.blanksAfter = static_cast<std::uint8_t>(after);
    return true;
  }

  bool ParseName(Name& name, std::string_view expected) {
    if (*at_ == '"') return ParseQuotedName(name);
    if (!Is(*at_, kNameStart)) return Fail(at_, expected);
    name.text = ScanWord();
    return true;
  }

  bool ParseTarget() {
    const char* place = at_;
    if (!Is(*at_, kNameStart)) return *at_ == '}' ? Fail(at_, "a } without its {") : FailOutside(place);
    if (ScanWord() != "target") return FailOutside(place);
    SkipBlanks();
    Name name;
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
  bool ParseBlock(KvfSection& parent, KvfKind kind, const Name& name, int depth) {
    if (!SkipSpace()) return false;
    if (*at_ != '{') return Fail(at_, fmt::format("{{ was expected behind the name {}", Shown(name.text)));
    const char* brace = at_++;
    if (depth > kKvfDeepestNesting)
      return Fail(brace, fmt::format("sections nested deeper than {} are not read", kKvfDeepestNesting));
    auto* section = file_.arena.New<KvfSection>();
    section->kind = kind;
    section->file = &file_;
    TakeName(*section, name);
    file_.Append(parent, *section);
    for (;;) {
      if (!SkipSpace()) return false;
      if (*at_ == '}') break;
      if (!ParseNode(*section, depth)) return false;
    }
    ++at_;
    return true;
  }

  bool ParseNode(KvfSection& parent, int depth) {
    Name name;
    const char* place = at_;
    if (*at_ == '"') {
      if (!ParseQuotedName(name)) return false;
      SkipBlanks();
    } else if (Is(*at_, kNameStart)) {
      name.text = ScanWord();
      SkipBlanks();
      if (name.text == "section" && *at_ != '=') {
        Name sectionName;
        return ParseName(sectionName, "the name of the section was expected") &&
               ParseBlock(parent, KvfKind::Section, sectionName, depth + 1);
      }
      if (name.text == "target" && *at_ != '=')
        return Fail(place, fmt::format("the }} that ends {} was expected before a target", Shown(parent.Name())));
    } else if (at_ == end_) {
      return Fail(at_, fmt::format("the file ends here: the }} that ends {} was expected", Shown(parent.Name())));
    } else {
      const auto byte = static_cast<unsigned char>(*at_);
      if (byte < 0x20 || byte == 0x7F) return FailAtByte();
      if (byte >= 0x80 && !CheckUtf8(at_, end_)) return false;
      return Fail(at_, "section NAME {, NAME = or } was expected");
    }
    if (*at_ != '=') return Fail(at_, fmt::format("= was expected behind the name {}", Shown(name.text)));
    ++at_;
    auto* keyword = file_.arena.New<KvfNode>();
    keyword->kind = KvfKind::Keyword;
    TakeName(*keyword, name);
    file_.Append(parent, *keyword);
    return ParseValues(*keyword);
  }

  // ---- Values

  bool ParseValues(KvfNode& keyword) {
    SkipBlanks();
    if (*at_ == '\n' || *at_ == '\r' || *at_ == '#' || at_ == end_) return EndLine();
    // Nearly all keywords have one value: its place is right behind its keyword.
    keyword.params = file_.arena.New<KvfParam>();
    keyword.capacity = 1;
    for (;;) {
      if (!ParseValue(file_.AddParam(keyword, KvfType::Int))) return false;
      SkipBlanks();
      if (*at_ != ',') break;
      ++at_;
      if (!SkipSpace()) return false;
      if (*at_ == '}' || at_ == end_) return Fail(at_, "a value was expected behind the comma");
    }
    return EndLine();
  }

  bool EndLine() {
    switch (*at_) {
      case '\n':
        ++at_;
        return true;
      case '\r':
        if (at_[1] != '\n') return FailAtByte();
        at_ += 2;
        return true;
      case '#':
        return SkipComment();
      default:
        return static_cast<unsigned char>(*at_) < 0x20 ? FailAtByte()
                                                       : Fail(at_, "a comma or the end of the line was expected");
    }
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

  bool ParseText(KvfParam& value) {
    std::string_view text;
    if (!ParseString(text)) return false;
    value.text = text.data();
    value.length = static_cast<std::uint32_t>(text.size());
    return true;
  }

  bool ParseWord(KvfParam& value) {
    const char* place = at_;
    const std::string_view word = ScanWord();
    if (word == "true" || word == "false") {
      value.type = KvfType::Bool;
      value.asBool = word == "true";
    } else if (word == "file") {
      SkipBlanks();
      if (*at_ != '"') return Fail(at_, "a file name in double quotes was expected behind file");
      value.type = KvfType::Filename;
      return ParseText(value);
    } else if (!ParseNotFinite(word, 1, value)) {
      return Fail(place, "a value was expected: a number, true, false, \"text\" or file \"name\"");
    }
    return Is(*at_, kDelimiter) ||
           Fail(place, "a value was expected: a number, true, false, \"text\" or file \"name\"");
  }

  bool ParseNotFinite(std::string_view word, int sign, KvfParam& value) {
    const bool isFloat = word == "inff" || word == "nanf";
    if (!isFloat && word != "inf" && word != "nan") return false;
    if (isFloat) {
      using Limits = std::numeric_limits<float>;
      value.type = KvfType::Float;
      value.asFloat =
          std::copysign(word[0] == 'i' ? Limits::infinity() : Limits::quiet_NaN(), static_cast<float>(sign));
    } else {
      using Limits = std::numeric_limits<double>;
      value.type = KvfType::Double;
      value.asDouble = std::copysign(word[0] == 'i' ? Limits::infinity() : Limits::quiet_NaN(), sign);
    }
    return true;
  }

  /// Steps over digits and appends them to `mantissa`, which holds up to 19; gives their number.
  std::ptrdiff_t ScanDigits(std::uint64_t& mantissa) {
    const char* at = at_;
    for (; Is(*at, kDigit); ++at) mantissa = mantissa * 10 + static_cast<std::uint64_t>(*at - '0');
    return at - std::exchange(at_, at);
  }

  bool ParseNumber(KvfParam& value) {
    const char* number = at_;
    const bool negative = *at_ == '-';
    if (negative) ++at_;
    std::uint64_t mantissa = 0;
    std::ptrdiff_t digitCount = ScanDigits(mantissa);
    if (digitCount > 0 && Is(*at_, kDelimiter)) {
      const std::uint64_t most = negative ? 0x8000'0000u : 0x7FFF'FFFFu;
      // 19 digits cannot have overflowed the 64 bits.
      if (digitCount > 19 || mantissa > most)
        return Fail(number, "a whole number from -2147483648 to 2147483647 was expected");
      value.type = KvfType::Int;
      const auto whole = static_cast<std::int64_t>(mantissa);
      value.asInt = static_cast<std::int32_t>(negative ? -whole : whole);
      return true;
    }
    if (negative && (*at_ == 'i' || *at_ == 'n')) {
      if (ParseNotFinite(ScanWord(), -1, value) && Is(*at_, kDelimiter)) return true;
      return Fail(number, "a number was expected");
    }
    std::ptrdiff_t fractionCount = 0;
    if (*at_ == '.') {
      ++at_;
      fractionCount = ScanDigits(mantissa);
      digitCount += fractionCount;
    }
    if (digitCount == 0) return FailNoValue(number);
    bool isKnown = digitCount <= 19;  // more may not have fitted
    int exponent = 0;
    if (*at_ == 'e' || *at_ == 'E') {
      ++at_;
      const bool isSmall = *at_ == '-';
      if (*at_ == '+' || *at_ == '-') ++at_;
      std::uint64_t size = 0;
      const std::ptrdiff_t exponentCount = ScanDigits(size);
      if (exponentCount == 0) return Fail(number, "a number was expected: its exponent is missing");
      isKnown = isKnown && exponentCount <= 4;
      if (isKnown) exponent = isSmall ? -static_cast<int>(size) : static_cast<int>(size);
    }
    const char* numberEnd = at_;
    const bool isFloat = *at_ == 'f';
    if (isFloat) ++at_;
    if (!Is(*at_, kDelimiter)) return Fail(number, "a number was expected");
    value.type = isFloat ? KvfType::Float : KvfType::Double;
    const auto take = [&](auto& real) {
      if (isKnown && RealOf(mantissa, exponent - static_cast<int>(fractionCount), negative, real)) return true;
      const std::from_chars_result result = std::from_chars(number, numberEnd, real);
      if (result.ec == std::errc::result_out_of_range)
        return Fail(number, fmt::format("a number that fits a {} was expected", isFloat ? "float" : "double"));
      return result.ptr == numberEnd || Fail(number, "a number was expected");
    };
    return isFloat ? take(value.asFloat) : take(value.asDouble);
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

  /// A string from its opening quote on; a view into the file's text, or into the arena where it held escapes.
  bool ParseString(std::string_view& text) {
    const char* quote = at_++;
    const char* begin = at_;
    bool ascii = true;
    bool escaped = false;
    for (;;) {
      while (Is(*at_, kPlain)) ++at_;
      if (*at_ == '"') break;
      if (*at_ == '\\') {
        escaped = true;
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
    return !escaped || Unescape(text);
  }

  bool Unescape(std::string_view& text) {
    // An escape is never shorter than what it stands for.
    auto* decoded = static_cast<char*>(file_.arena.Allocate(text.size(), 1));
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
  const char* start_;
  const char* end_;
  const char* at_;
};

}  // namespace

bool ParseKvf(KvfFile& file) { return Parser(file).Parse(); }

}  // namespace tervane
