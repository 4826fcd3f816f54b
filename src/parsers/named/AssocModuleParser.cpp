#include "AssocModuleParser.h"

#include "CParserConfigHolder.h"
#include "FileNamedModule.h"
#include "Port/InitObjects.h"

namespace Vad {

int AssocModuleParser::Parse(CParserConfigHolder& holder) {
  Port::StringBase name;
  Port::StringBase extension;
  holder.GetBaseName(name);
  holder.GetExtension(extension);
  name.Append('.').Append(extension.view());
  holder.AddModule(name, 0, true, TypeIds::FileNamedModule(), Port::StringBase());
  return 1;
}

}  // namespace Vad
