// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/surface/crop_controls.h"

#include <fmt/format.h>

#include "platform/text.h"
#include "simspec/periods.h"

namespace tervane {

namespace {

using Item = CVegetationItemKvf;

std::string DateText(const CYbDateTime& date) { return date.IsValid() ? date.Format("%Y-%m-%d %H:%M:%S") : "Invalid"; }

CYbDateTime DateOf(std::int64_t seconds) { return CYbDateTime::FromSecondsSinceEpoch(seconds); }

/// A vegetation without a name goes by its row.
std::string NameOf(const Item& crop, int row) {
  const std::string name = crop.VegPropFile().VegetationName();
  return name.empty() ? fmt::format("crop {}", row) : name;
}

/// The vegetations of a library.
std::vector<std::string> NamesIn(const FileName& file) {
  std::vector<std::string> names;
  if (file.IsEmpty()) return names;
  for (const LibraryEntry& entry : ReadLibraryOnce(kVegetationLibrary, file.Absolute())->library.entries)
    names.push_back(entry.Name());
  return names;
}

TimeBar BarOf(const CropStretch& stretch) {
  TimeBar bar;
  bar.start = DateOf(stretch.span.start);
  bar.end = DateOf(stretch.span.end);
  switch (stretch.kind) {
    case CropStretch::Kind::Crop:
      bar.name = stretch.file->VegetationName();
      break;
    case CropStretch::Kind::Gap:
      bar.kind = TimeBar::Kind::Gap;
      bar.name = "no crop";
      break;
    case CropStretch::Kind::Overlap:
      bar.kind = TimeBar::Kind::Overlap;
      bar.name = fmt::format("{} is not finished", stretch.file->VegetationName());
      break;
  }
  return bar;
}

/// "3 crops, 24 days without a crop, 2 overlaps", and how values go between stages.
std::string DevelopmentText(const CropDevelopment& development) {
  if (!development.problem.empty()) return development.problem;
  std::size_t crops = 0, overlaps = 0;
  std::int64_t without = 0;
  for (const CropStretch& stretch : development.stretches) {
    if (stretch.kind == CropStretch::Kind::Crop) ++crops;
    if (stretch.kind == CropStretch::Kind::Overlap) ++overlaps;
    if (stretch.kind == CropStretch::Kind::Gap) without += stretch.span.Seconds();
  }
  std::string text = fmt::format("{} {}", crops, crops == 1 ? "crop" : "crops");
  if (without > 0)
    text += fmt::format(", {} days without a crop", FormatNumber(CYbDateTimeSpan{without}.InDays(), "%.6g"));
  if (overlaps > 0) text += fmt::format(", {} {}", overlaps, overlaps == 1 ? "overlap" : "overlaps");
  return fmt::format("{}. {}", text, kVegetationLibrary.between);
}

Series CurveOf(const CropCourse& course, const std::vector<double>& values, const char* name, const char* unit) {
  Series series;
  series.name = name;
  series.unit = unit;
  for (const std::int64_t time : course.times) series.times.push_back(DateOf(time));
  series.values = values;
  return series;
}

}  // namespace

CropControls::CropControls(CVegetationListKvf& crops, const CYbSEDlgBase& page)
    : crops_(crops), page_(page), question_(page.Context().syncSoon) {}

void CropControls::Describe(PageForm& form, const char* chartLabel, const Condition& isShown) {
  table_ = CVegetationGrid();
  form.Table(table_).ShownWhen(isShown);
  form.Button("Start Date from Chart", [this] { AskStart(); })
      .ToolTip("The current crop begins where you click in the chart")
      .EnabledWhen("a crop of the table is the current one", [this] { return table_->Current() != nullptr; })
      .ShownWhen(isShown);
  form.Choice("Recycling Mode:", crops_.RecycleMode).ShownWhen(isShown);
  form.Shown(chartLabel, [this] { return DevelopmentText(crops_.Development()); }).ShownWhen(isShown);
  form.Chart([this] { return Chart(); }).ShownWhen(isShown);
}

std::shared_ptr<TableOf<Item>> CropControls::CVegetationGrid() const {
  auto table = std::make_shared<TableOf<Item>>(crops_);
  table->ItemName("Crop");
  table->ReportCurrentRow();
  table
      ->Value(
          "Name", [](Item& crop) { return crop.VegPropFile().VegetationName(); },
          [](Item& crop, const std::string& name) { crop.VegPropFile().SetVegetationName(name); })
      .Width(85)
      .Key("VEGETATION")
      .Offers([](Item& crop) { return NamesIn(crop.VegPropFile().File); });
  table
      ->Value(
          "Start date", [](Item& crop) { return crop.StartDate; },
          [](Item& crop, const CYbDateTime& date) { crop.StartDate = Midnight(date); })
      .ShownAs([](Item& crop) { return DateText(crop.StartDate); })
      .Width(130)
      .Hint(kTreeRebuilt)
      .Key("STARTDATE");
  table
      ->Value("Stages End",
              [](Item& crop) { return crop.StartDate.IsValid() ? DateText(crop.GetEndDate()) : std::string(); })
      .Width(130)
      .GreyWhen([](Item&) { return true; });
  table->Value("Vegetation property file", [](Item& crop) -> FileName& { return crop.VegPropFile().File; })
      .Width(290)
      .Key("FILE_NAME")
      .Filter(std::string(kVegetationLibrary.filter))
      .DefaultExtension(std::string(kVegetationLibrary.extension))
      .ToolTipOf([](Item& crop) { return crop.VegPropFile().File.Text(); });
  table->Button("", "...", [this](Item& crop) { SelectVegetation(crop); })
      .Width(25)
      .ToolTip("Choose a vegetation of a library");
  table->Button("", "Edit", [this](Item& crop) { page_.Outside().OpenInEditor(crop.VegPropFile().File.Absolute()); })
      .EnabledWhen([](Item& crop) { return !crop.VegPropFile().File.IsEmpty(); })
      .Width(25)
      .ToolTip("Edit the library");
  return table;
}

void CropControls::SelectVegetation(Item& crop) const {
  CTvnVegPropFile& file = crop.VegPropFile();
  const auto choice = page_.Outside().SelectLibraryEntry(
      {kVegetationLibrary, file.File.IsEmpty() ? std::string() : file.File.Absolute(), file.VegetationName()});
  if (!choice) return;
  file.Choose(FileName::Picked(choice->file, page_.Context().document.Root().SetupFolder()), choice->entry);
  page_.UpdateDoc(kDataChanged, "Choose Vegetation");
}

void CropControls::MoveStart(Item& crop, const CYbDateTime& date) const {
  crop.StartDate = Midnight(date);
  page_.UpdateDoc(kTreeRebuilt, "Change Start date");
}

void CropControls::AskStart() {
  Item* crop = table_->Current();
  if (!crop) return;
  question_.AskDate(fmt::format("Click the start of {}.", NameOf(*crop, table_->CurrentRow())),
                    [this, serial = crop->Serial()](const CYbDateTime& date) {
                      // It may have been deleted meanwhile.
                      for (int number = 1; number <= crops_.GetItemCount(); ++number)
                        if (Item& asked = *crops_.GetItem(number); asked.Serial() == serial)
                          return MoveStart(asked, date);
                    });
}

SeriesContent CropControls::Chart() const {
  SeriesContent chart;
  const CropDevelopment development = crops_.Development();
  const CropCourse& course = development.course;
  if (!development.problem.empty())
    chart.message = fmt::format("There is nothing to show: {}.", development.problem);
  else if (course.times.empty())
    chart.message = "No crop grows during the simulation.";
  if (!chart.message.empty()) return chart;
  chart.series = {CurveOf(course, course.lai, "LAI", "-"), CurveOf(course, course.rootDepth, "RD", "m")};
  if (const auto* period = crops_.Important(kSimulationPeriod))
    chart.period = {period->GetSimStartDate(), period->SIMEND};
  for (const CropStretch& stretch : development.stretches) chart.bars.push_back(BarOf(stretch));
  // Lines that stand close together tell nothing.
  constexpr int kMostMarkers = 30;
  for (int row = 1; row <= crops_.GetItemCount() && crops_.GetItemCount() <= kMostMarkers; ++row) {
    Item& crop = *crops_.GetItem(row);
    if (!chart.period || crop.StartDate < chart.period->first || crop.StartDate > chart.period->second) continue;
    chart.markers.push_back(
        {std::to_string(row), crop.StartDate, [this, &crop](const CYbDateTime& date) { MoveStart(crop, date); }});
  }
  question_.PutOn(chart);
  return chart;
}

}  // namespace tervane
