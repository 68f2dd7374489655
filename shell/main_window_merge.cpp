// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// How the main window merges setups.
#include <QPointer>
#include <QTabWidget>
#include <memory>

#include "document/flow_model_document.h"
#include "platform/files.h"
#include "shell/document_frame.h"
#include "shell/main_window.h"
#include "shell/merge_view.h"
#include "shell/widgets/qt_text.h"

namespace tervane {

void MainWindow::Merge(DocumentFrame& frame) {
  constexpr const char* kSetups = "Setups (*.tvd)|*.tvd||";
  if (frame.Session().Path().empty() || frame.Session().HasChangesToSave()) {
    host_.ShowMessage("Files are merged as they stand: save this setup first.", Host::Icon::Information);
    return;
  }
  const std::string& mine = frame.Session().Path();
  const auto theirs = host_.AskFileToOpen({FromQt(tr("Merge With")), kSetups, "tvd", mine});
  if (!theirs) return;
  if (const auto base = host_.AskFileToOpen({FromQt(tr("The Setup That Both Were Made From")), kSetups, "tvd", mine}))
    MergeWith(frame, *theirs, *base);
}

bool MainWindow::MergeWith(DocumentFrame& frame, const std::string& theirs, const std::string& base) {
  auto view = std::make_unique<MergeView>(MergeFiles{base, frame.Session().Path(), theirs}, host_);
  if (!view->Problem().empty()) {
    host_.ShowMessage(view->Problem(), Host::Icon::Error);
    return false;
  }
  MergeView* const shown = view.release();
  connect(shown, &MergeView::Saved, this, [this, setup = QPointer<DocumentFrame>(&frame), shown](const QString& path) {
    shown->deleteLater();
    if (setup && IsSameFile(setup->Session().Path(), FromQt(path)))
      emit setup->ReloadWanted();
    else
      OpenDocument(path);
  });
  tabs_->setCurrentIndex(tabs_->addTab(shown, shown->Title()));
  SyncCommands();
  return true;
}

}  // namespace tervane
