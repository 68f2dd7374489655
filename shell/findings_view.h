// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QTreeWidget>
#include <unordered_map>
#include <vector>

#include "pages/findings.h"
#include "pages/place_names.h"

class QMenu;

namespace tervane {

class CFlowModelDoc;

/// All that is wrong in a setup, as a list; choosing one leads to its place. Findings of one cause are one line with
/// their number, which opens.
class FindingsView : public QTreeWidget {
  Q_OBJECT

 public:
  explicit FindingsView(CFlowModelDoc& document);

  void Show(std::vector<SetupFinding> findings);
  /// The number of errors and warnings that hold now.
  int Count() const;
  /// Chooses the next or the previous line.
  void Step(int by);
  /// The commands of a line, with what mends its findings.
  void FillMenu(QMenu& menu, QTreeWidgetItem* item);

 signals:
  void FindingChosen(const SetupFinding& finding);
  /// What the node of that serial offers is to be done.
  void MendChosen(quint64 serial, const Mend& mend);
  /// The kind of fix of that name is to be tried for these findings; for all that it is for where there are none.
  void FixChosen(const QString& kind, const std::vector<SetupFinding>& findings);

 protected:
  void paintEvent(QPaintEvent* event) override;
  void contextMenuEvent(QContextMenuEvent* event) override;

 private:
  using Nodes = std::unordered_map<std::uint64_t, CYbSEKvfBase*>;

  void Choose(QTreeWidgetItem* item);
  /// What a line stands for; of a group the first. Null for no line.
  const SetupFinding* FindingOfLine(QTreeWidgetItem* item) const;
  QTreeWidgetItem* NewLine(const SetupFinding& finding, const QString& place, const QString& text) const;
  /// Makes the lines of a group when it is first opened.
  void Fill(QTreeWidgetItem* item);
  Nodes NodesOfFindings() const;
  /// The fixes for the findings of a line whose first one stands at the node.
  void AddFixes(QMenu& menu, CYbSEKvfBase& node, const std::vector<SetupFinding>& findings);

  CFlowModelDoc& document_;
  std::vector<SetupFinding> findings_;
  std::vector<FindingGroup> groups_;  ///< One for each line that stands at the left.
};

}  // namespace tervane
