// Finds the ports of a VHDL entity or Verilog module. Use: add the design files, Parse, look the
// unit up with findDesignUnit, check hasAllGenericsDefined, then read getPorts.
//
// Parse reads every file in its own language, as it was added; VHDL entities and Verilog modules
// are recorded with their generics or parameters and ports, together with the units that each
// one instantiates (which decides the top unit). Syntax it cannot follow is skipped. Ranges are
// evaluated from the defaults of the unit's generics and parameters; a port whose range cannot be
// evaluated is reported with hasRange false and bounds 0 (see PepUnitEvaluator).
//
// Failures (unreadable or too large files, Parse without files, bad arguments) are thrown as
// Pep_Exception::Base.
#pragma once

#include <string>
#include <vector>

#include "pep/PepPort.h"
#include "pep/PepUnitCatalog.h"

class PepExtractor {
 public:
  static constexpr int kVerilog = 0;
  static constexpr int kVhdl = 1;

  // Search modes of findDesignUnit.
  static constexpr int kSearchExactName = 0;  // the unit of that name
  static constexpr int kSearchTop = 1;        // the top unit; the name is ignored

  static constexpr int kUnitFound = 0;
  static constexpr int kUnitNotFound = 1;

  static constexpr const char* kBadFileMessage = "a design file needs a library, a path and a known language";
  static constexpr const char* kNoFilesMessage = "no design files to parse";
  // Followed by the path of the file.
  static constexpr const char* kUnreadableFileMessage = "cannot read design file ";
  static constexpr const char* kTooLargeFileMessage = "design file is larger than 256 MiB: ";

  PepExtractor();
  PepExtractor(const PepExtractor&) = delete;
  PepExtractor& operator=(const PepExtractor&) = delete;
  ~PepExtractor();

  // Queues one file for Parse; throws on a null library or path or an unknown language.
  void addDesignFile(const char* library, const char* path, int language);
  // Reads the queued files, each in the language it was added with; `language` is not used.
  // Forgets what an earlier Parse found. Throws when there is no file or a file cannot be read.
  void Parse(int language);
  // kUnitFound when a unit of `library` (any letter case) matches after Parse: with kSearchTop the
  // top unit, the last one in file order that no other parsed unit instantiates; with
  // kSearchExactName the last unit named `name` (VHDL units in any letter case). The unit becomes
  // the one whose ports getPorts lists. kUnitNotFound otherwise, which leaves no unit found.
  int findDesignUnit(const char* library, const char* name, int searchMode);
  // True when a unit was found and every generic or parameter of it has a default value that
  // could be evaluated (a VHDL generic of a non-integer type only needs a default; Verilog
  // localparams do not count).
  bool hasAllGenericsDefined() const { return allGenericsDefined_; }
  // The ports of the found unit in declaration order, owned by the extractor: records stay valid
  // and in place until the next findDesignUnit or Parse.
  const std::vector<PepPort>& getPorts() const { return ports_; }

 private:
  struct DesignFile {
    std::string library;
    std::string path;
    int language;
  };

  void ReadFile(const DesignFile& file);
  void SelectUnit(const PepDesignUnit* unit);

  std::vector<DesignFile> files_;
  PepUnitCatalog catalog_;
  std::vector<PepPort> ports_;
  bool allGenericsDefined_ = false;
};
