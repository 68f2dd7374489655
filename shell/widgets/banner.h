// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QFrame>
#include <QString>
#include <functional>
#include <utility>
#include <vector>

namespace tervane {

/// A question or a message that waits below a document without standing in the way of the work.
class Banner : public QFrame {
  Q_OBJECT

 public:
  using Answer = std::pair<QString, std::function<void()>>;
  /// Any answer closes the banner, and so does its cross.
  Banner(const QString& text, const std::vector<Answer>& answers);
};

}  // namespace tervane
