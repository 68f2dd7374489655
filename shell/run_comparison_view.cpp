// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/run_comparison_view.h"

#include <QHeaderView>
#include <QLabel>
#include <QTabWidget>
#include <QTableWidget>
#include <QVBoxLayout>
#include <utility>

#include "platform/text.h"
#include "shell/difference_list.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

using Figure = std::optional<double> RunStatistics::*;
constexpr std::pair<const char*, Figure> kFigures[] = {{"ME", &RunStatistics::meanError},
                                                       {"RMSE", &RunStatistics::rootMeanSquareError},
                                                       {"R2", &RunStatistics::nashSutcliffe}};

QString FigureText(const std::optional<double>& value) {
  return value ? ToQt(FormatNumber(*value, "%.4g")) : QString();
}

std::optional<double> FigureOf(const std::optional<RunStatistics>& run, Figure figure) {
  return run ? (*run).*figure : std::nullopt;
}

/// A text above a list, where there is something to say.
QWidget* WithText(const QString& text, QWidget* list) {
  auto* all = new QWidget;
  auto* column = new QVBoxLayout(all);
  auto* label = new QLabel(text);
  label->setWordWrap(true);
  label->setTextFormat(Qt::PlainText);
  label->setTextInteractionFlags(Qt::TextSelectableByMouse);
  column->addWidget(label);
  column->addWidget(list, 1);
  return all;
}

}  // namespace

RunComparisonView::RunComparisonView(const RunComparison& comparison)
    : title_(tr("%1, two runs").arg(ToQt(comparison.firstTitle).section(',', 0, 0))) {
  auto* column = new QVBoxLayout(this);
  auto* runs =
      new QLabel(tr("First run: %1\nSecond run: %2").arg(ToQt(comparison.firstTitle), ToQt(comparison.secondTitle)));
  runs->setTextFormat(Qt::PlainText);
  runs->setTextInteractionFlags(Qt::TextSelectableByMouse);
  column->addWidget(runs);
  auto* tabs = new QTabWidget;
  tabs->setDocumentMode(true);
  tabs->addTab(BuildPoints(comparison), tr("Statistics"));
  tabs->addTab(BuildSetups(comparison), tr("Setups (%1)").arg(comparison.differences.size()));
  column->addWidget(tabs, 1);
}

QWidget* RunComparisonView::BuildSetups(const RunComparison& comparison) {
  auto* list = new DifferenceList(tr("First run"), tr("Second run"));
  list->Show(comparison.differences);
  const auto count = comparison.differences.size();
  return WithText(!comparison.setupProblem.empty() ? Translated(comparison.setupProblem)
                  : count == 0                     ? tr("Both setups hold the same.")
                                                   : tr("Places that differ: %1").arg(count),
                  list);
}

QWidget* RunComparisonView::BuildPoints(const RunComparison& comparison) {
  constexpr int kFirstFigure = 4;
  QStringList heads{tr("Point"), tr("Data type"), tr("Layer"), tr("Unit")};
  for (const auto& [name, figure] : kFigures)
    heads << tr("%1, first").arg(name) << tr("%1, second").arg(name) << tr("Difference");
  auto* table = new QTableWidget(static_cast<int>(comparison.points.size()), static_cast<int>(heads.size()));
  table->setAccessibleName(tr("Statistics"));
  table->setHorizontalHeaderLabels(heads);
  table->setEditTriggers(QAbstractItemView::NoEditTriggers);
  table->setAlternatingRowColors(true);
  table->verticalHeader()->hide();
  const auto put = [table](int row, int column, const QString& text) {
    auto* item = new QTableWidgetItem(text);
    if (column >= kFirstFigure) item->setTextAlignment(Qt::AlignRight | Qt::AlignVCenter);
    table->setItem(row, column, item);
  };
  for (int row = 0; row < table->rowCount(); ++row) {
    const ComparedPoint& point = comparison.points[static_cast<std::size_t>(row)];
    put(row, 0, ToQt(point.name));
    put(row, 1, ToQt(point.dataType));
    put(row, 2, point.layer > 0 ? QString::number(point.layer) : QString());
    put(row, 3, ToQt(point.unit));
    int column = kFirstFigure;
    for (const auto& [name, figure] : kFigures) {
      put(row, column++, FigureText(FigureOf(point.first, figure)));
      put(row, column++, FigureText(FigureOf(point.second, figure)));
      put(row, column++, FigureText(point.Difference(figure)));
    }
  }
  table->resizeColumnsToContents();
  QString text = Translated(comparison.pointsProblem);
  if (!comparison.points.empty())
    text += (text.isEmpty() ? "" : "\n") +
            tr("From %1 to %2, which both runs simulate. ME is observed minus simulated; R2 is the efficiency of Nash "
               "and Sutcliffe. Differences are the second run minus the first.")
                .arg(ToQt(comparison.period.start.Format("%Y-%m-%d %H:%M")),
                     ToQt(comparison.period.end.Format("%Y-%m-%d %H:%M")));
  return WithText(text, table);
}

}  // namespace tervane
