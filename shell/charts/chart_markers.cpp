// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/charts/chart_markers.h"

#include <QApplication>
#include <QKeyEvent>
#include <QLabel>
#include <QMouseEvent>
#include <algorithm>
#include <cmath>
#include <optional>
#include <utility>

#include <qcustomplot.h>

#include "shell/charts/chart_axis.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr double kReach = 5;  ///< How near the pointer must be to a marker, in pixels at zoom 1.
constexpr double kClickRadius = 4;
constexpr std::size_t kMostNames = 60;  ///< More could not be read.

const QColor kMarkerColor(0xd1, 0x45, 0x3b);

}  // namespace

ChartMarkers::ChartMarkers(QCustomPlot& chart) : QObject(&chart), chart_(chart), prompt_(new QLabel(&chart)) {
  prompt_->setWordWrap(true);
  prompt_->setAlignment(Qt::AlignCenter);
  prompt_->setAutoFillBackground(true);
  prompt_->setFrameShape(QFrame::StyledPanel);
  prompt_->setMargin(Theme::Get().Scaled(4));
  prompt_->setAttribute(Qt::WA_TransparentForMouseEvents);
  prompt_->hide();
  chart_.installEventFilter(this);
}

/// The lines of all markers in one chart. There may be thousands: a pixel is drawn once.
class ChartMarkers::Lines : public QCPAbstractItem {
 public:
  Lines(const ChartMarkers& markers, QCPAxisRect& chart)
      : QCPAbstractItem(chart.parentPlot()), markers_(markers), chart_(chart) {
    setClipToAxisRect(true);
    setClipAxisRect(&chart);
    setSelectable(false);
  }
  double selectTest(const QPointF& /*place*/, bool /*onlySelectable*/, QVariant* /*details*/) const override {
    return -1;
  }

 protected:
  void draw(QCPPainter* painter) override {
    const QCPAxis& times = *chart_.axis(QCPAxis::atBottom);
    const double width = 1.6 * Theme::Get().Zoom();
    std::optional<int> last;
    for (const bool standsOut : {false, true}) {
      for (std::size_t i = 0; i < markers_.places_.size(); ++i) {
        const DateMarker& marker = markers_.markers_[i];
        const double at = times.coordToPixel(markers_.places_[i]);
        const int pixel = static_cast<int>(std::lround(at));
        if (marker.standsOut != standsOut || at < chart_.left() - width || at > chart_.right() + width) continue;
        if (last == pixel && !standsOut) continue;
        last = pixel;
        painter->setPen(QPen(kMarkerColor, standsOut ? 2 * width : width, marker.moved ? Qt::SolidLine : Qt::DashLine));
        painter->drawLine(QLineF(at, chart_.top(), at, chart_.bottom()));
      }
    }
  }

 private:
  const ChartMarkers& markers_;
  QCPAxisRect& chart_;
};

void ChartMarkers::MakeName(const DateMarker& marker) {
  auto* name = new QCPItemText(&chart_);
  name->position->setAxisRect(charts_.front());
  name->position->setAxes(charts_.front()->axis(QCPAxis::atBottom), charts_.front()->axis(QCPAxis::atLeft));
  name->position->setTypeX(QCPItemPosition::ptPlotCoords);
  name->position->setTypeY(QCPItemPosition::ptAxisRectRatio);
  name->setClipAxisRect(charts_.front());
  name->setText(Translated(marker.name));
  names_.push_back(name);
}

void ChartMarkers::Clear() {
  for (QCPItemText* name : names_) chart_.removeItem(name);
  for (Lines* lines : lines_) chart_.removeItem(lines);
  names_.clear();
  lines_.clear();
  places_.clear();
  markers_.clear();
  dragged_.reset();
}

void ChartMarkers::Show(const std::vector<DateMarker>& markers, const std::vector<QCPAxisRect*>& charts) {
  Clear();
  charts_ = charts;
  markers_ = markers;
  std::erase_if(markers_, [](const DateMarker& marker) { return !marker.time.IsValid(); });
  if (markers_.empty()) return;
  for (QCPAxisRect* rect : charts_) lines_.push_back(new Lines(*this, *rect));
  for (const DateMarker& marker : markers_) {
    if (markers_.size() <= kMostNames) MakeName(marker);
    places_.push_back(0);
    Place(places_.size() - 1, AxisCoordinate(marker.time));
  }
  ApplyTheme();
}

void ChartMarkers::SetMoves(const std::vector<DateMarker>& markers) {
  std::vector<DateMarker> valid = markers;
  std::erase_if(valid, [](const DateMarker& marker) { return !marker.time.IsValid(); });
  for (std::size_t i = 0; i < std::min(valid.size(), markers_.size()); ++i) markers_[i].moved = valid[i].moved;
}

void ChartMarkers::Place(std::size_t marker, double at) {
  places_[marker] = at;
  if (!names_.empty()) names_[marker]->position->setCoords(at, names_[marker]->position->value());
}

void ChartMarkers::ApplyTheme() {
  const Theme& theme = Theme::Get();
  for (QCPItemText* name : names_) {
    name->setFont(QApplication::font());
    name->setColor(QApplication::palette().color(QPalette::Text));
    QColor paper = QApplication::palette().color(QPalette::Base);
    paper.setAlpha(215);
    name->setBrush(paper);
    name->setPen(QPen(kMarkerColor, 1));
    const int margin = theme.Scaled(3);
    name->setPadding({margin, 0, margin, 0});
  }
}

void ChartMarkers::Arrange() {
  if (names_.empty() || charts_.front()->height() <= 0) return;
  const QFontMetrics metrics(QApplication::font());
  const QCPAxis& times = *charts_.front()->axis(QCPAxis::atBottom);
  const double margin = Theme::Get().Scaled(5), line = metrics.height() + 2.0;
  std::vector<std::size_t> order(names_.size());
  for (std::size_t i = 0; i < order.size(); ++i) order[i] = i;
  std::ranges::sort(order, {}, [&](std::size_t i) { return places_[i]; });
  std::vector<double> ends;  // of the names in each line
  for (const std::size_t i : order) {
    QCPItemText& name = *names_[i];
    const double at = times.coordToPixel(name.position->key());
    const double width = metrics.horizontalAdvance(name.text()) + 2 * margin;
    // On the left of its line where there is no room on the right.
    const bool isLeft = at + width > charts_.front()->right() && at - width > charts_.front()->left();
    const double begin = isLeft ? at - width : at;
    std::size_t row = 0;
    while (row < ends.size() && ends[row] > begin) ++row;
    if (row == ends.size()) ends.push_back(0);
    ends[row] = begin + width;
    name.setPositionAlignment((isLeft ? Qt::AlignRight : Qt::AlignLeft) | Qt::AlignTop);
    const double top = (static_cast<double>(row) * line + 2) / charts_.front()->height();
    name.position->setCoords(name.position->key(), top);
  }
}

void ChartMarkers::Ask(std::optional<DateRequest> request) {
  const bool isNew = request && (!request_ || request_->prompt != request->prompt);
  request_ = std::move(request);
  prompt_->setVisible(request_.has_value());
  if (!request_) {
    pressedAt_.reset();
    return chart_.unsetCursor();
  }
  chart_.setCursor(Qt::CrossCursor);
  prompt_->setText(Translated(request_->prompt));
  prompt_->setFixedWidth(std::min(prompt_->fontMetrics().horizontalAdvance(prompt_->text()) + Theme::Get().Scaled(24),
                                  std::max(chart_.width() - Theme::Get().Scaled(40), Theme::Get().Scaled(80))));
  prompt_->adjustSize();
  prompt_->move((chart_.width() - prompt_->width()) / 2, Theme::Get().Scaled(4));
  if (isNew && chart_.isVisible()) chart_.setFocus(Qt::OtherFocusReason);
}

void ChartMarkers::GiveUp() {
  const DateRequest left = *std::exchange(request_, {});
  Ask({});
  if (left.givenUp) left.givenUp();
}

// ---- Mouse and keyboard

double ChartMarkers::PerPixel() const {
  const QCPAxisRect& rect = *charts_.front();
  return rect.axis(QCPAxis::atBottom)->range().size() / std::max(rect.width(), 1);
}

bool ChartMarkers::IsInside(QPointF pointer) const {
  return std::ranges::any_of(charts_, [&](QCPAxisRect* rect) { return rect->rect().contains(pointer.toPoint()); });
}

std::optional<std::size_t> ChartMarkers::MarkerAt(QPointF pointer) const {
  if (!IsInside(pointer)) return {};
  const QCPAxis& times = *charts_.front()->axis(QCPAxis::atBottom);
  std::optional<std::size_t> found;
  double nearest = kReach * Theme::Get().Zoom();
  for (std::size_t i = 0; i < places_.size(); ++i) {
    const double distance = std::abs(times.coordToPixel(places_[i]) - pointer.x());
    if (!markers_[i].moved || distance >= nearest) continue;
    nearest = distance;
    found = i;
  }
  return found;
}

bool ChartMarkers::Press(const QMouseEvent& event) {
  if (event.button() != Qt::LeftButton || event.modifiers() & Qt::ShiftModifier) return false;
  if (request_) {
    pressedAt_ = event.position();
    return false;
  }
  dragged_ = MarkerAt(event.position());
  return dragged_.has_value();
}

bool ChartMarkers::Move(const QMouseEvent& event) {
  if (!dragged_) {
    if (!request_ && event.buttons() == Qt::NoButton) {
      if (MarkerAt(event.position()))
        chart_.setCursor(Qt::SizeHorCursor);
      else
        chart_.unsetCursor();
    }
    return false;
  }
  const QCPAxis& times = *charts_.front()->axis(QCPAxis::atBottom);
  const double inside = std::clamp(times.pixelToCoord(event.position().x()), times.range().lower, times.range().upper);
  Place(*dragged_, AxisCoordinate(DateAt(inside, PerPixel())));
  chart_.replot(QCustomPlot::rpQueuedReplot);
  return true;
}

bool ChartMarkers::Release(const QMouseEvent& event) {
  if (dragged_) {
    const std::size_t marker = *std::exchange(dragged_, {});
    const CYbDateTime time = CYbDateTime::FromSecondsSinceEpoch(std::llround(places_[marker]));
    // The page may be shown anew by what the move does.
    const auto moved = markers_[marker].moved;
    if (time != markers_[marker].time) {
      markers_[marker].time = time;
      moved(time);
    }
    return true;
  }
  const auto pressedAt = std::exchange(pressedAt_, {});
  const bool isClick = pressedAt && (event.position() - *pressedAt).manhattanLength() < kClickRadius;
  if (!request_ || !isClick || !IsInside(event.position())) return false;
  AnswerWith(charts_.front()->axis(QCPAxis::atBottom)->pixelToCoord(event.position().x()));
  return false;
}

bool ChartMarkers::AnswerWith(double place) {
  if (!request_) return false;
  const DateRequest answered = *std::exchange(request_, {});
  Ask({});
  if (answered.taken) answered.taken(DateAt(place, PerPixel()));
  return true;
}

bool ChartMarkers::eventFilter(QObject* /*watched*/, QEvent* event) {
  if (charts_.empty()) return false;
  switch (event->type()) {
    case QEvent::MouseButtonPress:
      return Press(*static_cast<QMouseEvent*>(event));
    case QEvent::MouseMove:
      return Move(*static_cast<QMouseEvent*>(event));
    case QEvent::MouseButtonRelease:
      return Release(*static_cast<QMouseEvent*>(event));
    case QEvent::KeyPress:
      if (!request_ || static_cast<QKeyEvent*>(event)->key() != Qt::Key_Escape) return false;
      GiveUp();
      return true;
    default:
      return false;
  }
}

}  // namespace tervane
