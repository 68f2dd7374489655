// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/maps/map_palette.h"

#include <QCoreApplication>
#include <algorithm>
#include <array>
#include <cmath>
#include <limits>
#include <span>

#include "platform/item_types.h"
#include "shell/widgets/qt_text.h"

namespace tervane {

namespace {

/// From low to high: lighter to darker, so that the order is seen without colours too, and neither end is lost on white
/// or dark paper.
constexpr std::array<QRgb, 7> kAmounts{0xfff6e7a1, 0xffc3dc8c, 0xff83c795, 0xff48aca5,
                                       0xff3388ad, 0xff3a62a8, 0xff4b3c8f};

/// Of the ground, from valleys to peaks.
constexpr std::array<QRgb, 7> kTerrain{0xff7fa868, 0xffaac37c, 0xffdccf96, 0xffc7a26b,
                                       0xffa27a58, 0xff9b8b83, 0xfff1efec};

// Their lightness, as the eye sees it, grows by equal steps.
constexpr std::array<QRgb, 9> kVioletToYellow{0xff34004d, 0xff331e7f, 0xff02469f, 0xff046b93, 0xff098a98,
                                              0xff08aa98, 0xff39ca81, 0xffa4da6c, 0xffefe670};
constexpr std::array<QRgb, 9> kBlueToYellow{0xff00245f, 0xff1b3b6f, 0xff3a5178, 0xff596880, 0xff807d73,
                                            0xff9c9577, 0xffbaac79, 0xffd9c57a, 0xfff8dd78};
constexpr std::array<QRgb, 9> kVioletToOrange{0xff250147, 0xff4e015d, 0xff771962, 0xff9f3160, 0xffc34e59,
                                              0xffe16f4e, 0xfff89547, 0xffffc165, 0xffffeba2};
/// Both sides of the middle grow darker alike.
constexpr std::array<QRgb, 9> kDifference{0xff0161bd, 0xff4b86cf, 0xff82a9db, 0xffb8cce6, 0xffeeeeee,
                                          0xffe4c0ba, 0xffd69288, 0xffc56358, 0xffaf2b25};

std::span<const QRgb> ColorsOf(Ramp ramp) {
  switch (ramp) {
    case Ramp::Terrain:
      return kTerrain;
    case Ramp::VioletToYellow:
      return kVioletToYellow;
    case Ramp::BlueToYellow:
      return kBlueToYellow;
    case Ramp::VioletToOrange:
      return kVioletToOrange;
    case Ramp::Difference:
      return kDifference;
    case Ramp::OfQuantity:
    case Ramp::Amounts:
      break;
  }
  return kAmounts;
}

/// Colours that are told apart side by side.
constexpr std::array<QRgb, 20> kDistinct{0xff4e79a7, 0xfff28e2b, 0xff59a14f, 0xffe15759, 0xffb07aa1,
                                         0xff76b7b2, 0xffedc948, 0xff9c755f, 0xffff9da7, 0xff6b8e23,
                                         0xffa0cbe8, 0xffffbe7d, 0xff8cd17d, 0xffd37295, 0xff499894,
                                         0xffd4a6c8, 0xffb6992d, 0xffd7b5a6, 0xff7b68c8, 0xff86bcb6};

constexpr QRgb kHighlight = 0xffe07b2a;
constexpr QRgb kOthers = 0xffa9b6c2;

/// Values of which so much lies at one end that equal classes would show nothing else.
struct Range {
  double low = 0, high = 0;
  bool isOpenBelow = false, isOpenAbove = false;
};

Range RangeOf(const CTvn2DOrthoRotatedGridData& grid, double smallest, double largest) {
  constexpr std::size_t kSamples = 20'000;
  constexpr double kOftenWider = 4;
  const std::vector<float>& values = grid.Values();
  std::vector<float> sample;
  // A stride that shares no factor with common row lengths, so that not always the same columns are met.
  const std::size_t stride = std::max<std::size_t>(1, values.size() / kSamples) | 1;
  for (std::size_t i = 0; i < values.size(); i += stride)
    if (!grid.IsEmptyValue(values[i])) sample.push_back(values[i]);
  Range range{smallest, largest};
  if (sample.size() < 50) return range;
  std::ranges::sort(sample);
  const double low = sample[sample.size() / 100], high = sample[sample.size() - 1 - sample.size() / 100];
  if (high <= low || largest - smallest < kOftenWider * (high - low)) return range;
  range.isOpenBelow = low - smallest > high - low;
  range.isOpenAbove = largest - high > high - low;
  if (range.isOpenBelow) range.low = low;
  if (range.isOpenAbove) range.high = high;
  return range;
}

}  // namespace

QRgb RampColor(double part, Ramp ramp) {
  const std::span<const QRgb> colors = ColorsOf(ramp);
  const double at = std::clamp(part, 0.0, 1.0) * static_cast<double>(colors.size() - 1);
  const auto low = std::min(static_cast<std::size_t>(at), colors.size() - 2);
  const double weight = at - static_cast<double>(low);
  const auto mix = [&](int a, int b) { return static_cast<int>(std::lround(a + weight * (b - a))); };
  const QRgb a = colors[low], b = colors[low + 1];
  return qRgb(mix(qRed(a), qRed(b)), mix(qGreen(a), qGreen(b)), mix(qBlue(a), qBlue(b)));
}

// Beyond the distinct colours hues step by the golden angle, which never comes near an earlier one soon.
QRgb CodeColor(std::size_t ordinal) {
  if (ordinal < kDistinct.size()) return kDistinct[ordinal];
  const double turn = static_cast<double>(ordinal) * 0.618033988749895;
  const int saturation = 75 + static_cast<int>(ordinal % 3) * 40;
  const int value = 235 - static_cast<int>(ordinal / 3 % 3) * 40;
  return QColor::fromHsv(static_cast<int>((turn - std::floor(turn)) * 359), saturation, value).rgb();
}

std::vector<double> ClassBorders(double smallest, double largest) {
  constexpr double kMostClasses = 10;
  // What a conversion of single precision numbers may be off a border, in steps.
  constexpr double kNoise = 1e-5;
  const double tiny = 1e-6 * std::max(std::abs(smallest), std::abs(largest));
  if (!(largest - smallest > tiny)) return {smallest};
  double step = NiceStep((largest - smallest) / kMostClasses * (1 - kNoise));
  const auto first = [&] { return std::floor(smallest / step + kNoise); };
  const auto last = [&] { return std::ceil(largest / step - kNoise); };
  while (last() - first() > kMostClasses) step = NiceStep(step * 1.01);
  std::vector<double> borders;
  for (double i = first(); i <= last(); ++i) borders.push_back(i * step);
  return borders;
}

QString NumberInSteps(double value, double step) {
  const double size = std::abs(step);
  if (size >= 1e7 || size < 1e-5) return ToQt(FormatNumber(value, "%.4g"));
  int decimals = 0;
  for (double scaled = size; decimals < 7 && std::abs(scaled - std::round(scaled)) > 1e-6 * scaled; scaled *= 10)
    ++decimals;
  return QString::number(value == 0 ? 0.0 : value, 'f', decimals);
}

// ---- Legends

void LegendBlock::Add(const QColor& color, const QString& text) {
  if (rows.size() < kMostRows)
    rows.push_back({color, text});
  else
    ++hidden;
}

QString TitleWithUnit(QString title, const std::string& unit) {
  if (!unit.empty()) title += (title.isEmpty() ? "[" : " [") + ToQt(unit) + "]";
  return title;
}

// ---- Colours of numbers

ValueColors::ValueColors(const ValueScale& scale, const std::vector<double>& values, const DisplayUnits* units)
    : names_(scale.names), unit_(scale.itemType, scale.unit, units) {
  legend_.title = names_.empty() ? TitleWithUnit(Translated(scale.title), unit_.Text()) : Translated(scale.title);
  if (names_.empty())
    MakeClasses(values);
  else
    MakeKinds(values);
}

void ValueColors::MakeKinds(const std::vector<double>& values) {
  for (std::size_t i = 0; i < names_.size(); ++i) {
    colors_.emplace_back(CodeColor(i));
    legend_.Add(colors_.back(), ToQt(names_[i].second));
  }
  colors_.emplace_back(kOthers);
  if (std::ranges::any_of(values, [&](double value) { return Number(value) == names_.size(); }))
    legend_.Add(colors_.back(), QCoreApplication::translate("MapPalette", "others"));
}

void ValueColors::MakeClasses(const std::vector<double>& values) {
  legend_.isScale = true;
  std::optional<std::pair<double, double>> range;
  for (const double value : values) {
    if (!std::isfinite(value)) continue;
    if (!range) range = {value, value};
    range = {std::min(range->first, value), std::max(range->second, value)};
  }
  if (range) {
    const std::vector<double> shown = ClassBorders(unit_.Shown(range->first), unit_.Shown(range->second));
    for (const double border : shown) borders_.push_back(unit_.Stored(border));
    if (shown.size() == 1) {
      borders_.push_back(borders_.front());
      colors_.emplace_back(RampColor(0.5));
      legend_.rows.push_back({colors_.back(), ToQt(FormatNumber(shown.front(), "%.6g"))});
    }
    for (std::size_t i = 0; i + 1 < shown.size(); ++i) {
      // The palest colours are too weak for a line.
      constexpr double kPalest = 0.2;
      const double part = static_cast<double>(i) / static_cast<double>(shown.size() - 2);
      colors_.emplace_back(RampColor(kPalest + (1 - kPalest) * part));
      const double step = shown[1] - shown[0];
      legend_.rows.insert(legend_.rows.begin(),
                          {colors_.back(), QString::fromUtf8("%1 – %2").arg(NumberInSteps(shown[i], step),
                                                                            NumberInSteps(shown[i + 1], step))});
    }
  }
  colors_.emplace_back(kOthers);
}

std::size_t ValueColors::Number(double value) const {
  if (!names_.empty()) {
    const auto found = std::ranges::find(names_, value, &std::pair<double, std::string>::first);
    return static_cast<std::size_t>(found - names_.begin());
  }
  if (std::isnan(value) || borders_.size() < 2) return colors_.size() - 1;
  const auto above = std::upper_bound(borders_.begin() + 1, borders_.end() - 1, value) - borders_.begin() - 1;
  return static_cast<std::size_t>(above);
}

QString ValueColors::TextOf(double value) const {
  const auto found = std::ranges::find(names_, value, &std::pair<double, std::string>::first);
  return found != names_.end() ? ToQt(found->second) : unit_.Value(value);
}

// ---- Colours of grids

MapPalette MapPalette::Of(const GridLayer& layer, const DisplayUnits* units) {
  const CTvn2DOrthoRotatedGridData& grid = *layer.grid;
  MapPalette palette;
  palette.deleteValue_ = grid.DeleteValue();
  palette.colors_ = {qRgba(0, 0, 0, 0)};
  if (layer.highlighted.code)
    palette.MakeHighlighted(layer);
  else if (!layer.classes.empty())
    palette.MakeOwnClasses(layer.classes);
  else if (layer.isCodes)
    palette.MakeCodes(layer);
  else if (!layer.scale.empty())
    palette.MakeScale(layer.scale, ShownUnit(grid.ItemType(), grid.ItemUnit(), units));
  else
    palette.MakeClasses(layer, ShownUnit(grid.ItemType(), grid.ItemUnit(), units));
  return palette;
}

void MapPalette::MakeClasses(const GridLayer& layer, const ShownUnit& unit) {
  Range range;
  if (layer.range) {
    range = {static_cast<double>(layer.range->first), static_cast<double>(layer.range->second)};
  } else {
    float largest = 0, smallest = 0;
    if (!layer.grid->GetMaxMin(largest, smallest)) return;
    constexpr float kMost = std::numeric_limits<float>::max();
    range = RangeOf(*layer.grid, std::max(smallest, -kMost), std::min(largest, kMost));
  }
  const bool isGround = layer.ramp == Ramp::OfQuantity && layer.grid->ItemType() == quantity::kElevation;
  const Ramp ramp = isGround ? Ramp::Terrain : layer.ramp;
  // The numbers are to be nice in the unit in which the user sees them.
  legend_.isScale = true;
  const std::vector<double> shown = ClassBorders(unit.Shown(range.low), unit.Shown(range.high));
  for (const double border : shown) borders_.push_back(unit.Stored(border));
  if (shown.size() == 1) {
    borders_.push_back(borders_.front());
    colors_.push_back(RampColor(0.5, ramp));
    legend_.rows.push_back({QColor(colors_.back()), ToQt(FormatNumber(shown.front(), "%.6g"))});
    return;
  }
  const std::size_t classes = shown.size() - 1;
  perClass_ = static_cast<double>(classes) / (borders_.back() - borders_.front());
  const double step = shown[1] - shown[0];
  for (std::size_t i = 0; i < classes; ++i) {
    colors_.push_back(RampColor(static_cast<double>(i) / static_cast<double>(classes - 1), ramp));
    const QString from = NumberInSteps(shown[i], step), to = NumberInSteps(shown[i + 1], step);
    QString text = QString::fromUtf8("%1 – %2").arg(from, to);
    if (i == 0 && range.isOpenBelow) text = QCoreApplication::translate("MapPalette", "below %1").arg(to);
    if (i + 1 == classes && range.isOpenAbove) text = QCoreApplication::translate("MapPalette", "above %1").arg(from);
    legend_.rows.insert(legend_.rows.begin(), {QColor(colors_.back()), text});
  }
}

void MapPalette::MakeScale(const std::vector<ScaleClass>& classes, const ShownUnit& unit) {
  kind_ = Kind::Scale;
  legend_.isScale = true;
  const std::size_t count = std::min<std::size_t>(classes.size(), kMostColors);
  const auto shown = [&](std::size_t i) { return unit.Shown(classes[i].upTo); };
  const double step = count > 1 ? shown(1) - shown(0) : 1;
  for (std::size_t i = 0; i < count; ++i) {
    upTo_.push_back(static_cast<float>(classes[i].upTo));
    colors_.push_back(qRgb(0, 0, 0) | classes[i].color);
    const QString to = NumberInSteps(shown(i), step);
    const QString text = i == 0 ? QCoreApplication::translate("MapPalette", "up to %1").arg(to)
                                : QString::fromUtf8("%1 – %2").arg(NumberInSteps(shown(i - 1), step), to);
    legend_.rows.insert(legend_.rows.begin(), {QColor(colors_.back()), text});
  }
}

void MapPalette::MakeShades() {
  std::vector<QRgb> shaded{colors_.front()};
  for (std::size_t i = 1; i < colors_.size(); ++i)
    for (int shade = 0; shade < kShades; ++shade) {
      // The middle one is the colour itself.
      constexpr double kDarkest = 0.45, kLightest = 1.35;
      const double light = kDarkest + (kLightest - kDarkest) * shade / (kShades - 1);
      const auto lit = [&](int part) { return std::min(255, static_cast<int>(std::lround(part * light))); };
      shaded.push_back(qRgb(lit(qRed(colors_[i])), lit(qGreen(colors_[i])), lit(qBlue(colors_[i]))));
    }
  colors_ = std::move(shaded);
}

void MapPalette::MakeCodes(const GridLayer& layer) {
  constexpr unsigned kSmallCodes = 1 << 16;
  kind_ = Kind::Codes;
  if (!layer.grid->GetIntValues(codes_)) return;
  const std::size_t count = std::min<std::size_t>(codes_.size(), kMostColors);
  for (std::size_t i = 0; i < count; ++i) colors_.push_back(CodeColor(i));
  colorOfCode_.resize(std::min(codes_.back() + 1, kSmallCodes));
  for (std::size_t i = 0; i < codes_.size() && codes_[i] < colorOfCode_.size(); ++i)
    colorOfCode_[codes_[i]] = static_cast<std::uint8_t>(1 + i % kMostColors);
  for (std::size_t i = 0; i < codes_.size(); ++i) {
    const auto name = std::ranges::find(layer.names, codes_[i], &std::pair<unsigned, std::string>::first);
    legend_.Add(QColor(colors_[1 + i % kMostColors]),
                name == layer.names.end() ? QString::number(codes_[i]) : ToQt(name->second));
  }
}

void MapPalette::MakeHighlighted(const GridLayer& layer) {
  kind_ = Kind::Highlighted;
  highlighted_ = *layer.highlighted.code;
  colors_ = {colors_.front(), kHighlight, kOthers};
  legend_.Add(QColor(kHighlight), ToQt(FormatNumber(static_cast<double>(highlighted_), "%.6g")));
  legend_.Add(QColor(kOthers), QCoreApplication::translate("MapPalette", "others"));
}

void MapPalette::MakeOwnClasses(const std::vector<CellClass>& classes) {
  kind_ = Kind::OwnClasses;
  for (const CellClass& each : classes) {
    if (ownValues_.size() == kMostColors) return;
    ownValues_.push_back(each.value);
    colors_.push_back(qRgb(0, 0, 0) | each.color);
    legend_.Add(QColor(colors_.back()), ToQt(each.name));
  }
}

std::uint8_t MapPalette::ColorNumber(float value) const {
  if (value == deleteValue_ || value != value) return 0;
  switch (kind_) {
    case Kind::Highlighted:
      return value == highlighted_ ? 1 : 2;
    case Kind::Codes: {
      const double code = std::floor(static_cast<double>(value) + 0.5);
      if (!(code >= 0) || code >= 4294967296.0) return 0;
      const auto whole = static_cast<unsigned>(code);
      if (whole < colorOfCode_.size()) return colorOfCode_[whole];
      const auto found = std::ranges::lower_bound(codes_, whole);
      if (found == codes_.end() || *found != whole) return 0;
      return static_cast<std::uint8_t>(1 + (found - codes_.begin()) % kMostColors);
    }
    case Kind::OwnClasses: {
      const auto found = std::ranges::find(ownValues_, value);
      return found == ownValues_.end() ? std::uint8_t{0} : static_cast<std::uint8_t>(1 + (found - ownValues_.begin()));
    }
    case Kind::Scale: {
      const auto place = std::ranges::lower_bound(upTo_, value) - upTo_.begin();
      return static_cast<std::uint8_t>(1 + std::min(place, static_cast<std::ptrdiff_t>(upTo_.size()) - 1));
    }
    case Kind::Classes:
      break;
  }
  const auto classes = static_cast<int>(borders_.size()) - 1;
  if (classes < 1) return 0;
  const double number = (static_cast<double>(value) - borders_.front()) * perClass_;
  int index = number >= classes ? classes - 1 : number > 0 ? static_cast<int>(number) : 0;
  // The estimate may miss by a rounding at a border; a border belongs to the class above it. Borders are exact for the
  // cell's type: 0.3 in a file is to be the border 0.3.
  const auto border = [&](int i) { return static_cast<float>(borders_[static_cast<std::size_t>(i)]); };
  if (index + 1 < classes && value >= border(index + 1)) ++index;
  if (index > 0 && value < border(index)) --index;
  return static_cast<std::uint8_t>(1 + index);
}

}  // namespace tervane
