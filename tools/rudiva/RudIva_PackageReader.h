// Finds the declaration of one package in VHDL text and lists the components it declares.
//
// The reader knows only as much of the language as it takes to find where each declaration of a
// package ends: components, records, physical and protected types and nested packages close with
// their own "end", every other declaration with a semicolon outside parentheses. Text that is not
// VHDL never makes it fail; it may only keep a component from being listed.
#pragma once

#include <cstddef>
#include <deque>
#include <istream>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "rudiva/RudIva_Lexer.h"

class RudIva_PackageReader {
 public:
  struct Package {
    std::string name;                     // as written in the package header
    std::vector<std::string> components;  // names as written, in declaration order
  };

  // At most this many components are listed per package, and nested packages are followed this
  // deep; beyond, declarations are skipped.
  static constexpr std::size_t kMaxComponents = 10000;
  static constexpr int kMaxNesting = 16;

  // The first declaration of package `unit` in the text (package bodies and package
  // instantiations do not count). A basic identifier matches ignoring letter case; an extended
  // one ("\name\") only exactly. Nothing when the text declares no such package.
  static std::optional<Package> Read(std::istream& in, std::string_view unit);

 private:
  explicit RudIva_PackageReader(std::istream& in) : lexer_(in) {}

  const RudIva_Lexer::Token& Peek(std::size_t ahead = 0);
  RudIva_Lexer::Token Take();
  bool AtEnd() { return Peek().kind == RudIva_Lexer::Kind::kEnd; }

  bool FindPackageHeader(std::string_view unit, std::string& name);
  void ReadDeclarations(int nesting, std::vector<std::string>* components);
  void ReadComponent(std::vector<std::string>* components);
  void SkipTypeDeclaration();
  void SkipNestedPackage(int nesting);
  bool SkipToEndOf(std::string_view construct);
  void SkipDeclaration();
  bool OpensDeclaration(const RudIva_Lexer::Token& previous);
  void SkipEndClause(std::string_view construct);

  RudIva_Lexer lexer_;
  std::deque<RudIva_Lexer::Token> lookahead_;
};
