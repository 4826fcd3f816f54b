#include "SchematicParser.h"

#include <cstdint>
#include <new>
#include <string>
#include <vector>

#include "CHdlFile.h"
#include "CParserConfigHolder.h"
#include "ConverterRun.h"
#include "DerivedOutput.h"
#include "FileNamedModule.h"
#include "IFile.h"
#include "IFileCompReference.h"
#include "Port/Env.h"
#include "Port/File.h"
#include "Port/FileName.h"
#include "Port/InitObjects.h"
#include "Port/MsgManData.h"
#include "Prjrep/AutoPtr.h"
#include "qhParser.h"

namespace Vad {
namespace {

constexpr ConverterMessages kSchematicConverterMessages{"Unable to run drawconv - Process Failed\n",
                                                        "Unable to run drawconv - Bad Command Line\n"};
constexpr const char* kDefaultFamily = "kestrel";

QUILLON_XUID_FROM_TEXT(SheetEntityType, "{15B800DC-CD3B-45f9-B26A-26BFDD3441EF}")
QUILLON_XUID_FROM_TEXT(SheetPackageBodyType, "{35077F2B-87EA-47ac-834F-8C02E49945F0}")
QUILLON_XUID_FROM_TEXT(SheetPackageType, "{98867360-CC87-4033-AB17-973F0CEB374F}")
QUILLON_XUID_FROM_TEXT(SheetInstanceLabelType, "{F8EC4980-CDA2-4346-9E3C-DB50D7DA83E9}")
QUILLON_XUID_FROM_TEXT(SheetTestVectorType, "{2391D1AB-9BB0-4a61-A080-3CE4BFE2E116}")

CParserConfigHolder::TypeIds SchematicTypeIds() {
  return {SheetEntityType(),  TypeIds::FileNamedModule(), TypeIds::FileNamedModule(), SheetPackageBodyType(),
          SheetPackageType(), SheetInstanceLabelType(),   SheetTestVectorType()};
}

// The path the host reports for the file through its file component; empty when it has none.
Port::StringBase HostLocationOf(const CParserConfigHolder& holder) {
  Port::StringBase location;
  auto* reference = Prjrep::QueryAs<IFileCompReference>(holder.GetFile());
  if (!reference) return location;
  Prjrep::AutoRelease<IFile> component;
  reference->getFileComponent(component.Out());
  if (component) component->GetPath(&location);
  return location;
}

Port::StringBase DeviceFamilyOf(const CParserConfigHolder& holder) {
  Port::StringBase family;
  holder.GetProperty("PROP_DevFamilyPMName", family);
  if (family.IsEmpty()) {
    Port_MsgManData::debugStub(
        "WARNING: Device property not set for schematic parser. Using \"kestrel\" to generate netlist.\n");
    family = kDefaultFamily;
  }
  return family;
}

bool NeedsConversion(const Port::StringBase& source, const Port::StringBase& output) {
  std::int64_t outputTime = 0;
  if (!Port::File::exist(output.c_str()) || !Port::File::getdatetime(output.c_str(), &outputTime))
    return true;
  std::int64_t sourceTime = 0;
  return Port::File::getdatetime(source.c_str(), &sourceTime) && outputTime < sourceTime;
}

const char* SchematicConverter() { return Port_Env::GetEnv("CVN_WSMGR_QT3") ? "drawconv3" : "drawconv"; }

int Convert(const CParserConfigHolder& holder, const Port::StringBase& family, const Port::StringBase& source,
            const Port::StringBase& output) {
  const std::vector<std::string> arguments{SchematicConverter(), "-intstyle",  "ardent",    "-family",
                                           family.str(),         source.str(), output.str()};
  Port_MsgManData::debugStub("Cmd line is: %s -intstyle ardent -family %s \"%s\" \"%s\"\n",
                             arguments[0].c_str(), family.c_str(), source.c_str(), output.c_str());
  Port_MsgManData::debugStub("Extracting hierarchy info from: %s\n", source.c_str());
  Port::StringBase discarded;
  std::int32_t keepTaking = 0;
  return RunConverter(holder, arguments, kSchematicConverterMessages,
                      new (std::nothrow) DerivedOutput(&discarded, &keepTaking));
}

// The converter's output: "<base name>.hrf" beside the file's host location.
Port::StringBase OutputPathOf(const CParserConfigHolder& holder) {
  Port::StringBase location = HostLocationOf(holder);
  if (location.IsEmpty()) holder.GetFullPath(location);
  Port::StringBase directory = Port::FileName::GetHead(location.view());
  Port::FileName::MakeCanonical(&directory);
  Port::StringBase baseName;
  holder.GetBaseName(baseName);
  return Port::FileName::Join(directory.view(), (baseName + ".hrf").view());
}

}  // namespace

int SchematicParser::Parse(CParserConfigHolder& holder) {
  const Port::StringBase output = OutputPathOf(holder);
  holder.SetTypeIds(SchematicTypeIds());
  const Port::StringBase family = DeviceFamilyOf(holder);
  Port::StringBase source;
  holder.GetFullPath(source);
  int status = 0;
  if (NeedsConversion(source, output)) status = Convert(holder, family, source, output);

  if (status != 0 && Port::File::exist(output.c_str()) &&
      !ConverterOutputUsable(SchematicConverter(), source, output, status)) {
    return 1;
  }
  if (Port::File::exist(output.c_str())) {
    qhParser(output, holder).Parse();
  } else {
    Port::StringBase baseName;
    holder.GetBaseName(baseName);
    holder.AddModule(baseName, 0, true, TypeIds::FileNamedModule(), Port::StringBase());
  }
  return 1;
}

}  // namespace Vad
