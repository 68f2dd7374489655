// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/charts/series_plot.h"

#include <QActionGroup>
#include <QApplication>
#include <QLabel>
#include <QScrollBar>
#include <QSignalBlocker>
#include <algorithm>
#include <array>
#include <cmath>
#include <map>
#include <utility>

#include <qcustomplot.h>

#include "shell/charts/chart_axis.h"
#include "shell/charts/chart_markers.h"
#include "shell/charts/chart_panels.h"
#include "shell/charts/chart_style.h"
#include "shell/charts/dense_graph.h"
#include "shell/charts/series_chooser.h"
#include "shell/charts/series_points.h"
#include "shell/charts/time_bars.h"
#include "shell/widgets/layer_colors.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr int kLeastInSight = 4;  ///< Of charts below each other; a page scrolls where it has no room for so many.

QString NameOf(const Series& series) {
  QString name = Translated(series.name);
  if (!series.unit.empty()) name += " [" + ToQt(series.unit) + "]";
  return name;
}

QString DateText(double seconds) {
  return ToQt(CYbDateTime::FromSecondsSinceEpoch(std::llround(seconds)).Format("%Y-%m-%d %H:%M:%S"));
}

QString ValueText(double value) { return std::isnan(value) ? QString() : ToQt(FormatNumber(value, "%.6g")); }

}  // namespace

struct SeriesPlot::Curve {
  const Series* series;
  std::size_t color;
  QCPGraph* graph;
};

SeriesPlot::SeriesPlot(Host& host, QWidget* parent)
    : PlotFrame(host, parent),
      chart_(new QCustomPlot),
      scroll_(new QScrollBar(Qt::Vertical)),
      message_(new QLabel(chart_)) {
  chart_->setMinimumSize(Theme::Get().Scaled(200), Theme::Get().Scaled(140));
  chart_->setFocusPolicy(Qt::StrongFocus);
  chart_->installEventFilter(this);
  chart_->setAccessibleName(tr("Chart of values over time"));
  chart_->setInteractions(QCP::iRangeDrag | QCP::iRangeZoom);
  chart_->setSelectionRectMode(QCP::srmNone);
  // Many values: lines of one pixel are drawn without the slow joins.
  chart_->setPlottingHint(QCP::phFastPolylines);
  chart_->addLayer(kPointerLayer, chart_->layer("overlay"), QCustomPlot::limBelow);
  chart_->layer(kPointerLayer)->setMode(QCPLayer::lmBuffered);
  PutLegendAbove(*chart_);
  panels_ = new ChartPanels(*chart_, 1);
  markers_ = new ChartMarkers(*chart_);
  connect(chart_, &QCustomPlot::beforeReplot, this, &SeriesPlot::Arrange);
  message_->setAlignment(Qt::AlignCenter);
  message_->setWordWrap(true);
  message_->setMargin(Theme::Get().Scaled(16));
  message_->setAutoFillBackground(true);
  message_->setBackgroundRole(QPalette::Base);
  Hold({chart_, [this](double factor) { Zoom(factor); }, [this] { Fit(); },
        [this](double pixelRatio) { return Picture(pixelRatio); }, [this] { return ValuesAsText(); }, scroll_});
  scroll_->setAccessibleName(tr("Further charts"));
  scroll_->hide();
  connect(scroll_, &QScrollBar::valueChanged, this, &SeriesPlot::ScrollTo);
  chooser_ = new SeriesChooser(host);
  AddToRow(chooser_);
  connect(chooser_, &SeriesChooser::Changed, this, &SeriesPlot::ShowChosen);
  views_ = new QActionGroup(this);
  const std::pair<SeriesView, QString> views[] = {{SeriesView::AsGiven, tr("As &given")},
                                                  {SeriesView::Cumulated, tr("C&umulated")},
                                                  {SeriesView::Monthly, tr("&Monthly")}};
  for (const auto& [view, name] : views) {
    QAction* action = AddCommand(name, [this, view = view] { SetView(view); });
    action->setCheckable(true);
    action->setChecked(view == view_);
    views_->addAction(action);
  }
  connect(chart_, &QCustomPlot::mousePress, this, [this](const QMouseEvent* event) {
    chart_->setSelectionRectMode(event->modifiers() & Qt::ShiftModifier ? QCP::srmZoom : QCP::srmNone);
  });
  connect(chart_, &QCustomPlot::mouseWheel, this, [this](const QWheelEvent* event) {
    const bool isValues = event->modifiers() & Qt::ControlModifier;
    for (QCPAxisRect* rect : panels_->Rects()) rect->setRangeZoom(isValues ? Qt::Vertical : Qt::Horizontal);
  });
  connect(chart_, &QCustomPlot::mouseMove, this, &SeriesPlot::PointAt);
  connect(chart_, &QCustomPlot::mouseDoubleClick, this, &SeriesPlot::Fit);
  connect(&Theme::Get(), &Theme::Changed, this, [this] {
    if (PanelsInSight() == panelsInSight_)
      ApplyTheme();
    else
      BuildPanels();
    chart_->replot(QCustomPlot::rpQueuedReplot);
  });
}

SeriesPlot::~SeriesPlot() = default;

QWidget* SeriesPlot::FocusTarget() const { return chart_; }

void SeriesPlot::Show(SeriesContent content) {
  std::optional<DateRequest> request = std::exchange(content.request, {});
  chooser_->SetChoice(std::exchange(content.choice, {}));
  if (isShown_ && LooksSameButForMarkers(content, given_)) {
    if (LooksSame(content.markers, given_.markers)) {
      markers_->SetMoves(content.markers);
    } else {
      given_.markers = content_.markers = std::move(content.markers);
      ShowMarkers();
      chart_->replot(QCustomPlot::rpQueuedReplot);
    }
  } else {
    isShown_ = true;
    given_ = std::move(content);
    content_ = InView();
    for (QAction* action : views_->actions()) action->setVisible(!given_.numbers);
    Build();
  }
  markers_->Ask(content_.IsEmpty() ? std::nullopt : std::move(request));
}

void SeriesPlot::ShowChosen() {
  const bool wasEmpty = content_.IsEmpty();
  const QCPRange seen = panels_->Keys().range();
  ShowWhenThere(source_);
  if (!wasEmpty && !content_.IsEmpty()) panels_->Keys().setRange(seen);
}

void SeriesPlot::ShowWhenThere(const std::function<SeriesContent()>& content) {
  source_ = content;
  SeriesContent now = Follow<SeriesContent>(content, [this, content] { ShowWhenThere(content); });
  if (!now.awaited.empty() && isShown_) return;
  // Nothing is said of an empty chart that is still to come.
  if (!now.awaited.empty() && now.message.empty()) now.message = " ";
  now.awaited.clear();
  Show(std::move(now));
}

void SeriesPlot::SetView(SeriesView view) {
  view_ = view;
  content_ = InView();
  Build();
}

SeriesContent SeriesPlot::InView() const {
  SeriesContent shown = given_;
  for (Series& series : shown.series) series = ViewOf(series, view_);
  return shown;
}

void SeriesPlot::Build() {
  panelCount_ = 1;
  for (const Series& series : content_.series) panelCount_ = std::max(panelCount_, series.panel + 1);
  chart_->setMinimumHeight(std::max(Theme::Get().Scaled(HasBars() ? 260 : 140),
                                    panelCount_ > 1 ? HeightOf(std::min(panelCount_, kLeastInSight)) : 0));
  message_->setText(content_.message.empty() ? tr("There is nothing to show.") : Translated(content_.message));
  message_->setVisible(content_.IsEmpty());
  places_ = PlacesOf(content_);
  SetStatus({});
  BuildPanels();
  Fit();
}

int SeriesPlot::HeightOf(int panels) const {
  // Of each of several charts, and of the axis below the last one.
  constexpr int kPanelHeight = 100, kAxisHeight = 54;
  return Theme::Get().Scaled(panels * kPanelHeight + kAxisHeight);
}

int SeriesPlot::PanelsInSight() const {
  int panels = std::min(panelCount_, kLeastInSight);
  while (panels < panelCount_ && HeightOf(panels + 1) <= chart_->height()) ++panels;
  return panels;
}

void SeriesPlot::ScrollTo(int panel) {
  const int first = std::clamp(panel, 0, panelCount_ - panelsInSight_);
  if (first == firstPanel_) return;
  firstPanel_ = first;
  BuildPanels();
  chart_->replot(QCustomPlot::rpQueuedReplot);
}

void SeriesPlot::BuildPanels() {
  panelsInSight_ = PanelsInSight();
  firstPanel_ = std::clamp(firstPanel_, 0, panelCount_ - panelsInSight_);
  {
    const QSignalBlocker isSetHere(scroll_);
    scroll_->setRange(0, panelCount_ - panelsInSight_);
    scroll_->setPageStep(panelsInSight_);
    scroll_->setValue(firstPanel_);
    scroll_->setVisible(panelsInSight_ < panelCount_);
  }
  markers_->Clear();
  chart_->clearPlottables();
  chart_->clearItems();
  curves_.clear();
  periods_.clear();
  hatches_.clear();
  pointers_.clear();
  titles_.clear();
  bars_ = nullptr;
  // More bars at once are drawn without their names.
  constexpr int kMostLines = 8;
  const int stripLines = HasBars() ? std::min(TimeBarPlottable::LanesOf(content_.bars), kMostLines) : 0;
  const QCPRange seen = panels_->Keys().range();
  panels_->SetUp(panelsInSight_, stripLines, content_.numbers);
  for (QCPAxisRect* rect : panels_->Rects()) rect->axis(QCPAxis::atBottom)->setRange(seen);
  if (HasBars()) BuildStrip();
  for (int place = 0; place < panelsInSight_; ++place) BuildPanel(firstPanel_ + place, place);
  for (QCPAxis* axis : panels_->AllValues()) FitValues(*axis);
  ShowMarkers();
  ApplyTheme();
}

void SeriesPlot::ShowMarkers() {
  // The first chart bears the names, which have no room in a strip.
  std::vector<QCPAxisRect*> marked = panels_->Rects();
  if (HasBars()) std::ranges::rotate(marked, marked.begin() + 1);
  markers_->Show(content_.IsEmpty() || content_.numbers ? std::vector<DateMarker>() : content_.markers, marked);
}

void SeriesPlot::BuildPanel(int panel, int place) {
  // The first two units have an axis each; with more, all numbers stand on one, and the legend tells their units.
  std::vector<std::string> units;
  for (const Series& series : content_.series)
    if (series.panel == panel && std::ranges::find(units, series.unit) == units.end()) units.push_back(series.unit);
  const bool hasSecond = units.size() == 2;
  QCPAxis &keys = panels_->Keys(place), &left = panels_->Values(place, false), &right = panels_->Values(place, true);
  const auto isOnRight = [&](const Series& series) { return hasSecond && series.unit == units[1]; };
  for (const bool isRight : {false, true}) {
    bool isLogarithmic = false, isLinear = false;
    for (const Series& series : content_.series)
      if (series.panel == panel && isOnRight(series) == isRight)
        (series.isLogarithmic ? isLogarithmic : isLinear) = true;
    SetUpValueAxis(isRight ? right : left, isLogarithmic && !isLinear);
  }
  for (const Series& series : content_.series)
    if (series.panel == panel) AddCurve(series, &keys, isOnRight(series) ? &right : &left);
  left.setLabel(units.size() == 1 || hasSecond ? ToQt(units[0]) : QString());
  right.setLabel(hasSecond ? ToQt(units[1]) : QString());
  right.setVisible(true);
  right.setTickLabels(hasSecond);
  right.setTicks(hasSecond);
  if (content_.IsEmpty()) return;
  if (static_cast<std::size_t>(panel) < content_.panelTitles.size())
    AddTitle(*left.axisRect(), content_.panelTitles[static_cast<std::size_t>(panel)]);
  AddPeriodAndPointer(keys, left);
  if (!content_.numbers) MarkMissing(panel, place);
}

void SeriesPlot::AddTitle(QCPAxisRect& rect, const std::string& text) {
  auto* title = new QCPItemText(chart_);
  title->setClipAxisRect(&rect);
  title->position->setAxisRect(&rect);
  title->position->setType(QCPItemPosition::ptAxisRectRatio);
  title->position->setCoords(0, 0);
  title->setPositionAlignment(Qt::AlignLeft | Qt::AlignTop);
  title->setPadding({4, 2, 4, 2});
  title->setText(Translated(text));
  titles_.push_back(title);
}

void SeriesPlot::BuildStrip() {
  QCPAxis &keys = *panels_->Strip()->axis(QCPAxis::atBottom), &values = *panels_->Strip()->axis(QCPAxis::atLeft);
  bars_ = new TimeBarPlottable(&keys, &values, content_.bars);
  AddPeriodAndPointer(keys, values);
}

void SeriesPlot::AddPeriodAndPointer(QCPAxis& keys, QCPAxis& values) {
  if (content_.period && !content_.numbers && content_.period->first.IsValid() && content_.period->second.IsValid())
    periods_.push_back(AddSpan(keys, values, content_.period->first, content_.period->second));
  const auto over = [&](QCPItemPosition* place) {
    place->setAxes(&keys, &values);
    place->setAxisRect(values.axisRect());
    place->setTypeX(QCPItemPosition::ptPlotCoords);
    place->setTypeY(QCPItemPosition::ptAxisRectRatio);
  };
  auto* pointer = new QCPItemStraightLine(chart_);
  pointer->setLayer(kPointerLayer);
  pointer->setVisible(false);
  pointer->setClipAxisRect(values.axisRect());
  over(pointer->point1);
  over(pointer->point2);
  pointers_.push_back(pointer);
}

QCPItemRect* SeriesPlot::AddSpan(QCPAxis& keys, QCPAxis& values, const CYbDateTime& from, const CYbDateTime& to) {
  auto* span = new QCPItemRect(chart_);
  span->setLayer("background");
  span->setClipAxisRect(values.axisRect());
  for (QCPItemPosition* place : {span->topLeft, span->bottomRight}) {
    place->setAxes(&keys, &values);
    place->setAxisRect(values.axisRect());
    place->setTypeX(QCPItemPosition::ptPlotCoords);
    place->setTypeY(QCPItemPosition::ptAxisRectRatio);
  }
  span->topLeft->setCoords(AxisCoordinate(from), 0);
  span->bottomRight->setCoords(AxisCoordinate(to), 1);
  return span;
}

void SeriesPlot::MarkMissing(int panel, int place) {
  const auto add = [&](const CYbDateTime& from, const CYbDateTime& to) {
    hatches_.push_back(AddSpan(panels_->Keys(place), panels_->Values(place, false), from, to));
  };
  constexpr std::size_t kMostGaps = 100;
  std::optional<std::pair<CYbDateTime, CYbDateTime>> covered;
  for (const Series& series : given_.series) {
    if (series.panel != panel || series.times.size() < 2) continue;
    const CYbDateTime first = series.times.front(), last = series.times.back();
    if (!first.IsValid() || !last.IsValid()) continue;
    covered =
        covered ? std::pair(std::min(covered->first, first), std::max(covered->second, last)) : std::pair(first, last);
    for (const auto& [from, to] : GapsOf(series, kMostGaps)) add(from, to);
  }
  if (!covered || periods_.empty()) return;
  const auto [start, end] = *content_.period;
  if (start < covered->first) add(start, std::min(end, covered->first));
  if (covered->second < end) add(std::max(start, covered->second), end);
}

void SeriesPlot::AddCurve(const Series& series, QCPAxis* keys, QCPAxis* values) {
  auto* graph = new DenseGraph(keys, values);
  const bool isLogarithmic = content_.numbers && content_.numbers->isLogarithmic;
  const auto shown = PointsOf(series, isLogarithmic, values->scaleType() == QCPAxis::stLogarithmic);
  graph->setData(shown);
  graph->setName(NameOf(series));
  graph->setAdaptiveSampling(true);
  // A value between two gaps makes no line, and is seen as a point where points do not run together.
  constexpr int kFewPoints = 60;
  if (series.isPoints) graph->setLineStyle(QCPGraph::lsNone);
  if (series.isPoints || (shown->size() <= kFewPoints && !series.isStepped))
    graph->setScatterStyle(QCPScatterStyle(QCPScatterStyle::ssDisc, Theme::Get().Scaled(4)));
  const auto number = static_cast<std::size_t>(&series - content_.series.data());
  curves_.push_back({&series, series.color.value_or(number), graph});
}

void SeriesPlot::ApplyTheme() {
  StyleChart(*chart_);
  markers_->ApplyTheme();
  const Theme& theme = Theme::Get();
  const QPalette colors = QApplication::palette();
  const QColor quiet = theme.QuietColor();
  for (const Curve& curve : curves_) {
    const QColor color = CurveColor(curve.color, theme.IsDark());
    // Wider pens are slow, and would join values that stand in neighbouring pixels.
    const bool isDense = curve.graph->data()->size() > 5000;
    curve.graph->setPen(QPen(color, isDense ? 1 : 1.4 * theme.Zoom()));
    if (curve.series->isStepped) {
      QColor fill = color;
      fill.setAlpha(60);
      curve.graph->setBrush(fill);
    }
  }
  QColor shade = theme.NoteColor();
  shade.setAlpha(theme.IsDark() ? 34 : 26);
  for (QCPItemRect* period : periods_) {
    period->setBrush(shade);
    period->setPen(Qt::NoPen);
  }
  QColor missing = theme.WarningColor();
  missing.setAlpha(90);
  for (QCPItemRect* hatch : hatches_) {
    hatch->setBrush(QBrush(missing, Qt::BDiagPattern));
    hatch->setPen(Qt::NoPen);
  }
  for (QCPItemText* title : titles_) {
    title->setFont(QApplication::font());
    title->setColor(colors.color(QPalette::Text));
  }
  for (QCPItemStraightLine* pointer : pointers_) pointer->setPen(QPen(quiet, 1, Qt::DashLine));
  QPalette quietText = colors;
  quietText.setColor(QPalette::WindowText, quiet);
  quietText.setColor(QPalette::Text, quiet);
  message_->setPalette(quietText);
}

void SeriesPlot::Arrange() {
  const QFontMetrics metrics(QApplication::font());
  int widest = 1;
  // Of all, so that the names keep their places while charts are scrolled.
  for (const Series& series : content_.series) widest = std::max(widest, metrics.horizontalAdvance(NameOf(series)));
  ArrangeLegend(*chart_, widest);
  const QString longest = content_.numbers ? "0000.00" : "2000/00/00";
  for (QCPAxisRect* rect : panels_->Rects()) {
    const int places = rect->width() / (metrics.horizontalAdvance(longest) * 3 / 2);
    rect->axis(QCPAxis::atBottom)->ticker()->setTickCount(std::clamp(places, 2, 9));
    // A chart that shares the height since just now still has its height of before.
    const int height = std::min(rect->height(), chart_->height() / panelsInSight_);
    const int numbers = std::clamp(height / (3 * metrics.height()), 2, 7);
    for (const auto side : {QCPAxis::atLeft, QCPAxis::atRight}) rect->axis(side)->ticker()->setTickCount(numbers);
  }
  markers_->Arrange();
}

void SeriesPlot::Fit() {
  std::optional<QCPRange> keys;
  if (places_) keys = QCPRange(places_->first, places_->second);
  bool hasBars = false;
  const QCPRange barred = bars_ ? bars_->getKeyRange(hasBars, QCP::sdBoth) : QCPRange();
  if (hasBars) keys = keys ? keys->expanded(barred) : barred;
  // The simulation is seen as a whole, also where the series do not cover it.
  if (keys && !periods_.empty())
    keys = keys->expanded({AxisCoordinate(content_.period->first), AxisCoordinate(content_.period->second)});
  for (QCPAxis* axis : panels_->AllValues()) FitValues(*axis);
  if (keys) panels_->Keys().setRange(*keys);
  if (panels_->Keys().range().size() <= 0) panels_->Keys().scaleRange(1.02);
  chart_->replot(QCustomPlot::rpQueuedReplot);
}

void SeriesPlot::FitValues(QCPAxis& axis) {
  axis.rescale();
  // Curves keep off the frame, but what starts at zero stands on it. Names stand above the curves.
  const bool standsOnZero = axis.range().lower == 0;
  axis.setRange(WithRoom(axis, standsOnZero ? 0 : 0.04, 0.08));
}

void SeriesPlot::Zoom(double factor) {
  panels_->Keys().scaleRange(1 / factor);
  chart_->replot(QCustomPlot::rpQueuedReplot);
}

bool SeriesPlot::Press(const QKeyEvent& event) {
  const int key = event.key();
  const bool movesMark = event.modifiers() & Qt::ControlModifier;
  switch (key) {
    case Qt::Key_Plus:
    case Qt::Key_Equal:
      Zoom(kZoomStep);
      return true;
    case Qt::Key_Minus:
      Zoom(1 / kZoomStep);
      return true;
    case Qt::Key_Left:
    case Qt::Key_Right:
      if (movesMark) return MoveMark(key == Qt::Key_Left ? -1 : 1), true;
      MoveAxis(panels_->Keys(), key == Qt::Key_Left ? -0.15 : 0.15);
      break;
    case Qt::Key_Return:
    case Qt::Key_Enter:
      return mark_ && markers_->AnswerWith(*mark_);
    case Qt::Key_Up:
      for (QCPAxis* axis : panels_->AllValues()) MoveAxis(*axis, 0.15);
      break;
    case Qt::Key_Down:
      for (QCPAxis* axis : panels_->AllValues()) MoveAxis(*axis, -0.15);
      break;
    case Qt::Key_Home:
      Fit();
      return true;
    case Qt::Key_PageUp:
    case Qt::Key_PageDown:
      if (panelsInSight_ == panelCount_) return false;
      ScrollTo(firstPanel_ + (key == Qt::Key_PageUp ? -panelsInSight_ : panelsInSight_));
      return true;
    default:
      return false;
  }
  chart_->replot(QCustomPlot::rpQueuedReplot);
  return true;
}

bool SeriesPlot::eventFilter(QObject* watched, QEvent* event) {
  if (event->type() == QEvent::KeyPress && !content_.IsEmpty()) return Press(*static_cast<QKeyEvent*>(event));
  if (event->type() == QEvent::Resize) {
    message_->setGeometry(chart_->rect());
    if (PanelsInSight() != panelsInSight_) BuildPanels();
  }
  if (event->type() == QEvent::Leave) ShowPointer({});
  return PlotFrame::eventFilter(watched, event);
}

void SeriesPlot::PointAt(const QMouseEvent* event) {
  if (pointers_.empty()) return;
  const bool isInside = std::ranges::any_of(
      panels_->Rects(), [&](const QCPAxisRect* rect) { return rect->rect().contains(event->pos()); });
  mark_.reset();
  ShowPointer(isInside ? std::optional(panels_->Keys().pixelToCoord(event->position().x())) : std::nullopt);
}

void SeriesPlot::ShowPointer(std::optional<double> place) {
  for (QCPItemStraightLine* pointer : pointers_) {
    pointer->setVisible(place.has_value());
    pointer->point1->setCoords(place.value_or(0), 0);
    pointer->point2->setCoords(place.value_or(0), 1);
  }
  // The curves stay as they are drawn.
  chart_->layer(kPointerLayer)->replot();
  SetStatus(place ? TextAt(*place) : QString());
}

void SeriesPlot::MoveMark(int by) {
  QCPAxis& keys = panels_->Keys();
  if (!mark_ || !keys.range().contains(*mark_)) {
    mark_ = keys.range().center();
  } else {
    // The next value that is seen beside this one.
    const double pixel = keys.range().size() / std::max(keys.axisRect()->width(), 1);
    mark_ = *mark_ + by * pixel;
    if (!curves_.empty() && !curves_.front().graph->data()->isEmpty()) {
      const auto& points = *curves_.front().graph->data();
      auto at = points.findBegin(*mark_, false);
      if (by < 0 && at != points.constBegin()) --at;
      if (at != points.constEnd()) mark_ = at->key;
    }
    if (!keys.range().contains(*mark_)) {
      keys.moveRange(*mark_ - keys.range().center());
      chart_->replot();
    }
  }
  ShowPointer(mark_);
}

QString SeriesPlot::TextAt(double time) const {
  // The time that is told is that of the nearest value of the first curve.
  QString text;
  for (const Curve& curve : curves_) {
    const auto& points = *curve.graph->data();
    if (points.isEmpty()) continue;
    auto at = points.findBegin(time, false);
    if (curve.series->isStepped) {
      // It holds over the interval before: the next one counts.
      if (at != points.constEnd() && at->key < time) ++at;
      if (at == points.constEnd() || (at == points.constBegin() && time < at->key)) continue;
    } else {
      if (at == points.constEnd()) --at;
      if (const auto before = at; before != points.constBegin() && time - (before - 1)->key < before->key - time)
        at = before - 1;
    }
    if (text.isEmpty()) text = PlaceText(at->key, content_.numbers);
    text +=
        "   " + Translated(curve.series->name) + " " + (std::isnan(at->value) ? tr("no value") : ValueText(at->value));
    if (!std::isnan(at->value) && !curve.series->unit.empty()) text += " " + ToQt(curve.series->unit);
  }
  if (const QString names = bars_ ? bars_->NamesAt(time) : QString(); !names.isEmpty()) text += "   " + names;
  return text;
}

QString SeriesPlot::ValuesAsText() const {
  std::map<double, std::vector<QString>> rows;
  QString text = content_.numbers ? AxisTitle(content_.numbers) : tr("Time");
  for (std::size_t i = 0; i < content_.series.size(); ++i) {
    const Series& series = content_.series[i];
    text += "\t" + NameOf(series);
    for (std::size_t k = 0; k < std::min(PlaceCount(series), series.values.size()); ++k) {
      const double place = ValueCoordinate(series, k);
      if (std::isnan(place)) continue;
      std::vector<QString>& row = rows[place];
      row.resize(content_.series.size());
      row[i] = std::isnan(series.values[k]) ? QString() : ToQt(FormatNumber(series.values[k], {}));
    }
  }
  text += "\n";
  for (const auto& [place, values] : rows) {
    text += content_.numbers ? ToQt(FormatNumber(place, {})) : DateText(place);
    for (const QString& value : values) text += "\t" + value;
    text += "\n";
  }
  return text;
}

QImage SeriesPlot::Picture(double pixelRatio) {
  if (panelsInSight_ == panelCount_) return chart_->toPixmap(chart_->width(), chart_->height(), pixelRatio).toImage();
  // All charts, as they would stand in a window of their height.
  SeriesPlot whole(Outside());
  QCustomPlot& chart = *whole.chart_;
  chart.resize(chart_->width(), HeightOf(panelCount_));
  chart.setViewport(chart.rect());
  whole.view_ = view_;
  whole.Show(given_);
  whole.panels_->Keys().setRange(panels_->Keys().range());
  for (const auto phase : {QCPLayoutElement::upPreparation, QCPLayoutElement::upMargins, QCPLayoutElement::upLayout})
    chart.plotLayout()->update(phase);
  whole.Arrange();
  constexpr double kMostPixels = 32000;  // in height: the toolkit paints no more
  return chart.toPixmap(chart.width(), chart.height(), std::min(pixelRatio, kMostPixels / chart.height())).toImage();
}

}  // namespace tervane
