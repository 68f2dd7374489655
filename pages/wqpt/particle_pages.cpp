// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/wqpt/particle_pages.h"

#include "document/flow_model_document.h"
#include "forms/table_of.h"
#include "wqpt/extractions.h"
#include "wqpt/pages.h"
#include "wqpt/registration_lenses.h"

namespace tervane {

namespace {

constexpr int kNamesChange = kTreeRebuilt | kDataChanged;

void DescribeLenses(PageForm& form, CRegLensePTListKvf& n) {
  using Lens = CRegLensePTItemKvf;
  auto table = std::make_shared<TableOf<Lens>>(n);
  table->ItemName("Lense");
  table->Value("Zone\nName", &Lens::LenseName).Width(150).Hint(kNamesChange);
  table->Value("Registration\nCode", &Lens::RegistrationCode).Width(100);
  table->Choice("Extent\nType", &Lens::ExtentType).Width(120).Hint(kNamesChange);
  form.Table(table);
}

// ---- Extractions

/// The kinds, as the program that extracts knows them.
enum ExtractionKind : int { kRegistrations = 0, kPathlines = 1 };

void Extract(const CYbSEDlgBase& page, int kind, int job) {
  if (auto* document = dynamic_cast<CFlowModelDoc*>(&page.Context().document)) document->RunExtraction(kind, job);
}

/// The jobs of one kind.
template <class List, class Item, int kind>
class ExtractionListDlg : public PageOf<List> {
 public:
  using PageOf<List>::PageOf;

 protected:
  void Describe(PageForm& form) override {
    const bool ofPathlines = kind == kPathlines;
    table_ = std::make_shared<TableOf<Item>>(this->Node());
    table_->ItemName("Extraction");
    table_->ReportCurrentRow();
    table_->Value(ofPathlines ? "Pathline extraction name" : "Registration extraction name", &Item::Name)
        .Width(200)
        .Hint(kNamesChange);
    table_->Value("Comment", &Item::Comment).Width(300);
    form.Table(table_);
    form.Button("Run Selected",
                [this] {
                  if (const int row = table_->FirstSelected()) Extract(*this, kind, row);
                })
        .ToolTip("Saves the setup and extracts what the first selected row tells");
    form.Button("Run All", [this] { Extract(*this, kind, -1); })
        .Beside()
        .ToolTip("Saves the setup and extracts what all rows tell");
  }

 private:
  std::shared_ptr<TableOf<Item>> table_;
};

template <class Item>
void RunButton(PageForm& form, Item& n, const CYbSEDlgBase& page, int kind) {
  form.Button("Run", [&n, &page, kind] { Extract(page, kind, n.GetNumberWhatAmI()); })
      .ToolTip("Saves the setup and extracts what this page tells");
}

/// A table of plain values.
template <class Value>
std::shared_ptr<TableOf<Value>> TableOfValues(std::vector<Value>& values, const char* head, const char* key) {
  auto table = std::make_shared<TableOf<Value>>(values);
  table->Value(head, [](Value& value) -> Value& { return value; }).Key(key).Width(170);
  return table;
}

/// A filter of registrations: everything that a check lets through, or what a table lists.
template <class Value>
void DescribeFilter(PageForm& form, const char* by, int& isBy, const char* all, int& isAll,
                    std::shared_ptr<TableOf<Value>> table, const Condition& alsoActive = {}) {
  form.Check(by, isBy);
  form.Check(all, isAll).EnabledWhen(On(isBy));
  const Condition listed = On(isBy) && !On(isAll);
  form.Table(table).EnabledWhen(alsoActive.IsAlways() ? listed : listed || alsoActive);
}

/// A date whose key holds the day alone.
Control& Day(PageForm& form, const char* label, CYbDateTime& value) {
  Control& date = form.Date(label, value);
  date.text = [&value] { return value.Format("%Y/%m/%d"); };
  return date;
}

void DescribeRegistrationExtraction(PageForm& form, CResultsPTRegExtractionItemKvf& n, CYbSEDlgBase& page) {
  form.Check("Create separate shape files for each extracted item", n.SeparateFilesCheck);
  form.Check("Additionally, create separate files for each numerical layer", n.SepatateLayerFilesCheck)
      .EnabledWhen(On(n.SeparateFilesCheck));
  form.Check("Create additional text file", n.AdditionalTextFile);
  const Condition someLayers = !On(n.AllLayerExtractionCheck), someDates = !On(n.AllRelDateExtractionCheck),
                  someTimes = !On(n.AllTrvTimesExtrCheck);
  form.Check("Extract particles originating in all layers", n.AllLayerExtractionCheck);
  form.Integer("Top layer", n.TopLayer).EnabledWhen(someLayers);
  form.Integer("Bottom layer", n.BottomLayer).Beside().EnabledWhen(someLayers);
  form.Check("Extract all release dates", n.AllRelDateExtractionCheck);
  Day(form, "Release dates between", n.StartDate).EnabledWhen(someDates);
  Day(form, "and", n.EndDate).Beside().EnabledWhen(someDates);
  form.Check("Extract all travel times", n.AllTrvTimesExtrCheck);
  form.Number("Extract travel times between", n.StartYear).EnabledWhen(someTimes);
  form.Number("and", n.EndYear).Beside().EnabledWhen(someTimes);
  form.Check("Only extract removed particles", n.OnlyRemovedByWellCheck);

  DescribeFilter(form.Group("Wells"), "Extract particles by destination well name", n.ExtrByWellCheck,
                 "Extract all wells", n.ExtrAllWellsCheck, TableOfValues(n.WellNames, "Well Name", "wellname"),
                 On(n.OnlyRemovedByWellCheck) && !On(n.ExtrAllWellsCheck));
  auto sinks = std::make_shared<TableOf<int>>(n.SinkCodes);
  sinks
      ->Choice(
          "Sink Code", [](int& code) -> int& { return code; }, CellChoices::Of(kSinkCodes))
      .Key("sinkcode")
      .Width(170);
  DescribeFilter(form.GroupBeside("Sinks"), "Extract particles by destination sink code", n.ExtrBySinkCodeCheck,
                 "Extract all sink codes", n.ExtrAllSinkCodesCheck, sinks);
  DescribeFilter(form.Group("Well fields"), "Extract particles by destination well field", n.ExtrByWellFieldCheck,
                 "Extract all well fields", n.ExtrAllWellFieldsCheck,
                 TableOfValues(n.WellFieldNames, "Well Field Name", "wellfieldname"));
  DescribeFilter(form.GroupBeside("Registration zones"), "Extract particles by destination registration code",
                 n.ExtrByRegCodeCheck, "Extract all registration codes", n.ExtrAllRegCodesCheck,
                 TableOfValues(n.RegCodes, "Registration Code", "regcode"));
  RunButton(form, n, page, kRegistrations);
}

void DescribePathlineExtraction(PageForm& form, CResultsPTPathlineExtractionItemKvf& n, CYbSEDlgBase& page) {
  form.Check("Create text file (all time steps of each particle)", n.CreateTextFile);
  form.Check("Create XML file (all particles of each time step)", n.CreateXMLFile);
  form.Check("Use compressed XML format", n.CompressedXMLFormat).EnabledWhen(On(n.CreateXMLFile));
  form.Check("Extract all particles", n.ExtrAllParticlesCheck);
  form.Table(TableOfValues(n.ParticleIDs, "Particle ID", "id")).EnabledWhen(!On(n.ExtrAllParticlesCheck));
  RunButton(form, n, page, kPathlines);
}

}  // namespace

std::span<const PageRow> ParticlePages() {
  static constexpr PageRow kRows[] = {
      DescribedBy<DescribeLenses>(kRegistrationLensesPage),
      PageIs<ExtractionListDlg<CResultsPTRegExtractionKvf, CResultsPTRegExtractionItemKvf, kRegistrations>,
             CResultsPTRegExtractionKvf>(kRegistrationExtractionsPage),
      PageIs<ExtractionListDlg<CResultsPTPathlineExtractionKvf, CResultsPTPathlineExtractionItemKvf, kPathlines>,
             CResultsPTPathlineExtractionKvf>(kPathlineExtractionsPage),
      DescribedBy<DescribeRegistrationExtraction>(kRegistrationExtractionPage),
      DescribedBy<DescribePathlineExtraction>(kPathlineExtractionPage),
  };
  return kRows;
}

}  // namespace tervane
