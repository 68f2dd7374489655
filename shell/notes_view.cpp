// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/notes_view.h"

#include <QComboBox>
#include <QDateTime>
#include <QDialogButtonBox>
#include <QFileDialog>
#include <QFormLayout>
#include <QHBoxLayout>
#include <QHeaderView>
#include <QLabel>
#include <QLineEdit>
#include <QMenu>
#include <QPlainTextEdit>
#include <QPushButton>
#include <QSettings>
#include <QToolButton>
#include <QTreeWidget>
#include <QVBoxLayout>
#include <algorithm>

#include "core/host.h"
#include "core/path.h"
#include "forms/page_form.h"
#include "pages/place_names.h"
#include "platform/os.h"
#include "platform/text.h"
#include "shell/program.h"
#include "shell/widgets/flat_button.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/row_delegate.h"
#include "shell/widgets/scrolled_row.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr const char* kAuthor = "ReviewAuthor";

QString StateText(ReviewState state) {
  return state == ReviewState::Open       ? NotesView::tr("Open")
         : state == ReviewState::Answered ? NotesView::tr("Answered")
                                          : NotesView::tr("Done");
}

std::string TimeOfNow() { return FromQt(QDateTime::currentDateTime().toString("yyyy-MM-dd HH:mm")); }

}  // namespace

// ---- The dialog

NoteDialog::NoteDialog(const QString& title, const QString& about, Program& program, QWidget* parent)
    : QDialog(parent), program_(program), text_(new QPlainTextEdit), author_(new QLineEdit) {
  setWindowTitle(title);
  auto* form = new QFormLayout(this);
  auto* place = new QLabel(about);
  place->setWordWrap(true);
  form->addRow(place);
  auto* label = new QLabel(tr("&Note"));
  label->setBuddy(text_);
  text_->setTabChangesFocus(true);
  text_->setMinimumSize(Theme::Get().Scaled(420), Theme::Get().Scaled(110));
  text_->setAccessibleName(tr("Note"));
  form->addRow(label, text_);
  author_->setText(program.Settings().value(kAuthor, ToQt(os::UserName())).toString());
  form->addRow(tr("&By"), author_);
  auto* buttons = new QDialogButtonBox(QDialogButtonBox::Ok | QDialogButtonBox::Cancel);
  connect(buttons, &QDialogButtonBox::accepted, this, &NoteDialog::accept);
  connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);
  form->addRow(buttons);
  const auto sync = [this, buttons] { buttons->button(QDialogButtonBox::Ok)->setEnabled(!Text().empty()); };
  connect(text_, &QPlainTextEdit::textChanged, this, sync);
  sync();
  text_->setFocus();
}

std::string NoteDialog::Text() const { return std::string(Trimmed(FromQt(text_->toPlainText()))); }
std::string NoteDialog::Author() const { return std::string(Trimmed(FromQt(author_->text()))); }

void NoteDialog::accept() {
  program_.Settings().setValue(kAuthor, ToQt(Author()));
  QDialog::accept();
}

// ---- The list

NotesView::NotesView(EditSession& session, Host& host, Program& program, NodeOf nodeOf)
    : session_(session),
      host_(host),
      program_(program),
      nodeOf_(std::move(nodeOf)),
      filter_(new QComboBox),
      list_(new QTreeWidget) {
  auto* column = new QVBoxLayout(this);
  column->setContentsMargins(0, 0, 0, 0);
  column->setSpacing(0);
  auto* area = new ScrolledRow;
  QHBoxLayout* row = &area->Row();
  row->setContentsMargins(4, 2, 4, 2);
  filter_->addItem(tr("All notes"));
  for (const ReviewState state : {ReviewState::Open, ReviewState::Answered, ReviewState::Done})
    filter_->addItem(StateText(state), static_cast<int>(state));
  filter_->setAccessibleName(tr("Which notes are listed"));
  row->addWidget(filter_);
  answer_ = AddFlatButton(*row, tr("&Answer…"), [this] { AskForAnswer(); });
  done_ = AddFlatButton(*row, tr("Done"), [this] {
    if (const PlacedNote* chosen = Chosen())
      SetState(chosen->note.name, chosen->note.state == ReviewState::Done ? ReviewState::Open : ReviewState::Done);
  });
  remove_ = AddFlatButton(*row, tr("Remove"), [this] {
    if (const PlacedNote* chosen = Chosen()) Remove(chosen->note.name);
  });
  row->addStretch(1);
  export_ = AddFlatButton(*row, tr("Export…"), [this] { Export(); });
  column->addWidget(area);
  column->addWidget(list_, 1);

  list_->setHeaderLabels({tr("State"), tr("Place"), tr("Note"), tr("By"), tr("Date")});
  list_->setItemDelegate(new RowDelegate(list_));
  list_->setUniformRowHeights(true);
  list_->setFrameShape(QFrame::NoFrame);
  list_->setAccessibleName(tr("Review notes"));
  const Theme& theme = Theme::Get();
  for (const auto& [at, width] : {std::pair{0, 110}, {1, 260}, {2, 330}, {3, 110}})
    list_->setColumnWidth(at, theme.Scaled(width));
  list_->setContextMenuPolicy(Qt::CustomContextMenu);
  connect(list_, &QWidget::customContextMenuRequested, this, &NotesView::ShowMenu);
  connect(list_, &QTreeWidget::itemActivated, this, [this](const QTreeWidgetItem* item) { Choose(item); });
  connect(list_, &QTreeWidget::itemClicked, this, [this](const QTreeWidgetItem* item) { Choose(item); });
  connect(list_, &QTreeWidget::currentItemChanged, this, [this] { SyncButtons(); });
  connect(filter_, &QComboBox::currentIndexChanged, this, [this] { Fill(); });
  setFocusProxy(list_);
  Fill();
}

CExtraParamsKvf& NotesView::List() const { return *session_.Document().Root().Child<CExtraParamsKvf>(); }

void NotesView::Sync() {
  CYbSEKvfGlobalBase& root = session_.Document().Root();
  std::vector<PlacedNote> notes;
  bool hasFollowed = false;
  for (ReviewNote& note : ReviewNotesOf(List())) {
    CYbSEKvfBase* node = NodeOfReviewNote(root, note);
    const PlacedNote* before = Find(note.name);
    if (before && before->serial && (!node || node->Serial() != before->serial))
      if (CYbSEKvfBase* same = nodeOf_(before->serial)) node = same;
    // Undo and redo bring notes to where they stood, and what follows them would be no part of their steps.
    if (before && node && !note.place.empty() && !session_.Steps().CanRedo() && FollowNode(note, *node)) {
      PutReviewNote(List(), note);
      hasFollowed = true;
    }
    notes.push_back({std::move(note), node ? node->Serial() : 0});
  }
  if (hasFollowed) session_.JoinStep();
  // What a place is called is found on its page, which takes a while: only for what has changed.
  if (notes == notes_) return;
  notes_ = std::move(notes);
  Fill();
}

int NotesView::OpenCount() const {
  return static_cast<int>(
      std::ranges::count_if(notes_, [](const PlacedNote& placed) { return placed.note.state != ReviewState::Done; }));
}

const NotesView::PlacedNote* NotesView::Find(const std::string& name) const {
  const auto found = std::ranges::find_if(notes_, [&](const PlacedNote& placed) { return placed.note.name == name; });
  return found == notes_.end() ? nullptr : &*found;
}

void NotesView::Fill() {
  const QTreeWidgetItem* current = list_->currentItem();
  const QString chosen = current ? current->data(0, Qt::UserRole).toString() : QString();
  list_->clear();
  PlaceNames names(session_.Document());
  const auto placeOf = [&](const PlacedNote& placed) {
    const ReviewNote& note = placed.note;
    if (note.place.empty()) return tr("The whole setup");
    CYbSEKvfBase* node = placed.serial ? nodeOf_(placed.serial) : nullptr;
    return node ? Translated(names.Of(*node, PathOf(*node), ParseSetupPath(note.place).key.name))
                : tr("%1 (gone)").arg(ToQt(note.place));
  };
  for (const PlacedNote& placed : notes_) {
    const ReviewNote& note = placed.note;
    if (filter_->currentData().isValid() && filter_->currentData().toInt() != static_cast<int>(note.state)) continue;
    const auto text = [](const std::string& said) { return ToQt(said).replace('\n', ' '); };
    auto* item = new QTreeWidgetItem(
        list_, {StateText(note.state), placeOf(placed), text(note.text), ToQt(note.author), ToQt(note.date)});
    item->setData(0, Qt::UserRole, ToQt(note.name));
    item->setToolTip(2, ToQt(note.text));
    if (note.state != ReviewState::Done) item->setIcon(0, Theme::Get().Icon("review"));
    for (const ReviewAnswer& answer : note.answers) {
      auto* below = new QTreeWidgetItem(
          item, {QString(), tr("Answer"), text(answer.text), ToQt(answer.author), ToQt(answer.date)});
      below->setData(0, Qt::UserRole, ToQt(note.name));
      below->setToolTip(2, ToQt(answer.text));
    }
    item->setExpanded(note.state != ReviewState::Done);
    if (item->data(0, Qt::UserRole).toString() == chosen) list_->setCurrentItem(item);
  }
  SyncButtons();
}

const NotesView::PlacedNote* NotesView::Chosen() const {
  const QTreeWidgetItem* item = list_->currentItem();
  return item ? Find(FromQt(item->data(0, Qt::UserRole).toString())) : nullptr;
}

void NotesView::SyncButtons() {
  const PlacedNote* chosen = Chosen();
  for (QToolButton* button : {answer_, done_, remove_}) button->setEnabled(chosen != nullptr);
  done_->setText(chosen && chosen->note.state == ReviewState::Done ? tr("Open Again") : tr("Done"));
  export_->setEnabled(!notes_.empty());
}

void NotesView::Choose(const QTreeWidgetItem* item) {
  list_->setCurrentItem(const_cast<QTreeWidgetItem*>(item));
  const PlacedNote* chosen = Chosen();
  if (chosen && chosen->serial && !chosen->note.place.empty())
    emit NoteChosen(chosen->serial, ToQt(ParseSetupPath(chosen->note.place).key.name));
}

void NotesView::Select(const std::string& name) {
  filter_->setCurrentIndex(0);
  for (int i = 0; i < list_->topLevelItemCount(); ++i)
    if (list_->topLevelItem(i)->data(0, Qt::UserRole).toString() == ToQt(name))
      list_->setCurrentItem(list_->topLevelItem(i));
}

void NotesView::ShowMenu(const QPoint& place) {
  QMenu menu;
  if (Chosen()) {
    menu.addAction(tr("&Go to Place"), this, [this] { Choose(list_->currentItem()); });
    menu.addAction(answer_->text(), answer_, &QToolButton::click);
    menu.addAction(done_->text(), done_, &QToolButton::click);
    menu.addAction(remove_->text(), remove_, &QToolButton::click);
    menu.addSeparator();
  }
  menu.addAction(export_->text(), export_, &QToolButton::click)->setEnabled(export_->isEnabled());
  menu.exec(list_->viewport()->mapToGlobal(place));
}

// ---- Changes

void NotesView::Change(const ReviewNote& note, int hint, const QString& action) {
  // The step stands where the note does, not in the list that keeps it: there undo leads.
  CYbSEKvfGlobalBase& root = session_.Document().Root();
  CYbSEKvfBase* node = NodeOfReviewNote(root, note);
  session_.UpdateDoc(node ? *node : root, hint, FromQt(action), nullptr, ParseSetupPath(note.place).key.name);
}

void NotesView::AddAt(CYbSEKvfBase& node, const std::string& key) {
  const std::uint64_t serial = node.Serial();
  const QString about = node.GetParent() ? Translated(PlaceNames(session_.Document()).Of(node, PathOf(node), key))
                                         : tr("The whole setup");
  NoteDialog dialog(tr("Add Note"), about, program_, window());
  if (dialog.exec() != QDialog::Accepted) return;
  // What was asked for a while may be gone.
  if (CYbSEKvfBase* now = nodeOf_(serial)) Add(*now, key, dialog.Author(), dialog.Text());
}

void NotesView::Add(CYbSEKvfBase& node, const std::string& key, const std::string& author, const std::string& text) {
  ReviewNote note = NewReviewNoteAt(node, key);
  note.author = author;
  note.date = TimeOfNow();
  note.text = text;
  note.name = PutReviewNote(List(), note);
  Change(note, kDataChanged | kItemAdded, "Add Note");
  Select(note.name);
}

void NotesView::Answer(const std::string& name, const std::string& author, const std::string& text) {
  const PlacedNote* found = Find(name);
  if (!found) return;
  ReviewNote note = found->note;
  note.answers.push_back({author, TimeOfNow(), text});
  if (note.state == ReviewState::Open) note.state = ReviewState::Answered;
  PutReviewNote(List(), note);
  Change(note, kDataChanged, "Answer Note");
}

void NotesView::SetState(const std::string& name, ReviewState state) {
  const PlacedNote* found = Find(name);
  if (!found) return;
  ReviewNote note = found->note;
  note.state = state;
  PutReviewNote(List(), note);
  Change(note, kDataChanged, "Change State of Note");
}

void NotesView::Remove(const std::string& name) {
  const PlacedNote* found = Find(name);
  if (!found) return;
  const ReviewNote note = found->note;
  if (RemoveReviewNote(List(), name)) Change(note, kDataChanged | kItemDeleted, "Remove Note");
}

void NotesView::AskForAnswer() {
  const PlacedNote* chosen = Chosen();
  if (!chosen) return;
  const std::string name = chosen->note.name;
  NoteDialog dialog(tr("Answer Note"), ToQt(chosen->note.text), program_, window());
  if (dialog.exec() == QDialog::Accepted) Answer(name, dialog.Author(), dialog.Text());
}

void NotesView::Export() {
  const QString path = QFileDialog::getSaveFileName(window(), tr("Export Review Notes"), tr("notes.csv"),
                                                    tr("Tables separated by commas (*.csv)"));
  if (path.isEmpty()) return;
  if (const FileResult result = WriteFileAtomically(FromQt(path), ReviewNotesAsCsv(ReviewNotesOf(List())));
      !result.Ok())
    host_.ShowMessage(result.error, Host::Icon::Error);
}

}  // namespace tervane
