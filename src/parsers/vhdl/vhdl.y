/* Partial VHDL grammar: recognises only the constructs that place design units in a project
   (library, use and context clauses, unit headers, package instances, instantiations,
   configurations, generate statements, port clauses) and lets error recovery swallow everything
   else. */

%code top {
/* The stack never grows: an overflow ends the parse of the file. */
#define YYINITDEPTH 200
#define YYMAXDEPTH 200
}

%code requires {
#include "VhdlParseContext.h"
}

%code provides {
namespace Vad {
// For every token code, whether the token can begin a construct when the grammar stands between
// two constructs. Any other token there is a syntax error whose recovery only discards it, so
// the scanner may drop it at once. Taken from the grammar's own tables.
const bool* VhdlTokensBeginningConstructs();
}
}

%code {
#include <array>
#include <cctype>
#include <string>

#include "CParserConfigHolder.h"
#include "VhdlParser.h"

int vhdl_lex(VHDL_STYPE* value, void* scanner);

/* Syntax errors are expected (most of VHDL is not in this grammar) and never reported. */
static void vhdl_error(void*, Vad::VhdlParseContext&, const char*) {}

namespace {

using Vad::VhdlParseContext;
using Vad::VhdlText;
namespace TypeIds = Vad::VhdlTypeIds;

std::string_view TextOf(const VhdlParseContext& ctx, VhdlText text) { return ctx.texts.View(text); }
Port::StringBase StringOf(const VhdlParseContext& ctx, VhdlText text) { return ctx.texts.String(text); }

void RecordArchitecture(VhdlParseContext& ctx, VhdlText archName, VhdlText entityName) {
  ctx.begin = false;
  ctx.parenDepth = 0;
  ctx.inProcess = false;
  ctx.inRecord = false;
  ctx.holder.AddArch(StringOf(ctx, archName), StringOf(ctx, entityName), ctx.line, TypeIds::Architecture());
}

std::string Lower(std::string_view text) {
  std::string lower(text);
  for (char& c : lower) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
  return lower;
}

void RecordLibrary(VhdlParseContext& ctx, VhdlText name) {
  ctx.libraries.insert(Lower(TextOf(ctx, name)));
  ctx.holder.AddLibrary(StringOf(ctx, name), ctx.line, TypeIds::Library());
}

void RecordEntity(VhdlParseContext& ctx, VhdlText name, bool portFlag) {
  ctx.holder.AddEntityDecl(StringOf(ctx, name), ctx.line, portFlag, TypeIds::Entity());
}

void RecordComponentInstance(VhdlParseContext& ctx, VhdlText label, VhdlText component) {
  ctx.holder.AddCompInst(StringOf(ctx, label), StringOf(ctx, component), ctx.line, TypeIds::Instance(),
                         Port::StringBase());
}

void RecordEntityInstance(VhdlParseContext& ctx, VhdlText label, VhdlText entity,
                          std::string_view architecture) {
  ctx.holder.AddEntityInst(StringOf(ctx, label), StringOf(ctx, entity), Port::StringBase(architecture),
                           ctx.line, TypeIds::Instance());
}

// Inside a configuration declaration a binding is a unit the configuration depends on; in an
// architecture it binds the component instances of its own (`for u : comp use entity ...`).
void RecordConfigBinding(VhdlParseContext& ctx, VhdlText instances, VhdlText component, VhdlText entity,
                         std::string_view architecture) {
  if (ctx.openDeclaration == Vad::VhdlDeclaration::kConfiguration) {
    RecordEntityInstance(ctx, instances, entity, architecture);
    return;
  }
  ctx.holder.AddConfigBinding(StringOf(ctx, instances), StringOf(ctx, component), StringOf(ctx, entity),
                              Port::StringBase(architecture));
}

// "u : name;" is also the form of an object declaration without a value and of a labelled
// procedure call; only a label where a concurrent statement begins counts as an instance.
void RecordMaplessComponentInstance(VhdlParseContext& ctx, VhdlText label, VhdlText component) {
  if (ctx.labelBeginsStatement && ctx.begin) RecordComponentInstance(ctx, label, component);
}

void RecordContextReference(VhdlParseContext& ctx, VhdlText name) {
  ctx.holder.AddUse(StringOf(ctx, name), ctx.line, TypeIds::Use(), ctx.begin);
}

void OpenDeclaration(VhdlParseContext& ctx, Vad::VhdlDeclaration declaration) {
  ctx.openDeclaration = declaration;
  ctx.configurationDepth = 0;
  ctx.parenDepth = 0;
  ctx.begin = false;
}

void RecordContextDeclaration(VhdlParseContext& ctx, VhdlText name) {
  OpenDeclaration(ctx, Vad::VhdlDeclaration::kContext);
  ctx.holder.AddContextDecl(StringOf(ctx, name), ctx.line, TypeIds::Package());
}

void RecordConfiguration(VhdlParseContext& ctx, VhdlText name, VhdlText entity) {
  OpenDeclaration(ctx, Vad::VhdlDeclaration::kConfiguration);
  ctx.configuredEntity.assign(TextOf(ctx, entity));
  ctx.awaitsConfiguredArchitecture = true;
  ctx.holder.AddConfigurationDecl(StringOf(ctx, name), ctx.line, TypeIds::Package());
}

// The block configuration that opens a configuration names the architecture it configures.
void RecordConfiguredArchitecture(VhdlParseContext& ctx, VhdlText architecture) {
  if (ctx.openDeclaration != Vad::VhdlDeclaration::kConfiguration || !ctx.awaitsConfiguredArchitecture) return;
  ctx.awaitsConfiguredArchitecture = false;
  Port::StringBase entity(ctx.configuredEntity);
  ctx.holder.AddEntityInst(entity, entity, StringOf(ctx, architecture), ctx.forLine, TypeIds::Instance());
}

void RecordPackageHeader(VhdlParseContext& ctx) {
  ctx.unitLine = ctx.line;
}

void RecordPackage(VhdlParseContext& ctx, VhdlText name) {
  ctx.parenDepth = 0;
  ctx.holder.AddPackageDecl(StringOf(ctx, name), ctx.unitLine, TypeIds::Package());
}

// A package instance inside parentheses is a formal package of a generic clause, and one inside
// an entity, architecture or configuration is declared there: both are uses of the unit around
// them. Any other is a library unit of its own.
void RecordPackageInstance(VhdlParseContext& ctx, VhdlText name, VhdlText genericPackage) {
  ctx.actuals = VhdlParseContext::Actuals::kAwaitingMap;
  if (ctx.parenDepth > 0 || ctx.holder.HasCurrentUnit()) {
    ctx.holder.AddUnitUse(StringOf(ctx, genericPackage), ctx.line, TypeIds::Use());
    return;
  }
  ctx.holder.AddPackageInstance(StringOf(ctx, name), StringOf(ctx, genericPackage), ctx.unitLine,
                                TypeIds::Package(), TypeIds::Use());
}

// A context declaration ends at its first "end", a configuration at the "end" outside every
// block and component configuration.
void RecordEnd(VhdlParseContext& ctx, bool namesDeclaration) {
  bool ends = ctx.openDeclaration == Vad::VhdlDeclaration::kContext ||
              (ctx.openDeclaration == Vad::VhdlDeclaration::kConfiguration &&
               (namesDeclaration || ctx.configurationDepth == 0));
  if (!ends) return;
  ctx.openDeclaration = Vad::VhdlDeclaration::kNone;
  ctx.awaitsConfiguredArchitecture = false;
  ctx.begin = true;
  ctx.holder.EndDeclaration();
}

}  // namespace
}

%define api.pure full
%define api.prefix {vhdl_}
%define api.token.prefix {VHDL_}
%define api.value.type {Vad::VhdlText}
%define parse.error simple
%expect 0
%lex-param {void* scanner}
%parse-param {void* scanner} {Vad::VhdlParseContext& ctx}

%token ARCHITECTURE IS ENTITY COMPONENT GENERIC MAP PORT TOK_BEGIN TOK_END ATTRIBUTE OF PACKAGE BODY
%token USE CONFIGURATION FOR ALL GENERATE LIBRARY IDENT STRING CONTEXT NEW
%token COLON PERIOD BSLASH OPEN_PAREN CLOSE_PAREN COMMA SEMICOLON EQUAL SLASH
/* A lone "end" gives way to the words that can follow it in one construct. */
%precedence END_ALONE
%precedence FOR CONTEXT CONFIGURATION GENERATE
/* Known to the grammar but never produced by the scanner. */
%token INT_NUM INTEGER OTHERS CR

%start input

%%

input
  : %empty { ctx.betweenConstructs = true; }
  | input all
      {
        /* Nothing of the completed construct is referenced any more; only a lookahead token
           already read keeps its text. Without one, the next token is read between constructs. */
        ctx.labelBeginsStatement = false;
        if (yychar == VHDL_VHDL_EMPTY) {
          ctx.texts.Clear();
          ctx.betweenConstructs = true;
        } else {
          ctx.texts.KeepOnly(yylval);
        }
      }
  ;

all
  : library
  | arch
  | instantiation
  | entity
  | package
  | idents
  | attribute
  | use
  | configuration
  | generate
  | compdecl
  | port
  | begin
  | context
  | end
  | error { yyclearin; yyerrok; }
  ;

begin
  : TOK_BEGIN { ctx.begin = true; }
  ;

use
  : USE ext_ident SEMICOLON
      { ctx.holder.AddUse(StringOf(ctx, $2), ctx.line, TypeIds::Use(), ctx.begin); }
  ;

/* The header is reduced before the next token is read, so the line is the header's own. */
package_header
  : PACKAGE ident IS { RecordPackageHeader(ctx); $$ = $2; }
  ;

package
  : package_header { RecordPackage(ctx, $1); }
  | package_header NEW ext_ident { RecordPackageInstance(ctx, $1, $3); }
  | PACKAGE BODY ident IS
      { ctx.holder.AddPackageBody(StringOf(ctx, $3), ctx.line, TypeIds::PackageBody()); }
  ;

library
  : LIBRARY lib_ident SEMICOLON
  | LIBRARY error { yyclearin; yyerrok; }
  ;

/* Right recursive: a list is recorded from its last name back to its first. */
lib_ident
  : ident { RecordLibrary(ctx, $1); }
  | ident COMMA lib_ident { RecordLibrary(ctx, $1); }
  ;

arch
  : ARCHITECTURE ident OF ident IS { RecordArchitecture(ctx, $2, $4); }
  | ARCHITECTURE ident OF ident { RecordArchitecture(ctx, $2, $4); }
  | ARCHITECTURE error { yyclearin; yyerrok; }
  ;

/* A port list is not part of the grammar: CLOSE_PAREN follows only for an empty list, so an
   entity whose header reaches its port clause normally keeps the port flag true. */
entity
  : ENTITY ident IS PORT OPEN_PAREN { RecordEntity(ctx, $2, true); } CLOSE_PAREN
      { ctx.holder.SetEntityPortFlag(false); }
  | ENTITY ident IS GENERIC { RecordEntity(ctx, $2, false); }
  | ENTITY ident IS TOK_END { RecordEntity(ctx, $2, false); }
  | ENTITY ident IS TOK_BEGIN { RecordEntity(ctx, $2, false); }
  | ENTITY ident IS idents { RecordEntity(ctx, $2, false); }
  | ENTITY error { yyclearin; yyerrok; }
  ;

instantiation
  : ident COLON ext_ident map { RecordComponentInstance(ctx, $1, $3); }
  | ident COLON ext_ident SEMICOLON { RecordMaplessComponentInstance(ctx, $1, $3); }
  | ident COLON COMPONENT ext_ident map_or_end { RecordComponentInstance(ctx, $1, $4); }
  | ident COLON ENTITY ext_ident map_or_end { RecordEntityInstance(ctx, $1, $4, {}); }
  | ident COLON ENTITY ext_ident OPEN_PAREN ext_ident CLOSE_PAREN map_or_end
      { RecordEntityInstance(ctx, $1, $4, TextOf(ctx, $6)); }
  | ident COLON CONFIGURATION ext_ident map_or_end { RecordEntityInstance(ctx, $1, $4, {}); }
  | ident COLON error { yyclearin; yyerrok; }
  ;

map_or_end
  : map
  | SEMICOLON
  ;

/* "context lib.ctx;" references a context declaration and is recorded as a use clause. */
context
  : CONTEXT ident IS { RecordContextDeclaration(ctx, $2); }
  | CONTEXT context_names SEMICOLON
  ;

context_names
  : ext_ident { RecordContextReference(ctx, $1); }
  | context_names COMMA ext_ident { RecordContextReference(ctx, $3); }
  ;

end
  : TOK_END %prec END_ALONE { RecordEnd(ctx, false); }
  | TOK_END FOR { if (ctx.configurationDepth > 0) --ctx.configurationDepth; }
  | TOK_END CONTEXT { RecordEnd(ctx, true); }
  | TOK_END CONFIGURATION { RecordEnd(ctx, true); }
  ;

port
  : PORT OPEN_PAREN { ctx.holder.SetEntityPortFlag(true); } CLOSE_PAREN
      { ctx.holder.SetEntityPortFlag(false); }
  ;

idents
  : ident
  ;

map
  : PORT MAP
  | GENERIC MAP
  ;

ext_ident
  : ident PERIOD ident PERIOD ALL { $$ = ctx.texts.Join({TextOf(ctx, $1), ".", TextOf(ctx, $3), ".all"}); }
  | ident PERIOD ident PERIOD ident
      { $$ = ctx.texts.Join({TextOf(ctx, $1), ".", TextOf(ctx, $3), ".", TextOf(ctx, $5)}); }
  | ident PERIOD ident { $$ = ctx.texts.Join({TextOf(ctx, $1), ".", TextOf(ctx, $3)}); }
  | ident PERIOD ALL { $$ = ctx.texts.Join({TextOf(ctx, $1), ".all"}); }
  | ident
  ;

ident
  : IDENT
  | BSLASH IDENT BSLASH { $$ = $2; }
  ;

compdecl
  : COMPONENT ident
  ;

attribute
  : ATTRIBUTE ident OF ident COLON COMPONENT IS STRING
  ;

configuration
  : CONFIGURATION ident OF ident IS { RecordConfiguration(ctx, $2, $4); }
  | for_keyword ident { RecordConfiguredArchitecture(ctx, $2); }
  | for_keyword inst_list COLON ident USE CONFIGURATION ext_ident
      {
        if (ctx.openDeclaration == Vad::VhdlDeclaration::kConfiguration)
          RecordEntityInstance(ctx, $2, $7, {});
      }
  | for_keyword inst_list COLON ident USE ENTITY ext_ident { RecordConfigBinding(ctx, $2, $4, $7, {}); }
  | for_keyword inst_list COLON ident USE ENTITY ext_ident OPEN_PAREN ident CLOSE_PAREN
      { RecordConfigBinding(ctx, $2, $4, $7, TextOf(ctx, $9)); }
  ;

/* Reduced as soon as "for" is read, so that its line is known. */
for_keyword
  : FOR { ctx.forLine = ctx.line; }
  ;

inst_list
  : ident
  | ident COMMA inst_list { $$ = ctx.texts.Join({TextOf(ctx, $1), ",", TextOf(ctx, $3)}); }
  | OTHERS { $$ = ctx.texts.Add("OTHERS"); }
  | ALL { $$ = ctx.texts.Add("ALL"); }
  ;

generate
  : GENERATE { ctx.holder.EnterGenerate(); }
  | TOK_END GENERATE { ctx.holder.LeaveGenerate(false); }
  ;

%%

namespace Vad {
namespace {

// The state the parser is in between two constructs: the one reached from the start state
// after reducing `input`.
int StateBetweenConstructs() {
  const int lhs = YYSYMBOL_input - YYNTOKENS;
  const int index = yypgoto[lhs];
  return (0 <= index && index <= YYLAST && yycheck[index] == 0) ? yytable[index] : yydefgoto[lhs];
}

bool SymbolBeginsConstruct(int state, int symbol) {
  const int base = yypact[state];
  const int index = base + symbol;
  // A default reduction or an entry for the token means the token is not simply discarded.
  return yypact_value_is_default(base) || yydefact[state] != 0 ||
         (0 <= index && index <= YYLAST && yycheck[index] == symbol);
}

std::array<bool, YYMAXUTOK + 1> TokensBeginningConstructs() {
  std::array<bool, YYMAXUTOK + 1> begins{};
  const int state = StateBetweenConstructs();
  for (int token = 0; token <= YYMAXUTOK; ++token) {
    begins[token] = SymbolBeginsConstruct(state, YYTRANSLATE(token));
  }
  return begins;
}

}  // namespace

void RecordGenericActual(VhdlParseContext& context, std::string_view name) {
  std::size_t dot = name.find('.');
  if (dot == std::string_view::npos) return;
  std::string library = Lower(name.substr(0, dot));
  if (library != "work" && !context.libraries.contains(library)) return;
  context.holder.AddUnitUse(Port::StringBase(name), context.line, TypeIds::Use());
}

const bool* VhdlTokensBeginningConstructs() {
  static const std::array<bool, YYMAXUTOK + 1> begins = TokensBeginningConstructs();
  return begins.data();
}

}  // namespace Vad
