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
#include "shell/widgets/qt_text.h"
#include "shell/widgets/row_delegate.h"
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

NotesView::NotesView(EditSession& session, Host& host, Program& program)
    : session_(session), host_(host), program_(program), filter_(new QComboBox), list_(new QTreeWidget) {
  auto* column = new QVBoxLayout(this);
  column->setContentsMargins(0, 0, 0, 0);
  column->setSpacing(0);
  auto* row = new QHBoxLayout;
  row->setContentsMargins(4, 2, 4, 2);
  filter_->addItem(tr("All notes"));
  for (const ReviewState state : {ReviewState::Open, ReviewState::Answered, ReviewState::Done})
    filter_->addItem(StateText(state), static_cast<int>(state));
  filter_->setAccessibleName(tr("Which notes are listed"));
  row->addWidget(filter_);
  const auto button = [&](const QString& text, auto run) {
    auto* made = new QToolButton;
    made->setText(text);
    made->setAutoRaise(true);
    made->setFocusPolicy(Qt::TabFocus);
    connect(made, &QToolButton::clicked, this, run);
    row->addWidget(made);
    return made;
  };
  answer_ = button(tr("Ans&wer…"), [this] { AskForAnswer(); });
  done_ = button(tr("Done"), [this] {
    if (const ReviewNote* note = Chosen())
      SetState(note->name, note->state == ReviewState::Done ? ReviewState::Open : ReviewState::Done);
  });
  remove_ = button(tr("Remove"), [this] {
    if (const ReviewNote* note = Chosen()) Remove(note->name);
  });
  row->addStretch(1);
  export_ = button(tr("Export…"), [this] { Export(); });
  column->addLayout(row);
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
  std::vector<ReviewNote> notes = ReviewNotesOf(List());
  // What a place is called is found on its page, which takes a while: only for what has changed.
  std::vector<std::uint64_t> nodes;
  for (const ReviewNote& note : notes) {
    const CYbSEKvfBase* node = NodeOfReviewNote(session_.Document().Root(), note);
    nodes.push_back(node ? node->Serial() : 0);
  }
  if (notes == notes_ && nodes == nodes_) return;
  notes_ = std::move(notes);
  nodes_ = std::move(nodes);
  Fill();
}

int NotesView::OpenCount() const {
  return static_cast<int>(
      std::ranges::count_if(notes_, [](const ReviewNote& note) { return note.state != ReviewState::Done; }));
}

QString NotesView::PlaceOf(const ReviewNote& note) {
  if (note.place.empty()) return tr("The whole setup");
  CYbSEKvfBase* node = NodeOfReviewNote(session_.Document().Root(), note);
  if (!node) return tr("%1 (gone)").arg(ToQt(note.place));
  return ToQt(PlaceNames(session_.Document()).Of(*node, PathOf(*node), ParseSetupPath(note.place).key.name));
}

void NotesView::Fill() {
  const QTreeWidgetItem* current = list_->currentItem();
  const QString chosen = current ? current->data(0, Qt::UserRole).toString() : QString();
  list_->clear();
  for (const ReviewNote& note : notes_) {
    if (filter_->currentData().isValid() && filter_->currentData().toInt() != static_cast<int>(note.state)) continue;
    const auto text = [](const std::string& said) { return ToQt(said).replace('\n', ' '); };
    auto* item = new QTreeWidgetItem(
        list_, {StateText(note.state), PlaceOf(note), text(note.text), ToQt(note.author), ToQt(note.date)});
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

const ReviewNote* NotesView::Chosen() const {
  const QTreeWidgetItem* item = list_->currentItem();
  const std::string name = item ? FromQt(item->data(0, Qt::UserRole).toString()) : std::string();
  const auto found = std::ranges::find(notes_, name, &ReviewNote::name);
  return found == notes_.end() ? nullptr : &*found;
}

void NotesView::SyncButtons() {
  const ReviewNote* note = Chosen();
  for (QToolButton* button : {answer_, done_, remove_}) button->setEnabled(note != nullptr);
  done_->setText(note && note->state == ReviewState::Done ? tr("Open Again") : tr("Done"));
  export_->setEnabled(!notes_.empty());
}

void NotesView::Choose(const QTreeWidgetItem* item) {
  list_->setCurrentItem(const_cast<QTreeWidgetItem*>(item));
  const ReviewNote* note = Chosen();
  if (!note) return;
  if (const CYbSEKvfBase* node = NodeOfReviewNote(session_.Document().Root(), *note); node && !note->place.empty())
    emit NoteChosen(node->Serial(), ToQt(ParseSetupPath(note->place).key.name));
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
  const QString about =
      node.GetParent() ? ToQt(PlaceNames(session_.Document()).Of(node, PathOf(node), key)) : tr("The whole setup");
  NoteDialog dialog(tr("Add Note"), about, program_, window());
  if (dialog.exec() != QDialog::Accepted) return;
  // What was asked for a while may be gone.
  CYbSEKvfBase* now = nullptr;
  WalkNodes(session_.Document().Root(), [&](const NodePlace& place) {
    if (place.node.Serial() == serial) now = &place.node;
  });
  if (!now && !node.GetParent()) now = &session_.Document().Root();
  if (now) Add(*now, key, dialog.Author(), dialog.Text());
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
  const auto found = std::ranges::find(notes_, name, &ReviewNote::name);
  if (found == notes_.end()) return;
  ReviewNote note = *found;
  note.answers.push_back({author, TimeOfNow(), text});
  if (note.state == ReviewState::Open) note.state = ReviewState::Answered;
  PutReviewNote(List(), note);
  Change(note, kDataChanged, "Answer Note");
}

void NotesView::SetState(const std::string& name, ReviewState state) {
  const auto found = std::ranges::find(notes_, name, &ReviewNote::name);
  if (found == notes_.end()) return;
  ReviewNote note = *found;
  note.state = state;
  PutReviewNote(List(), note);
  Change(note, kDataChanged, "Change State of Note");
}

void NotesView::Remove(const std::string& name) {
  const auto found = std::ranges::find(notes_, name, &ReviewNote::name);
  if (found == notes_.end()) return;
  const ReviewNote note = *found;
  if (RemoveReviewNote(List(), name)) Change(note, kDataChanged | kItemDeleted, "Remove Note");
}

void NotesView::AskForAnswer() {
  const ReviewNote* note = Chosen();
  if (!note) return;
  const std::string name = note->name;
  NoteDialog dialog(tr("Answer Note"), ToQt(note->text), program_, window());
  if (dialog.exec() == QDialog::Accepted) Answer(name, dialog.Author(), dialog.Text());
}

void NotesView::Export() {
  const QString path = QFileDialog::getSaveFileName(window(), tr("Export Review Notes"), tr("notes.csv"),
                                                    tr("Tables separated by commas (*.csv)"));
  if (path.isEmpty()) return;
  if (const FileResult result = WriteFileAtomically(FromQt(path), ReviewNotesAsCsv(notes_)); !result.Ok())
    host_.ShowMessage(result.error, Host::Icon::Error);
}

}  // namespace tervane
