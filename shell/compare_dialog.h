// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QDialog>
#include <memory>

#include "document/edit_session.h"

class QLabel;
class QPushButton;

namespace tervane {

class DifferenceList;

/// A setup beside another one, of which values can be taken.
class CompareDialog : public QDialog {
  Q_OBJECT

 public:
  CompareDialog(EditSession& session, const QString& name, std::unique_ptr<CFlowModelDoc> other, QWidget* parent);
  ~CompareDialog() override;

 signals:
  /// The user wants to see a place of his own setup.
  void PlaceChosen(const QString& path);

 private:
  void Sync();
  void Take();
  void Compare();

  EditSession& session_;
  std::unique_ptr<CFlowModelDoc> other_;
  QString otherName_;
  QLabel *summary_, *told_;
  DifferenceList* list_;
  QPushButton *take_, *show_;
};

}  // namespace tervane
