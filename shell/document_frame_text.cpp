// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The text of the setup beside its pages, and undo, which what is being typed there comes before.
#include <QScopedValueRollback>
#include <QTabWidget>

#include "shell/document_frame.h"
#include "shell/find_panel.h"
#include "shell/page/page_view.h"
#include "shell/text/text_view.h"
#include "shell/widgets/qt_text.h"

namespace tervane {

void DocumentFrame::BuildMiddle() {
  middle_ = new QTabWidget;
  middle_->setDocumentMode(true);
  text_ = new TextView(*session_);
  middle_->addTab(pagePlace_, tr("Form"));
  middle_->addTab(text_, tr("Text"));
  connect(text_, &TextView::TypingChanged, this, &DocumentFrame::StateChanged);
  connect(middle_, &QTabWidget::currentChanged, this, [this] {
    const std::uint64_t shown = current_;
    if (IsTextShown()) {
      if (const CYbSEKvfBase* node = NodeOf(shown)) text_->GoTo(*node);
      text_->Text().setFocus();
    } else {
      Commit();
      const TextView::Place place = text_->PlaceAtCursor();
      // A place that has no page of its own shows on one above it, which may be the one that is shown.
      if (place.serial) GoTo(place.serial, place.key);
    }
    emit StateChanged();
  });
}

bool DocumentFrame::IsTextShown() const { return middle_->currentWidget() == text_; }

void DocumentFrame::ShowText(bool isShown) {
  middle_->setCurrentWidget(isShown ? static_cast<QWidget*>(text_) : pagePlace_);
}

void DocumentFrame::FollowInText(const CYbSEKvfBase& node, const std::string& control) {
  if (IsTextShown()) text_->GoTo(node, control);
}

void DocumentFrame::StartFind() { IsTextShown() ? text_->StartFind() : find_->Start(); }

void DocumentFrame::Undo() {
  if (!text_->UndoTyping()) Step(&EditSession::Undo, &UndoStack::UndoPlace, &UndoStack::UndoName, tr("Undone: %1"));
}

void DocumentFrame::Redo() {
  if (!text_->RedoTyping()) Step(&EditSession::Redo, &UndoStack::RedoPlace, &UndoStack::RedoName, tr("Done again: %1"));
}

void DocumentFrame::Step(bool (EditSession::*step)(), StepPlace (UndoStack::*placeOf)() const,
                         std::string (UndoStack::*nameOf)() const, const QString& told) {
  Commit();
  if (page_) page_->DropRefused();
  const StepPlace place = (session_->Steps().*placeOf)();
  const std::string name = (session_->Steps().*nameOf)();
  const QScopedValueRollback stepping(isStepping_, true);
  if (!(*session_.*step)()) return;
  // A command of the menus has no page: what it has changed is seen where it stands.
  if (GoTo(place.node) && page_) page_->PointOut(place.control);
  emit Told(told.arg(Translated(name)));
}

bool DocumentFrame::HasUntakenText() const { return text_->HasTyping(); }

bool DocumentFrame::CanUndo() const { return session_->Steps().CanUndo() || text_->HasTyping(); }

bool DocumentFrame::CanRedo() const { return session_->Steps().CanRedo() || text_->HasTyping(); }

}  // namespace tervane
