// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Review notes in a document's window: the list, the marks in the tree and on pages. The journal beside them.
#include <QTabWidget>

#include "core/path.h"
#include "pages/place_names.h"
#include "shell/document_frame.h"
#include "shell/journal_view.h"
#include "shell/node_tree.h"
#include "shell/notes_view.h"
#include "shell/page/page_view.h"
#include "shell/qt_host.h"
#include "shell/text/text_view.h"
#include "shell/widgets/qt_text.h"

namespace tervane {

void DocumentFrame::BuildNotes() {
  notes_ = new NotesView(*session_, host_, program_, [this](std::uint64_t serial) { return NodeOf(serial); });
  bottomTabs_->addTab(notes_, tr("Notes"));
  connect(notes_, &NotesView::NoteChosen, this,
          [this](quint64 serial, const QString& key) { GoTo(serial, FromQt(key)); });
  for (NodeTree* tree : trees_)
    connect(tree, &NodeTree::NoteWanted, this, [this](quint64 serial) { AddNote(serial, {}); });
}

void DocumentFrame::AddNote(std::uint64_t serial, const std::string& key) {
  Commit();
  CYbSEKvfBase* node = NodeOf(serial);
  if (!node) return;
  bottomTabs_->setCurrentWidget(notes_);
  notes_->AddAt(*node, key);
}

void DocumentFrame::AddNoteHere() {
  if (const TextView::Place place = IsTextShown() ? text_->PlaceAtCursor() : TextView::Place(); place.serial)
    return AddNote(place.serial, place.key);
  const auto [serial, key] = page_ ? page_->KeyWithFocus() : std::pair<std::uint64_t, std::string>();
  AddNote(serial ? serial : current_, key);
}

void DocumentFrame::ShowNotes() {
  notes_->Sync();
  const int count = notes_->OpenCount();
  bottomTabs_->setTabText(bottomTabs_->indexOf(notes_), count ? tr("Notes (%1)").arg(count) : tr("Notes"));
  noted_.clear();
  std::map<std::uint64_t, int> ofPages;
  for (const NotesView::PlacedNote& placed : notes_->Notes()) {
    const ReviewNote& note = placed.note;
    CYbSEKvfBase* node = placed.serial ? NodeOf(placed.serial) : nullptr;
    if (!node || note.place.empty() || note.state == ReviewState::Done) continue;
    const QString text = tr("%1 (%2, %3)").arg(ToQt(note.text), ToQt(note.author), ToQt(note.date));
    QString& told = noted_[{placed.serial, ParseSetupPath(note.place).key.name}];
    told += (told.isEmpty() ? "" : "\n") + text;
    if (const CYbSEKvfBase* shown = PlaceNames::PageNodeOf(*node)) ++ofPages[shown->Serial()];
  }
  for (NodeTree* tree : trees_) tree->ShowNotes(ofPages);
  ShowNotesOnPage();
}

void DocumentFrame::ShowNotesOnPage() {
  if (!page_) return;
  page_->ShowNotes([this](const CYbSEKvfBase& node, const std::string& key) {
    const auto found = noted_.find({node.Serial(), key});
    return found == noted_.end() ? QString() : found->second;
  });
}

bool DocumentFrame::ShowBelow(const QString& title) {
  for (int tab = 0; tab < bottomTabs_->count(); ++tab)
    // Behind a title may stand how many lines there are: "Notes (2)".
    if (bottomTabs_->tabText(tab).section(" (", 0, 0) == title) return bottomTabs_->setCurrentIndex(tab), true;
  return false;
}

// ---- Journal

void DocumentFrame::BuildJournal() {
  journal_ = new JournalView(*session_, host_, program_, [this] { Commit(); });
  bottomTabs_->addTab(journal_, tr("Journal"));
  connect(journal_, &JournalView::StepChosen, this,
          [this](quint64 serial, const QString& key) { GoTo(serial, FromQt(key)); });
}

void DocumentFrame::ShowJournal() {
  journal_->Sync();
  const std::string trouble = session_->TakeJournalTrouble();
  if (trouble.empty()) return;
  const QString text = tr("The journal is not kept: %1. What is not in it is written when that is possible again.");
  Log(text.arg(Translated(trouble)));
  ShowBanner(text.arg(Translated(trouble)), {});
}

}  // namespace tervane
