// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "forms/page.h"
#include "geometry/projection_list.h"

namespace tervane {

/// Lets the user find a coordinate system by its name, its EPSG code or a place.
class ProjectionDialog : public CYbSEDlgBase {
 public:
  /// `now` is the text of the present one.
  ProjectionDialog(const PageContext& context, CYbSEKvfBase& node, const std::string& now);
  /// The text of the chosen one, or nothing when the user gave up.
  std::optional<std::string> Run();

 protected:
  void Describe(PageForm& form) override;

 private:
  void Find();

  std::string typed_, problem_;
  std::vector<KnownProjection> found_;
  int chosen_ = -1;  ///< The row, from 0; -1 for none.
};

}  // namespace tervane
