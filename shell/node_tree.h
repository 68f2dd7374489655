// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QStringList>
#include <QTreeWidget>
#include <cstdint>
#include <map>
#include <set>
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
  /// Marks the entries of these nodes, each with its number of review notes.
  void ShowNotes(const std::map<std::uint64_t, int>& counts);
  /// Selects the node's entry without telling; true when it has one.
  bool Select(std::uint64_t serial);
  /// Of the entries that stand in this tree alone: whether there is one, whether one is selected.
  bool HasOwn() const;
  bool IsAtOwn() const;
  /// Chooses the one that was selected last and is still there, else the first one; where there is none, the first of
  /// all.
  void ChooseLatest();
  /// The branches that the user has opened and closed, to be given to `RestoreBranches` of a later tree of the setup.
  QStringList Branches() const;
  void RestoreBranches(const QStringList& branches);

 signals:
  void NodeChosen(quint64 serial);
  /// The Tab key leads on.
  void TabbedOn();
  /// The user wants to note something at a node.
  void NoteWanted(quint64 serial);
  /// The user asks why a node takes part.
  void WhyAsked(quint64 serial);

 protected:
  void paintEvent(QPaintEvent* event) override;
  void contextMenuEvent(QContextMenuEvent* event) override;
  bool focusNextPrevChild(bool next) override;

 private:
  struct Entry {
    std::uint64_t serial;
    int depth;
    bool operator==(const Entry&) const = default;
  };

  QTreeWidgetItem* ItemOf(std::uint64_t serial) const;
  void Keep(const QTreeWidgetItem& item);
  static bool BeginsClosed(const QTreeWidgetItem& item);
  /// Shows the mark of an entry; of a closed one also what it hides.
  void ShowMark(QTreeWidgetItem* item) const;

  int treeId_;
  QString emptyText_;
  std::vector<Entry> entries_;
  std::vector<QTreeWidgetItem*> items_;  ///< In the order of the entries.
  QString latest_;                       ///< The path of the own entry that was selected last.
  std::set<QString> toggled_;            ///< Paths of branches that were opened or closed in an earlier session.
};

}  // namespace tervane
