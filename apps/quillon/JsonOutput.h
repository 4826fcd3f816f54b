// The JSON output of the commands, for programs: the field names are fixed, other programs read
// them. A failed operation writes null in place of its answer; the messages say why.
#pragma once

#include <ostream>
#include <string>
#include <vector>

#include "DesignModel.h"

namespace quillon {

class JsonOutput {
 public:
  static void Units(const std::vector<FileInfo>& files, const std::vector<MessageInfo>& messages,
                    std::ostream& out);
  static void Tree(const TreeNodeInfo* root, const std::vector<MessageInfo>& messages, std::ostream& out);
  static void Order(const std::vector<OrderEntry>* order, const std::vector<MessageInfo>& messages,
                    std::ostream& out);
  static void Check(std::size_t files, std::size_t units, const std::vector<MessageInfo>& messages,
                    std::ostream& out);
  // The ports of `unit` come with the module's port extraction; until then "ports" is null.
  static void Ports(const std::string& unit, const std::vector<MessageInfo>& messages, std::ostream& out);
  // Only the messages, for a command that produced nothing else.
  static void Messages(const std::vector<MessageInfo>& messages, std::ostream& out);
};

}  // namespace quillon
