// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/text/text_view.h"

#include <QListWidget>
#include <QTextBlock>

#include <gmock/gmock.h>

#include "shell/text/text_colors.h"
#include "tests/shell/next_answer.h"
#include "tests/shell/opened_setup.h"

namespace tervane::text_view_test {
namespace {

using test::OpenedSetup;
using testing::HasSubstr;

constexpr const char* kTitles = "section SimSpec {\nsection SimTitle {\nTitle = \"old\"\nDescription = \"kept\"\n}\n}";

/// A setup with its text shown at the title.
class ShownText : public OpenedSetup {
 public:
  explicit ShownText(std::string_view sections = kTitles, const std::string& path = "SimSpec/SimTitle")
      : OpenedSetup(sections) {
    GoTo(path);
    Command("Text of the Setup");
  }
  TextView& View() { return *Frame().findChild<TextView*>(); }
  SetupText& Text() { return View().Text(); }
  /// All of it, as it is shown.
  std::string Shown() { return FromQt(Text().toPlainText()); }
  bool Shows(const std::string& text) { return Shown().find(text) != std::string::npos; }
  bool ShowsWhatIsHeld() { return Shown() == test::SavedText(Session().Document()); }
  std::string Line() { return FromQt(Text().textCursor().block().text().trimmed()); }
  /// Puts the cursor behind that text in the section of the title.
  void GoBehind(const QString& text) {
    QTextCursor hit = Text().document()->find(text, Text().document()->find("section SimTitle {"));
    ASSERT_FALSE(hit.isNull()) << FromQt(text);
    hit.setPosition(hit.selectionEnd());
    Text().setTextCursor(hit);
  }
  void Keys(const QString& keys) { QTest::keyClicks(&Text(), keys); }
  void Key(Qt::Key key, Qt::KeyboardModifiers modifiers = Qt::NoModifier) {
    QTest::keyClick(&Text(), key, modifiers);
    QApplication::processEvents();
  }
  QStringList Problems() {
    QStringList texts;
    const auto* list = View().findChild<QListWidget*>();
    for (int i = 0; list->isVisible() && i < list->count(); ++i) texts << list->item(i)->text();
    return texts;
  }
};

TEST(TextView, TheTextStandsAtThePageAndThePageAtTheText) {
  ShownText setup;
  EXPECT_EQ(setup.Line(), "section SimTitle {");
  EXPECT_TRUE(setup.ShowsWhatIsHeld());
  EXPECT_TRUE(setup.Text().hasFocus());
  // A page that is chosen in the tree, or that a finding leads to.
  setup.GoTo("SimSpec/ModelComp:WM");
  EXPECT_THAT(setup.Line(), HasSubstr("WM ="));
  setup.GoTo("SimSpec/SimTitle");
  setup.GoBehind("Description");
  setup.Command("Text of the Setup");
  EXPECT_EQ(setup.Frame().CurrentPath(), "SimSpec/SimTitle");
  ASSERT_TRUE(setup.Window().focusWidget());
  EXPECT_FALSE(setup.Text().isVisible());
}

TEST(TextView, WhatIsTypedIsTakenWhenTheLineIsLeftAsAStepOfTheSameUndo) {
  ShownText setup;
  setup.GoBehind("Title = \"");
  setup.Keys("new and ");
  EXPECT_EQ(setup.Value("SimSpec/SimTitle:Title"), "old") << "while it is typed";
  setup.Key(Qt::Key_Down);
  EXPECT_EQ(setup.Value("SimSpec/SimTitle:Title"), "new and old");
  EXPECT_TRUE(setup.Session().IsModified());
  setup.Command("Undo Edit Text");
  EXPECT_EQ(setup.Value("SimSpec/SimTitle:Title"), "old");
  EXPECT_TRUE(setup.Shows("Title = \"old\""));
  setup.Command("Redo Edit Text");
  EXPECT_TRUE(setup.Shows("Title = \"new and old\""));
  // A command takes what is typed with it.
  setup.GoBehind("Title = \"");
  setup.Keys("saved ");
  setup.Command("Save");
  EXPECT_EQ(setup.Value("SimSpec/SimTitle:Title"), "saved new and old");
  EXPECT_FALSE(setup.Session().IsModified());
}

TEST(TextView, AStepOnAPageShowsInTheText) {
  ShownText setup;
  setup.Command("Text of the Setup");
  setup.GoTo("SimSpec/SimTitle:Title");
  setup.Type("of the page");
  setup.Command("Text of the Setup");
  EXPECT_TRUE(setup.Shows("Title = \"of the page\""));
  setup.Frame().Undo();
  EXPECT_TRUE(setup.Shows("Title = \"old\""));
}

TEST(TextView, WhatCannotBeTakenIsToldAtItsLineAndStays) {
  ShownText setup;
  setup.GoBehind("Title = \"old");
  const int line = setup.Text().textCursor().blockNumber() + 1;
  setup.Key(Qt::Key_Delete);
  // While one types.
  EXPECT_TRUE(QTest::qWaitFor([&setup] { return !setup.Problems().isEmpty(); }));
  ASSERT_EQ(setup.Problems().size(), 1);
  EXPECT_THAT(FromQt(setup.Problems().front()), HasSubstr("Line " + std::to_string(line) + ": "));
  setup.Key(Qt::Key_Down);
  EXPECT_EQ(setup.Value("SimSpec/SimTitle:Title"), "old");
  EXPECT_TRUE(setup.Shows("Title = \"old\n"));
  // Undo takes the typing back before any step.
  setup.Command("Undo");
  EXPECT_TRUE(setup.Problems().isEmpty());
  EXPECT_FALSE(setup.View().HasTyping());

  setup.GoBehind("Title = \"old\"");
  setup.Key(Qt::Key_Return);
  setup.Keys("Subtitle = 3");
  setup.Key(Qt::Key_Up);
  ASSERT_EQ(setup.Problems().size(), 1);
  EXPECT_THAT(FromQt(setup.Problems().front()), HasSubstr("the setup has no key Subtitle here"));
  EXPECT_TRUE(setup.Shows("Subtitle = 3"));
  setup.View().Drop();
  EXPECT_TRUE(setup.Problems().isEmpty());
  EXPECT_TRUE(setup.ShowsWhatIsHeld());
}

TEST(TextView, ANewSectionIsTypedLineByLineAndTakenWhenItIsWhole) {
  ShownText setup(
      "section Species {\nYbSEKvfListItemCount = 0\n}\nsection SimSpec {\nsection ModelComp {\nWQ = 1\n}\n}");
  setup.GoTo("Species");
  setup.Text().GoToLine(setup.Text().textCursor().blockNumber());
  setup.Key(Qt::Key_End);
  setup.Key(Qt::Key_Return);
  setup.Keys("section Species_1 {");
  setup.Key(Qt::Key_Return);
  setup.Keys("Name = \"Nitrate\"");
  setup.Key(Qt::Key_Return);
  EXPECT_EQ(setup.Value("Species/Species_1:Name"), "");
  setup.Keys("}");
  setup.Key(Qt::Key_Down);
  EXPECT_EQ(setup.Value("Species/Species_1:Name"), "Nitrate");
  EXPECT_TRUE(setup.Problems().isEmpty()) << FromQt(setup.Problems().join(", "));
  EXPECT_TRUE(setup.ShowsWhatIsHeld()) << "with all keys of the new section";
}

TEST(TextView, WhatIsNotTakenOutlivesOtherColoursAndIsAskedForBeforeItIsLost) {
  ShownText setup;
  setup.GoBehind("Title = \"old");
  setup.Key(Qt::Key_Delete);
  setup.Key(Qt::Key_Down);
  setup.Frame().Redraw();
  QApplication::processEvents();
  EXPECT_TRUE(setup.Text().isVisible());
  EXPECT_TRUE(setup.Shows("Title = \"old\n"));
  EXPECT_EQ(setup.Problems().size(), 1);
  {
    test::NextAnswer no("No");
    EXPECT_FALSE(setup.Window().CloseTab(&setup.Frame()));
    EXPECT_THAT(no.Text(), HasSubstr("lines that the setup has not taken"));
  }
  EXPECT_TRUE(setup.Shows("Title = \"old\n"));
  setup.View().Drop();
  EXPECT_TRUE(setup.ShowsWhatIsHeld());
}

TEST(TextView, SectionsFoldAndOpenForAPlaceWithin) {
  ShownText setup;
  const int title = setup.Text().textCursor().blockNumber();
  setup.Text().GoToLine(title);
  setup.Key(Qt::Key_Period, Qt::ControlModifier);
  EXPECT_TRUE(setup.Text().IsFolded(title));
  EXPECT_FALSE(setup.Text().document()->findBlockByNumber(title + 2).isVisible());
  setup.Text().GoToLine(title + 2);
  EXPECT_TRUE(setup.Text().document()->findBlockByNumber(title + 2).isVisible());
  setup.Text().FoldAll(true);
  EXPECT_FALSE(setup.Text().document()->findBlockByNumber(title).isVisible());
  setup.Text().FoldAll(false);
  for (QTextBlock block = setup.Text().document()->firstBlock(); block.isValid(); block = block.next())
    ASSERT_TRUE(block.isVisible()) << block.blockNumber();
}

TEST(TextView, FindsOnFromTheCursorAndRoundTheEnd) {
  ShownText setup;
  setup.Command("Find…");
  setup.Type("description");
  EXPECT_THAT(setup.Line(), HasSubstr("Description = \"kept\""));
  const int first = setup.Text().textCursor().blockNumber();
  setup.Type("YbSEKvfListItemCount");
  setup.Press(Qt::Key_Return);
  setup.Press(Qt::Key_Return, Qt::ShiftModifier);
  EXPECT_GT(setup.Text().textCursor().blockNumber(), first);
  setup.Press(Qt::Key_Escape);
  EXPECT_TRUE(setup.Text().hasFocus());
}

TEST(TextView, ColoursStandOutFromTheGround) {
  const auto luminance = [](const QColor& color) {
    const auto part = [](double c) { return c <= 0.04045 ? c / 12.92 : std::pow((c + 0.055) / 1.055, 2.4); };
    return 0.2126 * part(color.redF()) + 0.7152 * part(color.greenF()) + 0.0722 * part(color.blueF());
  };
  for (const bool isDark : {false, true}) {
    const TextColors colors = TextColors::Of(isDark);
    const double ground = luminance(isDark ? QColor("#24282c") : QColor("#ffffff"));
    for (const QColor& color : {colors.section, colors.text, colors.number, colors.comment, colors.quiet}) {
      const double other = luminance(color);
      EXPECT_GE((std::max(ground, other) + 0.05) / (std::min(ground, other) + 0.05), 4.5) << FromQt(color.name());
    }
  }
}

}  // namespace
}  // namespace tervane::text_view_test
