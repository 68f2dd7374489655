// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QWidget>
#include <memory>

#include "document/edit_session.h"

class QLabel;
class QPushButton;

namespace tervane {

class DifferenceList;

/// A setup beside another one in a tab: what differs, and what one of them has and the other has not. Values and
/// items of the other can be taken. It goes with the tab of its setup.
class CompareView : public QWidget {
  Q_OBJECT

 public:
  CompareView(EditSession& session, const QString& name, std::unique_ptr<CFlowModelDoc> other);
  ~CompareView() override;

  /// "karup.tvd and other.tvd"
  const QString& Title() const { return title_; }
  /// The file of the other setup.
  QString Path() const;

 signals:
  /// The user wants to see a place of his own setup.
  void PlaceChosen(const QString& path);

 protected:
  void showEvent(QShowEvent* event) override;

 private:
  void Sync();
  void Take();
  void Compare();

  EditSession& session_;
  std::unique_ptr<CFlowModelDoc> other_;
  QString otherName_, title_;
  QLabel *summary_, *told_;
  DifferenceList* list_;
  QPushButton *take_, *show_;
};

}  // namespace tervane
