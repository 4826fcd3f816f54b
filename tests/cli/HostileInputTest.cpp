// Hostile input on the command line: no input is lost, nothing blocks, no failure passes as
// success.
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstdlib>
#include <fstream>
#include <iterator>
#include <string>
#include <vector>

#include "CliRun.h"
#include "Port/InputLimits.h"

namespace cli_test {
namespace {

std::string Contents(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  return std::string((std::istreambuf_iterator<char>(in)), std::istreambuf_iterator<char>());
}

void ExpectBadInputNaming(const CliResult& result, const std::string& named) {
  EXPECT_EQ(result.status, 2) << result.err;
  EXPECT_EQ(result.out, "");
  EXPECT_NE(result.err.find(named), std::string::npos) << result.err;
}

// Creates an empty file; its path.
std::string Created(const std::string& path) {
  std::ofstream{path};
  return path;
}

const char* const kEntity = "entity solo is end entity;\n";

TEST(HostileInput, OutputPathThatIsAnInputIsRefusedAndLeftAlone) {
  ScopedTextFile source(kEntity, "solo.vhd");
  ScopedTextFile list(source.path() + "\n", "sources.f");
  ScopedTextFile project("{\"files\": [{\"path\": \"" + source.path() + "\"}]}", "project.json");
  const std::vector<std::vector<std::string>> runs = {
      {"units", "-o", source.path(), source.path()},
      {"units", "-o", list.path(), "-f", list.path()},
      {"units", "-o", source.path(), "-f", list.path()},
      {"units", "-o", project.path(), "-P", project.path()},
  };
  for (const std::vector<std::string>& args : runs) {
    SCOPED_TRACE(args[2]);
    ExpectBadInputNaming(RunQuillon(args), "is also an input");
  }
  EXPECT_EQ(Contents(source.path()), kEntity);
  EXPECT_EQ(Contents(list.path()), source.path() + "\n");

  // A symbolic link to a source is the same file.
  const std::string link = source.Beside("link.json");
  ASSERT_EQ(symlink(source.path().c_str(), link.c_str()), 0);
  ExpectBadInputNaming(RunQuillon({"units", "-o", link, source.path()}), "is also an input");
  EXPECT_EQ(Contents(source.path()), kEntity);
}

TEST(HostileInput, FailingRunLeavesAnExistingOutputUntouched) {
  ScopedTextFile output("the answer of an earlier run", "answer.txt");
  ScopedTextFile source(kEntity, "solo.vhd");
  CliResult failed = RunQuillon({"order", "--top", "nowhere", "-o", output.path(), source.path()});
  EXPECT_NE(failed.status, 0);
  EXPECT_EQ(Contents(output.path()), "the answer of an earlier run");

  CliResult done = RunQuillon({"units", "-o", output.path(), source.path()});
  EXPECT_EQ(done.status, 0) << done.err;
  EXPECT_NE(Contents(output.path()).find("Entity|solo"), std::string::npos);
  struct stat facts {};
  ASSERT_EQ(stat(output.path().c_str(), &facts), 0);
  mode_t mask = umask(0);
  umask(mask);
  EXPECT_EQ(facts.st_mode & 0777, 0666 & ~mask) << "the output gets the mode of a new file";
}

TEST(HostileInput, SourcesAndListsMustBeRegularFilesOfBoundedSize) {
  ScopedTextFile source(kEntity, "solo.vhd");
  const std::string fifo = source.Beside("pipe.vhd");
  ASSERT_EQ(mkfifo(fifo.c_str(), 0600), 0);
  for (const char* option : {"", "-P", "-f"}) {
    SCOPED_TRACE(option);
    std::vector<std::string> args{"units"};
    if (*option) args.push_back(option);
    args.push_back(fifo);
    ExpectBadInputNaming(RunQuillon(args), fifo + " is not a regular file");
  }
  ExpectBadInputNaming(RunQuillon({"units", "/dev/zero"}), "/dev/zero is not a regular file");
  ExpectBadInputNaming(RunQuillon({"units", "-f", "/dev/zero"}), "/dev/zero is not a regular file");

  // Sparse files: the size is checked before anything is read.
  const std::string hugeList = source.Beside("huge.f");
  ASSERT_EQ(truncate(Created(hugeList).c_str(), Port::InputLimits::kMaxListBytes + 1), 0);
  ExpectBadInputNaming(RunQuillon({"units", "-f", hugeList}), hugeList + " is larger than");
  const std::string hugeSource = source.Beside("huge.vhd");
  ASSERT_EQ(truncate(Created(hugeSource).c_str(), Port::InputLimits::kMaxSourceBytes + 1), 0);
  ExpectBadInputNaming(RunQuillon({"units", hugeSource}), hugeSource + " is larger than");
}

TEST(HostileInput, ConverterThatWritesNothingFailsTheRunAndJsonStaysJson) {
  ScopedTextFile converter("#!/bin/sh\nexit 0\n", "abelconv");
  ASSERT_EQ(chmod(converter.path().c_str(), 0755), 0);
  ScopedTextFile source("module silent\n", "silent.abl");
  const std::string path = converter.Beside("") + ":" + (getenv("PATH") ? getenv("PATH") : "");
  CliResult result = RunQuillon(CliRun{{"--format", "json", "check", source.path()}, "", {{"PATH", path}}});
  EXPECT_EQ(result.status, 1) << result.err;
  ASSERT_FALSE(result.out.empty());
  EXPECT_EQ(result.out[0], '{') << result.out;
  EXPECT_EQ(result.out.find("File not found"), std::string::npos) << result.out;
  EXPECT_NE(result.out.find("abelconv wrote no output silent.hrf for silent.abl"), std::string::npos)
      << result.out;
}

TEST(HostileInput, ConverterTimeoutIsAnOptionOfSeconds) {
  ScopedTextFile source(kEntity, "solo.vhd");
  EXPECT_EQ(RunQuillon({"--converter-timeout", "5", "units", source.path()}).status, 0);
  ExpectBadInputNaming(RunQuillon({"--converter-timeout", "soon", "units", source.path()}),
                       "--converter-timeout");
  ExpectBadInputNaming(RunQuillon({"--converter-timeout", "-3", "units", source.path()}),
                       "--converter-timeout");
}

TEST(HostileInput, DefinesAndIncludeDirectoriesHoldingTheListSeparatorAreRefused) {
  ScopedTextFile source(kEntity, "solo.vhd");
  ExpectBadInputNaming(RunQuillon({"-D", "A=1;B", "units", source.path()}), "-D 'A=1;B' holds a ';'");
  ExpectBadInputNaming(RunQuillon({"-I", "inc;other", "units", source.path()}), "-I 'inc;other' holds a ';'");
  ScopedTextFile list("+define+A=1;B\n" + source.path() + "\n", "sources.f");
  ExpectBadInputNaming(RunQuillon({"units", "-f", list.path()}), list.path() + ":1: 'A=1;B' holds a ';'");
}

TEST(HostileInput, FileListsSkipAByteOrderMarkAndKeepDoubleSlashesInsidePaths) {
  ScopedTextFile source(kEntity, "solo.vhd");
  const std::string doubled = source.Beside("") + "/solo.vhd";
  ScopedTextFile list("\xEF\xBB\xBF" + doubled + "  // the only source\n", "sources.f");
  CliResult result = RunQuillon({"units", "-f", list.path()});
  EXPECT_EQ(result.status, 0) << result.err;
  EXPECT_NE(result.out.find("Entity|solo"), std::string::npos) << result.out;
}

TEST(HostileInput, RepeatedSourceIsReadOnceWithAWarning) {
  ScopedTextFile source(kEntity, "solo.vhd");
  ScopedTextFile list(source.path() + "\n", "sources.f");
  CliResult result = RunQuillon({"units", source.path(), "-f", list.path()});
  EXPECT_EQ(result.status, 0) << result.err;
  EXPECT_EQ(Lines(result.out).size(), 1u) << result.out;
  EXPECT_NE(result.err.find("WARNING: " + source.path() + " is given more than once; it is read once"),
            std::string::npos)
      << result.err;
}

TEST(HostileInput, NulInsideAProjectFilePathIsAnError) {
  ScopedTextFile source(kEntity, "solo.vhd");
  ScopedTextFile project("{\"files\": [{\"path\": \"" + source.path() + "\\u0000.txt\"}]}", "project.json");
  ExpectBadInputNaming(RunQuillon({"units", "-P", project.path()}),
                       "files[0]: the path holds a NUL character");
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
