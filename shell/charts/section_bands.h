// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <vector>

#include <qcustomplot.h>

namespace tervane {

/// A filled band between two lines over the same positions; where one of them has no value the band has a gap. A band
/// without thickness is not drawn.
class BandPlottable : public QCPAbstractPlottable {
 public:
  BandPlottable(QCPAxis* keys, QCPAxis* values) : QCPAbstractPlottable(keys, values) {}

  void SetData(std::vector<double> positions, std::vector<double> top, std::vector<double> bottom);

  double selectTest(const QPointF& /*at*/, bool /*onlySelectable*/, QVariant* /*details*/) const override { return -1; }
  QCPRange getKeyRange(bool& isFound, QCP::SignDomain domain) const override;
  QCPRange getValueRange(bool& isFound, QCP::SignDomain domain, const QCPRange& keys) const override;

 protected:
  void draw(QCPPainter* painter) override;
  void drawLegendIcon(QCPPainter* painter, const QRectF& place) const override;

 private:
  QPointF ToScreen(double position, double value) const;

  std::vector<double> positions_, top_, bottom_;
};

}  // namespace tervane
