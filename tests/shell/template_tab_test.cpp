// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/template_tab.h"

#include <QPlainTextEdit>
#include <QPushButton>
#include <QTabWidget>
#include <QTableView>

#include <gmock/gmock.h>

#include "core/path.h"
#include "tests/shell/next_answer.h"
#include "tests/shell/opened_setup.h"
#include "wqpt/kinetra_specification.h"
#include "wqpt/species.h"

namespace tervane::template_tab_test {
namespace {

using test::NextAnswer;
using testing::ElementsAre;
using testing::HasSubstr;

std::string TemplateWith(const std::string& variables) {
  std::string text = "target KINETRA_SETUP {\nsection STATE_VARIABLES {\n";
  int number = 0;
  for (const char symbol : variables)
    text += "section STATE_VARIABLE_" + std::to_string(++number) + " {\nSYMBOL = \"" + symbol + "\"\n}\n";
  return text + "}\n}\n";
}

/// A window with a setup that takes the template `a.kinetra` over ground.
class TemplateOfSetup : public testing::Test {
 protected:
  TemplateOfSetup()
      : setup_(
            "section SimSpec {\nsection ModelComp {\nWQ = 1\n}\n}\nsection ModelCompWQ {\nOL = 1\n"
            "IncludeProcesses = 1\nProcessType = 1\n}\nsection KinetraTemplateSpecification {\nKinetra_OL = 1\n}\n"),
        path_(setup_.Folder().Write("a.kinetra", TemplateWith("A"))) {
    Templates().SetTemplate(kKinetraOverland, FileName("a.kinetra", setup_.Folder().Path()), true);
    setup_.Session().UpdateDoc(Templates(), kTreeRebuilt | kDataChanged, "Choose Template");
  }
  CKinetraSpecKvf& Templates() { return *setup_.Session().Document().Root().Important(kKinetraSpecification); }
  std::vector<std::string> Species() { return setup_.Session().Document().Root().Important(kSpecies)->Names(); }
  TemplateTab* Tab() { return setup_.Window().findChild<TemplateTab*>(); }
  void Click(const QString& text) {
    for (QAbstractButton* button : setup_.Frame().findChildren<QAbstractButton*>())
      if (button->isVisible() && QString(button->text()).remove('&') == text) return button->click();
    ADD_FAILURE() << "no button " << FromQt(text);
  }

  test::OpenedSetup setup_;
  const std::string path_;
};

TEST_F(TemplateOfSetup, IsShownInATabOfItsOwnWithItsText) {
  setup_.GoTo("KinetraTemplateSpecification");
  Click("Edit...");
  ASSERT_TRUE(Tab());
  auto* tabs = setup_.Window().findChild<QTabWidget*>();
  EXPECT_EQ(tabs->currentWidget(), Tab());
  EXPECT_EQ(Tab()->Title(), "a.kinetra");
  auto& rows = *Tab()->findChild<QTableView*>()->model();
  EXPECT_EQ(rows.rowCount(), 1);
  auto& text = *Tab()->findChild<QPlainTextEdit*>();
  EXPECT_THAT(FromQt(text.toPlainText()), HasSubstr("SYMBOL = \"A\""));
  // Another program writes it.
  setup_.Folder().Write("a.kinetra", TemplateWith("AB"));
  Tab()->Reload();
  EXPECT_EQ(Tab()->findChild<QTableView*>()->model()->rowCount(), 2);
  EXPECT_THAT(FromQt(text.toPlainText()), HasSubstr("SYMBOL = \"B\""));
  EXPECT_TRUE(setup_.Window().OpenFile(ToQt(path_)));
  EXPECT_EQ(tabs->count(), 2) << "opened once";

  const NextAnswer ok("OK");
  EXPECT_FALSE(setup_.Window().OpenFile(ToQt(setup_.Folder().Write("b.kinetra", "target {"))));
  EXPECT_THAT(ok.Text(), HasSubstr("b.kinetra:"));
}

TEST_F(TemplateOfSetup, AChangeOnDiskIsOfferedAndTakenAsOneStep) {
  setup_.GoTo("KinetraTemplateSpecification");
  setup_.Frame().CheckTemplates();
  EXPECT_FALSE(setup_.Shows("has changed on disk"));
  setup_.Folder().Write("a.kinetra", TemplateWith("ABC"));
  setup_.Frame().CheckTemplates();
  QApplication::processEvents();
  EXPECT_TRUE(setup_.Shows("The template a.kinetra has changed on disk."));
  // Nothing is taken until the user says so, whatever else is edited meanwhile.
  setup_.Command("Undo Choose Template");
  setup_.Command("Redo Choose Template");
  EXPECT_THAT(Species(), ElementsAre("A"));
  Click("Not Now");
  setup_.Frame().CheckTemplates();
  EXPECT_THAT(Species(), ElementsAre("A"));

  Click("Refresh");  // Of the page.
  EXPECT_THAT(Species(), ElementsAre("A", "B", "C"));
  setup_.Frame().CheckTemplates();
  QApplication::processEvents();
  EXPECT_FALSE(setup_.Shows("has changed on disk"));
  setup_.Command("Undo Refresh Templates");
  EXPECT_THAT(Species(), ElementsAre("A"));
}

}  // namespace
}  // namespace tervane::template_tab_test
