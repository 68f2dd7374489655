// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/surface/crop_table.h"

namespace tervane {

namespace {

using Item = CVegetationItemKvf;

constexpr std::string_view kDateFormat = "%Y-%m-%d %H:%M:%S";

std::string DateText(const CYbDateTime& date) { return date.IsValid() ? date.Format(kDateFormat) : "Invalid"; }

void SelectVegetation(Item& item, const CYbSEDlgBase& page) {
  CTvnVegPropFile& file = item.VegPropFile();
  const auto choice = page.Outside().SelectLibraryEntry(
      {kVegetationLibrary, file.File.IsEmpty() ? std::string() : file.File.Absolute(), file.VegetationName()});
  if (!choice) return;
  file.Choose(FileName::Picked(choice->file, page.Context().document.Root().SetupFolder()), choice->entry);
  page.UpdateDoc(kDataChanged, "Select Vegetation");
}

}  // namespace

std::shared_ptr<TableOf<Item>> CVegetationGrid(CVegetationListKvf& crops, const CYbSEDlgBase& page) {
  auto table = std::make_shared<TableOf<Item>>(crops);
  table->ItemName("Crop");
  table
      ->Value(
          "Name", [](Item& item) { return item.VegPropFile().VegetationName(); },
          [](Item& item, const std::string& name) { item.VegPropFile().SetVegetationName(name); })
      .Width(85);
  table
      ->Value(
          "Start date", [](Item& item) { return item.StartDate; },
          [](Item& item, const CYbDateTime& date) { item.StartDate = Midnight(date); })
      .Width(130)
      .Hint(kTreeRebuilt);
  table
      ->Value("Stages End",
              [](Item& item) { return item.StartDate.IsValid() ? DateText(item.GetEndDate()) : std::string(); })
      .Width(130)
      .GreyWhen([](Item&) { return true; });
  table->Value("Vegetation property file", [](Item& item) -> FileName& { return item.VegPropFile().File; })
      .Width(290)
      .Filter(std::string(kVegetationLibrary.filter))
      .DefaultExtension(std::string(kVegetationLibrary.extension))
      .ToolTipOf([](Item& item) { return item.VegPropFile().File.Text(); });
  table->Button("", "...", [&page](Item& item) { SelectVegetation(item, page); })
      .Width(25)
      .ToolTip("Select a library and one of its vegetations");
  table
      ->Button("", "Edit",
               [&page](Item& item) {
                 if (page.Context().openDataFile) page.Context().openDataFile(item.VegPropFile().File.Absolute());
               })
      .Width(25)
      .EnabledWhen([](Item& item) { return !item.VegPropFile().File.IsEmpty(); })
      .ToolTip("Edit the library");
  return table;
}

}  // namespace tervane
