// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/editors/data_viewer.h"

#include <QApplication>
#include <QComboBox>
#include <QFileInfo>
#include <QHBoxLayout>
#include <QLabel>
#include <QLineEdit>
#include <QListWidget>
#include <QSignalBlocker>
#include <QSlider>
#include <QSplitter>
#include <QStackedWidget>
#include <QToolButton>
#include <QVBoxLayout>

#include "shell/charts/series_plot.h"
#include "shell/editors/data_table.h"
#include "shell/maps/map_view.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/row_delegate.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr int kListWidth = 230, kPlotHeight = 430, kTableHeight = 260;
constexpr int kDateWidth = 150;
constexpr int kDiskInterval = 2000;  ///< Milliseconds between looks at the file on disk.

}  // namespace

DataViewer::DataViewer(const std::string& path, Host& host, const DisplayUnits& units)
    : file_(path, &units), further_([] { return std::vector<SeriesOffer>(); }), units_(units), shownUnits_(units) {
  map_ = new MapView(host);
  chart_ = new SeriesPlot(host);
  table_ = new DataTable(file_);
  whole_ = new QStackedWidget;
  whole_->addWidget(BuildBody());
  problem_ = new QLabel;
  problem_->setAlignment(Qt::AlignCenter);
  problem_->setWordWrap(true);
  problem_->setTextFormat(Qt::PlainText);
  problem_->setTextInteractionFlags(Qt::TextSelectableByMouse);
  whole_->addWidget(problem_);
  auto* all = new QVBoxLayout(this);
  all->setContentsMargins(0, 0, 0, 0);
  all->addWidget(whole_);

  connect(items_, &QListWidget::itemSelectionChanged, this, [this] {
    std::vector<int> numbers;
    // The one that was chosen last comes first, so that it decides what is shown.
    if (items_->currentItem() && items_->currentItem()->isSelected()) numbers.push_back(items_->currentRow() + 1);
    for (int row = 0; row < items_->count(); ++row)
      if (row != items_->currentRow() && items_->item(row)->isSelected()) numbers.push_back(row + 1);
    file_.Choose(std::move(numbers));
    ShowItem();
  });
  connect(steps_, &QSlider::valueChanged, this, [this](int step) {
    file_.ChooseSlice({static_cast<std::size_t>(step), file_.Slice().layer});
    ShowSlice();
  });
  connect(earlier_, &QToolButton::clicked, this, [this] { steps_->setValue(steps_->value() - 1); });
  connect(later_, &QToolButton::clicked, this, [this] { steps_->setValue(steps_->value() + 1); });
  connect(layers_, &QComboBox::activated, this, [this](int index) {
    // The list goes from the top, as layers lie; the file counts from the bottom.
    file_.ChooseSlice({file_.Slice().step, file_.Layers() - 1 - index});
    ShowSlice();
  });
  connect(date_, &QLineEdit::returnPressed, this, &DataViewer::GoToDate);
  connect(table_, &DataTable::Told, this, &DataViewer::ShowNotes);
  connect(&disk_, &QTimer::timeout, this, [this] { Reload(false); });
  connect(&Theme::Get(), &Theme::Changed, this, &DataViewer::FollowTheme);
  disk_.start(kDiskInterval);
  FollowTheme();
  Reload(true);
}

DataViewer::~DataViewer() {
  // What shows the file goes before the file does.
  delete whole_;
}

void DataViewer::PutOverMaps(std::function<void(MapContent& map)> put) {
  file_.PutOverMaps(std::move(put));
  if (Problem().empty()) ShowSlice();
}

QString DataViewer::Title() const { return QFileInfo(ToQt(Path())).fileName(); }

QWidget* DataViewer::BuildChoices() {
  auto* row = new QWidget;
  auto* line = new QHBoxLayout(row);
  line->setContentsMargins(0, 0, 0, 0);
  layerLabel_ = new QLabel(tr("Layer:"));
  layers_ = new QComboBox;
  layers_->setAccessibleName(tr("Layer"));
  line->addWidget(layerLabel_);
  line->addWidget(layers_);

  stepRow_ = new QWidget;
  auto* steps = new QHBoxLayout(stepRow_);
  steps->setContentsMargins(0, 0, 0, 0);
  const auto button = [](const QString& tip) {
    auto* made = new QToolButton;
    made->setAutoRaise(true);
    made->setAutoRepeat(true);
    made->setToolTip(tip);
    made->setAccessibleName(tip);
    return made;
  };
  earlier_ = button(tr("The step before"));
  later_ = button(tr("The next step"));
  steps_ = new QSlider(Qt::Horizontal);
  steps_->setAccessibleName(tr("Time step"));
  step_ = new QLabel;
  steps->addWidget(new QLabel(tr("Time step:")));
  steps->addWidget(earlier_);
  steps->addWidget(steps_, 1);
  steps->addWidget(later_);
  steps->addWidget(step_);
  line->addWidget(stepRow_, 1);
  line->addStretch();

  date_ = new QLineEdit;
  date_->setPlaceholderText(tr("Go to date"));
  date_->setToolTip(tr("A date as 2000-01-31 12:00; Enter goes there"));
  date_->setAccessibleName(tr("Go to date"));
  line->addWidget(date_);
  return row;
}

QWidget* DataViewer::BuildBody() {
  items_ = new QListWidget;
  items_->setAccessibleName(tr("Items"));
  items_->setSelectionMode(QAbstractItemView::ExtendedSelection);
  items_->setFrameShape(QFrame::NoFrame);
  items_->setWordWrap(true);
  items_->setItemDelegate(new RowDelegate(items_));

  plots_ = new QStackedWidget;
  plots_->addWidget(map_);
  plots_->addWidget(chart_);
  tableText_ = new QLabel;
  tableText_->setTextFormat(Qt::PlainText);
  told_ = new QLabel;
  told_->setTextFormat(Qt::PlainText);
  told_->setWordWrap(true);
  auto* values = new QWidget;
  auto* below = new QVBoxLayout(values);
  below->setContentsMargins(0, 0, 0, 0);
  below->addWidget(tableText_);
  below->addWidget(table_, 1);
  below->addWidget(told_);

  split_ = new QSplitter(Qt::Vertical);
  split_->setChildrenCollapsible(false);
  split_->addWidget(plots_);
  split_->addWidget(values);
  split_->setStretchFactor(0, 1);
  auto* right = new QWidget;
  auto* column = new QVBoxLayout(right);
  const int margin = Theme::Get().Scaled(8);
  column->setContentsMargins(margin, margin, margin, margin);
  column->addWidget(BuildChoices());
  column->addWidget(split_, 1);
  auto* body = new QSplitter;
  body->setChildrenCollapsible(false);
  body->addWidget(items_);
  body->addWidget(right);
  body->setStretchFactor(1, 1);
  body->setSizes({Theme::Get().Scaled(kListWidth), Theme::Get().Scaled(4 * kListWidth)});
  split_->setSizes({Theme::Get().Scaled(kPlotHeight), Theme::Get().Scaled(kTableHeight)});
  return body;
}

void DataViewer::FollowTheme() {
  const Theme& theme = Theme::Get();
  earlier_->setIcon(theme.Icon("back"));
  later_->setIcon(theme.Icon("forward"));
  const QSize size(theme.Scaled(16), theme.Scaled(16));
  earlier_->setIconSize(size);
  later_->setIconSize(size);
  date_->setFixedWidth(theme.Scaled(kDateWidth));
  // What the slider tells must not move it.
  step_->setMinimumWidth(step_->fontMetrics().horizontalAdvance("0000-00-00 00:00  (000000 of 000000)"));
  QPalette quiet = QApplication::palette();
  quiet.setColor(QPalette::WindowText, theme.QuietColor());
  problem_->setPalette(quiet);
  told_->setPalette(quiet);
}

void DataViewer::Reload(bool always) {
  const bool isOther = file_.Reopen(always);
  if (!isOther && shownUnits_ == units_) return;
  shownUnits_ = units_;
  whole_->setCurrentIndex(Problem().empty() ? 0 : 1);
  problem_->setText(ToQt(Problem()));
  if (Problem().empty()) {
    const QSignalBlocker blocker(items_);
    items_->clear();
    for (int number = 1; number <= static_cast<int>(file_.Items().size()); ++number) {
      const QString name = ToQt(file_.Items()[static_cast<std::size_t>(number - 1)].name);
      auto* row = new QListWidgetItem(name + "\n" + ToQt(file_.ItemDetail(number)));
      row->setToolTip(name);
      items_->addItem(row);
    }
    items_->setCurrentRow(file_.Chosen().front() - 1);
    for (const int number : file_.Chosen()) items_->item(number - 1)->setSelected(true);
  }
  QStringList notes;
  for (const std::string& note : file_.Notes()) notes << ToQt(note);
  ShowNotes(notes.join("\n"));
  ShowItem();
}

void DataViewer::ShowItem() {
  if (!Problem().empty()) {
    map_->StopWaiting();
    chart_->StopWaiting();
    table_->Reset();
    return;
  }
  const bool isSeries = file_.IsSeries();
  plots_->setCurrentWidget(isSeries ? static_cast<QWidget*>(chart_) : map_);
  layers_->clear();
  for (int layer = file_.Layers(); layer > 0; --layer) {
    const QString text = layer == file_.Layers() ? tr("%1 (top)") : layer == 1 ? tr("%1 (bottom)") : QString("%1");
    layers_->addItem(text.arg(layer));
  }
  const bool hasLayers = file_.Layers() > 1;
  layerLabel_->setVisible(hasLayers);
  layers_->setVisible(hasLayers);
  stepRow_->setVisible(!isSeries && file_.Steps() > 1);
  date_->setVisible(isSeries || file_.Steps() > 1);
  table_->Reset();
  if (isSeries) {
    map_->StopWaiting();
    chart_->ShowWhenThere([this] {
      SeriesContent chart = file_.Chart();
      further_.AddTo(chart);
      return chart;
    });
    table_->GoTo(0, file_.ColumnOf(file_.Chosen().front()));
  } else {
    chart_->StopWaiting();
  }
  ShowSlice();
}

void DataViewer::ShowSlice() {
  tableText_->setText(ToQt(file_.TableText()));
  tableText_->setVisible(!tableText_->text().isEmpty());
  if (file_.IsSeries()) return;
  const auto step = static_cast<int>(file_.Slice().step), steps = static_cast<int>(file_.Steps());
  {
    const QSignalBlocker blocker(steps_);
    steps_->setRange(0, steps - 1);
    steps_->setValue(step);
  }
  earlier_->setEnabled(step > 0);
  later_->setEnabled(step + 1 < steps);
  step_->setText(tr("%1  (%2 of %3)").arg(ToQt(file_.StepText(file_.Slice().step))).arg(step + 1).arg(steps));
  layers_->setCurrentIndex(file_.Layers() - 1 - file_.Slice().layer);
  map_->ShowWhenThere(
      [this] {
        MapContent map = file_.Map();
        map.picked = [this](const MapPick& pick) {
          if (!pick.cell) return;
          const auto [row, column] = file_.TableCellOf(pick.cell->first, pick.cell->second);
          table_->GoTo(row, column);
        };
        if (map.awaited.empty()) table_->Refill();
        return map;
      },
      &units_);
}

void DataViewer::GoToDate() {
  std::size_t step = 0;
  if (const std::string expected = file_.FindDate(FromQt(date_->text()), step); !expected.empty()) {
    ShowNotes(Translated(expected));
    return;
  }
  ShowNotes({});
  if (!file_.IsSeries()) return steps_->setValue(static_cast<int>(step));
  bool isMoved = false;
  const std::size_t row = file_.ShowRowOf(step, isMoved);
  if (isMoved) table_->Reset();
  tableText_->setText(ToQt(file_.TableText()));
  table_->GoTo(row, file_.ColumnOf(file_.Chosen().front()));
}

void DataViewer::ShowNotes(const QString& text) {
  told_->setText(text);
  told_->setVisible(!text.isEmpty());
}

void DataViewer::showEvent(QShowEvent* event) {
  QWidget::showEvent(event);
  Reload(false);
}

}  // namespace tervane
