// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/program.h"

#include <QFileInfo>
#include <QStandardPaths>

#include "shell/widgets/qt_text.h"
#include "shell/widgets/shown_language.h"

namespace tervane {

namespace {

constexpr int kMostRecentFiles = 10;
constexpr const char* kRecentFiles = "RecentFiles";
constexpr const char* kBranches = "Branches";
constexpr qsizetype kMostSetups = 30;  ///< Of which the branches are kept.
constexpr const char* kDisplayUnits = "DisplayUnits";
constexpr const char* kLanguage = "Language";

}  // namespace

Program::Program(const QString& settingsFile) {
  settings_ = settingsFile.isEmpty() ? std::make_unique<QSettings>("Tervane", "Quarzel")
                                     : std::make_unique<QSettings>(settingsFile, QSettings::IniFormat);
  std::string ignored;
  units_ = DisplayUnits::FromText(FromQt(settings_->value(kDisplayUnits).toString()), ignored);
  const QString folder = settingsFile.isEmpty()
                             ? QStandardPaths::writableLocation(QStandardPaths::GenericDataLocation) + "/Tervane"
                             : QFileInfo(settingsFile).absolutePath();
  recoveryFolder_ = FromQt(folder + "/recovery");
}

void Program::ChooseUnit(int itemType, int unitKey) {
  units_.Choose(itemType, unitKey);
  settings_->setValue(kDisplayUnits, ToQt(units_.Text()));
}

QString Program::Language() const { return settings_->value(kLanguage, kSystemLanguage).toString(); }

void Program::ChooseLanguage(const QString& language) { settings_->setValue(kLanguage, language); }

QStringList Program::RecentFiles() const { return settings_->value(kRecentFiles).toStringList(); }

void Program::AddRecentFile(const QString& path) {
  QStringList files = RecentFiles();
  const QString absolute = QFileInfo(path).absoluteFilePath();
  files.removeAll(absolute);
  files.prepend(absolute);
  settings_->setValue(kRecentFiles, files.mid(0, kMostRecentFiles));
}

void Program::ForgetRecentFiles() { settings_->remove(kRecentFiles); }

QStringList Program::Branches(const QString& path) const {
  for (const QVariant& kept : settings_->value(kBranches).toList()) {
    const QStringList entry = kept.toStringList();
    if (!entry.isEmpty() && entry.front() == path) return entry.mid(1);
  }
  return {};
}

void Program::KeepBranches(const QString& path, const QStringList& branches) {
  QVariantList entries = settings_->value(kBranches).toList();
  entries.removeIf([&](const QVariant& kept) { return kept.toStringList().value(0) == path; });
  if (!branches.isEmpty()) entries.prepend(QStringList{path} + branches);
  settings_->setValue(kBranches, entries.mid(0, kMostSetups));
}

}  // namespace tervane
