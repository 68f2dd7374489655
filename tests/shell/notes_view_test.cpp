// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/notes_view.h"

#include <QPlainTextEdit>
#include <QTabWidget>
#include <QTimer>
#include <QTreeWidget>

#include <gmock/gmock.h>

#include "core/list.h"
#include "forms/page_form.h"
#include "shell/node_tree.h"
#include "tests/shell/opened_setup.h"

namespace tervane::notes_view_test {
namespace {

using test::OpenedSetup;

class NotedSetup : public OpenedSetup {
 public:
  NotedSetup() : OpenedSetup("section SimSpec {\nsection SimTitle {\nTitle = \"old\"\n}\n}") {}
  NotesView& View() { return *Frame().findChild<NotesView*>(); }
  QTreeWidget& List() { return *View().findChild<QTreeWidget*>(); }
  std::string Row(int row) {
    const QTreeWidgetItem* item = List().topLevelItem(row);
    QStringList cells;
    for (int column = 0; item && column < 4; ++column) cells << item->text(column);
    return FromQt(cells.join(" | "));
  }
  /// Fills the dialog that opens next.
  static void AnswerNext(const QString& text, const QString& author) {
    QTimer::singleShot(0, [text, author] {
      auto* dialog = qobject_cast<NoteDialog*>(QApplication::activeModalWidget());
      ASSERT_TRUE(dialog);
      dialog->findChild<QPlainTextEdit*>()->setPlainText(text);
      dialog->findChild<QLineEdit*>()->setText(author);
      dialog->accept();
    });
  }
  QString TabText() {
    for (const QTabWidget* tabs : Frame().findChildren<QTabWidget*>())
      if (tabs->indexOf(&View()) >= 0) return tabs->tabText(tabs->indexOf(&View()));
    return {};
  }
};

TEST(NotesView, ANoteAtTheFieldWithTheKeyboardIsAStepThatIsMarkedListedAndUndone) {
  NotedSetup setup;
  setup.GoTo("SimSpec/SimTitle:Title");
  NotedSetup::AnswerNext("  Which Karup?\n", "Anna");
  setup.Command("Add Note…");
  EXPECT_EQ(setup.Row(0),
            "Open | Simulation specification > Simulation title > Simulation Title | Which Karup? | Anna");
  EXPECT_EQ(setup.TabText(), "Notes (1)");
  const auto marks = [&setup] {
    int shown = 0;
    for (const QLabel* label : setup.Frame().findChildren<QLabel*>())
      shown += label->isVisible() && label->accessibleName().startsWith("Review note: Which Karup? (Anna, ");
    return shown;
  };
  EXPECT_EQ(marks(), 1);
  setup.Command("Undo Add Note");
  EXPECT_EQ(setup.List().topLevelItemCount(), 0);
  EXPECT_EQ(marks(), 0);
  setup.Command("Redo Add Note");
  EXPECT_EQ(marks(), 1);
  // The next one is by the same, and what was typed before it is kept.
  EXPECT_EQ(NoteDialog("", "", setup.Program(), nullptr).Author(), "Anna");
}

TEST(NotesView, NotesAreAnsweredClosedFilteredAndLeadToTheirPlace) {
  NotedSetup setup;
  CYbSEKvfBase& title = *FindNode(setup.Session().Document().Root(), ParseSetupPath("SimSpec/SimTitle").steps);
  setup.View().Add(title, "", "Anna", "A better title");
  setup.View().Add(*title.GetParent(), "", "Bo", "Which components?");
  ASSERT_EQ(setup.View().Notes().size(), 2U);
  const std::string name = setup.View().Notes()[0].note.name;
  setup.View().Answer(name, "Bo", "Yes");
  EXPECT_THAT(setup.Row(0), testing::StartsWith("Answered | "));
  EXPECT_EQ(setup.List().topLevelItem(0)->child(0)->text(2), "Yes");
  setup.View().SetState(name, ReviewState::Done);
  EXPECT_EQ(setup.TabText(), "Notes (1)");
  setup.Command("Undo Change State of Note");
  EXPECT_EQ(setup.TabText(), "Notes (2)");

  setup.GoTo("Climate");
  emit setup.List().itemActivated(setup.List().topLevelItem(0), 0);
  EXPECT_EQ(setup.Frame().CurrentPath(), "SimSpec/SimTitle");
  QApplication::processEvents();
  EXPECT_TRUE(setup.Shows("A better title")) << "below the page";
  setup.View().Remove(name);
  EXPECT_FALSE(setup.Shows("A better title"));
  // With the setup they are saved and read again.
  setup.Command("Save");
  CFlowModelDoc again;
  ASSERT_TRUE(again.OnOpenDocument(setup.Path()));
  const std::vector<ReviewNote> kept = ReviewNotesOf(*again.Root().Child<CExtraParamsKvf>());
  ASSERT_EQ(kept.size(), setup.View().Notes().size());
  EXPECT_EQ(kept[0], setup.View().Notes()[0].note);
}

TEST(NotesView, ANoteFollowsAnItemThatIsMovedOrRenamedAndStaysBehindOneThatIsGone) {
  OpenedSetup setup(
      "section Species {\nYbSEKvfListItemCount = 2\nNumberOfSpecies = 2\nsection Species_1 {\nName = \"Nitrate\"\n}\n"
      "section Species_2 {\nName = \"Phosphate\"\n}\n}");
  auto& view = *setup.Frame().findChild<NotesView*>();
  CYbSEKvfBase& root = setup.Session().Document().Root();
  const auto at = [&root](const char* path) { return FindNode(root, ParseSetupPath(path).steps); };
  view.Add(*at("Species/Species_2"), "Name", "Anna", "which one?");
  auto* list = dynamic_cast<CYbSEKvfListBaseInterface*>(at("Species"));
  list->DeleteItem(1, 1);
  setup.Session().UpdateDoc(*list, kItemDeleted, "Delete Row");
  EXPECT_EQ(view.Notes().front().note.place, "Species/Species_1:Name");
  setup.Session().Undo();
  EXPECT_EQ(view.Notes().front().note.place, "Species/Species_2:Name");
  setup.Session().Redo();
  list->DeleteItem(1, 1);
  setup.Session().UpdateDoc(*list, kItemDeleted, "Delete Row");
  ASSERT_EQ(view.Notes().size(), 1U);
  EXPECT_EQ(view.Notes().front().serial, 0U);
}

}  // namespace
}  // namespace tervane::notes_view_test
