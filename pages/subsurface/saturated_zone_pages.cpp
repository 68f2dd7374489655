// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/subsurface/saturated_zone_pages.h"

#include "pages/subsurface/ground_views.h"
#include "subsurface/pages.h"
#include "subsurface/saturated_zone.h"

namespace tervane {

namespace {

class CSatZoneDlg : public PageOf<CSatZoneKvf> {
 public:
  CSatZoneDlg(CYbSEKvfBase& node, const PageContext& context) : PageOf(node, context), views_(*this, Node()) {}

 protected:
  void Describe(PageForm& form) override {
    CSatZoneKvf& n = Node();
    form.Check("Include subsurface drainage", n.Drainage).Revalidates();
    form.Check("Include pumping wells", n.Wells).Revalidates();
    views_.Describe(form);
  }

 private:
  GroundViews views_;
};

}  // namespace

std::span<const PageRow> SaturatedZonePages() {
  static constexpr PageRow kRows[] = {PageIs<CSatZoneDlg, CSatZoneKvf>(kSaturatedZonePage)};
  return kRows;
}

}  // namespace tervane
