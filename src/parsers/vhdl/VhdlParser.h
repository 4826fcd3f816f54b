// Finds the design units of a VHDL source file without analysing VHDL fully: a small scanner and a
// partial grammar recognise library and use clauses, unit headers, instantiations, component
// bindings of configurations, generate statements and port clauses, and record them in the file's
// holder.
#pragma once

#include "CitI.h"
#include "Parser.h"

namespace Vad {

// Type identifiers that the VHDL parser gives the holder for what it records (host constants).
namespace VhdlTypeIds {
QUILLON_XUID_FROM_TEXT(Library, "{5F603C6A-2358-4949-99FB-D99B7306D2B5}")
QUILLON_XUID_FROM_TEXT(Use, "{5975F055-B2B5-4200-AF46-2B5C16B8315C}")
QUILLON_XUID_FROM_TEXT(Entity, "{0CBD7350-BC55-49c4-84AD-BBF6684DF5A8}")
QUILLON_XUID_FROM_TEXT(Architecture, "{A76A4C46-B805-40b3-83A6-E74CB1C82807}")
QUILLON_XUID_FROM_TEXT(Package, "{656E1E26-2F72-4c56-B3C6-D3254D55EAC2}")
QUILLON_XUID_FROM_TEXT(PackageBody, "{3EFD5479-1E17-4cf0-96B0-B4D8B84286BD}")
// Component and entity instances alike.
QUILLON_XUID_FROM_TEXT(Instance, "{A192BA7E-ECE8-46e2-84A5-A90A1CFA1D35}")
}  // namespace VhdlTypeIds

class VhdlParser : public Parser {
 public:
  // Written to standard output when the file cannot be opened, with the path and the system's
  // reason (the second text when the system gives none).
  static constexpr const char* kFileNotFoundBecause =
      "ERROR: Quillon.dll: VhdlParser: %s file not found: |%s|\n";
  static constexpr const char* kFileNotFound = "ERROR: Quillon.dll: VhdlParser: %s file not found\n";
  // The first syntax error of a file, as a host error message of this category with the file and
  // line as its source; the text is "FILE:LINE: syntax error: " and what is wrong.
  static constexpr const char* kMessageCategory = "VhdlParser";
  static constexpr const char* kSyntaxError = "%s:%u: syntax error: %s\n";
  // The property that names the parse target, and the target under which translate pragmas
  // switch code off.
  static constexpr const char* kParseTargetProperty = "PROP_Parse_Target";
  static constexpr const char* kSynthesisTarget = "synthesis";

  // Reads the holder's file to its end and records what it finds. A file that cannot be opened
  // gives the message above and no units. The first place where the file cannot be legal VHDL
  // gives one error message; what was recognised stays recorded. Always 0.
  int Parse(CParserConfigHolder& holder) override;

  // The ports of an entity, or of an architecture's entity: the port extractor reads the VHDL and
  // Verilog files of the unit's compile order (getCompileOrderByDU, mode flag set) in order and is
  // asked for the entity by name. 1 with the port iterator in `ports`; 10 when the extractor does
  // not find the entity, 11 when a generic has no value, 0 when the files are not available or
  // the extractor fails (each with an error message); kInvalidArg for a null unit or `ports`.
  CitI::Result ExtractPorts(CParserConfigHolder& holder, IHdlDesignUnit* unit,
                            IHdlPortIterator** ports) override;
};

}  // namespace Vad
