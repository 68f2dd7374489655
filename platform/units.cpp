// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/units.h"

#include <algorithm>
#include <array>
#include <cassert>
#include <charconv>
#include <cmath>
#include <cstddef>
#include <limits>
#include <memory>
#include <mutex>
#include <system_error>
#include <unordered_map>
#include <utility>
#include <vector>

#include <fmt/format.h>
#include <udunits2.h>

#include "platform/os.h"
#include "platform/text.h"

namespace tervane {
namespace {

bool IsLetter(char c) { return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z'); }

/// What people and files write outside ASCII in units and numbers, as UDUNITS and we compare it.
struct Spelling {
  std::string_view written;
  std::string_view ascii;
  bool isExponent = false;
};
constexpr Spelling kSpellings[] = {
    {"⁰", "0", true}, {"¹", "1", true}, {"²", "2", true},  {"³", "3", true}, {"⁴", "4", true}, {"⁵", "5", true},
    {"⁶", "6", true}, {"⁷", "7", true}, {"⁸", "8", true},  {"⁹", "9", true}, {"⁻", "-", true}, {"−", "-"},
    {"°", "deg"},     {"℃", "degC"},    {"℉", "degF"},     {"µ", "u"},       {"μ", "u"},       {"·", "."},
    {"⋅", "."},       {"×", "*"},       {"‰", "permille"}, {"\u00A0", " "},  {"\u2009", " "},  {"\u202F", " "},
};

/// The text in ASCII where a spelling is known, with an exponent behind '^', and one blank for many.
std::string AsciiSpelling(std::string_view text) {
  std::string result;
  bool inExponent = false;
  while (!text.empty()) {
    const auto* spelling =
        std::ranges::find_if(kSpellings, [&](const Spelling& s) { return text.starts_with(s.written); });
    const bool isKnown = spelling != std::end(kSpellings);
    const std::string_view ascii = isKnown ? spelling->ascii : text.substr(0, 1);
    const bool isExponent = isKnown && spelling->isExponent;
    if (isExponent && !inExponent) result += '^';
    inExponent = isExponent;
    if (ascii != " " || !result.ends_with(' ')) result += ascii;
    text.remove_prefix(isKnown ? spelling->written.size() : 1);
  }
  return std::string(Trimmed(result));
}

/// The spelling by which the table's names are found: "m^3 / s" and "m**3/s" are "m3/s".
std::string Folded(std::string_view text) {
  const std::string ascii = Replaced(Replaced(Replaced(AsciiSpelling(text), "**", "^"), " /", "/"), "/ ", "/");
  std::string result;
  for (std::size_t i = 0; i < ascii.size(); ++i) {
    const bool isPower = ascii[i] == '^' && i > 0 && IsLetter(ascii[i - 1]) && i + 1 < ascii.size() &&
                         (IsDigit(ascii[i + 1]) || ascii[i + 1] == '-');
    if (!isPower) result += ascii[i];
  }
  return result;
}

/// The table's units by their names. Abbreviations and aliases are told apart by case (mg, Mg), texts are not.
struct NamesOfUnits {
  std::unordered_map<std::string, const Unit*> abbreviations;
  std::unordered_map<std::string, const Unit*> texts;

  NamesOfUnits() {
    for (const Unit& unit : AllUnits()) {
      texts.emplace(LowerCase(Folded(unit.text)), &unit);
      if (!unit.abbreviation.empty()) abbreviations.emplace(Folded(unit.abbreviation), &unit);
      for (std::string_view rest = unit.aliases; !rest.empty();) {
        const std::size_t end = std::min(rest.find('|'), rest.size());
        abbreviations.emplace(Folded(rest.substr(0, end)), &unit);
        rest.remove_prefix(std::min(end + 1, rest.size()));
      }
    }
  }
};

const Unit* UnitNamed(std::string_view text) {
  static const NamesOfUnits names;
  const std::string folded = Folded(text);
  if (const auto found = names.abbreviations.find(folded); found != names.abbreviations.end()) return found->second;
  if (const auto found = names.texts.find(LowerCase(folded)); found != names.texts.end()) return found->second;
  return nullptr;
}

struct UtFree {
  void operator()(ut_unit* unit) const { ut_free(unit); }
  void operator()(cv_converter* converter) const { cv_free(converter); }
};
using UtUnit = std::unique_ptr<ut_unit, UtFree>;
using UtConverter = std::unique_ptr<cv_converter, UtFree>;

/// The scale of a unit from which `toAnchor` leads to `anchor`; nothing when the way is no straight line with a
/// positive slope (UDUNITS also turns s/m into m/s, and logarithms into numbers).
std::optional<UnitScale> ScaleOf(const cv_converter& toAnchor, const UnitScale& anchor) {
  const double atZero = cv_convert_double(&toAnchor, 0);
  // With an offset, a far point keeps the digits of the slope.
  const double step = atZero == 0 ? 1 : 0x1p20;
  const double slope = (cv_convert_double(&toAnchor, step) - atZero) / step;
  const double slopeOfTwo = (cv_convert_double(&toAnchor, 2 * step) - atZero) / (2 * step);
  if (!std::isfinite(atZero) || !std::isfinite(slope) || slope <= 0) return std::nullopt;
  if (std::abs(slopeOfTwo - slope) > 1e-9 * slope) return std::nullopt;
  return UnitScale{anchor.dimension, slope * anchor.numerator, anchor.denominator, (atZero + anchor.offset) / slope};
}

/// UDUNITS and its database, for one thread at a time. It lives to the end of the process.
class UdunitsDatabase {
 public:
  UdunitsDatabase() {
    ut_set_error_message_handler(ut_ignore);
    system_ = ut_read_xml(nullptr);
    if (system_ == nullptr) return;
    for (const Unit& unit : AllUnits()) {
      const bool isFirst = std::ranges::none_of(
          anchors_, [&](const Anchor& anchor) { return anchor.scale.dimension == unit.scale.dimension; });
      if (unit.udunits.empty() || !isFirst) continue;
      anchors_.push_back({unit.scale, Parse(std::string(unit.udunits))});
    }
  }

  std::optional<UnitScale> Read(const std::string& text) const {
    if (system_ == nullptr) return std::nullopt;
    const UtUnit unit = Parse(text);
    if (unit == nullptr) return std::nullopt;
    for (const Anchor& anchor : anchors_) {
      if (ut_are_convertible(unit.get(), anchor.unit.get()) == 0) continue;
      const UtConverter converter(ut_get_converter(unit.get(), anchor.unit.get()));
      if (converter == nullptr) continue;
      if (const std::optional<UnitScale> scale = ScaleOf(*converter, anchor.scale)) return scale;
    }
    return std::nullopt;
  }

 private:
  struct Anchor {
    UnitScale scale;
    UtUnit unit;
  };

  UtUnit Parse(const std::string& text) const { return UtUnit(ut_parse(system_, text.c_str(), UT_UTF8)); }

  ut_system* system_ = nullptr;
  std::vector<Anchor> anchors_;  ///< One unit of each dimension that UDUNITS knows.
};

std::optional<UnitScale> ScaleByUdunits(const std::string& text) {
  // Longer than any unit: its parser is recursive.
  constexpr std::size_t kMaxLength = 200;
  if (text.size() > kMaxLength || text.find('\0') != std::string::npos || FirstInvalidUtf8(text)) return std::nullopt;
  static std::mutex mutex;
  const std::lock_guard lock(mutex);
  // UDUNITS reads numbers by the process's locale: where that has a decimal comma, it cannot even read its database.
  const os::CLocaleScope locale;
  // Without a destructor, since threads may still ask while the process ends.
  static const UdunitsDatabase& database = *new UdunitsDatabase;
  return database.Read(text);
}

bool AlmostEqual(double a, double b) { return std::abs(a - b) <= 1e-12 * std::max(std::abs(a), std::abs(b)); }

bool IsSameScale(const UnitScale& a, const UnitScale& b) {
  return a.dimension == b.dimension && AlmostEqual(a.numerator * b.denominator, b.numerator * a.denominator) &&
         AlmostEqual(a.offset, b.offset);
}

std::string UnitsAllowedBy(const ItemType& itemType) {
  std::string result;
  for (const int key : itemType.unitKeys) {
    const Unit* unit = FindUnit(key);
    if (unit->abbreviation.empty() || unit->key == kDimensionlessUnit) continue;
    result += (result.empty() ? "" : ", ") + std::string(unit->abbreviation);
  }
  return result;
}

/// The display unit where the item type allows it, else the base unit.
const Unit& DisplayUnit(const ItemType& itemType, int unitKey) {
  return AllowsUnit(itemType, unitKey) ? *FindUnit(unitKey) : BaseUnit(itemType);
}

/// UDUNITS reads numbers within a unit as factors: "1 000 m" would be a thousand meters by accident, and "5 m 30" a
/// hundred and fifty. Only "1/s" begins with a number.
bool HasLooseNumber(std::string_view unit) {
  if (unit.starts_with("1/")) unit.remove_prefix(2);
  if (unit.starts_with('-') || unit.starts_with('+')) return true;
  for (std::size_t i = 0; i < unit.size(); ++i) {
    if (!IsDigit(unit[i])) continue;
    const char before = i == 0 ? ' ' : unit[i - 1];
    const bool isPower = before == '*' && i > 1 && unit[i - 2] == '*';
    if (before == ' ' || before == '.' || (before == '*' && !isPower)) return true;
  }
  return false;
}

struct NumberFormat {
  std::chars_format style = std::chars_format::general;
  int precision = 6;
};

std::optional<NumberFormat> ParseNumberFormat(std::string_view format) {
  constexpr int kMaxPrecision = 100;
  if (!format.starts_with('%')) return std::nullopt;
  format.remove_prefix(1);
  NumberFormat result;
  if (format.starts_with('.')) {
    format.remove_prefix(1);
    const auto [end, error] = std::from_chars(format.data(), format.data() + format.size(), result.precision);
    if (error != std::errc() || result.precision < 0 || result.precision > kMaxPrecision) return std::nullopt;
    format.remove_prefix(static_cast<std::size_t>(end - format.data()));
  }
  if (format == "g") return result;
  if (format == "e") return NumberFormat{std::chars_format::scientific, result.precision};
  if (format == "f") return NumberFormat{std::chars_format::fixed, result.precision};
  if (format == "d") return NumberFormat{std::chars_format::fixed, 0};
  return std::nullopt;
}

ParsedQuantity Refused(std::string error) { return {0, std::move(error)}; }

/// What a user typed, taken apart.
struct NumberAndUnit {
  double number = 0;
  std::string unit;   ///< Empty when the number stands alone.
  std::string error;  ///< Why it begins with no number.
};

/// `name` is what an empty text was expected to be; may be empty.
NumberAndUnit SplitQuantity(std::string_view text, std::string_view name) {
  const auto refused = [](std::string error) { return NumberAndUnit{0, {}, std::move(error)}; };
  const std::string ascii = AsciiSpelling(text);
  std::string_view rest = ascii;
  if (rest.empty()) return refused(fmt::format("{}{}a number was expected", name, name.empty() ? "" : ": "));
  if (rest.starts_with('+') && !rest.starts_with("+-")) rest.remove_prefix(1);
  double value = 0;
  const auto [end, error] = std::from_chars(rest.data(), rest.data() + rest.size(), value);
  const std::string_view number = rest.substr(0, static_cast<std::size_t>(end - rest.data()));
  const bool beginsWithComma = rest.starts_with(',') || rest.starts_with("-,");
  // Letters alone are "inf" and "nan", which no quantity is.
  if (!beginsWithComma && (error == std::errc::invalid_argument || std::ranges::none_of(number, IsDigit))) {
    return refused(fmt::format("\"{}\": a number was expected", Trimmed(text)));
  }
  rest.remove_prefix(number.size());
  if (beginsWithComma || rest.starts_with(',')) {
    return refused(
        fmt::format("\"{}\": use a point for decimals, as in 1.5, and nothing between thousands", Trimmed(text)));
  }
  if (error == std::errc::result_out_of_range) {
    return refused(fmt::format("\"{}\" is too large or too small", Trimmed(text)));
  }
  return {value, std::string(Trimmed(rest)), {}};
}

std::optional<ParsedUnit> TypedUnit(const std::string_view unit) {
  return UnitNamed(unit) != nullptr || !HasLooseNumber(unit) ? ParseUnit(unit) : std::nullopt;
}

}  // namespace

std::optional<UnitConversion> ConversionBetween(const UnitScale& from, const UnitScale& to) {
  if (from.dimension != to.dimension) return std::nullopt;
  UnitConversion conversion;
  const double numerator = from.numerator * to.denominator;
  const double denominator = from.denominator * to.numerator;
  // Steps that change nothing are left out, so that no digit is lost in them.
  if (numerator == denominator) {
    conversion.before_ = from.offset - to.offset;
  } else {
    conversion.before_ = from.offset;
    conversion.numerator_ = numerator;
    conversion.denominator_ = denominator;
    conversion.after_ = -to.offset;
  }
  return conversion;
}

const ItemType* FindItemType(int code) {
  const auto found = std::ranges::lower_bound(AllItemTypes(), code, {}, &ItemType::code);
  return found != AllItemTypes().end() && found->code == code ? &*found : nullptr;
}

const ItemType* FindItemType(std::string_view codeOrName) {
  const std::string name = LowerCase(Trimmed(codeOrName));
  for (const ItemType& type : AllItemTypes())
    if (LowerCase(type.name) == name || std::to_string(type.code) == name) return &type;
  return nullptr;
}

const Unit* FindUnit(int key) {
  const auto found = std::ranges::lower_bound(AllUnits(), key, {}, &Unit::key);
  return found != AllUnits().end() && found->key == key ? &*found : nullptr;
}

const Unit& BaseUnit(const ItemType& itemType) { return *FindUnit(itemType.unitKeys.front()); }

bool AllowsUnit(const ItemType& itemType, int unitKey) {
  return std::ranges::find(itemType.unitKeys, unitKey) != itemType.unitKeys.end();
}

const Unit* FindUnitByText(const ItemType& itemType, std::string_view text) {
  for (const int key : itemType.unitKeys) {
    const Unit* unit = FindUnit(key);
    if (unit->text == text) return unit;
  }
  return nullptr;
}

std::optional<ParsedUnit> ParseUnit(std::string_view text) {
  if (const Unit* unit = UnitNamed(text)) return ParsedUnit{unit->scale, unit};
  const std::optional<UnitScale> scale = ScaleByUdunits(AsciiSpelling(text));
  if (!scale) return std::nullopt;
  const auto same = std::ranges::find_if(
      AllUnits(), [&](const Unit& unit) { return !unit.udunits.empty() && IsSameScale(unit.scale, *scale); });
  if (same == AllUnits().end()) return ParsedUnit{*scale, nullptr};
  return ParsedUnit{same->scale, &*same};
}

ParsedQuantity ParseQuantity(std::string_view text, const ItemType& itemType, int displayUnitKey) {
  const NumberAndUnit typed = SplitQuantity(text, itemType.name);
  if (!typed.error.empty()) return Refused(typed.error);
  const Unit& base = BaseUnit(itemType);
  UnitScale scale = DisplayUnit(itemType, displayUnitKey).scale;
  if (!typed.unit.empty()) {
    const std::optional<ParsedUnit> unit = TypedUnit(typed.unit);
    if (!unit || unit->scale.dimension != base.scale.dimension) {
      const std::string allowed = UnitsAllowedBy(itemType);
      if (allowed.empty()) return Refused(fmt::format("\"{}\": {} has no unit", Trimmed(text), itemType.name));
      return Refused(fmt::format("\"{}\": \"{}\" is no unit of {}, which takes {} and what converts to them",
                                 Trimmed(text), typed.unit, itemType.name, allowed));
    }
    scale = unit->scale;
  }
  const double value = (*ConversionBetween(scale, base.scale))(typed.number);
  if (!std::isfinite(value)) return Refused(fmt::format("\"{}\" is too large", Trimmed(text)));
  if (base.key == kWholeNumberUnit &&
      (std::trunc(value) != value || std::abs(value) > std::numeric_limits<int>::max())) {
    return Refused(fmt::format("\"{}\": {} takes a whole number of at most {} digits", Trimmed(text), itemType.name,
                               std::numeric_limits<int>::digits10));
  }
  return {value, {}};
}

ParsedQuantity ParseQuantity(std::string_view text, std::string_view unit) {
  const NumberAndUnit typed = SplitQuantity(text, {});
  if (!typed.error.empty()) return Refused(typed.error);
  std::string_view own = Trimmed(unit);
  if (own.starts_with('[') && own.ends_with(']')) own = Trimmed(own.substr(1, own.size() - 2));
  const bool isOwn = typed.unit == own || typed.unit == Trimmed(unit);
  if (typed.unit.empty() || isOwn) return {typed.number, {}};
  // What nobody can convert ("[-]", "[g metabolite/ g pesticide]") takes numbers alone.
  const std::optional<ParsedUnit> target = TypedUnit(own);
  const std::optional<ParsedUnit> source = target ? TypedUnit(typed.unit) : std::nullopt;
  const auto conversion = source ? ConversionBetween(source->scale, target->scale) : std::nullopt;
  if (!conversion) {
    const std::string_view offer = target ? " or in a unit that converts to it" : "";
    return Refused(own.empty() || own == "-"
                       ? fmt::format("\"{}\": a number without a unit was expected", Trimmed(text))
                       : fmt::format("\"{}\": a number in {}{} was expected", Trimmed(text), own, offer));
  }
  const double value = (*conversion)(typed.number);
  if (!std::isfinite(value)) return Refused(fmt::format("\"{}\" is too large", Trimmed(text)));
  return {value, {}};
}

std::string FormatNumber(double value, std::string_view format) {
  if (format.empty()) return ShortestNumber(value);
  const std::optional<NumberFormat> parsed = ParseNumberFormat(format);
  assert(parsed && "not a format for one number");
  const NumberFormat numberFormat = parsed.value_or(NumberFormat{});
  if (format.ends_with('d')) value = std::round(value) + 0.0;  // + 0.0: a rounded -0.2 is 0
  std::array<char, std::numeric_limits<double>::max_exponent10 + 120> buffer;
  const auto [end, error] =
      std::to_chars(buffer.data(), buffer.data() + buffer.size(), value, numberFormat.style, numberFormat.precision);
  return {buffer.data(), end};
}

std::string FormatQuantity(double baseValue, const ItemType& itemType, int displayUnitKey, std::string_view format) {
  return FormatNumber(Convert(baseValue, BaseUnit(itemType), DisplayUnit(itemType, displayUnitKey)), format);
}

int DisplayUnits::UnitKey(int itemType) const {
  if (const auto found = chosen_.find(itemType); found != chosen_.end()) return found->second;
  const ItemType* known = FindItemType(itemType);
  return known != nullptr ? known->unitKeys.front() : kDimensionlessUnit;
}

const Unit& DisplayUnits::UnitOf(const ItemType& itemType) const { return *FindUnit(UnitKey(itemType.code)); }

bool DisplayUnits::Choose(int itemType, int unitKey) {
  const ItemType* known = FindItemType(itemType);
  if (known == nullptr || !AllowsUnit(*known, unitKey)) return false;
  if (unitKey == known->unitKeys.front()) {
    chosen_.erase(itemType);
  } else {
    chosen_[itemType] = unitKey;
  }
  return true;
}

std::string DisplayUnits::Text() const {
  std::string result;
  for (const auto& [itemType, unitKey] : chosen_) {
    result += fmt::format("{}{}={}", result.empty() ? "" : " ", itemType, unitKey);
  }
  return result;
}

DisplayUnits DisplayUnits::FromText(std::string_view text, std::string& ignored) {
  DisplayUnits result;
  ignored.clear();
  while (!(text = Trimmed(text)).empty()) {
    const std::string_view choice = text.substr(0, text.find_first_of(" \t\r\n"));
    text.remove_prefix(choice.size());
    int itemType = 0;
    int unitKey = 0;
    const char* const end = choice.data() + choice.size();
    const auto code = std::from_chars(choice.data(), end, itemType);
    const bool hasKey = code.ec == std::errc() && code.ptr != end && *code.ptr == '=';
    const auto key = hasKey ? std::from_chars(code.ptr + 1, end, unitKey) : code;
    if (hasKey && key.ec == std::errc() && key.ptr == end && result.Choose(itemType, unitKey)) continue;
    ignored += (ignored.empty() ? "" : " ") + std::string(choice);
  }
  return result;
}

}  // namespace tervane
