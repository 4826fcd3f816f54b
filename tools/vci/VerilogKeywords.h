// The reserved words that the module parser acts on, with what each one starts.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string_view>

namespace Hx_Vci {

namespace VerilogKeywordRole {
enum : std::uint8_t {
  kNone = 0,
  // Ends a skip: a unit boundary that cannot occur inside a module item. Only the words reserved
  // in every Verilog version are boundaries, so that older code using later keywords as names
  // (a signal called "config" or "interface") loses nothing.
  kBoundary = 1,
  // Starts a declaration or other item that runs to the next ';'.
  kDeclaration = 2,
  // Starts a process whose body is one statement.
  kProcess = 4,
  // Starts a region that runs to its own closing keyword (VerilogKeywords::ClosingOf).
  kRegion = 8,
  // Closes a block; a skip that meets one outside any block stops before it.
  kCloser = 16,
  // A drive strength.
  kStrength = 32,
};
}  // namespace VerilogKeywordRole

// clang-format off
#define HX_VCI_VERILOG_KEYWORDS(X)                                                   \
  X(kModule, "module", kBoundary) X(kMacromodule, "macromodule", kBoundary)           \
  X(kEndmodule, "endmodule", kBoundary) X(kPrimitive, "primitive", kBoundary | kRegion) \
  X(kEndprimitive, "endprimitive", kBoundary) X(kPackage, "package", kRegion)        \
  X(kEndpackage, "endpackage", kCloser) X(kInterface, "interface", kRegion)           \
  X(kEndinterface, "endinterface", kCloser) X(kProgram, "program", kRegion)           \
  X(kEndprogram, "endprogram", kCloser) X(kConfig, "config", kRegion)                 \
  X(kEndconfig, "endconfig", kCloser)                                                 \
  X(kGenerate, "generate", kNone) X(kEndgenerate, "endgenerate", kCloser)             \
  X(kBegin, "begin", kNone) X(kEnd, "end", kCloser) X(kFork, "fork", kNone)           \
  X(kJoin, "join", kCloser) X(kJoinAny, "join_any", kCloser) X(kJoinNone, "join_none", kCloser) \
  X(kIf, "if", kNone) X(kElse, "else", kNone) X(kFor, "for", kNone) X(kCase, "case", kNone) \
  X(kCasex, "casex", kNone) X(kCasez, "casez", kNone) X(kEndcase, "endcase", kCloser) \
  X(kDefault, "default", kNone) X(kWhile, "while", kNone) X(kRepeat, "repeat", kNone) \
  X(kForever, "forever", kNone) X(kDo, "do", kNone) X(kForeach, "foreach", kNone)     \
  X(kWait, "wait", kNone)                                                             \
  X(kAlways, "always", kProcess) X(kAlwaysComb, "always_comb", kProcess)              \
  X(kAlwaysFf, "always_ff", kProcess) X(kAlwaysLatch, "always_latch", kProcess)       \
  X(kInitial, "initial", kProcess) X(kFinal, "final", kProcess)                       \
  X(kFunction, "function", kRegion) X(kEndfunction, "endfunction", kCloser)           \
  X(kTask, "task", kRegion) X(kEndtask, "endtask", kCloser)                           \
  X(kSpecify, "specify", kRegion) X(kEndspecify, "endspecify", kCloser)               \
  X(kProperty, "property", kRegion) X(kEndproperty, "endproperty", kCloser)           \
  X(kSequence, "sequence", kRegion) X(kEndsequence, "endsequence", kCloser)           \
  X(kClocking, "clocking", kRegion) X(kEndclocking, "endclocking", kCloser)           \
  X(kCovergroup, "covergroup", kRegion) X(kEndgroup, "endgroup", kCloser)             \
  X(kClass, "class", kRegion) X(kEndclass, "endclass", kCloser)                       \
  X(kChecker, "checker", kRegion) X(kEndchecker, "endchecker", kCloser)               \
  X(kTable, "table", kRegion) X(kEndtable, "endtable", kCloser)                       \
  X(kInput, "input", kDeclaration) X(kOutput, "output", kDeclaration)                 \
  X(kInout, "inout", kDeclaration) X(kRef, "ref", kDeclaration)                       \
  X(kWire, "wire", kDeclaration) X(kReg, "reg", kDeclaration) X(kTri, "tri", kDeclaration) \
  X(kTri0, "tri0", kDeclaration) X(kTri1, "tri1", kDeclaration) X(kTriand, "triand", kDeclaration) \
  X(kTrior, "trior", kDeclaration) X(kTrireg, "trireg", kDeclaration)                 \
  X(kWand, "wand", kDeclaration) X(kWor, "wor", kDeclaration) X(kUwire, "uwire", kDeclaration) \
  X(kSupply0, "supply0", kDeclaration | kStrength) X(kSupply1, "supply1", kDeclaration | kStrength) \
  X(kInteger, "integer", kDeclaration) X(kReal, "real", kDeclaration)                 \
  X(kRealtime, "realtime", kDeclaration) X(kTime, "time", kDeclaration)               \
  X(kEvent, "event", kDeclaration) X(kParameter, "parameter", kDeclaration)           \
  X(kLocalparam, "localparam", kDeclaration) X(kSpecparam, "specparam", kDeclaration) \
  X(kDefparam, "defparam", kDeclaration) X(kGenvar, "genvar", kDeclaration)           \
  X(kAssign, "assign", kDeclaration) X(kDeassign, "deassign", kDeclaration)           \
  X(kForce, "force", kDeclaration) X(kRelease, "release", kDeclaration)               \
  X(kLogic, "logic", kDeclaration) X(kBit, "bit", kDeclaration) X(kByte, "byte", kDeclaration) \
  X(kInt, "int", kDeclaration) X(kShortint, "shortint", kDeclaration)                 \
  X(kLongint, "longint", kDeclaration) X(kShortreal, "shortreal", kDeclaration)       \
  X(kString, "string", kDeclaration) X(kChandle, "chandle", kDeclaration)             \
  X(kTypedef, "typedef", kDeclaration) X(kEnum, "enum", kDeclaration)                 \
  X(kStruct, "struct", kDeclaration) X(kUnion, "union", kDeclaration)                 \
  X(kImport, "import", kDeclaration) X(kExport, "export", kDeclaration)               \
  X(kExtern, "extern", kDeclaration) X(kVar, "var", kDeclaration)                     \
  X(kWreal, "wreal", kDeclaration) X(kNettype, "nettype", kDeclaration)               \
  X(kAlias, "alias", kDeclaration) X(kLet, "let", kDeclaration)                       \
  X(kTimeunit, "timeunit", kDeclaration) X(kTimeprecision, "timeprecision", kDeclaration) \
  X(kModport, "modport", kDeclaration) X(kBind, "bind", kDeclaration)                 \
  X(kConst, "const", kDeclaration) X(kVirtual, "virtual", kDeclaration)               \
  X(kAssert, "assert", kDeclaration) X(kAssume, "assume", kDeclaration)               \
  X(kCover, "cover", kDeclaration) X(kRestrict, "restrict", kDeclaration)             \
  X(kSigned, "signed", kDeclaration) X(kUnsigned, "unsigned", kDeclaration)           \
  X(kStatic, "static", kDeclaration) X(kAutomatic, "automatic", kDeclaration)         \
  X(kAnd, "and", kDeclaration) X(kNand, "nand", kDeclaration) X(kOr, "or", kDeclaration) \
  X(kNor, "nor", kDeclaration) X(kXor, "xor", kDeclaration) X(kXnor, "xnor", kDeclaration) \
  X(kBuf, "buf", kDeclaration) X(kNot, "not", kDeclaration)                           \
  X(kBufif0, "bufif0", kDeclaration) X(kBufif1, "bufif1", kDeclaration)               \
  X(kNotif0, "notif0", kDeclaration) X(kNotif1, "notif1", kDeclaration)               \
  X(kNmos, "nmos", kDeclaration) X(kPmos, "pmos", kDeclaration)                       \
  X(kRnmos, "rnmos", kDeclaration) X(kRpmos, "rpmos", kDeclaration)                   \
  X(kCmos, "cmos", kDeclaration) X(kRcmos, "rcmos", kDeclaration)                     \
  X(kTran, "tran", kDeclaration) X(kRtran, "rtran", kDeclaration)                     \
  X(kTranif0, "tranif0", kDeclaration) X(kTranif1, "tranif1", kDeclaration)           \
  X(kRtranif0, "rtranif0", kDeclaration) X(kRtranif1, "rtranif1", kDeclaration)       \
  X(kPullup, "pullup", kDeclaration) X(kPulldown, "pulldown", kDeclaration)           \
  X(kStrong0, "strong0", kStrength) X(kStrong1, "strong1", kStrength)                 \
  X(kPull0, "pull0", kStrength) X(kPull1, "pull1", kStrength)                         \
  X(kWeak0, "weak0", kStrength) X(kWeak1, "weak1", kStrength)                         \
  X(kHighz0, "highz0", kStrength) X(kHighz1, "highz1", kStrength)                     \
  X(kSmall, "small", kStrength) X(kMedium, "medium", kStrength) X(kLarge, "large", kStrength)
// clang-format on

namespace VerilogKeywordRole {
// The roles of every VerilogKeyword, by its value.
inline constexpr std::uint8_t kOfKeyword[] = {kNone,
#define HX_VCI_KEYWORD_ROLES(id, text, roles) static_cast<std::uint8_t>(roles),
                                              HX_VCI_VERILOG_KEYWORDS(HX_VCI_KEYWORD_ROLES)
#undef HX_VCI_KEYWORD_ROLES
};
}  // namespace VerilogKeywordRole

enum class VerilogKeyword : std::uint8_t {
  kNone,
#define HX_VCI_KEYWORD_ENUM(id, text, roles) id,
  HX_VCI_VERILOG_KEYWORDS(HX_VCI_KEYWORD_ENUM)
#undef HX_VCI_KEYWORD_ENUM
      kCount
};

class VerilogKeywords {
 public:
  // kNone for any word that is not one of the keywords above (Verilog is case-sensitive).
  static VerilogKeyword Find(std::string_view word);
  // Asked for nearly every token the parser skips, so it is a plain table look-up.
  static bool Has(VerilogKeyword keyword, std::uint8_t role) {
    return (VerilogKeywordRole::kOfKeyword[static_cast<std::size_t>(keyword)] & role) != 0;
  }
  // The keyword that closes a kRegion keyword's region (kNone for any other keyword).
  static VerilogKeyword ClosingOf(VerilogKeyword keyword);
  static std::string_view TextOf(VerilogKeyword keyword);
};

}  // namespace Hx_Vci
