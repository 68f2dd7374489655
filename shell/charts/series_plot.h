// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QString>
#include <memory>
#include <optional>
#include <utility>
#include <vector>

#include "forms/series_views.h"
#include "shell/widgets/plot_frame.h"

class QActionGroup;
class QCPAxis;
class QCPAxisRect;
class QCPGraph;
class QCPItemStraightLine;
class QCPItemText;
class QCPItemRect;
class QCustomPlot;
class QLabel;
class QMouseEvent;
class QScrollBar;

namespace tervane {

class ChartMarkers;
class ChartPanels;
class SeriesChooser;
class TimeBarPlottable;

/// A chart of a page: curves over time or a number with their legend, also several charts below each other. Of many
/// charts those are made that are in sight; the others are scrolled to.
///
/// The wheel zooms in time towards the pointer (with Ctrl in the values), drag moves, Shift and drag zooms to a box, a
/// double click or Home shows everything; + - and the arrows do the same from the keyboard, Page Up and Page Down
/// scroll. Ctrl and arrows point at one value after the other, Enter gives the date that is asked for.
class SeriesPlot : public PlotFrame {
  Q_OBJECT

 public:
  explicit SeriesPlot(Host& host, QWidget* parent = nullptr);
  ~SeriesPlot() override;

  /// Shows what there is to show; draws anew only where something differs. What the user looks at stays where only
  /// marked dates differ.
  void Show(SeriesContent content);
  /// The same of content that may have to be computed: what is shown stays until that is done.
  void ShowWhenThere(const std::function<SeriesContent()>& content);
  QCustomPlot& Chart() const { return *chart_; }
  QWidget* FocusTarget() const;
  /// The values of all series that the user sees at a time, in seconds since 1970.
  QString TextAt(double time) const;
  /// The values as a table of texts, one row for each time, as a spreadsheet takes them.
  QString ValuesAsText() const;
  void Fit();
  void Zoom(double factor);

 protected:
  bool eventFilter(QObject* watched, QEvent* event) override;

 private:
  struct Curve;

  /// Shows the series in another way.
  void SetView(SeriesView view);
  SeriesContent InView() const;
  /// Shows `content_` from its first to its last time.
  void Build();
  /// Makes the charts that are in sight; the times that they show stay.
  void BuildPanels();
  void ShowMarkers();
  /// Of the charts of the content, those that have room in the height that the chart has.
  int PanelsInSight() const;
  int HeightOf(int panels) const;
  /// Those in sight begin with this one of the content, or the last one from which on all are in sight.
  void ScrollTo(int panel);
  bool HasBars() const { return !content_.IsEmpty() && !content_.numbers && !content_.bars.empty(); }
  /// The values that an axis shows where the user has not chosen others.
  void FitValues(QCPAxis& axis);
  /// Shows what the user has laid over the chart; the time that he looks at stays.
  void ShowChosen();
  /// One of the charts below each other, in one of the places in sight.
  void BuildPanel(int panel, int place);
  /// The strip above the charts, with the bars.
  void AddTitle(QCPAxisRect& rect, const std::string& text);
  void BuildStrip();
  /// The simulated time and the line at the pointer.
  void AddPeriodAndPointer(QCPAxis& keys, QCPAxis& values);
  QCPItemRect* AddSpan(QCPAxis& keys, QCPAxis& values, const CYbDateTime& from, const CYbDateTime& to);
  /// Marks the parts of the simulation that the series of a chart do not cover, and their gaps.
  void MarkMissing(int panel, int place);
  void AddCurve(const Series& series, QCPAxis* keys, QCPAxis* values);
  void ApplyTheme();
  /// As many columns of names and ticks as there is room for.
  void Arrange();
  void PointAt(const QMouseEvent* event);
  /// Tells the values at a place of the axis, or none.
  void ShowPointer(std::optional<double> place);
  /// Moves the reading mark to the next value of the first curve or, with -1, to the one before.
  void MoveMark(int by);
  bool Press(const QKeyEvent& event);
  QImage Picture(double pixelRatio);

  SeriesContent given_, content_;  ///< As the page tells it, and as it is shown.
  SeriesView view_ = SeriesView::AsGiven;
  QActionGroup* views_;
  SeriesChooser* chooser_;
  std::function<SeriesContent()> source_;  ///< Which is asked again when the user has chosen further series.
  bool isShown_ = false;
  QCustomPlot* chart_;
  QScrollBar* scroll_;
  QLabel* message_;
  std::vector<Curve> curves_;
  ChartPanels* panels_ = nullptr;
  ChartMarkers* markers_ = nullptr;
  TimeBarPlottable* bars_ = nullptr;   ///< Null without bars.
  std::vector<QCPItemRect*> periods_;  ///< Of each chart.
  std::vector<QCPItemRect*> hatches_;  ///< Where there are no data.
  std::vector<QCPItemStraightLine*> pointers_;
  std::optional<double> mark_;  ///< Where the keyboard points at.
  std::vector<QCPItemText*> titles_;
  int panelCount_ = 1;                               ///< Of the content.
  int firstPanel_ = 0, panelsInSight_ = 1;           ///< Those that are made.
  std::optional<std::pair<double, double>> places_;  ///< From the first to the last place of all series.
};

}  // namespace tervane
