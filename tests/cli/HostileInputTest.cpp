// Hostile input on the command line: no input is lost, nothing blocks, no failure passes as
// success.
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstdlib>
#include <fstream>
#include <string>
#include <vector>

#include "CliRun.h"
#include "Port/InputLimits.h"

namespace cli_test {
namespace {

const char* const kEntity = "entity solo is end entity;\n";

// An empty file grown to `size` bytes without writing them; its path.
std::string Sparse(const std::string& path, off_t size) {
  std::ofstream{path};
  EXPECT_EQ(truncate(path.c_str(), size), 0);
  return path;
}

TEST(HostileInput, OutputPathThatIsAnInputIsRefusedAndLeftAlone) {
  ScopedTextFile source(kEntity, "solo.vhd");
  ScopedTextFile list(source.path() + "\n", "sources.f");
  ScopedTextFile project("{\"files\": [{\"path\": \"" + source.path() + "\"}]}", "project.json");
  const std::string link = source.Beside("link.json");  // a symbolic link to a source is the same file
  ASSERT_EQ(symlink(source.path().c_str(), link.c_str()), 0);
  ExpectAllRejected({
      {{"units", "-o", source.path(), source.path()}, "is also an input"},
      {{"units", "-o", list.path(), "-f", list.path()}, "is also an input"},
      {{"units", "-o", source.path(), "-f", list.path()}, "is also an input"},
      {{"units", "-o", project.path(), "-P", project.path()}, "is also an input"},
      {{"units", "-o", link, source.path()}, "is also an input"},
  });
  EXPECT_EQ(ReadText(source.path()), kEntity);
  EXPECT_EQ(ReadText(list.path()), source.path() + "\n");
  EXPECT_EQ(ReadText(project.path()), "{\"files\": [{\"path\": \"" + source.path() + "\"}]}");
}

TEST(HostileInput, FailingRunLeavesAnExistingOutputUntouched) {
  ScopedTextFile output("the answer of an earlier run", "answer.txt");
  ScopedTextFile source(kEntity, "solo.vhd");
  EXPECT_NE(RunQuillon({"order", "--top", "nowhere", "-o", output.path(), source.path()}).status, 0);
  EXPECT_EQ(ReadText(output.path()), "the answer of an earlier run");

  CliResult done = RunQuillon({"units", "-o", output.path(), source.path()});
  EXPECT_EQ(done.status, 0) << done.err;
  EXPECT_EQ(ReadText(output.path()), source.path() + ":1: Entity Entity|solo (library work)\n");
  struct stat facts {};
  ASSERT_EQ(stat(output.path().c_str(), &facts), 0);
  mode_t mask = umask(0);
  umask(mask);
  EXPECT_EQ(facts.st_mode & 0777, 0666 & ~mask) << "the output gets the mode of a new file";
}

TEST(HostileInput, InputsMustBeRegularFilesOfBoundedSizeAndSafeValues) {
  ScopedTextFile source(kEntity, "solo.vhd");
  const std::string fifo = source.Beside("pipe.vhd");
  ASSERT_EQ(mkfifo(fifo.c_str(), 0600), 0);
  // Sparse files: the size is checked before anything is read.
  const std::string hugeList = Sparse(source.Beside("huge.f"), Port::InputLimits::kMaxListBytes + 1);
  const std::string hugeSource = Sparse(source.Beside("huge.vhd"), Port::InputLimits::kMaxSourceBytes + 1);
  ScopedTextFile list("+define+A=1;B\n" + source.path() + "\n", "sources.f");
  ScopedTextFile nul("{\"files\": [{\"path\": \"" + source.path() + "\\u0000.txt\"}]}", "project.json");
  ExpectAllRejected({
      {{"units", fifo}, fifo + " is not a regular file"},
      {{"units", "-P", fifo}, fifo + " is not a regular file"},
      {{"units", "-f", fifo}, fifo + " is not a regular file"},
      {{"units", "/dev/zero"}, "/dev/zero is not a regular file"},
      {{"units", "-f", "/dev/zero"}, "/dev/zero is not a regular file"},
      {{"units", "-f", hugeList}, hugeList + " is larger than"},
      {{"units", hugeSource}, hugeSource + " is larger than"},
      {{"--converter-timeout", "soon", "units", source.path()}, "--converter-timeout"},
      {{"--converter-timeout", "-3", "units", source.path()}, "--converter-timeout"},
      // The separator of the lists that reach the parsers.
      {{"-D", "A=1;B", "units", source.path()}, "-D 'A=1;B' holds a ';'"},
      {{"-I", "inc;other", "units", source.path()}, "-I 'inc;other' holds a ';'"},
      {{"units", "-f", list.path()}, list.path() + ":1: 'A=1;B' holds a ';'"},
      {{"units", "-P", nul.path()}, "files[0]: the path holds a NUL character"},
  });
  EXPECT_EQ(RunQuillon({"--converter-timeout", "5", "units", source.path()}).status, 0);
}

TEST(HostileInput, ConverterThatWritesNothingFailsTheRunAndJsonStaysJson) {
  ScopedTextFile converter("#!/bin/sh\nexit 0\n", "abelconv");
  ASSERT_EQ(chmod(converter.path().c_str(), 0755), 0);
  ScopedTextFile source("module silent\n", "silent.abl");
  const std::string path = converter.dir() + ":" + (getenv("PATH") ? getenv("PATH") : "");
  CliResult result = RunQuillon(CliRun{{"--format", "json", "check", source.path()}, "", {{"PATH", path}}});
  EXPECT_EQ(result.status, 1) << result.err;
  ASSERT_FALSE(result.out.empty());
  EXPECT_EQ(result.out[0], '{') << result.out;
  EXPECT_EQ(result.out.find("File not found"), std::string::npos) << result.out;
  EXPECT_NE(result.out.find("abelconv wrote no output silent.hrf for silent.abl"), std::string::npos)
      << result.out;
}

TEST(HostileInput, ListsSkipAByteOrderMarkAndReadARepeatedSourceOnce) {
  ScopedTextFile source(kEntity, "solo.vhd");
  ScopedTextFile list("\xEF\xBB\xBF" + source.dir() + "//solo.vhd  // the only source\n", "sources.f");
  CliResult result = RunQuillon({"units", source.path(), "-f", list.path()});
  EXPECT_EQ(result.status, 0) << result.err;
  EXPECT_EQ(result.out, source.path() + ":1: Entity Entity|solo (library work)\n");
  EXPECT_NE(result.err.find("WARNING: " + source.path() + " is given more than once; it is read once"),
            std::string::npos)
      << result.err;
}

TEST(HostileInput, VerilogCompilerErrorsReachTheUserOnceWithFileAndLine) {
  ScopedTextFile broken("module a;\n`include \"absent.vh\"\nendmodule\n", "broken.v");
  ScopedTextFile clean("module b;\nendmodule\n", "clean.v");
  for (const char* command : {"units", "check"}) {
    CliResult result = RunQuillon({command, broken.path(), clean.path()});
    EXPECT_EQ(result.status, 1) << result.err;
    // check shows it as a diagnostic, the other commands as a message.
    const std::string expected =
        std::string(command) == "check"
            ? broken.path() + ":2: error: include file \"absent.vh\" not found [syntax-error]"
            : "ERROR: " + broken.path() + ":2: include file \"absent.vh\" not found";
    std::size_t first = result.err.find(expected);
    EXPECT_NE(first, std::string::npos) << result.err;
    EXPECT_EQ(result.err.find(expected, first + 1), std::string::npos) << "reported once: " << result.err;
  }
}

}  // namespace
}  // namespace cli_test
