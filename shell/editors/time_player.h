// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QTimer>
#include <QWidget>
#include <functional>

class QComboBox;
class QLabel;
class QSlider;
class QToolButton;

namespace tervane {

/// A slider over the steps of a file that can be played. Space plays and pauses, the arrows go by a step, Home and End
/// to the first and the last.
class TimePlayer : public QWidget {
  Q_OBJECT

 public:
  TimePlayer();

  /// Other steps than before; `text` tells the time of one.
  void SetSteps(int steps, std::function<QString(int step)> text);
  /// Shows a step without telling it.
  void SetStep(int step);
  int Step() const;
  /// Playing waits for a step for which this does not hold.
  void WaitFor(std::function<bool(int step)> isReady) { isReady_ = std::move(isReady); }

  void Play();
  void Pause();
  void PlayOrPause() { IsPlaying() ? Pause() : Play(); }
  bool IsPlaying() const { return clock_.isActive(); }
  /// Steps in a second.
  void SetSpeed(int steps);
  /// After the last step it goes on with the first.
  void SetLooping(bool isLooping);

 signals:
  void StepChosen(int step);
  void Paused();

 protected:
  void keyPressEvent(QKeyEvent* event) override;

 private:
  void Tick();
  void Sync();
  void FollowTheme();

  std::function<QString(int step)> text_;
  std::function<bool(int step)> isReady_;
  QSlider* slider_;
  QToolButton *earlier_, *later_, *play_, *loop_;
  QComboBox* speed_;
  QLabel* step_;
  QTimer clock_;
};

}  // namespace tervane
