// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/maps/map_view.h"

#include <QCheckBox>
#include <QDragEnterEvent>
#include <QDropEvent>
#include <QHBoxLayout>
#include <QMenu>
#include <QMimeData>
#include <QPointer>
#include <QSlider>
#include <QToolButton>
#include <QUrl>
#include <QWidgetAction>
#include <algorithm>
#include <utility>

#include "platform/item_types.h"
#include "shell/maps/map_canvas.h"
#include "shell/maps/map_export.h"
#include "shell/relief/relief_window.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr const char* kHillshade = "Maps/Hillshade";
constexpr const char* kCellLines = "Maps/CellLines";
constexpr const char* kLayerLegend = "Maps/LayerLegend";

}  // namespace

MapView::MapView(Host& host, QWidget* parent) : PlotFrame(host, parent), canvas_(new MapCanvas) {
  connect(canvas_, &MapCanvas::PointedAt, this,
          [this](const QString& text) { SetStatus(text.isEmpty() ? canvas_->Summary() : text); });
  Hold({canvas_, [this](double factor) { canvas_->Zoom(factor); }, [this] { canvas_->Fit(); },
        [this](double pixelRatio) { return canvas_->Picture(pixelRatio); }});
  layersButton_ = new QToolButton;
  layersButton_->setText(tr("Layers"));
  layersButton_->setToolTip(tr("Shows, hides and fades layers of the backdrop on this map"));
  layersButton_->setPopupMode(QToolButton::InstantPopup);
  layersButton_->setMenu(new QMenu(layersButton_));
  layersButton_->hide();
  connect(layersButton_->menu(), &QMenu::aboutToShow, this, &MapView::FillLayerMenu);
  AddToRow(layersButton_);
  AddCommand(tr("&Save Map As..."), [this] { SaveMapAs(); });
  AddCommand(tr("&3D View"), [this] { OpenRelief(); });
  hillshade_ = AddCommand(tr("&Hillshade"), [this] {
    SetHillshade(hillshade_->isChecked());
    Outside().SetSetting(kHillshade, hillshade_->isChecked() ? "1" : "0");
  });
  hillshade_->setCheckable(true);
  hillshade_->setChecked(Outside().Setting(kHillshade) == "1");
  // How all maps are looked at.
  const auto look = [this](const QString& text, const char* setting, QAction*& action) {
    action = AddCommand(text, [this, setting, &action] {
      Outside().SetSetting(setting, action->isChecked() ? "1" : "0");
      SyncLooks();
    });
    action->setCheckable(true);
    action->setChecked(Outside().Setting(setting) == "1");
  };
  look(tr("&Grid Lines"), kCellLines, cellLines_);
  look(tr("&Layers in the Legend"), kLayerLegend, layerLegend_);
}

void MapView::SyncLooks() {
  std::optional<GridGeometry> cells;
  if (cellLines_->isChecked() && modelCells_) cells = modelCells_();
  if (cellLines_->isChecked() && !cells && !content_.grids.empty()) cells = content_.grids.front().grid->Geometry();
  canvas_->SetCellLines(std::move(cells));
  canvas_->SetLayersInLegend(layerLegend_->isChecked());
}

// ---- Files dropped on the map

void MapView::TakeDrops(std::function<bool(const std::string& path)> wants,
                        std::function<void(const std::vector<std::string>& paths)> dropped) {
  wantsFile_ = std::move(wants);
  dropped_ = std::move(dropped);
  setAcceptDrops(true);
}

namespace {

std::vector<std::string> LocalFiles(const QMimeData& data) {
  std::vector<std::string> paths;
  for (const QUrl& url : data.urls())
    if (url.isLocalFile()) paths.push_back(FromQt(url.toLocalFile()));
  return paths;
}

}  // namespace

void MapView::dragEnterEvent(QDragEnterEvent* event) {
  // Other files go to the window.
  const std::vector<std::string> paths = LocalFiles(*event->mimeData());
  if (wantsFile_ && !paths.empty() && std::ranges::all_of(paths, wantsFile_)) event->acceptProposedAction();
}

void MapView::dropEvent(QDropEvent* event) {
  event->acceptProposedAction();
  dropped_(LocalFiles(*event->mimeData()));
}

void MapView::SetHillshade(bool isOn) {
  TakeFrame();
  LightSlopes(content_, isOn);
  canvas_->SetContent(AsLookedAt(), &units_);
}

void MapView::TakeFrame() {
  content_.grids = canvas_->Content().grids;
  content_.arrows = canvas_->Content().arrows;
}

// ---- Layers of the backdrop

MapContent MapView::AsLookedAt() const {
  MapContent shown = content_;
  for (auto* layers : {&shown.below, &shown.above}) {
    std::erase_if(*layers, [this](const BackdropLayer& layer) {
      const auto look = looks_.find(layer.title);
      return look != looks_.end() && !look->second.isShown;
    });
    for (BackdropLayer& layer : *layers)
      if (const auto look = looks_.find(layer.title); look != looks_.end())
        layer.transparency = look->second.transparency;
  }
  return shown;
}

void MapView::Look(const std::string& layer, const LayerLook& look) {
  looks_[layer] = look;
  TakeFrame();
  canvas_->SetContent(AsLookedAt(), &units_);
}

std::vector<std::string> MapView::LayerTitles() const {
  std::vector<std::string> titles;
  for (const auto* layers : {&content_.above, &content_.below})
    for (auto layer = layers->rbegin(); layer != layers->rend(); ++layer) titles.push_back(layer->title);
  return titles;
}

void MapView::FillLayerMenu() {
  QMenu* menu = layersButton_->menu();
  menu->clear();
  for (const std::string& title : LayerTitles()) {
    const LayerLook look = looks_[title];
    auto* row = new QWidget;
    auto* layout = new QHBoxLayout(row);
    const int margin = Theme::Get().Scaled(6);
    layout->setContentsMargins(margin, margin / 2, margin, margin / 2);
    auto* shown = new QCheckBox(Translated(title));
    shown->setChecked(look.isShown);
    auto* fade = new QSlider(Qt::Horizontal);
    fade->setRange(0, 100);
    fade->setValue(qRound(look.transparency * 100));
    fade->setFixedWidth(Theme::Get().Scaled(110));
    fade->setEnabled(look.isShown);
    fade->setToolTip(tr("Transparency"));
    fade->setAccessibleName(tr("Transparency of %1").arg(Translated(title)));
    layout->addWidget(shown, 1);
    layout->addWidget(fade);
    const auto apply = [this, title, shown, fade] {
      fade->setEnabled(shown->isChecked());
      Look(title, {shown->isChecked(), fade->value() / 100.0});
    };
    connect(shown, &QCheckBox::toggled, this, apply);
    connect(fade, &QSlider::valueChanged, this, apply);
    auto* action = new QWidgetAction(menu);
    action->setDefaultWidget(row);
    menu->addAction(action);
  }
}

// ---- The map as a file

void MapView::SaveMapAs() {
  if (content_.IsEmpty()) {
    Outside().ShowMessage("There is nothing here to save.", Host::Icon::Information);
    return;
  }
  const bool hasValues = !content_.grids.empty();
  const std::string picture = "Picture with world file (*.png)|*.png|", values = "Values as GeoTIFF (*.tif)|*.tif|";
  const auto path = Outside().AskFileToSave(
      {FromQt(tr("Save Map As")), picture + (hasValues ? values : std::string()) + "|", "png", {}});
  if (!path) return;
  TakeFrame();
  FileResult written;
  if (hasValues && QString::fromStdString(*path).endsWith(".tif", Qt::CaseInsensitive)) {
    written = WriteValues(*path, *content_.grids.front().grid);
  } else {
    constexpr double kPaperRatio = 2;
    const MapWindow& seen = canvas_->Window();
    const MapPoint upperLeft = seen.ToMap(seen.rect.topLeft()), lowerRight = seen.ToMap(seen.rect.bottomRight());
    const Envelope area{upperLeft.x, lowerRight.y, lowerRight.x, upperLeft.y};
    written = WritePlacedPicture(*path, canvas_->AreaPicture(area, (seen.rect.size() * kPaperRatio).toSize()), area);
  }
  if (!written.Ok()) Outside().ShowMessage(written.error, Host::Icon::Error);
}

// ---- The map from the side

namespace {

/// As many pixels as show the cells of a relief well.
QSize DrapePixels(const Envelope& area) {
  constexpr double kLongest = 2000;
  const double width = area.xMax - area.xMin, height = area.yMax - area.yMin, longest = std::max(width, height);
  return {std::max(1, static_cast<int>(kLongest * width / longest)),
          std::max(1, static_cast<int>(kLongest * height / longest))};
}

}  // namespace

ReliefWindow* MapView::OpenRelief() {
  const std::optional<Envelope> area = canvas_->WholeArea();
  if (!area || !(area->xMax > area->xMin) || !(area->yMax > area->yMin)) {
    Outside().ShowMessage("There is nothing here to show in 3D.", Host::Icon::Information);
    return nullptr;
  }
  TakeFrame();
  const auto ground = [view = QPointer<MapView>(this)]() -> SectionContent {
    return view && view->ground_ ? view->ground_() : SectionContent();
  };
  // A copy: it is sampled in another thread, while an editor may paint the grid.
  std::shared_ptr<const CTvn2DOrthoRotatedGridData> values;
  if (!content_.grids.empty()) values = std::make_shared<CTvn2DOrthoRotatedGridData>(*content_.grids.front().grid);
  auto drape = std::make_shared<ReliefDrape>();
  const QImage picture = canvas_->AreaPicture(*area, DrapePixels(*area)).convertToFormat(QImage::Format_ARGB32);
  drape->width = picture.width();
  drape->height = picture.height();
  for (int row = 0; row < picture.height(); ++row) {
    const auto* line = reinterpret_cast<const QRgb*>(picture.constScanLine(row));
    drape->pixels.insert(drape->pixels.end(), line, line + picture.width());
  }
  const auto paint = [drape = std::shared_ptr<const ReliefDrape>(drape), area = *area](Relief& relief) {
    PaintGround(relief);
    relief.bodies.front().drape = DrapeOver(relief.raster, *drape, area);
    relief.bodies.front().isShown = true;
  };
  auto* opened = new ReliefWindow(window(), Outside(), tr("3D View"));
  opened->Show(ReliefOf(ground, values), paint, units_);
  opened->show();
  return opened;
}

void MapView::LightSlopes(MapContent& content, bool isOn) {
  bool hasGround = false;
  for (GridLayer& layer : content.grids) {
    const bool isGround = !layer.isCodes && layer.grid->ItemType() == quantity::kElevation;
    layer.isHillshaded = isGround && isOn;
    hasGround = hasGround || isGround;
  }
  hillshade_->setVisible(hasGround);
}

void MapView::Show(MapContent content, const DisplayUnits* units) {
  const DisplayUnits chosen = units ? *units : DisplayUnits();
  LightSlopes(content, hillshade_->isChecked());
  const MapContent& seen = canvas_->Content();
  // Frames of another time may have been drawn meanwhile.
  const bool isSeen = content.grids == seen.grids && content.arrows == seen.arrows;
  if (isShown_ && isSeen && chosen == units_ && LooksSame(content, content_)) {
    canvas_->SetPicked(std::move(content.picked));
    canvas_->Ask(std::move(content.request));
    return;
  }
  isShown_ = true;
  units_ = chosen;
  std::optional<MapRequest> request = std::exchange(content.request, {});
  content_ = std::move(content);
  layersButton_->setVisible(!content_.below.empty() || !content_.above.empty());
  canvas_->SetContent(AsLookedAt(), units);
  SyncLooks();
  canvas_->Ask(std::move(request));
  SetStatus(canvas_->Summary());
}

void MapView::ShowWhenThere(const std::function<MapContent()>& content, const DisplayUnits* units) {
  MapContent now = Follow<MapContent>(content, [this, content, units] { ShowWhenThere(content, units); });
  if (!now.awaited.empty() && isShown_) return;
  // Nothing is said of an empty map that is still to come.
  if (!now.awaited.empty() && now.message.empty()) now.message = " ";
  now.awaited.clear();
  Show(std::move(now), units);
}

QString MapView::Description() const {
  if (canvas_->IsPointedAt()) return Status();
  QStringList parts{Status(), canvas_->LayersInWords()};
  parts.removeAll(QString());
  return parts.join("\n");
}

bool MapView::IsBusy() const { return PlotFrame::IsBusy() || canvas_->IsPreparing(); }

}  // namespace tervane
