// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/editors/edit_tab.h"

#include <QApplication>
#include <QFileInfo>
#include <QVBoxLayout>

#include "document/setup_lock.h"
#include "platform/files.h"
#include "shell/widgets/banner.h"
#include "shell/widgets/qt_text.h"

namespace tervane {

namespace {

constexpr int kLooks = 2000;  ///< Milliseconds between looks at the file on disk.

/// Large files take their time.
struct WaitCursor {
  WaitCursor() { QApplication::setOverrideCursor(Qt::WaitCursor); }
  ~WaitCursor() { QApplication::restoreOverrideCursor(); }
};

}  // namespace

EditTab::EditTab(Host& host) : host_(host), all_(new QVBoxLayout(this)) {
  all_->setContentsMargins(0, 0, 0, 0);
  all_->setSpacing(0);
  connect(&disk_, &QTimer::timeout, this, [this] {
    if (isVisible()) CheckDisk();
  });
  disk_.start(kLooks);
}

EditTab::~EditTab() = default;

void EditTab::SetBody(QWidget* body) {
  all_->addWidget(body, 1);
  ShowReadOnly();
}

void EditTab::HoldFile() {
  isHolding_ = true;
  lock_.Release();
  if (!File().Problem().empty()) return;
  const bool isTaken = lock_.Take(Path()) == SetupLock::Outcome::Taken;
  File().SetHeld(isTaken ? std::string() : lock_.Reason());
  ShowReadOnly();
}

void EditTab::ShowReadOnly() {
  if (readOnlyBanner_) delete readOnlyBanner_;
  if (File().WhyReadOnly().empty()) return;
  readOnlyBanner_ = new Banner(
      tr("Read-only: %1. Changes can be saved under another name.").arg(Translated(File().WhyReadOnly())), {});
  all_->addWidget(readOnlyBanner_);
}

QString EditTab::Name() const { return QFileInfo(ToQt(Path())).fileName(); }

QString EditTab::Title() const { return File().IsModified() ? Name() + "*" : Name(); }

void EditTab::Step(std::string (EditedFile::*step)()) {
  Commit();
  if (const std::string why = (File().*step)(); !why.empty()) host_.ShowMessage(why, Host::Icon::Error);
  Sync();
  emit StateChanged();
}

bool EditTab::Save(const std::string& path) {
  Commit();
  const bool isRenamed = path != Path();
  // What another editor holds is not written over.
  SetupLock other;
  if (isRenamed && isHolding_ && !IsSameFile(path, Path()) && other.Take(path) != SetupLock::Outcome::Taken) {
    host_.ShowMessage(other.Reason(), Host::Icon::Error);
    return false;
  }
  FileResult result;
  {
    const WaitCursor wait;
    result = File().Save(path);
  }
  if (!result.Ok()) host_.ShowMessage(result.error, Host::Icon::Error);
  if (!result.note.empty()) host_.ShowMessage(result.note, Host::Icon::Information);
  if (result.Ok()) {
    if (diskBanner_) delete diskBanner_;
    other.Release();
    if (isRenamed && isHolding_) HoldFile();
    ShowReadOnly();
    if (isRenamed) Renamed();
  }
  Sync();
  emit StateChanged();
  if (result.Ok()) emit FileSaved(ToQt(Path()));
  return result.Ok();
}

void EditTab::CheckDisk() {
  if (diskBanner_ || !File().IsOtherOnDisk()) return;
  const bool isGone = !FileExists(Path());
  if (!isGone && !File().IsModified() && File().Reload().empty()) {
    Reread();
    emit StateChanged();
    return;
  }
  std::vector<Banner::Answer> answers;
  if (!isGone) answers.push_back({tr("Re&load"), [this] { Reload(); }});
  answers.push_back({tr("&Keep Mine"), [this] { File().KeepMine(); }});
  diskBanner_ = new Banner(isGone ? tr("The file is no more on disk. A save writes it anew.")
                                  : tr("Another program has changed the file on disk."),
                           answers);
  all_->addWidget(diskBanner_);
}

void EditTab::Reload() {
  if (const std::string problem = File().Reload(); !problem.empty()) host_.ShowMessage(problem, Host::Icon::Error);
  Reread();
  emit StateChanged();
}

void EditTab::showEvent(QShowEvent* event) {
  QWidget::showEvent(event);
  CheckDisk();
}

}  // namespace tervane
