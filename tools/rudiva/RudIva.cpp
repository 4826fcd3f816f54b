#include "rudiva/RudIva.h"

RudIva* RudIva::getPLI() {
  static RudIva loader;
  return &loader;
}

// No compiled library can be read yet, so no unit is ever loaded.
RudIva_Node* RudIva::loadLibUnit(const char*, const char*, const char*, int, int) { return nullptr; }

std::vector<RudIva_Node*> RudIva::getMembers(const RudIva_Node* node, int kind) const {
  return node == nullptr ? std::vector<RudIva_Node*>{} : node->GetMembers(kind);
}

std::string RudIva::getName(const RudIva_Node* node) const {
  return node == nullptr ? std::string() : node->GetName();
}

int RudIva::getType(const RudIva_Node* node) const { return node == nullptr ? kNoObject : node->GetType(); }
