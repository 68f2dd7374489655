// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Much at once, and the same for very long.
#include <QTabWidget>

#include <gmock/gmock.h>
#include <malloc.h>

#include "platform/files.h"
#include "tests/shell/opened_setup.h"

namespace tervane::long_work_test {
namespace {

using test::OpenedSetup;

TEST(LongWork, AHundredSetupsAreOpenAndEachIsItself) {
  OpenedSetup setup;
  for (int number = 1; number < 100; ++number) {
    const std::string title = std::to_string(number);
    const std::string path = setup.Folder().Write(
        "setup" + title + ".tvd",
        test::SetupText(14, "section SimSpec {\nsection SimTitle {\nTitle = \"" + title + "\"\n}\n}"));
    ASSERT_TRUE(setup.Window().OpenDocument(ToQt(path)));
  }
  auto* tabs = setup.Window().findChild<QTabWidget*>();
  ASSERT_EQ(tabs->count(), 100);
  for (int number = 99; number > 0; number -= 7) {
    tabs->setCurrentIndex(number);
    EXPECT_EQ(setup.Value("SimSpec/SimTitle:Title"), std::to_string(number));
    setup.GoTo("SimSpec/SimTitle:Title");
    setup.Type("changed");
    setup.Command("Save");
    EXPECT_EQ(setup.Value("SimSpec/SimTitle:Title"), "changed");
  }
  while (tabs->count() > 1) setup.Command("Close");
  EXPECT_EQ(setup.Path(), setup.Session().Path());
}

/// Bytes that the allocator has handed out, when all that waits to be deleted is.
std::size_t Taken() {
  for (int i = 0; i < 3; ++i) {
    QApplication::processEvents();
    QApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
  }
  return mallinfo2().uordblks;
}

TEST(LongWork, TakesNoMoreMemoryTheLongerItGoesOn) {
  OpenedSetup setup;
  int number = 0;
  const auto work = [&] {
    for (const char* page : {"Climate/PrecipitationRate", "SimSpec", "SaturatedZone", "Catchment", "StoringOfResults"})
      setup.GoTo(page);
    setup.GoTo("SimSpec/SimTitle:Title");
    setup.Type(QString::number(++number));
    setup.Press(Qt::Key_Return);
    setup.Command("Text of the Setup");
    setup.Command("Text of the Setup");
    setup.Frame().Undo();
    setup.Frame().Redo();
    setup.Frame().Undo();
    if (number % 5 == 0) setup.Command("Save");
  };
  // Caches fill, and the list of visited pages.
  for (int i = 0; i < 40; ++i) work();
  const std::size_t before = Taken();
  constexpr int kRounds = 40;
  for (int i = 0; i < kRounds; ++i) work();
  const std::size_t after = Taken();
  // A page, a text or an open file that stays behind takes hundreds of thousands.
  EXPECT_LT(after, before + kRounds * 30'000);
}

}  // namespace
}  // namespace tervane::long_work_test
