// Every text the Verilog compiler reports, in one place (printf formats). Tests compare against
// these, formatted with VerilogMessageLog::Format.
#pragma once

namespace Hx_Vci::VerilogMessageText {

// Command line and files.
inline constexpr char kNoSourceFile[] = "no Verilog source file given";
inline constexpr char kBadDefine[] = "+define+ entry \"%s\" does not start with a macro name; it is ignored";
inline constexpr char kCannotOpen[] = "cannot open the Verilog file \"%s\"";
inline constexpr char kFileTooLarge[] = "\"%s\" is larger than %llu bytes and is not read";
inline constexpr char kInternalError[] = "internal error while compiling: %s";
inline constexpr char kTooManyMessages[] = "too many messages for this file; further ones are not reported";

// Preprocessor.
inline constexpr char kUnterminatedComment[] = "comment not terminated; the rest of the file is ignored";
inline constexpr char kUnterminatedString[] = "string not terminated before the end of the line";
inline constexpr char kUnterminatedStringAtEnd[] = "string not terminated at the end of the file";
inline constexpr char kStrayBacktick[] = "` not followed by a directive or macro name";
inline constexpr char kUndefinedMacro[] = "macro `%s is not defined";
inline constexpr char kMacroNeedsArguments[] = "macro `%s needs arguments in parentheses";
inline constexpr char kTooManyMacroArguments[] = "macro `%s takes %zu argument(s), %zu given";
inline constexpr char kUnterminatedMacroArguments[] = "argument list of macro `%s is not terminated";
inline constexpr char kMacroTooDeep[] =
    "macro `%s nests deeper than %d expansions (recursive definition?); expansion stopped";
inline constexpr char kMacroTooLarge[] = "expansion of macro `%s exceeds %zu bytes; expansion stopped";
inline constexpr char kExpansionBudgetSpent[] =
    "text expanded from macros and includes exceeds %zu bytes; further macros and includes are ignored";
inline constexpr char kDefineWithoutName[] = "`define without a macro name";
inline constexpr char kBadMacroParameters[] = "bad parameter list in the definition of macro `%s";
inline constexpr char kDirectiveRedefined[] = "`%s is a compiler directive and cannot be defined as a macro";
inline constexpr char kDirectiveNeedsName[] = "`%s needs a macro name";
inline constexpr char kIncludeNeedsFile[] = "`include needs a file name in quotes";
inline constexpr char kIncludeNotFound[] = "include file \"%s\" not found";
inline constexpr char kIncludeUnreadable[] = "include file \"%s\" cannot be read";
inline constexpr char kTooManyIncludes[] =
    "more than %zu `include directives are followed in one file; further ones are ignored";
inline constexpr char kIncludeTooDeep[] =
    "`include nests deeper than %d files (does a file include itself?); \"%s\" is not included";
inline constexpr char kConditionalWithoutIf[] = "`%s without `ifdef or `ifndef";
inline constexpr char kConditionalAfterElse[] = "`%s after `else";
inline constexpr char kUnterminatedConditional[] =
    "`ifdef or `ifndef of line %d is not closed by `endif in this file";

// Module parser.
inline constexpr char kUnexpectedToken[] = "syntax error near \"%s\"";
inline constexpr char kExpectedModule[] = "syntax error near \"%s\": a module was expected";
inline constexpr char kModuleWithoutName[] = "%s without a module name";
inline constexpr char kHeaderWithoutSemicolon[] = "';' expected after the header of module %s";
inline constexpr char kPortListUnterminated[] = "port list of module %s is not terminated";
inline constexpr char kMissingEndmodule[] = "module %s has no endmodule";
inline constexpr char kEndmoduleWithoutModule[] = "endmodule without module";
inline constexpr char kMissingBlockEnd[] = "%s without %s";
inline constexpr char kUnbalanced[] = "'%c' without its closing '%c'";
inline constexpr char kInstanceNameExpected[] = "instance name expected after module type %s";
inline constexpr char kInstanceConnectionsExpected[] = "port connections expected for instance %s";
inline constexpr char kInstanceSeparatorExpected[] = "',' or ';' expected after instance %s";
inline constexpr char kNestingTooDeep[] = "blocks nest deeper than %d levels; the innermost ones are skipped";
inline constexpr char kDeclarationWithoutSemicolon[] = "';' expected after \"%s\"";
inline constexpr char kUnterminatedAttribute[] = "attribute \"(*\" not terminated by \"*)\"";

}  // namespace Hx_Vci::VerilogMessageText
