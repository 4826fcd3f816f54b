/* Grammar of hierarchy descriptions: one command per line (modules, module declarations,
   sub-modules, packages, instance labels, test vectors), recorded into the holder as the lines
   are read. A line that fits no rule is a syntax error that error recovery absorbs. */

%code top {
/* The stack never grows: an overflow ends the parse of the file. */
#define YYINITDEPTH 200
#define YYMAXDEPTH 200
}

%code requires {
#include "HierarchyParseContext.h"
}

%code {
#include <algorithm>
#include <cstdio>
#include <cstring>

#include "CParserConfigHolder.h"
#include "Port/InputLimits.h"

int qh_lex(QH_STYPE* value, void* scanner);

namespace {

using Vad::CParserConfigHolder;
using Vad::HierarchyParseContext;

/* Bison calls this for the first error of a recovery and for a stack overflow. */
void qh_error(void*, HierarchyParseContext& ctx, const char* message) {
  const bool overflow = std::strcmp(message, "memory exhausted") == 0;
  ctx.Error("Syntax error: %s", overflow ? "parser stack overflow" : "parse error");
}

using Port::InputLimits::kMaxRangeLabels;
using Port::InputLimits::kMaxHierarchyLabels;

Port::StringBase NameOf(const HierarchyParseContext& ctx, const Vad::HierarchyValue& value) {
  return ctx.names.String(value.name);
}

const Port::XUID& SlotId(const HierarchyParseContext& ctx, CParserConfigHolder::TypeSlot slot) {
  return ctx.holder.GetTypeId(slot);
}

void RecordArchitecture(HierarchyParseContext& ctx, const Vad::HierarchyValue& entity,
                        const Vad::HierarchyValue& architecture, std::uint32_t line) {
  ctx.holder.AddArch(NameOf(ctx, architecture), NameOf(ctx, entity), line,
                     SlotId(ctx, CParserConfigHolder::kArchitectureSlot));
}

void RecordModule(HierarchyParseContext& ctx, const Vad::HierarchyValue& name, std::uint32_t line) {
  ctx.holder.AddModule(NameOf(ctx, name), line, true, SlotId(ctx, CParserConfigHolder::kModuleSlot),
                       Port::StringBase());
}

void RecordEntity(HierarchyParseContext& ctx, const Vad::HierarchyValue& name, std::uint32_t line) {
  ctx.holder.AddEntityDecl(NameOf(ctx, name), line, true, SlotId(ctx, CParserConfigHolder::kEntitySlot));
}

void RecordComponentInstance(HierarchyParseContext& ctx, const Vad::HierarchyValue& component,
                             std::uint32_t line) {
  ctx.holder.AddCompInst(Port::StringBase(), NameOf(ctx, component), line,
                         SlotId(ctx, CParserConfigHolder::kInstanceLabelSlot), Port::StringBase());
}

void RecordEntityInstance(HierarchyParseContext& ctx, const Vad::HierarchyValue& entity,
                          const Vad::HierarchyValue& architecture, std::uint32_t line) {
  ctx.holder.AddEntityInst(Port::StringBase(), NameOf(ctx, entity), NameOf(ctx, architecture), line,
                           SlotId(ctx, CParserConfigHolder::kInstanceLabelSlot));
}

void RecordPackageBody(HierarchyParseContext& ctx, const Vad::HierarchyValue& name, std::uint32_t line) {
  ctx.holder.AddPackageBody(NameOf(ctx, name), line, SlotId(ctx, CParserConfigHolder::kPackageBodySlot));
}

void RecordPackage(HierarchyParseContext& ctx, const Vad::HierarchyValue& name, std::uint32_t line) {
  ctx.holder.AddPackageDecl(NameOf(ctx, name), line, SlotId(ctx, CParserConfigHolder::kPackageDeclSlot));
}

/* Labels name_k for every k of the range, in either order, from the lower bound up. */
void RecordInstanceRange(HierarchyParseContext& ctx, const Vad::HierarchyValue& name, std::uint32_t from,
                         std::uint32_t to) {
  const std::uint32_t low = std::min(from, to);
  const std::uint32_t high = std::max(from, to);
  Port::StringBase base = NameOf(ctx, name);
  if (high - low >= kMaxRangeLabels) {
    ctx.Error(Port::InputLimits::kRangeTooWide, base.c_str(), from, to);
    return;
  }
  const std::uint64_t count = std::uint64_t{high} - low + 1;
  if (ctx.labels + count > kMaxHierarchyLabels) {
    /* Said once: every later range is refused as well. */
    if (ctx.labels <= kMaxHierarchyLabels) ctx.Error(Port::InputLimits::kTooManyLabels, static_cast<unsigned long long>(kMaxHierarchyLabels));
    ctx.labels = kMaxHierarchyLabels + 1;
    return;
  }
  ctx.labels += count;
  for (std::uint64_t k = low; k <= high; ++k) {
    Port::StringBase label;
    label.Format("%s_%u", base.c_str(), static_cast<unsigned>(k));
    ctx.holder.AddInstanceLabel(label);
  }
}

}  // namespace
}

%define api.pure full
%define api.prefix {qh_}
%define api.token.prefix {QH_}
%define api.value.type {Vad::HierarchyValue}
%define parse.error simple
%expect 0
%lex-param {void* scanner}
%parse-param {void* scanner} {Vad::HierarchyParseContext& ctx}

%token HIERARCHY ENDHIERARCHY MODULE MODULEDECL SUBMODULE PACKAGE SUBPACKAGE INSTANCE TESTVECTORS
%token MISSING_SUBMODULE LINENUM IDENT BSLASH LPAREN RPAREN COLON CR LF
/* Known to the grammar but never produced by the scanner: the word PACKAGEBODY reads as a name. */
%token PACKAGEBODY SPACE

%start input

%%

input
  : %empty
  | input line
  ;

line
  : commands CR LF
  | commands CR
  | error { yyclearin; yyerrok; }
  ;

commands
  : module
  | moduledecl
  | submodule
  | package
  | packagebody
  | subpackage
  | instance
  | testvectors
  | missingsubmodule
  /* Reduced only before a line end, which stays to end the line: discarding it as well would
     leave the recovery waiting for a line end with the next line's keyword, and that line, and
     every line after it, would be lost too. */
  | error { yyerrok; }
  ;

module
  : MODULE ex_ident ex_ident LINENUM { RecordArchitecture(ctx, $2, $3, $4.number); }
  | MODULE ex_ident LINENUM { RecordModule(ctx, $2, $3.number); }
  | MODULE ex_ident ex_ident { RecordArchitecture(ctx, $2, $3, 0); }
  | MODULE ex_ident { RecordModule(ctx, $2, 0); }
  ;

moduledecl
  : MODULEDECL ex_ident LINENUM { RecordEntity(ctx, $2, $3.number); }
  | MODULEDECL ex_ident { RecordEntity(ctx, $2, 0); }
  ;

submodule
  : SUBMODULE ex_ident LINENUM { RecordComponentInstance(ctx, $2, $3.number); }
  | SUBMODULE ex_ident { RecordComponentInstance(ctx, $2, 0); }
  | SUBMODULE ex_ident ex_ident LINENUM { RecordEntityInstance(ctx, $2, $3, $4.number); }
  | SUBMODULE ex_ident ex_ident { RecordEntityInstance(ctx, $2, $3, 0); }
  ;

missingsubmodule
  : MISSING_SUBMODULE ex_ident { RecordComponentInstance(ctx, $2, 0); }
  ;

packagebody
  : PACKAGEBODY ex_ident LINENUM { RecordPackageBody(ctx, $2, $3.number); }
  | PACKAGEBODY ex_ident { RecordPackageBody(ctx, $2, 0); }
  ;

package
  : PACKAGE ex_ident LINENUM { RecordPackage(ctx, $2, $3.number); }
  | PACKAGE ex_ident { RecordPackage(ctx, $2, 0); }
  ;

subpackage
  : SUBPACKAGE ex_ident ex_ident
  | SUBPACKAGE ex_ident
  ;

instance
  : INSTANCE ex_ident { ctx.holder.AddInstanceLabel(NameOf(ctx, $2)); }
  | INSTANCE ex_ident LPAREN LINENUM COLON LINENUM RPAREN { RecordInstanceRange(ctx, $2, $4.number, $6.number); }
  ;

testvectors
  : TESTVECTORS ex_ident { ctx.holder.AddTestVector(NameOf(ctx, $2)); }
  ;

ex_ident
  : IDENT
  | BSLASH IDENT BSLASH { $$ = $2; }
  ;

%%
