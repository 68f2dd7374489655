// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/editors/animation.h"

#include <QImage>
#include <algorithm>
#include <filesystem>

#include <gmock/gmock.h>

#include "tests/support/temp_folder.h"

namespace tervane::animation_test {
namespace {

struct Animation : testing::Test {
  test::TempFolder folder;
  std::string path = folder.File("heads.png");
  int red = 10;  ///< Of the first picture.

  QImage Draw(std::size_t number) const {
    QImage picture(2, 2, QImage::Format_RGB32);
    picture.fill(qRgb(red + static_cast<int>(number), 0, 0));
    return picture;
  }
  std::string Save(std::size_t count, std::size_t stopAt = 100, std::size_t failAt = 100) {
    return SaveAnimation(
        path, count,
        [&](std::size_t number, std::string& problem) {
          if (number == failAt) problem = "no values";
          return Draw(number);
        },
        [&](std::size_t done) { return done < stopAt; });
  }
  std::vector<std::string> Files() const {
    std::vector<std::string> names;
    for (const auto& entry : std::filesystem::directory_iterator(folder.Path()))
      names.push_back(entry.path().filename().string());
    std::ranges::sort(names);
    return names;
  }
  int RedOf(std::size_t number) const {
    return qRed(QImage(QString::fromStdString(PictureFile(path, number))).pixel(0, 0));
  }
};

TEST_F(Animation, PicturesHaveTheirNumbersInTheirNames) {
  EXPECT_EQ(PictureFile("/a/heads.PNG", 12), "/a/heads_0012.png");
  EXPECT_EQ(PictureFile("/a/heads", 12345), "/a/heads_12345.png");
  EXPECT_EQ(Save(3), "");
  EXPECT_THAT(Files(), testing::ElementsAre("heads_0001.png", "heads_0002.png", "heads_0003.png"));
  EXPECT_EQ(RedOf(3), 13);
}

TEST_F(Animation, EitherAllPicturesAreNewOrNone) {
  ASSERT_EQ(Save(2), "");
  red = 100;
  EXPECT_EQ(Save(3, 2), "cancelled");
  EXPECT_EQ(Save(3, 100, 3), "no values");
  path = folder.File("none/heads.png");
  EXPECT_THAT(Save(2), testing::HasSubstr("none/heads_0001.png cannot be written"));
  path = folder.File("heads.png");
  EXPECT_THAT(Files(), testing::ElementsAre("heads_0001.png", "heads_0002.png"));
  EXPECT_EQ(RedOf(2), 12);
  EXPECT_EQ(Save(3), "");
  EXPECT_EQ(RedOf(1), 101);
  EXPECT_THAT(Files(), testing::SizeIs(3));
}

}  // namespace
}  // namespace tervane::animation_test
