// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/charts/series_chooser.h"

#include <QFrame>
#include <QLineEdit>
#include <QListWidget>
#include <QPushButton>
#include <QScreen>
#include <QVBoxLayout>
#include <algorithm>
#include <utility>

#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr int kListWidth = 280, kListHeight = 300;
constexpr int kMostUnfiltered = 12;  ///< More need a field to find them.
constexpr int kOfferRole = Qt::UserRole;

/// The series of each group below its name, with check marks.
QListWidget* NewList(const std::vector<SeriesOffer>& offers, const SeriesChoice& choice) {
  auto* list = new QListWidget;
  list->setAccessibleName(SeriesChooser::tr("Series"));
  list->setMinimumSize(Theme::Get().Scaled(kListWidth), Theme::Get().Scaled(kListHeight));
  list->setUniformItemSizes(true);
  std::string group;
  for (std::size_t i = 0; i < offers.size(); ++i) {
    if (offers[i].group != group) {
      group = offers[i].group;
      auto* head = new QListWidgetItem(Translated(group), list);
      QFont bold = head->font();
      bold.setBold(true);
      head->setFont(bold);
      head->setFlags(Qt::ItemIsEnabled);
    }
    auto* item = new QListWidgetItem(ToQt(offers[i].name), list);
    item->setData(kOfferRole, static_cast<int>(i));
    item->setFlags(Qt::ItemIsEnabled | Qt::ItemIsSelectable | Qt::ItemIsUserCheckable);
    item->setCheckState(choice.isShown(offers[i]) ? Qt::Checked : Qt::Unchecked);
    item->setToolTip(ToQt(offers[i].path));
  }
  return list;
}

/// Hides what does not hold the typed text, and groups of which nothing is left.
void Filter(QListWidget& list, const QString& typed) {
  QListWidgetItem* head = nullptr;
  for (int row = 0; row < list.count(); ++row) {
    QListWidgetItem& item = *list.item(row);
    const bool isHead = !item.data(kOfferRole).isValid();
    const bool isFound = !isHead && item.text().contains(typed, Qt::CaseInsensitive);
    item.setHidden(!isFound);
    if (isHead) head = &item;
    if (isFound && head) head->setHidden(false);
  }
}

}  // namespace

SeriesChooser::SeriesChooser(Host& host) : host_(host) {
  setText(tr("Series"));
  setToolTip(tr("Lay other series over this chart"));
  setAutoRaise(true);
  setToolButtonStyle(Qt::ToolButtonTextOnly);
  hide();
  connect(this, &QToolButton::clicked, this, &SeriesChooser::Open);
}

void SeriesChooser::SetChoice(std::optional<SeriesChoice> choice) {
  choice_ = std::move(choice);
  setVisible(choice_.has_value());
}

void SeriesChooser::Open() {
  if (!choice_) return;
  auto* panel = new QFrame(this, Qt::Popup);
  panel->setAttribute(Qt::WA_DeleteOnClose);
  panel->setFrameShape(QFrame::StyledPanel);
  auto* column = new QVBoxLayout(panel);
  const int margin = Theme::Get().Scaled(6);
  column->setContentsMargins(margin, margin, margin, margin);
  const std::vector<SeriesOffer> offers = choice_->offers();
  QListWidget* list = NewList(offers, *choice_);
  if (static_cast<int>(offers.size()) > kMostUnfiltered) {
    auto* find = new QLineEdit;
    find->setPlaceholderText(tr("Find a series"));
    find->setClearButtonEnabled(true);
    connect(find, &QLineEdit::textChanged, list, [list](const QString& typed) { Filter(*list, typed); });
    column->addWidget(find);
    find->setFocus();
  } else {
    list->setFocus();
  }
  column->addWidget(list);
  auto* other = new QPushButton(tr("&Other File..."));
  column->addWidget(other);
  connect(list, &QListWidget::itemChanged, this, [this, offers](const QListWidgetItem* item) {
    const QVariant number = item->data(kOfferRole);
    if (!choice_ || !number.isValid()) return;
    choice_->show(offers[static_cast<std::size_t>(number.toInt())], item->checkState() == Qt::Checked);
    emit Changed();
  });
  connect(other, &QPushButton::clicked, this, [this, panel] {
    panel->close();
    AddFile();
  });
  panel->adjustSize();
  // Above the button, which stands at the foot of the chart.
  QPoint place = mapToGlobal(QPoint(width() - panel->width(), -panel->height()));
  if (const QScreen* on = screen()) {
    const QRect room = on->availableGeometry();
    place.setX(std::clamp(place.x(), room.left(), std::max(room.left(), room.right() - panel->width())));
    place.setY(std::max(place.y(), room.top()));
  }
  panel->move(place);
  panel->show();
}

void SeriesChooser::AddFile() {
  if (choice_ && choice_->addFile(host_)) emit Changed();
}

}  // namespace tervane
