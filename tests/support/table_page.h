// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <limits>
#include <string>
#include <vector>

#include "forms/page.h"
#include "forms/row_fields.h"

namespace tervane::test {

/// A row with a value of each kind.
struct TableRow {
  std::string name;
  CYbDateTime start{2000, 1, 1};
  double days = 30;
  int process = 1110;
  std::string species;
  bool hasFile = false;
  FileName file;
  double x = std::numeric_limits<double>::quiet_NaN();
  int flag = 0;
};

/// A page with a table of plain values that has every kind of cell, and with fields of its current row below.
class TablePage : public CYbSEDlgBase {
 public:
  explicit TablePage(const PageContext& context) : CYbSEDlgBase(node_, context) {}

  std::vector<TableRow> rows;
  bool withX = true;
  bool enabled = true;
  CellChoices processes{{1110, "Porosity"}, {1120, "Bulk density"}};
  std::vector<std::string> pressed;
  std::shared_ptr<TableOf<TableRow>> table;
  const Control& TableControl() const { return *Form().Controls().front(); }

  /// Three rows that differ.
  static std::vector<TableRow> ThreeRows() {
    std::vector<TableRow> rows(3);
    rows[0].name = "Spring";
    rows[1].name = "Summer";
    rows[1].days = 365.0 / 3;
    rows[1].process = 1120;
    rows[1].hasFile = true;
    rows[1].file = FileName("data/observed.nds0", {});
    rows[1].x = 1234567.891;
    rows[2].name = "Autumn";
    rows[2].start = CYbDateTime(2000, 9, 1, 12, 30);
    rows[2].flag = 1;
    return rows;
  }

 protected:
  void Describe(PageForm& form) override {
    using Row = TableRow;
    table = std::make_shared<TableOf<Row>>(rows);
    table->ItemName("Season");
    table->OfferToAllRows("Apply to All Seasons");
    table->RowHeads([](Row& row) { return row.name.empty() ? "?" : row.name.substr(0, 2); });
    table->Value("Name", &Row::name).Width(90).Hint(kDataChanged | kTreeRebuilt).Offers([](Row& row) {
      return std::vector<std::string>{row.days < 100 ? "Month" : "Half-year", "Winter"};
    });
    table->Value("Start", &Row::start).Width(150);
    table->Value("Length", &Row::days).Width(90).Unit("days").Format("%.6g");
    table
        ->Running(
            "End", [] { return CYbDateTime(2000, 1, 1); },
            [](const CYbDateTime& end, Row& row) { return end + CYbDateTimeSpan::Days(row.days); })
        .Width(150);
    table->Choice("Process", &Row::process, processes).Width(110);
    table
        ->Choice("Species", &Row::species,
                 [](Row& row) {
                   return row.process == 1110 ? CellChoices::Texts({"Nitrate", "Oxygen"})
                                              : CellChoices::Texts({"Sand", "Clay"});
                 })
        .Width(90);
    table->Value("X", &Row::x).Width(80).Format("%.2f").ShownWhen([this] { return withX; });
    table->Button("", "", [this](Row& row) { pressed.push_back("pick " + row.name); })
        .Icon("find")
        .ToolTip("Select point in the plot")
        .Width(30);
    table->Value("Incl. Obs.\nData", &Row::hasFile).Width(70);
    const auto hasNoFile = [](Row& row) { return !row.hasFile; };
    table->Value("Observed Data File", &Row::file).Width(170).HeadOver(3).GreyWhen(hasNoFile).ToolTipOf([](Row& row) {
      return row.file.Text();
    });
    table->Button("", "...", [this](Row& row) { pressed.push_back("browse " + row.name); }).Width(30);
    table->Button("", "Edit...", [this](Row& row) { pressed.push_back("edit " + row.name); })
        .Width(60)
        .EnabledWhen(&Row::hasFile);
    form.Table(table).EnabledWhen(On(enabled));
    RowFields<Row> fields(form, table);
    fields.Value("Name of the season:", &Row::name);
    fields.Value("Length of the season:", &Row::days).Unit("days");
    fields.Choice("Process of the season:", &Row::process, {{1110, "Porosity"}, {1120, "Bulk density"}});
    fields.Check("Is marked", &Row::flag);
    fields.Value("Start of the season:", &Row::start);
    fields.Value("File of the season:", &Row::file).GreyWhen(hasNoFile);
  }

 private:
  CTvnKvfBase node_{"Seasons", "Seasons", nullptr};
};

}  // namespace tervane::test
