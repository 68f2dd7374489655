// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/paths.h"

#include <filesystem>

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "tests/support/split_at_arrow.h"

namespace tervane::paths_test {
namespace {

using test::SplitAtArrow;

TEST(Paths, RootsOfEverySystemAreAbsolute) {
  for (const char* path : {"/", "/x", "\\x", "C:\\x", "c:/x", "C:", "C:x", "\\\\server\\share", "//server/share/x"})
    EXPECT_TRUE(IsAbsolutePath(path)) << path;
  for (const char* path : {"", "x", "x/y", "x\\y", "..", "./x", "1:/x", ":x", "ä:/x"})
    EXPECT_FALSE(IsAbsolutePath(path)) << path;
}

using Way = std::string (*)(std::string_view path, std::string_view folder);

/// Expects of each "path => way" the way from the folder to the path.
void ExpectWays(Way way, const char* folder, std::initializer_list<const char*> rows) {
  for (const char* row : rows)
    EXPECT_EQ(way(SplitAtArrow(row).first, folder), SplitAtArrow(row).second) << row << " in " << folder;
}

TEST(Paths, AStoredNameIsResolvedAgainstItsFolder) {
  ExpectWays(ResolvedPath, "/data",
             {" => ", "maps/x => /data/maps/x", "./maps//x => /data/maps/x", "../../../x => /x", ". => /data",
              "maps/ => /data/maps/", "maps\\ => /data/maps/", ".. => /", "/x/../y => /y", "C:\\x\\y => C:/x/y",
              "C:x => C:x", "C: => C:", "///x => /x", "\\x => /x", "a ä => /data/a ä"});
  ExpectWays(ResolvedPath, "/data", {"\\\\server\\share\\x => //server/share/x"});
  ExpectWays(ResolvedPath, "/data/setup/", {"../a/./b/../x => /data/a/x", "maps\\x => /data/setup/maps/x"});
  ExpectWays(ResolvedPath, "C:\\data\\setup", {"..\\x => C:/data/x", "..\\..\\..\\x => C:/x"});
  ExpectWays(ResolvedPath, "//server/share/data", {"../../x => //server/share/x"});
  ExpectWays(ResolvedPath, "//server/share", {"../../x => //server/share/x"});
  ExpectWays(ResolvedPath, "", {"x => x", "a/.. => ."});
  ExpectWays(ResolvedPath, "setup", {"../x => x", "../../x => ../x"});
}

TEST(Paths, ARelativeWayLeadsThroughTheCommonFolder) {
  ExpectWays(RelativePath, "/data",
             {"/data/x => x", "/data => .", "/data/maps/ => maps/", "/ => ..", "/data2/x => ../data2/x",
              "/Data/x => ../Data/x", "/data/C:x => ./C:x", " => "});
  ExpectWays(RelativePath, "/data/setup/", {"/data/maps/x => ../maps/x", "/x => ../../x", "C:\\x => C:/x"});
  ExpectWays(RelativePath, "c:/data", {"C:\\Data\\x => x", "C:\\maps\\x => ../maps/x", "D:\\x => D:/x", "C:x => C:x"});
  ExpectWays(RelativePath, "C:setup", {"C:x => C:x"});
  ExpectWays(RelativePath, "//SERVER/share/a", {"\\\\server\\share\\x => ../x", "//server/b/x => //server/b/x"});
  // And back.
  for (const char* path : {"/data/x", "/a/b/c", "/", "/data/setup", "/data/setup/C:x", "C:/x", "//server/share/x"})
    EXPECT_EQ(ResolvedPath(RelativePath(path, "/data/setup"), "/data/setup"), path);
}

TEST(Paths, APickedNameIsRelativeOnlyAtOrBelowTheFolder) {
  ExpectWays(StoredPath, "/data",
             {"/data/maps/x => maps/x", "/data => .", "/data2/x => /data2/x", "/data/../x => /x", " => "});
  ExpectWays(StoredPath, "C:\\data", {"C:\\Data\\maps\\x => maps/x", "D:\\a\\..\\x => D:/x"});
}

TEST(Paths, APathIsTakenApart) {
  // Into folder, name, base and extension.
  for (const char* row : {" => |||", "x.tvd => |x.tvd|x|.tvd", "/a/x.tvd => /a|x.tvd|x|.tvd", "/x => /|x|x|",
                          "a\\x.v1.tvd => a|x.v1.tvd|x.v1|.tvd", "//x => /|x|x|", "C:\\x => C:\\|x|x|",
                          "C:x => C:|x|x|", "a.d/x => a.d|x|x|", "a//x => a|x|x|", "a/ => a|||", ".x => |.x|.x|",
                          ".x.tvd => |.x.tvd|.x|.tvd", "a/.. => a|..|..|", "x. => |x.|x|."}) {
    const auto [path, parts] = SplitAtArrow(row);
    EXPECT_EQ(fmt::format("{}|{}|{}|{}", FolderOf(path), FileNameOf(path), BaseNameOf(path), ExtensionOf(path)), parts);
  }
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
}  // namespace tervane::paths_test
