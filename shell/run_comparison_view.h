// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QString>
#include <QWidget>

#include "pages/run_comparison.h"

class QLabel;
class QTabWidget;
class QTableWidget;

namespace tervane {

/// Two runs side by side in a tab: what differs between their setups, and how well each agrees with what was observed.
class RunComparisonView : public QWidget {
  Q_OBJECT

 public:
  explicit RunComparisonView(const RunComparison& comparison);

  /// "karup.tvd, two runs"
  QString Title() const { return title_; }

 private:
  QWidget* BuildSetups(const RunComparison& comparison);
  QWidget* BuildPoints(const RunComparison& comparison);

  QString title_;
};

}  // namespace tervane
