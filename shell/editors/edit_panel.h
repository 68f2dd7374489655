// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QWidget>
#include <functional>
#include <optional>

class QComboBox;
class QHBoxLayout;
class QLabel;
class QLineEdit;
class QPushButton;
class QVBoxLayout;

namespace tervane {

/// What is done to a file that is edited, beside it: groups of fields with their buttons, which are scrolled where they
/// do not fit, and below them, always in sight, what came of it.
class EditPanel : public QWidget {
  Q_OBJECT

 public:
  EditPanel();

  void Group(const QString& title);
  /// Rows of the present group.
  QLineEdit* Field(const QString& label, const QString& toolTip, const QString& text = {});
  QComboBox* Choice(const QString& label, const QString& toolTip, const QStringList& choices);
  QLabel* Text();
  /// Buttons of one row; `run` gives why nothing was done, or what is to be known, or nothing.
  using Run = std::function<QString()>;
  QPushButton* Button(const QString& text, const QString& toolTip, Run run, bool isNewRow = true);
  void End();

  /// A number that stands in a field; nothing, and it is told, where there is none.
  std::optional<double> NumberIn(const QLineEdit& field);
  void Tell(const QString& text);
  QString Told() const;

 signals:
  /// A button has done its work.
  void Done();

 private:
  QVBoxLayout *all_, *group_ = nullptr;
  QHBoxLayout* buttons_ = nullptr;
  QLabel* told_;
};

}  // namespace tervane
