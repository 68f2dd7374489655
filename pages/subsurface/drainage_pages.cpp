// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/subsurface/drainage_pages.h"

#include "forms/table_of.h"
#include "subsurface/drainage.h"
#include "subsurface/pages.h"

namespace tervane {

namespace {

void DescribeDrainage(PageForm& form, CDrainageSZKvf& n) {
  form.Radio("Drainage Option", n.DrainageOption).Hint(kTreeRebuilt | kDataChanged).Revalidates();
}

void DescribeDrains(PageForm& form, CDrainageMFSZKvf& n) {
  auto table = std::make_shared<TableOf<CDrainageMFSZItemKvf>>(n);
  table->ItemName("Drain");
  table->Value("Name", &CDrainageMFSZItemKvf::Name).Width(90).Hint(kTreeRebuilt | kDataChanged);
  form.Group("Drains").Table(table);
}

}  // namespace

std::span<const PageRow> DrainagePages() {
  static constexpr PageRow kRows[] = {
      DescribedBy<DescribeDrainage>(kDrainagePage),
      DescribedBy<DescribeDrains>(kModflowDrainsPage),
  };
  return kRows;
}

}  // namespace tervane
