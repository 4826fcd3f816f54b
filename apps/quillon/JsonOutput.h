// The JSON output of the commands, for programs: the field names are fixed, other programs read
// them. A failed operation writes null in place of its answer; the messages say why.
#pragma once

#include <ostream>
#include <string>
#include <vector>

#include "DesignModel.h"
#include "Diagnostic.h"

namespace quillon {

class JsonOutput {
 public:
  static void Units(const std::vector<FileInfo>& files, const std::vector<MessageInfo>& messages,
                    std::ostream& out);
  // Tree, Order and Check also list quillon's own diagnostics under "diagnostics".
  static void Tree(const TreeNodeInfo* root, const std::vector<MessageInfo>& messages, std::ostream& out,
                   const std::vector<Diagnostic>& diagnostics = {});
  static void Order(const std::vector<OrderEntry>* order, const std::vector<MessageInfo>& messages,
                    std::ostream& out, const std::vector<Diagnostic>& diagnostics = {});
  static void Check(std::size_t files, std::size_t units, const std::vector<MessageInfo>& messages,
                    const std::vector<Diagnostic>& diagnostics, std::ostream& out);
  // "low", "high" and "span" are null for a port without a range; "ports" is null when the
  // module handed out none.
  static void Ports(const std::string& unit, const std::vector<PortInfo>* ports,
                    const std::vector<MessageInfo>& messages, std::ostream& out);
  // Only the messages, for a command that produced nothing else.
  static void Messages(const std::vector<MessageInfo>& messages, std::ostream& out);
};

}  // namespace quillon
