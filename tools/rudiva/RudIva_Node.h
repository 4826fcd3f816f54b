// A unit or declaration of a compiled VHDL library, with its members grouped by kind.
#pragma once

#include <memory>
#include <string>
#include <utility>
#include <vector>

class RudIva_Node {
 public:
  RudIva_Node(std::string name, int type);
  RudIva_Node(const RudIva_Node&) = delete;
  RudIva_Node& operator=(const RudIva_Node&) = delete;
  ~RudIva_Node();

  const std::string& GetName() const { return name_; }
  int GetType() const { return type_; }

  // Creates a member of that kind, owned by this node, after the existing members.
  RudIva_Node* AddMember(int kind, std::string name, int type);
  // The members of that kind in the order they were added; valid while this node lives.
  std::vector<RudIva_Node*> GetMembers(int kind) const;

 private:
  std::string name_;
  int type_;
  std::vector<std::pair<int, std::unique_ptr<RudIva_Node>>> members_;
};
