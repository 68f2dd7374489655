// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QDialog>
#include <vector>

#include "pages/why.h"

class QTreeWidget;

namespace tervane {

/// Explanations with their reasons, each of which leads to the control that decides it.
class WhyDialog : public QDialog {
  Q_OBJECT

 public:
  /// `yes` and `no` are said behind the subject: "takes part", "takes no part".
  WhyDialog(const QString& title, const std::vector<Explanation>& explanations, const QString& yes, const QString& no,
            QWidget* parent);

 signals:
  /// The user wants to see the control; the key may be empty.
  void Chosen(quint64 serial, const QString& key);

 private:
  void Choose();

  QTreeWidget* list_;
};

}  // namespace tervane
