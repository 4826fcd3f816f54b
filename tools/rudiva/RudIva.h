// The VHDL library loader: reads a unit of a compiled VHDL library named in the library mapping
// file of the current directory. There is one loader per process (getPLI).
#pragma once

#include <string>
#include <vector>

#include "rudiva/RudIva_Node.h"

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

  static RudIva* getPLI();

  RudIva(const RudIva&) = delete;
  RudIva& operator=(const RudIva&) = delete;

  // The unit `unit` (with `secondaryUnit`, empty for a primary unit) of `library`, or null when it
  // cannot be loaded. The node is owned by the loader and stays valid until the next call.
  RudIva_Node* loadLibUnit(const char* library, const char* unit, const char* secondaryUnit, int objectType,
                           int nodeFileMode);

  // Null-safe readers of a node: no members, an empty name and kNoObject for a null node.
  std::vector<RudIva_Node*> getMembers(const RudIva_Node* node, int kind) const;
  std::string getName(const RudIva_Node* node) const;
  int getType(const RudIva_Node* node) const;

 private:
  RudIva() = default;
};
