// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <vector>

#include <qcustomplot.h>

namespace tervane {

/// A curve that may have many values in each pixel: then it is drawn as one upright line for each column of pixels,
/// from the least to the greatest value that the curve takes there, and filled down to zero where it has a brush.
///
/// A value that is not a number is a gap. A value between two gaps is a dot, unless values have symbols of their own.
class DenseGraph : public QCPGraph {
 public:
  using QCPGraph::QCPGraph;

 protected:
  void draw(QCPPainter* painter) override;

 private:
  /// What the curve takes of a column of pixels; nothing while `least` is above `most`.
  struct Column {
    double least, most;
  };
  using Iterator = QCPGraphDataContainer::const_iterator;

  std::vector<Column> ColumnsOf(Iterator begin, Iterator end) const;
  void DrawColumns(QCPPainter* painter, const std::vector<Column>& columns) const;
  void DrawLonePoints(QCPPainter* painter, Iterator begin, Iterator end) const;
};

}  // namespace tervane
