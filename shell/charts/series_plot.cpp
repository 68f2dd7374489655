// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/charts/series_plot.h"

#include <QApplication>
#include <QClipboard>
#include <QLabel>
#include <algorithm>
#include <array>
#include <cmath>
#include <map>
#include <utility>

#include <qcustomplot.h>

#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr double kDay = 86400;
constexpr double kZoomStep = 1.5;
constexpr const char* kPointerLayer = "pointer";

QDateTime AsDate(double seconds) {
  return QDateTime::fromMSecsSinceEpoch(static_cast<qint64>(std::llround(seconds * 1000)), Qt::UTC);
}

/// Ticks at whole hours, days, months and years, each labelled as finely as it stands.
class DateTicker : public QCPAxisTickerDateTime {
 public:
  DateTicker() { setDateTimeSpec(Qt::UTC); }

 protected:
  double getTickStep(const QCPRange& range) override {
    isFirst_ = std::floor(range.lower / kDay) == std::floor(range.upper / kDay);
    return step_ = QCPAxisTickerDateTime::getTickStep(range);
  }
  QString getTickLabel(double tick, const QLocale& /*locale*/, QChar /*formatChar*/, int /*precision*/) override {
    const QDateTime date = AsDate(tick);
    if (step_ > 360 * kDay) return date.toString("yyyy");
    if (step_ > 27 * kDay) return date.toString("yyyy/MM");
    if (step_ > 0.99 * kDay) return date.toString("yyyy/MM/dd");
    const QString time = date.toString(step_ > 59 ? "HH:mm" : "HH:mm:ss");
    // The day is told where it begins, and once where no day begins.
    const bool isFirst = std::exchange(isFirst_, false);
    return date.time() == QTime(0, 0) || isFirst ? time + "\n" + date.toString("yyyy/MM/dd") : time;
  }

 private:
  double step_ = kDay;
  bool isFirst_ = false;
};

/// Colours of curves that are told apart on white and on dark ground, also by people who confuse red and green.
QColor CurveColor(std::size_t number, bool onDark) {
  constexpr std::array<std::pair<QRgb, QRgb>, 8> kColors{{{0xff1f6fb2, 0xff62aef0},
                                                          {0xffd1601a, 0xffff9b54},
                                                          {0xff2b8a4b, 0xff62c987},
                                                          {0xffa63a78, 0xffe58abf},
                                                          {0xff7a5c16, 0xffd9b64a},
                                                          {0xff5b50b5, 0xffa79df5},
                                                          {0xff128a91, 0xff4fd0d6},
                                                          {0xff555c66, 0xffb9c0ca}}};
  const auto& [light, dark] = kColors[number % kColors.size()];
  return onDark ? dark : light;
}

QString NameOf(const Series& series) {
  QString name = ToQt(series.name);
  if (!series.unit.empty()) name += " [" + ToQt(series.unit) + "]";
  return name;
}

QString ValueText(double value) { return std::isnan(value) ? QString() : ToQt(FormatNumber(value, "%.6g")); }

}  // namespace

struct SeriesPlot::Curve {
  const Series* series;
  QCPGraph* graph;
};

SeriesPlot::SeriesPlot(Host& host, QWidget* parent)
    : PlotFrame(host, parent), chart_(new QCustomPlot), message_(new QLabel(chart_)) {
  chart_->setMinimumSize(Theme::Get().Scaled(200), Theme::Get().Scaled(140));
  chart_->setFocusPolicy(Qt::StrongFocus);
  chart_->installEventFilter(this);
  chart_->setInteractions(QCP::iRangeDrag | QCP::iRangeZoom);
  chart_->setSelectionRectMode(QCP::srmNone);
  // Many values: lines of one pixel are drawn without the slow joins.
  chart_->setPlottingHint(QCP::phFastPolylines);
  chart_->xAxis->setTicker(QSharedPointer<DateTicker>::create());
  chart_->addLayer(kPointerLayer, chart_->layer("overlay"), QCustomPlot::limBelow);
  chart_->layer(kPointerLayer)->setMode(QCPLayer::lmBuffered);
  // The legend stands above the curves, where it hides nothing.
  chart_->plotLayout()->insertRow(0);
  auto* names = new QCPLayoutGrid;
  chart_->plotLayout()->addElement(0, 0, names);
  names->addElement(0, 0, chart_->legend);
  names->addElement(0, 1, new QCPLayoutElement(chart_));
  names->setColumnStretchFactor(0, 0.001);
  chart_->plotLayout()->setRowStretchFactor(0, 0.001);
  chart_->legend->setFillOrder(QCPLegend::foColumnsFirst);
  connect(chart_, &QCustomPlot::beforeReplot, this, &SeriesPlot::Arrange);
  message_->setAlignment(Qt::AlignCenter);
  message_->setWordWrap(true);
  message_->setMargin(Theme::Get().Scaled(16));
  message_->setAutoFillBackground(true);
  message_->setBackgroundRole(QPalette::Base);
  Hold({chart_, [this](double factor) { Zoom(factor); }, [this] { Fit(); },
        [this](double pixelRatio) { return Picture(pixelRatio); }});
  AddCommand(tr("Copy &values"), [this] { QApplication::clipboard()->setText(ValuesAsText()); });
  connect(chart_, &QCustomPlot::mousePress, this, [this](const QMouseEvent* event) {
    chart_->setSelectionRectMode(event->modifiers() & Qt::ShiftModifier ? QCP::srmZoom : QCP::srmNone);
  });
  connect(chart_, &QCustomPlot::mouseWheel, this, [this](const QWheelEvent* event) {
    const bool isValues = event->modifiers() & Qt::ControlModifier;
    chart_->axisRect()->setRangeZoom(isValues ? Qt::Vertical : Qt::Horizontal);
  });
  connect(chart_, &QCustomPlot::mouseMove, this, &SeriesPlot::PointAt);
  connect(chart_, &QCustomPlot::mouseDoubleClick, this, &SeriesPlot::Fit);
  connect(&Theme::Get(), &Theme::Changed, this, [this] {
    ApplyTheme();
    chart_->replot(QCustomPlot::rpQueuedReplot);
  });
}

SeriesPlot::~SeriesPlot() = default;

QWidget* SeriesPlot::FocusTarget() const { return chart_; }

void SeriesPlot::Show(SeriesContent content) {
  if (isShown_ && LooksSame(content, content_)) return;
  isShown_ = true;
  content_ = std::move(content);
  Build();
}

void SeriesPlot::ShowWhenThere(const std::function<SeriesContent()>& content) {
  SeriesContent now = Follow<SeriesContent>(content, [this, content] { ShowWhenThere(content); });
  if (!now.awaited.empty() && isShown_) return;
  // Nothing is said of an empty chart that is still to come.
  if (!now.awaited.empty() && now.message.empty()) now.message = " ";
  now.awaited.clear();
  Show(std::move(now));
}

void SeriesPlot::Build() {
  chart_->clearPlottables();
  chart_->clearItems();
  curves_.clear();
  period_ = nullptr;
  pointer_ = nullptr;
  const bool isEmpty = content_.IsEmpty();
  // The first two units have an axis each; with more, all numbers stand on one, and the legend tells their units.
  std::vector<std::string> units;
  for (const Series& series : content_.series)
    if (std::ranges::find(units, series.unit) == units.end()) units.push_back(series.unit);
  const bool hasSecond = units.size() == 2;
  for (const Series& series : content_.series)
    AddCurve(series, hasSecond && series.unit == units[1] ? chart_->yAxis2 : chart_->yAxis);
  chart_->yAxis->setLabel(units.size() == 1 || hasSecond ? ToQt(units[0]) : QString());
  chart_->yAxis2->setLabel(hasSecond ? ToQt(units[1]) : QString());
  chart_->yAxis2->setVisible(true);
  chart_->yAxis2->setTickLabels(hasSecond);
  chart_->yAxis2->setTicks(hasSecond);
  chart_->xAxis2->setVisible(true);
  chart_->xAxis2->setTicks(false);
  chart_->xAxis2->setTickLabels(false);
  chart_->axisRect()->setRangeDragAxes({chart_->xAxis, chart_->yAxis, chart_->yAxis2});
  chart_->axisRect()->setRangeZoomAxes({chart_->xAxis, chart_->yAxis, chart_->yAxis2});

  message_->setText(content_.message.empty() ? tr("There is nothing to show.") : Translated(content_.message));
  message_->setVisible(isEmpty);
  if (!isEmpty) {
    if (content_.period && content_.period->first.IsValid() && content_.period->second.IsValid()) {
      period_ = new QCPItemRect(chart_);
      period_->setLayer("background");
      for (QCPItemPosition* corner : {period_->topLeft, period_->bottomRight}) {
        corner->setTypeX(QCPItemPosition::ptPlotCoords);
        corner->setTypeY(QCPItemPosition::ptAxisRectRatio);
      }
      period_->topLeft->setCoords(static_cast<double>(content_.period->first.SecondsSinceEpoch()), 0);
      period_->bottomRight->setCoords(static_cast<double>(content_.period->second.SecondsSinceEpoch()), 1);
    }
    pointer_ = new QCPItemStraightLine(chart_);
    pointer_->setLayer(kPointerLayer);
    pointer_->setVisible(false);
  }
  SetStatus({});
  ApplyTheme();
  Fit();
}

void SeriesPlot::AddCurve(const Series& series, QCPAxis* values) {
  QCPGraph* graph = chart_->addGraph(chart_->xAxis, values);
  const auto shown = QSharedPointer<QCPGraphDataContainer>::create();
  QVector<QCPGraphData> points;
  const std::size_t count = std::min(series.times.size(), series.values.size());
  points.reserve(static_cast<qsizetype>(count));
  bool isSorted = true;
  for (std::size_t i = 0; i < count; ++i) {
    if (!series.times[i].IsValid()) continue;
    const auto time = static_cast<double>(series.times[i].SecondsSinceEpoch());
    isSorted = isSorted && (points.isEmpty() || points.back().key <= time);
    // The value holds since the time before. (The chart's own steps lose all that stands behind a gap.)
    if (series.isStepped && !points.isEmpty()) points.push_back({points.back().key, series.values[i]});
    points.push_back({time, series.values[i]});
  }
  shown->set(points, isSorted);
  graph->setData(shown);
  graph->setName(NameOf(series));
  graph->setAdaptiveSampling(true);
  // A value between two gaps makes no line, and is seen as a point where points do not run together.
  constexpr qsizetype kFewPoints = 60;
  if (points.size() <= kFewPoints && !series.isStepped)
    graph->setScatterStyle(QCPScatterStyle(QCPScatterStyle::ssDisc, Theme::Get().Scaled(4)));
  curves_.push_back({&series, graph});
}

void SeriesPlot::ApplyTheme() {
  const Theme& theme = Theme::Get();
  const QPalette colors = QApplication::palette();
  const QColor ink = colors.color(QPalette::Text), quiet = theme.QuietColor();
  QColor grid = quiet;
  grid.setAlpha(70);
  chart_->setBackground(colors.color(QPalette::Base));
  for (QCPAxis* axis : chart_->axisRect()->axes()) {
    axis->setBasePen(QPen(quiet, 1));
    axis->setTickPen(QPen(quiet, 1));
    axis->setSubTickPen(QPen(quiet, 1));
    axis->setTickLabelColor(ink);
    axis->setLabelColor(ink);
    axis->setTickLabelFont(QApplication::font());
    axis->setLabelFont(QApplication::font());
    axis->grid()->setPen(QPen(grid, 1));
    axis->grid()->setZeroLinePen(QPen(quiet, 1));
    axis->setTickLength(0, theme.Scaled(5));
    axis->setSubTickLength(0, theme.Scaled(3));
  }
  chart_->legend->setFont(QApplication::font());
  chart_->legend->setTextColor(ink);
  chart_->legend->setBrush(Qt::NoBrush);
  chart_->legend->setBorderPen(Qt::NoPen);
  chart_->legend->setVisible(true);
  chart_->legend->setIconSize(theme.Scaled(24), QFontMetrics(QApplication::font()).height());
  for (std::size_t i = 0; i < curves_.size(); ++i) {
    const QColor color = CurveColor(i, theme.IsDark());
    // Wider pens are slow, and would join values that stand in neighbouring pixels.
    const bool isDense = curves_[i].graph->data()->size() > 5000;
    curves_[i].graph->setPen(QPen(color, isDense ? 1 : 1.4 * theme.Zoom()));
    if (curves_[i].series->isStepped) {
      QColor fill = color;
      fill.setAlpha(60);
      curves_[i].graph->setBrush(fill);
    }
  }
  if (period_) {
    QColor shade = theme.NoteColor();
    shade.setAlpha(theme.IsDark() ? 34 : 26);
    period_->setBrush(shade);
    period_->setPen(Qt::NoPen);
  }
  if (pointer_) pointer_->setPen(QPen(quiet, 1, Qt::DashLine));
  QPalette quietText = colors;
  quietText.setColor(QPalette::WindowText, quiet);
  quietText.setColor(QPalette::Text, quiet);
  message_->setPalette(quietText);
  chart_->selectionRect()->setPen(QPen(colors.color(QPalette::Highlight), 1.5));
  QColor veil = colors.color(QPalette::Highlight);
  veil.setAlpha(50);
  chart_->selectionRect()->setBrush(veil);
}

void SeriesPlot::Arrange() {
  const QFontMetrics metrics(QApplication::font());
  int widest = 1;
  for (const Curve& curve : curves_) widest = std::max(widest, metrics.horizontalAdvance(curve.graph->name()));
  const int columns = chart_->width() / (widest + Theme::Get().Scaled(44));
  chart_->legend->setWrap(std::max(1, columns));
  const int dates = chart_->axisRect()->width() / (metrics.horizontalAdvance("2000/00/00") * 3 / 2);
  chart_->xAxis->ticker()->setTickCount(std::clamp(dates, 2, 9));
  const int numbers = chart_->axisRect()->height() / (3 * metrics.height());
  for (QCPAxis* axis : {chart_->yAxis, chart_->yAxis2}) axis->ticker()->setTickCount(std::clamp(numbers, 2, 7));
}

void SeriesPlot::Fit() {
  chart_->rescaleAxes();
  for (QCPAxis* axis : {chart_->yAxis, chart_->yAxis2}) {
    // Curves keep off the frame, but what starts at zero stands on it. Names stand above the curves.
    const QCPRange range = axis->range();
    const double size = range.size() > 0 ? range.size() : 1;
    axis->setRange(range.lower == 0 ? 0 : range.lower - 0.04 * size, range.upper + 0.08 * size);
  }
  if (chart_->xAxis->range().size() <= 0) chart_->xAxis->scaleRange(1.02);
  chart_->replot(QCustomPlot::rpQueuedReplot);
}

void SeriesPlot::Zoom(double factor) {
  chart_->xAxis->scaleRange(1 / factor);
  chart_->replot(QCustomPlot::rpQueuedReplot);
}

bool SeriesPlot::Press(int key) {
  const auto move = [this](QCPAxis* axis, double part) { axis->moveRange(part * axis->range().size()); };
  switch (key) {
    case Qt::Key_Plus:
    case Qt::Key_Equal:
      Zoom(kZoomStep);
      return true;
    case Qt::Key_Minus:
      Zoom(1 / kZoomStep);
      return true;
    case Qt::Key_Left:
      move(chart_->xAxis, -0.15);
      break;
    case Qt::Key_Right:
      move(chart_->xAxis, 0.15);
      break;
    case Qt::Key_Up:
      for (QCPAxis* axis : {chart_->yAxis, chart_->yAxis2}) move(axis, 0.15);
      break;
    case Qt::Key_Down:
      for (QCPAxis* axis : {chart_->yAxis, chart_->yAxis2}) move(axis, -0.15);
      break;
    case Qt::Key_Home:
      Fit();
      return true;
    default:
      return false;
  }
  chart_->replot(QCustomPlot::rpQueuedReplot);
  return true;
}

bool SeriesPlot::eventFilter(QObject* watched, QEvent* event) {
  if (event->type() == QEvent::KeyPress && !content_.IsEmpty()) return Press(static_cast<QKeyEvent*>(event)->key());
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

void SeriesPlot::PointAt(const QMouseEvent* event) {
  if (!pointer_) return;
  const bool isInside = chart_->axisRect()->rect().contains(event->pos());
  const double time = chart_->xAxis->pixelToCoord(event->position().x());
  pointer_->setVisible(isInside);
  pointer_->point1->setCoords(time, 0);
  pointer_->point2->setCoords(time, 1);
  // The curves stay as they are drawn.
  chart_->layer(kPointerLayer)->replot();
  SetStatus(isInside ? TextAt(time) : QString());
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
    if (text.isEmpty()) text = AsDate(at->key).toString("yyyy/MM/dd HH:mm");
    text += "   " + ToQt(curve.series->name) + " " + (std::isnan(at->value) ? tr("no value") : ValueText(at->value));
    if (!std::isnan(at->value) && !curve.series->unit.empty()) text += " " + ToQt(curve.series->unit);
  }
  return text;
}

QString SeriesPlot::ValuesAsText() const {
  std::map<std::int64_t, std::vector<QString>> rows;
  QString text = tr("Time");
  for (std::size_t i = 0; i < content_.series.size(); ++i) {
    const Series& series = content_.series[i];
    text += "\t" + NameOf(series);
    for (std::size_t k = 0; k < std::min(series.times.size(), series.values.size()); ++k) {
      if (!series.times[k].IsValid()) continue;
      std::vector<QString>& row = rows[series.times[k].SecondsSinceEpoch()];
      row.resize(content_.series.size());
      row[i] = std::isnan(series.values[k]) ? QString() : ToQt(FormatNumber(series.values[k], {}));
    }
  }
  text += "\n";
  for (const auto& [time, values] : rows) {
    text += AsDate(static_cast<double>(time)).toString("yyyy-MM-dd HH:mm:ss");
    for (const QString& value : values) text += "\t" + value;
    text += "\n";
  }
  return text;
}

QImage SeriesPlot::Picture(double pixelRatio) {
  return chart_->toPixmap(chart_->width(), chart_->height(), pixelRatio).toImage();
}

}  // namespace tervane
