// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "forms/map_question.h"
#include "forms/page.h"
#include "forms/plots.h"
#include "spatial/domain.h"

namespace tervane {

/// The model domain and its grid.
class CCatchmentDlg : public PageOf<CCatchmentKvf> {
 public:
  CCatchmentDlg(CYbSEKvfBase& node, PageContext context)
      : PageOf(node, std::move(context)), question_(Context().syncSoon) {}

 protected:
  void Describe(PageForm& form) override;

 private:
  /// A number of the grid: the file's, or the node's own, which can be changed.
  Control& GridNumber(PageForm& form, const std::string& label, double& own, double GridGeometry::*inFile);
  bool BrowseShape(Host& host, const Host::FileQuestion& question);
  MapContent Map();
  MapContent DomainMap();

  MapQuestion question_;
};

}  // namespace tervane
