#include "xdm/Xdm_FileReader.h"

#include <new>

#include "xdm/Xdm_BlockTreeReader.h"
#include "xdm/Xdm_Exception.h"
#include "xdm/Xdm_FileFormat.h"
#include "xdm/Xdm_FormatProblem.h"
#include "xdm/Xdm_JsonFile.h"
#include "xdm/Xdm_ObjectReader.h"

bool Xdm_FileReader::IsNetlistDatabase(const std::string& file) noexcept {
  try {
    CheckMarker(Xdm_JsonFile::Load(file));
    return true;
  } catch (...) {
    return false;
  }
}

void Xdm_FileReader::Read(const std::string& file, Xdm_DesignMgr* designs) {
  try {
    Xdm_FileReader(file).ReadDocument(Xdm_JsonFile::Load(file), designs);
  } catch (const Xdm_Exception::Base&) {
    throw;
  } catch (const std::bad_alloc&) {
    throw Xdm_FormatProblem::Error(file, "", kOutOfMemoryMessage);
  } catch (const std::exception& error) {
    throw Xdm_FormatProblem::Error(file, "", kUnexpectedMessage + std::string(error.what()));
  }
}

void Xdm_FileReader::CheckMarker(const nlohmann::json& document) {
  if (!document.is_object()) {
    throw Xdm_FormatProblem(kNotNetlistMessage);
  }
  auto format = document.find("format");
  if (format == document.end() || *format != Xdm_FileFormat::kFormatName) {
    throw Xdm_FormatProblem(kNotNetlistMessage);
  }
  auto version = document.find("version");
  if (version == document.end() || !version->is_number_integer() || *version != Xdm_FileFormat::kVersion) {
    throw Xdm_FormatProblem(kUnsupportedVersionMessage);
  }
}

void Xdm_FileReader::ReadDocument(const nlohmann::json& document, Xdm_DesignMgr* designs) const {
  const nlohmann::json* designList = nullptr;
  try {
    CheckMarker(document);
    designList = &Xdm_ObjectReader(document, {"format", "version", "designs"}).RequiredArray("designs");
  } catch (const Xdm_FormatProblem& problem) {
    throw problem.At(file_, "");
  }
  for (std::size_t index = 0; index < designList->size(); ++index) {
    ReadDesign((*designList)[index], "/designs/" + std::to_string(index), designs);
  }
}

void Xdm_FileReader::ReadDesign(const nlohmann::json& value, const std::string& location,
                                Xdm_DesignMgr* designs) const {
  const nlohmann::json* viewList = nullptr;
  Xdm_Design* design = nullptr;
  try {
    Xdm_ObjectReader reader(value, {"name", "properties", "views"});
    const std::string& name = reader.Name();
    viewList = &reader.RequiredArray("views");
    design = designs->AddDesign(name);
    reader.ReadProperties(design);
  } catch (const Xdm_FormatProblem& problem) {
    throw problem.At(file_, location);
  }
  for (std::size_t index = 0; index < viewList->size(); ++index) {
    ReadView((*viewList)[index], location + "/views/" + std::to_string(index), design);
  }
}

void Xdm_FileReader::ReadView(const nlohmann::json& value, const std::string& location,
                              Xdm_Design* design) const {
  const nlohmann::json* block = nullptr;
  Xdm_View* view = nullptr;
  try {
    Xdm_ObjectReader reader(value, {"name", "properties", "block"});
    const std::string& name = reader.Name();
    block = &reader.Required("block");
    view = design->AddView(name);
    reader.ReadProperties(view);
  } catch (const Xdm_FormatProblem& problem) {
    throw problem.At(file_, location);
  }
  Xdm_BlockTreeReader(file_, location + "/block").Read(*block, view);
}
