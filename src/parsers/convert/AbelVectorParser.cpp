#include "AbelVectorParser.h"

#include "AbelParser.h"
#include "CParserConfigHolder.h"
#include "Port/InitObjects.h"

namespace Vad {
namespace {

QUILLON_XUID_FROM_TEXT(VectorEntityType, "{15B800DC-CD3B-45f9-B26A-26BFDD3441EF}")
QUILLON_XUID_FROM_TEXT(VectorPackageBodyType, "{35077F2B-87EA-47ac-834F-8C02E49945F0}")
QUILLON_XUID_FROM_TEXT(VectorPackageType, "{98867360-CC87-4033-AB17-973F0CEB374F}")
QUILLON_XUID_FROM_TEXT(VectorInstanceLabelType, "{F8EC4980-CDA2-4346-9E3C-DB50D7DA83E9}")
QUILLON_XUID_FROM_TEXT(VectorTestVectorType, "{2391D1AB-9BB0-4a61-A080-3CE4BFE2E116}")

CParserConfigHolder::TypeIds VectorTypeIds() {
  const Port::XUID& none = CParserConfigHolder::NoneTypeId();
  return {VectorEntityType(),
          none,
          none,
          VectorPackageBodyType(),
          VectorPackageType(),
          VectorInstanceLabelType(),
          VectorTestVectorType()};
}

}  // namespace

int AbelVectorParser::Parse(CParserConfigHolder& holder) {
  holder.SetTypeIds(VectorTypeIds());
  ReadThroughAbelConverter(holder);
  return 1;
}

}  // namespace Vad
