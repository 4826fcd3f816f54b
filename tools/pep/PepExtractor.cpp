#include "pep/PepExtractor.h"

#include "pep/PepSourceFile.h"
#include "pep/PepTokenStream.h"
#include "pep/PepUnitEvaluator.h"
#include "pep/PepVerilogLexer.h"
#include "pep/PepVerilogReader.h"
#include "pep/PepVhdlLexer.h"
#include "pep/PepVhdlReader.h"
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
  files_.push_back({PepUnitCatalog::Folded(library), path, language});
}

void PepExtractor::Parse(int) {
  if (files_.empty()) throw Pep_Exception::Base(kNoFilesMessage);
  catalog_.Clear();
  SelectUnit(nullptr);
  for (const DesignFile& file : files_) ReadFile(file);
}

void PepExtractor::ReadFile(const DesignFile& file) {
  std::string text;
  switch (PepSourceFile::Load(file.path, text)) {
    case PepSourceFile::Status::kUnreadable:
      throw Pep_Exception::Base(kUnreadableFileMessage + file.path);
    case PepSourceFile::Status::kTooLarge:
      throw Pep_Exception::Base(kTooLargeFileMessage + file.path);
    case PepSourceFile::Status::kRead:
      break;
  }
  if (file.language == kVhdl) {
    PepVhdlLexer lexer(text);
    PepTokenStream tokens(lexer);
    PepVhdlReader(tokens, file.library, catalog_).Read();
  } else {
    PepVerilogLexer lexer(text);
    PepTokenStream tokens(lexer);
    PepVerilogReader(tokens, file.library, catalog_).Read();
  }
}

int PepExtractor::findDesignUnit(const char* library, const char* name, int searchMode) {
  const PepDesignUnit* unit = nullptr;
  if (library != nullptr && searchMode == kSearchTop) {
    unit = catalog_.FindTop(library);
  } else if (library != nullptr && name != nullptr && searchMode == kSearchExactName) {
    unit = catalog_.FindByName(library, name);
  }
  SelectUnit(unit);
  return unit == nullptr ? kUnitNotFound : kUnitFound;
}

void PepExtractor::SelectUnit(const PepDesignUnit* unit) {
  ports_.clear();
  allGenericsDefined_ = false;
  if (unit == nullptr) return;
  PepUnitEvaluator evaluator(*unit);
  ports_ = evaluator.Ports();
  allGenericsDefined_ = evaluator.AllGenericsDefined();
}
