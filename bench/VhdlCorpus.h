// A generator of realistic VHDL design files for the parser benchmarks: packages with types,
// constants and functions, entities with generics and ports, architectures with signals,
// component declarations, configuration specifications, processes, component and entity
// instantiations and generate statements. Deterministic for a given seed on every platform.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "SeededRandom.h"

namespace QuillonBench {

class VhdlCorpus {
 public:
  explicit VhdlCorpus(std::uint64_t seed) : random_(seed) {}

  // Design units, one after another, until the text holds at least `minimumBytes`.
  std::string Generate(std::size_t minimumBytes) {
    text_.clear();
    text_.reserve(minimumBytes + 16384);
    unitNames_.clear();
    packageName_.clear();
    unitCount_ = 0;
    while (text_.size() < minimumBytes) AppendFile();
    return text_;
  }

 private:
  int Below(int bound) { return random_.Below(bound); }
  bool Chance(int percent) { return random_.Chance(percent); }
  template <std::size_t N>
  std::string_view Pick(const std::string_view (&words)[N]) {
    return words[Below(static_cast<int>(N))];
  }

  std::string Name(std::string_view stem) { return std::string(stem) + "_" + std::to_string(Below(1000)); }
  // Design units and the labels inside one architecture have distinct names, as in real designs.
  std::string UnitName(std::string_view stem) {
    return std::string(stem) + "_" + std::to_string(++unitCount_);
  }
  std::string Label(std::string_view stem) { return std::string(stem) + std::to_string(++labelCount_); }

  void Line(std::string_view indent, std::string_view text) {
    text_.append(indent);
    text_.append(text);
    text_.push_back('\n');
  }

  void AppendFile() {
    AppendHeaderComment();
    if (Chance(30)) AppendPackage();
    AppendContext();
    std::string entity = UnitName(Pick(kUnitStems));
    std::vector<std::string> ports = AppendEntity(entity);
    AppendArchitecture(entity, ports);
    unitNames_.push_back(entity);
    if (unitNames_.size() > 40) unitNames_.erase(unitNames_.begin());
  }

  void AppendHeaderComment() {
    Line("", "-------------------------------------------------------------------------------");
    Line("", "-- Block      : " + Name(Pick(kUnitStems)));
    Line("", "-- Description: " + std::string(Pick(kComments)));
    Line("", "-- Revision   : " + std::to_string(Below(40)) + "." + std::to_string(Below(10)));
    Line("", "-------------------------------------------------------------------------------");
    Line("", "");
  }

  void AppendContext() {
    Line("", "library ieee;");
    Line("", "use ieee.std_logic_1164.all;");
    Line("", "use ieee.numeric_std.all;");
    if (Chance(40) && !packageName_.empty()) {
      Line("", "library work;");
      Line("", "use work." + packageName_ + ".all;");
    }
    Line("", "");
  }

  void AppendPackage() {
    std::string package = UnitName("types") + "_pkg";
    packageName_ = package;
    Line("", "package " + package + " is");
    Line("  ", "constant DATA_WIDTH : natural := " + std::to_string(8 << Below(4)) + ";");
    Line("  ", "subtype word_t is std_logic_vector(DATA_WIDTH - 1 downto 0);");
    Line("  ", "type state_t is (IDLE, LOAD, RUN, FLUSH, DONE);");
    Line("  ", "type word_array_t is array (natural range <>) of word_t;");
    Line("  ", "function parity(v : std_logic_vector) return std_logic;");
    Line("", "end package " + package + ";");
    Line("", "");
    Line("", "package body " + package + " is");
    Line("  ", "function parity(v : std_logic_vector) return std_logic is");
    Line("    ", "variable p : std_logic := '0';");
    Line("  ", "begin");
    Line("    ", "for i in v'range loop");
    Line("      ", "p := p xor v(i);  -- accumulate");
    Line("    ", "end loop;");
    Line("    ", "return p;");
    Line("  ", "end function parity;");
    Line("", "end package body " + package + ";");
    Line("", "");
  }

  std::vector<std::string> AppendEntity(const std::string& entity) {
    Line("", "entity " + entity + " is");
    Line("  ", "generic (");
    Line("    ", "WIDTH : natural := " + std::to_string(8 << Below(3)) + ";");
    Line("    ", "DEPTH : natural := " + std::to_string(16 << Below(4)) + ";");
    Line("    ", "USE_RESET : boolean := true");
    Line("  ", ");");
    Line("  ", "port (");
    Line("    ", "clk     : in  std_logic;");
    Line("    ", "rst_n   : in  std_logic;");
    std::vector<std::string> ports;
    int count = 2 + Below(8);
    for (int i = 0; i < count; ++i) {
      std::string port = Name(Pick(kSignalStems));
      ports.push_back(port);
      bool input = Chance(50);
      std::string type = Chance(50) ? "std_logic" : "std_logic_vector(WIDTH - 1 downto 0)";
      Line("    ", port + " : " + (input ? "in  " : "out ") + type + (i + 1 < count ? ";" : ""));
    }
    Line("  ", ");");
    Line("", "end entity " + entity + ";");
    Line("", "");
    return ports;
  }

  void AppendArchitecture(const std::string& entity, const std::vector<std::string>& ports) {
    std::string arch = std::string(Pick(kArchNames));
    labelCount_ = 0;
    Line("", "architecture " + arch + " of " + entity + " is");
    std::vector<std::string> signals;
    int count = 3 + Below(10);
    for (int i = 0; i < count; ++i) {
      signals.push_back(Name(Pick(kSignalStems)));
      Line("  ", "signal " + signals.back() + " : std_logic_vector(WIDTH - 1 downto 0) := (others => '0');");
    }
    Line("  ", "signal state : state_t;");
    std::string component =
        unitNames_.empty() ? Name(Pick(kUnitStems)) : unitNames_[Below(static_cast<int>(unitNames_.size()))];
    AppendComponentDeclaration(component);
    if (Chance(40)) Line("  ", "for all : " + component + " use entity work." + component + ";");
    Line("", "begin");
    int statements = 2 + Below(5);
    for (int i = 0; i < statements; ++i) {
      switch (Below(5)) {
        case 0:
        case 1:
          AppendProcess(signals, ports);
          break;
        case 2:
          AppendComponentInstance(component, signals);
          break;
        case 3:
          AppendEntityInstance(signals);
          break;
        default:
          AppendGenerate(component, signals);
          break;
      }
    }
    Line("  ", signals[0] + " <= " + signals[1] + " when state = RUN else (others => 'Z');");
    Line("", "end architecture " + arch + ";");
    Line("", "");
  }

  void AppendComponentDeclaration(const std::string& component) {
    Line("  ", "component " + component + " is");
    Line("    ", "generic (WIDTH : natural := 8);");
    Line("    ", "port (clk : in std_logic; d : in std_logic_vector(WIDTH - 1 downto 0);");
    Line("          ", "q : out std_logic_vector(WIDTH - 1 downto 0));");
    Line("  ", "end component;");
  }

  void AppendPortMap(std::string_view indent, const std::vector<std::string>& signals) {
    Line(indent, "generic map (WIDTH => WIDTH)");
    Line(indent, "port map (");
    Line(indent, "  clk => clk,");
    Line(indent, "  d   => " + signals[Below(static_cast<int>(signals.size()))] + ",");
    Line(indent, "  q   => " + signals[Below(static_cast<int>(signals.size()))]);
    Line(indent, ");");
  }

  void AppendComponentInstance(const std::string& component, const std::vector<std::string>& signals) {
    Line("  ", Label("u") + " : " + (Chance(30) ? "component " : "") + component);
    AppendPortMap("    ", signals);
  }

  void AppendEntityInstance(const std::vector<std::string>& signals) {
    std::string entity =
        unitNames_.empty() ? Name(Pick(kUnitStems)) : unitNames_[Below(static_cast<int>(unitNames_.size()))];
    std::string architecture = Chance(50) ? "(" + std::string(Pick(kArchNames)) + ")" : "";
    Line("  ", Label("i") + " : entity work." + entity + architecture);
    AppendPortMap("    ", signals);
  }

  void AppendGenerate(const std::string& component, const std::vector<std::string>& signals) {
    std::string label = Label("gen");
    Line("  ", label + " : for i in 0 to DEPTH - 1 generate");
    Line("    ", Label("u") + " : " + component);
    AppendPortMap("      ", signals);
    Line("  ", "end generate " + label + ";");
  }

  void AppendProcess(const std::vector<std::string>& signals, const std::vector<std::string>& ports) {
    const std::string& target = signals[Below(static_cast<int>(signals.size()))];
    const std::string& source = signals[Below(static_cast<int>(signals.size()))];
    Line("  ", Label("p") + " : process (clk, rst_n)");
    Line("    ", "variable count : unsigned(WIDTH - 1 downto 0);");
    Line("  ", "begin");
    Line("    ", "if rst_n = '0' then");
    Line("      ", target + " <= (others => '0');  -- " + std::string(Pick(kComments)));
    Line("      ", "state <= IDLE;");
    Line("    ", "elsif rising_edge(clk) then");
    Line("      ", "case state is");
    Line("        ", "when IDLE => if " + ports[0] + " = '1' then state <= LOAD; end if;");
    Line("        ", "when LOAD => " + target + " <= std_logic_vector(unsigned(" + source + ") + 1);");
    Line("        ", "when RUN => count := count + 1; report \"running\" severity note;");
    Line("        ", "when others => state <= IDLE;");
    Line("      ", "end case;");
    Line("    ", "end if;");
    Line("  ", "end process;");
  }

  static constexpr std::string_view kUnitStems[] = {
      "fifo",  "uart_tx", "uart_rx", "spi_master", "alu",       "regfile", "dma_ctrl", "crc32",
      "timer", "arbiter", "decoder", "mux4",       "sync_fifo", "pwm",     "debounce"};
  static constexpr std::string_view kSignalStems[] = {"data",  "valid", "ready", "addr", "wr_en", "rd_en",
                                                      "count", "sum",   "carry", "flag", "busy",  "acc"};
  static constexpr std::string_view kArchNames[] = {"rtl", "behavioral", "structural", "fast", "small"};
  static constexpr std::string_view kComments[] = {"registered output stage",    "clock domain: core clock",
                                                   "reset is active low",        "keeps the handshake simple",
                                                   "one word per cycle at most", "see the block diagram"};

  SeededRandom random_;
  int unitCount_ = 0;
  int labelCount_ = 0;
  std::string packageName_;
  std::string text_;
  std::vector<std::string> unitNames_;
};

}  // namespace QuillonBench
