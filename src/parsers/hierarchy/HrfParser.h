// Reads hierarchy description files of a project: one keyword line per module, package or
// sub-module reference, recorded into the file's holder.
#pragma once

#include "CitI.h"
#include "Parser.h"

namespace Vad {

// Type identifiers that hierarchy files of a project give their records (host constants).
namespace HrfTypeIds {
QUILLON_XUID_FROM_TEXT(Instance, "{F8EC4980-CDA2-4346-9E3C-DB50D7DA83E9}")
QUILLON_XUID_FROM_TEXT(Entity, "{15B800DC-CD3B-45f9-B26A-26BFDD3441EF}")
QUILLON_XUID_FROM_TEXT(Use, "{C15358C8-D5ED-4619-9ADB-1D607C75747B}")
QUILLON_XUID_FROM_TEXT(Architecture, "{6DCC6CCB-40B6-4f09-9AB3-C3593438F5B2}")
QUILLON_XUID_FROM_TEXT(PackageBody, "{35077F2B-87EA-47ac-834F-8C02E49945F0}")
QUILLON_XUID_FROM_TEXT(Package, "{98867360-CC87-4033-AB17-973F0CEB374F}")
}  // namespace HrfTypeIds

class HrfParser : public Parser {
 public:
  // Reads the holder's file line by line up to an ENDHIERARCHY line and records its keyword
  // lines. A file that cannot be opened records nothing. Always 1.
  int Parse(CParserConfigHolder& holder) override;
};

}  // namespace Vad
