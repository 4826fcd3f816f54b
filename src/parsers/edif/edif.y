/* Grammar of EDIF netlists, as far as the design hierarchy needs it: libraries, cells, instances
   with their view references, nets (which give a cell a body), the design form and the part and
   partition properties. Every other form is absorbed by error recovery, token by token. */

%code top {
/* The stack never grows: an overflow ends the parse of the file. */
#define YYINITDEPTH 200
#define YYMAXDEPTH 200
}

%code requires {
#include <cstdint>

#include "EdifParseContext.h"
}

%code {
#include <string>

int edif_lex(EDIF_STYPE* value, void* scanner);

namespace {

using Vad::EdifParseContext;

/* Syntax errors are recovered from silently. */
void edif_error(void*, EdifParseContext&, const char*) {}

std::uint32_t Joined(EdifParseContext& ctx, const char* before, std::uint32_t first, std::uint32_t second) {
  return ctx.texts.AddJoined(before + ctx.texts.Text(first) + "|" + ctx.texts.Text(second));
}

}  // namespace
}

%define api.pure full
%define api.prefix {edif_}
%define api.token.prefix {EDIF_}
%define api.value.type {std::uint32_t}
%define parse.error simple
%expect 0
%lex-param {void* scanner}
%parse-param {void* scanner} {Vad::EdifParseContext& ctx}

%token OPEN CLOSE DESIGN PROPERTY STRING RENAME CELL CELLREF INSTANCE NET LIBRARY CONFIG
%token LIBRARYREF VIEWREF PART PARTITION QUOTE IDENT

%start input

%%

input
  : %empty
  | input all
  ;

all
  : cell
  | library
  | property
  | design
  | instance
  | net
  | error { yyclearin; yyerrok; }
  ;

net
  : OPEN NET { ctx.MarkBody(); }
  ;

instance
  : OPEN INSTANCE { ctx.MarkBody(); } inst_name viewref CLOSE { ctx.AddInstance($4, $5); }
  ;

cell
  : OPEN CELL rename { ctx.AddCell($3); }
  | OPEN CELL ident { ctx.AddCell($3); }
  ;

design
  : OPEN DESIGN inst_name cellref { ctx.AddDesign($4); }
  ;

property
  : OPEN PROPERTY PART QUOTE ident QUOTE { ctx.SetPart($5); }
  | OPEN PROPERTY PART string { ctx.SetPart($4); }
  | OPEN PROPERTY PARTITION QUOTE ident QUOTE { ctx.SetPartition($5); }
  | OPEN PROPERTY PARTITION string { ctx.SetPartition($4); }
  ;

rename
  : OPEN RENAME ident QUOTE ident QUOTE CLOSE { $$ = Joined(ctx, "|", $3, $5); }
  ;

ident
  : IDENT
  | PART
  | PARTITION
  | NET
  ;

libraryref
  : OPEN LIBRARYREF ident CLOSE { $$ = $3; }
  ;

cellref
  : OPEN CELLREF ident libraryref CLOSE { $$ = Joined(ctx, "", $3, $4); }
  | OPEN CELLREF ident CLOSE { $$ = $3; }
  ;

viewref
  : OPEN VIEWREF ident cellref { $$ = Joined(ctx, "", $3, $4); }
  ;

library
  : OPEN LIBRARY inst_name { ctx.SetLibrary($3); }
  ;

inst_name
  : rename
  | ident
  ;

string
  : OPEN STRING QUOTE ident QUOTE CLOSE { $$ = $4; }
  ;

%%
