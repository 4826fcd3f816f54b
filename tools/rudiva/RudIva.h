// The VHDL library loader: reads a unit of a compiled VHDL library named in the library mapping
// file of the current directory. There is one loader per process (getPLI); it is not re-entrant.
//
// A compiled library is a directory of VHDL sources (".vhd", ".vhdl", ".vho", any letter case).
// The mapping file ("corvanesim.ini" or "chdp.ini", see RudIva_LibraryMap.h for its lines) names
// the directory of each library; "$NAME" and "${NAME}" in it are taken from the environment, and a
// relative directory is taken from the current directory. A package unit is looked up in the
// directory's sources in byte order of their file names; the first declaration found is loaded.
#pragma once

#include <string>
#include <vector>

#include "rudiva/RudIva_Node.h"
#include "rudiva/RudIva_UnitCache.h"

class RudIva {
 public:
  // Object type of loadLibUnit: a package.
  static constexpr int kPackageObject = 55;
  // Node file modes of loadLibUnit: which mapping file names the libraries.
  static constexpr int kSimulationLibraries = 0;  // "corvanesim.ini"
  static constexpr int kSynthesisLibraries = 1;   // "chdp.ini"
  // Member kind of a unit's declarations, and the type of a component declaration among them.
  static constexpr int kDeclarationMembers = 106;
  static constexpr int kComponentDeclaration = 20;
  // getType of a null node.
  static constexpr int kNoObject = -1;

  // Why the last loadLibUnit answered null.
  enum class Failure {
    kNone,                 // it answered a node
    kUnsupportedRequest,   // null or empty names, a secondary unit, another object type or mode
    kNoMappingFile,        // the mode's mapping file cannot be read in the current directory
    kLibraryNotMapped,     // no line of the mapping file names the library
    kUnresolvedDirectory,  // the line refers to an unset environment variable
    kNoLibraryDirectory,   // the directory does not exist or cannot be listed
    kUnitNotFound,         // no source of the directory declares the package
  };

  static RudIva* getPLI();

  RudIva(const RudIva&) = delete;
  RudIva& operator=(const RudIva&) = delete;

  // The package `unit` of `library` (object type kPackageObject, `secondaryUnit` null or empty),
  // with one member of kind kDeclarationMembers and type kComponentDeclaration per component it
  // declares, in declaration order, named as written; or null when it cannot be loaded
  // (lastFailure says why). The node is owned by the loader and stays valid until the next call;
  // the same node may be answered again while the library's sources are unchanged.
  RudIva_Node* loadLibUnit(const char* library, const char* unit, const char* secondaryUnit, int objectType,
                           int nodeFileMode);

  Failure lastFailure() const { return lastFailure_; }
  // A sentence naming what could not be found; empty after a successful load.
  const std::string& lastError() const { return lastError_; }

  // Null-safe readers of a node: no members, an empty name and kNoObject for a null node.
  std::vector<RudIva_Node*> getMembers(const RudIva_Node* node, int kind) const;
  std::string getName(const RudIva_Node* node) const;
  int getType(const RudIva_Node* node) const;

 private:
  RudIva();
  ~RudIva();

  RudIva_Node* Succeed(RudIva_Node* node);
  RudIva_Node* Fail(Failure failure, std::string message);
  RudIva_Node* LoadPackage(const std::string& directory, const std::string& unit);

  RudIva_UnitCache cache_;
  Failure lastFailure_ = Failure::kNone;
  std::string lastError_;
};
