// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/library_dialog.h"

#include <QDialogButtonBox>
#include <QLabel>
#include <QLineEdit>
#include <QListWidget>
#include <QPushButton>

#include <gmock/gmock.h>

#include "libraries/vegetations.h"
#include "shell/widgets/qt_text.h"
#include "tests/support/page_driver.h"
#include "tests/support/temp_folder.h"

namespace tervane::library_dialog_test {
namespace {

using testing::HasSubstr;

TEST(LibraryDialog, OffersTheEntriesAndRefusesWhatIsNoLibrary) {
  const test::TempFolder folder;
  const std::string crops = TERVANE_SOURCE_DIR "/examples/crops.etv";
  const std::string wrong = folder.Write("wrong.etv", "target OTHER {\n}\n");
  const std::string empty =
      folder.Write("empty.etv", "target TERVANE_VEGETATION {\nsection Vegetation_1 {\nName = \"Maize\"\n}\n}\n");
  test::ScriptedHost host;
  LibraryDialog dialog({kVegetationLibrary, crops, "Maize"}, host, nullptr);
  auto* list = dialog.findChild<QListWidget*>();
  auto* file = dialog.findChild<QLineEdit*>();
  auto* ok = dialog.findChild<QDialogButtonBox*>()->button(QDialogButtonBox::Ok);
  const auto tells = [&] {
    std::string text;
    for (const QLabel* label : dialog.findChildren<QLabel*>())
      if (!label->isHidden()) text += FromQt(label->text()) + "\n";
    return text;
  };
  EXPECT_EQ(dialog.Chosen(), (Host::LibraryChoice{crops, "Maize"}));
  EXPECT_TRUE(ok->isEnabled());
  list->setCurrentRow(0);
  EXPECT_EQ(dialog.Chosen().entry, "Winter wheat");

  file->setText(ToQt(wrong));
  emit file->editingFinished();
  EXPECT_EQ(list->count(), 0);
  EXPECT_FALSE(ok->isEnabled());
  EXPECT_THAT(tells(), HasSubstr("wrong.etv is no vegetation property file"));

  for (QPushButton* button : dialog.findChildren<QPushButton*>()) {
    if (!button->text().contains("Browse")) continue;
    host.Expect("Open", std::optional(empty));
    button->click();
  }
  EXPECT_TRUE(host.IsDone());
  EXPECT_EQ(dialog.Chosen(), (Host::LibraryChoice{empty, "Maize"}));
  EXPECT_FALSE(ok->isEnabled());
  EXPECT_THAT(tells(), HasSubstr("it has no stages"));
}

}  // namespace
}  // namespace tervane::library_dialog_test
