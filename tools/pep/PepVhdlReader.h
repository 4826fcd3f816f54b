// Reads the entities of one VHDL file (generic and port clauses) and the instantiations in its
// architectures and configurations, skipping everything else. Constructs it cannot follow are
// skipped, never reported.
//
// Recognised instantiations: "label : [component] name (generic|port) map",
// "label : entity lib.name[(arch)]" and the binding "use entity lib.name" of a configuration;
// each is recorded for the entity of the enclosing architecture or configuration.
#pragma once

#include <string>

#include "pep/PepDesignUnit.h"
#include "pep/PepTokenStream.h"
#include "pep/PepUnitCatalog.h"

class PepVhdlReader {
 public:
  // Both must outlive the reader; `library` is in lower case.
  PepVhdlReader(PepTokenStream& tokens, std::string library, PepUnitCatalog& catalog)
      : tokens_(tokens), library_(std::move(library)), catalog_(catalog) {}

  void Read();

 private:
  bool AtEntityDeclaration();
  bool AtSecondaryUnitHeader();
  void ReadEntity();
  void ReadGenericClause(PepDesignUnit& unit);
  void ReadPortClause(PepDesignUnit& unit);
  void ReadGenericDeclaration(const PepTokens& declaration, PepDesignUnit& unit);
  void ReadPortDeclaration(const PepTokens& declaration, PepDesignUnit& unit);
  // After ':' of a labelled statement or after "use": records an instantiated unit if one is named.
  void ReadInstantiation(std::size_t nameAt);
  // The key of the last segment of the dotted name at `at`, and where the name ends.
  std::string DottedNameKey(std::size_t at, std::size_t& end);
  void Record(const std::string& unitKey);

  PepTokenStream& tokens_;
  std::string library_;
  PepUnitCatalog& catalog_;
  std::string ownerKey_;  // the entity of the architecture or configuration being read
};
