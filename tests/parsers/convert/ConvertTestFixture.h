// Parses sources of a project whose converters are small scripts of the test, put first on PATH,
// and describes what was recorded. Every parse also checks that the current directory is the
// one it started in.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <utime.h>

#include <cstdio>
#include <ctime>
#include <string>
#include <string_view>
#include <vector>

#include "CHdlElement.h"
#include "CParserConfigHolder.h"
#include "Port/File.h"
#include "Port/MsgManData.h"
#include "ScopedEnv.h"
#include "ScopedTempDir.h"
#include "TestHost.h"

namespace convert_test {

class ConverterParse : public test_host::PipelineTest {
 protected:
  void SetUp() override { project_ = NewProject(); }

  // An executable shell script named `name` in the tools directory.
  void InstallTool(std::string_view name, std::string_view body) {
    std::string path = tools_.Path(name);
    WriteBytes(path, "#!/bin/sh\n" + std::string(body));
    ASSERT_EQ(chmod(path.c_str(), 0755), 0);
  }

  // What a tool script appended to "<name>.log" in the tools directory; empty when it never ran.
  std::string ToolLog(std::string_view name) const {
    return ReadBytes(tools_.Path(std::string(name) + ".log"));
  }
  // A script line that logs the tool's directory and arguments, one run per line.
  std::string LogRun(std::string_view name) const {
    return "printf '%s' \"$(pwd)\" >> '" + tools_.Path(std::string(name) + ".log") +
           "'\nfor a in \"$@\"; do printf '|%s' \"$a\" >> '" + tools_.Path(std::string(name) + ".log") +
           "'; done\necho >> '" + tools_.Path(std::string(name) + ".log") + "'\n";
  }

  // A file in the sources directory holding exactly `bytes`; its full path.
  std::string Source(std::string_view name, std::string_view bytes) {
    std::string path = sources_.Path(name);
    WriteBytes(path, bytes);
    return path;
  }

  static std::string ReadBytes(const std::string& path) {
    std::string text;
    if (std::FILE* in = std::fopen(path.c_str(), "rb")) {
      char buffer[4096];
      for (std::size_t n; (n = std::fread(buffer, 1, sizeof buffer, in)) > 0;) text.append(buffer, n);
      std::fclose(in);
    }
    return text;
  }

  // Sets the file's modification time `seconds` from now.
  static void SetAge(const std::string& path, long seconds) {
    utimbuf times{};
    times.actime = times.modtime = std::time(nullptr) + seconds;
    ASSERT_EQ(utime(path.c_str(), &times), 0);
  }

  // Parses the file as the project does and describes its units; the current directory must be
  // the same afterwards.
  std::vector<std::string> Parse(const std::string& path, std::string_view plugin) {
    file_ = AddNewFile(project_.Get(), path, plugin);
    return ParseAgain();
  }

  std::vector<std::string> ParseAgain() {
    Port::StringBase before;
    Port::StringBase after;
    EXPECT_TRUE(Port::File::getcwd(&before));
    Port_DebugCapture debug;
    HolderOf(file_.Get())->Parse(nullptr);
    debugText_ = debug.text();
    EXPECT_TRUE(Port::File::getcwd(&after));
    EXPECT_EQ(after.str(), before.str()) << "the current directory was not restored";
    return Describe(FileObject(file_.Get())->GetUnitSet());
  }

  std::string Part() const { return HolderOf(file_.Get())->GetPart().str(); }

  // "<type>: <text>" of the messages issued, with their category checked.
  std::vector<std::string> Messages() const { return messages_.Lines("ProjectMgmt"); }

  static std::vector<std::string> Describe(Vad::IHdlDesignUnitSet* set) {
    return DescribeUnits(set, [](CitI::IInterface* unit) { return Describe(unit); });
  }

  static std::string Describe(CitI::IInterface* unit) { return DescribeRecord(unit, KindOf); }

  static std::string KindOf(const Port::XUID& type) {
    static constexpr TypeName kKinds[] = {
        {"{F8EC4980-CDA2-4346-9E3C-DB50D7DA83E9}", "instance"},
        {"{15B800DC-CD3B-45f9-B26A-26BFDD3441EF}", "entity"},
        {"{6DCC6CCB-40B6-4f09-9AB3-C3593438F5B2}", "architecture"},
        {"{AE4C9C94-8BAF-44e7-8443-58AD260CF311}", "module"},
        {"{2391D1AB-9BB0-4a61-A080-3CE4BFE2E116}", "test-vector"},
        {"{3E515CB2-8A29-45dd-860D-0C91C6E19881}", "file-named"},
        {"{8E6A8A42-F002-42fd-B41D-ACBD4C2B5496}", "netlist-top"},
        {"{45521D25-692C-4132-B1A3-3B13F6144A62}", "netlist-lower"},
        {"{B237B353-2643-4349-909D-962EC491A5A1}", "netlist-instance"},
        {"{6DD669C2-9830-4a4d-B522-97C444BEB739}", "placed-database"},
        {"{98318D43-5516-4f88-880D-2695BB65C12E}", "intermediate-database"}};
    return NameOfType(type, kKinds);
  }

  ScopedTempDir tools_;
  ScopedTempDir sources_;
  ScopedEnv path_{"PATH",
                  (tools_.path() + ":" + (Port_Env::GetEnv("PATH") ? Port_Env::GetEnv("PATH") : "")).c_str()};
  ScopedEnv qt3_{"CVN_WSMGR_QT3", nullptr};
  Prjrep::AutoPtr<Vad::IHdlProject> project_;
  Prjrep::AutoPtr<Vad::IHdlFile> file_;
  test_host::MessageLog messages_;
  std::string debugText_;
};

}  // namespace convert_test
