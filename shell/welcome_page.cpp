// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/welcome_page.h"

#include <QCommandLinkButton>
#include <QDir>
#include <QFileInfo>
#include <QLabel>
#include <QVBoxLayout>

#include "shell/widgets/theme.h"

namespace tervane {

WelcomePage::WelcomePage() {
  const Theme& theme = Theme::Get();
  auto* all = new QVBoxLayout(this);
  auto* middle = new QWidget;
  middle->setFixedWidth(theme.Scaled(520));
  auto* column = new QVBoxLayout(middle);
  column->setSpacing(theme.Scaled(8));
  auto* title = new QLabel("Quarzel");
  QFont large = title->font();
  large.setPointSizeF(large.pointSizeF() * 2);
  title->setFont(large);
  column->addWidget(title);
  column->addWidget(new QLabel(tr("The setup editor of the integrated catchment model Tervane")));
  column->addSpacing(theme.Scaled(12));
  const auto button = [&](const QString& text, const QString& explanation, const char* icon, auto signal) {
    auto* made = new QCommandLinkButton(text, explanation);
    made->setIcon(theme.Icon(icon));
    connect(made, &QCommandLinkButton::clicked, this, signal);
    column->addWidget(made);
  };
  button(tr("&New setup"), tr("Begin with all values at their defaults (Ctrl+N)"), "new", &WelcomePage::NewWanted);
  button(tr("&Open a setup"), tr("A .tvd file of any version; or drop one on this window (Ctrl+O)"), "open",
         &WelcomePage::OpenWanted);
  column->addSpacing(theme.Scaled(12));
  recent_ = new QVBoxLayout;
  recent_->setSpacing(theme.Scaled(4));
  column->addLayout(recent_);
  all->addStretch(1);
  all->addWidget(middle, 0, Qt::AlignHCenter);
  all->addStretch(2);
}

void WelcomePage::Show(const QStringList& recentFiles) {
  while (QLayoutItem* item = recent_->takeAt(0)) {
    if (QWidget* shown = item->widget()) {
      shown->hide();
      shown->deleteLater();
    }
    delete item;
  }
  if (recentFiles.isEmpty()) return;
  recent_->addWidget(new QLabel(tr("<b>Open lately</b>")));
  for (const QString& file : recentFiles) {
    const QFileInfo info(file);
    auto* link = new QLabel(QString("<a href='file'>%1</a>&nbsp; <span style='color:%3'>%2</span>")
                                .arg(info.fileName().toHtmlEscaped(),
                                     QDir::toNativeSeparators(info.absolutePath()).toHtmlEscaped(),
                                     Theme::Get().QuietColor().name()));
    link->setTextInteractionFlags(Qt::LinksAccessibleByKeyboard | Qt::LinksAccessibleByMouse);
    connect(link, &QLabel::linkActivated, this, [this, file] { emit FileWanted(file); });
    recent_->addWidget(link);
  }
}

}  // namespace tervane
