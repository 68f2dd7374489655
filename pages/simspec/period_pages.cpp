// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/simspec/period_pages.h"

#include "forms/table_of.h"
#include "platform/text.h"
#include "simspec/extra_params.h"
#include "simspec/periods.h"
#include "simspec/titles.h"

namespace tervane {

namespace {

void DescribeTitle(PageForm& form, CSimTitleBase& n) {
  form.Text("Simulation Title:", n.Title);
  form.LongText("Simulation Description:", n.Description);
}

/// The simulation period and its hot start.
class CSimPeriodDlg : public PageOf<CSimPeriodKvf> {
 public:
  using PageOf::PageOf;
  void Initialize() override;

 protected:
  void Describe(PageForm& form) override;

 private:
  void LoadHotStartDates();
  void ChooseHotStartDate(int index);
  /// Gives up a date that the list does not have; true when there was one.
  bool GiveUpLostDate();
  /// The start comes from the hot start.
  bool StartsHot() const;
};

/// The period of a simulation on flow results: water quality or particle tracking.
class CSimPeriodOnFlowDlg : public PageOf<CSimPeriodOnFlowBase> {
 public:
  using PageOf::PageOf;
  void Initialize() override;

 protected:
  void Describe(PageForm& form) override;
};

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

bool CSimPeriodDlg::GiveUpLostDate() {
  CSimPeriodKvf& n = Node();
  const bool isListed = n.HotStartDateIndex >= 0 && n.HotStartDateIndex < static_cast<int>(n.HotStartDates.size());
  const bool isChosen = n.HotStartDateIndex != 0 || CYbDateTime::Parse(n.HotStartDate, n.kHotStartFormat).IsValid();
  if (isListed || !isChosen) return false;
  ChooseHotStartDate(n.HotStartDateIndex);
  n.SetRevalidateAll();
  return true;
}

bool CSimPeriodDlg::StartsHot() const {
  const CSimPeriodKvf& n = Node();
  return n.HotStart && n.SimStartFromHotStartDate && CYbDateTime::Parse(n.HotStartDate, n.kHotStartFormat).IsValid();
}

void CSimPeriodDlg::Describe(PageForm& form) {
  CSimPeriodKvf& n = Node();
  const Condition isHot = On(n.HotStart);
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
      .EnabledWhen("the start is not taken from the hot start", [this] { return !StartsHot(); })
      .RevalidatesLater();
  form.Date("End Date:", n.SIMEND).RevalidatesLater();
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
  form.MendWhenShown("Give Up Lost Hot Start Date", [this] { return GiveUpLostDate(); });
  hot.Check("Use hot start date for simulation start date", n.SimStartFromHotStartDate)
      .EnabledWhen(isHot &&
                   Sentence("a hot start result file is chosen", [&n] { return !n.HotStartResultFile.IsEmpty(); }))
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
  form.Date("Start Date:", n.SimStart).RevalidatesLater();
  form.Date("End Date:", n.SimEnd).RevalidatesLater();
  form.Radio("", n.RecyclingType).RevalidatesLater();
  form.Date("Cycle Restart Date:", n.CycleRestartDate)
      .EnabledWhen(Is(n.RecyclingType, CSimPeriodOnFlowBase::kRecycling))
      .RevalidatesLater();
  form.Date("Cycle End Date:", n.CycleEndDate)
      .EnabledWhen(Is(n.RecyclingType, CSimPeriodOnFlowBase::kRecycling))
      .RevalidatesLater();
  form.Date("Date for Flow Field Solution:", n.FlowFieldSolutionDate)
      .EnabledWhen(Is(n.RecyclingType, CSimPeriodOnFlowBase::kConstantFlowField))
      .RevalidatesLater();
}

// ---- Extra parameters

void DescribeExtraParams(PageForm& form, CExtraParamsKvf& n) {
  using Item = CExtraParamsItemKvf;
  auto table = std::make_shared<TableOf<Item>>(n);
  table->ItemName("Parameter");
  table->Value("Name", &Item::Name).Width(220);
  table->Choice("Type", &Item::Type);
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
      .Key("Value")
      .Width(260);
  form.Table(std::move(table));
}

}  // namespace

std::span<const PageRow> PeriodPages() {
  static constexpr PageRow kRows[] = {
      DescribedBy<DescribeTitle>(kSimTitlePage),
      DescribedBy<DescribeTitle>(kSimTitleWQPage),
      DescribedBy<DescribeTitle>(kSimTitlePTPage),
      PageIs<CSimPeriodDlg, CSimPeriodKvf>(kSimPeriodPage),
      PageIs<CSimPeriodOnFlowDlg, CSimPeriodOnFlowBase>(kSimPeriodWQPage),
      PageIs<CSimPeriodOnFlowDlg, CSimPeriodOnFlowBase>(kSimPeriodPTPage),
      DescribedBy<DescribeExtraParams>(kExtraParamsPage),
  };
  return kRows;
}

}  // namespace tervane
