// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/program.h"

#include <QFileInfo>
#include <QStandardPaths>

#include "shell/widgets/qt_text.h"

namespace tervane {

namespace {

constexpr int kMostRecentFiles = 10;
constexpr const char* kRecentFiles = "RecentFiles";
constexpr const char* kDisplayUnits = "DisplayUnits";

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

QStringList Program::RecentFiles() const { return settings_->value(kRecentFiles).toStringList(); }

void Program::AddRecentFile(const QString& path) {
  QStringList files = RecentFiles();
  const QString absolute = QFileInfo(path).absoluteFilePath();
  files.removeAll(absolute);
  files.prepend(absolute);
  settings_->setValue(kRecentFiles, files.mid(0, kMostRecentFiles));
}

void Program::ForgetRecentFiles() { settings_->remove(kRecentFiles); }

}  // namespace tervane
