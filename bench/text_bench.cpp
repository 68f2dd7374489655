// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What a user waits for at the text of a setup of 20 MB: until it is there, for a key, and for a line that is left. The
// peer is the toolkit's own view of plain text, which gets the whole text at once. Run it with
// QT_QPA_PLATFORM=offscreen.
#include <QApplication>
#include <QPlainTextEdit>
#include <QTemporaryDir>
#include <QTest>
#include <QTextBlock>
#include <string>

#include <fmt/format.h>

#include "bench/desktop_figures.h"
#include "document/edit_session.h"
#include "platform/files.h"
#include "shell/text/text_view.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"
#include "simspec/extra_params.h"

namespace tervane::bench {

namespace {

constexpr int kItems = 130'000;

std::string LargeSetup() {
  CFlowModelDoc setup;
  std::string text, error;
  auto& list = *setup.Root().Child<CExtraParamsKvf>();
  list.SetItemCount(kItems, 1);
  for (int number = 1; number <= kItems; ++number) list.GetItem(number)->Name = fmt::format("parameter {}", number);
  if (!setup.BuildText("/setups", text, error)) fmt::print("not saved: {}\n", error);
  return text;
}

void Draw(QWidget& view) {
  QApplication::processEvents(QEventLoop::ExcludeUserInputEvents, 1);
  view.grab();
}

void Measure() {
  const QTemporaryDir folder;
  const std::string text = LargeSetup(), path = FromQt(folder.filePath("large.tvd"));
  WriteFileAtomically(path, text);
  std::string error;
  const auto session = EditSession::Open(path, FromQt(folder.path()), error);
  if (!session) return fmt::print("not opened: {}\n", error);
  fmt::print("a setup of {:.1f} MB, {} items\n", static_cast<double>(text.size()) / 1e6, kItems);

  TextView view(*session);
  view.resize(900, 600);
  Report("text view: open until the first screen is drawn", Milliseconds([&] {
           view.show();
           Draw(view);
         }),
         300, "ms");
  double longest = 0;
  const double whole = Milliseconds([&] {
    while (!view.Text().IsWhole())
      longest = std::max(longest, Milliseconds([&] { QApplication::processEvents(QEventLoop::AllEvents, 1); }));
  });
  ReportPeer("  until all of it is there, in the background", whole, "ms");
  Report("  the longest piece of that", longest, 100, "ms");
  {
    QPlainTextEdit peer;
    peer.setLineWrapMode(QPlainTextEdit::NoWrap);
    peer.resize(900, 600);
    ReportPeer("  peer: the toolkit's view, all at once", Milliseconds([&] {
                 peer.setPlainText(ToQt(text));
                 peer.show();
                 Draw(peer);
               }),
               "ms");
  }

  QTextCursor hit = view.Text().document()->find("parameter 65000");
  hit.setPosition(hit.selectionEnd());
  view.Text().setTextCursor(hit);
  Draw(view);
  Report("text view: a key until it is drawn", MedianOf([&] {
           QTest::keyClick(&view.Text(), Qt::Key_X);
           Draw(view);
         }),
         16, "ms");
  Report("text view: the look at what is typed, when the keys pause", Milliseconds([&] { view.LookAtTyping(); }), 16,
         "ms");
  Report("text view: a line is left, until its value is taken and drawn", Milliseconds([&] {
           view.Commit();
           Draw(view);
         }),
         300, "ms");
  const auto step = [&](const char* what, bool isUndo) {
    Report(what, Milliseconds([&] {
             isUndo ? session->Undo() : session->Redo();
             view.Follow();
             Draw(view);
           }),
           300, "ms");
  };
  step("text view: undo of that", true);
  step("text view: redo of that", false);

  auto& item = *session->Document().Root().Child<CExtraParamsKvf>()->GetItem(kItems / 2);
  const auto change = [&] {
    ++item.FloatValue;
    session->UpdateDoc(item, 1, "Change Value");
  };
  const double without = MedianOf(change);
  session->KeepJournal(true);
  Report("a value is changed while a journal is kept", MedianOf(change), 1000, "ms");
  ReportPeer("  without a journal", without, "ms");
}

}  // namespace

}  // namespace tervane::bench

int main(int argc, char** argv) {
  QApplication application(argc, argv);
  tervane::Theme theme;
  tervane::bench::Measure();
  return 0;
}
