// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QObject>
#include <cstddef>
#include <deque>
#include <memory>
#include <string>
#include <vector>

#include "pages/result_view.h"
#include "shell/maps/map_rendering.h"

namespace tervane {

/// A step with its picture.
struct ReadyFrame {
  std::size_t step = 0;
  int every = 1;
  std::shared_ptr<const GridFrame> frame;  ///< Null where there is a problem.
  std::string problem;
  GridLayer layer;
  std::shared_ptr<const GridPicture> picture;
};

/// Reads the steps that a user will want next, in threads beside the window's own, and makes pictures of them: so that
/// a slider moves without waiting.
class FramesAhead : public QObject {
  Q_OBJECT

 public:
  /// Both must outlive it.
  FramesAhead(ResultView& view, const DisplayUnits& units);
  ~FramesAhead() override;

  /// Other steps than before, or in other colours.
  void Forget();
  /// This step at once, then those behind it, or before it when `direction` is below 0. Nothing is read as long as the
  /// colours are not known.
  void Want(std::size_t step, int every, int direction, std::size_t steps);
  /// Null while it is in the making.
  std::shared_ptr<const ReadyFrame> At(std::size_t step, int every) const;

 signals:
  void Came(std::size_t step);

 private:
  struct Making;

  void StartNext();
  bool IsThereOrMaking(std::size_t step) const;

  ResultView& view_;
  const DisplayUnits& units_;
  int every_ = 1;
  std::vector<std::size_t> wanted_;  ///< The most urgent first.
  std::deque<std::shared_ptr<const ReadyFrame>> ready_;
  std::vector<std::unique_ptr<Making>> making_;
};

}  // namespace tervane
