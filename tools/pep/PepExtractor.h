// Finds the ports of a VHDL entity or Verilog module. Use: add the design files, Parse, look the
// unit up with findDesignUnit, check hasAllGenericsDefined, then read getPorts.
//
// Failures are thrown as Pep_Exception::Base.
#pragma once

#include <string>
#include <vector>

#include "pep/PepPort.h"

class PepExtractor {
 public:
  static constexpr int kVerilog = 0;
  static constexpr int kVhdl = 1;

  static constexpr int kSearchByName = 1;  // search mode of findDesignUnit
  static constexpr int kUnitFound = 0;
  static constexpr int kUnitNotFound = 1;

  static constexpr const char* kUnavailableMessage = "port extraction is not available";
  static constexpr const char* kBadFileMessage = "a design file needs a library, a path and a known language";

  PepExtractor();
  PepExtractor(const PepExtractor&) = delete;
  PepExtractor& operator=(const PepExtractor&) = delete;
  ~PepExtractor();

  // Queues one file for Parse; throws on a null library or path or an unknown language.
  void addDesignFile(const char* library, const char* path, int language);
  // Reads the queued files; throws when they cannot be read.
  void Parse(int language);
  // kUnitFound when the unit exists in `library` after Parse (it becomes the unit whose ports
  // getPorts lists), any other value when it does not.
  int findDesignUnit(const char* library, const char* name, int searchMode);
  // True when every generic or parameter of the found unit has a value.
  bool hasAllGenericsDefined() const;
  // The ports of the found unit in declaration order, owned by the extractor: records stay valid
  // and in place while it lives.
  const std::vector<PepPort>& getPorts() const { return ports_; }

 private:
  struct DesignFile {
    std::string library;
    std::string path;
    int language;
  };

  std::vector<DesignFile> files_;
  std::vector<PepPort> ports_;
};
