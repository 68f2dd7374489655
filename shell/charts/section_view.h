// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <optional>
#include <vector>

#include "forms/section_profile.h"
#include "platform/units.h"
#include "shell/widgets/plot_frame.h"

class QComboBox;
class QCPGraph;
class QCPItemLine;
class QCPItemText;
class QCPItemStraightLine;
class QCustomPlot;
class QLabel;
class QMouseEvent;

namespace tervane {

class BandPlottable;
class ReliefWindow;

/// A cut through the ground: named layers as bands over the distance along a line of a map, with the ground on top.
///
/// The wheel zooms along the line, drag moves, a double click or Home shows everything; Ctrl and arrows move a
/// mark along it, at which all layers are told. Heights are exaggerated so that
/// they fill the view, or by a number that the user chooses.
class SectionView : public PlotFrame {
  Q_OBJECT

 public:
  explicit SectionView(Host& host, QWidget* parent = nullptr);
  ~SectionView() override;

  /// Shows what there is to show, in the user's units (null for base units); draws anew only where something differs.
  void Show(SectionContent content, const DisplayUnits* units);
  void ShowWhenThere(const std::function<SectionContent()>& content, const DisplayUnits* units);
  QCustomPlot& Chart() const { return *chart_; }
  QWidget* FocusTarget() const;
  /// What the user reads at a distance and a height, in metres: the ground there, and the layer that he points at.
  QString TextAt(double distance, double height) const;
  /// All layers at a distance, a line for each, from top to bottom.
  QString LayersAt(double distance) const;
  /// How many times heights are drawn larger than distances now.
  double Exaggeration() const;
  /// Fixes the exaggeration; nothing to let heights fill the view.
  void SetExaggeration(std::optional<double> times);
  void Fit();
  void Zoom(double factor);
  /// Shows the whole ground from the side, in a window of its own.
  ReliefWindow* OpenRelief();

 protected:
  bool eventFilter(QObject* watched, QEvent* event) override;

 private:
  /// The nearest sample; nothing beside the section.
  std::optional<std::size_t> SampleAt(double distance) const;
  QString HeightText(double height) const;
  struct Units;  ///< How the user sees lengths.

  void Build();
  /// A line over the distance, in the user's units; gaps where there is no value.
  QCPGraph* AddLine(const QString& name, const std::vector<double>& heights);
  BandPlottable* AddBand(const std::string& name, const std::vector<double>& top, const std::vector<double>& bottom);
  void AddMarks();
  void AddScreens();
  /// The profile as a table: distance, place, ground and the bottoms of all layers.
  QString Values() const;
  void ApplyTheme();
  void Arrange();
  void FitHeights();
  void ShowExaggeration();
  void PointAt(const QMouseEvent* event);
  void ShowPointer(std::optional<double> distance);
  /// Moves the reading mark to the next sample or, with -1, to the one before.
  void MoveMark(int by);
  bool Press(const QKeyEvent& event);

  SectionContent content_;
  DisplayUnits displayUnits_;
  SectionProfile profile_;
  std::unique_ptr<Units> units_;
  bool isShown_ = false;
  std::optional<double> exaggeration_;
  QCustomPlot* chart_;
  QLabel* message_;
  QComboBox* choice_;
  std::vector<BandPlottable*> bands_;
  std::vector<BandPlottable*> lenses_;
  std::vector<QCPGraph*> curves_;
  std::vector<QCPItemLine*> screens_;
  std::vector<QCPItemText*> screenNames_;
  QCPGraph *ground_ = nullptr, *crossing_ = nullptr, *thin_ = nullptr;
  QCPItemStraightLine* pointer_ = nullptr;
  std::optional<double> mark_;  ///< Where the keyboard points at, in metres.
};

}  // namespace tervane
