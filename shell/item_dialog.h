// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QDialog>

#include "core/host.h"

class QLabel;
class QPushButton;
class QTreeWidget;

namespace tervane {

/// What a file holds, to choose one of; what cannot be chosen says why.
class ItemDialog : public QDialog {
  Q_OBJECT

 public:
  ItemDialog(const Host::ItemQuestion& question, QWidget* parent);
  int Chosen() const;

 private:
  void Sync();

  Host::ItemQuestion question_;
  QTreeWidget* list_;
  QLabel* refusal_;
  QPushButton* ok_;
};

}  // namespace tervane
