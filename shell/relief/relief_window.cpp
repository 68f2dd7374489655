// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/relief/relief_window.h"

#include <QComboBox>
#include <QDoubleSpinBox>
#include <QFormLayout>
#include <QHBoxLayout>
#include <QLabel>
#include <QListWidget>
#include <QSlider>
#include <QVBoxLayout>
#include <algorithm>
#include <utility>

#include "shell/relief/relief_canvas.h"
#include "shell/widgets/layer_colors.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/shown_unit.h"
#include "shell/widgets/theme.h"

namespace tervane {

ReliefView::ReliefView(Host& host, QWidget* parent) : PlotFrame(host, parent), canvas_(new ReliefCanvas) {
  connect(canvas_, &ReliefCanvas::PointedAt, this, [this](const QString& text) { SetStatus(text); });
  Hold({canvas_, [this](double factor) { canvas_->Zoom(factor); }, [this] { canvas_->Fit(); },
        [this](double pixelRatio) { return canvas_->Picture(pixelRatio); }});
}

void ReliefView::ShowWhenThere(ReliefSource source, std::function<void(Relief& relief)> paint,
                               const DisplayUnits& units) {
  const ReliefContent now =
      Follow<ReliefContent>(source, [this, source, paint, units] { ShowWhenThere(source, paint, units); });
  if (!now.awaited.empty()) return;
  if (now.relief && now.relief == shown_) return;
  shown_ = now.relief;
  std::shared_ptr<Relief> own;
  if (now.relief) {
    own = std::make_shared<Relief>(*now.relief);
    // What the user has hidden or faded stays so.
    if (const Relief* before = canvas_->Shown())
      for (ReliefBody& body : own->bodies) {
        const auto same = std::ranges::find(before->bodies, body.name, &ReliefBody::name);
        if (same == before->bodies.end()) continue;
        body.isShown = same->isShown;
        body.opacity = same->opacity;
      }
    paint(*own);
  }
  canvas_->SetRelief(std::move(own), units, Translated(now.message));
  SetStatus({});
  emit Shown();
}

ReliefWindow::ReliefWindow(QWidget* parent, Host& host, const QString& title)
    : QWidget(parent, Qt::Window), view_(new ReliefView(host)) {
  setAttribute(Qt::WA_DeleteOnClose);
  setWindowTitle(title);
  auto* row = new QHBoxLayout(this);
  const int margin = Theme::Get().Scaled(8);
  row->setContentsMargins(margin, margin, margin, margin);
  row->addWidget(view_, 1);
  row->addWidget(BuildPanel());
  resize(Theme::Get().Scaled(1040), Theme::Get().Scaled(680));
  connect(view_, &ReliefView::Shown, this, &ReliefWindow::FillBodies);
}

QWidget* ReliefWindow::BuildPanel() {
  auto* panel = new QWidget;
  panel->setFixedWidth(Theme::Get().Scaled(230));
  auto* column = new QVBoxLayout(panel);
  column->setContentsMargins(Theme::Get().Scaled(4), 0, 0, 0);
  const auto head = [&](const QString& text, QWidget* buddy) {
    auto* label = new QLabel(text);
    label->setBuddy(buddy);
    column->addWidget(label);
    column->addWidget(buddy);
  };
  bodies_ = new QListWidget;
  bodies_->setAccessibleName(tr("Bodies"));
  bodies_->setToolTip(tr("What is shown"));
  head(tr("&Shown:"), bodies_);
  connect(bodies_, &QListWidget::itemChanged, this, &ReliefWindow::TakeBody);
  const auto slider = [](const QString& name) {
    auto* made = new QSlider(Qt::Horizontal);
    made->setRange(0, 100);
    made->setAccessibleName(name);
    return made;
  };
  transparency_ = slider(tr("Transparency"));
  transparency_->setToolTip(tr("Transparency of all that is shown"));
  head(tr("&Transparency:"), transparency_);
  connect(transparency_, &QSlider::valueChanged, this, [this](int percent) {
    view_->Canvas().Change([percent](Relief& relief) {
      for (ReliefBody& body : relief.bodies) body.opacity = 1 - percent / 100.0;
    });
  });
  exaggeration_ = new QDoubleSpinBox;
  exaggeration_->setRange(0.1, 100000);
  exaggeration_->setDecimals(1);
  exaggeration_->setStepType(QAbstractSpinBox::AdaptiveDecimalStepType);
  exaggeration_->setPrefix("x ");
  exaggeration_->setToolTip(tr("How many times heights are drawn larger than distances"));
  head(tr("&Vertical exaggeration:"), exaggeration_);
  connect(exaggeration_, &QDoubleSpinBox::valueChanged, this,
          [this](double times) { view_->Canvas().SetExaggeration(times); });
  side_ = new QComboBox;
  side_->addItems({tr("None"), tr("From the south"), tr("From the north"), tr("From the west"), tr("From the east")});
  head(tr("S&lice:"), side_);
  place_ = slider(tr("Place of the slice"));
  place_->setValue(50);
  place_->setEnabled(false);
  column->addWidget(place_);
  connect(side_, &QComboBox::currentIndexChanged, this, &ReliefWindow::TakeSlice);
  connect(place_, &QSlider::valueChanged, this, &ReliefWindow::TakeSlice);
  return panel;
}

void ReliefWindow::Show(ReliefSource source, std::function<void(Relief& relief)> paint, const DisplayUnits& units) {
  view_->ShowWhenThere(std::move(source), std::move(paint), units);
}

void ReliefWindow::FillBodies() {
  const Relief* relief = view_->Canvas().Shown();
  isFilling_ = true;
  const bool isFirst = bodies_->count() == 0;
  bodies_->clear();
  if (relief) {
    for (const ReliefBody& body : relief->bodies) {
      auto* item = new QListWidgetItem(Translated(body.name), bodies_);
      item->setFlags(Qt::ItemIsEnabled | Qt::ItemIsSelectable | Qt::ItemIsUserCheckable);
      item->setCheckState(body.isShown ? Qt::Checked : Qt::Unchecked);
      item->setToolTip(item->text());
      QPixmap swatch(Theme::Get().Scaled(12), Theme::Get().Scaled(12));
      swatch.fill(QColor::fromRgb(body.color));
      item->setIcon(swatch);
    }
    if (isFirst) exaggeration_->setValue(GoodExaggeration(*relief));
  }
  isFilling_ = false;
}

void ReliefWindow::TakeBody(QListWidgetItem* item) {
  if (isFilling_) return;
  const auto place = static_cast<std::size_t>(bodies_->row(item));
  const bool isShown = item->checkState() == Qt::Checked;
  view_->Canvas().Change([place, isShown](Relief& relief) { relief.bodies[place].isShown = isShown; });
}

void ReliefWindow::Slice(int side, double part) {
  place_->setValue(static_cast<int>(part * 100));
  side_->setCurrentIndex(side);
}

void ReliefWindow::TakeSlice() {
  ReliefPart part;
  double ReliefPart::*const cuts[] = {&ReliefPart::south, &ReliefPart::north, &ReliefPart::west, &ReliefPart::east};
  const int side = side_->currentIndex();
  place_->setEnabled(side > 0);
  const double away = place_->value() / 100.0;
  if (side > 0) part.*cuts[side - 1] = side % 2 == 1 ? away : 1 - away;
  view_->Canvas().SetPart(part);
}

void PaintGround(Relief& relief) {
  std::size_t layer = 0, curve = 0;
  const bool isDark = Theme::Get().IsDark();
  for (ReliefBody& body : relief.bodies) {
    const bool isGround = &body == &relief.bodies.front();
    const QColor color = isGround           ? QColor(0xc8, 0xb8, 0x90)
                         : body.IsSurface() ? CurveColor(curve, isDark)
                                            : LayerColor(layer, isDark);
    if (body.color == 0) body.color = color.rgb();
    if (!isGround) ++(body.IsSurface() ? curve : layer);
  }
}

double GoodExaggeration(const Relief& relief) {
  const auto heights = relief.Heights();
  const double width = std::max(relief.raster.nx, relief.raster.ny) * relief.raster.cellSize;
  if (!heights || !(heights->second > heights->first)) return 1;
  constexpr double kShare = 0.07;  // Of the width.
  return NiceStep(std::max(1.0, kShare * width / (heights->second - heights->first)));
}

}  // namespace tervane
