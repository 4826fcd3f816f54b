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
  // A later occurrence of a shared subtree is a NODE with "shared": true, "firstOccurrence" (a
  // JSON pointer to the node printed in full, as "/root/children/0/children/2") and no children. A
  // node whose children a depth limit left out has "moreBelow": N.
  // Deeper than kDeepestIndent levels the indent stops growing. Tree, Order and Check also list
  // quillon's own diagnostics under "diagnostics".
  static void Tree(const TreeInfo* tree, const std::vector<MessageInfo>& messages, std::ostream& out,
                   const std::vector<Diagnostic>& diagnostics = {});
  static constexpr std::size_t kDeepestIndent = 100;
  // "includeDirs" and "defines" come with the order, so that its reader can compile the files.
  static void Order(const std::vector<OrderEntry>* order, const VerilogSettings& verilog,
                    const std::vector<MessageInfo>& messages, std::ostream& out,
                    const std::vector<Diagnostic>& diagnostics = {});
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
