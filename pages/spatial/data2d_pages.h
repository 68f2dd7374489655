// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "forms/page.h"
#include "spatial/data2d.h"

namespace tervane {

/// Any quantity with one value for each cell of the model.
class CData2DDlg : public PageOf<CData2DKvf> {
 public:
  using PageOf::PageOf;

  /// Builds the grid anew from its files.
  void OnRefresh() override;

 protected:
  void Describe(PageForm& form) override;

 private:
  MapContent Map();
};

}  // namespace tervane
