// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/editors/time_player.h"

#include <QComboBox>
#include <QHBoxLayout>
#include <QKeyEvent>
#include <QLabel>
#include <QSignalBlocker>
#include <QSlider>
#include <QToolButton>
#include <algorithm>
#include <utility>

#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr int kSpeeds[] = {1, 2, 5, 10, 20, 60};
constexpr int kUsualSpeed = 5;
constexpr int kNarrowestSlider = 80;  ///< In pixels at zoom 1.

QToolButton* PlayerButton(const QString& tip) {
  auto* made = new QToolButton;
  made->setAutoRaise(true);
  made->setToolTip(tip);
  made->setAccessibleName(tip);
  return made;
}

}  // namespace

TimePlayer::TimePlayer() {
  earlier_ = PlayerButton(tr("The step before"));
  later_ = PlayerButton(tr("The next step"));
  for (QToolButton* button : {earlier_, later_}) button->setAutoRepeat(true);
  play_ = PlayerButton({});
  loop_ = PlayerButton(tr("Go on with the first step after the last one"));
  loop_->setCheckable(true);
  slider_ = new QSlider(Qt::Horizontal);
  slider_->setAccessibleName(tr("Time step"));
  slider_->setFocusPolicy(Qt::StrongFocus);
  slider_->setToolTip(tr("Time step"));
  speed_ = new QComboBox;
  speed_->setAccessibleName(tr("Speed"));
  speed_->setToolTip(tr("How many steps are shown in a second"));
  for (const int speed : kSpeeds) speed_->addItem(tr("%1 / s").arg(speed), speed);
  step_ = new QLabel;

  auto* line = new QHBoxLayout(this);
  line->setContentsMargins(0, 0, 0, 0);
  for (QWidget* part : std::initializer_list<QWidget*>{earlier_, play_, later_}) line->addWidget(part);
  line->addWidget(slider_, 1);
  line->addWidget(step_);
  line->addWidget(loop_);
  line->addWidget(speed_);

  connect(slider_, &QSlider::valueChanged, this, [this](int step) {
    Sync();
    emit StepChosen(step);
  });
  connect(earlier_, &QToolButton::clicked, this, [this] { slider_->setValue(slider_->value() - 1); });
  connect(later_, &QToolButton::clicked, this, [this] { slider_->setValue(slider_->value() + 1); });
  connect(play_, &QToolButton::clicked, this, &TimePlayer::PlayOrPause);
  connect(speed_, &QComboBox::activated, this, [this] { SetSpeed(speed_->currentData().toInt()); });
  connect(&clock_, &QTimer::timeout, this, &TimePlayer::Tick);
  connect(&Theme::Get(), &Theme::Changed, this, &TimePlayer::FollowTheme);
  clock_.setTimerType(Qt::PreciseTimer);
  SetSpeed(kUsualSpeed);
  FollowTheme();
}

void TimePlayer::SetSteps(int steps, std::function<QString(int step)> text) {
  text_ = std::move(text);
  {
    const QSignalBlocker blocker(slider_);
    slider_->setRange(0, std::max(steps, 1) - 1);
  }
  FollowTheme();
  if (steps < 2) Pause();
  Sync();
}

void TimePlayer::SetStep(int step) {
  {
    const QSignalBlocker blocker(slider_);
    slider_->setValue(step);
  }
  Sync();
}

int TimePlayer::Step() const { return slider_->value(); }

void TimePlayer::Play() {
  // From its end a file is played once more.
  if (Step() == slider_->maximum() && !loop_->isChecked()) slider_->setValue(0);
  clock_.start();
  FollowTheme();
}

void TimePlayer::Pause() {
  if (!IsPlaying()) return;
  clock_.stop();
  FollowTheme();
  emit Paused();
}

void TimePlayer::SetSpeed(int steps) {
  clock_.setInterval(1000 / std::max(steps, 1));
  speed_->setCurrentIndex(speed_->findData(steps));
}

void TimePlayer::SetLooping(bool isLooping) { loop_->setChecked(isLooping); }

void TimePlayer::Tick() {
  const int last = slider_->maximum();
  if (Step() == last && !loop_->isChecked()) return Pause();
  const int next = Step() == last ? 0 : Step() + 1;
  if (isReady_ && !isReady_(next)) return;
  slider_->setValue(next);
}

void TimePlayer::Sync() {
  const int step = Step(), steps = slider_->maximum() + 1;
  earlier_->setEnabled(step > 0);
  later_->setEnabled(step + 1 < steps);
  step_->setText(tr("%1  (%2 of %3)").arg(text_ ? text_(step) : QString()).arg(step + 1).arg(steps));
}

void TimePlayer::FollowTheme() {
  const Theme& theme = Theme::Get();
  earlier_->setIcon(theme.Icon("back"));
  later_->setIcon(theme.Icon("forward"));
  play_->setIcon(theme.Icon(IsPlaying() ? "pause" : "play"));
  loop_->setIcon(theme.Icon("loop"));
  const QString tip = IsPlaying() ? tr("Pause (Space)") : tr("Play all steps (Space)");
  play_->setToolTip(tip);
  play_->setAccessibleName(tip);
  const QSize size(theme.Scaled(16), theme.Scaled(16));
  for (QToolButton* button : {earlier_, later_, play_, loop_}) button->setIconSize(size);
  slider_->setMinimumWidth(theme.Scaled(kNarrowestSlider));
  // What the slider tells must not move it.
  const QString number = QString(QString::number(slider_->maximum() + 1).size(), '0');
  step_->setMinimumWidth(
      step_->fontMetrics().horizontalAdvance(tr("%1  (%2 of %3)").arg("0000-00-00 00:00", number, number)));
}

void TimePlayer::keyPressEvent(QKeyEvent* event) {
  if (event->key() == Qt::Key_Space) return PlayOrPause();
  QWidget::keyPressEvent(event);
}

}  // namespace tervane
