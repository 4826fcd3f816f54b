#include "pep/PepExtractor.h"

#include "pep/Pep_Exception.h"

namespace {

bool IsKnownLanguage(int language) {
  return language == PepExtractor::kVerilog || language == PepExtractor::kVhdl;
}

}  // namespace

PepExtractor::PepExtractor() = default;

PepExtractor::~PepExtractor() = default;

void PepExtractor::addDesignFile(const char* library, const char* path, int language) {
  if (library == nullptr || path == nullptr || !IsKnownLanguage(language)) {
    throw Pep_Exception::Base(kBadFileMessage);
  }
  files_.push_back({library, path, language});
}

void PepExtractor::Parse(int) { throw Pep_Exception::Base(kUnavailableMessage); }

// Nothing is ever parsed yet, so no unit can be found and no generics are known.
int PepExtractor::findDesignUnit(const char*, const char*, int) { return kUnitNotFound; }

bool PepExtractor::hasAllGenericsDefined() const { return false; }
