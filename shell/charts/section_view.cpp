// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/charts/section_view.h"

#include <QApplication>
#include <QComboBox>
#include <QLabel>
#include <algorithm>
#include <cmath>
#include <utility>

#include <qcustomplot.h>

#include "shell/charts/chart_style.h"
#include "shell/charts/section_bands.h"
#include "shell/relief/relief_window.h"
#include "shell/widgets/layer_colors.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/shown_unit.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr int kDistanceType = 100217, kElevationType = 100180, kMetre = 1000;
constexpr std::array kExaggerations{1, 2, 5, 10, 20, 50, 100, 200};

}  // namespace

struct SectionView::Units {
  ShownUnit distance, height;
};

SectionView::SectionView(Host& host, QWidget* parent)
    : PlotFrame(host, parent), chart_(new QCustomPlot), message_(new QLabel(chart_)), choice_(new QComboBox) {
  chart_->setMinimumSize(Theme::Get().Scaled(200), Theme::Get().Scaled(140));
  chart_->setFocusPolicy(Qt::StrongFocus);
  chart_->installEventFilter(this);
  chart_->setInteractions(QCP::iRangeDrag | QCP::iRangeZoom);
  chart_->axisRect()->setRangeZoom(Qt::Horizontal);
  chart_->addLayer(kPointerLayer, chart_->layer("overlay"), QCustomPlot::limBelow);
  chart_->layer(kPointerLayer)->setMode(QCPLayer::lmBuffered);
  PutLegendAbove(*chart_);
  message_->setAlignment(Qt::AlignCenter);
  message_->setWordWrap(true);
  message_->setMargin(Theme::Get().Scaled(16));
  chart_->setAccessibleName(tr("Section"));
  message_->setAutoFillBackground(true);
  message_->setBackgroundRole(QPalette::Base);
  Hold({chart_, [this](double factor) { Zoom(factor); }, [this] { Fit(); },
        [this](double pixelRatio) { return chart_->toPixmap(chart_->width(), chart_->height(), pixelRatio).toImage(); },
        [this] { return Values(); }});
  choice_->addItem(QString());
  for (const int times : kExaggerations) choice_->addItem(QString::fromUtf8("%1 ×").arg(times), times);
  choice_->setToolTip(tr("How many times heights are drawn larger than distances"));
  choice_->setAccessibleName(tr("Vertical exaggeration"));
  choice_->setFocusPolicy(Qt::TabFocus);
  choice_->setSizeAdjustPolicy(QComboBox::AdjustToContents);
  AddToRow(choice_);
  auto* relief = new QToolButton;
  relief->setText(tr("3D"));
  relief->setToolTip(tr("Shows the whole ground from the side"));
  connect(relief, &QToolButton::clicked, this, &SectionView::OpenRelief);
  AddToRow(relief);
  connect(choice_, &QComboBox::activated, this, [this](int index) {
    SetExaggeration(index == 0 ? std::nullopt : std::optional<double>(choice_->itemData(index).toDouble()));
  });
  connect(chart_, &QCustomPlot::beforeReplot, this, &SectionView::Arrange);
  // The exaggeration depends on the place that the layout leaves.
  connect(chart_, &QCustomPlot::afterLayout, this, &SectionView::FitHeights);
  connect(chart_, &QCustomPlot::mouseMove, this, &SectionView::PointAt);
  connect(chart_, &QCustomPlot::mouseDoubleClick, this, &SectionView::Fit);
  connect(&Theme::Get(), &Theme::Changed, this, [this] {
    ApplyTheme();
    chart_->replot(QCustomPlot::rpQueuedReplot);
  });
}

SectionView::~SectionView() = default;

ReliefWindow* SectionView::OpenRelief() {
  auto* opened = new ReliefWindow(window(), Outside(), tr("3D View"));
  opened->Show(ReliefOf([content = content_] { return content; }), PaintGround, displayUnits_);
  opened->show();
  return opened;
}

QWidget* SectionView::FocusTarget() const { return chart_; }

void SectionView::Show(SectionContent content, const DisplayUnits* units) {
  const DisplayUnits chosen = units ? *units : DisplayUnits();
  if (isShown_ && chosen == displayUnits_ && LooksSame(content, content_)) return;
  isShown_ = true;
  content_ = std::move(content);
  displayUnits_ = chosen;
  units_ = std::make_unique<Units>(
      Units{ShownUnit(kDistanceType, kMetre, &displayUnits_), ShownUnit(kElevationType, kMetre, &displayUnits_)});
  Build();
}

void SectionView::ShowWhenThere(const std::function<SectionContent()>& content, const DisplayUnits* units) {
  SectionContent now = Follow<SectionContent>(content, [this, content, units] { ShowWhenThere(content, units); });
  if (!now.awaited.empty() && isShown_) return;
  if (!now.awaited.empty() && now.message.empty()) now.message = " ";
  now.awaited.clear();
  Show(std::move(now), units);
}

void SectionView::Build() {
  chart_->clearPlottables();
  chart_->clearItems();
  bands_.clear();
  lenses_.clear();
  curves_.clear();
  screens_.clear();
  screenNames_.clear();
  ground_ = crossing_ = thin_ = nullptr;
  pointer_ = nullptr;
  profile_ = ProfileOf(content_, StepFor(content_));
  message_->setText(content_.message.empty() ? tr("There is nothing to show.") : Translated(content_.message));
  message_->setVisible(content_.IsEmpty());
  choice_->setEnabled(!content_.IsEmpty());
  if (!content_.IsEmpty()) {
    for (const SectionProfile::Band& band : profile_.bands) bands_.push_back(AddBand(band.name, band.top, band.bottom));
    for (const SectionProfile::Lens& lens : profile_.lenses)
      lenses_.push_back(AddBand(lens.name, lens.top, lens.bottom));
    for (const SectionProfile::Curve& curve : profile_.curves)
      curves_.push_back(AddLine(Translated(curve.name), curve.heights));
    ground_ = AddLine(tr("Ground"), profile_.ground);
    AddMarks();
    AddScreens();
    pointer_ = new QCPItemStraightLine(chart_);
    pointer_->setLayer(kPointerLayer);
    pointer_->setVisible(false);
    pointer_->point1->setTypeY(QCPItemPosition::ptAxisRectRatio);
    pointer_->point2->setTypeY(QCPItemPosition::ptAxisRectRatio);
  }
  chart_->xAxis->setLabel(tr("Distance [%1]").arg(ToQt(units_->distance.Text())));
  chart_->yAxis->setLabel(tr("Elevation [%1]").arg(ToQt(units_->height.Text())));
  for (QCPAxis* axis : {chart_->xAxis2, chart_->yAxis2}) {
    axis->setVisible(true);
    axis->setTicks(false);
    axis->setTickLabels(false);
  }
  SetStatus({});
  ApplyTheme();
  Fit();
}

BandPlottable* SectionView::AddBand(const std::string& name, const std::vector<double>& top,
                                    const std::vector<double>& bottom) {
  const auto shown = [](const ShownUnit& unit, std::vector<double> values) {
    for (double& value : values) value = unit.Shown(value);
    return values;
  };
  std::vector<double> distances;
  for (const SectionPoint& point : profile_.points) distances.push_back(units_->distance.Shown(point.distance));
  auto* band = new BandPlottable(chart_->xAxis, chart_->yAxis);
  band->SetData(std::move(distances), shown(units_->height, top), shown(units_->height, bottom));
  band->setName(ToQt(name));
  return band;
}

QCPGraph* SectionView::AddLine(const QString& name, const std::vector<double>& heights) {
  QVector<double> distances, shown;
  for (const SectionPoint& point : profile_.points) distances.push_back(units_->distance.Shown(point.distance));
  for (const double height : heights) shown.push_back(units_->height.Shown(height));
  QCPGraph* line = chart_->addGraph();
  line->setData(distances, shown, true);
  line->setName(name);
  return line;
}

/// Marks run along the bottoms of layers; what no layer needs has no place in the legend.
void SectionView::AddMarks() {
  const auto add = [this](const QString& name, std::vector<double> SectionProfile::Band::*marks) -> QCPGraph* {
    std::vector<std::pair<double, double>> places;
    for (const SectionProfile::Band& band : profile_.bands) {
      bool wasThere = false;
      for (std::size_t i = 0; i < (band.*marks).size(); ++i) {
        const bool isThere = !std::isnan((band.*marks)[i]);
        if (isThere || wasThere) places.emplace_back(profile_.points[i].distance, (band.*marks)[i]);
        wasThere = isThere;
      }
      if (wasThere) places.emplace_back(profile_.points.back().distance, std::nan(""));
    }
    if (places.empty()) return nullptr;
    QVector<double> distances, heights;
    for (const auto& [distance, height] : places) {
      distances.push_back(units_->distance.Shown(distance));
      heights.push_back(units_->height.Shown(height));
    }
    QCPGraph* graph = chart_->addGraph();
    graph->setLineStyle(QCPGraph::lsNone);
    graph->setData(distances, heights);
    graph->setName(name);
    return graph;
  };
  crossing_ = add(tr("Levels cross"), &SectionProfile::Band::crossing);
  thin_ = add(tr("Thinner than %1").arg(units_->height.Value(content_.minimumThickness)), &SectionProfile::Band::thin);
}

void SectionView::AddScreens() {
  for (const SectionProfile::Screen& screen : profile_.screens) {
    const double at = units_->distance.Shown(screen.distance);
    auto* line = new QCPItemLine(chart_);
    line->start->setCoords(at, units_->height.Shown(screen.top));
    line->end->setCoords(at, units_->height.Shown(screen.bottom));
    screens_.push_back(line);
    // A well with several has its name above the highest.
    const bool isHighest = std::ranges::none_of(profile_.screens, [&](const auto& other) {
      return other.name == screen.name && other.distance == screen.distance && other.top > screen.top;
    });
    if (!isHighest) continue;
    auto* name = new QCPItemText(chart_);
    name->position->setCoords(at, units_->height.Shown(screen.top));
    name->setPositionAlignment(Qt::AlignBottom | Qt::AlignHCenter);
    name->setText(ToQt(screen.name));
    screenNames_.push_back(name);
  }
}

QString SectionView::Values() const {
  QString text;
  for (const auto& row : SectionRows(profile_)) {
    QStringList cells;
    for (const std::string& cell : row) cells << ToQt(cell);
    text += cells.join('\t') + '\n';
  }
  return text;
}

void SectionView::ApplyTheme() {
  StyleChart(*chart_);
  const Theme& theme = Theme::Get();
  const QColor ink = QApplication::palette().color(QPalette::Text);
  for (std::size_t i = 0; i < bands_.size(); ++i) {
    const auto& told = content_.surfaces[i].color;
    bands_[i]->setBrush(told ? QColor::fromRgb(*told) : LayerColor(i, theme.IsDark()));
    QColor border = ink;
    border.setAlpha(110);
    bands_[i]->setPen(QPen(border, 1));
  }
  for (std::size_t i = 0; i < lenses_.size(); ++i) {
    const QColor color = LayerColor(bands_.size() + i, theme.IsDark());
    lenses_[i]->setBrush(color);
    lenses_[i]->setPen(QPen(ink, theme.Zoom(), Qt::DotLine));
  }
  for (std::size_t i = 0; i < curves_.size(); ++i)
    curves_[i]->setPen(QPen(content_.curves[i].isDashed ? ink : CurveColor(i, theme.IsDark()), 1.5 * theme.Zoom(),
                            content_.curves[i].isDashed ? Qt::DashLine : Qt::SolidLine));
  const auto mark = [&](QCPGraph* graph, const QColor& color) {
    if (graph) graph->setScatterStyle(QCPScatterStyle(QCPScatterStyle::ssDisc, color, color, 4 * theme.Zoom()));
  };
  mark(crossing_, theme.ErrorColor());
  mark(thin_, theme.WarningColor());
  for (QCPItemLine* screen : screens_) {
    screen->setPen(QPen(ink, 4 * theme.Zoom(), Qt::SolidLine, Qt::FlatCap));
    screen->setHead(QCPLineEnding::esBar);
    screen->setTail(QCPLineEnding::esBar);
  }
  for (QCPItemText* name : screenNames_) {
    name->setColor(ink);
    name->setFont(QApplication::font());
  }
  if (ground_) ground_->setPen(QPen(ink, 2 * theme.Zoom()));
  if (pointer_) pointer_->setPen(QPen(theme.QuietColor(), 1, Qt::DashLine));
  // The bands cover the lines of the axes' grid, which help to read heights and distances.
  for (QCPAxis* axis : {chart_->xAxis, chart_->yAxis}) axis->grid()->setZeroLinePen(axis->grid()->pen());
  QPalette quiet = QApplication::palette();
  quiet.setColor(QPalette::WindowText, theme.QuietColor());
  message_->setPalette(quiet);
}

void SectionView::Arrange() {
  const QFontMetrics metrics(QApplication::font());
  int widest = metrics.horizontalAdvance(tr("Ground"));
  for (int i = 0; i < chart_->plottableCount(); ++i)
    widest = std::max(widest, metrics.horizontalAdvance(chart_->plottable(i)->name()));
  ArrangeLegend(*chart_, widest);
  const int distances = chart_->axisRect()->width() / (metrics.horizontalAdvance("000000") * 2);
  chart_->xAxis->ticker()->setTickCount(std::clamp(distances, 2, 9));
  const int heights = chart_->axisRect()->height() / (3 * metrics.height());
  chart_->yAxis->ticker()->setTickCount(std::clamp(heights, 2, 7));
}

/// Heights follow the distances that are seen: by the exaggeration, or so that they fill the view.
void SectionView::FitHeights() {
  if (content_.IsEmpty()) return;
  QCPAxis& heights = *chart_->yAxis;
  const QCPRange seen = chart_->xAxis->range();
  chart_->axisRect()->setRangeDrag(exaggeration_ ? Qt::Horizontal | Qt::Vertical : Qt::Orientations(Qt::Horizontal));
  if (exaggeration_) {
    const double metresPerPixel = (units_->distance.Stored(seen.upper) - units_->distance.Stored(seen.lower)) /
                                  std::max(chart_->axisRect()->width(), 1);
    const double size = metresPerPixel / *exaggeration_ * chart_->axisRect()->height();
    const double middle = units_->height.Stored(heights.range().center());
    heights.setRange(units_->height.Shown(middle - size / 2), units_->height.Shown(middle + size / 2));
  } else if (const auto range =
                 profile_.Range(units_->distance.Stored(seen.lower), units_->distance.Stored(seen.upper))) {
    const double size = range->second > range->first ? range->second - range->first : 1;
    heights.setRange(units_->height.Shown(range->first - 0.05 * size),
                     units_->height.Shown(range->second + 0.1 * size));
  }
  ShowExaggeration();
}

double SectionView::Exaggeration() const {
  const auto metresPerPixel = [](const QCPAxis& axis, const ShownUnit& unit, int pixels) {
    return (unit.Stored(axis.range().upper) - unit.Stored(axis.range().lower)) / std::max(pixels, 1);
  };
  return metresPerPixel(*chart_->xAxis, units_->distance, chart_->axisRect()->width()) /
         metresPerPixel(*chart_->yAxis, units_->height, chart_->axisRect()->height());
}

void SectionView::ShowExaggeration() {
  if (exaggeration_) return choice_->setItemText(0, tr("Fill"));
  const double times = Exaggeration();
  choice_->setItemText(0, tr("Fill (%1)").arg(QString::fromUtf8("%1 ×").arg(ToQt(FormatNumber(times, "%.2g")))));
}

void SectionView::SetExaggeration(std::optional<double> times) {
  exaggeration_ = times;
  const int index = times ? choice_->findData(static_cast<int>(*times)) : 0;
  choice_->setCurrentIndex(std::max(index, 0));
  Fit();
}

void SectionView::Fit() {
  if (!profile_.points.empty()) {
    chart_->xAxis->setRange(0, units_->distance.Shown(profile_.points.back().distance));
    if (const auto range = profile_.Range(0, profile_.points.back().distance))
      chart_->yAxis->setRange(units_->height.Shown(range->first), units_->height.Shown(range->second));
  }
  chart_->replot(QCustomPlot::rpQueuedReplot);
}

void SectionView::Zoom(double factor) {
  chart_->xAxis->scaleRange(1 / factor);
  chart_->replot(QCustomPlot::rpQueuedReplot);
}

bool SectionView::Press(const QKeyEvent& event) {
  const int key = event.key();
  const auto move = [](QCPAxis* axis, double part) { axis->moveRange(part * axis->range().size()); };
  switch (key) {
    case Qt::Key_Plus:
    case Qt::Key_Equal:
      return Zoom(kZoomStep), true;
    case Qt::Key_Minus:
      return Zoom(1 / kZoomStep), true;
    case Qt::Key_Left:
    case Qt::Key_Right:
      if (event.modifiers() & Qt::ControlModifier) return MoveMark(key == Qt::Key_Left ? -1 : 1), true;
      move(chart_->xAxis, key == Qt::Key_Left ? -0.15 : 0.15);
      break;
    case Qt::Key_Up:
      move(chart_->yAxis, 0.15);
      break;
    case Qt::Key_Down:
      move(chart_->yAxis, -0.15);
      break;
    case Qt::Key_Home:
      return Fit(), true;
    default:
      return false;
  }
  chart_->replot(QCustomPlot::rpQueuedReplot);
  return true;
}

bool SectionView::eventFilter(QObject* watched, QEvent* event) {
  if (event->type() == QEvent::KeyPress && !content_.IsEmpty()) return Press(*static_cast<QKeyEvent*>(event));
  if (event->type() == QEvent::Resize) message_->setGeometry(chart_->rect());
  if (event->type() == QEvent::Leave) {
    SetStatus({});
    if (pointer_) {
      pointer_->setVisible(false);
      chart_->layer(kPointerLayer)->replot();
    }
  }
  return PlotFrame::eventFilter(watched, event);
}

void SectionView::PointAt(const QMouseEvent* event) {
  if (!pointer_) return;
  const bool isInside = chart_->axisRect()->rect().contains(event->pos());
  const double distance = chart_->xAxis->pixelToCoord(event->position().x());
  mark_.reset();
  ShowPointer(isInside ? std::optional(distance) : std::nullopt);
  const double height = chart_->yAxis->pixelToCoord(event->position().y());
  SetStatus(isInside ? TextAt(units_->distance.Stored(distance), units_->height.Stored(height)) : QString());
  chart_->setToolTip(isInside ? LayersAt(units_->distance.Stored(distance)) : QString());
}

void SectionView::ShowPointer(std::optional<double> distance) {
  pointer_->setVisible(distance.has_value());
  pointer_->point1->setCoords(distance.value_or(0), 0);
  pointer_->point2->setCoords(distance.value_or(0), 1);
  chart_->layer(kPointerLayer)->replot();
}

void SectionView::MoveMark(int by) {
  const auto& points = profile_.points;
  if (!pointer_ || points.empty()) return;
  const QCPRange& seen = chart_->xAxis->range();
  if (!mark_ || !seen.contains(units_->distance.Shown(*mark_))) {
    mark_ = units_->distance.Stored(seen.center());
  } else {
    // The next sample that is seen beside this one.
    const double pixel = units_->distance.Stored(seen.size()) / std::max(chart_->axisRect()->width(), 1);
    const auto next = std::ranges::find_if(points, [&](const SectionPoint& point) {
      return by > 0 ? point.distance >= *mark_ + pixel : point.distance > *mark_ - pixel;
    });
    const bool isPast = by > 0 ? next == points.end() : next == points.begin();
    if (!isPast) mark_ = by > 0 ? next->distance : (next - 1)->distance;
    if (const double shown = units_->distance.Shown(*mark_); !seen.contains(shown)) {
      chart_->xAxis->moveRange(shown - seen.center());
      chart_->replot();
    }
  }
  ShowPointer(units_->distance.Shown(*mark_));
  SetStatus(tr("at %1").arg(units_->distance.Value(std::round(*mark_))) + "   " +
            LayersAt(*mark_).replace("\n", "   "));
}

std::optional<std::size_t> SectionView::SampleAt(double distance) const {
  const auto& points = profile_.points;
  if (points.empty() || distance < 0 || distance > points.back().distance) return {};
  auto next = std::ranges::lower_bound(points, distance, {}, &SectionPoint::distance);
  if (next != points.begin() && distance - (next - 1)->distance < next->distance - distance) --next;
  return static_cast<std::size_t>(next - points.begin());
}

QString SectionView::HeightText(double height) const {
  return std::isnan(height) ? tr("no value") : units_->height.Value(std::round(height * 100) / 100);
}

QString SectionView::TextAt(double distance, double height) const {
  const auto at = SampleAt(distance);
  if (!at) return {};
  QString text = tr("at %1").arg(units_->distance.Value(std::round(profile_.points[*at].distance)));
  text += "   " + tr("ground %1").arg(HeightText(profile_.ground[*at]));
  for (const SectionProfile::Band& band : profile_.bands)
    if (height < band.top[*at] && height >= band.bottom[*at])
      text +=
          "   " + tr("%1 from %2 to %3").arg(ToQt(band.name), HeightText(band.top[*at]), HeightText(band.bottom[*at]));
  for (const SectionProfile::Lens& lens : profile_.lenses)
    if (height < lens.top[*at] && height >= lens.bottom[*at]) text += "   " + tr("in %1").arg(ToQt(lens.name));
  return text;
}

QString SectionView::LayersAt(double distance) const {
  const auto at = SampleAt(distance);
  if (!at) return {};
  QString text = tr("ground %1").arg(HeightText(profile_.ground[*at]));
  for (const SectionProfile::Band& band : profile_.bands)
    text += "\n" + tr("%1 down to %2").arg(ToQt(band.name), HeightText(band.bottom[*at]));
  for (const SectionProfile::Lens& lens : profile_.lenses)
    if (!std::isnan(lens.top[*at]))
      text +=
          "\n" + tr("%1 from %2 to %3").arg(ToQt(lens.name), HeightText(lens.top[*at]), HeightText(lens.bottom[*at]));
  for (const SectionProfile::Curve& curve : profile_.curves)
    text += "\n" + tr("%1 %2").arg(Translated(curve.name), HeightText(curve.heights[*at]));
  return text;
}

}  // namespace tervane
