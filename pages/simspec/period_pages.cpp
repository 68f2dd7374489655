// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/simspec/period_pages.h"

#include "forms/table_of.h"
#include "platform/text.h"

namespace tervane {

void CSimTitleDlg::Describe(PageForm& form) {
  CSimTitleBase& n = Node();
  form.Text("Simulation Title:", n.Title);
  form.LongText("Simulation Description:", n.Description);
}

// ---- Simulation period

void CSimPeriodDlg::Initialize() {
  LoadHotStartDates();
  PageOf::Initialize();
}

void CSimPeriodDlg::LoadHotStartDates() {
  CSimPeriodKvf& n = Node();
  n.LoadHotStartDates(n.HotStartResultFile.Absolute());
}

void CSimPeriodDlg::ChooseHotStartDate(int index) {
  CSimPeriodKvf& n = Node();
  const bool exists = index >= 0 && index < static_cast<int>(n.HotStartDates.size());
  n.HotStartDateIndex = exists ? index : 0;
  n.HotStartDate = exists ? n.HotStartDates[static_cast<std::size_t>(index)] : std::string();
}

bool CSimPeriodDlg::StartsHot() const {
  const CSimPeriodKvf& n = Node();
  return n.HotStart && n.SimStartFromHotStartDate && CYbDateTime::Parse(n.HotStartDate, n.kHotStartFormat).IsValid();
}

void CSimPeriodDlg::Describe(PageForm& form) {
  CSimPeriodKvf& n = Node();
  const auto isHot = [&n] { return n.HotStart != 0; };
  // The dates on offer follow the file.
  const auto thenLoad = [this](Control& control) -> Control& {
    control.enter = [this, enter = std::move(control.enter)](const std::string& typed) {
      std::string expected = enter(typed);
      if (!expected.empty()) return expected;
      LoadHotStartDates();
      ChooseHotStartDate(Node().HotStartDateIndex);
      return expected;
    };
    return control;
  };
  form.Date(
          "Start Date:", [&n] { return n.GetSimStartDate(); }, [&n](const CYbDateTime& date) { n.SIMSTART = date; })
      .Key("SIMSTART")
      .EnabledWhen([this] { return !StartsHot(); })
      .RevalidatesLater();
  form.Date("End Date:", n.SIMEND).Key("SIMEND").RevalidatesLater();
  PageForm& hot = form.Group("Hot start");
  thenLoad(hot.Check("Use hot start data", n.HotStart));
  thenLoad(hot.File("Hot start result File:", n.HotStartResultFile))
      .Filter("tvdres catalogue file (*.tvdres) |*.tvdres|All Files (*.*) |*.*||")
      .DefaultExtension("tvdres")
      .EnabledWhen(isHot);
  hot.Choice(
         "Hot start date:", [&n] { return n.HotStartDates.empty() ? -1 : n.HotStartDateIndex; },
         [this](int index) { ChooseHotStartDate(index); }, [&n] { return n.HotStartDates; })
      .Key("HotStartDate")
      .EnabledWhen(isHot)
      .RevalidatesLater();
  hot.Check("Use hot start date for simulation start date", n.SimStartFromHotStartDate)
      .EnabledWhen([&n] { return n.HotStart && !n.HotStartResultFile.IsEmpty(); })
      .RevalidatesLater();
}

// ---- Periods on flow results

void CSimPeriodOnFlowDlg::Initialize() {
  // The dates are compared with the simulation period, which may have changed.
  Node().Validate();
  PageOf::Initialize();
}

void CSimPeriodOnFlowDlg::Describe(PageForm& form) {
  CSimPeriodOnFlowBase& n = Node();
  const auto recycles = [&n](int type) { return [&n, type] { return n.RecyclingType == type; }; };
  form.Date("Start Date:", n.SimStart).RevalidatesLater();
  form.Date("End Date:", n.SimEnd).RevalidatesLater();
  form.Radio("", n.RecyclingType,
             {"No recycling on flow results", "Recycling on flow results", "Constant Water Movement Flow Field"})
      .RevalidatesLater();
  form.Date("Cycle Restart Date:", n.CycleRestartDate).EnabledWhen(recycles(1)).RevalidatesLater();
  form.Date("Cycle End Date:", n.CycleEndDate).EnabledWhen(recycles(1)).RevalidatesLater();
  form.Date("Date for Flow Field Solution:", n.FlowFieldSolutionDate).EnabledWhen(recycles(2)).RevalidatesLater();
}

// ---- Extra parameters

void CExtraParamsDlg::Describe(PageForm& form) {
  using Item = CExtraParamsItemKvf;
  auto table = std::make_shared<TableOf<Item>>(Node());
  table->ItemName("Parameter");
  table->Value("Name", &Item::Name).Width(220);
  table->Choice("Type", &Item::Type, {"Float", "Integer", "Bool", "Text", "Filename"});
  // The cell follows the row's type; each type has a value of its own.
  table
      ->Value("Value",
              [](Item& item) -> CellPlace {
                switch (item.Type) {
                  case Item::kFloat:
                    return &item.FloatValue;
                  case Item::kInteger:
                    return &item.IntegerValue;
                  case Item::kBool:
                    return CheckOf{&item.BoolValue};
                  case Item::kText:
                    return &item.TextValue;
                  case Item::kFilename:
                    return &item.FilenameValue;
                  default:
                    return NoCell{"a type of the list must be chosen first"};
                }
              })
      .Width(260);
  form.Table(std::move(table));
}

}  // namespace tervane
