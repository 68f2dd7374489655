// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/qt_host.h"

#include <QAbstractButton>
#include <QDesktopServices>
#include <QEventLoop>
#include <QFileDialog>
#include <QMessageBox>
#include <QProgressDialog>
#include <QPushButton>
#include <QTimer>
#include <QUrl>
#include <cstdio>

#include "shell/item_dialog.h"
#include "shell/library_dialog.h"
#include "shell/widgets/background.h"
#include "shell/widgets/qt_text.h"

namespace tervane {

namespace {

constexpr int kMoment = 200;  ///< In milliseconds: what takes no longer is not told of.
constexpr int kTick = 80;

}  // namespace

QString DialogFilter(const std::string& filter) {
  const QStringList parts = ToQt(filter).split('|', Qt::SkipEmptyParts);
  QStringList filters;
  for (qsizetype i = 0; i + 1 < parts.size(); i += 2) {
    const QString text = parts[i].left(parts[i].indexOf('(')).trimmed();
    filters << QString("%1 (%2)").arg(text, parts[i + 1].trimmed().replace(';', ' '));
  }
  return filters.join(";;");
}

Host::Answer QtHost::Ask(const std::string& text, Icon icon, Buttons buttons) {
  if (isUnattended_) {
    std::fprintf(stderr, "quarzel: %s\n", text.c_str());
    if (buttons == Buttons::Ok) return Answer::Ok;
    return buttons == Buttons::YesNo ? Answer::No : Answer::Cancel;
  }
  QMessageBox box(window_);
  box.setText(Translated(text));
  switch (icon) {
    case Icon::Information:
      box.setIcon(QMessageBox::Information);
      break;
    case Icon::Warning:
      box.setIcon(QMessageBox::Warning);
      break;
    case Icon::Error:
      box.setIcon(QMessageBox::Critical);
      break;
    case Icon::Question:
      box.setIcon(QMessageBox::Question);
      break;
  }
  switch (buttons) {
    case Buttons::Ok:
      box.setStandardButtons(QMessageBox::Ok);
      break;
    case Buttons::OkCancel:
      box.setStandardButtons(QMessageBox::Ok | QMessageBox::Cancel);
      break;
    case Buttons::YesNo:
      box.setStandardButtons(QMessageBox::Yes | QMessageBox::No);
      break;
    case Buttons::YesNoCancel:
      box.setStandardButtons(QMessageBox::Yes | QMessageBox::No | QMessageBox::Cancel);
      break;
  }
  switch (box.exec()) {
    case QMessageBox::Ok:
      return Answer::Ok;
    case QMessageBox::Yes:
      return Answer::Yes;
    case QMessageBox::No:
      return Answer::No;
    default:
      return Answer::Cancel;
  }
}

std::optional<int> QtHost::Choose(const QString& text, const QString& explanation, const QStringList& answers) {
  if (isUnattended_) {
    std::fprintf(stderr, "quarzel: %s\n", FromQt(text).c_str());
    return std::nullopt;
  }
  QMessageBox box(QMessageBox::Warning, QString(), text, QMessageBox::Cancel, window_);
  box.setInformativeText(explanation);
  QList<QAbstractButton*> buttons;
  for (const QString& answer : answers) buttons.append(box.addButton(answer, QMessageBox::ActionRole));
  box.setDefaultButton(QMessageBox::Cancel);
  box.exec();
  const auto pressed = buttons.indexOf(box.clickedButton());
  return pressed >= 0 ? std::optional(static_cast<int>(pressed)) : std::nullopt;
}

std::optional<std::string> QtHost::AskFileToOpen(const FileQuestion& question) {
  if (isUnattended_) return std::nullopt;
  const QString title = question.title.empty() ? QFileDialog::tr("Open") : Translated(question.title);
  const QString path =
      QFileDialog::getOpenFileName(window_, title, ToQt(question.current), DialogFilter(question.filter));
  return path.isEmpty() ? std::nullopt : std::optional(FromQt(path));
}

std::optional<std::string> QtHost::AskFileToSave(const FileQuestion& question) {
  if (isUnattended_) return std::nullopt;
  QFileDialog dialog(window_, question.title.empty() ? QFileDialog::tr("Save As") : Translated(question.title));
  dialog.setAcceptMode(QFileDialog::AcceptSave);
  dialog.setNameFilter(DialogFilter(question.filter));
  dialog.setDefaultSuffix(ToQt(question.defaultExtension));
  if (!question.current.empty()) dialog.selectFile(ToQt(question.current));
  if (dialog.exec() != QDialog::Accepted || dialog.selectedFiles().isEmpty()) return std::nullopt;
  return FromQt(dialog.selectedFiles().constFirst());
}

std::optional<int> QtHost::AskItem(const ItemQuestion& question) {
  if (isUnattended_) return std::nullopt;
  ItemDialog dialog(question, window_);
  return dialog.exec() == QDialog::Accepted ? std::optional(dialog.Chosen()) : std::nullopt;
}

std::optional<Host::LibraryChoice> QtHost::SelectLibraryEntry(const LibraryQuestion& question) {
  if (isUnattended_) return std::nullopt;
  LibraryDialog dialog(question, *this, window_);
  return dialog.exec() == QDialog::Accepted ? std::optional(dialog.Chosen()) : std::nullopt;
}

void QtHost::OpenBrowser(const std::string& address) { QDesktopServices::openUrl(QUrl(ToQt(address))); }

bool QtHost::Compute(const std::shared_ptr<Computation>& computation) {
  Background background;
  background.Await({computation});
  if (background.IsDoneWithin(kMoment)) return true;
  QProgressDialog dialog(background.Title(), QProgressDialog::tr("Cancel"), 0, 100, window_);
  dialog.setWindowModality(Qt::WindowModal);
  dialog.setMinimumDuration(kMoment);
  dialog.setAutoReset(false);
  dialog.setAutoClose(false);
  QEventLoop loop;
  QTimer tick;
  QObject::connect(&tick, &QTimer::timeout, &dialog,
                   [&] { dialog.setValue(static_cast<int>(99 * background.Done())); });
  QObject::connect(&dialog, &QProgressDialog::canceled, &loop, [&] {
    background.Cancel();
    loop.quit();
  });
  QObject::connect(&background, &Background::Ended, &loop, &QEventLoop::quit);
  tick.start(kTick);
  dialog.setValue(0);
  // The dialog handles events too.
  if (background.IsWaiting()) loop.exec();
  // Whoever runs it next waits for the thread that works on it, and then finds it done or cancelled.
  Progress cancelled;
  cancelled.Cancel();
  return computation->Run(cancelled);
}

std::string QtHost::Setting(const std::string& name) const { return FromQt(settings_.value(ToQt(name)).toString()); }

void QtHost::SetSetting(const std::string& name, const std::string& value) {
  settings_.setValue(ToQt(name), ToQt(value));
}

}  // namespace tervane
