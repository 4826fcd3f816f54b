#include "rudiva/RudIva_PackageReader.h"

#include <utility>

using Kind = RudIva_Lexer::Kind;
using Token = RudIva_Lexer::Token;

namespace {

bool NameMatches(const Token& token, std::string_view unit) {
  if (!unit.empty() && unit.front() == '\\')
    return token.kind == Kind::kExtendedIdentifier && token.text == unit;
  return token.Is(unit);
}

// Paren depth of the text read so far; a stray closing parenthesis never makes it negative.
class ParenDepth {
 public:
  void Track(const Token& token) {
    if (token.IsDelimiter('(')) {
      ++depth_;
    } else if (token.IsDelimiter(')') && depth_ > 0) {
      --depth_;
    }
  }
  bool AtTop() const { return depth_ == 0; }

 private:
  long depth_ = 0;
};

}  // namespace

std::optional<RudIva_PackageReader::Package> RudIva_PackageReader::Read(std::istream& in,
                                                                        std::string_view unit) {
  RudIva_PackageReader reader(in);
  Package package;
  if (!reader.FindPackageHeader(unit, package.name)) return std::nullopt;
  reader.ReadDeclarations(0, &package.components);
  return package;
}

const Token& RudIva_PackageReader::Peek(std::size_t ahead) {
  while (lookahead_.size() <= ahead) lookahead_.push_back(lexer_.Next());
  return lookahead_[ahead];
}

Token RudIva_PackageReader::Take() {
  Peek();
  Token token = std::move(lookahead_.front());
  lookahead_.pop_front();
  return token;
}

bool RudIva_PackageReader::FindPackageHeader(std::string_view unit, std::string& name) {
  while (!AtEnd()) {
    if (Take().Is("package") && NameMatches(Peek(), unit) && Peek(1).Is("is") && !Peek(2).Is("new")) {
      name = Take().text;
      Take();
      return true;
    }
  }
  return false;
}

// Reads up to and including the "end" of the enclosing package; `components` may be null for a
// nested package, whose components are not the outer package's.
void RudIva_PackageReader::ReadDeclarations(int nesting, std::vector<std::string>* components) {
  while (!AtEnd()) {
    if (Peek().Is("end")) {
      SkipEndClause("package");
      return;
    }
    if (Peek().Is("component")) {
      ReadComponent(components);
    } else if (Peek().Is("type")) {
      SkipTypeDeclaration();
    } else if (Peek().Is("package")) {
      SkipNestedPackage(nesting);
    } else {
      SkipDeclaration();
    }
  }
}

void RudIva_PackageReader::ReadComponent(std::vector<std::string>* components) {
  Take();
  std::optional<std::string> name;
  if (Peek().IsName()) name = Take().text;
  bool closed = SkipToEndOf("component");
  if (closed && name && components && components->size() < kMaxComponents) {
    components->push_back(std::move(*name));
  }
}

// Records, physical units and protected types hold semicolons of their own and close with
// "end record", "end units" or "end protected".
void RudIva_PackageReader::SkipTypeDeclaration() {
  Token previous = Take();
  ParenDepth depth;
  while (!AtEnd() && !Peek().Is("end") && !(depth.AtTop() && OpensDeclaration(previous))) {
    for (std::string_view construct : {"record", "units", "protected"}) {
      if (Peek().Is(construct)) {
        Take();
        SkipToEndOf(construct);
        return;
      }
    }
    previous = Take();
    depth.Track(previous);
    if (previous.IsDelimiter(';') && depth.AtTop()) return;
  }
}

void RudIva_PackageReader::SkipNestedPackage(int nesting) {
  Take();
  if (nesting < kMaxNesting && Peek().IsName() && Peek(1).Is("is") && !Peek(2).Is("new")) {
    Take();
    Take();
    ReadDeclarations(nesting + 1, nullptr);
  } else {
    SkipDeclaration();
  }
}

// True when "end <construct>" closed it; false at the end of the text or at an "end" of something
// else, which is left for the enclosing declaration list. A component also stops at the next
// component, since one cannot hold another.
bool RudIva_PackageReader::SkipToEndOf(std::string_view construct) {
  ParenDepth depth;
  while (!AtEnd()) {
    if (Peek().Is("end")) {
      if (!Peek(1).Is(construct)) return false;
      SkipEndClause(construct);
      return true;
    }
    if (construct == "component" && depth.AtTop() && Peek().Is("component")) return false;
    depth.Track(Take());
  }
  return false;
}

// A declaration that ends with a semicolon outside parentheses. When the semicolon is missing it
// also stops (leaving the word) at an "end" or at the start of the next declaration.
void RudIva_PackageReader::SkipDeclaration() {
  ParenDepth depth;
  Token previous;
  do {
    previous = Take();
    depth.Track(previous);
    if (previous.IsDelimiter(';') && depth.AtTop()) return;
  } while (!AtEnd() && !Peek().Is("end") && !(depth.AtTop() && OpensDeclaration(previous)));
}

// "component", "type" and "package" stand inside a declaration only as the class of an attribute
// statement ("attribute a of x : component is ..."), right after the colon.
bool RudIva_PackageReader::OpensDeclaration(const Token& previous) {
  return (Peek().Is("component") || Peek().Is("type") || Peek().Is("package")) && !previous.IsDelimiter(':');
}

// "end", then optionally the construct's reserved word, its name and the semicolon. After a bare
// "end" the reserved word may instead open the next declaration ("end; component x is").
void RudIva_PackageReader::SkipEndClause(std::string_view construct) {
  Take();
  bool opensNext = Peek(1).IsName() && Peek(2).Is("is");
  if (Peek().Is(construct) && !opensNext) Take();
  if (Peek().IsName()) Take();
  if (Peek().IsDelimiter(';')) Take();
}
