// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/parts/create_dialogs.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include "data/grid_files.h"
#include "data/series_csv.h"
#include "data/series_file.h"
#include "pages/parts/file_controls.h"
#include "platform/item_types.h"
#include "platform/paths.h"
#include "platform/text.h"
#include "platform/units.h"
#include "simspec/periods.h"
#include "spatial/domain.h"

namespace tervane {

namespace {

constexpr const char* kTextFilter = "Text Files (*.txt) |*.txt|All Files (*.*) |*.*||";

/// A new file in the setup's folder, named after what it is for.
FileName NewFile(const PageContext& context, const std::string& baseName, const char* extension) {
  const std::string folder(FolderOf(context.document.PathName()));
  const std::string path = fmt::format("{}{}{}.{}", folder, folder.empty() ? "" : "/", baseName, extension);
  return FileName::Picked(Replaced(path, ",", "-"), context.document.Root().SetupFolder());
}

/// The way to another file that is to be made.
void BrowseToSave(Control& control, FileName& file, std::string folder) {
  control.browse = [&control, &file, folder = std::move(folder)](Host& host) {
    Host::FileQuestion question = control.fileQuestion;
    question.current = file.Absolute();
    const auto path = host.AskFileToSave(question);
    if (path) file = FileName::Picked(*path, folder);
    return path.has_value();
  };
}

/// False when the file exists and the user wants to keep it.
bool MayReplace(const FileName& file, Host& host) {
  if (!FileExists(file.Absolute())) return true;
  const std::string question = fmt::format("The file does already exist:\n{}\n\nCreate file anyway ?", file.Absolute());
  return host.Ask(question, Host::Icon::Question, Host::Buttons::YesNo) == Host::Answer::Yes;
}

/// Cells along the edges of a model domain are 2, its corners lie outside.
void PaintEdges(CTvn2DOrthoRotatedGridData& grid, float deleteValue) {
  const int nx = grid.Geometry().nx, ny = grid.Geometry().ny;
  float* cells = grid.GetData();
  for (int j = 0; j < ny; ++j) {
    for (int i = 0; i < nx; ++i) {
      const bool isAtSide = i == 0 || i == nx - 1, isAtEnd = j == 0 || j == ny - 1;
      float& cell = cells[static_cast<std::size_t>(j) * static_cast<std::size_t>(nx) + static_cast<std::size_t>(i)];
      if (isAtSide && isAtEnd)
        cell = deleteValue;
      else if (isAtSide || isAtEnd)
        cell = 2.0F;
    }
  }
}

/// Stays in the dialog without a message: the user was asked already.
constexpr const char* kStay = " ";

/// Writes a file while the user may watch and give up; gives why the dialog must stay.
std::string Write(const FileName& file, Host& host,
                  std::function<FileResult(const std::string& path, ProgressPart progress)> write) {
  struct Nothing {};
  const auto writing =
      std::make_shared<Computed<Nothing>>(fmt::format("Writing {}", FileNameOf(file.Absolute())),
                                          [path = file.Absolute(), write = std::move(write)](
                                              Nothing&, ProgressPart progress) { return write(path, progress); });
  return host.Compute(writing) ? writing->Problem() : kStay;
}

std::optional<FileName> RunDialog(const PageContext& context, const char* title, CYbSEDlgBase& dialog,
                                  const FileName& file, const std::function<std::string()>& create) {
  if (!context.runDialog) return std::nullopt;
  dialog.Initialize();
  return context.runDialog(title, dialog, create) ? std::optional(file) : std::nullopt;
}

}  // namespace

PageContext WithoutDocument(PageContext context) {
  context.updateDoc = {};
  return context;
}

// ---- Grids

CData2DNdsCreateDlg::CData2DNdsCreateDlg(const PageContext& context, CYbSEKvfBase& node, float value, float deleteValue,
                                         int itemType, bool isDomain)
    : CYbSEDlgBase(node, WithoutDocument(context)),
      isDomain_(isDomain),
      itemType_(itemType),
      fixedValue_(value),
      deleteValue_(deleteValue),
      gridFile_(NewFile(context, node.GetTitle(), "nds2")) {
  if (const auto* domain = node.Important(kDomain)) geometry_ = domain->GetModelGeometry();
}

CData2DNdsCreateDlg::CData2DNdsCreateDlg(const PageContext& context, float value, CYbSEKvfBase& node, int itemType)
    : CData2DNdsCreateDlg(context, node, value, kUsualDeleteValue, itemType, false) {}

CData2DNdsCreateDlg::CData2DNdsCreateDlg(const PageContext& context, CYbSEKvfBase& node)
    : CData2DNdsCreateDlg(context, node, -1.0F, -1.0F, quantity::kCode, true) {}

std::optional<FileName> CData2DNdsCreateDlg::Run() {
  if (!MayCreateFile(Context())) return std::nullopt;
  return RunDialog(Context(), "Create grid data", *this, gridFile_, [this] { return CreateFile(); });
}

void CData2DNdsCreateDlg::Describe(PageForm& form) {
  const Condition isFixed = Is(contents_, kFixedValue), isText = Is(contents_, kTextFile);
  form.Radio("", contents_, {isDomain_ ? "1: Inner points, 2: Outer points" : "Fixed value", "Import from text file"});
  if (!isDomain_) form.Number("Fixed Value:", fixedValue_).Quantity(itemType_).EnabledWhen(isFixed);
  Control& text = form.File("Filename:", textFile_);
  text.Filter(kTextFilter).DefaultExtension("txt").EnabledWhen(isText).Then([this] {
    if (const std::string problem = ImportText(); !problem.empty()) Outside().ShowMessage(problem, Host::Icon::Error);
    return 0;
  });
  form.Number("Delete Value:", deleteValue_).ShownWhen(isText);
  PageForm& grid = form.Group("Grid");
  grid.Integer("NX:", geometry_.nx).EnabledWhen(isFixed);
  grid.Integer("NY:", geometry_.ny).EnabledWhen(isFixed);
  grid.Number("Cell size:", geometry_.cellSize).Quantity(quantity::kHorizontalLength);
  grid.Number("X0:", geometry_.x0).Quantity(quantity::kHorizontalLength);
  grid.Number("Y0:", geometry_.y0).Quantity(quantity::kHorizontalLength);
  grid.Number("Rotation:", geometry_.rotation).Unit("[Deg, Counter clockwise]");
  grid.Text("Map Projection Type:", geometry_.projection);
  Control& file = form.File("Nds filename:", gridFile_);
  file.Filter("NDS2 Files (*.nds2) |*.nds2|All Files (*.*) |*.*||").DefaultExtension("nds2");
  BrowseToSave(file, gridFile_, Context().document.Root().SetupFolder());
}

int CData2DNdsCreateDlg::ValueUnit() const {
  const ItemType* type = FindItemType(itemType_);
  if (!type || itemType_ == quantity::kUndefined) return 0;
  return Context().displayUnits && !isDomain_ ? Context().displayUnits->UnitKey(itemType_) : BaseUnit(*type).key;
}

std::string CData2DNdsCreateDlg::ImportText() {
  imported_ = nullptr;
  const auto reading = std::make_shared<Computed<ImportedGrid>>(
      fmt::format("Reading {}", FileNameOf(textFile_.Absolute())),
      [path = textFile_.Absolute(), geometry = geometry_, deleteValue = deleteValue_, unit = ValueUnit(),
       itemType = itemType_](ImportedGrid& read, ProgressPart progress) {
        FileResult result = read.grid.ReadTextFile(path, geometry, deleteValue, unit, itemType, progress);
        read.note = result.note;
        return result;
      });
  if (!Outside().Compute(reading)) return {};
  imported_ = reading->Result();
  if (!imported_) return reading->Problem();
  imported_->grid.GetXYAxisInfo(&geometry_.nx, &geometry_.ny, &geometry_.cellSize);
  return imported_->note;
}

std::function<std::string(CTvn2DOrthoRotatedGridData&)> CData2DNdsCreateDlg::GridMaker() const {
  const int unit = ValueUnit();
  const ItemType* type = FindItemType(itemType_);
  const float value =
      unit == 0 ? fixedValue_
                : static_cast<float>(Convert(static_cast<double>(fixedValue_), BaseUnit(*type), *FindUnit(unit)));
  return [geometry = geometry_, value, deleteValue = deleteValue_, unit, itemType = itemType_,
          isDomain = isDomain_](CTvn2DOrthoRotatedGridData& grid) {
    if (!isDomain) return grid.SetGridData(geometry, value, deleteValue, unit, itemType);
    std::string problem = grid.SetGridData(geometry, 1.0F, deleteValue, unit, itemType);
    if (problem.empty()) PaintEdges(grid, deleteValue);
    return problem;
  };
}

std::string CData2DNdsCreateDlg::CreateFile() {
  if (contents_ == kTextFile && !imported_) return "Load a valid text file";
  if (contents_ == kFixedValue)
    if (std::string problem = geometry_.Problem(); !problem.empty()) return problem;
  if (!MayReplace(gridFile_, Outside())) return kStay;
  return Write(gridFile_, Outside(),
               [make = GridMaker(), imported = contents_ == kTextFile ? imported_ : nullptr, deleteValue = deleteValue_,
                name = Node().GetTitle()](const std::string& path, ProgressPart progress) {
                 CTvn2DOrthoRotatedGridData grid;
                 if (imported)
                   grid = imported->grid;
                 else if (std::string problem = make(grid); !problem.empty())
                   return FileResult{std::move(problem), {}};
                 if (imported) grid.SetDeleteValue(deleteValue);
                 grid.SetItemName(name);
                 return WriteGridData(path, grid, progress);
               });
}

// ---- Shapes

CData2DShpCreateDlg::CData2DShpCreateDlg(const PageContext& context, CYbSEKvfBase& node, const std::string& baseName)
    : CYbSEDlgBase(node, WithoutDocument(context)), file_(NewFile(context, baseName, "shp")) {}

std::optional<FileName> CData2DShpCreateDlg::Run() {
  if (!MayCreateFile(Context())) return std::nullopt;
  return RunDialog(Context(), "Create shape file", *this, file_, [this] { return CreateFile(); });
}

void CData2DShpCreateDlg::Describe(PageForm& form) {
  Control& file = form.File("Shape filename:", file_);
  file.Filter("Shape files (*.shp) |*.shp|All Files (*.*) |*.*||").DefaultExtension("shp");
  BrowseToSave(file, file_, Context().document.Root().SetupFolder());
}

std::string CData2DShpCreateDlg::CreateFile() {
  if (!MayReplace(file_, Outside())) return kStay;
  CTvnShapeData shapes;
  shapes.Create(ShapeKind::Polygon, {}, {});
  return shapes.SaveShapeFile(file_.Absolute()).error;
}

// ---- Series

CTvnCreate0DNdsDlg::CTvnCreate0DNdsDlg(const PageContext& context, CYbSEKvfBase& node, float value,
                                       std::vector<int> itemTypes, std::vector<int> valueTypes)
    : CYbSEDlgBase(node, WithoutDocument(context)),
      itemTypes_(std::move(itemTypes)),
      valueTypes_(valueTypes.empty() ? std::vector{0, 1, 2, 3} : std::move(valueTypes)),
      value_(static_cast<double>(value)) {
  SetTitle(node.GetTitle());
  if (const auto* period = node.Important(kSimulationPeriod)) {
    start_ = period->GetSimStartDate();
    end_ = period->SIMEND;
  }
}

void CTvnCreate0DNdsDlg::SetTitle(std::string title) {
  title_ = std::move(title);
  file_ = NewFile(Context(), title_, "nds0");
}

std::optional<FileName> CTvnCreate0DNdsDlg::Run() {
  if (!MayCreateFile(Context())) return std::nullopt;
  return RunDialog(Context(), "Create time series", *this, file_, [this] { return CreateFile(); });
}

void CTvnCreate0DNdsDlg::Describe(PageForm& form) {
  std::vector<std::string> quantities, kinds;
  for (const int code : itemTypes_) {
    const ItemType* type = FindItemType(code);
    quantities.push_back(type ? std::string(type->name) : std::to_string(code));
  }
  constexpr const char* kKinds[] = {"Instantaneous", "Accumulated", "Accumulated over the step", "Mean over the step"};
  for (const int kind : valueTypes_) kinds.emplace_back(kKinds[kind]);
  const Condition isOneValue = Sentence("no rows are pasted", [this] { return Trimmed(rows_).empty(); });
  form.Choice("Quantity:", itemType_, std::move(quantities));
  form.Choice("Kind of value:", valueType_, std::move(kinds));
  form.Date("Start Date:", start_).EnabledWhen(isOneValue);
  form.Date("End Date:", end_).EnabledWhen(isOneValue);
  form.Number("Time step:", stepHours_).Unit("hours").EnabledWhen(isOneValue);
  for (std::size_t i = 0; i < itemTypes_.size(); ++i)
    form.Number("Value:", value_)
        .Quantity(itemTypes_[i])
        .EnabledWhen(isOneValue)
        .ShownWhen(Is(itemType_, static_cast<int>(i)));
  form.LongText("Or dates and values, a row each, as pasted from a spreadsheet:", rows_);
  Control& file = form.File("Nds filename:", file_);
  file.Filter(kSeriesFileFilter).DefaultExtension("nds0");
  BrowseToSave(file, file_, Context().document.Root().SetupFolder());
}

std::string CTvnCreate0DNdsDlg::CreateFile() {
  constexpr std::size_t kMostSteps = 50'000'000;
  NewSeries series;
  std::vector<std::string> notes;
  series.name = title_;
  series.itemType = itemTypes_[static_cast<std::size_t>(itemType_)];
  series.valueType = valueTypes_[static_cast<std::size_t>(valueType_)];
  if (!Trimmed(rows_).empty()) {
    CsvSeries pasted = ReadPastedSeries(rows_);
    if (!pasted.error.empty()) return pasted.error;
    if (pasted.stamps.size() < 2) return "at least two rows with a date and a number were expected";
    series.times = std::move(pasted.stamps);
    series.values = std::move(pasted.values);
    notes = std::move(pasted.notes);
  } else {
    if (!start_.IsValid() || !end_.IsValid() || end_ <= start_) return "the end date must lie behind the start date";
    const auto seconds = static_cast<std::int64_t>(stepHours_ * 3600.0 + 0.5);
    if (!(stepHours_ > 0) || seconds < 1) return "the time step must be at least a second";
    const std::int64_t length = (end_ - start_).seconds;
    if (length / seconds > static_cast<std::int64_t>(kMostSteps))
      return fmt::format("the file would have {} steps: choose a longer step", length / seconds);
    // Both ends of the period have a value, the last step is cut where it does not fit.
    for (std::int64_t second = 0; second < length; second += seconds)
      series.times.push_back(start_ + CYbDateTimeSpan{second});
    series.times.push_back(end_);
    series.values.assign(series.times.size(), static_cast<float>(value_));
  }
  if (!MayReplace(file_, Outside())) return kStay;
  std::string problem =
      Write(file_, Outside(), [series = std::move(series)](const std::string& path, ProgressPart progress) {
        return WriteSeriesFile(path, series, progress);
      });
  if (problem.empty() && !notes.empty())
    Outside().ShowMessage(fmt::format("The file is made. {}", fmt::join(notes, "; ")), Host::Icon::Information);
  return problem;
}

}  // namespace tervane
