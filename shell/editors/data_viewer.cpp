// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/editors/data_viewer.h"

#include <QApplication>
#include <QComboBox>
#include <QFileInfo>
#include <QHBoxLayout>
#include <QKeyEvent>
#include <QLabel>
#include <QLineEdit>
#include <QListWidget>
#include <QPainter>
#include <QProgressDialog>
#include <QSignalBlocker>
#include <QSplitter>
#include <QStackedWidget>
#include <QTabBar>
#include <QTabWidget>
#include <QVBoxLayout>
#include <initializer_list>

#include <fmt/format.h>

#include "shell/charts/series_plot.h"
#include "shell/editors/animation.h"
#include "shell/editors/data_table.h"
#include "shell/editors/frames_ahead.h"
#include "shell/editors/result_tools.h"
#include "shell/editors/time_player.h"
#include "shell/maps/map_canvas.h"
#include "shell/maps/map_view.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/row_delegate.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr int kListWidth = 230, kPlotHeight = 430, kTableHeight = 260;
constexpr int kLeastBelow = 90;
constexpr int kDateWidth = 150;
constexpr int kRest = 150;           ///< Milliseconds after which a step is no longer one that passes.
constexpr int kDiskInterval = 2000;  ///< Milliseconds between looks at the file on disk.

}  // namespace

DataViewer::DataViewer(const std::string& path, Host& host, const DisplayUnits& units)
    : path_(path),
      isSetup_(IsNamedAsViewedSetup(path)),
      file_(isSetup_ ? std::string() : path, &units),
      host_(host),
      result_(file_, &units, host),
      further_([] { return std::vector<SeriesOffer>(); }),
      units_(units),
      shownUnits_(units) {
  map_ = new MapView(host);
  chart_ = new SeriesPlot(host);
  table_ = new DataTable(file_);
  cells_ = new SeriesPlot(host);
  profile_ = new SeriesPlot(host);
  player_ = new TimePlayer;
  tools_ = new ResultTools(result_, file_, host);
  frames_ = std::make_unique<FramesAhead>(result_, units_);
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
  Connect();
  disk_.start(kDiskInterval);
  FollowTheme();
  Reload(true);
}

void DataViewer::Connect() {
  connect(items_, &QListWidget::itemSelectionChanged, this, [this] {
    std::vector<int> numbers;
    // The one that was chosen last comes first, so that it decides what is shown.
    if (items_->currentItem() && items_->currentItem()->isSelected()) numbers.push_back(items_->currentRow() + 1);
    for (int row = 0; row < items_->count(); ++row)
      if (row != items_->currentRow() && items_->item(row)->isSelected()) numbers.push_back(row + 1);
    file_.Choose(std::move(numbers));
    ShowItem();
  });
  connect(player_, &TimePlayer::StepChosen, this, &DataViewer::GoToStep);
  connect(player_, &TimePlayer::Paused, this, [this] { rest_.start(); });
  player_->WaitFor([this](int step) {
    if (frames_->At(static_cast<std::size_t>(step), Every())) return true;
    frames_->Want(file_.Slice().step, Every(), 1, file_.Steps());
    // As long as nothing can be read ahead, each step is waited for when it is shown.
    return !result_.Colors();
  });
  connect(frames_.get(), &FramesAhead::Came, this, [this](std::size_t step) {
    if (step != file_.Slice().step || !rest_.isActive()) return;
    if (const auto ready = frames_->At(step, Every())) ShowFrame(*ready);
  });
  rest_.setSingleShot(true);
  rest_.setInterval(kRest);
  connect(&rest_, &QTimer::timeout, this, &DataViewer::ShowSlice);
  connect(tools_, &ResultTools::Changed, this, [this] {
    frames_->Forget();
    tools_->Sync();
    ShowSlice();
  });
  connect(tools_, &ResultTools::CellsChanged, this, &DataViewer::ShowSlice);
  connect(tools_, &ResultTools::LineWanted, this, &DataViewer::AskLine);
  connect(tools_, &ResultTools::AnimationWanted, this, &DataViewer::SaveAnimation);
  connect(below_, &QTabWidget::currentChanged, this, &DataViewer::ShowCharts);
  connect(layers_, &QComboBox::activated, this, [this](int index) {
    // The list goes from the top, as layers lie; the file counts from the bottom.
    file_.ChooseSlice({file_.Slice().step, file_.Layers() - 1 - index});
    frames_->Forget();
    ShowSlice();
  });
  connect(date_, &QLineEdit::returnPressed, this, &DataViewer::GoToDate);
  connect(table_, &DataTable::Told, this, &DataViewer::ShowNotes);
  connect(&disk_, &QTimer::timeout, this, [this] { Reload(false); });
  connect(&Theme::Get(), &Theme::Changed, this, &DataViewer::FollowTheme);
}

DataViewer::~DataViewer() {
  // What shows the file goes before the file does.
  frames_.reset();
  delete whole_;
}

void DataViewer::PutOverMaps(std::function<void(MapContent& map)> put) {
  result_.PutOverMaps(std::move(put));
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

  line->addWidget(player_, 1);
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
  below_ = new QTabWidget;
  below_->setDocumentMode(true);
  below_->addTab(values, tr("Values"));
  below_->addTab(cells_, tr("At Cells"));
  below_->addTab(profile_, tr("Along Line"));
  // A chart that is not shown asks for no room; what is shown is given more by the line above it.
  below_->setMinimumHeight(Theme::Get().Scaled(kLeastBelow));
  split_->addWidget(plots_);
  split_->addWidget(below_);
  split_->setStretchFactor(0, 1);
  auto* right = new QWidget;
  auto* column = new QVBoxLayout(right);
  const int margin = Theme::Get().Scaled(8);
  column->setContentsMargins(margin, margin, margin, margin);
  column->addWidget(BuildChoices());
  column->addWidget(tools_);
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
  date_->setFixedWidth(theme.Scaled(kDateWidth));
  QPalette quiet = QApplication::palette();
  quiet.setColor(QPalette::WindowText, theme.QuietColor());
  problem_->setPalette(quiet);
  told_->setPalette(quiet);
}

void DataViewer::ReadSetup() {
  setupStamp_ = StampOf(path_);
  setupNotes_.clear();
  ViewedSetup setup;
  setupProblem_ = ReadViewedSetup(path_, setup).error;
  if (!setupProblem_.empty()) return;
  setupNotes_ = setup.notes;
  file_.OpenOther(setup.result.path);
  file_.Choose({setup.result.item});
  if (file_.Problem().empty() && file_.Chosen().front() != setup.result.item)
    setupNotes_.push_back(fmt::format("There is no item {} any more: the first one is shown.", setup.result.item));
  file_.ChooseSlice({static_cast<std::size_t>(setup.currentStep), setup.result.layer});
  result_.TakeSetup(setup);
}

void DataViewer::Reload(bool always) {
  const bool isOtherSetup = isSetup_ && (always || StampOf(path_) != setupStamp_);
  if (isOtherSetup) ReadSetup();
  const bool isOther = file_.Reopen(always && !isSetup_) || isOtherSetup;
  if (!isOther && shownUnits_ == units_) return;
  result_.Forget();
  frames_->Forget();
  shownUnits_ = units_;
  whole_->setCurrentIndex(Problem().empty() ? 0 : 1);
  problem_->setText(Translated(Problem()));
  if (Problem().empty()) {
    const QSignalBlocker blocker(items_);
    items_->clear();
    for (int number = 1; number <= static_cast<int>(file_.Items().size()); ++number) {
      const QString name = ToQt(file_.Items()[static_cast<std::size_t>(number - 1)].name);
      auto* row = new QListWidgetItem(name + "\n" + Translated(file_.ItemDetail(number)));
      row->setToolTip(name);
      items_->addItem(row);
    }
    items_->setCurrentRow(file_.Chosen().front() - 1);
    for (const int number : file_.Chosen()) items_->item(number - 1)->setSelected(true);
  }
  QStringList notes;
  for (const std::string& note : setupNotes_) notes << Translated(note);
  for (const std::string& note : file_.Notes()) notes << Translated(note);
  ShowNotes(notes.join("\n"));
  ShowItem();
}

void DataViewer::ShowItem() {
  if (!Problem().empty()) {
    for (PlotFrame* plot : std::initializer_list<PlotFrame*>{map_, chart_, cells_, profile_}) plot->StopWaiting();
    player_->Pause();
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
  const bool isGrid = file_.IsGrid(), hasSteps = !isSeries && file_.Steps() > 1;
  player_->setVisible(hasSteps);
  player_->SetSteps(hasSteps ? static_cast<int>(file_.Steps()) : 1,
                    [this](int step) { return ToQt(file_.StepText(static_cast<std::size_t>(step))); });
  tools_->setVisible(isGrid);
  below_->tabBar()->setVisible(isGrid);
  below_->setTabVisible(1, isGrid && hasSteps);
  below_->setTabVisible(2, isGrid);
  if (!isGrid) below_->setCurrentIndex(0);
  frames_->Forget();
  if (isGrid) tools_->Sync();
  date_->setVisible(isSeries || file_.Steps() > 1);
  table_->Reset();
  if (isSeries) {
    map_->StopWaiting();
    chart_->ShowWhenThere([this] {
      SeriesContent chart = file_.Chart();
      further_.AddTo(chart);
      return chart;
    });
    table_->GoTo(0, static_cast<int>(file_.ColumnOf(file_.Chosen().front())));
  } else {
    chart_->StopWaiting();
  }
  ShowSlice();
}

void DataViewer::ShowSlice() {
  tableText_->setText(Translated(file_.TableText()));
  tableText_->setVisible(!tableText_->text().isEmpty());
  if (file_.IsSeries()) return;
  player_->SetStep(static_cast<int>(file_.Slice().step));
  layers_->setCurrentIndex(file_.Layers() - 1 - file_.Slice().layer);
  ShowMap();
  ShowCharts();
}

void DataViewer::ShowMap() {
  rest_.stop();
  map_->ShowWhenThere(
      [this] {
        MapContent map = result_.Map();
        map.picked = [this](const MapPick& pick) { PickCell(pick); };
        if (asksLine_)
          map.request = MapRequest{MapRequest::Kind::Line, "Click the points of the line; a double click ends it.",
                                   [this](const std::vector<MapPoint>& points) {
                                     asksLine_ = false;
                                     result_.TakeLine(points);
                                     below_->setCurrentWidget(profile_);
                                     ShowSlice();
                                   },
                                   [this] { asksLine_ = false; }};
        if (map.awaited.empty()) table_->Refill();
        return map;
      },
      &units_);
}

void DataViewer::ShowCharts() {
  if (!Problem().empty() || !file_.IsGrid()) return;
  if (below_->currentWidget() == cells_) cells_->ShowWhenThere([this] { return result_.CellSeries(); });
  if (below_->currentWidget() == profile_) profile_->ShowWhenThere([this] { return result_.Profile(); });
}

int DataViewer::Every() const {
  const DataItem& item = file_.Item();
  return item.geometry.IsPlaced() ? result_.EveryFor(map_->Canvas().Window().metresPerPixel / item.geometry.cellSize)
                                  : 1;
}

void DataViewer::GoToStep(int step) {
  const auto before = static_cast<int>(file_.Slice().step);
  if (step != before) direction_ = step > before || player_->IsPlaying() ? 1 : -1;
  file_.ChooseSlice({static_cast<std::size_t>(step), file_.Slice().layer});
  if (!file_.IsGrid()) return ShowSlice();
  // Reading goes on from here, also while the user drags.
  rest_.start();
  const int every = Every();
  frames_->Want(static_cast<std::size_t>(step), every, direction_, file_.Steps());
  if (const auto ready = frames_->At(static_cast<std::size_t>(step), every)) ShowFrame(*ready);
}

void DataViewer::ShowFrame(const ReadyFrame& ready) {
  if (!ready.frame) return ShowMap();
  map_->Canvas().ShowFrame(ready.layer, ready.picture, result_.ArrowsOf(*ready.frame), ready.every > 1);
  if (ready.every == 1) file_.ShowGrid(ready.frame->grid);
  if (below_->currentWidget() == profile_) profile_->Show(result_.Profile(*ready.frame));
}

void DataViewer::AskLine() {
  player_->Pause();
  asksLine_ = true;
  ShowMap();
}

void DataViewer::PickCell(const MapPick& pick) {
  if (!pick.cell) return;
  const auto [row, column] = file_.TableCellOf(pick.cell->first, pick.cell->second);
  table_->GoTo(static_cast<int>(row), static_cast<int>(column));
  if (file_.Steps() < 2 || !file_.HasDates()) return;
  result_.PickCell(pick.cell->first, pick.cell->second);
  below_->setCurrentWidget(cells_);
  ShowSlice();
}

QImage DataViewer::AnimationPicture(std::size_t step, std::string& problem) {
  const auto computed = result_.Frame(step);
  computed->Run();
  const std::optional<GridLayer> colors = result_.Colors();
  if (!computed->Result() || !colors) {
    problem = computed->Result() ? "The colours of the map are not known yet." : computed->Problem();
    return {};
  }
  GridLayer layer = *colors;
  layer.grid = computed->Result()->grid;
  const std::atomic<bool> isGivenUp{false};
  map_->Canvas().ShowFrame(layer, GridPicture::Make(layer, units_, isGivenUp), result_.ArrowsOf(*computed->Result()),
                           false);
  const QImage map = map_->Canvas().Picture(1);
  // The time stands above the map.
  const QFontMetrics metrics(font());
  const int head = 2 * metrics.height();
  QImage picture(map.width(), map.height() + head, QImage::Format_RGB32);
  picture.fill(palette().color(QPalette::Base));
  QPainter painter(&picture);
  painter.drawImage(0, head, map);
  painter.setFont(font());
  painter.setPen(palette().color(QPalette::Text));
  QString text = ToQt(file_.Item().name) + "   " + ToQt(file_.StepText(step));
  if (result_.IsDifference()) text += "   " + Translated(result_.DifferenceText());
  painter.drawText(QRect(metrics.height(), 0, map.width(), head), Qt::AlignVCenter, text);
  return picture;
}

void DataViewer::SaveAnimation() {
  player_->Pause();
  const auto path = host_.AskFileToSave({FromQt(tr("Save Animation")), "PNG picture (*.png)|*.png||", "png", {}});
  if (!path) return;
  if (FileExists(PictureFile(*path, 1)) &&
      host_.Ask(FromQt(tr("Pictures of that name are there already, %1 and more. Replace them?")
                           .arg(ToQt(PictureFile(*path, 1)))),
                Host::Icon::Question, Host::Buttons::YesNo) != Host::Answer::Yes)
    return;
  const auto steps = static_cast<int>(file_.Steps());
  QProgressDialog progress(tr("Drawing %1 pictures").arg(steps), tr("Stop"), 0, steps, this);
  progress.setWindowModality(Qt::WindowModal);
  const std::string problem = tervane::SaveAnimation(
      *path, static_cast<std::size_t>(steps),
      [this](std::size_t number, std::string& reason) { return AnimationPicture(number - 1, reason); },
      [&progress](std::size_t done) {
        // The dialog lets the window's events run, so that it can be stopped.
        progress.setValue(static_cast<int>(done));
        return !progress.wasCanceled();
      });
  ShowSlice();
  if (problem == kCancelled)
    ShowNotes(tr("Stopped: no picture was written."));
  else if (!problem.empty())
    host_.ShowMessage(problem, Host::Icon::Error);
  else
    ShowNotes(tr("%1 pictures were written: %2 and those that follow.").arg(steps).arg(ToQt(PictureFile(*path, 1))));
}

void DataViewer::keyPressEvent(QKeyEvent* event) {
  if (event->key() == Qt::Key_Space && player_->isVisible()) return player_->PlayOrPause();
  QWidget::keyPressEvent(event);
}

void DataViewer::GoToDate() {
  std::size_t step = 0;
  if (const std::string expected = file_.FindDate(FromQt(date_->text()), step); !expected.empty()) {
    ShowNotes(Translated(expected));
    return;
  }
  ShowNotes({});
  if (!file_.IsSeries()) {
    file_.ChooseSlice({step, file_.Slice().layer});
    return ShowSlice();
  }
  bool isMoved = false;
  const std::size_t row = file_.ShowRowOf(step, isMoved);
  if (isMoved) table_->Reset();
  tableText_->setText(Translated(file_.TableText()));
  table_->GoTo(static_cast<int>(row), static_cast<int>(file_.ColumnOf(file_.Chosen().front())));
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
