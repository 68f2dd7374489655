// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/qt_host.h"

#include <QDesktopServices>
#include <QFileDialog>
#include <QMessageBox>
#include <QUrl>

#include "shell/item_dialog.h"
#include "shell/qt_text.h"

namespace tervane {

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

std::optional<std::string> QtHost::AskFileToOpen(const FileQuestion& question) {
  const QString title = question.title.empty() ? QFileDialog::tr("Open") : Translated(question.title);
  const QString path =
      QFileDialog::getOpenFileName(window_, title, ToQt(question.current), DialogFilter(question.filter));
  return path.isEmpty() ? std::nullopt : std::optional(FromQt(path));
}

std::optional<std::string> QtHost::AskFileToSave(const FileQuestion& question) {
  QFileDialog dialog(window_, question.title.empty() ? QFileDialog::tr("Save As") : Translated(question.title));
  dialog.setAcceptMode(QFileDialog::AcceptSave);
  dialog.setNameFilter(DialogFilter(question.filter));
  dialog.setDefaultSuffix(ToQt(question.defaultExtension));
  if (!question.current.empty()) dialog.selectFile(ToQt(question.current));
  if (dialog.exec() != QDialog::Accepted || dialog.selectedFiles().isEmpty()) return std::nullopt;
  return FromQt(dialog.selectedFiles().constFirst());
}

std::optional<int> QtHost::AskItem(const ItemQuestion& question) {
  ItemDialog dialog(question, window_);
  return dialog.exec() == QDialog::Accepted ? std::optional(dialog.Chosen()) : std::nullopt;
}

void QtHost::OpenBrowser(const std::string& address) { QDesktopServices::openUrl(QUrl(ToQt(address))); }

std::string QtHost::Setting(const std::string& name) const { return FromQt(settings_.value(ToQt(name)).toString()); }

void QtHost::SetSetting(const std::string& name, const std::string& value) {
  settings_.setValue(ToQt(name), ToQt(value));
}

}  // namespace tervane
