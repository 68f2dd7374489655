// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QFutureWatcher>
#include <QObject>
#include <QString>
#include <memory>
#include <vector>

#include "forms/plots.h"

namespace tervane {

/// Waits for computations that run in threads beside the window's own. A computation that several wait for runs once;
/// it is cancelled when nobody waits for it any more.
class Background : public QObject {
  Q_OBJECT

 public:
  explicit Background(QObject* parent = nullptr);
  ~Background() override;

  /// Waits for these and for nothing else from now on. What the user has cancelled stays so until it is started again
  /// or something else is waited for. True when it is something else than before.
  bool Await(const Awaited& computations);
  void StopWaiting() { Await({}); }
  bool IsWaiting() const { return !runs_.empty(); }
  bool IsCancelled() const { return isCancelled_; }
  /// All that is waited for is done; waits up to that time for it.
  bool IsDoneWithin(int milliseconds) const;
  /// From 0 to 1, over all.
  double Done() const;
  /// Of what is not done yet.
  QString Title() const;

  void Cancel();
  void StartAgain();

 signals:
  /// All is done, or was cancelled by somebody else.
  void Ended();

 private:
  struct Run;  ///< A computation in its thread.
  struct Wait;

  void Start();

  Awaited awaited_;
  std::vector<std::unique_ptr<Wait>> runs_;
  bool isCancelled_ = false;
};

}  // namespace tervane
