// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QFrame>
#include <QString>
#include <functional>
#include <utility>
#include <vector>

class QLabel;

namespace tervane {

/// A question or a message that waits below a document without standing in the way of the work.
class Banner : public QFrame {
  Q_OBJECT

 public:
  using Answer = std::pair<QString, std::function<void()>>;
  /// A matter to be decided, or how something ended.
  enum class Tone { Question, Good, Bad };
  /// Any answer closes the banner, and so does its cross.
  Banner(const QString& text, const std::vector<Answer>& answers, Tone tone = Tone::Question);

  /// The ground on which it stands.
  static QColor Ground(Tone tone, bool isDark);

  /// What it tells is of the past, for the reason that is put behind it: it stands back.
  void Age(const QString& reason);

 private:
  QString text_;
  QLabel* label_;
};

}  // namespace tervane
