// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/page/page_view.h"

#include <QAbstractButton>
#include <QComboBox>
#include <QGroupBox>
#include <QPlainTextEdit>
#include <QScrollArea>
#include <QScrollBar>
#include <QTableView>
#include <algorithm>
#include <optional>

#include <gmock/gmock.h>

#include "shell/maps/map_canvas.h"
#include "shell/widgets/shown_language.h"
#include "shell/widgets/theme.h"
#include "tests/shell/cut_texts.h"
#include "tests/shell/opened_setup.h"
#include "tests/shell/rich_setups.h"
#include "tests/support/preprocessed_run.h"

namespace tervane::page_view_test {
namespace {

using test::OpenedSetup;

TEST(PageView, ANumberThatIsNoneStaysInItsFieldAndNeverReachesTheNode) {
  const struct {
    const char *typed, *value, *shown, *message;
  } cases[] = {
      {"0.25", "0.25", "0.25", ""},   {"1 day", "24", "24", ""},       {"abc", "6", "abc", "number"},
      {"5 km", "6", "5 km", "hours"}, {"1e99", "6", "1e99", "number"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.typed);
    OpenedSetup setup;
    setup.GoTo("SimSpec/CompControlParaTimeStep:InitialTimeStep");
    auto* field = setup.Focused<QLineEdit>();
    setup.Type(c.typed);
    setup.Press(Qt::Key_Return);
    EXPECT_EQ(setup.Value("SimSpec/CompControlParaTimeStep:InitialTimeStep"), c.value);
    EXPECT_EQ(field->text(), c.shown);
    EXPECT_EQ(setup.Shows("Not taken"), *c.message != '\0');
    EXPECT_TRUE(setup.Shows(c.message));
    EXPECT_EQ(setup.Session().IsModified(), *c.message == '\0');
    // Escape takes the node's value back.
    setup.Press(Qt::Key_Escape);
    EXPECT_EQ(field->text().toStdString(), c.value);
    EXPECT_FALSE(setup.Shows("Not taken"));
  }
}

TEST(PageView, AValueOutsideItsListIsShownAndSaid) {
  OpenedSetup setup("section SimSpec {\nsection ModelComp {\nUZ_ModelType = 9\n}\n}");
  setup.GoTo("SimSpec:UZ_ModelType");
  auto* list = setup.Focused<QComboBox>();
  EXPECT_EQ(list->currentText(), "9 (not in the list)");
  EXPECT_TRUE(setup.Shows("not in the list"));
  EXPECT_FALSE(setup.Session().IsModified());
  setup.Press(Qt::Key_Home);
  setup.Press(Qt::Key_Return);
  EXPECT_EQ(setup.Value("SimSpec/ModelComp:UZ_ModelType"), "0");
  EXPECT_FALSE(setup.Shows("not in the list"));
  EXPECT_EQ(list->count(), 3);
}

TEST(PageView, KeysCountThePartOfADateThatTheCursorStandsIn) {
  OpenedSetup setup;
  setup.GoTo("SimSpec/SimulationPeriod:SIMEND");
  auto* field = setup.Focused<QLineEdit>();
  ASSERT_EQ(field->text(), "2000/02/01  00:00");
  const struct {
    int cursor;
    Qt::Key key;
    const char* shown;
  } steps[] = {{0, Qt::Key_Up, "2001/02/01  00:00"},
               {6, Qt::Key_Down, "2001/01/01  00:00"},
               {9, Qt::Key_Down, "2000/12/31  00:00"},
               {13, Qt::Key_Up, "2000/12/31  01:00"},
               {16, Qt::Key_Down, "2000/12/31  00:59"}};
  for (const auto& step : steps) {
    field->setCursorPosition(step.cursor);
    setup.Press(step.key);
    EXPECT_EQ(field->text(), step.shown);
    EXPECT_EQ(field->cursorPosition(), step.cursor);
  }
  EXPECT_EQ(setup.Value("SimSpec/SimulationPeriod:SIMEND"), "2000, 12, 31, 0, 59");
}

TEST(PageView, WhatIsTypedIsEnteredBeforeACommandAndWhenAnotherPageIsShown) {
  OpenedSetup setup;
  setup.GoTo("SimSpec/SimTitle:Title");
  setup.Type("Karup");
  setup.Command("Save");
  EXPECT_THAT(test::ReadFile(setup.Path()), testing::HasSubstr("Title = \"Karup\""));
  setup.Type("Skjern");
  setup.GoTo("SimSpec");
  EXPECT_EQ(setup.Value("SimSpec/SimTitle:Title"), "Skjern");
  setup.GoTo("SimSpec/SimTitle:Description");
  setup.Focused<QPlainTextEdit>()->insertPlainText("two\nlines");
  setup.GoTo("SimSpec");
  EXPECT_EQ(setup.Value("SimSpec/SimTitle:Description"), "two\nlines");
}

// ---- Arrangement

PageView& ShownPage(OpenedSetup& setup) {
  // Pages that were left may not be deleted yet.
  const auto all = setup.Frame().findChildren<PageView*>();
  return **std::ranges::find_if(all, &PageView::isVisible);
}

TEST(PageView, TheWidthAlonePutsAMapBesideOrBelowTheForm) {
  OpenedSetup setup("section Topography {\nType = 2\n}");
  setup.GoTo("Topography");
  const struct {
    QSize window;
    bool isBeside;
  } cases[] = {{{1280, 800}, true},  {{1280, 560}, true}, {{900, 600}, false},
               {{900, 1100}, false}, {{800, 500}, false}, {{1920, 1080}, true}};
  for (const auto& c : cases) {
    SCOPED_TRACE(FromQt(QString("%1x%2").arg(c.window.width()).arg(c.window.height())));
    setup.Window().resize(c.window);
    QApplication::processEvents();
    PageView& page = ShownPage(setup);
    const auto placeOf = [&page](const QWidget& widget) { return QRect(widget.mapTo(&page, QPoint()), widget.size()); };
    const QRect map = placeOf(*page.findChild<MapCanvas*>());
    const QRect field = placeOf(*page.findChild<QComboBox*>());
    EXPECT_EQ(setup.Window().size(), c.window) << "nothing needs a larger window";
    if (c.isBeside) {
      EXPECT_GT(map.left(), field.right());
      EXPECT_GT(map.width(), page.width() * 2 / 5) << "what the form does not need";
    } else {
      EXPECT_GT(map.top(), field.bottom());
      EXPECT_GT(map.height(), 200) << "whatever height there is, for the page scrolls";
    }
  }
}

TEST(PageView, AHiddenTableLeavesItsRoom) {
  OpenedSetup setup("section LandUse {\nsection Vegetation {\nsection GLOBAL {\nTYPE = 3\n}\n}\n}");
  setup.GoTo("LandUse/Vegetation:TYPE");
  const auto* table = ShownPage(setup).findChild<QTableView*>();
  EXPECT_GT(table->height(), 200);
  setup.Press(Qt::Key_Home);
  setup.Press(Qt::Key_Return);
  ASSERT_FALSE(table->isVisible());
  QApplication::processEvents();
  const auto buttons = ShownPage(setup).findChildren<QAbstractButton*>();
  const auto parameters = std::ranges::find_if(
      buttons, [](const QAbstractButton* button) { return button->text().startsWith("ET parameters"); });
  ASSERT_NE(parameters, buttons.end());
  EXPECT_LT((*parameters)->mapTo(&ShownPage(setup), QPoint()).y(), 300);
}

/// What the Tab key comes to on a page, in its order.
std::vector<QWidget*> TabChain(PageView& page) {
  std::vector<QWidget*> chain;
  QWidget* widget = &page;
  while ((widget = widget->nextInFocusChain()) != &page) {
    const bool takesTab = (widget->focusPolicy() & Qt::TabFocus) && !widget->focusProxy();
    if (page.isAncestorOf(widget) && takesTab && widget->isVisibleTo(&page) && widget->isEnabled())
      chain.push_back(widget);
  }
  return chain;
}

/// Pairs that Tab comes to in another order than they are read: from the top down, in a row from the left.
std::string OrderFaults(PageView& page) {
  const auto nameOf = [](const QWidget& widget) {
    return widget.metaObject()->className() + std::string(" ") + FromQt(widget.accessibleName());
  };
  /// The parts of the nearest common ancestor in which two widgets stand.
  const auto placesOf = [](const QWidget& a, const QWidget& b) {
    const QWidget *partOfA = &a, *partOfB = &b;
    while (!partOfA->parentWidget()->isAncestorOf(&b)) partOfA = partOfA->parentWidget();
    while (!partOfB->parentWidget()->isAncestorOf(&a)) partOfB = partOfB->parentWidget();
    return std::pair(partOfA->geometry(), partOfB->geometry());
  };
  std::string faults;
  const std::vector<QWidget*> chain = TabChain(page);
  for (std::size_t i = 0; i < chain.size(); ++i)
    for (std::size_t k = i + 1; k < chain.size(); ++k) {
      if (chain[i]->isAncestorOf(chain[k]) || chain[k]->isAncestorOf(chain[i])) continue;
      const auto [first, second] = placesOf(*chain[i], *chain[k]);
      const bool isInRow = first.top() < second.center().y() && second.top() < first.center().y();
      if (isInRow ? second.right() <= first.left() : second.bottom() <= first.top())
        faults += nameOf(*chain[i]) + " before " + nameOf(*chain[k]) + "\n";
    }
  return faults;
}

TEST(PageView, TheTabKeyFollowsTheLookOfEveryPage) {
  std::size_t count = 0;
  for (const char* sections : test::kRichSetups) {
    OpenedSetup setup(sections);
    for (const std::string& path : test::PagesOf(setup, kSetupDataTree)) {
      SCOPED_TRACE(path);
      setup.GoTo(path);
      for (int i = 0; i < 3; ++i) QApplication::processEvents();
      EXPECT_EQ(OrderFaults(ShownPage(setup)), "");
      count += TabChain(ShownPage(setup)).size();
    }
  }
  EXPECT_GT(count, 500U);
}

// ---- Pictures

/// What is cut or lies over something else on the page that is shown.
std::string Faults(PageView& page, bool mayBeScrolled) {
  std::string faults = test::CutTexts(page);
  if (!mayBeScrolled && page.findChild<QScrollArea*>()->horizontalScrollBar()->maximum() > 0)
    faults += "the page is wider than its place\n";
  return faults;
}

TEST(PageView, NoPageHasACutLabelOrControlsOverEachOther) {
  const struct {
    double zoom;
    QSize window;
    const char* language;
  } cases[] = {{1, {1280, 800}, "en"},   {1.5, {1280, 800}, "en"}, {1, {900, 600}, "en"}, {2, {1280, 800}, "en"},
               {1, {1280, 800}, "long"}, {1, {1280, 800}, "de"},   {1, {900, 600}, "de"}};
  for (const auto& [zoom, window, language] : cases) {
    const bool isLong = std::string_view(language) == "long";
    const ShownLanguage shown(isLong ? "en" : language);
    std::optional<test::LongTexts> texts;
    if (isLong) texts.emplace();
    Theme::Get().SetZoom(zoom);
    // At the largest zoom, and with long words in a small window, a few pages are scrolled sideways.
    const bool mayBeScrolled = zoom >= 2 || (window.width() < 1000 && std::string_view(language) != "en");
    for (const char* sections : test::kRichSetups) {
      OpenedSetup setup(sections, window);
      test::WritePreprocessedRun(setup.Folder().File("karup_results"), "karup");
      setup.Frame().RebuildProcessedData();
      int count = 0;
      std::vector<std::string> paths;
      const auto add = [&](int tree) {
        const std::vector<std::string> pages = test::PagesOf(setup, tree);
        paths.insert(paths.end(), pages.begin(), pages.end());
      };
      add(kSetupDataTree);
      // What the preprocessor left is the same of all setups.
      if (sections == test::kRichSetups[0]) add(kProcessedDataTree);
      if (sections == test::kRichSetups[0]) add(kResultsTree);
      paths.emplace_back("CCoverageKvf");
      for (const std::string& path : paths) {
        SCOPED_TRACE(path + " at " + std::to_string(zoom) + ", " + language);
        setup.GoTo(path);
        QApplication::processEvents();
        // Layouts within layouts settle one after the other.
        for (int i = 0; i < 3; ++i) QApplication::processEvents();
        EXPECT_EQ(Faults(ShownPage(setup), mayBeScrolled), "");
        ++count;
      }
      EXPECT_GT(count, 5);
    }
  }
  Theme::Get().SetZoom(1);
}

}  // namespace
}  // namespace tervane::page_view_test
