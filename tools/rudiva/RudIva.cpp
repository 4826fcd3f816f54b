#include "rudiva/RudIva.h"

#include <filesystem>
#include <fstream>
#include <optional>
#include <system_error>
#include <utility>

#include "rudiva/RudIva_LibraryMap.h"
#include "rudiva/RudIva_PackageReader.h"

namespace fs = std::filesystem;

namespace {

const char* MappingFileName(int nodeFileMode) {
  return nodeFileMode == RudIva::kSimulationLibraries ? "corvanesim.ini" : "chdp.ini";
}

bool IsEmpty(const char* text) { return text == nullptr || *text == '\0'; }

std::unique_ptr<RudIva_Node> MakePackageNode(RudIva_PackageReader::Package package) {
  auto node = std::make_unique<RudIva_Node>(std::move(package.name), RudIva::kPackageObject);
  for (std::string& component : package.components) {
    node->AddMember(RudIva::kDeclarationMembers, std::move(component), RudIva::kComponentDeclaration);
  }
  return node;
}

}  // namespace

RudIva* RudIva::getPLI() {
  static RudIva loader;
  return &loader;
}

RudIva::RudIva() = default;

RudIva::~RudIva() = default;

RudIva_Node* RudIva::Succeed(RudIva_Node* node) {
  lastFailure_ = Failure::kNone;
  lastError_.clear();
  return node;
}

RudIva_Node* RudIva::Fail(Failure failure, std::string message) {
  lastFailure_ = failure;
  lastError_ = std::move(message);
  return nullptr;
}

RudIva_Node* RudIva::loadLibUnit(const char* library, const char* unit, const char* secondaryUnit,
                                 int objectType, int nodeFileMode) {
  if (IsEmpty(library) || IsEmpty(unit) || !IsEmpty(secondaryUnit) || objectType != kPackageObject ||
      (nodeFileMode != kSimulationLibraries && nodeFileMode != kSynthesisLibraries)) {
    return Fail(Failure::kUnsupportedRequest, "only a primary package unit of a named library can be loaded");
  }
  const char* mappingFile = MappingFileName(nodeFileMode);
  std::ifstream mapping(mappingFile, std::ios::binary);
  if (!mapping) {
    return Fail(Failure::kNoMappingFile, std::string("cannot read the library mapping file ") + mappingFile);
  }
  std::optional<std::string> written = RudIva_LibraryMap::FindDirectory(mapping, library);
  if (!written) {
    return Fail(Failure::kLibraryNotMapped,
                std::string("library ") + library + " is not named in " + mappingFile);
  }
  std::optional<std::string> directory = RudIva_LibraryMap::ExpandVariables(*written);
  if (!directory) {
    return Fail(Failure::kUnresolvedDirectory,
                "directory " + *written + " of library " + library + " names an unset variable");
  }
  return LoadPackage(*directory, unit);
}

RudIva_Node* RudIva::LoadPackage(const std::string& directory, const std::string& unit) {
  std::error_code error;
  fs::path absolute = directory.empty() ? fs::path() : fs::absolute(directory, error).lexically_normal();
  std::optional<RudIva_UnitCache::Sources> sources;
  if (!absolute.empty() && !error) sources = RudIva_UnitCache::ListSources(absolute);
  if (!sources) return Fail(Failure::kNoLibraryDirectory, "cannot list library directory " + directory);

  std::string key = RudIva_UnitCache::Key(absolute, unit);
  if (RudIva_Node* cached = cache_.Find(key, *sources)) return Succeed(cached);
  for (const RudIva_UnitCache::SourceFile& source : *sources) {
    std::ifstream text(absolute / source.name, std::ios::binary);
    std::optional<RudIva_PackageReader::Package> package = RudIva_PackageReader::Read(text, unit);
    if (package) return Succeed(cache_.Store(key, std::move(*sources), MakePackageNode(std::move(*package))));
  }
  return Fail(Failure::kUnitNotFound, "no source in " + directory + " declares package " + unit);
}

std::vector<RudIva_Node*> RudIva::getMembers(const RudIva_Node* node, int kind) const {
  return node == nullptr ? std::vector<RudIva_Node*>{} : node->GetMembers(kind);
}

std::string RudIva::getName(const RudIva_Node* node) const {
  return node == nullptr ? std::string() : node->GetName();
}

int RudIva::getType(const RudIva_Node* node) const { return node == nullptr ? kNoObject : node->GetType(); }
