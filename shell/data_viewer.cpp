// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/data_viewer.h"

#include <QComboBox>
#include <QFileInfo>
#include <QStackedWidget>
#include <QVBoxLayout>

#include "pages/spatial/plot_content.h"
#include "platform/datafile.h"
#include "shell/map_view.h"
#include "shell/qt_text.h"
#include "shell/series_plot.h"
#include "shell/theme.h"

namespace tervane {

DataViewer::DataViewer(const std::string& path, Host& host, const DisplayUnits& units, std::string& problem,
                       QWidget* parent)
    : QDialog(parent), path_(path), units_(units) {
  setAttribute(Qt::WA_DeleteOnClose);
  setWindowTitle(QFileInfo(ToQt(path)).fileName());
  resize(Theme::Get().Scaled(760), Theme::Get().Scaled(560));
  auto* all = new QVBoxLayout(this);
  items_ = new QComboBox;
  items_->setAccessibleName(tr("Item"));
  map_ = new MapView(host);
  chart_ = new SeriesPlot(host);
  views_ = new QStackedWidget;
  views_->addWidget(map_);
  views_->addWidget(chart_);
  all->addWidget(items_);
  all->addWidget(views_, 1);

  DataFile file;
  problem = file.Open(path);
  if (!problem.empty()) return;
  for (const DataItem& item : file.Items()) {
    const QString unit = item.unitText.empty() ? QString() : QString(" [%1]").arg(ToQt(item.unitText));
    items_->addItem(ToQt(item.name) + unit, item.dimensions);
  }
  connect(items_, &QComboBox::currentIndexChanged, this, [this](int index) { ShowItem(index + 1); });
  ShowItem(1);
}

void DataViewer::ShowItem(int number) {
  const bool isSeries = items_->itemData(number - 1).toInt() == 0;
  views_->setCurrentWidget(isSeries ? static_cast<QWidget*>(chart_) : map_);
  CTvnData2DNdsFile file(nullptr);
  file.File = FileName(path_, {});
  file.Items = {number};
  if (isSeries)
    chart_->Show(FileChart(file));
  else
    map_->Show(FileMap(file), &units_);
}

}  // namespace tervane
