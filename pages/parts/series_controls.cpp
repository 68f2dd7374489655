// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/parts/series_controls.h"

#include <fmt/format.h>

#include "pages/parts/create_dialogs.h"
#include "pages/parts/file_controls.h"

namespace tervane {

void DescribeSeriesFile(PageForm& form, const CYbSEDlgBase& page, const std::string& label, CFMData0DFile& file,
                        FirstSeries first, const Condition& isShown) {
  form.DataFile(label, file).Filter(kSeriesFileFilter).DefaultExtension("nds0").ShownWhen(isShown);
  form.Button("Edit...", [&file, &page] { page.Outside().OpenInEditor(file.File.Absolute()); }).ShownWhen(isShown);
  form.Button("Create...",
              [&page, &file, first = std::move(first)] {
                CTvnCreate0DNdsDlg dialog(page.Context(), page.Node(), first.value,
                                          first.itemTypesBy ? first.itemTypesBy() : first.itemTypes, first.valueTypes);
                if (*first.quantity) dialog.SetTitle(fmt::format("{} {}", page.Node().GetTitle(), first.quantity));
                if (const auto made = dialog.Run()) {
                  file.Choose(*made);
                  page.UpdateDoc(kDataChanged, "Create Time Series File");
                }
              })
      .Beside()
      .ShownWhen(isShown);
}

}  // namespace tervane
