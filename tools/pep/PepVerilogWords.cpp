#include "pep/PepVerilogWords.h"

#include <algorithm>
#include <span>
#include <string_view>

#include "pep/PepPort.h"

namespace {

constexpr std::string_view kDirections[] = {"input", "output", "inout", "ref"};

constexpr std::string_view kDataTypes[] = {
    "wire",     "tri",     "tri0",  "tri1", "wand",     "wor",       "triand",  "trior", "trireg",
    "supply0",  "supply1", "uwire", "reg",  "logic",    "bit",       "integer", "int",   "byte",
    "shortint", "longint", "time",  "real", "realtime", "shortreal", "string",  "var",   "interconnect"};

constexpr std::string_view kNonIntegerTypes[] = {"real", "realtime", "shortreal", "string"};

constexpr std::string_view kOtherKeywords[] = {
    "module",      "macromodule", "endmodule", "primitive",    "endprimitive", "parameter", "localparam",
    "defparam",    "specparam",   "assign",    "always",       "always_comb",  "always_ff", "always_latch",
    "initial",     "final",       "begin",     "end",          "if",           "else",      "case",
    "casex",       "casez",       "endcase",   "default",      "for",          "while",     "repeat",
    "forever",     "do",          "function",  "endfunction",  "task",         "endtask",   "generate",
    "endgenerate", "genvar",      "fork",      "join",         "join_any",     "join_none", "posedge",
    "negedge",     "or",          "and",       "nand",         "nor",          "xor",       "xnor",
    "not",         "buf",         "bufif0",    "bufif1",       "notif0",       "notif1",    "pullup",
    "pulldown",    "signed",      "unsigned",  "specify",      "endspecify",   "table",     "endtable",
    "automatic",   "static",      "import",    "export",       "typedef",      "enum",      "struct",
    "union",       "packed",      "interface", "endinterface", "modport",      "package",   "endpackage",
    "class",       "endclass",    "program",   "endprogram",   "assert",       "assume",    "cover",
    "property",    "endproperty", "sequence",  "endsequence",  "return",       "wait",      "disable",
    "force",       "release",     "deassign",  "event",        "type",         "const"};

bool IsOneOf(const PepToken& token, std::span<const std::string_view> words) {
  if (token.kind != PepToken::Kind::kName || token.escaped) return false;
  return std::find(words.begin(), words.end(), token.text) != words.end();
}

}  // namespace

bool PepVerilogWords::IsKeyword(const PepToken& token) {
  return IsDirection(token) || IsDataType(token) || IsOneOf(token, kOtherKeywords);
}

bool PepVerilogWords::IsIdentifier(const PepToken& token) {
  return token.IsName() && (token.escaped || (token.text.front() != '$' && !IsKeyword(token)));
}

bool PepVerilogWords::IsDirection(const PepToken& token) { return IsOneOf(token, kDirections); }

bool PepVerilogWords::IsDataType(const PepToken& token) { return IsOneOf(token, kDataTypes); }

bool PepVerilogWords::IsNonIntegerType(const PepToken& token) { return IsOneOf(token, kNonIntegerTypes); }

int PepVerilogWords::DirectionOf(const PepToken& token) {
  if (token.IsWord("input")) return PepPort::kDirectionIn;
  if (token.IsWord("output")) return PepPort::kDirectionOut;
  return PepPort::kDirectionInOut;
}
