#include "Parser.h"

namespace Vad {

CitI::Result Parser::ExtractPorts(CParserConfigHolder&, IHdlDesignUnit*, IHdlPortIterator**) {
  return kNoPortExtraction;
}

void Parser::SetTypeId(int index, const Port::XUID& id) {
  if (!IsValidIndex(index)) return;
  typeIds_[index] = id;
  typeIdSet_[index] = true;
}

const Port::XUID& Parser::GetTypeId(int index) const {
  static const Port::XUID kEmpty;
  return IsValidIndex(index) ? typeIds_[index] : kEmpty;
}

bool Parser::IsTypeIdSet(int index) const { return IsValidIndex(index) && typeIdSet_[index]; }

}  // namespace Vad
