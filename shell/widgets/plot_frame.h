// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QAction>
#include <QImage>
#include <QWidget>
#include <functional>
#include <vector>

#include "core/host.h"
#include "forms/plots.h"
#include "shell/widgets/background.h"

class QHBoxLayout;
class QLabel;
class QToolButton;

namespace tervane {

class WaitPanel;

/// What stands around a map or a chart: a line that tells what is pointed at, buttons to see more or less of it, and a
/// context menu that takes its picture along.
class PlotFrame : public QWidget {
  Q_OBJECT

 public:
  /// What the buttons and the menu ask of the plot.
  struct Plot {
    QWidget* widget = nullptr;
    std::function<void(double factor)> zoom;
    std::function<void()> fit;
    std::function<QImage(double pixelRatio)> picture;
    std::function<QString()> values = {};  ///< As text, tabs between the columns; of plots that show values over time.
    QWidget* beside = nullptr;             ///< On its right: a bar to scroll what does not fit.
  };

  void SetStatus(const QString& text);
  QString Status() const;
  /// What is shown is not all there yet.
  virtual bool IsBusy() const { return background_.IsWaiting(); }
  /// Gives up what is computed for the plot.
  void StopWaiting();

 protected:
  PlotFrame(Host& host, QWidget* parent);
  void Hold(Plot plot);
  /// What a screen reader tells of the plot.
  virtual QString Description() const { return Status(); }
  Host& Outside() const { return host_; }
  /// A further control in front of the buttons.
  void AddToRow(QWidget* tool);
  /// A further command of the context menu.
  QAction* AddCommand(const QString& text, std::function<void()> command);
  void resizeEvent(QResizeEvent* event) override;
  void showEvent(QShowEvent* event) override;
  /// The content, complete if that takes but a moment. Else what it awaits is computed in threads beside this one, the
  /// user sees how far it is, and `again` is called when it is done.
  template <class Content>
  Content Follow(const std::function<Content()>& content, const std::function<void()>& again) {
    for (;;) {
      Content now = content();
      if (now.awaited.empty()) StopWaiting();
      if (now.awaited.empty() || !IsThereInAMoment(now.awaited, again)) return now;
    }
  }

 private:
  /// Asks again for what was awaited.
  void AskAgain();
  bool IsThereInAMoment(const Awaited& awaited, const std::function<void()>& again);
  void ExportPicture();
  void ExportValues();
  /// Asks for a file and writes into it.
  void ExportAs(const QString& title, const std::string& filter, const std::string& extension, const QByteArray& bytes);
  void FollowTheme();
  void ArrangeStatus();

  Host& host_;
  Plot plot_;
  Background background_;
  WaitPanel* panel_ = nullptr;
  std::function<void()> again_;
  bool isAgainDue_ = false;  ///< What was waited for came while nobody saw the plot.
  QLabel* status_;
  QHBoxLayout* row_ = nullptr;  ///< The line below the plot.
  std::vector<std::pair<QToolButton*, QString>> buttons_;
  QToolButton* more_ = nullptr;  ///< Its menu has the commands of the context menu.
};

}  // namespace tervane
