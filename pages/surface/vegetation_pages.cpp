// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/surface/vegetation_pages.h"

#include <algorithm>
#include <iterator>
#include <optional>

#include "pages/parts/create_dialogs.h"
#include "pages/parts/further_series.h"
#include "pages/parts/plot_content.h"
#include "pages/parts/series_controls.h"
#include "pages/parts/table_of_zones.h"
#include "pages/parts/zone_controls.h"
#include "pages/surface/crop_controls.h"
#include "platform/item_types.h"
#include "surface/pages.h"
#include "surface/vegetation.h"

namespace tervane {

namespace {

/// Both series in one chart.
SeriesContent SeriesChart(const VegetationCourse& course) {
  SeriesContent chart = FileChart(course.LaiFile());
  SeriesContent rootDepth = FileChart(course.RootDepthFile());
  std::ranges::move(rootDepth.series, std::back_inserter(chart.series));
  std::ranges::move(rootDepth.awaited, std::back_inserter(chart.awaited));
  if (chart.message.empty()) chart.message = std::move(rootDepth.message);
  if (!chart.period) chart.period = rootDepth.period;
  return chart;
}

// ---- The parameters of evapotranspiration

/// Holds copies of the parameters, so that giving up changes nothing.
class CEvapoParamDlg : public CYbSEDlgBase {
 public:
  CEvapoParamDlg(const PageContext& context, const EvapotranspirationParameters& parameters)
      : CYbSEDlgBase(values_, WithoutDocument(context)) {
    values_.EvapotranspirationParameters::operator=(parameters);
  }

  /// The parameters when the user has accepted them.
  std::optional<EvapotranspirationParameters> Run() {
    if (!Context().runDialog) return std::nullopt;
    Initialize();
    if (!Context().runDialog("Evapotranspiration parameters", *this, [] { return std::string(); })) return std::nullopt;
    return values_;
  }

 protected:
  void Describe(PageForm& form) override {
    form.Group("General ET parameters").Number("Canopy interception", values_.C_INT);
    PageForm& twoLayer = form.Group("2-Layer Water Balance ET parameters");
    twoLayer.Number("Reduce ET from roots when UZ deficit fraction is below ", values_.ETReduced);
    twoLayer.Label("(0 = full ET until wilting point; 1= reduced ET below field capacity)");
    PageForm& gravity = form.Group(" Gravity Flow and Richards ET parameters (Kristensen and Jensen)");
    gravity.Number("C1", values_.C1);
    gravity.Number("C2", values_.C2);
    gravity.Number("C3", values_.C3);
    gravity.Number("Aroot", values_.A_ROOT);
  }

 private:
  CVegetationKvf values_{nullptr};  ///< Of no setup, for the declarations of its keys.
};

void ChangeParameters(const CYbSEDlgBase& page, CVegetationKvf& n) {
  const auto parameters = CEvapoParamDlg(page.Context(), n).Run();
  if (!parameters) return;
  n.EvapotranspirationParameters::operator=(*parameters);
  page.UpdateDoc(kDataChanged, "Change ET Parameters");
}

// ---- How vegetation develops, of the whole model or of one station

/// The series of the stations beside one; of all where it stands for the whole model.
std::vector<NamedFile> FilesOfOthers(const VegetationCourse& course, const CYbSEKvfBase& owner) {
  std::vector<NamedFile> files;
  for (const CYbSEKvfBase* child = owner.GetFirstChild(); child; child = owner.GetNextChild(child)) {
    const auto* other = dynamic_cast<const VegetationCourse*>(child);
    const auto* station = dynamic_cast<const CodedZoneProp*>(child);
    if (!other || other == &course || !station || !other->IsOfForm(VegetationCourse::kTimeVarying).Holds(*child))
      continue;
    files.push_back({station->GetStationName() + " LAI", &other->LaiFile()});
    files.push_back({station->GetStationName() + " RD", &other->RootDepthFile()});
  }
  return files;
}

void DescribeCourse(PageForm& form, const CYbSEDlgBase& page, VegetationCourse& course, const CYbSEKvfBase& owner) {
  const Condition isConstant = course.IsOfForm(VegetationCourse::kConstant),
                  isOverTime = course.IsOfForm(VegetationCourse::kTimeVarying);
  form.Number("LAI Constant Value:", course.FIXED_VALUE_LAI).ShownWhen(isConstant);
  form.Number("RD Constant Value:", course.FIXED_VALUE_RD).ShownWhen(isConstant);
  DescribeSeriesFile(form, page, "LAI Timeseries File:", course.LaiFile(),
                     {course.FIXED_VALUE_LAI, {quantity::kLeafAreaIndex}, {}, "LAI"}, isOverTime);
  DescribeSeriesFile(form, page, "RD Timeseries File:", course.RootDepthFile(),
                     {course.FIXED_VALUE_RD, {quantity::kRootDepth}, {}, "RD"}, isOverTime);
  const auto offers = [&course, &owner] {
    return OffersBeside(course.LaiFile(), "Other stations", FilesOfOthers(course, owner));
  };
  form.Chart(WithFurtherSeries([&course] { return SeriesChart(course); }, offers)).ShownWhen(isOverTime);
}

constexpr ZoneSourceWords kStationWords{.grid = "Station Based Distribution File:",
                                        .gridFilter = "Station distr.files (*.nds2) |*.nds2|All Files (*.*) |*.*||",
                                        .shape = "Shape File:",
                                        .units = "X- and Y-axis Units:",
                                        .isEditBeside = false,
                                        .newCode = [](const CYbSEKvfBase& node) {
                                          return static_cast<const CVegetationKvf&>(node).Global().FIXED_VALUE_LAI;
                                        }};

/// The vegetation: uniform, by stations, or for each cell.
class CVegetationDlg : public PageOf<CVegetationKvf> {
 public:
  using PageOf::PageOf;

  void OnRefresh() override { RefreshZones(*this, Node().Stations(), "Refresh Stations"); }

 protected:
  void Describe(PageForm& form) override;

 private:
  CropControls crops_{Node().Global().Crops(), *this};
  TableOfZones stations_{Node().Stations()};
};

void CVegetationDlg::Describe(PageForm& form) {
  CVegetationKvf& n = Node();
  CVegetationFullyDistKvf& fully = n.FullyDistributed();
  const auto is = [&n](int distribution) { return Is(n.DistributionType, distribution); };
  const Condition isUniform = is(CVegetationKvf::kUniform), isByStations = is(CVegetationKvf::kStationBased),
                  isByCells = is(CVegetationKvf::kFullyDistributed),
                  isCrops = n.Global().IsOfForm(VegetationCourse::kCrops);
  form.Choice("Spatial Distribution:", n.DistributionType).RevalidatesLater();
  form.Choice("Temporal Distribution:", n.Global().TYPE).ShownWhen(isUniform);
  form.Choice("Data Type:", n.Stations().TYPE).ShownWhen(isByStations).Then([this] {
    return SyncWithSource(Outside(), Node().Stations());
  });
  form.Choice("Temporal Distribution:", fully.TYPE).ShownWhen(isByCells);
  DescribeCourse(form, *this, n.Global(), n);
  crops_.Describe(form, "Crop development:", isCrops);
  DescribeZoneSource(form, *this, n.Stations(), kStationWords);
  stations_.Describe(form, *this);
  form.Map([this] {
        MapContent map = ZoneMap(Node().Stations(), nullptr);
        if (stations_.Follow(map.awaited) && Context().syncSoon) Context().syncSoon();
        GoToPickedZone(map, *this, Node().Stations());
        return map;
      })
      .ShownWhen(isByStations);
  const auto grid = [&](const char* label, const char* caption, CFMData2DNdsFile& file) {
    form.DataFile(label, file).Filter(kGridFileFilter).DefaultExtension("nds2").ShownWhen(isByCells);
    form.Map([&file] { return FileMap(file); }).Caption(caption).ShownWhen(isByCells);
  };
  grid("LAI Grid Distribution File:", "LAI", fully.LaiFile());
  grid("RD Grid distribution file:", "RD", fully.RootDepthFile());
  form.Button("ET parameters ...", [this] { ChangeParameters(*this, Node()); }).ShownWhen(!isCrops);
}

/// The vegetation of a station.
class CVegetationTimeSeriesDlg : public PageOf<CVegetationTimeSeriesKvf> {
 public:
  using PageOf::PageOf;

 protected:
  void Describe(PageForm& form) override;

 private:
  CropControls crops_{Node().Crops(), *this};
};

void CVegetationTimeSeriesDlg::Describe(PageForm& form) {
  CVegetationTimeSeriesKvf& n = Node();
  const auto* owner = dynamic_cast<const CVegetationKvf*>(n.GetParent());
  ZoneName(form, "Station ID:", n);
  form.Choice("Temporal Distribution:", n.TYPE);
  ZoneIdentity(form, "areas", n, owner ? &owner->Stations() : nullptr);
  DescribeCourse(form, *this, n, owner ? static_cast<const CYbSEKvfBase&>(*owner) : n);
  crops_.Describe(form, "Crop Development:", n.IsOfForm(VegetationCourse::kCrops));
  if (owner) form.Map([&n, owner] { return ZoneMap(owner->Stations(), &n); });
}

}  // namespace

std::span<const PageRow> VegetationPages() {
  static constexpr PageRow kRows[] = {
      PageIs<CVegetationDlg, CVegetationKvf>(kVegetationPage),
      PageIs<CVegetationTimeSeriesDlg, CVegetationTimeSeriesKvf>(kVegetationStationPage),
  };
  return kRows;
}

}  // namespace tervane
