// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/paths.h"

#include <filesystem>

#include <gmock/gmock.h>

namespace tervane {
namespace {

TEST(Paths, RootsOfEverySystemAreAbsolute) {
  for (const char* path : {"/", "/x", "\\x", "C:\\x", "c:/x", "C:", "C:x", "\\\\server\\share", "//server/share/x"}) {
    EXPECT_TRUE(IsAbsolutePath(path)) << path;
  }
  for (const char* path : {"", "x", "x/y", "x\\y", "..", "./x", "1:/x", ":x", "ä:/x"}) {
    EXPECT_FALSE(IsAbsolutePath(path)) << path;
  }
}

struct PathCase {
  const char* path;
  const char* folder;
  const char* expected;
};

TEST(Paths, AStoredNameIsResolvedAgainstItsFolder) {
  const PathCase cases[] = {
      {"", "/data", ""},
      {"maps/dem.nds2", "/data", "/data/maps/dem.nds2"},
      {"maps\\dem.nds2", "/data/", "/data/maps/dem.nds2"},
      {"./maps//dem.nds2", "/data", "/data/maps/dem.nds2"},
      {"../a/./b/../x", "/data/setup", "/data/a/x"},
      {"../../../x", "/data", "/x"},
      {"..\\x", "C:\\data\\setup", "C:/data/x"},
      {"..\\..\\..\\x", "C:\\data", "C:/x"},
      {"../../x", "//server/share/data", "//server/share/x"},
      {"../../x", "//server/share", "//server/share/x"},
      {".", "/data", "/data"},
      {"maps/", "/data", "/data/maps/"},
      {"maps\\", "/data", "/data/maps/"},
      {"..", "/data", "/"},
      {"/x/../y", "/data", "/y"},
      {"C:\\x\\y", "/data", "C:/x/y"},
      {"C:x", "/data", "C:x"},
      {"C:", "/data", "C:"},
      {"\\\\server\\share\\x", "/data", "//server/share/x"},
      {"///x", "/data", "/x"},
      {"\\x", "/data", "/x"},
      {"x", "", "x"},
      {"a/..", "", "."},
      {"../x", "setup", "x"},
      {"../../x", "setup", "../x"},
      {"a b/ä.tvd", "/data", "/data/a b/ä.tvd"},
  };
  for (const PathCase& c : cases) EXPECT_EQ(ResolvedPath(c.path, c.folder), c.expected) << c.path << " in " << c.folder;
}

TEST(Paths, ARelativeWayLeadsThroughTheCommonFolder) {
  const PathCase cases[] = {
      {"/data/x", "/data", "x"},
      {"/data/x", "/data/", "x"},
      {"/data/maps/x", "/data/setup", "../maps/x"},
      {"/x", "/data/setup", "../../x"},
      {"/data", "/data", "."},
      {"/data/maps/", "/data", "maps/"},
      {"/", "/data", ".."},
      {"/database/x", "/data", "../database/x"},
      {"/Data/x", "/data", "../Data/x"},
      {"C:\\Data\\x", "c:/data", "x"},
      {"C:\\maps\\x", "C:\\setup", "../maps/x"},
      {"D:\\x", "C:\\setup", "D:/x"},
      {"C:\\x", "/setup", "C:/x"},
      {"C:x", "C:/setup", "C:x"},
      {"C:x", "C:setup", "C:x"},
      {"\\\\server\\share\\x", "//SERVER/share/setup", "../x"},
      {"\\\\server\\other\\x", "\\\\server\\share\\setup", "//server/other/x"},
      {"/data/C:x", "/data", "./C:x"},
      {"", "/data", ""},
  };
  for (const PathCase& c : cases) EXPECT_EQ(RelativePath(c.path, c.folder), c.expected) << c.path << " in " << c.folder;
}

TEST(Paths, ARelativeWayLeadsBack) {
  for (const char* path : {"/data/x", "/a/b/c", "/", "/data/setup", "/data/setup/C:x", "C:/x", "//server/share/x"}) {
    const std::string folder = "/data/setup";
    EXPECT_EQ(ResolvedPath(RelativePath(path, folder), folder), path);
  }
}

TEST(Paths, APickedNameIsRelativeOnlyAtOrBelowTheFolder) {
  const PathCase cases[] = {
      {"/data/x", "/data", "x"},
      {"/data/maps/x", "/data", "maps/x"},
      {"C:\\Data\\maps\\x", "C:\\data", "maps/x"},
      {"/data", "/data", "."},
      {"/other/x", "/data", "/other/x"},
      {"/database/x", "/data", "/database/x"},
      {"/x", "/data", "/x"},
      {"D:\\a\\..\\x", "C:\\data", "D:/x"},
      {"\\\\server\\share\\x", "/data", "//server/share/x"},
      {"/data/../x", "/data", "/x"},
      {"", "/data", ""},
  };
  for (const PathCase& c : cases) EXPECT_EQ(StoredPath(c.path, c.folder), c.expected) << c.path << " in " << c.folder;
}

TEST(Paths, APathIsTakenApart) {
  struct Case {
    const char* path;
    const char* folder;
    const char* name;
    const char* base;
    const char* extension;
  };
  const Case cases[] = {
      {"", "", "", "", ""},
      {"x.tvd", "", "x.tvd", "x", ".tvd"},
      {"/data/x.tvd", "/data", "x.tvd", "x", ".tvd"},
      {"data\\x.v10.tvd", "data", "x.v10.tvd", "x.v10", ".tvd"},
      {"/x", "/", "x", "x", ""},
      {"//x", "/", "x", "x", ""},
      {"C:\\x", "C:\\", "x", "x", ""},
      {"C:x", "C:", "x", "x", ""},
      {"data.d/x", "data.d", "x", "x", ""},
      {"data//x", "data", "x", "x", ""},
      {"data/", "data", "", "", ""},
      {".hidden", "", ".hidden", ".hidden", ""},
      {".hidden.tvd", "", ".hidden.tvd", ".hidden", ".tvd"},
      {"a/..", "a", "..", "..", ""},
      {"x.", "", "x.", "x", "."},
  };
  for (const Case& c : cases) {
    EXPECT_EQ(FolderOf(c.path), c.folder) << c.path;
    EXPECT_EQ(FileNameOf(c.path), c.name) << c.path;
    EXPECT_EQ(BaseNameOf(c.path), c.base) << c.path;
    EXPECT_EQ(ExtensionOf(c.path), c.extension) << c.path;
  }
}

TEST(Paths, BothSeparatorsCanEndAPath) {
  EXPECT_TRUE(EndsInSeparator("maps/"));
  EXPECT_TRUE(EndsInSeparator("maps\\"));
  EXPECT_FALSE(EndsInSeparator("maps"));
  EXPECT_FALSE(EndsInSeparator(""));
}

TEST(Paths, ARelativePathIsMadeAbsoluteFromTheWorkingFolder) {
  const std::string here = TextOfPath(std::filesystem::current_path());
  EXPECT_EQ(AbsoluteFromHere("x/../y"), ResolvedPath("y", here));
  EXPECT_EQ(AbsoluteFromHere("."), here);
  EXPECT_EQ(AbsoluteFromHere("/a\\b"), "/a/b");
  EXPECT_EQ(AbsoluteFromHere("C:\\b"), "C:/b");
}

TEST(Paths, NativePathsGoBackAndForth) {
  EXPECT_EQ(TextOfPath(NativePath("/data/Übung €.tvd")), "/data/Übung €.tvd");
  EXPECT_EQ(NativePath("/data") / "x", NativePath("/data/x"));
}

}  // namespace
}  // namespace tervane
