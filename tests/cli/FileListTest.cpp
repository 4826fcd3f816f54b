#include <gtest/gtest.h>

#include <map>
#include <sstream>

#include "FileList.h"

namespace quillon {
namespace {

using Contents = FileList::Contents;

// Lists held in memory, an environment of our own and a standard input of our own.
class FileListTest : public ::testing::Test {
 protected:
  bool Read(const std::string& path, bool relativeToList, Contents& contents, std::string& error) {
    return reader_.Read(path, relativeToList, "", "", contents, error);
  }

  // Each entry as its path, after "LIBRARY:" when it has one and before " PLUGIN" when it has one.
  std::vector<std::string> Paths(const std::vector<FileList::Entry>& entries) {
    std::vector<std::string> paths;
    for (const FileList::Entry& entry : entries) {
      paths.push_back((entry.library.empty() ? "" : entry.library + ":") + entry.path +
                      (entry.plugin.empty() ? "" : " " + entry.plugin));
    }
    return paths;
  }

  // The contents of the list "top.f" holding `text`, or of standard input when `text` is empty.
  Contents ReadOk(const std::string& text) {
    std::string path = text.empty() ? FileList::kStandardInput : "top.f";
    if (!text.empty()) files_[path] = text;
    Contents contents;
    std::string error;
    EXPECT_TRUE(Read(path, false, contents, error)) << error;
    return contents;
  }

  // The error of reading `text` as the list "bad.f".
  std::string ErrorOf(const std::string& text) {
    files_["bad.f"] = text;
    Contents contents;
    std::string error;
    EXPECT_FALSE(Read("bad.f", false, contents, error));
    return error;
  }

  std::map<std::string, std::string> files_;
  std::map<std::string, std::string> environment_;
  std::istringstream input_;
  FileList reader_{[this](const std::string& path, std::string& text, std::string&) {
                     auto file = files_.find(path);
                     if (file == files_.end()) return false;
                     text = file->second;
                     return true;
                   },
                   [this](const std::string& name) -> std::optional<std::string> {
                     auto value = environment_.find(name);
                     if (value == environment_.end()) return std::nullopt;
                     return value->second;
                   },
                   input_};
};

TEST_F(FileListTest, EveryTokenKindOnAnyLine) {
  Contents contents = ReadOk(
      "a.v \"with blank.v\" 'c.sv' // a comment\n"
      "# a whole-line comment\n"
      "/* a comment\n   over lines */ d.vhd\n"
      "+incdir+inc+../shared +define+WIDTH=8+FAST\n"
      "+libext+.v+sv -y cells -v lib/gates.v\n"
      "-l common e.vhd -sv f.txt\n"
      "dir//g.v ./h.v\n");
  EXPECT_EQ(Paths(contents.sources),
            (std::vector<std::string>{"a.v", "with blank.v", "c.sv", "d.vhd", "common:e.vhd",
                                      "common:f.txt " + std::string(FileList::kVerilogPlugin),
                                      "common:dir/g.v " + std::string(FileList::kVerilogPlugin),
                                      "common:h.v " + std::string(FileList::kVerilogPlugin)}));
  EXPECT_EQ(contents.includeDirs, (std::vector<std::string>{"inc", "../shared"}));
  EXPECT_EQ(contents.defines, (std::vector<std::string>{"WIDTH=8", "FAST"}));
  EXPECT_EQ(contents.libraryExtensions, (std::vector<std::string>{".v", ".sv"}));
  EXPECT_EQ(Paths(contents.libraryDirs), std::vector<std::string>{"cells"});
  EXPECT_EQ(Paths(contents.libraryFiles), std::vector<std::string>{"lib/gates.v"});
  EXPECT_EQ(contents.sources[3].where, "top.f:4: ");
}

TEST_F(FileListTest, NestedListsTakePathsFromTheCurrentOrTheListDirectory) {
  files_["rtl/core/core.f"] = "-l core cpu.v +incdir+inc\n-F ../alu/alu.f\n";
  files_["rtl/alu/alu.f"] = "/abs/alu.v adder.v\n";
  files_["sim/sim.f"] = "sim/tb.v\n";
  Contents contents = ReadOk("-F rtl/core/core.f\n-f sim/sim.f\ntop.v\n");
  // A library set inside a list holds for that list and the lists it names, not after it.
  EXPECT_EQ(Paths(contents.sources), (std::vector<std::string>{"core:rtl/core/cpu.v", "core:/abs/alu.v",
                                                               "core:rtl/alu/adder.v", "sim/tb.v", "top.v"}));
  EXPECT_EQ(contents.includeDirs, std::vector<std::string>{"rtl/core/inc"});
}

TEST_F(FileListTest, VariablesComeFromTheEnvironmentOutsideSingleQuotes) {
  environment_ = {{"PROJECT_HOME", "/home/p"}, {"REV", "b"}};
  Contents contents =
      ReadOk("$PROJECT_HOME/a.v ${PROJECT_HOME}/x_$(REV).v \"$REV dir/c.v\" '$REV/d.v' cost$.v\n");
  EXPECT_EQ(Paths(contents.sources),
            (std::vector<std::string>{"/home/p/a.v", "/home/p/x_b.v", "b dir/c.v", "$REV/d.v", "cost$.v"}));

  EXPECT_EQ(ErrorOf("a.v\n$NOT_SET/b.v\n"), "bad.f:2: the environment variable NOT_SET is not set");
  EXPECT_EQ(ErrorOf("${OPEN/b.v\n"), "bad.f:1: the variable after '${' is not closed by '}'");
}

TEST_F(FileListTest, ErrorsNameTheListAndTheLine) {
  EXPECT_EQ(ErrorOf("a.v\n\n+bogus+1\n"), "bad.f:3: unknown list option +bogus+1");
  EXPECT_EQ(ErrorOf("-timescale 1ns/1ps\n"), "bad.f:1: unknown list option -timescale");
  EXPECT_EQ(ErrorOf("a.v\n\"open.v\n"), "bad.f:2: a \" quote is not closed on its line");
  EXPECT_EQ(ErrorOf("a.v /* open\n\n"), "bad.f:1: a /* comment is not closed");
  EXPECT_EQ(ErrorOf("a.v\n-f\n"), "bad.f:2: -f needs a value");
  EXPECT_EQ(ErrorOf("a.v\n-l\n-sv\nb.v\n"), "bad.f:2: -l needs a value");
  EXPECT_EQ(ErrorOf("-l\n+incdir+inc\n"), "bad.f:1: -l needs a value");
  EXPECT_EQ(ErrorOf("-y\n-v lib.v\n"), "bad.f:1: -y needs a value");
  EXPECT_EQ(ErrorOf("+define+=1\n"), "bad.f:1: +define+ needs NAME[=VALUE], not '=1'");
  EXPECT_EQ(ErrorOf("-f absent.f\n"), "bad.f:1: cannot read file list absent.f");

  files_["b.f"] = "two.v\n\n-f ./bad.f\n";
  EXPECT_EQ(ErrorOf("one.v\n-f b.f\n"), "b.f:3: the list bad.f includes itself");
}

TEST_F(FileListTest, HarmlessSimulatorOptionsOnlyWarn) {
  Contents contents = ReadOk("+notimingchecks a.v\n-64\n");
  EXPECT_EQ(Paths(contents.sources), std::vector<std::string>{"a.v"});
  EXPECT_EQ(contents.warnings,
            (std::vector<std::string>{
                "top.f:1: the simulator option +notimingchecks changes nothing here; it is ignored",
                "top.f:2: the simulator option -64 changes nothing here; it is ignored"}));
}

TEST_F(FileListTest, StandardInputIsReadOnce) {
  input_.str("a.v\n-F rtl/more.f\n");
  files_["rtl/more.f"] = "b.v\n";
  EXPECT_EQ(Paths(ReadOk("").sources), (std::vector<std::string>{"a.v", "rtl/b.v"}));
  EXPECT_EQ(ErrorOf("-f -\n"), "bad.f:1: standard input is read once; it is named as a list twice");
}

}  // namespace
}  // namespace quillon
