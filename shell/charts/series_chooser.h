// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QToolButton>
#include <optional>

#include "forms/plots.h"

namespace tervane {

/// The button of a chart whose list has the series that may be laid over those it shows.
class SeriesChooser : public QToolButton {
  Q_OBJECT

 public:
  explicit SeriesChooser(Host& host);

  /// Without a choice the button is hidden.
  void SetChoice(std::optional<SeriesChoice> choice);

 signals:
  /// Other series are chosen than before.
  void Changed();

 private:
  void Open();
  void AddFile();

  Host& host_;
  std::optional<SeriesChoice> choice_;
};

}  // namespace tervane
