// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QDialog>
#include <functional>
#include <string>

#include "forms/page.h"

namespace tervane {

class PageView;

/// A form with OK and Cancel.
class FormDialog : public QDialog {
  Q_OBJECT

 public:
  /// `accept` is asked at OK and gives why the form must stay; a blank for a reason that the user knows.
  FormDialog(const QString& title, CYbSEDlgBase& form, std::function<std::string()> accept, QWidget* parent);

 private:
  void TryAccept();

  CYbSEDlgBase& form_;
  std::function<std::string()> accept_;
  PageView* view_;
};

}  // namespace tervane
