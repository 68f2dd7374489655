// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "edits/edited_file.h"

#include <filesystem>

#include <gmock/gmock.h>

#include "tests/support/temp_folder.h"

namespace tervane::edited_file_test {
namespace {

using test::TempFolder;
using testing::HasSubstr;

/// A file with one number, and steps that weigh what they are told to.
class Number : public EditedFile {
 public:
  explicit Number(std::string path) : EditedFile(std::move(path)) { Begin(); }

  int value = 0;
  bool mayStep = true;

  void Set(int number, std::size_t bytes = 1) {
    auto step = std::make_unique<Change>(*this, number, bytes);
    step->Swap();
    Take("Set " + std::to_string(number), std::move(step));
  }

 private:
  class Change : public EditStep {
   public:
    Change(Number& file, int other, std::size_t bytes) : file_(file), other_(other), bytes_(bytes) {}
    std::string Prepare() override { return file_.mayStep ? "" : "not now"; }
    void Swap() override { std::swap(file_.value, other_); }
    std::size_t Bytes() const override { return bytes_; }

   private:
    Number& file_;
    int other_;
    std::size_t bytes_;
  };

  std::string Read() override {
    FileContent content;
    if (FileResult read = ReadWholeFile(Path(), content); !read.Ok()) return read.error;
    value = std::atoi(content.Text().data());
    return {};
  }
  FileResult Write(const std::string& path, ProgressPart /*progress*/) override {
    return WriteFileAtomically(path, std::to_string(value));
  }
};

TEST(EditedFile, StepsLeadToAndFroAndKnowWhatWasSaved) {
  const TempFolder folder;
  Number file(folder.Write("n", "1"));
  EXPECT_EQ(file.value, 1);
  file.Set(2);
  file.Set(3);
  EXPECT_EQ(file.UndoName(), "Set 3");
  ASSERT_EQ(file.Save(file.Path()).error, "");
  EXPECT_FALSE(file.IsModified());
  file.Undo();
  EXPECT_TRUE(file.IsModified());
  file.Redo();
  EXPECT_FALSE(file.IsModified());
  file.Undo();
  file.mayStep = false;
  EXPECT_EQ(file.Undo(), "not now");
  EXPECT_EQ(file.value, 2);
  file.mayStep = true;
  // What was saved lies on a branch to which nothing leads any more.
  file.Set(5);
  EXPECT_FALSE(file.CanRedo());
  EXPECT_TRUE(file.IsModified());
  file.Undo();
  EXPECT_TRUE(file.IsModified());
  ASSERT_EQ(file.Save(folder.File("other")).error, "");
  EXPECT_FALSE(file.IsModified());
  EXPECT_EQ(test::ReadFile(folder.File("n")), "3");
  EXPECT_THAT(file.Save(folder.File("none/n")).error, HasSubstr("none/n"));
  EXPECT_EQ(file.Path(), folder.File("other"));
}

TEST(EditedFile, TheOldestStepsGoWhereThereAreTooManyOrTooLargeOnes) {
  const TempFolder folder;
  Number file(folder.Write("n", "0"));
  for (int i = 1; i <= 1500; ++i) file.Set(i);
  while (file.CanUndo()) file.Undo();
  EXPECT_EQ(file.value, 500);
  EXPECT_TRUE(file.IsModified()) << "what the file holds cannot be reached";
  constexpr std::size_t kLarge = std::size_t{400} << 20;
  for (int i = 1; i <= 5; ++i) file.Set(i, kLarge);
  EXPECT_LE(file.BytesOfSteps(), std::size_t{1} << 30);
  // The last one stays, however large.
  file.Set(9, kLarge * 10);
  EXPECT_TRUE(file.CanUndo());
}

TEST(EditedFile, AnotherContentIsKnownAndTheSameUnderAnotherTimeIsNot) {
  const TempFolder folder;
  Number file(folder.Write("n", "1"));
  std::filesystem::last_write_time(file.Path(), std::filesystem::file_time_type::clock::now() + std::chrono::hours(1));
  EXPECT_FALSE(file.IsOtherOnDisk());
  folder.Write("n", "2");
  EXPECT_TRUE(file.IsOtherOnDisk());
  EXPECT_TRUE(file.IsOtherOnDisk());
  EXPECT_EQ(file.Reload(), "");
  EXPECT_EQ(file.value, 2);
  std::filesystem::remove(file.Path());
  EXPECT_TRUE(file.IsOtherOnDisk());
  EXPECT_THAT(file.Reload(), HasSubstr("it does not exist"));
  EXPECT_EQ(file.value, 2);
  EXPECT_EQ(file.Save(file.Path()).error, "");
  EXPECT_FALSE(file.IsOtherOnDisk());
}

}  // namespace
}  // namespace tervane::edited_file_test
