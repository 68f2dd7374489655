// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/why_dialog.h"

#include <QPushButton>
#include <QSignalSpy>
#include <QTreeWidget>

#include <gtest/gtest.h>

namespace tervane::why_dialog_test {
namespace {

TEST(WhyDialogTest, ShowsReasonsAndLeadsToWhatDecides) {
  const Explanation snow{"Snow Melt",
                         false,
                         {{false, "Include snow melt must be on", "Climate", 7, "Climate", "SM"},
                          {false, "must be so: a decay process depends on temperature", "", 0, "", ""}}};
  WhyDialog dialog("Why Is This Here?", {snow, {"Topography", true, {}}}, "takes part, since", "takes no part, since",
                   nullptr);
  auto* list = dialog.findChild<QTreeWidget*>();
  ASSERT_EQ(list->topLevelItemCount(), 2);
  EXPECT_EQ(list->topLevelItem(0)->text(0), "Snow Melt takes no part, since");
  ASSERT_EQ(list->topLevelItem(0)->childCount(), 2);
  EXPECT_EQ(list->topLevelItem(0)->child(0)->text(1), "Climate");
  EXPECT_EQ(list->topLevelItem(1)->childCount(), 1) << "what depends on nothing says so";

  QPushButton* show = nullptr;
  for (QPushButton* button : dialog.findChildren<QPushButton*>())
    if (button->text() == "&Show on Its Page") show = button;
  ASSERT_NE(show, nullptr);
  const QSignalSpy chosen(&dialog, &WhyDialog::Chosen);
  list->setCurrentItem(list->topLevelItem(0)->child(1));
  EXPECT_FALSE(show->isEnabled()) << "no page decides a sentence";
  list->setCurrentItem(list->topLevelItem(0)->child(0));
  show->click();
  ASSERT_EQ(chosen.size(), 1);
  EXPECT_EQ(chosen[0][0].toULongLong(), 7U);
  EXPECT_EQ(chosen[0][1].toString(), "SM");
}

}  // namespace
}  // namespace tervane::why_dialog_test
