// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/surface/irrigation_pages.h"

#include <algorithm>
#include <iterator>

#include <fmt/format.h>

#include "forms/map_question.h"
#include "forms/row_fields.h"
#include "pages/parts/create_dialogs.h"
#include "pages/parts/further_series.h"
#include "pages/parts/plot_content.h"
#include "pages/parts/river_map.h"
#include "pages/parts/series_controls.h"
#include "pages/parts/zone_controls.h"
#include "platform/item_types.h"
#include "simspec/river_branches.h"
#include "simspec/river_files.h"
#include "spatial/river_places.h"
#include "surface/irrigation.h"
#include "surface/pages.h"

namespace tervane {

namespace {

constexpr ZoneSourceWords kWords{};

// ---- A command area

using Source = CIrrCommandAreasPropSourceItemKvf;
using SourceTable = TableOf<Source>;

CellChoices ChoicesOf(KeyChoices keyChoices) {
  CellChoices choices;
  for (const KeyChoice& choice : keyChoices) choices.emplace_back(choice.value, std::string(choice.text));
  return choices;
}

/// A command area with its sources; the current one is shown below their table.
class CIrrCommandAreasPropDlg : public PageOf<CIrrCommandAreasPropKvf> {
 public:
  CIrrCommandAreasPropDlg(CYbSEKvfBase& node, const PageContext& context)
      : PageOf(node, context), question_(Context().syncSoon) {}

 protected:
  void Describe(PageForm& form) override;

 private:
  /// The columns of the table of sources.
  std::shared_ptr<SourceTable> CIrrCommandAreasPropSourceGrid();
  /// The current source is of that kind.
  Condition IsCurrent(Source::Kind kind, const char* sentence) const;
  void DescribeRiver(PageForm& form);
  void DescribeSingleWell(PageForm& form);
  void DescribeShallowWell(PageForm& form);
  void DescribeLicense(PageForm& form);
  void PickWell();
  void PickReach();
  /// Changes the source that was current when the map was asked, if it is still there.
  void Change(const Source* asked, const std::string& action, const std::function<void(Source&)>& change);
  /// The river network, and above it the reach of the current source.
  void AddReach(MapContent& map);
  void CreateLicense();
  MapContent Map();

  std::shared_ptr<SourceTable> table_;
  std::shared_ptr<const std::vector<MapLine>>
      reach_;  ///< Of the current source, kept so that maps tell it as the same.
  MapQuestion question_;
};

std::shared_ptr<SourceTable> CIrrCommandAreasPropDlg::CIrrCommandAreasPropSourceGrid() {
  auto table = std::make_shared<SourceTable>(Node().Sources());
  table->ItemName("Source");
  table->Choice("Type", &Source::SourceTypeCode).Width(90);
  // Applied as a sheet, water has an area of its own, which comes and goes in the tree.
  table
      ->Choice("Water Application", &Source::ShownApplication, &Source::SetShownApplication,
               ChoicesOf(kShownApplications))
      .Width(110)
      .Key("WaterApplication")
      .Hint(kDataChanged | kTreeRebuilt);
  if (table->RowCount() > 0) table->Choose(1);
  return table;
}

Condition CIrrCommandAreasPropDlg::IsCurrent(Source::Kind kind, const char* sentence) const {
  return Sentence(sentence, [table = table_, kind] {
    const Source* source = table->Current();
    return source && source->SourceTypeCode == kind;
  });
}

void CIrrCommandAreasPropDlg::DescribeRiver(PageForm& form) {
  RowFields<Source> fields(form, table_);
  fields.Value("River Name:", &Source::RiverNameRS).Offers([this](Source&) {
    return RiverBranches::Of(Node()).Names();
  });
  fields.Value("Upsteam Chainage:", &Source::UpstreamChainageRS);
  fields.Value("Downstream  Chainage:", &Source::DownstreamChainageRS);
  form.Button("Pick Reach on Map", [this] { PickReach(); })
      .ToolTip("Takes branch and chainages from a line that is drawn along the river on the map")
      .EnabledWhen("the setup has a river network", [this] { return RiverBranches::Of(Node()).AreKnown(); });
  fields.Value("Max rate:", &Source::CapacityRS);
  const auto withoutDischarge = [](const Source& source) { return source.UseThresholdDischargeRateRS == 0; };
  fields.Check("Use threshold river discharge", &Source::UseThresholdDischargeRateRS)
      .Key("UseThresholdDischargeRateRS");
  form.Label("River discharge:");
  fields.Value("Stop", &Source::ThresholdDischargeRateStopRS).GreyWhen(withoutDischarge);
  fields.Value("Restart", &Source::ThresholdDischargeRateRestartRS).GreyWhen(withoutDischarge);
  const auto withoutStage = [](const Source& source) { return source.UseThresholdStageRS == 0; };
  fields.Check("Use threshold river stage", &Source::UseThresholdStageRS).Key("UseThresholdStageRS");
  form.Label("River stage:");
  fields.Value("Stop", &Source::ThresholdStageStopRS).GreyWhen(withoutStage);
  fields.Value("Restart", &Source::ThresholdStageRestartRS).GreyWhen(withoutStage);
}

void CIrrCommandAreasPropDlg::DescribeSingleWell(PageForm& form) {
  RowFields<Source> fields(form, table_);
  fields.Value("X-Pos:", &Source::WellXposSIWS);
  fields.Value("Y-Pos:", &Source::WellYposSIWS);
  form.Button("Pick Well on Map", [this] { PickWell(); })
      .ToolTip("Takes the place of the well from a click on the map");
  fields.Value("Max rate:", &Source::CapacitySIWS);
  fields.Value("Max depth to water:", &Source::ThresholdDepthSIWS);
  fields.Value("Top of screen:", &Source::ScreenTopDepthSIWS);
  fields.Value("Bottom of Screen:", &Source::ScreenBottomDepthSIWS);
}

void CIrrCommandAreasPropDlg::DescribeShallowWell(PageForm& form) {
  RowFields<Source> fields(form, table_);
  fields.Value("Max rate:", &Source::CapacitySWS);
  fields.Value("Max depth to water:", &Source::ThresholdDepthSWS);
  fields.Value("Top of screen:", &Source::ScreenTopDepthSWS);
  fields.Value("Bottom of screen:", &Source::ScreenBottomDepthSWS);
}

void CIrrCommandAreasPropDlg::DescribeLicense(PageForm& form) {
  RowFields<Source> fields(form, table_);
  const auto isLimited = Sentence("the source is limited by a license", [table = table_] {
    const Source* source = table->Current();
    return source && source->IrrigationLicenseIncluded;
  });
  fields.Check("Include License Limited Irrigation", &Source::IrrigationLicenseIncluded)
      .Key("IrrigationLicenseIncluded");
  fields.DataFile("Time Series File:", [](Source& source) -> DataFileNode& { return source.LicenseFile(); })
      .Filter(kSeriesFileFilter)
      .DefaultExtension("nds0")
      .EnabledWhen(isLimited);
  form.Button("Edit...",
              [this] {
                const Source* source = table_->Current();
                if (source) Outside().OpenInEditor(source->LicenseFile().File.Absolute());
              })
      .EnabledWhen(isLimited);
  form.Button("Create...", [this] { CreateLicense(); }).Beside().EnabledWhen(isLimited);
}

void CIrrCommandAreasPropDlg::PickWell() {
  const Source* asked = table_->Current();
  if (!asked) return;
  question_.AskPoint("Click the place of the well. Esc gives up.", [this, asked](MapPoint place) {
    Change(asked, "Pick Place of the Well", [place](Source& source) {
      source.WellXposSIWS = static_cast<float>(place.x);
      source.WellYposSIWS = static_cast<float>(place.y);
    });
  });
}

void CIrrCommandAreasPropDlg::PickReach() {
  const Source* asked = table_->Current();
  if (!asked) return;
  question_.AskLine("Click the upstream end of the reach, then double click the other one. Esc gives up.",
                    [this, asked](const std::vector<MapPoint>& points) {
                      const RiverBranches branches = RiverBranches::Of(Node());
                      const CYbSimpleRiverData& network = branches.Reading().network;
                      const RiverPlace upstream = NearestPlace(network, points.front());
                      if (!upstream.branch) return;
                      const RiverPlace downstream = NearestPlace(network, points.back(), upstream.branch->name);
                      Change(asked, "Pick Reach of the Source", [&](Source& source) {
                        source.RiverNameRS = upstream.branch->name;
                        source.UpstreamChainageRS = static_cast<float>(upstream.chainage);
                        source.DownstreamChainageRS = static_cast<float>(downstream.chainage);
                      });
                    });
}

void CIrrCommandAreasPropDlg::Change(const Source* asked, const std::string& action,
                                     const std::function<void(Source&)>& change) {
  for (int row = 1; row <= table_->RowCount(); ++row) {
    Source& source = table_->At(row);
    if (&source != asked) continue;
    change(source);
    UpdateDoc(kDataChanged, action);
  }
}

void CIrrCommandAreasPropDlg::AddReach(MapContent& map) {
  const Source* source = table_->Current();
  if (!source || source->SourceTypeCode != Source::kRiver) return;
  AddRiver(map, RiverFileOfSetup(Node()));
  const RiverBranches branches = RiverBranches::Of(Node());
  const RiverBranch* branch = branches.Reading().Find(source->RiverNameRS);
  if (!branch) return;
  constexpr unsigned kReachOrange = 0xd9730d;
  std::vector<MapPoint> course = CourseBetween(*branch, static_cast<double>(source->UpstreamChainageRS),
                                               static_cast<double>(source->DownstreamChainageRS));
  if (!reach_ || reach_->front().points != course)
    reach_ = std::make_shared<const std::vector<MapLine>>(
        1, MapLine{.name = source->RiverNameRS, .points = std::move(course)});
  LineLayer reach;
  reach.lines = reach_;
  reach.withNames = false;
  reach.lineColor = kReachOrange;
  reach.lineWidth = 4;
  if (reach.lines->front().points.size() > 1) map.lines.push_back(std::move(reach));
}

void CIrrCommandAreasPropDlg::CreateLicense() {
  Source* source = table_->Current();
  if (!source) return;
  CTvnCreate0DNdsDlg dialog(Context(), Node(), 0, source->LicenseFile().ItemTypes, {});
  dialog.SetTitle("License limitated irrigation");
  if (const auto file = dialog.Run()) {
    source->LicenseFile().Choose(*file);
    UpdateDoc(kDataChanged, "Create Time Series File");
  }
}

MapContent CIrrCommandAreasPropDlg::Map() {
  MapContent map = ZoneMap(*ZonesOf(Node()), &Node());
  PointLayer wells;
  for (int row = 1; row <= table_->RowCount(); ++row) {
    const Source& source = table_->At(row);
    if (source.SourceTypeCode != Source::kSingleWell) continue;
    if (row == table_->CurrentRow()) wells.highlighted.place = wells.points.size();
    wells.points.push_back({static_cast<double>(source.WellXposSIWS), static_cast<double>(source.WellYposSIWS)});
    wells.labels.push_back(fmt::format("Source {}", row));
  }
  if (!wells.points.empty() && !map.IsEmpty()) map.points.insert(map.points.begin(), std::move(wells));
  if (!map.IsEmpty()) AddReach(map);
  question_.PutOn(map);
  return map;
}

void CIrrCommandAreasPropDlg::Describe(PageForm& form) {
  CIrrCommandAreasPropKvf& n = Node();
  table_ = CIrrCommandAreasPropSourceGrid();
  ZoneName(form, "ID:", n);
  ZoneIdentity(form, "areas", n, ZonesOf(n));
  form.Label("Sources:");
  form.Table(table_);
  DescribeRiver(form.Group("River source", IsCurrent(Source::kRiver, "a river is the chosen source")));
  DescribeSingleWell(
      form.Group("Single well source", IsCurrent(Source::kSingleWell, "a single well is the chosen source")));
  DescribeShallowWell(
      form.Group("Shallow well source", IsCurrent(Source::kShallowWell, "shallow wells are the chosen source")));
  PageForm& external = form.Group("External source", IsCurrent(Source::kExternal, "an external source is chosen"));
  RowFields<Source>(external, table_).Value("Max rate:", &Source::CapacityES);
  DescribeLicense(form.Group("License Limited Irrigation",
                             Sentence("a source is chosen", [table = table_] { return table->Current() != nullptr; })));
  const CodedZonesKvf* areas = ZonesOf(n);
  form.Map([this] { return Map(); }).ShownWhen("the areas are distributed", [areas] {
    return areas && areas->IsInForce();
  });
}

// ---- A demand

/// The series of the demand, below each other.
SeriesContent DemandChart(const CIrrDemandPropKvf& demand) {
  SeriesContent chart;
  int panel = 0;
  for (const DemandValue& value : CIrrDemandPropKvf::Values()) {
    if (value.demandType != demand.DemandType) continue;
    SeriesContent ofFile = FileChart(demand.FileOf(value));
    for (Series& series : ofFile.series) {
      series.name = value.chartTitle;
      series.panel = panel;
    }
    std::ranges::move(ofFile.series, std::back_inserter(chart.series));
    std::ranges::move(ofFile.awaited, std::back_inserter(chart.awaited));
    chart.period = ofFile.period;
    if (chart.message.empty()) chart.message = std::move(ofFile.message);
    ++panel;
  }
  return chart;
}

/// The series of one value of all other demands.
std::vector<NamedFile> FilesOfOthers(const CIrrDemandPropKvf& demand, const DemandValue& value) {
  std::vector<NamedFile> files;
  const auto* owner = dynamic_cast<const CFMSEKvfBase*>(demand.GetParent());
  if (!owner) return files;
  for (const CFMSEKvfGroupBase* zone : ZoneItems(*owner)) {
    const auto* other = dynamic_cast<const CIrrDemandPropKvf*>(zone);
    if (other && other != &demand && other->TYPE == CIrrDemandPropKvf::kSeries &&
        other->DemandType == demand.DemandType)
      files.push_back({other->NAME, &other->FileOf(value)});
  }
  return files;
}

void DescribeDemand(PageForm& form, CIrrDemandPropKvf& n, CYbSEDlgBase& page) {
  using Demand = CIrrDemandPropKvf;
  ZoneName(form, "ID:", n);
  ZoneIdentity(form, "zones", n, ZonesOf(n));
  form.Choice("Demand type:", n.DemandType).RevalidatesLater();
  form.Choice("Temporal Distribution:", n.TYPE).RevalidatesLater();
  form.Choice("Ref. moisture content:", n.DemandReferenceMoistureContent)
      .ShownWhen(Is(n.DemandType, Demand::kMaxAllowedDeficit));
  for (const DemandValue& value : Demand::Values()) {
    const Condition isAsked = Is(n.DemandType, value.demandType);
    form.Number(value.constantLabel, n.*value.constant).ShownWhen(isAsked && Is(n.TYPE, Demand::kConstant));
    DescribeSeriesFile(form, page, value.fileLabel, n.FileOf(value), {n.*value.constant, {value.itemType}},
                       isAsked && Is(n.TYPE, Demand::kSeries));
  }
  const auto offers = [&n] {
    const DemandValue* own = nullptr;
    for (const DemandValue& value : Demand::Values())
      if (!own && value.demandType == n.DemandType) own = &value;
    return own ? OffersBeside(n.FileOf(*own), "Other demands", FilesOfOthers(n, *own)) : std::vector<SeriesOffer>();
  };
  form.Chart(WithFurtherSeries([&n] { return DemandChart(n); }, offers)).ShownWhen(Is(n.TYPE, Demand::kSeries));
  PlaceOfZone(form, n);
}

}  // namespace

std::span<const PageRow> IrrigationPages() {
  static constexpr PageRow kRows[] = {
      PageIs<ZonesPage<kWords>, CodedZonesKvf>(kCommandAreasPage),
      PageIs<CIrrCommandAreasPropDlg, CIrrCommandAreasPropKvf>(kCommandAreaPage),
      PageIs<ZonesPage<kWords>, CodedZonesKvf>(kDemandsPage),
      DescribedBy<DescribeDemand>(kDemandPage),
      PageIs<ZonesPage<kWords>, CodedZonesKvf>(kPrioritiesPage),
  };
  return kRows;
}

}  // namespace tervane
