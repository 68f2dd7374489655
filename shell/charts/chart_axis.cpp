// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/charts/chart_axis.h"

#include <QDateTime>
#include <cmath>
#include <utility>

#include <qcustomplot.h>

#include "shell/widgets/qt_text.h"

namespace tervane {

namespace {

constexpr double kDay = 86400;

QDateTime AsDate(double seconds) {
  return QDateTime::fromMSecsSinceEpoch(static_cast<qint64>(std::llround(seconds * 1000)), Qt::UTC);
}

/// Ticks at whole hours, days, months and years, each labelled as finely as it stands.
class DateTicker : public QCPAxisTickerDateTime {
 public:
  DateTicker() { setDateTimeSpec(Qt::UTC); }

 protected:
  double getTickStep(const QCPRange& range) override {
    isFirst_ = std::floor(range.lower / kDay) == std::floor(range.upper / kDay);
    return step_ = QCPAxisTickerDateTime::getTickStep(range);
  }
  QString getTickLabel(double tick, const QLocale& /*locale*/, QChar /*formatChar*/, int /*precision*/) override {
    const QDateTime date = AsDate(tick);
    if (step_ > 360 * kDay) return date.toString("yyyy");
    if (step_ > 27 * kDay) return date.toString("yyyy/MM");
    if (step_ > 0.99 * kDay) return date.toString("yyyy/MM/dd");
    const QString time = date.toString(step_ > 59 ? "HH:mm" : "HH:mm:ss");
    // The day is told where it begins, and once where no day begins.
    const bool isFirst = std::exchange(isFirst_, false);
    return date.time() == QTime(0, 0) || isFirst ? time + "\n" + date.toString("yyyy/MM/dd") : time;
  }

 private:
  double step_ = kDay;
  bool isFirst_ = false;
};

/// Powers of ten. Where ticks are several decades apart, small ones mark the decades between them.
class PowerTicker : public QCPAxisTickerLog {
 protected:
  QVector<double> createSubTickVector(int count, const QVector<double>& ticks) override {
    constexpr double kMoreThanADecade = 11;
    if (ticks.size() < 2 || ticks[1] < kMoreThanADecade * ticks[0])
      return QCPAxisTickerLog::createSubTickVector(count, ticks);
    QVector<double> decades;
    for (qsizetype i = 0; i + 1 < ticks.size(); ++i)
      for (double at = ticks[i] * 10; at < ticks[i + 1] * 0.9; at *= 10) decades.push_back(at);
    return decades;
  }
};

void SetUpNumbers(QCPAxis& axis, bool isLogarithmic) {
  axis.setNumberFormat("gb");
  if (isLogarithmic) {
    // Powers of ten, written out while they are short.
    constexpr int kDigitsOfPower = 5;
    axis.setScaleType(QCPAxis::stLogarithmic);
    axis.setTicker(QSharedPointer<PowerTicker>::create());
    axis.setNumberPrecision(kDigitsOfPower);
  } else {
    axis.setScaleType(QCPAxis::stLinear);
    axis.setTicker(QSharedPointer<QCPAxisTicker>::create());
    constexpr int kDigits = 6;
    axis.setNumberPrecision(kDigits);
  }
}

}  // namespace

void SetUpAxis(QCPAxis& axis, const std::optional<NumberAxis>& numbers) {
  if (numbers) return SetUpNumbers(axis, numbers->isLogarithmic);
  axis.setScaleType(QCPAxis::stLinear);
  axis.setTicker(QSharedPointer<DateTicker>::create());
}

void SetUpValueAxis(QCPAxis& axis, bool isLogarithmic) { SetUpNumbers(axis, isLogarithmic); }

QCPRange WithRoom(const QCPAxis& axis, double below, double above) {
  const QCPRange range = axis.range();
  if (axis.scaleType() == QCPAxis::stLogarithmic) {
    const double size = range.upper > range.lower ? range.upper / range.lower : 10;
    return {range.lower * std::pow(size, -below), range.upper * std::pow(size, above)};
  }
  const double size = range.size() > 0 ? range.size() : 1;
  return {range.lower - below * size, range.upper + above * size};
}

void MoveAxis(QCPAxis& axis, double part) {
  const QCPRange range = axis.range();
  axis.moveRange(axis.scaleType() == QCPAxis::stLogarithmic ? std::pow(range.upper / range.lower, part)
                                                            : part * range.size());
}

QString AxisTitle(const std::optional<NumberAxis>& numbers) {
  if (!numbers) return {};
  const QString title = Translated(numbers->title);
  return numbers->unit.empty() ? title : QString("%1 [%2]").arg(title, ToQt(numbers->unit));
}

QString PlaceText(double place, const std::optional<NumberAxis>& numbers) {
  if (!numbers) return AsDate(place).toString("yyyy/MM/dd HH:mm");
  const QString number = Translated(numbers->title) + " " + ToQt(FormatNumber(place, "%.6g"));
  return numbers->unit.empty() ? number : number + " " + ToQt(numbers->unit);
}

double AxisCoordinate(const CYbDateTime& time) { return static_cast<double>(time.SecondsSinceEpoch()); }

CYbDateTime DateAt(double place, double perPixel) {
  double step = 60;
  for (const double coarser : {3600.0, kDay})
    if (perPixel > coarser / 12) step = coarser;
  return CYbDateTime::FromSecondsSinceEpoch(static_cast<std::int64_t>(std::round(place / step) * step));
}

}  // namespace tervane
