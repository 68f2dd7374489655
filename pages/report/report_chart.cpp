// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <algorithm>
#include <cmath>
#include <limits>

#include <fmt/format.h>

#include "pages/report/report_pictures.h"

namespace tervane {

namespace {

constexpr double kChartWidth = 560, kPanelHeight = 150, kLeft = 62, kRight = 58;
constexpr std::size_t kMostNames = 8;  ///< In the legend.

struct Extent {
  double least = std::numeric_limits<double>::infinity(), most = -std::numeric_limits<double>::infinity();

  void Take(double value) {
    if (!std::isfinite(value)) return;
    least = std::min(least, value);
    most = std::max(most, value);
  }
  bool IsEmpty() const { return !(most >= least); }
  double Length() const { return most - least; }
};

/// The numbers at which ticks stand along a time axis, with what is read there.
std::vector<std::pair<double, std::string>> TimeTicks(const Extent& time) {
  const auto dateAt = [](double seconds) {
    return CYbDateTime::FromSecondsSinceEpoch(static_cast<std::int64_t>(seconds));
  };
  constexpr double kDay = 86400;
  const double days = time.Length() / kDay;
  std::vector<std::pair<double, std::string>> ticks;
  const int firstYear = dateAt(time.least).Year(), lastYear = dateAt(time.most).Year();
  if (days > 800) {
    const int step = std::max(1, static_cast<int>(std::ceil(days / 365 / 10)));
    for (int year = firstYear + 1; year <= lastYear; ++year)
      if (year % step == 0)
        ticks.emplace_back(static_cast<double>(CYbDateTime(year, 1, 1).SecondsSinceEpoch()), std::to_string(year));
  } else if (days > 60) {
    const int step = days > 400 ? 3 : days > 200 ? 2 : 1;
    for (int year = firstYear; year <= lastYear; ++year)
      for (int month = 1; month <= 12; month += step)
        ticks.emplace_back(static_cast<double>(CYbDateTime(year, month, 1).SecondsSinceEpoch()),
                           fmt::format("{:04}-{:02}", year, month));
  } else {
    const double step = days > 3 ? std::ceil(days / 6) * kDay : days > 0.5 ? kDay / 4 : 3600;
    for (double at = std::ceil(time.least / step) * step; at <= time.most; at += step)
      ticks.emplace_back(at, dateAt(at).Format(days > 3 ? "%Y-%m-%d" : "%m-%d %H:%M"));
  }
  std::erase_if(ticks, [&](const auto& tick) { return tick.first < time.least || tick.first > time.most; });
  return ticks;
}

/// A vertical axis: the values of one unit of a panel.
struct ValueAxis {
  std::string unit;
  Extent extent;
  bool isLogarithmic = false;
  std::vector<double> borders;

  double At(double value) const { return isLogarithmic ? std::log10(value) : value; }
  void Finish() {
    if (extent.IsEmpty()) return;
    if (!isLogarithmic && extent.Length() <= 0) {
      const double around = extent.most == 0.0 ? 1 : std::abs(extent.most) * 0.1;
      extent = {extent.least - around, extent.most + around};
    }
    borders = NiceBorders(extent.least, extent.most, 5);
    if (borders.size() < 2) borders = {extent.least, extent.least + 1};
    extent = {borders.front(), borders.back()};
  }
  /// From 0 at the bottom to 1 on top.
  double Part(double value) const { return (At(value) - extent.least) / extent.Length(); }
  std::string Text(double border) const {
    return isLogarithmic ? fmt::format("{:.3g}", std::pow(10, border)) : NumberAt(border, borders[1] - borders[0]);
  }
};

class ChartDrawing {
 public:
  explicit ChartDrawing(const SeriesContent& content) : content_(content) {
    for (const Series& series : content.series) {
      for (std::size_t place = 0; place < PointsOf(series); ++place) position_.Take(PositionOf(series, place));
      panels_ = std::max(panels_, series.panel + 1);
    }
    if (content.period && !content.numbers) {
      position_.Take(static_cast<double>(content.period->first.SecondsSinceEpoch()));
      position_.Take(static_cast<double>(content.period->second.SecondsSinceEpoch()));
    }
  }

  std::optional<ReportPicture> Draw() {
    if (position_.IsEmpty()) return std::nullopt;
    if (position_.Length() <= 0) position_ = {position_.least - 1, position_.most + 1};
    for (int panel = 0; panel < panels_; ++panel) DrawPanel(panel);
    DrawPositions();
    DrawNames();
    ReportPicture picture;
    picture.width = static_cast<int>(kLeft + kChartWidth + kRight);
    picture.height = static_cast<int>(bottom_ + 4);
    picture.svg = fmt::format(
        "<svg xmlns=\"http://www.w3.org/2000/svg\" width=\"{0}\" height=\"{1}\" viewBox=\"0 0 {0} {1}\" "
        "font-family=\"DejaVu Sans, Helvetica, Arial, sans-serif\" font-size=\"11\" fill=\"#202020\">\n{2}</svg>\n",
        picture.width, picture.height, svg_);
    return picture;
  }

 private:
  std::size_t PointsOf(const Series& series) const {
    return std::min(content_.numbers ? series.positions.size() : series.times.size(), series.values.size());
  }
  double PositionOf(const Series& series, std::size_t place) const {
    if (!content_.numbers) {
      const CYbDateTime& time = series.times[place];
      return time.IsValid() ? static_cast<double>(time.SecondsSinceEpoch()) : std::nan("");
    }
    const double position = series.positions[place];
    return content_.numbers->isLogarithmic ? std::log10(position) : position;
  }
  double X(double position) const { return kLeft + (position - position_.least) / position_.Length() * kChartWidth; }
  unsigned ColorOf(std::size_t number) const { return ReportColor(content_.series[number].color.value_or(number)); }

  void DrawPanel(int panel) {
    ValueAxis axes[2];
    std::size_t used = 0;
    std::vector<std::pair<std::size_t, std::size_t>> drawn;  // series, axis
    for (std::size_t number = 0; number < content_.series.size(); ++number) {
      const Series& series = content_.series[number];
      if (series.panel != panel) continue;
      std::size_t axis = 0;
      while (axis < used && axes[axis].unit != series.unit) ++axis;
      if (axis >= 2) continue;
      if (axis == used) axes[used++] = {series.unit, {}, series.isLogarithmic, {}};
      for (std::size_t place = 0; place < PointsOf(series); ++place)
        if (!axes[axis].isLogarithmic || series.values[place] > 0)
          axes[axis].extent.Take(axes[axis].At(series.values[place]));
      drawn.emplace_back(number, axis);
    }
    const double top = bottom_ + 18;
    bottom_ = top + kPanelHeight;
    for (ValueAxis& axis : axes) axis.Finish();
    if (content_.period && !content_.numbers) {
      const double from = X(static_cast<double>(content_.period->first.SecondsSinceEpoch()));
      const double to = X(static_cast<double>(content_.period->second.SecondsSinceEpoch()));
      if (to > from)
        svg_ += fmt::format("<rect x=\"{:.1f}\" y=\"{:.1f}\" width=\"{:.1f}\" height=\"{:.0f}\" fill=\"#eef3f8\"/>\n",
                            from, top, to - from, kPanelHeight);
    }
    for (std::size_t axis = 0; axis < used; ++axis) DrawAxis(axes[axis], top, axis == 1);
    for (const auto& [number, axis] : drawn)
      if (!axes[axis].extent.IsEmpty()) DrawSeries(content_.series[number], axes[axis], top, ColorOf(number));
    svg_ += fmt::format("<rect x=\"{}\" y=\"{:.1f}\" width=\"{}\" height=\"{}\" fill=\"none\" stroke=\"#909090\"/>\n",
                        kLeft, top, kChartWidth, kPanelHeight);
    if (static_cast<std::size_t>(panel) < content_.panelTitles.size())
      svg_ += fmt::format("<text x=\"{}\" y=\"{:.1f}\" font-weight=\"bold\">{}</text>\n", kLeft + 6, top + 14,
                          XmlText(content_.panelTitles[static_cast<std::size_t>(panel)]));
  }
  void DrawAxis(const ValueAxis& axis, double top, bool isRight) {
    const double x = isRight ? kLeft + kChartWidth + 5 : kLeft - 5;
    const char* anchor = isRight ? "start" : "end";
    for (const double border : axis.borders) {
      const double y = top + kPanelHeight * (1 - (border - axis.extent.least) / axis.extent.Length());
      if (!isRight) svg_ += fmt::format("<path d=\"M{} {:.1f}h{}\" stroke=\"#dddddd\"/>\n", kLeft, y, kChartWidth);
      svg_ += fmt::format("<text x=\"{}\" y=\"{:.1f}\" text-anchor=\"{}\">{}</text>\n", x, y + 4, anchor,
                          axis.Text(border));
    }
    if (!axis.unit.empty() && axis.unit != "-")
      svg_ += fmt::format("<text x=\"{}\" y=\"{:.1f}\" text-anchor=\"{}\" fill=\"#505050\">{}</text>\n", x, top - 6,
                          anchor, XmlText(axis.unit));
  }
  /// Of many values in one column of pixels the lowest and the highest are drawn.
  void DrawSeries(const Series& series, const ValueAxis& axis, double top, unsigned color) {
    const auto y = [&](double value) { return top + kPanelHeight * (1 - axis.Part(value)); };
    std::string path;
    bool isOpen = false;
    double columnAt = -1, low = 0, high = 0, lastY = 0;
    const auto flush = [&] {
      if (columnAt >= 0 && high > low)
        path += fmt::format("M{0:.1f} {1:.1f}L{0:.1f} {2:.1f}M{0:.1f} {3:.1f}", columnAt, low, high, lastY);
    };
    for (std::size_t place = 0; place < PointsOf(series); ++place) {
      const double value = series.values[place], position = PositionOf(series, place);
      if (!std::isfinite(value) || !std::isfinite(position) || (axis.isLogarithmic && value <= 0)) {
        flush();
        columnAt = -1;
        isOpen = false;
        continue;
      }
      const double x = X(position), at = y(value);
      if (series.isPoints) {
        svg_ += fmt::format("<circle cx=\"{:.1f}\" cy=\"{:.1f}\" r=\"2\" fill=\"{}\"/>\n", x, at, SvgColor(color));
        continue;
      }
      if (isOpen && x - columnAt < 0.5) {
        low = std::min(low, at);
        high = std::max(high, at);
        lastY = at;
        continue;
      }
      flush();
      if (isOpen && series.isStepped) path += fmt::format("L{:.1f} {:.1f}", columnAt, at);
      path += fmt::format("{}{:.1f} {:.1f}", isOpen ? "L" : "M", x, at);
      columnAt = x;
      low = high = lastY = at;
      isOpen = true;
    }
    flush();
    if (!path.empty())
      svg_ += fmt::format("<path d=\"{}\" fill=\"none\" stroke=\"{}\" stroke-width=\"1.1\"/>\n", path, SvgColor(color));
  }
  void DrawPositions() {
    std::vector<std::pair<double, std::string>> ticks;
    if (!content_.numbers) {
      ticks = TimeTicks(position_);
    } else {
      const std::vector<double> borders = NiceBorders(position_.least, position_.most, 7);
      for (const double border : borders)
        if (border >= position_.least && border <= position_.most)
          ticks.emplace_back(border, content_.numbers->isLogarithmic ? fmt::format("{:.3g}", std::pow(10, border))
                                     : borders.size() > 1            ? NumberAt(border, borders[1] - borders[0])
                                                                     : fmt::format("{:.3g}", border));
    }
    for (const auto& [position, text] : ticks)
      svg_ += fmt::format(
          "<path d=\"M{0:.1f} {1:.1f}v4\" stroke=\"#909090\"/><text x=\"{0:.1f}\" y=\"{2:.1f}\" "
          "text-anchor=\"middle\">{3}</text>\n",
          X(position), bottom_, bottom_ + 16, text);
    bottom_ += 22;
    if (content_.numbers && !content_.numbers->title.empty()) {
      const std::string unit = content_.numbers->unit.empty() ? "" : fmt::format(" [{}]", content_.numbers->unit);
      svg_ += fmt::format("<text x=\"{}\" y=\"{:.1f}\" text-anchor=\"middle\">{}</text>\n", kLeft + kChartWidth / 2,
                          bottom_ + 10, XmlText(content_.numbers->title + unit));
      bottom_ += 18;
    }
  }
  void DrawNames() {
    double x = kLeft;
    const auto& all = content_.series;
    for (std::size_t number = 0; number < std::min(all.size(), kMostNames); ++number) {
      const std::string text = number + 1 == kMostNames && all.size() > kMostNames
                                   ? fmt::format("and {} more", all.size() - number)
                                   : all[number].name;
      if (text.empty()) continue;
      const double width = 30 + 6.6 * static_cast<double>(text.size());
      if (x > kLeft && x + width > kLeft + kChartWidth) x = kLeft, bottom_ += 16;
      svg_ += fmt::format(
          "<path d=\"M{:.1f} {:.1f}h16\" stroke=\"{}\" stroke-width=\"2\"/><text x=\"{:.1f}\" y=\"{:.1f}\">{}</text>\n",
          x, bottom_ + 6, SvgColor(ColorOf(number)), x + 21, bottom_ + 10, XmlText(text));
      x += width;
    }
    bottom_ += 16;
  }

  const SeriesContent& content_;
  Extent position_;
  int panels_ = 1;
  double bottom_ = 0;
  std::string svg_;
};

}  // namespace

std::optional<ReportPicture> DrawChart(const SeriesContent& content) {
  return content.IsEmpty() ? std::nullopt : ChartDrawing(content).Draw();
}

}  // namespace tervane
