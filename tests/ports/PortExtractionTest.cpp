// Port queries through the project (getDesignUnitPorts) and the parsers' ExtractPorts, on copies
// of the files under tests/data/ports/:
//   sizes_pkg.vhd  package sizes_pkg with the constant LANES
//   mixer.vhd      entity mixer (generics WIDTH, DEPTH from WIDTH; ports with ranges over both and
//                  one over LANES), architecture instantiating gauge
//   gauge.vhd      entity gauge with a generic without default, its architecture
//   pair.v         module stage (parameter W), module duo instantiating stage
#include <gtest/gtest.h>

#include <cstdio>
#include <fstream>
#include <sstream>
#include <string>
#include <string_view>
#include <vector>

#include "IHdlElaborationData.h"
#include "IHdlPort.h"
#include "Port/MsgManData.h"
#include "PortExtraction.h"
#include "ScopedTempDir.h"
#include "TestHost.h"
#include "VerilogParser.h"
#include "VhdlParser.h"

namespace {

using Strings = std::vector<std::string>;

std::string ReadText(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  std::ostringstream text;
  text << in.rdbuf();
  return text.str();
}

void WriteText(const std::string& path, std::string_view text) {
  std::ofstream out(path, std::ios::binary | std::ios::trunc);
  out << text;
  ASSERT_TRUE(out.good()) << path;
}

// "POSITION NAME DIRECTION TYPE", then " LOW HIGH SPAN" for a port with a range.
std::string Describe(Vad::IHdlPort* port) {
  Port::StringBase name;
  Port::StringBase type;
  port->getName(&name);
  port->getTypeName(&type);
  std::string text = std::to_string(port->getPosition()) + " " + name.str() + " " +
                     std::to_string(port->getDirection()) + " " + type.str();
  if (port->hasRange()) {
    text += " " + std::to_string(port->getRangeLow()) + " " + std::to_string(port->getRangeHigh()) + " " +
            std::to_string(port->getRangeSpan());
  }
  return text;
}

Strings Describe(Vad::IHdlPortIterator* ports) {
  Strings lines;
  if (!ports) return lines;
  for (ports->First(); !ports->IsDone(); ports->Next()) lines.push_back(Describe(ports->Current()));
  return lines;
}

class PortExtraction : public test_host::PipelineTest {
 protected:
  void SetUp() override {
    log_.SilenceTerminal();
    project_ = NewProject();
    for (const char* name : {"sizes_pkg.vhd", "mixer.vhd", "gauge.vhd"}) AddCopy(name, "PLUGIN_Vhdl");
    auto verilog = AddCopy("pair.v", "PLUGIN_Verilog");
    Prjrep::QueryAs<Vad::IHdlFileV3>(verilog.Get())->setV3Flag(true);
    ASSERT_EQ(project_->getAllDesignUnits(units_.Out()), CitI::kOk);
  }

  Prjrep::AutoPtr<Vad::IHdlFile> AddCopy(const char* name, const char* plugin) {
    WriteText(dir_.Path(name), ReadText(std::string(QUILLON_TEST_DATA_DIR) + "/ports/" + name));
    auto file = AddNewFile(project_.Get(), dir_.Path(name), plugin);
    files_.push_back(file);
    return file;
  }

  Vad::IHdlElaborationData* Elaboration() const {
    return Prjrep::QueryAs<Vad::IHdlElaborationData>(project_.Get());
  }

  Vad::IHdlDesignUnit* Unit(std::string_view key) const {
    return test_host::UnitWithKey(units_.Get(), key).Get();
  }

  // The ports the project hands out for the unit; the query itself always answers 1.
  Strings PortsOf(std::string_view key) {
    Prjrep::AutoRelease<Vad::IHdlPortIterator> ports;
    EXPECT_EQ(Elaboration()->getDesignUnitPorts(Unit(key), ports.Out()), CitI::kOk) << key;
    return Describe(ports.Get());
  }

  // The result of the parser's own port query for the unit of a file, which the project does
  // not pass on.
  template <class Parser>
  CitI::Result ParserResultFor(std::string_view key, Vad::IHdlFile* file) {
    Parser parser;
    Prjrep::AutoRelease<Vad::IHdlPortIterator> ports;
    CitI::Result result = parser.ExtractPorts(*HolderOf(file), Unit(key), ports.Out());
    EXPECT_EQ(ports.Get() != nullptr, result == CitI::kOk) << key;
    return result;
  }

  Strings ErrorTexts() const { return log_.Texts(Port_MsgMan::kError); }

  // The developer texts that give the reason for a missing answer.
  Strings Reasons() const {
    Strings reasons;
    std::istringstream lines(debug_.text());
    for (std::string line; std::getline(lines, line);) {
      if (line.starts_with("ports of ")) reasons.push_back(line);
    }
    return reasons;
  }

  ScopedTempDir dir_;
  Port_DebugCapture debug_;
  test_host::MessageLog log_;
  Prjrep::AutoPtr<Vad::IHdlProject> project_;
  std::vector<Prjrep::AutoPtr<Vad::IHdlFile>> files_;  // sizes_pkg, mixer, gauge, pair
  Prjrep::AutoRelease<Vad::IHdlDesignUnitSet> units_;
};

TEST_F(PortExtraction, AnEntityHasItsPortsWithRangesFromItsGenerics) {
  const Strings expected{"1 clk 0 std_logic", "2 samples 0 std_logic_vector 0 7 7",
                         "3 level 1 std_logic_vector 0 7 7", "4 probe 13 std_logic",
                         "5 lanes 1 std_logic_vector"};  // a package constant is not evaluated
  EXPECT_EQ(PortsOf("Entity|mixer"), expected);
  EXPECT_EQ(PortsOf("Architecture|mixer|rtl"), expected);
  EXPECT_EQ(ErrorTexts(), Strings{});
}

TEST_F(PortExtraction, EveryModuleGetsItsOwnPortsNotThoseOfTheTopModule) {
  EXPECT_EQ(PortsOf("Module|stage"), (Strings{"1 clk 0 wire", "2 d 0 wire 0 3 3", "3 q 1 reg 0 3 3"}));
  EXPECT_EQ(PortsOf("Module|duo"), (Strings{"1 clk 0 wire", "2 pins 13 wire 0 1 1"}));
  EXPECT_EQ(ErrorTexts(), Strings{});
}

TEST_F(PortExtraction, ThePortsOutliveTheProjectThatHandedThemOut) {
  Prjrep::AutoRelease<Vad::IHdlPortIterator> ports;
  ASSERT_EQ(Elaboration()->getDesignUnitPorts(Unit("Module|stage"), ports.Out()), CitI::kOk);
  units_ = nullptr;
  files_.clear();
  project_ = nullptr;
  EXPECT_EQ(Describe(ports.Get()).size(), 3u);
}

TEST_F(PortExtraction, NoPortsComeBackWithAResultAndADeveloperTextThatSaysWhy) {
  EXPECT_EQ(ParserResultFor<Vad::VhdlParser>("Entity|gauge", files_[2].Get()),
            Vad::PortExtraction::kGenericsWithoutValues);
  EXPECT_EQ(Reasons(),
            Strings{"ports of Entity|gauge: not every generic or parameter of 'gauge' has a value"});
  debug_.clear();

  EXPECT_EQ(ParserResultFor<Vad::VhdlParser>("PackageDecl|sizes_pkg", files_[0].Get()), CitI::kFail);
  EXPECT_EQ(Reasons(),
            Strings{"ports of PackageDecl|sizes_pkg: only entities, architectures and modules have ports"});
  debug_.clear();

  // A file of the compile order that is gone since the last parse: the extractor's own failure
  // is reported.
  ASSERT_EQ(std::remove(dir_.Path("mixer.vhd").c_str()), 0);
  EXPECT_EQ(ParserResultFor<Vad::VhdlParser>("Entity|mixer", files_[1].Get()), CitI::kFail);
  EXPECT_EQ(Reasons(), Strings{"ports of Entity|mixer: cannot read design file " + dir_.Path("mixer.vhd")});
  debug_.clear();

  // The file was edited since its last parse: the unit is no longer in it.
  WriteText(dir_.Path("pair.v"), "module renamed (input a);\nendmodule\n");
  EXPECT_EQ(ParserResultFor<Vad::VerilogParser>("Module|stage", files_[3].Get()),
            Vad::PortExtraction::kUnitNotFound);
  EXPECT_EQ(Reasons(),
            Strings{"ports of Module|stage: the port extractor does not find 'stage' in its design files"});
  debug_.clear();

  ASSERT_EQ(std::remove(dir_.Path("pair.v").c_str()), 0);
  EXPECT_EQ(ParserResultFor<Vad::VerilogParser>("Module|stage", files_[3].Get()), CitI::kFail);
  EXPECT_EQ(Reasons(), Strings{"ports of Module|stage: cannot read design file " + dir_.Path("pair.v")});
  debug_.clear();

  // The project passes no result on: the answer is simply empty.
  EXPECT_EQ(PortsOf("Module|stage"), Strings{});
  EXPECT_EQ(Reasons().size(), 1u);
  EXPECT_EQ(ErrorTexts(), Strings{}) << "a unit without ports is no error of the host";
}

TEST_F(PortExtraction, NullArgumentsAreRefused) {
  Prjrep::AutoRelease<Vad::IHdlPortIterator> ports;
  EXPECT_EQ(Elaboration()->getDesignUnitPorts(nullptr, ports.Out()), CitI::kInvalidArg);
  EXPECT_EQ(Elaboration()->getDesignUnitPorts(Unit("Entity|mixer"), nullptr), CitI::kInvalidArg);

  Vad::VhdlParser vhdl;
  Vad::VerilogParser verilog;
  Vad::IHdlPortIterator* left = reinterpret_cast<Vad::IHdlPortIterator*>(&vhdl);  // must be emptied
  EXPECT_EQ(vhdl.ExtractPorts(*HolderOf(files_[1].Get()), nullptr, &left), CitI::kInvalidArg);
  EXPECT_EQ(left, nullptr);
  left = reinterpret_cast<Vad::IHdlPortIterator*>(&verilog);
  EXPECT_EQ(verilog.ExtractPorts(*HolderOf(files_[3].Get()), nullptr, &left), CitI::kInvalidArg);
  EXPECT_EQ(left, nullptr);
  EXPECT_EQ(vhdl.ExtractPorts(*HolderOf(files_[1].Get()), Unit("Entity|mixer"), nullptr), CitI::kInvalidArg);
  EXPECT_EQ(ErrorTexts(), Strings{});
}

}  // namespace
