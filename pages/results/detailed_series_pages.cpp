// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/results/detailed_series_pages.h"

#include <algorithm>
#include <cmath>

#include <fmt/format.h>

#include "document/flow_model_document.h"
#include "forms/file_browse.h"
#include "forms/map_question.h"
#include "forms/table_of.h"
#include "libraries/river_network.h"
#include "pages/parts/create_dialogs.h"
#include "pages/parts/domain_map.h"
#include "pages/parts/file_controls.h"
#include "pages/parts/passport_notice.h"
#include "pages/parts/river_map.h"
#include "platform/item_types.h"
#include "platform/units.h"
#include "results/grid_series.h"
#include "results/named_places.h"
#include "results/pages.h"
#include "results/result_nodes.h"
#include "results/storing.h"
#include "simspec/river_branches.h"
#include "simspec/river_files.h"
#include "spatial/river_places.h"

namespace tervane {

namespace {

constexpr const char* kObservedFilter = "Time Series files (*.nds0)|*.nds0|All Files (*.*) |*.*||";

/// What the pages of both lists have: the import, the observed files, and the points on a map.
template <class List, class Item>
class DetailedSeriesDlg : public PageOf<List> {
 public:
  DetailedSeriesDlg(CYbSEKvfBase& node, const PageContext& context)
      : PageOf<List>(node, context), question_(context.syncSoon) {}

 protected:
  using PageOf<List>::Context;
  using PageOf<List>::Node;
  using PageOf<List>::Outside;
  using PageOf<List>::UpdateDoc;

  /// What a series of that point is a quantity of; 999 where nothing is known.
  virtual int QuantityOf(const Item& item) const = 0;
  /// The value with which a new file of observed values begins.
  virtual float FirstValueOf(const Item& /*item*/) const { return 0; }

  void ObservedColumns(TableOf<Item>& table) {
    table.Check("Incl. Obs.\nData", &Item::InclObserved).Key("InclObserved").Width(70);
    const auto isUnused = [](const Item& item) { return item.InclObserved == 0; };
    table
        .Value(
            "Observed Data File", [](const Item& item) { return item.Observed().File; },
            [](Item& item, const FileName& file) { item.Observed().Choose(file); })
        .Key("FILE_NAME")
        .HeadOver(4)
        .Width(200)
        .Filter(kObservedFilter)
        .DefaultExtension("nds0")
        .ToolTipOf([](const Item& item) { return item.Observed().File.Text(); })
        .GreyWhen(isUnused);
    const auto isUsed = [](const Item& item) { return item.InclObserved != 0; };
    table.Button("", "...", [this](Item& item) { ChooseFile(item); })
        .ToolTip("Choose a file and an item in it")
        .Width(30)
        .EnabledWhen(isUsed);
    table.Button("", "Edit...", [this](Item& item) { Edit(item); }).Width(50).EnabledWhen([isUsed](const Item& item) {
      return isUsed(item) && !item.Observed().File.IsEmpty();
    });
    table.Button("", "New...", [this](Item& item) { Create(item); }).Width(50).EnabledWhen(isUsed);
  }

  void ImportButton(PageForm& form) {
    form.Button("Import...", [this] { Import(); });
  }

  void Import() {
    const auto path = Outside().AskFileToOpen(
        {"Import Points", "Tab Delimited Textfile (*.txt)|*.txt|All Files (*.*)|*.*||", "txt", {}});
    if (!path) return;
    if (Context().document.PathName().empty())
      return Outside().ShowMessage("Document is not saved. Please save document first.", Host::Icon::Information);
    const DetailedImport done = Node().ImportFile(*path, Node().GetRoot()->SetupFolder());
    if (done.added > 0) UpdateDoc(kDataChanged | kItemAdded, "Import Points");
    if (done.result == 0) Outside().ShowMessage(done.message, Host::Icon::Error);
  }

  /// Does something with the point of that number, unless it is gone.
  void Change(std::uint64_t serial, const std::string& action, const std::function<void(Item&)>& change) {
    for (int number = 1; number <= Node().GetItemCount(); ++number) {
      Item& item = *Node().GetItem(number);
      if (item.Serial() != serial) continue;
      change(item);
      return UpdateDoc(kDataChanged | kRefreshPlots, action);
    }
  }

  static std::string NameOf(const Item& item, int number) {
    return item.Name.empty() ? std::to_string(number) : item.Name;
  }

  std::shared_ptr<TableOf<Item>> table_;
  MapQuestion question_;

 private:
  void ChooseFile(Item& item) {
    Host::FileQuestion question;
    question.title = "Choose Observed Data";
    question.filter = kObservedFilter;
    question.defaultExtension = "nds0";
    if (BrowseDataFile(item.Observed(), std::move(question), Outside()))
      UpdateDoc(kDataChanged, "Choose Observed Data File");
  }

  void Edit(const Item& item) { EditDataFile(Context(), item, item.Observed().File, item.Observed().SelectedItem()); }

  void Create(Item& item) {
    CTvnCreate0DNdsDlg dialog(Context(), Node(), FirstValueOf(item), {QuantityOf(item)}, {});
    if (const auto file = dialog.Run()) {
      item.Observed().Choose(*file);
      UpdateDoc(kDataChanged, "Create Time Series File");
    }
  }
};

// ---- Points of the model

using Point = CDetailedTSOutputItemKvf;

class CDetailedTSOutputDlg : public DetailedSeriesDlg<CDetailedTSOutputListKvf, Point> {
 public:
  using DetailedSeriesDlg::DetailedSeriesDlg;
  /// The first row starts a plot, also one that came there by an action in the table, as a part of that action.
  void SetData() override {
    if (std::exchange(isShown_, true) && Context().updateDoc) Node().StartFirstPlot();
  }

 protected:
  void Describe(PageForm& form) override;
  int QuantityOf(const Point& point) const override {
    const ResultDataType* type = ResultCatalogue::Own().Find(point.HydrComp);
    return type ? type->quantity : quantity::kUndefined;
  }
  float FirstValueOf(const Point& point) const override;

 private:
  const CellChoices& Types();
  void Pick(const Point& point);
  void AddFromFile();
  /// Adds points at those places, of the type of the current one.
  void Add(const NamedPlaces& read, const std::string& action);
  MapContent Map();

  bool isShown_ = false;
  std::string choicesOf_;
  CellChoices choices_;
};

float CDetailedTSOutputDlg::FirstValueOf(const Point& point) const {
  const ItemType* depth = FindItemType(quantity::kDepthBelowGround);
  const Unit& base = BaseUnit(*depth);
  const Unit& shown = Context().displayUnits ? Context().displayUnits->UnitOf(*depth) : base;
  return static_cast<float>(Convert(point.Z, base, shown));
}

const CellChoices& CDetailedTSOutputDlg::Types() {
  std::string text = Node().GetChoiceText();
  if (text == choicesOf_) return choices_;
  choices_.clear();
  if (const auto* types = Node().Important(kOutputGridSeries))
    for (const ResultDataType* type : types->SeriesTypes())
      choices_.emplace_back(type->newDataType, std::string(type->name));
  choicesOf_ = std::move(text);
  return choices_;
}

/// The name of a type, also of one that the setup does not store.
std::string TypeName(const Point& point) {
  if (point.HydrComp == 0) return {};
  const ResultDataType* type = ResultCatalogue::Own().Find(point.HydrComp);
  return type ? std::string(type->name) : std::to_string(point.HydrComp);
}

void CDetailedTSOutputDlg::Describe(PageForm& form) {
  CDetailedTSOutputListKvf& n = Node();
  form.FollowWhenShown([&n] { return n.StartFirstPlot(); });
  table_ = std::make_shared<TableOf<Point>>(n);
  table_->ItemName("Point");
  table_->ReportCurrentRow();
  table_->Value("Name", &Point::Name).Width(110);
  table_->Choice("Data type", &Point::HydrComp, [this](const Point&) { return Types(); })
      .Width(230)
      .ShownAs(TypeName)
      .ToolTipOf(TypeName)
      .Hint(kDataChanged | kRefreshPlots);
  table_->Check("New\nplot", &Point::Group).Key("Group").Width(50).GreyWhen([&n](const Point& point) {
    return n.GetItem(1) == &point;
  });
  table_->Value("X", &Point::X).Width(90).Format("%.6g").Hint(kDataChanged | kRefreshPlots);
  table_->Value("Y", &Point::Y).Width(90).Format("%.6g").Hint(kDataChanged | kRefreshPlots);
  table_
      ->Value("Depth",
              [](Point& point) -> CellPlace {
                if (!point.IsDepthActive()) return NoCell{"the type has no depth"};
                return &point.Z;
              })
      .Key("Z")
      .Quantity(quantity::kDepthBelowGround)
      .Width(70)
      .Format("%.6g")
      .GreyWhen([](const Point& point) { return !point.IsDepthActive(); });
  table_->Button("", "", [this](const Point& point) { Pick(point); })
      .Icon("target")
      .ToolTip("Select point in the plot")
      .Width(30);
  ObservedColumns(*table_);
  form.Table(table_);
  ImportButton(form);
  form.Button("Points from File...", [this] { AddFromFile(); })
      .Beside()
      .ToolTip("Adds a point for each of a point shape file, or of a table with the columns name, x and y");
  form.Button("Points from Wells", [this, &n] { Add(WellPlacesOf(n), "Add Points of Wells"); })
      .Beside()
      .ToolTip("Adds a point at each pumping well of the setup");
  form.Number("Minimum output time step:", n.MinimumOutputTimestep);
  form.Map([this] { return Map(); });
}

void CDetailedTSOutputDlg::AddFromFile() {
  const auto path = Outside().AskFileToOpen(
      {"Points from File", "Points (*.shp;*.csv;*.txt)|*.shp;*.csv;*.txt|All Files (*.*)|*.*||", "shp", {}});
  if (path) Add(ReadNamedPlaces(*path), "Add Points of File");
}

void CDetailedTSOutputDlg::Add(const NamedPlaces& read, const std::string& action) {
  if (!read.problem.empty()) return Outside().ShowMessage(read.problem, Host::Icon::Error);
  const Point* current = table_->Current();
  const int type = current ? current->HydrComp : 0;
  for (const auto& [name, place] : read.places) {
    Point& point = *Node().AddItem();
    point.Name = name;
    point.HydrComp = type;
    point.X = place.x;
    point.Y = place.y;
  }
  UpdateDoc(kDataChanged | kItemAdded | kRefreshPlots, action);
  if (read.notes.empty()) return;
  const auto shown = std::min<std::ptrdiff_t>(std::ssize(read.notes), 10);
  Outside().ShowMessage(fmt::format("{} points are added. Not taken:\n{}", read.places.size(),
                                    fmt::join(read.notes.begin(), read.notes.begin() + shown, "\n")),
                        Host::Icon::Warning);
}

void CDetailedTSOutputDlg::Pick(const Point& point) {
  const int number = Node().GetNumberWhatIs(&point);
  question_.AskPoint(fmt::format("Click the place of point {}. Esc gives up.", NameOf(point, number)),
                     [this, serial = point.Serial()](MapPoint place) {
                       Change(serial, "Select Place of Point", [place](Point& asked) {
                         asked.X = place.x;
                         asked.Y = place.y;
                       });
                     });
}

MapContent CDetailedTSOutputDlg::Map() {
  MapContent map = DomainMap(Node());
  for (GridLayer& grid : map.grids) grid.withLegend = false;
  PointLayer layer;
  for (int number = 1; number <= Node().GetItemCount(); ++number) {
    const Point& point = *Node().GetItem(number);
    if (!std::isfinite(point.X) || !std::isfinite(point.Y)) continue;
    if (number == table_->CurrentRow()) layer.highlighted.place = layer.points.size();
    layer.points.push_back({point.X, point.Y});
    layer.labels.push_back(NameOf(point, number));
  }
  if (!layer.points.empty()) map.points.insert(map.points.begin(), std::move(layer));
  question_.PutOn(map);
  return map;
}

// ---- Points of rivers

using RiverPoint = CDetailedFvrTSOutputItemKvf;

class CDetailedFvrTSOutputDlg : public DetailedSeriesDlg<CDetailedFvrTSOutputListKvf, RiverPoint> {
 public:
  using DetailedSeriesDlg::DetailedSeriesDlg;

 protected:
  void Describe(PageForm& form) override;
  int QuantityOf(const RiverPoint& point) const override {
    return point.DataType == RiverPoint::kDischarge ? quantity::kDischarge : quantity::kWaterLevel;
  }

 private:
  MapContent Map();
};

void CDetailedFvrTSOutputDlg::Describe(PageForm& form) {
  CDetailedFvrTSOutputListKvf& n = Node();
  table_ = std::make_shared<TableOf<RiverPoint>>(n);
  table_->ItemName("Point");
  table_->ReportCurrentRow();
  table_->Value("Name", &RiverPoint::Name).Width(110);
  table_->Choice("Data type", &RiverPoint::DataType).Width(100);
  table_->Value("Branch name", &RiverPoint::BranchName)
      .Width(140)
      .Hint(kDataChanged | kRefreshPlots)
      .Offers([&n](const RiverPoint&) { return RiverBranches::Of(n).Names(); });
  table_->Value("Chainage", &RiverPoint::Chainage).Width(90).Format("%.6g").Hint(kDataChanged | kRefreshPlots);
  ObservedColumns(*table_);
  form.Table(table_);
  ImportButton(form);
  form.Number("Minimum output time step:", n.MinimumOutputTimestep);
  form.Map([this] { return Map(); });
}

MapContent CDetailedFvrTSOutputDlg::Map() {
  MapContent map = DomainMap(Node());
  for (GridLayer& grid : map.grids) grid.withLegend = false;
  AddRiver(map, RiverFileOfSetup(Node()));
  const RiverBranches branches = RiverBranches::Of(Node());
  PointLayer layer;
  for (int number = 1; number <= Node().GetItemCount(); ++number) {
    const RiverPoint& point = *Node().GetItem(number);
    const RiverBranch* branch = branches.Reading().Find(point.BranchName);
    const auto chainage = static_cast<double>(point.Chainage);
    if (!branch || !branches.WhyOutside(point.BranchName, chainage).empty()) continue;
    const std::vector<MapPoint> course = CourseBetween(*branch, chainage, chainage);
    if (course.empty()) continue;
    if (number == table_->CurrentRow()) layer.highlighted.place = layer.points.size();
    layer.points.push_back(course.front());
    layer.labels.push_back(NameOf(point, number));
  }
  if (!layer.points.empty()) map.points.insert(map.points.begin(), std::move(layer));
  return map;
}

// ---- What a run tells

/// The page that a run has written to that file.
template <std::string (CFlowModelDoc::*file)() const>
void DescribeResultPage(PageForm& form, DetailedResultKvf& /*node*/, CYbSEDlgBase& page) {
  DescribePassport(form, page);
  form.Report([&page] {
    const auto* document = dynamic_cast<const CFlowModelDoc*>(&page.Context().document);
    return document && !document->PathName().empty() ? ResolvedPath((document->*file)(), {}) : std::string();
  });
}

}  // namespace

std::span<const PageRow> DetailedSeriesPages() {
  static constexpr PageRow kRows[] = {
      PageIs<CDetailedTSOutputDlg, CDetailedTSOutputListKvf>(kDetailedSeriesPage),
      PageIs<CDetailedFvrTSOutputDlg, CDetailedFvrTSOutputListKvf>(kDetailedRiverSeriesPage),
      DescribedBy<DescribeResultPage<&CFlowModelDoc::DetailedTimeSeriesPage>>(kDetailedResultPage),
      DescribedBy<DescribeResultPage<&CFlowModelDoc::DetailedRiverTimeSeriesPage>>(kDetailedRiverResultPage),
  };
  return kRows;
}

}  // namespace tervane
