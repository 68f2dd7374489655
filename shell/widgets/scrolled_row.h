// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QBoxLayout>
#include <QScrollArea>
#include <QScrollBar>

namespace tervane {

/// A row of buttons and fields that is scrolled where it is wider than its place, so that it never widens a window.
class ScrolledRow : public QScrollArea {
 public:
  ScrolledRow() : row_(new QWidget) {
    setFrameShape(QFrame::NoFrame);
    setFocusPolicy(Qt::NoFocus);
    setWidgetResizable(true);
    setVerticalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
    setSizePolicy(QSizePolicy::Preferred, QSizePolicy::Fixed);
    new QHBoxLayout(row_);
    setWidget(row_);
  }

  QHBoxLayout& Row() const { return static_cast<QHBoxLayout&>(*row_->layout()); }

  QSize sizeHint() const override {
    const int bar = width() < row_->minimumSizeHint().width() ? horizontalScrollBar()->sizeHint().height() : 0;
    return {row_->sizeHint().width(), row_->sizeHint().height() + bar};
  }
  QSize minimumSizeHint() const override { return {0, sizeHint().height()}; }

 protected:
  void resizeEvent(QResizeEvent* event) override {
    QScrollArea::resizeEvent(event);
    // The bar needs its own height.
    if (height() != sizeHint().height()) updateGeometry();
  }

 private:
  QWidget* row_;
};

}  // namespace tervane
