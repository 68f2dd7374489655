// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/editors/grid_editor.h"

#include <QAction>
#include <QActionGroup>
#include <QComboBox>
#include <QFileInfo>
#include <QHBoxLayout>
#include <QLabel>
#include <QLineEdit>
#include <QPainter>
#include <QSignalBlocker>
#include <QSpinBox>
#include <QSplitter>
#include <QToolButton>
#include <QVBoxLayout>
#include <algorithm>
#include <cmath>

#include "data/csv_reader.h"
#include "pages/parts/plot_content.h"
#include "platform/text.h"
#include "shell/editors/edit_panel.h"
#include "shell/editors/edit_table.h"
#include "shell/maps/map_canvas.h"
#include "shell/maps/map_view.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr int kCountDelay = 150;  ///< Milliseconds after which a selection that rests is counted.
constexpr unsigned kSelectedColor = 0x2a7fd4;

/// A line on light and dark ground.
void DrawOutline(QPainter& painter, const QPolygonF& outline) {
  painter.setBrush(Qt::NoBrush);
  for (const QPen& pen : {QPen(Qt::white, 3), QPen(QColor(0x1d, 0x22, 0x2a), 1.2)}) {
    painter.setPen(pen);
    painter.drawPolygon(outline);
  }
}

QString ShortNumber(double value, const QString& unit = {}) {
  return std::isfinite(value) ? QString::number(value, 'g', 7) + unit : QString("-");
}

}  // namespace

GridEditor::GridEditor(const std::string& path, Host& host) : EditTab(host), edit_(path) {
  // In the order of the keyboard.
  auto* tools = BuildTools();
  map_ = new MapView(host);
  table_ = BuildTable();
  panel_ = BuildPanel();
  auto* split = new QSplitter(Qt::Vertical);
  split->setChildrenCollapsible(false);
  split->addWidget(map_);
  split->addWidget(table_);
  split->setStretchFactor(0, 1);
  split->setSizes({Theme::Get().Scaled(460), Theme::Get().Scaled(190)});
  auto* body = new QWidget;
  auto* column = new QVBoxLayout(body);
  const int margin = Theme::Get().Scaled(8);
  column->setContentsMargins(margin, margin, margin, margin);
  column->addWidget(tools);
  auto* row = new QHBoxLayout;
  row->addWidget(split, 1);
  row->addWidget(panel_);
  column->addLayout(row, 1);
  SetBody(body);
  HoldFile();
  count_.setSingleShot(true);
  count_.setInterval(kCountDelay);
  connect(&count_, &QTimer::timeout, this, &GridEditor::ShowStatistics);
  if (!edit_.Problem().empty()) return;
  FillItems();
  Sync();
  for (const std::string& note : edit_.Notes()) panel_->Tell(panel_->Told() + Translated(note) + "\n");
}

GridEditor::~GridEditor() {
  // What shows the grid goes before the grid does.
  delete map_;
}

void GridEditor::Commit() {
  if (!edit_.Problem().empty()) return;
  table_->CommitOpenEditor();
  edit_.EndStroke();
  WaitForPicture();
}

Host::FileQuestion GridEditor::NameQuestion() const {
  const std::string suffix = FromQt(QFileInfo(ToQt(Path())).suffix());
  return {"Save As", "Data file (*." + suffix + ")|*." + suffix + "|All Files (*.*)|*||", suffix, Path()};
}

void GridEditor::PutOverMaps(std::function<void(MapContent& map)> put) {
  put_ = std::move(put);
  if (edit_.Problem().empty()) ShowMap();
}

void GridEditor::KeepBackdrop(std::vector<BackdropLayer> layers) {
  kept_ = std::move(layers);
  if (!edit_.Problem().empty()) return;
  ShowMap();
  for (const BackdropLayer& layer : kept_)
    if (std::holds_alternative<GridLayer>(layer.drawn)) map_->Look(layer.title, {.isShown = false, .transparency = 0});
}

// ---- What is shown

void GridEditor::Sync() {
  if (!edit_.Problem().empty()) return;
  if (items_->currentIndex() != edit_.Item() - 1 || !coloured_) return ShowItem();
  if (coloured_ != edit_.Grid()) return ShowSlice();
  Follow();
}

void GridEditor::Reread() {
  if (!edit_.Problem().empty()) return;
  FillItems();
  ShowItem();
}

void GridEditor::FillItems() {
  const QSignalBlocker blocked(items_);
  items_->clear();
  for (const DataItem& item : edit_.Items()) {
    items_->addItem(ToQt(item.name));
    if (item.dimensions < 2) items_->setItemData(items_->count() - 1, 0, Qt::UserRole - 1);  // cannot be chosen
  }
}

void GridEditor::ShowItem() {
  const DataItem& item = edit_.ItemFacts();
  const QSignalBlocker steps(step_);
  items_->setCurrentIndex(edit_.Item() - 1);
  layers_->clear();
  for (int layer = item.geometry.nz; layer > 0; --layer) {
    const QString text = layer == item.geometry.nz ? tr("%1 (top)") : layer == 1 ? tr("%1 (bottom)") : QString("%1");
    layers_->addItem(text.arg(layer));
  }
  for (QWidget* widget : {static_cast<QWidget*>(layerLabel_), static_cast<QWidget*>(layers_)})
    widget->setVisible(item.geometry.nz > 1);
  step_->setRange(1, static_cast<int>(edit_.Steps()));
  for (QWidget* widget : std::initializer_list<QWidget*>{stepLabel_, step_, date_})
    widget->setVisible(edit_.Steps() > 1);
  // The file's unit, whatever the user's is elsewhere.
  units_ = {};
  units_.Choose(item.itemType, item.unitKey);
  unit_->setText(edit_.IsCodes() ? tr("code") : ToQt(ShortUnitOf(item)));
  unit_->setVisible(!unit_->text().isEmpty());
  if (!edit_.WhyNotChanged().empty())
    panel_->Tell(tr("This item cannot be changed: %1.").arg(Translated(edit_.WhyNotChanged())));
  ShowSlice();
}

void GridEditor::ShowSlice() {
  const QSignalBlocker steps(step_);
  step_->setValue(static_cast<int>(edit_.Slice().step) + 1);
  layers_->setCurrentIndex(layers_->count() - 1 - edit_.Slice().layer);
  date_->setText(edit_.Time().hasDates && edit_.ItemFacts().hasTime
                     ? ToQt(edit_.Time().Stamp(edit_.Slice().step).Format("%Y-%m-%d %H:%M"))
                     : QString());
  coloured_.reset();
  edit_.TakeChanged();
  ShowMap();
  table_->Reset();
  emit StateChanged();
}

GridLayer GridEditor::Layer() {
  GridLayer layer{edit_.Grid(), edit_.IsCodes()};
  if (coloured_ != edit_.Grid()) {
    coloured_ = edit_.Grid();
    codes_.clear();
    range_.reset();
    if (edit_.IsCodes()) {
      edit_.Grid()->GetIntValues(codes_);
    } else {
      ValueSummary summary;
      summary.AddRange(edit_.Grid()->Values());
      if (summary.count > 0) range_ = {summary.smallest, summary.largest};
    }
  }
  layer.range = range_;
  return layer;
}

MapContent GridEditor::Content() {
  MapContent content;
  content.grids.push_back(Layer());
  // Others that lie over the first are made for it; colours of a map with light on its slopes stay.
  if (const auto window = edit_.SelectedWindow()) {
    auto selected = std::make_shared<CTvn2DOrthoRotatedGridData>();
    const GridGeometry& whole = edit_.Grid()->Geometry();
    const MapPoint corner =
        GridTransform(whole).ToWorld({static_cast<double>(window->i), static_cast<double>(window->j)});
    GridGeometry part = whole;
    part.nx = window->nx;
    part.ny = window->ny;
    part.x0 = corner.x;
    part.y0 = corner.y;
    std::vector<float> values(window->CellCount(), kDeleteValue);
    const auto nx = static_cast<std::size_t>(whole.nx);
    edit_.Selection().ForEach([&](std::size_t cell) {
      const std::size_t i = cell % nx - static_cast<std::size_t>(window->i);
      const std::size_t j = cell / nx - static_cast<std::size_t>(window->j);
      values[j * static_cast<std::size_t>(window->nx) + i] = 1;
    });
    if (selected->TakeValues(part, std::move(values), kDeleteValue, kDimensionlessUnit, quantity::kUndefined).empty()) {
      GridLayer layer{std::move(selected)};
      layer.classes = {{1, "Selected", kSelectedColor}};
      layer.withLegend = false;
      layer.transparency = 0.5;
      content.grids.push_back(std::move(layer));
    }
  }
  if (put_) put_(content);
  for (const BackdropLayer& layer : kept_)
    (std::holds_alternative<GridLayer>(layer.drawn) ? content.below : content.above).push_back(layer);
  content.picked = [this](const MapPick& pick) {
    if (pick.cell) table_->GoTo(edit_.Grid()->Geometry().ny - 1 - pick.cell->second, pick.cell->first);
  };
  const bool mayPaint = edit_.WhyNotChanged().empty();
  if (tool_ == Tool::Line && mayPaint)
    content.request = Request(MapRequest::Kind::Line, "Click the corners of a line to paint; a double click ends it.",
                              [this](const std::vector<MapPoint>& line) {
                                if (const auto value = Value()) Tell(edit_.PaintLine(line, width_->value(), *value));
                              });
  if (tool_ == Tool::Polygon && mayPaint)
    content.request = Request(MapRequest::Kind::Line, "Click the corners of an area to paint; a double click ends it.",
                              [this](const std::vector<MapPoint>& corners) {
                                if (const auto value = Value()) Tell(edit_.PaintPolygon(corners, *value));
                              });
  if (tool_ == Tool::Fill && mayPaint)
    content.request =
        Request(MapRequest::Kind::Point, "Click a cell: all that hang together and have its value are painted.",
                [this](const std::vector<MapPoint>& points) {
                  double i = 0, j = 0;
                  edit_.Grid()->GetCellCoordFromXYWorldCoord(points[0].x, points[0].y, i, j);
                  if (const auto value = Value())
                    Tell(edit_.Fill(static_cast<int>(std::floor(i)), static_cast<int>(std::floor(j)), *value));
                });
  if (tool_ == Tool::SelectPolygon)
    content.request =
        Request(MapRequest::Kind::Line, "Click the corners of the area to select; a double click ends it.",
                [this](const std::vector<MapPoint>& corners) { edit_.SelectPolygon(corners, Mode()); });
  return content;
}

MapRequest GridEditor::Request(MapRequest::Kind kind, const char* prompt,
                               std::function<void(const std::vector<MapPoint>&)> taken) {
  MapRequest request{kind, prompt, [this, taken = std::move(taken)](const std::vector<MapPoint>& points) {
                       WaitForPicture();
                       panel_->Tell({});
                       taken(points);
                       Follow();
                       // The tool stays for the next one.
                       ShowMap();
                     }};
  request.givenUp = [this] { SetTool(Tool::Move); };
  return request;
}

void GridEditor::ShowMap() {
  map_->Show(Content(), &units_);
  CountSoon();
}

void GridEditor::CountSoon() {
  constexpr std::size_t kAtOnce = 400'000;  // a few milliseconds
  if (edit_.Grid()->Geometry().CellCount() <= kAtOnce)
    ShowStatistics();
  else
    count_.start();
}

void GridEditor::WaitForPicture() {
  if (!map_->Canvas().PictureOf(0)) map_->Canvas().WaitUntilReady();
}

bool GridEditor::Recolour() {
  const std::vector<CellWindow> changed = edit_.TakeChanged();
  if (changed.empty()) return false;
  const auto isBeyondColours = [this](float value) {
    if (value == kDeleteValue) return false;
    if (edit_.IsCodes()) return value >= 0 && !std::ranges::binary_search(codes_, static_cast<unsigned>(value));
    return !range_ || value < range_->first || value > range_->second;
  };
  const std::vector<float>& values = edit_.Grid()->Values();
  const int nx = edit_.Grid()->Geometry().nx;
  const bool isBeyond = std::ranges::any_of(changed, [&](const CellWindow& window) {
    for (int j = window.j; j < window.j + window.ny; ++j) {
      const auto row = values.begin() + static_cast<std::ptrdiff_t>(j) * nx + window.i;
      if (std::any_of(row, row + window.nx, isBeyondColours)) return true;
    }
    return false;
  });
  if (!isBeyond) {
    map_->Canvas().UpdateCells(changed);
    return false;
  }
  GridLayer layer = map_->Canvas().Content().grids.front();
  coloured_.reset();
  layer.range = Layer().range;
  map_->Canvas().RemakeGrid(layer);
  return true;
}

void GridEditor::Follow() {
  Recolour();
  table_->Refill();
  CountSoon();
  emit StateChanged();
}

void GridEditor::ShowStatistics() {
  if (!edit_.Grid()) return;
  const SelectionStatistics found = edit_.Statistics();
  const QString unit = edit_.IsCodes() ? QString() : " " + ToQt(ShortUnitOf(edit_.ItemFacts())).toHtmlEscaped();
  QString rows;
  const auto add = [&](const QString& name, const QString& value) {
    rows += QString("<tr><td>%1&nbsp;&nbsp;</td><td align=right>%2</td></tr>").arg(name, value);
  };
  add(tr("Cells"), edit_.HasSelection() ? tr("%L1 selected").arg(found.count + found.missing)
                                        : tr("%L1, all").arg(found.count + found.missing));
  add(tr("With a value"), QString("%L1").arg(found.count));
  add(tr("Missing"), QString("%L1").arg(found.missing));
  add(tr("Smallest"), ShortNumber(found.smallest, unit));
  add(tr("Largest"), ShortNumber(found.largest, unit));
  add(tr("Mean"), ShortNumber(found.mean, unit));
  add(tr("Deviation"), ShortNumber(found.deviation, unit));
  add(tr("Sum"), ShortNumber(found.sum, unit));
  if (found.area) add(tr("Area"), QString::fromUtf8("%1 km²").arg(ShortNumber(*found.area / 1e6)));
  statistics_->setText("<table>" + rows + "</table>");
}

void GridEditor::Tell(const std::string& why) {
  if (!why.empty()) panel_->Tell(Translated(why));
}

QString GridEditor::CellText(float value) const {
  return value == kDeleteValue ? QString() : ToQt(ShortestNumber(value));
}

std::optional<float> GridEditor::ValueIn(const QLineEdit& field) {
  const QString text = field.text().trimmed();
  if (text.isEmpty()) return kDeleteValue;
  const auto number = ParseCsvNumber(FromQt(text), true);
  const QString why =
      number ? Translated(edit_.WhyNotValue(*number)) : tr("A number was expected, or nothing for no value.");
  if (why.isEmpty()) return static_cast<float>(*number);
  panel_->Tell(field.accessibleName() + " " + why);
  return std::nullopt;
}

std::optional<float> GridEditor::Value() { return ValueIn(*value_); }

SelectionMode GridEditor::Mode() const { return static_cast<SelectionMode>(mode_->currentIndex()); }

QString GridEditor::Burn() {
  const auto path = Outside().AskFileToOpen({"Burn Shapes", "Shape file (*.shp)|*.shp||", "shp", {}});
  if (!path) return {};
  const auto facts = ShapeFactsOf(*path);
  if (!facts->error.empty()) return Translated(facts->error);
  Host::ItemQuestion question{"Value of the Shapes", *path, {"Attribute"}, {{{"The value of the tools"}, {}}}, 0};
  for (const ShapeField& field : facts->fields) question.rows.push_back({{field.name}, {}});
  const auto row = facts->fields.empty() ? std::optional(0) : Outside().AskItem(question);
  if (!row) return {};
  ShapesToBurn shapes{*path, *row > 0 ? facts->fields[static_cast<std::size_t>(*row - 1)].name : std::string(), 0};
  if (*row == 0) {
    const auto value = Value();
    if (!value) return panel_->Told();
    shapes.value = *value;
  }
  WaitForPicture();
  std::string note;
  const std::string why = edit_.Burn(shapes, note);
  return Translated(why.empty() ? note : why);
}

// ---- Tools

void GridEditor::SetTool(Tool tool) {
  tool_ = tool;
  for (QAction* action : tools_->actions()) action->setChecked(action->data().toInt() == static_cast<int>(tool));
  MapCanvas& canvas = map_->Canvas();
  if (tool == Tool::Brush && edit_.WhyNotChanged().empty())
    canvas.SetDrag(BrushDrag());
  else if (tool == Tool::SelectRectangle)
    canvas.SetDrag(RectangleDrag());
  else
    canvas.SetDrag({});
  ShowMap();
}

MapDrag GridEditor::BrushDrag() {
  MapDrag drag;
  drag.moved = [this](MapPoint from, MapPoint to) { Paint(from, to); };
  drag.ended = [this](std::optional<MapPoint>) {
    edit_.EndStroke();
    Follow();
  };
  drag.draw = [this](QPainter& painter, const MapWindow& window, MapPoint at, std::optional<MapPoint>) {
    const double radius = width_->value() * edit_.Grid()->Geometry().cellSize / 2 / window.metresPerPixel;
    painter.setBrush(Qt::NoBrush);
    for (const QPen& pen : {QPen(Qt::white, 3), QPen(QColor(0x1d, 0x22, 0x2a), 1.2)}) {
      painter.setPen(pen);
      painter.drawEllipse(window.ToScreen(at), std::max(radius, 2.0), std::max(radius, 2.0));
    }
  };
  return drag;
}

void GridEditor::Paint(MapPoint from, MapPoint to) {
  if (!edit_.IsStroke()) {
    panel_->Tell({});
    const auto value = Value();
    if (!value) return;
    WaitForPicture();
    if (const std::string why = edit_.BeginStroke("Paint", *value); !why.empty()) return Tell(why);
  }
  edit_.StrokeTo(from, to, width_->value());
  if (Recolour()) WaitForPicture();
}

MapDrag GridEditor::RectangleDrag() {
  // The drag begins where the button goes down.
  const auto begin = std::make_shared<std::optional<MapPoint>>();
  MapDrag drag;
  drag.moved = [begin](MapPoint from, MapPoint) {
    if (!*begin) *begin = from;
  };
  drag.ended = [this, begin](std::optional<MapPoint> place) {
    const auto from = std::exchange(*begin, {});
    if (from && place) edit_.SelectRectangle(*from, *place, Mode());
    ShowMap();
  };
  drag.draw = [this](QPainter& painter, const MapWindow& window, MapPoint at, std::optional<MapPoint> from) {
    if (!from) return;
    const GridTransform transform(edit_.Grid()->Geometry());
    const MapPoint a = transform.ToCells(*from), b = transform.ToCells(at);
    QPolygonF corners;
    for (const MapPoint& corner : {a, MapPoint{b.x, a.y}, b, MapPoint{a.x, b.y}})
      corners << window.ToScreen(transform.ToWorld(corner));
    DrawOutline(painter, corners);
  };
  return drag;
}

}  // namespace tervane
