#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstdlib>
#include <ctime>
#include <string>
#include <vector>

#include "Port/File.h"
#include "Port/StringBase.h"
#include "ScopedEnv.h"
#include "ScopedTempDir.h"
#include "ScopedWorkingDirectory.h"

namespace {

void WriteFile(const std::string& path, std::string_view content) {
  std::unique_ptr<Port::Stream> stream = Port::File::open(path.c_str(), "wb");
  ASSERT_TRUE(stream);
  ASSERT_TRUE(stream->write(content));
  ASSERT_TRUE(stream->close());
}

std::vector<std::string> ReadLines(const std::string& path) {
  std::vector<std::string> lines;
  std::unique_ptr<Port::Stream> stream = Port::File::open(path.c_str(), "r");
  if (!stream) return lines;
  Port::StringBase line;
  while (stream->readline(line) == 1) lines.push_back(line.str());
  EXPECT_TRUE(stream->geteof());
  EXPECT_FALSE(stream->error());
  return lines;
}

}  // namespace

TEST(File, OpenRefusesMissingFilesDirectoriesAndUnknownModes) {
  ScopedTempDir dir;
  EXPECT_EQ(Port::File::open(dir.Path("missing.v").c_str(), "r"), nullptr);
  EXPECT_EQ(Port::File::open(dir.path().c_str(), "r"), nullptr);
  EXPECT_EQ(Port::File::open(dir.path().c_str(), "rb"), nullptr);
  EXPECT_EQ(Port::File::open(dir.Path("new.v").c_str(), "rw"), nullptr);
  EXPECT_FALSE(Port::File::exist(dir.Path("new.v").c_str()));
  EXPECT_EQ(Port::File::open(nullptr, "r"), nullptr);
  EXPECT_EQ(Port::File::open(dir.Path("new.v").c_str(), nullptr), nullptr);
}

TEST(File, ReadlineHandlesLfCrlfEmptyLinesAndAMissingLastLineEnd) {
  ScopedTempDir dir;
  WriteFile(dir.Path("lines.txt"), "one\ntwo\r\n\nlast");
  EXPECT_EQ(ReadLines(dir.Path("lines.txt")), (std::vector<std::string>{"one", "two", "", "last"}));

  WriteFile(dir.Path("crlf.txt"), "a\r\nb\r\n");
  EXPECT_EQ(ReadLines(dir.Path("crlf.txt")), (std::vector<std::string>{"a", "b"}));

  WriteFile(dir.Path("empty.txt"), "");
  std::unique_ptr<Port::Stream> stream = Port::File::open(dir.Path("empty.txt").c_str(), "r");
  ASSERT_TRUE(stream);
  Port::StringBase line("stale");
  EXPECT_FALSE(stream->geteof());
  EXPECT_EQ(stream->readline(line), 0);
  EXPECT_TRUE(line.IsEmpty());
  EXPECT_TRUE(stream->geteof());
}

TEST(File, ReadlineReadsAOneMegabyteLine) {
  ScopedTempDir dir;
  std::string longLine(1 << 20, 'q');
  longLine[12345] = 'z';
  WriteFile(dir.Path("long.txt"), longLine + "\r\nshort\n");
  std::vector<std::string> lines = ReadLines(dir.Path("long.txt"));
  ASSERT_EQ(lines.size(), 2u);
  EXPECT_EQ(lines[0], longLine);
  EXPECT_EQ(lines[1], "short");
}

TEST(File, ReadGivesTheBytesWrittenThenZeroAtEnd) {
  ScopedTempDir dir;
  std::string path = dir.Path("data.bin");
  {
    std::unique_ptr<Port::Stream> stream = Port::File::open(path.c_str(), "wb");
    ASSERT_TRUE(stream);
    EXPECT_TRUE(stream->puts("ab"));
    EXPECT_FALSE(stream->puts(nullptr));
    EXPECT_TRUE(stream->write("c\0d", 3));
    Port::File::close(stream);
    EXPECT_EQ(stream, nullptr);
  }
  {
    std::unique_ptr<Port::Stream> stream = Port::File::open(path.c_str(), "a");
    ASSERT_TRUE(stream);
    EXPECT_TRUE(stream->write(std::string_view("e")));
  }
  std::uint64_t size = 0;
  ASSERT_TRUE(Port::File::getsize(path.c_str(), &size));
  EXPECT_EQ(size, 6u);

  std::unique_ptr<Port::Stream> stream = Port::File::open(path.c_str(), "rb");
  ASSERT_TRUE(stream);
  char buffer[16] = {};
  EXPECT_EQ(stream->read(buffer, 4), 4u);
  EXPECT_EQ(std::string(buffer, 4), std::string("abc\0d", 4));
  EXPECT_FALSE(stream->geteof());
  EXPECT_EQ(stream->read(buffer, sizeof buffer), 2u);
  EXPECT_EQ(std::string(buffer, 2), "de");
  EXPECT_EQ(stream->read(buffer, sizeof buffer), 0u);
  EXPECT_TRUE(stream->geteof());
  EXPECT_EQ(stream->read(nullptr, 4), 0u);
}

TEST(File, RemoveRRemovesANestedTreeButNoLinkTarget) {
  ScopedTempDir outside;
  WriteFile(outside.Path("keep.txt"), "kept");
  ScopedTempDir dir;
  std::string tree = dir.Path("tree");
  ASSERT_TRUE(Port::File::mkdir(tree.c_str()));
  ASSERT_TRUE(Port::File::mkdir((tree + "/a").c_str()));
  ASSERT_TRUE(Port::File::mkdir((tree + "/a/b").c_str()));
  ASSERT_TRUE(Port::File::mkdir((tree + "/a/b/empty").c_str()));
  WriteFile(tree + "/top.v", "x");
  WriteFile(tree + "/a/b/deep.v", "y");
  ASSERT_EQ(::symlink(outside.path().c_str(), (tree + "/a/linkToDir").c_str()), 0);
  ASSERT_EQ(::symlink(outside.Path("keep.txt").c_str(), (tree + "/a/b/linkToFile").c_str()), 0);

  EXPECT_TRUE(Port::File::remove_r(tree.c_str()));
  EXPECT_FALSE(Port::File::exist(tree.c_str()));
  EXPECT_TRUE(Port::File::exist(outside.Path("keep.txt").c_str()));

  EXPECT_FALSE(Port::File::remove_r(tree.c_str()));
  EXPECT_FALSE(Port::File::remove_r(nullptr));
  WriteFile(dir.Path("single.v"), "z");
  EXPECT_TRUE(Port::File::remove_r(dir.Path("single.v").c_str()));
  EXPECT_FALSE(Port::File::exist(dir.Path("single.v").c_str()));
}

TEST(File, RemoveROfALinkRemovesTheLinkOnly) {
  ScopedTempDir outside;
  WriteFile(outside.Path("keep.txt"), "kept");
  ScopedTempDir dir;
  std::string link = dir.Path("link");
  ASSERT_EQ(::symlink(outside.path().c_str(), link.c_str()), 0);
  EXPECT_TRUE(Port::File::remove_r(link.c_str()));
  EXPECT_TRUE(Port::File::exist(outside.Path("keep.txt").c_str()));
}

TEST(File, MkdtempCreatesDistinctPrivateDirectoriesUnderTmpdir) {
  ScopedTempDir root;
  ScopedEnv tmpdir("TMPDIR", (root.path() + "/").c_str());

  Port::StringBase first;
  Port::StringBase second;
  ASSERT_TRUE(Port::File::mkdtemp(&first));
  ASSERT_TRUE(Port::File::mkdtemp(&second));
  EXPECT_NE(first, second);
  for (const Port::StringBase& made : {first, second}) {
    EXPECT_TRUE(made.StartsWith(root.path() + "/")) << made.str();
    EXPECT_EQ(made.view().find("//"), std::string_view::npos) << made.str();
    struct stat info;
    ASSERT_EQ(::stat(made.c_str(), &info), 0);
    EXPECT_TRUE(S_ISDIR(info.st_mode));
    EXPECT_EQ(info.st_mode & 0777, 0700u);
  }

  Port_Env::SetEnv("TMPDIR", root.Path("no-such-dir").c_str());
  Port::StringBase fallback;
  ASSERT_TRUE(Port::File::mkdtemp(&fallback));
  EXPECT_TRUE(fallback.StartsWith("/tmp/")) << fallback.str();
  EXPECT_TRUE(Port::File::remove_r(fallback.c_str()));
  EXPECT_FALSE(Port::File::mkdtemp(nullptr));
}

TEST(File, TmpnamGivesFreshUnusedNames) {
  Port::StringBase first;
  Port::StringBase second;
  ASSERT_TRUE(Port::File::tmpnam(&first));
  ASSERT_TRUE(Port::File::tmpnam(&second));
  EXPECT_NE(first, second);
  EXPECT_FALSE(Port::File::exist(first.c_str()));
  EXPECT_FALSE(Port::File::exist(second.c_str()));
  EXPECT_FALSE(Port::File::tmpnam(nullptr));
}

TEST(File, GetdatetimeGivesTheModificationTimeOfExistingFilesOnly) {
  ScopedTempDir dir;
  std::int64_t before = std::time(nullptr);
  WriteFile(dir.Path("fresh.v"), "module m; endmodule\n");
  std::int64_t after = std::time(nullptr);

  std::int64_t modified = -1;
  ASSERT_TRUE(Port::File::getdatetime(dir.Path("fresh.v").c_str(), &modified));
  EXPECT_GE(modified, before - 1);
  EXPECT_LE(modified, after + 1);

  std::int64_t untouched = 42;
  EXPECT_FALSE(Port::File::getdatetime(dir.Path("missing.v").c_str(), &untouched));
  EXPECT_EQ(untouched, 42);
  EXPECT_FALSE(Port::File::getdatetime(dir.Path("fresh.v").c_str(), nullptr));
  std::uint64_t size = 0;
  EXPECT_FALSE(Port::File::getsize(dir.Path("missing.v").c_str(), &size));
}

TEST(File, MkdirChdirAndGetcwdWorkTogether) {
  ScopedTempDir dir;
  ScopedWorkingDirectory returns(dir.path());
  std::string sub = dir.Path("sub");
  EXPECT_TRUE(Port::File::mkdir(sub.c_str()));
  EXPECT_FALSE(Port::File::mkdir(sub.c_str()));
  EXPECT_TRUE(Port::File::isDirectory(sub.c_str()));
  EXPECT_FALSE(Port::File::chdir(dir.Path("missing").c_str()));

  ASSERT_TRUE(Port::File::chdir(sub.c_str()));
  Port::StringBase cwd;
  ASSERT_TRUE(Port::File::getcwd(&cwd));
  char* real = ::realpath(sub.c_str(), nullptr);
  ASSERT_NE(real, nullptr);
  EXPECT_EQ(cwd, real);
  std::free(real);
  EXPECT_FALSE(Port::File::getcwd(nullptr));
}
