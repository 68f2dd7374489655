// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <QApplication>
#include <QPushButton>
#include <QTest>
#include <QTextBrowser>

#include <gmock/gmock.h>

#include "document/flow_model_document.h"
#include "shell/page/page_view.h"
#include "shell/widgets/qt_text.h"
#include "tests/support/temp_folder.h"

namespace tervane::report_widget_test {
namespace {

using testing::HasSubstr;

class BrowsingHost : public NobodyToAsk {
 public:
  void OpenBrowser(const std::string& address) override { opened.push_back(address); }
  std::vector<std::string> opened;
};

class ReportPage : public CYbSEDlgBase {
 public:
  ReportPage(CYbSEKvfBase& node, const PageContext& context) : CYbSEDlgBase(node, context) {}
  std::string path;

 protected:
  void Describe(PageForm& form) override {
    form.Report([this] { return path; });
  }
};

class ReportWidgetTest : public testing::Test {
 protected:
  explicit ReportWidgetTest() : page(document.Root(), {document, host, {}}) { page.Initialize(); }
  void Show(const std::string& path) {
    page.path = path;
    if (!view) view = std::make_unique<PageView>(page);
    view->Sync();
    view->resize(600, 400);
    view->show();
    QApplication::processEvents();
  }
  QTextBrowser& Browser() { return *view->findChild<QTextBrowser*>(); }
  std::string Text() { return FromQt(Browser().toPlainText()); }
  QPushButton& Button(const QString& text) {
    for (auto* button : view->findChildren<QPushButton*>())
      if (button->text() == text) return *button;
    throw std::runtime_error("no such button");
  }

  test::TempFolder folder;
  BrowsingHost host;
  CFlowModelDoc document;
  ReportPage page;
  std::unique_ptr<PageView> view;
};

TEST_F(ReportWidgetTest, TheReportIsShownWithItsLinksAndOpenedInTheBrowser) {
  folder.Write("more/layer.html", "<p>Layer page</p>");
  Show(folder.Write("a report.html",
                    "<script>1</script><p>Water balance</p><a href=\"more/layer.html#top\">layer</a> "
                    "<a href=\"data.csv\">data</a> <a href=\"https://example.org/x\">out</a>"));
  EXPECT_THAT(Text(), HasSubstr("Water balance"));
  QTest::mouseClick(&Button("Open in Browser"), Qt::LeftButton);
  ASSERT_EQ(host.opened.size(), 1U);
  EXPECT_THAT(host.opened[0], HasSubstr("a%20report.html"));
  emit Browser().anchorClicked(QUrl("data.csv"));
  emit Browser().anchorClicked(QUrl("https://example.org/x"));
  ASSERT_EQ(host.opened.size(), 3U);
  EXPECT_EQ(host.opened[1], "file://" + folder.Path() + "/data.csv");
  EXPECT_EQ(host.opened[2], "https://example.org/x");
  // A page beside it is shown here, also when the form is shown anew, and there is a way back.
  emit Browser().anchorClicked(QUrl("more/layer.html#top"));
  EXPECT_EQ(Text(), "Layer page");
  view->Sync();
  EXPECT_EQ(Text(), "Layer page");
  QTest::mouseClick(&Button("Back to the Report"), Qt::LeftButton);
  EXPECT_THAT(Text(), HasSubstr("Water balance"));
  EXPECT_FALSE(Button("Back to the Report").isVisible());
}

TEST_F(ReportWidgetTest, AMissingFileIsToldUntilItIsThere) {
  Show(folder.File("late.html"));
  EXPECT_THAT(Text(), HasSubstr("There is no file late.html"));
  EXPECT_FALSE(Button("Open in Browser").isEnabled());
  folder.Write("late.html", "<p>Done</p>");
  Show(folder.File("late.html"));
  EXPECT_EQ(Text(), "Done");
  EXPECT_TRUE(Button("Open in Browser").isEnabled());
}

}  // namespace
}  // namespace tervane::report_widget_test
