// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/parts/section_tool.h"

#include <utility>

namespace tervane {

namespace {

constexpr unsigned kLineColor = 0xe03c31;

}  // namespace

SectionTool::SectionTool(std::function<void()> shown) : shown_(shown), question_(std::move(shown)) {}

void SectionTool::DescribeButtons(PageForm& form, const Condition& isOffered) {
  form.Button("Draw Section",
              [this] {
                question_.AskLine("Click the points of the section. A double click ends it, Esc gives up.",
                                  [this](const std::vector<MapPoint>& line) {
                                    line_ = line;
                                    drawn_ = std::make_shared<std::vector<MapLine>>(1, MapLine{{}, line});
                                  });
              })
      .ToolTip("Draw a line on the map and see the layers below it")
      .ShownWhen(isOffered);
  form.Button("Remove Section",
              [this] {
                line_.clear();
                drawn_.reset();
                if (shown_) shown_();
              })
      .Beside()
      .EnabledWhen("a section is drawn", [this] { return drawn_ != nullptr; })
      .ShownWhen(isOffered);
}

void SectionTool::DescribeSection(PageForm& form, std::function<SectionContent()> content, const Condition& isOffered) {
  form.Section([this, content = std::move(content)] {
        // Maps show the ground in 3D without a line, too.
        SectionContent section = content();
        section.line = line_;
        if (!drawn_) section.message = "Draw a section on the map.";
        return section;
      })
      .ShownWhen(Sentence("a section is drawn", [this] { return drawn_ != nullptr; }) && isOffered);
}

void SectionTool::PutOn(MapContent& map) const {
  question_.PutOn(map);
  if (!drawn_ || map.IsEmpty()) return;
  LineLayer layer{drawn_};
  layer.lineColor = kLineColor;
  layer.lineWidth = 2;
  map.lines.push_back(std::move(layer));
  PointLayer ends;
  ends.points = {line_.front(), line_.back()};
  ends.labels = {"A", "B"};
  map.points.push_back(std::move(ends));
}

}  // namespace tervane
