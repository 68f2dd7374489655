// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/editors/animation.h"

#include <QFile>
#include <QFileInfo>
#include <QTemporaryDir>
#include <vector>

#include <fmt/format.h>

#include "platform/progress.h"
#include "shell/widgets/qt_text.h"

namespace tervane {

namespace {

/// Puts a file in the place of another one, which is kept aside until all are there.
struct Placed {
  QString path, kept;
};

bool Place(const QString& made, const QString& path, const QString& kept, std::vector<Placed>& placed) {
  const bool isThere = QFileInfo::exists(path);
  if (isThere && !QFile::rename(path, kept)) return false;
  if (!QFile::rename(made, path)) {
    if (isThere) QFile::rename(kept, path);
    return false;
  }
  placed.push_back({path, isThere ? kept : QString()});
  return true;
}

void TakeBack(const std::vector<Placed>& placed) {
  for (const Placed& one : placed) {
    QFile::remove(one.path);
    if (!one.kept.isEmpty()) QFile::rename(one.kept, one.path);
  }
}

}  // namespace

std::string PictureFile(const std::string& path, std::size_t number) {
  const bool hasSuffix = ToQt(path).endsWith(".png", Qt::CaseInsensitive);
  return fmt::format("{}_{:04}.png", hasSuffix ? path.substr(0, path.size() - 4) : path, number);
}

std::string SaveAnimation(const std::string& path, std::size_t count,
                          const std::function<QImage(std::size_t number, std::string& problem)>& draw,
                          const std::function<bool(std::size_t done)>& goesOn) {
  // In the same folder, so that each picture takes its place in one step.
  const QTemporaryDir folder(ToQt(path) + "-XXXXXX");
  if (!folder.isValid())
    return fmt::format("{} cannot be written: {}", PictureFile(path, 1), FromQt(folder.errorString()));
  const auto made = [&](std::size_t number) { return folder.filePath(QString("%1.png").arg(number)); };
  for (std::size_t number = 1; number <= count; ++number) {
    std::string problem;
    const QImage picture = draw(number, problem);
    if (!problem.empty()) return problem;
    if (!picture.save(made(number), "PNG"))
      return fmt::format("{} cannot be written; is the disk full?", PictureFile(path, number));
    if (!goesOn(number)) return kCancelled;
  }
  std::vector<Placed> placed;
  for (std::size_t number = 1; number <= count; ++number) {
    const std::string target = PictureFile(path, number);
    if (Place(made(number), ToQt(target), folder.filePath(QString("kept%1").arg(number)), placed)) continue;
    TakeBack(placed);
    return fmt::format("{} cannot be replaced.", target);
  }
  return {};
}

}  // namespace tervane
