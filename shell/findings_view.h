// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QTreeWidget>
#include <vector>

#include "pages/findings.h"

namespace tervane {

/// All that is wrong in a setup, as a list; choosing one leads to its place.
class FindingsView : public QTreeWidget {
  Q_OBJECT

 public:
  FindingsView();

  void Show(std::vector<SetupFinding> findings);
  /// The number of errors and warnings.
  int Count() const;
  /// Chooses the next or the previous one.
  void Step(int by);

 signals:
  void FindingChosen(const SetupFinding& finding);

 protected:
  void paintEvent(QPaintEvent* event) override;
  void contextMenuEvent(QContextMenuEvent* event) override;

 private:
  void Choose(QTreeWidgetItem* item);

  std::vector<SetupFinding> findings_;
};

}  // namespace tervane
