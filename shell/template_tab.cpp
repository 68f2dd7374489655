// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/template_tab.h"

#include <QFileInfo>
#include <QSplitter>
#include <QVBoxLayout>

#include "shell/editors/text_file_view.h"
#include "shell/page/page_view.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr int kTableWidth = 760, kTextWidth = 420;
constexpr int kTemplateInterval = 2000;  ///< Milliseconds between looks at the file on disk.

}  // namespace

TemplateTab::TemplateTab(const std::string& path, Host& host) : view_(path), host_(host) {
  pagePlace_ = new QWidget;
  auto* place = new QVBoxLayout(pagePlace_);
  place->setContentsMargins(0, 0, 0, 0);
  text_ = new TextFileView;
  auto* body = new QSplitter;
  body->setChildrenCollapsible(false);
  body->addWidget(pagePlace_);
  body->addWidget(text_);
  body->setStretchFactor(0, 2);
  body->setStretchFactor(1, 1);
  body->setSizes({Theme::Get().Scaled(kTableWidth), Theme::Get().Scaled(kTextWidth)});
  auto* all = new QVBoxLayout(this);
  all->setContentsMargins(0, 0, 0, 0);
  all->addWidget(body);
  Redraw();
  connect(&disk_, &QTimer::timeout, this, &TemplateTab::Reload);
  disk_.start(kTemplateInterval);
}

TemplateTab::~TemplateTab() {
  // The page reads the view.
  delete page_;
}

QString TemplateTab::Title() const { return QFileInfo(ToQt(Path())).fileName(); }

void TemplateTab::Reload() {
  if (view_.Reopen()) Redraw();
}

void TemplateTab::Redraw() {
  delete page_;
  const auto sync = [this] {
    QTimer::singleShot(0, this, [this] {
      if (page_) page_->Sync();
    });
  };
  page_ = new PageView(view_.MakePage(host_, sync), ToQt(Path()));
  pagePlace_->layout()->addWidget(page_);
  text_->Show(Path());
}

}  // namespace tervane
