#include "rudiva/RudIva_Node.h"

RudIva_Node::RudIva_Node(std::string name, int type) : name_(std::move(name)), type_(type) {}

RudIva_Node::~RudIva_Node() = default;

RudIva_Node* RudIva_Node::AddMember(int kind, std::string name, int type) {
  members_.emplace_back(kind, std::make_unique<RudIva_Node>(std::move(name), type));
  return members_.back().second.get();
}

std::vector<RudIva_Node*> RudIva_Node::GetMembers(int kind) const {
  std::vector<RudIva_Node*> selected;
  for (const auto& [memberKind, member] : members_) {
    if (memberKind == kind) {
      selected.push_back(member.get());
    }
  }
  return selected;
}
