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
  EXPECT_EQ(FileName::GetBase("C:/x/top.v"), "top");
  EXPECT_EQ(FileName::GetExtension("C:/x/top.v"), "v");
  EXPECT_EQ(FileName::GetHead("C:/x/top.v"), "C:/x/");
  EXPECT_EQ(FileName::GetTail("C:/x/top.v"), "top.v");

  EXPECT_EQ(FileName::GetBase("lib/archive.tar.gz"), "archive.tar");
  EXPECT_EQ(FileName::GetExtension("lib/archive.tar.gz"), "gz");

  EXPECT_EQ(FileName::GetBase("/top.vhd"), "top");
  EXPECT_EQ(FileName::GetHead("/top.vhd"), "/");
  EXPECT_EQ(FileName::GetTail("dir/"), "");
}

TEST(FileName, NamesWithoutExtension) {
  using Port::FileName;
  EXPECT_EQ(FileName::GetBase("Makefile"), "Makefile");
  EXPECT_EQ(FileName::GetExtension("Makefile"), "");
  EXPECT_EQ(FileName::GetHead("Makefile"), "");
  EXPECT_EQ(FileName::GetTail("Makefile"), "Makefile");

  EXPECT_EQ(FileName::GetExtension("rel.d/Makefile"), "");
  EXPECT_EQ(FileName::GetBase("rel.d/Makefile"), "Makefile");

  EXPECT_EQ(FileName::GetBase("proj/.settings"), ".settings");
  EXPECT_EQ(FileName::GetExtension("proj/.settings"), "");
  EXPECT_EQ(FileName::GetBase(".cfg.v"), ".cfg");
  EXPECT_EQ(FileName::GetExtension(".cfg.v"), "v");

  EXPECT_EQ(FileName::GetBase("top."), "top.");
  EXPECT_EQ(FileName::GetExtension("top."), "");
  EXPECT_EQ(FileName::GetBase(".."), "..");
  EXPECT_EQ(FileName::GetExtension(""), "");
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
