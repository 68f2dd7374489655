// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "forms/plots.h"

#include <algorithm>
#include <bit>
#include <cstdint>

#include <fmt/format.h>
#include <fmt/ranges.h>

#include "geometry/grid_section.h"

namespace tervane {

bool Highlight::IsOfShape(std::size_t itsPlace, const Shape& shape) const {
  return IsOf(itsPlace, name.empty() || !shape.HasValue() ? std::string() : TextOf(shape.Value()));
}

void LetStandOut(MapContent& map, const Highlight& highlighted) {
  if (!map.grids.empty()) map.grids.front().highlighted = highlighted;
  if (!map.shapes.empty()) map.shapes.front().highlighted = highlighted;
  if (!map.lines.empty()) map.lines.front().highlighted = highlighted;
  if (!map.points.empty()) map.points.front().highlighted = highlighted;
}

bool LooksSame(const MapContent& a, const MapContent& b) {
  return a.grids == b.grids && a.shapes == b.shapes && a.lines == b.lines && a.points == b.points &&
         a.below == b.below && a.above == b.above && a.domain == b.domain && a.area == b.area &&
         a.message == b.message && a.arrows == b.arrows;
}

bool HasSameColors(const GridLayer& a, const GridLayer& b) {
  return a.isCodes == b.isCodes && a.highlighted.code == b.highlighted.code && a.range == b.range &&
         a.names == b.names && a.classes == b.classes && a.isHillshaded == b.isHillshaded && a.ramp == b.ramp &&
         a.scale == b.scale;
}

bool LooksSame(const SectionContent& a, const SectionContent& b) {
  return a.line == b.line && a.ground == b.ground && a.surfaces == b.surfaces && a.lenses == b.lenses &&
         a.curves == b.curves && a.screens == b.screens && SameNumber(a.screenReach, b.screenReach) &&
         SameNumber(a.minimumThickness, b.minimumThickness) && a.message == b.message;
}

namespace {

bool LooksSame(const Series& a, const Series& b) {
  // By their bits, since a gap, which is no number, equals nothing.
  const auto sameBits = [](double x, double y) {
    return std::bit_cast<std::uint64_t>(x) == std::bit_cast<std::uint64_t>(y);
  };
  return a.name == b.name && a.unit == b.unit && a.isStepped == b.isStepped && a.panel == b.panel &&
         a.isLogarithmic == b.isLogarithmic && a.color == b.color && a.isPoints == b.isPoints && a.times == b.times &&
         std::ranges::equal(a.positions, b.positions, sameBits) && a.values.IsEqual(b.values, sameBits);
}

}  // namespace

bool LooksSame(const std::vector<DateMarker>& a, const std::vector<DateMarker>& b) {
  return std::ranges::equal(a, b, [](const DateMarker& x, const DateMarker& y) {
    return x.name == y.name && x.time == y.time && !x.moved == !y.moved && x.standsOut == y.standsOut;
  });
}

bool LooksSame(const SeriesContent& a, const SeriesContent& b) {
  return LooksSameButForMarkers(a, b) && LooksSame(a.markers, b.markers);
}

bool LooksSameButForMarkers(const SeriesContent& a, const SeriesContent& b) {
  return a.period == b.period && a.message == b.message && a.numbers == b.numbers && a.bars == b.bars &&
         a.panelTitles == b.panelTitles &&
         std::ranges::equal(a.series, b.series, [](const Series& x, const Series& y) { return LooksSame(x, y); });
}

namespace {

std::string HighlightText(const MapContent& content) {
  std::vector<Highlight> all;
  const auto collect = [&all](const auto& layers) {
    for (const auto& layer : layers)
      if (!layer.highlighted.IsNone() && std::ranges::find(all, layer.highlighted) == all.end())
        all.push_back(layer.highlighted);
  };
  collect(content.grids);
  collect(content.shapes);
  collect(content.lines);
  collect(content.points);
  std::vector<std::string> texts;
  for (const Highlight& one : all) {
    if (one.code) texts.push_back(fmt::format("code {}", *one.code));
    if (!one.name.empty()) texts.push_back(fmt::format("\"{}\"", one.name));
    if (one.place) texts.push_back(fmt::format("number {}", *one.place + 1));
  }
  return texts.empty() ? std::string() : fmt::format("{} standing out", fmt::join(texts, ", "));
}

}  // namespace

std::string Summary(const MapContent& content) {
  std::vector<std::string> parts;
  if (content.IsEmpty()) parts.push_back(content.message);
  for (const GridLayer& layer : content.grids)
    parts.push_back(fmt::format("grid {}x{}", layer.grid->Geometry().nx, layer.grid->Geometry().ny));
  std::size_t shapes = 0, points = 0;
  for (const ShapeLayer& layer : content.shapes) shapes += layer.shapes->GetData().size();
  for (const PointLayer& layer : content.points) points += layer.points.size();
  if (!content.shapes.empty()) parts.push_back(fmt::format("{} shapes", shapes));
  for (const LineLayer& layer : content.lines) {
    std::size_t vertices = 0;
    for (const MapLine& line : *layer.lines) vertices += line.points.size();
    parts.push_back(fmt::format("{} lines of {} points", layer.lines->size(), vertices));
    if (layer.painted) parts.back() += " by " + layer.painted->title;
  }
  if (!content.points.empty()) parts.push_back(fmt::format("{} points", points));
  if (content.arrows) parts.push_back("arrows");
  std::vector<std::string> backdrop;
  for (const auto* side : {&content.below, &content.above})
    for (const BackdropLayer& layer : *side) backdrop.push_back(layer.title);
  if (!backdrop.empty()) parts.push_back(fmt::format("backdrop {}", fmt::join(backdrop, ", ")));
  if (std::string standsOut = HighlightText(content); !standsOut.empty()) parts.push_back(std::move(standsOut));
  if (content.request) parts.push_back(fmt::format("asks \"{}\"", content.request->prompt));
  return fmt::format("{}", fmt::join(parts, ", "));
}

std::string Summary(const SectionContent& content) {
  if (content.IsEmpty()) return content.message;
  std::vector<std::string> names{"ground"};
  for (const SectionSurface& surface : content.surfaces) names.push_back(surface.name);
  for (const SectionLens& lens : content.lenses) names.push_back(lens.name);
  for (const SectionCurve& curve : content.curves) names.push_back(curve.name);
  if (!content.screens.empty()) names.push_back(fmt::format("{} screens", content.screens.size()));
  return fmt::format("section of {:.0f} m: {}", LengthOf(content.line), fmt::join(names, ", "));
}

std::string Summary(const SeriesContent& content) {
  if (content.IsEmpty()) return content.message;
  std::size_t values = 0;
  int charts = 1;
  for (const Series& series : content.series) {
    values += series.values.size();
    charts = std::max(charts, series.panel + 1);
  }
  std::string text = fmt::format("{} series, {} values", content.series.size(), values);
  if (charts > 1) text += fmt::format(", in {} charts", charts);
  if (content.numbers)
    text += fmt::format(", over {} [{}]{}", content.numbers->title, content.numbers->unit,
                        content.numbers->isLogarithmic ? ", logarithmic" : "");
  for (const Series& series : content.series)
    if (series.isLogarithmic) text += fmt::format(", {} on a logarithmic axis", series.name);
  const auto count = [&](TimeBar::Kind kind) { return std::ranges::count(content.bars, kind, &TimeBar::kind); };
  if (!content.bars.empty())
    text += fmt::format(", {} bars, {} gaps, {} overlaps", count(TimeBar::Kind::Thing), count(TimeBar::Kind::Gap),
                        count(TimeBar::Kind::Overlap));
  for (const DateMarker& marker : content.markers)
    text += fmt::format(", {} at {}", marker.name, marker.time.Format("%Y-%m-%d %H:%M"));
  if (content.request) text += fmt::format(", asks \"{}\"", content.request->prompt);
  return text;
}

double DepthContent::Bottom() const {
  double bottom = 0;
  for (const DepthColumn& column : columns) bottom = std::max(bottom, column.Bottom());
  return bottom;
}

std::string Summary(const DepthContent& content) {
  if (!content.message.empty()) return content.message;
  std::string text;
  for (const DepthColumn& column : content.columns) {
    text += fmt::format("{}{}: ", text.empty() ? "" : "; ", column.title);
    for (std::size_t i = 0; i < column.blocks.size(); ++i) {
      const DepthBlock& block = column.blocks[i];
      text += fmt::format("{}{} to {:.6g} m", i > 0 ? ", " : "", block.name, block.bottom);
    }
  }
  return text;
}

}  // namespace tervane
