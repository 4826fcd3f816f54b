// A generator of VHDL projects with a deep instance hierarchy for the compile-order benchmarks:
// a few base packages, library packages that use them (some with bodies), and designs whose
// architectures use packages and instantiate the designs below them (entity and component
// instantiations). Most designs keep entity and architecture in one file, some in two.
// Every design is instantiated once at most, so the hierarchy tree grows with the project.
// Deterministic for a given seed on every platform.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <utility>
#include <vector>

#include "SeededRandom.h"

namespace QuillonBench {

struct CorpusFile {
  std::string name;
  std::string text;
};

class DesignTreeCorpus {
 public:
  struct Options {
    std::size_t fileCount = 10000;
    std::size_t basePackages = 20;
    std::size_t libraryPackages = 1500;
    int splitPercent = 20;  // designs with entity and architecture in separate files
    int topPercent = 2;     // designs that nothing instantiates
    // Designs that also instantiate their grandparent: circular file dependencies that the
    // relaxed rule resolves.
    int backReferencePercent = 0;
  };

  DesignTreeCorpus(std::uint64_t seed, Options options) : random_(seed), options_(options) {}

  std::vector<CorpusFile> Generate() {
    files_.clear();
    for (std::size_t i = 0; i < options_.basePackages; ++i) AddBasePackage(i);
    for (std::size_t i = 0; i < options_.libraryPackages; ++i) AddLibraryPackage(i);
    PlanDesigns();
    for (std::size_t i = 0; i < parents_.size(); ++i) AddDesign(i);
    return std::move(files_);
  }

 private:
  std::size_t Below(std::size_t bound) { return random_.Below(bound); }
  bool Chance(int percent) { return random_.Chance(percent); }

  static std::string Design(std::size_t i) {
    std::string name("d");
    name += std::to_string(i);
    return name;
  }

  void AddBasePackage(std::size_t i) {
    std::string name = "base" + std::to_string(i);
    files_.push_back({name + ".vhd", "package " + name + " is\n  constant W" + std::to_string(i) +
                                         " : natural := " + std::to_string(4 + i) + ";\nend package " + name +
                                         ";\n"});
  }

  void AddLibraryPackage(std::size_t i) {
    std::string name = "pkg" + std::to_string(i);
    std::string text = "library ieee;\nuse ieee.std_logic_1164.all;\nuse work.base" +
                       std::to_string(Below(options_.basePackages)) + ".all;\n";
    text += "package " + name + " is\n  function f" + std::to_string(i) +
            "(v : std_logic_vector) return std_logic;\nend package " + name + ";\n";
    if (Chance(50)) {
      text += "\npackage body " + name + " is\n  function f" + std::to_string(i) +
              "(v : std_logic_vector) return std_logic is\n  begin\n    return v(v'low);\n  end function;\n"
              "end package body " +
              name + ";\n";
    }
    files_.push_back({name + ".vhd", std::move(text)});
  }

  // One design per remaining file, a split design taking two; each picks its parent among the
  // designs just before it.
  void PlanDesigns() {
    parents_.clear();
    split_.clear();
    std::size_t files = files_.size();
    while (files < options_.fileCount) {
      std::size_t i = parents_.size();
      bool split = files + 2 <= options_.fileCount && Chance(options_.splitPercent);
      bool top = i == 0 || Chance(options_.topPercent);
      parents_.push_back(top ? kNone : i - 1 - Below(i < 200 ? i : 200));
      split_.push_back(split);
      files += split ? 2 : 1;
    }
    children_.assign(parents_.size(), {});
    for (std::size_t i = 0; i < parents_.size(); ++i) {
      if (parents_[i] != kNone) children_[parents_[i]].push_back(i);
    }
  }

  void AddDesign(std::size_t i) {
    std::string name = Design(i);
    std::string entity = "library ieee;\nuse ieee.std_logic_1164.all;\nentity " + name +
                         " is\n  port (clk : in std_logic; q : out std_logic);\nend entity " + name + ";\n";
    std::string architecture = ArchitectureOf(i);
    if (split_[i]) {
      files_.push_back({name + "_ent.vhd", std::move(entity)});
      files_.push_back({name + "_rtl.vhd", std::move(architecture)});
    } else {
      files_.push_back({name + ".vhd", entity + "\n" + architecture});
    }
  }

  std::string ArchitectureOf(std::size_t i) {
    std::string text = "library ieee;\nuse ieee.std_logic_1164.all;\n";
    std::size_t packages = 1 + Below(2);
    for (std::size_t p = 0; p < packages; ++p) {
      text += "use work.pkg" + std::to_string(Below(options_.libraryPackages)) + ".all;\n";
    }
    std::vector<std::size_t> instances = children_[i];
    std::size_t parent = parents_[i];
    if (parent != kNone && parents_[parent] != kNone && Chance(options_.backReferencePercent)) {
      instances.push_back(parents_[parent]);
    }
    text += "architecture rtl of " + Design(i) + " is\n  signal s : std_logic;\n";
    std::string body;
    for (std::size_t child : instances) {
      std::string label = "u_" + Design(child);
      if (Chance(50)) {
        body += "  " + label + " : entity work." + Design(child) + " port map (clk => clk, q => s);\n";
      } else {
        text += "  component " + Design(child) +
                "\n    port (clk : in std_logic; q : out std_logic);\n"
                "  end component;\n";
        body += "  " + label + " : " + Design(child) + " port map (clk => clk, q => s);\n";
      }
    }
    text += "begin\n" + body + "  q <= s;\nend architecture rtl;\n";
    return text;
  }

  static constexpr std::size_t kNone = static_cast<std::size_t>(-1);

  SeededRandom random_;
  Options options_;
  std::vector<CorpusFile> files_;
  std::vector<std::size_t> parents_;
  std::vector<bool> split_;
  std::vector<std::vector<std::size_t>> children_;
};

}  // namespace QuillonBench
