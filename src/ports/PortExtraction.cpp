#include "PortExtraction.h"

#include <memory>
#include <new>

#include "Arch.h"
#include "CPepPortIter.h"
#include "EntityDecl.h"
#include "IHdlFile.h"
#include "IHdlPort.h"
#include "Port/MsgManData.h"
#include "Prjrep/Casts.h"
#include "module.h"
#include "pep/PepExtractor.h"
#include "pep/Pep_Exception.h"

namespace Vad::PortExtraction {

namespace {

constexpr const char* kLibrary = "work";

// A host that asks every unit for its ports would get an error for each unit without any; the
// reason is a developer text, and the host explains the missing answer in its own words.
void ReportError(int /*line*/, const std::string& unitKey, const std::string& reason) {
  Port_MsgManData::debugStub("ports of %s: %s\n", unitKey.c_str(), reason.c_str());
}

std::string DesignUnitKeyOf(const DbObject* object) {
  Port::StringBase key;
  if (object) object->GetDesignUnitKey(key);
  return object ? key.str() : "a design unit of no project";
}

// An entity's or module's own name; an architecture's entity name. False for other kinds.
bool PortUnitNameOf(const DbObject* object, std::string& name) {
  if (auto* entity = dynamic_cast<const EntityDecl*>(object)) {
    name = entity->GetEntityName().str();
  } else if (auto* architecture = dynamic_cast<const Arch*>(object)) {
    name = architecture->GetEntityName().str();
  } else if (auto* verilogModule = dynamic_cast<const module*>(object)) {
    name = verilogModule->GetModuleName().str();
  } else {
    return false;
  }
  return true;
}

// The extractor after it looked for `name`; the result says what it found.
CitI::Result RunExtractor(const std::vector<DesignFile>& files, const std::string& name,
                          std::unique_ptr<PepExtractor>& extractor) {
  extractor = std::make_unique<PepExtractor>();
  for (const DesignFile& file : files) extractor->addDesignFile(kLibrary, file.path.c_str(), file.language);
  extractor->Parse(PepExtractor::kVerilog);
  if (extractor->findDesignUnit(kLibrary, name.c_str(), PepExtractor::kSearchExactName) !=
      PepExtractor::kUnitFound)
    return kUnitNotFound;
  if (!extractor->hasAllGenericsDefined()) return kGenericsWithoutValues;
  return CitI::kOk;
}

}  // namespace

CitI::Result Extract(IHdlDesignUnit* unit, const FileLister& listFiles, IHdlPortIterator** out) {
  if (!out) return CitI::kInvalidArg;
  *out = nullptr;
  if (!unit) return CitI::kInvalidArg;

  const auto* object = Prjrep::ImplementationCast<DbObject>(unit);
  const std::string key = DesignUnitKeyOf(object);
  std::string name;
  if (!PortUnitNameOf(object, name)) {
    ReportError(__LINE__, key, "only entities, architectures and modules have ports");
    return CitI::kFail;
  }
  try {
    std::vector<DesignFile> files;
    if (!listFiles(files)) {
      ReportError(__LINE__, key, "the design files for the port extractor are not available");
      return CitI::kFail;
    }
    std::unique_ptr<PepExtractor> extractor;
    CitI::Result result = RunExtractor(files, name, extractor);
    if (result == kUnitNotFound) {
      ReportError(__LINE__, key, "the port extractor does not find '" + name + "' in its design files");
    } else if (result == kGenericsWithoutValues) {
      ReportError(__LINE__, key, "not every generic or parameter of '" + name + "' has a value");
    } else {
      *out = CPepPortIter::ForExtractor(std::move(extractor)).Detach();
    }
    return result;
  } catch (const Pep_Exception::Base& failure) {
    ReportError(__LINE__, key, failure.what());
  } catch (const std::bad_alloc&) {
    ReportError(__LINE__, key, "out of memory");
  }
  return CitI::kFail;
}

bool ExtractorPathOf(IHdlFile* file, std::string& path) {
  Port::StringBase directory;
  Port::StringBase fileName;
  if (!file || file->getFileName(&directory, &fileName) != CitI::kOk || fileName.IsEmpty()) return false;
  path = directory.str();
  if (!path.empty() && path.back() != '/') path += '/';
  path += fileName.str();
  return true;
}

}  // namespace Vad::PortExtraction
