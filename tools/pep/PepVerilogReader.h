// Reads the modules of one Verilog file: parameters (#(...) list and body parameter/localparam
// declarations), ANSI and non-ANSI ports and the module instances of each body, skipping
// everything else. Constructs it cannot follow are skipped, never reported.
//
// Non-ANSI ports keep the order of the header's name list and take direction, type and range
// from the body's input/output/inout declarations; a later net or variable declaration of the
// same name ("output q; reg [3:0] q;") supplies the type, and the range when the direction
// declaration had none. A header name that is never declared is reported as inout "wire".
#pragma once

#include <string>

#include "pep/PepDesignUnit.h"
#include "pep/PepTokenStream.h"
#include "pep/PepUnitCatalog.h"

class PepVerilogReader {
 public:
  // Both must outlive the reader; `library` is in lower case.
  PepVerilogReader(PepTokenStream& tokens, std::string library, PepUnitCatalog& catalog)
      : tokens_(tokens), library_(std::move(library)), catalog_(catalog) {}

  void Read();

 private:
  bool AtModule();
  void ReadModule();
  void ReadHeaderPorts(PepDesignUnit& unit, bool& ansi);
  void ReadBody(PepDesignUnit& unit, bool ansi, bool hasParameterList);
  void ReadBodyPortDeclaration(PepDesignUnit& unit);
  void ReadBodyNetDeclaration(PepDesignUnit& unit);
  bool AtInstance();
  void SkipUntilWord(std::string_view endWord);
  PepTokens TakeStatement();

  PepTokenStream& tokens_;
  std::string library_;
  PepUnitCatalog& catalog_;
};
