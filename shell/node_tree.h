// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QTreeWidget>
#include <cstdint>
#include <vector>

#include "core/node.h"

namespace tervane {

/// One of the trees of a document's window: the nodes that have a page there, with marks of findings.
class NodeTree : public QTreeWidget {
  Q_OBJECT

 public:
  /// `emptyText` is shown while the tree has no entry.
  NodeTree(int treeId, QString emptyText);

  /// Follows the tree of nodes; what was open stays open, what was selected stays selected.
  void Sync(CYbSEKvfGlobalBase& root, bool showMarks);
  /// Selects the node's entry without telling; true when it has one.
  bool Select(std::uint64_t serial);

 signals:
  void NodeChosen(quint64 serial);
  /// The user asks why a node takes part.
  void WhyAsked(quint64 serial);

 protected:
  void paintEvent(QPaintEvent* event) override;
  void contextMenuEvent(QContextMenuEvent* event) override;

 private:
  struct Entry {
    std::uint64_t serial;
    int depth;
    bool operator==(const Entry&) const = default;
  };

  QTreeWidgetItem* ItemOf(std::uint64_t serial) const;

  int treeId_;
  QString emptyText_;
  std::vector<Entry> entries_;
  std::vector<QTreeWidgetItem*> items_;  ///< In the order of the entries.
};

}  // namespace tervane
