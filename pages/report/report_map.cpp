// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <algorithm>
#include <array>
#include <cmath>
#include <map>

#include <fmt/format.h>

#include "pages/report/png.h"
#include "pages/report/report_pictures.h"
#include "platform/text.h"

namespace tervane {

namespace {

constexpr double kMapWidth = 470, kMapHeight = 440, kLegendWidth = 190;
constexpr int kMostPixels = 700;         ///< Of an image along a side.
constexpr std::size_t kMostLegend = 16;  ///< Rows of a layer.
constexpr std::size_t kMostLabels = 25;  ///< Points that bear their names.
constexpr unsigned kHighlight = 0xef8636, kOthers = 0xe4e4e4, kOutline = 0x404040, kDomainLine = 0xb03030,
                   kDomainFill = 0xdde8f2, kWater = 0x2060b0;

struct LegendRow {
  unsigned color;
  std::string text;
};
struct Legend {
  std::string title;
  std::vector<LegendRow> rows;
};

unsigned Mixed(unsigned from, unsigned to, double part) {
  unsigned mixed = 0;
  for (unsigned shift = 0; shift <= 16; shift += 8) {
    const double a = from >> shift & 0xffU, b = to >> shift & 0xffU;
    mixed |= static_cast<unsigned>(std::lround(a + (b - a) * part)) << shift;
  }
  return mixed;
}

unsigned RampAt(double part, bool isGround) {
  constexpr std::array<unsigned, 6> kGround{0x2f7d4f, 0x8fb45c, 0xe6d98c, 0xc79a5b, 0x8c6446, 0xf4f1ee};
  constexpr std::array<unsigned, 5> kAmounts{0xf3f6e4, 0xb8dcc4, 0x5fb3c4, 0x2b6fb0, 0x16305e};
  const auto at = [part](const auto& stops) {
    const double place = std::clamp(part, 0.0, 1.0) * static_cast<double>(stops.size() - 1);
    const auto below = std::min(static_cast<std::size_t>(place), stops.size() - 2);
    return Mixed(stops[below], stops[below + 1], place - static_cast<double>(below));
  };
  return isGround ? at(kGround) : at(kAmounts);
}

std::string TitleOf(const CTvn2DOrthoRotatedGridData& grid) {
  const ItemType* type = FindItemType(grid.ItemType());
  std::string title = !grid.ItemName().empty() ? grid.ItemName() : type ? std::string(type->name) : std::string();
  const Unit* unit = FindUnit(grid.ItemUnit());
  if (unit && !unit->abbreviation.empty() && unit->abbreviation != "()")
    title += fmt::format(" [{}]", unit->abbreviation);
  return title;
}

/// The colours of the cells of a layer by numbers from 1, with what the legend says of them.
class LayerColors {
 public:
  explicit LayerColors(const GridLayer& layer) : layer_(layer) {
    legend_.title = TitleOf(*layer.grid);
    if (layer.highlighted.code)
      MakeHighlighted(*layer.highlighted.code);
    else if (!layer.classes.empty())
      MakeOwn();
    else if (layer.isCodes)
      MakeCodes();
    else
      MakeClasses();
  }
  std::uint8_t NumberOf(float value) const {
    if (layer_.grid->IsEmptyValue(value)) return 0;
    if (!byValue_.empty()) {
      const auto found = byValue_.find(layer_.classes.empty() ? std::round(value) : value);
      return found == byValue_.end() ? numberOfOthers_ : found->second;
    }
    if (borders_.size() < 2) return 1;
    const auto above = std::upper_bound(borders_.begin() + 1, borders_.end() - 1, static_cast<double>(value));
    return static_cast<std::uint8_t>(above - borders_.begin());
  }
  const std::vector<unsigned>& Colors() const { return colors_; }
  const Legend& Rows() const { return legend_; }

 private:
  void Add(unsigned color, std::string text) {
    colors_.push_back(color);
    if (legend_.rows.size() < kMostLegend) legend_.rows.push_back({color, std::move(text)});
  }
  void MakeHighlighted(float code) {
    byValue_[code] = 1;
    numberOfOthers_ = 2;
    colors_.insert(colors_.end(), {kHighlight, kOthers});
    legend_.title.clear();
  }
  void MakeOwn() {
    for (const CellClass& each : layer_.classes) {
      if (colors_.size() > 255) break;
      byValue_[each.value] = static_cast<std::uint8_t>(colors_.size());
      Add(each.color, each.name);
    }
  }
  void MakeCodes() {
    std::vector<unsigned> codes;
    layer_.grid->GetIntValues(codes);
    for (std::size_t place = 0; place < codes.size(); ++place) {
      const auto number = static_cast<std::uint8_t>(1 + place % 255);
      byValue_[static_cast<float>(codes[place])] = number;
      const auto name = std::ranges::find(layer_.names, codes[place], &std::pair<unsigned, std::string>::first);
      std::string text = name != layer_.names.end() ? name->second : std::to_string(codes[place]);
      // Without a legend it lies below what the map is about.
      const unsigned color = ReportColor(place);
      if (place < 255) Add(layer_.withLegend ? color : Mixed(color, 0xffffff, 0.75), std::move(text));
    }
    if (codes.size() > kMostLegend)
      legend_.rows.push_back({0xffffff, fmt::format("and {} more", codes.size() - kMostLegend)});
  }
  void MakeClasses() {
    float largest = 0, smallest = 0;
    if (!layer_.grid->GetMaxMin(largest, smallest)) return;
    if (layer_.range) smallest = layer_.range->first, largest = layer_.range->second;
    borders_ = NiceBorders(static_cast<double>(smallest), static_cast<double>(largest), 10);
    const bool isGround = layer_.ramp == Ramp::Terrain ||
                          (layer_.ramp == Ramp::OfQuantity && layer_.grid->ItemType() == quantity::kElevation);
    if (borders_.size() < 2) return Add(RampAt(0.5, isGround), ShortestNumber(smallest));
    const std::size_t classes = borders_.size() - 1;
    const double step = borders_[1] - borders_[0];
    for (std::size_t each = 0; each < classes; ++each)
      Add(RampAt(static_cast<double>(each) / static_cast<double>(std::max<std::size_t>(classes - 1, 1)), isGround),
          fmt::format("{} – {}", NumberAt(borders_[each], step), NumberAt(borders_[each + 1], step)));
    // The highest on top, as on the scale of a gauge.
    std::ranges::reverse(legend_.rows);
  }

  const GridLayer& layer_;
  std::vector<unsigned> colors_{0xffffff};
  std::vector<double> borders_;
  std::map<float, std::uint8_t> byValue_;
  std::uint8_t numberOfOthers_ = 0;
  Legend legend_;
};

class MapDrawing {
 public:
  explicit MapDrawing(const Envelope& area) : area_(area) {
    const double width = area.xMax - area.xMin, height = area.yMax - area.yMin;
    scale_ = std::min(kMapWidth / width, kMapHeight / height);
    width_ = width * scale_;
    height_ = height * scale_;
  }

  void Add(const GridLayer& layer) {
    const CTvn2DOrthoRotatedGridData& grid = *layer.grid;
    const GridGeometry& geometry = grid.Geometry();
    if (geometry.CellCount() == 0 || grid.Values().size() != geometry.CellCount()) return;
    const LayerColors colors(layer);
    const int step = (std::max(geometry.nx, geometry.ny) + kMostPixels - 1) / kMostPixels;
    IndexedImage image{(geometry.nx + step - 1) / step, (geometry.ny + step - 1) / step, {}, colors.Colors()};
    for (int row = image.height - 1; row >= 0; --row)
      for (int column = 0; column < image.width; ++column)
        image.pixels.push_back(colors.NumberOf(grid.Value(column * step, row * step)));
    const GridTransform transform(geometry);
    const double right = static_cast<double>(image.width) * step, top = static_cast<double>(image.height) * step;
    const MapPoint corner = Place(transform.ToWorld({0, top})), east = Place(transform.ToWorld({right, top})),
                   south = Place(transform.ToWorld({0, 0}));
    svg_ += fmt::format(
        "<image width=\"{}\" height=\"{}\" preserveAspectRatio=\"none\" "
        "transform=\"matrix({:.6f} {:.6f} {:.6f} {:.6f} {:.3f} {:.3f})\" "
        "style=\"image-rendering:pixelated\" xlink:href=\"data:image/png;base64,{}\"/>\n",
        image.width, image.height, (east.x - corner.x) / image.width, (east.y - corner.y) / image.width,
        (south.x - corner.x) / image.height, (south.y - corner.y) / image.height, corner.x, corner.y,
        Base64(PngOf(image)));
    if (layer.withLegend) AddLegend(colors.Rows());
  }

  void Add(const ShapeLayer& layer) {
    if (!layer.shapes) return;
    const bool arePoints = layer.shapes->Kind() == ShapeKind::Point || layer.shapes->Kind() == ShapeKind::MultiPoint;
    const bool areFilled = layer.isFilled && !layer.isDomain && layer.shapes->Kind() == ShapeKind::Polygon;
    std::map<std::string, unsigned> fills;
    Legend legend;
    std::size_t place = 0;
    for (const Shape& shape : layer.shapes->GetData()) {
      const bool isHighlighted = layer.highlighted.IsOfShape(place++, shape);
      if (arePoints) {
        for (const MapPoint& point : shape.points) AddDot(point, kOutline);
        continue;
      }
      std::string fill = "none";
      if (areFilled && shape.HasValue()) {
        const std::string value = TextOf(shape.Value());
        // Quiet, so that lines over it are seen.
        const auto [known, isNew] = fills.try_emplace(value, Mixed(ReportColor(fills.size()), 0xffffff, 0.4));
        fill = SvgColor(known->second);
        const auto name = std::ranges::find(layer.names, value, &std::pair<std::string, std::string>::first);
        if (isNew && legend.rows.size() < kMostLegend)
          legend.rows.push_back({known->second, name != layer.names.end() ? name->second : value});
      }
      if (layer.isDomain && layer.isFilled) fill = SvgColor(kDomainFill);
      if (isHighlighted && layer.shapes->Kind() == ShapeKind::Polygon) fill = SvgColor(kHighlight);
      std::string path;
      for (std::size_t part = 0; part < shape.parts.size(); ++part)
        AddPath(path, std::span(shape.points).subspan(shape.parts[part], shape.PartEnd(part) - shape.parts[part]),
                layer.shapes->Kind() == ShapeKind::Polygon);
      svg_ += fmt::format(
          "<path d=\"{}\" fill=\"{}\"  fill-rule=\"evenodd\" stroke=\"{}\" "
          "stroke-width=\"{}\"/>\n",
          path, fill, SvgColor(layer.lineColor.value_or(layer.isDomain ? kDomainLine : kOutline)),
          layer.isDomain ? 1.8 : 0.8);
    }
    if (fills.size() > kMostLegend)
      legend.rows.push_back({0xffffff, fmt::format("and {} more", fills.size() - kMostLegend)});
    if (!legend.rows.empty()) AddLegend(legend);
  }

  void Add(const LineLayer& layer) {
    if (!layer.lines) return;
    std::map<double, unsigned> paints;
    Legend legend;
    if (layer.painted) legend.title = layer.painted->title;
    for (const MapLine& line : *layer.lines) {
      unsigned color = layer.lineColor.value_or(kWater);
      if (layer.painted && line.value) {
        const auto [known, isNew] = paints.try_emplace(*line.value, ReportColor(paints.size()));
        color = known->second;
        const auto name = std::ranges::find(layer.painted->names, *line.value, &std::pair<double, std::string>::first);
        if (isNew && legend.rows.size() < kMostLegend)
          legend.rows.push_back(
              {color, name != layer.painted->names.end() ? name->second : ShortestNumber(*line.value)});
      }
      std::string path;
      AddPath(path, line.points, false);
      svg_ += fmt::format("<path d=\"{}\" fill=\"none\" stroke=\"{}\" stroke-width=\"{}\"/>\n", path, SvgColor(color),
                          layer.lineWidth.value_or(1.6));
    }
    if (!legend.rows.empty()) AddLegend(legend);
  }

  void Add(const PointLayer& layer) {
    const bool withLabels = layer.points.size() <= kMostLabels;
    for (std::size_t place = 0; place < layer.points.size(); ++place) {
      AddDot(layer.points[place], 0xc02020);
      if (!withLabels || place >= layer.labels.size()) continue;
      const MapPoint at = Place(layer.points[place]);
      svg_ += fmt::format("<text x=\"{:.1f}\" y=\"{:.1f}\" font-size=\"10\">{}</text>\n", at.x + 5, at.y + 3,
                          XmlText(layer.labels[place]));
    }
  }

  ReportPicture Finish() {
    const double legendHeight = static_cast<double>(legendLine_) * kLine + 8;
    const double height = std::max(height_, legendHeight) + 34;
    ReportPicture picture;
    picture.width = static_cast<int>(width_ + 24 + (legend_.empty() ? 0 : kLegendWidth));
    picture.height = static_cast<int>(height);
    picture.svg = fmt::format(
        "<svg xmlns=\"http://www.w3.org/2000/svg\" xmlns:xlink=\"http://www.w3.org/1999/xlink\" width=\"{0}\" "
        "height=\"{1}\" viewBox=\"0 0 {0} {1}\" font-family=\"DejaVu Sans, Helvetica, Arial, sans-serif\" "
        "font-size=\"11\" fill=\"#202020\">\n<g transform=\"translate(1 1)\">\n{2}"
        "<rect x=\"0\" y=\"0\" width=\"{3:.1f}\" height=\"{4:.1f}\" fill=\"none\" stroke=\"#909090\" "
        "stroke-width=\"1\"/>\n{5}</g>\n<g transform=\"translate({6:.1f} 10)\">\n{7}</g>\n</svg>\n",
        picture.width, picture.height, svg_, width_, height_, ScaleBar(), width_ + 18, legend_);
    return picture;
  }

 private:
  static constexpr double kLine = 16;

  MapPoint Place(const MapPoint& point) const {
    return {(point.x - area_.xMin) * scale_, (area_.yMax - point.y) * scale_};
  }
  void AddDot(const MapPoint& point, unsigned color) {
    const MapPoint at = Place(point);
    svg_ += fmt::format("<circle cx=\"{:.1f}\" cy=\"{:.1f}\" r=\"3\" fill=\"{}\" stroke=\"#ffffff\"/>\n", at.x, at.y,
                        SvgColor(color));
  }
  /// Points that would lie within half a pixel of the one before are left out.
  void AddPath(std::string& path, std::span<const MapPoint> points, bool isClosed) const {
    MapPoint last;
    for (std::size_t place = 0; place < points.size(); ++place) {
      const MapPoint at = Place(points[place]);
      const bool isEnd = place == 0 || place + 1 == points.size();
      if (!isEnd && std::hypot(at.x - last.x, at.y - last.y) < 0.5) continue;
      path += fmt::format("{}{:.1f} {:.1f}", place == 0 ? "M" : "L", at.x, at.y);
      last = at;
    }
    if (isClosed && !points.empty()) path += "Z";
  }
  void AddLegend(const Legend& legend) {
    const auto line = [this] { return static_cast<double>(legendLine_++) * kLine; };
    if (legendLine_ > 0) ++legendLine_;
    if (!legend.title.empty())
      legend_ +=
          fmt::format("<text x=\"0\" y=\"{:.0f}\" font-weight=\"bold\">{}</text>\n", line() + 6, XmlText(legend.title));
    for (const LegendRow& row : legend.rows) {
      const double y = line();
      legend_ += fmt::format(
          "<rect x=\"0\" y=\"{:.0f}\" width=\"16\" height=\"12\" fill=\"{}\"/><text x=\"22\" y=\"{:.0f}\">{}"
          "</text>\n",
          y - 4, SvgColor(row.color), y + 6, XmlText(row.text));
    }
  }
  /// A length that people like, of about a quarter of the map.
  std::string ScaleBar() const {
    const double most = width_ / scale_ / 4;
    double length = std::pow(10, std::floor(std::log10(most)));
    for (const double factor : {5.0, 2.0})
      if (length * factor <= most) {
        length *= factor;
        break;
      }
    return fmt::format(
        "<path d=\"M0 {0:.1f}v6h{1:.1f}v-6\" fill=\"none\" stroke=\"#202020\"/><text x=\"{2:.1f}\" "
        "y=\"{3:.1f}\">{4}</text>\n",
        height_ + 8, length * scale_, length * scale_ + 6, height_ + 18,
        length >= 1000 ? fmt::format("{} km", ShortestNumber(length / 1000))
                       : fmt::format("{} m", ShortestNumber(length)));
  }

  Envelope area_;
  double scale_ = 1, width_ = 0, height_ = 0;
  std::string svg_, legend_;
  int legendLine_ = 0;
};

/// The smallest rectangle around all that is drawn, with a narrow rim.
std::optional<Envelope> AreaOf(const MapContent& content) {
  std::optional<Envelope> area;
  const auto take = [&](double x, double y) {
    if (!std::isfinite(x) || !std::isfinite(y)) return;
    if (!area) area = Envelope{x, y, x, y};
    *area = {std::min(area->xMin, x), std::min(area->yMin, y), std::max(area->xMax, x), std::max(area->yMax, y)};
  };
  if (content.area) area = content.area;
  for (const GridLayer& layer : content.grids) {
    if (!layer.grid || content.area) continue;
    const Envelope box = layer.grid->GetEnvelope();
    take(box.xMin, box.yMin);
    take(box.xMax, box.yMax);
  }
  if (!area) {
    for (const ShapeLayer& layer : content.shapes)
      if (layer.shapes)
        for (const Shape& shape : layer.shapes->GetData())
          for (const MapPoint& point : shape.points) take(point.x, point.y);
    for (const LineLayer& layer : content.lines)
      if (layer.lines)
        for (const MapLine& line : *layer.lines)
          for (const MapPoint& point : line.points) take(point.x, point.y);
    for (const PointLayer& layer : content.points)
      for (const MapPoint& point : layer.points) take(point.x, point.y);
  }
  if (!area) return std::nullopt;
  const double rim = std::max({area->xMax - area->xMin, area->yMax - area->yMin, 1.0}) * 0.02;
  return Envelope{area->xMin - rim, area->yMin - rim, area->xMax + rim, area->yMax + rim};
}

}  // namespace

std::optional<ReportPicture> DrawMap(const MapContent& content) {
  const std::optional<Envelope> area = AreaOf(content);
  if (!area || (content.grids.empty() && content.shapes.empty() && content.lines.empty() && content.points.empty()))
    return std::nullopt;
  MapDrawing drawing(*area);
  for (const GridLayer& layer : content.grids)
    if (layer.grid) drawing.Add(layer);
  for (const ShapeLayer& layer : content.shapes) drawing.Add(layer);
  if (content.domain) drawing.Add(ShapeLayer{.shapes = content.domain, .isDomain = true});
  for (const LineLayer& layer : content.lines) drawing.Add(layer);
  for (const PointLayer& layer : content.points) drawing.Add(layer);
  return drawing.Finish();
}

std::string XmlText(std::string_view text) {
  std::string xml;
  for (const char c : Printable(text)) {
    switch (c) {
      case '&':
        xml += "&amp;";
        break;
      case '<':
        xml += "&lt;";
        break;
      case '>':
        xml += "&gt;";
        break;
      case '"':
        xml += "&quot;";
        break;
      default:
        xml += c;
    }
  }
  return xml;
}

std::string SvgColor(unsigned color) { return fmt::format("#{:06x}", color & 0xffffffU); }

unsigned ReportColor(std::size_t number) {
  constexpr std::array<unsigned, 12> kColors{0x3b75af, 0xef8636, 0x519e3e, 0xc53a32, 0x8d69b8, 0x84584e,
                                             0xd57dbe, 0x7f7f7f, 0xbcbd45, 0x58bbcc, 0x1f4e79, 0x7a9a01};
  return kColors[number % kColors.size()];
}

std::vector<double> NiceBorders(double smallest, double largest, int most) {
  if (!(largest > smallest) || !std::isfinite(largest - smallest)) return {smallest};
  const double rough = (largest - smallest) / most;
  double step = std::pow(10, std::floor(std::log10(rough)));
  for (const double factor : {1.0, 2.0, 5.0, 10.0})
    if (step * factor >= rough) {
      step *= factor;
      break;
    }
  std::vector<double> borders;
  const double first = std::floor(smallest / step), last = std::ceil(largest / step);
  for (double each = first; each <= last; ++each) borders.push_back(each * step);
  return borders;
}

std::string NumberAt(double value, double step) {
  const int decimals = step > 0 && step < 1 ? static_cast<int>(std::ceil(-std::log10(step) - 1e-9)) : 0;
  if (decimals > 6) return fmt::format("{:.3g}", value);
  const std::string text = fmt::format("{:.{}f}", value, decimals);
  return text.find_first_not_of("-0.") == std::string::npos && text.starts_with('-') ? text.substr(1) : text;
}

}  // namespace tervane
