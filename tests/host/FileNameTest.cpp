#include <gtest/gtest.h>

#include "Port/File.h"
#include "Port/FileName.h"
#include "Port/StringBase.h"

namespace {

std::string Canonical(const char* path, const char* base) {
  Port::StringBase text(path);
  EXPECT_TRUE(Port::FileName::MakeCanonical(&text, base)) << path;
  return text.str();
}

}  // namespace

TEST(FileName, MakeCanonicalResolvesDotsAndSlashesByText) {
  EXPECT_EQ(Canonical("a/./b/../c.v", "/work//proj/"), "/work/proj/a/c.v");
  EXPECT_EQ(Canonical("//src///top.v", "/ignored"), "/src/top.v");
  EXPECT_EQ(Canonical("../../../../x.v", "/work/proj"), "/x.v");
  EXPECT_EQ(Canonical("/..", nullptr), "/");
  EXPECT_EQ(Canonical("dir/sub/", "/w"), "/w/dir/sub");
  EXPECT_EQ(Canonical("..", "/w/p"), "/w");
  EXPECT_EQ(Canonical("", "/w/p/."), "/w/p");
  EXPECT_EQ(Canonical("./.hidden/..x/a..b", "/"), "/.hidden/..x/a..b");
  EXPECT_FALSE(Port::FileName::MakeCanonical(nullptr, "/w"));
}

TEST(FileName, MakeCanonicalUsesTheCurrentDirectoryForRelativeBases) {
  Port::StringBase cwd;
  ASSERT_TRUE(Port::File::getcwd(&cwd));
  std::string expectedParent = Canonical("..", cwd.c_str());

  EXPECT_EQ(Canonical("x/../top.v", nullptr), Canonical("top.v", cwd.c_str()));
  EXPECT_EQ(Canonical("top.v", "sub/.."), Canonical("top.v", cwd.c_str()));
  EXPECT_EQ(Canonical("top.v", ".."), Port::FileName::Join(expectedParent, "top.v").str());
}

TEST(FileName, PartsOfAPath) {
  using Port::FileName;
  const std::pair<const char*, const char*> cases[] = {
      {"C:/x/top.v", "C:/x/|top.v|top|v"},
      {"lib/archive.tar.gz", "lib/|archive.tar.gz|archive.tar|gz"},
      {"/top.vhd", "/|top.vhd|top|vhd"},
      {"dir/", "dir/|||"},
      {"Makefile", "|Makefile|Makefile|"},
      {"rel.d/Makefile", "rel.d/|Makefile|Makefile|"},
      {"proj/.settings", "proj/|.settings|.settings|"},
      {".cfg.v", "|.cfg.v|.cfg|v"},
      {"top.", "|top.|top.|"},
      {"..", "|..|..|"},
      {"", "|||"}};
  for (const auto& [path, expected] : cases) {
    EXPECT_EQ(FileName::GetHead(path) + "|" + FileName::GetTail(path).view() + "|" +
                  FileName::GetBase(path).view() + "|" + FileName::GetExtension(path).view(),
              expected)
        << path;
  }
}

TEST(FileName, JoinAndIsAbsolute) {
  using Port::FileName;
  EXPECT_TRUE(FileName::IsAbsolute("/a"));
  EXPECT_FALSE(FileName::IsAbsolute("a/b"));
  EXPECT_FALSE(FileName::IsAbsolute(""));
  EXPECT_EQ(FileName::Join("/w", "a.v"), "/w/a.v");
  EXPECT_EQ(FileName::Join("/w/", "a.v"), "/w/a.v");
  EXPECT_EQ(FileName::Join("", "a.v"), "a.v");
  EXPECT_EQ(FileName::Join("/w", "/abs/a.v"), "/abs/a.v");
}
