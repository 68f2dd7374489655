// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QWidget>
#include <memory>

#include "pages/search.h"

class QLabel;
class QLineEdit;
class QStackedWidget;
class QTreeWidget;
class QTreeWidgetItem;

namespace tervane {

/// Finds nodes, labels and keys as one types; what it found takes the place of the trees until the field is empty.
class FindPanel : public QWidget {
  Q_OBJECT

 public:
  /// `trees` is what is shown while nothing is sought.
  FindPanel(CYbSEDocument& document, QWidget* trees);

  /// Puts the keyboard into the field.
  void Start();
  /// Puts the keyboard on the list of what was found; false where the trees are shown.
  bool FocusOnHits();
  /// The setup is another one now: what is sought is sought anew.
  void Forget();

 signals:
  void HitChosen(quint64 serial, const QString& control);
  void Left();

 protected:
  bool eventFilter(QObject* watched, QEvent* event) override;

 private:
  void Find();
  void Choose(QTreeWidgetItem* item);

  CYbSEDocument& document_;
  std::unique_ptr<SearchIndex> index_;  ///< Made when it is first asked.
  std::vector<SearchHit> hits_;
  QLineEdit* field_;
  QStackedWidget* stack_;
  QTreeWidget* list_;
  QLabel* count_;
};

}  // namespace tervane
