#include "ProjectReader.h"

#include <algorithm>

#include "FileFacts.h"
#include "IHdlDesignUnit.h"
#include "IHdlElaborationData.h"
#include "IHdlPort.h"
#include "ParseCache.h"
#include "PluginTable.h"
#include "UnitRecordReader.h"

namespace quillon {

namespace {

// The project parses Verilog files together (each parse sees the list of all of them), so only
// the other files can be parsed one by one ahead of it without being parsed twice.
bool ParsesAlone(Vad::IHdlFile* file) {
  Port::StringBase plugin;
  file->getPluginName(&plugin);
  return !plugin.Equals("PLUGIN_Verilog", Port::kCompareNoCase);
}

template <class Iterator, class Visit>
void ForEachIn(Iterator* iterator, Visit visit) {
  if (!iterator) return;
  for (iterator->First(); !iterator->IsDone(); iterator->Next()) {
    if (auto* element = iterator->Current()) visit(element);
  }
}

Prjrep::AutoRelease<Vad::IHdlFileIterator> FilesOf(Vad::IHdlProject* project) {
  Prjrep::AutoRelease<Vad::IHdlFileIterator> files;
  if (auto* set = Prjrep::QueryAs<Vad::IHdlFileSet>(project)) set->CreateIterator(files.Out());
  return files;
}

// The records are listed first (into `records`, scratch room) so that their large descriptions
// are built in place, never moved. `units` keeps its room from the previous file.
void ReadUnitsOf(Vad::IHdlFile* file, UnitRecordReader& reader, std::vector<Vad::IHdlDesignUnit*>& records,
                 std::vector<UnitInfo>& units) {
  records.clear();
  units.clear();
  Prjrep::AutoRelease<Vad::IHdlDesignUnitIterator> iterator;
  if (file->getDesignUnits(nullptr, iterator.Out()) != CitI::kOk) return;
  ForEachIn(iterator.Get(), [&](Vad::IHdlDesignUnit* unit) { records.push_back(unit); });
  units.resize(records.size());
  for (std::size_t i = 0; i < records.size(); ++i) reader.Read(records[i], units[i]);
}

// The project's Verilog files in the order it compiles them: largest order key first.
std::vector<Vad::IHdlFile*> VerilogFilesOf(Vad::IHdlProject* project) {
  std::vector<std::pair<std::uint64_t, Vad::IHdlFile*>> keyed;
  auto files = FilesOf(project);
  ForEachIn(files.Get(), [&](Vad::IHdlFile* file) {
    std::uint64_t key = 0;
    file->getOrderKey(&key);
    if (!ParsesAlone(file)) keyed.emplace_back(key, file);
  });
  std::stable_sort(keyed.begin(), keyed.end(),
                   [](const auto& a, const auto& b) { return a.first > b.first; });
  std::vector<Vad::IHdlFile*> verilog;
  for (const auto& entry : keyed) verilog.push_back(entry.second);
  return verilog;
}

Vad::IHdlElaborationData* ElaborationOf(Vad::IHdlProject* project) {
  return Prjrep::QueryAs<Vad::IHdlElaborationData>(project);
}

const char* DirectionName(std::int32_t direction) {
  switch (direction) {
    case Vad::IHdlPort::kDirectionIn:
      return "in";
    case Vad::IHdlPort::kDirectionOut:
      return "out";
    default:
      return "inout";
  }
}

PortInfo PortInfoOf(Vad::IHdlPort* port) {
  Port::StringBase name;
  Port::StringBase type;
  port->getName(&name);
  port->getTypeName(&type);
  PortInfo info{name.str(), port->getPosition(), type.str(), DirectionName(port->getDirection()), {}, {}, {}};
  if (port->hasRange()) {
    info.low = port->getRangeLow();
    info.high = port->getRangeHigh();
    info.span = port->getRangeSpan();
  }
  return info;
}

}  // namespace

std::vector<UnitInfo> ProjectReader::UnitsOf(Vad::IHdlFile* file) {
  UnitRecordReader reader;
  std::vector<Vad::IHdlDesignUnit*> records;
  std::vector<UnitInfo> units;
  ReadUnitsOf(file, reader, records, units);
  return units;
}

std::size_t ProjectReader::FileCount() const {
  auto* set = Prjrep::QueryAs<Vad::IHdlFileSet>(project_);
  return set ? set->GetCount() : 0;
}

// Also without progress, so that the files' messages come in the same order whether or not a
// cache answers for some of them.
void ProjectReader::ParseFilesOneByOne(ParseCache* cache) {
  auto files = FilesOf(project_);
  std::size_t total = FileCount(), done = 0;
  ForEachIn(files.Get(), [&](Vad::IHdlFile* file) {
    progress_.Step("parsing", ++done, total);
    if (!ParsesAlone(file)) return;
    if (cache) {
      cache->ParseOrRestore(file);
    } else {
      file->parseIfNeeded();
    }
  });
  if (cache) cache->RestoreVerilog(VerilogFilesOf(project_));
}

CitI::Result ProjectReader::Parse(ParseCache* cache) {
  ParseFilesOneByOne(cache);
  progress_.Phase("collecting the design units");
  if (cache) cache->BeginVerilogParse();
  CitI::Result result = project_->getAllDesignUnits(designUnits_.Out());
  if (cache && result == CitI::kOk) cache->StoreVerilog(VerilogFilesOf(project_));
  progress_.Clear();
  return result;
}

std::vector<FileInfo> ProjectReader::Files(UnitFields fields) const {
  std::vector<FileInfo> infos;
  infos.reserve(FileCount());
  VisitFiles(fields, [&](FileInfo& file) { infos.push_back(std::move(file)); });
  return infos;
}

void ProjectReader::VisitFiles(UnitFields fields, const std::function<void(FileInfo&)>& visit) const {
  auto files = FilesOf(project_);
  UnitRecordReader reader(fields == UnitFields::kAll);
  std::vector<Vad::IHdlDesignUnit*> records;
  FileInfo info;
  ForEachIn(files.Get(), [&](Vad::IHdlFile* file) {
    OrderEntry facts = FileFacts::Describe(file);
    info.path = std::move(facts.path);
    info.plugin = std::move(facts.plugin);
    info.library = std::move(facts.library);
    info.fullPath.clear();
    ReadUnitsOf(file, reader, records, info.units);
    visit(info);
  });
}

std::vector<OrderEntry> ProjectReader::Describe(Vad::IHdlFileIterator* files) {
  std::vector<OrderEntry> order;
  ForEachIn(files, [&](Vad::IHdlFile* file) { order.push_back(FileFacts::Describe(file)); });
  return order;
}

CitI::Result ProjectReader::Order(std::vector<OrderEntry>& order) const {
  auto* elaboration = ElaborationOf(project_);
  if (!elaboration) return CitI::kFail;
  Prjrep::AutoRelease<Vad::IHdlFileIterator> files;
  progress_.Phase("ordering the files");
  CitI::Result result = elaboration->getCompileOrder(nullptr, files.Out());
  progress_.Clear();
  if (result == CitI::kOk) order = Describe(files.Get());
  return result == CitI::kOk && !files ? CitI::kFail : result;
}

CitI::Result ProjectReader::OrderOf(Vad::IHdlDesignUnit* unit, bool byUnit,
                                    std::vector<OrderEntry>& order) const {
  auto* elaboration = ElaborationOf(project_);
  if (!elaboration) return CitI::kFail;
  Prjrep::AutoRelease<Vad::IHdlFileIterator> files;
  progress_.Phase("ordering the files");
  CitI::Result result = elaboration->getCompileOrderByDU(unit, byUnit, files.Out());
  progress_.Clear();
  if (result == CitI::kOk) order = Describe(files.Get());
  return result == CitI::kOk && !files ? CitI::kFail : result;
}

CitI::Result ProjectReader::PortsOf(Vad::IHdlDesignUnit* unit,
                                    std::optional<std::vector<PortInfo>>& ports) const {
  ports.reset();
  auto* elaboration = ElaborationOf(project_);
  if (!elaboration) return CitI::kFail;
  Prjrep::AutoRelease<Vad::IHdlPortIterator> iterator;
  progress_.Phase("extracting the ports");
  CitI::Result result = elaboration->getDesignUnitPorts(unit, iterator.Out());
  progress_.Clear();
  if (result != CitI::kOk || !iterator) return result;
  ports.emplace();
  ForEachIn(iterator.Get(), [&](Vad::IHdlPort* port) { ports->push_back(PortInfoOf(port)); });
  return result;
}

}  // namespace quillon
