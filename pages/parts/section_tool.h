// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <vector>

#include "forms/map_question.h"
#include "forms/page_form.h"
#include "forms/plots.h"

namespace tervane {

/// Lets a user draw a line on the map of a page, and shows the section along it below the map.
class SectionTool {
 public:
  /// `shown` makes the page show itself anew (`PageContext::syncSoon`); may be empty.
  explicit SectionTool(std::function<void()> shown);

  /// Adds the buttons that draw and remove a line; `isOffered` says whether there is something to cut.
  void DescribeButtons(PageForm& form, const Condition& isOffered);
  /// Adds the section, which is shown once there is a line; `content` gives its surfaces, and the tool the line.
  void DescribeSection(PageForm& form, std::function<SectionContent()> content, const Condition& isOffered);
  /// Puts the line on the page's map, and the question for it.
  void PutOn(MapContent& map) const;

 private:
  std::function<void()> shown_;
  MapQuestion question_;
  std::vector<MapPoint> line_;
  std::shared_ptr<const std::vector<MapLine>> drawn_;  ///< The line as a layer of the map.
};

}  // namespace tervane
